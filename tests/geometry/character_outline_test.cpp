#include "geometry/character_outline.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>

#include "polygon_area.h"

namespace qvtl::geometry {
namespace {

using waveform_test::reversed, waveform_test::square;

using vesk::plugin::lib::CurveContour, vesk::plugin::lib::GlyphDescriptor,
    vesk::plugin::lib::LinearCurve, vesk::plugin::lib::QuadraticCurve;

// A closed polygon as straight curves, each ending where the next starts.
CurveContour polygon(const PointList& points) {
  CurveContour contour;
  for (size_t i = 0; i < points.size(); ++i) {
    contour.push_back(std::make_shared<LinearCurve>(points[i], points[(i + 1) % points.size()]));
  }
  return contour;
}

// Outer clockwise and inner counter-clockwise, as TrueType outlines come.
GlyphDescriptor letterO() {
  GlyphDescriptor glyph;
  glyph.contours = {polygon(reversed(square(0, 0, 10, 10))), polygon(square(3, 3, 7, 7))};
  return glyph;
}

TEST(CharacterOutline, ClockwiseOuterIsTurnedWithItsHole) {
  GlyphOutlineRequest request;
  request.scale = 2;
  const auto outline = makeCharacterOutline(letterO(), request);
  // The contours keep their own direction, numbered from 1, with band arrays for each point.
  ASSERT_EQ(outline->contours.size(), 2u);
  const OutlineContour& first = outline->contours[0];
  EXPECT_EQ(first.path.id, 1u);
  EXPECT_EQ(outline->contours[1].path.id, 2u);
  EXPECT_EQ(first.path.orientation, kClockwise);
  EXPECT_EQ(first.path.bounds, (std::array<float, 4>{0, 0, 20, 20}));
  EXPECT_EQ((std::array<size_t, 4>{first.outerOffsets.size(), first.innerOffsets.size(),
                                   first.outerFlags.size(), first.innerFlags.size()}),
            (std::array<size_t, 4>{8, 8, 4, 4}));
  // The shape is normalised: a counter-clockwise outer loop around a clockwise hole.
  ASSERT_EQ(outline->shape.children.size(), 1u);
  const Shape2f& outer = outline->shape.children[0];
  EXPECT_EQ(outer.path.orientation, kCounterClockwise);
  EXPECT_EQ(computeOrientation(outer.path), kCounterClockwise);
  ASSERT_EQ(outer.children.size(), 1u);
  const Shape2f& hole = outer.children[0];
  EXPECT_EQ(hole.path.orientation, kClockwise);
  EXPECT_EQ(computeOrientation(hole.path), kClockwise);
  EXPECT_EQ(hole.path.bounds, (std::array<float, 4>{6, 6, 14, 14}));
  EXPECT_EQ(collectFilledPieces(outline->shape), std::vector<const Shape2f*>{&outer});
}

TEST(CharacterOutline, CurvedContourIsFlattened) {
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

// Degenerate point lists are left to the shapes; here the contours and the scale.
TEST(CharacterOutline, DegenerateContoursGiveNoPieces) {
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const float inf = std::numeric_limits<float>::infinity();
  GlyphDescriptor glyph;
  glyph.contours = {{}, {nullptr}, polygon({{0, 0}, {inf, 0}, {10, 10}})};
  const auto outline = makeCharacterOutline(glyph, GlyphOutlineRequest{});
  EXPECT_EQ(outline->contours.size(), glyph.contours.size());
  EXPECT_TRUE(collectFilledPieces(outline->shape).empty());

  GlyphOutlineRequest nanScale;
  nanScale.scale = nan;
  EXPECT_TRUE(collectFilledPieces(makeCharacterOutline(letterO(), nanScale)->shape).empty());
}

// Contours that cross or nest fill, as fonts fill them, every point they wind around (non-zero
// rule): overlaps once, opposite windings cancelling, self-crossing contours on both lobes.
// Degenerate contours and huge coordinates change nothing.
TEST(CharacterOutline, OverlappingContoursFillTheirUnion) {
  const PointList figureEight{{0, 0}, {4, 4}, {4, 0}, {0, 4}};  // two triangles of area 4 each
  struct Case {
    const char* name;
    std::vector<PointList> contours;
    float scale;
    double area;  // at scale 1
  };
  for (const Case& c : {
           Case{"two squares", {square(0, 0, 2, 2), square(1, 1, 3, 3)}, 1, 7},
           Case{"two clockwise squares",
                {reversed(square(0, 0, 2, 2)), reversed(square(1, 1, 3, 3))},
                1,
                7},
           // The square covers 1 of each lobe: it adds to the counter-clockwise left lobe and
           // cancels the clockwise right one.
           Case{"figure-eight and square", {figureEight, square(1, 1, 3, 3)}, 1, 9},
           Case{"opposite windings", {square(0, 0, 4, 4), reversed(square(1, -1, 3, 5))}, 1, 12},
           // Contours apart from each other: a letter inside a ring's hole, drawn the way the hole
           // winds, is filled (16 - 4 + 1).
           Case{"island winding like its hole",
                {square(0, 0, 4, 4), reversed(square(1, 1, 3, 3)),
                 reversed(square(1.5f, 1.5f, 2.5f, 2.5f))},
                1,
                13},
           Case{"degenerate contours, huge coordinates",
                {{}, square(0, 0, 2, 2), {{0, 1}, {3, 1}, {1, 1}}, square(1, 1, 3, 3)},
                1e30f,
                7},
       }) {
    GlyphDescriptor glyph;
    for (const PointList& contour : c.contours) {
      glyph.contours.push_back(polygon(contour));
    }
    GlyphOutlineRequest request;
    request.scale = c.scale;
    const auto outline = makeCharacterOutline(glyph, request);
    const double expected = c.area * c.scale * c.scale;
    EXPECT_NEAR(waveform_test::trianglesArea(outline->vertices, outline->indices), expected,
                1e-5 * expected)
        << c.name;
    EXPECT_EQ(outline->contours.size(), c.contours.size()) << c.name;
    for (const uint32_t id : outline->pieceIds) {
      EXPECT_TRUE(id >= 1 && id <= c.contours.size()) << c.name << ": piece id " << id;
    }
  }
}

TEST(CharacterOutline, LoopsPerGlyphAreCapped) {
  GlyphDescriptor glyph;
  for (int k = 0; k < 1500; ++k) {
    const float x = static_cast<float>(3 * k);
    glyph.contours.push_back(polygon(square(x, 0, x + 2, 2)));
  }
  const auto outline = makeCharacterOutline(glyph, GlyphOutlineRequest{});
  EXPECT_EQ(outline->contours.size(), 1500u);
  EXPECT_EQ(outline->shape.children.size(), kMaxLoopsPerGlyph);
}

}  // namespace
}  // namespace qvtl::geometry
