#include "geometry/curves.h"

#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <string>
#include <vector>

namespace {

using qvtl::geometry::Point2f, qvtl::geometry::PointList;
using vesk::plugin::lib::AbstractCurve, vesk::plugin::lib::CubicCurve,
    vesk::plugin::lib::LinearCurve, vesk::plugin::lib::QuadraticCurve;

// The parameters the font flattens glyph curves with.
constexpr float kSteps = 10.0f, kStep = 0.1f, kStep2 = 0.01f, kStep3 = 0.001f;

PointList flattened(const AbstractCurve& curve) {
  PointList points;
  curve.flatten(kSteps, kStep, kStep2, kStep3, points);
  return points;
}

std::string describe(const PointList& points) {
  std::string text;
  for (const Point2f& p : points) {
    text += "(" + std::to_string(p.x) + ", " + std::to_string(p.y) + ") ";
  }
  return text;
}

// The Bezier curves evaluated directly, in double.
Point2f quadraticAt(Point2f p0, Point2f c, Point2f p2, double t) {
  const double u = 1 - t;
  return {static_cast<float>(u * u * p0.x + 2 * u * t * c.x + t * t * p2.x),
          static_cast<float>(u * u * p0.y + 2 * u * t * c.y + t * t * p2.y)};
}

Point2f cubicAt(Point2f p0, Point2f c1, Point2f c2, Point2f p3, double t) {
  const double u = 1 - t;
  const double w0 = u * u * u, w1 = 3 * u * u * t, w2 = 3 * u * t * t, w3 = t * t * t;
  return {static_cast<float>(w0 * p0.x + w1 * c1.x + w2 * c2.x + w3 * p3.x),
          static_cast<float>(w0 * p0.y + w1 * c1.y + w2 * c2.y + w3 * p3.y)};
}

void expectPoints(const PointList& points, const PointList& expected, float tolerance,
                  const std::string& name) {
  ASSERT_EQ(points.size(), expected.size()) << name << ": " << describe(points);
  for (size_t i = 0; i < points.size(); ++i) {
    EXPECT_NEAR(points[i].x, expected[i].x, tolerance) << name << " point " << i;
    EXPECT_NEAR(points[i].y, expected[i].y, tolerance) << name << " point " << i;
  }
}

// Curves that move more than a pixel per step keep every sample: the differencing visits
// t = 0.1 ... 0.9 and never the end point. The sums accumulate float rounding, on curves a few
// hundred pixels wide about 1e-4 pixel: far below FreeType's 1/64 pixel resolution.
TEST(CurveFlattening, ForwardDifferencingMatchesTheCurveAtTenthsOfT) {
  const Point2f p0{3, -40}, c{90, 160}, p2{200, 20};
  const Point2f q0{-50, 10}, c1{0, 180}, c2{160, -120}, q3{210, 60};
  PointList quadratic, cubic;
  for (int k = 0; k < 10; ++k) {
    quadratic.push_back(quadraticAt(p0, c, p2, k / 10.0));
    cubic.push_back(cubicAt(q0, c1, c2, q3, k / 10.0));
  }
  expectPoints(flattened(QuadraticCurve(p0, c, p2)), quadratic, 5e-4f, "quadratic");
  expectPoints(flattened(CubicCurve(q0, c1, c2, q3)), cubic, 5e-4f, "cubic");
}

// Straight curves with evenly spaced control points move by exactly the same amount each step,
// which makes the one-pixel rule visible: a sample exactly one pixel away (in x and in y) is
// dropped, one slightly further in either is kept.
TEST(CurveFlattening, KeepsOnlySamplesMoreThanOnePixelAway) {
  struct Case {
    const char* name;
    std::shared_ptr<AbstractCurve> curve;
    PointList expected;
  };
  const Case cases[] = {
      {"quadratic, 1 px in x",
       std::make_shared<QuadraticCurve>(Point2f{0, 0}, Point2f{5, 0}, Point2f{10, 0}),
       {{0, 0}, {2, 0}, {4, 0}, {6, 0}, {8, 0}}},
      {"quadratic, 1 px in x and y",
       std::make_shared<QuadraticCurve>(Point2f{0, 0}, Point2f{5, 5}, Point2f{10, 10}),
       {{0, 0}, {2, 2}, {4, 4}, {6, 6}, {8, 8}}},
      {"quadratic, 1 px in x, 2 px in y",
       std::make_shared<QuadraticCurve>(Point2f{0, 0}, Point2f{5, 10}, Point2f{10, 20}),
       {{0, 0}, {1, 2}, {2, 4}, {3, 6}, {4, 8}, {5, 10}, {6, 12}, {7, 14}, {8, 16}, {9, 18}}},
      {"cubic, 1 px in y",
       std::make_shared<CubicCurve>(Point2f{0, 0}, Point2f{0, 10.0f / 3}, Point2f{0, 20.0f / 3},
                                    Point2f{0, 10}),
       {{0, 0}, {0, 2}, {0, 4}, {0, 6}, {0, 8}}},
      {"cubic, 3 px in x",
       std::make_shared<CubicCurve>(Point2f{0, 0}, Point2f{10, 0}, Point2f{20, 0}, Point2f{30, 0}),
       {{0, 0}, {3, 0}, {6, 0}, {9, 0}, {12, 0}, {15, 0}, {18, 0}, {21, 0}, {24, 0}, {27, 0}}},
  };
  for (const Case& c : cases) {
    expectPoints(flattened(*c.curve), c.expected, 1e-5f, c.name);
  }
}

// A straight curve appends its start only, and so does a curve within one pixel of its start or
// flattened in at most one step.
TEST(CurveFlattening, StraightOrShortCurvesOrSingleStepsGiveTheStartOnly) {
  PointList points{{7, 7}};
  LinearCurve({1, 2}, {30, 40}).flatten(kSteps, kStep, kStep2, kStep3, points);
  EXPECT_EQ(points, (PointList{{7, 7}, {1, 2}}));
  const Point2f near{10.25f, 20.5f};
  EXPECT_EQ(flattened(QuadraticCurve(near, {11.2f, 21.0f}, {10.5f, 21.4f})), PointList{near});
  EXPECT_EQ(flattened(CubicCurve(near, {11.2f, 21.0f}, {10.0f, 21.5f}, {11.0f, 20.0f})),
            PointList{near});
  const Point2f start{0, 0};
  const QuadraticCurve quadratic(start, {50, 100}, {100, 0});
  const CubicCurve cubic(start, {0, 100}, {100, 100}, {100, 0});
  for (float steps : {1.0f, 0.5f, 0.0f, -3.0f}) {
    PointList points;
    quadratic.flatten(steps, kStep, kStep2, kStep3, points);
    EXPECT_EQ(points, PointList{start}) << "quadratic, steps " << steps;
    points.clear();
    cubic.flatten(steps, kStep, kStep2, kStep3, points);
    EXPECT_EQ(points, PointList{start}) << "cubic, steps " << steps;
  }
}

}  // namespace
