#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "geometry/character_outline.h"

namespace qvtl::geometry {
namespace {

using vesk::plugin::lib::CurveContour;
using vesk::plugin::lib::GlyphDescriptor;
using vesk::plugin::lib::LinearCurve;
using vesk::plugin::lib::QuadraticCurve;

// A closed polygon as straight curves, each ending where the next starts.
CurveContour polygon(const PointList& points) {
  CurveContour contour;
  for (size_t i = 0; i < points.size(); ++i) {
    contour.push_back(std::make_shared<LinearCurve>(points[i], points[(i + 1) % points.size()]));
  }
  return contour;
}

// Clockwise square with corners (x0, y0) and (x1, y1), y up.
PointList clockwiseSquare(float x0, float y0, float x1, float y1) {
  return {{x0, y0}, {x0, y1}, {x1, y1}, {x1, y0}};
}

PointList reversed(PointList points) {
  std::reverse(points.begin(), points.end());
  return points;
}

GlyphDescriptor letterO() {
  GlyphDescriptor glyph;
  glyph.glyphIndex = 82;
  glyph.filePath = u"/fonts/test.ttf";
  glyph.pixelSize = 24;
  glyph.ascender = 0.9f;
  glyph.descender = -0.2f;
  glyph.lineHeight = 1.2f;
  // Outer clockwise and inner counter-clockwise, as TrueType outlines come.
  glyph.contours = {polygon(clockwiseSquare(0, 0, 10, 10)),
                    polygon(reversed(clockwiseSquare(3, 3, 7, 7)))};
  return glyph;
}

TEST(CharacterOutlineTest, CopiesTheDescriptorAndSizesTheBandArrays) {
  GlyphOutlineRequest request;
  request.innerBandWidth = 0.5f;
  request.outerBandWidth = 1.5f;
  const auto outline = makeCharacterOutline(letterO(), request);
  EXPECT_EQ(outline->glyphIndex, 82u);
  EXPECT_EQ(outline->filePath, u"/fonts/test.ttf");
  EXPECT_EQ(outline->pixelSize, 24);
  EXPECT_EQ(outline->ascender, 0.9f);
  EXPECT_EQ(outline->descender, -0.2f);
  EXPECT_EQ(outline->lineHeight, 1.2f);
  EXPECT_EQ(outline->innerBandWidth, 0.5f);
  EXPECT_EQ(outline->outerBandWidth, 1.5f);
  EXPECT_EQ(outline->curves.size(), 2u);
  ASSERT_EQ(outline->contours.size(), 2u);
  for (size_t k = 0; k < 2; ++k) {
    const OutlineContour& contour = outline->contours[k];
    EXPECT_EQ(contour.path.id, k + 1);
    EXPECT_EQ(contour.path.points.size(), 4u);
    EXPECT_EQ(contour.outerOffsets.size(), 8u);
    EXPECT_EQ(contour.innerOffsets.size(), 8u);
    EXPECT_EQ(contour.outerFlags.size(), 4u);
    EXPECT_EQ(contour.innerFlags.size(), 4u);
    EXPECT_TRUE(contour.bandVertices.empty());
    EXPECT_GE(contour.bandVertices.capacity(), 72u);
    EXPECT_EQ(contour.scale, 1);
    EXPECT_EQ(contour.innerWidth, 0);
  }
}

TEST(CharacterOutlineTest, ClockwiseOuterIsTurnedWithItsHole) {
  GlyphOutlineRequest request;
  request.scale = 2;
  const auto outline = makeCharacterOutline(letterO(), request);
  // The contours keep their own direction; only the shape is normalised.
  EXPECT_EQ(outline->contours[0].path.orientation, kClockwise);
  EXPECT_EQ(outline->contours[0].path.bounds, (std::array<float, 4>{0, 0, 20, 20}));

  ASSERT_EQ(outline->shape.children.size(), 1u);
  const Shape2f& outer = outline->shape.children[0];
  EXPECT_EQ(outer.path.orientation, kCounterClockwise);
  EXPECT_EQ(computeOrientation(outer.path), kCounterClockwise);
  EXPECT_EQ(outer.path.bounds, (std::array<float, 4>{0, 0, 20, 20}));
  ASSERT_EQ(outer.children.size(), 1u);
  const Shape2f& hole = outer.children[0];
  EXPECT_EQ(hole.path.orientation, kClockwise);
  EXPECT_EQ(computeOrientation(hole.path), kClockwise);
  EXPECT_EQ(hole.path.bounds, (std::array<float, 4>{6, 6, 14, 14}));

  const auto pieces = collectFilledPieces(outline->shape);
  ASSERT_EQ(pieces.size(), 1u);
  EXPECT_EQ(pieces[0], &outer);
}

TEST(CharacterOutlineTest, CurvedContourIsFlattened) {
  // A circle of radius 50 from four quadratic arcs, counter-clockwise.
  const Point2f e{50, 0}, n{0, 50}, w{-50, 0}, s{0, -50};
  GlyphDescriptor glyph;
  glyph.contours = {{std::make_shared<QuadraticCurve>(e, Point2f{50, 50}, n),
                     std::make_shared<QuadraticCurve>(n, Point2f{-50, 50}, w),
                     std::make_shared<QuadraticCurve>(w, Point2f{-50, -50}, s),
                     std::make_shared<QuadraticCurve>(s, Point2f{50, -50}, e)}};
  const auto outline = makeCharacterOutline(glyph, GlyphOutlineRequest{});
  const Path2f& path = outline->contours[0].path;
  EXPECT_GT(path.points.size(), 20u);
  EXPECT_EQ(path.orientation, kCounterClockwise);
  // Every point lies on an arc: between its chord and its control corner.
  for (const Point2f p : path.points) {
    EXPECT_GE(std::fabs(p.x) + std::fabs(p.y), 49.99f);
    EXPECT_LE(std::max(std::fabs(p.x), std::fabs(p.y)), 50.0f);
  }
  EXPECT_EQ(path.bounds, (std::array<float, 4>{-50, -50, 50, 50}));
  EXPECT_EQ(collectFilledPieces(outline->shape).size(), 1u);
}

TEST(CharacterOutlineTest, DegenerateContoursGiveNoPieces) {
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const float inf = std::numeric_limits<float>::infinity();
  GlyphDescriptor glyph;
  glyph.contours = {{},
                    {nullptr},
                    polygon({{1, 1}}),
                    polygon({{0, 0}, {5, 5}}),
                    polygon({{2, 2}, {2, 2}, {2, 2}}),
                    polygon({{0, 0}, {10, 0}, {10, nan}, {0, 10}}),
                    polygon({{0, 0}, {inf, 0}, {10, 10}})};
  const auto outline = makeCharacterOutline(glyph, GlyphOutlineRequest{});
  EXPECT_EQ(outline->contours.size(), glyph.contours.size());
  EXPECT_TRUE(collectFilledPieces(outline->shape).empty());

  GlyphOutlineRequest nanScale;
  nanScale.scale = nan;
  EXPECT_TRUE(collectFilledPieces(makeCharacterOutline(letterO(), nanScale)->shape).empty());
}

TEST(CharacterOutlineTest, LoopsPerGlyphAreCapped) {
  GlyphDescriptor glyph;
  for (int k = 0; k < 1500; ++k) {
    const float x = static_cast<float>(3 * k);
    glyph.contours.push_back(polygon(reversed(clockwiseSquare(x, 0, x + 2, 2))));
  }
  const auto outline = makeCharacterOutline(glyph, GlyphOutlineRequest{});
  EXPECT_EQ(outline->contours.size(), 1500u);
  EXPECT_EQ(outline->shape.children.size(), kMaxLoopsPerGlyph);
}

}  // namespace
}  // namespace qvtl::geometry
