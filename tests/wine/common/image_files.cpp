#include "tests/wine/common/image_files.h"

#include <objidl.h>
#include <gdiplus.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <memory>

namespace br::test {

namespace {

using File = std::unique_ptr<FILE, int (*)(FILE*)>;

File Open(const std::wstring& path) { return File(_wfopen(path.c_str(), L"wb"), &std::fclose); }

void Put16(std::vector<unsigned char>& out, unsigned value) {
  out.push_back(value & 0xFF);
  out.push_back(value >> 8 & 0xFF);
}
void Put32(std::vector<unsigned char>& out, std::uint32_t value) {
  Put16(out, value & 0xFFFF);
  Put16(out, value >> 16);
}

bool Save(const std::wstring& path, const std::vector<unsigned char>& bytes) {
  File file = Open(path);
  return file && std::fwrite(bytes.data(), 1, bytes.size(), file.get()) == bytes.size();
}

// The colours of the picture (alpha dropped) and each pixel's index; false past 256.
bool Indexed(const Pixels& pixels, std::vector<std::uint32_t>& colours, std::vector<unsigned char>& indices) {
  std::map<std::uint32_t, unsigned char> seen;
  for (std::uint32_t p : pixels.argb) {
    const std::uint32_t rgb = p & 0xFFFFFF;
    auto it = seen.find(rgb);
    if (it == seen.end()) {
      if (colours.size() == 256) return false;
      it = seen.emplace(rgb, static_cast<unsigned char>(colours.size())).first;
      colours.push_back(rgb);
    }
    indices.push_back(it->second);
  }
  return true;
}

std::vector<unsigned char> BmpHeader(const Pixels& pixels, int bits, int colours, std::uint32_t imageBytes) {
  std::vector<unsigned char> out;
  const std::uint32_t offset = 14 + 40 + 4 * colours;
  out.push_back('B');
  out.push_back('M');
  Put32(out, offset + imageBytes);
  Put32(out, 0);
  Put32(out, offset);
  Put32(out, 40);
  Put32(out, pixels.width);
  Put32(out, pixels.height);  // bottom-up
  Put16(out, 1);
  Put16(out, bits);
  Put32(out, 0);
  Put32(out, imageBytes);
  Put32(out, 2835);
  Put32(out, 2835);
  Put32(out, colours);
  Put32(out, 0);
  return out;
}

}  // namespace

Pixels CornerPattern(int width, int height) {
  Pixels p{width, height, std::vector<std::uint32_t>(static_cast<size_t>(width) * height, kPatternGrey)};
  for (int y = 0; y < 8 && y < height; ++y)
    for (int x = 0; x < 8 && x < width; ++x) {
      p.at(x, y) = kCornerColours[0];
      p.at(width - 1 - x, y) = kCornerColours[1];
      p.at(x, height - 1 - y) = kCornerColours[2];
      p.at(width - 1 - x, height - 1 - y) = kCornerColours[3];
    }
  return p;
}

bool WriteBmp24(const std::wstring& path, const Pixels& pixels) {
  const int stride = (pixels.width * 3 + 3) & ~3;
  std::vector<unsigned char> out = BmpHeader(pixels, 24, 0, stride * pixels.height);
  for (int y = pixels.height - 1; y >= 0; --y) {
    const size_t start = out.size();
    for (int x = 0; x < pixels.width; ++x) {
      const std::uint32_t p = pixels.argb[static_cast<size_t>(y) * pixels.width + x];
      out.push_back(p & 0xFF);
      out.push_back(p >> 8 & 0xFF);
      out.push_back(p >> 16 & 0xFF);
    }
    out.resize(start + stride, 0);
  }
  return Save(path, out);
}

bool WriteBmp8(const std::wstring& path, const Pixels& pixels) {
  std::vector<std::uint32_t> colours;
  std::vector<unsigned char> indices;
  if (!Indexed(pixels, colours, indices)) return false;
  const int stride = (pixels.width + 3) & ~3;
  std::vector<unsigned char> out = BmpHeader(pixels, 8, static_cast<int>(colours.size()), stride * pixels.height);
  for (std::uint32_t c : colours) Put32(out, c);  // B, G, R, 0
  for (int y = pixels.height - 1; y >= 0; --y) {
    const size_t start = out.size();
    out.insert(out.end(), indices.begin() + static_cast<long>(y) * pixels.width,
               indices.begin() + static_cast<long>(y + 1) * pixels.width);
    out.resize(start + stride, 0);
  }
  return Save(path, out);
}

bool WriteGif(const std::wstring& path, const Pixels& pixels) {
  std::vector<std::uint32_t> colours;
  std::vector<unsigned char> indices;
  if (!Indexed(pixels, colours, indices)) return false;
  colours.resize(256, 0);
  std::vector<unsigned char> out = {'G', 'I', 'F', '8', '9', 'a'};
  Put16(out, pixels.width);
  Put16(out, pixels.height);
  out.push_back(0xF7);  // global colour table of 256 entries
  out.push_back(0);
  out.push_back(0);
  for (std::uint32_t c : colours) {
    out.push_back(c >> 16 & 0xFF);
    out.push_back(c >> 8 & 0xFF);
    out.push_back(c & 0xFF);
  }
  out.push_back(0x2C);
  Put16(out, 0);
  Put16(out, 0);
  Put16(out, pixels.width);
  Put16(out, pixels.height);
  out.push_back(0);
  out.push_back(8);  // minimum code size
  // Every pixel as a literal 9-bit code, with a clear code before the table would need
  // 10 bits: simple, and any decoder reads it.
  std::vector<unsigned char> data;
  std::uint32_t buffer = 0;
  int bits = 0;
  const auto emit = [&](unsigned code) {
    buffer |= code << bits;
    bits += 9;
    while (bits >= 8) {
      data.push_back(buffer & 0xFF);
      buffer >>= 8;
      bits -= 8;
    }
  };
  int sinceClear = 0;
  emit(256);
  for (unsigned char index : indices) {
    if (sinceClear == 254) {
      emit(256);
      sinceClear = 0;
    }
    emit(index);
    ++sinceClear;
  }
  emit(257);
  if (bits > 0) data.push_back(buffer & 0xFF);
  for (size_t i = 0; i < data.size(); i += 255) {
    const size_t n = std::min<size_t>(255, data.size() - i);
    out.push_back(static_cast<unsigned char>(n));
    out.insert(out.end(), data.begin() + i, data.begin() + i + n);
  }
  out.push_back(0);
  out.push_back(0x3B);
  return Save(path, out);
}

bool WriteEncoded(const std::wstring& path, const Pixels& pixels, const wchar_t* mime) {
  namespace gp = Gdiplus::DllExports;
  ULONG_PTR token = 0;
  Gdiplus::GdiplusStartupInput input;
  if (Gdiplus::GdiplusStartup(&token, &input, nullptr) != Gdiplus::Ok) return false;
  bool saved = false;
  UINT count = 0, bytes = 0;
  gp::GdipGetImageEncodersSize(&count, &bytes);
  std::vector<unsigned char> table(bytes);
  auto* codecs = reinterpret_cast<Gdiplus::ImageCodecInfo*>(table.data());
  Gdiplus::GpBitmap* bitmap = nullptr;
  if (bytes && gp::GdipGetImageEncoders(count, bytes, codecs) == Gdiplus::Ok &&
      gp::GdipCreateBitmapFromScan0(pixels.width, pixels.height, pixels.width * 4, PixelFormat32bppARGB,
                                    reinterpret_cast<BYTE*>(const_cast<std::uint32_t*>(pixels.argb.data())),
                                    &bitmap) == Gdiplus::Ok) {
    for (UINT i = 0; i < count; ++i)
      if (lstrcmpiW(codecs[i].MimeType, mime) == 0)
        saved = gp::GdipSaveImageToFile(bitmap, path.c_str(), &codecs[i].Clsid, nullptr) == Gdiplus::Ok;
    gp::GdipDisposeImage(bitmap);
  }
  Gdiplus::GdiplusShutdown(token);
  return saved;
}

bool WriteBroken(const std::wstring& path) {
  const std::string text = "this is no picture at all, just text";
  return Save(path, std::vector<unsigned char>(text.begin(), text.end()));
}

PictureFolder::PictureFolder(const wchar_t* name) {
  wchar_t temp[MAX_PATH] = {};
  GetTempPathW(MAX_PATH, temp);
  path_ = std::wstring(temp) + name + L"_" + std::to_wstring(GetCurrentProcessId()) + L"\\";
  CreateDirectoryW(path_.c_str(), nullptr);
}

PictureFolder::~PictureFolder() {
  WIN32_FIND_DATAW entry;
  const HANDLE find = FindFirstFileW((path_ + L"*").c_str(), &entry);
  if (find != INVALID_HANDLE_VALUE) {
    do {
      if (!(entry.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY)) {
        SetFileAttributesW((path_ + entry.cFileName).c_str(), FILE_ATTRIBUTE_NORMAL);
        DeleteFileW((path_ + entry.cFileName).c_str());
      }
    } while (FindNextFileW(find, &entry));
    FindClose(find);
  }
  RemoveDirectoryW(path_.c_str());
}

}  // namespace br::test
