// Every glyph of two installed fonts, one with quadratic (TrueType) and one with cubic (CFF)
// outlines, converted, shaped into loops and triangulated: the triangles cover exactly the area
// the cleaned contours enclose.
#include <gtest/gtest.h>

#include <ft2build.h>
#include FT_FREETYPE_H

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "fonts/glyph_conversion.h"
#include "geometry/character_outline.h"
#include "geometry/triangulate_pieces.h"

namespace waveform_test {
namespace {

using qvtl::geometry::PointList;

double shoelace(const PointList& points) {
  double twice = 0;
  for (size_t i = 0; i < points.size(); ++i) {
    const auto& a = points[i];
    const auto& b = points[(i + 1) % points.size()];
    twice += static_cast<double>(a.x) * b.y - static_cast<double>(b.x) * a.y;
  }
  return twice / 2;
}

struct FontCheck {
  int glyphs = 0;
  int filled = 0;      // glyphs with any area
  int mismatched = 0;  // glyphs whose triangles' area differs from the contours' by over 0.1 %
  int triangles = 0;
  int flat = 0;  // triangles of no area: ears clipped from a ring that had no proper one
  std::string firstMismatch;
};

FontCheck checkEveryGlyph(const std::string& path) {
  FontCheck check;
  FT_Library library = nullptr;
  FT_Face face = nullptr;
  if (FT_Init_FreeType(&library) != 0 || FT_New_Face(library, path.c_str(), 0, &face) != 0) {
    ADD_FAILURE() << "FreeType cannot open " << path;
    return check;
  }
  FT_Set_Pixel_Sizes(face, 0, 48);
  const std::u16string filePath(path.begin(), path.end());
  for (FT_Long glyph = 0; glyph < face->num_glyphs; ++glyph, ++check.glyphs) {
    const vesk::plugin::lib::GlyphDescriptor descriptor =
        vesk::plugin::lib::convertGlyph(face, static_cast<uint32_t>(glyph), 48, filePath, 0);
    const auto outline = qvtl::geometry::makeCharacterOutline(descriptor, {});
    // The fill rule of the contours: their signed areas add up, holes counting against.
    double contours = 0;
    for (const auto& contour : outline->contours) {
      contours += shoelace(contour.path.points);
    }
    contours = std::fabs(contours);
    qvtl::geometry::triangulatePieces(*outline);
    double triangles = 0;
    for (size_t i = 0; i + 2 < outline->indices.size(); i += 3) {
      const double area = std::fabs(shoelace({outline->vertices[outline->indices[i]],
                                              outline->vertices[outline->indices[i + 1]],
                                              outline->vertices[outline->indices[i + 2]]}));
      triangles += area;
      ++check.triangles;
      check.flat += area < 1e-6 ? 1 : 0;
    }
    check.filled += contours > 0 ? 1 : 0;
    if (std::fabs(triangles - contours) > 0.001 * contours + 1e-3) {
      if (check.mismatched++ == 0) {
        check.firstMismatch = "glyph " + std::to_string(glyph) + ": triangles " +
                              std::to_string(triangles) + ", contours " + std::to_string(contours);
      }
    }
  }
  FT_Done_Face(face);
  FT_Done_FreeType(library);
  return check;
}

bool fontInstalled(const std::string& path) {
  if (std::filesystem::exists(path)) {
    return true;
  }
  const char* ci = std::getenv("CI");
  if (ci != nullptr && std::string(ci) == "true") {
    ADD_FAILURE() << path << " is not installed";
  }
  return false;
}

TEST(GlyphArea, TrianglesCoverTheContoursOfEveryGlyph) {
  for (const std::string path : {"/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf",
                                 "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf"}) {
    if (!fontInstalled(path)) {
      continue;
    }
    const FontCheck check = checkEveryGlyph(path);
    std::printf("%s: %d glyphs checked, %d with area, %d mismatched; %d triangles, %d flat\n",
                path.c_str(), check.glyphs, check.filled, check.mismatched, check.triangles,
                check.flat);
    EXPECT_GT(check.filled, 500) << path;
    EXPECT_EQ(check.mismatched, 0) << path << ", first: " << check.firstMismatch;
  }
}

}  // namespace
}  // namespace waveform_test
