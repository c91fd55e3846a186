// Code texts of raster chart entries: the S-57 texts made from gdal-data at build time,
// the projection table's codes and kinds, and the producer code's two forms.
#include <doctest/doctest.h>

#include <set>
#include <string>

#include "frame/geo/raster_chart_codes.h"

using namespace br::geo;

namespace {
std::string Text(const char* text) { return text ? text : "(none)"; }
}  // namespace

TEST_CASE("units and datums carry the S-57 texts") {
  CHECK(Text(DepthUnitText(1)) == "metres");
  CHECK(Text(DepthUnitText(2)) == "fathoms and feet");
  CHECK(Text(DepthUnitText(3)) == "feet");
  CHECK(Text(HeightUnitText(2)) == "feet");  // HUNITS numbers feet differently from DUNITS
  CHECK(Text(VerticalDatumText(23)) == "Lowest astronomical tide");
  CHECK(Text(VerticalDatumText(3)) == "Mean sea level");
  CHECK(Text(HorizontalDatumText(2)) == "WGS 84");
  CHECK(Text(HorizontalDatumText(3)) == "European 1950");
  // Code 0 and codes past each list have no text.
  CHECK(DepthUnitText(0) == nullptr);
  CHECK(DepthUnitText(5) == nullptr);
  CHECK(HeightUnitText(3) == nullptr);
  CHECK(VerticalDatumText(0) == nullptr);
  CHECK(VerticalDatumText(255) == nullptr);
  CHECK(S57CodeText(131, 1) == nullptr);  // an attribute outside the four
  // Values the list reserves without a text have none: the legend keeps its default.
  for (unsigned value = 61; value <= 98; ++value) {
    INFO(value);
    CHECK(HorizontalDatumText(static_cast<std::uint8_t>(value)) == nullptr);
  }
  for (unsigned value = 0; value < 256; ++value) {
    for (const char* text : {DepthUnitText(static_cast<std::uint8_t>(value)), HeightUnitText(static_cast<std::uint8_t>(value)),
                             VerticalDatumText(static_cast<std::uint8_t>(value)),
                             HorizontalDatumText(static_cast<std::uint8_t>(value))}) {
      CHECK((text == nullptr || *text != '\0'));
    }
  }
}

TEST_CASE("projection codes and kinds are unique and find each other") {
  std::set<int> codes;
  std::set<std::string> kinds;
  for (const ProjectionCode& row : ProjectionCodes()) {
    CHECK(codes.insert(row.code).second);
    CHECK(kinds.insert(row.kind).second);
    CHECK(std::string(row.kind).size() == 2);
    CHECK(FindProjection(row.code) == &row);
    CHECK(FindProjectionKind(row.kind) == &row);
  }
  CHECK(Text(FindProjection(1)->name) == "MERCATOR");
  CHECK(Text(FindProjectionKind("TC")->name) == "TRANSVERSE MERCATOR");
  CHECK(FindProjection(0) == nullptr);
  CHECK(FindProjection(200) == nullptr);
  CHECK(FindProjectionKind("mc") == nullptr);
  CHECK(FindProjectionKind("") == nullptr);
}

TEST_CASE("a producer code as agency and as identification code") {
  const std::vector<AgencyRow> agencies = {{170, "FR", "Service Hydrographique et Oceanographique de la Marine"},
                                           {550, "US", "Office of Coast Survey, USA"}};
  CHECK(RasterAgencyText(agencies, 170, AgencyCodeVariant::Agency) ==
        "Service Hydrographique et Oceanographique de la Marine");
  CHECK(RasterAgencyText(agencies, 170, AgencyCodeVariant::Identification) == "FR");
  CHECK(RasterAgencyText(agencies, 171, AgencyCodeVariant::Agency) == "171");
  CHECK(RasterAgencyText(agencies, 171, AgencyCodeVariant::Identification) == "171");
  CHECK(RasterAgencyText(agencies, 0xFFFFFFFFu, AgencyCodeVariant::Agency) == "4294967295");
}
