// The agency table loaded from the chart installation: the real table (made from
// gdal-data) in both encodings, KeyPath's place, duplicates, short lines, no file, and the
// HOCode2Name contract of Lookup.
#include <doctest/doctest.h>

#include <string>

#include "frame/geo/AgencyTable.h"
#include "tests/wine/common/registry_test_support.h"

using namespace br::geo;

namespace {

const std::string kRealTable = BR_AGENCY_FOLDER "\\SYSTEM\\HTML\\hosource.txt";

// The 8-bit table as UTF-16 LE with its mark.
std::string Utf16(const std::string& text) {
  std::string bytes = "\xFF\xFE";
  for (unsigned char c : text) {
    bytes.push_back(static_cast<char>(c));
    bytes.push_back('\0');
  }
  return bytes;
}

std::wstring Text(BSTR text) { return text ? std::wstring(text, SysStringLen(text)) : L"<null>"; }

}  // namespace

TEST_CASE("the real table in both encodings gives one table") {
  ScratchFolder folder;
  const std::string wide = folder / "hosource16.txt";
  WriteTextFile(wide, Utf16(ReadWholeFile(kRealTable)));
  const AgencyTable ansi(kRealTable);
  const AgencyTable utf16(wide);
  REQUIRE(ansi.Loaded());
  REQUIRE(utf16.Loaded());
  CHECK(ansi.Size() == 248);
  REQUIRE(utf16.Size() == ansi.Size());
  for (std::size_t i = 0; i < ansi.Size(); ++i) {
    CHECK(utf16.Rows()[i].code == ansi.Rows()[i].code);
    CHECK(utf16.Rows()[i].name == ansi.Rows()[i].name);
    CHECK(utf16.Rows()[i].abbreviation == ansi.Rows()[i].abbreviation);
  }
  CHECK(utf16.NameOrCode(550) == "Office of Coast Survey, USA");
  CHECK(utf16.NameOrCode(510) == "Trinidad & Tobago Hydrographic Unit, Trinidad & Tobago");
}

TEST_CASE("Lookup answers as HOCode2Name") {
  ScratchFolder folder;
  const std::string path = folder / "hosource.txt";
  // A hand-made table without 550; 170 twice; short and blank lines.
  WriteTextFile(path, "170;FR;Service hydrographique\r\n170;XX;Second\r\n12;AB\r\n\r\n40|CA|Canadian Hydrographic Service\n");
  const AgencyTable table(path);
  CHECK(table.Size() == 3);

  BSTR name = nullptr;
  BSTR abbreviation = nullptr;
  CHECK(table.Lookup(170, &name, &abbreviation) == S_OK);
  CHECK(Text(name) == L"Service hydrographique");
  CHECK(Text(abbreviation) == L"FR");
  SysFreeString(name);
  SysFreeString(abbreviation);

  name = nullptr;
  abbreviation = SysAllocString(L"kept");
  CHECK(table.Lookup(550, &name, &abbreviation) == S_FALSE);
  CHECK(Text(name) == L"550");
  CHECK(Text(abbreviation) == L"kept");  // left untouched
  SysFreeString(name);
  SysFreeString(abbreviation);

  CHECK(table.Lookup(12, nullptr, nullptr) == S_FALSE);  // a short line is no row
  CHECK(table.Lookup(40, nullptr, nullptr) == S_OK);     // out pointers may be null
  name = nullptr;
  CHECK(table.Lookup(-7, &name, nullptr) == S_FALSE);
  CHECK(Text(name) == L"-7");
  SysFreeString(name);
}

TEST_CASE("no file, and the place KeyPath names") {
  ScratchFolder folder;
  const AgencyTable none(folder / "missing.txt");
  CHECK_FALSE(none.Loaded());
  CHECK(none.Size() == 0);
  CHECK(none.NameOrCode(550) == "550");

  SavedRegistryValue keyPath(HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine\\Brdata\\Enum", "KeyPath");
  keyPath.SetString(BR_AGENCY_FOLDER "\\");
  CHECK(AgencyTable::DefaultPath() == kRealTable);
  CHECK(AgencyTable().NameOrCode(170) == "Service Hydrographique et Oceanographique de la Marine, France");
  keyPath.Delete();
  CHECK(AgencyTable::DefaultPath() == "SYSTEM\\HTML\\hosource.txt");
}
