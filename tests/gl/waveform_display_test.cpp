// The "copyWaveform" display program: what each display index makes of stored traces.
#include <gtest/gtest.h>

#include <array>
#include <vector>

#include "gl/framebuffer.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "scope/waveform_display.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;
using Pixel = std::array<float, 4>;

class WaveformDisplay : public GlTest {};

// Draws a waveform of `stored` texels, `storedHeight` rows of equal width, into a float target of
// its width and `shownHeight` rows, and reads it back (bottom row first).
std::vector<Pixel> display(const std::vector<Pixel>& stored, DisplayIndex index,
                           GLsizei storedHeight = 1, GLsizei shownHeight = 1) {
  const auto width = static_cast<GLsizei>(stored.size()) / storedHeight;
  GLuint textures[2] = {};
  glGenTextures(2, textures);
  glBindTexture(GL_TEXTURE_2D, textures[0]);
  glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, width, storedHeight, 0, GL_RGBA, GL_FLOAT,
               stored.data());
  glBindTexture(GL_TEXTURE_2D, textures[1]);
  glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, width, shownHeight, 0, GL_RGBA, GL_FLOAT, nullptr);
  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, textures[1], 0);
  glViewport(0, 0, width, shownHeight);

  GlTestHost host;
  Plugin::gl::EffectData programs;
  ensureWaveformDisplayPrograms(programs, false);
  const float w = static_cast<float>(width);
  const float h = static_cast<float>(shownHeight);
  const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(w, h);
  drawWaveformDisplay(host.calls(), programs, textures[0], {0, 0, w, h}, {}, index, projection,
                      Plugin::gl::kIdentityMatrix);

  std::vector<Pixel> shown(static_cast<size_t>(width) * shownHeight);
  glReadPixels(0, 0, width, shownHeight, GL_RGBA, GL_FLOAT, shown.data());
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  glDeleteTextures(2, textures);
  return shown;
}

void expectPixel(const Pixel& actual, const Pixel& expected, const std::string& where) {
  for (size_t c = 0; c < 4; ++c) {
    EXPECT_NEAR(actual[c], expected[c], 1e-4) << where << " channel " << c;
  }
}

const std::vector<Pixel> kStored = {
    {0, 0, 0, 0}, {0.2f, 0.4f, 0.6f, 1}, {0.9f, 0.1f, 0.3f, 1}, {1.5f, 0.25f, 0.5f, 1}};

TEST_F(WaveformDisplay, ChannelSelectionsAndGreys) {
  const auto withAlpha = [](float r, float g, float b) {
    return Pixel{r, g, b, std::min(std::max(r, std::max(g, b)), 1.0f)};
  };
  const std::vector<std::pair<int32_t, std::vector<Pixel>>> cases = {
      {0,
       {withAlpha(0, 0, 0), withAlpha(0.2f, 0.4f, 0.6f), withAlpha(0.9f, 0.1f, 0.3f),
        withAlpha(1.5f, 0.25f, 0.5f)}},
      {1,
       {withAlpha(0, 0, 0), withAlpha(0.2f, 0.2f, 0.2f), withAlpha(0.9f, 0.9f, 0.9f),
        withAlpha(1.5f, 1.5f, 1.5f)}},
      {2,
       {withAlpha(0, 0, 0), withAlpha(0.4f, 0.4f, 0.4f), withAlpha(0.1f, 0.1f, 0.1f),
        withAlpha(0.25f, 0.25f, 0.25f)}},
      {3,
       {withAlpha(0, 0, 0), withAlpha(0.6f, 0.6f, 0.6f), withAlpha(0.3f, 0.3f, 0.3f),
        withAlpha(0.5f, 0.5f, 0.5f)}},
      // Cr (stored in blue) shows in red, Cb (stored in green) in blue.
      {4,
       {withAlpha(0, 0, 0), withAlpha(0.6f, 0, 0.4f), withAlpha(0.3f, 0, 0.1f),
        withAlpha(0.5f, 0, 0.25f)}},
      {5,
       {withAlpha(0, 0, 0), withAlpha(0.39996f, 0.39996f, 0.39996f),
        withAlpha(0.43329f, 0.43329f, 0.43329f), withAlpha(0.74995f, 0.74995f, 0.74995f)}},
      {9,
       {withAlpha(0, 0, 0), withAlpha(0.2f, 0.4f, 0.6f), withAlpha(0.9f, 0.1f, 0.3f),
        withAlpha(1.5f, 0.25f, 0.5f)}},
  };
  for (const auto& [index, expected] : cases) {
    const std::vector<Pixel> shown = display(kStored, static_cast<DisplayIndex>(index));
    for (size_t i = 0; i < expected.size(); ++i) {
      expectPixel(shown[i], expected[i],
                  "index " + std::to_string(index) + " texel " + std::to_string(i));
    }
  }
}

TEST_F(WaveformDisplay, TintedTracesFadeToGreyAndSaturateToWhite) {
  const std::vector<Pixel> stored = {{0, 0, 0, 0}, {0.3f, 0.3f, 0.3f, 1}, {1, 1, 1, 1}};
  for (const auto index : {kDisplayRedTint, kDisplayGreenTint, kDisplayBlueTint}) {
    const std::vector<Pixel> shown = display(stored, index);
    const size_t own = static_cast<size_t>(index - kDisplayRedTint);
    const std::string where = "index " + std::to_string(index);
    expectPixel(shown[0], {0, 0, 0, 0}, where + " empty");
    expectPixel(shown[2], {1, 1, 1, 1}, where + " saturated");
    // A faint trace keeps its own hue: its channel is the brightest.
    for (size_t c = 0; c < 3; ++c) {
      if (c != own) {
        EXPECT_GT(shown[1][own], shown[1][c] + 0.05f) << where << " channel " << c;
      }
    }
    EXPECT_NEAR(shown[1][3], std::max(shown[1][0], std::max(shown[1][1], shown[1][2])), 1e-6)
        << where;
  }
}

TEST_F(WaveformDisplay, ThinTracesSurviveAPanelSmallerThanTheWaveform) {
  // 64 rows shown in 8: one lit row in each column, each in a different place within the eight
  // rows that share a pixel. Every trace keeps its full brightness in the pixel that covers it.
  const std::vector<GLsizei> litRows = {37, 40, 47, 0};
  std::vector<Pixel> stored(4 * 64, Pixel{});
  for (size_t column = 0; column < litRows.size(); ++column) {
    stored[static_cast<size_t>(litRows[column]) * 4 + column] = {0.6f, 0.6f, 0.6f, 1};
  }
  const std::vector<Pixel> shown = display(stored, kDisplayAsStored, 64, 8);
  for (size_t column = 0; column < litRows.size(); ++column) {
    for (GLsizei row = 0; row < 8; ++row) {
      const float expected = row == litRows[column] / 8 ? 0.6f : 0.0f;
      EXPECT_NEAR(shown[static_cast<size_t>(row) * 4 + column][0], expected, 1e-6)
          << "column " << column << " row " << row;
    }
  }
}

}  // namespace
}  // namespace waveform_test
