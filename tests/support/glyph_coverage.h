// How far a glyph's triangles are from FreeType's own anti-aliased rendering of the glyph: the
// wrongly covered area (the summed per-pixel difference of coverage) over FreeType's inked area.
// The triangles are sampled 16 x 16 times per pixel on FreeType's pixel grid: with 4 x 4 the
// sampling alone puts thin strokes past a tenth of their area.
#ifndef WAVEFORM_TESTS_SUPPORT_GLYPH_COVERAGE_H
#define WAVEFORM_TESTS_SUPPORT_GLYPH_COVERAGE_H

#include <ft2build.h>
#include FT_FREETYPE_H

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <vector>

#include "fonts/glyph_conversion.h"
#include "geometry/character_outline.h"

namespace waveform_test {

struct CoverageError {
  double wrong = 0;  // pixels' worth of area covered differently
  double inked = 0;  // FreeType's covered area in pixels
  double ratio() const { return inked > 0 ? wrong / inked : 0; }
};

// The glyph of `face` (pixel size already set) made into an outline by the effect's own code and
// compared with FreeType's rendering. Triangles reaching outside FreeType's bitmap count as wrong
// by their samples outside it.
inline CoverageError glyphCoverageError(FT_Face face, uint32_t glyph, float pixelSize) {
  constexpr int kSamples = 16;  // per pixel side
  const auto outline = qvtl::geometry::makeCharacterOutline(
      vesk::plugin::lib::convertGlyph(face, glyph, pixelSize, u"", 0), {});
  CoverageError error;
  if (FT_Load_Glyph(face, glyph, FT_LOAD_RENDER | FT_LOAD_NO_BITMAP) != 0 ||
      face->glyph->bitmap.pixel_mode != FT_PIXEL_MODE_GRAY) {
    return error;
  }
  const FT_Bitmap& bitmap = face->glyph->bitmap;
  // A margin of pixels around FreeType's bitmap catches triangles that reach past the glyph.
  const int margin = 2, left = face->glyph->bitmap_left - margin,
            top = face->glyph->bitmap_top + margin;
  const int width = static_cast<int>(bitmap.width) + 2 * margin,
            height = static_cast<int>(bitmap.rows) + 2 * margin;
  std::vector<uint8_t> hits(static_cast<size_t>(width * height * kSamples * kSamples), 0);
  const auto& v = outline->vertices;
  const auto& ix = outline->indices;
  for (size_t t = 0; t + 2 < ix.size(); t += 3) {
    const qvtl::geometry::Point2f a = v[ix[t]], b = v[ix[t + 1]], c = v[ix[t + 2]];
    const double area =
        (double(b.x) - a.x) * (double(c.y) - a.y) - (double(b.y) - a.y) * (double(c.x) - a.x);
    if (area == 0) {
      continue;
    }
    // Sample columns and rows (in samples from the grid's left and top) the triangle spans.
    const auto column = [&](double x) { return (x - left) * kSamples - 0.5; };
    const auto row = [&](double y) { return (top - y) * kSamples - 0.5; };
    const int x0 = std::max(0, static_cast<int>(std::ceil(column(std::min({a.x, b.x, c.x})))));
    const int x1 = std::min(width * kSamples - 1,
                            static_cast<int>(std::floor(column(std::max({a.x, b.x, c.x})))));
    const int y0 = std::max(0, static_cast<int>(std::ceil(row(std::max({a.y, b.y, c.y})))));
    const int y1 = std::min(height * kSamples - 1,
                            static_cast<int>(std::floor(row(std::min({a.y, b.y, c.y})))));
    const auto side = [&](qvtl::geometry::Point2f p, qvtl::geometry::Point2f q, double x,
                          double y) {
      return ((double(q.x) - p.x) * (y - p.y) - (double(q.y) - p.y) * (x - p.x)) * area;
    };
    for (int sy = y0; sy <= y1; ++sy) {
      const double y = top - (sy + 0.5) / kSamples;
      for (int sx = x0; sx <= x1; ++sx) {
        const double x = left + (sx + 0.5) / kSamples;
        if (side(a, b, x, y) >= 0 && side(b, c, x, y) >= 0 && side(c, a, x, y) >= 0) {
          hits[static_cast<size_t>(sy) * width * kSamples + sx] = 1;
        }
      }
    }
  }
  for (int py = 0; py < height; ++py) {
    for (int px = 0; px < width; ++px) {
      int covered = 0;
      for (int sy = 0; sy < kSamples; ++sy) {
        for (int sx = 0; sx < kSamples; ++sx) {
          covered +=
              hits[static_cast<size_t>(py * kSamples + sy) * width * kSamples + px * kSamples + sx];
        }
      }
      const int bx = px - margin, by = py - margin;
      const bool inBitmap = bx >= 0 && by >= 0 && bx < static_cast<int>(bitmap.width) &&
                            by < static_cast<int>(bitmap.rows);
      const double reference =
          inBitmap ? bitmap.buffer[static_cast<size_t>(by) * bitmap.pitch + bx] / 255.0 : 0;
      error.inked += reference;
      error.wrong += std::fabs(double(covered) / (kSamples * kSamples) - reference);
    }
  }
  return error;
}

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_SUPPORT_GLYPH_COVERAGE_H
