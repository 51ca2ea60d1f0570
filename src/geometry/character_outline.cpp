#include "geometry/character_outline.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "geometry/nonzero_union.h"
#include "geometry/triangulate_pieces.h"

namespace qvtl::geometry {
namespace {

// Room for the band triangles the band builder emits per point.
constexpr std::size_t kBandVerticesPerPoint = 18;

PointList flattenContour(const vesk::plugin::lib::CurveContour& contour,
                         const GlyphOutlineRequest& request) {
  PointList points;
  for (const auto& curve : contour) {
    if (curve != nullptr) {
      curve->flatten(request.steps, request.step, request.step2, request.step3, points);
    }
  }
  return points;
}

void scalePath(Path2f& path, float scale) {
  for (Point2f& p : path.points) {
    p = {p.x * scale, p.y * scale};
  }
  const bool finite = std::all_of(path.points.begin(), path.points.end(), [](Point2f p) {
    return std::isfinite(p.x) && std::isfinite(p.y);
  });
  if (!finite) {
    path.points.clear();
    path.orientation = kUndetermined;
  }
  updateBounds(path);
}

void sizeBandArrays(OutlineContour& contour) {
  const std::size_t n = contour.path.points.size();
  contour.outerOffsets.assign(2 * n, Point2f{});
  contour.innerOffsets.assign(2 * n, Point2f{});
  contour.outerFlags.assign(n, 0);
  contour.innerFlags.assign(n, 0);
  contour.bandVertices.clear();
  contour.bandVertices.reserve(kBandVerticesPerPoint * n);
}

// The outermost loops are made counter-clockwise; flipping a loop flips everything inside it so
// that orientations keep alternating down the tree.
void normaliseOrientation(Shape2f& shape) {
  for (Shape2f& top : shape.children) {
    if (top.path.orientation == kClockwise) {
      reversePoints(top.path);
      top.path.orientation = kCounterClockwise;
      for (Shape2f& child : top.children) {
        flipOrientation(child);
      }
    }
  }
}

// Contours that cross or touch, or that nest inside a contour winding their way, are replaced by
// the boundary of the area they fill together, as the font fills them (non-zero winding); the
// containment tree alone would take an overlap, or a contour inside a like one, for a hole. Glyphs whose contours stay apart keep their own contours, split and nested as they are.
void buildShape(CharacterOutline& outline) {
  std::vector<const Path2f*> paths;
  for (const OutlineContour& contour : outline.contours) {
    paths.push_back(&contour.path);
  }
  if ((pathsIntersect(paths) || nestedWithTheirParentsWinding(paths)) &&
      addNonZeroUnion(outline.shape, paths, kMaxLoopsPerGlyph)) {
    return;
  }
  std::size_t loops = 0;
  for (const OutlineContour& contour : outline.contours) {
    const std::size_t allowed = std::min(kMaxLoopsPerPath, kMaxLoopsPerGlyph - loops);
    loops += addPath(outline.shape, contour.path, allowed);
  }
  normaliseOrientation(outline.shape);
}

}  // namespace

std::shared_ptr<CharacterOutline> makeCharacterOutline(
    const vesk::plugin::lib::GlyphDescriptor& descriptor, const GlyphOutlineRequest& request) {
  auto outline = std::make_shared<CharacterOutline>();
  outline->glyphIndex = descriptor.glyphIndex;
  outline->filePath = descriptor.filePath;
  outline->pixelSize = descriptor.pixelSize;
  outline->ascender = descriptor.ascender;
  outline->descender = descriptor.descender;
  outline->lineHeight = descriptor.lineHeight;
  outline->curves = descriptor.contours;
  outline->innerBandWidth = request.innerBandWidth;
  outline->outerBandWidth = request.outerBandWidth;

  std::size_t glyphPoints = 0;
  outline->contours.reserve(descriptor.contours.size());
  for (std::size_t k = 0; k < descriptor.contours.size(); ++k) {
    OutlineContour contour;
    PointList points = flattenContour(descriptor.contours[k], request);
    glyphPoints += points.size();
    if (points.size() > kMaxContourPoints || glyphPoints > kMaxGlyphPoints) {
      points.clear();
    }
    contour.path = makePath(points, static_cast<uint32_t>(k + 1));
    scalePath(contour.path, request.scale);
    sizeBandArrays(contour);
    // Band geometry is built with widths (0, 0) here, which builds nothing.
    outline->contours.push_back(std::move(contour));
  }
  buildShape(*outline);
  // Triangulated now, so that an outline shared between threads is never written while read.
  triangulatePieces(*outline);
  return outline;
}

}  // namespace qvtl::geometry
