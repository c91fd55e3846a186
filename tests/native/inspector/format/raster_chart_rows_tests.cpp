// Raster chart entries: chart and panel records parsed from bytes written here (full,
// short and lying about their panel count), and the rows made of them.
#include <doctest/doctest.h>

#include <cfloat>
#include <cstring>
#include <string>
#include <vector>

#include "inspector/format/raster_chart_rows.h"

using namespace br::inspector;

namespace {

class Record {
public:
  explicit Record(std::size_t size) : bytes_(size, 0) {}
  template <typename T>
  Record& Put(std::size_t at, T value) {
    std::memcpy(bytes_.data() + at, &value, sizeof value);
    return *this;
  }
  Record& Text(std::size_t at, const std::string& text) {
    std::memcpy(bytes_.data() + at, text.data(), text.size());
    return *this;
  }
  const unsigned char* data() const { return bytes_.data(); }
  std::size_t size() const { return bytes_.size(); }

private:
  std::vector<unsigned char> bytes_;
};

std::size_t PanelAt(int i) { return kRasterPanelsAt + static_cast<std::size_t>(i) * kRasterPanelSize; }

// Chart 7401 of producer 170 with a Mercator main panel and a transverse Mercator plan.
Record TwoPanels() {
  Record r(PanelAt(2));
  r.Put<std::uint32_t>(0, 170).Text(kRasterChartNumberAt, "7401").Text(kRasterChartTitleAt, "Goulet de Brest");
  r.Put<std::uint16_t>(kRasterPanelCountAt, 2);
  r.Put<std::uint16_t>(PanelAt(0), 0).Put<std::uint16_t>(PanelAt(0) + 2, 1).Put<std::uint16_t>(PanelAt(0) + 4, 2);
  r.Text(PanelAt(0) + 6, "MC").Put<std::int32_t>(PanelAt(0) + 8, 50000);
  r.Put<double>(PanelAt(0) + 12, 48.5).Put<double>(PanelAt(0) + 20, 0.25).Put<double>(PanelAt(0) + 28, DBL_MAX);
  r.Text(PanelAt(0) + 36, "Rade de Brest");
  r.Put<std::uint16_t>(PanelAt(1), 3).Put<std::uint16_t>(PanelAt(1) + 2, 2).Put<std::uint16_t>(PanelAt(1) + 4, 2);
  r.Text(PanelAt(1) + 6, "TC").Put<std::int32_t>(PanelAt(1) + 8, 10000);
  r.Put<double>(PanelAt(1) + 12, 0.9996).Put<double>(PanelAt(1) + 20, -4.5).Put<double>(PanelAt(1) + 28, DBL_MAX);
  r.Text(PanelAt(1) + 36, "Port du Chateau");
  return r;
}

MetadataSources Sources() {
  MetadataSources s;
  s.date = [](double date) { return date > 0 ? "day " + std::to_string(static_cast<long>(date)) : std::string(); };
  return s;
}

using Rows = std::vector<std::pair<std::string, std::string>>;
Rows Pairs(const std::vector<MetadataRow>& rows) {
  Rows pairs;
  for (const MetadataRow& r : rows) pairs.emplace_back(r.caption, r.value);
  return pairs;
}

}  // namespace

TEST_CASE("a chart with two panels: the chart, then each panel under its heading") {
  const Record record = TwoPanels();
  const RasterChart chart = ParseRasterChart(record.data(), record.size());
  REQUIRE(chart.panels.size() == 2);
  CHECK(chart.producer == 170u);
  const Rows rows = Pairs(RasterChartRows(chart, 45000.0, "SHOM", Sources()));
  const Rows expected{
      {"$HEADER$", "Chart"},
      {"Chart Number", "7401"},
      {"Chart Title", "Goulet de Brest"},
      {"File Issue Date", "day 45000"},
      {"$HEADER$", "Main Panel (Chart 7401, SHOM)"},
      {"Plan Title", "Rade de Brest"},
      {"Scale", "50000"},
      {"$HEADER$", "Sub-Panel Number 1 of 2"},
      {"Projection", "MERCATOR\rLatitude: 48\xB0 30'.000 N\rRotation: 0.2500000"},
      {"$HEADER$", "Plan #3 (Chart 7401, SHOM)"},
      {"Plan Title", "Port du Chateau"},
      {"Scale", "10000"},
      {"$HEADER$", "Sub-Panel Number 2 of 2"},
      {"Projection", "TRANSVERSE MERCATOR\rScale Factor: 0.9996000000\rLongitude: 004\xB0 30'.000 W\rRotation: <None>"},
  };
  CHECK(rows == expected);
}

TEST_CASE("one panel has no sub-panel heading; gnomonic and unknown kinds") {
  Record r(PanelAt(1));
  r.Text(kRasterChartNumberAt, "12345678901234567890123456");  // longer than its field
  r.Put<std::uint16_t>(kRasterPanelCountAt, 1).Put<std::uint16_t>(PanelAt(0) + 4, 1).Text(PanelAt(0) + 6, "PG");
  r.Put<double>(PanelAt(0) + 12, DBL_MAX).Put<double>(PanelAt(0) + 20, 3.75).Put<std::int32_t>(PanelAt(0) + 8, 25000);
  const RasterChart chart = ParseRasterChart(r.data(), r.size());
  CHECK(chart.number == std::string("123456789012345678901"));
  const Rows rows = Pairs(RasterChartRows(chart, std::nullopt, "170", Sources()));
  const Rows expected{{"$HEADER$", "Chart"},
                      {"Chart Number", "123456789012345678901"},
                      {"$HEADER$", "Main Panel (Chart 123456789012345678901, 170)"},
                      {"Scale", "25000"},
                      {"Projection", "GNOMONIC\rLatitude: <None>\rLongitude: 003\xB0 45'.000 E"}};
  CHECK(rows == expected);

  RasterPanel unknown;
  unknown.projection = "ZZ";
  CHECK(ProjectionParameterText(unknown).empty());
}

TEST_CASE("short and lying records read only what is there") {
  const Record full = TwoPanels();
  // Cut inside the second panel's parameters: its title and last parameters are gone.
  const RasterChart cut = ParseRasterChart(full.data(), PanelAt(1) + 20);
  REQUIRE(cut.panels.size() == 2);
  CHECK(cut.panels[1].parameters[0] == 0.9996);
  CHECK_FALSE(cut.panels[1].parameters[1]);
  CHECK_FALSE(cut.panels[1].title);

  // A count of 60000 panels in a record of two: only the two are read.
  Record lying = TwoPanels();
  lying.Put<std::uint16_t>(kRasterPanelCountAt, 60000);
  CHECK(ParseRasterChart(lying.data(), lying.size()).panels.size() == 2);

  const RasterChart tiny = ParseRasterChart(full.data(), 3);
  CHECK_FALSE(tiny.producer);
  CHECK_FALSE(tiny.number);
  CHECK(tiny.panels.empty());
  CHECK(ParseRasterChart(nullptr, 100).panels.empty());

  CHECK_FALSE(ParseRasterIssueDate(full.data(), kRasterIssueDateAt + 7));
  Record issue(64);
  issue.Put<double>(kRasterIssueDateAt, 44361.0);
  CHECK(ParseRasterIssueDate(issue.data(), issue.size()) == 44361.0);
}
