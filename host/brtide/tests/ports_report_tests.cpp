#include <doctest/doctest.h>

#include "host/brtide/ports_report.h"

#include <sstream>

using namespace br::brtide;

TEST_CASE("the ports listing gives folder, box, one row per station and the count") {
  PortsReport report;
  report.folder = "Z:\\data\\world";
  report.stationCount = 3742;
  report.box = {49.5, -3.0, 47.0, -6.0};  // corners swapped: shown as the box searched
  report.rows = {
      {1491, "Brest", {48.383333333333333, -4.5}},
      {1500, "Le Conquet \xC3\xA9", {48.35, -4.783333333333333}},
      {-1, "Nowhere", {47.5, -5.0}},
  };
  std::ostringstream out;
  WritePortsText(report, out);
  const std::string expected =
      "Folder  Z:\\data\\world (3742 stations)\n"
      "Box     47\xC2\xB0 00'.000 N  006\xC2\xB0 00'.000 W  to  49\xC2\xB0 30'.000 N  003\xC2\xB0 00'.000 W\n"
      "\n"
      "   No.  Name                  Latitude       Longitude\n"
      "  1491  Brest                 48\xC2\xB0 23'.000 N  004\xC2\xB0 30'.000 W\n"
      "  1500  Le Conquet \xC3\xA9          48\xC2\xB0 21'.000 N  004\xC2\xB0 47'.000 W\n"
      "     ?  Nowhere               47\xC2\xB0 30'.000 N  005\xC2\xB0 00'.000 W\n"
      "\n"
      "3 stations in the box\n";
  CHECK(out.str() == expected);
}

TEST_CASE("long names widen the name column up to the file's 40 characters") {
  PortsReport report;
  report.stationCount = 1;
  report.rows = {{0, std::string(45, 'x'), {1, 1}}};
  std::ostringstream out;
  WritePortsText(report, out);
  CHECK(out.str().find("  No.  Name" + std::string(36, ' ') + "  Latitude") != std::string::npos);
  CHECK(out.str().find("\n1 station in the box\n") != std::string::npos);
}
