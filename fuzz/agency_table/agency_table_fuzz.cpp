// The producing agency table of a chart installation, read from its bytes in either
// encoding.
//
// One input: u8 choice, then the file. Choice 0: the bytes as 8-bit text, and again as
// UTF-16 (each byte one unit, behind the mark), which must give the same rows. Choice 1:
// the bytes behind the UTF-16 mark as they are. Choice 2: the bytes as they are, read
// with a converter that stops at a zero unit, as some code page converters do. Checked
// beyond "no crash": no field holds a separator or a line end, there are never more rows
// than lines, a lookup gives the first row of its code and the name or the code in decimal.
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "frame/geo/agency_table.h"

using namespace br::geo;

namespace {

bool HasSeparator(const std::string& field) { return field.find_first_of(";|\r\n") != std::string::npos; }

std::size_t LineEnds(const unsigned char* data, std::size_t size) {
  std::size_t count = 0;
  for (std::size_t i = 0; i < size; ++i) count += data[i] == '\r' || data[i] == '\n';
  return count;
}

void CheckRows(const std::vector<AgencyRow>& rows, std::size_t lines) {
  FUZZ_CHECK(rows.size() <= lines);
  for (std::size_t i = 0; i < rows.size(); ++i) {
    const AgencyRow& row = rows[i];
    FUZZ_CHECK(!HasSeparator(row.abbreviation) && !HasSeparator(row.name));
    const AgencyRow* first = FindAgency(rows, row.code);
    FUZZ_CHECK(first != nullptr && first <= &row && first->code == row.code);
    FUZZ_CHECK(AgencyNameOrCode(rows, row.code) == first->name);
  }
  // A code no row has gives itself back.
  std::int32_t missing = INT32_MIN;
  while (FindAgency(rows, missing) != nullptr) ++missing;
  FUZZ_CHECK(AgencyNameOrCode(rows, missing) == std::to_string(missing));
}

bool SameRows(const std::vector<AgencyRow>& a, const std::vector<AgencyRow>& b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i].code != b[i].code || a[i].abbreviation != b[i].abbreviation || a[i].name != b[i].name) return false;
  }
  return true;
}

std::string StopAtZero(const char16_t* units, std::size_t count) {
  std::size_t end = 0;
  while (end < count && units[end] != 0) ++end;
  return Latin1FromUtf16(units, end);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const unsigned choice = data[0] % 3;
  const std::vector<unsigned char> file(data + 1, data + size);
  // The reader is handed the file's own block: nothing past its end may be read.
  const unsigned char* bytes = file.empty() ? nullptr : file.data();

  if (choice == 0) {
    const std::vector<AgencyRow> rows = ParseAgencyTable(bytes, file.size());
    CheckRows(rows, LineEnds(bytes, file.size()) + 1);
    const bool marked = file.size() >= 3 && file[0] == 0xFF && file[1] == 0xFE;
    if (!marked) {
      std::vector<unsigned char> wide{0xFF, 0xFE};
      for (unsigned char c : file) {
        wide.push_back(c);
        wide.push_back(0);
      }
      FUZZ_CHECK(SameRows(rows, ParseAgencyTable(wide.data(), wide.size())));
    }
  } else if (choice == 1) {
    std::vector<unsigned char> wide{0xFF, 0xFE};
    wide.insert(wide.end(), file.begin(), file.end());
    // An odd last byte is dropped, so only whole units count as line ends.
    std::size_t lines = 1;
    for (std::size_t i = 2; i + 1 < wide.size(); i += 2) {
      lines += wide[i + 1] == 0 && (wide[i] == '\r' || wide[i] == '\n');
    }
    const std::vector<AgencyRow> rows = ParseAgencyTable(wide.data(), wide.size());
    CheckRows(rows, lines);
    // The default converter keeps units below 256 and writes "?" for the others.
    for (const AgencyRow& row : rows) {
      FUZZ_CHECK(row.name.size() + row.abbreviation.size() <= wide.size() / 2);
    }
  } else {
    CheckRows(ParseAgencyTable(bytes, file.size(), StopAtZero), file.size() + 1);
  }
  return 0;
}
