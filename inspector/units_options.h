#pragma once
// What a host set through IUnitsOption, kept for the detail panels.

#include <memory>
#include <string>

namespace br::inspector {

// The record a non-zero option makes: the panels show values in these units.
struct UnitsRecord {
  long option = 0;
};

struct UnitsOptions {
  long option = 0;
  bool optionIsOne = false;
  long units = 0;
  std::wstring text;
  std::unique_ptr<UnitsRecord> record;  // made for a non-zero option, kept afterwards

  void SetOption(long value) {
    option = value;
    optionIsOne = value == 1;
    if (value != 0) {
      if (!record) record = std::make_unique<UnitsRecord>();
      record->option = value;
    }
  }
};

}  // namespace br::inspector
