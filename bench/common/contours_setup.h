// The contours view's set-up shared by the benchmarks: the host's presentation parameters
// (a four-shade scheme, 2 m and 30 m contours), a colour map and a seven-colour palette whose
// entry 0 is 0xFAC800 (BGR 0x0000C8FA in a 32-bit DIB).
#pragma once

#include "GeoData.h"

#include <windows.h>

namespace br::bench {

// The host's components, as small as they come: fixed answers, no reference counting.
class BenchParams : public IPresParams {
public:
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    *out = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IPresParams) ? this : nullptr;
    return *out ? S_OK : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP GetParam(long index, VARIANT* value) override {
    VariantInit(value);
    if (index == 3) {
      value->vt = VT_I4;
      value->lVal = 0;
    } else {
      value->vt = VT_R4;
      value->fltVal = index == 0 ? 2.0f : 30.0f;
    }
    return S_OK;
  }
};

class BenchColours : public IColorMap {
public:
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    *out = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IColorMap) ? this : nullptr;
    return *out ? S_OK : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP Reserved3() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved4() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved5() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved6() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved7() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved8() override { return E_NOTIMPL; }
  STDMETHODIMP GetPaletteIndex(long colour, USHORT* index) override {
    *index = static_cast<USHORT>(colour % 7);
    return S_OK;
  }
};

inline HPALETTE BenchPalette() {
  struct {
    LOGPALETTE head;
    PALETTEENTRY more[6];
  } table{};
  table.head.palVersion = 0x300;
  table.head.palNumEntries = 7;
  PALETTEENTRY* entries = table.head.palPalEntry;
  for (int i = 0; i < 7; ++i) entries[i] = PALETTEENTRY{BYTE(30 * i), BYTE(200 - 20 * i), 250, 0};
  return CreatePalette(&table.head);
}

}  // namespace br::bench
