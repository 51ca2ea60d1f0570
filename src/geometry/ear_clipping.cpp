// Ear scoring and clipping over one ring of the triangulation graph. Geometry is evaluated in
// double so that no float input can overflow a cross product; the tolerances are those of the
// float code.
#include <algorithm>
#include <cmath>
#include <queue>

#include "geometry/triangulation.h"

namespace qvtl::geometry {
namespace {

struct Vec {
  double x;
  double y;
};

Vec operator-(const Vec& a, const Vec& b) {
  return {a.x - b.x, a.y - b.y};
}
double cross(const Vec& a, const Vec& b) {
  return a.x * b.y - a.y * b.x;
}
bool samePoint(const Vec& a, const Vec& b) {
  return a.x == b.x && a.y == b.y;
}

// approxEqual(value, 0) evaluated in double: |value| <= 0.00001.
bool nearZero(double value) {
  return std::fabs(value) <= 0.00001;
}

Vec normalisedUnlessZero(const Vec& v) {
  if (nearZero(v.x) && nearZero(v.y)) {
    return v;
  }
  const double length = std::sqrt(v.x * v.x + v.y * v.y);
  return {v.x / length, v.y / length};
}

// The ring as a doubly linked list over its original positions, so that clipping keeps every
// remaining vertex's place (which decides ties) and removal is constant time. The points are
// copied per position and the remaining positions kept in a dense list (compacted when half of it
// is gone), so that the quadratic scoring loop reads contiguous arrays.
struct RingLinks {
  std::vector<Vec> points;
  std::vector<uint32_t> previous;
  std::vector<uint32_t> next;
  std::vector<uint8_t> alive;
  std::vector<uint32_t> live;  // remaining positions, and some removed ones until compacted
  size_t remaining = 0;

  RingLinks(const TriangulationGraph& graph, const TriangulationRing& ring)
      : points(ring.size()),
        previous(ring.size()),
        next(ring.size()),
        alive(ring.size(), 1),
        live(ring.size()),
        remaining(ring.size()) {
    const size_t count = ring.size();
    for (size_t i = 0; i < count; ++i) {
      const Point2f& p = graph.vertices()[ring[i].vertex].position;
      points[i] = {p.x, p.y};
      previous[i] = static_cast<uint32_t>((i + count - 1) % count);
      next[i] = static_cast<uint32_t>((i + 1) % count);
      live[i] = static_cast<uint32_t>(i);
    }
  }
  void remove(uint32_t position) {
    alive[position] = 0;
    next[previous[position]] = next[position];
    previous[next[position]] = previous[position];
    if (--remaining * 2 < live.size()) {
      live.erase(std::remove_if(live.begin(), live.end(), [this](uint32_t i) { return !alive[i]; }),
                 live.end());
    }
  }
};

class EarScorer {
 public:
  explicit EarScorer(const RingLinks& links) : links_(links) {}

  float score(uint32_t apexPosition) const {
    const uint32_t before = links_.previous[apexPosition];
    const uint32_t after = links_.next[apexPosition];
    const Vec& previous = links_.points[before];
    const Vec& apex = links_.points[apexPosition];
    const Vec& next = links_.points[after];
    if (!isEar(before, apexPosition, after)) {
      return isSpike(previous, apex, next) ? kSpikeEar : kNotAnEar;
    }
    const Vec u = normalisedUnlessZero(previous - apex);
    const Vec w = normalisedUnlessZero(next - apex);
    if (w.y * u.x - w.x * u.y > 0) {
      return kReflexEar;
    }
    return static_cast<float>((u.x * w.x + u.y * w.y + 1.0) * 0.5);
  }

 private:
  bool isEar(uint32_t before, uint32_t apexPosition, uint32_t after) const {
    const Vec& p = links_.points[before];
    const Vec& a = links_.points[apexPosition];
    const Vec& n = links_.points[after];
    if (nearZero(cross(a - p, n - p))) {
      return false;
    }
    const double minX = std::min({p.x, a.x, n.x});
    const double maxX = std::max({p.x, a.x, n.x});
    const double minY = std::min({p.y, a.y, n.y});
    const double maxY = std::max({p.y, a.y, n.y});
    const double diagonalMinX = std::min(p.x, n.x);
    const double diagonalMaxX = std::max(p.x, n.x);
    const double diagonalMinY = std::min(p.y, n.y);
    const double diagonalMaxY = std::max(p.y, n.y);
    for (uint32_t j : links_.live) {
      if (!links_.alive[j]) {
        continue;
      }
      const uint32_t k = links_.next[j];
      const Vec& q = links_.points[j];
      const Vec& q1 = links_.points[k];
      if (j != before && j != apexPosition && j != after && q.x >= minX && q.x <= maxX &&
          q.y >= minY && q.y <= maxY && insideTriangle(p, a, n, q)) {
        return false;
      }
      if (std::max(q.x, q1.x) >= diagonalMinX && std::min(q.x, q1.x) <= diagonalMaxX &&
          std::max(q.y, q1.y) >= diagonalMinY && std::min(q.y, q1.y) <= diagonalMaxY &&
          crosses(p, n, q, q1)) {
        return false;
      }
    }
    return true;
  }

  // The apex is the tip of a zero-width spike: both neighbours lie on one line on the same side
  // of it. Clipping it emits a triangle of no area and leaves the ring covering what it did.
  static bool isSpike(const Vec& previous, const Vec& apex, const Vec& next) {
    const Vec u = previous - apex, w = next - apex;
    return nearZero(cross(u, w)) && u.x * w.x + u.y * w.y > 0;
  }

  // Closed triangle, except its corners: a vertex repeated where a hole is bridged sits on a
  // corner without blocking the ear, while a vertex on an edge would leave a touching ring.
  static bool insideTriangle(const Vec& p, const Vec& a, const Vec& n, const Vec& q) {
    if (samePoint(q, p) || samePoint(q, a) || samePoint(q, n)) {
      return false;
    }
    const double d1 = cross(a - p, q - p);
    const double d2 = cross(n - a, q - a);
    const double d3 = cross(p - n, q - n);
    const bool negative = d1 < 0 || d2 < 0 || d3 < 0;
    const bool positive = d1 > 0 || d2 > 0 || d3 > 0;
    return !(negative && positive);
  }

  // The diagonal p -> n crosses edge q0 -> q1 strictly inside both (parameters in (0.001, 0.999));
  // nearly parallel edges (cross product of directions within 0.001 of 0) never cross.
  static bool crosses(const Vec& p, const Vec& n, const Vec& q0, const Vec& q1) {
    const Vec d = n - p;
    const Vec e = q1 - q0;
    double denominator = cross(d, e);
    if (std::fabs(denominator) <= 0.001) {
      return false;
    }
    const Vec w = q0 - p;
    double t = cross(w, e);  // the parameters times the denominator, compared without division
    double u = cross(w, d);
    if (denominator < 0) {
      denominator = -denominator, t = -t, u = -u;
    }
    const double low = 0.001 * denominator;
    const double high = 0.999 * denominator;
    return t > low && t < high && u > low && u < high;
  }

  const RingLinks& links_;
};

}  // namespace

float earScore(const TriangulationGraph& graph, const TriangulationRing& ring, size_t position) {
  if (ring.size() < 3 || position >= ring.size()) {
    return kNotAnEar;
  }
  const RingLinks links(graph, ring);
  return EarScorer(links).score(static_cast<uint32_t>(position));
}

void clipEars(TriangulationGraph& graph, TriangulationRing& ring, uint32_t maxIterations,
              std::vector<Triangle>& triangles) {
  if (ring.size() < 3) {
    return;
  }
  RingLinks links(graph, ring);
  const EarScorer scorer(links);
  // Best score first, then the first position; an entry is stale once its position was re-scored
  // or clipped.
  struct Candidate {
    float score;
    uint32_t position;
    uint32_t stamp;
  };
  auto worse = [](const Candidate& a, const Candidate& b) {
    return a.score < b.score || (a.score == b.score && a.position > b.position);
  };
  std::priority_queue<Candidate, std::vector<Candidate>, decltype(worse)> queue(worse);
  std::vector<uint32_t> stamps(ring.size(), 0);
  auto rescore = [&](uint32_t position) {
    ring[position].score = scorer.score(position);
    queue.push({ring[position].score, position, ++stamps[position]});
  };
  for (uint32_t i = 0; i < ring.size(); ++i) {
    rescore(i);
  }
  for (uint32_t steps = 0; links.remaining > 2 && steps < maxIterations; ++steps) {
    while (!links.alive[queue.top().position] ||
           queue.top().stamp != stamps[queue.top().position]) {
      queue.pop();
    }
    const uint32_t best = queue.top().position;
    queue.pop();
    const uint32_t before = links.previous[best];
    const uint32_t after = links.next[best];
    triangles.push_back({ring[after].vertex, ring[best].vertex, ring[before].vertex});
    if (links.remaining > 3) {
      graph.addEdge(ring[before].vertex, ring[after].vertex);
    }
    links.remove(best);
    if (links.remaining > 2) {
      rescore(before);
      rescore(after);
    }
  }
  TriangulationRing left;
  left.reserve(links.remaining);
  for (uint32_t i = 0; i < ring.size(); ++i) {
    if (links.alive[i]) {
      left.push_back(ring[i]);
    }
  }
  ring = std::move(left);
}

}  // namespace qvtl::geometry
