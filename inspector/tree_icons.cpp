#include "inspector/tree_icons.h"

#include "inspector/rules/object_groups.h"

namespace br::inspector {

namespace {

constexpr int kSize = 16;
const COLORREF kInk = RGB(32, 64, 128);
const COLORREF kFill = RGB(120, 170, 230);
const COLORREF kMark = RGB(220, 30, 30);

class Pen {
public:
  Pen(HDC dc, COLORREF colour, int width = 1)
      : dc_(dc), pen_(CreatePen(PS_SOLID, width, colour)), brush_(CreateSolidBrush(kFill)) {
    oldPen_ = SelectObject(dc_, pen_);
    oldBrush_ = SelectObject(dc_, brush_);
  }
  ~Pen() {
    SelectObject(dc_, oldPen_);
    SelectObject(dc_, oldBrush_);
    DeleteObject(pen_);
    DeleteObject(brush_);
  }
  Pen(const Pen&) = delete;
  Pen& operator=(const Pen&) = delete;

private:
  HDC dc_;
  HPEN pen_;
  HBRUSH brush_;
  HGDIOBJ oldPen_;
  HGDIOBJ oldBrush_;
};

void DrawBase(HDC dc, int icon) {
  Pen pen(dc, kInk, 1);
  switch (icon) {
    case 0: {  // unknown geometry: a dashed square with a question mark's dot
      for (int i = 2; i < 14; i += 3) {
        SetPixel(dc, i, 2, kInk);
        SetPixel(dc, i, 13, kInk);
        SetPixel(dc, 2, i, kInk);
        SetPixel(dc, 13, i, kInk);
      }
      Rectangle(dc, 7, 7, 9, 9);
      break;
    }
    case 1:  // point: a filled circle
      Ellipse(dc, 4, 4, 12, 12);
      break;
    case 2: {  // line: a zigzag
      Pen thick(dc, kInk, 2);
      const POINT line[] = {{1, 12}, {6, 4}, {10, 11}, {15, 3}};
      Polyline(dc, line, 4);
      break;
    }
    case 3: {  // area: a filled polygon
      const POINT area[] = {{2, 12}, {4, 3}, {12, 2}, {14, 9}, {9, 14}};
      Polygon(dc, area, 5);
      break;
    }
    case 4:  // no geometry: a page
      Rectangle(dc, 3, 1, 13, 15);
      MoveToEx(dc, 5, 5, nullptr);
      LineTo(dc, 11, 5);
      MoveToEx(dc, 5, 8, nullptr);
      LineTo(dc, 11, 8);
      MoveToEx(dc, 5, 11, nullptr);
      LineTo(dc, 9, 11);
      break;
    case 5:  // dataset: a stack of sheets
      Rectangle(dc, 4, 1, 15, 11);
      Rectangle(dc, 2, 3, 13, 13);
      Rectangle(dc, 0, 5, 11, 15);
      break;
    case kIconHarbourAtEntry: {  // harbour: an anchor
      Pen thick(dc, kInk, 2);
      MoveToEx(dc, 8, 3, nullptr);
      LineTo(dc, 8, 14);
      MoveToEx(dc, 4, 6, nullptr);
      LineTo(dc, 12, 6);
      Arc(dc, 2, 6, 15, 15, 2, 11, 15, 11);
      break;
    }
    default: {  // a numbered tile: its number in small digits
      Rectangle(dc, 0, 0, 16, 16);
      char digits[4];
      const int n = wsprintfA(digits, "%d", icon % 100);
      SetBkMode(dc, TRANSPARENT);
      SetTextColor(dc, kInk);
      RECT box{0, 0, kSize, kSize};
      HFONT font = CreateFontA(-9, 0, 0, 0, FW_BOLD, 0, 0, 0, ANSI_CHARSET, 0, 0, NONANTIALIASED_QUALITY, 0, "Arial");
      HGDIOBJ old = SelectObject(dc, font);
      DrawTextA(dc, digits, n, &box, DT_CENTER | DT_VCENTER | DT_SINGLELINE);
      SelectObject(dc, old);
      DeleteObject(font);
      break;
    }
  }
}

// The mark: a red triangle in the lower right corner.
void DrawMark(HDC dc) {
  Pen pen(dc, kMark, 1);
  HBRUSH red = CreateSolidBrush(kMark);
  HGDIOBJ old = SelectObject(dc, red);
  const POINT corner[] = {{15, 8}, {15, 15}, {8, 15}};
  Polygon(dc, corner, 3);
  SelectObject(dc, old);
  DeleteObject(red);
}

// Which picture an icon number shows, and whether it carries the mark.
void Describe(int icon, int& base, bool& marked) {
  marked = false;
  base = icon;
  if (icon >= 6 && icon <= 11) {
    base = icon - 6;
    marked = true;
  } else if (icon >= 78 && icon <= 124) {
    base = icon - 47;
    marked = true;
  }
}

}  // namespace

HIMAGELIST MakeTreeIcons() {
  HIMAGELIST images = ImageList_Create(kSize, kSize, ILC_COLOR24 | ILC_MASK, kIconCount, 0);
  if (!images) return nullptr;
  HDC screen = GetDC(nullptr);
  HDC dc = CreateCompatibleDC(screen);
  HBITMAP picture = CreateCompatibleBitmap(screen, kSize, kSize);
  ReleaseDC(nullptr, screen);
  const COLORREF key = RGB(255, 0, 255);
  for (int icon = 0; icon < kIconCount; ++icon) {
    HGDIOBJ old = SelectObject(dc, picture);
    RECT all{0, 0, kSize, kSize};
    HBRUSH background = CreateSolidBrush(key);
    FillRect(dc, &all, background);
    DeleteObject(background);
    int base = 0;
    bool marked = false;
    Describe(icon, base, marked);
    DrawBase(dc, base);
    if (marked) DrawMark(dc);
    SelectObject(dc, old);
    ImageList_AddMasked(images, picture, key);
  }
  DeleteObject(picture);
  DeleteDC(dc);
  return images;
}

}  // namespace br::inspector
