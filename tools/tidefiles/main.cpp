// tidefiles: makes, reads and checks tide station folders; see --help.
#include <exception>
#include <iostream>
#include <new>

#include "tools/tidefiles/command_line.h"

int main(int argc, char** argv) {
  std::vector<std::string> args(argv + 1, argv + argc);
  try {
    return br::tidefiles::RunTidefiles(args, std::cin, std::cout, std::cerr);
  } catch (const std::bad_alloc&) {
    std::cerr << "tidefiles: out of memory\n";
  } catch (const std::exception& e) {
    std::cerr << "tidefiles: " << e.what() << '\n';
  }
  return 1;
}
