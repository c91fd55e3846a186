// The station folder brtide and brdesk open when none is given: the world set.
#pragma once

#include <string>

namespace br::brtide {

// "data\world" beside the program or in a folder above it (the build tree's programs find
// the source tree's world set); empty when there is none.
std::wstring DefaultStationFolder();

}  // namespace br::brtide
