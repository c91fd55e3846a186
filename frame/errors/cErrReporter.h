#pragma once
// Turns a guarded operation's failure into a log line and, if switched on, a
// modal Abort/Retry/Ignore box. Both are off unless "LogBRCL" under
// HKLM\SOFTWARE\Brine switches them on.

#include <windows.h>

#include <cstdint>
#include <string>

#include "frame/errors/err_text.h"
#include "frame/errors/cErrHandler.h"

namespace br {

class cErrReporter : public cErrHandler {
public:
  static constexpr std::uint32_t LOG_TO_FILE = 1;  // mask bit 0
  static constexpr std::uint32_t LOG_TO_BOX = 4;   // mask bit 2
  static constexpr const char* BOX_CAPTION = "BRCL Error";

  cErrReporter();

  std::uint32_t Mask() const { return mask_; }

  // Clears the thread's last-error value.
  void BeginAttempt() noexcept override;
  bool Report(const char* className, ErrRecord& record) noexcept override;

  // "LogBRCL" read once per process: REG_DWORD only, 0xFFFFFFFF counts as 0.
  static std::uint32_t CachedLogMask();
  // The same rules, read now from any key (the cache reads HKLM\SOFTWARE\Brine).
  static std::uint32_t ReadLogMask(HKEY root, const char* keyPath);

  // The log file, worked out afresh: "LogFileBRCL" with drive and folder as it
  // stands, else completed from "KeyPath". Empty when there is none.
  static std::string LogFilePath();

  // The platform's message text for a result, cut at its first line break;
  // false when the platform has none.
  static bool SystemMessage(std::int32_t result, std::string& text);

protected:
  // The mask for this report; the cached registry value.
  virtual std::uint32_t CurrentMask() const;
  // Shows the box and returns the button chosen (IDABORT, IDRETRY, IDIGNORE).
  virtual int ShowBox(const std::string& text) const;

private:
  bool ReportUnguarded(const char* className, ErrRecord& record);
  static void AppendToLog(const std::string& line);

  std::uint32_t mask_;
};

}  // namespace br
