// Times outline building (conversion, flattening, loops and containment tree) plus
// triangulation for every glyph of a font at 48 pixels: the total and the slowest glyph.
//   glyph_geometry_bench [FONT_FILE]   (default: DejaVu Sans)
#include <ft2build.h>
#include FT_FREETYPE_H

#include <chrono>
#include <cstdio>
#include <string>

#include "fonts/glyph_conversion.h"
#include "geometry/character_outline.h"
#include "geometry/triangulate_pieces.h"

namespace {

using Clock = std::chrono::steady_clock;

double millisecondsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

}  // namespace

int main(int argc, char** argv) {
  const std::string path = argc > 1 ? argv[1] : "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
  FT_Library library = nullptr;
  FT_Face face = nullptr;
  if (FT_Init_FreeType(&library) != 0 || FT_New_Face(library, path.c_str(), 0, &face) != 0) {
    std::fprintf(stderr, "glyph_geometry_bench: cannot open %s\n", path.c_str());
    return 1;
  }
  FT_Set_Pixel_Sizes(face, 0, 48);
  const std::u16string filePath(path.begin(), path.end());
  double total = 0;
  double conversion = 0;
  double slowest = 0;
  long slowestGlyph = -1;
  size_t triangles = 0;
  for (FT_Long glyph = 0; glyph < face->num_glyphs; ++glyph) {
    const Clock::time_point start = Clock::now();
    const vesk::plugin::lib::GlyphDescriptor descriptor =
        vesk::plugin::lib::convertGlyph(face, static_cast<uint32_t>(glyph), 48, filePath, 0);
    conversion += millisecondsSince(start);
    const auto outline = qvtl::geometry::makeCharacterOutline(descriptor, {});
    qvtl::geometry::triangulatePieces(*outline);
    const double spent = millisecondsSince(start);
    triangles += outline->indices.size() / 3;
    total += spent;
    if (spent > slowest) {
      slowest = spent;
      slowestGlyph = glyph;
    }
  }
  std::printf("%s at 48 px: %ld glyphs, %zu triangles\n", path.c_str(), face->num_glyphs,
              triangles);
  std::printf(
      "total %.1f ms (FreeType loading and conversion %.1f ms), slowest glyph %ld: %.3f ms\n",
      total, conversion, slowestGlyph, slowest);
  FT_Done_Face(face);
  FT_Done_FreeType(library);
  return 0;
}
