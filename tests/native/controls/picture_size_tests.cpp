#include "host/brtide/picture_size.h"

#include <doctest/doctest.h>

#include <string>

using br::brtide::ParsePictureSize;
using br::brtide::PictureSize;

TEST_CASE("picture sizes are WIDTHxHEIGHT within the limits") {
  PictureSize size;
  std::string error;
  CHECK((ParsePictureSize("800x400", size, error) && size.width == 800 && size.height == 400));
  CHECK((ParsePictureSize("64X8192", size, error) && size.width == 64 && size.height == 8192));
  CHECK(error.empty());
}

TEST_CASE("other sizes are refused with a message and leave the size alone") {
  for (const char* text : {"", "800", "x400", "800x", "63x100", "100x8193", "-100x100", "100x100x5", "1e3x100",
                           "800 x 400", "99999999999x100", "0x0"}) {
    CAPTURE(text);
    PictureSize size{321, 123};
    std::string error;
    CHECK_FALSE(ParsePictureSize(text, size, error));
    CHECK(error.find("--size") == 0);
    CHECK((size.width == 321 && size.height == 123));
  }
}
