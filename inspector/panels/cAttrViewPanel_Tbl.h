#pragma once
// The attribute table panel of the inspector's "Attributes" tab: headings across the
// whole width, attributes as name and value side by side. Filled with an object's
// attributes (as cP_SHPanel) or with the metadata of the dataset behind the tree's
// header item.
//
// What the control calls, besides cP_SHPanel's FillObject, Clear and HasContent:
//   FillDataSetMetadata(owner, id)  the dataset's metadata rows
// Accessibility clients read each row from the table's window as "name<TAB>value", a
// heading as "label<TAB>" (its value cell is empty). A value of several lines shows them
// one under the other, its row as high as they are.

#include "frame/geo/AgencyTable.h"
#include "inspector/panels/cP_SHPanel.h"

namespace br::inspector {

class cAttrViewPanel_Tbl : public cP_SHPanel {
public:
  static constexpr int kNameColumn = 1;
  static constexpr int kTextColumn = 2;

  // Loads the panel's copy of the agency table (AgencyTable::DefaultPath).
  explicit cAttrViewPanel_Tbl(const PanelSettings& settings);

  const toolkit::ClassRecord* getClassRecord() const override;

  // Adds the rows of the dataset the owner and identity stand for (see
  // dataset_metadata.h), then lays the panel out again. E_INVALIDARG for a null owner;
  // E_FAIL (and no rows) without a dataset or with parameters of the wrong form.
  HRESULT FillDataSetMetadata(IUnknown* owner, REFGUID id);

  void AddRow(const std::wstring& name, const std::wstring& value) override;
  void AddHeading(const std::wstring& label) override;

  const geo::AgencyTable& agencies() const { return agencies_; }

protected:
  bool DrawCell(HDC dc, const RECT& rect, int column, int row) override;

private:
  geo::AgencyTable agencies_;
};

}  // namespace br::inspector
