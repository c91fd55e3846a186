// Metadata rows of chart and library datasets and the text form, from parameter arrays
// and header records written here, with lookups that answer from small tables.
#include <doctest/doctest.h>

#include <map>
#include <string>

#include "inspector/format/metadata_rows.h"

using namespace br::inspector;
using br::geo::DataSetHeader;

namespace {

ParameterValue Text(std::string text) {
  ParameterValue v;
  v.kind = ParameterValue::kText;
  v.text = std::move(text);
  return v;
}
ParameterValue Integer(std::int64_t value) {
  ParameterValue v;
  v.kind = ParameterValue::kInteger;
  v.integer = value;
  return v;
}
ParameterValue Date(double date) {
  ParameterValue v;
  v.kind = ParameterValue::kDate;
  v.date = date;
  return v;
}

// Captions in French for a few ids, agencies 550 and 31, HORDAT 2 and VERDAT 3 and 7
// (7 with an empty text), dates as their day numbers, one datum shift unit per 1e-7 degree.
MetadataSources Sources() {
  MetadataSources s;
  s.text = [](long id, const char* defaultText) -> std::string {
    static const std::map<long, std::string> french{{13, "Echelle"}, {33, "ANNULE"}, {4, "Non defini"}};
    const auto found = french.find(id);
    return found != french.end() ? found->second : defaultText;
  };
  s.date = [](double date) -> std::string {
    if (date < 0) return {};
    return "day " + std::to_string(static_cast<long>(date));
  };
  s.agency = [](long code) -> std::string {
    if (code == 550) return "SHOM";
    if (code == 31) return "UKHO";
    return {};
  };
  s.catalogue = [](const char* acronym, long value) -> std::optional<std::string> {
    if (std::string(acronym) == "HORDAT" && value == 2) return "WGS 84";
    if (std::string(acronym) == "VERDAT" && value == 3) return "Mean sea level";
    if (std::string(acronym) == "VERDAT" && value == 7) return std::string();
    return std::nullopt;
  };
  s.degrees = [](long normalised) -> std::optional<double> { return normalised * 1e-7; };
  return s;
}

// A chart dataset's parameters as a host fills them.
std::vector<ParameterValue> ChartParameters() {
  std::vector<ParameterValue> p(34);
  p[1] = Integer(5);
  p[2] = Text("FR5BR010.000");
  p[3] = Integer(4);
  p[4] = Integer(2);
  p[5] = Date(45000.25);
  p[6] = Date(44900);
  p[10] = Integer(0);
  p[11] = Integer(550);
  p[12] = Integer(1234);
  p[13] = Text("FR5BR010");
  p[15] = Text("A12");
  p[22] = Text("Goulet de Brest");
  p[23] = Integer(2);
  p[24] = Integer(99);  // not in the catalogue: no row
  p[25] = Integer(-150000);
  p[26] = Integer(2000000);
  p[27] = Integer(3);
  p[28] = Integer(7);
  p[29] = Integer(22000);
  return p;
}

DataSetHeader Header() {
  DataSetHeader h;
  h.level = 5;
  h.usage = 5;
  h.status = 0;
  return h;
}

using Rows = std::vector<std::pair<std::string, std::string>>;
Rows Pairs(const std::vector<MetadataRow>& rows) {
  Rows pairs;
  for (const MetadataRow& r : rows) pairs.emplace_back(r.caption, r.value);
  return pairs;
}

}  // namespace

TEST_CASE("chart dataset rows in their order, with agency names, datums and shifts") {
  const Rows rows = Pairs(ChartDataSetRows(ChartParameters(), Header(), std::nullopt, Sources()));
  const Rows expected{
      {"DataSet filename", "FR5BR010.000"},
      {"Chart Title", "Goulet de Brest"},
      {"DataSet source type", "Official"},
      {"Source identification code", "FR5BR010"},
      {"Source producing agency", "1234"},  // not listed: the code
      {"Producing agency", "SHOM"},
      {"Echelle", "22000"},
      {"Update application date", "day 45000"},
      {"Issue date", "day 44900"},
      {"Edition number", "4"},
      {"Update number (embedded into ENC)", "2"},
      {"Archive Code", "A12"},
      {"Horizontal Datum", "WGS 84"},
      {"Lon Horizontal Datum Shift", "-0.90000'"},
      {"Lat Horizontal Datum Shift", "12.00000'"},
      {"Vertical Datum", "Mean sea level"},
      {"Sounding Datum", "Non defini"},
      {"Level", "5"},
      {"Intended usage", "5"},
  };
  CHECK(rows == expected);
}

TEST_CASE("chart dataset: status words, source type, embedded update, missing values") {
  auto p = ChartParameters();
  DataSetHeader h = Header();

  SUBCASE("terminated with a new edition") {
    h.status = 3;
    const auto rows = ChartDataSetRows(p, h, std::nullopt, Sources());
    REQUIRE(!rows.empty());
    CHECK(rows[0].value == "FR5BR010.000 (ANNULE) (NEW EDITION AVAILABLE)");
  }
  SUBCASE("an unknown agency makes the source non official; the embedded update wins") {
    p[12] = Integer(0xFFFF);  // -1 as 16 bits
    const Rows rows = Pairs(ChartDataSetRows(p, h, std::uint16_t{65535}, Sources()));
    CHECK(rows[2] == std::make_pair(std::string("DataSet source type"), std::string("Non official")));
    CHECK(rows[4].second == "-1");
    bool found = false;
    for (const auto& r : rows) {
      if (r.first == "Update number (embedded into ENC)") found = r.second == "65535";
    }
    CHECK(found);
  }
  SUBCASE("a non-zero official flag gives Non official") {
    p[10] = Integer(1);
    CHECK(ChartDataSetRows(p, h, std::nullopt, Sources())[2].value == "Non official");
  }
  SUBCASE("a short array, no geodesy, a failing date and no header fields") {
    p.resize(7);
    p[6] = Date(-1);
    MetadataSources s = Sources();
    s.degrees = nullptr;
    const Rows rows = Pairs(ChartDataSetRows(p, DataSetHeader{}, std::nullopt, s));
    const Rows expected{{"DataSet filename", "FR5BR010.000"},
                        {"DataSet source type", "Non official"},
                        {"Update application date", "day 45000"},
                        {"Issue date", "Non defini"},
                        {"Edition number", "4"},
                        {"Update number (embedded into ENC)", "2"}};
    CHECK(rows == expected);
  }
  SUBCASE("an empty array gives only the source type") {
    const Rows rows = Pairs(ChartDataSetRows({}, DataSetHeader{}, std::nullopt, Sources()));
    CHECK(rows == Rows{{"DataSet source type", "Non official"}});
  }
}

TEST_CASE("library rows: the scale falls back to element 2") {
  std::vector<ParameterValue> p(34);
  p[1] = Integer(3);
  p[2] = Text("1:50000");
  p[8] = Text("LIBBRST");
  p[9] = Text("Brest library");
  p[13] = Text("LB1");
  p[14] = Integer(7);
  p[16] = Date(45100);
  p[22] = Text("metres");
  p[25] = Text("MLWS");
  p[27] = Text("LAT");
  p[29] = Text("WGS 84");
  p[31] = Text("Mercator");
  const Rows expected{{"Name", "LIBBRST"},          {"Description", "Brest library"},
                      {"Echelle", "1:50000"},       {"Level", "3"},
                      {"Source identification code", "LB1"},
                      {"Edition date", "day 45100"}, {"Edition number", "7"},
                      {"Depth Height Units", "metres"}, {"Sounding Datum", "LAT"},
                      {"Vertical Datum", "MLWS"},   {"Horizontal Datum", "WGS 84"},
                      {"Projection", "Mercator"}};
  CHECK(Pairs(LibraryRows(p, Sources())) == expected);
  p[11] = Integer(25000);
  CHECK(LibraryRows(p, Sources())[2].value == "25000");
}

TEST_CASE("the text form of a chart dataset, from its header record") {
  DataSetHeader h;
  h.fileName = "FR5BR010.000";
  h.sourceId = "";
  h.sourceAgency = 31;
  h.agency = 4000000000u;  // unsigned 32-bit code, not listed
  h.scale = 22000;
  h.level = 5;
  h.usage = 5;
  h.updateDate = 0;                                // 1601-01-01: -109205
  h.issueDate = 131000000000000000ull;             // 2016-02-12 approximately
  h.edition = 65535;
  const std::string text = MetadataText(ChartDataSetTextRows(h, std::uint16_t{3}, Sources()));
  CHECK(text ==
        "DataSet filename\rFR5BR010.000\r"
        "Source identification code\r \r"
        "Source producing agency\rUKHO\r"
        "Producing agency\r4000000000\r"
        "Echelle\r22000\r"
        "Level\r5\r"
        "Intended usage\r5\r"
        "Update application date\rNon defini\r"
        "Issue date\rday 42415\r"
        "Edition number\r65535\r"
        "Update number (embedded into ENC)\r3\r");
  CHECK(MetadataText(ChartDataSetTextRows(DataSetHeader{}, std::nullopt, Sources())).empty());
}

TEST_CASE("file times become platform dates") {
  CHECK(PlatformDateOfFileTime(0) == doctest::Approx(-109205.0));
  // 1899-12-30 is 109205 days after 1601-01-01.
  CHECK(PlatformDateOfFileTime(109205ull * 864000000000ull) == doctest::Approx(0.0));
  CHECK(PlatformDateOfFileTime(109205ull * 864000000000ull + 432000000000ull) == doctest::Approx(0.5));
}
