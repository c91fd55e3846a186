// brtide's only contact with the library: a TidesDatabase created by its programmatic
// identifier, and ports read through ITidesPort, as any automation client would.
#pragma once

#include <windows.h>
#include <wrl/client.h>

#include <string>
#include <vector>

#include "BR_Info.h"
#include "host/brtide/day_report.h"
#include "host/brtide/ports_report.h"
#include "host/brtide/requests.h"

namespace br::brtide {

class TideService {
public:
  // Each gives false and a one-line message on failure. COM must be initialised.
  bool Create(std::string& error);
  // folder: UTF-8, relative or full. Tells a missing folder from one without station files.
  bool Open(const std::string& folder, std::string& error);

  const std::string& Folder() const { return folder_; }  // full path, UTF-8
  long StationCount() const { return count_; }

  bool StationPositions(std::vector<Position>& positions, std::string& error);
  // The ports strictly inside the box, in station order; none is not an error here.
  bool PortsInBox(const Box& box, std::vector<PortRow>& rows, std::string& error);
  // The port of a station number; null when the folder has no such station.
  Microsoft::WRL::ComPtr<ITidesPort> Port(long number, std::string& error);
  // Calculates the request's day on port and reads everything the report shows; false
  // when the library gives no points for that day.
  bool CalculateDay(ITidesPort& port, const DayRequest& request, DayReport& day, std::string& error);

private:
  Microsoft::WRL::ComPtr<ITidesDatabase> database_;
  std::string folder_;
  long count_ = 0;
};

// The computer's standard time minus universal time in minutes (summer time never applies:
// the library starts a day at local standard midnight).
int ComputerStandardOffsetMinutes();

}  // namespace br::brtide
