// The example of docs/toolkit.md, built and clicked.
#include <doctest/doctest.h>

#include "tests/wine/common/toolkit_test_support.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"

using namespace toolkit;

namespace {

// A question over a centred row of two buttons.
class AskPanel : public Panel {
public:
  AskPanel() : Panel(std::make_unique<BorderLayout>(0, 4)) {
    insertNamed("Center", &question_, "question");
    insertNamed("South", &buttons_, "buttons");
    buttons_.add(&yes_, "YES");
    buttons_.add(&no_, "NO");
  }

  int answer = 0;

  // Button clicks arrive as action events (id 0) bubbling up from the buttons.
  int onAction(ToolkitEvent& event) override {
    if (event.source == &yes_) answer = IDYES;
    else if (event.source == &no_) answer = IDNO;
    else return 0;  // not ours: let it go on up
    return 1;
  }

  Label question_{"Keep the new chart?", Label::kCenter};
  Panel buttons_{std::make_unique<FlowLayout>()};  // centred rows, 3-pixel gaps
  Button yes_{"Yes"};
  Button no_{"No"};
};

void click(cXComponent& c) {
  SendMessageA(c.getHandle(), WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(2, 2));
  SendMessageA(c.getHandle(), WM_LBUTTONUP, 0, MAKELPARAM(2, 2));
}

}  // namespace

TEST_CASE("the documented AskPanel lays out its tree and hears its buttons") {
  tktest::HostWindow host;
  AskPanel ask;
  REQUIRE(ask.create(host.hwnd()));
  ask.setBounds(0, 0, 300, 120, true, true);
  ask.doLayout();

  // The buttons' row sits at the bottom, full width; the question fills the rest.
  RECT row = tktest::placed(ask.buttons_);
  RECT question = tktest::placed(ask.question_);
  CHECK(row.bottom == 120);
  CHECK(row.right - row.left == 300);
  CHECK(question.top == 4);  // the gap of the empty North region still counts
  CHECK(question.bottom == row.top - 4);
  // Centred row of cells as wide as the wider button, each button at its own width.
  const SIZE yesPref = ask.yes_.getPreferredSize(), noPref = ask.no_.getPreferredSize();
  const int cell = yesPref.cx > noPref.cx ? yesPref.cx : noPref.cx;
  const int left = (300 - 2 * (3 + cell)) / 2;
  RECT yes = tktest::placed(ask.yes_);
  RECT no = tktest::placed(ask.no_);
  CHECK(yesPref.cx > 0);
  CHECK(yes.left == left);
  CHECK(yes.right - yes.left == yesPref.cx);
  CHECK(no.left == left + 3 + yesPref.cx);

  click(ask.no_);
  CHECK(ask.answer == IDNO);
  click(ask.yes_);
  CHECK(ask.answer == IDYES);
}
