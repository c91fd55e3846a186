// The S-57 catalogue as gdal-data writes it, with its traps: quoted names with commas, one
// backslash-escaped quote, UTF-8 and Latin-1 bytes mixed, acronyms that differ in letter
// case only, rows that do not fit the columns.
#include <doctest/doctest.h>

#include <cstdlib>
#include <string>

#include "host/chartscene/model/S57Catalogue.h"
#include "host/chartscene/model/cp1252_text.h"

using namespace br::chartscene;

namespace {

std::string GdalFolder() {
  const char* folder = std::getenv("BR_S57_FOLDER");
  return folder ? folder : "/usr/share/gdal";
}

}  // namespace

TEST_CASE("code page 1252 from mixed bytes") {
  CHECK(Cp1252FromMixed("moir\xC3\xA9") == "moir\xE9");     // UTF-8
  CHECK(Cp1252FromMixed("moir\xE9") == "moir\xE9");         // Latin-1 already
  CHECK(Cp1252FromMixed("Diver\xE2\x80\x99s") == "Diver\x92s");  // right quote
  CHECK(Cp1252FromMixed("a \xC2\x96 b") == "a \x96 b");     // a 1252 dash read as Latin-1
  CHECK(Cp1252FromMixed("\xE2\x82\xAC \xE4\xB8\xAD") == "\x80 ?");  // euro; no CJK in 1252
  CHECK(Utf8FromCp1252("\x80 \x96 \xE9") == "\xE2\x82\xAC \xE2\x80\x93 \xC3\xA9");
}

TEST_CASE("the gdal-data S-57 files: the codes the library relies on, and the traps") {
  S57Catalogue catalogue;
  std::string error;
  REQUIRE_MESSAGE(catalogue.LoadFolder(GdalFolder(), error), error);
  CHECK(catalogue.ClassCount() > 250);
  CHECK(catalogue.AttributeCount() > 400);
  CHECK(catalogue.EnumCount() > 900);

  const struct {
    const char* acronym;
    long code;
  } classes[] = {{"LIGHTS", 75}, {"M_ACCY", 300}, {"M_QUAL", 308}, {"M_SDAT", 309}, {"M_VDAT", 312},
                 {"MAGVAR", 81}, {"C_AGGR", 400}, {"C_ASSO", 401}, {"BUISGL", 12}, {"LNDMRK", 74}};
  for (const auto& row : classes) {
    INFO(row.acronym);
    REQUIRE(catalogue.ClassByAcronym(row.acronym) != nullptr);
    CHECK(catalogue.ClassByAcronym(row.acronym)->code == row.code);
  }
  CHECK(catalogue.ClassByCode(12)->name == "Building, single");  // quoted, with a comma

  const struct {
    const char* acronym;
    long code;
    char type;
  } attributes[] = {{"VALMAG", 176, 'F'}, {"CATZOC", 72, 'E'}, {"VERDAT", 185, 'E'}, {"PICREP", 120, 'S'},
                    {"TXTDSC", 158, 'S'}, {"NTXTDS", 304, 'S'}, {"HORDAT", 400, 'E'}, {"POSACC", 401, 'F'},
                    {"COLOUR", 75, 'L'}, {"TS_TSP", 159, 'A'}, {"verdat", 17005, 'E'}};
  for (const auto& row : attributes) {
    INFO(row.acronym);
    REQUIRE(catalogue.AttributeByAcronym(row.acronym) != nullptr);
    CHECK(catalogue.AttributeByAcronym(row.acronym)->code == row.code);
    CHECK(catalogue.AttributeByAcronym(row.acronym)->type == row.type);
  }
  CHECK(catalogue.AttributeByAcronym("Verdat") == nullptr);
  CHECK(catalogue.AttributeByCode(17009)->name == "Marks navigational \x96 System of");
  CHECK(catalogue.AttributeByCode(20524)->name == "Diver\x92s Thrust Test Depth");
  CHECK(catalogue.AttributeByCode(0) == nullptr);  // the comment row

  CHECK(*catalogue.EnumText(400, 13) == "Astro beacon \"E\" 1945");
  CHECK(*catalogue.EnumText(37, 16) == "moir\xE9 effect");
  CHECK(*catalogue.EnumText(2, 1) == "stake, pole, perch, post");
  CHECK(*catalogue.EnumText(400, 2) == "WGS 84");
  CHECK(catalogue.EnumText(185, 0) == nullptr);
}

TEST_CASE("a scene's own classes and attributes join or replace the catalogue's") {
  S57Catalogue catalogue;
  std::string error;
  CHECK_FALSE(catalogue.Load("", "", "", error));
  REQUIRE(catalogue.Load("1,Light,LIGHTS,,\n", "1,Colour,COLOUR,L,F\n", "1,1,white\n", error));
  catalogue.AddClass({55001, "harbr_", "Harbour facilities", kCatalogueHidden});
  catalogue.AddAttribute({1, "COLOR2", "Colour again", 'E', 0});
  CHECK(catalogue.ClassByAcronym("harbr_")->flags == kCatalogueHidden);
  CHECK(catalogue.AttributeByAcronym("COLOUR") == nullptr);  // replaced with its acronym
  CHECK(catalogue.AttributeByAcronym("COLOR2")->code == 1);
}
