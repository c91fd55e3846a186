#pragma once
// Registry values restored after a test, scratch folders, small file helpers.

#include <windows.h>

#include <string>
#include <vector>

// Saves a registry value (or its absence) and puts it back when destroyed.
class SavedRegistryValue {
public:
  SavedRegistryValue(HKEY root, std::string path, std::string name);
  ~SavedRegistryValue();
  SavedRegistryValue(const SavedRegistryValue&) = delete;
  SavedRegistryValue& operator=(const SavedRegistryValue&) = delete;

  void SetString(const std::string& text, DWORD type = REG_SZ) const;
  void SetDword(DWORD value) const;
  void SetBinary(const std::vector<BYTE>& data) const;
  void Delete() const;

private:
  void Set(DWORD type, const BYTE* data, DWORD size) const;

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
  ScratchFolder();
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  const std::string& Path() const { return m_path; }  // without a closing backslash
  std::string operator/(const std::string& relative) const { return m_path + "\\" + relative; }

private:
  std::string m_path;
};

void WriteTextFile(const std::string& path, const std::string& text);
// The file's bytes, or empty when it cannot be read.
std::string ReadWholeFile(const std::string& path);
bool FileExists(const std::string& path);
// Lines ending in "\n" (any "\r" kept), the last partial line too.
std::vector<std::string> SplitLines(const std::string& text);
