// Messages about the input, collected while a command runs and printed by the caller.
#pragma once

#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

namespace br::tidefiles {

enum class Severity { Note, Warning, Error };

struct Diagnostic {
  Severity severity;
  std::string text;
};

class Diagnostics {
 public:
  void Note(std::string text) { Add(Severity::Note, std::move(text)); }
  void Warning(std::string text) { Add(Severity::Warning, std::move(text)); }
  void Error(std::string text) { Add(Severity::Error, std::move(text)); }

  bool HasErrors() const { return Count(Severity::Error) > 0; }
  std::size_t Count(Severity severity) const;
  const std::vector<Diagnostic>& All() const { return items_; }

  // One line per message, "tidefiles: warning: ..."; notes only when verbose.
  void Print(std::ostream& out, bool verbose) const;

 private:
  void Add(Severity severity, std::string text) { items_.push_back({severity, std::move(text)}); }
  std::vector<Diagnostic> items_;
};

}  // namespace br::tidefiles
