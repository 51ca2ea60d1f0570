#include "geometry/qv_shape.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <functional>
#include <unordered_map>
#include <utility>

namespace qvtl::geometry {
namespace {

// Segments whose directions' cross product lies within this of zero count as parallel.
constexpr float kParallelTolerance = 0.001f;

Point2f minus(Point2f a, Point2f b) {
  return {a.x - b.x, a.y - b.y};
}
float cross(Point2f a, Point2f b) {
  return a.x * b.y - a.y * b.x;
}

Point2f normalised(Point2f v) {
  const float length = std::sqrt(v.x * v.x + v.y * v.y);
  return length > 0 ? Point2f{v.x / length, v.y / length} : Point2f{};
}

float boundsArea(const std::array<float, 4>& b) {
  return (b[2] - b[0]) * (b[3] - b[1]);
}

// Where segment p0 -> p1 meets segment q0 -> q1: t along the first, u along the second. False for
// (nearly) parallel segments and for crossings outside either segment.
bool segmentsCross(Point2f p0, Point2f p1, Point2f q0, Point2f q1, float& t, float& u) {
  const Point2f r = minus(p1, p0);
  const Point2f s = minus(q1, q0);
  const float denominator = cross(r, s);
  if (std::fabs(denominator) <= kParallelTolerance) {
    return false;
  }
  const Point2f qp = minus(q0, p0);
  t = cross(qp, s) / denominator;
  u = cross(qp, r) / denominator;
  return t >= 0 && t <= 1 && u >= 0 && u <= 1;
}

// Rotates the points so that the first one lies on the outside of the figure: walking from point
// 0, at each crossing where the crossed segment leads off to the right the walk turns onto it,
// and the first point reached a second time becomes the start. Spends crossing tests from
// `budget`; when it runs out the walk goes on without turning.
void rotateToOutsideStart(PointList& points, size_t& budget) {
  const size_t n = points.size();
  std::vector<bool> visited(n, false);
  size_t i = 0;
  while (!visited[i]) {
    visited[i] = true;
    const size_t i1 = (i + 1) % n;
    const Point2f direction = normalised(minus(points[i1], points[i]));
    float bestT = 2;
    size_t next = i1;
    for (size_t j = 0; j < n && budget > 0; ++j) {
      const size_t j1 = (j + 1) % n;
      if (j == i || j1 == i || j == i1) {
        continue;  // shares an end point with segment i
      }
      --budget;
      float t = 0, u = 0;
      if (segmentsCross(points[i], points[i1], points[j], points[j1], t, u) && t < bestT &&
          cross(direction, normalised(minus(points[j1], points[i]))) < 0) {
        bestT = t;
        next = j1;
      }
    }
    i = next;
  }
  std::rotate(points.begin(), points.begin() + static_cast<std::ptrdiff_t>(i), points.end());
}

struct Crossing {
  size_t i = 0, j = 0;  // segment i crosses the later segment j
  float t = 0, u = 0;
};

// The first segment from `firstSegment` on that crosses a later segment sharing no end point with
// it, with its nearest crossing. False when there is none or the budget runs out.
bool findFirstCrossing(const PointList& points, size_t firstSegment, size_t& budget,
                       Crossing& found) {
  const size_t n = points.size();
  for (size_t i = firstSegment; i < n; ++i) {
    float bestT = 2;
    for (size_t j = i + 2; j < n; ++j) {
      if (i == 0 && j == n - 1) {
        continue;  // the closing segment shares point 0
      }
      if (budget == 0) {
        return false;
      }
      --budget;
      float t = 0, u = 0;
      if (segmentsCross(points[i], points[i + 1], points[j], points[(j + 1) % n], t, u) &&
          t < bestT) {
        bestT = t;
        found = {i, j, t, u};
      }
    }
    if (bestT <= 1) {
      return true;
    }
  }
  return false;
}

// Removes consecutive repeats, the last point repeating the first included. True if any went.
bool removeRepeats(PointList& points) {
  const size_t before = points.size();
  points.erase(std::unique(points.begin(), points.end()), points.end());
  while (points.size() > 1 && points.back() == points.front()) {
    points.pop_back();
  }
  return points.size() != before;
}

// Exact bit pattern of a point, with -0 made +0 so that equal coordinates give equal keys.
uint64_t pointKey(Point2f p) {
  const float x = p.x + 0.0f, y = p.y + 0.0f;
  uint32_t bx = 0, by = 0;
  std::memcpy(&bx, &x, sizeof bx);
  std::memcpy(&by, &y, sizeof by);
  return (static_cast<uint64_t>(bx) << 32) | by;
}

float totalBoundsArea(const std::vector<Path2f>& loops) {
  float area = 0;
  for (const Path2f& loop : loops) {
    area += boundsArea(loop.bounds);
  }
  return area;
}

size_t subtreeHeight(const Shape2f& node) {
  size_t height = 0;
  for (const Shape2f& child : node.children) {
    height = std::max(height, subtreeHeight(child) + 1);
  }
  return height;
}

}  // namespace

bool containsPath(const Path2f& inner, const Path2f& outer, bool allowOverlapTest) {
  if (outer.points.size() < 3 || inner.points.empty()) {
    return false;
  }
  const std::array<float, 4>& o = outer.bounds;
  const std::array<float, 4>& n = inner.bounds;
  if (o[0] <= n[0] && o[1] <= n[1] && n[2] <= o[2] && n[3] <= o[3]) {
    const float middle = signedDistance(outer, inner.points[inner.points.size() / 2]);
    if (!approxEqual(middle, 0)) {
      return middle > 0;
    }
    return signedDistance(outer, inner.points.back()) > 0;
  }
  const bool overlap = o[0] <= n[2] && n[0] <= o[2] && o[1] <= n[3] && n[1] <= o[3];
  if (allowOverlapTest && overlap && boundsArea(o) > boundsArea(n)) {
    const size_t stride = (inner.points.size() + kMaxOverlapSamples - 1) / kMaxOverlapSamples;
    float sum = 0;
    for (size_t k = 0; k < inner.points.size(); k += stride) {
      sum += signedDistance(outer, inner.points[k]);
    }
    return sum > 0;
  }
  return false;
}

bool containsPath(const Shape2f& node, const Path2f& outer, bool allowOverlapTest) {
  return containsPath(node.path, outer, allowOverlapTest);
}

void insertIntoShape(Shape2f& node, Path2f path) {
  Shape2f* parent = &node;
  size_t depth = 0;  // of `parent`
  while (depth + 1 < kMaxShapeDepth) {
    const auto container =
        std::find_if(parent->children.begin(), parent->children.end(),
                     [&](const Shape2f& child) { return containsPath(path, child.path, true); });
    if (container == parent->children.end()) {
      break;
    }
    parent = &*container;
    ++depth;
  }
  Shape2f added;
  added.path = std::move(path);
  std::vector<Shape2f> kept;
  for (Shape2f& child : parent->children) {
    // A child moves one level down; it stays put where that would pass the depth limit.
    if (containsPath(child.path, added.path, true) &&
        depth + 2 + subtreeHeight(child) <= kMaxShapeDepth) {
      added.children.push_back(std::move(child));
    } else {
      kept.push_back(std::move(child));
    }
  }
  kept.push_back(std::move(added));
  parent->children = std::move(kept);
}

std::vector<Path2f> splitSelfIntersections(Path2f path) {
  return splitSelfIntersections(std::move(path), kMaxLoopsPerPath);
}

std::vector<Path2f> splitSelfIntersections(Path2f path, std::size_t maxLoops) {
  std::vector<Path2f> loops;
  if (path.points.size() <= 2) {
    loops.push_back(std::move(path));
    return loops;
  }
  // Clockwise paths are cut as counter-clockwise ones so that the start walk's right-hand turns
  // keep to the outside; their loops are turned back afterwards.
  const bool reversed = path.orientation == kClockwise;
  if (reversed) {
    reversePoints(path);
  }
  const auto keep = [&](PointList points) {
    if (points.size() > 2) {
      if (reversed) {
        std::reverse(points.begin(), points.end());
      }
      loops.push_back(makePath(points, path.id));
    }
  };
  if (path.points.size() > kMaxSplitPoints) {
    keep(std::move(path.points));
    return loops;
  }
  // The start walk may spend at most half the budget, so that cutting always gets the rest.
  size_t walkBudget = kMaxCrossingTests / 2;
  rotateToOutsideStart(path.points, walkBudget);
  size_t budget = kMaxCrossingTests / 2 + walkBudget;

  // Loops still to examine, each with the first segment that may still cross a later one.
  std::vector<std::pair<PointList, size_t>> pending;
  pending.emplace_back(std::move(path.points), 0);
  while (!pending.empty()) {
    auto [points, firstSegment] = std::move(pending.back());
    pending.pop_back();
    Crossing c;
    if (loops.size() + pending.size() + 1 >= maxLoops ||
        !findFirstCrossing(points, firstSegment, budget, c)) {
      keep(std::move(points));
      continue;
    }
    const size_t n = points.size();
    const Point2f a = points[c.i], b = points[c.i + 1];
    Point2f x{a.x + c.t * (b.x - a.x), a.y + c.t * (b.y - a.y)};
    if (c.t == 0) {
      x = a;
    } else if (c.t == 1) {
      x = b;
    } else if (c.u == 0) {
      x = points[c.j];
    } else if (c.u == 1) {
      x = points[(c.j + 1) % n];
    }
    // The loop between the crossing's two passes, and the rest of the path around it.
    PointList cutOff{x};
    cutOff.insert(cutOff.end(), points.begin() + static_cast<std::ptrdiff_t>(c.i + 1),
                  points.begin() + static_cast<std::ptrdiff_t>(c.j + 1));
    PointList rest(points.begin(), points.begin() + static_cast<std::ptrdiff_t>(c.i + 1));
    rest.push_back(x);
    rest.insert(rest.end(), points.begin() + static_cast<std::ptrdiff_t>(c.j + 1), points.end());
    removeRepeats(cutOff);
    // The rest's segments before the crossing were already checked against everything after
    // them, of which the rest keeps only parts.
    const size_t restFirst = removeRepeats(rest) ? 0 : c.i;
    pending.emplace_back(std::move(rest), restFirst);
    pending.emplace_back(std::move(cutOff), 0);
  }
  return loops;
}

std::vector<Path2f> splitTouchingPoints(Path2f path) {
  return splitTouchingPoints(std::move(path), kMaxLoopsPerPath);
}

std::vector<Path2f> splitTouchingPoints(Path2f path, size_t maxLoops) {
  std::vector<Path2f> loops;
  std::unordered_map<uint64_t, size_t> seen;  // point -> its index in `rest`
  PointList rest;
  rest.reserve(path.points.size());
  bool cut = false;
  for (const Point2f p : path.points) {
    const auto repeat = seen.find(pointKey(p));
    if (repeat != seen.end() && loops.size() + 1 < maxLoops) {
      const auto from = rest.begin() + static_cast<std::ptrdiff_t>(repeat->second);
      PointList loop(from, rest.end());
      for (const Point2f q : loop) {
        seen.erase(pointKey(q));
      }
      rest.erase(from, rest.end());
      loops.push_back(makePath(loop, path.id));
      cut = true;
    }
    seen[pointKey(p)] = rest.size();
    rest.push_back(p);
  }
  loops.push_back(cut ? makePath(rest, path.id) : std::move(path));
  return loops;
}

std::size_t addPath(Shape2f& shape, Path2f path, std::size_t maxLoops) {
  if (path.points.empty() || maxLoops == 0) {
    return 0;
  }
  std::vector<Path2f> loops;
  if (path.orientation == kUndetermined && path.points.size() > 2) {
    // Which way round a path of undecided winding runs is unknown: cut it both ways and keep the
    // cut whose loops cover the larger bounding area.
    Path2f clockwise = path;
    clockwise.orientation = kClockwise;
    loops = splitSelfIntersections(std::move(path), maxLoops);
    std::vector<Path2f> other = splitSelfIntersections(std::move(clockwise), maxLoops);
    if (totalBoundsArea(other) > totalBoundsArea(loops)) {
      loops = std::move(other);
    }
  } else {
    loops = splitSelfIntersections(std::move(path), maxLoops);
  }
  // Each loop still to come keeps room for itself, so the total stays within maxLoops.
  size_t inserted = 0;
  for (size_t k = 0; k < loops.size(); ++k) {
    const size_t reserved = inserted + (loops.size() - k - 1);
    const size_t allowed = maxLoops > reserved ? maxLoops - reserved : 1;
    for (Path2f& piece : splitTouchingPoints(std::move(loops[k]), allowed)) {
      if (!piece.points.empty()) {
        insertIntoShape(shape, std::move(piece));
        ++inserted;
      }
    }
  }
  return inserted;
}

void flipOrientation(Shape2f& node) {
  reversePoints(node.path);
  if (node.path.orientation == kClockwise) {
    node.path.orientation = kCounterClockwise;
  } else if (node.path.orientation == kCounterClockwise) {
    node.path.orientation = kClockwise;
  }
  for (Shape2f& child : node.children) {
    flipOrientation(child);
  }
}

std::vector<const Shape2f*> collectFilledPieces(const Shape2f& shape) {
  std::vector<const Shape2f*> pieces;
  std::function<void(const Shape2f&)> visit = [&](const Shape2f& node) {
    for (const Shape2f& child : node.children) {
      visit(child);
    }
    if (node.path.points.size() >= 3 && node.path.orientation != kClockwise) {
      pieces.push_back(&node);
    }
  };
  visit(shape);
  return pieces;
}

std::vector<PointList> pieceHoles(const Shape2f& piece) {
  std::vector<PointList> holes;
  for (const Shape2f& child : piece.children) {
    if (child.path.orientation == kClockwise) {
      holes.push_back(child.path.points);
    } else if (child.path.id != piece.path.id) {
      holes.emplace_back(child.path.points.rbegin(), child.path.points.rend());
    }
  }
  return holes;
}

}  // namespace qvtl::geometry
