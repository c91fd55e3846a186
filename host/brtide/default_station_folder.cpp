#include "host/brtide/default_station_folder.h"

#include <windows.h>

#include <vector>

namespace br::brtide {

std::wstring DefaultStationFolder() {
  std::vector<wchar_t> self(32768);
  const DWORD length = GetModuleFileNameW(nullptr, self.data(), static_cast<DWORD>(self.size()));
  std::wstring folder(self.data(), length);
  for (std::size_t cut = folder.find_last_of(L"\\/"); cut != std::wstring::npos; cut = folder.find_last_of(L"\\/")) {
    folder.erase(cut);
    const std::wstring candidate = folder + L"\\data\\world";
    if (GetFileAttributesW((candidate + L"\\td_num.ntx").c_str()) != INVALID_FILE_ATTRIBUTES) return candidate;
  }
  return std::wstring();
}

}  // namespace br::brtide
