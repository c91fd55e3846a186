// Shared by the boundary, leak and re-entrancy suites: awkward VARIANTs and SAFEARRAYs,
// row runners, an open station database, a hosted control.
#pragma once

#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/EventSink.h"
#include "tests/wine/common/StationFolder.h"
#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/Canvas.h"

#include "BR_Info.h"

#include <windows.h>
#include <oaidl.h>
#include <oleauto.h>

#include <doctest/doctest.h>

#include <functional>
#include <initializer_list>
#include <limits>
#include <new>
#include <string>
#include <vector>

namespace br::test::boundary {

inline const double kNaN = std::numeric_limits<double>::quiet_NaN();
inline const double kInfinity = std::numeric_limits<double>::infinity();

// Written into out-parameters before a call that must not write them.
inline constexpr double kUntouchedDouble = -12345.678;
inline constexpr long kUntouchedLong = -777;
inline IUnknown* const kUntouchedUnknown = reinterpret_cast<IUnknown*>(static_cast<UINT_PTR>(0x0BADF00D));

// One owned VARIANT; by-reference forms borrow their target.
class Variant {
public:
  Variant() { VariantInit(&v_); }
  ~Variant() {
    if (!borrowed_) VariantClear(&v_);
  }
  Variant(Variant&& other) noexcept : v_(other.v_), borrowed_(other.borrowed_) { VariantInit(&other.v_); }
  Variant(const Variant&) = delete;

  template <class F>
  static Variant Make(VARTYPE vt, F set) {
    Variant v;
    v.v_.vt = vt;
    set(v.v_);
    return v;
  }
  static Variant Empty() { return Variant(); }
  static Variant I4(LONG x) { return Make(VT_I4, [=](VARIANT& v) { v.lVal = x; }); }
  static Variant R8(double x) { return Make(VT_R8, [=](VARIANT& v) { v.dblVal = x; }); }
  static Variant NullBstr() { return Make(VT_BSTR, [](VARIANT& v) { v.bstrVal = nullptr; }); }
  static Variant Bstr(const std::wstring& text) {  // embedded zeros kept
    return Make(VT_BSTR, [&](VARIANT& v) {
      if (!(v.bstrVal = SysAllocStringLen(text.data(), static_cast<UINT>(text.size())))) throw std::bad_alloc();
    });
  }
  static Variant Unknown(IUnknown* x) {
    return Make(VT_UNKNOWN, [=](VARIANT& v) { if ((v.punkVal = x)) x->AddRef(); });
  }
  static Variant Array(VARTYPE type, SAFEARRAY* a) {  // owns the array
    return Make(VT_ARRAY | type, [=](VARIANT& v) { v.parray = a; });
  }
  static Variant RefVariant(VARIANT* x) { return Make(VT_BYREF | VT_VARIANT, [=](VARIANT& v) { v.pvarVal = x; }); }
  static Variant RefI4(LONG* x) { return Make(VT_BYREF | VT_I4, [=](VARIANT& v) { v.plVal = x; }); }
  static Variant RefBstr(BSTR* x) { return Make(VT_BYREF | VT_BSTR, [=](VARIANT& v) { v.pbstrVal = x; }); }
  static Variant RefArray(VARTYPE type, SAFEARRAY** x) {
    return Make(VT_BYREF | VT_ARRAY | type, [=](VARIANT& v) { v.pparray = x; });
  }
  // The static descriptor with no dimensions, which the Variant never frees.
  static Variant ZeroDimensions(VARTYPE type);

  VARIANT& get() { return v_; }

private:
  VARIANT v_;
  bool borrowed_ = false;
};

// A SAFEARRAY with one SAFEARRAYBOUND per dimension, every element zero.
SAFEARRAY* MakeArray(VARTYPE type, std::initializer_list<SAFEARRAYBOUND> bounds);
// One-dimensional arrays from lower: VT_I4 values, or interface pointers (each referenced;
// VT_DISPATCH: their IDispatch).
SAFEARRAY* MakeLongArray(const std::vector<LONG>& values, LONG lower = 0);
SAFEARRAY* MakeUnknownArray(const std::vector<IUnknown*>& objects, LONG lower = 0, VARTYPE type = VT_UNKNOWN);
// count elements of elementSize bytes and no element type, as a hand-built descriptor.
SAFEARRAY* MakeRawArray(ULONG elementSize, ULONG count);
// Two dimensions, one empty, the other claiming `claimed` elements over data it neither
// owns nor frees: an array that holds nothing however long a dimension says it is.
SAFEARRAY* MakeEmptyTwoDimensionArray(IUnknown** data, ULONG claimed, bool emptyFirst);

// A late-bound call: the member by name through GetIDsOfNames and IDispatch::Invoke, the
// arguments in the order the member declares them (reversed here as DISPPARAMS wants);
// DISPATCH_PROPERTYPUT passes the last one as the named put argument. result may be null.
HRESULT InvokeByName(IDispatch* object, const wchar_t* name, WORD flags, std::vector<VARIANT> arguments,
                     VARIANT* result = nullptr);

// Out-parameters of the rows, holding markers until a call writes them.
struct Outs {
  double value, second;
  long number;
  BSTR name;
  IUnknown* unknown;
  VARIANT variant;
  const BSTR marker = SysAllocString(L"marker");
  Outs() { Reset(); }
  ~Outs() { SysFreeString(marker); }
  void Reset();
  bool Untouched() const;
};

// One direct call: its result, and a check of what it wrote (else: nothing written).
struct Row {
  std::string what;
  std::function<HRESULT()> call;
  HRESULT expected;
  std::function<bool()> check = nullptr;
};

// Runs each row; snapshot() must read the same before and after it.
template <class Snapshot>
void RunRows(const std::vector<Row>& rows, Snapshot snapshot, Outs* outs = nullptr) {
  for (const Row& row : rows) {
    INFO(row.what);
    if (outs) outs->Reset();
    const auto before = snapshot();
    CHECK(row.call() == row.expected);
    if (row.check) CHECK(row.check());
    else if (outs) CHECK(outs->Untouched());
    CHECK(snapshot() == before);
  }
}

// Three stations whose name order (Alpha, Bravo, Charlie) is not their file order.
std::vector<TestStation> ThreeStations();
inline const TestStation kHarbour = {"Harbour", 1200, -300, -1, {{0, 2000, 0}, {36, 1000, 900}, {29, 700, 100}}};

// A station folder, the DLL, and a database (open unless asked) on the folder, which
// outlives the DLL.
struct OpenTides {
  StationFolder folder;
  DllUnderTest dll;
  ComRef<ITidesDatabase> db;
  std::vector<IUnknown*> ports;  // held until Finish
  explicit OpenTides(const std::vector<TestStation>& stations, bool open = true);
  ~OpenTides() { Finish(); }
  ITidesPort* Port(long index) const { return PortAt(db.Get(), index); }
  const std::vector<IUnknown*>& Ports(long count);  // the first count by GetPort, into ports
  HRESULT Finish() {
    for (IUnknown* p : ports) p->Release();
    ports.clear();
    db.Reset();
    return dll.CanUnloadNow();
  }
};

std::wstring SelectedName(ITidesPortList* list);  // PortName: empty for none
std::vector<ULONG> RefCounts(const std::vector<IUnknown*>& objects);
// Connects sink without keeping the connection point, which would hold the source.
void AdviseOnly(IUnknown* source, const IID& events, EventSink& sink);

// A control from the DLL, in-place active in Wine's ATL host inside a top-level window.
class HostedControl {
public:
  HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width = 300, int height = 200);
  ~HostedControl() { Close(); }
  HostedControl(const HostedControl&) = delete;

  IUnknown* Control() const { return control_.Get(); }  // null after Close
  HWND Window() const { return window_; }                // the control's own window
  template <class I>
  ComRef<I> Query() const {  // REQUIREd
    REQUIRE(control_);
    return br::test::Query<I>(control_.Get());
  }
  void Paint() const { RedrawWindow(window_, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN); }
  void MouseMove(int x, int y = 50) const { SendMessageW(window_, WM_MOUSEMOVE, 0, MAKELPARAM(x, y)); }
  // Destroys the host window and releases the test's references. Idempotent.
  void Close();

private:
  AtlHost atl_;
  HWND host_ = nullptr;
  HWND window_ = nullptr;
  ComRef<IUnknown> control_;
  ComRef<IUnknown> site_;
};

}  // namespace br::test::boundary
