#include "command_line.h"

#include <cerrno>
#include <climits>
#include <cstdlib>

namespace vtpl::host {
namespace {

const std::vector<std::string> kCommands = {"info", "render", "demo", "help"};

// The most pixels a side of the scope control may have: the size every GL 4.1 driver allows.
constexpr long kLargestControlSide = 16384;

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

// One side of "WxH": digits only, from 1 to the largest side.
int32_t parseSide(const std::string& digits, const std::string& size) {
  const bool allDigits = !digits.empty() && digits.size() <= 5 &&
                         digits.find_first_not_of("0123456789") == std::string::npos;
  const long value = allDigits ? std::strtol(digits.c_str(), nullptr, 10) : 0;
  if (value < 1 || value > kLargestControlSide) {
    throw UsageError("--control-size takes WIDTHxHEIGHT, each from 1 to " +
                     std::to_string(kLargestControlSide) + ", not '" + size + "'");
  }
  return static_cast<int32_t>(value);
}

void parseControlSize(const std::string& size, CommandLine& line) {
  const size_t x = size.find('x');
  line.controlWidth = parseSide(size.substr(0, x), size);
  line.controlHeight = parseSide(x == std::string::npos ? "" : size.substr(x + 1), size);
}

// Options that only some commands use are refused elsewhere, so that a mistyped command line
// does not quietly do less than asked.
void checkOptionsFit(const CommandLine& line, bool controlSizeGiven) {
  const bool renders = line.command == "render" || line.command == "demo";
  if (!line.comparison.empty() && !renders) {
    throw UsageError("--compare is an option of render and demo");
  }
  if (line.keepDefaults && !renders) {
    throw UsageError("--keep-defaults is an option of render and demo");
  }
  if (controlSizeGiven && !renders) {
    throw UsageError("--control-size is an option of render and demo");
  }
  if (!line.controlOutput.empty() && line.command != "render") {
    throw UsageError("--control is an option of render (demo always writes scope.png)");
  }
}

}  // namespace

CommandLine parseCommandLine(const std::vector<std::string>& arguments) {
  CommandLine line;
  bool controlSizeGiven = false;
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
    } else if (argument == "--keep-defaults") {
      line.keepDefaults = true;
    } else if (argument == "-o" || isOption(argument, "--output")) {
      line.output = optionValue(arguments, i, argument == "-o" ? "-o" : "--output");
    } else if (isOption(argument, "--compare")) {
      line.comparison = optionValue(arguments, i, "--compare");
    } else if (isOption(argument, "--control-size")) {
      parseControlSize(optionValue(arguments, i, "--control-size"), line);
      controlSizeGiven = true;
    } else if (isOption(argument, "--control")) {
      line.controlOutput = optionValue(arguments, i, "--control");
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
  if (line.command == "demo" && line.output.empty()) {
    line.output = std::filesystem::path("out") / "demo";
  }
  checkOptionsFit(line, controlSizeGiven);
  return line;
}

std::string usageText() {
  return R"(usage: vtpl-host COMMAND [options]

commands:
  info                      print the plug-in's information and its parameter panel
  render IN.png -o OUT.png  render one frame of the picture through the effect, with the
                            scope control attached, then draw the control; the effect is
                            told the picture is its layer first, as the editor does
  demo [-o DIR]             the same for a built-in test frame (colour bars over a grey
                            ramp); writes test-frame.png, output.png (the rendered frame) and
                            scope.png (the control) into DIR (default out/demo), and prints
                            their paths
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

render and demo options:
  -o, --output PATH    render: the output picture (PNG, the input's bit depth);
                       demo: the folder to write into (created when missing)
  --compare B.png      choose the picture as the comparison layer ("overlayLayer")
  --control SCOPE.png  render: also write the picture of the scope control (PNG, 8-bit)
  --control-size WxH   the scope control's size in pixels (default 500x300)
  --float              hold 8-bit pictures in float textures (16-bit ones always are)
  --pad                allocate textures with power-of-two storage
  --keep-defaults      keep the plug-in's defaults for the analysed rectangle (clipStartPos,
                       clipEndPos) and the scope's corners (scopePositionTL, scopePositionBR);
                       by default each of them not given with --set spans the whole picture

Render to layer: --set blendType=Screen (or another blend) draws the scope into the frame,
over the rectangle --set scopePositionTL=X,Y --set scopePositionBR=X,Y in frame pixels from
the frame's centre, x to the right and y up.
)";
}

}  // namespace vtpl::host
