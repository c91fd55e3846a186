#include "frame/settings/cRegKeyReader.h"

#include <vector>

#include "frame/errors/cErr.h"

namespace br {

cRegKeyReader::cRegKeyReader(HKEY root, const char* path) {
  HKEY key = nullptr;
  if (RegOpenKeyExA(root, path, 0, KEY_QUERY_VALUE, &key) == ERROR_SUCCESS) {
    key_ = key;
  }
}

cRegKeyReader::~cRegKeyReader() {
  if (key_ != nullptr) {
    RegCloseKey(key_);
  }
}

void cRegKeyReader::RequireOpen() const {
  if (key_ == nullptr) {
    throw cErr(BR_ERR_REG_NO_KEY);
  }
}

bool cRegKeyReader::ReadDword(const char* name, DWORD& value) const {
  RequireOpen();
  DWORD type = 0;
  DWORD data = 0;
  DWORD size = sizeof data;
  if (RegQueryValueExA(key_, name, nullptr, &type, reinterpret_cast<BYTE*>(&data), &size) !=
          ERROR_SUCCESS ||
      type != REG_DWORD || size != sizeof data) {
    return false;
  }
  value = data;
  return true;
}

bool cRegKeyReader::ReadString(const char* name, std::string& value, DWORD maxBytes) const {
  RequireOpen();
  if (maxBytes == 0) {
    return false;
  }
  std::vector<char> buffer(maxBytes + 1, '\0');  // one spare for a value stored unterminated
  DWORD type = 0;
  DWORD size = maxBytes;
  if (RegQueryValueExA(key_, name, nullptr, &type, reinterpret_cast<BYTE*>(buffer.data()),
                       &size) != ERROR_SUCCESS ||
      type != REG_SZ) {
    return false;
  }
  value.assign(buffer.data());  // up to the first terminator
  return true;
}

}  // namespace br
