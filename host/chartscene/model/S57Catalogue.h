#pragma once
// The attribute catalogue of the stand-in host: S-57 object classes, attributes and
// enumerated values with their codes, acronyms and texts, read from gdal-data's
// s57objectclasses.csv, s57attributes.csv and s57expectedinput.csv, plus what a scene
// adds (its own classes and attributes, hidden classes, unprintable attributes).
// Texts are kept in code page 1252; acronyms compare with letter case ("VERDAT" 185,
// "verdat" 17005). Rows that do not fit the columns (comments, shifted cells) are skipped.

#include <map>
#include <string>

namespace br::chartscene {

struct CatalogueClass {
  long code = 0;
  std::string acronym;
  std::string name;
  unsigned long flags = 0;  // bit 15: not shown
};

// Attribute types: the S-57 letters E (enumerated), L (list), F (float), I (integer),
// A (coded string), S (free text), and the host's U (unsigned 16-bit) and R (4-byte float).
struct CatalogueAttribute {
  long code = 0;
  std::string acronym;
  std::string name;
  char type = 'S';
  unsigned long flags = 0;  // bit 15: not printed
};

inline constexpr unsigned long kCatalogueHidden = 0x8000;

class S57Catalogue {
public:
  // The three CSV texts; false with a message when a file holds no usable row.
  bool Load(const std::string& classes, const std::string& attributes, const std::string& enumerations,
            std::string& error);
  // The same from a folder holding the three files.
  bool LoadFolder(const std::string& folder, std::string& error);

  // A scene's own entries replace the catalogue's entries of the same code.
  void AddClass(const CatalogueClass& entry);
  void AddAttribute(const CatalogueAttribute& entry);
  void AddEnumText(long attribute, long value, const std::string& text);

  const CatalogueClass* ClassByCode(long code) const;
  const CatalogueClass* ClassByAcronym(const std::string& acronym) const;
  const CatalogueAttribute* AttributeByCode(long code) const;
  const CatalogueAttribute* AttributeByAcronym(const std::string& acronym) const;
  const std::string* EnumText(long attribute, long value) const;
  CatalogueClass* MutableClass(long code);
  CatalogueAttribute* MutableAttribute(long code);

  std::size_t ClassCount() const { return classes_.size(); }
  std::size_t AttributeCount() const { return attributes_.size(); }
  std::size_t EnumCount() const { return enums_.size(); }

private:
  std::map<long, CatalogueClass> classes_;
  std::map<std::string, long> classAcronyms_;
  std::map<long, CatalogueAttribute> attributes_;
  std::map<std::string, long> attributeAcronyms_;
  std::map<std::pair<long, long>, std::string> enums_;
};

}  // namespace br::chartscene
