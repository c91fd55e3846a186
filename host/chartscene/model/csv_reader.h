#pragma once
// Comma-separated files as written in the wild: RFC-4180 quoting (a doubled quote inside a
// quoted cell is one quote; quoted cells hold commas and line breaks), a backslash before a
// quote inside a quoted cell also taken as one quote, CR LF or LF line ends. Each cell
// remembers whether it was quoted, so an empty quoted cell can differ from an empty one.

#include <string>
#include <vector>

namespace br::chartscene {

struct CsvCell {
  std::string text;
  bool quoted = false;
};

using CsvRow = std::vector<CsvCell>;

struct CsvRecord {
  int line = 0;  // the line the record starts on, from 1
  CsvRow cells;
};

// Every record of the text; blank lines give no record. A quote left open at the end
// closes there.
std::vector<CsvRecord> ReadCsv(const std::string& text);

}  // namespace br::chartscene
