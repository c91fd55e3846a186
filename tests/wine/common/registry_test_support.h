#pragma once
// Registry values restored after a test, scratch folders, folder links, whole-file reads
// and writes.

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

// Folder links. Wine's CreateSymbolicLink makes nothing, but it shows Unix symbolic links
// as folder links (directory + reparse point), so under Wine the link is made, and a tree
// holding links removed, by the Unix ln and rm; on Windows by the platform's own calls.
namespace folder_links {

inline bool OnWine() { return GetProcAddress(GetModuleHandleA("ntdll.dll"), "wine_get_version") != nullptr; }

inline std::string UnixPath(const std::string& path) {
  using ToUnix = char*(CDECL*)(LPCWSTR);
  const auto toUnix = reinterpret_cast<ToUnix>(
      reinterpret_cast<void*>(GetProcAddress(GetModuleHandleA("kernel32.dll"), "wine_get_unix_file_name")));
  const std::wstring wide(path.begin(), path.end());
  char* unixPath = toUnix ? toUnix(wide.c_str()) : nullptr;
  const std::string result = unixPath ? unixPath : "";
  HeapFree(GetProcessHeap(), 0, unixPath);
  return result;
}

inline void RunUnix(const char* program, std::string commandLine) {
  STARTUPINFOA startup{};
  startup.cb = sizeof(startup);
  PROCESS_INFORMATION process{};
  if (CreateProcessA(program, &commandLine[0], nullptr, nullptr, FALSE, 0, nullptr, nullptr, &startup, &process)) {
    WaitForSingleObject(process.hProcess, 30000);
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
  }
}

}  // namespace folder_links

// A link at linkPath to the folder target; true when the link lists as a folder link.
inline bool MakeFolderLink(const std::string& linkPath, const std::string& target) {
  if (folder_links::OnWine()) {
    folder_links::RunUnix("Z:\\bin\\ln", "ln -s \"" + folder_links::UnixPath(target) + "\" \"" +
                                                 folder_links::UnixPath(linkPath) + "\"");
  } else {
    CreateSymbolicLinkA(linkPath.c_str(), target.c_str(), SYMBOLIC_LINK_FLAG_DIRECTORY);
  }
  // As a folder listing shows it (asking the path itself may follow the link). Wine's
  // process handle for a Unix program does not wait for the program: look until it is there.
  const DWORD links = FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY;
  for (int attempt = 0; attempt < 100; ++attempt) {
    WIN32_FIND_DATAA found;
    const HANDLE search = FindFirstFileA(linkPath.c_str(), &found);
    if (search != INVALID_HANDLE_VALUE) {
      FindClose(search);
      return (found.dwFileAttributes & links) == links;
    }
    Sleep(50);
  }
  return false;
}

// Removes a folder tree that holds folder links without following them (a recursive
// delete through the shell would walk a link loop).
inline void RemoveTreeWithLinks(const std::string& folder) {
  if (folder_links::OnWine()) {
    folder_links::RunUnix("Z:\\bin\\rm", "rm -rf \"" + folder_links::UnixPath(folder) + "\"");
    for (int attempt = 0; attempt < 100 && GetFileAttributesA(folder.c_str()) != INVALID_FILE_ATTRIBUTES; ++attempt) {
      Sleep(50);
    }
    return;
  }
  WIN32_FIND_DATAA found;
  const HANDLE search = FindFirstFileA((folder + "\\*").c_str(), &found);
  if (search != INVALID_HANDLE_VALUE) {
    do {
      const std::string name = found.cFileName;
      if (name == "." || name == "..") continue;
      const std::string path = folder + "\\" + name;
      if ((found.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0) {
        RemoveDirectoryA(path.c_str());
      } else if ((found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0) {
        RemoveTreeWithLinks(path);
      } else {
        DeleteFileA(path.c_str());
      }
    } while (FindNextFileA(search, &found));
    FindClose(search);
  }
  RemoveDirectoryA(folder.c_str());
}
