#pragma once
// Dates and times through the platform's locale formatting, in the system's
// default locale, with explicit patterns.

#include <windows.h>

#include <string>

namespace br {

inline constexpr const char* DATE_PATTERN = "dd.MM.yyyy";   // log lines and inspector panels
inline constexpr const char* TIME_PATTERN = "HH:mm";        // always 24-hour
inline constexpr const char* MONTH_PATTERN = "MM-yyyy";     // month edit default

// Empty text when the platform refuses the date or the pattern.
std::string FormatDate(const SYSTEMTIME& when, const char* pattern = DATE_PATTERN);
std::string FormatTime(const SYSTEMTIME& when, const char* pattern = TIME_PATTERN);

// A platform date: days since 1899-12-30, the fraction being the time of day.
std::string FormatDate(double platformDate, const char* pattern = DATE_PATTERN);
std::string FormatTime(double platformDate, const char* pattern = TIME_PATTERN);

}  // namespace br
