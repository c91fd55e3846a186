#include "tests/wine/common/station_folder.h"

#include "tests/native/engine/station_folder.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace br::test {

using namespace br::tides;

// The engine suite's writer encodes the files; the options damage them afterwards.
StationFolder::StationFolder(const std::vector<TestStation>& stations, const FolderOptions& options)
    : folder_(std::make_unique<testing::TempFolder>("brtest")), path_(folder_->path().wstring()) {
  std::vector<testing::TestStation> written;
  for (const TestStation& s : stations) {
    testing::TestStation t;
    t.name = s.name;
    t.latitude = s.latitude;
    t.longitude = s.longitude;
    t.zone = s.zone;
    for (const TestConstituent& c : s.constituents) {
      ConstituentRecord record;
      record.number = c.number;
      record.phase = c.phase;
      record.amplitude = c.amplitude;
      t.constituents.push_back(record);
    }
    written.push_back(std::move(t));
  }
  const std::filesystem::path& folder = folder_->path();
  testing::WriteStationFolder(folder, written);
  if (options.withoutDataFile) std::filesystem::remove(folder / kStationDataFileName);
  if (options.notInCoordinateIndex.empty()) return;

  // td_crd.ntx again from td_num.ntx, with those stations' records moved near the south pole.
  std::ifstream in(folder / kStationIndexFileName, std::ios::binary);
  const std::vector<std::uint8_t> numbers((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  std::vector<StationIndexRecord> records;
  for (std::size_t i = 0; (i + 1) * StationIndexRecord::kSize <= numbers.size(); ++i) {
    StationIndexRecord record = DecodeStationIndexRecord(numbers.data() + i * StationIndexRecord::kSize);
    if (options.notInCoordinateIndex.count(i)) {
      record.latitude = static_cast<std::int16_t>(-5400 + static_cast<int>(i));
      record.longitude = -10800;
    }
    records.push_back(record);
  }
  std::stable_sort(records.begin(), records.end(), [](const StationIndexRecord& a, const StationIndexRecord& b) {
    return StationKey(a) < StationKey(b);
  });
  std::vector<std::uint8_t> coordinates;
  for (const StationIndexRecord& r : records) {
    const auto bytes = EncodeStationIndexRecord(r);
    coordinates.insert(coordinates.end(), bytes.begin(), bytes.end());
  }
  testing::WriteBytes(folder / kCoordinateIndexFileName, coordinates);
}

StationFolder::~StationFolder() = default;

}  // namespace br::test
