// A texture produced and fenced on the render thread, read on the interface thread.
#include <gtest/gtest.h>

#include <memory>
#include <vector>

#include "gl/framebuffer.h"
#include "gl/texture.h"
#include "gl_thread.h"

namespace waveform_test {
namespace {

using Plugin::gl::Texture;

TEST(Fence, TextureFencedOnOneContextReadsCorrectlyOnTheOther) {
  vtpl::host::GlThread render("render");
  vtpl::host::GlThread interface("interface", &render);
  for (int frame = 0; frame < 4; ++frame) {
    const float level = 0.125f * (frame + 1);
    std::shared_ptr<Texture> texture;
    render.run([&] {
      texture = Texture::create();
      texture->define(64, 32, GL_RGBA32F, 1.0f);
      const Plugin::gl::FBO framebuffer;
      glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
      glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture->name(),
                             0);
      glViewport(0, 0, 64, 32);
      glClearColor(level, 1.0f - level, 0.5f, 1.0f);
      glClear(GL_COLOR_BUFFER_BIT);
      glBindFramebuffer(GL_FRAMEBUFFER, 0);
      texture->placeFence();
    });
    std::vector<float> pixels(4 * 64 * 32, -1.0f);
    interface.run([&] {
      glWaitSync(texture->fence(), 0, GL_TIMEOUT_IGNORED);
      glBindTexture(GL_TEXTURE_2D, texture->name());
      glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, pixels.data());
      glBindTexture(GL_TEXTURE_2D, 0);
    });
    for (size_t i = 0; i < pixels.size(); i += 4) {
      ASSERT_EQ(pixels[i], level) << "frame " << frame << " pixel " << i / 4;
      ASSERT_EQ(pixels[i + 1], 1.0f - level);
      ASSERT_EQ(pixels[i + 3], 1.0f);
    }
    render.run([&] { texture.reset(); });
  }
}

TEST(Fence, GlThreadRethrowsWhatItsTaskThrows) {
  vtpl::host::GlThread thread("render");
  EXPECT_THROW(thread.run([] { throw std::runtime_error("task failed"); }), std::runtime_error);
  bool ran = false;
  thread.run([&] { ran = vtpl::host::GlThread::current() == &thread; });
  EXPECT_TRUE(ran);
  EXPECT_EQ(vtpl::host::GlThread::current(), nullptr);
}

}  // namespace
}  // namespace waveform_test
