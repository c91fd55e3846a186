#pragma once
// The metadata rows of a raster chart entry: the chart, then each of its panels, read from
// the entry's chart header record and issue record (byte layouts in
// docs/host-interfaces.md, "Dataset entries"). Every field is read only when the record
// reaches its end, and texts only up to their field's end, so a short or damaged record
// loses fields, never reads past its data. No Windows API: tested natively.

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "inspector/format/metadata_rows.h"

namespace br::inspector {

struct RasterPanel {
  std::optional<std::uint16_t> number;      // below 1: the main panel, else a plan
  std::optional<std::uint16_t> index;       // this panel's place among the sub-panels, from 1
  std::optional<std::uint16_t> count;       // sub-panels of the chart
  std::string projection;                   // two letters: MC, TC, PG, ...
  std::optional<std::int32_t> scale;
  std::optional<double> parameters[3];      // projection parameters, by kind
  std::optional<std::string> title;
};

struct RasterChart {
  std::optional<std::uint32_t> producer;
  std::optional<std::string> number;
  std::optional<std::string> title;
  std::vector<RasterPanel> panels;
};

// Layout of the chart header record.
inline constexpr std::size_t kRasterChartNumberAt = 4;
inline constexpr std::size_t kRasterChartNumberSize = 21;
inline constexpr std::size_t kRasterChartTitleAt = 32;
inline constexpr std::size_t kRasterChartTitleSize = 136;
inline constexpr std::size_t kRasterPanelCountAt = 296;
inline constexpr std::size_t kRasterPanelsAt = 300;
inline constexpr std::size_t kRasterPanelSize = 128;
// At most this many panel records are read, whatever the count says.
inline constexpr std::size_t kRasterMaxPanels = 64;
// The issue record's file issue (edition) date: an automation date, 8 bytes.
inline constexpr std::size_t kRasterIssueDateAt = 37;

RasterChart ParseRasterChart(const unsigned char* data, std::size_t size);
std::optional<double> ParseRasterIssueDate(const unsigned char* data, std::size_t size);

// The rows: a heading "Chart" and the chart's rows, then per panel its heading and rows.
// `producer` is the producer's name as shown (the caller's agency lookup); sources.text
// gives the captions, sources.date the file issue date.
std::vector<MetadataRow> RasterChartRows(const RasterChart& chart, std::optional<double> issueDate,
                                         const std::string& producer, const MetadataSources& sources);

// A projection's parameters by its two-letter kind, each on a new line as "caption: value"
// (so the text starts with a line break); empty for a kind without parameters.
std::string ProjectionParameterText(const RasterPanel& panel);

}  // namespace br::inspector
