#include "tides/controls/TidesPortListPanel.h"

#include "toolkit/core/Palette.h"
#include "toolkit/layout/GridLayout.h"

namespace br::tides {

TidesPortListPanel::TidesPortListPanel(Owner& owner) : owner_(owner) {
  setLayout(std::make_unique<toolkit::GridLayout>(1, 1, 10, 0, "100", 68));
  add(&table_, "table");
}

TidesPortListPanel::~TidesPortListPanel() { removeComponent(&table_, false); }

bool TidesPortListPanel::create(HWND parent) {
  if (!Container::create(parent)) return false;
  modifyStyle(0, WS_CLIPCHILDREN | WS_CLIPSIBLINGS, 0);
  table_.addTableStyle(kTableStyleOption);
  return true;
}

int TidesPortListPanel::onAction(toolkit::ToolkitEvent& event) {
  if (event.source != &table_ || event.params[3] != toolkit::Table::kNotifySelect) return 0;
  // Rows are reported as stored; the row data is the index into the port list,
  // whatever order the rows are shown in.
  const int row = static_cast<int>(event.params[0]);
  if (row >= 0 && row < table_.getRowCount()) owner_.PortRowSelected(table_.getUserData(0, row));
  return 1;
}

int TidesPortListPanel::onEraseBackground(toolkit::ToolkitEvent& event) {
  if (event.source != this) return 0;
  const HDC dc = reinterpret_cast<HDC>(event.params[0]);
  const RECT client = getClientRect();
  toolkit::Palette::fill(dc, client, kPaletteBackground);
  event.handled = true;
  return 1;
}

void TidesPortListPanel::paint(HDC dc) {
  const RECT client = getClientRect();
  toolkit::Palette::fill(dc, client, kPaletteBackground);
}

}  // namespace br::tides
