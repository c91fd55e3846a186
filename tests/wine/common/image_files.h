// Picture files written at test time: BMP (8 and 24 bits) and GIF by hand, PNG, TIFF and
// JPEG through GDI+'s encoders (Wine's GIF encoder writes files its decoder cannot read).
#pragma once

#include <windows.h>

#include <cstdint>
#include <string>
#include <vector>

namespace br::test {

// Pixels as 0xAARRGGBB, row by row from the top.
struct Pixels {
  int width = 0;
  int height = 0;
  std::vector<std::uint32_t> argb;

  std::uint32_t& at(int x, int y) { return argb[static_cast<size_t>(y) * width + x]; }
};

constexpr std::uint32_t Argb(int a, int r, int g, int b) {
  return static_cast<std::uint32_t>(a) << 24 | static_cast<std::uint32_t>(r) << 16 |
         static_cast<std::uint32_t>(g) << 8 | static_cast<std::uint32_t>(b);
}
// The same colour as the canvas reads it (0x00BBGGRR).
inline COLORREF AsColour(std::uint32_t argb) { return RGB(argb >> 16 & 0xFF, argb >> 8 & 0xFF, argb & 0xFF); }

// width x height of grey (100, 100, 100) with 8 x 8 corner blocks: red top left, green top
// right, blue bottom left, white bottom right (JPEG keeps blocks of one colour nearly exact).
Pixels CornerPattern(int width, int height);
constexpr std::uint32_t kPatternGrey = Argb(255, 100, 100, 100);
constexpr std::uint32_t kCornerColours[4] = {Argb(255, 255, 0, 0), Argb(255, 0, 255, 0), Argb(255, 0, 0, 255),
                                             Argb(255, 255, 255, 255)};

// Each writer gives false when the file could not be made. The 8-bit writers need at most
// 256 colours; alpha is dropped except by PNG and TIFF.
bool WriteBmp24(const std::wstring& path, const Pixels& pixels);
bool WriteBmp8(const std::wstring& path, const Pixels& pixels);
bool WriteGif(const std::wstring& path, const Pixels& pixels);
// mime: "image/png", "image/tiff", "image/jpeg".
bool WriteEncoded(const std::wstring& path, const Pixels& pixels, const wchar_t* mime);
// Bytes that no decoder takes for a picture.
bool WriteBroken(const std::wstring& path);

// A folder for picture files under the temporary folder, removed with its files on destruction.
class PictureFolder {
public:
  explicit PictureFolder(const wchar_t* name);
  ~PictureFolder();
  PictureFolder(const PictureFolder&) = delete;
  PictureFolder& operator=(const PictureFolder&) = delete;
  const std::wstring& Path() const { return path_; }
  std::wstring File(const std::wstring& name) const { return path_ + name; }

private:
  std::wstring path_;  // ends with a backslash
};

}  // namespace br::test
