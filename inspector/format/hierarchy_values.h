#pragma once
// What the hierarchy panel shows of a node: the attribute value texts by the value's
// type, and which related objects a node of a level takes as its children. No Windows
// API: tested natively.

#include <cstdint>
#include <optional>
#include <string>

namespace br::inspector {

// The hierarchy's classes: notes, diagrams and sources are leaves; nodes carry a level.
inline constexpr long kClassHierarchyNote = 57001;
inline constexpr long kClassHierarchyDiagram = 57002;
inline constexpr long kClassHierarchySource = 57003;
inline constexpr long kClassHierarchyNode = 57004;
// A node's level: an unsigned 16-bit value; 7 the top, then 6 and 5.
inline constexpr long kCodeHierarchyLevel = 57003;

// Notes, diagrams and sources (IsHierarchyClass of rules/object_groups.h takes nodes too).
bool IsHierarchyLeafClass(long classCode);

// Whether a node of `parentLevel` takes a related node of `childLevel` as its child:
// level 7 takes every node, 6 those not of level 7, 5 those neither of 7 nor 6; other
// levels take none.
bool TakesChildNode(unsigned parentLevel, unsigned childLevel);
// Whether a node of the level takes related objects that are not nodes (leaves).
bool TakesLeaves(unsigned parentLevel);

// An attribute value as the host typed it.
enum class HierarchyValueType { Text, I1, I2, I4, UI1, UI2, UI4, R4, R8, Other, Unreadable };

struct HierarchyValue {
  HierarchyValueType type = HierarchyValueType::Unreadable;
  std::string text;                     // Text, in the ANSI code page
  std::int64_t whole = 0;               // the integer types
  double real = 0;                      // R4 (as read, widened) and R8
  std::optional<std::string> enumText;  // UI1 and UI2: the catalogue's text of the value
};

// The text shown: texts as they are; signed integers "%ld", the largest value of the
// type being "<unknown>"; UI1/UI2 the catalogue text, 0 "<unknown>", else "%lu"; UI4 "%lu",
// 0 "<unknown>"; R4 and R8 "%.3f", the largest finite value of the type "<unknown>";
// "<unknown value type>" for other types and "<Error retrieving value>" when the value
// could not be read.
std::string HierarchyValueText(const HierarchyValue& value);

}  // namespace br::inspector
