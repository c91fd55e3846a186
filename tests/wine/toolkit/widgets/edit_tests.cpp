// cXEdit2 driven with real key, character and mouse messages: what the edit takes and what
// bubbles on (what each edit type makes of a key is the native edit suites').
#include <doctest/doctest.h>

#include <cmath>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/widgets/cXEdit2.h"

using namespace toolkit;
using namespace wtest;

namespace {

// A host, a recording panel and an edit 160 x 24 inside it.
struct EditBench {
  MountedPanel panel;
  cXEdit2 edit;
  HWND h = nullptr;

  explicit EditBench(int maxLength = 0) : edit(maxLength) {
    panel.add(&edit);
    edit.setBounds(10, 10, 160, 24, true, true);
    h = edit.getHandle();
  }
};

}  // namespace

TEST_CASE("characters typed reach the model; refused ones bubble, the edit's keys do not") {
  // type, mask, limit, start value (NaN: none), End first, characters, text, characters that bubbled
  struct Row { int type; const char* mask; int limit; double value; bool end; const char *typed, *text; int bubbled; };
  const Row rows[] = {
      {kEditLatitude, nullptr, 0, -12.5, true, "nx", "12\xB0" "30.000'N", 1},  // 'n' taken, 'x' refused
      {kEditInteger, nullptr, 6, NAN, false, "1234567-", "123456", 2},
      {kEditText, "-99:99", 0, NAN, false, "-1234", "-12:34", 0},
      {kEditText, nullptr, 0, NAN, false, "ab\t", "ab", 1},  // control characters are not text
  };
  for (const Row& row : rows) {
    CAPTURE(row.typed);
    EditBench b(row.limit);
    REQUIRE(b.edit.setEditType(row.type, row.mask));
    if (!std::isnan(row.value)) REQUIRE(b.edit.setValue(row.value));
    if (row.end) key(b.h, VK_END);
    for (const char* c = row.typed; *c; ++c) typeChar(b.h, *c);
    CHECK(b.edit.getText() == row.text);
    CHECK(b.panel.count(kEventChar) == row.bubbled);
    key(b.h, VK_HOME);
    key(b.h, VK_DELETE);  // Delete is taken too: never bubbles
    CHECK(b.panel.count(kEventKeyDown) == 0);
    key(b.h, VK_RETURN);  // keys that are not the edit's go on
    CHECK(b.panel.count(kEventKeyDown) == 1);
  }
}

TEST_CASE("keys are the edit's only while its window is visible") {
  EditBench b;
  b.edit.setText("abc");
  b.edit.show(false);
  key(b.h, VK_BACK);
  typeChar(b.h, 'x');
  CHECK(b.edit.getText() == "abc");
  CHECK(b.panel.count(kEventKeyDown) == 1);
  CHECK(b.panel.count(kEventChar) == 1);
}
