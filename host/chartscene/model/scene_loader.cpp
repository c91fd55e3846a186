#include "host/chartscene/model/scene_loader.h"

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <set>
#include <sstream>

#include "host/chartscene/model/cp1252_text.h"
#include "host/chartscene/model/json_reader.h"

namespace br::chartscene {

std::string SceneError::Text() const {
  return "line " + std::to_string(line) + ", column " + std::to_string(column) + ": " + message;
}

namespace {

using Kind = JsonValue::Kind;

// Thrown inside the loader, caught at its top.
struct Refusal {
  int line;
  int column;
  std::string message;
};

[[noreturn]] void Refuse(const JsonValue& at, const std::string& message) {
  throw Refusal{at.line, at.column, message};
}

[[noreturn]] void Refuse(const JsonMember& at, const std::string& message) {
  throw Refusal{at.line, at.column, message};
}

// Days from 1970-01-01 of a civil date (proleptic Gregorian).
long long DaysFromCivil(long long year, unsigned month, unsigned day) {
  year -= month <= 2;
  const long long era = (year >= 0 ? year : year - 399) / 400;
  const unsigned yearOfEra = static_cast<unsigned>(year - era * 400);
  const unsigned dayOfYear = (153 * (month + (month > 2 ? -3 : 9)) + 2) / 5 + day - 1;
  const unsigned dayOfEra = yearOfEra * 365 + yearOfEra / 4 - yearOfEra / 100 + dayOfYear;
  return era * 146097 + static_cast<long long>(dayOfEra) - 719468;
}

constexpr long long kAutomationEpoch = -25569;  // 1899-12-30 in days from 1970-01-01
constexpr long long kFileTimeEpoch = -134774;   // 1601-01-01

// Field offsets of the header record (docs/host-interfaces.md).
constexpr std::size_t kHeaderSize = 592;

class Reader {
public:
  Reader(const std::string& folder, SceneModel& scene) : folder_(folder), scene_(scene) {}

  void Read(const JsonValue& root) {
    RequireObject(root, "the scene");
    Keys(root, {"format", "catalogue", "faults", "databases", "projections", "palettes", "colorMaps", "presParams"});
    const JsonValue& format = Required(root, "format");
    if (Text(format) != "chartscene 1") Refuse(format, "the format must be \"chartscene 1\"");
    if (const JsonValue* catalogue = root.Find("catalogue")) ReadCatalogue(*catalogue);
    if (const JsonValue* faults = root.Find("faults")) ReadFaults(*faults);
    const JsonValue& databases = Required(root, "databases");
    RequireArray(databases, "databases");
    // Objects first, members after: a member may be named before it is defined.
    for (const JsonValue& database : databases.items) ReadDatabase(database);
    for (const auto& [object, names] : pendingMembers_) LinkMembers(object, *names);
    if (const JsonValue* list = root.Find("projections")) ReadEach(*list, [&](const JsonValue& v) { ReadProjection(v); });
    if (const JsonValue* list = root.Find("palettes")) ReadEach(*list, [&](const JsonValue& v) { ReadPalette(v); });
    if (const JsonValue* list = root.Find("colorMaps")) ReadEach(*list, [&](const JsonValue& v) { ReadColorMap(v); });
    if (const JsonValue* list = root.Find("presParams")) ReadEach(*list, [&](const JsonValue& v) { ReadPresParams(v); });
  }

private:
  // ---- shapes
  static void RequireObject(const JsonValue& value, const std::string& what) {
    if (value.kind != Kind::Object) Refuse(value, what + " must be an object");
  }
  static void RequireArray(const JsonValue& value, const std::string& what) {
    if (value.kind != Kind::Array) Refuse(value, what + " must be an array");
  }
  static void Keys(const JsonValue& object, std::initializer_list<const char*> allowed) {
    for (const JsonMember& member : object.members) {
      bool known = false;
      for (const char* key : allowed) known = known || member.key == key;
      if (!known) Refuse(member, "unknown key \"" + member.key + "\"");
    }
  }
  static const JsonValue& Required(const JsonValue& object, const char* key) {
    const JsonValue* value = object.Find(key);
    if (value == nullptr) Refuse(object, std::string("\"") + key + "\" is missing");
    return *value;
  }
  template <typename F>
  static void ReadEach(const JsonValue& list, F read) {
    RequireArray(list, "the list");
    for (const JsonValue& item : list.items) read(item);
  }
  static const std::string& Text(const JsonValue& value) {
    if (value.kind != Kind::String) Refuse(value, "expected a text");
    return value.text;
  }
  static long long Integer(const JsonValue& value, long long low, long long high) {
    if (value.kind != Kind::Number || !value.integral) Refuse(value, "expected a whole number");
    if (value.integer < low || value.integer > high) {
      Refuse(value, "expected a number from " + std::to_string(low) + " to " + std::to_string(high));
    }
    return value.integer;
  }
  static double Number(const JsonValue& value) {
    if (value.kind != Kind::Number) Refuse(value, "expected a number");
    return value.number;
  }
  static bool Boolean(const JsonValue& value) {
    if (value.kind != Kind::Bool) Refuse(value, "expected true or false");
    return value.boolean;
  }
  static long KeyNumber(const JsonMember& member) {
    char* end = nullptr;
    const long number = std::strtol(member.key.c_str(), &end, 10);
    if (member.key.empty() || end == nullptr || *end != '\0') Refuse(member, "expected a number as the key");
    return number;
  }
  void UniqueName(const JsonValue& at, std::set<std::string>& names, const std::string& name, const char* what) {
    if (name.empty()) Refuse(at, std::string("a ") + what + " needs a name");
    if (!names.insert(name).second) Refuse(at, std::string("a second ") + what + " named \"" + name + "\"");
  }

  // ---- values
  static double Date(const JsonValue& value) {
    if (value.kind == Kind::Number) return value.number;
    double days = 0;
    if (!ParseSceneDate(Text(value), days)) Refuse(value, "expected a date YYYY-MM-DD[THH:MM[:SS]]");
    return days;
  }

  // A number, text, true/false, null or {"TYPE": value}.
  static TypedValue Typed(const JsonValue& value) {
    TypedValue typed;
    switch (value.kind) {
      case Kind::Null: return typed;
      case Kind::Bool: typed.type = TypedValue::Type::Bool; typed.integer = value.boolean; return typed;
      case Kind::String: typed.type = TypedValue::Type::Text; typed.text = value.text; return typed;
      case Kind::Number:
        if (value.integral && value.integer >= INT32_MIN && value.integer <= INT32_MAX) {
          typed.type = TypedValue::Type::I4;
          typed.integer = value.integer;
        } else {
          typed.type = TypedValue::Type::R8;
          typed.real = value.number;
        }
        return typed;
      case Kind::Array: Refuse(value, "expected a single value");
      case Kind::Object: break;
    }
    if (value.members.size() != 1) Refuse(value, "a typed value is {\"TYPE\": value}");
    const JsonMember& member = value.members[0];
    const std::string& type = member.key;
    const JsonValue& inner = member.value;
    const struct {
      const char* name;
      TypedValue::Type type;
      long long low, high;
    } integers[] = {{"I1", TypedValue::Type::I1, -128, 127},
                    {"I2", TypedValue::Type::I2, -32768, 32767},
                    {"I4", TypedValue::Type::I4, INT32_MIN, INT32_MAX},
                    {"UI1", TypedValue::Type::UI1, 0, 255},
                    {"UI2", TypedValue::Type::UI2, 0, 65535},
                    {"UI4", TypedValue::Type::UI4, 0, UINT32_MAX}};
    for (const auto& row : integers) {
      if (type == row.name) {
        typed.type = row.type;
        typed.integer = Integer(inner, row.low, row.high);
        return typed;
      }
    }
    if (type == "R4" || type == "R8") {
      typed.type = type == "R4" ? TypedValue::Type::R4 : TypedValue::Type::R8;
      typed.real = Number(inner);
    } else if (type == "BSTR") {
      typed.type = TypedValue::Type::Text;
      typed.text = Text(inner);
    } else if (type == "DATE") {
      typed.type = TypedValue::Type::Date;
      typed.real = Date(inner);
    } else if (type == "BOOL") {
      typed.type = TypedValue::Type::Bool;
      typed.integer = Boolean(inner);
    } else if (type == "EMPTY") {
      if (inner.kind != Kind::Null) Refuse(inner, "EMPTY takes null");
    } else {
      Refuse(member, "unknown value type \"" + type + "\"");
    }
    return typed;
  }

  // An attribute's value by its catalogue type; a typed value overrides the type.
  static TypedValue AttributeValue(const JsonValue& value, const CatalogueAttribute& attribute) {
    if (value.kind == Kind::Object || value.kind == Kind::Null) return Typed(value);
    TypedValue typed;
    switch (attribute.type) {
      case 'E': {
        const long long number = Integer(value, 0, 65535);
        typed.type = number > 255 ? TypedValue::Type::UI2 : TypedValue::Type::UI1;
        typed.integer = number;
        return typed;
      }
      case 'U':
        typed.type = TypedValue::Type::UI2;
        typed.integer = Integer(value, 0, 65535);
        return typed;
      case 'L': {
        typed.type = TypedValue::Type::ByteList;
        if (value.kind == Kind::Array) {
          for (const JsonValue& item : value.items) typed.list.push_back(static_cast<unsigned>(Integer(item, 0, 65535)));
        } else {
          typed.list.push_back(static_cast<unsigned>(Integer(value, 0, 65535)));
        }
        for (unsigned item : typed.list) {
          if (item > 255) typed.type = TypedValue::Type::WordList;
        }
        return typed;
      }
      case 'F':
        typed.type = TypedValue::Type::R8;
        typed.real = Number(value);
        return typed;
      case 'R':
        typed.type = TypedValue::Type::R4;
        typed.real = Number(value);
        return typed;
      case 'I':
        typed.type = TypedValue::Type::I4;
        typed.integer = Integer(value, INT32_MIN, INT32_MAX);
        return typed;
      default:
        typed.type = TypedValue::Type::Text;
        typed.text = Text(value);
        return typed;
    }
  }

  // ---- catalogue and faults
  void ReadCatalogue(const JsonValue& catalogue) {
    RequireObject(catalogue, "the catalogue");
    Keys(catalogue, {"classes", "attributes", "enums", "hidden", "unprintable"});
    if (const JsonValue* classes = catalogue.Find("classes")) {
      ReadEach(*classes, [&](const JsonValue& entry) {
        RequireObject(entry, "a class");
        Keys(entry, {"code", "acronym", "name", "hidden"});
        CatalogueClass added;
        added.code = static_cast<long>(Integer(Required(entry, "code"), 1, INT32_MAX));
        added.acronym = Text(Required(entry, "acronym"));
        added.name = Cp1252(Required(entry, "name"));
        if (const JsonValue* hidden = entry.Find("hidden")) added.flags = Boolean(*hidden) ? kCatalogueHidden : 0;
        scene_.catalogue.AddClass(added);
      });
    }
    if (const JsonValue* attributes = catalogue.Find("attributes")) {
      ReadEach(*attributes, [&](const JsonValue& entry) {
        RequireObject(entry, "an attribute");
        Keys(entry, {"code", "acronym", "name", "type", "unprintable"});
        CatalogueAttribute added;
        added.code = static_cast<long>(Integer(Required(entry, "code"), 1, INT32_MAX));
        added.acronym = Text(Required(entry, "acronym"));
        added.name = Cp1252(Required(entry, "name"));
        const JsonValue& type = Required(entry, "type");
        if (Text(type).size() != 1 || std::string("ELFIASUR").find(type.text[0]) == std::string::npos) {
          Refuse(type, "an attribute type is one of E L F I A S U R");
        }
        added.type = type.text[0];
        if (const JsonValue* flag = entry.Find("unprintable")) added.flags = Boolean(*flag) ? kCatalogueHidden : 0;
        scene_.catalogue.AddAttribute(added);
      });
    }
    if (const JsonValue* enums = catalogue.Find("enums")) {
      ReadEach(*enums, [&](const JsonValue& entry) {
        RequireObject(entry, "an enumeration text");
        Keys(entry, {"attribute", "value", "text"});
        const CatalogueAttribute& attribute = AttributeOf(Required(entry, "attribute"));
        scene_.catalogue.AddEnumText(attribute.code, static_cast<long>(Integer(Required(entry, "value"), 0, 65535)),
                                     Cp1252(Required(entry, "text")));
      });
    }
    if (const JsonValue* hidden = catalogue.Find("hidden")) {
      ReadEach(*hidden, [&](const JsonValue& acronym) {
        scene_.catalogue.MutableClass(ClassOf(acronym))->flags |= kCatalogueHidden;
      });
    }
    if (const JsonValue* unprintable = catalogue.Find("unprintable")) {
      ReadEach(*unprintable, [&](const JsonValue& acronym) {
        scene_.catalogue.MutableAttribute(AttributeOf(acronym).code)->flags |= kCatalogueHidden;
      });
    }
  }

  // Texts that end up in byte records and the catalogue are code page 1252.
  static std::string Cp1252(const JsonValue& value) { return Cp1252FromMixed(Text(value)); }

  void ReadFaults(const JsonValue& faults) {
    RequireObject(faults, "the faults");
    for (const JsonMember& member : faults.members) {
      const std::string& operation = member.key;
      const std::size_t dot = operation.find('.');
      if (operation.size() < 4 || operation[0] != 'I' || dot == std::string::npos || dot + 1 >= operation.size()) {
        Refuse(member, "a fault names an operation as Interface.Method");
      }
      std::uint32_t result = 0;
      if (member.value.kind == Kind::String) {
        char* end = nullptr;
        const unsigned long parsed = std::strtoul(member.value.text.c_str(), &end, 16);
        if (member.value.text.compare(0, 2, "0x") != 0 || end == nullptr || *end != '\0') {
          Refuse(member.value, "an HRESULT as \"0x8000FFFF\" or a number");
        }
        result = static_cast<std::uint32_t>(parsed);
      } else {
        result = static_cast<std::uint32_t>(Integer(member.value, INT32_MIN, UINT32_MAX));
      }
      if (result == 0) Refuse(member.value, "a fault of S_OK is no fault");
      scene_.faults[operation] = result;
    }
  }

  long ClassOf(const JsonValue& value) {
    if (value.kind == Kind::Number) {
      const long code = static_cast<long>(Integer(value, 1, INT32_MAX));
      if (scene_.catalogue.ClassByCode(code) == nullptr) Refuse(value, "unknown object class " + std::to_string(code));
      return code;
    }
    const CatalogueClass* found = scene_.catalogue.ClassByAcronym(Text(value));
    if (found == nullptr) Refuse(value, "unknown object class \"" + value.text + "\"");
    return found->code;
  }

  const CatalogueAttribute& AttributeOf(const JsonValue& value) {
    const CatalogueAttribute* found = nullptr;
    if (value.kind == Kind::Number) {
      found = scene_.catalogue.AttributeByCode(static_cast<long>(Integer(value, 1, INT32_MAX)));
    } else {
      found = scene_.catalogue.AttributeByAcronym(Text(value));
    }
    if (found == nullptr) Refuse(value, "unknown attribute");
    return *found;
  }

  // ---- databases and datasets
  void ReadDatabase(const JsonValue& value) {
    RequireObject(value, "a database");
    Keys(value, {"name", "kind", "datasets"});
    SceneDatabaseModel database;
    database.name = Text(Required(value, "name"));
    UniqueName(value, databaseNames_, database.name, "database");
    const JsonValue& kind = Required(value, "kind");
    if (Text(kind) == "chart") {
      database.kind = DatabaseKind::Chart;
    } else if (kind.text == "user") {
      database.kind = DatabaseKind::User;
    } else if (kind.text == "hierarchy") {
      database.kind = DatabaseKind::Hierarchy;
    } else {
      Refuse(kind, "a database kind is chart, user or hierarchy");
    }
    database.kindId = KindBytes(database.kind);
    const std::size_t index = scene_.databases.size();
    scene_.databases.push_back(database);
    const JsonValue& dataSets = Required(value, "datasets");
    RequireArray(dataSets, "datasets");
    for (const JsonValue& dataSet : dataSets.items) ReadDataSet(dataSet, index);
  }

  void ReadDataSet(const JsonValue& value, std::size_t database) {
    RequireObject(value, "a dataset");
    Keys(value, {"id", "type", "header", "parameters", "parametersForm", "properties", "objects", "chartHeader",
                 "chartIssue"});
    SceneDataSetModel dataSet;
    dataSet.database = database;
    const JsonValue& id = Required(value, "id");
    const std::string& idText = Text(id);
    if (idText.empty() || idText.size() > 8 || idText.find('.') != std::string::npos) {
      Refuse(id, "a dataset id has 1 to 8 characters and no full stop");
    }
    dataSet.id = idText + std::string(8 - idText.size(), '.');
    UniqueName(id, dataSetIds_, dataSet.id, "dataset");
    if (const JsonValue* type = value.Find("type")) {
      if (Text(*type) == "vector") {
        dataSet.type = DataSetType::Vector;
      } else if (type->text == "raster") {
        dataSet.type = DataSetType::Raster;
      } else if (type->text == "library") {
        dataSet.type = DataSetType::Library;
      } else {
        Refuse(*type, "a dataset type is vector, raster or library");
      }
    }
    const std::size_t index = scene_.dataSets.size();
    const JsonValue empty;
    const JsonValue* header = value.Find("header");
    HeaderFields fields = ReadHeader(header ? *header : empty, dataSet, idText);
    dataSet.parameters = DefaultParameters(fields);
    if (const JsonValue* parameters = value.Find("parameters")) ReadParameters(*parameters, dataSet.parameters);
    if (const JsonValue* form = value.Find("parametersForm")) {
      if (Text(*form) == "direct") {
        dataSet.parameterForm = ParameterForm::Direct;
      } else if (form->text == "byReference") {
        dataSet.parameterForm = ParameterForm::ByReference;
      } else if (form->text == "inVariant") {
        dataSet.parameterForm = ParameterForm::InVariant;
      } else {
        Refuse(*form, "a parameters form is direct, byReference or inVariant");
      }
    }
    if (const JsonValue* properties = value.Find("properties")) ReadTypedMap(*properties, dataSet.properties);
    if (const JsonValue* record = value.Find("chartHeader")) dataSet.chartHeader = ReadRecord(*record);
    if (const JsonValue* record = value.Find("chartIssue")) dataSet.chartIssue = ReadRecord(*record);
    scene_.dataSets.push_back(dataSet);
    scene_.databases[database].dataSets.push_back(index);
    if (const JsonValue* objects = value.Find("objects")) {
      ReadEach(*objects, [&](const JsonValue& object) { ReadObject(object, index); });
    }
  }

  struct HeaderFields {
    long long level = 0, edition = 0, update = 0, agency = 0, sourceAgency = 0, scale = 0;
    double updateDate = 0, issueDate = 0;
    bool hasUpdateDate = false, hasIssueDate = false;
    std::string sourceId, fileName;
  };

  static void Put(std::vector<unsigned char>& bytes, std::size_t offset, unsigned long long value, int size) {
    for (int i = 0; i < size; ++i) {
      if (offset + i < bytes.size()) bytes[offset + i] = static_cast<unsigned char>(value >> (8 * i));
    }
  }
  static void PutText(std::vector<unsigned char>& bytes, std::size_t offset, std::size_t field, const std::string& text) {
    for (std::size_t i = 0; i < text.size() && i + 1 < field; ++i) {
      if (offset + i < bytes.size()) bytes[offset + i] = static_cast<unsigned char>(text[i]);
    }
  }
  static unsigned long long FileTime(double automationDays) {
    const double days = automationDays + static_cast<double>(kAutomationEpoch - kFileTimeEpoch);
    return static_cast<unsigned long long>(std::llround(days * 864000000000.0));
  }

  HeaderFields ReadHeader(const JsonValue& header, SceneDataSetModel& dataSet, const std::string& id) {
    HeaderFields fields;
    fields.fileName = id + ".000";
    std::size_t size = kHeaderSize;
    bool terminated = false, newEdition = false;
    long long usage = 0;
    std::string identity;
    if (header.kind != Kind::Null) {
      RequireObject(header, "the header");
      Keys(header, {"size", "scale", "level", "edition", "update", "updateDate", "issueDate", "agency",
                    "sourceAgency", "sourceId", "terminated", "newEdition", "fileName", "usage", "identity"});
      if (const JsonValue* v = header.Find("size")) size = static_cast<std::size_t>(Integer(*v, 0, 65536));
      if (const JsonValue* v = header.Find("scale")) fields.scale = Integer(*v, 0, UINT32_MAX);
      if (const JsonValue* v = header.Find("level")) fields.level = Integer(*v, INT32_MIN, INT32_MAX);
      if (const JsonValue* v = header.Find("edition")) fields.edition = Integer(*v, 0, 65535);
      if (const JsonValue* v = header.Find("update")) fields.update = Integer(*v, 0, 65535);
      if (const JsonValue* v = header.Find("updateDate")) {
        fields.updateDate = Date(*v);
        fields.hasUpdateDate = true;
      }
      if (const JsonValue* v = header.Find("issueDate")) {
        fields.issueDate = Date(*v);
        fields.hasIssueDate = true;
      }
      if (const JsonValue* v = header.Find("agency")) fields.agency = Integer(*v, 0, UINT32_MAX);
      if (const JsonValue* v = header.Find("sourceAgency")) fields.sourceAgency = Integer(*v, 0, UINT32_MAX);
      if (const JsonValue* v = header.Find("sourceId")) fields.sourceId = Cp1252(*v);
      if (const JsonValue* v = header.Find("terminated")) terminated = Boolean(*v);
      if (const JsonValue* v = header.Find("newEdition")) newEdition = Boolean(*v);
      if (const JsonValue* v = header.Find("fileName")) fields.fileName = Cp1252(*v);
      if (const JsonValue* v = header.Find("usage")) usage = Integer(*v, 0, UINT32_MAX);
      if (const JsonValue* v = header.Find("identity")) {
        identity = Text(*v);
        if (identity.size() != 32 || identity.find_first_not_of("0123456789abcdefABCDEF") != std::string::npos) {
          Refuse(*v, "an identity is 32 hexadecimal digits");
        }
      }
    }
    std::vector<unsigned char>& bytes = dataSet.header;
    bytes.assign(size, 0);
    Put(bytes, 16, static_cast<unsigned long long>(fields.scale), 4);
    Put(bytes, 20, static_cast<unsigned long long>(fields.level), 4);
    Put(bytes, 24, static_cast<unsigned long long>(fields.edition), 2);
    Put(bytes, 26, static_cast<unsigned long long>(fields.update), 2);
    if (fields.hasUpdateDate) Put(bytes, 28, FileTime(fields.updateDate), 8);
    if (fields.hasIssueDate) Put(bytes, 36, FileTime(fields.issueDate), 8);
    Put(bytes, 48, static_cast<unsigned long long>(fields.agency), 4);
    Put(bytes, 52, static_cast<unsigned long long>(fields.sourceAgency), 4);
    PutText(bytes, 60, 252, fields.sourceId);
    Put(bytes, 312, (terminated ? 1u : 0u) | (newEdition ? 2u : 0u), 1);
    PutText(bytes, 316, 256, fields.fileName);
    Put(bytes, 572, static_cast<unsigned long long>(usage), 4);
    for (std::size_t i = 0; i < 16; ++i) {
      unsigned char byte = 0;
      if (identity.empty()) {
        byte = static_cast<unsigned char>(i < 8 ? dataSet.id[i] : (fields.edition >> (8 * (i - 8))) & 0xFF);
      } else {
        byte = static_cast<unsigned char>(std::stoul(identity.substr(2 * i, 2), nullptr, 16));
      }
      Put(bytes, 576 + i, byte, 1);
    }
    return fields;
  }

  static TypedValue Value(TypedValue::Type type, long long integer) {
    TypedValue typed;
    typed.type = type;
    typed.integer = integer;
    return typed;
  }

  static std::vector<TypedValue> DefaultParameters(const HeaderFields& fields) {
    std::vector<TypedValue> parameters(34);
    parameters[1] = Value(TypedValue::Type::I4, fields.level);
    parameters[2].type = TypedValue::Type::Text;
    parameters[2].text = Utf8(fields.fileName);
    parameters[3] = Value(TypedValue::Type::I4, fields.edition);
    parameters[4] = Value(TypedValue::Type::I4, fields.update);
    if (fields.hasUpdateDate) {
      parameters[5].type = TypedValue::Type::Date;
      parameters[5].real = fields.updateDate;
    }
    if (fields.hasIssueDate) {
      parameters[6].type = TypedValue::Type::Date;
      parameters[6].real = fields.issueDate;
    }
    parameters[10] = Value(TypedValue::Type::I4, 0);
    parameters[11] = Value(TypedValue::Type::I2, static_cast<short>(fields.agency));
    parameters[12] = Value(TypedValue::Type::I2, static_cast<short>(fields.sourceAgency));
    parameters[13].type = TypedValue::Type::Text;
    parameters[13].text = Utf8(fields.sourceId);
    parameters[29] = Value(TypedValue::Type::I4, fields.scale);
    return parameters;
  }

  static std::string Utf8(const std::string& cp1252) { return Utf8FromCp1252(cp1252); }

  void ReadParameters(const JsonValue& value, std::vector<TypedValue>& parameters) {
    RequireObject(value, "the parameters");
    const struct {
      const char* name;
      std::size_t element;
      TypedValue::Type type;  // Empty: as written
    } named[] = {{"level", 1, TypedValue::Type::I4},
                 {"fileName", 2, TypedValue::Type::Text},
                 {"edition", 3, TypedValue::Type::I4},
                 {"update", 4, TypedValue::Type::I4},
                 {"updateDate", 5, TypedValue::Type::Date},
                 {"issueDate", 6, TypedValue::Type::Date},
                 {"name", 8, TypedValue::Type::Text},
                 {"description", 9, TypedValue::Type::Text},
                 {"official", 10, TypedValue::Type::I4},
                 {"agency", 11, TypedValue::Type::I2},
                 {"sourceAgency", 12, TypedValue::Type::I2},
                 {"sourceId", 13, TypedValue::Type::Text},
                 {"libraryEdition", 14, TypedValue::Type::I4},
                 {"archiveCode", 15, TypedValue::Type::Text},
                 {"editionDate", 16, TypedValue::Type::Date},
                 {"title", 22, TypedValue::Type::Text},
                 {"horizontalDatum", 23, TypedValue::Type::I2},
                 {"horizontalDatumSource", 24, TypedValue::Type::I2},
                 {"datumShiftLon", 25, TypedValue::Type::I4},
                 {"datumShiftLat", 26, TypedValue::Type::I4},
                 {"verticalDatum", 27, TypedValue::Type::UI1},
                 {"soundingDatum", 28, TypedValue::Type::UI1},
                 {"scale", 29, TypedValue::Type::I4},
                 {"projection", 31, TypedValue::Type::Text}};
    for (const JsonMember& member : value.members) {
      if (member.key == "count") {
        parameters.resize(static_cast<std::size_t>(Integer(member.value, 0, 1000)));
        continue;
      }
      std::size_t element = SIZE_MAX;
      TypedValue typed;
      for (const auto& row : named) {
        if (member.key != row.name) continue;
        element = row.element;
        if (member.value.kind == Kind::Object) {
          typed = Typed(member.value);
        } else if (row.type == TypedValue::Type::Text) {
          typed.type = row.type;
          typed.text = Text(member.value);
        } else if (row.type == TypedValue::Type::Date) {
          typed.type = row.type;
          typed.real = Date(member.value);
        } else {
          const long long limit = row.type == TypedValue::Type::UI1 ? 255 : row.type == TypedValue::Type::I2 ? 32767 : INT32_MAX;
          typed = Value(row.type, Integer(member.value, row.type == TypedValue::Type::UI1 ? 0 : -limit - 1, limit));
        }
      }
      if (element == SIZE_MAX) {
        if (member.key.empty() || member.key.find_first_not_of("0123456789") != std::string::npos) {
          Refuse(member, "unknown parameter \"" + member.key + "\"");
        }
        element = static_cast<std::size_t>(KeyNumber(member));
        if (element >= 1000) Refuse(member, "a parameter number below 1000");
        typed = Typed(member.value);
      }
      if (element >= parameters.size()) parameters.resize(element + 1);
      parameters[element] = typed;
    }
  }

  void ReadTypedMap(const JsonValue& value, std::map<long, TypedValue>& map) {
    RequireObject(value, "the properties");
    for (const JsonMember& member : value.members) map[KeyNumber(member)] = Typed(member.value);
  }

  // {"size": N, "fields": [{"at": offset, "u8"|"u16"|"u32"|"i32"|"f64"|"date"|"text": value}]}
  std::vector<unsigned char> ReadRecord(const JsonValue& value) {
    RequireObject(value, "a record");
    Keys(value, {"size", "fields"});
    std::vector<unsigned char> bytes(static_cast<std::size_t>(Integer(Required(value, "size"), 0, 65536)), 0);
    if (const JsonValue* fields = value.Find("fields")) {
      ReadEach(*fields, [&](const JsonValue& field) {
        RequireObject(field, "a field");
        if (field.members.size() != 2) Refuse(field, "a field is {\"at\": offset, \"TYPE\": value}");
        const std::size_t at = static_cast<std::size_t>(Integer(Required(field, "at"), 0, 65535));
        for (const JsonMember& member : field.members) {
          if (member.key == "at") continue;
          std::size_t width = 0;
          if (member.key == "u8") {
            width = 1;
            Put(bytes, at, static_cast<unsigned long long>(Integer(member.value, 0, 255)), 1);
          } else if (member.key == "u16") {
            width = 2;
            Put(bytes, at, static_cast<unsigned long long>(Integer(member.value, 0, 65535)), 2);
          } else if (member.key == "u32" || member.key == "i32") {
            width = 4;
            Put(bytes, at, static_cast<unsigned long long>(Integer(member.value, INT32_MIN, UINT32_MAX)), 4);
          } else if (member.key == "f64" || member.key == "date") {
            width = 8;
            const double number = member.key == "f64" ? Number(member.value) : Date(member.value);
            unsigned long long bits = 0;
            std::memcpy(&bits, &number, sizeof(bits));
            Put(bytes, at, bits, 8);
          } else if (member.key == "text") {
            const std::string text = Cp1252(member.value);
            width = text.size() + 1;
            PutText(bytes, at, width, text);
          } else {
            Refuse(member, "a field type is u8, u16, u32, i32, f64, date or text");
          }
          if (at + width > bytes.size()) Refuse(member, "the field ends past the record's size");
        }
      });
    }
    return bytes;
  }

  // ---- objects
  void ReadObject(const JsonValue& value, std::size_t dataSet) {
    RequireObject(value, "an object");
    Keys(value, {"name", "class", "primitive", "point", "line", "area", "attributes", "members", "flags",
                 "properties", "text", "files"});
    SceneObjectModel object;
    object.name = Text(Required(value, "name"));
    UniqueName(value, objectNames_, object.name, "object");
    object.dataSet = dataSet;
    object.number = static_cast<std::uint32_t>(scene_.dataSets[dataSet].objects.size() + 1);
    object.classCode = ClassOf(Required(value, "class"));
    int shapes = 0;
    const struct {
      const char* key;
      long primitive;
    } geometries[] = {{"point", 1}, {"line", 2}, {"area", 3}};
    for (const auto& geometry : geometries) {
      const JsonValue* shape = value.Find(geometry.key);
      if (shape == nullptr) continue;
      ++shapes;
      object.primitive = geometry.primitive;
      if (geometry.primitive == 1) {
        object.geometry.push_back(Position(*shape));
      } else {
        RequireArray(*shape, geometry.key);
        if (shape->items.size() < 2) Refuse(*shape, "a line or area needs two positions or more");
        for (const JsonValue& point : shape->items) object.geometry.push_back(Position(point));
      }
    }
    if (shapes > 1) Refuse(value, "an object has one geometry");
    if (const JsonValue* primitive = value.Find("primitive")) {
      const std::string& name = Text(*primitive);
      const long given = name == "point" ? 1 : name == "line" ? 2 : name == "area" ? 3 : name == "none" ? 6 : 0;
      if (given == 0) Refuse(*primitive, "a primitive is point, line, area or none");
      object.primitive = given;
    }
    if (const JsonValue* attributes = value.Find("attributes")) {
      RequireObject(*attributes, "the attributes");
      for (const JsonMember& member : attributes->members) {
        const CatalogueAttribute* attribute = scene_.catalogue.AttributeByAcronym(member.key);
        if (attribute == nullptr) Refuse(member, "unknown attribute \"" + member.key + "\"");
        object.attributes.push_back({attribute->code, AttributeValue(member.value, *attribute)});
      }
    }
    TypedValue flags;
    flags.type = TypedValue::Type::UI4;
    if (const JsonValue* given = value.Find("flags")) flags.integer = Integer(*given, 0, UINT32_MAX);
    object.properties[0] = flags;
    if (const JsonValue* properties = value.Find("properties")) ReadTypedMap(*properties, object.properties);
    if (const JsonValue* text = value.Find("text")) {
      object.text = Text(*text);
    } else {
      for (const SceneAttributeModel& attribute : object.attributes) {
        if (attribute.code == 116 && attribute.value.type == TypedValue::Type::Text) object.text = attribute.value.text;
      }
    }
    if (const JsonValue* files = value.Find("files")) {
      RequireObject(*files, "the files");
      for (const JsonMember& member : files->members) {
        StoredFile file;
        file.name = member.key;
        // Stream names of structured storage: 1 to 31 characters, none of \ / : !
        if (file.name.empty() || file.name.size() > 31 || file.name.find_first_of("\\/:!") != std::string::npos) {
          Refuse(member, "a stored file name has 1 to 31 characters and none of \\ / : !");
        }
        if (!ReadStoredFile(Text(member.value), file.bytes)) Refuse(member.value, "cannot read \"" + member.value.text + "\"");
        object.files.push_back(std::move(file));
      }
    }
    const std::size_t index = scene_.objects.size();
    if (const JsonValue* members = value.Find("members")) {
      RequireArray(*members, "members");
      pendingMembers_.push_back({index, members});
    }
    scene_.objects.push_back(std::move(object));
    scene_.dataSets[dataSet].objects.push_back(index);
  }

  static GeoPosition Position(const JsonValue& value) {
    if (value.kind != Kind::Array || value.items.size() != 2) Refuse(value, "a position is [latitude, longitude]");
    GeoPosition position{Number(value.items[0]), Number(value.items[1])};
    if (std::fabs(position.lat) > 90 || std::fabs(position.lon) > 180) Refuse(value, "a position out of range");
    return position;
  }

  void LinkMembers(std::size_t object, const JsonValue& names) {
    for (const JsonValue& name : names.items) {
      std::size_t member = SIZE_MAX;
      for (std::size_t i = 0; i < scene_.objects.size(); ++i) {
        if (scene_.objects[i].name == Text(name)) member = i;
      }
      if (member == SIZE_MAX) Refuse(name, "unknown object \"" + name.text + "\"");
      if (member == object) Refuse(name, "an object cannot hold itself");
      scene_.objects[object].members.push_back(member);
      scene_.objects[member].holders.push_back(object);
    }
  }

  bool ReadStoredFile(const std::string& path, std::string& bytes) const {
    std::string full = path;
    const bool absolute = !path.empty() && (path[0] == '/' || path[0] == '\\' || (path.size() > 1 && path[1] == ':'));
    if (!absolute && !folder_.empty()) {
      full = folder_;
      if (full.back() != '/' && full.back() != '\\') full += '/';
      full += path;
    }
    std::ifstream in(full, std::ios::binary);
    if (!in) return false;
    std::ostringstream content;
    content << in.rdbuf();
    bytes = content.str();
    return true;
  }

  // ---- display components
  void ReadProjection(const JsonValue& value) {
    RequireObject(value, "a projection");
    Keys(value, {"name", "kind", "centre", "pixelsPerDegree", "size"});
    SceneProjectionModel projection;
    projection.name = Text(Required(value, "name"));
    UniqueName(value, projectionNames_, projection.name, "projection");
    const JsonValue& kind = Required(value, "kind");
    if (Text(kind) == "mercator") {
      projection.mercator = true;
    } else if (kind.text == "plateCarree") {
      projection.mercator = false;
    } else {
      Refuse(kind, "a projection kind is mercator or plateCarree");
    }
    const GeoPosition centre = Position(Required(value, "centre"));
    if (projection.mercator && std::fabs(centre.lat) > 85) Refuse(value, "a Mercator centre beyond 85 degrees");
    projection.centreLat = centre.lat;
    projection.centreLon = centre.lon;
    const JsonValue& scale = Required(value, "pixelsPerDegree");
    projection.pixelsPerDegree = Number(scale);
    if (!(projection.pixelsPerDegree > 0)) Refuse(scale, "pixels per degree must be above 0");
    if (const JsonValue* size = value.Find("size")) {
      if (size->kind != Kind::Array || size->items.size() != 2) Refuse(*size, "a size is [width, height]");
      projection.width = static_cast<long>(Integer(size->items[0], 1, 100000));
      projection.height = static_cast<long>(Integer(size->items[1], 1, 100000));
    }
    scene_.projections.push_back(projection);
  }

  void ReadPalette(const JsonValue& value) {
    RequireObject(value, "a palette");
    Keys(value, {"name", "colours"});
    ScenePaletteModel palette;
    palette.name = Text(Required(value, "name"));
    UniqueName(value, paletteNames_, palette.name, "palette");
    const JsonValue& colours = Required(value, "colours");
    RequireArray(colours, "colours");
    if (colours.items.empty() || colours.items.size() > 256) Refuse(colours, "a palette has 1 to 256 colours");
    for (const JsonValue& colour : colours.items) {
      const std::string& text = Text(colour);
      if (text.size() != 7 || text[0] != '#' || text.find_first_not_of("0123456789abcdefABCDEF", 1) != std::string::npos) {
        Refuse(colour, "a colour is \"#RRGGBB\"");
      }
      palette.colours.push_back({static_cast<unsigned char>(std::stoul(text.substr(1, 2), nullptr, 16)),
                                 static_cast<unsigned char>(std::stoul(text.substr(3, 2), nullptr, 16)),
                                 static_cast<unsigned char>(std::stoul(text.substr(5, 2), nullptr, 16))});
    }
    scene_.palettes.push_back(palette);
  }

  void ReadColorMap(const JsonValue& value) {
    RequireObject(value, "a colour map");
    Keys(value, {"name", "indices"});
    SceneColorMapModel map;
    map.name = Text(Required(value, "name"));
    UniqueName(value, colorMapNames_, map.name, "colour map");
    const JsonValue& indices = Required(value, "indices");
    RequireObject(indices, "the indices");
    for (const JsonMember& member : indices.members) {
      map.indices[KeyNumber(member)] = static_cast<unsigned short>(Integer(member.value, 0, 65535));
    }
    scene_.colorMaps.push_back(map);
  }

  void ReadPresParams(const JsonValue& value) {
    RequireObject(value, "presentation parameters");
    Keys(value, {"name", "values"});
    ScenePresParamsModel params;
    params.name = Text(Required(value, "name"));
    UniqueName(value, presParamsNames_, params.name, "presentation parameter set");
    ReadTypedMap(Required(value, "values"), params.values);
    scene_.presParams.push_back(params);
  }

  std::string folder_;
  SceneModel& scene_;
  std::set<std::string> databaseNames_, dataSetIds_, objectNames_, projectionNames_, paletteNames_, colorMapNames_,
      presParamsNames_;
  std::vector<std::pair<std::size_t, const JsonValue*>> pendingMembers_;
};

}  // namespace

bool ParseSceneDate(const std::string& text, double& days) {
  int year = 0, month = 0, day = 0, hour = 0, minute = 0, second = 0;
  char tail = 0;
  int fields = 0;
  if (text.size() == 10) {
    fields = std::sscanf(text.c_str(), "%4d-%2d-%2d%c", &year, &month, &day, &tail);
    if (fields != 3) return false;
  } else if (text.size() == 16) {
    fields = std::sscanf(text.c_str(), "%4d-%2d-%2dT%2d:%2d%c", &year, &month, &day, &hour, &minute, &tail);
    if (fields != 5) return false;
  } else if (text.size() == 19) {
    fields = std::sscanf(text.c_str(), "%4d-%2d-%2dT%2d:%2d:%2d%c", &year, &month, &day, &hour, &minute, &second, &tail);
    if (fields != 6) return false;
  } else {
    return false;
  }
  if (month < 1 || month > 12 || day < 1 || day > 31 || hour > 23 || minute > 59 || second > 59) return false;
  const long long civil = DaysFromCivil(year, static_cast<unsigned>(month), static_cast<unsigned>(day));
  // A day past the month's end rolls into the next month: refuse it.
  if ((month < 12 ? DaysFromCivil(year, static_cast<unsigned>(month + 1), 1) : DaysFromCivil(year + 1, 1, 1)) <= civil) {
    return false;
  }
  days = static_cast<double>(civil - kAutomationEpoch) + (hour * 3600 + minute * 60 + second) / 86400.0;
  return true;
}

bool LoadScene(const std::string& json, const std::string& folder, const S57Catalogue& catalogue,
               SceneModel& scene, SceneError& error) {
  JsonValue root;
  JsonError jsonError;
  if (!ParseJson(json, root, jsonError)) {
    error = {jsonError.line, jsonError.column, jsonError.message};
    return false;
  }
  SceneModel loaded;
  loaded.catalogue = catalogue;
  try {
    Reader(folder, loaded).Read(root);
  } catch (const Refusal& refusal) {
    error = {refusal.line, refusal.column, refusal.message};
    return false;
  }
  scene = std::move(loaded);
  return true;
}

}  // namespace br::chartscene
