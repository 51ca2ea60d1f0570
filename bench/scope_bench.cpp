// Times whole frames through the reference host on the machine's GL (the software renderer
// here): an HD test frame rendered with the scope control attached, then the control drawn, as
// the editor does with the effect's panel open; for the Luminance and RGB modes, each with and
// without a comparison layer, and the scope rendered into the layer.
//   scope_bench [--runs N] [--plugin PATH]
#include <GL/glew.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>
#include <utility>
#include <vector>

#include "bench_runs.h"
#include "effect_host.h"
#include "gl_thread.h"
#include "image.h"
#include "plugin_module.h"
#include "test_frame.h"

namespace {

using waveform_bench::median;

using namespace vtpl::host;
using Clock = std::chrono::steady_clock;

constexpr int kFrameWidth = 1920;
constexpr int kFrameHeight = 1080;
constexpr int kControlWidth = 500;
constexpr int kControlHeight = 300;

struct Options {
  int runs = 3;
  std::string plugin = WAVEFORM_MODULE_PATH;
};

struct Case {
  const char* name;
  std::vector<std::pair<std::string, std::string>> settings;  // as --set would give them
  bool comparison;
  bool attached = true;  // false: no control open, so the render only copies the layer
};

struct Timing {
  double render = 0;   // milliseconds
  double control = 0;  // milliseconds
  double together = 0;
};

double millisecondsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

// One host per case, opened and set up as the tool does; the times are the medians over the
// runs of the render (upload, message 10 and read-back), of the control drawing (message 1003
// and read-back), and of both in one run.
Timing timeCase(const PluginModule& module, const Case& c, const Image& frame,
                const Image& comparison, int runs) {
  HostSettings settings;
  settings.gl = true;
  EffectHost host(module, settings);
  host.open();
  for (const auto& [id, value] : c.settings) {
    host.setValueFromText(id, value);
  }
  if (c.comparison) {
    host.setComparisonLayer(comparison);
  }
  if (c.attached) {
    host.attachControl();
  }
  ControlOptions control;
  control.width = kControlWidth;
  control.height = kControlHeight;
  // One untimed run first: the driver compiles its shader variants on first use.
  host.renderFrame(frame);
  host.drawControl(control);
  std::vector<double> renders, controls, together;
  for (int run = 0; run < runs; ++run) {
    const Clock::time_point start = Clock::now();
    host.renderFrame(frame);
    const double render = millisecondsSince(start);
    const Clock::time_point drawn = Clock::now();
    host.drawControl(control);
    const double drawing = millisecondsSince(drawn);
    renders.push_back(render);
    controls.push_back(drawing);
    together.push_back(render + drawing);
  }
  if (c.attached) {
    host.detachControl();
  }
  return {median(renders), median(controls), median(together)};
}

// The comparison: the test frame mirrored left to right, so that its waveform differs.
Image mirrored(const Image& picture) {
  Image result = picture;
  for (int y = 0; y < picture.height; ++y) {
    for (int x = 0; x < picture.width; ++x) {
      std::copy_n(picture.pixel(picture.width - 1 - x, y), 4, result.pixel(x, y));
    }
  }
  return result;
}

std::string rendererName() {
  std::string name;
  GlThread probe("probe");
  probe.run([&] { name = reinterpret_cast<const char*>(glGetString(GL_RENDERER)); });
  return name;
}

Options parse(int argc, char** argv) {
  Options options;
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--runs" && i + 1 < argc) {
      options.runs = std::max(1, std::atoi(argv[++i]));
    } else if (argument == "--plugin" && i + 1 < argc) {
      options.plugin = argv[++i];
    } else {
      std::fprintf(stderr, "usage: scope_bench [--runs N] [--plugin PATH]\n");
      std::exit(2);
    }
  }
  return options;
}

}  // namespace

int main(int argc, char** argv) {
  const Options options = parse(argc, argv);
  try {
    const PluginModule module(options.plugin);
    const Image frame = colourBarTestFrame(kFrameWidth, kFrameHeight);
    const Image comparison = mirrored(frame);
    // The point parameters' defaults span 1280 x 720: every case analyses the whole HD frame,
    // and the scope rendered into the layer covers all of it (frame pixels from the centre, y up).
    const std::vector<std::pair<std::string, std::string>> wholeFrame = {
        {"clipStartPos", "-960,-540"}, {"clipEndPos", "960,540"}};
    const auto with = [&wholeFrame](std::vector<std::pair<std::string, std::string>> settings) {
      settings.insert(settings.begin(), wholeFrame.begin(), wholeFrame.end());
      return settings;
    };
    const std::vector<Case> cases = {
        {"Nothing attached (copy only)", with({}), false, false},
        {"Luminance", with({{"waveformMode", "Luminance"}}), false},
        {"Luminance + comparison", with({{"waveformMode", "Luminance"}}), true},
        {"RGB", with({{"waveformMode", "RGB"}}), false},
        {"RGB + comparison", with({{"waveformMode", "RGB"}}), true},
        {"Luminance, Screen to layer",
         with({{"waveformMode", "Luminance"},
               {"blendType", "Screen"},
               {"scopePositionTL", "-960,540"},
               {"scopePositionBR", "960,-540"}}),
         false},
    };
    std::printf("GL: %s\n", rendererName().c_str());
    std::printf("frame %dx%d (8-bit colour bars), control %dx%d, median of %d run(s), ms\n",
                kFrameWidth, kFrameHeight, kControlWidth, kControlHeight, options.runs);
    std::printf("%-28s %10s %10s %10s\n", "case", "render", "control", "together");
    for (const Case& c : cases) {
      const Timing timing = timeCase(module, c, frame, comparison, options.runs);
      std::printf("%-28s %10.1f %10.1f %10.1f\n", c.name, timing.render, timing.control,
                  timing.together);
      std::fflush(stdout);
    }
  } catch (const std::exception& error) {
    std::fprintf(stderr, "scope_bench: %s\n", error.what());
    return 1;
  }
  return 0;
}
