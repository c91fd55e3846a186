// The creatable classes of BR_Info.dll, in table order: XObjectInspector, TidesDatabase,
// TidesPort, TidesPortList, TidesWindow, XChartLegend, XContoursView, XPICREPView.
// A class joins with one row here (and its library in frame/dll.cmake).
#include "frame/module/class_rows.h"

#include "contours/XContoursView.h"
#include "inspector/XObjectInspector.h"
#include "legend/XChartLegend.h"
#include "picture/XPICREPView.h"
#include "tides/controls/TidesPortList.h"
#include "tides/controls/TidesWindow.h"
#include "tides/objects/TidesDatabase.h"
#include "tides/objects/TidesPort.h"

namespace br::module {
namespace {

ClassEntry gRows[] = {
    ControlRow<br::inspector::XObjectInspector>(L"XObjectInspector", 103),
    PlainObjectRow<br::tides::TidesDatabase>(L"TidesDatabase"),
    PlainObjectRow<br::tides::TidesPort>(L"TidesPort"),
    ControlRow<br::tides::TidesPortList>(L"TidesPortList", 107),
    ControlRow<br::tides::TidesWindow>(L"TidesWindow", 109),
    PlainObjectRow<br::legend::XChartLegend>(L"XChartLegend"),
    ControlRow<br::contours::XContoursView>(L"XContoursView", 116),
    ControlRow<br::picture::XPICREPView>(L"XPICREPView", 118),
};

}  // namespace

ClassTable& TheClassTable() {
  static ClassTable table(gRows, sizeof gRows / sizeof gRows[0]);
  return table;
}

}  // namespace br::module
