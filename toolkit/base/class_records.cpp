#include "toolkit/base/class_records.h"

// All records live in this one file, parents before children, and are constant
// initialised: nothing registers them and nothing looks them up by name.
namespace toolkit::records {

constexpr ClassRecord Object{"Object", nullptr};
constexpr ClassRecord cXComponent{"cXComponent", &Object};
constexpr ClassRecord Layout{"Layout", &Object};
constexpr ClassRecord FlowLayout{"FlowLayout", &Layout};
constexpr ClassRecord BorderLayout{"BorderLayout", &Layout};
constexpr ClassRecord GridLayout{"GridLayout", &Layout};
constexpr ClassRecord TabLayout{"TabLayout", &Layout};
constexpr ClassRecord SplitterLayout{"SplitterLayout", &Layout};
constexpr ClassRecord ContainedWindow{"ContainedWindow", &cXComponent};
constexpr ClassRecord Container{"Container", &cXComponent};
constexpr ClassRecord Panel{"Panel", &Container};
constexpr ClassRecord TabContainer{"TabContainer", &Container};
constexpr ClassRecord cXEdit{"cXEdit", &cXComponent};
constexpr ClassRecord Button{"Button", &cXComponent};
constexpr ClassRecord Label{"Label", &cXComponent};
constexpr ClassRecord AXComponent{"AXComponent", &cXComponent};
constexpr ClassRecord Display{"Display", &cXComponent};
constexpr ClassRecord TextProgressBar{"TextProgressBar", &cXComponent};
constexpr ClassRecord cXEdit2{"cXEdit2", &cXComponent};
constexpr ClassRecord RadioButton{"RadioButton", &Button};
constexpr ClassRecord CheckButton{"CheckButton", &Button};
constexpr ClassRecord Check{"Check", &Button};
constexpr ClassRecord Choice{"Choice", &ContainedWindow};
constexpr ClassRecord ProgressBar{"ProgressBar", &ContainedWindow};
constexpr ClassRecord cXDateTime{"cXDateTime", &ContainedWindow};
constexpr ClassRecord cXEditW{"cXEditW", &ContainedWindow};
constexpr ClassRecord cXTextDescr{"cXTextDescr", &ContainedWindow};
constexpr ClassRecord cP_SHPanel{"cP_SHPanel", &Container};
constexpr ClassRecord cLightsViewPanel{"cLightsViewPanel", &Container};
constexpr ClassRecord cHierarchyPanel{"cHierarchyPanel", &Container};
constexpr ClassRecord cXPictDescr{"cXPictDescr", &Container};
constexpr ClassRecord cAttrViewPanel_Tbl{"cAttrViewPanel_Tbl", &cP_SHPanel};
constexpr ClassRecord cXPictDescr_AXPictDescr{"cXPictDescr::AXPictDescr", &AXComponent};

}  // namespace toolkit::records
