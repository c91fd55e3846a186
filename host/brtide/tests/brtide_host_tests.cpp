// brtide's failures on station folders this suite writes (its day against TidesPort: the
// JScript example suite; the wording of usage errors: the native brtide tests).
#include <doctest/doctest.h>

#include <filesystem>
#include <string>
#include <vector>

#include "tests/common/station_writer.h"
#include "host/brtide/tests/brtide_process.h"

using br::tides::testing::TempFolder;
using br::tides::testing::TestStation;

TEST_CASE("every failure gives its exit status and one line on standard error") {
  // Constituent records are {number, phase in tenths of a degree, amplitude in millimetres};
  // the second station's block is cut short, so the library has no name and no day for it.
  const std::vector<TestStation> stations = {{"Worked M2", 3000, -240, 0, {{0, 0, 0}, {29, 0, 1000}}},
                                             {"Ghost", 3030, -250, 0, {{0, 0, 1000}, {29, 0, 500}}}};
  TempFolder folder("brtide"), incomplete("brtide_partial");
  br::tides::testing::WriteStationFolder(folder.path(), stations);
  const std::filesystem::path data = folder.path() / "td_pnt.dat";
  br::tides::testing::TruncateFile(data, std::filesystem::file_size(data) - 3);
  br::tides::testing::WriteStationFolder(incomplete.path(), stations);
  std::filesystem::remove(incomplete.path() / "td_pnt.dat");
  const std::string path = folder.str(), missing = path + "\\missing", partial = incomplete.str();

  struct Case {
    std::vector<std::string> args;
    unsigned long status;
    std::string message;
  };
  const Case cases[] = {
      {{"ports", "--folder", missing, "--box", "1", "1", "2", "2"}, 1, "brtide: no folder \"" + missing + "\""},
      {{"ports", "--folder", partial, "--box", "1", "1", "2", "2"},
       1,
       "brtide: \"" + partial + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)"},
      {{"ports", "--folder", path, "--box", "0", "0", "1", "1"},
       1,
       "brtide: no station inside the box in \"" + path + "\" (2 stations)"},
      {{"day", "--folder", path, "--port", "2", "--date", "2024-01-01"},
       1,
       "brtide: no station 2 in \"" + path + "\" (stations 0 to 1)"},
      {{"day", "--folder", path, "--port", "1", "--date", "2024-01-01"},
       1,
       "brtide: no tide day for station 1 \"\" on 2024-01-01 (the station's data or its sun times cannot be had)"},
      {{"day", "--folder", path, "--port", "0", "--date", "20240101"},
       2,
       "brtide: bad date \"20240101\" (a real day as YYYY-MM-DD)"},
  };
  for (const Case& c : cases) {
    CAPTURE(c.message);
    const br::test::ProcessResult r = br::test::RunBrtide(c.args);
    CHECK(r.exitCode == c.status);
    CHECK(r.out.empty());
    CHECK(r.err == c.message + "\n");
  }
}
