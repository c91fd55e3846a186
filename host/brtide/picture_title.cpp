#include "host/brtide/picture_title.h"

#include "host/brtide/clock_text.h"
#include "host/brtide/printable_text.h"

namespace br::brtide {

std::vector<std::string> PictureTitle(const DayReport& day) {
  const std::string first = PrintableText(day.name) + " (station " + std::to_string(day.station) + ")  " +
                            IsoDate(SplitDayCount(day.predictionDate).date) + "  heights in metres";
  const std::string station = "station time UTC" + ZoneOffsetText(day.zone);
  if (day.stationTime || day.clockOffsetMinutes == -day.zone * 60) return {first, "curve and sun bands: " + station};
  return {first, "curve: this computer's standard time UTC" + OffsetText(day.clockOffsetMinutes) + "    sun bands: " + station};
}

}  // namespace br::brtide
