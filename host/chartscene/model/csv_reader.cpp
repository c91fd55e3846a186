#include "host/chartscene/model/csv_reader.h"

namespace br::chartscene {

std::vector<CsvRecord> ReadCsv(const std::string& text) {
  std::vector<CsvRecord> records;
  CsvRecord record;
  CsvCell cell;
  bool inQuotes = false;
  bool cellStarted = false;
  int line = 1;
  record.line = line;

  const auto endCell = [&] {
    record.cells.push_back(std::move(cell));
    cell = CsvCell();
    cellStarted = false;
  };
  const auto endRecord = [&] {
    // A line with nothing on it is no record; a line with one empty cell is.
    if (cellStarted || !record.cells.empty()) {
      endCell();
      records.push_back(std::move(record));
    }
    record = CsvRecord();
    record.line = line;
  };

  for (std::size_t i = 0; i < text.size(); ++i) {
    const char c = text[i];
    if (inQuotes) {
      if (c == '"') {
        if (i + 1 < text.size() && text[i + 1] == '"') {
          cell.text += '"';
          ++i;
        } else {
          inQuotes = false;
        }
      } else if (c == '\\' && i + 1 < text.size() && text[i + 1] == '"') {
        cell.text += '"';
        ++i;
      } else {
        if (c == '\n') ++line;
        cell.text += c;
      }
      continue;
    }
    switch (c) {
      case '"':
        inQuotes = true;
        cell.quoted = true;
        cellStarted = true;
        break;
      case ',':
        cellStarted = true;
        endCell();
        cellStarted = true;  // a comma always opens the next cell
        break;
      case '\r':
        break;
      case '\n':
        ++line;
        endRecord();
        break;
      default:
        cell.text += c;
        cellStarted = true;
        break;
    }
  }
  endRecord();
  return records;
}

}  // namespace br::chartscene
