#include <doctest/doctest.h>

#include "toolkit/table/logic/RowOrder.h"

#include <cmath>

using namespace toolkit::table;

TEST_CASE("ordering by text maps display rows to stored rows and back") {
  RowOrder order;
  CHECK((!order.active() && order.toStored(3) == 3));

  order.orderByText({"Le Havre", "brest", "Anvers", "Brest", "Zeebrugge"});
  REQUIRE(order.active());
  const int expected[] = {2, 3, 1, 0, 4};  // Anvers, Brest, brest, Le Havre, Zeebrugge
  for (int d = 0; d < 5; ++d) {
    CHECK(order.toStored(d) == expected[d]);
    CHECK(order.toDisplay(expected[d]) == d);
  }
  // Rows beyond the ordered ones keep their place.
  CHECK((order.toStored(7) == 7 && order.toDisplay(-1) == -1));

  order.clear();
  CHECK(order.toStored(0) == 0);
}

TEST_CASE("equal keys keep their stored order") {
  RowOrder order;
  order.orderByText({"b", "a", "b", "a"});
  const int expected[] = {1, 3, 0, 2};
  for (int d = 0; d < 4; ++d) CHECK(order.toStored(d) == expected[d]);
}

TEST_CASE("ordering by number puts NaN last") {
  RowOrder order;
  order.orderByNumber({2.5, std::nan(""), -1.0, 2.5, 0.0});
  const int expected[] = {2, 4, 0, 3, 1};
  for (int d = 0; d < 5; ++d) CHECK(order.toStored(d) == expected[d]);
  order.orderByNumber({});
  CHECK_FALSE(order.active());
}

TEST_CASE("text matching, whole or anywhere, with or without case") {
  const struct {
    const char* pattern;
    bool anywhere, caseMatters, matches;
  } rows[] = {{"Brest", false, true, true}, {"brest", false, true, false}, {"brest", false, false, true},
              {"res", false, false, false}, {"RES", true, false, true},   {"RES", true, true, false},
              {"", true, true, true},       {"Brest harbour", true, false, false}};
  for (const auto& r : rows) CHECK_MESSAGE(textMatches("Brest", r.pattern, r.anywhere, r.caseMatters) == r.matches, r.pattern);
}
