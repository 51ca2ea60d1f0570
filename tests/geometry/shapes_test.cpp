#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "geometry/qv_shape.h"
#include "polygon_area.h"

namespace qvtl::geometry {
namespace {

using waveform_test::reversed, waveform_test::square;

size_t depthOf(const Shape2f& node) {
  size_t depth = 0;
  for (const Shape2f& child : node.children)
    depth = std::max(depth, depthOf(child) + 1);
  return depth;
}

// The loops below `node`, each checked to carry `id` unless that is 0.
size_t loopsBelow(const Shape2f& node, uint32_t id = 0) {
  size_t count = 0;
  for (const Shape2f& child : node.children) {
    EXPECT_TRUE(id == 0 || child.path.id == id);
    count += 1 + loopsBelow(child, id);
  }
  return count;
}

// A letter O beside a square: the hole goes below the outer loop in either order.
TEST(Shapes, LetterOIsOuterWithItsHoleInEitherOrder) {
  for (const bool holeFirst : {false, true}) {
    SCOPED_TRACE(holeFirst);
    Shape2f shape;
    const Path2f outer = makePath(square(0, 0, 10, 10), 1);
    const Path2f hole = makePath(reversed(square(3, 3, 7, 7)), 2);
    addPath(shape, makePath(square(20, 0, 30, 10), 3));
    addPath(shape, holeFirst ? hole : outer);
    addPath(shape, holeFirst ? outer : hole);
    ASSERT_EQ(shape.children.size(), 2u);
    const Shape2f& top = shape.children[0].path.id == 1 ? shape.children[0] : shape.children[1];
    EXPECT_EQ(top.path.id, 1u);
    ASSERT_EQ(top.children.size(), 1u);
    EXPECT_EQ(top.children[0].path.id, 2u);
    EXPECT_EQ(top.children[0].path.orientation, kClockwise);
    const std::vector<const Shape2f*> pieces = collectFilledPieces(shape);
    EXPECT_EQ(pieces.size(), 2u);
    EXPECT_EQ(std::count(pieces.begin(), pieces.end(), &top), 1);
  }
}

TEST(Shapes, ContainsPath) {
  const Path2f outer = makePath(square(0, 0, 10, 10));
  struct Case {
    const char* name;
    PointList inner;
    bool allowOverlap;
    bool expected;
  };
  const Case cases[] = {
      {"inside", square(1, 1, 2, 2), false, true},
      {"outside", square(20, 20, 21, 21), true, false},
      {"mostly inside, overlap allowed", square(1, 1, 10.5f, 9), true, true},
      {"mostly inside, overlap not allowed", square(1, 1, 10.5f, 9), false, false},
      {"mostly outside, overlap allowed", square(9, 1, 18, 9), true, false},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(containsPath(makePath(c.inner), outer, c.allowOverlap), c.expected) << c.name;
  }
  EXPECT_FALSE(containsPath(makePath(square(1, 1, 2, 2)), makePath({{0, 0}, {10, 10}}), true));
  EXPECT_FALSE(containsPath(Path2f{}, outer, true));
}

TEST(Shapes, FigureEightSplitsAtItsCrossing) {
  Shape2f shape;
  addPath(shape, makePath({{0, 0}, {2, 2}, {2, 0}, {0, 2}}, 5));
  ASSERT_EQ(shape.children.size(), 2u);
  std::vector<std::array<float, 4>> bounds;
  for (const Shape2f& loop : shape.children) {
    EXPECT_EQ(loop.path.points.size(), 3u);
    EXPECT_EQ(loop.path.id, 5u);
    EXPECT_NE(loop.path.orientation, kUndetermined);
    bounds.push_back(loop.path.bounds);
  }
  std::sort(bounds.begin(), bounds.end());
  EXPECT_EQ(bounds[0], (std::array<float, 4>{0, 0, 1, 2}));
  EXPECT_EQ(bounds[1], (std::array<float, 4>{1, 0, 2, 2}));
}

TEST(Shapes, ClockwiseLoopsKeepTheirDirectionAfterSplitting) {
  // A clockwise square whose right side makes a crossed loop outward.
  const PointList points = reversed({{0, 0}, {4, 0}, {4, 1}, {6, 3}, {6, 2}, {4, 4}, {0, 4}});
  const std::vector<Path2f> loops = splitSelfIntersections(makePath(points, 3));
  ASSERT_EQ(loops.size(), 2u);
  for (const Path2f& loop : loops) {
    EXPECT_EQ(loop.id, 3u);
    EXPECT_GE(loop.points.size(), 3u);
  }
  const Path2f& big = loops[0].bounds[0] == 0 ? loops[0] : loops[1];
  EXPECT_EQ(big.orientation, kClockwise);
  EXPECT_EQ(big.bounds, (std::array<float, 4>{0, 0, 5.5f, 4}));
}

TEST(Shapes, RevisitedPointSplitsIntoTwoLoops) {
  const PointList points{{0, 0}, {1, 0}, {1, 1}, {2, 1}, {2, 2}, {1, 2}, {1, 1}, {0, 1}};
  Path2f path;
  path.points = points;
  path.id = 4;
  const std::vector<Path2f> loops = splitTouchingPoints(path);
  ASSERT_EQ(loops.size(), 2u);
  EXPECT_EQ(loops[0].points, square(1, 1, 2, 2));
  EXPECT_EQ(loops[1].points, square(0, 0, 1, 1));
  for (const Path2f& loop : loops) {
    EXPECT_EQ(loop.id, 4u);
    EXPECT_EQ(loop.orientation, kCounterClockwise);
  }

  Shape2f shape;
  addPath(shape, makePath(points, 4));
  EXPECT_EQ(shape.children.size(), 2u);
}

TEST(Shapes, FlipOrientationTurnsTheWholeSubtree) {
  Shape2f shape;
  addPath(shape, makePath(reversed(square(0, 0, 10, 10)), 1));
  addPath(shape, makePath(square(3, 3, 7, 7), 2));
  addPath(shape, makePath(reversed(square(4, 4, 5, 5)), 3));
  ASSERT_EQ(depthOf(shape), 3u);
  flipOrientation(shape.children[0]);
  const Shape2f& outer = shape.children[0];
  EXPECT_EQ(outer.path.orientation, kCounterClockwise);
  EXPECT_EQ(outer.path.points, reversed(makePath(reversed(square(0, 0, 10, 10))).points));
  EXPECT_EQ(outer.children[0].path.orientation, kClockwise);
  EXPECT_EQ(outer.children[0].children[0].path.orientation, kCounterClockwise);
  EXPECT_EQ(computeOrientation(outer.children[0].children[0].path), kCounterClockwise);
}

TEST(Shapes, HolesOfAPiece) {
  Shape2f piece;
  piece.path = makePath(square(0, 0, 10, 10), 1);
  const Path2f clockwiseChild = makePath(reversed(square(1, 1, 2, 2)), 2);
  const Path2f otherIdChild = makePath(square(3, 3, 4, 4), 3);
  const Path2f sameIdChild = makePath(square(5, 5, 6, 6), 1);
  for (const Path2f& child : {clockwiseChild, otherIdChild, sameIdChild}) {
    piece.children.push_back(Shape2f{child, {}});
  }
  EXPECT_EQ(pieceHoles(piece),
            (std::vector<PointList>{clockwiseChild.points, reversed(otherIdChild.points)}));
  // Children are visited before their parent; the clockwise child is not filled.
  const std::vector<const Shape2f*> pieces = collectFilledPieces(piece);
  ASSERT_EQ(pieces.size(), 3u);
  EXPECT_EQ(pieces.back(), &piece);
}

TEST(Shapes, DegenerateContoursContributeNoPiece) {
  const float nan = std::nanf("");
  const PointList inputs[] = {
      {},
      {{1, 1}},
      {{0, 0}, {1, 1}},
      {{2, 2}, {2, 2}, {2, 2}, {2, 2}},
      {{0, 0}, {1, 0}, {2, 0}, {3, 0}},
      {{0, 0}, {1, 0}, {nan, 1}, {0, 1}},
  };
  for (const PointList& points : inputs) {
    Shape2f shape;
    addPath(shape, makePath(points, 1));
    EXPECT_TRUE(collectFilledPieces(shape).empty()) << points.size();
  }
}

TEST(Shapes, StarCrossingItselfThousandsOfTimesIsSplitWithinBounds) {
  constexpr int kPoints = 2000;
  PointList star;
  for (int i = 0; i < kPoints; ++i) {
    const double angle = 2 * 3.14159265358979 * ((i * 701) % kPoints) / kPoints;
    star.push_back(
        {static_cast<float>(100 * std::cos(angle)), static_cast<float>(100 * std::sin(angle))});
  }
  Shape2f shape;
  addPath(shape, makePath(star, 9));
  const size_t count = loopsBelow(shape, 9);
  EXPECT_GT(count, 1u);
  EXPECT_LE(count, kMaxLoopsPerPath);
  EXPECT_LE(depthOf(shape), kMaxShapeDepth);
}

TEST(Shapes, DeepNestingIsCapped) {
  for (const bool outsideIn : {true, false}) {
    Shape2f shape;
    constexpr int kSquares = 200;
    for (int k = 0; k < kSquares; ++k) {
      const float d = static_cast<float>(outsideIn ? k : kSquares - 1 - k);
      addPath(shape, makePath(square(d, d, 1000 - d, 1000 - d), static_cast<uint32_t>(k + 1)));
    }
    EXPECT_EQ(loopsBelow(shape), static_cast<size_t>(kSquares)) << outsideIn;
    EXPECT_EQ(depthOf(shape), kMaxShapeDepth) << outsideIn;
  }
}

}  // namespace
}  // namespace qvtl::geometry
