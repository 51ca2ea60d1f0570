#include "fonts/glyph_conversion.h"

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_GLYPH_H
#include FT_OUTLINE_H

#include <exception>
#include <memory>
#include <stdexcept>
#include <utility>

namespace vesk::plugin::lib {
namespace {

Point2f toPixels(const FT_Vector* v) {
  return {fixed26Dot6ToFloat(v->x), fixed26Dot6ToFloat(v->y)};
}

// The state of one outline walk: the finished contours, the contour being built and the pen.
struct OutlineWalk {
  std::vector<CurveContour> contours;
  CurveContour building;
  bool open = false;
  Point2f pen;
  // An allocation failure inside a callback must not unwind through FreeType's C code: it is kept
  // here, the walk is stopped, and it is rethrown once FreeType has returned.
  std::exception_ptr failure;

  template <typename Action>
  int guarded(Action action) {
    try {
      action();
      return 0;
    } catch (...) {
      failure = std::current_exception();
      return 1;
    }
  }

  // A move to starts a new contour; the one before it is finished as it stands.
  void startContour(Point2f start) {
    if (open) {
      contours.push_back(std::move(building));
      building.clear();
    }
    open = true;
    pen = start;
  }

  // The last contour has no following move to finish it.
  void finishLastContour() {
    if (open && !building.empty()) {
      contours.push_back(std::move(building));
      building.clear();
    }
  }
};

OutlineWalk& walkOf(void* user) {
  return *static_cast<OutlineWalk*>(user);
}

int moveTo(const FT_Vector* to, void* user) {
  OutlineWalk& walk = walkOf(user);
  return walk.guarded([&] { walk.startContour(toPixels(to)); });
}

int lineTo(const FT_Vector* to, void* user) {
  OutlineWalk& walk = walkOf(user);
  return walk.guarded([&] {
    const Point2f end = toPixels(to);
    walk.building.push_back(std::make_shared<LinearCurve>(walk.pen, end));
    walk.pen = end;
  });
}

int conicTo(const FT_Vector* control, const FT_Vector* to, void* user) {
  OutlineWalk& walk = walkOf(user);
  return walk.guarded([&] {
    const Point2f end = toPixels(to);
    walk.building.push_back(std::make_shared<QuadraticCurve>(walk.pen, toPixels(control), end));
    walk.pen = end;
  });
}

int cubicTo(const FT_Vector* control1, const FT_Vector* control2, const FT_Vector* to, void* user) {
  OutlineWalk& walk = walkOf(user);
  return walk.guarded([&] {
    const Point2f end = toPixels(to);
    walk.building.push_back(
        std::make_shared<CubicCurve>(walk.pen, toPixels(control1), toPixels(control2), end));
    walk.pen = end;
  });
}

struct GlyphImageRelease {
  void operator()(FT_Glyph glyph) const { FT_Done_Glyph(glyph); }
};
using GlyphImage = std::unique_ptr<FT_GlyphRec, GlyphImageRelease>;

// The outline of the glyph in the face's slot as contours; none when it cannot be loaded or is
// not a non-empty outline.
std::vector<CurveContour> loadContours(FT_Face face, uint32_t glyphIndex) {
  if (FT_Load_Glyph(face, glyphIndex, 0) != 0) {
    return {};
  }
  FT_Glyph raw = nullptr;
  if (FT_Get_Glyph(face->glyph, &raw) != 0) {
    return {};
  }
  const GlyphImage image(raw);
  if (image->format != FT_GLYPH_FORMAT_OUTLINE) {
    return {};
  }
  FT_Outline& outline = reinterpret_cast<FT_OutlineGlyph>(image.get())->outline;
  if (outline.n_points <= 0 || outline.n_contours <= 0) {
    return {};
  }
  FT_Outline_Funcs callbacks{};
  callbacks.move_to = moveTo;
  callbacks.line_to = lineTo;
  callbacks.conic_to = conicTo;
  callbacks.cubic_to = cubicTo;
  callbacks.shift = 0;
  callbacks.delta = 0;
  OutlineWalk walk;
  FT_Outline_Decompose(&outline, &callbacks, &walk);
  if (walk.failure) {
    std::rethrow_exception(walk.failure);
  }
  walk.finishLastContour();
  return std::move(walk.contours);
}

}  // namespace

float fixed26Dot6ToFloat(long value) {
  return static_cast<float>(value / 64) + static_cast<float>(value % 64) * (1.0f / 64.0f);
}

GlyphDescriptor convertGlyph(FT_Face face, uint32_t glyphIndex, float pixelSize,
                             const std::u16string& filePath, uint32_t faceIndex) {
  if (face == nullptr) {
    throw std::invalid_argument("convertGlyph: the face is null");
  }
  GlyphDescriptor glyph;
  glyph.glyphIndex = glyphIndex;
  glyph.filePath = filePath;
  glyph.faceIndex = faceIndex;
  glyph.pixelSize = pixelSize;
  glyph.contours = loadContours(face, glyphIndex);
  // Bitmap-only faces have no units per em; their metrics stay zero rather than infinite.
  const float unitsPerEm = static_cast<float>(face->units_per_EM);
  if (unitsPerEm > 0.0f) {
    glyph.ascender = static_cast<float>(face->ascender) / unitsPerEm;
    glyph.descender = static_cast<float>(face->descender) / unitsPerEm;
    glyph.lineHeight = static_cast<float>(face->height) / unitsPerEm;
  }
  return glyph;
}

}  // namespace vesk::plugin::lib
