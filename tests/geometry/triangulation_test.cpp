#include "geometry/triangulation.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <random>
#include <string>

#include "polygon_area.h"

namespace qvtl::geometry {
namespace {

using waveform_test::insideRing, waveform_test::reversed, waveform_test::signedArea,
    waveform_test::square;

double coveredArea(const TriangulationResult& result) {
  std::vector<uint32_t> indices;
  for (const Triangle& t : result.triangles) {
    indices.insert(indices.end(), t.begin(), t.end());
  }
  return waveform_test::trianglesArea(result.vertices, indices);
}

// The filled area: inside the outer ring and outside every hole.
double filledArea(const PointList& outer, const std::vector<PointList>& holes) {
  double area = std::fabs(signedArea(outer));
  for (const PointList& hole : holes) {
    area -= std::fabs(signedArea(hole));
  }
  return area;
}

// Samples a grid of points (offset so that none lies on an edge) over the outer ring's bounds and
// counts the triangles holding each: one inside the filled area, none elsewhere.
void expectCoveredOnce(const PointList& outer, const std::vector<PointList>& holes,
                       const TriangulationResult& result, int steps = 41) {
  float minX = outer[0].x, maxX = outer[0].x, minY = outer[0].y, maxY = outer[0].y;
  for (const Point2f& p : outer) {
    minX = std::min(minX, p.x), maxX = std::max(maxX, p.x);
    minY = std::min(minY, p.y), maxY = std::max(maxY, p.y);
  }
  int mistakes = 0;
  for (int i = 0; i < steps; ++i) {
    for (int j = 0; j < steps; ++j) {
      const double x = minX + (maxX - minX) * (i + 0.4142) / steps;
      const double y = minY + (maxY - minY) * (j + 0.2718) / steps;
      bool filled = insideRing(outer, x, y);
      for (const PointList& hole : holes) {
        filled = filled && !insideRing(hole, x, y);
      }
      int count = 0;
      for (const Triangle& t : result.triangles) {
        const auto& v = result.vertices;
        count += insideRing({v[t[0]], v[t[1]], v[t[2]]}, x, y) ? 1 : 0;
      }
      if (count != (filled ? 1 : 0) && ++mistakes <= 5) {
        ADD_FAILURE() << "(" << x << ", " << y << ") covered " << count << " times, filled "
                      << filled;
      }
    }
  }
}

// Star-shaped around (cx, cy), counter-clockwise: radii between the two at evenly spaced angles.
PointList star(int count, float cx, float cy, const std::function<float()>& radius) {
  PointList ring;
  for (int i = 0; i < count; ++i) {
    const double a = 2 * M_PI * i / count;
    const float r = radius();
    ring.push_back(
        {cx + r * static_cast<float>(std::cos(a)), cy + r * static_cast<float>(std::sin(a))});
  }
  return ring;
}
PointList regularPolygon(int count, float radius) {
  return star(count, 0, 0, [radius] { return radius; });
}
PointList randomStar(std::mt19937& random, int count, float minRadius, float maxRadius, float cx,
                     float cy) {
  std::uniform_real_distribution<float> radius(minRadius, maxRadius);
  return star(count, cx, cy, [&] { return radius(random); });
}

TriangulationGraph graphOf(const PointList& points) {
  TriangulationGraph graph;
  for (const Point2f& p : points) {
    graph.addVertex(p);
  }
  return graph;
}
TriangulationRing ringOf(size_t count) {
  TriangulationRing ring;
  for (uint32_t i = 0; i < count; ++i) {
    ring.push_back({i, 0.0f});
  }
  return ring;
}

TEST(EarScore, ScoresEveryCornerOfAnLShape) {
  const PointList l{{0, 0}, {2, 0}, {2, 1}, {1, 1}, {1, 2}, {0, 2}};
  const std::vector<float> expected{kNotAnEar, 0.5f, 0.5f, kReflexEar, 0.5f, 0.5f};
  const TriangulationGraph graph = graphOf(l);
  for (size_t i = 0; i < l.size(); ++i) {
    EXPECT_FLOAT_EQ(earScore(graph, ringOf(l.size()), i), expected[i]) << "corner " << i;
  }
  const TriangulationGraph shapes = graphOf({{0, 0}, {2, 0}, {4, 0}, {-1, 1.7320508f}});
  EXPECT_EQ(earScore(shapes, ringOf(4), 1), kNotAnEar);      // straight
  EXPECT_NEAR(earScore(shapes, ringOf(4), 0), 0.25f, 1e-6);  // 120 degrees
  // An edge crosses the diagonal of the ear at (2, -2) although no vertex lies in it.
  const TriangulationGraph crossed = graphOf({{0, 0}, {2, -2}, {4, 0}, {1, 1}, {3, -3}});
  EXPECT_EQ(earScore(crossed, ringOf(5), 1), kNotAnEar);
  EXPECT_EQ(earScore(crossed, ringOf(3), 1), 0.5f);
}

TEST(ClipEars, StopsAtTheIterationCapAndRecordsDiagonals) {
  TriangulationGraph graph = graphOf(square(0, 0, 1, 1));
  TriangulationRing ring = ringOf(4);
  std::vector<Triangle> triangles;
  clipEars(graph, ring, 1, triangles);
  ASSERT_EQ(triangles.size(), 1u);
  EXPECT_EQ(triangles[0], (Triangle{1, 0, 3}));  // (next, apex, previous)
  EXPECT_EQ(ring.size(), 3u);
  EXPECT_EQ(graph.vertices()[1].neighbours, (std::vector<uint32_t>{3}));
  clipEars(graph, ring, 99999999, triangles);
  EXPECT_EQ(triangles.size(), 2u);
  EXPECT_EQ(ring.size(), 2u);
}

TEST(TriangulatePolygon, StartsAtTheSharpestCornerFirstOnTies) {
  const PointList kite{{0, 0}, {10, -1}, {12, 0}, {10, 1}};
  struct Case {
    std::string name;
    PointList ring;
    uint32_t apex;
  } cases[] = {
      {"kite", kite, 0},
      {"kite turned", {kite[2], kite[3], kite[0], kite[1]}, 2},
      {"square ties", square(0, 0, 1, 1), 0},
      {"hexagon ties", regularPolygon(6, 5), 0},
      {"triangle", {{0, 0}, {5, 0}, {0, 1}}, 1},
  };
  for (const Case& c : cases) {
    const TriangulationResult result = triangulatePolygon(c.ring, {}, 99999999);
    ASSERT_EQ(result.triangles.size(), c.ring.size() - 2) << c.name;
    EXPECT_EQ(result.vertices, c.ring) << c.name;
    EXPECT_EQ(result.triangles[0][1], c.apex) << c.name;
    EXPECT_NEAR(coveredArea(result), signedArea(c.ring), 1e-4) << c.name;
  }
}

PointList comb(int teeth) {
  PointList ring{{0, 0}, {static_cast<float>(2 * teeth), 0}};
  for (int i = teeth; i > 0; --i) {
    ring.insert(ring.end(),
                {{2.0f * i, 5}, {2.0f * i - 1, 5}, {2.0f * i - 1, 1}, {2.0f * i - 2, 1}});
  }
  ring.back().y = 5;
  return ring;
}

PointList spiral(int turns, int perTurn) {
  PointList inner, ring;
  for (int i = 0; i <= turns * perTurn; ++i) {
    const double a = 2 * M_PI * i / perTurn, r = 1 + a;
    inner.push_back({static_cast<float>(r * std::cos(a)), static_cast<float>(r * std::sin(a))});
    ring.push_back(
        {static_cast<float>((r + 3) * std::cos(a)), static_cast<float>((r + 3) * std::sin(a))});
  }
  ring.insert(ring.end(), inner.rbegin(), inner.rend());
  return ring;
}

TEST(TriangulatePolygon, CoversTheFilledAreaOnce) {
  const PointList ten = square(0, 0, 10, 10);
  struct Case {
    std::string name;
    PointList outer;
    std::vector<PointList> holes;
  } cases[] = {
      {"letter O", ten, {reversed(square(3, 3, 7, 7))}},
      {"hole given counter-clockwise", ten, {square(3, 3, 7, 7)}},
      {"outer given clockwise", reversed(ten), {reversed(square(3, 3, 7, 7))}},
      {"two holes", ten, {reversed(square(1, 1, 4, 9)), reversed(square(6, 1, 9, 9))}},
      {"holes sharing a rightmost x",
       ten,
       {reversed(square(1, 1, 4, 4)), reversed(square(1, 6, 4, 9)), reversed(square(6, 2, 9, 8))}},
      {"free triangle hole", ten, {{{2.3f, 4.1f}, {3.7f, 7.9f}, {5.9f, 3.3f}}}},
      {"hole in a concave outer",
       {{0, 0}, {10, 0}, {10, 10}, {6, 10}, {6, 4}, {4, 4}, {4, 10}, {0, 10}},
       {reversed(square(1, 1, 3, 8))}},
      {"octagon with octagon hole", regularPolygon(8, 10), {reversed(regularPolygon(8, 6))}},
      // A letter A made of an inverted V and an overlapping bar, after their union: the hole's
      // lower right corner lies on the line of the notch's right edge, which leaves a zero-width
      // spike in the ring once the triangles beside it are clipped.
      {"hole corner in line with an outer edge",
       {{8.87722301f, 10},
        {23.2003765f, 10},
        {26.640625f, 0},
        {31.078125f, 0},
        {18.078125f, 36},
        {14.171875f, 36},
        {0.9375f, 0},
        {5.359375f, 0}},
       {{{10.1689329f, 13.671875f},
         {15.984375f, 30.203125f},
         {16.25f, 30.203125f},
         {21.9371605f, 13.671875f}}}},
      // The non-zero union of overlapping contours leaves holes that touch their outer ring or
      // each other at a point, as in a star with an open centre.
      {"hole touching the outer at two corners, cutting it in two",
       {{0, 0}, {10, 0}, {10, 5}, {10, 10}, {0, 10}, {0, 5}},
       {{{0, 5}, {5, 7}, {10, 5}, {5, 3}}}},
      {"holes touching at a point",
       ten,
       {{{2, 2}, {2, 8}, {5, 5}}, {{8, 8}, {8, 2}, {5, 5}}, {{3.5f, 9}, {6.5f, 9}, {5, 5}}}},
      {"comb", comb(7), {}},
      {"comb of one tooth", comb(1), {}},
      {"spiral", spiral(3, 24), {}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    const TriangulationResult result = triangulatePolygon(c.outer, c.holes, 99999999);
    const double expected = filledArea(c.outer, c.holes);
    EXPECT_NEAR(coveredArea(result), expected, 1e-4 * expected);
    expectCoveredOnce(c.outer, c.holes, result, 61);
  }
}

// A grid of random holes in a random outer ring; a ring of many points.
TEST(TriangulatePolygon, RandomHolesAndLargeRingsKeepTheirArea) {
  for (unsigned seed = 1; seed <= 10; ++seed) {
    SCOPED_TRACE("seed " + std::to_string(seed));
    std::mt19937 random(seed);
    const PointList outer = randomStar(random, 40, 95, 100, 0, 0);
    std::vector<PointList> holes;
    for (int gx = -1; gx <= 1; ++gx) {
      for (int gy = -1; gy <= 1; ++gy) {
        holes.push_back(reversed(randomStar(random, 3 + static_cast<int>(random() % 20), 5, 20,
                                            40.0f * gx, 40.0f * gy)));
      }
    }
    const TriangulationResult result = triangulatePolygon(outer, holes, 99999999);
    const double expected = filledArea(outer, holes);
    EXPECT_NEAR(coveredArea(result), expected, 1e-4 * expected);
    expectCoveredOnce(outer, holes, result, 31);
  }
  const PointList circle = regularPolygon(5000, 100);
  const TriangulationResult result = triangulatePolygon(circle, {}, 99999999);
  EXPECT_EQ(result.triangles.size(), circle.size() - 2);
  EXPECT_NEAR(coveredArea(result), signedArea(circle), 1e-4 * signedArea(circle));
}

TEST(TriangulatePolygon, DegenerateInputGivesNoArea) {
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const float inf = std::numeric_limits<float>::infinity();
  PointList line;
  for (int i = 0; i < 3000; ++i) {
    line.push_back({static_cast<float>(i), 2.0f * i});
  }
  struct Case {
    std::string name;
    PointList outer;
    std::vector<PointList> holes;
    size_t triangles;
  } cases[] = {
      {"empty", {}, {}, 0},
      {"two points", {{0, 0}, {1, 1}}, {}, 0},
      {"all points equal", PointList(10, {3, 3}), {}, 0},
      {"collinear", line, {}, line.size() - 2},
      {"NaN", {{0, 0}, {1, 0}, {nan, 1}}, {}, 0},
      {"infinite hole point", square(0, 0, 4, 4), {{{1, 1}, {inf, 1}, {1, 2}}}, 0},
      {"too many points", regularPolygon(kMaxTriangulationPoints + 1, 100), {}, 0},
  };
  for (const Case& c : cases) {
    const TriangulationResult result = triangulatePolygon(c.outer, c.holes, 99999999);
    EXPECT_EQ(result.triangles.size(), c.triangles) << c.name;
    EXPECT_NEAR(coveredArea(result), 0.0, 1e-6) << c.name;
  }
  // A self-crossing ring has no valid triangulation but still ends with n - 2 triangles.
  EXPECT_EQ(triangulatePolygon({{0, 0}, {2, 2}, {2, 0}, {0, 2}}, {}, 99999999).triangles.size(),
            2u);
  // Holes of fewer than 3 distinct points or no area are left out.
  const TriangulationResult result = triangulatePolygon(
      square(0, 0, 4, 4), {{{1, 1}, {2, 2}}, {{1, 1}, {2, 1}, {3, 1}}}, 99999999);
  EXPECT_EQ(result.vertices.size(), 9u);
  EXPECT_NEAR(coveredArea(result), 16.0, 1e-9);
}

}  // namespace
}  // namespace qvtl::geometry
