// The text table file (BRInfo.csv) that the stand-in's text component reads, and the CSV
// reader under it.
//
// One input: the file. Checked beyond "no crash": records start on increasing lines within
// the text; a refused file names its line; a read table has one cell per language in every
// row, a lookup gives the cell of the first column of that language; and a table written
// back (every cell quoted, missing cells left empty) reads as the same table.
#include <cstddef>
#include <cstdint>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "host/chartscene/model/csv_reader.h"
#include "host/chartscene/model/text_table_file.h"

using namespace br::chartscene;

namespace {

std::string Quoted(const std::string& text) {
  std::string out = "\"";
  for (char c : text) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + '"';
}

// A backslash before a quote inside a quoted cell reads as a quote: such texts cannot be
// written back unchanged.
bool Writable(const TextTableData& table) {
  for (const auto& [key, cells] : table.texts) {
    if (key.first.find('\\') != std::string::npos) return false;
    for (const auto& cell : cells) {
      if (cell && cell->find('\\') != std::string::npos) return false;
    }
  }
  return true;
}

std::string Write(const TextTableData& table) {
  std::string out = "section,id";
  for (long language : table.languages) out += "," + std::to_string(language);
  out += "\r\n";
  for (const auto& [key, cells] : table.texts) {
    out += Quoted(key.first) + "," + std::to_string(key.second);
    for (const auto& cell : cells) out += "," + (cell ? Quoted(*cell) : std::string());
    out += "\r\n";
  }
  return out;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string content(reinterpret_cast<const char*>(data), size);

  std::size_t lineEnds = 0;
  for (char c : content) lineEnds += c == '\n';
  int previous = 0;
  for (const CsvRecord& record : ReadCsv(content)) {
    FUZZ_CHECK(record.line > previous && static_cast<std::size_t>(record.line) <= lineEnds + 1);
    FUZZ_CHECK(!record.cells.empty());
    previous = record.line;
  }

  TextTableData table;
  std::string error;
  if (!ParseTextTable(content, table, error)) {
    FUZZ_CHECK(error.compare(0, 5, "line ") == 0);
    return 0;
  }
  FUZZ_CHECK(!table.languages.empty());
  // Language and id cells are whole numbers: none holds a zero byte.
  const std::vector<CsvRecord> records = ReadCsv(content.compare(0, 3, "\xEF\xBB\xBF") == 0 ? content.substr(3) : content);
  for (std::size_t r = 0; r < records.size(); ++r) {
    const CsvRow& cells = records[r].cells;
    for (std::size_t c = r == 0 ? 2 : 1; c < (r == 0 ? cells.size() : 2); ++c) {
      FUZZ_CHECK(cells[c].text.find('\0') == std::string::npos);
    }
  }
  for (const auto& [key, cells] : table.texts) {
    FUZZ_CHECK(!key.first.empty());
    FUZZ_CHECK(cells.size() == table.languages.size());
    for (std::size_t i = 0; i < table.languages.size(); ++i) {
      std::size_t first = 0;
      while (table.languages[first] != table.languages[i]) ++first;
      FUZZ_CHECK(FindText(table, key.first, key.second, table.languages[i]) == cells[first]);
    }
  }

  if (!Writable(table)) return 0;
  TextTableData again;
  FUZZ_CHECK(ParseTextTable(Write(table), again, error));
  FUZZ_CHECK(again.languages == table.languages);
  FUZZ_CHECK(again.texts == table.texts);
  return 0;
}
