#include "legend/record/legend_record.h"

#include <cmath>
#include <cstring>

namespace br::legend {
namespace {

template <class T>
std::optional<T> ReadAt(const unsigned char* data, std::size_t size, std::size_t offset) {
  if (!data || offset > size || size - offset < sizeof(T)) return std::nullopt;
  // Little-endian fields on little-endian machines: the bytes as they lie.
  T value;
  std::memcpy(&value, data + offset, sizeof(T));
  return value;
}

}  // namespace

CalendarDate CalendarDate::Unconvertible() {
  CalendarDate date;
  date.fields.fill(0xFFFF);
  return date;
}

bool CalendarDate::IsNoValue() const {
  bool allZero = true;
  bool allOnes = true;
  for (std::uint16_t field : fields) {
    allZero = allZero && field == 0;
    allOnes = allOnes && field == 0xFFFF;
  }
  return allZero || allOnes;
}

LegendRecord ResetRecord(const LegendDefaults& defaults) {
  LegendRecord record;
  record.depthUnits = defaults.units;
  record.heightUnits = defaults.units;
  record.soundingDatum = defaults.notDefined;
  record.verticalDatum = defaults.notDefined;
  record.horizontalDatum = "WGS-84";
  record.projection = defaults.projection;
  return record;
}

double MagneticVariation(double value, std::optional<double> annualChangeMinutes,
                         std::optional<std::int32_t> referenceYear, std::int32_t currentYear) {
  if (!referenceYear) return value;
  const double change = annualChangeMinutes && std::isfinite(*annualChangeMinutes) ? *annualChangeMinutes : 0.0;
  const double years = static_cast<double>(currentYear) - static_cast<double>(*referenceYear);
  return value + change / 60.0 * years;
}

PixelRect NearRect(std::int32_t x, std::int32_t y) {
  // Computed wide: a pixel near the ends of the 32-bit range must not wrap.
  const auto clamp = [](std::int64_t v) {
    return static_cast<std::int32_t>(v < INT32_MIN ? INT32_MIN : (v > INT32_MAX ? INT32_MAX : v));
  };
  return {clamp(std::int64_t{x} - 8), clamp(std::int64_t{y} - 8), clamp(std::int64_t{x} + 8),
          clamp(std::int64_t{y} + 8)};
}

PixelRect ScreenRect(std::int32_t width, std::int32_t height) {
  return {-(width / 2), -(height / 2), width / 2, height / 2};
}

RasterChartHeader ParseRasterChartHeader(const unsigned char* data, std::size_t size) {
  RasterChartHeader header;
  header.producer = ReadAt<std::uint32_t>(data, size, 0);
  header.scale = ReadAt<std::int32_t>(data, size, 25);
  header.depthUnits = ReadAt<std::uint8_t>(data, size, 29);
  header.projection = ReadAt<std::uint8_t>(data, size, 168);
  header.horizontalDatum = ReadAt<std::uint8_t>(data, size, 271);
  header.soundingDatum = ReadAt<std::uint8_t>(data, size, 276);
  header.heightUnits = ReadAt<std::uint8_t>(data, size, 280);
  header.verticalDatum = ReadAt<std::uint8_t>(data, size, 284);
  return header;
}

RasterChartIssue ParseRasterChartIssue(const unsigned char* data, std::size_t size) {
  return {ReadAt<double>(data, size, 21), ReadAt<double>(data, size, 37)};
}

}  // namespace br::legend
