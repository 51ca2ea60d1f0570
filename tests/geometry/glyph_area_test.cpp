// Every glyph of two installed fonts, one with quadratic (TrueType) and one with cubic (CFF)
// outlines, converted, shaped into loops and triangulated: the triangles cover exactly the area
// the cleaned contours enclose.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <string>

#include "ci_or_skip.h"
#include "fonts/glyph_conversion.h"
#include "freetype_face.h"
#include "geometry/character_outline.h"
#include "geometry/triangulate_pieces.h"
#include "polygon_area.h"

namespace waveform_test {
namespace {

TEST(GlyphArea, TrianglesCoverTheContoursOfEveryGlyph) {
  for (const std::string path : {"/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf",
                                 "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf"}) {
    REQUIRE_FILE(path);
    const FreeTypeFace face(path, 0, 48);
    ASSERT_NE(face.get(), nullptr) << path;
    int filled = 0, mismatched = 0;
    for (FT_Long glyph = 0; glyph < face->num_glyphs; ++glyph) {
      const auto outline = qvtl::geometry::makeCharacterOutline(
          vesk::plugin::lib::convertGlyph(face.get(), static_cast<uint32_t>(glyph), 48, u"", 0),
          {});
      // The fill rule of the contours: their signed areas add up, holes counting against.
      double contours = 0;
      for (const auto& contour : outline->contours) {
        contours += signedArea(contour.path.points);
      }
      contours = std::fabs(contours);
      qvtl::geometry::triangulatePieces(*outline);
      const double triangles = trianglesArea(outline->vertices, outline->indices);
      filled += contours > 0 ? 1 : 0;
      if (std::fabs(triangles - contours) > 0.001 * contours + 1e-3 && mismatched++ == 0) {
        ADD_FAILURE() << path << " glyph " << glyph << ": triangles " << triangles << ", contours "
                      << contours;
      }
    }
    std::printf("%s: %ld glyphs, %d with area, %d mismatched\n", path.c_str(), face->num_glyphs,
                filled, mismatched);
    EXPECT_GT(filled, 500) << path;
    EXPECT_EQ(mismatched, 0) << path;
  }
}

}  // namespace
}  // namespace waveform_test
