#include "host/chartscene/model/text_table_file.h"

#include <cerrno>
#include <cstdlib>

#include "host/chartscene/model/csv_reader.h"

namespace br::chartscene {

namespace {

bool ParseLong(const std::string& text, long& value) {
  if (text.empty()) return false;
  errno = 0;
  char* end = nullptr;
  value = std::strtol(text.c_str(), &end, 10);
  // The whole cell: a zero byte inside it does not end the number.
  return errno == 0 && end == text.c_str() + text.size();
}

}  // namespace

bool ParseTextTable(const std::string& content, TextTableData& table, std::string& error) {
  table = TextTableData();
  // A UTF-8 byte-order mark is not part of the first cell.
  const std::string text = content.compare(0, 3, "\xEF\xBB\xBF") == 0 ? content.substr(3) : content;
  const std::vector<CsvRecord> records = ReadCsv(text);
  if (records.empty()) {
    error = "line 1: no header row";
    return false;
  }
  const CsvRow& header = records.front().cells;
  if (header.size() < 3 || header[0].text != "section" || header[1].text != "id") {
    error = "line 1: the header must be section,id,<language>,...";
    return false;
  }
  for (std::size_t i = 2; i < header.size(); ++i) {
    long language = 0;
    if (!ParseLong(header[i].text, language)) {
      error = "line 1: column " + std::to_string(i + 1) + " is not a language identifier";
      return false;
    }
    table.languages.push_back(language);
  }
  for (std::size_t r = 1; r < records.size(); ++r) {
    const CsvRecord& record = records[r];
    long id = 0;
    if (record.cells.size() < 2 || record.cells[0].text.empty() || !ParseLong(record.cells[1].text, id)) {
      error = "line " + std::to_string(record.line) + ": a row needs a section and a numeric id";
      return false;
    }
    std::vector<std::optional<std::string>> cells(table.languages.size());
    for (std::size_t i = 0; i < cells.size() && i + 2 < record.cells.size(); ++i) {
      const CsvCell& cell = record.cells[i + 2];
      if (cell.quoted || !cell.text.empty()) cells[i] = cell.text;
    }
    table.texts[{record.cells[0].text, id}] = std::move(cells);
  }
  return true;
}

std::optional<std::string> FindText(const TextTableData& table, const std::string& section,
                                    long id, long language) {
  const auto row = table.texts.find({section, id});
  if (row == table.texts.end()) return std::nullopt;
  for (std::size_t i = 0; i < table.languages.size(); ++i) {
    if (table.languages[i] == language) return row->second[i];
  }
  return std::nullopt;
}

}  // namespace br::chartscene
