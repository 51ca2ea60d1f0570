#include "geometry/nonzero_union.h"

#include <clipper.hpp>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <unordered_map>
#include <utility>

namespace qvtl::geometry {
namespace {

// The polygon library works on integers: coordinates are scaled by a power of two so that the
// largest lands near 2^30, which keeps more precision than a float holds and stays in the range
// where the library's arithmetic is plain 64-bit.
constexpr int kIntegerBits = 30;

struct Segment {
  Point2f a, b;
  float minX, maxX, minY, maxY;
  size_t path, index;  // the segment runs from point `index` of path `path` to the next one
};

double orient(Point2f o, Point2f a, Point2f b) {
  return (double(a.x) - o.x) * (double(b.y) - o.y) - (double(a.y) - o.y) * (double(b.x) - o.x);
}

// Whether p, known to be collinear with segment ab, lies within its bounding box.
bool withinBox(Point2f a, Point2f b, Point2f p) {
  return std::min(a.x, b.x) <= p.x && p.x <= std::max(a.x, b.x) && std::min(a.y, b.y) <= p.y &&
         p.y <= std::max(a.y, b.y);
}

bool segmentsMeet(const Segment& s, const Segment& t) {
  const double d1 = orient(s.a, s.b, t.a), d2 = orient(s.a, s.b, t.b);
  const double d3 = orient(t.a, t.b, s.a), d4 = orient(t.a, t.b, s.b);
  if (((d1 > 0 && d2 < 0) || (d1 < 0 && d2 > 0)) && ((d3 > 0 && d4 < 0) || (d3 < 0 && d4 > 0))) {
    return true;
  }
  return (d1 == 0 && withinBox(s.a, s.b, t.a)) || (d2 == 0 && withinBox(s.a, s.b, t.b)) ||
         (d3 == 0 && withinBox(t.a, t.b, s.a)) || (d4 == 0 && withinBox(t.a, t.b, s.b));
}

// Segments i and j of a path of n points share an end point.
bool adjacent(size_t i, size_t j, size_t n) {
  return j == i + 1 || i == j + 1 || (i == 0 && j == n - 1) || (j == 0 && i == n - 1);
}

std::vector<Segment> collectSegments(const std::vector<const Path2f*>& paths) {
  std::vector<Segment> segments;
  for (size_t p = 0; p < paths.size(); ++p) {
    const PointList& points = paths[p]->points;
    if (points.size() < 3) {
      continue;
    }
    for (size_t i = 0; i < points.size(); ++i) {
      const Point2f a = points[i], b = points[(i + 1) % points.size()];
      segments.push_back({a, b, std::min(a.x, b.x), std::max(a.x, b.x), std::min(a.y, b.y),
                          std::max(a.y, b.y), p, i});
    }
  }
  return segments;
}

double signedArea(const PointList& points) {
  double sum = 0;
  for (size_t i = 0; i < points.size(); ++i) {
    const Point2f a = points[i], b = points[(i + 1) % points.size()];
    sum += double(a.x) * b.y - double(b.x) * a.y;
  }
  return sum * 0.5;
}

// Even-odd crossing test of a point against a closed polygon.
bool inside(const PointList& polygon, Point2f p) {
  bool in = false;
  for (size_t i = 0, j = polygon.size() - 1; i < polygon.size(); j = i++) {
    const Point2f a = polygon[i], b = polygon[j];
    if ((a.y > p.y) != (b.y > p.y) &&
        p.x < (double(b.x) - a.x) * (double(p.y) - a.y) / (double(b.y) - a.y) + a.x) {
      in = !in;
    }
  }
  return in;
}

uint64_t pointKey(const ClipperLib::IntPoint& p) {
  return (static_cast<uint64_t>(static_cast<uint32_t>(p.X)) << 32) | static_cast<uint32_t>(p.Y);
}

// Scaling between the paths' floats and the library's integers, and the source id of every
// integer point a path passes through.
struct IntegerPaths {
  double scale = 1;
  ClipperLib::Paths paths;
  std::unordered_map<uint64_t, uint32_t> ids;
};

bool toIntegers(const std::vector<const Path2f*>& paths, IntegerPaths& out) {
  float largest = 0;
  for (const Path2f* path : paths) {
    for (const Point2f p : path->points) {
      largest = std::max({largest, std::fabs(p.x), std::fabs(p.y)});
    }
  }
  if (!(largest > 0) || !std::isfinite(largest)) {
    return false;
  }
  int exponent = 0;
  std::frexp(largest, &exponent);  // largest < 2^exponent
  out.scale = std::ldexp(1.0, kIntegerBits - exponent);
  for (const Path2f* path : paths) {
    if (path->points.size() < 3) {
      continue;
    }
    ClipperLib::Path ring;
    ring.reserve(path->points.size());
    for (const Point2f p : path->points) {
      ring.emplace_back(std::llround(p.x * out.scale), std::llround(p.y * out.scale));
      out.ids.emplace(pointKey(ring.back()), path->id);
    }
    out.paths.push_back(std::move(ring));
  }
  return !out.paths.empty();
}

// The id most of the loop's points were found under; the first path's id when none was.
uint32_t loopId(const ClipperLib::Path& loop, const IntegerPaths& source, uint32_t fallback) {
  std::unordered_map<uint32_t, size_t> votes;
  for (const ClipperLib::IntPoint& p : loop) {
    const auto found = source.ids.find(pointKey(p));
    if (found != source.ids.end()) {
      ++votes[found->second];
    }
  }
  uint32_t id = fallback;
  size_t best = 0;
  for (const auto& [candidate, count] : votes) {
    if (count > best || (count == best && candidate < id)) {
      best = count;
      id = candidate;
    }
  }
  return id;
}

struct TreeBuilder {
  const IntegerPaths& source;
  uint32_t fallbackId;
  size_t loopsLeft;

  // Adds the node's loop under `parent` and its subtree under that loop. A loop that cleans to
  // fewer than 3 points is left out with everything inside it.
  void add(Shape2f& parent, const ClipperLib::PolyNode& node, size_t depth) {
    if (loopsLeft == 0 || depth >= kMaxShapeDepth) {
      return;
    }
    PointList points;
    points.reserve(node.Contour.size());
    for (const ClipperLib::IntPoint& p : node.Contour) {
      points.push_back(
          {static_cast<float>(p.X / source.scale), static_cast<float>(p.Y / source.scale)});
    }
    Shape2f added;
    added.path = makePath(points, loopId(node.Contour, source, fallbackId));
    if (added.path.points.size() < 3) {
      return;
    }
    // The library gives outer loops counter-clockwise and holes clockwise (y up); the winding is
    // set from that rather than measured again on float points.
    added.path.orientation = node.IsHole() ? kClockwise : kCounterClockwise;
    --loopsLeft;
    for (const ClipperLib::PolyNode* child : node.Childs) {
      add(added, *child, depth + 1);
    }
    parent.children.push_back(std::move(added));
  }
};

}  // namespace

bool pathsIntersect(const std::vector<const Path2f*>& paths) {
  std::vector<Segment> segments = collectSegments(paths);
  std::sort(segments.begin(), segments.end(),
            [](const Segment& s, const Segment& t) { return s.minX < t.minX; });
  size_t budget = kMaxIntersectionTests;
  for (size_t i = 0; i < segments.size(); ++i) {
    const Segment& s = segments[i];
    for (size_t j = i + 1; j < segments.size() && segments[j].minX <= s.maxX; ++j) {
      const Segment& t = segments[j];
      if (t.maxY < s.minY || s.maxY < t.minY ||
          (s.path == t.path && adjacent(s.index, t.index, paths[s.path]->points.size()))) {
        continue;
      }
      if (budget-- == 0 || segmentsMeet(s, t)) {
        return true;
      }
    }
  }
  return false;
}

bool nestedWithTheirParentsWinding(const std::vector<const Path2f*>& paths) {
  struct Contour {
    const PointList* points;
    bool counterClockwise;
    std::vector<size_t> containers;  // the contours it lies inside
  };
  std::vector<Contour> contours;
  for (const Path2f* path : paths) {
    const double area = path->points.size() >= 3 ? signedArea(path->points) : 0.0;
    if (area != 0 && std::isfinite(area)) {
      contours.push_back({&path->points, area > 0, {}});
    }
  }
  for (size_t i = 0; i < contours.size(); ++i) {
    for (size_t j = 0; j < contours.size(); ++j) {
      if (i != j && inside(*contours[j].points, contours[i].points->front())) {
        contours[i].containers.push_back(j);
      }
    }
  }
  for (const Contour& contour : contours) {
    // The nearest container is the one inside the most others.
    const Contour* parent = nullptr;
    for (const size_t j : contour.containers) {
      if (parent == nullptr || contours[j].containers.size() > parent->containers.size()) {
        parent = &contours[j];
      }
    }
    if (parent != nullptr && parent->counterClockwise == contour.counterClockwise) {
      return true;
    }
  }
  return false;
}

bool addNonZeroUnion(Shape2f& shape, const std::vector<const Path2f*>& paths,
                     std::size_t maxLoops) {
  IntegerPaths source;
  if (!toIntegers(paths, source)) {
    return false;
  }
  ClipperLib::PolyTree tree;
  try {
    ClipperLib::Clipper clipper;
    // Strictly simple loops never touch themselves; a hole may still meet its outer loop or
    // another hole at a point, which the triangulator splices in there.
    clipper.StrictlySimple(true);
    clipper.AddPaths(source.paths, ClipperLib::ptSubject, true);
    if (!clipper.Execute(ClipperLib::ctUnion, tree, ClipperLib::pftNonZero,
                         ClipperLib::pftNonZero)) {
      return false;
    }
  } catch (const ClipperLib::clipperException&) {
    return false;
  }
  uint32_t fallbackId = 0;
  for (const Path2f* path : paths) {
    if (path->points.size() >= 3) {
      fallbackId = path->id;
      break;
    }
  }
  TreeBuilder builder{source, fallbackId, maxLoops};
  for (const ClipperLib::PolyNode* outer : tree.Childs) {
    builder.add(shape, *outer, 0);
  }
  return true;
}

}  // namespace qvtl::geometry
