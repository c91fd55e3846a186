#include "inspector/panels/geo_object_rules.h"

#include <climits>

#include "frame/geo/geo_enumeration.h"
#include "inspector/panels/PanelSettings.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

constexpr long kLabelFlags = 6;

}  // namespace

bool IsChartKind(const GUID& kind) { return IsEqualGUID(kind, GEOKIND_CHART_DATABASE) != 0; }

std::optional<GUID> KindOf(IGeoObject* object) {
  GUID kind{};
  if (object == nullptr || FAILED(object->GetKindId(&kind))) return std::nullopt;
  return kind;
}

std::optional<GUID> OwnerKindOf(IGeoAttribute* attribute) {
  ComPtr<IUnknown> owner;
  if (attribute == nullptr || FAILED(attribute->GetOwner(&owner)) || !owner) return std::nullopt;
  ComPtr<IGeoObject> object;
  if (SUCCEEDED(owner.As(&object))) return KindOf(object.Get());
  ComPtr<IGeoDataSet> dataSet;
  GUID kind{};
  if (SUCCEEDED(owner.As(&dataSet)) && SUCCEEDED(dataSet->GetKindId(&kind))) return kind;
  return std::nullopt;
}

ComPtr<IGeoCatalog> CatalogueOf(IGeoDataSet* dataSet) {
  ComPtr<IGeoDatabase> database;
  ComPtr<IGeoCatalog> catalogue;
  if (dataSet == nullptr || FAILED(dataSet->GetDatabase(&database)) || !database) return nullptr;
  if (FAILED(database.As(&catalogue))) return nullptr;
  return catalogue;
}

bool IsHiddenClass(IGeoObject* object, long classCode) {
  ComPtr<IGeoDataSet> dataSet;
  if (object == nullptr || FAILED(object->GetDataSet(&dataSet)) || !dataSet) return false;
  ComPtr<IGeoCatalog> catalogue = CatalogueOf(dataSet.Get());
  long flags = 0;
  if (!catalogue || FAILED(catalogue->GetClassFlags(classCode, &flags)) || (flags & kCatalogueHiddenBit) == 0) {
    return false;
  }
  // A hidden class still shows when the object holds others.
  ComPtr<IGeoObjectEnum> members;
  if (FAILED(object->GetMembers(&members)) || !members) return true;
  return geo::ForEachItem(members.Get(), [](IUnknown*) { return false; }) == 0;
}

std::wstring ObjectLabel(const PanelSettings& settings, IGeoObject* object, long classCode) {
  BSTR text = nullptr;
  std::wstring label;
  if (IObjectFormatter* formatter = settings.Formatter()) {
    if (SUCCEEDED(formatter->FormatObject(0, kLabelFlags | settings.objectFlags, object, 0, 0, &text)) && text) {
      label.assign(text, SysStringLen(text));
    }
  }
  SysFreeString(text);
  return label.empty() ? std::to_wstring(classCode) : label;
}

std::optional<long> LongProperty(IGeoObject* object, long index) {
  VARIANT value;
  VariantInit(&value);
  std::optional<long> result;
  if (object != nullptr && SUCCEEDED(object->GetProperty(index, &value))) {
    VARIANT converted;
    VariantInit(&converted);
    if (SUCCEEDED(VariantChangeType(&converted, &value, 0, VT_I4))) result = converted.lVal;
    VariantClear(&converted);
  }
  VariantClear(&value);
  return result;
}

std::string AnsiText(const wchar_t* text, std::size_t length) {
  if (text == nullptr || length == 0 || length > static_cast<std::size_t>(INT_MAX)) return {};
  const int wide = static_cast<int>(length);
  const int size = WideCharToMultiByte(CP_ACP, 0, text, wide, nullptr, 0, nullptr, nullptr);
  if (size <= 0) return {};
  std::string ansi(static_cast<std::size_t>(size), '\0');
  WideCharToMultiByte(CP_ACP, 0, text, wide, ansi.data(), size, nullptr, nullptr);
  return ansi;
}

std::string AnsiText(BSTR text) { return AnsiText(text, text ? SysStringLen(text) : 0); }

std::string Utf8Text(BSTR text) {
  const std::size_t length = text ? SysStringLen(text) : 0;
  if (length == 0 || length > static_cast<std::size_t>(INT_MAX) / 4) return {};
  const int wide = static_cast<int>(length);
  const int size = WideCharToMultiByte(CP_UTF8, 0, text, wide, nullptr, 0, nullptr, nullptr);
  if (size <= 0) return {};
  std::string utf8(static_cast<std::size_t>(size), '\0');
  WideCharToMultiByte(CP_UTF8, 0, text, wide, utf8.data(), size, nullptr, nullptr);
  return utf8;
}

std::wstring WideText(std::string_view utf8) {
  if (utf8.empty() || utf8.size() > static_cast<std::size_t>(INT_MAX)) return {};
  const int bytes = static_cast<int>(utf8.size());
  const int size = MultiByteToWideChar(CP_UTF8, 0, utf8.data(), bytes, nullptr, 0);
  if (size <= 0) return {};
  std::wstring wide(static_cast<std::size_t>(size), L'\0');
  MultiByteToWideChar(CP_UTF8, 0, utf8.data(), bytes, wide.data(), size);
  return wide;
}

}  // namespace br::inspector
