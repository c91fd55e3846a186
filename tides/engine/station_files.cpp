#include "tides/engine/station_files.h"

#include <algorithm>
#include <climits>
#include <cstdio>
#include <cstring>
#include <memory>
#include <vector>

#include "tides/engine/TideEngine.h"

namespace br::tides {

namespace {

#ifdef _WIN32
constexpr char kPathSeparator = '\\';
#else
constexpr char kPathSeparator = '/';
#endif

// Longest station block: a header and 69 constituent records.
constexpr std::size_t kMaxBlockSize = StationHeader::kSize + kConstituentCount * ConstituentRecord::kSize;
constexpr std::uint32_t kNotRead = UINT32_MAX;

struct StationFiles {
  std::vector<StationIndexRecord> byNumber;  // "td_num.ntx"
  std::vector<StationIndexRecord> byKey;     // "td_crd.ntx"
  std::FILE* data = nullptr;                 // "td_pnt.dat", open while a folder is open
  // Blocks already read whole from this open "td_pnt.dat", so a station predicted day after
  // day is read once: per "td_crd.ntx" record the start of its block's bytes in blocks, or
  // kNotRead. Both are emptied with the stream, so no other folder's bytes are ever served.
  std::vector<std::uint32_t> blockStart;
  std::vector<std::uint8_t> blocks;
};

StationFiles& Files() {
  static StationFiles files;
  return files;
}

struct FileCloser {
  void operator()(std::FILE* f) const {
    if (f) std::fclose(f);
  }
};

// Reads up to limit bytes of a file; false when it cannot be opened or read.
bool ReadWholeFile(const std::string& path, std::size_t limit, std::vector<std::uint8_t>& out) {
  std::unique_ptr<std::FILE, FileCloser> f(std::fopen(path.c_str(), "rb"));
  if (!f) return false;
  out.clear();
  std::uint8_t chunk[4096];
  while (out.size() < limit) {
    const std::size_t want = std::min(sizeof chunk, limit - out.size());
    const std::size_t got = std::fread(chunk, 1, want, f.get());
    out.insert(out.end(), chunk, chunk + got);
    if (got < want) break;
  }
  return !std::ferror(f.get());
}

std::vector<StationIndexRecord> DecodeIndex(const std::vector<std::uint8_t>& bytes, std::size_t count) {
  std::vector<StationIndexRecord> records;
  records.reserve(count);
  for (std::size_t i = 0; i < count; ++i)
    records.push_back(DecodeStationIndexRecord(bytes.data() + i * StationIndexRecord::kSize));
  return records;
}

// The bytes of a block whose header is possible and whose records are all there, or null.
// Read once, with one read of the longest block (fewer bytes at the end of the file).
const std::uint8_t* StationBlock(StationFiles& files, std::size_t position) {
  const std::uint32_t start = files.blockStart[position];
  if (start != kNotRead) return files.blocks.data() + start;
  const std::uint32_t offset = files.byKey[position].offset;
  if (offset > static_cast<std::uint32_t>(LONG_MAX)) return nullptr;
  if (std::fseek(files.data, static_cast<long>(offset), SEEK_SET) != 0) return nullptr;
  std::uint8_t buffer[kMaxBlockSize];
  const std::size_t got = std::fread(buffer, 1, sizeof buffer, files.data);
  if (got < StationHeader::kSize) return nullptr;
  // A damaged header counts as no station, like a block cut short.
  const StationHeader header = DecodeStationHeader(buffer);
  if (IsImpossibleHeader(header)) return nullptr;
  const std::size_t size =
      StationHeader::kSize + static_cast<std::size_t>(header.constituentCount) * ConstituentRecord::kSize;
  if (got < size) return nullptr;
  // At most 32767 blocks of kMaxBlockSize bytes: the starts fit in 32 bits.
  files.blockStart[position] = static_cast<std::uint32_t>(files.blocks.size());
  files.blocks.insert(files.blocks.end(), buffer, buffer + size);
  return files.blocks.data() + files.blockStart[position];
}

}  // namespace

int OpenTideFiles(const char* folder) {
  CloseTideFiles();
  if (folder == nullptr) return -1;
  const std::size_t length = std::strlen(folder);
  // An empty path has no folder to name; the limit keeps every full name within 260.
  if (length == 0 || length > kMaxFolderLength) return -1;

  std::string base(folder, length);
  if (base.back() != '\\' && base.back() != '/') base += kPathSeparator;

  // One byte more than the largest allowed index shows a file with too many stations.
  const std::size_t limit = (static_cast<std::size_t>(kMaxStationCount) + 1) * StationIndexRecord::kSize;
  std::vector<std::uint8_t> numbers, coordinates;
  if (!ReadWholeFile(base + kStationIndexFileName, limit, numbers)) return -1;
  const std::size_t count = numbers.size() / StationIndexRecord::kSize;
  if (count > static_cast<std::size_t>(kMaxStationCount)) return -1;
  if (!ReadWholeFile(base + kCoordinateIndexFileName, limit, coordinates)) return -1;
  // The coordinate index must hold a record for every station; extra bytes are ignored.
  if (coordinates.size() < count * StationIndexRecord::kSize) return -1;

  std::FILE* data = std::fopen((base + kStationDataFileName).c_str(), "rb");
  if (!data) return -1;

  StationFiles& files = Files();
  files.byNumber = DecodeIndex(numbers, count);
  files.byKey = DecodeIndex(coordinates, count);
  files.data = data;
  files.blockStart.assign(count, kNotRead);
  return 0;
}

void CloseTideFiles() {
  StationFiles& files = Files();
  if (files.data) std::fclose(files.data);
  files.data = nullptr;
  files.byNumber.clear();
  files.byNumber.shrink_to_fit();
  files.byKey.clear();
  files.byKey.shrink_to_fit();
  files.blockStart.clear();
  files.blockStart.shrink_to_fit();
  files.blocks.clear();
  files.blocks.shrink_to_fit();
}

std::int32_t StationCount() {
  ResetConstituents();
  return static_cast<std::int32_t>(Files().byNumber.size());
}

bool ReadStationIndexRecord(std::int32_t position, StationIndexRecord& out) {
  ResetConstituents();
  const auto& records = Files().byNumber;
  if (position < 0 || static_cast<std::size_t>(position) >= records.size()) return false;
  out = records[static_cast<std::size_t>(position)];
  return true;
}

bool IsImpossibleHeader(const StationHeader& header) {
  return !ZoneIsPossible(header.zone) || !LatitudeIsPossible(header.latitude) ||
         !LongitudeIsPossible(header.longitude) || header.constituentCount < 0 ||
         header.constituentCount > kConstituentCount;
}

bool FindStation(const StationIndexRecord& key, StationHeader& header) {
  TideEngine& engine = TheTideEngine();
  for (ConstituentTableEntry& c : engine.constituents) c.used = 0;

  StationFiles& files = Files();
  if (!files.data) return false;
  const std::uint32_t wanted = StationKey(key);
  const auto found = std::lower_bound(
      files.byKey.begin(), files.byKey.end(), wanted,
      [](const StationIndexRecord& r, std::uint32_t k) { return StationKey(r) < k; });
  if (found == files.byKey.end() || StationKey(*found) != wanted) return false;

  // The whole block is there before the working records are touched: a block cut short (or
  // an offset past what the stream can seek to) leaves everything as it was.
  const std::uint8_t* block = StationBlock(files, static_cast<std::size_t>(found - files.byKey.begin()));
  if (!block) return false;
  const StationHeader read = DecodeStationHeader(block);
  const int records = read.constituentCount;
  const std::uint8_t* recordBytes = block + StationHeader::kSize;

  int loaded = 0;
  for (int i = 0; i < records; ++i) {
    const ConstituentRecord c = DecodeConstituentRecord(recordBytes + i * ConstituentRecord::kSize);
    if (c.number < 0 || c.number >= kConstituentCount) continue;
    StationConstituent& w = engine.working[static_cast<std::size_t>(loaded++)];
    w = StationConstituent{};
    w.number = c.number;
    w.g = c.phase * kPi / 1800.0;
    w.H = c.amplitude * 0.1;
    engine.constituents[static_cast<std::size_t>(c.number)].used = 1;
  }
  engine.workingCount = loaded;
  header = read;
  return true;
}

}  // namespace br::tides
