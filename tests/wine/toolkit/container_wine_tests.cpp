// Container: the child list, insertion and removal, palettes from safe arrays,
// font lending and repainting.
#include <doctest/doctest.h>

#include "ToolkitTestSupport.h"

#include <oleauto.h>
#include "toolkit/base/ClassRecords.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/layout/GridLayout.h"

using namespace toolkit;
using namespace tktest;

namespace {

struct CountedLayout : BorderLayout {
  explicit CountedLayout(int* d) : deaths(d) {}
  ~CountedLayout() override { ++*deaths; }
  int* deaths;
};

SAFEARRAY* makeArray(VARTYPE vt, ULONG count, LONG lower) {
  SAFEARRAYBOUND bound{count, lower};
  SAFEARRAY* array = SafeArrayCreate(vt, 1, &bound);
  if (vt == VT_I4 || vt == VT_UI4) {
    for (LONG i = 0; i < static_cast<LONG>(count); ++i) {
      LONG index = lower + i;
      LONG value = RGB(i, 100, 200);
      SafeArrayPutElement(array, &index, &value);
    }
  }
  return array;
}

HRESULT paletteFrom(Container& c, VARTYPE vt, ULONG count, LONG lower, bool byRef = false) {
  SAFEARRAY* array = makeArray(vt, count, lower);
  VARIANT v;
  VariantInit(&v);
  HRESULT hr;
  if (byRef) {
    v.vt = VT_ARRAY | VT_BYREF | vt;
    v.pparray = &array;
    hr = c.setPalette(v);
  } else {
    v.vt = VT_ARRAY | vt;
    v.parray = array;
    hr = c.setPalette(v);
  }
  SafeArrayDestroy(array);
  return hr;
}

}  // namespace

TEST_CASE("a Panel starts with a BorderLayout, its id and user value 7") {
  Panel p("Lights", 12);
  CHECK(p.getClassRecord() == &records::Panel);
  CHECK(p.getUserId() == 12);
  CHECK(p.getUserValue1() == 7);
  REQUIRE(p.getLayout());
  CHECK(isKindOf(p.getLayout(), &records::BorderLayout));
  CHECK(p.getLayout()->hgap == 0);
  CHECK(p.getLayout()->mode == 16);
  Panel withGrid(std::make_unique<GridLayout>(2, 2));
  CHECK(isKindOf(withGrid.getLayout(), &records::GridLayout));
}

// Row order, insertAt and removal without destroying: the tab container case, whose tabs follow the rows.
TEST_CASE("insertion: positions kept, windows made under the container, null and repeated children refused") {
  HostWindow host;
  Panel root;
  Probe a, b, c, d, e;
  // Before the container has a window, children stay windowless.
  CHECK(root.add(&a, "A") == 0);
  CHECK_FALSE(a.isValid());
  CHECK(a.getParent() == &root);
  REQUIRE(root.create(host.hwnd()));
  CHECK(GetParent(a.getHandle()) == root.getHandle());  // made when the container was

  CHECK(root.insertNamed("North", &b, "B") == 1);
  CHECK(root.insertAtNamed(1, "South", &c, "C") == 1);  // before row 1
  CHECK(root.insertAt(0, &d, "D") == 0);
  // No such row: appended through add, so the position is not kept.
  CHECK(root.insertAtNamed(9, "East", &e, "E") == 4);
  std::string order;
  for (int i = 0; i < 5; ++i) order += root.getChildName(i) + ":" + root.getChildPosition(i) + ";";
  CHECK(order == "D:;A:;C:South;B:North;E:;");
  CHECK(root.findChild("C") == &c);
  CHECK(root.findChild("Z") == nullptr);

  // A null component is not added; a child already present keeps its one row.
  CHECK(root.add(nullptr, "nothing") == 0);
  CHECK(root.getChildCount() == 5);
  CHECK(root.add(&a, "again") == 1);
  CHECK(root.getChildCount() == 5);

  root.setChildValues(4);
  CHECK(c.getUserValue1() == 4);
  CHECK(e.getUserValue2() == 4);
  CHECK(root.countWindows() == 5);
  CHECK(root.hasHandle(c.getHandle()));
  CHECK_FALSE(root.hasHandle(host.hwnd()));

  for (Probe* p : {&a, &b, &c, &d, &e}) root.removeComponent(p, false);
  CHECK(root.getChildCount() == 0);
}

TEST_CASE("a creation parent stands in for the container's missing window") {
  HostWindow host;
  Panel root;
  root.setCreationParent(host.hwnd());
  Probe a;
  root.add(&a);
  REQUIRE(a.isValid());
  CHECK(GetParent(a.getHandle()) == host.hwnd());
  root.removeComponent(&a, false);

  // A stale creation parent is not a window: nothing is made, nothing thrown.
  Panel stale;
  HWND gone = CreateWindowExA(0, "STATIC", "", WS_CHILD, 0, 0, 1, 1, host.hwnd(), nullptr, nullptr, nullptr);
  DestroyWindow(gone);
  stale.setCreationParent(gone);
  Probe b;
  stale.add(&b);
  CHECK_FALSE(b.isValid());
  stale.removeComponent(&b, false);
}

TEST_CASE("removal with and without destroying the child") {
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
  Probe* a = make("a");
  Probe* b = make("b");
  Probe* c = make("c");
  Probe* d = make("d");

  CHECK(root.removeComponent(a, false));
  CHECK(deaths == 0);
  CHECK(a->getParent() == nullptr);
  CHECK(root.getChildCount() == 3);
  delete a;
  CHECK(deaths == 1);

  HWND bWindow = b->getHandle();
  CHECK(root.removeNamed("b", true));
  CHECK(deaths == 2);
  CHECK_FALSE(IsWindow(bWindow));
  CHECK_FALSE(root.removeNamed("b", true));
  CHECK_FALSE(root.removeAt(-1, true));
  CHECK(root.removeAt(1, true));
  CHECK(deaths == 3);
  CHECK(root.getChild(0) == c);

  // A child deleted by its owner leaves the list by itself.
  delete c;
  CHECK(deaths == 4);
  CHECK(root.getChildCount() == 0);
  CHECK_FALSE(root.removeComponent(d, true));  // already gone with the row above
}

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

TEST_CASE("setLayout deletes the previous layout; the container deletes the last") {
  int deaths = 0;
  {
    Panel p(std::make_unique<CountedLayout>(&deaths));
    p.setLayout(std::make_unique<CountedLayout>(&deaths));
    CHECK(deaths == 1);
    p.setLayout(nullptr);
    CHECK(deaths == 2);
    CHECK(p.getLayout() == nullptr);
    p.setLayout(std::make_unique<CountedLayout>(&deaths));
  }
  CHECK(deaths == 3);
}

TEST_CASE("setPalette takes one-dimensional arrays of 20 four-byte elements from 0") {
  Palette::reset();
  Panel p;
  CHECK(paletteFrom(p, VT_I4, 19, 0) == E_INVALIDARG);
  CHECK(paletteFrom(p, VT_I4, 21, 0) == E_INVALIDARG);
  CHECK(paletteFrom(p, VT_I4, 20, 1) == E_INVALIDARG);
  CHECK(paletteFrom(p, VT_I2, 20, 0) == E_INVALIDARG);
  CHECK(paletteFrom(p, VT_UI4, 20, 0, true) == S_OK);
  CHECK(Palette::colour(19) == RGB(19, 100, 200));

  // Two dimensions, no array, an empty variant.
  SAFEARRAYBOUND bounds[2] = {{20, 0}, {1, 0}};
  SAFEARRAY* twoD = SafeArrayCreate(VT_I4, 2, bounds);
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_ARRAY | VT_I4;
  v.parray = twoD;
  CHECK(p.setPalette(v) == E_INVALIDARG);
  SafeArrayDestroy(twoD);
  v.parray = nullptr;
  CHECK(p.setPalette(v) == E_INVALIDARG);
  VariantInit(&v);
  CHECK(p.setPalette(v) == E_INVALIDARG);
  v.vt = VT_I4;
  v.lVal = 20;
  CHECK(p.setPalette(v) == E_INVALIDARG);
  v.vt = VT_ARRAY | VT_BYREF | VT_I4;
  v.pparray = nullptr;
  CHECK(p.setPalette(v) == E_INVALIDARG);
  Palette::reset();
}

TEST_CASE("a container lends its font (own, lent or an OLE font) down the tree; children never delete it") {
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
  CHECK(leaf.getFont() == lent);
  CHECK(deep.getFont() == lent);

  // An OLE font object goes down the whole tree as well; a null one is ignored.
  FONTDESC desc{sizeof(FONTDESC), const_cast<LPOLESTR>(L"Arial"), {{90000, 0}}, FW_BOLD, ANSI_CHARSET,
                FALSE, FALSE, FALSE};
  IFont* font = nullptr;
  REQUIRE(SUCCEEDED(OleCreateFontIndirect(&desc, IID_IFont, reinterpret_cast<void**>(&font))));
  HFONT hfont = nullptr;
  REQUIRE(SUCCEEDED(font->get_hFont(&hfont)));
  root.setFontObject(font);
  CHECK(deep.getFont() == hfont);
  root.setFontObject(nullptr);
  CHECK(deep.getFont() == hfont);
  root.removeComponent(inner, true);
  CHECK(GetObjectType(lent) == OBJ_FONT);

  // The container's own new font goes to the children too, replacing the loan.
  REQUIRE(root.setFont("Arial", 12, false, false));
  CHECK(leaf.getFont() == root.ownFont());

  // A child made later gets the container's font when its window is made.
  Probe late;
  root.add(&late);
  CHECK(late.getFont() == root.getFont());

  root.removeComponent(&leaf, false);
  root.removeComponent(&late, false);
  DeleteObject(lent);
  font->Release();
}

TEST_CASE("repaintAll invalidates the visible windows of the whole tree") {
  HostWindow host;
  Panel root;
  REQUIRE(root.create(host.hwnd()));
  root.setBounds(0, 0, 100, 100, true, true);
  Probe shown, hidden;
  root.add(&shown);
  root.add(&hidden);
  shown.setBounds(0, 0, 20, 20, true, true);
  hidden.setBounds(20, 0, 20, 20, true, true);
  hidden.show(false);
  pump(10);
  for (HWND h : {root.getHandle(), shown.getHandle(), hidden.getHandle()}) ValidateRect(h, nullptr);

  root.repaintAll();
  RECT r;
  CHECK(GetUpdateRect(root.getHandle(), &r, FALSE));
  CHECK(GetUpdateRect(shown.getHandle(), &r, FALSE));
  CHECK_FALSE(GetUpdateRect(hidden.getHandle(), &r, FALSE));
  root.removeComponent(&shown, false);
  root.removeComponent(&hidden, false);
}
