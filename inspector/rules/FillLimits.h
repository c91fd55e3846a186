#pragma once
// Bounds of the recursive fill of related objects: a chart whose relations run deep or
// in circles must never hang the host. The fill goes at most kMaxDepth levels down,
// makes at most kMaxItems items in one call, and never descends into an identity that
// is already on the path from the root (a relation back up the tree, which is normal:
// a light's collection holds the light). Depth and item cuts are kept for the log.

#include <array>
#include <cstddef>
#include <set>

namespace br::inspector {

class FillLimits {
public:
  static constexpr std::size_t kMaxDepth = 32;
  static constexpr std::size_t kMaxItems = 10000;
  using Id = std::array<unsigned char, 16>;

  enum class Cut { kNone, kDepth, kItems };

  // Whether an item for `id` may be made at the current depth; on true the item is
  // counted and the id stands on the path until Leave. An id on the path is refused
  // without counting a cut.
  bool Enter(const Id& id);
  void Leave(const Id& id);

  bool OnPath(const Id& id) const { return path_.count(id) != 0; }
  std::size_t Depth() const { return depth_; }
  std::size_t Items() const { return items_; }
  // The first cut made, kNone while nothing was cut.
  Cut FirstCut() const { return firstCut_; }
  std::size_t Cuts() const { return cuts_; }

private:
  void Refuse(Cut cut);

  std::set<Id> path_;
  std::size_t depth_ = 0;
  std::size_t items_ = 0;
  std::size_t cuts_ = 0;
  Cut firstCut_ = Cut::kNone;
};

}  // namespace br::inspector
