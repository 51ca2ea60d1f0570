// The scope rendered into the layer through the real blend program: where it lands, mirroring,
// the smallest area, padded host allocations, and what a transparent scope leaves of the layer.
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <vector>

#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl/texture_units.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "scope/blend_shader.h"
#include "scope/graticule_drawing.h"
#include "scope/parameter_choices.h"
#include "scope/render_to_layer.h"
#include "scope/waveform_display.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;
using Pixel = std::array<float, 4>;

class RenderToLayer : public GlTest {};

constexpr int kFrameWidth = 64;
constexpr int kFrameHeight = 36;

// A float layer texture holding `pixels` (bottom row first) in storage of at least its size.
vtpl::HostTexture layerTexture(const std::vector<Pixel>& pixels, uint32_t allocatedWidth,
                               uint32_t allocatedHeight) {
  vtpl::HostTexture texture{};
  texture.format = GL_RGBA32F;
  texture.pixelType = GL_FLOAT;
  texture.width = kFrameWidth;
  texture.height = kFrameHeight;
  texture.allocatedWidth = allocatedWidth;
  texture.allocatedHeight = allocatedHeight;
  texture.uMax = static_cast<float>(kFrameWidth) / allocatedWidth;
  texture.vMax = static_cast<float>(kFrameHeight) / allocatedHeight;
  texture.factor1 = texture.factor2 = 1;
  glGenTextures(1, &texture.name);
  glBindTexture(GL_TEXTURE_2D, texture.name);
  glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, static_cast<GLsizei>(allocatedWidth),
               static_cast<GLsizei>(allocatedHeight), 0, GL_RGBA, GL_FLOAT, nullptr);
  glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, kFrameWidth, kFrameHeight, GL_RGBA, GL_FLOAT,
                  pixels.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return texture;
}

// Every pixel different, to show where the layer is sampled.
std::vector<Pixel> gradientLayer() {
  std::vector<Pixel> pixels;
  for (int y = 0; y < kFrameHeight; ++y) {
    for (int x = 0; x < kFrameWidth; ++x) {
      pixels.push_back({x / 64.0f, y / 36.0f, 0.5f, 1});
    }
  }
  return pixels;
}

// A float waveform lit in its lower-left quarter only, so that mirroring shows.
WaveformResult cornerWaveform() {
  auto texture = Plugin::gl::Texture::create();
  texture->define(8, 8, GL_RGBA32F, 1.0f);
  std::vector<Pixel> texels(64, Pixel{});
  for (int y = 0; y < 4; ++y) {
    for (int x = 0; x < 4; ++x) {
      texels[y * 8 + x] = {1, 1, 1, 1};
    }
  }
  glBindTexture(GL_TEXTURE_2D, texture->name());
  glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, 8, 8, GL_RGBA, GL_FLOAT, texels.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return {texture, kFrameWidth, kFrameHeight};
}

struct Placement {
  std::array<float, 2> topLeft, bottomRight;
};

struct Rendered {
  std::vector<Pixel> pixels;  // bottom row first
  size_t allocations;
  size_t released;
  const Pixel& at(int x, int y) const { return pixels[static_cast<size_t>(y) * kFrameWidth + x]; }
};

// Renders the scope into an output prefilled with the layer, as the copy pass leaves it.
Rendered render(const Placement& placement, int32_t blend, float backgroundAlpha,
                const ScopeWaveforms& waveforms, uint32_t padTo = 0) {
  GlTestHost host;
  RenderToLayerSettings settings;
  settings.blend = blend;
  settings.topLeft = placement.topLeft;
  settings.bottomRight = placement.bottomRight;
  settings.backgroundColour = {0.2f, 0.3f, 0.4f};
  settings.backgroundAlpha = backgroundAlpha;
  host.allocatedWidth = padTo;
  host.allocatedHeight = padTo;
  const uint32_t allocated = padTo != 0 ? padTo : kFrameWidth;
  const std::vector<Pixel> layer = gradientLayer();
  vtpl::HostTexture source = layerTexture(layer, allocated, padTo != 0 ? padTo : kFrameHeight);
  vtpl::HostTexture destination = layerTexture(layer, kFrameWidth, kFrameHeight);

  const Plugin::gl::Matrix4 projection =
      Plugin::gl::orthographicMatrix(static_cast<float>(kFrameWidth), kFrameHeight);
  vtpl::HostRenderRecord frame{};
  frame.source = &source;
  frame.destination = &destination;
  frame.projection = projection.data();
  frame.modelView = Plugin::gl::kIdentityMatrix.data();
  frame.frameWidth = kFrameWidth;
  frame.frameHeight = kFrameHeight;
  host.record().messageRecord = &frame;

  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  Plugin::gl::attachTexture(destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  Plugin::gl::EffectData programs;
  ensureWaveformDisplayPrograms(programs, false);
  ensureGuidelineProgram(programs, false);
  ensureBlendProgram(programs, false);
  renderToLayer(host.calls(), programs, waveforms, frame, settings, CompositionSettings{});

  Rendered rendered;
  rendered.pixels.resize(static_cast<size_t>(kFrameWidth) * kFrameHeight);
  Plugin::gl::attachTexture(destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  glReadPixels(0, 0, kFrameWidth, kFrameHeight, GL_RGBA, GL_FLOAT, rendered.pixels.data());
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  glDeleteTextures(1, &source.name);
  glDeleteTextures(1, &destination.name);
  rendered.allocations = host.allocations.size();
  rendered.released = host.releasedLayers.size();
  return rendered;
}

void expectPixel(const Pixel& actual, const Pixel& expected, const std::string& where) {
  for (size_t c = 0; c < 4; ++c) {
    EXPECT_NEAR(actual[c], expected[c], 1e-5) << where << " channel " << c;
  }
}

const Placement kWholeFrame = {{-32, 18}, {32, -18}};

TEST_F(RenderToLayer, WholeFrameScopeWithItsWaveformInTheLowerLeft) {
  ScopeWaveforms waveforms;
  waveforms.primary = cornerWaveform();
  const Rendered normal = render(kWholeFrame, kBlendNormal, 1, waveforms);
  EXPECT_EQ(normal.allocations, 1u);
  EXPECT_EQ(normal.released, 1u);  // the working texture goes back to the host
  // An opaque scope replaces the layer: white where the waveform is lit, background elsewhere.
  expectPixel(normal.at(5, 5), {1, 1, 1, 1}, "lit corner");
  expectPixel(normal.at(58, 30), {0.2f, 0.3f, 0.4f, 1}, "background");
  expectPixel(normal.at(58, 5), {0.2f, 0.3f, 0.4f, 1}, "background lower right");
}

TEST_F(RenderToLayer, SwappedCornersMirrorBothAxes) {
  ScopeWaveforms waveforms;
  waveforms.primary = cornerWaveform();
  const Rendered normal = render(kWholeFrame, kBlendNormal, 1, waveforms);
  const Rendered mirrored = render({{32, -18}, {-32, 18}}, kBlendNormal, 1, waveforms);
  expectPixel(mirrored.at(58, 30), {1, 1, 1, 1}, "lit corner moved to the upper right");
  for (int y = 0; y < kFrameHeight; ++y) {
    for (int x = 0; x < kFrameWidth; ++x) {
      expectPixel(mirrored.at(kFrameWidth - 1 - x, kFrameHeight - 1 - y), normal.at(x, y),
                  "pixel " + std::to_string(x) + ", " + std::to_string(y));
    }
  }
}

TEST_F(RenderToLayer, PaddedAllocationsGiveTheSamePicture) {
  ScopeWaveforms waveforms;
  waveforms.primary = cornerWaveform();
  // A part of the frame, blended with a mode that reads the layer.
  const Placement part = {{-20, 10}, {21, -14}};
  const Rendered exact = render(part, kBlendDifference, 0.5f, waveforms);
  const Rendered padded = render(part, kBlendDifference, 0.5f, waveforms, 128);
  const std::vector<Pixel> layer = gradientLayer();
  EXPECT_NE(exact.pixels, layer);
  for (int y = 0; y < kFrameHeight; ++y) {
    for (int x = 0; x < kFrameWidth; ++x) {
      expectPixel(padded.at(x, y), exact.at(x, y),
                  "pixel " + std::to_string(x) + ", " + std::to_string(y));
    }
  }
}

TEST_F(RenderToLayer, TransparentBackgroundKeepsTheLayerOutsideTheTraces) {
  ScopeWaveforms waveforms;
  waveforms.primary = cornerWaveform();
  const std::vector<Pixel> layer = gradientLayer();
  const Rendered rendered = render(kWholeFrame, kBlendNormal, 0, waveforms);
  expectPixel(rendered.at(5, 5), {1, 1, 1, 1}, "trace");
  for (const auto& [x, y] : {std::pair{40, 5}, {5, 30}, {60, 33}, {45, 25}}) {
    expectPixel(rendered.at(x, y), layer[static_cast<size_t>(y) * kFrameWidth + x],
                "pixel " + std::to_string(x) + ", " + std::to_string(y));
  }
}

}  // namespace
}  // namespace waveform_test
