// brchart's window: the chart at its projection's pixel size, the depth-shading panel
// beside it (BR_Info's XContoursView with the scene's presentation parameters, colour map
// and palette, hosted by ATL's control host window), and a status line under both with
// the position under the pointer, the chart legend's fields there (BR_Info's XChartLegend)
// and what the last click picked; the object inspector (XObjectInspector) at the right
// shows the picked objects, and the object chosen in it is ringed on the chart.
#pragma once

#include <windows.h>

#include <cstdint>
#include <string>
#include <vector>

#include "BR_Info.h"
#include "host/brdesk/DispatchSink.h"
#include "host/brchart/ChartSession.h"
#include "host/brchart/LegendReader.h"

namespace br::brchart {

class ChartWindow {
public:
  static constexpr int kStatusHeight = 22;
  static constexpr int kPanelWidth = 110;
  static constexpr int kPanelTitleHeight = 20;
  static constexpr int kInspectorWidth = 420;

  explicit ChartWindow(ChartSession& session);
  ~ChartWindow();
  ChartWindow(const ChartWindow&) = delete;
  ChartWindow& operator=(const ChartWindow&) = delete;

  // Makes the window (hidden) and its panel. A depth panel that cannot be made is noted
  // in the status line, not a failure: the chart is still drawn.
  bool Create(std::string& error);
  // Draws the whole client area (chart, panel, status line) into a DC, as it looks.
  void DrawInto(HDC dc);
  // The client area as 32-bit pixels (blue, green, red, unused), rows top-down.
  std::vector<std::uint32_t> Pixels(int& width, int& height);
  bool HasDepthPanel() const { return contours_ != nullptr; }
  bool HasInspector() const { return inspector_ != nullptr; }
  // What the inspector has selected: its GUID text and the scene name of the object ("" for
  // none or the dataset header).
  std::string InspectedGuid();
  std::string InspectedName();
  HWND Handle() const { return window_; }
  // Picks at a chart pixel, as a click there does.
  void PickAt(long x, long y);
  // Selects one object by scene name; false when there is none.
  bool SelectNamed(const std::string& name);
  // The inspector's tree as a person reads it: one line per item, two spaces per level,
  // "* " before the selected one (UTF-8; empty without an inspector).
  std::vector<std::string> InspectorTreeLines();
  // Brings the inspector's details tab of that title to the front; false when it is not shown.
  bool ShowInspectorTab(const std::string& title);
  // The status line's text (UTF-8).
  const std::string& Status() const { return status_; }
  // A note shown at the end of the status line (e.g. why picking is unavailable).
  void SetNote(const std::string& note);

private:
  static LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  LRESULT Handle(UINT message, WPARAM wParam, LPARAM lParam);
  void Paint();
  // The position, the legend there, the last pick and the note; null: no position.
  void ShowStatusAt(const chartscene::GeoPosition* at);
  void LayOut();
  SIZE ContentSize() const;
  bool PositionOfPixel(long x, long y, chartscene::GeoPosition& at) const;  // chart and panel, status line under them
  bool MakeDepthPanel(std::string& error);
  bool MakeInspector(std::string& error);
  // Hands the picked objects' records to the inspector.
  void Inspect();
  // The inspector chose an object: it alone is highlighted on the chart.
  void OnInspectorSelection(const DISPPARAMS& params);
  std::size_t ObjectOfGuid(const std::string& guid) const;  // SIZE_MAX for none
  HWND InspectorChild(const wchar_t* className) const;       // a window of that class inside the inspector
  // Chooses the first picked object in the inspector's tree, as a person's click there does.
  void ChooseFirstInspected();

  ChartSession& session_;
  HWND window_ = nullptr;
  HWND statusLine_ = nullptr;
  HWND panelTitle_ = nullptr;
  HWND contoursHost_ = nullptr;
  IXContoursView* contours_ = nullptr;
  LegendReader legend_;
  HWND inspectorHost_ = nullptr;
  IXObjectInspector* inspector_ = nullptr;
  br::brdesk::DispatchSink inspectorSink_;
  HFONT font_ = nullptr;
  std::string status_;
  std::string picked_;
  std::string note_;
  std::string inspected_;
  chartscene::GeoPosition lastAt_;
  bool hasLastAt_ = false;
};

}  // namespace br::brchart
