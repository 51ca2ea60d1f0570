// Triangulation of glyph pieces: one outer ring with its holes at a time. The holes are bridged
// into the outer ring, and ears are clipped from that one ring while the diagonals are recorded in
// a planar vertex graph.
#ifndef WAVEFORM_GEOMETRY_TRIANGULATION_H
#define WAVEFORM_GEOMETRY_TRIANGULATION_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "geometry/point2.h"

namespace qvtl::geometry {

using Triangle = std::array<uint32_t, 3>;

struct TriangulationResult {
  PointList vertices;               // the outer ring's and holes' points, then created points
  std::vector<Triangle> triangles;  // indices into vertices
};

// Triangulates the area inside `outer` and outside every hole. The outline passes
// maxIterations = 99999999. A non-finite coordinate, or more than kMaxTriangulationPoints points
// in all (each hole counting two more for its bridge), gives no triangles. Holes with fewer than 3
// distinct points, zero area, or no part of the outer ring to their right (so not inside it) are
// ignored.
TriangulationResult triangulatePolygon(const PointList& outer, const std::vector<PointList>& holes,
                                       uint32_t maxIterations);

// The work is quadratic in the number of points; this bounds one call to about a quarter of a
// second.
inline constexpr size_t kMaxTriangulationPoints = 6000;

// A vertex of the triangulator's planar graph.
struct TriangulationVertex {
  Point2f position;
  uint32_t index = 0;                // its own place in the graph
  std::vector<uint32_t> neighbours;  // sorted by atan2(-(y - y0), x - x0) + pi, seen from here
  uint32_t created = 0;              // 1 for a vertex made by the triangulator
};

// Vertices with their undirected edges, each stored in both end points' neighbour lists.
class TriangulationGraph {
 public:
  uint32_t addVertex(Point2f position, uint32_t created = 0);
  // Adding an existing edge or a self-loop changes nothing.
  void addEdge(uint32_t a, uint32_t b);
  const std::vector<TriangulationVertex>& vertices() const { return vertices_; }

 private:
  void insertNeighbour(uint32_t at, uint32_t neighbour);

  std::vector<TriangulationVertex> vertices_;
  std::vector<std::vector<double>> neighbourKeys_;  // the angles of each vertex's neighbours
};

// The face being clipped: graph vertex indices in ring order (counter-clockwise with y up for a
// filled area), each with its last ear score. A vertex may appear twice where a hole is bridged.
struct RingVertex {
  uint32_t vertex = 0;
  float score = 0;
};
using TriangulationRing = std::vector<RingVertex>;

inline constexpr float kNotAnEar = -4.0f;
inline constexpr float kReflexEar = -2.0f;
// A zero-width spike's tip: clipped only when no ear scores 0 or more, before any reflex ear.
inline constexpr float kSpikeEar = -1.0f;

// The score of the ring vertex at `position` as the apex of an ear with its ring neighbours:
// kNotAnEar when the triangle is degenerate, its diagonal crosses a ring edge or another ring
// vertex lies in it (edges included, points at the triangle's corners excluded), or kSpikeEar
// instead when the apex is the tip of a zero-width spike; kReflexEar for a reflex apex; otherwise
// (cos(apex angle) + 1) / 2, 1 for the sharpest apex.
float earScore(const TriangulationGraph& graph, const TriangulationRing& ring, size_t position);

// Clips the best-scored ear (the first on ties, even a negative score, so it always ends) until
// two vertices remain or maxIterations ears are clipped. Each ear appends the triangle
// (next, apex, previous); while more than 3 vertices remain the diagonal joins the graph. `ring`
// is left holding the vertices not clipped, with their scores.
void clipEars(TriangulationGraph& graph, TriangulationRing& ring, uint32_t maxIterations,
              std::vector<Triangle>& triangles);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_TRIANGULATION_H
