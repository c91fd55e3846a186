// One scratch folder per fuzzing process, removed when the process ends.
#pragma once

#include <cstdint>
#include <filesystem>
#include <string_view>

namespace br::fuzz {

// The folder (made on first use under TMPDIR or /tmp).
const std::filesystem::path& ScratchFolder();

// Writes bytes as the file name inside the scratch folder, replacing it.
void WriteScratchFile(const char* name, std::string_view bytes);

}  // namespace br::fuzz
