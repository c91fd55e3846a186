#include "tests/wine/common/station_folder.h"

#include "tides/engine/station_files.h"

#include <windows.h>

#include <algorithm>
#include <cstring>
#include <stdexcept>

namespace br::test {
namespace {

using namespace br::tides;

void WriteFile(const std::wstring& path, const std::vector<std::uint8_t>& bytes) {
  HANDLE file = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
  if (file == INVALID_HANDLE_VALUE) throw std::runtime_error("cannot write a station file");
  DWORD written = 0;
  const BOOL ok = bytes.empty() ||
                  ::WriteFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr);
  CloseHandle(file);
  if (!ok || written != bytes.size()) throw std::runtime_error("cannot write a station file");
}

template <class Bytes>
void Append(std::vector<std::uint8_t>& out, const Bytes& b) {
  out.insert(out.end(), b.begin(), b.end());
}

std::wstring Widen(const char* s) { return std::wstring(s, s + strlen(s)); }

}  // namespace

StationFolder::StationFolder(const std::vector<TestStation>& stations, const FolderOptions& options) {
  static LONG counter = 0;
  wchar_t temp[MAX_PATH + 1] = {};
  GetTempPathW(MAX_PATH, temp);
  // A folder of its own: never one left behind by an earlier run with the same process id.
  for (;;) {
    path_ = std::wstring(temp) + L"brtest_" + std::to_wstring(GetCurrentProcessId()) + L"_" +
            std::to_wstring(GetTickCount()) + L"_" + std::to_wstring(InterlockedIncrement(&counter));
    if (CreateDirectoryW(path_.c_str(), nullptr)) break;
    if (GetLastError() != ERROR_ALREADY_EXISTS) throw std::runtime_error("cannot make a station folder");
  }

  std::vector<StationIndexRecord> index;
  std::vector<std::uint8_t> data;
  for (std::size_t i = 0; i < stations.size(); ++i) {
    const TestStation& s = stations[i];
    StationIndexRecord record;
    record.station = static_cast<std::uint16_t>(i);
    record.latitude = s.latitude;
    record.longitude = s.longitude;
    record.offset = static_cast<std::uint32_t>(data.size());
    index.push_back(record);

    StationHeader header;
    SetStationName(header, s.name);
    header.latitude = s.latitude;
    header.longitude = s.longitude;
    header.zone = s.zone;
    header.constituentCount = static_cast<std::int8_t>(s.constituents.size());
    Append(data, EncodeStationHeader(header));
    for (const TestConstituent& c : s.constituents) {
      ConstituentRecord record2;
      record2.number = c.number;
      record2.amplitude = c.amplitude;
      record2.phase = c.phase;
      Append(data, EncodeConstituentRecord(record2));
    }
  }

  std::vector<std::uint8_t> numbers;
  for (const StationIndexRecord& r : index) Append(numbers, EncodeStationIndexRecord(r));
  std::vector<StationIndexRecord> sorted;
  for (std::size_t i = 0; i < index.size(); ++i) {
    StationIndexRecord record = index[i];
    if (options.notInCoordinateIndex.count(i)) {
      record.latitude = static_cast<std::int16_t>(-5400 + static_cast<int>(i));  // near the south pole
      record.longitude = -10800;
    }
    sorted.push_back(record);
  }
  std::stable_sort(sorted.begin(), sorted.end(), [](const StationIndexRecord& a, const StationIndexRecord& b) {
    return StationKey(a) < StationKey(b);
  });
  std::vector<std::uint8_t> coordinates;
  for (const StationIndexRecord& r : sorted) Append(coordinates, EncodeStationIndexRecord(r));

  WriteFile(path_ + L"\\" + Widen(kStationIndexFileName), numbers);
  WriteFile(path_ + L"\\" + Widen(kCoordinateIndexFileName), coordinates);
  if (!options.withoutDataFile) WriteFile(path_ + L"\\" + Widen(kStationDataFileName), data);
}

StationFolder::~StationFolder() {
  for (const char* name : {kStationIndexFileName, kCoordinateIndexFileName, kStationDataFileName}) {
    DeleteFileW((path_ + L"\\" + Widen(name)).c_str());
  }
  RemoveDirectoryW(path_.c_str());
}

}  // namespace br::test
