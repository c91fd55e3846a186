#include "inspector/format/raster_chart_rows.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

#include "frame/format/coord_format.h"
#include "frame/format/number_format.h"
#include "frame/geo/dataset_header.h"
#include "frame/geo/raster_chart_codes.h"

namespace br::inspector {

namespace {

// Offsets inside a panel record.
constexpr std::size_t kPanelNumber = 0;
constexpr std::size_t kPanelIndex = 2;
constexpr std::size_t kPanelCount = 4;
constexpr std::size_t kPanelProjection = 6;  // two letters
constexpr std::size_t kPanelScale = 8;
constexpr std::size_t kPanelParameters = 12;  // three doubles
constexpr std::size_t kPanelTitle = 36;
constexpr std::size_t kPanelTitleSize = kRasterPanelSize - kPanelTitle;

constexpr std::size_t kProducerAt = 0;

template <typename T>
std::optional<T> Read(const unsigned char* data, std::size_t size, std::size_t offset) {
  if (data == nullptr || offset > size || size - offset < sizeof(T)) return std::nullopt;
  T value;
  std::memcpy(&value, data + offset, sizeof(T));  // the records are little-endian, as we are
  return value;
}

std::string Line(const std::string& caption, const std::string& value) { return caption + ": " + value; }

std::string Number(double value, int decimals) { return FormatNumber(value, decimals); }

std::string Latitude(double value) { return value == NO_VALUE ? NO_VALUE_TEXT : FormatLatitudeDM(value); }
std::string Longitude(double value) { return value == NO_VALUE ? NO_VALUE_TEXT : FormatLongitudeDM(value); }

std::string Text(const MetadataSources& sources, long id, const char* defaultText) {
  return sources.text ? sources.text(id, defaultText) : std::string(defaultText);
}

// Captions without a text id always show their default text.
std::string Fixed(const char* text) { return text; }

}  // namespace

RasterChart ParseRasterChart(const unsigned char* data, std::size_t size) {
  RasterChart chart;
  if (data == nullptr) return chart;
  chart.producer = Read<std::uint32_t>(data, size, kProducerAt);
  chart.number = geo::BoundedText(data, size, kRasterChartNumberAt, kRasterChartNumberSize);
  chart.title = geo::BoundedText(data, size, kRasterChartTitleAt, kRasterChartTitleSize);
  const std::size_t count =
      std::min<std::size_t>(Read<std::uint16_t>(data, size, kRasterPanelCountAt).value_or(0), kRasterMaxPanels);
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t at = kRasterPanelsAt + i * kRasterPanelSize;
    if (at >= size) break;
    RasterPanel panel;
    panel.number = Read<std::uint16_t>(data, size, at + kPanelNumber);
    panel.index = Read<std::uint16_t>(data, size, at + kPanelIndex);
    panel.count = Read<std::uint16_t>(data, size, at + kPanelCount);
    if (auto kind = geo::BoundedText(data, size, at + kPanelProjection, 2)) panel.projection = *kind;
    panel.scale = Read<std::int32_t>(data, size, at + kPanelScale);
    for (std::size_t p = 0; p < 3; ++p) panel.parameters[p] = Read<double>(data, size, at + kPanelParameters + 8 * p);
    panel.title = geo::BoundedText(data, size, at + kPanelTitle, kPanelTitleSize);
    chart.panels.push_back(std::move(panel));
  }
  return chart;
}

std::optional<double> ParseRasterIssueDate(const unsigned char* data, std::size_t size) {
  return Read<double>(data, size, kRasterIssueDateAt);
}

std::string ProjectionParameterText(const RasterPanel& panel) {
  const auto p = [&](int i) { return panel.parameters[i].value_or(NO_VALUE); };
  std::vector<std::string> lines;
  if (panel.projection == "MC") {
    lines = {Line(Fixed("Latitude"), Latitude(p(0))), Line(Fixed("Rotation"), Number(p(1), 7))};
  } else if (panel.projection == "TC") {
    lines = {Line(Fixed("Scale Factor"), Number(p(0), 10)), Line(Fixed("Longitude"), Longitude(p(1))),
             Line(Fixed("Rotation"), Number(p(2), 7))};
  } else if (panel.projection == "PG") {
    lines = {Line(Fixed("Latitude"), Latitude(p(0))), Line(Fixed("Longitude"), Longitude(p(1)))};
  }
  std::string text;
  for (const std::string& line : lines) text += "\r" + line;
  return text;
}

std::vector<MetadataRow> RasterChartRows(const RasterChart& chart, std::optional<double> issueDate,
                                         const std::string& producer, const MetadataSources& sources) {
  std::vector<MetadataRow> rows;
  const auto add = [&](std::string caption, std::string value) {
    if (!caption.empty() && !value.empty()) rows.push_back({std::move(caption), std::move(value)});
  };
  const std::string chartWord = Fixed("Chart");
  const std::string number = chart.number.value_or("");

  add(kHeadingCaption, chartWord);
  add(Text(sources, 37, "Chart Number"), number);
  add(Fixed("Chart Title"), chart.title.value_or(""));
  if (issueDate) {
    std::string date = sources.date ? sources.date(*issueDate) : std::string();
    add(Text(sources, 40, "File Issue Date"), date.empty() ? Text(sources, 4, "Not defined") : date);
  }

  for (const RasterPanel& panel : chart.panels) {
    const int panelNumber = panel.number.value_or(0);
    std::string heading = panelNumber < 1 ? Fixed("Main Panel") : Fixed("Plan") + " #" + std::to_string(panelNumber);
    heading += " (" + chartWord + " " + number + ", " + producer + ")";
    add(kHeadingCaption, heading);
    add(Fixed("Plan Title"), panel.title.value_or(""));
    if (panel.scale) add(Text(sources, 13, "Scale"), std::to_string(*panel.scale));
    const int count = panel.count.value_or(1);
    if (count > 1) {
      char subPanel[80];
      std::snprintf(subPanel, sizeof subPanel, "Sub-Panel Number %d of %d", static_cast<int>(panel.index.value_or(0)),
                    count);
      add(kHeadingCaption, subPanel);
    }
    if (!panel.projection.empty()) {
      const geo::ProjectionCode* known = geo::FindProjectionKind(panel.projection);
      const std::string name = known ? known->name : panel.projection;
      add(Text(sources, 23, "Projection"), name + ProjectionParameterText(panel));
    }
  }
  return rows;
}

}  // namespace br::inspector
