#pragma once
// Finding the record that was selected before the tree was rebuilt. After a selection
// the selected object's record is copied to record 0 (the header's), so a search that
// stops at the first match would always land on the header: the object's own entry is
// looked for from index 1 first, and a match at 0 stands for 1 only when nothing else
// matches.

#include <cstddef>
#include <functional>
#include <optional>

namespace br::inspector {

// `matches(i)` tells whether record i is the remembered one; `count` records exist.
std::optional<std::size_t> FindRememberedRecord(std::size_t count, const std::function<bool(std::size_t)>& matches);

}  // namespace br::inspector
