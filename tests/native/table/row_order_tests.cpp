#include <doctest/doctest.h>

#include "toolkit/table/logic/RowOrder.h"

#include <cmath>

using namespace toolkit::table;

TEST_CASE("ordering by text maps display rows to stored rows and back") {
  RowOrder order;
  CHECK_FALSE(order.active());
  CHECK(order.toStored(3) == 3);

  order.orderByText({"Le Havre", "brest", "Anvers", "Brest", "Zeebrugge"});
  REQUIRE(order.active());
  const int expected[] = {2, 3, 1, 0, 4};  // Anvers, Brest, brest, Le Havre, Zeebrugge
  for (int d = 0; d < 5; ++d) {
    CHECK(order.toStored(d) == expected[d]);
    CHECK(order.toDisplay(expected[d]) == d);
  }
  // Rows beyond the ordered ones keep their place.
  CHECK(order.toStored(7) == 7);
  CHECK(order.toDisplay(-1) == -1);

  order.clear();
  CHECK(order.toStored(0) == 0);
}

TEST_CASE("equal keys keep their stored order") {
  RowOrder order;
  order.orderByText({"b", "a", "b", "a"});
  CHECK(order.toStored(0) == 1);
  CHECK(order.toStored(1) == 3);
  CHECK(order.toStored(2) == 0);
  CHECK(order.toStored(3) == 2);
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
  CHECK(textMatches("Brest", "Brest", false, true));
  CHECK_FALSE(textMatches("Brest", "brest", false, true));
  CHECK(textMatches("Brest", "brest", false, false));
  CHECK_FALSE(textMatches("Brest", "res", false, false));
  CHECK(textMatches("Brest", "RES", true, false));
  CHECK_FALSE(textMatches("Brest", "RES", true, true));
  CHECK(textMatches("Brest", "", true, true));
  CHECK_FALSE(textMatches("Brest", "Brest harbour", true, false));
}
