#include "frame/settings/cRegSettings.h"

#include <vector>

namespace br {

namespace {

// Closes the key on every way out.
class OpenKey {
public:
  OpenKey(HKEY root, const std::string& path, REGSAM access) {
    if (RegOpenKeyExA(root, path.c_str(), 0, access, &key_) != ERROR_SUCCESS) {
      key_ = nullptr;
    }
  }
  explicit OpenKey(HKEY key) : key_(key) {}
  ~OpenKey() {
    if (key_ != nullptr) {
      RegCloseKey(key_);
    }
  }
  OpenKey(const OpenKey&) = delete;
  OpenKey& operator=(const OpenKey&) = delete;
  HKEY get() const { return key_; }

private:
  HKEY key_ = nullptr;
};

// Another writer may grow the value between asking its size and reading it.
constexpr int STRING_READ_ATTEMPTS = 4;

}  // namespace

std::string cRegSettings::FullPath(const char* subkey) {
  std::string path = BASE_PATH;
  if (subkey != nullptr && *subkey != '\0') {
    path += '\\';
    path += subkey;
  }
  return path;
}

DWORD cRegSettings::ReadDword(const char* subkey, const char* name, DWORD defaultValue) const {
  OpenKey key(root_, FullPath(subkey), KEY_QUERY_VALUE);
  if (key.get() == nullptr) {
    return defaultValue;
  }
  DWORD type = 0;
  DWORD data = 0;
  DWORD size = sizeof data;
  if (RegQueryValueExA(key.get(), name, nullptr, &type, reinterpret_cast<BYTE*>(&data), &size) !=
          ERROR_SUCCESS ||
      type != REG_DWORD || size != sizeof data) {
    return defaultValue;
  }
  return data;
}

std::string cRegSettings::ReadString(const char* subkey, const char* name,
                                     const std::string& defaultText) const {
  OpenKey key(root_, FullPath(subkey), KEY_QUERY_VALUE);
  if (key.get() == nullptr) {
    return defaultText;
  }
  for (int attempt = 0; attempt < STRING_READ_ATTEMPTS; ++attempt) {
    DWORD type = 0;
    DWORD size = 0;
    if (RegQueryValueExA(key.get(), name, nullptr, &type, nullptr, &size) != ERROR_SUCCESS ||
        type != REG_SZ) {
      return defaultText;
    }
    std::vector<char> buffer(size + 1, '\0');  // stored length plus one terminator
    DWORD got = size + 1;
    const LONG status = RegQueryValueExA(key.get(), name, nullptr, &type,
                                         reinterpret_cast<BYTE*>(buffer.data()), &got);
    if (status == ERROR_MORE_DATA) {
      continue;
    }
    if (status != ERROR_SUCCESS || type != REG_SZ) {
      return defaultText;
    }
    buffer.back() = '\0';
    return std::string(buffer.data());
  }
  return defaultText;
}

bool cRegSettings::WriteDword(const char* subkey, const char* name, DWORD value) const {
  HKEY created = nullptr;
  if (RegCreateKeyExA(root_, FullPath(subkey).c_str(), 0, nullptr, REG_OPTION_NON_VOLATILE,
                      KEY_SET_VALUE, nullptr, &created, nullptr) != ERROR_SUCCESS) {
    return false;
  }
  OpenKey key(created);
  return RegSetValueExA(key.get(), name, 0, REG_DWORD, reinterpret_cast<const BYTE*>(&value),
                        sizeof value) == ERROR_SUCCESS;
}

}  // namespace br
