#include "tools/tidefiles/Diagnostics.h"

namespace br::tidefiles {

std::size_t Diagnostics::Count(Severity severity) const {
  std::size_t n = 0;
  for (const Diagnostic& d : items_) n += d.severity == severity ? 1 : 0;
  return n;
}

void Diagnostics::Print(std::ostream& out, bool verbose) const {
  for (const Diagnostic& d : items_) {
    if (d.severity == Severity::Note && !verbose) continue;
    const char* label = d.severity == Severity::Error ? "error" : d.severity == Severity::Warning ? "warning" : "note";
    out << "tidefiles: " << label << ": " << d.text << '\n';
  }
}

}  // namespace br::tidefiles
