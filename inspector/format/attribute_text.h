#pragma once
// How a formatter's attribute text becomes a row of an attribute panel: split into name
// and value, the value cleaned for display, magnetic variation written by us, and the
// order in which a chart object's attributes are shown. No Windows API: tested natively.
//
// Texts are 8-bit in the ANSI code page (the degree sign is 0xB0 there).

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace br::inspector {

struct AttributeText {
  std::string name;
  std::string value;
};

// Attribute codes with a rule of their own.
inline constexpr long kCodeObjectName = 116;        // OBJNAM: shown first
inline constexpr long kCodeInformation = 102;       // INFORM: second for property 500 = 184
inline constexpr long kCodeTidalStream = 159;       // a tidal stream table
inline constexpr long kCodeMagneticVariation = 176; // VALMAG
inline constexpr long kProperty500Informed = 184;

// The text split at its first '#' or '=': before it the name, after it the value.
// None when there is no separator or it is the last character.
std::optional<AttributeText> SplitAttributeText(std::string_view text);

// Every '|' and every "<br>" (any letter case) becomes a carriage return.
std::string CleanAttributeValue(std::string_view value);

// A magnetic variation in degrees with its hemisphere letter: "E" east (positive), "W"
// west (negative, shown without sign), a blank for zero. Whole values within the 32-bit
// range as "%d", others with two decimals. None for the no-value marker and for values
// that are not finite.
std::optional<std::string> MagneticVariationText(double degrees);

// An information text that holds "0x" is an internal reference, not for people.
bool IsHiddenInformation(long code, std::string_view value);

// Codes of a chart object's attributes in the order shown: 116 first; 102 next when
// property 500 was 184 (behind a 116, in front of everything else); the rest as listed.
std::vector<long> OrderChartAttributeCodes(const std::vector<long>& listed, bool informedObject);

}  // namespace br::inspector
