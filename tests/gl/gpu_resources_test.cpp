// Textures, stencil buffers, host-texture helpers and the copy pass on Mesa's software GL.
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <random>
#include <vector>

#include "gl/copy_pass.h"
#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl/stencil_buffer.h"
#include "gl/texture.h"
#include "gl/texture_units.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "host_access/working_texture.h"

namespace waveform_test {
namespace {

using namespace Plugin::gl;

class GpuResources : public GlTest {};

GLint levelParameter(GLuint texture, GLint level, GLenum parameter) {
  glBindTexture(GL_TEXTURE_2D, texture);
  GLint value = 0;
  glGetTexLevelParameteriv(GL_TEXTURE_2D, level, parameter, &value);
  glBindTexture(GL_TEXTURE_2D, 0);
  return value;
}

TEST_F(GpuResources, DefineChoosesThePixelFormatForColourAndDepth) {
  const auto colour = Texture::create();
  colour->define(6, 4, GL_RGBA32F, 0.5f);
  EXPECT_EQ(levelParameter(colour->name(), 0, GL_TEXTURE_INTERNAL_FORMAT), GL_RGBA32F);
  EXPECT_EQ(levelParameter(colour->name(), 0, GL_TEXTURE_WIDTH), 6);
  EXPECT_EQ(colour->scale(), 0.5f);

  // A depth format with a colour pixel format would be refused and leave no storage.
  const auto depth = Texture::create();
  depth->define(6, 4, GL_DEPTH_COMPONENT24, 1.0f);
  EXPECT_EQ(levelParameter(depth->name(), 0, GL_TEXTURE_WIDTH), 6);
  EXPECT_EQ(levelParameter(depth->name(), 0, GL_TEXTURE_INTERNAL_FORMAT), GL_DEPTH_COMPONENT24);
}

TEST_F(GpuResources, DefineWithTheSameSizeKeepsTheContentsAndStoresTheScale) {
  const auto texture = Texture::create();
  texture->define(2, 1, GL_RGBA32F, 1.0f);
  const float pixels[8] = {0.25f, 0.5f, 0.75f, 1.0f, 1, 0, 0, 1};
  glBindTexture(GL_TEXTURE_2D, texture->name());
  glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, 2, 1, GL_RGBA, GL_FLOAT, pixels);

  texture->define(2, 1, GL_RGBA32F, 3.0f);
  EXPECT_EQ(texture->scale(), 3.0f);
  float readBack[8] = {};
  glBindTexture(GL_TEXTURE_2D, texture->name());
  glGetTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, readBack);
  glBindTexture(GL_TEXTURE_2D, 0);
  EXPECT_TRUE(std::equal(std::begin(readBack), std::end(readBack), std::begin(pixels)));
}

TEST_F(GpuResources, FencedTextureIsDeletedWithItsLastReference) {
  GLuint name = 0;
  {
    const auto texture = Texture::create();
    texture->define(1, 1, GL_RGBA32F, 1.0f);
    texture->placeFence();
    texture->placeFence();  // the first fence is waited for and replaced
    ASSERT_NE(texture->fence(), nullptr);
    name = texture->name();
    EXPECT_TRUE(glIsTexture(name));
  }
  EXPECT_FALSE(glIsTexture(name));
}

TEST_F(GpuResources, StencilPoolReusesBuffersNobodyHolds) {
  StencilBufferList pool;
  std::recursive_mutex lock;
  auto first = acquireStencilBuffer(pool, lock);
  const auto second = acquireStencilBuffer(pool, lock);
  EXPECT_NE(first, second);
  StencilRenderBuffer* const firstBuffer = first.get();
  first.reset();
  EXPECT_EQ(acquireStencilBuffer(pool, lock).get(), firstBuffer);
  EXPECT_EQ(pool.size(), 2u);
}

TEST_F(GpuResources, AttachStencilSpecifiesStorageOnlyWhenTheSizeChanges) {
  const FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  StencilRenderBuffer buffer;
  attachStencil(buffer, 16, 8);
  GLint width = 0;
  glBindRenderbuffer(GL_RENDERBUFFER, buffer.name());
  glGetRenderbufferParameteriv(GL_RENDERBUFFER, GL_RENDERBUFFER_WIDTH, &width);
  EXPECT_EQ(width, 16);
  GLint attached = 0;
  glGetFramebufferAttachmentParameteriv(GL_FRAMEBUFFER, GL_STENCIL_ATTACHMENT,
                                        GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME, &attached);
  EXPECT_EQ(static_cast<GLuint>(attached), buffer.name());
  GLint drawFramebuffer = 0;
  glGetIntegerv(GL_DRAW_FRAMEBUFFER_BINDING, &drawFramebuffer);
  EXPECT_EQ(static_cast<GLuint>(drawFramebuffer), framebuffer.name());
  EXPECT_EQ(buffer.internalFormat, static_cast<GLenum>(GL_STENCIL_INDEX8));
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
}

TEST_F(GpuResources, AttachTextureSetsTheViewportOfTheLevel) {
  GLuint name = 0;
  glGenTextures(1, &name);
  glBindTexture(GL_TEXTURE_2D, name);
  glTexImage2D(GL_TEXTURE_2D, 2, GL_RGBA8, 480, 270, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
  const FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  vtpl::HostTexture texture{};
  texture.name = name;
  texture.width = 1920;
  texture.height = 1080;
  attachTexture(texture, 2, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  GLint viewport[4] = {};
  glGetIntegerv(GL_VIEWPORT, viewport);
  EXPECT_EQ(viewport[2], 480);
  EXPECT_EQ(viewport[3], 270);
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  glDeleteTextures(1, &name);
}

TEST_F(GpuResources, WorkingTextureRectangleAndFormat) {
  GlTestHost host;
  host.allocatedWidth = 2048;
  host.allocatedHeight = 2048;
  vtpl::HostTexture destination{};
  destination.format = GL_RGBA;
  destination.pixelType = GL_FLOAT;
  vtpl::HostRenderRecord render{};
  render.destination = &destination;
  host.record().messageRecord = &render;

  const Plugin::host::LayerHandle handle =
      Plugin::host::acquireWorkingTexture(host.calls(), 1920, 1080, true, true);
  const vtpl::HostTexture& texture = handle.texture();
  EXPECT_EQ(texture.uMax, 0.9375f);
  EXPECT_EQ(texture.vMax, 0.52734375f);
  EXPECT_EQ(texture.allocatedWidth, 2048u);
  EXPECT_NE(texture.name, 0u);
  ASSERT_EQ(host.allocations.size(), 1u);
  EXPECT_EQ(host.allocations[0].internalFormat, static_cast<uint32_t>(GL_RGBA32F));
  EXPECT_EQ(host.allocations[0].format, static_cast<uint32_t>(GL_RGBA));
  EXPECT_EQ(host.allocations[0].flag, 1);

  // Without the float request, or from a template that is not RGBA, the format is kept.
  host.allocatedWidth = host.allocatedHeight = 0;
  Plugin::host::acquireWorkingTexture(host.calls(), 8, 8, false, false);
  destination.format = GL_RGBA16F;
  Plugin::host::acquireWorkingTexture(host.calls(), 8, 8, true, false);
  EXPECT_EQ(host.allocations[1].internalFormat, static_cast<uint32_t>(GL_RGBA));
  EXPECT_EQ(host.allocations[2].internalFormat, static_cast<uint32_t>(GL_RGBA16F));
}

TEST_F(GpuResources, MultiplyMatricesAppliesTheFirstArgumentFirst) {
  Matrix4 translate = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 3, 0, 0, 1};
  Matrix4 scale = {2, 0, 0, 0, 0, 2, 0, 0, 0, 0, 2, 0, 0, 0, 0, 1};
  // Scale after translation moves the origin to 2 x 3; the other order leaves it at 3.
  EXPECT_EQ(multiplyMatrices(translate, scale)[12], 6.0f);
  EXPECT_EQ(multiplyMatrices(scale, translate)[12], 3.0f);
  EXPECT_EQ(multiplyMatrices(translate, scale)[0], 2.0f);
}

// ---- the copy pass ---------------------------------------------------------------------

struct Frame {
  GLsizei width, height;
};

// A host texture of the frame's size inside storage of `allocated` size, holding `pixels`.
template <typename Pixel>
vtpl::HostTexture uploadTexture(Frame frame, Frame allocated, GLenum internalFormat, GLenum type,
                                const std::vector<Pixel>& pixels) {
  vtpl::HostTexture texture{};
  glGenTextures(1, &texture.name);
  glBindTexture(GL_TEXTURE_2D, texture.name);
  glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(internalFormat), allocated.width,
               allocated.height, 0, GL_RGBA, type, nullptr);
  if (!pixels.empty()) {
    glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, frame.width, frame.height, GL_RGBA, type,
                    pixels.data());
  }
  glBindTexture(GL_TEXTURE_2D, 0);
  texture.format = internalFormat == GL_RGBA32F ? GL_RGBA32F : GL_RGBA;
  texture.pixelType = type;
  texture.allocatedWidth = static_cast<uint32_t>(allocated.width);
  texture.allocatedHeight = static_cast<uint32_t>(allocated.height);
  texture.width = static_cast<uint32_t>(frame.width);
  texture.height = static_cast<uint32_t>(frame.height);
  texture.uMax = static_cast<float>(frame.width) / allocated.width;
  texture.vMax = static_cast<float>(frame.height) / allocated.height;
  texture.factor1 = texture.factor2 = 1.0f;
  return texture;
}

template <typename Pixel>
std::vector<Pixel> readTexture(const vtpl::HostTexture& texture, GLenum type) {
  std::vector<Pixel> pixels(4 * static_cast<size_t>(texture.width) * texture.height);
  const FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture.name, 0);
  glPixelStorei(GL_PACK_ALIGNMENT, 1);
  glReadPixels(0, 0, static_cast<GLsizei>(texture.width), static_cast<GLsizei>(texture.height),
               GL_RGBA, type, pixels.data());
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  return pixels;
}

// Copies `source` to a fresh output of the frame's size, as a render of that frame would.
struct CopyRun {
  GlTestHost host;
  EffectData programs;
  vtpl::HostTexture output{};
  GLint currentProgram = -1;
  GLint boundOnUnit0 = 0;
  GLint attachedAfter = 0;

  CopyRun(vtpl::HostTexture source, Frame frame, GLenum outputFormat, GLenum type) {
    ensureCopyAndClearPrograms(programs, false);
    output = uploadTexture(frame, frame, outputFormat, type, std::vector<float>{});
    const Matrix4 projection = orthographicMatrix(float(frame.width), float(frame.height));
    vtpl::HostRenderRecord render{};
    render.source = &source;
    render.destination = &output;
    render.projection = projection.data();
    render.modelView = kIdentityMatrix.data();
    render.frameWidth = frame.width;
    render.frameHeight = frame.height;
    host.record().messageRecord = &render;
    const FBO framebuffer;
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
    copyPass(host.calls(), programs, source, output);
    glGetIntegerv(GL_CURRENT_PROGRAM, &currentProgram);
    glGetIntegerv(GL_TEXTURE_BINDING_2D, &boundOnUnit0);
    glGetFramebufferAttachmentParameteriv(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0,
                                          GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME, &attachedAfter);
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    host.record().messageRecord = nullptr;
  }
};

std::vector<uint8_t> randomBytes(size_t count) {
  std::mt19937 random(7);
  std::vector<uint8_t> bytes(count);
  for (uint8_t& byte : bytes) {
    byte = static_cast<uint8_t>(random());
  }
  return bytes;
}

// Float storage goes through the same pass; it is checked end to end with 16-bit pictures.
TEST_F(GpuResources, CopyPassCopiesEightBitFramesExactly) {
  const Frame frame{7, 5};
  const std::vector<uint8_t> pixels = randomBytes(4 * 7 * 5);
  for (const Frame allocated : {Frame{7, 5}, Frame{16, 8}}) {
    const vtpl::HostTexture source =
        uploadTexture(frame, allocated, GL_RGBA8, GL_UNSIGNED_BYTE, pixels);
    const CopyRun run(source, frame, GL_RGBA8, GL_UNSIGNED_BYTE);
    EXPECT_EQ(readTexture<uint8_t>(run.output, GL_UNSIGNED_BYTE), pixels)
        << "source storage " << allocated.width << "x" << allocated.height;
    // Ready for the next stage: output attached, the frame's source bound, no program.
    EXPECT_EQ(run.currentProgram, 0);
    EXPECT_EQ(static_cast<GLuint>(run.boundOnUnit0), source.name);
    EXPECT_EQ(static_cast<GLuint>(run.attachedAfter), run.output.name);
    EXPECT_EQ(run.host.buffersCreated, 1);
    EXPECT_EQ(run.host.buffersReleased, 1);
    glDeleteTextures(1, &source.name);
    glDeleteTextures(1, &run.output.name);
  }
}

}  // namespace
}  // namespace waveform_test
