// The tidal stream table: its fifteen lines byte for byte for high and low water, a
// reference that is neither, short and long field lists, and data that looks like a format.
#include <doctest/doctest.h>

#include <string>

#include "inspector/format/tidal_stream_text.h"

using namespace br::inspector;

namespace {

const std::string kDeg = "\xB0";

std::string HourLine(const std::string& ref, const std::string& label, const std::string& dir, const std::string& rate,
                     const std::string& knots = "kn") {
  return "     " + ref + label + "      " + dir + kDeg + "      " + rate + knots + "\r";
}

std::string Goulet(const char* reference) {
  return std::string("Brest,Goulet,") + reference +
         ",060,1.2,065,2.1,068,2.9,070,3.4,070,3.6,068,3.1,000,0.3,250,2.2,248,3.0,248,3.4,250,3.3,250,2.6,245,1.4";
}

int Lines(const std::string& text) {
  int count = 0;
  for (char c : text) count += c == '\r';
  return count;
}

}  // namespace

TEST_CASE("hour labels: a minus with two blanks before, six blanks at the reference, a plus after") {
  CHECK(TidalStreamHourLabel(-6) == " -  6");
  CHECK(TidalStreamHourLabel(-1) == " -  1");
  CHECK(TidalStreamHourLabel(0) == "      ");
  CHECK(TidalStreamHourLabel(3) == " + 3");
  CHECK(TidalStreamHourLabel(6) == " + 6");
}

TEST_CASE("the reference names its water with the captions given; hours keep the field order") {
  // The full tables are read back byte for byte from the panels under Wine; here the
  // captions and the pairing of fields with hours.
  TidalStreamCaptions french;
  french.highWater = "PleineMer";
  french.lowWater = "BasseMer";
  french.time = "Heure";
  french.velocity = "Vitesse";
  french.knots = "nd";
  const std::string low = TidalStreamText(Goulet("LW"), french);
  CHECK(low.rfind("Brest, Goulet LW(BasseMer)\r       Heure    Direction   Vitesse\r" +
                      HourLine("LW", " -  6", "060", "1.2", "nd") + HourLine("LW", " -  5", "065", "2.1", "nd"),
                  0) == 0);
  CHECK(low.find(HourLine("LW", "      ", "000", "0.3", "nd")) != std::string::npos);
  CHECK(low.substr(low.size() - HourLine("LW", " + 6", "245", "1.4", "nd").size()) ==
        HourLine("LW", " + 6", "245", "1.4", "nd"));
  CHECK(Lines(low) == 15);
  CHECK(TidalStreamText(Goulet("HW"), TidalStreamCaptions{}).rfind("Brest, Goulet HW(HighWater)\r", 0) == 0);
}

TEST_CASE("a reference other than HW or LW prints empty brackets; missing fields are empty cells") {
  const TidalStreamCaptions captions;
  CHECK(TidalStreamText(Goulet("MSL"), captions).rfind("Brest, Goulet MSL()\r", 0) == 0);
  CHECK(TidalStreamText(Goulet("hw"), captions).rfind("Brest, Goulet hw()\r", 0) == 0);

  // No reference at all: the first line keeps its punctuation, the hours their labels.
  const std::string none = TidalStreamText("Brest,Goulet", captions);
  std::string expected = "Brest, Goulet ()\r       Time    Direction   Velocity\r";
  for (int hour = -6; hour <= 6; ++hour) expected += HourLine("", TidalStreamHourLabel(hour), "", "");
  CHECK(none == expected);

  // A short list: three hours given, the rest empty.
  const std::string shortList = TidalStreamText("Brest,Goulet,HW,060,1.2,065,2.1,068", captions);
  CHECK(Lines(shortList) == 15);
  CHECK(shortList.find(HourLine("HW", " -  6", "060", "1.2")) != std::string::npos);
  CHECK(shortList.find(HourLine("HW", " -  4", "068", "")) != std::string::npos);
  CHECK(shortList.find(HourLine("HW", " -  3", "", "")) != std::string::npos);
  CHECK(shortList.find(HourLine("HW", " + 6", "", "")) != std::string::npos);

  // Nothing at all still gives every line.
  CHECK(Lines(TidalStreamText("", captions)) == 15);
  CHECK(TidalStreamText("", captions).rfind(",  ()\r", 0) == 0);
}

TEST_CASE("fields beyond the 29th are ignored; texts from data are copied, never read as formats") {
  const TidalStreamCaptions captions;
  const std::string longer = TidalStreamText(Goulet("HW") + ",999,9.9,888", captions);
  CHECK(longer == TidalStreamText(Goulet("HW"), captions));
  CHECK(longer.find("999") == std::string::npos);

  const std::string formats = TidalStreamText("%s%n%x,%d,HW,%s,%n", captions);
  CHECK(formats.rfind("%s%n%x, %d HW(HighWater)\r", 0) == 0);
  CHECK(formats.find(HourLine("HW", " -  6", "%s", "%n")) != std::string::npos);

  // A long field is kept whole.
  const std::string wide(5000, 'x');
  const std::string big = TidalStreamText(wide + ",B,LW", captions);
  CHECK(big.rfind(wide + ", B LW(LowWater)\r", 0) == 0);
}

TEST_CASE("fields split at every comma") {
  CHECK(SplitTidalStreamFields("") == std::vector<std::string>{""});
  CHECK(SplitTidalStreamFields("a,,b,") == std::vector<std::string>{"a", "", "b", ""});
  CHECK(SplitTidalStreamFields(Goulet("HW")).size() == kTidalStreamFields);
}
