// Command-line parsing for brtide: a command word followed by "--name value..." options,
// each command described by a table so that new options need no parser changes.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace br::brtide {

struct OptionSpec {
  std::string name;       // "--folder"
  int valueCount = 0;     // values that follow the name; 0 for a switch
  std::string valueHint;  // "F", "LAT LON"
  std::string help;       // one line for --help
  bool required = false;
  // Options of one group exclude each other and one of them is needed; --help shows
  // neighbours of a group as "(--a X | --b Y)". The command's request checks the rule.
  std::string group;
};

struct CommandSpec {
  std::string name;     // "day"
  std::string summary;  // one line for --help
  std::vector<OptionSpec> options;

  const OptionSpec* Find(const std::string& option) const;
};

struct ParsedCommand {
  std::string command;  // empty with help for the general help
  bool help = false;
  std::map<std::string, std::vector<std::string>> options;

  bool Has(const std::string& option) const { return options.count(option) != 0; }
  // The option's values; empty when it was not given.
  const std::vector<std::string>& Values(const std::string& option) const;
  // The first value, or empty text.
  std::string Value(const std::string& option) const;
};

struct ParseOutcome {
  bool ok = false;
  ParsedCommand parsed;
  std::string error;  // one line when not ok
};

class ArgumentParser {
public:
  explicit ArgumentParser(std::vector<CommandSpec> commands) : commands_(std::move(commands)) {}

  // args without the program name. "--help" or "-h" anywhere, or "help" first, asks for
  // help (for the command when one was named); "--name=value" works for one-value options.
  ParseOutcome Parse(const std::vector<std::string>& args) const;

  const std::vector<CommandSpec>& Commands() const { return commands_; }
  const CommandSpec* Find(const std::string& command) const;

private:
  std::vector<CommandSpec> commands_;
};

}  // namespace br::brtide
