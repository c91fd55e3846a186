// Runs a harness over saved inputs without libFuzzer: every file named on the command
// line, and every file inside each folder named (not recursive, in name order; a folder
// that does not exist, as regressions/ before a first find, is skipped). A failing input
// stops the program the way it stops the fuzzer (sanitizer report or abort).
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <system_error>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);
extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) __attribute__((weak));

int main(int argc, char** argv) {
  if (LLVMFuzzerInitialize) LLVMFuzzerInitialize(&argc, &argv);
  std::vector<std::filesystem::path> files;
  for (int i = 1; i < argc; ++i) {
    std::error_code error;
    if (!std::filesystem::is_directory(argv[i], error)) {
      if (std::filesystem::exists(argv[i], error)) files.emplace_back(argv[i]);
      continue;
    }
    const std::size_t first = files.size();
    for (const auto& entry : std::filesystem::directory_iterator(argv[i], error))
      if (entry.is_regular_file()) files.push_back(entry.path());
    std::sort(files.begin() + static_cast<std::ptrdiff_t>(first), files.end());
  }
  for (const auto& file : files) {
    std::ifstream in(file, std::ios::binary);
    if (!in) {
      std::fprintf(stderr, "replay: cannot read %s\n", file.c_str());
      return 1;
    }
    const std::vector<char> bytes{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
    // A heap block of exactly the input's size (never null, as libFuzzer passes it), so a
    // read past its end is caught here as it is in the fuzzer.
    std::uint8_t* copy = new std::uint8_t[bytes.size()];
    std::copy(bytes.begin(), bytes.end(), copy);
    LLVMFuzzerTestOneInput(copy, bytes.size());
    delete[] copy;
  }
  std::printf("replayed %zu inputs\n", files.size());
  return 0;
}
