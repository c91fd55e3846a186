#include "host/brtide/usage.h"

#include <algorithm>

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

constexpr std::size_t kLineWidth = 88;

// words wrapped to lines of at most width characters (a longer word stands alone), the
// first line after first, the others after indent.
std::string Wrapped(const std::string& words, std::size_t width, const std::string& first, const std::string& indent) {
  std::string text = first, line;
  std::size_t start = 0;
  while (start < words.size()) {
    std::size_t end = words.find(' ', start);
    if (end == std::string::npos) end = words.size();
    const std::string word = words.substr(start, end - start);
    start = end + 1;
    if (!line.empty() && Utf8Width(line) + 1 + Utf8Width(word) > width) {
      text += line + "\n" + indent;
      line.clear();
    }
    line += (line.empty() ? "" : " ") + word;
  }
  return text + line + "\n";
}

}  // namespace

void WriteUsage(const std::vector<CommandSpec>& commands, const CommandSpec* command, std::ostream& out) {
  if (command) {
    out << Wrapped(Synopsis(*command), kLineWidth - 7, "usage: ", std::string(7 + 7 + command->name.size() + 1, ' '))
        << '\n' << command->summary << "\n\n";
    std::size_t column = 0;
    for (const OptionSpec& option : command->options) column = std::max(column, Utf8Width(OptionWithValues(option)));
    column = std::min<std::size_t>(column, 28) + 2;
    for (const OptionSpec& option : command->options) {
      const std::string name = OptionWithValues(option);
      const std::string indent(2 + column, ' ');
      const std::string first = Utf8Width(name) < column ? "  " + PadRight(name, column) : "  " + name + "\n" + indent;
      out << Wrapped(option.help, kLineWidth - 2 - column, first, indent);
    }
    return;
  }
  out << "brtide: tide tables from a folder of tide stations, through the BR_Info library\n\n";
  for (const CommandSpec& spec : commands) out << Wrapped(Synopsis(spec), kLineWidth - 2, "  ", std::string(10 + spec.name.size(), ' '));
  out << "\nCommands:\n";
  for (const CommandSpec& spec : commands) out << "  " << PadRight(spec.name, 8) << spec.summary << '\n';
  out << "\n\"brtide COMMAND --help\" describes a command's options. Exit status: 0 done, 1 the folder,\n"
         "station or day cannot be had, 2 a wrong command line.\n";
}

}  // namespace br::brtide
