// Tide station files: the three files of a station folder and the process-wide reader.
//
// A folder holds
//   "td_num.ntx"  StationIndexRecords in station-number order (its length fixes the count),
//   "td_crd.ntx"  the same records sorted by the unsigned StationKey (binary-searched),
//   "td_pnt.dat"  one block per station: a StationHeader and its ConstituentRecords.
// Every multi-byte field is little-endian. The Encode/Decode helpers below work on byte
// images and do not depend on struct packing or on the host's byte order, so tools that
// write or check station folders use them as well as the reader.
//
// Phases in the files are Greenwich phase lags (referred to universal time), in tenths of a
// degree; amplitudes are in thousandths of the published height unit.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>

namespace br::tides {

inline constexpr const char kStationIndexFileName[] = "td_num.ntx";
inline constexpr const char kCoordinateIndexFileName[] = "td_crd.ntx";
inline constexpr const char kStationDataFileName[] = "td_pnt.dat";

// Longest folder path OpenTideFiles accepts (characters, without the terminator).
inline constexpr std::size_t kMaxFolderLength = 240;
// Rows of the constituent table: the mean level (0) and constituents 1..68.
inline constexpr int kConstituentCount = 69;
// Station numbers are signed 16-bit on every interface that names them.
inline constexpr std::int32_t kMaxStationCount = 32767;

// One record of either index file (10 bytes on disk).
struct StationIndexRecord {
  static constexpr std::size_t kSize = 10;
  using Bytes = std::array<std::uint8_t, kSize>;

  std::uint16_t station = 0;   // carried with the record, not interpreted
  std::int16_t latitude = 0;   // whole minutes of arc, north positive
  std::int16_t longitude = 0;  // whole minutes of arc, east positive
  std::uint32_t offset = 0;    // byte offset of the station's block in "td_pnt.dat"
};

// Station block header (46 bytes on disk).
struct StationHeader {
  static constexpr std::size_t kSize = 46;
  static constexpr std::size_t kNameSize = 40;
  using Bytes = std::array<std::uint8_t, kSize>;

  std::array<char, kNameSize> name{};  // ANSI code page, zero-terminated when shorter
  std::int16_t latitude = 0;           // minutes of arc, north positive
  std::int16_t longitude = 0;          // minutes of arc, east positive
  std::int8_t zone = 0;                // hours: universal time = zone time + zone (UTC+1 holds -1)
  std::int8_t constituentCount = 0;    // records that follow, 0..69
};

// What a station header can hold. Zones run from UTC-12 (12) to UTC+14 (-14), the
// world's standard times; positions are whole minutes of real latitudes and longitudes.
inline constexpr int kMinZone = -14;
inline constexpr int kMaxZone = 12;
inline constexpr int kMaxLatitudeMinutes = 90 * 60;
inline constexpr int kMaxLongitudeMinutes = 180 * 60;

inline constexpr bool ZoneIsPossible(int zone) { return zone >= kMinZone && zone <= kMaxZone; }
inline constexpr bool LatitudeIsPossible(int minutes) {
  return minutes >= -kMaxLatitudeMinutes && minutes <= kMaxLatitudeMinutes;
}
inline constexpr bool LongitudeIsPossible(int minutes) {
  return minutes >= -kMaxLongitudeMinutes && minutes <= kMaxLongitudeMinutes;
}

// One harmonic constituent of a station (6 bytes on disk).
struct ConstituentRecord {
  static constexpr std::size_t kSize = 6;
  using Bytes = std::array<std::uint8_t, kSize>;

  std::int16_t number = 0;      // row of the constituent table, 0 = mean level
  std::uint16_t phase = 0;      // Greenwich phase lag g, tenths of a degree
  std::uint16_t amplitude = 0;  // thousandths of the published height unit
};

// ---- little-endian field helpers ----------------------------------------------------------

inline void PutU16(std::uint8_t* p, std::uint16_t v) {
  p[0] = static_cast<std::uint8_t>(v & 0xFFu);
  p[1] = static_cast<std::uint8_t>(v >> 8);
}
inline void PutU32(std::uint8_t* p, std::uint32_t v) {
  for (int i = 0; i < 4; ++i) p[i] = static_cast<std::uint8_t>((v >> (8 * i)) & 0xFFu);
}
inline std::uint16_t GetU16(const std::uint8_t* p) {
  return static_cast<std::uint16_t>(p[0] | (p[1] << 8));
}
inline std::uint32_t GetU32(const std::uint8_t* p) {
  return static_cast<std::uint32_t>(p[0]) | (static_cast<std::uint32_t>(p[1]) << 8) |
         (static_cast<std::uint32_t>(p[2]) << 16) | (static_cast<std::uint32_t>(p[3]) << 24);
}
// Two's-complement reinterpretation without implementation-defined conversions.
inline std::int16_t GetI16(const std::uint8_t* p) {
  const std::uint16_t u = GetU16(p);
  return u < 0x8000u ? static_cast<std::int16_t>(u) : static_cast<std::int16_t>(static_cast<int>(u) - 0x10000);
}
inline std::int8_t ToI8(std::uint8_t u) {
  return u < 0x80u ? static_cast<std::int8_t>(u) : static_cast<std::int8_t>(static_cast<int>(u) - 0x100);
}

// ---- record images -------------------------------------------------------------------------

inline StationIndexRecord::Bytes EncodeStationIndexRecord(const StationIndexRecord& r) {
  StationIndexRecord::Bytes b{};
  PutU16(&b[0], r.station);
  PutU16(&b[2], static_cast<std::uint16_t>(r.latitude));
  PutU16(&b[4], static_cast<std::uint16_t>(r.longitude));
  PutU32(&b[6], r.offset);
  return b;
}
inline StationIndexRecord DecodeStationIndexRecord(const std::uint8_t* b) {
  StationIndexRecord r;
  r.station = GetU16(&b[0]);
  r.latitude = GetI16(&b[2]);
  r.longitude = GetI16(&b[4]);
  r.offset = GetU32(&b[6]);
  return r;
}

inline StationHeader::Bytes EncodeStationHeader(const StationHeader& h) {
  StationHeader::Bytes b{};
  for (std::size_t i = 0; i < StationHeader::kNameSize; ++i) b[i] = static_cast<std::uint8_t>(h.name[i]);
  PutU16(&b[40], static_cast<std::uint16_t>(h.latitude));
  PutU16(&b[42], static_cast<std::uint16_t>(h.longitude));
  b[44] = static_cast<std::uint8_t>(h.zone);
  b[45] = static_cast<std::uint8_t>(h.constituentCount);
  return b;
}
inline StationHeader DecodeStationHeader(const std::uint8_t* b) {
  StationHeader h;
  for (std::size_t i = 0; i < StationHeader::kNameSize; ++i) h.name[i] = static_cast<char>(b[i]);
  h.latitude = GetI16(&b[40]);
  h.longitude = GetI16(&b[42]);
  h.zone = ToI8(b[44]);
  h.constituentCount = ToI8(b[45]);
  return h;
}

inline ConstituentRecord::Bytes EncodeConstituentRecord(const ConstituentRecord& c) {
  ConstituentRecord::Bytes b{};
  PutU16(&b[0], static_cast<std::uint16_t>(c.number));
  PutU16(&b[2], c.phase);
  PutU16(&b[4], c.amplitude);
  return b;
}
inline ConstituentRecord DecodeConstituentRecord(const std::uint8_t* b) {
  ConstituentRecord c;
  c.number = GetI16(&b[0]);
  c.phase = GetU16(&b[2]);
  c.amplitude = GetU16(&b[4]);
  return c;
}

// The station name up to its terminator (at most 40 bytes, stored code page unchanged).
inline std::string StationName(const StationHeader& h) {
  std::size_t n = 0;
  while (n < StationHeader::kNameSize && h.name[n] != '\0') ++n;
  return std::string(h.name.data(), n);
}
// Stores name cut to the 40-byte field; shorter names are zero-filled.
inline void SetStationName(StationHeader& h, const std::string& name) {
  h.name.fill('\0');
  for (std::size_t i = 0; i < name.size() && i < StationHeader::kNameSize; ++i) h.name[i] = name[i];
}

// ---- search key ---------------------------------------------------------------------------

// Bytes 2..5 of an index record read as one unsigned little-endian number: latitude as
// unsigned 16 bits in the low half, longitude in the high half. "td_crd.ntx" is sorted
// ascending by it, so negative values sort after the positive ones of the same half.
inline constexpr std::uint32_t StationKey(std::int16_t latitude, std::int16_t longitude) {
  return static_cast<std::uint32_t>(static_cast<std::uint16_t>(latitude)) |
         (static_cast<std::uint32_t>(static_cast<std::uint16_t>(longitude)) << 16);
}
inline constexpr std::uint32_t StationKey(const StationIndexRecord& r) {
  return StationKey(r.latitude, r.longitude);
}

// ---- the process-wide reader -------------------------------------------------------------
// None of these is re-entrant: the engine is one set of process-wide tables, used from one
// thread at a time, and FindStation..prediction must not be interleaved with another station.

// Opens a station folder (8-bit path, at most 240 characters; a trailing '\\' or '/' is
// optional). Reads both index files whole and keeps "td_pnt.dat" open. Returns 0 on success,
// -1 on any failure: null or over-long path, a file that cannot be opened, an index file
// shorter than the station count's records, or more than 32767 stations. May be called again
// after a failure (or to replace an open folder); keeping to one successful open per process
// is the caller's rule.
int OpenTideFiles(const char* folder);

// Closes "td_pnt.dat" and frees both index tables; the station count reads 0 afterwards.
void CloseTideFiles();

// Number of stations of the last successful open (0 when none is open). Resets the
// constituent table's speeds and nodal values first.
std::int32_t StationCount();

// Copies the "td_num.ntx" record of station number position. Resets the constituent table
// first. Returns false (out unchanged) when position is outside 0..count-1.
bool ReadStationIndexRecord(std::int32_t position, StationIndexRecord& out);

// A header no sound station has: a zone, latitude or longitude out of range, or a
// constituent count outside 0..69. Its numbers would only give confident nonsense.
bool IsImpossibleHeader(const StationHeader& header);

// Finds the station whose StationKey equals key's and loads its constituents into the
// working records. Returns true with header written when found and its block read whole;
// false when no station has the key, its header is impossible (IsImpossibleHeader) or its
// block cannot be read whole (header and working records unwritten). The constituent
// table's used flags are cleared either way. A record whose number lies outside 0..68 is
// skipped.
bool FindStation(const StationIndexRecord& key, StationHeader& header);

}  // namespace br::tides
