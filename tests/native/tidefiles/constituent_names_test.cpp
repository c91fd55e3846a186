// Constituent names to table rows: usual names, spellings, equal Doodson numbers.
#include <doctest/doctest.h>

#include <string>

#include "tides/engine/tide_engine.h"
#include "tools/tidefiles/constituent_names.h"

namespace {

using br::tidefiles::ConstituentMatch;
using br::tidefiles::DoodsonNumbers;
using br::tidefiles::DoodsonNumbersOfName;
using br::tidefiles::MatchConstituentName;
using br::tidefiles::UsualConstituentName;

int RowOf(const std::string& name) {
  const auto match = MatchConstituentName(name);
  return match ? match->row : -1;
}

void CheckRows(std::initializer_list<std::pair<const char*, int>> rows) {
  for (const auto& [name, row] : rows) CHECK_MESSAGE(RowOf(name) == row, name);
}

bool ViaDoodson(const std::string& name) {
  const auto match = MatchConstituentName(name);
  return match && match->via == ConstituentMatch::Via::DoodsonNumbers;
}

}  // namespace

TEST_CASE("usual names map to their rows, whatever the letter case") {
  CheckRows({{"Sa", 1}, {"SA", 1}, {"ssa", 2}, {"2mk6", 68}});
  CHECK_FALSE(ViaDoodson("M2"));
  // Every row that has a usual name is found again by it.
  for (int row = 0; row < br::tides::kConstituentCount; ++row) {
    const std::string name(UsualConstituentName(row));
    if (!name.empty()) CHECK_MESSAGE(RowOf(name) == row, name);
  }
  for (int row : {20, 69, -1}) CHECK(UsualConstituentName(row).empty());
}

TEST_CASE("common spellings of the Greek-letter constituents") {
  CheckRows({{"RHO", 7}, {"rho1", 7}, {"LAMBDA2", 32}, {"LDA2", 32}, {"\xCE\xBD" "2", 26}});  // ν2
}

TEST_CASE("compound names get their Doodson numbers from their components") {
  // MKS2 = M2 + K2 - S2, 2MK3 = 2 M2 - K1, OP2 = O1 + P1 (two -90 degree phases), M8 = 4 M2, SK3 = S2 + K1.
  const DoodsonNumbers expected[] = {{{2, 0, 2, 0, 0, 0}, 0}, {{3, -1, 0, 0, 0, 0}, -1}, {{2, 0, -2, 0, 0, 0}, -2},
                                     {{8, 0, 0, 0, 0, 0}, 0}, {{3, 3, -2, 0, 0, 0}, 1}};
  const char* names[] = {"MKS2", "2MK3", "OP2", "M8", "SK3"};
  for (int i = 0; i < 5; ++i) {
    CAPTURE(names[i]);
    const auto numbers = DoodsonNumbersOfName(names[i]);
    REQUIRE(numbers);
    CHECK(numbers->multipliers == expected[i].multipliers);
    CHECK(numbers->quarterTurns == expected[i].quarterTurns);
  }
  // No sign pattern reaches the species, or letters that are no component.
  for (const char* name : {"3N2", "OO1", "M(KS)2", "SA_KV", "MSQM", "M0", "2"}) CHECK_FALSE(DoodsonNumbersOfName(name));
}

TEST_CASE("names whose Doodson numbers equal a row's map to that row") {
  // 2MK3 in the MO3 row; SO3 in the first of the equal rows 43 and 44; TK1 = T2 - K1 (pi1); MP1 = M2 - P1 (tau1).
  CheckRows({{"2MK3", 40}, {"OP2", 27}, {"SO3", 43}, {"MA2", 28}, {"TK1", 12}, {"MP1", 9}});
  CHECK((ViaDoodson("2MK3") && ViaDoodson("MA2")));
}

TEST_CASE("names with no row are not matched") {
  for (const char* name : {"SA_KV", "OO1", "M8", "3N2", "M(KS)2", "", "m2 ", "M2x"}) {
    CHECK_MESSAGE(RowOf(name) == -1, name);
  }
  // Same multipliers as row 66 but half a turn of phase apart (L2 carries 180 degrees).
  CHECK(RowOf("2ML6") == -1);
  // Same multipliers as row 27 (OP2's) with phase 0.
  CHECK(RowOf("MSK2") == -1);
}

TEST_CASE("Doodson comparison takes the fixed phase modulo a full turn") {
  DoodsonNumbers a{{2, 0, -2, 0, 0, 0}, -2};
  DoodsonNumbers b{{2, 0, -2, 0, 0, 0}, 2};
  DoodsonNumbers c{{2, 0, -2, 0, 0, 0}, 0};
  CHECK(a.SameConstituentAs(b));
  CHECK_FALSE(a.SameConstituentAs(c));
}
