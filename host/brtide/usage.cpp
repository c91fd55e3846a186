#include "host/brtide/usage.h"

#include "host/brtide/position_text.h"

namespace br::brtide {

namespace {

std::string OptionWithValues(const OptionSpec& option) {
  return option.valueHint.empty() ? option.name : option.name + " " + option.valueHint;
}

std::string Synopsis(const CommandSpec& command) {
  std::string text = "brtide " + command.name;
  const std::vector<OptionSpec>& options = command.options;
  for (std::size_t i = 0; i < options.size(); ++i) {
    const OptionSpec& option = options[i];
    if (option.group.empty()) {
      text += " " + (option.required ? OptionWithValues(option) : "[" + OptionWithValues(option) + "]");
      continue;
    }
    std::string choice = OptionWithValues(option);
    while (i + 1 < options.size() && options[i + 1].group == option.group) choice += " | " + OptionWithValues(options[++i]);
    text += " (" + choice + ")";
  }
  return text;
}

}  // namespace

void WriteUsage(const std::vector<CommandSpec>& commands, const CommandSpec* command, std::ostream& out) {
  if (command) {
    out << "usage: " << Synopsis(*command) << "\n\n" << command->summary << "\n\n";
    for (const OptionSpec& option : command->options) {
      out << "  " << PadRight(OptionWithValues(option), 34) << " " << option.help << '\n';
    }
    return;
  }
  out << "brtide: tide tables from a folder of tide stations, through the BR_Info library\n\n";
  for (const CommandSpec& spec : commands) out << "  " << Synopsis(spec) << '\n';
  out << "\nCommands:\n";
  for (const CommandSpec& spec : commands) out << "  " << PadRight(spec.name, 8) << spec.summary << '\n';
  out << "\n\"brtide COMMAND --help\" describes a command's options. Exit status: 0 done, 1 the folder,\n"
         "station or day cannot be had, 2 a wrong command line.\n";
}

}  // namespace br::brtide
