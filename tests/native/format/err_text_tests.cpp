#include <doctest/doctest.h>

#include <string>

#include "frame/errors/ErrText.h"

namespace {

ErrRecord SampleRecord() {
  ErrRecord record(ErrPlace{"C:\\work\\legend\\XChartLegend.cpp", "SetLegendData", 1240});
  record.line = 1265;
  record.result = static_cast<std::int32_t>(0x80004005u);
  return record;
}

ErrReportContext SampleContext(const char* systemText) {
  ErrReportContext context;
  context.className = "CXChartLegend";
  context.date = "05.03.2024";
  context.time = "14:07";
  context.threadId = 36;
  context.systemText = systemText;
  return context;
}

}  // namespace

TEST_CASE("source names keep only the file name and extension") {
  const char* rows[][3] = {{"C:\\work\\legend\\XChartLegend.cpp", "XChartLegend", ".cpp"},
                           {"/work/main/inspector/cP_SHPanel.tar.cpp", "cP_SHPanel.tar", ".cpp"},
                           {"D:Makefile", "Makefile", ""}, {"dir.d\\noext", "noext", ""}, {nullptr, "", ""}};
  for (const auto& r : rows) {
    std::string name = "x", extension = "y";
    SplitSourceName(r[0], name, extension);
    CHECK((name == r[1] && extension == r[2]));
  }
}

TEST_CASE("system messages are cut at their first line break") {
  CHECK((FirstLineOf("Unspecified error\r\n") == "Unspecified error" && FirstLineOf("two\nlines") == "two"));
  CHECK((FirstLineOf("") == "" && FirstLineOf(nullptr) == ""));
}

// The plain failure's line and box are the Wine errors suite's, through the reporter.
TEST_CASE("the log line with no line, a code, a text and no system text") {
  ErrRecord record = SampleRecord();
  record.line = -1;
  record.code = 0x1234abcd;
  record.text = "extra";
  record.result = static_cast<std::int32_t>(0xE0040001u);
  CHECK(FormatErrLogLine(record, SampleContext(nullptr)) ==
        "ERR: 05.03.2024 14:07 file:XChartLegend.cpp(-1) CXChartLegend::SetLegendData "
        "line:-1 code:3234ABCD text:'extra' thread:36 hres:0xE0040001((null)) \n");
}

TEST_CASE("the log line is not limited in length") {
  ErrRecord record = SampleRecord();
  const std::string longText(2000, 'x');
  record.text = longText.c_str();
  const std::string line = FormatErrLogLine(record, SampleContext(nullptr));
  CHECK(line.find("text:'" + longText + "'") != std::string::npos);
}

TEST_CASE("the box text, with the record's text on a line of its own, at most 511 characters") {
  ErrRecord record = SampleRecord();
  record.text = "";
  CHECK(FormatErrBoxText(record, SampleContext(nullptr)).find('\n') == std::string::npos);
  record.text = "more";
  CHECK(FormatErrBoxText(record, SampleContext(nullptr)) ==
        "XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25 code:20000000 "
        "hres:0x80004005((null))\nmore");
  const std::string longText(600, 'y');
  record.text = longText.c_str();
  const std::string box = FormatErrBoxText(record, SampleContext(nullptr));
  CHECK((box.size() == ERR_BOX_TEXT_MAX && box.back() == 'y'));
}
