// Feeds polygons built from arbitrary bytes to triangulatePolygon. Every input must end; when the
// outer ring and the holes are simple, the holes lie strictly inside the outer ring and touch
// nothing, the triangles must cover exactly the outer area minus the holes' areas.
//   byte 0: number of holes (0-3), and bit 2: order each ring's points by their angle around
//   the ring's centre, which makes most rings simple; then the outer ring: one byte for its point
//   count (3-34, fewer when the input ends) and two bytes per point for x and y (0-255); then per
//   hole two bytes for its offset (0-239) and a ring of points 0-15 from there (small ranges, so
//   collinear and axis-aligned cases are common).
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "geometry/triangulation.h"

namespace {

using qvtl::geometry::Point2f;
using qvtl::geometry::PointList;

struct Reader {
  const uint8_t* data;
  size_t size;
  size_t at = 0;
  uint8_t next() { return at < size ? data[at++] : 0; }
};

int64_t orient(const Point2f& a, const Point2f& b, const Point2f& c) {
  const int64_t v = static_cast<int64_t>(b.x - a.x) * static_cast<int64_t>(c.y - a.y) -
                    static_cast<int64_t>(b.y - a.y) * static_cast<int64_t>(c.x - a.x);
  return (v > 0) - (v < 0);
}
bool onSegment(const Point2f& a, const Point2f& b, const Point2f& q) {
  return orient(a, b, q) == 0 && std::fmin(a.x, b.x) <= q.x && q.x <= std::fmax(a.x, b.x) &&
         std::fmin(a.y, b.y) <= q.y && q.y <= std::fmax(a.y, b.y);
}
// Closed segments share at least one point.
bool touch(const Point2f& a, const Point2f& b, const Point2f& c, const Point2f& d) {
  const int64_t o1 = orient(a, b, c), o2 = orient(a, b, d), o3 = orient(c, d, a),
                o4 = orient(c, d, b);
  if (o1 != o2 && o3 != o4 && o1 != 0 && o2 != 0 && o3 != 0 && o4 != 0) {
    return true;
  }
  return onSegment(a, b, c) || onSegment(a, b, d) || onSegment(c, d, a) || onSegment(c, d, b);
}

double area(const PointList& ring) {
  double sum = 0;
  for (size_t i = 0; i < ring.size(); ++i) {
    const Point2f& a = ring[i];
    const Point2f& b = ring[(i + 1) % ring.size()];
    sum += static_cast<double>(a.x) * b.y - static_cast<double>(b.x) * a.y;
  }
  return sum * 0.5;
}

bool simple(const PointList& ring) {
  const size_t n = ring.size();
  for (size_t i = 0; i < n; ++i) {
    const Point2f& a = ring[i];
    const Point2f& b = ring[(i + 1) % n];
    if (a == b) {
      return false;
    }
    // Consecutive edges meet only at their shared point.
    const Point2f& c = ring[(i + 2) % n];
    if (orient(a, b, c) == 0 && (c.x - b.x) * (a.x - b.x) + (c.y - b.y) * (a.y - b.y) > 0) {
      return false;
    }
    for (size_t j = i + 2; j < n; ++j) {
      if ((j + 1) % n == i) {
        continue;
      }
      if (touch(a, b, ring[j], ring[(j + 1) % n])) {
        return false;
      }
    }
  }
  return area(ring) != 0;
}

bool ringsTouch(const PointList& r, const PointList& s) {
  for (size_t i = 0; i < r.size(); ++i) {
    for (size_t j = 0; j < s.size(); ++j) {
      if (touch(r[i], r[(i + 1) % r.size()], s[j], s[(j + 1) % s.size()])) {
        return true;
      }
    }
  }
  return false;
}

bool inside(const PointList& ring, const Point2f& p) {
  bool in = false;
  for (size_t i = 0, j = ring.size() - 1; i < ring.size(); j = i++) {
    const double xi = ring[i].x, yi = ring[i].y, xj = ring[j].x, yj = ring[j].y;
    if ((yi > p.y) != (yj > p.y) && p.x < (xj - xi) * (p.y - yi) / (yj - yi) + xi) {
      in = !in;
    }
  }
  return in;
}

PointList readRing(Reader& reader, bool byAngle, int range, float x0, float y0) {
  // Short inputs give short rings rather than rings padded with repeated points.
  const size_t wanted = 3 + reader.next() % 32u;
  PointList ring(std::min(wanted, std::max<size_t>(3, (reader.size - reader.at) / 2)));
  double cx = 0, cy = 0;
  for (Point2f& p : ring) {
    p.x = x0 + static_cast<float>(reader.next() % range);
    p.y = y0 + static_cast<float>(reader.next() % range);
    cx += p.x / static_cast<double>(ring.size());
    cy += p.y / static_cast<double>(ring.size());
  }
  if (byAngle) {
    std::stable_sort(ring.begin(), ring.end(), [cx, cy](const Point2f& a, const Point2f& b) {
      return std::atan2(a.y - cy, a.x - cx) < std::atan2(b.y - cy, b.x - cx);
    });
  }
  return ring;
}

// The rings are valid when each is simple, no two touch, every hole lies inside the outer ring
// and no hole lies inside another.
bool valid(const PointList& outer, const std::vector<PointList>& holes) {
  if (!simple(outer)) {
    return false;
  }
  for (size_t h = 0; h < holes.size(); ++h) {
    if (!simple(holes[h]) || ringsTouch(outer, holes[h]) || !inside(outer, holes[h][0])) {
      return false;
    }
    for (size_t k = 0; k < h; ++k) {
      if (ringsTouch(holes[h], holes[k]) || inside(holes[h], holes[k][0]) ||
          inside(holes[k], holes[h][0])) {
        return false;
      }
    }
  }
  return true;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  Reader reader{data, size};
  const uint8_t shape = reader.next();
  const bool byAngle = (shape & 4) != 0;
  const PointList outer = readRing(reader, byAngle, 256, 0, 0);
  std::vector<PointList> holes;
  for (size_t h = 0; h < shape % 4u; ++h) {
    const float x0 = static_cast<float>(reader.next() % 240);
    const float y0 = static_cast<float>(reader.next() % 240);
    holes.push_back(readRing(reader, byAngle, 16, x0, y0));
  }
  const qvtl::geometry::TriangulationResult result =
      qvtl::geometry::triangulatePolygon(outer, holes, 99999999);
  for (const auto& t : result.triangles) {
    for (uint32_t index : t) {
      if (index >= result.vertices.size()) {
        std::abort();
      }
    }
  }
  if (!valid(outer, holes)) {
    return 0;
  }
  double expected = std::fabs(area(outer));
  for (const PointList& hole : holes) {
    expected -= std::fabs(area(hole));
  }
  double covered = 0;
  for (const auto& t : result.triangles) {
    covered +=
        std::fabs(area({result.vertices[t[0]], result.vertices[t[1]], result.vertices[t[2]]}));
  }
  if (std::getenv("POLYGON_FUZZ_VERBOSE") != nullptr) {
    std::fprintf(stderr, "valid: %zu holes, %zu outer points, covered %f, expected %f\n",
                 holes.size(), outer.size(), covered, expected);
  }
  if (std::fabs(covered - expected) > 1e-4 * expected) {
    std::fprintf(stderr, "covered %f, expected %f\n", covered, expected);
    std::abort();
  }
  return 0;
}
