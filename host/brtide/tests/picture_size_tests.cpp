#include "host/brtide/picture_size.h"

#include <doctest/doctest.h>

#include <string>

using namespace br::brtide;

TEST_CASE("picture sizes are WIDTHxHEIGHT within the limits; others are refused with a message") {
  PictureSize size;
  std::string error;
  CHECK((ParsePictureSize("64X8192", size, error) && size.width == 64 && size.height == 8192 && error.empty()));
  for (const char* text : {"", "800", "x400", "800x", "63x100", "100x8193", "-100x100", "100x100x5", "800 x 400", "99999999999x100"}) {
    CAPTURE(text);
    size = PictureSize{321, 123};
    CHECK_FALSE(ParsePictureSize(text, size, error));
    CHECK((error.find("--size") == 0 && size.width == 321 && size.height == 123));
  }
}
