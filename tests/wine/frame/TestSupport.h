#pragma once
// Registry values restored after a test, scratch folders, whole-file reads and writes.

#include <windows.h>
#include <shellapi.h>

#include <fstream>
#include <iterator>
#include <string>
#include <vector>

// Saves a registry value (or its absence) and puts it back when destroyed.
class SavedRegistryValue {
public:
  SavedRegistryValue(HKEY root, std::string path, std::string name)
      : m_root(root), m_path(std::move(path)), m_name(std::move(name)) {
    DWORD size = 1 << 16;
    m_data.resize(size);
    m_existed = RegGetValueA(m_root, m_path.c_str(), m_name.c_str(), RRF_RT_ANY | RRF_NOEXPAND, &m_type,
                             m_data.data(), &size) == ERROR_SUCCESS;
    m_data.resize(size);
  }
  ~SavedRegistryValue() { m_existed ? Set(m_type, m_data.data(), static_cast<DWORD>(m_data.size())) : Delete(); }

  // Creates the key when it is missing.
  void Set(DWORD type, const void* data, DWORD size) const {
    RegSetKeyValueA(m_root, m_path.c_str(), m_name.c_str(), type, data, size);
  }
  void SetString(const std::string& text, DWORD type = REG_SZ) const {
    Set(type, text.c_str(), static_cast<DWORD>(text.size() + 1));
  }
  void SetDword(DWORD value) const { Set(REG_DWORD, &value, sizeof value); }
  void Delete() const { RegDeleteKeyValueA(m_root, m_path.c_str(), m_name.c_str()); }

private:
  HKEY m_root;
  std::string m_path;
  std::string m_name;
  bool m_existed = false;
  DWORD m_type = 0;
  std::vector<BYTE> m_data;
};

// A fresh folder under the temporary folder, removed with its contents.
class ScratchFolder {
public:
  ScratchFolder() {
    char temp[MAX_PATH];
    GetTempPathA(MAX_PATH, temp);
    static unsigned counter = 0;
    do {
      m_path = std::string(temp) + "brtest_" + std::to_string(GetCurrentProcessId()) + "_" + std::to_string(++counter);
    } while (!CreateDirectoryA(m_path.c_str(), nullptr));
  }
  ~ScratchFolder() {
    const std::string from = m_path + '\0';  // double-terminated list for the shell's recursive delete
    SHFILEOPSTRUCTA operation{nullptr, FO_DELETE, from.c_str(), nullptr,
                              FOF_NOCONFIRMATION | FOF_NOERRORUI | FOF_SILENT, FALSE, nullptr, nullptr};
    SHFileOperationA(&operation);
  }

  const std::string& Path() const { return m_path; }  // without a closing backslash
  std::string operator/(const std::string& relative) const { return m_path + "\\" + relative; }

private:
  std::string m_path;
};

inline void WriteTextFile(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}
// The file's bytes, or empty when it cannot be read.
inline std::string ReadWholeFile(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}
