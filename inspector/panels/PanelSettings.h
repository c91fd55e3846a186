#pragma once
// The settings block the inspector's detail panels share: the host's object formatter,
// the two formatter flag words ORed into every call, the switch that turns the
// unprintable-attribute test off, and the language handed to the formatter. The control
// makes one and lends it to each panel; a panel never outlives it.

#include <windows.h>

#include <wrl/client.h>

#include "GeoData.h"
#include "frame/errors/cErrReporter.h"

namespace br::inspector {

class PanelSettings {
public:
  // Without a formatter; Create or SetFormatter gives one. The block uses localised
  // texts while it lives (it is a text client).
  PanelSettings();
  ~PanelSettings();
  PanelSettings(const PanelSettings&) = delete;
  PanelSettings& operator=(const PanelSettings&) = delete;

  // Creates the formatter (CLSID_ObjectFormatter) and gives it the current language
  // (option 61) and the text for a missing value (option 64, text 55). A formatter that
  // cannot be made leaves the block without one; panels then add no attribute rows.
  HRESULT Create();
  // Uses a formatter the caller made (null: none).
  void SetFormatter(IObjectFormatter* formatter) { formatter_ = formatter; }

  IObjectFormatter* Formatter() const { return formatter_.Get(); }
  // The units the host shows values in, handed on to the formatter (option 62 a number,
  // 63 a text) so attribute values follow them; the formatter's answer, S_FALSE without one.
  HRESULT SetUnits(long units);
  HRESULT SetUnitsText(const std::wstring& text);
  // Where the panels report the failures they skip: the library's reporter (log file,
  // box) unless the control hands over its own.
  cErrHandler& Errors() const { return *errors_; }
  void SetErrorHandler(cErrHandler* handler) { errors_ = handler ? handler : &reporter_; }

  long language = 0;
  long objectFlags = 0;     // ORed into FormatObject's flags
  long attributeFlags = 0;  // ORed into FormatAttribute's flags
  bool skipUnprintableTest = false;

private:
  Microsoft::WRL::ComPtr<IObjectFormatter> formatter_;
  cErrReporter reporter_;
  cErrHandler* errors_ = &reporter_;
};

}  // namespace br::inspector
