#include "host/brtide/brtide_app.h"

#include "host/brtide/DayExtension.h"
#include "host/brtide/StationTimePort.h"
#include "host/brtide/TideService.h"
#include "host/brtide/usage.h"

namespace br::brtide {

namespace {

int Fail(std::ostream& err, const std::string& message, int status) {
  err << "brtide: " << message << '\n';
  return status;
}

std::string Count(std::size_t n, const char* noun) { return std::to_string(n) + " " + noun + (n == 1 ? "" : "s"); }

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
                         Count(static_cast<std::size_t>(report.stationCount), "station") + ")", kExitFailure);
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
    if (values == request.extras.end()) continue;
    const std::string required = extension->RequiredOption();
    if (!required.empty() && !request.extras.count(required))
      return Fail(err, extension->Option().name + " goes with " + required, kExitUsage);
    if (!extension->Accepts(values->second, error)) return Fail(err, error, kExitUsage);
  }

  TideService service;
  if (!service.Create(error) || !service.Open(request.folder, error)) return Fail(err, error, kExitFailure);
  DayReport day;
  day.station = service.ChooseStation(request.station, error);
  if (day.station < 0) return Fail(err, error, kExitFailure);
  const auto port = service.Port(day.station, error);
  if (!port) return Fail(err, error, kExitFailure);
  if (!service.CalculateDay(*port.Get(), request, day, error)) return Fail(err, error, kExitFailure);

  if (request.csv) {
    WriteDayCsv(day, out);
  } else if (request.json) {
    WriteDayJson(day, out);
  } else {
    WriteDayText(day, out);
  }
  out.flush();
  std::ostream& messages = request.csv || request.json ? err : out;
  // On the station's clock the outputs read a port of that day; else the library's own.
  Microsoft::WRL::ComPtr<ITidesPort> shown = port;
  if (request.stationTime) {
    shown.Attach(StationTimePort::Create(day));
    if (!shown) return Fail(err, "out of memory", kExitFailure);
  }
  for (const auto& extension : extensions) {
    const auto values = request.extras.find(extension->Option().name);
    if (values == request.extras.end()) continue;
    const int status = extension->Run(*shown.Get(), request, day, values->second, messages, err);
    if (status != kExitOk) return status;
  }
  return kExitOk;
}

int RunDays(const ParsedCommand& parsed, std::ostream& out, std::ostream& err) {
  DaysRequest request;
  std::string error;
  if (!BuildDaysRequest(parsed, request, error)) return Fail(err, error, kExitUsage);

  TideService service;
  if (!service.Create(error) || !service.Open(request.folder, error)) return Fail(err, error, kExitFailure);
  DaysReport table;
  table.station = service.ChooseStation(request.station, error);
  if (table.station < 0) return Fail(err, error, kExitFailure);
  const auto port = service.Port(table.station, error);
  if (!port) return Fail(err, error, kExitFailure);
  if (!service.CalculateDays(*port.Get(), request, table, error)) return Fail(err, error, kExitFailure);
  if (request.csv) {
    WriteDaysCsv(table, out);
  } else if (request.json) {
    WriteDaysJson(table, out);
  } else {
    WriteDaysText(table, out);
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
  if (parsed.command == "days") return RunDays(parsed, out, err);
  return RunDay(parsed, extensions, out, err);
}

}  // namespace br::brtide
