#include "tests/wine/boundary/boundary_support.h"

#include <stdexcept>

namespace br::test::boundary {

Variant& Variant::operator=(Variant&& other) noexcept {
  if (this != &other) {
    VariantClear(&v_);
    v_ = other.v_;
    VariantInit(&other.v_);
  }
  return *this;
}

Variant Variant::Empty() { return Variant(); }

Variant Variant::Null() {
  Variant v;
  v.v_.vt = VT_NULL;
  return v;
}

Variant Variant::I2(SHORT value) {
  Variant v;
  v.v_.vt = VT_I2;
  v.v_.iVal = value;
  return v;
}

Variant Variant::I4(LONG value) {
  Variant v;
  v.v_.vt = VT_I4;
  v.v_.lVal = value;
  return v;
}

Variant Variant::UI1(BYTE value) {
  Variant v;
  v.v_.vt = VT_UI1;
  v.v_.bVal = value;
  return v;
}

Variant Variant::R4(float value) {
  Variant v;
  v.v_.vt = VT_R4;
  v.v_.fltVal = value;
  return v;
}

Variant Variant::R8(double value) {
  Variant v;
  v.v_.vt = VT_R8;
  v.v_.dblVal = value;
  return v;
}

Variant Variant::Date(double value) {
  Variant v;
  v.v_.vt = VT_DATE;
  v.v_.date = value;
  return v;
}

Variant Variant::Bool(bool value) {
  Variant v;
  v.v_.vt = VT_BOOL;
  v.v_.boolVal = value ? VARIANT_TRUE : VARIANT_FALSE;
  return v;
}

Variant Variant::Error(SCODE value) {
  Variant v;
  v.v_.vt = VT_ERROR;
  v.v_.scode = value;
  return v;
}

Variant Variant::Bstr(const std::wstring& text) {
  Variant v;
  v.v_.vt = VT_BSTR;
  v.v_.bstrVal = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
  if (!v.v_.bstrVal) throw std::bad_alloc();
  return v;
}

Variant Variant::NullBstr() {
  Variant v;
  v.v_.vt = VT_BSTR;
  v.v_.bstrVal = nullptr;
  return v;
}

Variant Variant::Unknown(IUnknown* object) {
  Variant v;
  v.v_.vt = VT_UNKNOWN;
  v.v_.punkVal = object;
  if (object) object->AddRef();
  return v;
}

Variant Variant::Dispatch(IDispatch* object) {
  Variant v;
  v.v_.vt = VT_DISPATCH;
  v.v_.pdispVal = object;
  if (object) object->AddRef();
  return v;
}

Variant Variant::Array(VARTYPE arrayType, SAFEARRAY* array) {
  Variant v;
  v.v_.vt = static_cast<VARTYPE>(VT_ARRAY | arrayType);
  v.v_.parray = array;
  return v;
}

Variant Variant::RefVariant(VARIANT* target) {
  Variant v;
  v.v_.vt = VT_BYREF | VT_VARIANT;
  v.v_.pvarVal = target;
  return v;
}

Variant Variant::RefI4(LONG* target) {
  Variant v;
  v.v_.vt = VT_BYREF | VT_I4;
  v.v_.plVal = target;
  return v;
}

Variant Variant::RefR8(double* target) {
  Variant v;
  v.v_.vt = VT_BYREF | VT_R8;
  v.v_.pdblVal = target;
  return v;
}

Variant Variant::RefBstr(BSTR* target) {
  Variant v;
  v.v_.vt = VT_BYREF | VT_BSTR;
  v.v_.pbstrVal = target;
  return v;
}

Variant Variant::RefUnknown(IUnknown** target) {
  Variant v;
  v.v_.vt = VT_BYREF | VT_UNKNOWN;
  v.v_.ppunkVal = target;
  return v;
}

Variant Variant::RefArray(VARTYPE arrayType, SAFEARRAY** target) {
  Variant v;
  v.v_.vt = static_cast<VARTYPE>(VT_BYREF | VT_ARRAY | arrayType);
  v.v_.pparray = target;
  return v;
}

SAFEARRAY* MakeArray(VARTYPE type, std::initializer_list<SAFEARRAYBOUND> bounds) {
  std::vector<SAFEARRAYBOUND> b(bounds);
  SAFEARRAY* array = SafeArrayCreate(type, static_cast<UINT>(b.size()), b.data());
  if (!array) throw std::runtime_error("SafeArrayCreate failed");
  return array;
}

SAFEARRAY* MakeLongArray(const std::vector<LONG>& values, LONG lower) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_I4, lower, static_cast<ULONG>(values.size()));
  if (!array) throw std::runtime_error("SafeArrayCreateVector failed");
  for (std::size_t i = 0; i < values.size(); ++i) {
    LONG index = lower + static_cast<LONG>(i);
    LONG value = values[i];
    SafeArrayPutElement(array, &index, &value);
  }
  return array;
}

SAFEARRAY* MakeUnknownArray(const std::vector<IUnknown*>& objects, LONG lower) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_UNKNOWN, lower, static_cast<ULONG>(objects.size()));
  if (!array) throw std::runtime_error("SafeArrayCreateVector failed");
  for (std::size_t i = 0; i < objects.size(); ++i) {
    LONG index = lower + static_cast<LONG>(i);
    SafeArrayPutElement(array, &index, objects[i]);  // takes its own reference
  }
  return array;
}

SAFEARRAY* MakeRawArray(ULONG elementSize, ULONG count) {
  SAFEARRAY* array = nullptr;
  if (FAILED(SafeArrayAllocDescriptor(1, &array))) throw std::runtime_error("SafeArrayAllocDescriptor failed");
  array->cbElements = elementSize;
  array->rgsabound[0].cElements = count;
  array->rgsabound[0].lLbound = 0;
  if (FAILED(SafeArrayAllocData(array))) {
    SafeArrayDestroyDescriptor(array);
    throw std::runtime_error("SafeArrayAllocData failed");
  }
  return array;
}

SAFEARRAY* MakeEmptyTwoDimensionArray(IUnknown** data, ULONG claimed, bool emptyFirst) {
  SAFEARRAY* array = nullptr;
  if (FAILED(SafeArrayAllocDescriptor(2, &array))) throw std::runtime_error("SafeArrayAllocDescriptor failed");
  array->cbElements = sizeof(IUnknown*);
  array->fFeatures = FADF_STATIC | FADF_FIXEDSIZE;
  array->rgsabound[emptyFirst ? 0 : 1] = SAFEARRAYBOUND{0, 0};
  array->rgsabound[emptyFirst ? 1 : 0] = SAFEARRAYBOUND{claimed, 0};
  array->pvData = data;
  return array;
}

SAFEARRAY* ZeroDimensionArray() {
  static SAFEARRAY none = {0, FADF_STATIC | FADF_FIXEDSIZE, 4, 0, nullptr, {{0, 0}}};
  return &none;
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

LateCall& LateCall::Arg(Variant value) {
  args_.push_back(std::move(value));
  return *this;
}

LateCall& LateCall::Interface(const IID& riid) {
  iid_ = riid;
  return *this;
}

LateCall& LateCall::NoParams() {
  noParams_ = true;
  return *this;
}

HRESULT LateCall::Run() {
  // DISPPARAMS holds the arguments last first; the copies are shallow, the Variants keep
  // ownership (a callee may change a by-reference target, never the VARIANT itself).
  std::vector<VARIANT> reversed;
  for (auto it = args_.rbegin(); it != args_.rend(); ++it) reversed.push_back(it->get());
  DISPID namedPut = DISPID_PROPERTYPUT;
  DISPPARAMS params = {reversed.empty() ? nullptr : reversed.data(), nullptr, static_cast<UINT>(reversed.size()), 0};
  if (flags_ & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) {
    params.rgdispidNamedArgs = &namedPut;
    params.cNamedArgs = 1;
  }
  VariantClear(&result);
  return target_->Invoke(id_, iid_, LOCALE_USER_DEFAULT, flags_, noParams_ ? nullptr : &params, &result,
                         &exception, &argumentError);
}

HRESULT LateResult(HRESULT hr, const EXCEPINFO& exception) {
  return hr == DISP_E_EXCEPTION ? exception.scode : hr;
}

}  // namespace br::test::boundary
