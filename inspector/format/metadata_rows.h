#pragma once
// The metadata rows of a dataset, in the order the attribute panel shows them, and their
// text form. What comes from outside (parameter values, captions, dates, agency names,
// catalogue texts, angles) arrives already read, or through the lookups of
// MetadataSources, so the rules here need no Windows API and are tested natively.
//
// A row is kept only when caption and value are both non-empty; a row whose caption is
// kHeadingCaption is a heading, its value the heading's text.

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "frame/geo/dataset_header.h"

namespace br::inspector {

inline constexpr const char* kHeadingCaption = "$HEADER$";

struct MetadataRow {
  std::string caption;
  std::string value;
};

// One element of a dataset's parameter array, as far as the rows can show it.
struct ParameterValue {
  enum Kind { kNone, kText, kDate, kInteger };
  Kind kind = kNone;
  std::string text;          // kText
  double date = 0;           // kDate: a platform date
  std::int64_t integer = 0;  // kInteger
};

struct MetadataSources {
  // A caption or fixed text of section "ObjInspector" by id, with its default.
  std::function<std::string(long id, const char* defaultText)> text;
  // A platform date as "dd.MM.yyyy"; empty when it cannot be converted.
  std::function<std::string(double date)> date;
  // The producing agency's name; empty when the code is not listed.
  std::function<std::string(long code)> agency;
  // The catalogue text of an enumerated value of an attribute given by acronym; none
  // when the lookup fails (the row is then left out).
  std::function<std::optional<std::string>(const char* acronym, long value)> catalogue;
  // A datum shift in the dataset's normalised angle unit as degrees; none without the
  // geodesy library.
  std::function<std::optional<double>(long normalised)> degrees;
};

// A file time (100 ns since 1601) as a platform date (days since 1899-12-30).
double PlatformDateOfFileTime(std::uint64_t fileTime);

// An element as a value text: a text as it is, a date through sources.date ("Not
// defined" when that fails), an integer in decimal; empty for a missing element.
std::string ParameterText(const std::vector<ParameterValue>& parameters, std::size_t index,
                          const MetadataSources& sources);

// The rows of an electronic chart dataset: its parameters, header record and the update
// number embedded in it (none when the dataset does not know it).
std::vector<MetadataRow> ChartDataSetRows(const std::vector<ParameterValue>& parameters,
                                          const geo::DataSetHeader& header,
                                          std::optional<std::uint16_t> embeddedUpdate,
                                          const MetadataSources& sources);

// The rows of a library dataset.
std::vector<MetadataRow> LibraryRows(const std::vector<ParameterValue>& parameters, const MetadataSources& sources);

// The rows of the text form of a chart dataset, from its header record alone.
std::vector<MetadataRow> ChartDataSetTextRows(const geo::DataSetHeader& header,
                                              std::optional<std::uint16_t> embeddedUpdate,
                                              const MetadataSources& sources);

// Caption, carriage return, value, carriage return, for each row.
std::string MetadataText(const std::vector<MetadataRow>& rows);

}  // namespace br::inspector
