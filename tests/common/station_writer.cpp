#include "tests/common/station_writer.h"

#include <algorithm>
#include <atomic>
#include <fstream>
#include <random>
#include <stdexcept>

#include <unistd.h>

namespace br::tides::testing {

namespace fs = std::filesystem;

TempFolder::TempFolder(const std::string& hint) {
  static std::atomic<int> serial{0};
  std::random_device rd;
  path_ = fs::temp_directory_path() / ("br_" + hint + "_" + std::to_string(getpid()) + "_" +
                                       std::to_string(serial++) + "_" + std::to_string(rd() % 100000));
  fs::create_directories(path_);
}

TempFolder::~TempFolder() {
  std::error_code ec;
  fs::remove_all(path_, ec);
}

void WriteBytes(const fs::path& file, const std::vector<std::uint8_t>& bytes) {
  std::ofstream out(file, std::ios::binary | std::ios::trunc);
  out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  if (!out) throw std::runtime_error("cannot write " + file.string());
}

StationFolderBytes StationFolderImage(const std::vector<TestStation>& stations) {
  StationFolderBytes image;
  std::vector<std::uint8_t>& data = image.stationData;
  std::vector<std::uint8_t>& numbers = image.stationIndex;
  std::vector<std::uint8_t>& coordinates = image.coordinateIndex;
  std::vector<StationIndexRecord> index;
  for (std::size_t i = 0; i < stations.size(); ++i) {
    const TestStation& s = stations[i];
    index.push_back({static_cast<std::uint16_t>(i), s.latitude, s.longitude, static_cast<std::uint32_t>(data.size())});
    StationHeader h;
    SetStationName(h, s.name);
    h.latitude = s.latitude;
    h.longitude = s.longitude;
    h.zone = s.zone;
    h.constituentCount = s.overrideCount ? s.count : static_cast<std::int8_t>(s.constituents.size());
    const auto hb = EncodeStationHeader(h);
    data.insert(data.end(), hb.begin(), hb.end());
    for (const ConstituentRecord& c : s.constituents) {
      const auto cb = EncodeConstituentRecord(c);
      data.insert(data.end(), cb.begin(), cb.end());
    }
  }
  std::vector<StationIndexRecord> sorted = index;
  std::stable_sort(sorted.begin(), sorted.end(), [](const auto& a, const auto& b) { return StationKey(a) < StationKey(b); });
  for (std::size_t i = 0; i < index.size(); ++i) {
    const auto n = EncodeStationIndexRecord(index[i]), c = EncodeStationIndexRecord(sorted[i]);
    numbers.insert(numbers.end(), n.begin(), n.end());
    coordinates.insert(coordinates.end(), c.begin(), c.end());
  }
  return image;
}

void WriteStationFolder(const fs::path& folder, const std::vector<TestStation>& stations) {
  fs::create_directories(folder);
  const StationFolderBytes image = StationFolderImage(stations);
  WriteBytes(folder / kStationIndexFileName, image.stationIndex);
  WriteBytes(folder / kCoordinateIndexFileName, image.coordinateIndex);
  WriteBytes(folder / kStationDataFileName, image.stationData);
}

void TruncateFile(const fs::path& file, std::uintmax_t size) { fs::resize_file(file, size); }

}  // namespace br::tides::testing
