// brtide --help.
#pragma once

#include <ostream>
#include <vector>

#include "host/brtide/ArgumentParser.h"

namespace br::brtide {

// The general help (command == nullptr) or one command's options.
void WriteUsage(const std::vector<CommandSpec>& commands, const CommandSpec* command, std::ostream& out);

}  // namespace br::brtide
