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

bool ViaDoodson(const std::string& name) {
  const auto match = MatchConstituentName(name);
  return match && match->via == ConstituentMatch::Via::DoodsonNumbers;
}

}  // namespace

TEST_CASE("usual names map to their rows, whatever the letter case") {
  CHECK(RowOf("Z0") == 0);
  CHECK(RowOf("Sa") == 1);
  CHECK(RowOf("SA") == 1);
  CHECK(RowOf("ssa") == 2);
  CHECK(RowOf("MSF") == 4);
  CHECK(RowOf("Mf") == 5);
  CHECK(RowOf("O1") == 8);
  CHECK(RowOf("k1") == 15);
  CHECK(RowOf("2N2") == 21);
  CHECK(RowOf("M2") == 29);
  CHECK(RowOf("S2") == 36);
  CHECK(RowOf("K2") == 38);
  CHECK(RowOf("MO3") == 40);
  CHECK(RowOf("M3") == 42);
  CHECK(RowOf("MK3") == 45);
  CHECK(RowOf("2MS6") == 67);
  CHECK(RowOf("2mk6") == 68);
  CHECK_FALSE(ViaDoodson("M2"));
  // Every row that has a usual name is found again by it.
  for (int row = 0; row < br::tides::kConstituentCount; ++row) {
    const std::string name(UsualConstituentName(row));
    if (!name.empty()) CHECK_MESSAGE(RowOf(name) == row, name);
  }
  CHECK(UsualConstituentName(20).empty());
  CHECK(UsualConstituentName(69).empty());
  CHECK(UsualConstituentName(-1).empty());
}

TEST_CASE("common spellings of the Greek-letter constituents") {
  CHECK(RowOf("RHO") == 7);
  CHECK(RowOf("RHO1") == 7);
  CHECK(RowOf("rho1") == 7);
  CHECK(RowOf("LAM2") == 32);
  CHECK(RowOf("LAMBDA2") == 32);
  CHECK(RowOf("LDA2") == 32);
  CHECK(RowOf("THE1") == 18);
  CHECK(RowOf("THETA1") == 18);
  CHECK(RowOf("NU2") == 26);
  CHECK(RowOf("MU2") == 22);
  CHECK(RowOf("TAU1") == 9);
  CHECK(RowOf("PHI1") == 17);
  CHECK(RowOf("\xCE\xBD" "2") == 26);  // ν2
  CHECK(RowOf("\xCF\x81" "1") == 7);   // ρ1
}

TEST_CASE("compound names get their Doodson numbers from their components") {
  const auto mks2 = DoodsonNumbersOfName("MKS2");  // M2 + K2 - S2
  REQUIRE(mks2);
  CHECK(mks2->multipliers == std::array<int, 6>{2, 0, 2, 0, 0, 0});
  CHECK(mks2->quarterTurns == 0);
  const auto twoMK3 = DoodsonNumbersOfName("2MK3");  // 2 M2 - K1
  REQUIRE(twoMK3);
  CHECK(twoMK3->multipliers == std::array<int, 6>{3, -1, 0, 0, 0, 0});
  CHECK(twoMK3->quarterTurns == -1);
  const auto op2 = DoodsonNumbersOfName("OP2");  // O1 + P1: two -90 degree phases
  REQUIRE(op2);
  CHECK(op2->multipliers == std::array<int, 6>{2, 0, -2, 0, 0, 0});
  CHECK(op2->quarterTurns == -2);
  const auto m8 = DoodsonNumbersOfName("M8");  // overtide: 4 M2
  REQUIRE(m8);
  CHECK(m8->multipliers == std::array<int, 6>{8, 0, 0, 0, 0, 0});
  const auto sk3 = DoodsonNumbersOfName("SK3");  // S2 + K1
  REQUIRE(sk3);
  CHECK(sk3->multipliers == std::array<int, 6>{3, 3, -2, 0, 0, 0});
  CHECK(sk3->quarterTurns == 1);
  // No sign pattern reaches the species, or letters that are no component.
  CHECK_FALSE(DoodsonNumbersOfName("3N2"));
  CHECK_FALSE(DoodsonNumbersOfName("OO1"));
  CHECK_FALSE(DoodsonNumbersOfName("M(KS)2"));
  CHECK_FALSE(DoodsonNumbersOfName("SA_KV"));
  CHECK_FALSE(DoodsonNumbersOfName("MSQM"));
  CHECK_FALSE(DoodsonNumbersOfName("M0"));
  CHECK_FALSE(DoodsonNumbersOfName("2"));
}

TEST_CASE("names whose Doodson numbers equal a row's map to that row") {
  CHECK(RowOf("2MK3") == 40);  // the MO3 row
  CHECK(ViaDoodson("2MK3"));
  CHECK(RowOf("OP2") == 27);
  CHECK(RowOf("MKS2") == 31);
  CHECK(RowOf("SO3") == 43);  // rows 43 and 44 are the same: the first
  CHECK(RowOf("SN4") == 54);
  CHECK(RowOf("MA2") == 28);
  CHECK(RowOf("MB2") == 30);
  CHECK(RowOf("NO3") == 39);
  CHECK(RowOf("MSN6") == 65);
  CHECK(RowOf("3MS4") == 48);
  CHECK(RowOf("2MK2") == 20);
  CHECK(RowOf("TK1") == 12);  // T2 - K1: the pi1 row
  CHECK(RowOf("MP1") == 9);   // M2 - P1: the tau1 row
  CHECK(ViaDoodson("MA2"));
}

TEST_CASE("names with no row are not matched") {
  for (const char* name : {"SA_KV", "S1_KV", "OQ2_KV", "OO1", "2Q1", "S4", "M8", "N4", "2SM2", "EP2", "SGM", "MSQM",
                           "MTM", "3N2", "3L2", "S3", "S6", "2MK5", "M(KS)2", "", "XYZ", "m2 ", "M2x"}) {
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
