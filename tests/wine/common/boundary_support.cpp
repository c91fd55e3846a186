#include "tests/wine/common/boundary_support.h"

#include <stdexcept>

namespace br::test::boundary {

namespace {

SAFEARRAY* Checked(SAFEARRAY* array) {
  return array ? array : throw std::runtime_error("SAFEARRAY not made");
}

SAFEARRAY* Descriptor(UINT dimensions, ULONG elementSize) {
  SAFEARRAY* array = nullptr;
  SafeArrayAllocDescriptor(dimensions, &array);
  return Checked(array)->cbElements = elementSize, array;
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

std::vector<TestStation> ThreeStations() {
  return {{"Charlie", 600, 600, 0, {{0, 1000, 0}, {29, 500, 100}}},
          {"Alpha", 610, 610, 0, {{0, 1000, 0}, {36, 300, 900}}},
          {"Bravo", 620, 620, 0, {{0, 1000, 0}}}};
}

OpenTides::OpenTides(const std::vector<TestStation>& stations, bool open) : folder(stations) {
  REQUIRE(dll.Create(CLSID_TidesDatabase, db.Out()) == S_OK);
  if (open) REQUIRE(db->Initialize(Variant::Bstr(folder.Path()).get().bstrVal) == S_OK);
}

const std::vector<IUnknown*>& OpenTides::Ports(long count) {
  for (long i = 0; i < count; ++i) ports.push_back(Port(i));  // as IUnknown: one object, one identity
  return ports;
}

std::wstring SelectedName(ITidesPortList* list) {
  IUnknown* port = kUntouchedUnknown;
  REQUIRE(list->get_Selected(&port) == S_OK);
  REQUIRE(port != kUntouchedUnknown);
  const std::wstring name = PortName(port);
  if (port) port->Release();
  return name;
}

std::vector<ULONG> RefCounts(const std::vector<IUnknown*>& objects) {
  std::vector<ULONG> counts;
  for (IUnknown* p : objects) counts.push_back(RefCount(p));
  return counts;
}

void AdviseOnly(IUnknown* source, const IID& events, EventSink& sink) {
  ComRef<IConnectionPoint> point;
  REQUIRE(Query<IConnectionPointContainer>(source)->FindConnectionPoint(events, point.Out()) == S_OK);
  DWORD cookie = 0;
  REQUIRE(point->Advise(static_cast<IDispatch*>(&sink), &cookie) == S_OK);
}

HostedControl::HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width, int height) {
  atl_.WinInit();
  REQUIRE(dll.Create(clsid, IID_IUnknown, control_.OutVoid()) == S_OK);
  REQUIRE((host_ = AtlHost::MakeWindow(width, height)) != nullptr);
  REQUIRE(atl_.Attach(control_.Get(), host_, site_.Out()) == S_OK);
  Query<IOleWindow>()->GetWindow(&window_);
  REQUIRE(window_ != nullptr);
}

void HostedControl::Close() {
  if (host_) DestroyWindow(host_);
  host_ = window_ = nullptr;
  site_.Reset();
  control_.Reset();
}

HRESULT InvokeByName(IDispatch* object, const wchar_t* name, WORD flags, std::vector<VARIANT> arguments,
                     VARIANT* result) {
  DISPID id = DISPID_UNKNOWN;
  LPOLESTR names[] = {const_cast<LPOLESTR>(name)};
  const HRESULT found = object->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id);
  if (FAILED(found)) return found;
  std::vector<VARIANT> reversed(arguments.rbegin(), arguments.rend());
  DISPID put = DISPID_PROPERTYPUT;
  DISPPARAMS parameters{reversed.empty() ? nullptr : reversed.data(), nullptr, static_cast<UINT>(reversed.size()), 0};
  if (flags == DISPATCH_PROPERTYPUT) {
    parameters.rgdispidNamedArgs = &put;
    parameters.cNamedArgs = 1;
  }
  EXCEPINFO exception{};
  UINT badArgument = 0;
  const HRESULT hr = object->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, flags, &parameters, result, &exception,
                                    &badArgument);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrHelpFile);
  return hr;
}

}  // namespace br::test::boundary
