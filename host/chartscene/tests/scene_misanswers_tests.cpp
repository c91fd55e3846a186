// The stand-in's wrong answers: one kind per operation, counted only when given, removed one
// by one or all together with the faults.
#include "host/chartscene/model/scene_counters.h"
#include "host/chartscene/model/scene_misanswers.h"

#include <doctest/doctest.h>

using namespace br::chartscene;

TEST_CASE("misanswers: the set kind only, counted when given, cleared with the faults") {
  ClearFaults();
  const long given = CounterValue("misanswers.given");
  CHECK_FALSE(Misanswers("IPresParams.GetParam", Misanswer::WrongType));

  SetMisanswer("IPresParams.GetParam", Misanswer::WrongType);
  SetMisanswer("IGeoSelectionEnum.Next", Misanswer::Endless);
  CHECK(Misanswers("IPresParams.GetParam", Misanswer::WrongType));
  CHECK_FALSE(Misanswers("IPresParams.GetParam", Misanswer::NullOut));      // another kind
  CHECK_FALSE(Misanswers("IPresParams.GetParamX", Misanswer::WrongType));   // names compare whole
  CHECK_FALSE(Misanswers("IColorMap.GetPaletteIndex", Misanswer::WrongType));
  CHECK(Misanswers("IGeoSelectionEnum.Next", Misanswer::Endless));
  CHECK(CounterValue("misanswers.given") == given + 2);

  // A second kind replaces the first; None removes one operation's.
  SetMisanswer("IPresParams.GetParam", Misanswer::HugeText);
  CHECK_FALSE(Misanswers("IPresParams.GetParam", Misanswer::WrongType));
  CHECK(Misanswers("IPresParams.GetParam", Misanswer::HugeText));
  SetMisanswer("IPresParams.GetParam", Misanswer::None);
  CHECK_FALSE(Misanswers("IPresParams.GetParam", Misanswer::HugeText));
  CHECK(Misanswers("IGeoSelectionEnum.Next", Misanswer::Endless));

  // Failing results and wrong answers go together.
  SetFault("IGeoDataSet.GetHeader", 0x80004005u);
  ClearFaults();
  CHECK_FALSE(Misanswers("IGeoSelectionEnum.Next", Misanswer::Endless));
  CHECK_FALSE(CallAndFault("IGeoDataSet.GetHeader").has_value());
  CHECK(CounterValue("misanswers.given") == given + 4);
}
