#pragma once
// Settings access under one registry root and the base path "SOFTWARE\Brine".
// Every access opens its key afresh and closes it before returning; values of
// another type than asked for read as absent.

#include <windows.h>

#include <string>

namespace br {

class cRegSettings {
public:
  static constexpr const char* BASE_PATH = "SOFTWARE\\Brine";

  // HKEY_LOCAL_MACHINE or HKEY_CURRENT_USER.
  explicit cRegSettings(HKEY root) : root_(root) {}
  static cRegSettings Machine() { return cRegSettings(HKEY_LOCAL_MACHINE); }
  static cRegSettings User() { return cRegSettings(HKEY_CURRENT_USER); }

  HKEY Root() const { return root_; }

  // subkey is relative to the base path; null or empty names the base key.
  DWORD ReadDword(const char* subkey, const char* name, DWORD defaultValue) const;
  // A null name reads the key's default value.
  std::string ReadString(const char* subkey, const char* name,
                         const std::string& defaultText) const;
  // Creates the key when it is missing.
  bool WriteDword(const char* subkey, const char* name, DWORD value) const;

  // "SOFTWARE\Brine" or "SOFTWARE\Brine\<subkey>".
  static std::string FullPath(const char* subkey);

private:
  HKEY root_;
};

}  // namespace br
