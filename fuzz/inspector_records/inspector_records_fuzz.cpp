// What the inspector's panels take from a host as bytes or text: a raster chart header
// record, a dataset header record, a formatter's attribute text, a tidal stream value and
// a light's signal group.
//
// One input: u8 choice, then the rest as the record or text; choice 5 is a dataset's
// parameter array (u8 count, then per element u8 kind and a text up to a zero byte or
// u64 bits) followed by its header record. Checked beyond "no crash": texts never grow
// past their fields, at most 64 panels are read, every row has a caption and a value, a
// cleaned value holds no bar and no break tag, a split text gives back its own parts, a
// tidal stream table has its 15 lines whatever the fields, a signal group gives no more
// groups than it opens brackets, and a parameter's text is its text or number and empty
// past the array's end.
#include <cctype>
#include <cstddef>
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "frame/geo/dataset_header.h"
#include "inspector/format/attribute_text.h"
#include "inspector/format/light_abbreviation.h"
#include "inspector/format/metadata_rows.h"
#include "inspector/format/raster_chart_rows.h"
#include "inspector/format/tidal_stream_text.h"

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

MetadataSources FullSources() {
  MetadataSources s = Sources();
  s.text = [](long id, const char* defaultText) { return (id % 7 == 0 ? "~" : "") + std::string(defaultText); };
  s.agency = [](long code) { return code % 2 ? std::string("Agency ") + std::to_string(code) : std::string(); };
  s.catalogue = [](const char* acronym, long value) -> std::optional<std::string> {
    if (value % 3 == 0) return std::nullopt;
    return std::string(acronym) + " " + std::to_string(value);
  };
  return s;
}

std::vector<ParameterValue> ReadParameters(br::fuzz::InputReader& in) {
  std::vector<ParameterValue> parameters(in.U8() % 48);
  for (ParameterValue& p : parameters) {
    switch (in.U8() % 4) {
      case 1:
        p.kind = ParameterValue::kText;
        p.text = std::string(in.UntilZero());
        break;
      case 2: {
        p.kind = ParameterValue::kDate;
        const std::uint64_t bits = in.U64();
        std::memcpy(&p.date, &bits, sizeof p.date);
        break;
      }
      case 3:
        p.kind = ParameterValue::kInteger;
        p.integer = static_cast<std::int64_t>(in.U64());
        break;
      default:
        break;
    }
  }
  return parameters;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const unsigned choice = data[0] % 6;
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
  } else if (choice == 3) {
    const std::string value(reinterpret_cast<const char*>(rest), restSize);
    const std::string table = TidalStreamText(value, TidalStreamCaptions{});
    std::size_t lines = 0;
    for (char c : table) lines += c == '\r';
    std::size_t inputBreaks = 0;
    for (char c : value) inputBreaks += c == '\r';
    // Fields are copied once (the reference once per hour line too), captions are fixed.
    FUZZ_CHECK(lines >= 15 && lines <= 15 + 14 * inputBreaks);
    FUZZ_CHECK(table.size() <= 500 + 15 * value.size());
    FUZZ_CHECK(!table.empty() && table.back() == '\r');
  } else if (choice == 4) {
    LightValues light;
    light.signalGroup.assign(reinterpret_cast<const char*>(rest), restSize);
    light.characteristic = restSize > 0 ? rest[0] % 32 : 2;
    light.colours.assign(rest, rest + std::min<std::size_t>(restSize, 8));
    const std::vector<std::string> groups = SignalGroups(light.signalGroup);
    std::size_t opened = 0;
    for (char c : light.signalGroup) opened += c == '(';
    FUZZ_CHECK(groups.size() <= opened);
    FUZZ_CHECK(LightAbbreviation(light).size() <= 64 + 3 * restSize);
  } else if (choice == 5) {
    br::fuzz::InputReader in(rest, restSize);
    const std::vector<ParameterValue> parameters = ReadParameters(in);
    const std::string_view record = in.Rest();
    const br::geo::DataSetHeader header =
        br::geo::ParseDataSetHeader(reinterpret_cast<const unsigned char*>(record.data()), record.size());
    const MetadataSources sources = FullSources();
    for (std::size_t i = 0; i <= parameters.size(); ++i) {
      const std::string text = ParameterText(parameters, i, sources);
      if (i == parameters.size() || parameters[i].kind == ParameterValue::kNone) FUZZ_CHECK(text.empty());
      else if (parameters[i].kind == ParameterValue::kText) FUZZ_CHECK(text == parameters[i].text);
      else if (parameters[i].kind == ParameterValue::kInteger) FUZZ_CHECK(text == std::to_string(parameters[i].integer));
    }
    CheckRows(ChartDataSetRows(parameters, header, std::nullopt, sources));
    CheckRows(ChartDataSetRows(parameters, header, std::uint16_t{7}, Sources()));
    CheckRows(LibraryRows(parameters, sources));
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
