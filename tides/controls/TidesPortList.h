// TidesPortList: the station list control. It keeps the ports the host hands it
// (one reference each, in the order given), shows their names in a table ordered
// by name, and fires SelectChanged with the port of the row the user picks.
#pragma once

#include "frame/control/ControlObject.h"
#include "tides/controls/TidesPortListPanel.h"

#include "BR_Info.h"

#include <memory>
#include <vector>

namespace br::tides {

class TidesPortList final : public br::control::ControlObject<TidesPortList, ITidesPortList> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  TidesPortList();
  ~TidesPortList() override;

  // ITidesPortList
  STDMETHODIMP SetPortList(VARIANT portList) override;
  STDMETHODIMP get_Selected(IUnknown** port) override;

  // For tests and hosts inside the library: the table, null before the window.
  toolkit::Table* Table() const { return panel_ ? &panel_->table() : nullptr; }
  size_t PortCount() const { return ports_.size(); }

protected:
  void Paint(HDC dc, const RECT& client) override;
  bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
  HRESULT SetPalette(const VARIANT& palette) override;
  HRESULT SetFont(IFont* font) override;
  HRESULT TranslateAccelerator(MSG* message) override;

private:
  // Passes the panel's row selections on to the control.
  class SelectionRelay final : public TidesPortListPanel::Owner {
  public:
    explicit SelectionRelay(TidesPortList& list) : list_(list) {}
    void PortRowSelected(int index) override { list_.PortRowSelected(index); }

  private:
    TidesPortList& list_;
  };

  void PortRowSelected(int index);
  void BuildContent(HWND window);
  void DestroyContent();
  void ClearPorts();
  void TakePorts(const VARIANT& portList);
  void Fill();
  void LayOut(HWND window);

  std::vector<IUnknown*> ports_;
  SelectionRelay relay_{*this};
  std::unique_ptr<TidesPortListPanel> panel_;
};

}  // namespace br::tides
