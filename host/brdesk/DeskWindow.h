// The tide desk: a top-level window with a station box and a date the user can edit,
// a TidesPortList on the left and a TidesWindow on the right, both hosted by ATL's
// control host window, and a status line with the pointer readout of the graph.
#pragma once

#include "host/brdesk/desk_options.h"
#include "host/brdesk/DispatchSink.h"

#include "BR_Info.h"

#include <string>

namespace br::brdesk {

class DeskWindow {
public:
  explicit DeskWindow(const DeskOptions& options);
  ~DeskWindow();
  DeskWindow(const DeskWindow&) = delete;
  DeskWindow& operator=(const DeskWindow&) = delete;

  // Makes the window and its controls; false with a message.
  bool Create(std::string& error);
  HWND Handle() const { return window_; }
  // Asks the database for the ports of the box typed in and hands them to the list.
  bool LoadPorts(std::string& error);
  // Selects the row (as shown) in the list, which shows its day in the graph.
  bool SelectRow(int row);
  // A key message for the list while the focus is inside it: given to the list's
  // TranslateAccelerator before the dialog keys take it (true when the list used it).
  bool TranslateListKey(MSG& message);
  // Draws the whole window into a PNG file.
  bool SaveScreenshot(const std::wstring& path, std::string& error);
  const std::string& Status() const { return status_; }

private:
  static LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  LRESULT Handle(UINT message, WPARAM wParam, LPARAM lParam);
  void LayOut();
  void ShowPort(IDispatch* port);
  void Recalculate();
  bool ReadDate(double& date) const;
  void SetStatus(const std::string& text);
  void DrawInto(HDC dc);

  DeskOptions options_;
  HWND window_ = nullptr;
  HWND boxLabel_ = nullptr, boxEdit_ = nullptr, dateLabel_ = nullptr, dateEdit_ = nullptr, showButton_ = nullptr;
  HWND listHost_ = nullptr, graphHost_ = nullptr, statusLine_ = nullptr;
  HFONT font_ = nullptr;
  ITidesDatabase* database_ = nullptr;
  ITidesPortList* list_ = nullptr;
  ITidesWindow* graph_ = nullptr;
  ITidesPort* port_ = nullptr;
  std::string portName_;
  std::string status_;
  DispatchSink listSink_;
  DispatchSink graphSink_;
};

}  // namespace br::brdesk
