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
      : root_(root), path_(std::move(path)), name_(std::move(name)) {
    DWORD size = 1 << 16;
    data_.resize(size);
    existed_ = RegGetValueA(root_, path_.c_str(), name_.c_str(), RRF_RT_ANY | RRF_NOEXPAND, &type_,
                             data_.data(), &size) == ERROR_SUCCESS;
    data_.resize(size);
  }
  ~SavedRegistryValue() { existed_ ? Set(type_, data_.data(), static_cast<DWORD>(data_.size())) : Delete(); }

  // Creates the key when it is missing.
  void Set(DWORD type, const void* data, DWORD size) const {
    RegSetKeyValueA(root_, path_.c_str(), name_.c_str(), type, data, size);
  }
  void SetString(const std::string& text, DWORD type = REG_SZ) const {
    Set(type, text.c_str(), static_cast<DWORD>(text.size() + 1));
  }
  void SetDword(DWORD value) const { Set(REG_DWORD, &value, sizeof value); }
  void Delete() const { RegDeleteKeyValueA(root_, path_.c_str(), name_.c_str()); }

private:
  HKEY root_;
  std::string path_;
  std::string name_;
  bool existed_ = false;
  DWORD type_ = 0;
  std::vector<BYTE> data_;
};

// A fresh folder under the temporary folder, removed with its contents.
class ScratchFolder {
public:
  ScratchFolder() {
    char temp[MAX_PATH];
    GetTempPathA(MAX_PATH, temp);
    static unsigned counter = 0;
    do {
      path_ = std::string(temp) + "brtest_" + std::to_string(GetCurrentProcessId()) + "_" + std::to_string(++counter);
    } while (!CreateDirectoryA(path_.c_str(), nullptr));
  }
  ~ScratchFolder() {
    const std::string from = path_ + '\0';  // double-terminated list for the shell's recursive delete
    SHFILEOPSTRUCTA operation{nullptr, FO_DELETE, from.c_str(), nullptr,
                              FOF_NOCONFIRMATION | FOF_NOERRORUI | FOF_SILENT, FALSE, nullptr, nullptr};
    SHFileOperationA(&operation);
  }

  const std::string& Path() const { return path_; }  // without a closing backslash
  std::string operator/(const std::string& relative) const { return path_ + "\\" + relative; }

private:
  std::string path_;
};

inline void WriteTextFile(const std::string& path, const std::string& text) {
  std::ofstream(path, std::ios::binary) << text;
}
// The file's bytes, or empty when it cannot be read.
inline std::string ReadWholeFile(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}
