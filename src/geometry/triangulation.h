// Triangulation of glyph pieces: one outer ring with its holes at a time, by clipping ears from
// the faces of a planar vertex graph.
#ifndef WAVEFORM_GEOMETRY_TRIANGULATION_H
#define WAVEFORM_GEOMETRY_TRIANGULATION_H

#include <array>
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
// maxIterations = 99999999.
TriangulationResult triangulatePolygon(const PointList& outer, const std::vector<PointList>& holes,
                                       uint32_t maxIterations);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_TRIANGULATION_H
