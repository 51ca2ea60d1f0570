// The analysis pass on synthetic frames whose waveform is known without the shader's formulas.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <functional>
#include <stdexcept>
#include <vector>

#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "scope/waveform_analysis.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;
using Pixel = std::array<float, 4>;

constexpr uint32_t kEightBit = GL_RGBA;
constexpr uint32_t kFloat = GL_RGBA32F;

struct Frame {
  int width, height;
  std::function<Pixel(int x, int y)> pixel;  // premultiplied, y from the bottom
  uint32_t layerFormat = kEightBit;
};

struct Settings : AnalysisSettings {
  Settings() {
    colorSpace = 709;
    brightness = 1.0f;
  }
  bool instanced = true;
  bool fullFrame = true;
  bool linearInput = false;
};

// A waveform read back: width x height RGBA floats, row 0 at the bottom.
struct Waveform {
  int width = 0, height = 0;
  std::vector<float> values;
  float at(int x, int row, int channel) const {
    return values[4 * (static_cast<size_t>(row) * width + x) + channel];
  }
  // The rows of a column where the channel is lit.
  std::vector<int> litRows(int x, int channel) const {
    std::vector<int> rows;
    for (int row = 0; row < height; ++row) {
      if (at(x, row, channel) > 0.0f) {
        rows.push_back(row);
      }
    }
    return rows;
  }
};

class WaveformAnalysis : public GlTest {};

Waveform analyse(const Frame& frame, const Settings& settings) {
  std::vector<Pixel> pixels;
  for (int y = 0; y < frame.height; ++y) {
    for (int x = 0; x < frame.width; ++x) {
      pixels.push_back(frame.pixel(x, y));
    }
  }
  vtpl::HostTexture layer{};
  glGenTextures(1, &layer.name);
  glBindTexture(GL_TEXTURE_2D, layer.name);
  glTexImage2D(GL_TEXTURE_2D, 0, frame.layerFormat == kFloat ? GL_RGBA32F : GL_RGBA8, frame.width,
               frame.height, 0, GL_RGBA, GL_FLOAT, pixels.data());
  layer.format = frame.layerFormat;
  layer.width = layer.allocatedWidth = static_cast<uint32_t>(frame.width);
  layer.height = layer.allocatedHeight = static_cast<uint32_t>(frame.height);
  layer.uMax = layer.vMax = 1.0f;

  auto target = Plugin::gl::Texture::create();
  const uint32_t rows = waveformTextureHeight(frame.layerFormat, layer.height);
  // A waveform texture of the layer's format, as the effect's own layer gets.
  target->define(layer.width, rows, frame.layerFormat, 1.0f);

  GlTestHost host;
  Plugin::gl::EffectData programs;
  ensureAnalysisPrograms(programs, false);
  Plugin::gl::StencilBufferList pool;
  std::recursive_mutex lock;
  const float w = static_cast<float>(frame.width), h = static_cast<float>(frame.height);
  const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(w, h);
  AnalysisInput input;
  input.layer = layer;
  input.target = target;
  input.fullFrame = settings.fullFrame;
  input.linearInput = settings.linearInput;
  input.frameWidth = frame.width;
  input.frameHeight = frame.height;
  input.projection = projection.data();
  input.modelView = Plugin::gl::kIdentityMatrix.data();

  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glClearColor(0, 0, 0, 0);
  analyseLayer(host.calls(), {programs, pool, lock, settings.instanced}, settings, input);

  Waveform waveform;
  waveform.width = frame.width;
  waveform.height = static_cast<int>(rows);
  waveform.values.resize(4 * static_cast<size_t>(frame.width) * rows);
  glReadPixels(0, 0, frame.width, static_cast<GLsizei>(rows), GL_RGBA, GL_FLOAT,
               waveform.values.data());
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  glDeleteTextures(1, &layer.name);
  return waveform;
}

// The texture row a value lands in: values span the frame's height less one pixel, centred.
double expectedRow(double value, int frameHeight, int rows, double low = 0, double high = 1) {
  const double v = std::clamp((value - low) / (high - low), 0.0, 1.0);
  const double y = (v - 0.5) * (frameHeight - 1) + frameHeight / 2.0;
  return y / frameHeight * rows;
}

void expectOneRowNear(const Waveform& waveform, int x, int channel, double row,
                      const std::string& what) {
  const std::vector<int> lit = waveform.litRows(x, channel);
  ASSERT_EQ(lit.size(), 1u) << what << " column " << x;
  EXPECT_LE(std::fabs(lit[0] + 0.5 - row), 1.0) << what << " column " << x;
}

// A uniform frame lights one row per column and channel, at the level the mode and colour space
// give (Luminance puts the pixel's colour at its luma: only red is checked for a red frame).
TEST_F(WaveformAnalysis, EachModePutsItsChannelsAtTheirLevels) {
  struct Case {
    const char* what;
    Pixel pixel;
    uint32_t format;
    int32_t mode;
    int32_t colorSpace;
    std::array<double, 3> levels;
  };
  const Case cases[] = {
      {"grey luma", {0.5f, 0.5f, 0.5f, 1}, kEightBit, 0, 709, {0.5, 0.5, 0.5}},
      {"red in RGB", {1, 0, 0, 1}, kEightBit, 1, 709, {1, 0, 0}},
      {"grey in CbCr", {0.25f, 0.25f, 0.25f, 1}, kEightBit, 4, 709, {0.25, 0.5, 0.5}},
      {"red luma 601", {1, 0, 0, 1}, kFloat, 0, 601, {0.299, -1, -1}},
      {"red luma 709", {1, 0, 0, 1}, kFloat, 0, 709, {0.2126, -1, -1}},
      {"red luma 2020", {1, 0, 0, 1}, kFloat, 0, 2020, {0.2627, -1, -1}},
  };
  for (const Case& c : cases) {
    const Frame frame{6, 16, [&c](int, int) { return c.pixel; }, c.format};
    Settings settings;
    settings.mode = c.mode;
    settings.colorSpace = c.colorSpace;
    const Waveform waveform = analyse(frame, settings);
    ASSERT_EQ(waveform.height, 256) << c.what;
    const bool extended = c.format == kFloat;
    for (int x = 0; x < frame.width; ++x) {
      for (int channel = 0; channel < 3 && c.levels[channel] >= 0; ++channel) {
        expectOneRowNear(
            waveform, x, channel,
            expectedRow(c.levels[channel], 16, 256, extended ? -0.25 : 0, extended ? 1.25 : 1),
            std::string(c.what) + " channel " + std::to_string(channel));
      }
    }
  }
}

TEST_F(WaveformAnalysis, HorizontalRampLightsTheRowOfEachColumnsValue) {
  const Frame ramp{16, 8, [](int x, int) {
                     const float v = x / 15.0f;
                     return Pixel{v, v, v, 1};
                   }};
  const Waveform waveform = analyse(ramp, {});
  for (int x = 0; x < ramp.width; ++x) {
    expectOneRowNear(waveform, x, 1, expectedRow(x / 15.0, 8, 256), "ramp");
  }
}

TEST_F(WaveformAnalysis, TransparentFrameLeavesTheTextureCleared) {
  const Frame clear{8, 8, [](int, int) { return Pixel{0, 0, 0, 0}; }};
  for (const int32_t mode : {0, 1, 4, 8}) {
    Settings settings;
    settings.mode = mode;
    const Waveform waveform = analyse(clear, settings);
    for (const float value : waveform.values) {
      ASSERT_EQ(value, 0.0f) << "mode " << mode;
    }
  }
}

TEST_F(WaveformAnalysis, FloatLayerSpansMinusAQuarterToOneAndAQuarter) {
  const Frame extremes{2, 300,
                       [](int x, int) {
                         const float v = x == 0 ? -0.25f : 1.25f;
                         return Pixel{v, v, v, 1};
                       },
                       kFloat};
  const Waveform waveform = analyse(extremes, {});
  ASSERT_EQ(waveform.height, 300);
  EXPECT_EQ(waveform.litRows(0, 0), std::vector<int>{0});
  EXPECT_EQ(waveform.litRows(1, 0), std::vector<int>{299});
  EXPECT_EQ(waveformTextureHeight(GL_RGBA, 1080), 256u);
  EXPECT_EQ(waveformTextureHeight(GL_RGBA32F, 1080), 1080u);
  EXPECT_EQ(waveformTextureHeight(GL_RGBA32F, 100), 256u);
}

TEST_F(WaveformAnalysis, StencilCapsHowBrightAColumnOfIdenticalPixelsGets) {
  EXPECT_EQ(saturationCap(pointIntensity(1.0f, 1080, waveformValueRange(GL_RGBA32F), 1080)), 15);
  EXPECT_EQ(saturationCap(pointIntensity(0.1f, 1080, waveformValueRange(GL_RGBA32F), 1080)), 100);
  // 64 identical pixels per column of a float layer at a low brightness: intensity
  // 0.1 x (256 / 1.5) / 64 x 0.25 = 1 / 15, so n = 15 and Luminance accepts 3n + 1 = 46 points
  // per output pixel.
  const Frame flat{4, 64, [](int, int) { return Pixel{0.5f, 0.5f, 0.5f, 1}; }, kFloat};
  Settings dim;
  dim.brightness = 0.25f;
  const Waveform waveform = analyse(flat, dim);
  const std::vector<int> lit = waveform.litRows(0, 0);
  ASSERT_EQ(lit.size(), 1u);
  EXPECT_NEAR(waveform.at(0, lit[0], 0), 46.0f / 15.0f, 1e-4);
  EXPECT_EQ(waveform.at(0, lit[0], 3), 1.0f);  // alpha keeps its largest value
}

TEST_F(WaveformAnalysis, InstancedAndPerColumnDrawingAgree) {
  const Frame busy{
      24, 12, [](int x, int y) {
        return Pixel{(x * 7 % 11) / 10.0f, (y * 3 % 7) / 6.0f, ((x + y) % 5) / 4.0f, 1};
      }};
  for (const int32_t mode : {0, 1, 4}) {
    Settings instanced;
    instanced.mode = mode;
    Settings perColumn = instanced;
    perColumn.instanced = false;
    EXPECT_EQ(analyse(busy, instanced).values, analyse(busy, perColumn).values) << mode;
  }
}

TEST_F(WaveformAnalysis, ClipPointsInEitherOrderGiveTheSameWaveform) {
  const Frame busy{32, 16, [](int x, int y) {
                     const float v = ((x * 5 + y * 3) % 17) / 16.0f;
                     return Pixel{v, v, v, 1};
                   }};
  Settings forward;
  forward.fullFrame = false;
  forward.clipStart = {-10, -4};
  forward.clipEnd = {6, 5};
  Settings backward = forward;
  std::swap(backward.clipStart, backward.clipEnd);
  const Waveform a = analyse(busy, forward);
  EXPECT_EQ(a.values, analyse(busy, backward).values);
  // Columns outside the clip stay dark.
  EXPECT_TRUE(a.litRows(0, 0).empty());
  EXPECT_FALSE(a.litRows(10, 0).empty());
}

TEST_F(WaveformAnalysis, DirectionNinetyDegreesTurnsLayerRowsIntoStretchedScopeColumns) {
  // Each layer row has its own value; turned by 90 degrees the rows run along the scope, and the
  // 8 rows are stretched over the 16-pixel width: row y lands on the edge between scope columns
  // 14 - 2y and 15 - 2y, and lights exactly one of them.
  const Frame rows{16, 8, [](int, int y) {
                     const float v = y / 7.0f;
                     return Pixel{v, v, v, 1};
                   }};
  Settings turned;
  turned.directionDegrees = 90.0f;
  const Waveform waveform = analyse(rows, turned);
  for (int y = 0; y < rows.height; ++y) {
    const int left = 14 - 2 * y;
    const bool leftLit = !waveform.litRows(left, 0).empty();
    const bool rightLit = !waveform.litRows(left + 1, 0).empty();
    ASSERT_NE(leftLit, rightLit) << "layer row " << y;
    expectOneRowNear(waveform, leftLit ? left : left + 1, 0, expectedRow(y / 7.0, 8, 256),
                     "turned");
  }
}

TEST_F(WaveformAnalysis, HalfDownsamplingSamplesEverySecondPixelWithLargerPoints) {
  const Frame columns{16, 8, [](int x, int) {
                        const float v = x / 15.0f;
                        return Pixel{v, v, v, 1};
                      }};
  Settings full;
  Settings half;
  half.downsample = 1;
  const Waveform fine = analyse(columns, full);
  const Waveform coarse = analyse(columns, half);
  for (int pair = 0; pair < 8; ++pair) {
    const std::vector<int> left = coarse.litRows(2 * pair, 0);
    // A 2-pixel point covers two rows of both columns of the pair.
    EXPECT_EQ(left.size(), 2u) << "pair " << pair;
    EXPECT_EQ(left, coarse.litRows(2 * pair + 1, 0)) << "pair " << pair;
    // It shows one of the pair's two values.
    const std::vector<int> even = fine.litRows(2 * pair, 0);
    const std::vector<int> odd = fine.litRows(2 * pair + 1, 0);
    ASSERT_FALSE(left.empty());
    const bool showsEven = std::find(left.begin(), left.end(), even[0]) != left.end();
    const bool showsOdd = std::find(left.begin(), left.end(), odd[0]) != left.end();
    EXPECT_TRUE(showsEven || showsOdd) << "pair " << pair;
  }
}

TEST_F(WaveformAnalysis, LinearInputIsEncodedToSrgbBeforeMeasuring) {
  // 0.214041 in linear light is 0.5 after the sRGB curve.
  const Frame linearGrey{4, 8,
                         [](int, int) {
                           return Pixel{0.214041f, 0.214041f, 0.214041f, 1};
                         },
                         kFloat};
  Settings linear;
  linear.linearInput = true;
  const Waveform encoded = analyse(linearGrey, linear);
  const Waveform raw = analyse(linearGrey, {});
  for (int x = 0; x < 4; ++x) {
    expectOneRowNear(encoded, x, 0, expectedRow(0.5, 8, 256, -0.25, 1.25), "encoded");
    expectOneRowNear(raw, x, 0, expectedRow(0.214041, 8, 256, -0.25, 1.25), "raw");
  }
}

}  // namespace
}  // namespace waveform_test

namespace waveform_test {
namespace {

// The GL state a host cares about, as one comparable record.
struct HostState {
  GLint blend, blendSource, stencilTest, program, colourAttachment, viewport[4];
  bool operator==(const HostState& o) const {
    return blend == o.blend && blendSource == o.blendSource && stencilTest == o.stencilTest &&
           program == o.program && colourAttachment == o.colourAttachment &&
           std::equal(viewport, viewport + 4, o.viewport);
  }
};

HostState hostState() {
  HostState state{};
  state.blend = glIsEnabled(GL_BLEND);
  glGetIntegerv(GL_BLEND_SRC_RGB, &state.blendSource);
  state.stencilTest = glIsEnabled(GL_STENCIL_TEST);
  glGetIntegerv(GL_CURRENT_PROGRAM, &state.program);
  glGetFramebufferAttachmentParameteriv(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0,
                                        GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME,
                                        &state.colourAttachment);
  glGetIntegerv(GL_VIEWPORT, state.viewport);
  return state;
}

// A host callback failing half-way through the pass leaves the host's state as it was.
TEST_F(WaveformAnalysis, FailingHostCallbackLeavesTheHostsStateAsItWas) {
  const auto hostTarget = Plugin::gl::Texture::create();
  hostTarget->define(8, 8, GL_RGBA32F, 1.0f);
  Plugin::gl::EffectData hostPrograms;
  ensureAnalysisPrograms(hostPrograms, false);
  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, hostTarget->name(),
                         0);
  glViewport(1, 2, 3, 4);
  glEnable(GL_BLEND);
  glBlendFunc(GL_SRC_ALPHA, GL_ONE);
  hostPrograms.useProgram(kWaveformProgram);
  const HostState before = hostState();

  const auto layer = Plugin::gl::Texture::create();
  layer->define(4, 4, GL_RGBA8, 1.0f);
  AnalysisInput input;
  input.layer.name = layer->name();
  input.layer.width = input.layer.height = 4;
  input.target = Plugin::gl::Texture::create();
  input.target->define(4, 256, GL_RGBA32F, 1.0f);
  input.fullFrame = true;
  input.frameWidth = input.frameHeight = 4;
  input.projection = input.modelView = Plugin::gl::kIdentityMatrix.data();
  GlTestHost failing;
  failing.failBuffers = true;
  Plugin::gl::EffectData programs;
  ensureAnalysisPrograms(programs, false);
  Plugin::gl::StencilBufferList pool;
  std::recursive_mutex lock;
  hostPrograms.useProgram(kWaveformProgram);
  EXPECT_THROW(analyseLayer(failing.calls(), {programs, pool, lock, true}, Settings(), input),
               std::runtime_error);
  EXPECT_TRUE(hostState() == before);
  glUseProgram(0);
  glDisable(GL_BLEND);
  glBlendFunc(GL_ONE, GL_ZERO);
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
}

}  // namespace
}  // namespace waveform_test
