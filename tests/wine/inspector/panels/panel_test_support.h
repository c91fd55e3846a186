// A detail panel of the inspector standing alone in a host window, with the settings
// block made as the control makes it (the stand-in's formatter and texts), and its rows
// read as an accessibility client reads them.
#pragma once

#include <windows.h>
#include <objbase.h>

#include <doctest/doctest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "inspector/panels/PanelSettings.h"
#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/widget_test_support.h"

namespace br::test {

struct Apartment {
  Apartment() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
  ~Apartment() { CoUninitialize(); }
};

template <class PanelClass>
struct MountedPanel {
  Apartment apartment;
  wtest::HostWindow host{520, 400};
  inspector::PanelSettings settings;
  PanelClass panel{settings};

  MountedPanel() {
    REQUIRE(settings.Create() == S_OK);
    REQUIRE(panel.create(host.hwnd()));
    panel.setBounds(0, 0, 500, 380, true, true);
    panel.doLayout();
  }

  // Each row as a client names it: the visible cells joined by tabs.
  std::vector<std::wstring> Rows() {
    AccessibleReader reader(panel.table().getHandle());
    REQUIRE(reader.get() != nullptr);
    return reader.ChildNames();
  }
  std::vector<int> Types() const {
    std::vector<int> types;
    for (int row = 0; row < panel.table().getRowCount(); ++row) types.push_back(panel.RowType(row));
    return types;
  }
};

using Names = std::vector<std::wstring>;

// A row as a failure message shows it: tabs and line breaks spelled out, other
// characters beyond ASCII as \u escapes.
inline std::string Printable(const std::wstring& text) {
  std::string out;
  for (wchar_t c : text) {
    if (c == L'\t') {
      out += "\\t";
    } else if (c == L'\r') {
      out += "\\r";
    } else if (c >= 0x20 && c < 0x7F) {
      out += static_cast<char>(c);
    } else {
      char escape[8];
      snprintf(escape, sizeof escape, "\\u%04X", static_cast<unsigned>(c));
      out += escape;
    }
  }
  return out;
}

}  // namespace br::test

namespace doctest {
template <>
struct StringMaker<std::wstring> {
  static String convert(const std::wstring& text) { return ("\"" + br::test::Printable(text) + "\"").c_str(); }
};
template <>
struct StringMaker<std::vector<std::wstring>> {
  static String convert(const std::vector<std::wstring>& rows) {
    std::string all = "{";
    for (const std::wstring& row : rows) all += "\n  \"" + br::test::Printable(row) + "\"";
    return (all + "}").c_str();
  }
};
}  // namespace doctest
