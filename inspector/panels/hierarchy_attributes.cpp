#include "inspector/panels/hierarchy_attributes.h"

#include <cstdio>

#include <wrl/client.h>

#include "frame/geo/catalogue_texts.h"
#include "frame/geo/geo_enumeration.h"
#include "inspector/panels/geo_object_rules.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

HierarchyValue ToHierarchyValue(const VARIANT& value, IGeoCatalog* catalogue, long attributeCode) {
  HierarchyValue out;
  switch (value.vt) {
    case VT_BSTR:
      out.type = HierarchyValueType::Text;
      out.text = AnsiText(value.bstrVal);
      break;
    case VT_I1: out.type = HierarchyValueType::I1; out.whole = static_cast<signed char>(value.cVal); break;
    case VT_I2: out.type = HierarchyValueType::I2; out.whole = value.iVal; break;
    case VT_I4: out.type = HierarchyValueType::I4; out.whole = value.lVal; break;
    case VT_UI4: out.type = HierarchyValueType::UI4; out.whole = value.ulVal; break;
    case VT_R4: out.type = HierarchyValueType::R4; out.real = value.fltVal; break;
    case VT_R8: out.type = HierarchyValueType::R8; out.real = value.dblVal; break;
    case VT_UI1:
    case VT_UI2: {
      out.type = value.vt == VT_UI1 ? HierarchyValueType::UI1 : HierarchyValueType::UI2;
      out.whole = value.vt == VT_UI1 ? value.bVal : value.uiVal;
      std::string text;
      if (out.whole != 0 && catalogue != nullptr &&
          geo::ReadEnumText(catalogue, attributeCode, static_cast<ULONG>(out.whole), text)) {
        out.enumText = text;
      }
      break;
    }
    default: out.type = HierarchyValueType::Other; break;
  }
  return out;
}

std::string HierarchyTitle(IGeoCatalog* catalogue, long classCode) {
  std::string name;
  if (catalogue != nullptr && geo::ReadClassName(catalogue, classCode, name) && !name.empty()) return name;
  char code[16];
  std::snprintf(code, sizeof code, "%ld", classCode);
  return code;
}

std::vector<std::string> HierarchyAttributeRows(IGeoObject* object, IGeoCatalog* catalogue) {
  std::vector<std::string> rows;
  ComPtr<IGeoObjectEnum> attributes;
  if (object == nullptr || FAILED(object->GetAttributes(&attributes)) || !attributes) return rows;
  geo::ForEachItem(attributes.Get(), [&](IUnknown* item) {
    ComPtr<IGeoAttribute> attribute;
    long code = 0;
    if (FAILED(item->QueryInterface(IID_IGeoAttribute, reinterpret_cast<void**>(attribute.GetAddressOf()))) ||
        !attribute || FAILED(attribute->GetCode(&code))) {
      return true;
    }
    std::string name;
    if (catalogue == nullptr || !geo::ReadAttributeName(catalogue, code, name) || name.empty()) {
      char number[16];
      std::snprintf(number, sizeof number, "%ld", code);
      name = number;
    }
    VARIANT value;
    VariantInit(&value);
    HierarchyValue shown;  // unreadable unless the host answers
    if (SUCCEEDED(attribute->GetValue(&value))) shown = ToHierarchyValue(value, catalogue, code);
    VariantClear(&value);
    rows.push_back(name + ": " + HierarchyValueText(shown));
    return true;
  });
  return rows;
}

}  // namespace br::inspector
