// The producing agency table read from bytes: both encodings give one table, lines end at
// CR and LF, fields at ";" and "|", the first row of a code wins, short and heading lines
// are skipped; and the real table made from gdal-data's list at build time.
#include <doctest/doctest.h>

#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "frame/geo/agency_table.h"

using namespace br::geo;

namespace {

std::vector<AgencyRow> Parse(const std::string& text) {
  return ParseAgencyTable(reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

// The same text as UTF-16 LE with its mark (Latin-1 characters only).
std::string Utf16(const std::string& text) {
  std::string bytes = "\xFF\xFE";
  for (unsigned char c : text) {
    bytes.push_back(static_cast<char>(c));
    bytes.push_back('\0');
  }
  return bytes;
}

void CheckRow(const AgencyRow* row, int code, const char* abbreviation, const char* name) {
  REQUIRE(row != nullptr);
  CHECK(row->code == code);
  CHECK(row->abbreviation == abbreviation);
  CHECK(row->name == name);
}

}  // namespace

TEST_CASE("lines, separators and columns") {
  const auto rows = Parse("170;FR;Service Hydrographique\r\n550|US|Office of Coast Survey\n"
                          "20;BH|Survey Directorate, Bahrain\r40;CA;Canadian Hydrographic Service");
  REQUIRE(rows.size() == 4);
  CheckRow(&rows[0], 170, "FR", "Service Hydrographique");
  CheckRow(&rows[1], 550, "US", "Office of Coast Survey");
  CheckRow(&rows[2], 20, "BH", "Survey Directorate, Bahrain");
  CheckRow(&rows[3], 40, "CA", "Canadian Hydrographic Service");  // no line end at the end
}

TEST_CASE("skipped lines and empty fields") {
  const auto rows = Parse("Code;Abbr;Name\r\n\r\n\r\n12;XX\r\n13\r\n"
                          "14;;No abbreviation\r\n15;AB;\r\n 16 ;CD;Blanks round the code;extra;fields\r\n"
                          "x17;EF;not a number\r\n99999999999;GH;too large\r\n-3;NE;negative\r\n");
  // The heading, blank lines, short lines and bad codes give no row.
  REQUIRE(rows.size() == 4);
  CheckRow(&rows[0], 14, "", "No abbreviation");
  CheckRow(&rows[1], 15, "AB", "");
  CheckRow(&rows[2], 16, "CD", "Blanks round the code");
  CheckRow(&rows[3], -3, "NE", "negative");
}

TEST_CASE("the first row of a code wins") {
  const auto rows = Parse("170;FR;First\r\n170;F2;Second\r\n");
  REQUIRE(rows.size() == 2);
  CheckRow(FindAgency(rows, 170), 170, "FR", "First");
  CHECK(AgencyNameOrCode(rows, 170) == "First");
  CHECK(FindAgency(rows, 171) == nullptr);
  CHECK(AgencyNameOrCode(rows, 171) == "171");
  CHECK(AgencyNameOrCode({}, -5) == "-5");
}

TEST_CASE("UTF-16 with its mark gives the table of the 8-bit text") {
  const std::string text = "170;FR;Service hydrographique et oc\xE9" "anographique\r\n550|US|Office\n";
  const auto ansi = Parse(text);
  const auto wide = Parse(Utf16(text));
  REQUIRE(ansi.size() == 2);
  REQUIRE(wide.size() == 2);
  for (std::size_t i = 0; i < ansi.size(); ++i) {
    CHECK(wide[i].code == ansi[i].code);
    CHECK(wide[i].abbreviation == ansi[i].abbreviation);
    CHECK(wide[i].name == ansi[i].name);
  }
  // An odd last byte is dropped; units past Latin-1 reach the converter.
  auto odd = Utf16("1;A;B\r\n2;C;D");
  odd.push_back('X');
  CHECK(Parse(odd).size() == 2);
  const std::string greek("\xFF\xFE" "7\0;\0G\0;\0\xA3\x03" "a\0", 14);
  const auto rows = Parse(greek);
  REQUIRE(rows.size() == 1);
  CHECK(rows[0].name == "?a");
  // Without the mark, or shorter than 3 bytes, the bytes are 8-bit text.
  CHECK(Parse(std::string("\xFF\xFE", 2)).empty());
  const auto marked = Parse("\xFF" "1;A;B");
  CHECK(marked.empty());  // "\xFF" "1" is not a number
}

TEST_CASE("no bytes") {
  CHECK(ParseAgencyTable(nullptr, 10).empty());
  CHECK(Parse("").empty());
  CHECK(Parse("\r\n\r\n").empty());
}

TEST_CASE("the table made from gdal-data's agency list") {
  std::ifstream file(BR_AGENCY_FILE, std::ios::binary);
  REQUIRE(file.good());
  const std::string bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
  const auto rows = Parse(bytes);
  CHECK(rows.size() == 248);
  CheckRow(FindAgency(rows, 550), 550, "US", "Office of Coast Survey, USA");
  CheckRow(FindAgency(rows, 1), 1, "AR", "Servicio de Hidrografia Naval, Argentina");
  // Decoded entities: their ";" would otherwise have cut the names.
  CheckRow(FindAgency(rows, 510), 510, "TT", "Trinidad & Tobago Hydrographic Unit, Trinidad & Tobago");
  CheckRow(FindAgency(rows, 1010), 1010, "JM", "Harbour Master's Department, Jamaica");
  const auto wide = Parse(Utf16(bytes));
  REQUIRE(wide.size() == rows.size());
  CHECK(wide.back().name == rows.back().name);
}
