#include "TestSupport.h"

#include <shellapi.h>

#include <cstdio>

SavedRegistryValue::SavedRegistryValue(HKEY root, std::string path, std::string name)
    : m_root(root), m_path(std::move(path)), m_name(std::move(name)) {
  DWORD size = 0;
  if (RegGetValueA(m_root, m_path.c_str(), m_name.c_str(), RRF_RT_ANY | RRF_NOEXPAND, &m_type,
                   nullptr, &size) == ERROR_SUCCESS) {
    m_data.resize(size);
    m_existed = RegGetValueA(m_root, m_path.c_str(), m_name.c_str(), RRF_RT_ANY | RRF_NOEXPAND,
                             &m_type, m_data.data(), &size) == ERROR_SUCCESS;
    m_data.resize(size);
  }
}

SavedRegistryValue::~SavedRegistryValue() {
  if (m_existed) {
    Set(m_type, m_data.data(), static_cast<DWORD>(m_data.size()));
  } else {
    Delete();
  }
}

void SavedRegistryValue::Set(DWORD type, const BYTE* data, DWORD size) const {
  HKEY key = nullptr;
  if (RegCreateKeyExA(m_root, m_path.c_str(), 0, nullptr, 0, KEY_SET_VALUE, nullptr, &key,
                      nullptr) == ERROR_SUCCESS) {
    RegSetValueExA(key, m_name.c_str(), 0, type, data, size);
    RegCloseKey(key);
  }
}

void SavedRegistryValue::SetString(const std::string& text, DWORD type) const {
  Set(type, reinterpret_cast<const BYTE*>(text.c_str()), static_cast<DWORD>(text.size() + 1));
}

void SavedRegistryValue::SetDword(DWORD value) const {
  Set(REG_DWORD, reinterpret_cast<const BYTE*>(&value), sizeof value);
}

void SavedRegistryValue::SetBinary(const std::vector<BYTE>& data) const {
  Set(REG_BINARY, data.data(), static_cast<DWORD>(data.size()));
}

void SavedRegistryValue::Delete() const {
  HKEY key = nullptr;
  if (RegOpenKeyExA(m_root, m_path.c_str(), 0, KEY_SET_VALUE, &key) == ERROR_SUCCESS) {
    RegDeleteValueA(key, m_name.c_str());
    RegCloseKey(key);
  }
}

ScratchFolder::ScratchFolder() {
  char temp[MAX_PATH];
  GetTempPathA(MAX_PATH, temp);
  static unsigned counter = 0;
  for (;;) {
    m_path = std::string(temp) + "brtest_" + std::to_string(GetCurrentProcessId()) + "_" +
             std::to_string(++counter);
    if (CreateDirectoryA(m_path.c_str(), nullptr)) {
      break;
    }
  }
}

ScratchFolder::~ScratchFolder() {
  // Double-terminated list for the shell's recursive delete.
  std::string from = m_path;
  from.push_back('\0');
  SHFILEOPSTRUCTA operation{};
  operation.wFunc = FO_DELETE;
  operation.pFrom = from.c_str();
  operation.fFlags = FOF_NOCONFIRMATION | FOF_NOERRORUI | FOF_SILENT;
  SHFileOperationA(&operation);
}

void WriteTextFile(const std::string& path, const std::string& text) {
  if (FILE* file = std::fopen(path.c_str(), "wb")) {
    std::fwrite(text.data(), 1, text.size(), file);
    std::fclose(file);
  }
}

std::string ReadWholeFile(const std::string& path) {
  std::string text;
  if (FILE* file = std::fopen(path.c_str(), "rb")) {
    char buffer[4096];
    std::size_t got;
    while ((got = std::fread(buffer, 1, sizeof buffer, file)) > 0) {
      text.append(buffer, got);
    }
    std::fclose(file);
  }
  return text;
}

bool FileExists(const std::string& path) {
  const DWORD attributes = GetFileAttributesA(path.c_str());
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0;
}

std::vector<std::string> SplitLines(const std::string& text) {
  std::vector<std::string> lines;
  std::size_t start = 0;
  while (start < text.size()) {
    const std::size_t end = text.find('\n', start);
    if (end == std::string::npos) {
      lines.push_back(text.substr(start));
      break;
    }
    lines.push_back(text.substr(start, end + 1 - start));
    start = end + 1;
  }
  return lines;
}
