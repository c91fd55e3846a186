#include "tides/controls/tide_day_reader.h"

#include "tides/engine/prediction.h"
#include "tides/objects/platform_dates.h"

#include <oleauto.h>

#include <algorithm>
#include <cmath>
#include <limits>

namespace br::tides {

namespace {

using Getter = HRESULT (STDMETHODCALLTYPE ITidesPort::*)(double*);

std::optional<graph::TimeOfDay> ReadEvent(ITidesPort* port, Getter getter) {
  double date = 0.0;
  if (FAILED((port->*getter)(&date)) || !std::isfinite(date)) return std::nullopt;  // Wine makes a time of NaN
  SYSTEMTIME time{};
  if (!VariantTimeToSystemTime(date, &time)) return std::nullopt;
  return graph::TimeOfDay{time.wHour, time.wMinute};
}

}  // namespace

bool ReadTideDay(ITidesPort* port, graph::TideDay& day) {
  day = graph::TideDay{};
  if (!port) return false;
  long count = 0;
  // A port of another make may claim any count: more than a day can have is no day.
  if (FAILED(port->get_NumPoints(&count)) || count < 1 || count > kMaxDayPoints) return false;

  day.points.resize(static_cast<std::size_t>(count));
  for (long k = 0; k < count; ++k) {
    double value = 0.0;
    day.points[static_cast<std::size_t>(k)] =
        SUCCEEDED(port->get_WavePoint(k, &value)) ? value : std::numeric_limits<double>::quiet_NaN();
  }
  if (FAILED(port->get_MaxValue(&day.maxValue)) || FAILED(port->get_MinValue(&day.minValue))) {
    const auto [low, high] = std::minmax_element(day.points.begin(), day.points.end());
    day.minValue = *low;
    day.maxValue = *high;
  }

  day.sun.twilightBegin = ReadEvent(port, &ITidesPort::get_BeginTwilight);
  day.sun.sunrise = ReadEvent(port, &ITidesPort::get_SunRise);
  day.sun.sunset = ReadEvent(port, &ITidesPort::get_SunSet);
  day.sun.twilightEnd = ReadEvent(port, &ITidesPort::get_EndTwilight);
  double latitude = 0.0;
  double longitude = 0.0;
  if (SUCCEEDED(port->GetPortPos(&latitude, &longitude))) day.sun.latitude = latitude;
  double predictionDate = 0.0;
  CalendarDate date;
  if (SUCCEEDED(port->get_PredictionDate(&predictionDate)) && SplitDayCountDate(predictionDate, date)) {
    day.sun.month = date.month;
  }
  return true;
}

}  // namespace br::tides
