#include "tests/wine/boundary/boundary_support.h"

#include <stdexcept>

namespace br::test::boundary {

namespace {

SAFEARRAY* Checked(SAFEARRAY* array) {
  if (!array) throw std::runtime_error("SAFEARRAY not made");
  return array;
}

SAFEARRAY* Descriptor(UINT dimensions, ULONG elementSize) {
  SAFEARRAY* array = nullptr;
  if (FAILED(SafeArrayAllocDescriptor(dimensions, &array))) throw std::runtime_error("no descriptor");
  array->cbElements = elementSize;
  return array;
}

}  // namespace

Variant Variant::ZeroDimensions(VARTYPE type) {
  static SAFEARRAY none = {0, FADF_STATIC | FADF_FIXEDSIZE, 4, 0, nullptr, {{0, 0}}};
  Variant v = Array(type, &none);
  v.borrowed_ = true;
  return v;
}

SAFEARRAY* MakeArray(VARTYPE type, std::initializer_list<SAFEARRAYBOUND> bounds) {
  std::vector<SAFEARRAYBOUND> b(bounds);
  return Checked(SafeArrayCreate(type, static_cast<UINT>(b.size()), b.data()));
}

SAFEARRAY* MakeLongArray(const std::vector<LONG>& values, LONG lower) {
  SAFEARRAY* array = Checked(SafeArrayCreateVector(VT_I4, lower, static_cast<ULONG>(values.size())));
  for (std::size_t i = 0; i < values.size(); ++i) static_cast<LONG*>(array->pvData)[i] = values[i];
  return array;
}

SAFEARRAY* MakeUnknownArray(const std::vector<IUnknown*>& objects, LONG lower, VARTYPE type) {
  SAFEARRAY* array = Checked(SafeArrayCreateVector(type, lower, static_cast<ULONG>(objects.size())));
  for (std::size_t i = 0; i < objects.size(); ++i) {
    LONG index = lower + static_cast<LONG>(i);
    IUnknown* element = objects[i];
    if (element && type == VT_DISPATCH) element->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&element));
    else if (element) element->AddRef();
    SafeArrayPutElement(array, &index, element);  // takes its own reference
    if (element) element->Release();
  }
  return array;
}

SAFEARRAY* MakeRawArray(ULONG elementSize, ULONG count) {
  SAFEARRAY* array = Descriptor(1, elementSize);
  array->rgsabound[0] = SAFEARRAYBOUND{count, 0};
  if (FAILED(SafeArrayAllocData(array))) throw std::runtime_error("SafeArrayAllocData failed");
  return array;
}

SAFEARRAY* MakeEmptyTwoDimensionArray(IUnknown** data, ULONG claimed, bool emptyFirst) {
  SAFEARRAY* array = Descriptor(2, sizeof(IUnknown*));
  array->fFeatures = FADF_STATIC | FADF_FIXEDSIZE;
  array->rgsabound[emptyFirst ? 0 : 1] = SAFEARRAYBOUND{0, 0};
  array->rgsabound[emptyFirst ? 1 : 0] = SAFEARRAYBOUND{claimed, 0};
  array->pvData = data;
  return array;
}

void Outs::Reset() {
  value = second = kUntouchedDouble;
  number = kUntouchedLong;
  name = marker;
  unknown = kUntouchedUnknown;
  VariantInit(&variant);
  variant.vt = VT_I2;
  variant.iVal = -3;
}

bool Outs::Untouched() const {
  return value == kUntouchedDouble && second == kUntouchedDouble && number == kUntouchedLong && name == marker &&
         unknown == kUntouchedUnknown && variant.vt == VT_I2 && variant.iVal == -3;
}

LateCall::LateCall(IDispatch* target, DISPID id, WORD flags) : target_(target), id_(id), flags_(flags) {
  VariantInit(&result);
}

LateCall::~LateCall() {
  VariantClear(&result);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrHelpFile);
}

HRESULT LateCall::Run() {
  // DISPPARAMS holds the arguments last first; shallow copies, the Variants keep ownership.
  std::vector<VARIANT> reversed;
  for (auto it = args_.rbegin(); it != args_.rend(); ++it) reversed.push_back(it->get());
  DISPID namedPut = DISPID_PROPERTYPUT;
  DISPPARAMS params = {reversed.empty() ? nullptr : reversed.data(), nullptr, static_cast<UINT>(reversed.size()), 0};
  if (flags_ & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) {
    params.rgdispidNamedArgs = &namedPut;
    params.cNamedArgs = 1;
  }
  VariantClear(&result);
  UINT argumentError = 0;
  return target_->Invoke(id_, iid_, LOCALE_USER_DEFAULT, flags_, &params, &result, &exception, &argumentError);
}

std::vector<TestStation> ThreeStations() {
  return {{"Charlie", 600, 600, 0, {{0, 1000, 0}, {29, 500, 100}}},
          {"Alpha", 610, 610, 0, {{0, 1000, 0}, {36, 300, 900}}},
          {"Bravo", 620, 620, 0, {{0, 1000, 0}}}};
}

OpenTides::OpenTides(const std::vector<TestStation>& stations, bool open) : folder(stations) {
  REQUIRE(dll.Create(CLSID_TidesDatabase, &db) == S_OK);
  if (open) REQUIRE(db->Initialize(Variant::Bstr(folder.Path()).get().bstrVal) == S_OK);
}

IUnknown* OpenTides::Unknown(long index) const {
  IUnknown* port = nullptr;
  REQUIRE(db->GetPort(index, &port) == S_OK);
  REQUIRE(port != nullptr);
  return port;
}

const std::vector<IUnknown*>& OpenTides::Ports(long count) {
  for (long i = 0; i < count; ++i) ports.push_back(Unknown(i));
  return ports;
}

long Points(ITidesPort* port) {
  long n = -1;
  REQUIRE(port->get_NumPoints(&n) == S_OK);
  return n;
}

std::wstring NameOf(IUnknown* port) {
  if (!port) return L"<none>";
  ITidesPort* typed = nullptr;
  if (FAILED(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed)))) return L"<not a port>";
  BSTR name = nullptr;
  typed->get_PortName(&name);
  std::wstring text = name ? name : L"";
  SysFreeString(name);
  typed->Release();
  return text;
}

std::wstring SelectedName(ITidesPortList* list) {
  IUnknown* port = kUntouchedUnknown;
  REQUIRE(list->get_Selected(&port) == S_OK);
  REQUIRE(port != kUntouchedUnknown);
  const std::wstring name = NameOf(port);
  if (port) port->Release();
  return name;
}

std::vector<ULONG> RefCounts(const std::vector<IUnknown*>& objects) {
  std::vector<ULONG> counts;
  for (IUnknown* p : objects) counts.push_back(RefCount(p));
  return counts;
}

void AdviseOnly(IUnknown* source, const IID& events, EventSink& sink) {
  IConnectionPointContainer* container = Query<IConnectionPointContainer>(source);
  IConnectionPoint* point = nullptr;
  REQUIRE(container->FindConnectionPoint(events, &point) == S_OK);
  container->Release();
  DWORD cookie = 0;
  REQUIRE(point->Advise(static_cast<IDispatch*>(&sink), &cookie) == S_OK);
  point->Release();
}

HostedControl::HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width, int height) {
  atl_.WinInit();
  REQUIRE(dll.Create(clsid, IID_IUnknown, reinterpret_cast<void**>(&control_)) == S_OK);
  REQUIRE((host_ = AtlHost::MakeWindow(width, height)) != nullptr);
  REQUIRE(atl_.Attach(control_, host_, &site_) == S_OK);
  IOleWindow* window = Query<IOleWindow>();
  window->GetWindow(&window_);
  window->Release();
  REQUIRE(window_ != nullptr);
}

void HostedControl::Close() {
  if (host_) DestroyWindow(host_);
  host_ = window_ = nullptr;
  ReleaseAndNull(site_);
  ReleaseAndNull(control_);
}

}  // namespace br::test::boundary
