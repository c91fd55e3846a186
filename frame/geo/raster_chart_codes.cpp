#include "frame/geo/raster_chart_codes.h"

#include <cstddef>

namespace br::geo {
namespace {

struct CodeText {
  int attribute;
  unsigned value;
  const char* text;
};

// Generated from gdal-data's s57expectedinput.csv (frame/geo/s57_code_texts.cmake).
const CodeText kCodeTexts[] = {
#include "s57_code_texts.inc"
};

}  // namespace

const char* S57CodeText(int attribute, unsigned value) {
  for (const CodeText& row : kCodeTexts) {
    if (row.attribute == attribute && row.value == value) return row.text;
  }
  return nullptr;
}

const char* DepthUnitText(std::uint8_t code) { return S57CodeText(kAttributeDepthUnits, code); }
const char* HeightUnitText(std::uint8_t code) { return S57CodeText(kAttributeHeightUnits, code); }
const char* VerticalDatumText(std::uint8_t code) { return S57CodeText(kAttributeVerticalDatum, code); }
const char* HorizontalDatumText(std::uint8_t code) {
  return S57CodeText(kAttributeHorizontalDatum, code);
}

const std::vector<ProjectionCode>& ProjectionCodes() {
  // The projections of paper and raster charts; codes are ours and never reused.
  static const std::vector<ProjectionCode> codes = {
      {1, "MC", "MERCATOR"},
      {2, "TC", "TRANSVERSE MERCATOR"},
      {3, "UT", "UNIVERSAL TRANSVERSE MERCATOR"},
      {4, "PG", "GNOMONIC"},
      {5, "PS", "POLAR STEREOGRAPHIC"},
      {6, "LC", "LAMBERT CONFORMAL CONIC"},
      {7, "PC", "POLYCONIC"},
      {8, "OM", "OBLIQUE MERCATOR"},
      {9, "AE", "AZIMUTHAL EQUIDISTANT"},
      {10, "EQ", "EQUIRECTANGULAR"},
  };
  return codes;
}

const ProjectionCode* FindProjection(std::uint8_t code) {
  for (const ProjectionCode& row : ProjectionCodes()) {
    if (row.code == code) return &row;
  }
  return nullptr;
}

const ProjectionCode* FindProjectionKind(const std::string& kind) {
  for (const ProjectionCode& row : ProjectionCodes()) {
    if (kind == row.kind) return &row;
  }
  return nullptr;
}

std::string RasterAgencyText(const std::vector<AgencyRow>& agencies, std::uint32_t code,
                             AgencyCodeVariant variant) {
  // Codes above the 32-bit signed range are never listed; they still show as written.
  const AgencyRow* row =
      code <= 0x7FFFFFFFu ? FindAgency(agencies, static_cast<std::int32_t>(code)) : nullptr;
  if (!row) return std::to_string(code);
  return variant == AgencyCodeVariant::Agency ? row->name : row->abbreviation;
}

}  // namespace br::geo
