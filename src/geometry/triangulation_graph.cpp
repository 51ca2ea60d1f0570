#include <algorithm>
#include <cmath>

#include "geometry/triangulation.h"

namespace qvtl::geometry {
namespace {

// The neighbour's angle as seen from `from`, in [0, 2 pi]: west is 0, then north, east, south.
// The y difference is negated as written so that a neighbour straight west gets -0 and so 0.
double angularKey(const Point2f& from, const Point2f& to) {
  const double dy = static_cast<double>(to.y) - static_cast<double>(from.y);
  const double dx = static_cast<double>(to.x) - static_cast<double>(from.x);
  return std::atan2(-dy, dx) + M_PI;
}

}  // namespace

// After the neighbours of equal angle already there, so the order of equal angles is insertion
// order.
void TriangulationGraph::insertNeighbour(uint32_t at, uint32_t neighbour) {
  TriangulationVertex& vertex = vertices_[at];
  std::vector<double>& keys = neighbourKeys_[at];
  const double key = angularKey(vertex.position, vertices_[neighbour].position);
  const auto place = std::upper_bound(keys.begin(), keys.end(), key);
  vertex.neighbours.insert(vertex.neighbours.begin() + (place - keys.begin()), neighbour);
  keys.insert(place, key);
}

uint32_t TriangulationGraph::addVertex(Point2f position, uint32_t created) {
  TriangulationVertex vertex;
  vertex.position = position;
  vertex.index = static_cast<uint32_t>(vertices_.size());
  vertex.created = created;
  vertices_.push_back(std::move(vertex));
  neighbourKeys_.emplace_back();
  return vertices_.back().index;
}

void TriangulationGraph::addEdge(uint32_t a, uint32_t b) {
  if (a == b || a >= vertices_.size() || b >= vertices_.size()) {
    return;
  }
  for (uint32_t existing : vertices_[a].neighbours) {
    if (existing == b) {
      return;
    }
  }
  insertNeighbour(a, b);
  insertNeighbour(b, a);
}

}  // namespace qvtl::geometry
