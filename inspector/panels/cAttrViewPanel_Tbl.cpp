#include "inspector/panels/cAttrViewPanel_Tbl.h"

#include <algorithm>
#include <vector>

#include "inspector/panels/dataset_metadata.h"
#include "toolkit/base/class_records.h"

namespace br::inspector {

namespace {
std::wstring AnsiWide(const std::string& text) {
  if (text.empty() || text.size() > 0x7FFFFFF) return {};
  const int bytes = static_cast<int>(text.size());
  const int size = MultiByteToWideChar(CP_ACP, 0, text.data(), bytes, nullptr, 0);
  if (size <= 0) return {};
  std::wstring wide(static_cast<std::size_t>(size), L'\0');
  MultiByteToWideChar(CP_ACP, 0, text.data(), bytes, wide.data(), size);
  return wide;
}
}  // namespace

cAttrViewPanel_Tbl::cAttrViewPanel_Tbl(const PanelSettings& settings) : cP_SHPanel(settings, TwoColumns{}) {
  table().setColumnWidth(kNameColumn, 140);
}

const toolkit::ClassRecord* cAttrViewPanel_Tbl::getClassRecord() const {
  return &toolkit::records::cAttrViewPanel_Tbl;
}

void cAttrViewPanel_Tbl::AddRow(const std::wstring& name, const std::wstring& value) {
  if (name.empty() || value.empty()) return;
  const int row = AppendRow(kRowAttribute, kNameColumn, name);
  if (row >= 0) table().setCellWideText(kTextColumn, row, value);
}

void cAttrViewPanel_Tbl::AddHeading(const std::wstring& label) { AppendRow(kRowHeading, kNameColumn, label); }

HRESULT cAttrViewPanel_Tbl::FillDataSetMetadata(IUnknown* owner, REFGUID id) {
  std::vector<MetadataRow> rows;
  const HRESULT hr = ReadDataSetMetadata(owner, id, &agencies_, rows);
  if (FAILED(hr)) return hr == E_INVALIDARG ? hr : E_FAIL;
  // Metadata texts are read in the ANSI code page; the rows take them widened.
  for (const MetadataRow& row : rows) {
    if (row.caption == kHeadingCaption) {
      if (!row.value.empty()) AddHeading(AnsiWide(row.value));
    } else {
      AddRow(AnsiWide(row.caption), AnsiWide(row.value));
    }
  }
  doLayout();
  LayOutRows();
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
  DrawCellText(dc, area, table().getCellWideText(row, column), KindOf(row));
  return true;
}

}  // namespace br::inspector
