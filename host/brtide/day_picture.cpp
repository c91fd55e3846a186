#include "host/brtide/day_picture.h"

#include "host/brtide/picture_size.h"
#include "host/brtide/picture_title.h"
#include "host/brtide/png_file.h"
#include "host/brtide/wide_text.h"

#include <ocidl.h>
#include <oleauto.h>
#include <wrl/client.h>

#include <vector>

namespace br::brtide {

namespace {

using Microsoft::WRL::ComPtr;

constexpr const char* kPngOption = "--png";
constexpr const char* kSizeOption = "--size";

// A 32-bit top-down DIB section selected into a memory DC.
class PictureBitmap {
public:
  PictureBitmap(int width, int height) {
    BITMAPINFO info{};
    info.bmiHeader.biSize = sizeof(info.bmiHeader);
    info.bmiHeader.biWidth = width;
    info.bmiHeader.biHeight = -height;
    info.bmiHeader.biPlanes = 1;
    info.bmiHeader.biBitCount = 32;
    info.bmiHeader.biCompression = BI_RGB;
    dc_ = CreateCompatibleDC(nullptr);
    if (dc_) bitmap_ = CreateDIBSection(dc_, &info, DIB_RGB_COLORS, &bits_, nullptr, 0);
    if (bitmap_) old_ = SelectObject(dc_, bitmap_);
  }
  ~PictureBitmap() {
    if (old_) SelectObject(dc_, old_);
    if (bitmap_) DeleteObject(bitmap_);
    if (dc_) DeleteDC(dc_);
  }
  PictureBitmap(const PictureBitmap&) = delete;
  PictureBitmap& operator=(const PictureBitmap&) = delete;

  bool Valid() const { return dc_ && bitmap_ && bits_; }
  HDC Dc() const { return dc_; }
  const void* Bits() const { return bits_; }

private:
  HDC dc_ = nullptr;
  HBITMAP bitmap_ = nullptr;
  HGDIOBJ old_ = nullptr;
  void* bits_ = nullptr;
};

// The title lines in the default GUI font, black on white, over the picture's top.
void DrawTitle(const std::vector<std::string>& lines, const PictureBitmap& picture, int width) {
  const RECT area{0, 0, width, kPictureTitleHeight};
  FillRect(picture.Dc(), &area, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH)));
  const HGDIOBJ oldFont = SelectObject(picture.Dc(), GetStockObject(DEFAULT_GUI_FONT));
  SetBkMode(picture.Dc(), TRANSPARENT);
  SetTextColor(picture.Dc(), RGB(0, 0, 0));
  int y = 3;
  for (const std::string& line : lines) {
    const std::wstring text = WideFromUtf8(line);
    TextOutW(picture.Dc(), 6, y, text.c_str(), static_cast<int>(text.size()));
    y += (kPictureTitleHeight - 6) / 2;
  }
  SelectObject(picture.Dc(), oldFont);
}

// Draws the port's calculated day with a new TidesWindow (labels on, automatic scale)
// below the title.
bool DrawDay(ITidesPort& port, const PictureBitmap& picture, const PictureSize& size, std::string& error) {
  CLSID clsid{};
  if (FAILED(CLSIDFromProgID(L"BR_Info.TidesWindow", &clsid))) {
    error = "BR_Info.TidesWindow is not registered";
    return false;
  }
  ComPtr<ITidesWindow> window;
  if (FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_ITidesWindow,
                              reinterpret_cast<void**>(window.GetAddressOf())))) {
    error = "cannot create BR_Info.TidesWindow";
    return false;
  }
  ComPtr<IViewObject> view;
  if (FAILED(window->SetPort(&port)) || FAILED(window.As(&view))) {
    error = "BR_Info.TidesWindow cannot show the port";
    return false;
  }
  const RECTL bounds{0, kPictureTitleHeight, size.width, size.height};
  if (FAILED(view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, picture.Dc(), &bounds, nullptr, nullptr,
                        0))) {
    error = "BR_Info.TidesWindow cannot draw the day";
    return false;
  }
  GdiFlush();
  window->SetPort(nullptr);
  return true;
}

std::string FullPath(const std::wstring& path) {
  std::vector<wchar_t> buffer(32768);
  const DWORD n = GetFullPathNameW(path.c_str(), static_cast<DWORD>(buffer.size()), buffer.data(), nullptr);
  if (n == 0 || n >= buffer.size()) return Utf8FromWide(path);
  return Utf8FromWide(buffer.data(), n);
}

}  // namespace

OptionSpec DayPictureOption::Option() const {
  OptionSpec option;
  option.name = kPngOption;
  option.valueCount = 1;
  option.valueHint = "FILE";
  option.help = "also draw the day with the TidesWindow control into a PNG picture, under a title that names "
                "the clocks of the curve and of the sun bands";
  return option;
}

bool DayPictureOption::Accepts(const std::vector<std::string>& values, std::string& error) const {
  if (values.empty() || values.front().empty()) {
    error = "--png wants a file name";
    return false;
  }
  return true;
}

int DayPictureOption::Run(ITidesPort& port, const DayRequest& request, const DayReport& day,
                          const std::vector<std::string>& values, std::ostream& messages, std::ostream& err) {
  PictureSize size;
  std::string error;
  const auto sizeValues = request.extras.find(kSizeOption);
  if (sizeValues != request.extras.end() && !sizeValues->second.empty() &&
      !ParsePictureSize(sizeValues->second.front(), size, error)) {
    err << "brtide: " << error << "\n";
    return kExitUsage;
  }
  const PictureBitmap picture(size.width, size.height);
  if (!picture.Valid()) {
    err << "brtide: no bitmap of " << size.width << " x " << size.height << " pixels can be made\n";
    return kExitFailure;
  }
  const std::wstring path = WideFromUtf8(values.front());
  DrawTitle(PictureTitle(day), picture, size.width);
  if (!DrawDay(port, picture, size, error) ||
      !WritePngFile(path, picture.Bits(), size.width, size.height, error)) {
    err << "brtide: " << error << " (" << values.front() << ")\n";
    return kExitFailure;
  }
  messages << "Picture of the day: " << FullPath(path) << " (" << size.width << " x " << size.height
           << " pixels)\n";
  return kExitOk;
}

OptionSpec PictureSizeOption::Option() const {
  OptionSpec option;
  option.name = kSizeOption;
  option.valueCount = 1;
  option.valueHint = "WxH";
  option.help = "size of the --png picture in pixels (default 600x300)";
  return option;
}

bool PictureSizeOption::Accepts(const std::vector<std::string>& values, std::string& error) const {
  PictureSize size;
  return !values.empty() && ParsePictureSize(values.front(), size, error);
}

}  // namespace br::brtide
