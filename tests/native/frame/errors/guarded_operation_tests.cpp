// The guarded-operation frame against a recording handler; retries and the real
// reporter's boxes (Retry, Abort, Ignore) are the Wine errors suite's.
#include <doctest/doctest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "frame/errors/guarded_operation.h"
#include "frame/errors/cComError.h"

using namespace br;

namespace {

// Records every report and goes on with the failure.
struct RecordingHandler : cErrHandler {
  void BeginAttempt() noexcept override { ++attempts; }
  bool Report(const char*, ErrRecord& record) noexcept override {
    reports.push_back(record);
    return true;
  }
  int attempts = 0;
  std::vector<ErrRecord> reports;
};

const ErrPlace PLACE{"C:\\src\\legend\\XChartLegend.cpp", "SetLegendData", 1240};

}  // namespace

TEST_CASE("each kind of thrown value is turned into the record's line and result") {
  RecordingHandler handler;
  ErrRecord record;
  CHECK(RunGuarded(handler, "C", PLACE, record, [] {}) == 0);
  CHECK((handler.attempts == 1 && handler.reports.empty() && !record.failed() && record.firstLine == 1240));
  CHECK(static_cast<std::uint32_t>(RunGuarded(handler, "C", PLACE, record, [] { throw cErr(BR_ERR_FILE_OPEN); })) ==
        0xE0040001u);
  CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw cComError(-2147024809); }) == BR_RESULT_FAIL);
  CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw std::runtime_error("x"); }) == BR_RESULT_FAIL);
  int expectedLine = 0;
  RunGuarded(handler, "C", PLACE, record, [&] {
    BR_CHECK_HR(0);
    BR_CHECK(true);
    expectedLine = __LINE__ + 1;
    BR_CHECK_HR(static_cast<std::int32_t>(0x80070057u));  // the check macros throw the line they stand on
  });
  REQUIRE(handler.reports.size() == 4);
  CHECK((handler.reports[0].line == -1 && static_cast<std::uint32_t>(handler.reports[0].result) == 0xE0040001u));
  CHECK((handler.reports[1].line == -1 && handler.reports[2].line == -1 && handler.reports[2].result == BR_RESULT_FAIL));
  CHECK((handler.reports[3].line == expectedLine && record.failed()));
}
