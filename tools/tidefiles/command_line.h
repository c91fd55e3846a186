// The tidefiles command: build, dump, check and predict station folders.
#pragma once

#include <istream>
#include <ostream>
#include <string>
#include <vector>

namespace br::tidefiles {

// Exit statuses: 0 success, 1 the input or folder has problems, 2 a bad command line.
int RunTidefiles(const std::vector<std::string>& args, std::istream& in, std::ostream& out, std::ostream& err);

}  // namespace br::tidefiles
