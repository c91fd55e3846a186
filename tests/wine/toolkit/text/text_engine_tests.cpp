// The engine's font slots, base fonts and measuring.
#include <doctest/doctest.h>

#include <windows.h>

#include <string>

#include "tests/wine/toolkit/text/text_test_support.h"
#include "toolkit/text/TextEngine.h"

using namespace br::test;
using toolkit::TextEngine;

namespace {

HFONT MakeFont(int height) {
  LOGFONTW logFont{};
  logFont.lfHeight = height;
  lstrcpyW(logFont.lfFaceName, L"DejaVu Sans");
  return CreateFontIndirectW(&logFont);
}

bool Alive(HGDIOBJ object) { return GetObjectType(object) == OBJ_FONT; }

LOGFONTW Described(HFONT font) {
  LOGFONTW logFont{};
  GetObjectW(font, sizeof logFont, &logFont);
  return logFont;
}

const std::wstring kArabic =
    L"\u0645\u064A\u0646\u0627\u0621 \u0627\u0644\u0625\u0633\u0643\u0646\u062F\u0631\u064A\u0629";

}  // namespace

TEST_CASE("font slots: only 0..4, a slot's owned font deleted when replaced, never when given again") {
  TextEngine engine(false);
  HFONT a = MakeFont(-12), b = MakeFont(-14), lent = MakeFont(-16);

  CHECK(engine.setFontSlot(5, a, true) == -1);
  CHECK(engine.setFontSlot(-1, a, true) == -1);
  for (int slot = 0; slot < TextEngine::kSlots; ++slot) CHECK(engine.slotFont(slot) == nullptr);

  CHECK(engine.setFontSlot(3, a, true) == 3);
  CHECK(engine.setFontSlot(3, a, true) == 3);  // the slot's own font again
  CHECK(Alive(a));
  CHECK(engine.slotFont(3) == a);

  CHECK(engine.setFontSlot(3, b, true) == 3);  // replaced: the owned one goes
  CHECK_FALSE(Alive(a));
  CHECK(engine.setFontSlot(4, lent, false) == 4);
  CHECK(engine.setFontSlot(4, nullptr, false) == 4);  // lent: stays the caller's
  CHECK(Alive(lent));

  SUBCASE("selecting: a slot with a font becomes current, an empty one leaves none") {
    CHECK(engine.selectFontSlot(3) == -1);
    CHECK(engine.currentSlot() == 3);
    CHECK(engine.selectFontSlot(4) == 3);
    CHECK(engine.currentSlot() == -1);
    CHECK(engine.selectFontSlot(7) == -1);
    engine.selectFontSlot(3);
    engine.setFontSlot(3, nullptr, false);  // emptying the current slot leaves none current
    CHECK(engine.currentSlot() == -1);
    CHECK_FALSE(Alive(b));
  }
  SUBCASE("the engine deletes what it owns when it goes") {
    HFONT c = MakeFont(-18);
    {
      TextEngine owner(false);
      owner.setFontSlot(0, c, true);
      owner.setFontSlot(1, c, true);  // one font in two slots is deleted once
      owner.setFontSlot(1, nullptr, false);
      CHECK(Alive(c));  // slot 0 still holds it
    }
    CHECK_FALSE(Alive(c));
  }
  DeleteObject(lent);
}

TEST_CASE("base fonts: normal, bold and bold underlined in slots 0..2, replaced without leaking") {
  TestFont source(L"DejaVu Sans", -15);
  TextEngine engine(false);
  CHECK_FALSE(engine.setBaseFont(nullptr));
  CHECK_FALSE(engine.setBaseFont(reinterpret_cast<HFONT>(GetStockObject(WHITE_BRUSH))));
  CHECK(engine.slotFont(0) == nullptr);

  REQUIRE(engine.setBaseFont(source.get()));
  HFONT first[3] = {engine.baseFont(0), engine.baseFont(1), engine.baseFont(2)};
  for (int i = 0; i < 3; ++i) {
    CHECK(engine.slotFont(i) == first[i]);
    CHECK(first[i] != source.get());
    CHECK(Described(first[i]).lfHeight == -15);
  }
  CHECK(Described(first[0]).lfWeight == FW_NORMAL);
  CHECK(Described(first[1]).lfWeight == FW_BOLD);
  CHECK_FALSE(Described(first[1]).lfUnderline);
  CHECK(Described(first[2]).lfWeight == FW_BOLD);
  CHECK(Described(first[2]).lfUnderline);

  // Slot 4 borrows a base font; a second base font must not leave it a dead handle.
  engine.setFontSlot(4, first[1], true);
  engine.selectFontSlot(0);
  TestFont other(L"DejaVu Sans", -20);
  REQUIRE(engine.setBaseFont(other.get()));
  for (HFONT old : first) CHECK_FALSE(Alive(old));
  CHECK(engine.slotFont(4) == nullptr);
  CHECK(engine.currentSlot() == 0);
  CHECK(Described(engine.slotFont(0)).lfHeight == -20);
  CHECK(Alive(source.get()));
}

TEST_CASE("measureText: GDI's extent without the script processor or a slot, shaped widths with it") {
  REQUIRE(HasFace(kArabicFace));
  EngineOnCanvas shaped(kArabicFace, true);
  EngineOnCanvas plain(kArabicFace, false);
  REQUIRE(shaped.engine.available());
  CHECK_FALSE(plain.engine.available());
  HDC dc = plain.canvas.Dc();
  const std::wstring latin = L"Port of Brest, tide gauge";

  SIZE gdi{};
  GetTextExtentPoint32W(dc, latin.c_str(), static_cast<int>(latin.size()), &gdi);
  SIZE measured = plain.engine.measureText(dc, latin);
  CHECK(measured.cx == gdi.cx);
  CHECK(measured.cy == gdi.cy);

  SUBCASE("no current slot measures with the DC's own font, through GDI") {
    shaped.engine.selectFontSlot(-1);
    TestFont big(kArabicFace, -30);
    HGDIOBJ old = SelectObject(shaped.canvas.Dc(), big.get());
    SIZE bigGdi{};
    GetTextExtentPoint32W(shaped.canvas.Dc(), latin.c_str(), static_cast<int>(latin.size()), &bigGdi);
    CHECK(shaped.engine.measureText(shaped.canvas.Dc(), latin).cx == bigGdi.cx);
    SelectObject(shaped.canvas.Dc(), old);
  }
  SUBCASE("a slot's font is measured, and the DC keeps its own font") {
    TestFont small(kArabicFace, -8);
    HGDIOBJ old = SelectObject(dc, small.get());
    const SIZE withSlot = plain.engine.measureText(dc, latin);
    CHECK(withSlot.cx == gdi.cx);
    CHECK(GetCurrentObject(dc, OBJ_FONT) == small.get());
    SelectObject(dc, old);
  }
  SUBCASE("Arabic joins when shaped, so its width differs from GDI's") {
    SIZE arabicGdi{};
    GetTextExtentPoint32W(dc, kArabic.c_str(), static_cast<int>(kArabic.size()), &arabicGdi);
    const SIZE arabicShaped = shaped.engine.measureText(shaped.canvas.Dc(), kArabic);
    CHECK(arabicShaped.cx > 0);
    CHECK(arabicShaped.cx != arabicGdi.cx);
    CHECK(plain.engine.measureText(dc, kArabic).cx == arabicGdi.cx);
    // Right-to-left reading gives the same extent.
    SetTextAlign(shaped.canvas.Dc(), TA_RTLREADING);
    CHECK(shaped.engine.measureText(shaped.canvas.Dc(), kArabic).cx == arabicShaped.cx);
    SetTextAlign(shaped.canvas.Dc(), TA_LEFT);
  }
  SUBCASE("an empty text has no width; no DC gives nothing") {
    CHECK(shaped.engine.measureText(shaped.canvas.Dc(), L"").cx == 0);
    CHECK(shaped.engine.measureText(nullptr, latin).cx == 0);
  }
}
