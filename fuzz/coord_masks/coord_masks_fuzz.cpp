// Coordinate masks: the mask-driven formatter, its read-back by the coordinate edit, and the
// edit's date pictures (the fixed degree-minute and number formats have their native tests).
//
// One input: u8 kind, u8 options, u64 value bits, then the mask (up to a zero byte) and
// the rest as a text typed into an edit. Options bit 0 turns the bits into an ordinary
// coordinate (millionths of a degree) instead of a raw double (NaN, infinities, huge).
//
// Checked beyond "no crash": a general mask gives one character per place of its roles,
// digits in field places, the hemisphere letter at '$' and the mask's own characters
// elsewhere; a preset mask's text reads back within its rounding; a date picture always
// gives a valid date; read-back of any text is finite.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include "frame/format/coord_format.h"
#include "fuzz/common/fuzz_check.h"
#include "toolkit/widgets/edit/CoordText.h"
#include "toolkit/widgets/edit/MonthPicture.h"

using namespace br;

namespace {

struct Preset {
  const char* mask;
  int kind;
  double unit;    // degrees per last digit
  double limit;   // degrees that fit the degree field
};
const Preset kPresets[] = {
    {COORD_MASK_LAT_MINUTES, COORD_LATITUDE, 1.0 / 60000.0, 99.0},
    {COORD_MASK_LAT_HUNDREDTHS, COORD_LATITUDE, 1.0 / 6000.0, 99.0},
    {COORD_MASK_LON_MINUTES, COORD_LONGITUDE, 1.0 / 60000.0, 999.0},
    {COORD_MASK_LON_HUNDREDTHS, COORD_LONGITUDE, 1.0 / 6000.0, 999.0},
};

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// The general path, place by place against the mask it came from.
void CheckGeneral(const std::string& mask, char hemisphere, const std::string& text) {
  FUZZ_CHECK(text.size() == toolkit::CoordText::roles(mask).size());
  std::size_t at = 0;
  std::size_t i = 0;
  while (i < mask.size()) {
    const char c = mask[i];
    std::size_t run = 1;
    while (i + run < mask.size() && mask[i + run] == c) ++run;
    if (c == '$') {
      FUZZ_CHECK(text[at++] == hemisphere);
    } else if (toolkit::CoordText::isFieldLetter(c)) {
      for (std::size_t k = 0; k < run; ++k) FUZZ_CHECK(IsDigit(text[at++]));
    } else {
      FUZZ_CHECK(text.compare(at, run, mask, i, run) == 0);
      at += run;
    }
    i += run;
  }
}

void CheckPresetReadBack(const Preset& preset, double value) {
  if (!(std::fabs(value) < preset.limit)) return;
  const std::string text = FormatCoord(preset.mask, preset.kind, value);
  const double back = toolkit::CoordText::parse(preset.mask, preset.kind, text);
  // One rounding to the last digit, plus the error of summing the fields in doubles.
  FUZZ_CHECK(std::fabs(back - value) <= preset.unit / 2 + 1e-9);
}

void CheckDate(const toolkit::CivilDate& d) {
  FUZZ_CHECK(d.year >= 100 && d.year <= 9999);
  FUZZ_CHECK(d.month >= 1 && d.month <= 12);
  FUZZ_CHECK(d.day >= 1 && d.day <= toolkit::MonthPicture::daysInMonth(d.year, d.month));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::InputReader in(data, size);
  const std::uint8_t kindByte = in.U8();
  const std::uint8_t options = in.U8();
  const std::uint64_t bits = in.U64();
  const std::string mask(in.UntilZero());
  const std::string_view typed = in.Rest();

  // Mostly the two coordinate kinds; the top of the range tries the others.
  const int kind = kindByte < 240 ? COORD_LATITUDE + (kindByte & 1) : static_cast<int>(kindByte) - 245;
  double value;
  if (options & 1) {
    value = static_cast<double>(static_cast<std::int32_t>(bits)) / 1e6;
  } else {
    std::memcpy(&value, &bits, sizeof value);
  }

  const std::string text = FormatCoord(mask.c_str(), kind, value);
  const bool formats = !mask.empty() && (kind == COORD_LATITUDE || kind == COORD_LONGITUDE) && std::isfinite(value);
  if (!formats) {
    FUZZ_CHECK(text.empty());
  } else {
    const char hemisphere = HemisphereLetter(kind, value);
    bool preset = false;
    for (const Preset& p : kPresets) preset = preset || mask == p.mask;
    if (preset) {
      FUZZ_CHECK(!text.empty() && text.size() <= 100);
      if (text.size() < 100) FUZZ_CHECK(text.back() == hemisphere);
    } else {
      CheckGeneral(mask, hemisphere, text);
    }
    const double back = toolkit::CoordText::parse(mask, kind, text);
    FUZZ_CHECK(std::isfinite(back));
  }
  for (const Preset& p : kPresets) CheckPresetReadBack(p, value);

  // Whatever the user types, the edit reads a finite value (0 for a kind without letters).
  const double typedValue = toolkit::CoordText::parse(mask, kind, typed);
  FUZZ_CHECK(std::isfinite(typedValue));
  if (kind != COORD_LATITUDE && kind != COORD_LONGITUDE) FUZZ_CHECK(typedValue == 0.0);

  // The same mask taken as a date picture.
  toolkit::CivilDate base;
  if (toolkit::MonthPicture::fromPlatformDate(value, base)) {
    CheckDate(base);
    FUZZ_CHECK(toolkit::MonthPicture::toPlatformDate(base) == std::trunc(value));
  }
  CheckDate(toolkit::MonthPicture::parse(mask, typed, base));
  return 0;
}
