// Times outline building (conversion, flattening, loops and containment tree) plus
// triangulation for every glyph of a font at 48 pixels: the total and the slowest glyph.
//   glyph_geometry_bench [FONT_FILE]   (default: DejaVu Sans)
#include <chrono>
#include <cstdio>
#include <string>

#include "fonts/glyph_conversion.h"
#include "freetype_face.h"
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
  const waveform_test::FreeTypeFace face(path, 0, 48);
  if (face.get() == nullptr) {
    std::fprintf(stderr, "glyph_geometry_bench: cannot open %s\n", path.c_str());
    return 1;
  }
  const std::u16string filePath(path.begin(), path.end());
  double total = 0;
  double conversion = 0;
  double slowest = 0;
  long slowestGlyph = -1;
  size_t triangles = 0;
  for (FT_Long glyph = 0; glyph < face->num_glyphs; ++glyph) {
    const Clock::time_point start = Clock::now();
    const vesk::plugin::lib::GlyphDescriptor descriptor =
        vesk::plugin::lib::convertGlyph(face.get(), static_cast<uint32_t>(glyph), 48, filePath, 0);
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
  return 0;
}
