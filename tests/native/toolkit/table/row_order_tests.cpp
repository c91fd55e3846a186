#include <doctest/doctest.h>

#include "toolkit/table/logic/RowOrder.h"

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

