#pragma once
// The producing agency table of the chart installation, loaded once from
// <KeyPath>SYSTEM\HTML\hosource.txt (KeyPath of HKLM SOFTWARE\Brine\Brdata\Enum, nothing put
// between; without it the relative path). File format: frame/geo/agency_table.h. A file that
// cannot be read leaves the table empty, so every lookup then answers "not found".
//
// Shared by every user of agency names (the legend, the inspector's HOCode2Name and its
// metadata panel). HOCode2Name's in/out contract is Lookup's:
//   found      S_OK,    *name = the name, *abbreviation (when not null) = the abbreviation;
//   not found  S_FALSE, *name = the code in decimal, *abbreviation left untouched.
// Either out pointer may be null and is then skipped; a BSTR handed out is the caller's.

#include <windows.h>
#include <oleauto.h>

#include <cstdint>
#include <string>
#include <vector>

#include "frame/geo/agency_table.h"

namespace br::geo {

class AgencyTable {
public:
  static constexpr const char* FILE_IN_FOLDER = "SYSTEM\\HTML\\hosource.txt";
  // Larger files are not tables; reading stops being worth it.
  static constexpr std::size_t kMaxFileBytes = 16u << 20;

  // KeyPath + FILE_IN_FOLDER, read now.
  static std::string DefaultPath();

  // Loads DefaultPath().
  AgencyTable();
  // Loads the file at path (ANSI code page).
  explicit AgencyTable(const std::string& path);

  bool Loaded() const { return loaded_; }
  std::size_t Size() const { return rows_.size(); }
  const std::vector<AgencyRow>& Rows() const { return rows_; }

  const AgencyRow* Find(std::int32_t code) const { return FindAgency(rows_, code); }
  std::string NameOrCode(std::int32_t code) const { return AgencyNameOrCode(rows_, code); }
  HRESULT Lookup(std::int32_t code, BSTR* name, BSTR* abbreviation) const;

  // UTF-16 units in the system's ANSI code page.
  static std::string AnsiFromUtf16(const char16_t* units, std::size_t count);

private:
  void Load(const std::string& path);

  std::vector<AgencyRow> rows_;
  bool loaded_ = false;
};

}  // namespace br::geo
