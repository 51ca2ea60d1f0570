#include "geometry/curves.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

namespace vesk::plugin::lib {
namespace {

// Component-wise arithmetic in float, in the order the differencing formulas are written, so that
// the sample points come out the same on every build.
Point2f operator+(Point2f a, Point2f b) {
  return {a.x + b.x, a.y + b.y};
}
Point2f operator-(Point2f a, Point2f b) {
  return {a.x - b.x, a.y - b.y};
}
Point2f operator-(Point2f a) {
  return {-a.x, -a.y};
}
Point2f operator*(float s, Point2f a) {
  return {s * a.x, s * a.y};
}
Point2f operator*(Point2f a, float s) {
  return {a.x * s, a.y * s};
}

// Room for `steps` more points. Capacity still grows geometrically, so that flattening a long
// contour curve by curve does not reallocate on every curve.
void reserveSteps(float steps, PointList& points) {
  // The negated comparison also rejects NaN; absurd step counts reserve nothing (the loop, not the
  // reservation, decides what is appended).
  if (!(steps > 0.0f) || steps > 1.0e6f) {
    return;
  }
  const std::size_t wanted = points.size() + static_cast<std::size_t>(steps);
  if (wanted > points.capacity()) {
    points.reserve(std::max(wanted, 2 * points.capacity()));
  }
}

// A sample is kept only when it lies more than one pixel from the last kept point along x or
// along y; nearer samples add nothing visible at pixel scale.
bool farEnough(Point2f p, Point2f last) {
  return std::fabs(p.x - last.x) > 1.0f || std::fabs(p.y - last.y) > 1.0f;
}

// Appends `start`, then walks `steps - 1` forward-difference steps from it, each adding the first
// difference `d` and then letting `advance` update the differences, and appends every sample
// more than a pixel from the last appended one.
template <typename Advance>
void walkDifferences(Point2f start, Point2f d, float steps, PointList& points, Advance advance) {
  reserveSteps(steps, points);
  Point2f p = start;
  points.push_back(p);
  Point2f last = p;
  if (steps - 1.0f > 0.0f) {
    long i = 0;
    do {
      p = p + d;
      if (farEnough(p, last)) {
        points.push_back(p);
        last = p;
      }
      ++i;
      advance(d);
    } while (steps - 1.0f > static_cast<float>(i));
  }
}

}  // namespace

LinearCurve::LinearCurve(Point2f start, Point2f end) : start_(start), end_(end) {}

// The end point is the next curve's start point, appended by that curve.
void LinearCurve::flatten(float /*steps*/, float /*step*/, float /*step2*/, float /*step3*/,
                          PointList& points) const {
  points.push_back(start_);
}

QuadraticCurve::QuadraticCurve(Point2f start, Point2f control, Point2f end)
    : start_(start), control_(control), end_(end) {}

// Forward differencing of B(t) = P0 + 2(C - P0)t + A t^2 with A = P0 - 2C + P2: the first
// difference starts at 2(C - P0)h + A h^2 and grows by the constant 2A h^2 each step.
void QuadraticCurve::flatten(float steps, float step, float step2, float /*step3*/,
                             PointList& points) const {
  const Point2f a = start_ - 2.0f * control_ + end_;
  const Point2f d = 2.0f * (control_ - start_) * step + a * step2;
  const Point2f e = 2.0f * a * step2;
  walkDifferences(start_, d, steps, points, [&](Point2f& first) { first = first + e; });
}

CubicCurve::CubicCurve(Point2f start, Point2f control1, Point2f control2, Point2f end)
    : start_(start), control1_(control1), control2_(control2), end_(end) {}

// Forward differencing of B(t) = a t^3 + b t^2 + c t + P0 with three differences: the first
// starts at c h + b h^2 + a h^3, the second at 2b h^2 + 6a h^3, the third is the constant 6a h^3.
void CubicCurve::flatten(float steps, float step, float step2, float step3,
                         PointList& points) const {
  const Point2f a = -start_ + 3.0f * control1_ - 3.0f * control2_ + end_;
  const Point2f b = 3.0f * start_ - 6.0f * control1_ + 3.0f * control2_;
  const Point2f c = 3.0f * control1_ - 3.0f * start_;
  const Point2f d = c * step + b * step2 + a * step3;
  Point2f e = 2.0f * b * step2 + 6.0f * a * step3;
  const Point2f f = 6.0f * a * step3;
  walkDifferences(start_, d, steps, points, [&](Point2f& first) {
    first = first + e;
    e = e + f;
  });
}

}  // namespace vesk::plugin::lib
