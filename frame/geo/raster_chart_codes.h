#pragma once
// Code texts of raster chart entries: the one-byte codes a raster chart header carries for
// its units, datums and projection, and the two ways its producer code is shown. Units and
// datums use the S-57 enumeration values and texts (DUNITS, HUNITS, VERDAT, HORDAT, taken
// from gdal-data at build time); projections use the table below (docs/raster-chart-codes.md).
// The inspector's chart metadata panel and the legend read the same tables.

#include <cstdint>
#include <string>
#include <vector>

#include "frame/geo/agency_table.h"

namespace br::geo {

// S-57 attribute numbers of the tables.
inline constexpr int kAttributeDepthUnits = 89;         // DUNITS
inline constexpr int kAttributeHeightUnits = 96;        // HUNITS
inline constexpr int kAttributeVerticalDatum = 185;     // VERDAT (sounding datum too)
inline constexpr int kAttributeHorizontalDatum = 400;   // HORDAT

// The S-57 text of an enumerated value of one of the four attributes; null when the value
// (0 among them) is not listed.
const char* S57CodeText(int attribute, unsigned value);

const char* DepthUnitText(std::uint8_t code);        // 1 "metres", 3 "feet", ...
const char* HeightUnitText(std::uint8_t code);       // 1 "metres", 2 "feet"
const char* VerticalDatumText(std::uint8_t code);    // 23 "Lowest astronomical tide", ...
const char* HorizontalDatumText(std::uint8_t code);  // 2 "WGS 84", ...

struct ProjectionCode {
  std::uint8_t code;
  const char* kind;  // two letters, as panel records name a projection
  const char* name;  // as the legend shows it
};

// Every listed projection, in code order.
const std::vector<ProjectionCode>& ProjectionCodes();
// Null for an unlisted code or kind.
const ProjectionCode* FindProjection(std::uint8_t code);
const ProjectionCode* FindProjectionKind(const std::string& kind);

// A raster chart's producer code shown as its source producing agency (variant 0: the
// agency's name, else the code in decimal) or as its source identification code (variant 1:
// the agency's abbreviation, else the code in decimal).
enum class AgencyCodeVariant { Agency = 0, Identification = 1 };
std::string RasterAgencyText(const std::vector<AgencyRow>& agencies, std::uint32_t code,
                             AgencyCodeVariant variant);

}  // namespace br::geo
