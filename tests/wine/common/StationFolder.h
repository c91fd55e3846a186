// Station folders written by the tests themselves into a temporary folder, by the engine
// suite's folder writer. Removed again when the object goes (declare it before the
// DllUnderTest that opens it, so the DLL has closed the files by then).
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace br::tides::testing {
class TempFolder;
}

namespace br::test {

struct TestConstituent {
  std::int16_t number;      // row of the constituent table; 0 = mean level
  std::uint16_t amplitude;  // thousandths of the published unit
  std::uint16_t phase;      // Greenwich phase lag, tenths of a degree
};

struct TestStation {
  std::string name;
  std::int16_t latitude;   // minutes, north positive
  std::int16_t longitude;  // minutes, east positive
  std::int8_t zone;        // hours: universal time = zone time + zone
  std::vector<TestConstituent> constituents;
};

class StationFolder {
public:
  explicit StationFolder(const std::vector<TestStation>& stations, bool withoutDataFile = false);  // no td_pnt.dat
  ~StationFolder();
  StationFolder(const StationFolder&) = delete;
  StationFolder& operator=(const StationFolder&) = delete;

  const std::wstring& Path() const { return path_; }  // no trailing separator

private:
  std::unique_ptr<br::tides::testing::TempFolder> folder_;
  std::wstring path_;
};

// Positions in minutes as the library reports them in degrees.
inline double Degrees(std::int16_t minutes) { return minutes * 0.016666666666666666; }

}  // namespace br::test
