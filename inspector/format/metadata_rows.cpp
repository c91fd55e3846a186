#include "inspector/format/metadata_rows.h"

#include <climits>
#include <cstdio>

namespace br::inspector {

namespace {

// Elements of the parameter array of a chart dataset.
enum ChartElement : std::size_t {
  kFileName = 2,
  kEdition = 3,
  kUpdate = 4,
  kUpdateDate = 5,
  kIssueDate = 6,
  kOfficial = 10,
  kAgency = 11,
  kSourceAgency = 12,
  kSourceId = 13,
  kArchiveCode = 15,
  kTitle = 22,
  kHorizontalDatum = 23,
  kHorizontalDatumSource = 24,
  kShiftLon = 25,
  kShiftLat = 26,
  kVerticalDatum = 27,
  kSoundingDatum = 28,
  kScale = 29,
};

// Elements of the parameter array of a library dataset.
enum LibraryElement : std::size_t {
  kLibLevel = 1,
  kLibFileName = 2,
  kLibName = 8,
  kLibDescription = 9,
  kLibScale = 11,
  kLibSourceId = 13,
  kLibEdition = 14,
  kLibEditionDate = 16,
  kLibUnits = 22,
  kLibVerticalDatum = 25,
  kLibSoundingDatum = 27,
  kLibHorizontalDatum = 29,
  kLibProjection = 31,
};

constexpr double kFileTimeTicksPerDay = 864000000000.0;
constexpr double kFileTimeEpochInPlatformDays = -109205.0;  // 1601-01-01

class RowList {
public:
  explicit RowList(const MetadataSources& sources) : sources_(sources) {}

  std::string Text(long id, const char* defaultText) const {
    return sources_.text ? sources_.text(id, defaultText) : std::string(defaultText);
  }
  void Add(long id, const char* defaultText, std::string value) {
    std::string caption = Text(id, defaultText);
    if (caption.empty() || value.empty()) return;
    rows_.push_back({std::move(caption), std::move(value)});
  }
  std::vector<MetadataRow> Take() { return std::move(rows_); }

private:
  const MetadataSources& sources_;
  std::vector<MetadataRow> rows_;
};

const ParameterValue* At(const std::vector<ParameterValue>& parameters, std::size_t index) {
  return index < parameters.size() ? &parameters[index] : nullptr;
}

std::optional<std::int64_t> Integer(const std::vector<ParameterValue>& parameters, std::size_t index) {
  const ParameterValue* value = At(parameters, index);
  if (value == nullptr || value->kind != ParameterValue::kInteger) return std::nullopt;
  return value->integer;
}

std::string Decimal(std::int64_t value) { return std::to_string(value); }

// Header codes are unsigned 32-bit, parameter codes signed 16-bit: both fit 64 bits, and
// only a code that fits a long is looked up.
std::string AgencyText(const MetadataSources& sources, std::int64_t code) {
  const bool fits = code >= LONG_MIN && code <= LONG_MAX;
  std::string name = sources.agency && fits ? sources.agency(static_cast<long>(code)) : std::string();
  return name.empty() ? Decimal(code) : name;
}

std::string DateText(const MetadataSources& sources, double date, const RowList& rows) {
  std::string text = sources.date ? sources.date(date) : std::string();
  return text.empty() ? rows.Text(4, "Not defined") : text;
}

// The catalogue text of an element; none when the element or the lookup is missing.
std::optional<std::string> DatumText(const std::vector<ParameterValue>& parameters, std::size_t index,
                                     const char* acronym, const MetadataSources& sources) {
  const std::optional<std::int64_t> value = Integer(parameters, index);
  if (!value || !sources.catalogue) return std::nullopt;
  return sources.catalogue(acronym, static_cast<long>(*value));
}

// A datum shift in minutes of arc, "%.5f'".
std::string ShiftText(const std::vector<ParameterValue>& parameters, std::size_t index,
                      const MetadataSources& sources) {
  const std::optional<std::int64_t> value = Integer(parameters, index);
  if (!value || !sources.degrees) return {};
  const std::optional<double> degrees = sources.degrees(static_cast<std::int32_t>(*value));
  if (!degrees) return {};
  char text[400];  // room for the widest double
  std::snprintf(text, sizeof text, "%.5f'", *degrees * 60.0);
  return text;
}

}  // namespace

double PlatformDateOfFileTime(std::uint64_t fileTime) {
  return kFileTimeEpochInPlatformDays + static_cast<double>(fileTime) / kFileTimeTicksPerDay;
}

std::string ParameterText(const std::vector<ParameterValue>& parameters, std::size_t index,
                          const MetadataSources& sources) {
  const ParameterValue* value = At(parameters, index);
  if (value == nullptr) return {};
  switch (value->kind) {
    case ParameterValue::kText:
      return value->text;
    case ParameterValue::kDate:
      return DateText(sources, value->date, RowList(sources));
    case ParameterValue::kInteger:
      return Decimal(value->integer);
    case ParameterValue::kNone:
      break;
  }
  return {};
}

std::vector<MetadataRow> ChartDataSetRows(const std::vector<ParameterValue>& parameters,
                                          const geo::DataSetHeader& header,
                                          std::optional<std::uint16_t> embeddedUpdate,
                                          const MetadataSources& sources) {
  RowList rows(sources);
  const auto element = [&](std::size_t index) { return ParameterText(parameters, index, sources); };

  std::string fileName = element(kFileName);
  if (!fileName.empty() && header.status) {
    if (*header.status & geo::kHeaderStatusTerminated) fileName += " (" + rows.Text(33, "TERMINATED") + ")";
    if (*header.status & geo::kHeaderStatusNewEdition) fileName += " (" + rows.Text(34, "NEW EDITION AVAILABLE") + ")";
  }
  rows.Add(24, "DataSet filename", fileName);
  rows.Add(25, "Chart Title", element(kTitle));

  const std::optional<std::int64_t> official = Integer(parameters, kOfficial);
  const std::optional<std::int64_t> agency = Integer(parameters, kAgency);
  const std::optional<std::int64_t> sourceAgency = Integer(parameters, kSourceAgency);
  const auto known = [](const std::optional<std::int64_t>& code) {
    return code && static_cast<std::int16_t>(*code) != -1;
  };
  const bool isOfficial = official && *official == 0 && known(sourceAgency) && known(agency);
  rows.Add(56, "DataSet source type", isOfficial ? rows.Text(57, "Official") : rows.Text(58, "Non official"));
  rows.Add(15, "Source identification code", element(kSourceId));
  // Agency codes are 16-bit in the parameters.
  if (sourceAgency) rows.Add(26, "Source producing agency", AgencyText(sources, static_cast<std::int16_t>(*sourceAgency)));
  if (agency) rows.Add(27, "Producing agency", AgencyText(sources, static_cast<std::int16_t>(*agency)));
  if (const auto scale = Integer(parameters, kScale)) rows.Add(13, "Scale", Decimal(static_cast<std::int32_t>(*scale)));
  rows.Add(29, "Update application date", element(kUpdateDate));
  rows.Add(30, "Issue date", element(kIssueDate));
  if (const auto edition = Integer(parameters, kEdition)) {
    rows.Add(17, "Edition number", Decimal(static_cast<std::uint16_t>(*edition)));
  }
  rows.Add(31, "Update number (embedded into ENC)", embeddedUpdate ? Decimal(*embeddedUpdate) : element(kUpdate));
  rows.Add(47, "Archive Code", element(kArchiveCode));
  if (const auto datum = DatumText(parameters, kHorizontalDatum, "HORDAT", sources)) {
    rows.Add(22, "Horizontal Datum", *datum);
  }
  if (const auto datum = DatumText(parameters, kHorizontalDatumSource, "HORDAT", sources)) {
    rows.Add(48, "Horizontal Datum Source", *datum);
  }
  rows.Add(49, "Lon Horizontal Datum Shift", ShiftText(parameters, kShiftLon, sources));
  rows.Add(50, "Lat Horizontal Datum Shift", ShiftText(parameters, kShiftLat, sources));
  if (const auto datum = DatumText(parameters, kVerticalDatum, "VERDAT", sources)) {
    rows.Add(21, "Vertical Datum", datum->empty() ? rows.Text(4, "Not defined") : *datum);
  }
  if (const auto datum = DatumText(parameters, kSoundingDatum, "VERDAT", sources)) {
    rows.Add(19, "Sounding Datum", datum->empty() ? rows.Text(4, "Not defined") : *datum);
  }
  if (header.level) rows.Add(14, "Level", Decimal(*header.level));
  if (header.usage) rows.Add(20, "Intended usage", Decimal(*header.usage));
  return rows.Take();
}

std::vector<MetadataRow> LibraryRows(const std::vector<ParameterValue>& parameters, const MetadataSources& sources) {
  RowList rows(sources);
  const auto element = [&](std::size_t index) { return ParameterText(parameters, index, sources); };
  rows.Add(11, "Name", element(kLibName));
  rows.Add(12, "Description", element(kLibDescription));
  std::string scale = element(kLibScale);
  rows.Add(13, "Scale", scale.empty() ? element(kLibFileName) : scale);
  rows.Add(14, "Level", element(kLibLevel));
  rows.Add(15, "Source identification code", element(kLibSourceId));
  rows.Add(16, "Edition date", element(kLibEditionDate));
  rows.Add(17, "Edition number", element(kLibEdition));
  rows.Add(18, "Depth Height Units", element(kLibUnits));
  rows.Add(19, "Sounding Datum", element(kLibSoundingDatum));
  rows.Add(21, "Vertical Datum", element(kLibVerticalDatum));
  rows.Add(22, "Horizontal Datum", element(kLibHorizontalDatum));
  rows.Add(23, "Projection", element(kLibProjection));
  return rows.Take();
}

std::vector<MetadataRow> ChartDataSetTextRows(const geo::DataSetHeader& header,
                                              std::optional<std::uint16_t> embeddedUpdate,
                                              const MetadataSources& sources) {
  RowList rows(sources);
  if (header.fileName) rows.Add(24, "DataSet filename", *header.fileName);
  if (header.sourceId) rows.Add(15, "Source identification code", header.sourceId->empty() ? " " : *header.sourceId);
  if (header.sourceAgency) {
    rows.Add(26, "Source producing agency", AgencyText(sources, *header.sourceAgency));
  }
  if (header.agency) rows.Add(27, "Producing agency", AgencyText(sources, *header.agency));
  if (header.scale) rows.Add(13, "Scale", Decimal(*header.scale));
  if (header.level) rows.Add(14, "Level", Decimal(*header.level));
  if (header.usage) rows.Add(20, "Intended usage", Decimal(*header.usage));
  if (header.updateDate) {
    rows.Add(29, "Update application date", DateText(sources, PlatformDateOfFileTime(*header.updateDate), rows));
  }
  if (header.issueDate) rows.Add(30, "Issue date", DateText(sources, PlatformDateOfFileTime(*header.issueDate), rows));
  if (header.edition) rows.Add(17, "Edition number", Decimal(*header.edition));
  if (embeddedUpdate) rows.Add(31, "Update number (embedded into ENC)", Decimal(*embeddedUpdate));
  return rows.Take();
}

std::string MetadataText(const std::vector<MetadataRow>& rows) {
  std::string text;
  for (const MetadataRow& row : rows) {
    text += row.caption;
    text += '\r';
    text += row.value;
    text += '\r';
  }
  return text;
}

}  // namespace br::inspector
