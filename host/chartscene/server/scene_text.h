#pragma once
// Text conversions and file reading of the stand-in host: files and scene texts are
// UTF-8, COM texts UTF-16, catalogue texts code page 1252.

#include <windows.h>
#include <oleauto.h>

#include <string>

namespace br::chartscene {

std::string Utf8FromWide(const wchar_t* text, std::size_t length);
std::wstring WideFromUtf8(const std::string& text);
// A new BSTR (null for an empty text when allocation fails).
BSTR BstrFromUtf8(const std::string& text);
BSTR BstrFromWide(const std::wstring& text);
bool ReadWholeFile(const std::wstring& path, std::string& content);

}  // namespace br::chartscene
