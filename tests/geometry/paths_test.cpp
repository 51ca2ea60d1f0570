#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <tuple>

#include "geometry/qv_path.h"
#include "polygon_area.h"

namespace qvtl::geometry {
namespace {

using waveform_test::reversed;

const PointList kUnitSquare{{0, 0}, {1, 0}, {1, 1}, {0, 1}};  // counter-clockwise, y up

TEST(Paths, CleanPathRemovesRepeatsAndSpikesButKeepsCollinearPoints) {
  struct Case {
    const char* name;
    PointList input;
    PointList expected;
  };
  const Case cases[] = {
      {"each point twice",
       {{0, 0}, {0, 0}, {1, 0}, {1, 0}, {1, 1}, {1, 1}, {0, 1}, {0, 1}},
       kUnitSquare},
      {"spike out and back", {{0, 0}, {1, 0}, {2, -1}, {1, 0}, {1, 1}, {0, 1}}, kUnitSquare},
      {"spike left behind by a removal",
       {{0, 0}, {2, 0}, {3, 0}, {1, 0}, {1, 1}, {0, 1}},
       kUnitSquare},
      {"collinear midpoint",
       {{0, 0}, {0.5f, 0}, {1, 0}, {1, 1}, {0, 1}},
       {{0, 0}, {0.5f, 0}, {1, 0}, {1, 1}, {0, 1}}},
  };
  for (const Case& c : cases) {
    Path2f path;
    path.points = c.input;
    cleanPath(path);
    EXPECT_EQ(path.points, c.expected) << c.name;
  }
}

TEST(Paths, OrientationByWinding) {
  struct Case {
    const char* name;
    PointList points;
    Orientation expected;
  };
  const Case cases[] = {
      {"counter-clockwise square", kUnitSquare, kCounterClockwise},
      {"clockwise square", reversed(kUnitSquare), kClockwise},
      {"points on a line", {{0, 0}, {1, 0}, {2, 0}}, kUndetermined},
      {"all points equal", {{3, 3}, {3, 3}, {3, 3}, {3, 3}}, kUndetermined},
      {"two points", {{0, 0}, {1, 1}}, kUndetermined},
      {"empty", {}, kUndetermined},
  };
  for (const Case& c : cases) {
    Path2f path;
    path.points = c.points;
    EXPECT_EQ(computeOrientation(path), c.expected) << c.name;
  }
}

TEST(Paths, MakePathSetsOrientationBoundsAndId) {
  const Path2f path = makePath({{2, 1}, {2, 1}, {5, 1}, {5, 4}, {2, 4}}, 7);
  EXPECT_EQ(std::make_tuple(path.points.size(), path.orientation, path.bounds, path.id),
            std::make_tuple(size_t{4}, kCounterClockwise, std::array<float, 4>{2, 1, 5, 4}, 7u));
}

TEST(Paths, ThousandsOfCollinearPointsStayAndKeepTheWinding) {
  PointList points;
  for (int i = 0; i < 1000; ++i)
    points.push_back({i * 1.0f, 0});
  for (int i = 0; i < 1000; ++i)
    points.push_back({1000, i * 1.0f});
  for (int i = 0; i < 1000; ++i)
    points.push_back({1000 - i * 1.0f, 1000});
  for (int i = 0; i < 1000; ++i)
    points.push_back({0, 1000 - i * 1.0f});
  const Path2f path = makePath(points);
  EXPECT_EQ(path.points.size(), 4000u);
  EXPECT_EQ(path.orientation, kCounterClockwise);
}

TEST(Paths, SignedDistanceIsPositiveInside) {
  struct Case {
    PointList points;
    Point2f query;
    float expected;
  };
  const Case cases[] = {
      {kUnitSquare, {0.5f, 0.5f}, 0.5f},       {kUnitSquare, {2, 0.5f}, -1},
      {kUnitSquare, {0.5f, -3}, -3},           {reversed(kUnitSquare), {0.5f, 0.75f}, 0.25f},
      {reversed(kUnitSquare), {-1, 0.5f}, -1}, {{{0, 0}, {1, 1}}, {0, 0}, 1e7f},
  };
  for (const Case& c : cases) {
    const Path2f path = makePath(c.points);
    EXPECT_NEAR(signedDistance(path, c.query), c.expected, 1e-6f) << c.query.x << ", " << c.query.y;
  }
}

}  // namespace
}  // namespace qvtl::geometry
