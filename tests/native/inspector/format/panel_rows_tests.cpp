// Row layout of the text panels: indents, heights from the wrapped text's height, and a
// cell's text cut into its lines.
#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "inspector/format/panel_rows.h"

using namespace br::inspector;

TEST_CASE("indents: heading, name and value stacked; heading and cells side by side") {
  CHECK(PanelRowIndent(PanelRowKind::Heading, false) == 15);
  CHECK(PanelRowIndent(PanelRowKind::Name, false) == 30);
  CHECK(PanelRowIndent(PanelRowKind::Value, false) == 60);
  CHECK(PanelRowIndent(PanelRowKind::Heading, true) == 4);
  CHECK(PanelRowIndent(PanelRowKind::Attribute, true) == 8);
}

TEST_CASE("a row is its text and 4 pixels; a heading 10 more, the last row 5 more") {
  // Three wrapped lines of 13 pixels.
  CHECK(PanelRowHeight(39, 13, PanelRowKind::Value, false) == 43);
  CHECK(PanelRowHeight(39, 13, PanelRowKind::Value, true) == 48);
  CHECK(PanelRowHeight(13, 13, PanelRowKind::Heading, false) == 27);
  CHECK(PanelRowHeight(13, 13, PanelRowKind::Heading, true) == 32);
  // An empty text still takes its line, and a bad line height its pixel.
  CHECK(PanelRowHeight(0, 13, PanelRowKind::Name, false) == 17);
  CHECK(PanelRowHeight(0, 0, PanelRowKind::Name, false) == 5);
  // The heading's space lies above its text, inside its height.
  CHECK(PanelRowTextTop(PanelRowKind::Heading) == 12);
  CHECK(PanelRowTextTop(PanelRowKind::Attribute) == 2);
}

TEST_CASE("a cell's lines: each kind of line break once, empty lines kept") {
  using Lines = std::vector<std::wstring>;
  const auto lines = [](std::wstring_view text) {
    Lines out;
    for (std::wstring_view line : PanelTextLines(text)) out.emplace_back(line);
    return out;
  };
  CHECK(lines(L"") == Lines{L""});
  CHECK(lines(L"one") == Lines{L"one"});
  CHECK(lines(L"Open 8:00\rclosed Sunday") == Lines{L"Open 8:00", L"closed Sunday"});
  CHECK(lines(L"a\r\nb\nc") == Lines{L"a", L"b", L"c"});
  CHECK(lines(L"a\r\rb\r") == Lines{L"a", L"", L"b", L""});
  // Texts beyond Latin pass whole.
  CHECK(lines(L"\x0E17\x0E48\x0E32\r\x4E2D\x6587") == Lines{L"\x0E17\x0E48\x0E32", L"\x4E2D\x6587"});
}
