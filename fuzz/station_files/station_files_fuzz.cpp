// The station-file reader and the index search over arbitrary folders.
//
// One input carries the three files:
//   u16 length of "td_num.ntx", u16 length of "td_crd.ntx", u8 options,
//   then the "td_num.ntx" bytes, the "td_crd.ntx" bytes, and the rest as "td_pnt.dat"
// (a length longer than what is left takes what is left). The options pick the
// prediction step and date from small tables of real and awkward values.
//
// Checked beyond "no crash": the folder opens exactly when its index files are whole,
// records read back as stored, the search finds a station exactly when the sorted
// coordinate index holds its key, its block is whole and its header possible (then the working records are
// the block's valid constituents), and a predicted day is finite with valid sun times.
#include <algorithm>
#include <climits>
#include <cmath>
#include <cstdlib>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "tides/engine/prediction.h"
#include "tides/engine/station_files.h"
#include "tides/engine/sun_events.h"
#include "tides/engine/TideEngine.h"

using namespace br::tides;

namespace {

constexpr double kSteps[] = {1.0, 0.5, 0.25, 0.1, 24.0, 6.0, -20.0, 3.0};
constexpr CalendarDate kDates[] = {
    {2000, 1, 1}, {2024, 6, 21}, {1970, 1, 1}, {1899, 12, 30},
    {2100, 12, 31}, {100, 1, 1}, {9999, 12, 31}, {2023, 12, 21},
};
// Stations searched and predicted per input: enough to reach every path, few enough to
// keep the run fast.
constexpr std::size_t kMaxSearches = 16;
constexpr std::size_t kMaxPredictions = 2;

std::vector<StationIndexRecord> Records(std::string_view bytes) {
  std::vector<StationIndexRecord> records;
  for (std::size_t at = 0; at + StationIndexRecord::kSize <= bytes.size(); at += StationIndexRecord::kSize)
    records.push_back(DecodeStationIndexRecord(reinterpret_cast<const std::uint8_t*>(bytes.data()) + at));
  return records;
}

bool SameRecord(const StationIndexRecord& a, const StationIndexRecord& b) {
  return a.station == b.station && a.latitude == b.latitude && a.longitude == b.longitude && a.offset == b.offset;
}

// What FindStation must load for the block at offset: nothing when the block is not whole
// or its header is one no station has (zone beyond UTC-12..UTC+14, a position off the
// globe, a count outside 0..69).
struct ExpectedBlock {
  bool whole = false;
  StationHeader header;
  std::vector<ConstituentRecord> valid;  // records with a number in 0..68, in file order
};

ExpectedBlock BlockAt(std::string_view data, std::uint32_t offset) {
  ExpectedBlock block;
  if (offset > static_cast<std::uint32_t>(LONG_MAX) || offset > data.size() ||
      data.size() - offset < StationHeader::kSize)
    return block;
  const auto* p = reinterpret_cast<const std::uint8_t*>(data.data()) + offset;
  block.header = DecodeStationHeader(p);
  const StationHeader& h = block.header;
  if (h.zone < -14 || h.zone > 12 || std::abs(h.latitude) > 5400 || std::abs(h.longitude) > 10800 ||
      h.constituentCount < 0 || h.constituentCount > kConstituentCount)
    return block;
  const int count = h.constituentCount;
  const std::size_t need = StationHeader::kSize + static_cast<std::size_t>(count) * ConstituentRecord::kSize;
  if (data.size() - offset < need) return block;
  block.whole = true;
  for (int i = 0; i < count; ++i) {
    const ConstituentRecord c =
        DecodeConstituentRecord(p + StationHeader::kSize + static_cast<std::size_t>(i) * ConstituentRecord::kSize);
    if (c.number >= 0 && c.number < kConstituentCount) block.valid.push_back(c);
  }
  return block;
}

void CheckLoaded(const ExpectedBlock& block, const StationHeader& header) {
  const TideEngine& engine = TheTideEngine();
  FUZZ_CHECK(std::equal(header.name.begin(), header.name.end(), block.header.name.begin()));
  FUZZ_CHECK(header.latitude == block.header.latitude && header.longitude == block.header.longitude);
  FUZZ_CHECK(header.zone == block.header.zone && header.constituentCount == block.header.constituentCount);
  FUZZ_CHECK(engine.workingCount == static_cast<std::int32_t>(block.valid.size()));
  for (std::size_t k = 0; k < block.valid.size(); ++k) {
    const StationConstituent& w = engine.working[k];
    FUZZ_CHECK(w.number == block.valid[k].number);
    FUZZ_CHECK(w.H == block.valid[k].amplitude * 0.1);
    FUZZ_CHECK(engine.constituents[static_cast<std::size_t>(w.number)].used == 1);
  }
}

void CheckDay(const std::vector<float>& samples, std::int32_t written, const SunDay& sun) {
  for (std::int32_t k = 0; k < written; ++k) FUZZ_CHECK(std::isfinite(samples[static_cast<std::size_t>(k)]));
  const PublishedSunTimes times = PublishSunTimes(sun);
  for (const HourMinute& t : times.events) {
    FUZZ_CHECK(t.hour >= 0 && t.hour <= 23);
    FUZZ_CHECK(t.minute >= 0 && t.minute <= 59);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  br::fuzz::InputReader in(data, size);
  const std::size_t numberLength = in.U16();
  const std::size_t coordinateLength = in.U16();
  const std::uint8_t options = in.U8();
  const std::string_view numbers = in.Bytes(numberLength);
  const std::string_view coordinates = in.Bytes(coordinateLength);
  const std::string_view stationData = in.Rest();

  br::fuzz::WriteScratchFile(kStationIndexFileName, numbers);
  br::fuzz::WriteScratchFile(kCoordinateIndexFileName, coordinates);
  br::fuzz::WriteScratchFile(kStationDataFileName, stationData);

  const std::size_t count = numbers.size() / StationIndexRecord::kSize;
  const bool shouldOpen = coordinates.size() >= count * StationIndexRecord::kSize;
  const int opened = OpenTideFiles(br::fuzz::ScratchFolder().string().c_str());
  FUZZ_CHECK((opened == 0) == shouldOpen);
  if (opened != 0) {
    FUZZ_CHECK(StationCount() == 0);
    StationHeader header;
    FUZZ_CHECK(!FindStation(StationIndexRecord{}, header));
    return 0;
  }
  FUZZ_CHECK(StationCount() == static_cast<std::int32_t>(count));

  const std::vector<StationIndexRecord> byNumber = Records(numbers);
  std::vector<StationIndexRecord> byKey = Records(coordinates);
  byKey.resize(count);  // bytes past the station count are not part of the index
  const bool sorted = std::is_sorted(byKey.begin(), byKey.end(), [](const auto& a, const auto& b) {
    return StationKey(a) < StationKey(b);
  });

  StationIndexRecord record;
  FUZZ_CHECK(!ReadStationIndexRecord(-1, record));
  FUZZ_CHECK(!ReadStationIndexRecord(static_cast<std::int32_t>(count), record));
  for (std::size_t i = 0; i < count; ++i) {
    FUZZ_CHECK(ReadStationIndexRecord(static_cast<std::int32_t>(i), record));
    FUZZ_CHECK(SameRecord(record, byNumber[i]));
  }

  // Keys of both indexes, and one made from the options byte that is likely absent.
  std::vector<StationIndexRecord> keys;
  for (std::size_t i = 0; i < count && keys.size() < kMaxSearches / 2; ++i) keys.push_back(byNumber[i]);
  for (std::size_t i = 0; i < count && keys.size() < kMaxSearches; ++i) keys.push_back(byKey[i]);
  StationIndexRecord stray;
  stray.latitude = static_cast<std::int16_t>(options * 7 - 900);
  stray.longitude = static_cast<std::int16_t>(-options * 13);
  keys.push_back(stray);

  const double step = kSteps[options & 7];
  const CalendarDate date = kDates[(options >> 3) & 7];
  std::size_t predictions = 0;
  for (const StationIndexRecord& key : keys) {
    const std::uint32_t wanted = StationKey(key);
    const auto holder = std::find_if(byKey.begin(), byKey.end(), [&](const auto& r) { return StationKey(r) == wanted; });
    StationHeader header;
    const bool found = FindStation(key, header);
    if (found) FUZZ_CHECK(holder != byKey.end());
    if (sorted) {
      // The search meets the first record of the key in sorted order: the one found here.
      const ExpectedBlock block = holder == byKey.end() ? ExpectedBlock{} : BlockAt(stationData, holder->offset);
      FUZZ_CHECK(found == block.whole);
      if (found) CheckLoaded(block, header);
    }
    if (!found || predictions == kMaxPredictions) continue;
    ++predictions;

    const std::int32_t samples = DaySampleCount(step);
    std::vector<float> buffer(samples > 0 ? static_cast<std::size_t>(samples) : 0, 0.0f);
    SunDay sun;
    StationHeader predicted;
    const DayPrediction day = PredictDay(key, predicted, date, step, buffer.data(), buffer.size(), sun,
                                         FixedOffsetLocalMidnight(3600 * (options >> 6)));
    FUZZ_CHECK(day.stationFound);
    FUZZ_CHECK(day.sampleCount == static_cast<std::int32_t>(buffer.size()));
    CheckDay(buffer, day.sampleCount, sun);
  }
  return 0;
}
