#pragma once
// What a guarded operation reports its failures to. cErrReporter is the real
// one; the frame in GuardedOperation.h only needs this much.

#include <cstdint>

#include "frame/errors/ErrRecord.h"

namespace br {

class cErrHandler {
public:
  virtual ~cErrHandler() = default;

  // Called before every attempt of a guarded operation.
  virtual void BeginAttempt() noexcept {}

  // Reports the record as it stands. Returns true to go on after the guarded
  // body, false to run the operation again. May clear record.result.
  virtual bool Report(const char* className, ErrRecord& record) noexcept = 0;

  // Reports a failure result: stored in the record first.
  bool ReportResult(const char* className, ErrRecord& record, std::int32_t result) noexcept {
    record.result = result;
    return Report(className, record);
  }
};

}  // namespace br
