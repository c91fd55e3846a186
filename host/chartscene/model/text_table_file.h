#pragma once
// The text table file (BRInfo.csv) of the stand-in text component, UTF-8:
//
//   section,id,1033,1036
//   ObjInspector,1,Attributes,Attributs
//   ObjInspector,55,unknown,""        <- an empty quoted cell: an empty text
//   cPictureBox,-1,Close              <- a missing cell: no text in that language
//
// The first row names the columns: "section", "id", then one language identifier
// (decimal) per column. An empty unquoted cell counts as missing too. A later row with
// the same section and id replaces an earlier one.

#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace br::chartscene {

struct TextTableData {
  std::vector<long> languages;
  // (section, id) -> one cell per language; none where the cell is missing.
  std::map<std::pair<std::string, long>, std::vector<std::optional<std::string>>> texts;
};

// False with a message naming the line for a file that is not of this form.
bool ParseTextTable(const std::string& content, TextTableData& table, std::string& error);

// The text of (section, id) in a language; none when the table has no such row, no such
// language or a missing cell. Sections compare with letter case.
std::optional<std::string> FindText(const TextTableData& table, const std::string& section,
                                    long id, long language);

}  // namespace br::chartscene
