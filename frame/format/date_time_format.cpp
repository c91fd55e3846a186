#include "frame/format/date_time_format.h"

#include <oleauto.h>

#include <cmath>

namespace br {

namespace {

// The platform date functions give the needed length when asked with no buffer.
template <class Formatter>
std::string CallWithBuffer(Formatter format) {
  const int needed = format(nullptr, 0);
  if (needed <= 0) {
    return std::string();
  }
  std::string text(static_cast<std::size_t>(needed), '\0');
  const int written = format(&text[0], needed);
  if (written <= 0) {
    return std::string();
  }
  text.resize(static_cast<std::size_t>(written) - 1);  // the count includes the terminator
  return text;
}

bool ToSystemTime(double platformDate, SYSTEMTIME& when) {
  // Not every platform version refuses NaN itself.
  return std::isfinite(platformDate) && VariantTimeToSystemTime(platformDate, &when) != FALSE;
}

}  // namespace

std::string FormatDate(const SYSTEMTIME& when, const char* pattern) {
  return CallWithBuffer([&](char* buffer, int size) {
    return GetDateFormatA(LOCALE_SYSTEM_DEFAULT, 0, &when, pattern, buffer, size);
  });
}

std::string FormatTime(const SYSTEMTIME& when, const char* pattern) {
  return CallWithBuffer([&](char* buffer, int size) {
    return GetTimeFormatA(LOCALE_SYSTEM_DEFAULT, 0, &when, pattern, buffer, size);
  });
}

std::string FormatDate(double platformDate, const char* pattern) {
  SYSTEMTIME when;
  return ToSystemTime(platformDate, when) ? FormatDate(when, pattern) : std::string();
}

std::string FormatTime(double platformDate, const char* pattern) {
  SYSTEMTIME when;
  return ToSystemTime(platformDate, when) ? FormatTime(when, pattern) : std::string();
}

}  // namespace br
