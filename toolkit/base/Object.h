#pragma once
// Root of every toolkit class: components and layout objects alike answer their
// class record first.

#include "toolkit/base/ClassRecord.h"

namespace toolkit {

class Object {
public:
  Object() = default;
  Object(const Object&) = delete;
  Object& operator=(const Object&) = delete;

  virtual const ClassRecord* getClassRecord() const;  // slot 0
  virtual ~Object();                                  // slot 1
};

}  // namespace toolkit
