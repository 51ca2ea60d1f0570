// The scope picture drawn from waveform textures: layouts, overlay routing, the panel and its
// margins, the guidelines and the colour-bar markers, read back from a float target.
#include <gtest/gtest.h>

#include <array>
#include <functional>
#include <string>
#include <vector>

#include "gl/framebuffer.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "scope/blend_shader.h"
#include "scope/graticule_drawing.h"
#include "scope/parameter_choices.h"
#include "scope/scope_composition.h"
#include "scope/waveform_display.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;
using Pixel = std::array<float, 4>;

class ScopeComposition : public GlTest {};

// A waveform texture of `format` whose texels are `lit` where the predicate holds, else empty.
WaveformResult waveform(GLenum format, GLuint width, GLuint height, const Pixel& lit,
                        const std::function<bool(GLuint, GLuint)>& where = nullptr,
                        int32_t frameWidth = 1280, int32_t frameHeight = 720) {
  auto texture = Plugin::gl::Texture::create();
  texture->define(width, height, format, 1.0f);
  std::vector<Pixel> texels(static_cast<size_t>(width) * height);
  for (GLuint y = 0; y < height; ++y) {
    for (GLuint x = 0; x < width; ++x) {
      texels[y * width + x] = !where || where(x, y) ? lit : Pixel{};
    }
  }
  glBindTexture(GL_TEXTURE_2D, texture->name());
  glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, static_cast<GLsizei>(width), static_cast<GLsizei>(height),
                  GL_RGBA, GL_FLOAT, texels.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return {texture, frameWidth, frameHeight};
}

const Pixel kWhite = {1, 1, 1, 1};

// The scope drawn into a float target of its size; pixels bottom row first.
class DrawnScope {
 public:
  DrawnScope(int width, int height) : width_(width), height_(height) {}

  std::vector<Pixel> draw(GlTestHost& host, const ScopeWaveforms& waveforms,
                          const ScopeDrawing& drawing) {
    GLuint target = 0;
    glGenTextures(1, &target);
    glBindTexture(GL_TEXTURE_2D, target);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, width_, height_, 0, GL_RGBA, GL_FLOAT, nullptr);
    const Plugin::gl::FBO framebuffer;
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target, 0);
    glViewport(0, 0, width_, height_);
    Plugin::gl::EffectData programs;
    ensureWaveformDisplayPrograms(programs, false);
    ensureGuidelineProgram(programs, false);
    drawScope(host.calls(), programs, waveforms, drawing);
    pixels_.assign(static_cast<size_t>(width_) * height_, Pixel{});
    glReadPixels(0, 0, width_, height_, GL_RGBA, GL_FLOAT, pixels_.data());
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    glDeleteTextures(1, &target);
    return pixels_;
  }
  const Pixel& at(int x, int y) const { return pixels_[static_cast<size_t>(y) * width_ + x]; }

 private:
  int width_, height_;
  std::vector<Pixel> pixels_;
};

ScopeDrawing blackScope(float width, float height) {
  ScopeDrawing drawing;
  drawing.background = {0, 0, 0, 1};
  drawing.width = width;
  drawing.height = height;
  return drawing;
}

void expectPixel(const Pixel& actual, const Pixel& expected, const std::string& where,
                 float tolerance = 1e-5f) {
  for (size_t c = 0; c < 4; ++c) {
    EXPECT_NEAR(actual[c], expected[c], tolerance) << where << " channel " << c;
  }
}

TEST_F(ScopeComposition, OverlayRoutesEachScopeIntoItsChannels) {
  // The primary's traces are in the left half of its waveform, the comparison's in the right.
  const Pixel grey = {0.5f, 0.5f, 0.5f, 1};
  ScopeWaveforms waveforms;
  waveforms.primary = waveform(GL_RGBA32F, 8, 8, grey, [](GLuint x, GLuint) { return x < 4; });
  waveforms.comparison = waveform(GL_RGBA32F, 8, 8, grey, [](GLuint x, GLuint) { return x >= 4; });
  struct Case {
    int32_t channels;
    Pixel left, right;
  };
  const Case cases[] = {
      {0, {0.5f, 0, 0, 1}, {0, 0.5f, 0, 1}},  // RG
      {3, {0, 0.5f, 0, 1}, {0, 0, 0.5f, 1}},  // GB
      {5, {0, 0, 0.5f, 1}, {0, 0.5f, 0, 1}},  // BG: primary blue, comparison green
  };
  for (const Case& c : cases) {
    GlTestHost host;
    ScopeDrawing drawing = blackScope(32, 16);
    drawing.composition.comparison.type = kComparisonOverlay;
    drawing.composition.overlayChannels = c.channels;
    drawing.composition.mode = kModeRGB;  // grey traces when overlaid
    DrawnScope scope(32, 16);
    scope.draw(host, waveforms, drawing);
    const std::string what = "channels " + std::to_string(c.channels);
    expectPixel(scope.at(4, 8), c.left, what + " left", 1e-4f);
    expectPixel(scope.at(27, 8), c.right, what + " right", 1e-4f);
  }
}

TEST_F(ScopeComposition, SideBySideAndSingleScopeLayouts) {
  const WaveformResult primary = waveform(GL_RGBA32F, 8, 8, {0.25f, 0.25f, 0.25f, 1});
  const WaveformResult comparison = waveform(GL_RGBA32F, 8, 8, {0.75f, 0.75f, 0.75f, 1});
  struct Case {
    const char* what;
    bool withComparison;
    int32_t type;
    bool show;
    float left, right;  // the grey level shown in each half of the panel
  };
  const Case cases[] = {
      {"side by side", true, 0, true, 0.25f, 0.75f},
      {"side by side, no comparison", false, 0, true, 0.25f, 0.25f},
      {"single scope", true, 2, false, 0.25f, 0.25f},
      {"single scope, comparison on", true, 2, true, 0.75f, 0.75f},
  };
  for (const Case& c : cases) {
    GlTestHost host;
    ScopeDrawing drawing = blackScope(40, 10);
    drawing.composition.comparison = {c.type, c.show};
    ScopeWaveforms waveforms;
    waveforms.primary = primary;
    if (c.withComparison) {
      waveforms.comparison = comparison;
    }
    DrawnScope scope(40, 10);
    scope.draw(host, waveforms, drawing);
    for (const int x : {0, 10, 19}) {
      expectPixel(scope.at(x, 5), {c.left, c.left, c.left, 1}, std::string(c.what) + " left");
    }
    for (const int x : {20, 30, 39}) {
      expectPixel(scope.at(x, 5), {c.right, c.right, c.right, 1}, std::string(c.what) + " right");
    }
  }
}

TEST_F(ScopeComposition, ControlPanelIsBlackBetweenTheMarginsOfAnEightBitScope) {
  GlTestHost host;
  ScopeWaveforms waveforms;
  waveforms.primary = waveform(GL_RGBA, 4, 16, {});
  ScopeDrawing drawing;
  drawing.background = {0.2f, 0.4f, 0.6f, 1};
  drawing.width = 20;
  drawing.height = 60;
  drawing.labels.scaleY = 1.5f;  // margins of 15 pixels
  drawing.fillPanel = true;
  DrawnScope scope(20, 60);
  scope.draw(host, waveforms, drawing);
  for (int y = 0; y < 60; ++y) {
    const bool inPanel = y >= 15 && y < 45;
    const Pixel expected = inPanel ? Pixel{0, 0, 0, 1} : Pixel{0.2f, 0.4f, 0.6f, 1};
    expectPixel(scope.at(10, y), expected, "row " + std::to_string(y));
  }
  // A float waveform has no margins: the panel fills the height.
  waveforms.primary = waveform(GL_RGBA32F, 4, 16, {});
  scope.draw(host, waveforms, drawing);
  expectPixel(scope.at(10, 0), {0, 0, 0, 1}, "float bottom row");
  expectPixel(scope.at(10, 59), {0, 0, 0, 1}, "float top row");
}

TEST_F(ScopeComposition, BackgroundIsPremultipliedAndTheWaveformScreenedOverIt) {
  GlTestHost host;
  ScopeWaveforms waveforms;
  waveforms.primary =
      waveform(GL_RGBA32F, 4, 4, {0.5f, 0.5f, 0.5f, 1}, [](GLuint x, GLuint) { return x >= 2; });
  ScopeDrawing drawing;
  drawing.background = {0.4f, 0.2f, 1.0f, 0.5f};
  drawing.width = 16;
  drawing.height = 8;
  DrawnScope scope(16, 8);
  scope.draw(host, waveforms, drawing);
  expectPixel(scope.at(1, 4), {0.2f, 0.1f, 0.5f, 0.5f}, "background");
  // Screen: source x (1 - target) + target, alpha likewise; the trace's alpha is its brightest
  // channel.
  expectPixel(scope.at(14, 4),
              {0.5f * 0.8f + 0.2f, 0.5f * 0.9f + 0.1f, 0.5f * 0.5f + 0.5f, 0.5f * 0.5f + 0.5f},
              "trace");
}

// Rows of column `x` holding more than the background.
std::vector<int> litRows(const DrawnScope& scope, int x, int height) {
  std::vector<int> rows;
  for (int y = 0; y < height; ++y) {
    if (scope.at(x, y)[0] > 1e-4f || scope.at(x, y)[1] > 1e-4f || scope.at(x, y)[2] > 1e-4f) {
      rows.push_back(y);
    }
  }
  return rows;
}

TEST_F(ScopeComposition, GuidelinesAreTwoPixelLinesAtTheirLevels) {
  GlTestHost host;
  ScopeWaveforms waveforms;
  waveforms.primary = waveform(GL_RGBA, 4, 16, {});
  ScopeDrawing drawing = blackScope(30, 60);  // margins of 10: drawing height 40
  drawing.showGuidelines = true;
  DrawnScope scope(30, 60);
  scope.draw(host, waveforms, drawing);
  // Lines at 100, 50 and 0 IRE: heights 40, 20 and 0 above the bottom margin, each lighting the
  // two rows whose centres lie half a pixel from it.
  const std::vector<int> expected = {9, 10, 29, 30, 49, 50};
  for (const int x : {0, 15, 29}) {
    EXPECT_EQ(litRows(scope, x, 60), expected) << "column " << x;
  }
  expectPixel(scope.at(5, 29), {0.125f, 0.125f, 0.125f, 1}, "half coverage");
  drawing.showGuidelines = false;
  scope.draw(host, waveforms, drawing);
  EXPECT_TRUE(litRows(scope, 15, 60).empty());
}

TEST_F(ScopeComposition, ColourBarMarkersOnlyInLuminanceOncePerHalf) {
  // 709 yellow at 75 %: luma 0.69494, 27.8 pixels up a drawing height of 40, so its brightest
  // row is the one centred 27.5 above the bottom margin of 10.
  const int yellowRow = 37;
  ScopeWaveforms waveforms;
  waveforms.primary = waveform(GL_RGBA, 4, 16, {});
  waveforms.comparison = waveform(GL_RGBA, 4, 16, {});
  struct Case {
    int32_t mode;
    int32_t type;
    std::vector<int> yellowColumns;  // columns where the yellow marker is expected
    std::vector<int> darkColumns;
  };
  const Case cases[] = {
      {0, 2, {20, 25, 29}, {19, 30}},             // one scope over 90 pixels: bars 10 wide
      {0, 0, {10, 14, 55, 59}, {9, 15, 50, 54}},  // one set per half: bars 5 wide
      {1, 2, {}, {20, 25, 29}},                   // RGB: no markers
  };
  for (const Case& c : cases) {
    GlTestHost host;
    ScopeDrawing drawing = blackScope(90, 60);
    drawing.composition.mode = c.mode;
    drawing.composition.comparison.type = c.type;
    drawing.composition.colorSpace = kRec709;
    drawing.showColourBars = true;
    DrawnScope scope(90, 60);
    scope.draw(host, waveforms, drawing);
    const std::string what = "mode " + std::to_string(c.mode) + ", type " + std::to_string(c.type);
    for (const int x : c.yellowColumns) {
      const Pixel& p = scope.at(x, yellowRow);
      EXPECT_GT(p[0], 0.4f) << what << " column " << x;
      EXPECT_NEAR(p[0], p[1], 1e-5) << what << " column " << x;
      EXPECT_NEAR(p[2], 0, 1e-5) << what << " column " << x;
    }
    for (const int x : c.darkColumns) {
      const Pixel& p = scope.at(x, yellowRow);
      EXPECT_FALSE(p[0] > 0.01f && p[2] < 1e-5f) << what << " column " << x << " is yellow";
    }
  }
}

}  // namespace
}  // namespace waveform_test
