// Every glyph of two installed fonts, one with quadratic (TrueType) and one with cubic (CFF)
// outlines, converted, shaped into loops and triangulated: the triangles cover exactly the area
// the cleaned contours enclose, or for contours that overlap, the area of the loops that bound
// what they fill together. Overlapping glyphs are compared with FreeType's own rendering.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <string>

#include "ci_or_skip.h"
#include "fonts/glyph_conversion.h"
#include "freetype_face.h"
#include "geometry/character_outline.h"
#include "geometry/nonzero_union.h"
#include "geometry/triangulate_pieces.h"
#include "glyph_coverage.h"
#include "polygon_area.h"

namespace waveform_test {
namespace {

// The signed areas of a shape's loops summed: outer loops count, holes count against.
double shapeArea(const qvtl::geometry::Shape2f& node) {
  double area = signedArea(node.path.points);
  for (const auto& child : node.children) {
    area += shapeArea(child);
  }
  return area;
}

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
      std::vector<const qvtl::geometry::Path2f*> paths;
      for (const auto& contour : outline->contours) {
        contours += signedArea(contour.path.points);
        paths.push_back(&contour.path);
      }
      contours =
          std::fabs(qvtl::geometry::pathsIntersect(paths) ? shapeArea(outline->shape) : contours);
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

// Glyphs drawn from overlapping contours (most of the variable font's Latin capitals, and a few
// of the others, among them stars whose union has holes touching each other or the outer ring)
// against FreeType's anti-aliased rendering at 48 pixels.
TEST(GlyphArea, OverlappingContoursCoverWhatFreeTypeInks) {
  struct Range {
    const char* path;
    uint32_t first, last;
  };
  for (const Range& range : {
           Range{"/usr/share/fonts/truetype/inter-vf/Inter.var.ttf", 2, 64},
           Range{"/usr/share/fonts/truetype/dejavu/DejaVuSans-Bold.ttf", 4025, 4034},
           Range{"/usr/share/fonts/truetype/wqy/wqy-microhei.ttc", 4251, 4251},
           Range{"/usr/share/fonts/truetype/wqy/wqy-microhei.ttc", 18900, 18900},
           Range{"/usr/share/fonts/truetype/wqy/wqy-microhei.ttc", 48754, 48754},
       }) {
    REQUIRE_FILE(range.path);
    const FreeTypeFace face(range.path, 0, 48);
    ASSERT_NE(face.get(), nullptr) << range.path;
    for (uint32_t glyph = range.first; glyph <= range.last; ++glyph) {
      const CoverageError error = glyphCoverageError(face.get(), glyph, 48);
      EXPECT_LT(error.ratio(), 0.1) << range.path << " glyph " << glyph << ": " << error.wrong
                                    << " of " << error.inked << " pixels covered wrongly";
    }
  }
}

}  // namespace
}  // namespace waveform_test
