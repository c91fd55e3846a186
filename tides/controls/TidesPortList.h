// TidesPortList: the station list control. It keeps the ports the host hands it
// (one reference each, in the order given), shows their names in a table ordered
// by name, and fires SelectChanged with the port of the row the user picks.
#pragma once

#include "frame/com/ComRef.h"
#include "frame/control/ToolkitControl.h"
#include "tides/controls/TidesPortListPanel.h"

#include "BR_Info.h"

#include <memory>
#include <vector>

namespace br::tides {

class TidesPortList final : public br::control::ToolkitControl<TidesPortList, ITidesPortList> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  TidesPortList();
  ~TidesPortList() override;

  // ITidesPortList
  STDMETHODIMP SetPortList(VARIANT portList) override;
  STDMETHODIMP get_Selected(IUnknown** port) override;

  // For tests and hosts inside the library: the table, null before the window.
  toolkit::Table* Table() const { return Panel() ? &Panel()->table() : nullptr; }
  size_t PortCount() const { return ports_.size(); }

protected:
  std::unique_ptr<toolkit::Container> MakeContent() override;
  void ContentMade() override;
  void ContentGoing() override;
  void FontChanged() override;
  toolkit::cXComponent* FocusChild() override;

private:
  // Passes the panel's row selections on to the control.
  class SelectionRelay final : public TidesPortListPanel::Owner {
  public:
    explicit SelectionRelay(TidesPortList& list) : list_(list) {}
    void PortRowSelected(int index) override { list_.PortRowSelected(index); }

  private:
    TidesPortList& list_;
  };

  TidesPortListPanel* Panel() const { return static_cast<TidesPortListPanel*>(Content()); }
  void PortRowSelected(int index);
  void ClearPorts();
  void TakePorts(const VARIANT& portList);
  void Fill();
  void FitColumn();

  std::vector<br::com::ComRef<IUnknown>> ports_;
  SelectionRelay relay_{*this};
};

}  // namespace br::tides
