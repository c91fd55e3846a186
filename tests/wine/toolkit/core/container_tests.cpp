// Container: the child list, insertion and removal, palettes from safe arrays, font lending.
#include <doctest/doctest.h>

#include "tests/wine/common/toolkit_test_support.h"

#include <oleauto.h>
#include "toolkit/core/Palette.h"
#include "toolkit/core/Panel.h"

using namespace toolkit;
using namespace tktest;

// Row order, insertAt and removal without destroying: the tab container case, whose tabs follow the rows.
TEST_CASE("insertion: positions kept, windows made under the container, null and repeated children refused") {
  HostWindow host;
  Panel root;
  Probe a, b, c, d, e;
  // Before the container has a window, children stay windowless; theirs are made with it.
  CHECK(root.add(&a, "A") == 0);
  CHECK_FALSE(a.isValid());
  REQUIRE(root.create(host.hwnd()));
  CHECK(GetParent(a.getHandle()) == root.getHandle());

  CHECK(root.insertNamed("North", &b, "B") == 1);
  CHECK(root.insertAtNamed(1, "South", &c, "C") == 1);  // before row 1
  CHECK(root.insertAt(0, &d, "D") == 0);
  // No such row: appended through add, so the position is not kept.
  CHECK(root.insertAtNamed(9, "East", &e, "E") == 4);
  std::string order;
  for (int i = 0; i < 5; ++i) order += root.getChildName(i) + ":" + root.getChildPosition(i) + ";";
  CHECK(order == "D:;A:;C:South;B:North;E:;");
  CHECK(root.findChild("C") == &c);

  // A null component is not added; a child already present keeps its one row.
  CHECK(root.add(nullptr, "nothing") == 0);
  CHECK(root.add(&a, "again") == 1);
  CHECK(root.getChildCount() == 5);

  for (Probe* p : {&a, &b, &c, &d, &e}) root.removeComponent(p, false);
}

TEST_CASE("findNamed searches the subtree depth first; findChild only the direct children") {
  Panel root, first, second, inner;
  Probe a, deep, shallow, late;
  root.add(&first, "first");
  first.add(&inner, "inner");
  inner.add(&deep, "X");       // depth 3, but in the first branch
  root.add(&second, "second");
  second.add(&shallow, "X");   // depth 2, in a later branch
  root.add(&a, "A");
  second.add(&late, "late");

  CHECK(root.findNamed("X") == &deep);  // the first branch is searched to its end first
  CHECK(root.findChild("X") == nullptr);
  CHECK(second.findNamed("X") == &shallow);
  CHECK(root.findNamed("late") == &late);
  CHECK(root.findNamed("inner") == &inner);  // a container is found by its own name too
  CHECK(root.findNamed("A") == &a);
  CHECK(root.findNamed("missing") == nullptr);
  CHECK(root.findNamed(nullptr) == nullptr);  // no unnamed child here
  // A child removed from the tree is no longer found.
  inner.removeComponent(&deep, false);
  CHECK(root.findNamed("X") == &shallow);
}

TEST_CASE("removal destroys the child when asked; a child deleted by its owner leaves the list") {
  HostWindow host;
  Panel root;
  REQUIRE(root.create(host.hwnd()));
  int deaths = 0;
  auto make = [&](const char* name) {
    auto* p = new Probe;
    p->deletions = &deaths;
    root.add(p, name);
    return p;
  };
  Probe* b = make("b");
  Probe* c = make("c");
  Probe* d = make("d");

  HWND bWindow = b->getHandle();
  CHECK(root.removeNamed("b", true));
  CHECK((deaths == 1 && !IsWindow(bWindow)));
  CHECK(root.removeAt(1, true));
  CHECK((deaths == 2 && root.getChild(0) == c));

  // A child deleted by its owner leaves the list by itself.
  delete c;
  CHECK((deaths == 3 && root.getChildCount() == 0));
  CHECK_FALSE(root.removeComponent(d, true));  // already gone with the row above
}

// The shapes of array refused are the embedded control boundary suite's; here the container's answers.
TEST_CASE("setPalette answers E_INVALIDARG for a wrong array and takes one by reference") {
  Palette::reset();
  Panel p;
  SAFEARRAY* array = SafeArrayCreateVector(VT_I4, 0, 20);
  for (LONG i = 0; i < 20; ++i) {
    LONG value = RGB(i, 100, 200);
    SafeArrayPutElement(array, &i, &value);
  }
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_I4;
  v.lVal = 20;
  CHECK(p.setPalette(v) == E_INVALIDARG);
  v.vt = VT_ARRAY | VT_BYREF | VT_I4;
  v.pparray = &array;
  CHECK(p.setPalette(v) == S_OK);
  CHECK(Palette::colour(19) == RGB(19, 100, 200));
  SafeArrayDestroy(array);
  Palette::reset();
}

TEST_CASE("a container lends its font (lent or an OLE font) down the tree; children never delete it") {
  HostWindow host;
  Panel root;
  auto* inner = new Panel;
  Probe leaf, deep;
  root.add(inner);
  root.add(&leaf);
  inner->add(&deep);
  REQUIRE(root.create(host.hwnd()));
  REQUIRE(deep.isValid());

  HFONT lent = CreateFontA(-11, 0, 0, 0, FW_NORMAL, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, "Arial");
  root.lendFont(lent);
  CHECK(deep.getFont() == lent);

  // An OLE font object goes down the whole tree as well.
  FONTDESC desc{sizeof(FONTDESC), const_cast<LPOLESTR>(L"Arial"), {{90000, 0}}, FW_BOLD, ANSI_CHARSET,
                FALSE, FALSE, FALSE};
  IFont* font = nullptr;
  REQUIRE(SUCCEEDED(OleCreateFontIndirect(&desc, IID_IFont, reinterpret_cast<void**>(&font))));
  HFONT hfont = nullptr;
  REQUIRE(SUCCEEDED(font->get_hFont(&hfont)));
  root.setFontObject(font);
  CHECK(deep.getFont() == hfont);
  root.removeComponent(inner, true);
  CHECK(GetObjectType(lent) == OBJ_FONT);

  // A child made later gets the container's font when its window is made.
  Probe late;
  root.add(&late);
  CHECK(late.getFont() == root.getFont());

  root.removeComponent(&leaf, false);
  root.removeComponent(&late, false);
  DeleteObject(lent);
  font->Release();
}


// Regression: a child left behind by its container forgets it (no dangling parent).
TEST_CASE("children outlive their container and forget it") {
  HostWindow host;
  Probe child;
  {
    Panel root;
    REQUIRE(root.create(host.hwnd()));
    root.add(&child);
    REQUIRE(child.isValid());
  }
  CHECK(child.getParent() == nullptr);
  CHECK_FALSE(child.isValid());  // its window went with the container's
  CHECK(child.fireAction() == 0);
}
