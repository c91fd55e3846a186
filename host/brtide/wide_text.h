// UTF-8 (brtide's own text) to and from UTF-16 (the platform's and the library's).
#pragma once

#include <windows.h>

#include <string>

namespace br::brtide {

std::string Utf8FromWide(const wchar_t* text, std::size_t length);
std::string Utf8FromWide(const std::wstring& text);
std::wstring WideFromUtf8(const std::string& text);

}  // namespace br::brtide
