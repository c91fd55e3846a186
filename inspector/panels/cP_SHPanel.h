#pragma once
// The stacked text panel of the inspector's services tabs: one chart object, and the
// objects related to it, as rows of text in a table widget, top to bottom: a heading per
// object, then for each attribute a name row and a value row. The attribute table panel
// (cAttrViewPanel_Tbl) derives from it and shows name and value side by side.
//
// What the control calls:
//   FillObject(object, heading, related)  rows of an object (and its related objects)
//   Clear()                               no rows
//   HasContent()                          whether any row is shown
// Rows are read by accessibility clients from the table's window (table().getHandle()):
// one list item per row, named by its visible cells joined by tabs.
//
// Texts stay UTF-16 from the formatter to the screen (wide text cells, drawn through a
// TextEngine), so names in any script show as they are. Each row is word-wrapped to its
// cell and as high as its text (see panel_rows.h); rows are measured again when the
// panel's width changes and after each fill.
//
// The panel borrows the inspector's settings block (formatter, flag words), which must
// outlive it. Failures of the host or the formatter skip the attribute or object and are
// logged under the source name cP_SHPanel.

#include <windows.h>

#include <optional>
#include <string>

#include "GeoData.h"
#include "toolkit/core/Panel.h"
#include "inspector/format/panel_rows.h"
#include "toolkit/table/Table.h"
#include "toolkit/text/TextEngine.h"

namespace br::inspector {

class PanelSettings;

class cP_SHPanel : public toolkit::Panel {
public:
  // Row types of the type column.
  static constexpr int kRowHeading = 1000;
  static constexpr int kRowName = 2000;
  static constexpr int kRowValue = 3000;
  static constexpr int kRowAttribute = 4000;

  explicit cP_SHPanel(const PanelSettings& settings);
  ~cP_SHPanel() override;

  const toolkit::ClassRecord* getClassRecord() const override;

  // Shows the object's attributes; with `heading` a heading row names it (when related
  // objects are shown too), with `related` the objects it holds (or that hold it) follow
  // in label order, each under its own heading. Rows are added to those already there.
  // S_OK; E_INVALIDARG for a null object; E_FAIL when its class code cannot be read;
  // S_FALSE when its class is hidden.
  HRESULT FillObject(IGeoObject* object, bool heading, bool related);
  // Adds the rows of one attribute. S_OK when a row was added, S_FALSE when the
  // attribute is not shown, E_NOINTERFACE without a formatter, the host's failure.
  HRESULT AddAttributeToContent(IGeoAttribute* attribute);
  // Whether the catalogue marks the attribute not to be printed; failures count as printable.
  bool IsUnprintable(IGeoAttribute* attribute) const;

  // A name/value row; added only when both are non-empty.
  virtual void AddRow(const std::wstring& name, const std::wstring& value);
  virtual void AddHeading(const std::wstring& label);
  void Clear();
  bool HasContent() const { return table_.getRowCount() > 0; }

  // The row table: type, then the text columns.
  toolkit::Table& table() { return table_; }
  const toolkit::Table& table() const { return table_; }
  int RowType(int row) const { return table_.getCellLong(kTypeColumn, row); }
  // Gives every row the height of its wrapped text for the present column widths.
  void LayOutRows();
  // The font the rows are drawn and measured in.
  HFONT RowFont() const;

  int dispatchEvent(toolkit::ToolkitEvent& event) override;

protected:
  static constexpr int kTypeColumn = 0;
  // The attribute table panel has a name column beside the text column.
  struct TwoColumns {};
  cP_SHPanel(const PanelSettings& settings, TwoColumns);

  const PanelSettings& settings() const { return settings_; }
  // Appends a row of the given type; column -1 leaves the text cells empty.
  int AppendRow(int type, int column, const std::wstring& text);
  bool TableLayout() const { return textColumn_ != 1; }
  PanelRowKind KindOf(int row) const;
  // Draws a cell's lines, wrapped, from the row kind's indent; the area is filled first.
  void DrawCellText(HDC dc, const RECT& area, const std::wstring& text, PanelRowKind kind);
  // A tidal stream attribute's value (the formatter's field list) laid out as its table
  // of lines, with the localised captions (tidal_stream_text.h).
  static std::string TidalStreamValue(const std::string& raw);
  // Draws a heading row across the whole width; other cells as the table draws them.
  virtual bool DrawCell(HDC dc, const RECT& rect, int column, int row);

private:
  void SetUp(bool twoColumns);
  // AddAttributeToContent for an attribute already found printable; whether its owner is
  // of the chart-database kind, when the caller knows.
  HRESULT AddPrintableAttribute(IGeoAttribute* attribute, std::optional<bool> chartOwner);
  void AddObjectAttributes(IGeoObject* object);
  int VisibleWidth(int column) const;
  // The engine in the rows' font; answers the height of one line.
  int PrepareEngine(HDC dc);
  // Height of a cell's wrapped lines in `width` pixels from the kind's indent.
  int MeasureCellText(HDC dc, const std::wstring& text, int width, PanelRowKind kind, int lineHeight);

  const PanelSettings& settings_;
  toolkit::Table table_;
  int textColumn_ = 1;
  toolkit::TextEngine engine_;
  HFONT engineFont_ = nullptr;  // the font the engine's slots were copied from
};

}  // namespace br::inspector
