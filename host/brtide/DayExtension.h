// Extra outputs of "brtide day", each chosen by an option of its own (a picture of the
// curve, for example). To add one: derive from DayExtension in its own source file and
// list it in MakeDayExtensions (day_extensions.cpp).
#pragma once

#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "BR_Info.h"
#include "host/brtide/ArgumentParser.h"
#include "host/brtide/day_report.h"
#include "host/brtide/requests.h"

namespace br::brtide {

class DayExtension {
public:
  virtual ~DayExtension() = default;

  // The option that asks for this output; it joins the "day" command's options.
  virtual OptionSpec Option() const = 0;

  // Checks the option's values before anything is calculated; false with a one-line message.
  virtual bool Accepts(const std::vector<std::string>& values, std::string& error) const {
    (void)values;
    (void)error;
    return true;
  }

  // Another extra output this one only works with ("--png" for "--size"); empty for none.
  virtual std::string RequiredOption() const { return std::string(); }

  // Runs after the day is calculated and printed, with the port holding that day (a port
  // of the day on the station's clock with --station-time).
  // Progress goes to messages (standard error when the day itself went out as CSV),
  // failures to err. Returns an exit status (kExitOk when done).
  virtual int Run(ITidesPort& port, const DayRequest& request, const DayReport& day,
                  const std::vector<std::string>& values, std::ostream& messages, std::ostream& err) = 0;
};

std::vector<std::unique_ptr<DayExtension>> MakeDayExtensions();

}  // namespace br::brtide
