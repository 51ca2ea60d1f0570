// A waveform published on the render thread and taken on the interface thread: the other
// context waits for the commands that drew it, and sees every texel.
#include <gtest/gtest.h>

#include <vector>

#include "gl/framebuffer.h"
#include "gl_thread.h"
#include "plugin/scopes_shared_data.h"
#include "plugin/waveform_results.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;

TEST(PublishedResults, InterfaceThreadReadsWhatTheRenderThreadDrew) {
  vtpl::host::GlThread render("render");
  vtpl::host::GlThread interface("interface", &render);
  ScopesSharedData shared;
  for (int frame = 0; frame < 3; ++frame) {
    const float level = 0.25f * static_cast<float>(frame + 1);
    render.run([&] {
      auto texture = Plugin::gl::Texture::create();
      texture->define(64, 32, GL_RGBA32F, 1.0f);
      const Plugin::gl::FBO framebuffer;
      glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
      glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture->name(),
                             0);
      glViewport(0, 0, 64, 32);
      glClearColor(level, 1.0f - level, 0.5f, 1.0f);
      glClear(GL_COLOR_BUFFER_BIT);
      glBindFramebuffer(GL_FRAMEBUFFER, 0);
      storeResult(shared, &ScopesSharedData::primary, texture, 640, 360);
    });
    std::vector<float> seen(4 * 64 * 32, -1.0f);
    interface.run([&] {
      const ScopeWaveforms waveforms = takePublishedWaveforms(&shared);
      ASSERT_NE(waveforms.primary.texture, nullptr);
      EXPECT_EQ(waveforms.primary.width, 640);
      EXPECT_EQ(waveforms.primary.texture->fence(), nullptr);  // waited for and deleted
      glBindTexture(GL_TEXTURE_2D, waveforms.primary.texture->name());
      glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, seen.data());
      glBindTexture(GL_TEXTURE_2D, 0);
    });
    for (size_t i = 0; i < seen.size(); i += 4) {
      ASSERT_EQ(seen[i], level) << "frame " << frame << " texel " << i / 4;
      ASSERT_EQ(seen[i + 1], 1.0f - level);
    }
  }
  render.run([&] { shared.primary = {}; });
}

}  // namespace
}  // namespace waveform_test
