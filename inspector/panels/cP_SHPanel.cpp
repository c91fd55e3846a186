#include "inspector/panels/cP_SHPanel.h"

#include <algorithm>
#include <vector>

#include <wrl/client.h>

#include "frame/geo/geo_enumeration.h"
#include "frame/settings/localised_texts.h"
#include "inspector/format/attribute_text.h"
#include "inspector/format/tidal_stream_text.h"
#include "inspector/panels/PanelSettings.h"
#include "inspector/panels/geo_object_rules.h"
#include "toolkit/base/class_records.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/table/logic/cell_kinds.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

constexpr long kAttributeFlags = 4;
constexpr long kPropertyInformed = 500;

// Related objects never shown among an object's rows: services have tabs of their own,
// lights a panel of their own, collections are shown as the objects they gather.
bool IsLeftOutRelation(long classCode) {
  return classCode == kClassInternalService || classCode == kClassExternalService || classCode == kClassLight ||
         classCode == kClassAggregation || classCode == kClassAssociation;
}

void LogFailure(const PanelSettings& settings, const char* function, int line, HRESULT result) {
  ErrRecord record(ErrPlace{__FILE__, function, line});
  record.line = line;
  settings.Errors().ReportResult("cP_SHPanel", record, static_cast<std::int32_t>(result));
}

std::wstring AnsiWideText(const std::string& text) {
  if (text.empty() || text.size() > 0x7FFFFFF) return {};
  const int bytes = static_cast<int>(text.size());
  const int size = MultiByteToWideChar(CP_ACP, 0, text.data(), bytes, nullptr, 0);
  if (size <= 0) return {};
  std::wstring wide(static_cast<std::size_t>(size), L'\0');
  MultiByteToWideChar(CP_ACP, 0, text.data(), bytes, wide.data(), size);
  return wide;
}

struct Related {
  std::wstring label;
  ComPtr<IGeoObject> object;
};

}  // namespace

cP_SHPanel::cP_SHPanel(const PanelSettings& settings)
    : Panel(std::make_unique<toolkit::BorderLayout>()), settings_(settings) {
  SetUp(false);
}

cP_SHPanel::cP_SHPanel(const PanelSettings& settings, TwoColumns)
    : Panel(std::make_unique<toolkit::BorderLayout>()), settings_(settings) {
  SetUp(true);
}

cP_SHPanel::~cP_SHPanel() = default;

const toolkit::ClassRecord* cP_SHPanel::getClassRecord() const { return &toolkit::records::cP_SHPanel; }

void cP_SHPanel::SetUp(bool twoColumns) {
  using namespace toolkit::table;
  table_.addColumn("type", "Type", kCellLong, 0, nullptr, false);
  if (twoColumns) table_.addColumn("name", "Name", kCellWideText, 0, nullptr, false);
  textColumn_ = table_.addColumn("text", "Text", kCellWideText, 0, nullptr, false);
  // Hidden columns need the style bit first: the type column is for the panel, not for people.
  table_.setTableStyle((table_.getTableStyle() | toolkit::Table::kStyleWholeRow | toolkit::Table::kStyleFillLast |
                        toolkit::Table::kStyleNoEditOnSelect | toolkit::Table::kStyleOwnerDraw |
                        toolkit::Table::kStyleHidden) &
                       ~(toolkit::Table::kStyleHorizontalGrid | toolkit::Table::kStyleVerticalGrid));
  table_.setColumnVisible(kTypeColumn, false);
  insertNamed("Center", &table_, "rows");
}

int cP_SHPanel::AppendRow(int type, int column, const std::wstring& text) {
  const int row = table_.appendRowLong(kTypeColumn, type, 0);
  if (row >= 0 && column >= 0) table_.setCellWideText(column, row, text);
  return row;
}

void cP_SHPanel::AddRow(const std::wstring& name, const std::wstring& value) {
  if (name.empty() || value.empty()) return;
  AppendRow(kRowName, textColumn_, name);
  AppendRow(kRowValue, textColumn_, value);
}

void cP_SHPanel::AddHeading(const std::wstring& label) { AppendRow(kRowHeading, textColumn_, label); }

void cP_SHPanel::Clear() { table_.removeAllRows(); }

HRESULT cP_SHPanel::FillObject(IGeoObject* object, bool heading, bool related) {
  if (object == nullptr) return E_INVALIDARG;
  long classCode = 0;
  if (FAILED(object->GetClassCode(&classCode))) return E_FAIL;
  if (IsHiddenClass(object, classCode)) return S_FALSE;

  // 1. The related objects worth a heading of their own, by label.
  std::vector<Related> kept;
  if (related) {
    ComPtr<IGeoObjectEnum> relations;
    if (FAILED(object->GetMembers(&relations)) || !relations) {
      relations.Reset();
      object->GetRelated(&relations);
    }
    if (relations) {
      geo::ForEachItem(relations.Get(), [&](IUnknown* item) {
        ComPtr<IGeoObject> other;
        long otherClass = 0;
        if (FAILED(item->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(other.GetAddressOf()))) ||
            FAILED(other->GetClassCode(&otherClass)) || IsLeftOutRelation(otherClass) ||
            IsHiddenClass(other.Get(), otherClass)) {
          return true;
        }
        kept.push_back({ObjectLabel(settings_, other.Get(), otherClass), other});
        return true;
      });
    }
    std::stable_sort(kept.begin(), kept.end(), [](const Related& a, const Related& b) { return a.label < b.label; });
  }

  // 2. The object itself; with a heading only when there is something under it.
  if (heading) {
    bool hasAttributes = false;
    ComPtr<IGeoObjectEnum> attributes;
    if (SUCCEEDED(object->GetAttributes(&attributes)) && attributes) {
      hasAttributes = geo::ForEachItem(attributes.Get(), [](IUnknown*) { return false; }) > 0;
    }
    if (kept.empty() && !hasAttributes) {
      doLayout();
      LayOutRows();
      return S_OK;
    }
    if (related) AddHeading(ObjectLabel(settings_, object, classCode));
  }
  AddObjectAttributes(object);

  // 3. Each related object under its heading.
  for (const Related& other : kept) {
    AddHeading(other.label);
    AddObjectAttributes(other.object.Get());
  }
  doLayout();
  LayOutRows();
  return S_OK;
}

void cP_SHPanel::AddObjectAttributes(IGeoObject* object) {
  bool chart = false;
  bool informed = false;
  ComPtr<IGeoDataSet> dataSet;
  GUID kind{};
  if (SUCCEEDED(object->GetDataSet(&dataSet)) && dataSet && SUCCEEDED(dataSet->GetKindId(&kind)) &&
      IsChartKind(kind)) {
    chart = true;
    informed = LongProperty(object, kPropertyInformed) == kProperty500Informed;
  }
  // The object owns every attribute listed: its catalogue answers for all of them.
  ComPtr<IGeoCatalog> catalogue = CatalogueOf(dataSet.Get());
  const auto unprintable = [&](long code) {
    if (settings_.skipUnprintableTest) return false;
    long flags = 0;
    const HRESULT hr = catalogue ? catalogue->GetAttributeFlags(code, &flags) : E_NOINTERFACE;
    if (FAILED(hr)) {
      LogFailure(settings_, "IsUNPRINTABLE", __LINE__, hr);
      return false;
    }
    return (flags & kCatalogueHiddenBit) != 0;
  };

  ComPtr<IGeoObjectEnum> attributes;
  if (FAILED(object->GetAttributes(&attributes)) || !attributes) return;
  std::vector<long> codes;
  geo::ForEachItem(attributes.Get(), [&](IUnknown* item) {
    ComPtr<IGeoAttribute> attribute;
    long code = 0;
    if (FAILED(item->QueryInterface(IID_IGeoAttribute, reinterpret_cast<void**>(attribute.GetAddressOf()))) ||
        FAILED(attribute->GetCode(&code)) || unprintable(code)) {
      return true;
    }
    if (chart) {
      codes.push_back(code);
    } else {
      AddPrintableAttribute(attribute.Get(), false);
    }
    return true;
  });
  if (!chart) return;
  for (long code : OrderChartAttributeCodes(codes, informed)) {
    ComPtr<IGeoAttribute> attribute;
    // The codes were tested as they were listed.
    if (object->GetAttribute(code, &attribute) == S_OK && attribute) AddPrintableAttribute(attribute.Get(), true);
  }
}

bool cP_SHPanel::IsUnprintable(IGeoAttribute* attribute) const {
  if (attribute == nullptr || settings_.skipUnprintableTest) return false;
  ComPtr<IUnknown> owner;
  HRESULT hr = attribute->GetOwner(&owner);
  if (FAILED(hr) || !owner) {
    LogFailure(settings_, "IsUNPRINTABLE", __LINE__, FAILED(hr) ? hr : E_POINTER);
    return false;
  }
  ComPtr<IGeoDataSet> dataSet;
  ComPtr<IGeoObject> object;
  if (SUCCEEDED(owner.As(&object))) {
    hr = object->GetDataSet(&dataSet);
  } else {
    hr = owner.As(&dataSet);
  }
  if (FAILED(hr) || !dataSet) {
    LogFailure(settings_, "IsUNPRINTABLE", __LINE__, FAILED(hr) ? hr : E_POINTER);
    return false;
  }
  ComPtr<IGeoCatalog> catalogue = CatalogueOf(dataSet.Get());
  long code = 0;
  long flags = 0;
  if (!catalogue) {
    LogFailure(settings_, "IsUNPRINTABLE", __LINE__, E_NOINTERFACE);
    return false;
  }
  if (FAILED(hr = attribute->GetCode(&code)) || FAILED(hr = catalogue->GetAttributeFlags(code, &flags))) {
    LogFailure(settings_, "IsUNPRINTABLE", __LINE__, hr);
    return false;
  }
  return (flags & kCatalogueHiddenBit) != 0;
}

HRESULT cP_SHPanel::AddAttributeToContent(IGeoAttribute* attribute) {
  if (attribute == nullptr) return E_INVALIDARG;
  if (IsUnprintable(attribute)) return S_FALSE;
  const HRESULT hr = AddPrintableAttribute(attribute, std::nullopt);
  if (hr == S_OK) LayOutRows();
  return hr;
}

HRESULT cP_SHPanel::AddPrintableAttribute(IGeoAttribute* attribute, std::optional<bool> chartOwner) {
  long code = 0;
  HRESULT hr = attribute->GetCode(&code);
  if (FAILED(hr)) {
    LogFailure(settings_, "_AddAttributeToContent", __LINE__, hr);
    return hr;
  }
  bool chart = false;
  if (chartOwner) {
    chart = *chartOwner;
  } else {
    const std::optional<GUID> kind = OwnerKindOf(attribute);
    chart = kind && IsChartKind(*kind);
  }

  // Magnetic variation is written here, whatever the formatter makes of it.
  std::optional<std::string> variation;
  if (chart && code == kCodeMagneticVariation) {
    VARIANT value;
    VariantInit(&value);
    if (SUCCEEDED(attribute->GetValue(&value)) && value.vt == VT_R8) variation = MagneticVariationText(value.dblVal);
    VariantClear(&value);
  }

  IObjectFormatter* formatter = settings_.Formatter();
  if (formatter == nullptr) return E_NOINTERFACE;
  BSTR text = nullptr;
  hr = formatter->FormatAttribute(0, kAttributeFlags | settings_.attributeFlags, attribute, 0, 0, &text);
  // UTF-8 while the rules below look for their ASCII marks; UTF-16 again for the rows.
  const std::string formatted = SUCCEEDED(hr) ? Utf8Text(text) : std::string();
  SysFreeString(text);
  if (FAILED(hr)) {
    LogFailure(settings_, "_AddAttributeToContent", __LINE__, hr);
    return hr;
  }
  std::optional<AttributeText> pair = SplitAttributeText(formatted);
  if (!pair) return S_FALSE;

  bool ansiValue = false;
  if (variation) {
    pair->value = *variation;
  } else {
    if (chart && code == kCodeTidalStream) {
      // The table is laid out in the ANSI code page, as its captions and degree signs are.
      const std::wstring wide = WideText(pair->value);
      pair->value = TidalStreamValue(AnsiText(wide.c_str(), wide.size()));
      ansiValue = true;
    }
    pair->value = CleanAttributeValue(pair->value);
  }
  if (IsHiddenInformation(code, pair->value)) return S_FALSE;
  if (pair->name.empty() || pair->value.empty()) return S_FALSE;
  std::wstring value;
  if (variation) {
    // Written here in Latin-1 (the degree sign), which maps byte for unit.
    for (char c : *variation) value += static_cast<wchar_t>(static_cast<unsigned char>(c));
  } else {
    value = ansiValue ? AnsiWideText(pair->value) : WideText(pair->value);
  }
  AddRow(WideText(pair->name), value);
  return S_OK;
}

std::string cP_SHPanel::TidalStreamValue(const std::string& raw) {
  TidalStreamCaptions captions;
  captions.highWater = GetText("ObjInspector", 59, "HighWater");
  captions.lowWater = GetText("ObjInspector", 60, "LowWater");
  captions.time = GetText("ObjInspector", 61, "Time");
  captions.direction = GetText("ObjInspector", 62, "Direction");
  captions.velocity = GetText("ObjInspector", 63, "Velocity");
  captions.knots = GetText("ObjInspector", 64, "kn");
  return TidalStreamText(raw, captions);
}

int cP_SHPanel::dispatchEvent(toolkit::ToolkitEvent& event) {
  if (event.source == &table_ && event.id == toolkit::Table::kEventLayoutRows) {
    LayOutRows();
    return 1;
  }
  if (event.source == &table_ && event.id == toolkit::Table::kEventDrawCell) {
    const HDC dc = reinterpret_cast<HDC>(event.params[0]);
    const RECT* rect = reinterpret_cast<const RECT*>(event.params[1]);
    const int column = static_cast<int>(event.params[3]);
    const int row = static_cast<int>(event.params[4]);
    if (dc != nullptr && rect != nullptr && DrawCell(dc, *rect, column, row)) return 1;
  }
  return Panel::dispatchEvent(event);
}

PanelRowKind cP_SHPanel::KindOf(int row) const {
  switch (RowType(row)) {
    case kRowHeading: return PanelRowKind::Heading;
    case kRowName: return PanelRowKind::Name;
    case kRowValue: return PanelRowKind::Value;
    default: return PanelRowKind::Attribute;
  }
}

HFONT cP_SHPanel::RowFont() const {
  const HFONT font = table_.getFont();
  return font ? font : static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
}

int cP_SHPanel::PrepareEngine(HDC dc) {
  const HFONT font = RowFont();
  if (font != engineFont_ && engine_.setBaseFont(font)) engineFont_ = font;
  engine_.selectFontSlot(0);
  const HGDIOBJ old = SelectObject(dc, font);
  TEXTMETRICW metrics{};
  const int lineHeight = GetTextMetricsW(dc, &metrics) ? static_cast<int>(metrics.tmHeight) : 13;
  SelectObject(dc, old);
  return std::max(lineHeight, 1);
}

namespace {
// Text is kept this far from a cell's right edge.
constexpr int kRightMargin = 4;
// The name column of the side-by-side layout.
constexpr int kSideNameColumn = 1;
}  // namespace

int cP_SHPanel::MeasureCellText(HDC dc, const std::wstring& text, int width, PanelRowKind kind, int lineHeight) {
  const RECT box{PanelRowIndent(kind, TableLayout()), 0, std::max<LONG>(width - kRightMargin, 1), 0};
  engine_.setMeasureOnly(true);
  int y = 0;
  for (std::wstring_view line : PanelTextLines(text)) {
    engine_.drawParagraph(dc, line, y, box, 0, static_cast<int>(line.size()), lineHeight);
  }
  engine_.setMeasureOnly(false);
  return y;
}

// Texts wrap at the window's edge when a column reaches past it (the last column only
// ever grows to fill the table).
int cP_SHPanel::VisibleWidth(int column) const {
  const RECT cell = table_.getCellRect(column, -1);
  const LONG right = std::min(cell.right, table_.getClientRect().right);
  return std::max(static_cast<int>(right - cell.left), 1);
}

void cP_SHPanel::LayOutRows() {
  const int rows = table_.getRowCount();
  if (rows == 0) return;
  const HWND window = table_.getHandle();
  const HDC dc = window ? GetDC(window) : CreateCompatibleDC(nullptr);
  if (dc == nullptr) return;
  const int lineHeight = PrepareEngine(dc);
  const HGDIOBJ old = SelectObject(dc, RowFont());
  const int clientWidth = static_cast<int>(table_.getClientRect().right);
  for (int row = 0; row < rows; ++row) {
    const PanelRowKind kind = KindOf(row);
    int textHeight = 0;
    if (!TableLayout()) {
      textHeight =
          MeasureCellText(dc, table_.getCellWideText(row, textColumn_), VisibleWidth(textColumn_), kind, lineHeight);
    } else if (kind == PanelRowKind::Heading) {
      // A heading spans the row from the name column's left edge.
      const int left = static_cast<int>(table_.getCellRect(kSideNameColumn, -1).left);
      textHeight = MeasureCellText(dc, table_.getCellWideText(row, kSideNameColumn),
                                   std::max(clientWidth - std::max(left, 0), table_.getColumnWidth(kSideNameColumn)),
                                   kind, lineHeight);
    } else {
      for (int column : {kSideNameColumn, textColumn_}) {
        textHeight = std::max(textHeight, MeasureCellText(dc, table_.getCellWideText(row, column),
                                                          VisibleWidth(column), kind, lineHeight));
      }
    }
    table_.setRowHeight(row, PanelRowHeight(textHeight, lineHeight, kind, row == rows - 1));
  }
  SelectObject(dc, old);
  if (window) {
    ReleaseDC(window, dc);
  } else {
    DeleteDC(dc);
  }
}

void cP_SHPanel::DrawCellText(HDC dc, const RECT& area, const std::wstring& text, PanelRowKind kind) {
  FillRect(dc, &area, GetSysColorBrush(COLOR_WINDOW));
  const int lineHeight = PrepareEngine(dc);
  const int indent = PanelRowIndent(kind, TableLayout());
  const LONG right = std::min(area.right, table_.getClientRect().right);
  const RECT box{area.left + indent, area.top, std::max<LONG>(right - kRightMargin, area.left + indent + 1),
                 area.bottom};
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColour = SetTextColor(dc, GetSysColor(kind == PanelRowKind::Heading ? COLOR_HIGHLIGHT : COLOR_WINDOWTEXT));
  // Rows are as high as their text; a cell cut short (its row not measured yet) clips.
  const int saved = SaveDC(dc);
  IntersectClipRect(dc, area.left, area.top, area.right, area.bottom);
  int y = area.top + PanelRowTextTop(kind);
  for (std::wstring_view line : PanelTextLines(text)) {
    engine_.drawParagraph(dc, line, y, box, 0, static_cast<int>(line.size()), lineHeight);
  }
  RestoreDC(dc, saved);
  SetTextColor(dc, oldColour);
  SetBkMode(dc, oldMode);
}

bool cP_SHPanel::DrawCell(HDC dc, const RECT& rect, int column, int row) {
  if (row < 0) return false;
  const int type = RowType(row);
  if (type != kRowHeading && type != kRowName && type != kRowValue) return false;
  DrawCellText(dc, rect, table_.getCellWideText(row, column), KindOf(row));
  return true;
}

}  // namespace br::inspector
