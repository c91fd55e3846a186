#include "frame/geo/agency_table.h"

#include <cerrno>
#include <cstdlib>
#include <string_view>

namespace br::geo {
namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t'; }

// A decimal 32-bit number with blanks around it; false for anything else.
bool ParseCode(std::string_view field, std::int32_t& code) {
  while (!field.empty() && IsBlank(field.front())) field.remove_prefix(1);
  while (!field.empty() && IsBlank(field.back())) field.remove_suffix(1);
  if (field.empty() || field.size() > 16) return false;
  const std::string text(field);
  char* end = nullptr;
  errno = 0;
  const long long value = std::strtoll(text.c_str(), &end, 10);
  if (errno != 0 || end != text.c_str() + text.size()) return false;
  if (value < INT32_MIN || value > INT32_MAX) return false;
  // strtoll takes leading blanks and a "+"; the trimmed text must start with a sign or digit.
  const char first = text.front();
  if (first != '-' && first != '+' && (first < '0' || first > '9')) return false;
  code = static_cast<std::int32_t>(value);
  return true;
}

void AddLine(std::string_view line, std::vector<AgencyRow>& rows) {
  std::string_view fields[3];
  std::size_t count = 0;
  std::size_t start = 0;
  for (std::size_t i = 0; i <= line.size() && count < 3; ++i) {
    if (i == line.size() || line[i] == ';' || line[i] == '|') {
      fields[count++] = line.substr(start, i - start);
      start = i + 1;
    }
  }
  if (count < 3) return;
  AgencyRow row;
  if (!ParseCode(fields[0], row.code)) return;
  row.abbreviation.assign(fields[1]);
  row.name.assign(fields[2]);
  rows.push_back(std::move(row));
}

}  // namespace

std::string Latin1FromUtf16(const char16_t* units, std::size_t count) {
  std::string text;
  text.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    text.push_back(units[i] < 0x100 ? static_cast<char>(units[i]) : '?');
  }
  return text;
}

std::vector<AgencyRow> ParseAgencyTable(const unsigned char* data, std::size_t size,
                                        const Utf16ToText& toText) {
  std::vector<AgencyRow> rows;
  if (!data || size == 0) return rows;
  std::string text;
  if (size >= 3 && data[0] == 0xFF && data[1] == 0xFE) {
    std::u16string units;
    units.reserve((size - 2) / 2);
    for (std::size_t i = 2; i + 1 < size; i += 2) {
      units.push_back(static_cast<char16_t>(data[i] | (data[i + 1] << 8)));
    }
    // Converted line by line: a converter that stops at a zero unit loses one line only.
    std::size_t start = 0;
    for (std::size_t i = 0; i <= units.size(); ++i) {
      if (i == units.size() || units[i] == u'\r' || units[i] == u'\n') {
        if (i > start) {
          const std::string line = toText ? toText(units.data() + start, i - start)
                                          : Latin1FromUtf16(units.data() + start, i - start);
          AddLine(line, rows);
        }
        start = i + 1;
      }
    }
    return rows;
  }
  const std::string_view all(reinterpret_cast<const char*>(data), size);
  std::size_t start = 0;
  for (std::size_t i = 0; i <= all.size(); ++i) {
    if (i == all.size() || all[i] == '\r' || all[i] == '\n') {
      if (i > start) AddLine(all.substr(start, i - start), rows);
      start = i + 1;
    }
  }
  return rows;
}

const AgencyRow* FindAgency(const std::vector<AgencyRow>& rows, std::int32_t code) {
  for (const AgencyRow& row : rows) {
    if (row.code == code) return &row;
  }
  return nullptr;
}

std::string AgencyNameOrCode(const std::vector<AgencyRow>& rows, std::int32_t code) {
  const AgencyRow* row = FindAgency(rows, code);
  return row ? row->name : std::to_string(code);
}

}  // namespace br::geo
