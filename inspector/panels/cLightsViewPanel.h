#pragma once
// The panel of the inspector's "Lights" tab: a list with one row per light and one column
// per light attribute, shown only for the attributes some light has.
//
// What the control calls:
//   Clear()              no rows, no used column
//   FillLights(object)   the rows of the lights the object is or holds (see below), shown
//   HasContent()         whether the tab is worth showing (a row at least)
// Which lights: the selected object itself when it is a light, every light related to it
// (a beacon's or lighthouse's lights), the lights gathered with it in a collection, and
// for a light the other lights of the structure that carries it (its sectors). Each light
// once, the selected one first. Only objects of the chart-database kind have lights.
//
// Accessibility clients read one list item per row from the table's window
// (table().getHandle()): named by the light's chart abbreviation (light_abbreviation.h),
// its value the visible cells joined by tabs. Hovering a row shows the abbreviation too.
//
// The panel borrows the inspector's settings block (formatter), which must outlive it.
// Failures of the host skip the attribute or the light; a caption that cannot be built is
// logged under the source name cLightsViewPanel and keeps its default.

#include <windows.h>

#include <array>
#include <functional>
#include <string>
#include <vector>

#include "GeoData.h"
#include "toolkit/core/Panel.h"
#include "toolkit/data/DataTable.h"
#include "toolkit/table/Table.h"

namespace br::inspector {

class PanelSettings;

class cLightsViewPanel : public toolkit::Panel {
public:
  // Row table columns: 0 the light's row number (not shown), 1 to 12 the attribute texts.
  static constexpr int kColumnCount = 13;
  static constexpr int kFirstShown = 1;
  static constexpr int kLastShown = 12;
  static constexpr int kSectorColumn = 5;
  // Widths: caption or widest cell, plus this margin.
  static constexpr int kCellMargin = 20;
  // An empty cell of a used column shows this.
  static constexpr const char* kEmptyCell = " - ";

  explicit cLightsViewPanel(const PanelSettings& settings);
  ~cLightsViewPanel() override;

  const toolkit::ClassRecord* getClassRecord() const override;

  // The caption of the column after `index` (0 names column 1, 11 column 12): the
  // formatter's localised attribute name, else the default. Empty outside 0..11.
  std::string GetColumnName(int index) const;
  // The row table's column name (the attribute's acronym) and code; "" and 0 outside.
  static const char* ColumnAcronym(int column);
  static long ColumnCode(int column);
  static const char* DefaultCaption(int column);

  void Clear();
  bool HasContent() const { return rows_.rowCount() > 0; }
  // Adds the rows of the lights of `object` and shows them. S_OK when the object has a
  // light, S_FALSE when it has none, E_INVALIDARG for a null object.
  HRESULT FillLights(IGeoObject* object);
  // Adds one light's row (not shown until Display). S_OK, or the host's failure.
  HRESULT AddLight(IGeoObject* light);
  // Fills the list from the row table with widths computed for the list's font.
  void Display();

  int RowCount() const { return rows_.rowCount(); }
  std::string CellText(int row, int column) const { return rows_.text(column, row); }
  bool IsColumnUsed(int column) const;
  // The width computed at the last display (0 before one, and for unused columns
  // without caption or cells).
  int ComputedWidth(int column) const;
  const std::string& Abbreviation(int row) const;

  toolkit::Table& table() { return table_; }
  const toolkit::Table& table() const { return table_; }

  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  void doLayout() override;

private:
  void ComputeWidths();
  std::string CaptionOf(int column) const;
  // The text shown in a cell: its own, or " - " for an empty cell of a used column.
  std::string ShownText(int row, int column) const;
  // The row under the cursor, for the hover popup; -1 when none.
  int RowUnderCursor() const;

  const PanelSettings& settings_;
  toolkit::DataTable rows_;
  std::array<bool, kColumnCount> used_{};
  std::array<int, kColumnCount> widths_{};
  std::vector<std::string> abbreviations_;
  std::vector<int> listRows_;  // the row table's row of each list row
  toolkit::Table table_;
};

}  // namespace br::inspector
