#pragma once
// The groups the tree shows chart objects in, and the class rules that sort them. The
// tree lists the groups in kInsertionOrder; dataset entries are only remembered.

#include <array>
#include <cstdint>

namespace br::inspector {

enum ObjectGroup : int {
  kGroupHarbours = 0,       // class 55001
  kGroupClass13 = 1,
  kGroupAidsToNavigation = 2,
  kGroupDangers = 3,
  kGroupAreas = 4,
  kGroupRouteing = 5,
  kGroupOthers = 6,
  kGroupDataSetEntries = 7,
  kGroupAggregations = 8,   // class 400
  kGroupAssociations = 9,   // class 401
  kGroupCount = 10,
};

inline constexpr std::array<ObjectGroup, 9> kInsertionOrder = {
    kGroupHarbours, kGroupClass13,      kGroupAidsToNavigation, kGroupDangers, kGroupAreas,
    kGroupRouteing, kGroupAggregations, kGroupAssociations,     kGroupOthers};

// Host classes with a meaning of their own in the tree.
inline constexpr long kClassHarbour = 55001;
inline constexpr long kClassHarbourEntry = 55500;
inline constexpr long kClassInternalService = 55059;
inline constexpr long kClassExternalService = 55060;
inline constexpr long kClassTechnical = 53355;
inline constexpr long kClassAggregation = 400;
inline constexpr long kClassAssociation = 401;

// What decides whether a beacon, buoy or light of the conditional classes is an aid to
// navigation; read from the object only for those classes.
struct AidFacts {
  long attribute40 = -1;          // CATLIT-like enumeration of class 84; -1 when absent
  bool list94Has33 = false;       // list attribute 94 holds 33
  bool list35Has17 = false;       // list attribute 35 holds 17
};

// True for the classes whose group depends on AidFacts (84, 12, 74).
bool NeedsAidFacts(long classCode);

// The group of an object of a class that is not a harbour and not in a collection.
ObjectGroup GroupOfClass(long classCode, const AidFacts& facts);

// Icons: by primitive 1, 2, 3, 6 -> 1, 2, 3, 4, else 0; 5 is the dataset header.
inline constexpr int kIconHeader = 5;
inline constexpr int kIconHarbourAtEntry = 30;
int IconOfPrimitive(long primitive);
// The marked form of an icon: 0..5 add 6, 31..77 add 47; others stay.
int MarkedIcon(int icon);
inline constexpr int kIconCount = 125;  // 0..77 and the marked forms up to 124

// Property 0 of an object: bits 8 or 9 mark it, bits 0 or 25 hide it.
bool IsMarkedFlags(std::uint32_t flags);
bool IsHiddenFlags(std::uint32_t flags);
// Class flags of the catalogue: bit 15 hides the class.
bool IsHiddenClassFlags(long flags);

// The classes of a hierarchy object (the chart supplementary information).
bool IsHierarchyClass(long classCode);

}  // namespace br::inspector
