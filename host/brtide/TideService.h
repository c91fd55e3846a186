// brtide's contact with the library: a TidesDatabase created by its programmatic
// identifier, and ports read through ITidesPort, as any automation client would. Before
// the library opens a folder, brtide reads it with the station-folder check, so that a
// damaged station gives a message naming it rather than confident numbers.
#pragma once

#include <windows.h>
#include <wrl/client.h>

#include <map>
#include <string>
#include <vector>

#include "BR_Info.h"
#include "host/brtide/day_report.h"
#include "host/brtide/days_report.h"
#include "host/brtide/ports_report.h"
#include "host/brtide/requests.h"

namespace br::brtide {

// A port's heights every minute over whole days, with each day's sun times.
struct MinuteCurve {
  int firstDay = 0;              // days after the asked date, of the first sample's midnight
  std::vector<double> heights;   // metres, every minute from that midnight (the port's clock)
  std::map<int, SunTimes> sun;   // each day's published sun times, by days after the date
};

class TideService {
public:
  // Each gives false and a one-line message on failure. COM must be initialised.
  bool Create(std::string& error);
  // folder: UTF-8, relative or full; empty for the world set beside the program. Tells a
  // missing folder from one without station files and names a damaged station.
  bool Open(const std::string& folder, std::string& error);

  const std::string& Folder() const { return folder_; }  // full path, UTF-8
  long StationCount() const { return count_; }

  bool StationPositions(std::vector<Position>& positions, std::string& error);
  // The ports strictly inside the box (two searches for a box across the 180th
  // meridian), in station order; none is not an error here.
  bool PortsInBox(const Box& box, std::vector<PortRow>& rows, std::string& error);
  // The station number of a choice (the nearest one for a position); -1 with a message.
  long ChooseStation(const StationChoice& choice, std::string& error);
  // The port of a station number; null when the folder has no such station.
  Microsoft::WRL::ComPtr<ITidesPort> Port(long number, std::string& error);

  // Calculates the request's day on port and reads everything the report shows. The
  // port holds the request's day at its step afterwards (the port's clock); false when
  // the library gives no points for that day.
  bool CalculateDay(ITidesPort& port, const DayRequest& request, DayReport& day, std::string& error);
  // The tide table of the request's days.
  bool CalculateDays(ITidesPort& port, const DaysRequest& request, DaysReport& table, std::string& error);

private:
  bool ReadStation(ITidesPort& port, std::string& name, Position& position, std::string& error);
  bool ReadMinuteCurve(ITidesPort& port, const br::tides::CalendarDate& date, int firstDay, int lastDay,
                       MinuteCurve& curve, std::string& error);
  bool ReadZone(ITidesPort& port, const br::tides::CalendarDate& date, long& zone, std::string& error);

  Microsoft::WRL::ComPtr<ITidesDatabase> database_;
  std::string folder_;
  long count_ = 0;
};

// The computer's standard time minus universal time in minutes (summer time never applies:
// the library starts a day at local standard midnight).
int ComputerStandardOffsetMinutes();

}  // namespace br::brtide
