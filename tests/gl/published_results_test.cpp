// A waveform analysed and published on the render thread, read on the interface thread.
#include <gtest/gtest.h>

#include <vector>

#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl_test_host.h"
#include "gl_thread.h"
#include "plugin/scopes_shared_data.h"
#include "plugin/waveform_results.h"
#include "scope/parameter_choices.h"
#include "scope/waveform_analysis.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;

std::vector<float> readTexture(const Plugin::gl::Texture& texture) {
  std::vector<float> values(4 * static_cast<size_t>(texture.width()) * texture.height());
  glBindTexture(GL_TEXTURE_2D, texture.name());
  glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, values.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return values;
}

TEST(PublishedResults, InterfaceThreadReadsWhatTheRenderThreadAnalysed) {
  vtpl::host::GlThread render("render");
  vtpl::host::GlThread interface("interface", &render);
  ScopesSharedData shared;
  std::vector<float> analysed;
  render.run([&] {
    constexpr int kWidth = 32, kHeight = 16;
    std::vector<float> pixels;
    for (int y = 0; y < kHeight; ++y) {
      for (int x = 0; x < kWidth; ++x) {
        const float v = static_cast<float>((x * 3 + y) % 11) / 10.0f;
        pixels.insert(pixels.end(), {v, v * 0.5f, 1 - v, 1});
      }
    }
    vtpl::HostTexture layer{};
    glGenTextures(1, &layer.name);
    glBindTexture(GL_TEXTURE_2D, layer.name);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, kWidth, kHeight, 0, GL_RGBA, GL_FLOAT,
                 pixels.data());
    layer.format = GL_RGBA32F;
    layer.width = layer.allocatedWidth = kWidth;
    layer.height = layer.allocatedHeight = kHeight;
    layer.uMax = layer.vMax = 1.0f;

    GlTestHost host;
    Plugin::gl::EffectData programs;
    ensureAnalysisPrograms(programs, false);
    Plugin::gl::StencilBufferList pool;
    std::recursive_mutex lock;
    const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(kWidth, kHeight);
    AnalysisInput input;
    input.layer = layer;
    input.target = Plugin::gl::Texture::create();
    input.target->define(kWidth, waveformTextureHeight(GL_RGBA32F, kHeight), GL_RGBA32F, 1.0f);
    input.fullFrame = true;
    input.frameWidth = kWidth;
    input.frameHeight = kHeight;
    input.projection = projection.data();
    input.modelView = Plugin::gl::kIdentityMatrix.data();
    const Plugin::gl::FBO framebuffer;
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
    glClearColor(0, 0, 0, 0);
    AnalysisSettings rgb;
    rgb.mode = kModeRGB;
    rgb.brightness = 1;
    analyseLayer(host.calls(), {programs, pool, lock, true}, rgb, input);
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    storeResult(shared, &ScopesSharedData::primary, input.target, kWidth, kHeight);
    analysed = readTexture(*input.target);
    glDeleteTextures(1, &layer.name);
  });
  std::vector<float> seen;
  interface.run([&] {
    std::shared_ptr<Plugin::gl::Texture> texture;
    {
      const std::lock_guard<std::mutex> guard(shared.lock);
      texture = shared.primary.texture;
      EXPECT_EQ(shared.primary.width, 32);
    }
    ASSERT_NE(texture, nullptr);
    ASSERT_NE(texture->fence(), nullptr);
    glWaitSync(texture->fence(), 0, GL_TIMEOUT_IGNORED);
    seen = readTexture(*texture);
  });
  ASSERT_FALSE(analysed.empty());
  EXPECT_EQ(seen, analysed);
  float total = 0;
  for (const float value : seen) {
    total += value;
  }
  EXPECT_GT(total, 0.0f);  // the waveform is not empty
  render.run([&] {
    const std::lock_guard<std::mutex> guard(shared.lock);
    shared.primary = {};
  });
}

}  // namespace
}  // namespace waveform_test
