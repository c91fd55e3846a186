#pragma once
// The frame every guarded operation runs in. At a method boundary:
//
//   ErrRecord record;
//   RunGuarded(reporter_, "CXChartLegend", BR_ERR_PLACE("SetLegendData"), record, [&] {
//     BR_CHECK_HR(dataset_->GetName(&name));
//     ...
//   });
//   if (record.failed()) { ...clean up...; return E_FAIL; }
//
// Inside the body, a failed step throws its source line (BR_CHECK, BR_CHECK_HR);
// lower routines throw cErr; anything else thrown counts as E_FAIL. When the
// report asks for a retry, the body runs again: capture arguments by value, or
// leave them untouched, so the retry sees them as first given.

#include <cstdint>

#include "frame/errors/ErrRecord.h"
#include "frame/errors/cErr.h"
#include "frame/errors/cErrHandler.h"

namespace br {

inline constexpr std::int32_t BR_RESULT_FAIL = static_cast<std::int32_t>(0x80004005u);  // E_FAIL

#define BR_THROW_LINE() throw static_cast<int>(__LINE__)
#define BR_CHECK(condition)   \
  do {                        \
    if (!(condition)) {       \
      BR_THROW_LINE();        \
    }                         \
  } while (0)
#define BR_CHECK_HR(hr) BR_CHECK(static_cast<std::int32_t>(hr) >= 0)

// Runs body until it succeeds or its failure is reported without a retry.
// Returns the record's result: 0 for success or an ignored failure.
template <class Body>
std::int32_t RunGuarded(cErrHandler& handler, const char* className, const ErrPlace& place,
                        ErrRecord& record, Body&& body) {
  for (;;) {
    handler.BeginAttempt();
    record.reset(place);
    // A caught line carries no result of its own; it still has to read as a failure.
    std::int32_t result = BR_RESULT_FAIL;
    try {
      body();
      return record.result;
    } catch (const cErr& error) {
      result = static_cast<std::int32_t>(error.code());
    } catch (int line) {
      record.line = line;
    } catch (...) {
    }
    // Reported outside the handlers: the report may run a modal loop.
    if (handler.ReportResult(className, record, result)) {
      return record.result;
    }
  }
}

}  // namespace br
