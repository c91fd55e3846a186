#include "toolkit/base/Object.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

const ClassRecord* Object::getClassRecord() const { return &records::Object; }

Object::~Object() = default;

}  // namespace toolkit
