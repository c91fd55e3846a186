#include "fuzz/common/temp_folder.h"

#include <cstdio>
#include <cstdlib>
#include <string>
#include <system_error>

#include <unistd.h>

#include "fuzz/common/fuzz_check.h"

namespace br::fuzz {

namespace {

std::filesystem::path& Folder() {
  static std::filesystem::path folder;
  return folder;
}

void RemoveFolder() {
  std::error_code ignored;
  if (!Folder().empty()) std::filesystem::remove_all(Folder(), ignored);
}

}  // namespace

const std::filesystem::path& ScratchFolder() {
  if (Folder().empty()) {
    const char* base = std::getenv("TMPDIR");
    std::string pattern = std::string(base && *base ? base : "/tmp") + "/br-fuzz-XXXXXX";
    FUZZ_CHECK(mkdtemp(pattern.data()) != nullptr);
    Folder() = pattern;
    std::atexit(RemoveFolder);
  }
  return Folder();
}

void WriteScratchFile(const char* name, std::string_view bytes) {
  const std::string path = (ScratchFolder() / name).string();
  std::FILE* f = std::fopen(path.c_str(), "wb");
  FUZZ_CHECK(f != nullptr);
  if (!bytes.empty()) FUZZ_CHECK(std::fwrite(bytes.data(), 1, bytes.size(), f) == bytes.size());
  FUZZ_CHECK(std::fclose(f) == 0);
}

}  // namespace br::fuzz
