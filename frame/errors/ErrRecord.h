#pragma once
// Where a guarded operation failed, and with what result. One record per
// guarded operation; refilled from its ErrPlace at the start of each attempt.

#include <cstdint>

namespace br {

// The fixed part of a guarded operation's place: its source file, name and
// first line. BR_ERR_PLACE("Name") fills it at the operation's first line.
struct ErrPlace {
  const char* file;
  const char* function;
  std::int32_t firstLine;
};

#define BR_ERR_PLACE(function) (::br::ErrPlace{__FILE__, (function), __LINE__})

struct ErrRecord {
  const char* file = "";
  const char* function = "";
  const char* text = nullptr;     // extra text; none unless an operation adds one
  std::int32_t firstLine = 0;
  std::int32_t line = -1;         // source line of the failure; -1 until a line is caught
  std::uint32_t code = 0;         // application error code
  std::int32_t result = 0;        // the attempt's failure HRESULT; 0 while it has none

  ErrRecord() = default;
  explicit ErrRecord(const ErrPlace& place) { reset(place); }

  // Start of an attempt: everything but the place is cleared.
  void reset(const ErrPlace& place) {
    file = place.file ? place.file : "";
    function = place.function ? place.function : "";
    text = nullptr;
    firstLine = place.firstLine;
    line = -1;
    code = 0;
    result = 0;
  }

  bool failed() const { return result != 0; }
};

}  // namespace br
