// The scene reader's JSON: values with their positions, and every malformed document
// refused at the line and column of its first fault.
#include <doctest/doctest.h>

#include <string>

#include "host/chartscene/model/json_reader.h"

using namespace br::chartscene;

TEST_CASE("values, escapes and positions") {
  const std::string text =
      "\xEF\xBB\xBF{\n"
      "  \"name\": \"Brest \\u00e9\\ud83c\\udf0a \\\"x\\\"\",\n"
      "  \"list\": [1, -2.5e1, true, null, {}],\n"
      "  \"big\": 12345678901234567890,\n"
      "  \"caf\xC3\xA9\": 0\n"
      "}";
  JsonValue root;
  JsonError error;
  REQUIRE_MESSAGE(ParseJson(text, root, error), error.message);
  REQUIRE(root.kind == JsonValue::Kind::Object);
  CHECK(root.Find("name")->text == "Brest \xC3\xA9\xF0\x9F\x8C\x8A \"x\"");
  const JsonValue& list = *root.Find("list");
  REQUIRE(list.items.size() == 5);
  CHECK((list.items[0].integral && list.items[0].integer == 1));
  CHECK((!list.items[1].integral && list.items[1].number == -25.0));
  CHECK(list.items[2].boolean);
  CHECK(list.items[3].kind == JsonValue::Kind::Null);
  CHECK((list.line == 3 && list.column == 11));
  CHECK((list.items[4].line == 3 && list.items[4].column == 35));
  CHECK_FALSE(root.Find("big")->integral);  // beyond 64 bits: a double only
  CHECK(root.members[3].key == "caf\xC3\xA9");
  CHECK((root.members[3].line == 5 && root.members[3].column == 3));
  CHECK((root.Find("caf\xC3\xA9")->line == 5 && root.Find("caf\xC3\xA9")->column == 11));  // characters, not bytes
}

TEST_CASE("malformed documents are refused where they go wrong") {
  struct Row {
    const char* text;
    int line, column;
    const char* words;
  };
  const Row rows[] = {
      {"{\"a\": 1,}", 1, 9, "key"},
      {"{\"a\": 1 \"b\": 2}", 1, 9, "','"},
      {"[1, 2", 1, 6, "','"},
      {"{\"a\": 1,\n \"a\": 2}", 2, 2, "twice"},
      {"\"tab\there\"", 1, 5, "control"},
      {"\"\\x\"", 1, 4, "escape"},
      {"\"\\ud800x\"", 1, 8, "surrogate"},
      {"\"\\udc00\"", 1, 8, "surrogate"},
      {"\"\xC3\x28\"", 1, 2, "UTF-8"},
      {"\"\xED\xA0\x80\"", 1, 2, "UTF-8"},  // an encoded surrogate
      {"01", 1, 2, "after the end"},
      {"-", 1, 2, "digit"},
      {"1.", 1, 3, "digit"},
      {"1e+", 1, 4, "digit"},
      {"tru", 1, 4, "true"},
      {"{} {}", 1, 4, "after the end"},
      {"", 1, 1, "end"},
      {"\n\n  \"open", 3, 8, "not closed"},
  };
  for (const Row& row : rows) {
    INFO(row.text);
    JsonValue value;
    JsonError error;
    REQUIRE_FALSE(ParseJson(row.text, value, error));
    CHECK(error.line == row.line);
    CHECK(error.column == row.column);
    CHECK(error.message.find(row.words) != std::string::npos);
  }
  std::string deep(kMaxJsonDepth + 2, '[');
  deep += std::string(kMaxJsonDepth + 2, ']');
  JsonValue value;
  JsonError error;
  CHECK_FALSE(ParseJson(deep, value, error));
  CHECK(error.message.find("deeply") != std::string::npos);
}
