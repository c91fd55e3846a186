#include <doctest/doctest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "frame/errors/GuardedOperation.h"
#include "frame/errors/cComError.h"

namespace {

// Records every report and answers with a scripted sequence of choices.
class ScriptedHandler : public cErrHandler {
public:
  enum Choice { GoOn, Retry, Ignore };

  explicit ScriptedHandler(std::vector<Choice> choices = {}) : m_choices(std::move(choices)) {}

  void BeginAttempt() noexcept override { ++attempts; }
  bool Report(const char* className, ErrRecord& record) noexcept override {
    reports.push_back(record);
    classNames.push_back(className);
    const Choice choice = m_next < m_choices.size() ? m_choices[m_next++] : GoOn;
    if (choice == Ignore) {
      record.result = 0;
    }
    return choice != Retry;
  }

  int attempts = 0;
  std::vector<ErrRecord> reports;
  std::vector<std::string> classNames;

private:
  std::vector<Choice> m_choices;
  std::size_t m_next = 0;
};

const ErrPlace PLACE{"C:\\src\\legend\\XChartLegend.cpp", "SetLegendData", 1240};

}  // namespace

TEST_CASE("a body that succeeds runs once and reports nothing") {
  ScriptedHandler handler;
  ErrRecord record;
  int runs = 0;
  CHECK(RunGuarded(handler, "CXChartLegend", PLACE, record, [&] { ++runs; }) == 0);
  CHECK((runs == 1 && handler.attempts == 1 && handler.reports.empty() && !record.failed()));
  CHECK((record.firstLine == 1240 && std::string(record.function) == "SetLegendData"));
}

TEST_CASE("each kind of thrown value is turned into the record's line and result") {
  ScriptedHandler handler;
  ErrRecord record;

  SUBCASE("cErr: its code is the result, no line") {
    CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw cErr(BR_ERR_FILE_OPEN); }) ==
          static_cast<std::int32_t>(0xE0040001u));
    REQUIRE(handler.reports.size() == 1);
    CHECK((handler.reports[0].line == -1 && static_cast<std::uint32_t>(handler.reports[0].result) == 0xE0040001u));
  }
  // A thrown source line: the Wine errors suite's logged line shows it.
  SUBCASE("the COM-support exception and anything else: E_FAIL") {
    CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw cComError(-2147024809); }) ==
          BR_RESULT_FAIL);
    CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw std::runtime_error("x"); }) ==
          BR_RESULT_FAIL);
    CHECK(RunGuarded(handler, "C", PLACE, record, [] { throw 2.5; }) == BR_RESULT_FAIL);
    REQUIRE(handler.reports.size() == 3);
    for (const ErrRecord& reported : handler.reports) CHECK((reported.line == -1 && reported.result == BR_RESULT_FAIL));
  }
  CHECK((handler.classNames.back() == "C" && record.failed()));
}

TEST_CASE("the check macros throw the line they stand on") {
  ScriptedHandler handler;
  ErrRecord record;
  int expectedLine = 0;
  RunGuarded(handler, "C", PLACE, record, [&] {
    BR_CHECK_HR(0);
    BR_CHECK(true);
    expectedLine = __LINE__ + 1;
    BR_CHECK_HR(static_cast<std::int32_t>(0x80070057u));
  });
  REQUIRE(handler.reports.size() == 1);
  CHECK(handler.reports[0].line == expectedLine);
}

TEST_CASE("retry runs the body again with the same arguments and a fresh record") {
  ScriptedHandler handler({ScriptedHandler::Retry, ScriptedHandler::Retry, ScriptedHandler::GoOn});
  ErrRecord record;
  std::vector<int> seen;
  const auto operation = [&](int argument) {
    return RunGuarded(handler, "C", PLACE, record, [&, argument] {
      seen.push_back(argument);
      if (seen.size() == 1) {
        record.text = "set by the first attempt";
        throw 1300;
      }
      throw cErr(BR_ERR_FILE_READ);
    });
  };
  CHECK(static_cast<std::uint32_t>(operation(42)) == 0xE0040003u);
  CHECK((seen == std::vector<int>{42, 42, 42} && handler.attempts == 3));
  REQUIRE(handler.reports.size() == 3);
  CHECK(handler.reports[0].line == 1300);
  // The second attempt starts from a clean record.
  CHECK((handler.reports[1].line == -1 && handler.reports[1].text == nullptr));
}

TEST_CASE("ignore forgets the failure; going on keeps it") {
  ErrRecord record;
  ScriptedHandler ignoring({ScriptedHandler::Ignore});
  CHECK(RunGuarded(ignoring, "C", PLACE, record, [] { throw 7; }) == 0);
  CHECK((!record.failed() && record.line == 7));

  ScriptedHandler aborting({ScriptedHandler::GoOn});
  CHECK(RunGuarded(aborting, "C", PLACE, record, [] { throw 7; }) == BR_RESULT_FAIL);
  CHECK(record.failed());
}

TEST_CASE("a retry after success is never asked for") {
  ScriptedHandler handler({ScriptedHandler::Retry});
  ErrRecord record;
  int runs = 0;
  RunGuarded(handler, "C", PLACE, record, [&] {
    if (++runs == 1) throw cErr(BR_ERR_OUT_OF_MEMORY);
  });
  CHECK((runs == 2 && handler.reports.size() == 1 && !record.failed()));
}
