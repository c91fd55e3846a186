#include "tools/tidefiles/station_json.h"

#include <cmath>
#include <set>
#include <sstream>

#include <nlohmann/json.hpp>

#include "tides/engine/station_files.h"
#include "tools/tidefiles/constituent_names.h"

namespace br::tidefiles {
namespace {

using Json = nlohmann::json;

constexpr double kDegrees = 180.0 / 3.14159265358979323846;


std::string Quoted(const std::string& s) { return "\"" + MessageText(s) + "\""; }

std::optional<double> FiniteNumber(const Json& value) {
  if (!value.is_number()) return std::nullopt;
  const double d = value.get<double>();
  if (!std::isfinite(d)) return std::nullopt;
  return d;
}

std::optional<long> WholeNumber(const Json& value, long low, long high) {
  const std::optional<double> d = FiniteNumber(value);
  if (!d || *d != std::floor(*d) || *d < static_cast<double>(low) || *d > static_cast<double>(high))
    return std::nullopt;
  return static_cast<long>(*d);
}

class StationReader {
 public:
  StationReader(std::size_t index, Diagnostics& diagnostics) : index_(index), diagnostics_(diagnostics) {}

  std::optional<StationEntry> Read(const Json& object) {
    if (!object.is_object()) {
      Error("is not a JSON object");
      return std::nullopt;
    }
    entry_.index = index_;
    ReadName(object);
    for (const auto& [key, value] : object.items()) {
      if (key == "name" || key == "constituents") continue;
      if (key == "latitude") {
        ReadCoordinate(value, "latitude", -90.0, 90.0, entry_.latitude);
      } else if (key == "longitude") {
        ReadCoordinate(value, "longitude", -180.0, 360.0, entry_.longitude);
        if (entry_.longitude > 180.0) entry_.longitude -= 360.0;
      } else if (key == "zone") {
        const std::optional<long> zone = WholeNumber(value, br::tides::kMinZone, br::tides::kMaxZone);
        if (zone) {
          entry_.zone = static_cast<int>(*zone);
        } else {
          Error("\"zone\" must be a whole number of hours from -14 to 12 (UTC+14 to UTC-12)");
        }
      } else if (key == "mean_level") {
        entry_.meanLevel = FiniteNumber(value);
        if (!entry_.meanLevel) Error("\"mean_level\" must be a number (metres)");
      } else if (key == "tag") {
        const std::optional<long> tag = WholeNumber(value, 0, 65535);
        if (tag) {
          entry_.tag = static_cast<std::uint16_t>(*tag);
        } else {
          Error("\"tag\" must be a whole number from 0 to 65535");
        }
      } else {
        Warning("unknown field " + Quoted(key) + " ignored");
      }
    }
    if (!object.contains("latitude")) Error("has no \"latitude\"");
    if (!object.contains("longitude")) Error("has no \"longitude\"");
    if (!object.contains("zone")) Error("has no \"zone\" (whole hours, UTC+1 is -1)");
    const auto constituents = object.find("constituents");
    if (constituents == object.end()) {
      Error("has no \"constituents\" array");
    } else if (!constituents->is_array()) {
      Error("\"constituents\" is not an array");
    } else {
      for (std::size_t i = 0; i < constituents->size(); ++i) ReadConstituent((*constituents)[i], i);
    }
    ReportDropped();
    if (failed_) return std::nullopt;
    return entry_;
  }

 private:
  std::string Where() const { return DescribeStation(index_, entry_.name); }
  void Error(const std::string& text) {
    diagnostics_.Error(Where() + ": " + text);
    failed_ = true;
  }
  void Warning(const std::string& text) { diagnostics_.Warning(Where() + ": " + text); }
  void Note(const std::string& text) { diagnostics_.Note(Where() + ": " + text); }

  void ReadName(const Json& object) {
    const auto name = object.find("name");
    if (name == object.end() || !name->is_string()) {
      Error("has no \"name\" string");
      return;
    }
    entry_.name = name->get<std::string>();
    if (entry_.name.empty()) Error("has an empty \"name\"");
  }

  void ReadCoordinate(const Json& value, const char* key, double low, double high, double& out) {
    const std::optional<double> d = FiniteNumber(value);
    if (!d || *d < low || *d > high) {
      std::ostringstream s;
      s << Quoted(key) << " must be a number of degrees from " << low << " to " << high;
      Error(s.str());
      return;
    }
    out = *d;
  }

  void ReadConstituent(const Json& item, std::size_t position) {
    const std::string where = "constituent " + std::to_string(position);
    if (!item.is_object()) {
      Error(where + " is not a JSON object");
      return;
    }
    ConstituentEntry c;
    std::optional<int> byNumber;
    std::optional<ConstituentMatch> byName;
    bool named = false;
    for (const auto& [key, value] : item.items()) {
      if (key == "name") {
        if (!value.is_string() || value.get_ref<const std::string&>().empty()) {
          Error(where + ": \"name\" must be a non-empty string");
          return;
        }
        const std::string& name = value.get_ref<const std::string&>();
        c.label = MessageText(name);  // the label only ever goes into messages
        named = true;
        byName = MatchConstituentName(name);
      } else if (key == "number") {
        const std::optional<long> n = WholeNumber(value, 0, br::tides::kConstituentCount - 1);
        if (!n) {
          Error(where + ": \"number\" must be a whole number from 0 to 68");
          return;
        }
        byNumber = static_cast<int>(*n);
      } else if (key != "amplitude" && key != "phase") {
        Warning(where + ": unknown field " + Quoted(key) + " ignored");
      }
    }
    const auto amplitude = item.find("amplitude");
    const auto phase = item.find("phase");
    const std::optional<double> a = amplitude == item.end() ? std::nullopt : FiniteNumber(*amplitude);
    const std::optional<double> g = phase == item.end() ? std::nullopt : FiniteNumber(*phase);
    if (!named && !byNumber) {
      Error(where + " has neither \"name\" nor \"number\"");
      return;
    }
    if (!named) c.label = "number " + std::to_string(*byNumber);
    if (!a) {
      Error(where + " (" + c.label + ") needs a number \"amplitude\" (metres)");
      return;
    }
    if (!g) {
      Error(where + " (" + c.label + ") needs a number \"phase\" (degrees)");
      return;
    }
    if (named && byNumber && (!byName || byName->row != *byNumber)) {
      Error(where + ": name " + Quoted(c.label) + " is not table row " + std::to_string(*byNumber));
      return;
    }
    if (!byNumber && !byName) {
      dropped_.push_back(c.label);
      return;
    }
    if (*a < 0.0) {
      Warning(c.label + ": negative amplitude cannot be stored; dropped");
      return;
    }
    c.row = byNumber ? *byNumber : byName->row;
    c.amplitude = *a;
    c.phase = *g;
    const bool viaDoodson = !byNumber && byName->via == ConstituentMatch::Via::DoodsonNumbers;
    if (c.row == 0 && HasMeanLevel()) {
      Error(c.label + ": the mean level is given twice (\"mean_level\" and constituent 0)");
      return;
    }
    Merge(std::move(c), viaDoodson);
  }

  bool HasMeanLevel() const { return entry_.meanLevel.has_value(); }

  // Keeps a row once: a repeat of the same constituent is dropped, a different constituent
  // of the same Doodson numbers (2MK3 beside MO3) is added to it as a wave of equal speed.
  void Merge(ConstituentEntry c, bool viaDoodson) {
    for (std::size_t i = 0; i < entry_.constituents.size(); ++i) {
      ConstituentEntry& kept = entry_.constituents[i];
      if (kept.row != c.row) continue;
      if (!viaDoodson && !viaDoodson_[i]) {
        Warning(c.label + " repeats " + kept.label + " (table row " + std::to_string(c.row) + "); dropped");
        return;
      }
      const double x = kept.amplitude * std::cos(kept.phase / kDegrees) + c.amplitude * std::cos(c.phase / kDegrees);
      const double y = kept.amplitude * std::sin(kept.phase / kDegrees) + c.amplitude * std::sin(c.phase / kDegrees);
      kept.amplitude = std::hypot(x, y);
      kept.phase = std::atan2(y, x) * kDegrees;
      if (kept.phase < 0.0) kept.phase += 360.0;
      Note(c.label + " has the Doodson numbers of " + kept.label + " (table row " + std::to_string(c.row) +
           "); added to it");
      kept.label += "+" + c.label;
      viaDoodson_[i] = true;
      return;
    }
    if (viaDoodson) {
      Note(c.label + " has the Doodson numbers of table row " + std::to_string(c.row) + "; stored as that row");
    }
    entry_.constituents.push_back(std::move(c));
    viaDoodson_.push_back(viaDoodson);
  }

  void ReportDropped() {
    if (dropped_.empty()) return;
    std::string list;
    for (const std::string& name : dropped_) list += (list.empty() ? "" : ", ") + name;
    Warning("no table row for " + list + "; dropped");
  }

  std::size_t index_;
  Diagnostics& diagnostics_;
  StationEntry entry_;
  std::vector<bool> viaDoodson_;
  std::vector<std::string> dropped_;
  bool failed_ = false;
};

std::string Number(double value) { return Json(value).dump(); }

// Decimal degrees of whole minutes print with six places; rounding back is exact.
double Rounded(double value, double scale) { return std::round(value * scale) / scale; }

}  // namespace

std::vector<StationEntry> ReadStationsJson(std::string_view text, Diagnostics& diagnostics) {
  std::vector<StationEntry> stations;
  Json root;
  try {
    root = Json::parse(text.begin(), text.end());
  } catch (const Json::exception& e) {
    diagnostics.Error(std::string("not valid JSON: ") + e.what());
    return stations;
  }
  if (!root.is_array()) {
    diagnostics.Error("the station JSON must be an array of stations");
    return stations;
  }
  for (std::size_t i = 0; i < root.size(); ++i) {
    StationReader reader(i, diagnostics);
    if (std::optional<StationEntry> entry = reader.Read(root[i])) stations.push_back(std::move(*entry));
  }
  return stations;
}

std::string WriteStationsJson(const std::vector<StationEntry>& stations) {
  std::string out = "[";
  for (std::size_t i = 0; i < stations.size(); ++i) {
    const StationEntry& s = stations[i];
    out += i == 0 ? "\n" : ",\n";
    out += "  {\n";
    out += "    \"name\": " + Json(s.name).dump(-1, ' ', false, Json::error_handler_t::replace) + ",\n";
    out += "    \"latitude\": " + Number(Rounded(s.latitude, 1e6)) + ",\n";
    out += "    \"longitude\": " + Number(Rounded(s.longitude, 1e6)) + ",\n";
    out += "    \"zone\": " + std::to_string(s.zone) + ",\n";
    if (s.meanLevel) out += "    \"mean_level\": " + Number(*s.meanLevel) + ",\n";
    if (s.tag != 0) out += "    \"tag\": " + std::to_string(s.tag) + ",\n";
    out += "    \"constituents\": [";
    for (std::size_t k = 0; k < s.constituents.size(); ++k) {
      const ConstituentEntry& c = s.constituents[k];
      out += k == 0 ? "\n" : ",\n";
      const std::string_view usual = UsualConstituentName(c.row);
      out += "      {";
      out += usual.empty() ? "\"number\": " + std::to_string(c.row) : "\"name\": " + Json(std::string(usual)).dump();
      out += ", \"amplitude\": " + Number(c.amplitude) + ", \"phase\": " + Number(c.phase) + "}";
    }
    out += s.constituents.empty() ? "]\n" : "\n    ]\n";
    out += "  }";
  }
  out += stations.empty() ? "]\n" : "\n]\n";
  return out;
}

}  // namespace br::tidefiles
