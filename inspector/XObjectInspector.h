// XObjectInspector: the chart-object inspector control. The host hands it object records
// (SetInfo replaces, AddInfo adds); it lists them as a grouped tree with their related
// objects, shows the chosen entry's details in tabs beside it and fires SelectObject with
// the entry's identity and owner. It also answers agency names and attribute texts.
#pragma once

#include "frame/com/ComRef.h"
#include "frame/control/ToolkitControl.h"
#include "frame/errors/cErrReporter.h"
#include "frame/geo/AgencyTable.h"
#include "inspector/InspectorPanel.h"
#include "inspector/InspectorUnitsFace.h"
#include "inspector/object_records.h"
#include "inspector/panels/PanelSettings.h"
#include "inspector/units_options.h"

#include "BR_Info.h"
#include "GeoData.h"

#include <memory>
#include <vector>

namespace br::inspector {

class XObjectInspector final : public br::control::ToolkitControl<XObjectInspector, IXObjectInspector> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  XObjectInspector();
  ~XObjectInspector() override;

  // IXObjectInspector
  STDMETHODIMP SetInfo(VARIANT value) override;
  STDMETHODIMP AddInfo(VARIANT value) override;
  STDMETHODIMP get_DataSet(IUnknown** dataSet) override;
  STDMETHODIMP HOCode2Name(LONG code, BSTR* name, BSTR* abbreviation) override;
  STDMETHODIMP GetSelectedObject(BSTR* guid, IUnknown** owner) override;
  STDMETHODIMP FormatAttributes(IUnknown* database, BSTR guid, BSTR* attributes) override;

  UnitsOptions& Units() { return units_; }
  // Hands the units set through IUnitsOption to the formatter and shows the chosen entry's
  // details again in them.
  void UnitsChanged();
  // For tests and hosts inside the library: the tree, null before the window.
  ObjectTree* Tree() const { return Panel() ? &Panel()->tree() : nullptr; }
  std::size_t RecordCount() const { return records_.size(); }

protected:
  std::unique_ptr<toolkit::Container> MakeContent() override;
  void ContentGoing() override;
  toolkit::cXComponent* FocusChild() override;

private:
  class ChoiceRelay final : public InspectorPanel::Owner {
  public:
    explicit ChoiceRelay(XObjectInspector& inspector) : inspector_(inspector) {}
    void TreeItemChosen(LPARAM data, bool doubleClick) override { inspector_.ItemChosen(data, doubleClick); }

  private:
    XObjectInspector& inspector_;
  };

  static IUnknown* UnitsOption(XObjectInspector& o) { return &o.unitsFace_; }

  InspectorPanel* Panel() const { return static_cast<InspectorPanel*>(Content()); }
  HRESULT Take(const VARIANT& value, bool replace);
  void ItemChosen(LPARAM data, bool doubleClick);
  void ShowDetails(const ObjectRecord& record, bool header);
  void FireSelectObject(const std::wstring& guidText, IUnknown* owner, bool doubleClick);
  void FillObjectDetails(InspectorPanel& panel, IGeoObject* object, long classCode, bool chart);
  // A request of the hierarchy card's buttons: SelectObject for the chart's node it names.
  void TakeHierarchyRequest(const std::string& request);

  std::vector<ObjectRecord> records_;
  br::cErrReporter reporter_;
  PanelSettings settings_;  // the formatter and flag words the tree and the panels share
  br::geo::AgencyTable agencies_;  // loaded once, with the control
  UnitsOptions units_;
  InspectorUnitsFace unitsFace_{*static_cast<IXObjectInspector*>(this), *this};
  ChoiceRelay relay_{*this};
  bool rebuilding_ = false;
};

}  // namespace br::inspector
