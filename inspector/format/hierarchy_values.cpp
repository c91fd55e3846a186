#include "inspector/format/hierarchy_values.h"

#include <cfloat>
#include <cstdio>

namespace br::inspector {

namespace {

constexpr const char* kUnknown = "<unknown>";

std::string Signed(std::int64_t value, std::int64_t largest) {
  if (value == largest) return kUnknown;
  char text[32];
  std::snprintf(text, sizeof text, "%ld", static_cast<long>(value));
  return text;
}

std::string Unsigned(std::int64_t value) {
  if (value == 0) return kUnknown;
  char text[32];
  std::snprintf(text, sizeof text, "%lu", static_cast<unsigned long>(value));
  return text;
}

std::string Real(double value, double largest) {
  if (value == largest) return kUnknown;
  char text[384];  // "%.3f" of the largest double takes 313 characters
  std::snprintf(text, sizeof text, "%.3f", value);
  return text;
}

}  // namespace

bool IsHierarchyLeafClass(long classCode) {
  return classCode >= kClassHierarchyNote && classCode <= kClassHierarchySource;
}

bool TakesChildNode(unsigned parentLevel, unsigned childLevel) {
  switch (parentLevel) {
    case 7: return true;
    case 6: return childLevel != 7;
    case 5: return childLevel != 7 && childLevel != 6;
    default: return false;
  }
}

bool TakesLeaves(unsigned parentLevel) { return parentLevel >= 5 && parentLevel <= 7; }

std::string HierarchyValueText(const HierarchyValue& value) {
  switch (value.type) {
    case HierarchyValueType::Text: return value.text;
    case HierarchyValueType::I1: return Signed(value.whole, INT8_MAX);
    case HierarchyValueType::I2: return Signed(value.whole, INT16_MAX);
    case HierarchyValueType::I4: return Signed(value.whole, INT32_MAX);
    case HierarchyValueType::UI1:
    case HierarchyValueType::UI2:
      if (value.whole == 0) return kUnknown;
      if (value.enumText) return *value.enumText;
      return Unsigned(value.whole);
    case HierarchyValueType::UI4: return Unsigned(value.whole);
    case HierarchyValueType::R4: return Real(value.real, static_cast<double>(FLT_MAX));
    case HierarchyValueType::R8: return Real(value.real, DBL_MAX);
    case HierarchyValueType::Other: return "<unknown value type>";
    case HierarchyValueType::Unreadable: break;
  }
  return "<Error retrieving value>";
}

}  // namespace br::inspector
