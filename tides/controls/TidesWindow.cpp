#include "tides/controls/TidesWindow.h"

#include "frame/com/bstr_text.h"
#include "frame/com/Module.h"
#include "tides/controls/graph/label_format.h"
#include "tides/controls/tide_day_reader.h"
#include "tides/controls/TideGraphPainter.h"
#include "tides/objects/platform_dates.h"

#include "resource.h"

#include <windowsx.h>

namespace br::tides {

namespace {

constexpr DISPID kMouseActionEvent = 1;

}  // namespace

const br::com::ClassIdentity TidesWindow::kClass = {&CLSID_TidesWindow, &IID_ITidesWindow,
                                                    &DIID__ITidesWindowEvents, L"TidesWindow"};

const TidesWindow::Entry TidesWindow::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_ITidesWindow, Self},
    {&IID_IDispatch, Self},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {&IID_IUnitsOption, UnitsOption},
    {nullptr, nullptr},
};

TidesWindow::~TidesWindow() {
  if (font_) DeleteObject(font_);
}

// ---- ITidesWindow

STDMETHODIMP TidesWindow::SetPort(IUnknown* port) {
  return Guard([&] {
    port_.Reset();
    if (!port) return S_FALSE;
    auto tidesPort = br::com::ComRef<IUnknown>(port).Query<ITidesPort>(IID_ITidesPort);
    if (!tidesPort) return E_INVALIDARG;
    port_ = std::move(tidesPort);
    return S_OK;
  });
}

STDMETHODIMP TidesWindow::Calculate(double step, double predictDate) {
  return Guard([&] {
    // The port's Calculated sinks may replace our port while it calculates.
    if (const br::com::ComRef<ITidesPort> port = port_) port->Calculate(step, predictDate);
    Repaint();
    return S_OK;
  });
}

STDMETHODIMP TidesWindow::SetScale(double maximum, double minimum) {
  scaleMax_ = maximum;
  scaleMin_ = minimum;
  return S_OK;
}

STDMETHODIMP TidesWindow::put_Property(TW_PROPERTY code, VARIANT value) {
  return Guard([&] {
    HRESULT hr = E_INVALIDARG;
    if (code == TW_DRAWTEXT) {
      hr = PutDrawText(value);
    } else if (code == TW_FORMATTEXT) {
      hr = PutFormatText(value);
    }
    if (SUCCEEDED(hr)) Repaint();
    return hr;
  });
}

HRESULT TidesWindow::PutDrawText(const VARIANT& value) {
  switch (value.vt) {
    case VT_I4:
      drawText_ = value.lVal;
      return S_OK;
    case VT_I2:
      drawText_ = value.iVal;  // sign-extended
      return S_OK;
    case VT_UI1:
      drawText_ = value.bVal;  // zero-extended
      return S_OK;
    default:
      return E_INVALIDARG;
  }
}

HRESULT TidesWindow::PutFormatText(const VARIANT& value) {
  if (value.vt != VT_BSTR) return E_INVALIDARG;
  std::string format = br::com::AnsiFromBstr(value.bstrVal);
  if (format.empty()) format = graph::kDefaultLabelFormat;
  // The labels pass this format to the C library with one double: anything but one
  // floating conversion would read or write memory it should not.
  if (!graph::IsValueLabelFormat(format)) return E_INVALIDARG;
  formatText_ = std::move(format);
  return S_OK;
}

STDMETHODIMP TidesWindow::get_Property(TW_PROPERTY code, VARIANT* value) {
  if (!value) return E_INVALIDARG;
  VariantInit(value);
  return Guard([&] {
    if (code == TW_DRAWTEXT) {
      value->vt = VT_I4;
      value->lVal = drawText_;
      return S_OK;
    }
    if (code == TW_FORMATTEXT) {
      value->bstrVal = br::com::BstrFromAnsi(formatText_);
      value->vt = VT_BSTR;
      return S_OK;
    }
    return E_INVALIDARG;
  });
}

HRESULT TidesWindow::SetFeet(LONG feet) {
  feet_ = feet;
  Repaint();
  return S_OK;
}

// ---- painting, font and pointer

void TidesWindow::Paint(HDC dc, const RECT& client) {
  graph::TideDay day;
  bool haveDay = false;
  // A port of another make may take itself away from us inside one of its getters.
  if (const br::com::ComRef<ITidesPort> port = port_) haveDay = ReadTideDay(port.Get(), day);
  TideGraphStyle style;
  style.font = font_;
  style.drawText = drawText_ != 0;
  style.format = formatText_;
  style.feet = feet_ != 0;
  style.scaleMax = scaleMax_;
  style.scaleMin = scaleMin_;
  const TideGraphMargins margins = TideGraphPainter::Paint(dc, client, haveDay ? &day : nullptr, style);
  leftMargin_ = margins.left;
  bottomMargin_ = margins.bottom;
}

HRESULT TidesWindow::SetFont(IFont* font) {
  HFONT handle = nullptr;
  if (font && FAILED(font->get_hFont(&handle))) handle = nullptr;
  CopyFont(handle);
  Repaint();
  return S_OK;
}

void TidesWindow::CopyFont(HFONT font) {
  HFONT copy = nullptr;
  LOGFONTA description{};
  if (font && GetObjectA(font, sizeof description, &description) > 0) copy = CreateFontIndirectA(&description);
  if (font_) DeleteObject(font_);
  font_ = copy;
}

bool TidesWindow::OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) {
  switch (message) {
    case WM_MOUSEMOVE:
      if (!ReportPointer(window, LOWORD(lParam))) return false;
      result = 0;
      return true;
    case WM_SETFONT:
      CopyFont(reinterpret_cast<HFONT>(wParam));
      if (LOWORD(lParam)) Repaint();
      result = 0;
      return true;
    case WM_GETFONT:
      result = reinterpret_cast<LRESULT>(font_);
      return true;
    case WM_SETCURSOR: {
      if (reinterpret_cast<HWND>(wParam) != window) return false;
      const HCURSOR cursor = LoadCursorW(br::com::Module::Instance(), MAKEINTRESOURCEW(IDC_CROSSHAIR));
      if (!cursor) return false;
      SetCursor(cursor);
      result = TRUE;
      return true;
    }
    default:
      return false;
  }
}

bool TidesWindow::ReportPointer(HWND window, unsigned pointerX) {
  // Held for the reading: a port of another make may take itself away inside a getter.
  const br::com::ComRef<ITidesPort> port = port_;
  return port && ReportPointerOf(port.Get(), window, pointerX);
}

bool TidesWindow::ReportPointerOf(ITidesPort* port, HWND window, unsigned pointerX) {
  long count = 0;
  if (FAILED(port->get_NumPoints(&count)) || count < 1) return false;
  double predictionDate = 0.0;
  CalendarDate date;
  if (FAILED(port->get_PredictionDate(&predictionDate)) || !SplitDayCountDate(predictionDate, date)) return false;
  RECT client{};
  GetClientRect(window, &client);
  const graph::GraphGeometry geometry(graph::Rect{client.left, client.top, client.right, client.bottom},
                                      leftMargin_, bottomMargin_);
  graph::PointerReading reading;
  if (!geometry.ReadPointer(pointerX, count, reading)) return false;
  double time = 0.0;
  if (!ComposeDayCountDate(date, reading.hour, reading.minute, time)) return false;
  double value = 0.0;
  if (FAILED(port->get_WavePoint(reading.index, &value))) return false;
  // Taken away while we read it: the day under the pointer is no longer the one shown.
  if (port != port_.Get()) return false;

  VARIANT arguments[2];  // in reverse order: MouseAction(Time, WaveValue)
  arguments[1].vt = VT_R8;
  arguments[1].dblVal = time;
  arguments[0].vt = VT_R8;
  arguments[0].dblVal = value;
  DISPPARAMS parameters = {arguments, nullptr, 2, 0};
  FireEvent(kMouseActionEvent, &parameters);
  return true;
}

}  // namespace br::tides
