#pragma once
// The legend of one chart dataset at one position, and the arithmetic behind it that needs
// no Windows API: the magnetic variation of a variation object, the hit rectangles, the
// raster chart header and issue record fields, and the calendar dates' "no value" forms.

#include <array>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <string>

namespace br::legend {

inline constexpr double kNoValue = std::numeric_limits<double>::max();

// A calendar date as the platform's SYSTEMTIME lays it out: year, month, day of week, day,
// hour, minute, second, millisecond.
struct CalendarDate {
  std::array<std::uint16_t, 8> fields{};

  static CalendarDate Unconvertible();  // every field 0xFFFF
  // All zero (no date was read) or unconvertible: shown as "no value".
  bool IsNoValue() const;
};

struct LegendRecord {
  std::string depthUnits;
  std::string heightUnits;
  std::string soundingDatum;
  std::string verticalDatum;
  std::string horizontalDatum;
  CalendarDate editionDate;
  CalendarDate updateDate;
  std::int32_t editionNumber = 0;
  std::int32_t updateNumber = 0;
  std::string sourceIdCode;
  std::string sourceProducingAgency;
  std::string bathymetricQuality;
  double nonBathymetricQuality = 0.0;
  std::int32_t defaultScale = 0;
  std::string projection;
  double magneticVariation = kNoValue;
};

// The texts a reset record takes (localised by the caller).
struct LegendDefaults {
  std::string units;         // "Meters"
  std::string notDefined;    // "Not defined"
  std::string projection;    // "MERCATOR"
};

LegendRecord ResetRecord(const LegendDefaults& defaults);

// What tells a dataset's header fill from another's: its identity, edition and update
// number. A key that was never filled (or was cleared by a reset) matches nothing.
struct CacheKey {
  bool valid = false;
  std::array<unsigned char, 16> identity{};
  std::uint16_t edition = 0;
  std::uint16_t update = 0;

  bool Matches(const std::array<unsigned char, 16>& otherIdentity, std::uint16_t otherEdition,
               std::uint16_t otherUpdate) const {
    return valid && identity == otherIdentity && edition == otherEdition && update == otherUpdate;
  }
};

// The variation of a magnetic variation object in degrees: value + annual change (minutes)
// / 60 x (current year - reference year). Without a reference year the value stands alone:
// a change per year means nothing without the year it counts from.
double MagneticVariation(double value, std::optional<double> annualChangeMinutes,
                         std::optional<std::int32_t> referenceYear, std::int32_t currentYear);

struct PixelRect {
  std::int32_t left, top, right, bottom;
};
// The 16-pixel square around the position's pixel (x, y).
PixelRect NearRect(std::int32_t x, std::int32_t y);
// A screen-sized rectangle centred on the projection's pixel (0, 0).
PixelRect ScreenRect(std::int32_t width, std::int32_t height);

// The fields of a raster chart's header record that the legend reads; each only when the
// bytes reach its end.
struct RasterChartHeader {
  std::optional<std::uint32_t> producer;       // +0
  std::optional<std::int32_t> scale;           // +25
  std::optional<std::uint8_t> depthUnits;      // +29
  std::optional<std::uint8_t> projection;      // +168
  std::optional<std::uint8_t> horizontalDatum; // +271
  std::optional<std::uint8_t> soundingDatum;   // +276
  std::optional<std::uint8_t> heightUnits;     // +280
  std::optional<std::uint8_t> verticalDatum;   // +284
};
RasterChartHeader ParseRasterChartHeader(const unsigned char* data, std::size_t size);

// The issue record's automation dates (8-byte doubles): update at +21, edition at +37.
struct RasterChartIssue {
  std::optional<double> updateDate;
  std::optional<double> editionDate;
};
RasterChartIssue ParseRasterChartIssue(const unsigned char* data, std::size_t size);

}  // namespace br::legend
