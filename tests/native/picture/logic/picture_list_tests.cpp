#include "picture/logic/picture_list.h"

#include <doctest/doctest.h>

using namespace br::picture;
using Names = std::vector<std::string>;

TEST_CASE("picture names from the attribute text") {
  CHECK(SplitPictureNames("a.png") == Names{"a.png"});
  CHECK(SplitPictureNames("a.png,b.tif;c.jpg:d.gif|e.bmp") == Names{"a.png", "b.tif", "c.jpg", "d.gif", "e.bmp"});
  CHECK(SplitPictureNames(",,a.png;;|b.png|") == Names{"a.png", "b.png"});
  CHECK(SplitPictureNames("").empty());
  CHECK(SplitPictureNames(",;:|").empty());
  CHECK(SplitPictureNames("with space.png") == Names{"with space.png"});
}

TEST_CASE("stepping through the list") {
  SUBCASE("next wraps from the last to the first") {
    CHECK(NextIndex(-1, 3) == 0);
    CHECK(NextIndex(0, 3) == 1);
    CHECK(NextIndex(2, 3) == 0);
  }
  SUBCASE("previous stops at the first") {
    CHECK(PreviousIndex(2, 3) == 1);
    CHECK(PreviousIndex(0, 3) == 0);
    CHECK(PreviousIndex(-1, 3) == 0);
  }
  SUBCASE("an empty list has nothing to show") {
    CHECK(NextIndex(-1, 0) == -1);
    CHECK(PreviousIndex(-1, 0) == -1);
    CHECK(NextIndex(5, 0) == -1);
  }
  SUBCASE("an index past a shrunken list comes back inside") {
    CHECK(NextIndex(7, 3) == 0);
    CHECK(PreviousIndex(7, 3) == 2);
  }
}

TEST_CASE("zoom choice") {
  CHECK(ZoomText(0) == "200%");
  CHECK(ZoomText(kDefaultZoomEntry) == "100%");
  CHECK(ZoomText(6) == "20%");
  CHECK(ZoomText(7).empty());
  CHECK(ZoomText(-1).empty());

  CHECK(ZoomInEntry(3) == 2);
  CHECK(ZoomInEntry(0) == 0);  // 200% selected: nothing changes
  CHECK(ZoomOutEntry(3) == 4);
  CHECK(ZoomOutEntry(6) == 6);
  CHECK(ZoomInEntry(-1) == -1);
  CHECK_FALSE(CanZoomIn(0));
  CHECK(CanZoomIn(6));
  CHECK_FALSE(CanZoomOut(6));
  CHECK(CanZoomOut(0));
}
