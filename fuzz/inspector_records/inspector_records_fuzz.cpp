// What the inspector's panels take from a host as bytes or text: a raster chart header
// record, a dataset header record and a formatter's attribute text.
//
// One input: u8 choice, then the rest as the record or text. Checked beyond "no crash":
// texts never grow past their fields, at most 64 panels are read, every row has a caption
// and a value, a cleaned value holds no bar and no break tag, and a split text gives back
// its own parts.
#include <cctype>
#include <cstddef>
#include <cstdint>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "frame/geo/dataset_header.h"
#include "inspector/format/attribute_text.h"
#include "inspector/format/metadata_rows.h"
#include "inspector/format/raster_chart_rows.h"

using namespace br::inspector;

namespace {

bool HasBreakTag(const std::string& text) {
  for (std::size_t i = 0; i + 4 <= text.size(); ++i) {
    if (text[i] == '<' && std::tolower(static_cast<unsigned char>(text[i + 1])) == 'b' &&
        std::tolower(static_cast<unsigned char>(text[i + 2])) == 'r' && text[i + 3] == '>') {
      return true;
    }
  }
  return false;
}

void CheckRows(const std::vector<MetadataRow>& rows) {
  for (const MetadataRow& row : rows) FUZZ_CHECK(!row.caption.empty() && !row.value.empty());
}

MetadataSources Sources() {
  MetadataSources s;
  s.date = [](double date) { return date > 0 && date < 1e6 ? std::to_string(static_cast<long>(date)) : std::string(); };
  s.degrees = [](long n) -> std::optional<double> { return n * 1e-7; };
  return s;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const unsigned choice = data[0] % 3;
  const unsigned char* rest = data + 1;
  const std::size_t restSize = size - 1;

  if (choice == 0) {
    const RasterChart chart = ParseRasterChart(rest, restSize);
    FUZZ_CHECK(chart.panels.size() <= kRasterMaxPanels);
    FUZZ_CHECK(!chart.number || chart.number->size() <= kRasterChartNumberSize);
    FUZZ_CHECK(!chart.title || chart.title->size() <= kRasterChartTitleSize);
    for (const RasterPanel& panel : chart.panels) {
      FUZZ_CHECK(panel.projection.size() <= 2);
      FUZZ_CHECK(!panel.title || panel.title->size() < kRasterPanelSize);
    }
    CheckRows(RasterChartRows(chart, ParseRasterIssueDate(rest, restSize), "producer", Sources()));
  } else if (choice == 1) {
    const br::geo::DataSetHeader header = br::geo::ParseDataSetHeader(rest, restSize);
    CheckRows(ChartDataSetTextRows(header, std::nullopt, Sources()));
    CheckRows(ChartDataSetRows({}, header, std::uint16_t{1}, Sources()));
  } else {
    const std::string text(reinterpret_cast<const char*>(rest), restSize);
    if (const auto pair = SplitAttributeText(text)) {
      FUZZ_CHECK(pair->name.size() + 1 + pair->value.size() == text.size());
      FUZZ_CHECK(text.compare(0, pair->name.size(), pair->name) == 0);
      FUZZ_CHECK(pair->name.find_first_of("#=") == std::string::npos);
      FUZZ_CHECK(!pair->value.empty());
    }
    const std::string cleaned = CleanAttributeValue(text);
    FUZZ_CHECK(cleaned.size() <= text.size());
    FUZZ_CHECK(cleaned.find('|') == std::string::npos);
    FUZZ_CHECK(!HasBreakTag(cleaned) || HasBreakTag(text));
  }
  return 0;
}
