#include "inspector/panels/cAttrViewPanel_Tbl.h"

#include <algorithm>
#include <vector>

#include "inspector/panels/dataset_metadata.h"
#include "toolkit/base/class_records.h"

namespace br::inspector {

cAttrViewPanel_Tbl::cAttrViewPanel_Tbl(const PanelSettings& settings) : cP_SHPanel(settings, TwoColumns{}) {
  table().setColumnWidth(kNameColumn, 140);
}

const toolkit::ClassRecord* cAttrViewPanel_Tbl::getClassRecord() const {
  return &toolkit::records::cAttrViewPanel_Tbl;
}

void cAttrViewPanel_Tbl::AddRow(const std::string& name, const std::string& value) {
  if (name.empty() || value.empty()) return;
  const int row = AppendRow(kRowAttribute, kNameColumn, name);
  if (row >= 0) table().setCellText(kTextColumn, row, value.c_str());
}

void cAttrViewPanel_Tbl::AddHeading(const std::string& label) { AppendRow(kRowHeading, kNameColumn, label); }

HRESULT cAttrViewPanel_Tbl::FillDataSetMetadata(IUnknown* owner, REFGUID id) {
  std::vector<MetadataRow> rows;
  const HRESULT hr = ReadDataSetMetadata(owner, id, &agencies_, rows);
  if (FAILED(hr)) return hr == E_INVALIDARG ? hr : E_FAIL;
  for (const MetadataRow& row : rows) {
    if (row.caption == kHeadingCaption) {
      if (!row.value.empty()) AddHeading(row.value);
    } else {
      AddRow(row.caption, row.value);
    }
  }
  doLayout();
  return S_OK;
}

bool cAttrViewPanel_Tbl::DrawCell(HDC dc, const RECT& rect, int column, int row) {
  if (row < 0) return false;
  const int type = RowType(row);
  if (type != kRowHeading && type != kRowAttribute) return false;
  // A heading spans the row: its name cell (drawn first) paints it all, the value cell
  // leaves it be.
  if (type == kRowHeading && column != kNameColumn) return true;
  RECT area = rect;
  if (type == kRowHeading) area.right = std::max(area.right, static_cast<LONG>(table().getClientRect().right));
  FillRect(dc, &area, GetSysColorBrush(COLOR_WINDOW));
  RECT text = area;
  text.left += type == kRowHeading ? 4 : 8;
  std::string cell = table().getCellText(row, column);
  std::replace(cell.begin(), cell.end(), '\r', ' ');
  SetBkMode(dc, TRANSPARENT);
  SetTextColor(dc, GetSysColor(type == kRowHeading ? COLOR_HIGHLIGHT : COLOR_WINDOWTEXT));
  DrawTextA(dc, cell.c_str(), static_cast<int>(cell.size()), &text,
            DT_LEFT | DT_VCENTER | DT_SINGLELINE | DT_END_ELLIPSIS | DT_NOPREFIX);
  return true;
}

}  // namespace br::inspector
