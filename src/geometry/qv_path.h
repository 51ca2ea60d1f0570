// A simple closed polygon of a glyph outline with its orientation, bounds and the id of the
// contour it came from, and the operations on one path alone.
#ifndef WAVEFORM_GEOMETRY_QV_PATH_H
#define WAVEFORM_GEOMETRY_QV_PATH_H

#include <array>
#include <cstdint>

#include "geometry/point2.h"

namespace qvtl::geometry {

// Counter-clockwise is meant with y pointing up.
enum Orientation : uint32_t {
  kCounterClockwise = 0,
  kClockwise = 1,
  kUndetermined = 2,
};

template <typename T, int Dimensions>
struct QvPath;

template <>
struct QvPath<float, 2> {
  // Closed: the last point connects back to the first, which is not repeated at the end.
  PointList points;
  Orientation orientation = kUndetermined;
  std::array<float, 4> bounds{};  // minX, minY, maxX, maxY of the points
  uint32_t id = 0;                // the source contour; kept by every loop split from it
};

using Path2f = QvPath<float, 2>;

// Copies the points, cleans them, computes the orientation and the bounds. A point list with a
// NaN or infinite coordinate gives an empty path: such a contour contributes nothing.
Path2f makePath(const PointList& points, uint32_t id = 0);

// Removes points with a zero-length incoming or outgoing edge and spikes that turn straight back,
// stepping back after each removal so that the neighbours are examined again. Collinear points
// stay. Linear in the number of points.
void cleanPath(Path2f& path);

// The winding of the path by its summed turning angle; a path too degenerate for that is decided
// by a vote of the signs of its corners.
Orientation computeOrientation(const Path2f& path);

// Distance from `point` to the path's boundary, positive inside (by the path's orientation);
// 1e7 for a path of fewer than 3 points.
float signedDistance(const Path2f& path, Point2f point);

// Recomputes the bounds from the points (all zero for an empty path).
void updateBounds(Path2f& path);

// Reverses the order of the points; the orientation field is left as it is.
void reversePoints(Path2f& path);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_QV_PATH_H
