// What the legend reads from a host as bytes and numbers: a raster chart's header and issue
// records with the code texts and producing agency shown for them, a variation object's
// values and the hit rectangles around a pixel.
//
// One input: u8 choice, then the rest. Choice 0: the rest as a header record and, from
// its 9th byte on, as an issue record. Choice 1: u64 value bits, u64 annual change bits,
// u8 presence, two u32 years, two u32 pixel coordinates and two u16 screen sizes.
// Checked beyond "no crash": a field is read exactly when the bytes reach its end, and
// then holds the bytes there; a code text is null or not empty; an agency text is a row's
// or the code in decimal, never another code's (negative and large codes in the table);
// a variation without a reference year is the value itself, with finite inputs it is
// finite; a rectangle around a pixel holds it and never wraps.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "frame/geo/agency_table.h"
#include "frame/geo/raster_chart_codes.h"
#include "legend/record/legend_record.h"

using namespace br::legend;
using br::geo::AgencyCodeVariant;

namespace {

template <typename T>
void CheckField(const std::optional<T>& field, const unsigned char* data, std::size_t size, std::size_t offset) {
  FUZZ_CHECK(field.has_value() == (size >= offset + sizeof(T)));
  if (!field) return;
  T value;
  std::memcpy(&value, data + offset, sizeof(T));  // the records are little-endian, as this machine
  FUZZ_CHECK(std::memcmp(&value, &*field, sizeof(T)) == 0);
}

void CheckText(const char* text) { FUZZ_CHECK(text == nullptr || *text != '\0'); }

const std::vector<br::geo::AgencyRow>& Agencies() {
  static const std::vector<br::geo::AgencyRow> rows = [] {
    const std::string table = "-1;NEG;Negative one\r\n0;ZER;Zero\r\n550;US;Office of Coast Survey\r\n"
                              "2147483647;MAX;Largest\r\n-2147483648;MIN;Smallest\r\n";
    return br::geo::ParseAgencyTable(reinterpret_cast<const unsigned char*>(table.data()), table.size());
  }();
  return rows;
}

void CheckAgency(std::uint32_t code) {
  for (AgencyCodeVariant variant : {AgencyCodeVariant::Agency, AgencyCodeVariant::Identification}) {
    const std::string text = br::geo::RasterAgencyText(Agencies(), code, variant);
    const br::geo::AgencyRow* row =
        code <= 0x7FFFFFFFu ? br::geo::FindAgency(Agencies(), static_cast<std::int32_t>(code)) : nullptr;
    if (row) {
      FUZZ_CHECK(text == (variant == AgencyCodeVariant::Agency ? row->name : row->abbreviation));
    } else {
      FUZZ_CHECK(text == std::to_string(code));
    }
  }
}

double Double(std::uint64_t bits) {
  double value;
  std::memcpy(&value, &bits, sizeof value);
  return value;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  br::fuzz::InputReader in(data, size);
  if (in.U8() % 2 == 0) {
    const std::vector<unsigned char> record(data + (size > 0 ? 1 : 0), data + size);
    const unsigned char* bytes = record.empty() ? nullptr : record.data();
    const RasterChartHeader header = ParseRasterChartHeader(bytes, record.size());
    CheckField(header.producer, bytes, record.size(), 0);
    CheckField(header.scale, bytes, record.size(), 25);
    CheckField(header.depthUnits, bytes, record.size(), 29);
    CheckField(header.projection, bytes, record.size(), 168);
    CheckField(header.horizontalDatum, bytes, record.size(), 271);
    CheckField(header.soundingDatum, bytes, record.size(), 276);
    CheckField(header.heightUnits, bytes, record.size(), 280);
    CheckField(header.verticalDatum, bytes, record.size(), 284);
    if (header.depthUnits) CheckText(br::geo::DepthUnitText(*header.depthUnits));
    if (header.heightUnits) CheckText(br::geo::HeightUnitText(*header.heightUnits));
    if (header.verticalDatum) CheckText(br::geo::VerticalDatumText(*header.verticalDatum));
    if (header.soundingDatum) CheckText(br::geo::VerticalDatumText(*header.soundingDatum));
    if (header.horizontalDatum) CheckText(br::geo::HorizontalDatumText(*header.horizontalDatum));
    if (header.projection) {
      const br::geo::ProjectionCode* projection = br::geo::FindProjection(*header.projection);
      FUZZ_CHECK(!projection || (projection->code == *header.projection &&
                                 br::geo::FindProjectionKind(projection->kind) == projection));
    }
    if (header.producer) CheckAgency(*header.producer);

    const std::size_t issueStart = record.size() > 8 ? 8 : record.size();
    const unsigned char* issueBytes = bytes ? bytes + issueStart : nullptr;
    const RasterChartIssue issue = ParseRasterChartIssue(issueBytes, record.size() - issueStart);
    CheckField(issue.updateDate, issueBytes, record.size() - issueStart, 21);
    CheckField(issue.editionDate, issueBytes, record.size() - issueStart, 37);
    return 0;
  }

  const double value = Double(in.U64());
  const double change = Double(in.U64());
  const std::uint8_t presence = in.U8();
  const auto reference = static_cast<std::int32_t>(in.U16() | (std::uint32_t{in.U16()} << 16));
  const auto current = static_cast<std::int32_t>(in.U16() | (std::uint32_t{in.U16()} << 16));
  const std::optional<double> annual = presence & 1 ? std::optional<double>(change) : std::nullopt;
  const std::optional<std::int32_t> year = presence & 2 ? std::optional<std::int32_t>(reference) : std::nullopt;
  const double variation = MagneticVariation(value, annual, year, current);
  if (!year) FUZZ_CHECK(std::memcmp(&variation, &value, sizeof value) == 0);
  if (std::isfinite(value) && std::fabs(value) <= 360 && (!annual || std::fabs(*annual) <= 1e4)) {
    FUZZ_CHECK(std::isfinite(variation));
  }

  const auto x = static_cast<std::int32_t>(in.U16() | (std::uint32_t{in.U16()} << 16));
  const auto y = static_cast<std::int32_t>(in.U16() | (std::uint32_t{in.U16()} << 16));
  const PixelRect near = NearRect(x, y);
  FUZZ_CHECK(near.left <= x && x <= near.right && near.top <= y && y <= near.bottom);
  FUZZ_CHECK(std::int64_t{near.right} - near.left <= 16 && std::int64_t{near.bottom} - near.top <= 16);
  const std::int32_t width = in.U16();
  const std::int32_t height = in.U16();
  const PixelRect screen = ScreenRect(width, height);
  FUZZ_CHECK(screen.left <= 0 && 0 <= screen.right && screen.top <= 0 && 0 <= screen.bottom);
  FUZZ_CHECK(std::int64_t{screen.right} - screen.left <= std::int64_t{width} + 1);
  return 0;
}
