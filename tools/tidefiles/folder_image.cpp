#include "tools/tidefiles/folder_image.h"

#include <filesystem>
#include <fstream>
#include <system_error>

#include "tides/engine/station_files.h"

namespace br::tidefiles {
namespace {

namespace fs = std::filesystem;

// Far beyond any real folder (32767 stations of at most 460 bytes each).
constexpr std::uintmax_t kMaxFileSize = 256u * 1024u * 1024u;

bool ReadWhole(const fs::path& path, std::vector<std::uint8_t>& bytes, std::string& error) {
  std::error_code ec;
  const std::uintmax_t size = fs::file_size(path, ec);
  if (ec) {
    error = path.filename().string() + ": cannot read (" + ec.message() + ")";
    return false;
  }
  if (size > kMaxFileSize) {
    error = path.filename().string() + ": too large for a station file (" + std::to_string(size) + " bytes)";
    return false;
  }
  std::ifstream in(path, std::ios::binary);
  bytes.assign(static_cast<std::size_t>(size), 0);
  if (!in || !in.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(size))) {
    error = path.filename().string() + ": cannot read";
    return false;
  }
  return true;
}

bool WriteWhole(const fs::path& path, const std::vector<std::uint8_t>& bytes, std::string& error) {
  fs::path temporary = path;
  temporary += ".tmp";
  {
    std::ofstream out(temporary, std::ios::binary | std::ios::trunc);
    out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    out.close();
    if (!out) {
      std::error_code ignored;
      fs::remove(temporary, ignored);
      error = path.string() + ": cannot write";
      return false;
    }
  }
  std::error_code ec;
  fs::rename(temporary, path, ec);
  if (ec) {
    fs::remove(temporary, ec);
    error = path.string() + ": cannot write";
    return false;
  }
  return true;
}

}  // namespace

bool ReadFolderImage(const std::string& folder, FolderImage& image, std::string& error) {
  const fs::path base(folder);
  std::error_code ec;
  if (!fs::is_directory(base, ec)) {
    error = folder + ": not a folder";
    return false;
  }
  return ReadWhole(base / br::tides::kStationIndexFileName, image.stationIndex, error) &&
         ReadWhole(base / br::tides::kCoordinateIndexFileName, image.coordinateIndex, error) &&
         ReadWhole(base / br::tides::kStationDataFileName, image.stationData, error);
}

bool WriteFolderImage(const std::string& folder, const FolderImage& image, std::string& error) {
  const fs::path base(folder);
  std::error_code ec;
  fs::create_directories(base, ec);
  if (!fs::is_directory(base, ec)) {
    error = folder + ": cannot make the folder";
    return false;
  }
  return WriteWhole(base / br::tides::kStationDataFileName, image.stationData, error) &&
         WriteWhole(base / br::tides::kStationIndexFileName, image.stationIndex, error) &&
         WriteWhole(base / br::tides::kCoordinateIndexFileName, image.coordinateIndex, error);
}

}  // namespace br::tidefiles
