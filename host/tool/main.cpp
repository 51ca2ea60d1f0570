// vtpl-host: loads an effect module the way the editor does and runs one command with it.
#include <algorithm>
#include <filesystem>
#include <iostream>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "command_line.h"
#include "effect_host.h"
#include "image.h"
#include "panel_printer.h"
#include "plugin_module.h"
#include "test_frame.h"
#include "utf16_text.h"

namespace {

using namespace vtpl::host;

std::filesystem::path defaultPluginPath() {
  std::error_code error;
  const std::filesystem::path tool = std::filesystem::read_symlink("/proc/self/exe", error);
  return tool.parent_path() / "plugins" / "scopes" / "Waveform.vtpl";
}

HostSettings settingsFrom(const CommandLine& line) {
  HostSettings settings;
  if (line.hostVersion) {
    settings.version = *line.hostVersion;
  }
  if (line.hostIdentifier) {
    settings.identifier = toUtf16(*line.hostIdentifier);
  }
  settings.verbose = line.verbose;
  return settings;
}

void warnAboutUnknownIds(const EffectHost& host) {
  if (host.unknownParameterIds().empty()) {
    return;
  }
  std::cerr << "vtpl-host: warning: the effect used parameter ids the panel does not have:";
  for (const std::string& id : host.unknownParameterIds()) {
    std::cerr << ' ' << id;
  }
  std::cerr << '\n';
}

int runInfo(const CommandLine& line, const PluginModule& module) {
  const PluginInformation information = module.information();
  EffectHost host(module, settingsFrom(line), line.trace ? &std::cerr : nullptr);
  host.open();
  for (const auto& [id, value] : line.settings) {
    host.setValueFromText(id, value);
  }
  printInformation(std::cout, information);
  std::cout << "\nParameters (" << host.parameters().parameters().size() << "), as host "
            << toUtf8(host.settings().identifier) << ' ' << host.settings().version
            << " shows them:\n";
  printPanel(std::cout, host.parameters());
  warnAboutUnknownIds(host);
  return 0;
}

// The size of the demo's test frame: the frame the point parameters' defaults span.
constexpr int kDemoWidth = 1280;
constexpr int kDemoHeight = 720;

std::string pointText(double x, double y) {
  std::ostringstream text;
  text << x << ',' << y;
  return text.str();
}

// The editor's user drags the analysed rectangle and the scope's corners over the frame; the
// tool's user gets them spanning the whole picture, except those given with --set, unless
// --keep-defaults asks for the plug-in's own defaults.
std::vector<std::pair<std::string, std::string>> pictureSpanningPoints(const CommandLine& line,
                                                                       const Image& layer) {
  if (line.keepDefaults) {
    return {};
  }
  const double halfWidth = layer.width / 2.0;
  const double halfHeight = layer.height / 2.0;
  const std::pair<std::string, std::string> spanning[] = {
      {"clipStartPos", pointText(-halfWidth, -halfHeight)},
      {"clipEndPos", pointText(halfWidth, halfHeight)},
      {"scopePositionTL", pointText(-halfWidth, halfHeight)},
      {"scopePositionBR", pointText(halfWidth, -halfHeight)}};
  std::vector<std::pair<std::string, std::string>> points;
  for (const auto& point : spanning) {
    const bool given = std::any_of(line.settings.begin(), line.settings.end(),
                                   [&](const auto& setting) { return setting.first == point.first; });
    if (!given) {
      points.push_back(point);
    }
  }
  return points;
}

struct RenderedFrame {
  Image output;
  Image control;
};

// Renders one frame of `layer` as the editor does with the effect's panel open: the scope
// control is attached while the frame renders and drawn on the interface thread afterwards.
RenderedFrame renderWithControl(const CommandLine& line, const PluginModule& module,
                                const Image& layer) {
  HostSettings settings = settingsFrom(line);
  settings.gl = true;
  settings.padTextures = line.pad;
  EffectHost host(module, settings, line.trace ? &std::cerr : nullptr);
  host.open();
  // Applied to a layer, the effect hears of its parent layer first (it follows the layer's
  // colour space), then the user's changes arrive.
  if (host.changeParentLayer(layer.width, layer.height) != vtpl::kResultHandled) {
    std::cerr << "vtpl-host: warning: the effect did not take the picture as its parent layer\n";
  }
  for (const auto& [id, value] : pictureSpanningPoints(line, layer)) {
    host.setValueFromText(id, value);
  }
  for (const auto& [id, value] : line.settings) {
    host.setValueFromText(id, value);
  }
  if (!line.comparison.empty()) {
    host.setComparisonLayer(readPng(line.comparison), line.asFloat);
  }
  host.attachControl();
  RenderedFrame frame;
  frame.output = host.renderFrame(layer, line.asFloat);
  ControlOptions control;
  control.width = line.controlWidth;
  control.height = line.controlHeight;
  host.drawControl(control);
  frame.control = host.controlPicture();
  host.detachControl();
  warnAboutUnknownIds(host);
  return frame;
}

int runRender(const CommandLine& line, const PluginModule& module) {
  const RenderedFrame frame = renderWithControl(line, module, readPng(line.input));
  writePng(line.output, frame.output);
  if (!line.controlOutput.empty()) {
    writePng(line.controlOutput, frame.control);
  }
  return 0;
}

int runDemo(const CommandLine& line, const PluginModule& module) {
  const Image testFrame = colourBarTestFrame(kDemoWidth, kDemoHeight);
  const RenderedFrame frame = renderWithControl(line, module, testFrame);
  std::filesystem::create_directories(line.output);
  const std::pair<const char*, const Image*> pictures[] = {
      {"test-frame.png", &testFrame}, {"output.png", &frame.output}, {"scope.png", &frame.control}};
  for (const auto& [name, picture] : pictures) {
    const std::filesystem::path path = line.output / name;
    writePng(path, *picture);
    std::cout << path.string() << '\n';
  }
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    const CommandLine line = parseCommandLine(std::vector<std::string>(argv + 1, argv + argc));
    if (line.command == "help") {
      std::cout << usageText();
      return 0;
    }
    const PluginModule module(line.plugin.empty() ? defaultPluginPath() : line.plugin);
    if (line.command == "render") {
      return runRender(line, module);
    }
    return line.command == "demo" ? runDemo(line, module) : runInfo(line, module);
  } catch (const UsageError& error) {
    std::cerr << "vtpl-host: " << error.what() << "\n\n" << usageText();
    return 2;
  } catch (const std::exception& error) {
    std::cerr << "vtpl-host: " << error.what() << '\n';
    return 1;
  }
}
