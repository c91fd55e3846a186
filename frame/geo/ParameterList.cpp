#include "frame/geo/ParameterList.h"

namespace br::geo {

namespace {

constexpr VARTYPE kArrayOfVariants = VT_ARRAY | VT_VARIANT;

// The array a VARIANT holds in one of the accepted forms; null for any other.
SAFEARRAY* HeldArray(const VARIANT& value) {
  const VARIANT* outer = &value;
  if (outer->vt == (VT_BYREF | VT_VARIANT)) {
    outer = outer->pvarVal;
    if (outer == nullptr || outer->vt == (VT_BYREF | VT_VARIANT)) {
      return nullptr;  // one level of indirection only: a chain could loop
    }
  }
  if (outer->vt == kArrayOfVariants) {
    return outer->parray;
  }
  if (outer->vt == (VT_BYREF | kArrayOfVariants) && outer->pparray != nullptr) {
    return *outer->pparray;
  }
  return nullptr;
}

std::string AnsiText(const wchar_t* text, int length) {
  if (text == nullptr || length <= 0) {
    return std::string();
  }
  const int size = WideCharToMultiByte(CP_ACP, 0, text, length, nullptr, 0, nullptr, nullptr);
  std::string ansi(size > 0 ? static_cast<std::size_t>(size) : 0, '\0');
  if (size > 0) {
    WideCharToMultiByte(CP_ACP, 0, text, length, &ansi[0], size, nullptr, nullptr);
  }
  return ansi;
}

}  // namespace

ParameterList::~ParameterList() { Clear(); }

void ParameterList::Clear() {
  for (VARIANT& element : elements_) {
    VariantClear(&element);
  }
  elements_.clear();
}

bool ParameterList::Assign(const VARIANT& value) {
  Clear();
  SAFEARRAY* array = HeldArray(value);
  return array != nullptr && CopyArray(array);
}

bool ParameterList::CopyArray(SAFEARRAY* array) {
  VARTYPE type = VT_EMPTY;
  if (SafeArrayGetDim(array) != 1 || SafeArrayGetElemsize(array) != sizeof(VARIANT) ||
      (SUCCEEDED(SafeArrayGetVartype(array, &type)) && type != VT_VARIANT)) {
    return false;
  }
  const ULONG count = array->rgsabound[0].cElements;
  const std::size_t wanted = count < kMaxElements ? count : kMaxElements;
  void* data = nullptr;
  if (FAILED(SafeArrayAccessData(array, &data)) || data == nullptr) {
    return false;
  }
  VARIANT* source = static_cast<VARIANT*>(data);
  elements_.resize(wanted);
  for (std::size_t i = 0; i < wanted; ++i) {
    VariantInit(&elements_[i]);
    // An element that cannot be copied (a damaged BSTR, a foreign type) stays empty.
    if (FAILED(VariantCopy(&elements_[i], &source[i]))) {
      VariantInit(&elements_[i]);
    }
  }
  SafeArrayUnaccessData(array);
  return true;
}

HRESULT ParameterList::Read(IGeoDataSet* dataSet) {
  Clear();
  if (dataSet == nullptr) {
    return E_POINTER;
  }
  VARIANT answer;
  VariantInit(&answer);
  const HRESULT hr = dataSet->GetParameters(&answer);
  const bool shaped = SUCCEEDED(hr) && Assign(answer);
  VariantClear(&answer);
  if (FAILED(hr)) {
    return hr;
  }
  return shaped ? S_OK : E_INVALIDARG;
}

const VARIANT* ParameterList::At(std::size_t index) const {
  return index < elements_.size() ? &elements_[index] : nullptr;
}

std::optional<long> ParameterList::Integer(std::size_t index) const {
  const VARIANT* element = At(index);
  if (element == nullptr || element->vt == VT_EMPTY || element->vt == VT_NULL ||
      element->vt == VT_BSTR || (element->vt & (VT_ARRAY | VT_BYREF)) != 0) {
    return std::nullopt;
  }
  VARIANT converted;
  VariantInit(&converted);
  if (FAILED(VariantChangeType(&converted, const_cast<VARIANT*>(element), 0, VT_I4))) {
    return std::nullopt;
  }
  return converted.lVal;
}

std::optional<std::string> ParameterList::Text(std::size_t index) const {
  const VARIANT* element = At(index);
  if (element == nullptr || element->vt != VT_BSTR) {
    return std::nullopt;
  }
  return AnsiText(element->bstrVal, static_cast<int>(SysStringLen(element->bstrVal)));
}

std::optional<double> ParameterList::Date(std::size_t index) const {
  const VARIANT* element = At(index);
  if (element == nullptr || element->vt != VT_DATE) {
    return std::nullopt;
  }
  return element->date;
}

}  // namespace br::geo
