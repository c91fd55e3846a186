#pragma once
// The producing agency table of a chart installation ("SYSTEM\HTML\hosource.txt" below the
// chart database folder) read from its bytes. One row per line, in file order:
//
//   code;abbreviation;name          (either ";" or "|" parts the fields)
//
// - Text: UTF-16 little-endian when the data is at least 3 bytes long and starts with the
//   mark FF FE (the mark is skipped; an odd last byte is dropped); otherwise 8-bit text in
//   the system code page, kept as it is.
// - Lines end at every CR and every LF, so CR LF, LF and CR files read alike.
// - Empty fields count: "550;;Office" has an empty abbreviation and the name "Office", so
//   a missing abbreviation never moves the name into its place.
// - A line needs at least three fields and a first field that is a decimal number
//   (an optional sign, digits, blanks around them allowed, within 32 bits); any other line
//   (a heading, a blank line, a short line) is skipped. Fields past the third are ignored.
// - Lookups take the first row of a code: a later duplicate never wins.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

namespace br::geo {

struct AgencyRow {
  std::int32_t code = 0;
  std::string abbreviation;
  std::string name;
};

// Turns UTF-16 units into the 8-bit text the library works in. The loader gives the
// system code page's converter; the default keeps units below 256 and writes "?" for others.
using Utf16ToText = std::function<std::string(const char16_t* units, std::size_t count)>;

std::string Latin1FromUtf16(const char16_t* units, std::size_t count);

std::vector<AgencyRow> ParseAgencyTable(const unsigned char* data, std::size_t size,
                                        const Utf16ToText& toText = Latin1FromUtf16);

// The first row of the code, null when there is none.
const AgencyRow* FindAgency(const std::vector<AgencyRow>& rows, std::int32_t code);

// The name of the code's row, else the code in decimal (metadata rows and the legend).
std::string AgencyNameOrCode(const std::vector<AgencyRow>& rows, std::int32_t code);

}  // namespace br::geo
