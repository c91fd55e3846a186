// The plain failure's line and box are the Wine errors suite's, through the reporter.
#include <doctest/doctest.h>

#include <string>

#include "frame/errors/err_text.h"

using namespace br;

TEST_CASE("the log line with no line, a code and a long text; the box with the text on a line of its own") {
  std::string name, extension;
  SplitSourceName("/work/main/inspector/cP_SHPanel.tar.cpp", name, extension);
  CHECK((name == "cP_SHPanel.tar" && extension == ".cpp"));
  SplitSourceName("D:Makefile", name, extension);
  CHECK((name == "Makefile" && extension.empty()));
  CHECK(FirstLineOf("two\nlines") == "two");

  ErrRecord record(ErrPlace{"C:\\work\\legend\\XChartLegend.cpp", "SetLegendData", 1240});
  ErrReportContext context;
  context.className = "CXChartLegend";
  context.date = "05.03.2024";
  context.time = "14:07";
  context.threadId = 36;
  record.code = 0x1234abcd;
  record.result = static_cast<std::int32_t>(0xE0040001u);
  const std::string longText(2000, 'x');  // the log line has no length limit
  record.text = longText.c_str();
  CHECK(FormatErrLogLine(record, context) ==
        "ERR: 05.03.2024 14:07 file:XChartLegend.cpp(-1) CXChartLegend::SetLegendData "
        "line:-1 code:3234ABCD text:'" + longText + "' thread:36 hres:0xE0040001((null)) \n");

  record.line = 1265;
  record.text = "";
  CHECK(FormatErrBoxText(record, context).find('\n') == std::string::npos);
  record.text = "more";
  CHECK(FormatErrBoxText(record, context) ==
        "XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25 code:3234ABCD hres:0xE0040001((null))\nmore");
  const std::string boxText(600, 'y');  // the box keeps at most 511 characters
  record.text = boxText.c_str();
  const std::string box = FormatErrBoxText(record, context);
  CHECK((box.size() == ERR_BOX_TEXT_MAX && box.back() == 'y'));
}
