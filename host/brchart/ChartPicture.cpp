#include "host/brchart/ChartPicture.h"

#include <map>
#include <string>
#include <utility>


namespace br::brchart {

namespace {

COLORREF Ref(const Rgb& c) { return RGB(c.red, c.green, c.blue); }

int PenStyle(Dash dash) {
  switch (dash) {
    case Dash::Dashed: return PS_DASH;
    case Dash::Dotted: return PS_DOT;
    default: return PS_SOLID;
  }
}

std::vector<POINT> Points(const std::vector<chartscene::PixelPoint>& shape) {
  std::vector<POINT> out;
  out.reserve(shape.size());
  for (const auto& p : shape) out.push_back(POINT{static_cast<LONG>(p.x), static_cast<LONG>(p.y)});
  return out;
}

// Selects a GDI object for a scope and deletes the one it made.
class Selected {
public:
  Selected(HDC dc, HGDIOBJ object) : dc_(dc), object_(object), old_(SelectObject(dc, object)) {}
  ~Selected() {
    SelectObject(dc_, old_);
    DeleteObject(object_);
  }
  Selected(const Selected&) = delete;
  Selected& operator=(const Selected&) = delete;

private:
  HDC dc_;
  HGDIOBJ object_;
  HGDIOBJ old_;
};

}  // namespace

ChartPicture::ChartPicture(std::vector<br::brchart::DrawItem> items, Rgb background, long width, long height)
    : items_(std::move(items)), background_(background), width_(width), height_(height) {}

void ChartPicture::Draw(HDC dc) const {
  const RECT all{0, 0, width_, height_};
  // Shapes reach past the chart's edges: nothing of them lands beside it.
  const int saved = SaveDC(dc);
  IntersectClipRect(dc, 0, 0, width_, height_);
  HBRUSH sea = CreateSolidBrush(Ref(background_));
  FillRect(dc, &all, sea);
  DeleteObject(sea);
  const int savedMode = SetBkMode(dc, TRANSPARENT);
  for (const auto& item : items_) DrawItem(dc, item);
  DrawLabels(dc);
  for (const auto& item : items_)
    if (highlighted_.count(item.object)) DrawHighlight(dc, item);
  SetBkMode(dc, savedMode);
  RestoreDC(dc, saved);
}

void ChartPicture::DrawItem(HDC dc, const br::brchart::DrawItem& item) const {
  const std::vector<POINT> points = Points(item.shape);
  const COLORREF colour = Ref(item.colour);
  switch (item.style.mark) {
    case Mark::Fill: {
      const Selected brush(dc, CreateSolidBrush(colour));
      const Selected pen(dc, CreatePen(PS_NULL, 0, 0));
      Polygon(dc, points.data(), static_cast<int>(points.size()));
      break;
    }
    case Mark::Outline: {
      // Dashed pens are one pixel wide in GDI.
      const Selected pen(dc, CreatePen(PenStyle(item.style.dash), item.style.dash == Dash::Solid ? item.style.width : 1, colour));
      const Selected hollow(dc, GetStockObject(NULL_BRUSH));
      Polygon(dc, points.data(), static_cast<int>(points.size()));
      break;
    }
    case Mark::Line: {
      const Selected pen(dc, CreatePen(PenStyle(item.style.dash), item.style.dash == Dash::Solid ? item.style.width : 1, colour));
      Polyline(dc, points.data(), static_cast<int>(points.size()));
      break;
    }
    case Mark::Symbol: {
      const POINT p = points.front();
      const int r = item.style.width;
      switch (item.style.symbol) {
        case Symbol::Circle: {
          const Selected brush(dc, CreateSolidBrush(colour));
          const Selected pen(dc, CreatePen(PS_SOLID, 1, RGB(0, 0, 0)));
          Ellipse(dc, p.x - r, p.y - r, p.x + r + 1, p.y + r + 1);
          break;
        }
        case Symbol::Square: {
          const Selected brush(dc, CreateSolidBrush(colour));
          const Selected pen(dc, CreatePen(PS_SOLID, 1, colour));
          Rectangle(dc, p.x - r, p.y - r, p.x + r + 1, p.y + r + 1);
          break;
        }
        case Symbol::Cross: {
          const Selected pen(dc, CreatePen(PS_SOLID, 1, colour));
          MoveToEx(dc, p.x - r, p.y, nullptr);
          LineTo(dc, p.x + r + 1, p.y);
          MoveToEx(dc, p.x, p.y - r, nullptr);
          LineTo(dc, p.x, p.y + r + 1);
          break;
        }
        case Symbol::Flare: {
          // A light's flare: a teardrop leaning away from its structure.
          const Selected brush(dc, CreateSolidBrush(colour));
          const Selected pen(dc, CreatePen(PS_SOLID, 1, colour));
          const POINT flare[3] = {{p.x, p.y}, {p.x + r / 2, p.y - r * 2}, {p.x + r + r / 2, p.y - r * 2 + r / 2}};
          Polygon(dc, flare, 3);
          break;
        }
        case Symbol::Diamond: {
          // Outlined, so the water's shade shows through as on a paper chart.
          const Selected pen(dc, CreatePen(PS_SOLID, 2, colour));
          const POINT diamond[5] = {{p.x, p.y - r}, {p.x + r, p.y}, {p.x, p.y + r}, {p.x - r, p.y}, {p.x, p.y - r}};
          Polyline(dc, diamond, 5);
          break;
        }
        case Symbol::Dot:
        default: {
          const Selected brush(dc, CreateSolidBrush(colour));
          const Selected pen(dc, CreatePen(PS_SOLID, 1, colour));
          Rectangle(dc, p.x - r, p.y - r, p.x + r + 1, p.y + r + 1);
          break;
        }
      }
      break;
    }
    case Mark::None:
      break;
  }
}

void ChartPicture::DrawLabels(HDC dc) const {
  HFONT font = CreateFontW(-11, 0, 0, 0, FW_NORMAL, FALSE, FALSE, FALSE, DEFAULT_CHARSET, OUT_DEFAULT_PRECIS,
                           CLIP_DEFAULT_PRECIS, DEFAULT_QUALITY, VARIABLE_PITCH | FF_SWISS, L"Arial");
  const HGDIOBJ old = font ? SelectObject(dc, font) : nullptr;
  const COLORREF oldColour = SetTextColor(dc, RGB(0, 0, 0));
  std::map<std::pair<long, long>, int> placed;
  for (const auto& item : items_) {
    if (item.label.empty() || item.shape.empty()) continue;
    // Names are UTF-8: a harbour named in any script is written as it is.
    const int n = MultiByteToWideChar(CP_UTF8, 0, item.label.data(), static_cast<int>(item.label.size()), nullptr, 0);
    std::wstring text(static_cast<std::size_t>(n > 0 ? n : 0), L'\0');
    if (n > 0)
      MultiByteToWideChar(CP_UTF8, 0, item.label.data(), static_cast<int>(item.label.size()), &text[0], n);
    const auto& p = item.shape.front();
    // Objects on one spot (a beacon and its light) write their names one under the other.
    const int line = placed[{p.x, p.y}]++;
    TextOutW(dc, static_cast<int>(p.x) + item.style.width + 4, static_cast<int>(p.y) + 2 + line * 12, text.c_str(),
             static_cast<int>(text.size()));
  }
  SetTextColor(dc, oldColour);
  if (old) SelectObject(dc, old);
  if (font) DeleteObject(font);
}

void ChartPicture::DrawHighlight(HDC dc, const br::brchart::DrawItem& item) const {
  const Selected pen(dc, CreatePen(PS_SOLID, 3, RGB(255, 0, 0)));
  const Selected hollow(dc, GetStockObject(NULL_BRUSH));
  const std::vector<POINT> points = Points(item.shape);
  if (item.style.mark == Mark::Symbol) {
    const POINT p = points.front();
    Ellipse(dc, p.x - 10, p.y - 10, p.x + 11, p.y + 11);
  } else if (item.style.mark == Mark::Line) {
    Polyline(dc, points.data(), static_cast<int>(points.size()));
  } else {
    Polygon(dc, points.data(), static_cast<int>(points.size()));
  }
}

}  // namespace br::brchart
