// Runs the built brtide.exe as a child process and collects what it printed.
#pragma once

#include <string>
#include <vector>

namespace br::test {

struct ProcessResult {
  unsigned long exitCode = 0;
  std::string out;  // standard output, bytes as written (UTF-8)
  std::string err;  // standard error
};

// The brtide.exe of the build tree the test program lies in, with arguments (UTF-8; each
// is quoted for the command line).
ProcessResult RunBrtide(const std::vector<std::string>& args);

}  // namespace br::test
