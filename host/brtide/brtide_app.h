// brtide's commands over the library: parses the command line, runs "ports" or "day"
// through TideService and prints the result. COM must be initialised by the caller.
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace br::brtide {

// args without the program name, UTF-8. Returns the exit status.
int RunBrtide(const std::vector<std::string>& args, std::ostream& out, std::ostream& err);

}  // namespace br::brtide
