#include "geometry/qv_path.h"

#include <algorithm>
#include <cmath>
#include <vector>

namespace qvtl::geometry {
namespace {

constexpr double kPi = 3.14159265358979323846;
// A turn whose cosine lies below this counts as a reversal when deciding the orientation.
constexpr float kNearReversalCosine = -0.999f;

Point2f minus(Point2f a, Point2f b) {
  return {a.x - b.x, a.y - b.y};
}
float dot(Point2f a, Point2f b) {
  return a.x * b.x + a.y * b.y;
}
float cross(Point2f a, Point2f b) {
  return a.x * b.y - a.y * b.x;
}
float lengthSquared(Point2f a) {
  return dot(a, a);
}
// An edge too short to give a direction: its squared length is (approximately) 0.
bool isZeroLength(Point2f edge) {
  return approxEqual(lengthSquared(edge), 0.0f);
}

// The cosine of the angle between the incoming and the outgoing edge of a corner whose edges are
// both of non-zero length.
float turnCosine(Point2f in, Point2f out) {
  return dot(in, out) / (std::sqrt(lengthSquared(in)) * std::sqrt(lengthSquared(out)));
}

// Walks the closed point list forward and removes every point for which
// `shouldRemove(previous, point, next)` holds; after a removal the walk steps back one point so
// that the neighbours are examined again. Stops once fewer than 3 points remain. A linked list
// keeps this linear: every step back is paid for by a removal.
template <typename Predicate>
void removeWalking(PointList& points, Predicate shouldRemove) {
  const size_t n = points.size();
  if (n < 3) {
    return;
  }
  std::vector<size_t> previous(n), next(n);
  for (size_t i = 0; i < n; ++i) {
    previous[i] = (i + n - 1) % n;
    next[i] = (i + 1) % n;
  }
  std::vector<bool> alive(n, true);
  size_t head = 0, current = 0, remaining = n;
  while (remaining >= 3) {
    if (shouldRemove(points[previous[current]], points[current], points[next[current]])) {
      next[previous[current]] = next[current];
      previous[next[current]] = previous[current];
      alive[current] = false;
      --remaining;
      if (current == head) {
        head = next[current];
        current = head;
      } else {
        current = previous[current];
      }
      continue;
    }
    if (next[current] == head) {
      break;
    }
    current = next[current];
  }
  size_t kept = 0;
  for (size_t i = 0; i < n; ++i) {
    if (alive[i]) {
      points[kept++] = points[i];
    }
  }
  points.resize(kept);
}

bool isDegenerateCorner(Point2f previous, Point2f point, Point2f next, float reversalCosine) {
  const Point2f in = minus(point, previous);
  const Point2f out = minus(next, point);
  if (isZeroLength(in) || isZeroLength(out)) {
    return true;
  }
  return turnCosine(in, out) < reversalCosine;
}

double summedTurningAngle(const PointList& points) {
  const size_t n = points.size();
  double sum = 0;
  for (size_t i = 0; i < n; ++i) {
    const Point2f previous = points[(i + n - 1) % n];
    const Point2f next = points[(i + 1) % n];
    if (isDegenerateCorner(previous, points[i], next, kNearReversalCosine)) {
      continue;
    }
    const Point2f in = minus(points[i], previous);
    const Point2f out = minus(next, points[i]);
    double turn = std::atan2(-out.y, out.x) - std::atan2(-in.y, in.x);
    if (turn < -kPi) {
      turn += 2 * kPi;
    } else if (turn > kPi) {
      turn -= 2 * kPi;
    }
    sum += turn;
  }
  return sum;
}

Orientation voteOrientation(const PointList& points) {
  const size_t n = points.size();
  size_t positives = 0, negatives = 0;
  for (size_t i = 0; i < n; ++i) {
    const Point2f previous = points[(i + n - 1) % n];
    const float c = cross(minus(points[i], previous), minus(points[(i + 1) % n], previous));
    if (c < 0) {
      ++negatives;
    } else if (c > 0) {
      ++positives;
    }
  }
  if (negatives > positives) {
    return kClockwise;
  }
  return positives > negatives ? kCounterClockwise : kUndetermined;
}

}  // namespace

Path2f makePath(const PointList& points, uint32_t id) {
  Path2f path;
  path.id = id;
  const bool finite = std::all_of(points.begin(), points.end(), [](Point2f p) {
    return std::isfinite(p.x) && std::isfinite(p.y);
  });
  if (finite) {
    path.points = points;
  }
  cleanPath(path);
  path.orientation = computeOrientation(path);
  updateBounds(path);
  return path;
}

void cleanPath(Path2f& path) {
  removeWalking(path.points, [](Point2f previous, Point2f point, Point2f next) {
    const Point2f in = minus(point, previous);
    const Point2f out = minus(next, point);
    if (isZeroLength(in) || isZeroLength(out)) {
      return true;
    }
    return approxEqual(turnCosine(in, out), -1.0f);
  });
}

Orientation computeOrientation(const Path2f& path) {
  PointList copy = path.points;
  const auto degenerate = [](Point2f previous, Point2f point, Point2f next) {
    return isDegenerateCorner(previous, point, next, kNearReversalCosine);
  };
  removeWalking(copy, degenerate);
  // The second pass starts opposite the first, so a degenerate stretch across the first pass's
  // start point is seen from both sides.
  std::rotate(copy.begin(), copy.begin() + copy.size() / 2, copy.end());
  removeWalking(copy, degenerate);
  if (copy.size() < 3) {
    return voteOrientation(path.points);
  }
  const double sum = summedTurningAngle(copy);
  if (sum >= kPi) {
    return kClockwise;
  }
  return sum <= -kPi ? kCounterClockwise : kUndetermined;
}

float signedDistance(const Path2f& path, Point2f q) {
  const PointList& points = path.points;
  const size_t n = points.size();
  if (n < 3) {
    return 1e7f;
  }
  float best = 1e11f;
  float side = 0;
  for (size_t i = 0; i < n; ++i) {
    const Point2f start = points[i];
    const Point2f edge = minus(points[(i + 1) % n], start);
    const float edgeLength2 = lengthSquared(edge);
    float t = 0;
    if (edgeLength2 > 0) {
      t = std::clamp(dot(minus(q, start), edge) / edgeLength2, 0.0f, 1.0f);
    }
    const Point2f closest{start.x + t * edge.x, start.y + t * edge.y};
    const Point2f toQ = minus(q, closest);
    const float d2 = lengthSquared(toQ);
    float s = 0;
    if (edgeLength2 > 0) {
      const float length = std::sqrt(edgeLength2);
      s = cross({edge.x / length, edge.y / length}, toQ);
    }
    const bool sameDistance = approxEqual(d2, best);
    if ((sameDistance && std::fabs(s) > std::fabs(side)) || (!sameDistance && d2 < best)) {
      best = d2;
      side = s;
    }
  }
  const float distance = std::sqrt(best);
  if (path.orientation == kClockwise) {
    return side <= 0 ? distance : -distance;
  }
  return side >= 0 ? distance : -distance;
}

void updateBounds(Path2f& path) {
  if (path.points.empty()) {
    path.bounds = {0, 0, 0, 0};
    return;
  }
  std::array<float, 4> b{path.points[0].x, path.points[0].y, path.points[0].x, path.points[0].y};
  for (const Point2f p : path.points) {
    b[0] = std::min(b[0], p.x);
    b[1] = std::min(b[1], p.y);
    b[2] = std::max(b[2], p.x);
    b[3] = std::max(b[3], p.y);
  }
  path.bounds = b;
}

void reversePoints(Path2f& path) {
  std::reverse(path.points.begin(), path.points.end());
}

}  // namespace qvtl::geometry
