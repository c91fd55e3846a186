// Labels, buttons and edits read through oleacc as a screen reader reads them; what
// is not self-drawn left to the platform; an object that outlives its widget.
#include <doctest/doctest.h>

#include <windows.h>
#include <objbase.h>

#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/widget_test_support.h"
#include "toolkit/access/ComponentAccessible.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"
#include "toolkit/widgets/cXEdit2.h"

using namespace toolkit;
using br::test::AccessibleReader;
using br::test::ChildId;

namespace {

// oleacc hands objects over through COM marshalling.
struct Apartment {
  Apartment() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
  ~Apartment() { CoUninitialize(); }
};

}  // namespace

TEST_CASE("labels, buttons and edits: role, name or value, and state as the widget shows them") {
  Apartment apartment;
  wtest::MountedPanel panel;
  Label label("High water 05:42");
  Button push("Calculate"), toggle("Feet"), radio("Metres");
  toggle.kind = Button::kToggle;
  radio.kind = Button::kRadio;
  cXEdit2 edit;
  for (cXComponent* c : std::initializer_list<cXComponent*>{&label, &push, &toggle, &radio, &edit}) panel.add(c);
  edit.setText("Brest");

  AccessibleReader l(label.getHandle()), p(push.getHandle()), t(toggle.getHandle()), r(radio.getHandle()),
      e(edit.getHandle());
  REQUIRE(l.get());
  CHECK(l.Role() == ROLE_SYSTEM_STATICTEXT);
  CHECK(l.Name() == L"High water 05:42");
  CHECK(l.State() == STATE_SYSTEM_READONLY);
  CHECK(l.ChildCount() == 0);
  label.setText("High water 06:10");  // read when asked, never cached
  CHECK(l.Name() == L"High water 06:10");

  CHECK(p.Role() == ROLE_SYSTEM_PUSHBUTTON);
  CHECK(p.Name() == L"Calculate");
  CHECK(p.State() == STATE_SYSTEM_FOCUSABLE);
  SetFocus(push.getHandle());
  CHECK(p.State() == (STATE_SYSTEM_FOCUSABLE | STATE_SYSTEM_FOCUSED));
  CHECK(p.Focus() == CHILDID_SELF);
  CHECK(l.Focus() == -1);
  push.setEnabled(false);
  CHECK((p.State() & STATE_SYSTEM_UNAVAILABLE) != 0);
  push.show(false);
  CHECK((p.State() & STATE_SYSTEM_INVISIBLE) != 0);

  CHECK(t.Role() == ROLE_SYSTEM_CHECKBUTTON);
  CHECK(r.Role() == ROLE_SYSTEM_RADIOBUTTON);
  CHECK((t.State() & STATE_SYSTEM_CHECKED) == 0);
  toggle.setChecked(true);
  CHECK((t.State() & STATE_SYSTEM_CHECKED) != 0);

  CHECK(e.Role() == ROLE_SYSTEM_TEXT);
  CHECK(e.Value() == L"Brest");
  BSTR name = nullptr;
  CHECK(e.get()->get_accName(ChildId(CHILDID_SELF), &name) == S_FALSE);  // an edit is named by its label
  CHECK(name == nullptr);

  // The same object on every request, for as long as the window lives.
  AccessibleReader again(label.getHandle());
  CHECK(again.get() == l.get());
}

TEST_CASE("containers and native controls are left to the platform's standard objects") {
  Apartment apartment;
  wtest::MountedPanel panel;
  Label label("Tide");
  panel.add(&label);
  // A container's client area and a widget's window are not the toolkit's to answer.
  CHECK(SendMessageA(panel.getHandle(), WM_GETOBJECT, 0, static_cast<LPARAM>(OBJID_CLIENT)) == 0);
  CHECK(SendMessageA(label.getHandle(), WM_GETOBJECT, 0, static_cast<LPARAM>(OBJID_WINDOW)) == 0);
}

TEST_CASE("bad requests are refused; an object that outlives its widget answers that it is gone") {
  Apartment apartment;
  wtest::MountedPanel panel;
  auto label = std::make_unique<Label>("Ebb");
  panel.add(label.get());
  auto reader = std::make_unique<AccessibleReader>(label->getHandle());
  IAccessible* object = reader->get();
  REQUIRE(object);
  CHECK(ComponentAccessible::liveObjects() == 1);

  BSTR text = nullptr;
  VARIANT out;
  VariantInit(&out);
  CHECK(object->get_accName(ChildId(1), &text) == E_INVALIDARG);  // a label has no children
  CHECK(object->get_accName(ChildId(-1), &text) == E_INVALIDARG);
  VARIANT wrongType;
  wrongType.vt = VT_BSTR;
  wrongType.bstrVal = nullptr;
  CHECK(object->get_accRole(wrongType, &out) == E_INVALIDARG);
  CHECK(object->get_accName(ChildId(CHILDID_SELF), nullptr) == E_POINTER);

  // Where the label is on the screen: its window rectangle.
  label->setBounds(10, 20, 120, 30, true, true);
  LONG x = 0, y = 0, w = 0, h = 0;
  CHECK(object->accLocation(&x, &y, &w, &h, ChildId(CHILDID_SELF)) == S_OK);
  const RECT shown = label->getWindowRect();
  CHECK(wtest::str(wtest::xywh(x, y, w, h)) == wtest::str(shown));
  CHECK(object->accHitTest(shown.left + 5, shown.top + 5, &out) == S_OK);
  CHECK(out.vt == VT_I4);
  CHECK(out.lVal == CHILDID_SELF);
  CHECK(object->accHitTest(shown.right + 50, shown.top, &out) == S_FALSE);
  CHECK(out.vt == VT_EMPTY);

  label.reset();  // the widget goes while a client still holds its object
  CHECK(object->get_accName(ChildId(CHILDID_SELF), &text) == CO_E_OBJNOTCONNECTED);
  CHECK(object->get_accRole(ChildId(CHILDID_SELF), &out) == CO_E_OBJNOTCONNECTED);
  CHECK(object->accHitTest(0, 0, &out) == CO_E_OBJNOTCONNECTED);
  LONG count = 5;
  CHECK(object->get_accChildCount(&count) == CO_E_OBJNOTCONNECTED);
  CHECK(count == 0);
  CHECK(ComponentAccessible::liveObjects() == 1);  // keeps the module loaded until released
  reader.reset();
  CHECK(ComponentAccessible::liveObjects() == 0);
}
