#pragma once
// A light's chart abbreviation, as charts print it beside the light's star: for example
// "Fl(2)R.6s12m5M", "Iso.WRG.4s", "Q(6)+LFl.W.15s10m5M", "Oc(2)W.12s56m19M 219°-259°".
// Built from the light's raw attribute values. No Windows API: tested natively.
//
// Rules, in the order the parts are written:
//  1. "Dir" when the light's categories (CATLIT) hold 1, directional function.
//  2. The characteristic (LITCHR) by its chart abbreviation (F, Fl, LFl, Q, VQ, UQ, Iso,
//     Oc, IQ, IVQ, IUQ, Mo, FFl, Fl+LFl, Oc+Fl, FLFl, Al.Oc, Al.LFl, Al.Fl, Al, Al.FFl);
//     an unknown code writes nothing.
//  3. The signal group (SIGGRP) in brackets after the characteristic: "(2)", "(2+1)".
//     Each bracketed group of the value belongs to one part of a composite characteristic
//     ("(6)(1)" with Q+LFl gives "Q(6)+LFl"; a group of one flash is not written). An
//     empty group "()" and a group "1" are not written, but a Morse letter always is.
//  4. The colours (COLOUR) in list order, run together: W, B, R, G, Bu, Y, Gy, Br, Am,
//     Vi, Or, Mg, Pk; unknown codes are skipped.
//  5. The period (SIGPER) in seconds with its unit: "6s", "2.5s".
//     Parts 2 to 5 are joined by a full stop, except after a closing bracket.
//  6. The height (HEIGHT) in metres, "12m", then the nominal range (VALNMR) in sea miles,
//     "5M", written straight after.
//  7. A sector (SECTR1 and SECTR2, both given) as the two bearings from seaward, after a
//     blank: "050°-070.5°" (three digits, a decimal only when there is one; bearings
//     outside 0..360 wrap).
// Numbers keep at most one decimal (periods two); a missing value, the no-value marker,
// a value that is not finite, or a negative period, height or range leaves its part out.
// The degree sign is 0xB0 (ANSI code page).

#include <optional>
#include <string>
#include <vector>

namespace br::inspector {

// The attribute codes a light abbreviation reads.
inline constexpr long kCodeCategoryOfLight = 37;   // CATLIT
inline constexpr long kCodeColour = 75;            // COLOUR
inline constexpr long kCodeHeight = 95;            // HEIGHT
inline constexpr long kCodeLightCharacter = 107;   // LITCHR
inline constexpr long kCodeSectorOne = 136;        // SECTR1
inline constexpr long kCodeSectorTwo = 137;        // SECTR2
inline constexpr long kCodeSignalGroup = 141;      // SIGGRP
inline constexpr long kCodeSignalPeriod = 142;     // SIGPER
inline constexpr long kCodeNominalRange = 178;     // VALNMR

struct LightValues {
  std::optional<long> characteristic;  // LITCHR
  std::string signalGroup;             // SIGGRP
  std::vector<long> colours;           // COLOUR
  std::optional<double> period;        // SIGPER, seconds
  std::optional<double> height;        // HEIGHT, metres
  std::optional<double> range;         // VALNMR, sea miles
  std::optional<double> sectorOne;     // SECTR1, degrees
  std::optional<double> sectorTwo;     // SECTR2, degrees
  std::vector<long> categories;        // CATLIT
};

// The abbreviation; empty when none of its parts is known.
std::string LightAbbreviation(const LightValues& light);

// The chart abbreviation of a characteristic code; empty when unknown.
std::string LightCharacteristicText(long code);

// The bracketed groups of a signal group value, without their brackets: "(6)(1)" gives
// {"6", "1"}, "()" gives {""}. Text outside brackets and an unclosed group are ignored.
std::vector<std::string> SignalGroups(const std::string& value);

}  // namespace br::inspector
