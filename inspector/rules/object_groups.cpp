#include "inspector/rules/object_groups.h"

#include <algorithm>
#include <iterator>

namespace br::inspector {

namespace {

constexpr long kAids[] = {5,  6,  7,  8,  9,   14,  15,  16,  17,  18,  19,  39, 58,
                          75, 76, 77, 99, 100, 102, 103, 104, 105, 113, 144, 306};
constexpr long kDangers[] = {86, 153, 156, 159};
constexpr long kAreas[] = {1,  20, 21, 22, 25, 27, 31, 32, 37,  48,  50,  54,  55,  56,  60,
                           66, 67, 80, 82, 83, 87, 88, 92, 93, 94, 112, 120, 132, 133, 135};
constexpr long kRouteing[] = {40, 41, 68, 85, 96, 109, 145, 146, 147, 148, 149, 150};

template <std::size_t N>
bool In(const long (&codes)[N], long code) {
  return std::find(std::begin(codes), std::end(codes), code) != std::end(codes);
}

}  // namespace

bool NeedsAidFacts(long classCode) { return classCode == 84 || classCode == 12 || classCode == 74; }

ObjectGroup GroupOfClass(long classCode, const AidFacts& facts) {
  if (classCode == kClassHarbour) return kGroupHarbours;
  if (classCode == 13) return kGroupClass13;
  if (In(kAids, classCode)) return kGroupAidsToNavigation;
  if (classCode == 84 && facts.attribute40 == 7) return kGroupAidsToNavigation;
  if (classCode == 12 && facts.list94Has33) return kGroupAidsToNavigation;
  if (classCode == 74 && facts.list94Has33 && facts.list35Has17) return kGroupAidsToNavigation;
  if (In(kDangers, classCode)) return kGroupDangers;
  if (In(kAreas, classCode)) return kGroupAreas;
  if (In(kRouteing, classCode)) return kGroupRouteing;
  return kGroupOthers;
}

int IconOfPrimitive(long primitive) {
  switch (primitive) {
    case 1: return 1;
    case 2: return 2;
    case 3: return 3;
    case 6: return 4;
    default: return 0;
  }
}

int MarkedIcon(int icon) {
  if (icon >= 0 && icon <= 5) return icon + 6;
  if (icon >= 31 && icon <= 77) return icon + 47;
  return icon;
}

bool IsMarkedFlags(std::uint32_t flags) { return (flags & ((1u << 8) | (1u << 9))) != 0; }
bool IsHiddenFlags(std::uint32_t flags) { return (flags & ((1u << 0) | (1u << 25))) != 0; }
bool IsHiddenClassFlags(long flags) { return (static_cast<unsigned long>(flags) & 0x8000u) != 0; }

bool IsHierarchyClass(long classCode) { return classCode >= 57001 && classCode <= 57004; }

}  // namespace br::inspector
