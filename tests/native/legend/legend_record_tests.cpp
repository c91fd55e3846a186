// The legend's portable arithmetic: the cache key, the variation of one object, the hit
// rectangles, and the raster chart records read only inside their bytes.
#include <doctest/doctest.h>

#include <cstring>
#include <vector>

#include "legend/record/legend_record.h"

using namespace br::legend;

TEST_CASE("the cache key matches only after a fill, on identity, edition and update") {
  std::array<unsigned char, 16> identity{};
  identity[0] = 7;
  CacheKey key;
  key.identity = identity;
  CHECK_FALSE(key.Matches(identity, 0, 0));  // a cleared key: an edition 0 dataset is read again
  key.valid = true;
  CHECK(key.Matches(identity, 0, 0));
  CHECK_FALSE(key.Matches(identity, 1, 0));
  CHECK_FALSE(key.Matches(identity, 0, 1));  // a new update
  identity[15] = 1;
  CHECK_FALSE(key.Matches(identity, 0, 0));
}

TEST_CASE("the variation of one object") {
  // 2.5 degrees, 6 minutes a year, ten years on.
  CHECK(MagneticVariation(2.5, 6.0, 2014, 2024) == doctest::Approx(3.5));
  CHECK(MagneticVariation(-1.5, -12.0, 2030, 2024) == doctest::Approx(-0.3));
  // No change read: the value stands.
  CHECK(MagneticVariation(2.5, std::nullopt, 2014, 2024) == 2.5);
  // No reference year: the value alone, not 6' times the year number (+202 degrees).
  CHECK(MagneticVariation(2.5, 6.0, std::nullopt, 2024) == 2.5);
}

TEST_CASE("hit rectangles") {
  const PixelRect near = NearRect(100, -20);
  CHECK((near.left == 92 && near.top == -28 && near.right == 108 && near.bottom == -12));
  const PixelRect edge = NearRect(INT32_MAX - 3, INT32_MIN + 2);  // no wrap at the ends
  CHECK((edge.right == INT32_MAX && edge.top == INT32_MIN && edge.left == INT32_MAX - 11));
  const PixelRect screen = ScreenRect(1025, 768);
  CHECK((screen.left == -512 && screen.right == 512 && screen.top == -384 && screen.bottom == 384));
}

namespace {
template <class T>
void Put(std::vector<unsigned char>& bytes, std::size_t offset, T value) {
  std::memcpy(&bytes[offset], &value, sizeof value);
}
}  // namespace

TEST_CASE("raster chart records: fields at their offsets, none past the bytes") {
  std::vector<unsigned char> header(300, 0);
  Put<std::uint32_t>(header, 0, 170);
  Put<std::int32_t>(header, 25, -50000);
  header[29] = 3;
  header[168] = 2;
  header[271] = 4;
  header[276] = 23;
  header[280] = 2;
  header[284] = 7;
  const RasterChartHeader full = ParseRasterChartHeader(header.data(), header.size());
  CHECK(*full.producer == 170);
  CHECK(*full.scale == -50000);
  CHECK(*full.depthUnits == 3);
  CHECK(*full.projection == 2);
  CHECK(*full.horizontalDatum == 4);
  CHECK(*full.soundingDatum == 23);
  CHECK(*full.heightUnits == 2);
  CHECK(*full.verticalDatum == 7);

  const RasterChartHeader cut = ParseRasterChartHeader(header.data(), 28);  // the scale ends at 29
  CHECK(cut.producer.has_value());
  CHECK_FALSE(cut.scale.has_value());
  CHECK_FALSE(cut.depthUnits.has_value());
  CHECK_FALSE(ParseRasterChartHeader(header.data(), 284).verticalDatum.has_value());
  CHECK(ParseRasterChartHeader(header.data(), 285).verticalDatum.has_value());
  CHECK_FALSE(ParseRasterChartHeader(nullptr, 300).producer.has_value());

  std::vector<unsigned char> issue(45, 0);
  Put<double>(issue, 21, 45000.5);
  Put<double>(issue, 37, 44000.0);
  const RasterChartIssue dates = ParseRasterChartIssue(issue.data(), issue.size());
  CHECK(*dates.updateDate == 45000.5);
  CHECK(*dates.editionDate == 44000.0);
  CHECK_FALSE(ParseRasterChartIssue(issue.data(), 44).editionDate.has_value());
  CHECK(ParseRasterChartIssue(issue.data(), 29).updateDate.has_value());
}
