#include "inspector/panels/cLightsViewPanel.h"

#include <algorithm>
#include <optional>
#include <set>
#include <tuple>

#include <wrl/client.h>

#include "frame/geo/geo_enumeration.h"
#include "inspector/format/attribute_text.h"
#include "inspector/format/light_abbreviation.h"
#include "inspector/panels/PanelSettings.h"
#include "inspector/panels/geo_object_rules.h"
#include "toolkit/base/class_records.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/table/logic/cell_kinds.h"
#include "toolkit/widgets/Tooltip.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

constexpr long kAttributeFlags = 4;

struct ColumnInfo {
  const char* acronym;
  const char* caption;
  long code;
};

// The row table's columns in order; column 0 numbers the rows and is never shown.
constexpr ColumnInfo kColumns[cLightsViewPanel::kColumnCount] = {
    {"LIGHTS", "", 0},
    {"LITCHR", "Characteristic", kCodeLightCharacter},
    {"SIGGRP", "Signal Group", kCodeSignalGroup},
    {"COLOUR", "Colour", kCodeColour},
    {"SIGPER", "Signal Period", kCodeSignalPeriod},
    {"SECTOR", "Sector", kCodeSectorOne},
    {"HEIGHT", "Height", kCodeHeight},
    {"VALNMR", "Range", kCodeNominalRange},
    {"CATLIT", "Category", kCodeCategoryOfLight},
    {"STATUS", "Status", 149},
    {"PERSTA", "PERSTA", 119},
    {"PEREND", "PEREND", 118},
    {"INFORM", "Inform", kCodeInformation},
};

bool Shown(int column) { return column >= cLightsViewPanel::kFirstShown && column <= cLightsViewPanel::kLastShown; }

// ---- raw values for the abbreviation

std::optional<double> DoubleValue(const VARIANT& value) {
  VARIANT converted;
  VariantInit(&converted);
  std::optional<double> out;
  if (value.vt != VT_EMPTY && value.vt != VT_NULL && !(value.vt & VT_ARRAY) &&
      SUCCEEDED(VariantChangeType(&converted, const_cast<VARIANT*>(&value), 0, VT_R8))) {
    out = converted.dblVal;
  }
  VariantClear(&converted);
  return out;
}

// A list attribute: 8-bit or 16-bit numbers by the array's element size; a single
// number counts as a list of one.
std::vector<long> ListValue(const VARIANT& value) {
  std::vector<long> out;
  if ((value.vt & VT_ARRAY) != 0 && (value.vt & VT_BYREF) == 0 && value.parray != nullptr) {
    SAFEARRAY* array = value.parray;
    if (SafeArrayGetDim(array) != 1) return out;
    const UINT size = SafeArrayGetElemsize(array);
    if (size != 1 && size != 2) return out;
    LONG low = 0;
    LONG high = -1;
    SafeArrayGetLBound(array, 1, &low);
    SafeArrayGetUBound(array, 1, &high);
    void* data = nullptr;
    if (high < low || FAILED(SafeArrayAccessData(array, &data))) return out;
    const std::size_t count = static_cast<std::size_t>(high - low) + 1;
    for (std::size_t i = 0; i < count && i < 256; ++i) {
      out.push_back(size == 1 ? static_cast<const BYTE*>(data)[i] : static_cast<const USHORT*>(data)[i]);
    }
    SafeArrayUnaccessData(array);
    return out;
  }
  if (const std::optional<double> single = DoubleValue(value)) out.push_back(static_cast<long>(*single));
  return out;
}

std::string TextValue(const VARIANT& value) { return value.vt == VT_BSTR ? AnsiText(value.bstrVal) : std::string(); }

// Reads one attribute's value into `read`; a missing attribute leaves it alone.
template <typename Read>
void WithValue(IGeoObject* light, long code, Read&& read) {
  ComPtr<IGeoAttribute> attribute;
  if (light->GetAttribute(code, &attribute) != S_OK || !attribute) return;
  VARIANT value;
  VariantInit(&value);
  if (SUCCEEDED(attribute->GetValue(&value))) read(value);
  VariantClear(&value);
}

LightValues ReadLightValues(IGeoObject* light) {
  LightValues values;
  WithValue(light, kCodeLightCharacter, [&](const VARIANT& v) {
    if (const auto number = DoubleValue(v); number && *number >= 0 && *number < 1000) {
      values.characteristic = static_cast<long>(*number);
    }
  });
  WithValue(light, kCodeSignalGroup, [&](const VARIANT& v) { values.signalGroup = TextValue(v); });
  WithValue(light, kCodeColour, [&](const VARIANT& v) { values.colours = ListValue(v); });
  WithValue(light, kCodeSignalPeriod, [&](const VARIANT& v) { values.period = DoubleValue(v); });
  WithValue(light, kCodeHeight, [&](const VARIANT& v) { values.height = DoubleValue(v); });
  WithValue(light, kCodeNominalRange, [&](const VARIANT& v) { values.range = DoubleValue(v); });
  WithValue(light, kCodeSectorOne, [&](const VARIANT& v) { values.sectorOne = DoubleValue(v); });
  WithValue(light, kCodeSectorTwo, [&](const VARIANT& v) { values.sectorTwo = DoubleValue(v); });
  WithValue(light, kCodeCategoryOfLight, [&](const VARIANT& v) { values.categories = ListValue(v); });
  return values;
}

// ---- relations

bool IsLight(IGeoObject* object) {
  long classCode = 0;
  return object != nullptr && SUCCEEDED(object->GetClassCode(&classCode)) && classCode == kClassLight;
}

// Every object of both relation lists (held ones, then holders).
void ForEachRelated(IGeoObject* object, const std::function<void(IGeoObject*)>& visit) {
  for (int list = 0; list < 2; ++list) {
    ComPtr<IGeoObjectEnum> related;
    const HRESULT hr = list == 0 ? object->GetMembers(&related) : object->GetRelated(&related);
    if (FAILED(hr) || !related) continue;
    geo::ForEachItem(related.Get(), [&](IUnknown* item) {
      ComPtr<IGeoObject> other;
      if (SUCCEEDED(item->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(other.GetAddressOf()))) && other) {
        visit(other.Get());
      }
      return true;
    });
  }
}

using GuidKey = std::tuple<unsigned long, unsigned short, unsigned short, unsigned long long>;

GuidKey KeyOf(const GUID& id) {
  unsigned long long tail = 0;
  for (unsigned char byte : id.Data4) tail = (tail << 8) | byte;
  return {id.Data1, id.Data2, id.Data3, tail};
}

}  // namespace

cLightsViewPanel::cLightsViewPanel(const PanelSettings& settings)
    : Panel(std::make_unique<toolkit::BorderLayout>()), settings_(settings) {
  rows_.addColumn(toolkit::ColumnType::Integer, kColumns[0].acronym);
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    rows_.addColumn(toolkit::ColumnType::Text, kColumns[column].acronym);
  }
  table_.addTableStyle(toolkit::Table::kStyleWholeRow | toolkit::Table::kStyleNoEditOnSelect);
  table_.setRowNamer([this](int listRow) {
    if (listRow < 0 || static_cast<std::size_t>(listRow) >= listRows_.size()) return std::string();
    return Abbreviation(listRows_[static_cast<std::size_t>(listRow)]);
  });
  insertNamed("Center", &table_, "lights");
}

cLightsViewPanel::~cLightsViewPanel() { table_.setRowNamer(nullptr); }

const toolkit::ClassRecord* cLightsViewPanel::getClassRecord() const { return &toolkit::records::cLightsViewPanel; }

const char* cLightsViewPanel::ColumnAcronym(int column) {
  return column >= 0 && column < kColumnCount ? kColumns[column].acronym : "";
}

long cLightsViewPanel::ColumnCode(int column) { return Shown(column) ? kColumns[column].code : 0; }

const char* cLightsViewPanel::DefaultCaption(int column) { return Shown(column) ? kColumns[column].caption : ""; }

std::string cLightsViewPanel::GetColumnName(int index) const {
  const int column = index + 1;
  if (!Shown(column)) return std::string();
  try {
    return CaptionOf(column);
  } catch (...) {
    ErrRecord record(ErrPlace{__FILE__, "GetColumnName", __LINE__});
    record.line = __LINE__;
    settings_.Errors().ReportResult("cLightsViewPanel", record, E_FAIL);
    return kColumns[column].caption;
  }
}

std::string cLightsViewPanel::CaptionOf(int column) const {
  IObjectFormatter* formatter = settings_.Formatter();
  if (formatter == nullptr) return kColumns[column].caption;
  BSTR name = nullptr;
  const HRESULT hr = formatter->GetAttributeName(GEOKIND_CHART_DATABASE, 0, kColumns[column].code, 0, 0, &name);
  std::string caption = SUCCEEDED(hr) ? AnsiText(name) : std::string();
  SysFreeString(name);
  return caption.empty() ? std::string(kColumns[column].caption) : caption;
}

void cLightsViewPanel::Clear() {
  rows_.clear();
  used_.fill(false);
  abbreviations_.clear();
  listRows_.clear();
  table_.removeAllRows();
}

bool cLightsViewPanel::IsColumnUsed(int column) const { return column >= 0 && column < kColumnCount && used_[column]; }

int cLightsViewPanel::ComputedWidth(int column) const {
  return column >= 0 && column < kColumnCount ? widths_[column] : 0;
}

const std::string& cLightsViewPanel::Abbreviation(int row) const {
  static const std::string kNone;
  return row >= 0 && static_cast<std::size_t>(row) < abbreviations_.size() ? abbreviations_[row] : kNone;
}

HRESULT cLightsViewPanel::FillLights(IGeoObject* object) {
  if (object == nullptr) return E_INVALIDARG;
  const std::optional<GUID> kind = KindOf(object);
  if (!kind || !IsChartKind(*kind)) return S_FALSE;

  // The lights in the order met, each once: the object, its own relations, and one step
  // further through collections (and, from a light, through what carries it).
  std::vector<ComPtr<IGeoObject>> lights;
  std::set<GuidKey> seen;
  const auto keep = [&](IGeoObject* candidate) {
    GUID id{};
    if (!IsLight(candidate) || FAILED(candidate->GetId(&id)) || !seen.insert(KeyOf(id)).second) return;
    lights.emplace_back(candidate);
  };
  const bool selectedIsLight = IsLight(object);
  keep(object);
  ForEachRelated(object, [&](IGeoObject* related) {
    if (IsLight(related)) {
      keep(related);
      return;
    }
    long classCode = 0;
    if (FAILED(related->GetClassCode(&classCode))) return;
    if (selectedIsLight || classCode == kClassAggregation || classCode == kClassAssociation) {
      ForEachRelated(related, keep);
    }
  });

  const int before = rows_.rowCount();
  for (const ComPtr<IGeoObject>& light : lights) AddLight(light.Get());
  Display();
  return rows_.rowCount() > before ? S_OK : S_FALSE;
}

HRESULT cLightsViewPanel::AddLight(IGeoObject* light) {
  if (light == nullptr) return E_INVALIDARG;
  const int row = rows_.appendRowInteger(rows_.rowCount());
  if (row < 0) return E_OUTOFMEMORY;

  // Cell texts as the formatter writes the attributes.
  IObjectFormatter* formatter = settings_.Formatter();
  const auto valueText = [&](long code) {
    ComPtr<IGeoAttribute> attribute;
    if (formatter == nullptr || light->GetAttribute(code, &attribute) != S_OK || !attribute) return std::string();
    BSTR text = nullptr;
    const HRESULT hr = formatter->FormatAttribute(0, kAttributeFlags | settings_.attributeFlags, attribute.Get(), 0, 0,
                                                  &text);
    const std::string formatted = SUCCEEDED(hr) ? AnsiText(text) : std::string();
    SysFreeString(text);
    std::optional<AttributeText> pair = SplitAttributeText(formatted);
    if (!pair) return std::string();
    // List items and lines of a text side by side: the list shows one line per light.
    const std::string cleaned = CleanAttributeValue(pair->value);
    std::string value;
    for (char c : cleaned) {
      if (c == '\r') {
        value += ", ";
      } else {
        value += c;
      }
    }
    return value;
  };
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    std::string text = valueText(kColumns[column].code);
    // A sector is both its limits.
    if (column == kSectorColumn) {
      const std::string second = valueText(kCodeSectorTwo);
      if (!second.empty()) text = text.empty() ? second : text + " - " + second;
    }
    if (text.empty()) continue;
    rows_.setText(column, row, text);
    used_[column] = true;
  }
  abbreviations_.push_back(LightAbbreviation(ReadLightValues(light)));
  return S_OK;
}

std::string cLightsViewPanel::ShownText(int row, int column) const {
  std::string text = rows_.text(column, row);
  if (text.empty() && used_[column]) text = kEmptyCell;
  return text;
}

void cLightsViewPanel::ComputeWidths() {
  widths_.fill(0);
  HDC dc = GetDC(nullptr);
  if (dc == nullptr) return;
  HFONT font = table_.getFont();
  if (font == nullptr) font = static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
  HGDIOBJ previous = SelectObject(dc, font);
  const auto extent = [&](const std::string& text) {
    SIZE size{};
    if (!text.empty()) GetTextExtentPoint32A(dc, text.c_str(), static_cast<int>(text.size()), &size);
    return static_cast<int>(size.cx);
  };
  // 1. Captions; 2. the widest shown cell.
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    widths_[column] = extent(GetColumnName(column - 1));
    for (int row = 0; row < rows_.rowCount(); ++row) {
      widths_[column] = std::max(widths_[column], extent(ShownText(row, column)));
    }
  }
  SelectObject(dc, previous);
  ReleaseDC(nullptr, dc);

  // 3. A margin for every column with a width.
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    if (widths_[column] != 0) widths_[column] += kCellMargin;
  }
  // 4. Spare room of the list shared equally among the used columns with a width.
  const RECT client = table_.getClientRect();
  const int clientWidth = client.right - client.left;
  int sum = 0;
  int sharing = 0;
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    if (!used_[column]) continue;
    sum += widths_[column];
    if (widths_[column] != 0) ++sharing;
  }
  if (clientWidth > sum && sharing > 0) {
    const double share = static_cast<double>(clientWidth - sum) / sharing;
    for (int column = kFirstShown; column <= kLastShown; ++column) {
      if (used_[column] && widths_[column] != 0) widths_[column] = static_cast<int>(widths_[column] + share);
    }
  }
}

void cLightsViewPanel::Display() {
  // 1. An empty list, and the widths for its font.
  table_.removeAllRows();
  table_.resetColumns();
  listRows_.clear();
  ComputeWidths();

  // 2. One list column per used column, in order.
  std::array<int, kColumnCount> listColumn;
  listColumn.fill(-1);
  for (int column = kFirstShown; column <= kLastShown; ++column) {
    if (!used_[column]) continue;
    const std::string caption = GetColumnName(column - 1);
    const int added = table_.addColumn(kColumns[column].acronym, caption.c_str(), toolkit::table::kCellText, 0,
                                       nullptr, false);
    if (added < 0) continue;
    listColumn[column] = added;
    const int width = widths_[column] != 0 ? widths_[column] : static_cast<int>(table_.getColumnWidth(added) * 1.2);
    table_.setColumnWidth(added, width);
  }

  // 3. The rows: the first shown cell makes the list row, the others fill it.
  for (int row = 0; row < rows_.rowCount(); ++row) {
    int listRow = -1;
    for (int column = kFirstShown; column <= kLastShown; ++column) {
      if (listColumn[column] < 0) continue;
      const std::string text = ShownText(row, column);
      if (text.empty()) continue;
      if (listRow < 0) {
        listRow = table_.appendRowText(listColumn[column], text.c_str(), row);
        if (listRow < 0) break;
        listRows_.push_back(row);
      } else {
        table_.setCellText(listColumn[column], listRow, text.c_str());
      }
    }
  }
  table_.invalidate();
}

int cLightsViewPanel::RowUnderCursor() const {
  HWND window = table_.getHandle();
  POINT cursor{};
  if (window == nullptr || !GetCursorPos(&cursor) || !ScreenToClient(window, &cursor)) return -1;
  int row = -1;
  int column = -1;
  if (!table_.hitTest(cursor.x, cursor.y, row, column) || row < 0) return -1;
  return static_cast<std::size_t>(row) < listRows_.size() ? listRows_[static_cast<std::size_t>(row)] : -1;
}

int cLightsViewPanel::dispatchEvent(toolkit::ToolkitEvent& event) {
  // The hover popup of the list asks for its text just before it shows.
  if (event.source == &table_ && event.id == toolkit::kEventNotify) {
    const auto* header = reinterpret_cast<const NMHDR*>(event.params[3]);
    if (header != nullptr && header->idFrom == toolkit::Tooltip::kNotifyId &&
        header->code == toolkit::Tooltip::kNotifyCode) {
      if (toolkit::Tooltip* tip = toolkit::Tooltip::of(table_)) tip->setFittedText(Abbreviation(RowUnderCursor()));
      return 1;
    }
  }
  return Panel::dispatchEvent(event);
}

void cLightsViewPanel::doLayout() {
  Panel::doLayout();
  // The spare width of the list is shared anew at its new size.
  if (rows_.rowCount() > 0 && table_.isValid()) Display();
}

}  // namespace br::inspector
