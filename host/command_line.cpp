#include "command_line.h"

#include <cerrno>
#include <climits>
#include <cstdlib>

namespace vtpl::host {
namespace {

const std::vector<std::string> kCommands = {"info", "render", "help"};

// The value of an option given as "--name=value" or as "--name value".
std::string optionValue(const std::vector<std::string>& arguments, size_t& index,
                        const std::string& name) {
  const std::string& argument = arguments[index];
  if (argument.size() > name.size() && argument[name.size()] == '=') {
    return argument.substr(name.size() + 1);
  }
  if (index + 1 >= arguments.size()) {
    throw UsageError(name + " needs a value");
  }
  return arguments[++index];
}

bool isOption(const std::string& argument, const std::string& name) {
  return argument == name || argument.rfind(name + "=", 0) == 0;
}

int32_t parseVersion(const std::string& text) {
  char* end = nullptr;
  errno = 0;
  const long value = std::strtol(text.c_str(), &end, 10);
  if (text.empty() || *end != '\0' || errno != 0 || value < INT32_MIN || value > INT32_MAX) {
    throw UsageError("--host-version takes a whole number, not '" + text + "'");
  }
  return static_cast<int32_t>(value);
}

}  // namespace

CommandLine parseCommandLine(const std::vector<std::string>& arguments) {
  CommandLine line;
  for (size_t i = 0; i < arguments.size(); ++i) {
    const std::string& argument = arguments[i];
    if (argument == "--help" || argument == "-h") {
      line.command = "help";
    } else if (argument == "--trace") {
      line.trace = true;
    } else if (argument == "--verbose") {
      line.verbose = true;
    } else if (argument == "--float") {
      line.asFloat = true;
    } else if (argument == "--pad") {
      line.pad = true;
    } else if (argument == "-o" || isOption(argument, "--output")) {
      line.output = optionValue(arguments, i, argument == "-o" ? "-o" : "--output");
    } else if (isOption(argument, "--plugin")) {
      line.plugin = optionValue(arguments, i, "--plugin");
    } else if (isOption(argument, "--host-version")) {
      line.hostVersion = parseVersion(optionValue(arguments, i, "--host-version"));
    } else if (isOption(argument, "--host-id")) {
      line.hostIdentifier = optionValue(arguments, i, "--host-id");
    } else if (isOption(argument, "--set")) {
      const std::string setting = optionValue(arguments, i, "--set");
      const size_t equals = setting.find('=');
      if (equals == std::string::npos || equals == 0) {
        throw UsageError("--set takes id=value, not '" + setting + "'");
      }
      line.settings.emplace_back(setting.substr(0, equals), setting.substr(equals + 1));
    } else if (argument.rfind("-", 0) == 0) {
      throw UsageError("unknown option '" + argument + "'");
    } else if (line.command.empty()) {
      line.command = argument;
    } else if (line.command == "render" && line.input.empty()) {
      line.input = argument;
    } else {
      throw UsageError("unexpected argument '" + argument + "'");
    }
  }
  if (line.command.empty()) {
    throw UsageError("no command given");
  }
  bool known = false;
  for (const std::string& command : kCommands) {
    known = known || command == line.command;
  }
  if (!known) {
    throw UsageError("unknown command '" + line.command + "'");
  }
  if (line.command == "render" && (line.input.empty() || line.output.empty())) {
    throw UsageError("render needs an input picture and -o OUTPUT");
  }
  return line;
}

std::string usageText() {
  return R"(usage: vtpl-host COMMAND [options]

commands:
  info                      print the plug-in's information and its parameter panel
  render IN.png -o OUT.png  render one frame of the picture through the effect
  help                      print this text

options:
  --plugin PATH        the effect module to load (default: plugins/scopes/Waveform.vtpl
                       beside vtpl-host)
  --set ID=VALUE       set a parameter as a user would, before the command runs; a choice
                       takes an item text or value, a bool true/false, a point "x,y",
                       a colour "r,g,b"; may be repeated
  --host-version N     the version the host reports (default 5600)
  --host-id TEXT       the identifier the host reports (default com.vantric.Vantric)
  --verbose            set the host's verbose flag
  --trace              log every message and callback, with arguments and results, to
                       standard error

render options:
  -o, --output PATH    the output picture (PNG, the input's bit depth)
  --float              hold 8-bit pictures in float textures (16-bit ones always are)
  --pad                allocate textures with power-of-two storage
)";
}

}  // namespace vtpl::host
