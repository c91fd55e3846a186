// Shared by the boundary, leak and re-entrancy suites: awkward VARIANTs and SAFEARRAYs,
// late-bound calls, row runners, an open station database, a hosted control, a foreign port.
#pragma once

#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"
#include "tests/wine/controls/atl_host.h"
#include "tests/wine/controls/canvas.h"

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
inline const double kSmallestDenormal = std::numeric_limits<double>::denorm_min();

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
  Variant& operator=(Variant&& other) noexcept {
    if (!borrowed_) VariantClear(&v_);
    v_ = other.v_;
    borrowed_ = other.borrowed_;
    VariantInit(&other.v_);
    return *this;
  }
  Variant(const Variant&) = delete;

  template <class F>
  static Variant Make(VARTYPE vt, F set) {
    Variant v;
    v.v_.vt = vt;
    set(v.v_);
    return v;
  }
  static Variant Empty() { return Variant(); }
  static Variant Null() { return Make(VT_NULL, [](VARIANT&) {}); }
  static Variant I2(SHORT x) { return Make(VT_I2, [=](VARIANT& v) { v.iVal = x; }); }
  static Variant I4(LONG x) { return Make(VT_I4, [=](VARIANT& v) { v.lVal = x; }); }
  static Variant R8(double x) { return Make(VT_R8, [=](VARIANT& v) { v.dblVal = x; }); }
  static Variant Bool(bool x) { return Make(VT_BOOL, [=](VARIANT& v) { v.boolVal = x ? -1 : 0; }); }
  static Variant NullBstr() { return Make(VT_BSTR, [](VARIANT& v) { v.bstrVal = nullptr; }); }
  static Variant Bstr(const std::wstring& text) {  // embedded zeros kept
    return Make(VT_BSTR, [&](VARIANT& v) {
      if (!(v.bstrVal = SysAllocStringLen(text.data(), static_cast<UINT>(text.size())))) throw std::bad_alloc();
    });
  }
  static Variant Unknown(IUnknown* x) {
    return Make(VT_UNKNOWN, [=](VARIANT& v) { if ((v.punkVal = x)) x->AddRef(); });
  }
  static Variant Dispatch(IDispatch* x) {
    return Make(VT_DISPATCH, [=](VARIANT& v) { if ((v.pdispVal = x)) x->AddRef(); });
  }
  static Variant Array(VARTYPE type, SAFEARRAY* a) {  // owns the array
    return Make(VT_ARRAY | type, [=](VARIANT& v) { v.parray = a; });
  }
  static Variant RefVariant(VARIANT* x) { return Make(VT_BYREF | VT_VARIANT, [=](VARIANT& v) { v.pvarVal = x; }); }
  static Variant RefI4(LONG* x) { return Make(VT_BYREF | VT_I4, [=](VARIANT& v) { v.plVal = x; }); }
  static Variant RefR8(double* x) { return Make(VT_BYREF | VT_R8, [=](VARIANT& v) { v.pdblVal = x; }); }
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

// One late-bound call through IDispatch::Invoke, arguments in call order.
class LateCall {
public:
  LateCall(IDispatch* target, DISPID id, WORD flags = DISPATCH_METHOD);
  ~LateCall();
  LateCall(const LateCall&) = delete;
  LateCall& Arg(Variant value) { return args_.push_back(std::move(value)), *this; }
  LateCall& Interface(const IID& riid) { return iid_ = riid, *this; }  // instead of IID_NULL
  HRESULT Run();
  HRESULT Result() {  // for DISP_E_EXCEPTION, the exception's scode
    const HRESULT hr = Run();
    return hr == DISP_E_EXCEPTION ? exception.scode : hr;
  }

  VARIANT result;
  EXCEPINFO exception{};

private:
  IDispatch* target_;
  DISPID id_;
  WORD flags_;
  IID iid_ = IID_NULL;
  std::vector<Variant> args_;
};

// Three stations whose name order (Alpha, Bravo, Charlie) is not their file order.
std::vector<TestStation> ThreeStations();
inline const TestStation kHarbour = {"Harbour", 1200, -300, -1, {{0, 2000, 0}, {36, 1000, 900}, {29, 700, 100}}};

// A station folder, the DLL, and a database (open unless asked) on the folder, which
// outlives the DLL.
struct OpenTides {
  StationFolder folder;
  DllUnderTest dll;
  ITidesDatabase* db = nullptr;
  std::vector<IUnknown*> ports;  // held until Finish
  explicit OpenTides(const std::vector<TestStation>& stations, bool open = true);
  ~OpenTides() { Finish(); }
  IUnknown* Unknown(long index) const;  // GetPort, REQUIREd to give a port
  ITidesPort* Port(long index) const { return PortAt(db, index); }
  const std::vector<IUnknown*>& Ports(long count);  // the first count, into ports
  HRESULT Finish() {
    for (IUnknown* p : ports) p->Release();
    ports.clear();
    ReleaseAndNull(db);
    return dll.CanUnloadNow();
  }
};

long Points(ITidesPort* port);         // NumPoints, REQUIREd to answer
std::wstring NameOf(IUnknown* port);  // "<none>" for null, "<not a port>"
std::wstring SelectedName(ITidesPortList* list);
std::vector<ULONG> RefCounts(const std::vector<IUnknown*>& objects);
// Connects sink without keeping the connection point, which would hold the source.
void AdviseOnly(IUnknown* source, const IID& events, EventSink& sink);

// A control from the DLL, in-place active in Wine's ATL host inside a top-level window.
class HostedControl {
public:
  HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width = 300, int height = 200);
  ~HostedControl() { Close(); }
  HostedControl(const HostedControl&) = delete;

  IUnknown* Control() const { return control_; }  // null after Close
  HWND Window() const { return window_; }          // the control's own window
  template <class I>
  I* Query() const {  // a new reference, REQUIREd
    REQUIRE(control_ != nullptr);
    return br::test::Query<I>(control_);
  }
  void Paint() const { RedrawWindow(window_, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN); }
  void MouseMove(int x, int y = 50) const { SendMessageW(window_, WM_MOUSEMOVE, 0, MAKELPARAM(x, y)); }
  // Destroys the host window and releases the test's references. Idempotent.
  void Close();

private:
  AtlHost atl_;
  HWND host_ = nullptr;
  HWND window_ = nullptr;
  IUnknown* control_ = nullptr;
  IUnknown* site_ = nullptr;
};

// A TidesPort of another make: every answer settable (NaN and infinite values, absurd
// counts, failing getters) and a hook that runs last inside each getter. It lives on the
// heap and deletes itself at its last Release, as a real object does.
class ForeignPort final : public ITidesPort {
public:
  static ForeignPort* Create() { return new ForeignPort(); }  // one reference, the caller's

  long points = 25;
  double height = 1.0;          // every WavePoint
  std::vector<double> heights;  // when not empty: WavePoint(k), else height
  double maxValue = 2.0, minValue = 0.0;
  double predictionDate = 45000.0;
  double sunRise = 45000.25, sunSet = 45000.75, twilightBegin = 45000.2, twilightEnd = 45000.8;
  HRESULT result = S_OK;        // of every getter
  std::function<void()> onGet;  // may end the object

  ULONG References() const { return refs_; }
  static long Alive() { return alive_; }

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    const bool port = riid == IID_IUnknown || riid == IID_IDispatch || riid == IID_ITidesPort;
    *out = port ? static_cast<ITidesPort*>(this) : nullptr;
    return port ? (AddRef(), S_OK) : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override {
    const ULONG left = --refs_;
    if (left == 0) delete this;
    return left;
  }
  // IDispatch: not offered to late binding
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { return count ? (*count = 0, S_OK) : E_POINTER; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  STDMETHODIMP get_PortName(BSTR* v) override { return Answer(v, [&] { *v = SysAllocString(L"Foreign"); }); }
  STDMETHODIMP GetPortPos(double* latitude, double* longitude) override {
    return Answer(latitude && longitude, [&] { *latitude = 50.0, *longitude = -4.0; });
  }
  STDMETHODIMP Calculate(double, double) override { return S_OK; }
  STDMETHODIMP get_PredictionDate(double* v) override { return Get(predictionDate, v); }
  STDMETHODIMP get_NumPoints(long* v) override { return Get(points, v); }
  STDMETHODIMP get_WavePoint(long k, double* v) override {
    if (v && SUCCEEDED(result) && (k < 0 || k >= points)) return Answer(true, [] {}, E_INVALIDARG);
    return Get(heights.empty() ? height : heights[static_cast<std::size_t>(k) % heights.size()], v);
  }
  STDMETHODIMP get_MaxValueIndex(long* v) override { return Get(0L, v); }
  STDMETHODIMP get_MinValueIndex(long* v) override { return Get(0L, v); }
  STDMETHODIMP get_MaxValue(double* v) override { return Get(maxValue, v); }
  STDMETHODIMP get_MinValue(double* v) override { return Get(minValue, v); }
  STDMETHODIMP get_Step(double* v) override { return Get(24.0 / (points > 1 ? points - 1 : 1), v); }
  STDMETHODIMP get_SunRise(double* v) override { return Get(sunRise, v); }
  STDMETHODIMP get_SunSet(double* v) override { return Get(sunSet, v); }
  STDMETHODIMP get_BeginTwilight(double* v) override { return Get(twilightBegin, v); }
  STDMETHODIMP get_EndTwilight(double* v) override { return Get(twilightEnd, v); }
  STDMETHODIMP get_TimeZone(long* v) override { return Get(0L, v); }

private:
  ForeignPort() { ++alive_; }
  ~ForeignPort() { --alive_; }
  template <class T>
  HRESULT Get(T value, T* out) { return Answer(out != nullptr, [&] { *out = value; }); }
  // E_POINTER for a missing pointer, else the set result (written only on success); then
  // the hook, on a copy, touching nothing of the object afterwards.
  template <class F>
  HRESULT Answer(bool pointers, F write, HRESULT refusal = S_OK) {
    const HRESULT hr = !pointers ? E_POINTER : FAILED(refusal) ? refusal : result;
    if (pointers && SUCCEEDED(hr)) write();
    if (onGet) std::function<void()>{onGet}();  // a copy: the hook may end the object
    return hr;
  }

  ULONG refs_ = 1;
  static inline long alive_ = 0;
};

}  // namespace br::test::boundary
