#include "frame/geo/AgencyTable.h"

#include "frame/settings/settings.h"

#include <memory>

namespace br::geo {
namespace {

struct HandleCloser {
  void operator()(HANDLE handle) const { CloseHandle(handle); }
};
using FileHandle = std::unique_ptr<void, HandleCloser>;

bool ReadWholeFile(const std::string& path, std::vector<unsigned char>& bytes) {
  FileHandle file(CreateFileA(path.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr,
                              OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr));
  if (file.get() == INVALID_HANDLE_VALUE) {
    file.release();
    return false;
  }
  LARGE_INTEGER size{};
  if (!GetFileSizeEx(file.get(), &size) || size.QuadPart < 0 ||
      static_cast<unsigned long long>(size.QuadPart) > AgencyTable::kMaxFileBytes) {
    return false;
  }
  bytes.resize(static_cast<std::size_t>(size.QuadPart));
  std::size_t done = 0;
  while (done < bytes.size()) {
    DWORD read = 0;
    if (!ReadFile(file.get(), bytes.data() + done, static_cast<DWORD>(bytes.size() - done), &read, nullptr) ||
        read == 0) {
      break;
    }
    done += read;
  }
  bytes.resize(done);  // a file that shrank while read gives what was there
  return true;
}

BSTR BstrFromAnsi(const std::string& text) {
  const int length = MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  BSTR result = SysAllocStringLen(nullptr, static_cast<UINT>(length > 0 ? length : 0));
  if (result && length > 0) {
    MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), result, length);
  }
  return result;
}

}  // namespace

std::string AgencyTable::DefaultPath() { return ReadKeyPath() + FILE_IN_FOLDER; }

AgencyTable::AgencyTable() { Load(DefaultPath()); }

AgencyTable::AgencyTable(const std::string& path) { Load(path); }

void AgencyTable::Load(const std::string& path) {
  std::vector<unsigned char> bytes;
  if (!ReadWholeFile(path, bytes)) return;
  loaded_ = true;
  rows_ = ParseAgencyTable(bytes.data(), bytes.size(), AnsiFromUtf16);
}

std::string AgencyTable::AnsiFromUtf16(const char16_t* units, std::size_t count) {
  static_assert(sizeof(char16_t) == sizeof(wchar_t), "UTF-16 units are wide characters here");
  if (count == 0) return {};
  const auto* wide = reinterpret_cast<const wchar_t*>(units);
  const int length = WideCharToMultiByte(CP_ACP, 0, wide, static_cast<int>(count), nullptr, 0, nullptr, nullptr);
  if (length <= 0) return {};
  std::string text(static_cast<std::size_t>(length), '\0');
  WideCharToMultiByte(CP_ACP, 0, wide, static_cast<int>(count), text.data(), length, nullptr, nullptr);
  return text;
}

HRESULT AgencyTable::Lookup(std::int32_t code, BSTR* name, BSTR* abbreviation) const {
  const AgencyRow* row = Find(code);
  if (!row) {
    if (name) *name = BstrFromAnsi(std::to_string(code));
    return S_FALSE;
  }
  if (name) *name = BstrFromAnsi(row->name);
  if (abbreviation) *abbreviation = BstrFromAnsi(row->abbreviation);
  return S_OK;
}

}  // namespace br::geo
