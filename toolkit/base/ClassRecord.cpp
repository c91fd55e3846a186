#include "toolkit/base/ClassRecord.h"

#include "toolkit/base/Object.h"

namespace toolkit {

bool isKindOf(const ClassRecord* record, const ClassRecord* target) {
  if (!target) return false;
  for (; record; record = record->parent) {
    if (record == target) return true;
  }
  return false;
}

bool isKindOf(const Object* object, const ClassRecord* target) {
  return object && isKindOf(object->getClassRecord(), target);
}

int whichOf(const Object* object, const ClassRecord* r0, const ClassRecord* r1,
            const ClassRecord* r2, const ClassRecord* r3, const ClassRecord* r4) {
  if (!object) return -1;
  const ClassRecord* record = object->getClassRecord();
  const ClassRecord* candidates[] = {r0, r1, r2, r3, r4};
  for (int i = 0; i < 5 && candidates[i]; ++i) {
    if (isKindOf(record, candidates[i])) return i;
  }
  return -1;
}

}  // namespace toolkit
