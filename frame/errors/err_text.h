#pragma once
// The texts of an error report: the log line and the message box text.
// Portable: the reporter gathers the platform's parts (date, time, thread,
// system message) and these functions put them together.

#include <cstdint>
#include <string>

#include "frame/errors/ErrRecord.h"

namespace br {

// Bit 29 marks an application-defined error in the thread's last-error value.
inline constexpr std::uint32_t LIBRARY_ERROR_BIT = 0x20000000u;

// The longest message box text, without its terminator.
inline constexpr std::size_t ERR_BOX_TEXT_MAX = 511;

// Everything of one report apart from the record itself.
struct ErrReportContext {
  const char* className = "";
  std::string date;            // "dd.MM.yyyy"
  std::string time;            // "HH:mm"
  std::uint32_t threadId = 0;
  const char* systemText = nullptr;  // the result's system message, first line; none: "(null)"
};

// File name and extension of a source path written with either separator.
void SplitSourceName(const char* path, std::string& name, std::string& extension);

// Line of the failure relative to the operation's first line; -1 for none.
std::int32_t LineOffset(const ErrRecord& record);

// A system message cut at its first carriage return or line feed.
std::string FirstLineOf(const char* text);

std::string FormatErrLogLine(const ErrRecord& record, const ErrReportContext& context);
std::string FormatErrBoxText(const ErrRecord& record, const ErrReportContext& context);

}  // namespace br
