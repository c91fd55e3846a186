#include "host/chartscene/model/S57Catalogue.h"

#include <cctype>
#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <sstream>

#include "host/chartscene/model/cp1252_text.h"
#include "host/chartscene/model/csv_reader.h"

namespace br::chartscene {

namespace {

bool Number(const std::string& text, long& value) {
  if (text.empty()) return false;
  errno = 0;
  char* end = nullptr;
  value = std::strtol(text.c_str(), &end, 10);
  return errno == 0 && end != nullptr && *end == '\0';
}

// Six letters, digits or underscores (S-57 and the inland additions).
bool IsAcronym(const std::string& text) {
  if (text.size() != 6) return false;
  for (char c : text) {
    if (!(std::isalnum(static_cast<unsigned char>(c)) || c == '_' || c == '$')) return false;
  }
  return true;
}

bool IsAttributeType(const std::string& text) {
  return text.size() == 1 && std::string("ELFIAS").find(text[0]) != std::string::npos;
}

bool ReadFile(const std::string& path, std::string& content) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  std::ostringstream text;
  text << in.rdbuf();
  content = text.str();
  return true;
}

}  // namespace

bool S57Catalogue::Load(const std::string& classes, const std::string& attributes,
                        const std::string& enumerations, std::string& error) {
  // "Code","ObjectClass","Acronym",...
  for (const CsvRecord& record : ReadCsv(classes)) {
    long code = 0;
    if (record.cells.size() < 3 || !Number(record.cells[0].text, code) || code <= 0 ||
        !IsAcronym(record.cells[2].text)) {
      continue;
    }
    AddClass({code, record.cells[2].text, Cp1252FromMixed(record.cells[1].text), 0});
  }
  // "Code","Attribute","Acronym","Attributetype","Class"
  for (const CsvRecord& record : ReadCsv(attributes)) {
    long code = 0;
    if (record.cells.size() < 4 || !Number(record.cells[0].text, code) || code <= 0 ||
        !IsAcronym(record.cells[2].text) || !IsAttributeType(record.cells[3].text)) {
      continue;
    }
    AddAttribute({code, record.cells[2].text, Cp1252FromMixed(record.cells[1].text), record.cells[3].text[0], 0});
  }
  // "Code","ID","Meaning"
  for (const CsvRecord& record : ReadCsv(enumerations)) {
    long attribute = 0, value = 0;
    if (record.cells.size() < 3 || !Number(record.cells[0].text, attribute) || !Number(record.cells[1].text, value)) {
      continue;
    }
    AddEnumText(attribute, value, Cp1252FromMixed(record.cells[2].text));
  }
  if (classes_.empty() || attributes_.empty() || enums_.empty()) {
    error = "the S-57 catalogue files hold no usable rows";
    return false;
  }
  return true;
}

bool S57Catalogue::LoadFolder(const std::string& folder, std::string& error) {
  std::string classes, attributes, enumerations;
  const std::string base = folder.empty() || folder.back() == '/' || folder.back() == '\\' ? folder : folder + "/";
  for (const auto& [name, content] : {std::pair<const char*, std::string*>{"s57objectclasses.csv", &classes},
                                      {"s57attributes.csv", &attributes},
                                      {"s57expectedinput.csv", &enumerations}}) {
    if (!ReadFile(base + name, *content)) {
      error = "cannot read " + base + name;
      return false;
    }
  }
  return Load(classes, attributes, enumerations, error);
}

void S57Catalogue::AddClass(const CatalogueClass& entry) {
  const auto old = classes_.find(entry.code);
  if (old != classes_.end()) classAcronyms_.erase(old->second.acronym);
  classes_[entry.code] = entry;
  classAcronyms_[entry.acronym] = entry.code;
}

void S57Catalogue::AddAttribute(const CatalogueAttribute& entry) {
  const auto old = attributes_.find(entry.code);
  if (old != attributes_.end()) attributeAcronyms_.erase(old->second.acronym);
  attributes_[entry.code] = entry;
  attributeAcronyms_[entry.acronym] = entry.code;
}

void S57Catalogue::AddEnumText(long attribute, long value, const std::string& text) {
  enums_[{attribute, value}] = text;
}

const CatalogueClass* S57Catalogue::ClassByCode(long code) const {
  const auto it = classes_.find(code);
  return it == classes_.end() ? nullptr : &it->second;
}

const CatalogueClass* S57Catalogue::ClassByAcronym(const std::string& acronym) const {
  const auto it = classAcronyms_.find(acronym);
  return it == classAcronyms_.end() ? nullptr : ClassByCode(it->second);
}

const CatalogueAttribute* S57Catalogue::AttributeByCode(long code) const {
  const auto it = attributes_.find(code);
  return it == attributes_.end() ? nullptr : &it->second;
}

const CatalogueAttribute* S57Catalogue::AttributeByAcronym(const std::string& acronym) const {
  const auto it = attributeAcronyms_.find(acronym);
  return it == attributeAcronyms_.end() ? nullptr : AttributeByCode(it->second);
}

const std::string* S57Catalogue::EnumText(long attribute, long value) const {
  const auto it = enums_.find({attribute, value});
  return it == enums_.end() ? nullptr : &it->second;
}

CatalogueClass* S57Catalogue::MutableClass(long code) {
  const auto it = classes_.find(code);
  return it == classes_.end() ? nullptr : &it->second;
}

CatalogueAttribute* S57Catalogue::MutableAttribute(long code) {
  const auto it = attributes_.find(code);
  return it == attributes_.end() ? nullptr : &it->second;
}

}  // namespace br::chartscene
