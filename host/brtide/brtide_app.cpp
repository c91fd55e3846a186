#include "host/brtide/brtide_app.h"

#include "host/brtide/DayExtension.h"
#include "host/brtide/TideService.h"
#include "host/brtide/usage.h"

namespace br::brtide {

namespace {

int Fail(std::ostream& err, const std::string& message, int status) {
  err << "brtide: " << message << '\n';
  return status;
}

int RunPorts(const ParsedCommand& parsed, std::ostream& out, std::ostream& err) {
  PortsRequest request;
  std::string error;
  if (!BuildPortsRequest(parsed, request, error)) return Fail(err, error, kExitUsage);

  TideService service;
  if (!service.Create(error) || !service.Open(request.folder, error)) return Fail(err, error, kExitFailure);
  PortsReport report;
  report.folder = service.Folder();
  report.stationCount = service.StationCount();
  report.box = request.box;
  if (!service.PortsInBox(request.box, report.rows, error)) return Fail(err, error, kExitFailure);
  if (report.rows.empty()) {
    return Fail(err, "no station inside the box in \"" + report.folder + "\" (" +
                         std::to_string(report.stationCount) + " stations)", kExitFailure);
  }
  WritePortsText(report, out);
  return kExitOk;
}

int RunDay(const ParsedCommand& parsed, const std::vector<std::unique_ptr<DayExtension>>& extensions,
           std::ostream& out, std::ostream& err) {
  DayRequest request;
  std::string error;
  if (!BuildDayRequest(parsed, request, error)) return Fail(err, error, kExitUsage);
  for (const auto& extension : extensions) {
    const auto values = request.extras.find(extension->Option().name);
    if (values != request.extras.end() && !extension->Accepts(values->second, error)) {
      return Fail(err, error, kExitUsage);
    }
  }

  TideService service;
  if (!service.Create(error) || !service.Open(request.folder, error)) return Fail(err, error, kExitFailure);
  DayReport day;
  if (request.port) {
    day.station = *request.port;
  } else {
    std::vector<Position> stations;
    if (!service.StationPositions(stations, error)) return Fail(err, error, kExitFailure);
    day.station = NearestStation(stations, *request.nearTo);
    if (day.station < 0) return Fail(err, "\"" + service.Folder() + "\" has no station", kExitFailure);
  }
  const auto port = service.Port(day.station, error);
  if (!port) return Fail(err, error, kExitFailure);
  if (!service.CalculateDay(*port.Get(), request, day, error)) return Fail(err, error, kExitFailure);

  if (request.csv) {
    WriteDayCsv(day, out);
  } else {
    WriteDayText(day, out);
  }
  out.flush();
  std::ostream& messages = request.csv ? err : out;
  for (const auto& extension : extensions) {
    const auto values = request.extras.find(extension->Option().name);
    if (values == request.extras.end()) continue;
    const int status = extension->Run(*port.Get(), request, day, values->second, messages, err);
    if (status != kExitOk) return status;
  }
  return kExitOk;
}

}  // namespace

int RunBrtide(const std::vector<std::string>& args, std::ostream& out, std::ostream& err) {
  const std::vector<std::unique_ptr<DayExtension>> extensions = MakeDayExtensions();
  std::vector<CommandSpec> commands = BrtideCommands();
  for (const auto& extension : extensions) AddDayOption(commands, extension->Option());

  const ArgumentParser parser(commands);
  const ParseOutcome outcome = parser.Parse(args);
  if (!outcome.ok) return Fail(err, outcome.error, kExitUsage);
  const ParsedCommand& parsed = outcome.parsed;
  if (parsed.help) {
    WriteUsage(parser.Commands(), parser.Find(parsed.command), out);
    return kExitOk;
  }
  if (parsed.command == "ports") return RunPorts(parsed, out, err);
  return RunDay(parsed, extensions, out, err);
}

}  // namespace br::brtide
