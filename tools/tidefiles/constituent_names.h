// Constituent names and the rows of the engine's constituent table.
//
// A name maps to a row by the row's usual name or one of its common spellings ("M2",
// "rho1" or "RHO", "lambda2" or "LAM2", ...; letter case ignored), else by Doodson
// numbers: a named constituent whose multipliers of tau, s, h, p, N, p1 and whose fixed
// phase (in quarter turns, modulo a full turn) equal a row's maps to that row. The
// numbers of compound names (2MK3, OP2, MKS2, SO3, SN4, ...) come from their components
// with the usual sign convention; a few non-compound names (MA2, MB2) are listed.
#pragma once

#include <array>
#include <optional>
#include <string_view>

namespace br::tidefiles {

struct DoodsonNumbers {
  std::array<int, 6> multipliers{};  // tau, s, h, p, N, p1
  int quarterTurns = 0;              // fixed phase, multiples of 90 degrees

  bool SameConstituentAs(const DoodsonNumbers& other) const;
};

struct ConstituentMatch {
  enum class Via { UsualName, DoodsonNumbers };
  int row = 0;
  Via via = Via::UsualName;
};

// The table row that name stands for, or nothing when no row fits.
std::optional<ConstituentMatch> MatchConstituentName(std::string_view name);

// The usual name of a row ("" for rows that have none, and outside 0..68).
std::string_view UsualConstituentName(int row);

// Doodson numbers of a row of the engine's table (row in 0..68).
DoodsonNumbers RowDoodsonNumbers(int row);

// Doodson numbers of a name: a listed named constituent or a compound such as "2MK3"
// (components M, S, N, K, O, P, Q, L, J, T, R with multipliers, then the species).
std::optional<DoodsonNumbers> DoodsonNumbersOfName(std::string_view name);

}  // namespace br::tidefiles
