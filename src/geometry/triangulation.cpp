// triangulatePolygon: the outer ring and its holes become one ring, which is clipped into ears.
//
// Holes are carved by bridging rather than by splitting the graph at crossings and walking its
// faces: holes are taken by their rightmost point, rightmost first, and each is joined to a vertex
// of the ring built so far that the point sees (a ray to the right finds the nearest edge; the
// visible vertex is that edge's right end or, if ring vertices lie in the triangle between the
// point, the hit and that end, the one at the smallest angle to the ray). The ring then runs in
// along the bridge, around the hole and back out. Every step is linear in the ring, no new points
// are computed (so no rounding can make faces overlap), and the one ring is weakly simple: it
// touches itself only at the repeated bridge ends, which the ear test treats as corners. The
// covered area is the outer ring's minus the holes', each once.
#include <algorithm>
#include <cmath>
#include <optional>

#include "geometry/triangulation.h"

namespace qvtl::geometry {
namespace {

using Ring = std::vector<uint32_t>;  // graph vertex indices

double signedArea(const std::vector<TriangulationVertex>& vertices, const Ring& ring) {
  double sum = 0;
  for (size_t i = 0; i < ring.size(); ++i) {
    const Point2f& a = vertices[ring[i]].position;
    const Point2f& b = vertices[ring[(i + 1) % ring.size()]].position;
    sum += static_cast<double>(a.x) * b.y - static_cast<double>(b.x) * a.y;
  }
  return sum * 0.5;
}

bool finite(const PointList& points) {
  return std::all_of(points.begin(), points.end(),
                     [](const Point2f& p) { return std::isfinite(p.x) && std::isfinite(p.y); });
}

// The vertices first..first+count-1 as a ring without repeated consecutive points, turned so that
// its signed area has the wanted sign (positive: counter-clockwise). A ring with fewer than 3
// points or zero area comes back empty when `dropFlat` is set.
Ring orientedRing(const std::vector<TriangulationVertex>& vertices, uint32_t first, size_t count,
                  bool counterClockwise, bool dropFlat) {
  Ring ring;
  for (uint32_t i = first; i < first + count; ++i) {
    if (ring.empty() || vertices[ring.back()].position != vertices[i].position) {
      ring.push_back(i);
    }
  }
  while (ring.size() > 1 && vertices[ring.back()].position == vertices[ring.front()].position) {
    ring.pop_back();
  }
  const double area = ring.size() >= 3 ? signedArea(vertices, ring) : 0.0;
  if (dropFlat && (ring.size() < 3 || area == 0)) {
    return {};
  }
  if ((area < 0 && counterClockwise) || (area > 0 && !counterClockwise)) {
    std::reverse(ring.begin(), ring.end());
  }
  return ring;
}

struct Vec {
  double x;
  double y;
};
Vec toVec(const Point2f& p) {
  return {p.x, p.y};
}
double cross(const Vec& o, const Vec& a, const Vec& b) {
  return (a.x - o.x) * (b.y - o.y) - (a.y - o.y) * (b.x - o.x);
}
bool insideClosedTriangle(const Vec& a, const Vec& b, const Vec& c, const Vec& q) {
  const double d1 = cross(a, b, q);
  const double d2 = cross(b, c, q);
  const double d3 = cross(c, a, q);
  return !((d1 < 0 || d2 < 0 || d3 < 0) && (d1 > 0 || d2 > 0 || d3 > 0));
}

// Whether direction d leaves `corner` into the filled side, the counter-clockwise sweep from the
// outgoing edge to the incoming one (the ring runs counter-clockwise).
bool insideWedge(const Vec& previous, const Vec& corner, const Vec& next, const Vec& d) {
  const double start = std::atan2(next.y - corner.y, next.x - corner.x);
  auto sweep = [start](double angle) {
    double s = angle - start;
    while (s < 0) {
      s += 2 * M_PI;
    }
    while (s >= 2 * M_PI) {
      s -= 2 * M_PI;
    }
    return s;
  };
  double end = sweep(std::atan2(previous.y - corner.y, previous.x - corner.x));
  if (end == 0) {
    end = 2 * M_PI;
  }
  return sweep(std::atan2(d.y, d.x)) < end;
}

class HoleBridger {
 public:
  explicit HoleBridger(const std::vector<TriangulationVertex>& vertices) : vertices_(vertices) {}

  // A hole that touches the ring at a point (one of its vertices lies where a ring vertex lies)
  // needs no bridge: it is spliced in at that point. Gives the hole's vertex and the ring
  // position, whose filled wedge holds the hole's edges there.
  std::optional<std::pair<size_t, size_t>> touchingPoint(const Ring& ring, const Ring& hole) const {
    for (size_t k = 0; k < hole.size(); ++k) {
      const Vec p = point(hole[k]);
      const bool onRing = std::any_of(ring.begin(), ring.end(), [&](uint32_t vertex) {
        const Vec q = point(vertex);
        return q.x == p.x && q.y == p.y;
      });
      if (onRing) {
        return std::pair{k, positionFacing(ring, p, point(hole[(k + 1) % hole.size()]))};
      }
    }
    return std::nullopt;
  }

  // The ring position whose vertex the hole point m sees, or nothing when no ring edge lies to its
  // right (the hole is not inside the ring).
  std::optional<size_t> visiblePosition(const Ring& ring, uint32_t m) const {
    const Vec hole = point(m);
    std::optional<Vec> hit;
    Vec end{};
    for (size_t i = 0; i < ring.size(); ++i) {
      // Only edges running upwards can be left when going right from inside the filled area.
      const Vec a = point(ring[i]);
      const Vec b = point(ring[(i + 1) % ring.size()]);
      if (!(a.y <= hole.y && hole.y <= b.y && a.y < b.y)) {
        continue;
      }
      const double x = a.x + (hole.y - a.y) * (b.x - a.x) / (b.y - a.y);
      if (x <= hole.x || (hit && x >= hit->x)) {
        continue;
      }
      hit = Vec{x, hole.y};
      end = a.y == hole.y ? a : b.y == hole.y ? b : (a.x > b.x ? a : b);
    }
    if (!hit) {
      return std::nullopt;
    }
    const Vec target = bestVisible(ring, hole, *hit, end);
    return positionFacing(ring, target, hole);
  }

 private:
  Vec point(uint32_t vertex) const { return toVec(vertices_[vertex].position); }

  // Of the ring points in the triangle (hole, hit, end), end included, the one at the smallest
  // angle to the ray, the nearest on ties: nothing can lie between it and the hole point.
  Vec bestVisible(const Ring& ring, const Vec& hole, const Vec& hit, const Vec& end) const {
    Vec best = end;
    if (hit.x == end.x && hit.y == end.y) {
      return best;
    }
    auto angle = [&hole](const Vec& q) {
      return std::atan2(std::fabs(q.y - hole.y), q.x - hole.x);
    };
    auto distance = [&hole](const Vec& q) {
      return (q.x - hole.x) * (q.x - hole.x) + (q.y - hole.y) * (q.y - hole.y);
    };
    double bestAngle = angle(best);
    for (uint32_t vertex : ring) {
      const Vec q = point(vertex);
      if (q.x <= hole.x || !insideClosedTriangle(hole, hit, end, q)) {
        continue;
      }
      const double a = angle(q);
      if (a < bestAngle || (a == bestAngle && distance(q) < distance(best))) {
        best = q;
        bestAngle = a;
      }
    }
    return best;
  }

  // The place of `target` in the ring whose filled wedge the bridge enters; a point repeated by an
  // earlier bridge has one place per wedge.
  size_t positionFacing(const Ring& ring, const Vec& target, const Vec& hole) const {
    std::optional<size_t> first;
    for (size_t i = 0; i < ring.size(); ++i) {
      const Vec q = point(ring[i]);
      if (q.x != target.x || q.y != target.y) {
        continue;
      }
      if (!first) {
        first = i;
      }
      const Vec previous = point(ring[(i + ring.size() - 1) % ring.size()]);
      const Vec next = point(ring[(i + 1) % ring.size()]);
      if (insideWedge(previous, q, next, {hole.x - q.x, hole.y - q.y})) {
        return i;
      }
    }
    return first.value_or(0);
  }

  const std::vector<TriangulationVertex>& vertices_;
};

size_t rightmost(const std::vector<TriangulationVertex>& vertices, const Ring& hole) {
  size_t best = 0;
  for (size_t i = 1; i < hole.size(); ++i) {
    if (vertices[hole[i]].position.x > vertices[hole[best]].position.x) {
      best = i;
    }
  }
  return best;
}

void addRingEdges(TriangulationGraph& graph, const Ring& ring) {
  for (size_t i = 0; i < ring.size(); ++i) {
    graph.addEdge(ring[i], ring[(i + 1) % ring.size()]);
  }
}

// Splices each hole into `ring` behind the vertex it sees: ..., v, m, hole..., m, v, ... A hole
// that touches the ring is spliced in where it touches. True when a hole touched the ring.
bool bridgeHoles(TriangulationGraph& graph, Ring& ring, std::vector<Ring> holes) {
  const auto& vertices = graph.vertices();
  std::stable_sort(holes.begin(), holes.end(), [&vertices](const Ring& a, const Ring& b) {
    return vertices[a[rightmost(vertices, a)]].position.x >
           vertices[b[rightmost(vertices, b)]].position.x;
  });
  const HoleBridger bridger(vertices);
  bool touched = false;
  for (const Ring& hole : holes) {
    if (const auto touching = bridger.touchingPoint(ring, hole)) {
      touched = true;
      // ..., p, hole after p ..., p (the hole's own vertex), ...: the ring touches itself at p.
      const auto [k, at] = *touching;
      Ring spliced(ring.begin(), ring.begin() + static_cast<std::ptrdiff_t>(at) + 1);
      for (size_t step = 1; step <= hole.size(); ++step) {
        spliced.push_back(hole[(k + step) % hole.size()]);
      }
      spliced.insert(spliced.end(), ring.begin() + static_cast<std::ptrdiff_t>(at) + 1, ring.end());
      addRingEdges(graph, hole);
      ring = std::move(spliced);
      continue;
    }
    const size_t m = rightmost(vertices, hole);
    const std::optional<size_t> at = bridger.visiblePosition(ring, hole[m]);
    if (!at) {
      continue;
    }
    Ring spliced(ring.begin(), ring.begin() + static_cast<std::ptrdiff_t>(*at) + 1);
    for (size_t k = 0; k <= hole.size(); ++k) {
      spliced.push_back(hole[(m + k) % hole.size()]);
    }
    spliced.push_back(ring[*at]);
    spliced.insert(spliced.end(), ring.begin() + static_cast<std::ptrdiff_t>(*at) + 1, ring.end());
    addRingEdges(graph, hole);
    graph.addEdge(ring[*at], hole[m]);
    ring = std::move(spliced);
  }
  return touched;
}

// A hole that touches its outer ring at two points cuts the piece there, and other holes may add
// further cuts: the ring then touches itself at points where both of its parts fill area. Such
// a ring is clipped as the separate rings it splits into at those points; a repeated point with
// a hole on one side (a bridge end, a single touch) keeps the ring whole.
std::vector<Ring> separatedAtCuts(const std::vector<TriangulationVertex>& vertices, Ring ring) {
  std::vector<Ring> done;
  std::vector<Ring> pending = {std::move(ring)};
  while (!pending.empty()) {
    Ring current = std::move(pending.back());
    pending.pop_back();
    bool split = false;
    for (size_t i = 0; i < current.size() && !split; ++i) {
      for (size_t j = i + 2; j < current.size() && !split; ++j) {
        if (vertices[current[i]].position != vertices[current[j]].position ||
            (i == 0 && j + 1 == current.size())) {
          continue;
        }
        Ring inner(current.begin() + static_cast<std::ptrdiff_t>(i),
                   current.begin() + static_cast<std::ptrdiff_t>(j));
        Ring outer(current.begin() + static_cast<std::ptrdiff_t>(j), current.end());
        outer.insert(outer.end(), current.begin(),
                     current.begin() + static_cast<std::ptrdiff_t>(i));
        if (signedArea(vertices, inner) > 0 && signedArea(vertices, outer) > 0) {
          pending.push_back(std::move(inner));
          pending.push_back(std::move(outer));
          split = true;
        }
      }
    }
    if (!split) {
      done.push_back(std::move(current));
    }
  }
  return done;
}

}  // namespace

TriangulationResult triangulatePolygon(const PointList& outer, const std::vector<PointList>& holes,
                                       uint32_t maxIterations) {
  size_t total = outer.size();
  bool allFinite = finite(outer);
  for (const PointList& hole : holes) {
    total += hole.size() + 2;  // a bridge repeats two points in the clipped ring
    allFinite = allFinite && finite(hole);
  }
  if (!allFinite || total > kMaxTriangulationPoints) {
    return {};
  }

  TriangulationGraph graph;
  for (const Point2f& p : outer) {
    graph.addVertex(p);
  }
  for (const PointList& hole : holes) {
    for (const Point2f& p : hole) {
      graph.addVertex(p);
    }
  }

  Ring ring = orientedRing(graph.vertices(), 0, outer.size(), true, false);
  addRingEdges(graph, ring);
  std::vector<Ring> holeRings;
  uint32_t first = static_cast<uint32_t>(outer.size());
  for (const PointList& hole : holes) {
    Ring holeRing = orientedRing(graph.vertices(), first, hole.size(), false, true);
    if (!holeRing.empty() && ring.size() >= 3) {
      holeRings.push_back(std::move(holeRing));
    }
    first += static_cast<uint32_t>(hole.size());
  }
  const bool touched = bridgeHoles(graph, ring, std::move(holeRings));

  TriangulationResult result;
  const std::vector<Ring> rings =
      touched ? separatedAtCuts(graph.vertices(), std::move(ring)) : std::vector<Ring>{ring};
  for (const Ring& part : rings) {
    TriangulationRing clipped;
    clipped.reserve(part.size());
    for (uint32_t vertex : part) {
      clipped.push_back({vertex, 0.0f});
    }
    clipEars(graph, clipped, maxIterations, result.triangles);
  }
  result.vertices.reserve(graph.vertices().size());
  for (const TriangulationVertex& vertex : graph.vertices()) {
    result.vertices.push_back(vertex.position);
  }
  return result;
}

}  // namespace qvtl::geometry
