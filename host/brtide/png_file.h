// Writes a 32-bit picture to a PNG file through GDI+.
#pragma once

#include <windows.h>

#include <string>

namespace br::brtide {

// bits: width x height pixels of 32 bits (blue, green, red, unused), rows top-down.
// False and a one-line message when GDI+ cannot start or the file cannot be written.
bool WritePngFile(const std::wstring& path, const void* bits, int width, int height, std::string& error);

}  // namespace br::brtide
