#pragma once
// One registry key held open for reading, for the error reporter: it must not
// depend on anything that could itself report errors.

#include <windows.h>

#include <string>

namespace br {

class cRegKeyReader {
public:
  cRegKeyReader(HKEY root, const char* path);
  ~cRegKeyReader();
  cRegKeyReader(const cRegKeyReader&) = delete;
  cRegKeyReader& operator=(const cRegKeyReader&) = delete;

  bool IsOpen() const { return key_ != nullptr; }

  // False for a missing value or one of another type. Both throw
  // cErr(BR_ERR_REG_NO_KEY) when no key is open.
  bool ReadDword(const char* name, DWORD& value) const;
  // REG_SZ only, at most maxBytes including the terminator.
  bool ReadString(const char* name, std::string& value, DWORD maxBytes) const;

private:
  void RequireOpen() const;

  HKEY key_ = nullptr;
};

}  // namespace br
