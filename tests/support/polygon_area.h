// Rings to triangulate, and their areas, containment and simplicity (in double), for checking
// what triangulations cover.
#ifndef WAVEFORM_TESTS_SUPPORT_POLYGON_AREA_H
#define WAVEFORM_TESTS_SUPPORT_POLYGON_AREA_H

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <vector>

#include "geometry/point2.h"

namespace waveform_test {

// The rectangle with corners (x0, y0) and (x1, y1), counter-clockwise with y up.
inline qvtl::geometry::PointList square(float x0, float y0, float x1, float y1) {
  return {{x0, y0}, {x1, y0}, {x1, y1}, {x0, y1}};
}

inline qvtl::geometry::PointList reversed(qvtl::geometry::PointList ring) {
  std::reverse(ring.begin(), ring.end());
  return ring;
}

// The shoelace formula: positive for a counter-clockwise ring (y up).
inline double signedArea(const qvtl::geometry::PointList& ring) {
  double twice = 0;
  for (size_t i = 0; i < ring.size(); ++i) {
    const qvtl::geometry::Point2f& a = ring[i];
    const qvtl::geometry::Point2f& b = ring[(i + 1) % ring.size()];
    twice += static_cast<double>(a.x) * b.y - static_cast<double>(b.x) * a.y;
  }
  return twice / 2;
}

// The summed unsigned area of indexed triangles, three indices each.
inline double trianglesArea(const qvtl::geometry::PointList& vertices,
                            const std::vector<uint32_t>& indices) {
  double sum = 0;
  for (size_t i = 0; i + 2 < indices.size(); i += 3) {
    sum += std::fabs(
        signedArea({vertices[indices[i]], vertices[indices[i + 1]], vertices[indices[i + 2]]}));
  }
  return sum;
}

// Even-odd containment of a point that lies on no edge.
inline bool insideRing(const qvtl::geometry::PointList& ring, double x, double y) {
  bool inside = false;
  for (size_t i = 0, j = ring.size() - 1; i < ring.size(); j = i++) {
    const double xi = ring[i].x, yi = ring[i].y, xj = ring[j].x, yj = ring[j].y;
    if ((yi > y) != (yj > y) && x < (xj - xi) * (y - yi) / (yj - yi) + xi) {
      inside = !inside;
    }
  }
  return inside;
}

inline double cross(qvtl::geometry::Point2f o, qvtl::geometry::Point2f a,
                    qvtl::geometry::Point2f b) {
  return static_cast<double>(a.x - o.x) * (b.y - o.y) -
         static_cast<double>(a.y - o.y) * (b.x - o.x);
}

inline double distanceToSegment(qvtl::geometry::Point2f p, qvtl::geometry::Point2f a,
                                qvtl::geometry::Point2f b) {
  const double dx = b.x - a.x, dy = b.y - a.y, length2 = dx * dx + dy * dy;
  double t = length2 > 0 ? ((p.x - a.x) * dx + (p.y - a.y) * dy) / length2 : 0;
  t = t < 0 ? 0 : t > 1 ? 1 : t;
  return std::hypot(a.x + t * dx - p.x, a.y + t * dy - p.y);
}

// Whether the segments ab and cd cross or come within `room` of each other.
inline bool segmentsNear(qvtl::geometry::Point2f a, qvtl::geometry::Point2f b,
                         qvtl::geometry::Point2f c, qvtl::geometry::Point2f d, double room) {
  const double d1 = cross(a, b, c), d2 = cross(a, b, d), d3 = cross(c, d, a), d4 = cross(c, d, b);
  const bool crossing =
      ((d1 < 0 && d2 > 0) || (d1 > 0 && d2 < 0)) && ((d3 < 0 && d4 > 0) || (d3 > 0 && d4 < 0));
  return crossing || distanceToSegment(a, c, d) < room || distanceToSegment(b, c, d) < room ||
         distanceToSegment(c, a, b) < room || distanceToSegment(d, a, b) < room;
}

// Whether the ring is simple with room to spare: no two non-adjacent edges come within `room` of
// each other and no corner turns back along its own edge. A ring that is simple only by float
// rounding (a path retraced a hair's breadth away) is no reference: ear clipping may cover such a
// sliver more than once, as it is allowed to on degenerate rings.
inline bool isSimple(const qvtl::geometry::PointList& ring, double room = 1e-3) {
  const size_t n = ring.size();
  for (size_t i = 0; i < n; ++i) {
    const auto a = ring[(i + n - 1) % n], b = ring[i], c = ring[(i + 1) % n];
    const double dot =
        static_cast<double>(b.x - a.x) * (c.x - b.x) + static_cast<double>(b.y - a.y) * (c.y - b.y);
    if (dot < 0 && std::fabs(cross(a, b, c)) < room * std::sqrt(-dot)) {
      return false;
    }
    for (size_t j = i + 2; j < n && (i > 0 || j < n - 1); ++j) {
      if (segmentsNear(b, c, ring[j], ring[(j + 1) % n], room)) {
        return false;
      }
    }
  }
  return true;
}

// Whether every edge of one ring stays `room` away from every edge of the other.
inline bool ringsApart(const qvtl::geometry::PointList& r, const qvtl::geometry::PointList& s,
                       double room = 1e-3) {
  for (size_t i = 0; i < r.size(); ++i) {
    for (size_t j = 0; j < s.size(); ++j) {
      if (segmentsNear(r[i], r[(i + 1) % r.size()], s[j], s[(j + 1) % s.size()], room)) {
        return false;
      }
    }
  }
  return true;
}

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_SUPPORT_POLYGON_AREA_H
