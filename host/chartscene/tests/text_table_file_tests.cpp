// The stand-in's files: CSV cells as the S-57 files and BRInfo.csv write them, and the
// text table's rule that an empty quoted cell is a text while a missing cell is none.
#include <doctest/doctest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "host/chartscene/model/csv_reader.h"
#include "host/chartscene/model/text_table_file.h"

using namespace br::chartscene;

TEST_CASE("CSV: quotes with commas and line breaks, doubled and backslash-escaped quotes, line numbers") {
  const std::string text =
      "\"Code\",\"Meaning\"\r\n"
      "2,\"stake, pole, perch, post\"\r\n"
      "\r\n"
      "400,13,\"Astro beacon \\\"E\\\" 1945\"\n"
      "5,\"two\nlines\",\"say \"\"hi\"\"\"\n"
      "7,,\"\"\n"
      "8";
  const std::vector<CsvRecord> records = ReadCsv(text);
  REQUIRE(records.size() == 6);
  CHECK(records[1].cells[1].text == "stake, pole, perch, post");
  CHECK(records[2].line == 4);  // the blank line 3 is no record
  CHECK(records[2].cells[2].text == "Astro beacon \"E\" 1945");
  CHECK(records[3].cells[1].text == "two\nlines");
  CHECK(records[3].cells[2].text == "say \"hi\"");
  CHECK(records[4].line == 7);  // the quoted line break counted
  REQUIRE(records[4].cells.size() == 3);
  CHECK_FALSE(records[4].cells[1].quoted);
  CHECK(records[4].cells[2].quoted);
  CHECK(records[4].cells[2].text.empty());
  CHECK(records[5].cells[0].text == "8");  // no line end after the last record
}

TEST_CASE("text table: languages by column, empty quoted cells are texts, missing cells are none") {
  const std::string file =
      "\xEF\xBB\xBFsection,id,1033,1036\n"
      "ObjInspector,1,Attributes,Attributs\n"
      "ObjInspector,55,unknown,\"\"\n"
      "ObjInspector,56,only English\n"
      "ObjInspector,57,,Officiel\n"
      "cPictureBox,-1,Close,Fermer\n"
      "cPictureBox,-1,Close it,Fermez\n";
  TextTableData table;
  std::string error;
  REQUIRE(ParseTextTable(file, table, error));
  CHECK(*FindText(table, "ObjInspector", 1, 1036) == "Attributs");
  CHECK(FindText(table, "ObjInspector", 55, 1036)->empty());
  CHECK_FALSE(FindText(table, "ObjInspector", 56, 1036).has_value());
  CHECK_FALSE(FindText(table, "ObjInspector", 57, 1033).has_value());
  CHECK(*FindText(table, "cPictureBox", -1, 1033) == "Close it");  // the later row wins
  CHECK_FALSE(FindText(table, "objinspector", 1, 1033).has_value());
  CHECK_FALSE(FindText(table, "ObjInspector", 1, 1031).has_value());
  CHECK_FALSE(FindText(table, "ObjInspector", 2, 1033).has_value());

  CHECK_FALSE(ParseTextTable("", table, error));
  CHECK_FALSE(ParseTextTable("id,section,1033\n", table, error));
  CHECK_FALSE(ParseTextTable("section,id,english\n", table, error));
  CHECK_FALSE(ParseTextTable("section,id,1033\nObjInspector,one,Attributes\n", table, error));
  CHECK(error.find("line 2") != std::string::npos);
  // A number cell is read whole: what follows a zero byte is not dropped.
  CHECK_FALSE(ParseTextTable(std::string("section,id,1033\nObjInspector,12\0x,Attributes\n", 45), table, error));
  CHECK_FALSE(ParseTextTable(std::string("section,id,1033\0\nObjInspector,12,Attributes\n", 44), table, error));
}

TEST_CASE("the shipped BRInfo.csv reads whole, with English and French for every row") {
  const char* root = std::getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  std::ifstream in(std::string(root) + "/host/chartscene/BRInfo.csv", std::ios::binary);
  std::ostringstream content;
  content << in.rdbuf();
  TextTableData table;
  std::string error;
  REQUIRE_MESSAGE(ParseTextTable(content.str(), table, error), error);
  REQUIRE(table.languages == std::vector<long>{1033, 1036});
  for (const auto& [key, cells] : table.texts) {
    INFO(key.first << " " << key.second);
    CHECK(cells[0].has_value());
    CHECK(cells[1].has_value());
  }
  CHECK(*FindText(table, "ObjectInfo", 5, 1033) == "Unknown Datum");
  CHECK(*FindText(table, "cPictureBox", -1, 1036) == "Fermer");
  CHECK(*FindText(table, "ObjInspector", 4, 1036) == "Non d\xC3\xA9" "fini");
}
