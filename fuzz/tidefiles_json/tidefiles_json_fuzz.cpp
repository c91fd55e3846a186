// "tidefiles build" input: the station JSON read, built into the three files, checked,
// dumped back and rebuilt, and the built folder opened and searched by the engine.
//
// Checked beyond "no crash": whatever the reader accepts the builder stores; a built
// folder passes the folder check and the engine finds every station in it; dumping it
// gives JSON that the reader accepts and that builds exactly the same files again.
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "tides/engine/station_files.h"
#include "tools/tidefiles/Diagnostics.h"
#include "tools/tidefiles/folder_builder.h"
#include "tides/engine/station_folder_check.h"
#include "tools/tidefiles/folder_dump.h"
#include "tools/tidefiles/station_json.h"

using namespace br::tidefiles;
namespace bt = br::tides;

namespace {

std::string_view View(const std::vector<std::uint8_t>& bytes) {
  return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

// The engine opens the folder and finds each station by the key of its index record.
void SearchWithEngine(const FolderImage& image) {
  br::fuzz::WriteScratchFile(bt::kStationIndexFileName, View(image.stationIndex));
  br::fuzz::WriteScratchFile(bt::kCoordinateIndexFileName, View(image.coordinateIndex));
  br::fuzz::WriteScratchFile(bt::kStationDataFileName, View(image.stationData));
  FUZZ_CHECK(bt::OpenTideFiles(br::fuzz::ScratchFolder().string().c_str()) == 0);
  const std::int32_t count = bt::StationCount();
  FUZZ_CHECK(static_cast<std::size_t>(count) * bt::StationIndexRecord::kSize == image.stationIndex.size());
  for (std::int32_t i = 0; i < count; ++i) {
    bt::StationIndexRecord record;
    FUZZ_CHECK(bt::ReadStationIndexRecord(i, record));
    bt::StationHeader header;
    FUZZ_CHECK(bt::FindStation(record, header));
    FUZZ_CHECK(header.latitude == record.latitude && header.longitude == record.longitude);
  }
  bt::CloseTideFiles();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  Diagnostics read;
  const std::vector<StationEntry> stations = ReadStationsJson(text, read);
  for (const Diagnostic& d : read.All()) FUZZ_CHECK(d.text.find('\n') == std::string::npos);
  if (read.HasErrors()) return 0;

  Diagnostics built;
  const auto image = BuildFolderImage(stations, built);
  if (!image) {
    FUZZ_CHECK(built.HasErrors());
    return 0;
  }
  FUZZ_CHECK(!built.HasErrors());
  FUZZ_CHECK(br::tides::CheckStationFolder(*image).empty());
  SearchWithEngine(*image);

  Diagnostics dumped;
  const std::vector<StationEntry> back = DumpFolderImage(*image, dumped);
  FUZZ_CHECK(!dumped.HasErrors());
  FUZZ_CHECK(back.size() * bt::StationIndexRecord::kSize == image->stationIndex.size());
  const std::string json = WriteStationsJson(back);

  Diagnostics reread;
  const std::vector<StationEntry> again = ReadStationsJson(json, reread);
  FUZZ_CHECK(!reread.HasErrors());
  Diagnostics rebuilt;
  const auto second = BuildFolderImage(again, rebuilt);
  FUZZ_CHECK(second.has_value());
  FUZZ_CHECK(second->stationIndex == image->stationIndex);
  FUZZ_CHECK(second->coordinateIndex == image->coordinateIndex);
  FUZZ_CHECK(second->stationData == image->stationData);
  return 0;
}
