// Times the waveform analysis pass on the machine's GL (the software renderer here) for HD and
// UHD frames, and ffmpeg's waveform filter on the same pictures as an outside reference.
//   analysis_bench [--runs N] [--quick] [--no-ffmpeg] [--folder DIR]
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <string>
#include <vector>

#include "bench_runs.h"
#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl_test_host.h"
#include "headless_gl.h"
#include "image.h"
#include "scope/parameter_choices.h"
#include "scope/waveform_analysis.h"

namespace {

using waveform_bench::median;

using namespace plugin::Scopes;
using Clock = std::chrono::steady_clock;

struct Options {
  int runs = 3;
  bool quick = false;  // HD only, Full only
  bool ffmpeg = true;
  std::filesystem::path folder = std::filesystem::temp_directory_path() / "waveform-bench";
};

// A busy picture: colour bars over a luma ramp with fine detail; or a flat grey frame, the worst
// case, where every point of a column lands on one texel.
vtpl::host::Image picture(int width, int height, bool busy, int bitDepth) {
  static const float bars[8][3] = {{1, 1, 1}, {1, 1, 0}, {0, 1, 1}, {0, 1, 0},
                                   {1, 0, 1}, {1, 0, 0}, {0, 0, 1}, {0, 0, 0}};
  vtpl::host::Image image;
  image.width = width;
  image.height = height;
  image.bitDepth = bitDepth;
  image.rgba.resize(4 * static_cast<size_t>(width) * height);
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) {
      float* p = image.pixel(x, y);
      if (!busy) {
        p[0] = p[1] = p[2] = 0.5f;
      } else if (y < height / 2) {
        const float* bar = bars[x * 8 / width];
        for (int c = 0; c < 3; ++c) {
          p[c] = 0.75f * bar[c];
        }
      } else {
        const float ramp = static_cast<float>(x) / (width - 1);
        const float detail = 0.05f * static_cast<float>((x * 7 + y * 13) % 17) / 16.0f;
        p[0] = ramp;
        p[1] = std::min(1.0f, ramp * 0.8f + detail);
        p[2] = 1.0f - ramp;
      }
      p[3] = 1.0f;
    }
  }
  return image;
}

vtpl::HostTexture upload(const vtpl::host::Image& image, bool asFloat) {
  vtpl::HostTexture layer{};
  glGenTextures(1, &layer.name);
  glBindTexture(GL_TEXTURE_2D, layer.name);
  glTexImage2D(GL_TEXTURE_2D, 0, asFloat ? GL_RGBA32F : GL_RGBA8, image.width, image.height, 0,
               GL_RGBA, GL_FLOAT, image.rgba.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  layer.format = asFloat ? GL_RGBA32F : GL_RGBA;
  layer.width = layer.allocatedWidth = static_cast<uint32_t>(image.width);
  layer.height = layer.allocatedHeight = static_cast<uint32_t>(image.height);
  layer.uMax = layer.vMax = 1.0f;
  return layer;
}

double secondsOf(const std::string& command) {
  const auto start = Clock::now();
  if (std::system(command.c_str()) != 0) {
    return -1;
  }
  return std::chrono::duration<double>(Clock::now() - start).count();
}

// ffmpeg's waveform filter on one core, per frame: a run with the filter less a run without it.
// Float pictures go in as 12 bits per channel, the deepest the filter takes.
double ffmpegMilliseconds(const std::filesystem::path& png, int32_t mode, bool sixteenBit) {
  constexpr int kFrames = 5;
  const std::string format =
      mode == kModeRGB ? (sixteenBit ? "gbrp12" : "gbrp") : (sixteenBit ? "yuv444p12" : "yuv444p");
  const std::string filter = mode == kModeRGB    ? "waveform=components=7"
                             : mode == kModeCbCr ? "waveform=components=6"
                                                 : "waveform=components=1";
  const std::string base = "ffmpeg -v error -threads 1 -filter_threads 1 -loop 1 -i '" +
                           png.string() + "' -frames:v " + std::to_string(kFrames) + " -vf ";
  const double with = secondsOf(base + "format=" + format + "," + filter + " -f null -");
  const double without = secondsOf(base + "format=" + format + " -f null -");
  if (with < 0 || without < 0) {
    return -1;
  }
  return std::max(0.0, with - without) * 1000.0 / kFrames;
}

Options parse(int argc, char** argv) {
  Options options;
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--runs" && i + 1 < argc) {
      options.runs = std::max(1, std::atoi(argv[++i]));
    } else if (argument == "--quick") {
      options.quick = true;
    } else if (argument == "--no-ffmpeg") {
      options.ffmpeg = false;
    } else if (argument == "--folder" && i + 1 < argc) {
      options.folder = argv[++i];
    }
  }
  return options;
}

}  // namespace

int main(int argc, char** argv) {
  const Options options = parse(argc, argv);
  const vtpl::host::HeadlessContext context = vtpl::host::createCurrentContext(nullptr);
  if (!context.error.empty()) {
    std::fprintf(stderr, "analysis_bench: %s\n", context.error.c_str());
    return 1;
  }
  std::filesystem::create_directories(options.folder);
  std::printf("GL: %s\n", reinterpret_cast<const char*>(glGetString(GL_RENDERER)));
  std::printf("%-10s %-6s %-6s %-9s %-5s %10s %10s %7s\n", "frame", "depth", "scene", "mode",
              "down", "ours ms", "ffmpeg ms", "ratio");

  waveform_test::GlTestHost host;
  Plugin::gl::EffectData programs;
  ensureAnalysisPrograms(programs, false);
  Plugin::gl::StencilBufferList pool;
  std::recursive_mutex lock;
  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glClearColor(0, 0, 0, 0);

  const std::vector<std::pair<int, int>> sizes =
      options.quick ? std::vector<std::pair<int, int>>{{1920, 1080}}
                    : std::vector<std::pair<int, int>>{{1920, 1080}, {3840, 2160}};
  const std::vector<int32_t> downsamples =
      options.quick ? std::vector<int32_t>{0} : std::vector<int32_t>{0, 1, 2};
  const char* modeNames[] = {"Luminance", "RGB", "", "", "CbCr"};
  const char* downNames[] = {"Full", "Half", "Quart"};
  for (const auto& [width, height] : sizes) {
    for (const bool asFloat : {false, true}) {
      for (const bool busy : {true, false}) {
        const vtpl::host::Image image = picture(width, height, busy, asFloat ? 16 : 8);
        const std::filesystem::path png =
            options.folder / (std::to_string(height) + (asFloat ? "-16" : "-8") +
                              (busy ? "-busy" : "-flat") + ".png");
        if (options.ffmpeg) {
          vtpl::host::writePng(png, image);
        }
        vtpl::HostTexture layer = upload(image, asFloat);
        const Plugin::gl::Matrix4 projection =
            Plugin::gl::orthographicMatrix(float(width), float(height));
        for (const int32_t mode : {kModeLuminance, kModeRGB, kModeCbCr}) {
          const double reference = options.ffmpeg ? ffmpegMilliseconds(png, mode, asFloat) : -1;
          for (const int32_t downsample : downsamples) {
            AnalysisSettings settings;
            settings.mode = mode;
            settings.colorSpace = kRec709;
            settings.brightness = 1;
            settings.downsample = downsample;
            AnalysisInput input;
            input.layer = layer;
            input.target = Plugin::gl::Texture::create();
            input.target->define(static_cast<GLuint>(width),
                                 waveformTextureHeight(layer.format, layer.height),
                                 asFloat ? GL_RGBA32F : GL_RGBA, 1.0f);
            input.fullFrame = true;
            input.frameWidth = width;
            input.frameHeight = height;
            input.projection = projection.data();
            input.modelView = Plugin::gl::kIdentityMatrix.data();
            std::vector<double> times;
            for (int run = 0; run < options.runs; ++run) {
              glFinish();
              const auto start = Clock::now();
              analyseLayer(host.calls(), {programs, pool, lock, true}, settings, input);
              glFinish();
              times.push_back(
                  std::chrono::duration<double, std::milli>(Clock::now() - start).count());
            }
            const double ours = median(times);
            char referenceText[16] = "-";
            char ratioText[16] = "-";
            if (reference > 0) {
              std::snprintf(referenceText, sizeof referenceText, "%.1f", reference);
              std::snprintf(ratioText, sizeof ratioText, "%.2f", ours / reference);
            }
            std::printf("%4dx%-5d %-6s %-6s %-9s %-5s %10.1f %10s %7s\n", width, height,
                        asFloat ? "float" : "8-bit", busy ? "busy" : "flat", modeNames[mode],
                        downNames[downsample], ours, referenceText, ratioText);
            std::fflush(stdout);
          }
        }
        glDeleteTextures(1, &layer.name);
      }
    }
  }
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  vtpl::host::makeCurrent(nullptr);
  vtpl::host::destroyContext(context.context);
  return 0;
}
