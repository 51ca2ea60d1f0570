// The glyph fill draw on Mesa's software GL: a ring with a hole drawn into a tiny target.
#include <gtest/gtest.h>

#include <vector>

#include "geometry/triangulate_pieces.h"
#include "gl/framebuffer.h"
#include "gl/texture.h"
#include "gl_test_context.h"
#include "gl_test_host.h"

namespace waveform_test {
namespace {

using namespace qvtl::geometry;

class DrawFill : public GlTest {};

constexpr int kSize = 16;

GLuint compile(GLenum stage, const char* source) {
  const GLuint shader = glCreateShader(stage);
  glShaderSource(shader, 1, &source, nullptr);
  glCompileShader(shader);
  return shader;
}

// Writes 1 wherever a triangle covers the pixel.
GLuint makeWhiteProgram() {
  const GLuint program = glCreateProgram();
  const GLuint vertex = compile(GL_VERTEX_SHADER,
                                "#version 410 core\nlayout(location = 0) in vec2 p;\n"
                                "void main() { gl_Position = vec4(p, 0.0, 1.0); }\n");
  const GLuint fragment = compile(GL_FRAGMENT_SHADER,
                                  "#version 410 core\nout vec4 colour;\n"
                                  "void main() { colour = vec4(1.0); }\n");
  glAttachShader(program, vertex);
  glAttachShader(program, fragment);
  glLinkProgram(program);
  glDeleteShader(vertex);
  glDeleteShader(fragment);
  return program;
}

// Red channel of the target after drawing the outline of the given contours.
std::vector<float> drawOutline(GlTestHost& host, const std::vector<PointList>& contours) {
  const auto target = Plugin::gl::Texture::create();
  target->define(kSize, kSize, GL_RGBA32F, 1.0f);
  const Plugin::gl::FBO fbo;
  glBindFramebuffer(GL_FRAMEBUFFER, fbo.name());
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target->name(), 0);
  glViewport(0, 0, kSize, kSize);
  glClearColor(0, 0, 0, 0);
  glClear(GL_COLOR_BUFFER_BIT);
  const GLuint program = makeWhiteProgram();
  glUseProgram(program);

  CharacterOutline outline;
  for (size_t k = 0; k < contours.size(); ++k) {
    addPath(outline.shape, makePath(contours[k], static_cast<uint32_t>(k + 1)));
  }
  drawFill(outline, host.calls());

  std::vector<float> pixels(kSize * kSize * 4);
  glReadPixels(0, 0, kSize, kSize, GL_RGBA, GL_FLOAT, pixels.data());
  glUseProgram(0);
  glDeleteProgram(program);
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  std::vector<float> red;
  for (size_t i = 0; i < pixels.size(); i += 4)
    red.push_back(pixels[i]);
  return red;
}

TEST_F(DrawFill, RingIsFilledAroundItsHole) {
  GlTestHost host;
  const PointList outer{{-1, -1}, {1, -1}, {1, 1}, {-1, 1}};
  const PointList hole{{-0.5f, -0.5f}, {-0.5f, 0.5f}, {0.5f, 0.5f}, {0.5f, -0.5f}};
  const std::vector<float> red = drawOutline(host, {outer, hole});
  for (int y = 0; y < kSize; ++y) {
    for (int x = 0; x < kSize; ++x) {
      const bool inHole = x >= 4 && x < 12 && y >= 4 && y < 12;
      EXPECT_EQ(red[y * kSize + x], inHole ? 0.0f : 1.0f) << x << ", " << y;
    }
  }
  EXPECT_EQ(host.buffersCreated, 2);
  EXPECT_EQ(host.buffersReleased, 2);
}

TEST_F(DrawFill, OutlineWithoutPiecesDrawsNothing) {
  GlTestHost host;
  const std::vector<float> red = drawOutline(host, {{{-1, -1}, {1, 1}}});
  for (const float value : red)
    EXPECT_EQ(value, 0.0f);
  EXPECT_EQ(host.buffersCreated, 0);
}

}  // namespace
}  // namespace waveform_test
