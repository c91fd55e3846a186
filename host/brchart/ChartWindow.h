// brchart's window: the chart at its projection's pixel size and a status line under it
// with the position under the pointer and what the last click picked.
#pragma once

#include <windows.h>

#include <string>

#include "host/brchart/ChartSession.h"

namespace br::brchart {

class ChartWindow {
public:
  static constexpr int kStatusHeight = 22;

  explicit ChartWindow(ChartSession& session);
  ~ChartWindow();
  ChartWindow(const ChartWindow&) = delete;
  ChartWindow& operator=(const ChartWindow&) = delete;

  bool Create(std::string& error);
  HWND Handle() const { return window_; }
  // Picks at a chart pixel, as a click there does.
  void PickAt(long x, long y);
  // The status line's text (UTF-8).
  const std::string& Status() const { return status_; }
  // A note shown at the end of the status line (e.g. why picking is unavailable).
  void SetNote(const std::string& note);

private:
  static LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  LRESULT Handle(UINT message, WPARAM wParam, LPARAM lParam);
  void Paint();
  void ShowStatus(const std::string& position);
  void LayOut();

  ChartSession& session_;
  HWND window_ = nullptr;
  HWND statusLine_ = nullptr;
  HFONT font_ = nullptr;
  std::string status_;
  std::string picked_;
  std::string note_;
};

}  // namespace br::brchart
