#pragma once
// Run-time class records of the toolkit: each class has one static record that
// names it and points to its parent class's record. Kind tests walk this chain
// instead of relying on the compiler's type information.

namespace toolkit {

class Object;

struct ClassRecord {
  const char* name;           // the class name, as the program shows it
  const ClassRecord* parent;  // null for the root class

  constexpr ClassRecord(const char* className, const ClassRecord* parentRecord)
      : name(className), parent(parentRecord) {}
};

// True when `record` is `target` or descends from it. Null arguments give false.
bool isKindOf(const ClassRecord* record, const ClassRecord* target);
bool isKindOf(const Object* object, const ClassRecord* target);

// Index (0..4) of the first record the object is kind of, or -1. A null record ends
// the list early, so callers may pass fewer than five.
int whichOf(const Object* object, const ClassRecord* r0, const ClassRecord* r1 = nullptr,
            const ClassRecord* r2 = nullptr, const ClassRecord* r3 = nullptr,
            const ClassRecord* r4 = nullptr);

}  // namespace toolkit
