#include "host/brpicture/picture_options.h"

#include <doctest/doctest.h>

using br::brpicture::ParsePictureOptions;
using br::brpicture::PictureOptions;

namespace {

bool Parse(std::vector<std::wstring> args, PictureOptions& options, std::string& error) {
  options = PictureOptions{};
  return ParsePictureOptions(args, options, error);
}

}  // namespace

TEST_CASE("brpicture options") {
  PictureOptions o;
  std::string error;
  SUBCASE("a file alone: a window at 100%") {
    REQUIRE(Parse({L"chart.png"}, o, error));
    CHECK(o.file == L"chart.png");
    CHECK(o.png.empty());
    CHECK(o.zoom == 100);
    CHECK(o.width == 0);
  }
  SUBCASE("every option") {
    REQUIRE(Parse({L"--zoom", L"50", L"a.tif", L"--png", L"out.png", L"--size", L"320x200", L"--palette", L"3",
                   L"--shade", L"-40"},
                  o, error));
    CHECK(o.file == L"a.tif");
    CHECK(o.png == L"out.png");
    CHECK(o.zoom == 50);
    CHECK(o.width == 320);
    CHECK(o.height == 200);
    CHECK(o.palette == 3);
    CHECK(o.shade == -40.0);
  }
  SUBCASE("bad values and missing parts") {
    CHECK_FALSE(Parse({}, o, error));
    CHECK(error == "no picture file");
    CHECK_FALSE(Parse({L"a.png", L"--zoom", L"0"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--zoom", L"12x"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--palette", L"5"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--shade", L"101"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--size", L"300"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--size", L"0x10"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"--png"}, o, error));
    CHECK(error == "an option wants a value");
    CHECK_FALSE(Parse({L"a.png", L"--colour", L"red"}, o, error));
    CHECK_FALSE(Parse({L"a.png", L"b.png"}, o, error));
  }
}
