// The vtpl-host command line: a subcommand and its options.
#ifndef VTPL_HOST_COMMAND_LINE_H
#define VTPL_HOST_COMMAND_LINE_H

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host_error.h"

namespace vtpl::host {

// A command line that cannot be understood; the tool prints it with the usage text.
class UsageError : public HostError {
 public:
  using HostError::HostError;
};

struct CommandLine {
  std::string command;               // "info", "render", "demo" or "help"
  std::filesystem::path input;       // render: the layer picture
  std::filesystem::path output;      // render: where the output goes; demo: the folder (out/demo)
  bool asFloat = false;              // render, demo: float storage for 8-bit pictures too
  bool pad = false;                  // render, demo: power-of-two texture storage
  bool keepDefaults = false;  // render, demo: leave the clip and the scope's corners at the
                              // plug-in's defaults instead of spanning the picture
  std::filesystem::path comparison;  // render, demo: the comparison layer's picture, if any
  std::filesystem::path controlOutput;  // render: where the scope control's picture goes, if
                                        // anywhere
  int32_t controlWidth = 500;           // render, demo: the scope control's size in pixels
  int32_t controlHeight = 300;
  std::filesystem::path plugin;  // empty: the module built beside the tool
  bool trace = false;            // log every message and callback to standard error
  bool verbose = false;          // set the host record's verbose flag
  std::vector<std::pair<std::string, std::string>> settings;  // --set id=value, in order
  std::optional<int32_t> hostVersion;
  std::optional<std::string> hostIdentifier;
};

// Throws UsageError.
CommandLine parseCommandLine(const std::vector<std::string>& arguments);

std::string usageText();

}  // namespace vtpl::host

#endif  // VTPL_HOST_COMMAND_LINE_H
