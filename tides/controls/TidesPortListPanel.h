// The content of TidesPortList: a toolkit container, laid out by a one-cell
// GridLayout, whose only child is the table of port names. It passes the table's
// selection changes (action code 1) to its owner and erases with palette colour 7.
#pragma once

#include "toolkit/core/Container.h"
#include "toolkit/table/Table.h"

namespace br::tides {

class TidesPortListPanel final : public toolkit::Container {
public:
  class Owner {
  public:
    virtual ~Owner() = default;
    // The table selected the row whose row data is `index`.
    virtual void PortRowSelected(int index) = 0;
  };

  static constexpr int kPaletteBackground = 7;
  static constexpr int kTableStyleOption = 0x80;

  explicit TidesPortListPanel(Owner& owner);
  ~TidesPortListPanel() override;

  toolkit::Table& table() { return table_; }

  // Makes the window under parent with the clipping styles, the layout and the table.
  bool create(HWND parent) override;
  int onAction(toolkit::ToolkitEvent& event) override;
  int onEraseBackground(toolkit::ToolkitEvent& event) override;
  void paint(HDC dc) override;

private:
  Owner& owner_;
  toolkit::Table table_;
};

}  // namespace br::tides
