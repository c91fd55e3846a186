#pragma once
// The one palette of 20 colours that colours all toolkit drawing. It is replaced
// only as a whole; drawing helpers take a palette index.

#include <windows.h>
#include <oaidl.h>

namespace toolkit {

class Palette {
public:
  static constexpr int kSize = 20;

  static COLORREF colour(int index);  // 0 (black) for an index outside 0..19
  // Copies exactly kSize entries; any other count (or no table) changes nothing.
  static bool replace(const COLORREF* table, int count);
  // The same from a VARIANT (or a reference to one) holding, or referring to, a
  // one-dimensional SAFEARRAY of kSize 4-byte values with lower bound 0; anything else
  // changes nothing.
  static bool replace(const VARIANT& palette);
  static void reset();                // back to the initial colours

  // Fills with the colour: SetBkColor, then an opaque ExtTextOut of no text.
  static void fill(HDC dc, const RECT& rect, int index);
  static HBRUSH makeBrush(int index);  // solid; the caller deletes it
  static HPEN makePen(int index);      // solid, one pixel; the caller deletes it
};

}  // namespace toolkit
