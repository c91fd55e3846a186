#include "host/brtide/ArgumentParser.h"

namespace br::brtide {

namespace {

bool IsHelpOption(const std::string& arg) { return arg == "--help" || arg == "-h"; }

ParseOutcome Failure(std::string message) {
  ParseOutcome outcome;
  outcome.error = std::move(message);
  return outcome;
}

std::string Plural(int n, const char* word) { return std::to_string(n) + " " + word + (n == 1 ? "" : "s"); }

}  // namespace

const OptionSpec* CommandSpec::Find(const std::string& option) const {
  for (const OptionSpec& spec : options) {
    if (spec.name == option) return &spec;
  }
  return nullptr;
}

const std::vector<std::string>& ParsedCommand::Values(const std::string& option) const {
  static const std::vector<std::string> kNone;
  const auto it = options.find(option);
  return it == options.end() ? kNone : it->second;
}

std::string ParsedCommand::Value(const std::string& option) const {
  const std::vector<std::string>& values = Values(option);
  return values.empty() ? std::string() : values.front();
}

const CommandSpec* ArgumentParser::Find(const std::string& command) const {
  for (const CommandSpec& spec : commands_) {
    if (spec.name == command) return &spec;
  }
  return nullptr;
}

ParseOutcome ArgumentParser::Parse(const std::vector<std::string>& args) const {
  ParseOutcome outcome;
  ParsedCommand& parsed = outcome.parsed;
  if (args.empty()) return Failure("no command given (try --help)");

  // Help wins over every other mistake on the line.
  for (std::size_t i = 0; i < args.size(); ++i) {
    if (!IsHelpOption(args[i]) && !(i == 0 && args[i] == "help")) continue;
    parsed.help = true;
    if (i > 0 && Find(args.front())) parsed.command = args.front();
    if (i == 0 && args.size() > 1 && Find(args[1])) parsed.command = args[1];  // "help day"
    outcome.ok = true;
    return outcome;
  }

  const CommandSpec* command = Find(args.front());
  if (!command) return Failure("unknown command \"" + args.front() + "\" (try --help)");
  parsed.command = command->name;

  for (std::size_t i = 1; i < args.size();) {
    std::string name = args[i++];
    std::vector<std::string> values;
    const std::size_t equals = name.find('=');
    const bool inlineValue = name.rfind("--", 0) == 0 && equals != std::string::npos;
    if (inlineValue) {
      values.push_back(name.substr(equals + 1));
      name.erase(equals);
    }
    const OptionSpec* option = command->Find(name);
    if (!option) {
      if (name.rfind("-", 0) != 0) return Failure("unexpected argument \"" + name + "\" for " + command->name);
      return Failure("unknown option " + name + " for " + command->name + " (try " + command->name + " --help)");
    }
    if (parsed.Has(name)) return Failure(name + " is given twice");
    if (inlineValue && option->valueCount != 1) return Failure(name + " does not take \"=\"");
    if (!inlineValue) {
      for (int k = 0; k < option->valueCount; ++k) {
        // Negative numbers are values; another option name is not.
        if (i >= args.size() || args[i].rfind("--", 0) == 0) {
          return Failure(name + " needs " + Plural(option->valueCount, "value") + ": " + option->valueHint);
        }
        values.push_back(args[i++]);
      }
    }
    parsed.options[name] = std::move(values);
  }

  for (const OptionSpec& option : command->options) {
    if (option.required && !parsed.Has(option.name)) {
      return Failure(command->name + " needs " + option.name + " " + option.valueHint);
    }
  }
  outcome.ok = true;
  return outcome;
}

}  // namespace br::brtide
