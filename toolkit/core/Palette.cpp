#include "toolkit/core/Palette.h"

#include <oleauto.h>

#include <algorithm>
#include <cstring>

namespace toolkit {

namespace {

constexpr COLORREF kInitial[Palette::kSize] = {
    0x000000, 0x000080, 0x008000, 0x008080, 0x800000, 0x808000, 0x800080,
    0xC0C0C0, 0x808080, 0x0000FF, 0x00FF00, 0x00FFFF, 0xFF0000, 0xFFFF00,
    0xFF00FF, 0xFFFFFF, 0x000000, 0x808080, 0xA4A0A0, 0xF0FBFF,
};

COLORREF g_colours[Palette::kSize] = {
    0x000000, 0x000080, 0x008000, 0x008080, 0x800000, 0x808000, 0x800080,
    0xC0C0C0, 0x808080, 0x0000FF, 0x00FF00, 0x00FFFF, 0xFF0000, 0xFFFF00,
    0xFF00FF, 0xFFFFFF, 0x000000, 0x808080, 0xA4A0A0, 0xF0FBFF,
};

}  // namespace

COLORREF Palette::colour(int index) {
  if (index < 0 || index >= kSize) return 0;
  return g_colours[index];
}

bool Palette::replace(const COLORREF* table, int count) {
  if (!table || count != kSize) return false;
  std::copy(table, table + kSize, g_colours);
  return true;
}

bool Palette::replace(const VARIANT& given) {
  // A reference to a VARIANT (what Basic passes for a Variant variable) stands for it; one
  // level only.
  const VARIANT& palette = given.vt == (VT_BYREF | VT_VARIANT) && given.pvarVal ? *given.pvarVal : given;
  if (!(palette.vt & VT_ARRAY)) return false;
  SAFEARRAY* array = nullptr;
  if (palette.vt & VT_BYREF) {
    array = palette.pparray ? *palette.pparray : nullptr;
  } else {
    array = palette.parray;
  }
  if (!array || SafeArrayGetDim(array) != 1 || SafeArrayGetElemsize(array) != 4 ||
      array->rgsabound[0].cElements != kSize || array->rgsabound[0].lLbound != 0)
    return false;
  void* data = nullptr;
  if (FAILED(SafeArrayAccessData(array, &data)) || !data) return false;
  COLORREF table[kSize];
  std::memcpy(table, data, sizeof(table));
  SafeArrayUnaccessData(array);
  return replace(table, kSize);
}

void Palette::reset() { std::copy(kInitial, kInitial + kSize, g_colours); }

void Palette::fill(HDC dc, const RECT& rect, int index) {
  SetBkColor(dc, colour(index));
  ExtTextOutA(dc, 0, 0, ETO_OPAQUE, &rect, "", 0, nullptr);
}

HBRUSH Palette::makeBrush(int index) { return CreateSolidBrush(colour(index)); }

HPEN Palette::makePen(int index) { return CreatePen(PS_SOLID, 1, colour(index)); }

}  // namespace toolkit
