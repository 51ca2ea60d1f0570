// Glyphs filled on the GPU from their triangulated outlines, compared with FreeType's own
// anti-aliased rendering of the same glyphs: the covered pixels agree.
#include <gtest/gtest.h>

#include <ft2build.h>
#include FT_FREETYPE_H

#include <algorithm>
#include <cstdio>
#include <string>
#include <vector>

#include "ci_or_skip.h"
#include "fonts/glyph_conversion.h"
#include "geometry/character_outline.h"
#include "gl/effect_data.h"
#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl/vertex_attributes.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "text_render/glyph_fill.h"

namespace waveform_test {
namespace {

class GlyphFill : public GlTest {};

constexpr char kFillProgram[] = "testFill";

void buildFillProgram(Plugin::gl::EffectData& programs) {
  programs.addProgram(R"(#version 410
in vec2 vertexPosition;
uniform mat4 projectionMatrix;
void main() {
  gl_Position = projectionMatrix * vec4(vertexPosition, 0.0, 1.0);
}
)",
                      R"(#version 410
layout(location = 0) out vec4 fragColour;
void main() {
  fragColour = vec4(1.0);
}
)",
                      false, kFillProgram);
  programs.bindAttribute(kFillProgram, Plugin::gl::kPositionLocation, "vertexPosition");
  ASSERT_TRUE(programs.linkProgram(kFillProgram, false));
}

// The glyph's pixels as the GPU fills them over FreeType's bitmap box: 1 where covered.
std::vector<uint8_t> fillOnGpu(FT_Face face, uint32_t glyph, const FT_Bitmap& bitmap, int left,
                               int top, Plugin::gl::EffectData& programs) {
  const auto width = static_cast<GLsizei>(bitmap.width);
  const auto height = static_cast<GLsizei>(bitmap.rows);
  GLuint target = 0;
  glGenTextures(1, &target);
  glBindTexture(GL_TEXTURE_2D, target);
  glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA8, width, height, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
  const Plugin::gl::FBO framebuffer;
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer.name());
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target, 0);
  glViewport(0, 0, width, height);
  glClearColor(0, 0, 0, 0);
  glClear(GL_COLOR_BUFFER_BIT);

  const vesk::plugin::lib::GlyphDescriptor descriptor =
      vesk::plugin::lib::convertGlyph(face, glyph, 48, u"", 0);
  const auto outline = qvtl::geometry::makeCharacterOutline(descriptor, {});
  GlTestHost host;
  programs.useProgram(kFillProgram);
  const Plugin::gl::Matrix4 projection =
      Plugin::gl::orthographicMatrix(static_cast<float>(left), static_cast<float>(left + width),
                                     static_cast<float>(top - height), static_cast<float>(top));
  programs.setUniformMatrix(programs.uniformLocation("projectionMatrix"), 4, 1, false,
                            projection.data());
  Plugin::gl::drawFill(*outline, host.calls());
  EXPECT_EQ(host.buffersReleased, host.buffersCreated);  // both host buffers go back
  programs.releaseProgram();

  // GL's first row is the bottom; FreeType's bitmap starts at the top.
  std::vector<uint8_t> rgba(4 * static_cast<size_t>(width) * height);
  glPixelStorei(GL_PACK_ALIGNMENT, 1);
  glReadPixels(0, 0, width, height, GL_RGBA, GL_UNSIGNED_BYTE, rgba.data());
  std::vector<uint8_t> covered(static_cast<size_t>(width) * height);
  for (GLsizei y = 0; y < height; ++y) {
    for (GLsizei x = 0; x < width; ++x) {
      covered[static_cast<size_t>(height - 1 - y) * width + x] =
          rgba[4 * (static_cast<size_t>(y) * width + x)] > 127 ? 1 : 0;
    }
  }
  glBindFramebuffer(GL_FRAMEBUFFER, 0);
  glDeleteTextures(1, &target);
  return covered;
}

TEST_F(GlyphFill, LettersAndDigitsCoverWhatFreeTypeRenders) {
  const std::string path = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
  REQUIRE_FILE(path);
  FT_Library library = nullptr;
  FT_Face face = nullptr;
  ASSERT_EQ(FT_Init_FreeType(&library), 0);
  ASSERT_EQ(FT_New_Face(library, path.c_str(), 0, &face), 0);
  FT_Set_Pixel_Sizes(face, 0, 48);
  Plugin::gl::EffectData programs;
  buildFillProgram(programs);
  double lowest = 1;
  for (const char letter : std::string("Waveform0123456789-")) {
    const FT_UInt glyph = FT_Get_Char_Index(face, static_cast<FT_ULong>(letter));
    ASSERT_EQ(FT_Load_Glyph(face, glyph, FT_LOAD_DEFAULT), 0);
    ASSERT_EQ(FT_Render_Glyph(face->glyph, FT_RENDER_MODE_NORMAL), 0);
    const FT_Bitmap& bitmap = face->glyph->bitmap;
    const int left = face->glyph->bitmap_left;
    const int top = face->glyph->bitmap_top;
    std::vector<uint8_t> reference(static_cast<size_t>(bitmap.width) * bitmap.rows);
    for (unsigned y = 0; y < bitmap.rows; ++y) {
      for (unsigned x = 0; x < bitmap.width; ++x) {
        reference[y * bitmap.width + x] = bitmap.buffer[y * bitmap.pitch + x] >= 128 ? 1 : 0;
      }
    }
    const FT_Bitmap copy = bitmap;  // the conversion below reloads the glyph
    const std::vector<uint8_t> filled = fillOnGpu(face, glyph, copy, left, top, programs);
    size_t both = 0;
    size_t either = 0;
    for (size_t i = 0; i < reference.size(); ++i) {
      both += reference[i] & filled[i];
      either += reference[i] | filled[i];
    }
    ASSERT_GT(either, 0u) << letter;
    const double overlap = static_cast<double>(both) / static_cast<double>(either);
    EXPECT_GE(overlap, 0.97) << "'" << letter << "': intersection over union " << overlap;
    lowest = std::min(lowest, overlap);
  }
  std::printf("lowest intersection over union: %.4f\n", lowest);
  FT_Done_Face(face);
  FT_Done_FreeType(library);
}

}  // namespace
}  // namespace waveform_test
