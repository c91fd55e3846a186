#include "tests/wine/common/StationFolder.h"

#include "tests/common/station_writer.h"

#include <filesystem>

namespace br::test {

using namespace br::tides;

// The engine suite's writer encodes the files.
StationFolder::StationFolder(const std::vector<TestStation>& stations, bool withoutDataFile)
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
  if (withoutDataFile) std::filesystem::remove(folder / kStationDataFileName);
}

StationFolder::~StationFolder() = default;

}  // namespace br::test
