// A 2-D point or vector of the geometry code, in pixels, y pointing up.
#ifndef WAVEFORM_GEOMETRY_POINT2_H
#define WAVEFORM_GEOMETRY_POINT2_H

#include <vector>

namespace qvtl::geometry {

struct Point2f {
  float x = 0;
  float y = 0;
};

inline bool operator==(const Point2f& a, const Point2f& b) {
  return a.x == b.x && a.y == b.y;
}
inline bool operator!=(const Point2f& a, const Point2f& b) {
  return !(a == b);
}

using PointList = std::vector<Point2f>;

// True when |a - b| <= 0.00001 x (min(|a|, |b|) + 1): the float equality of the geometry code.
bool approxEqual(float a, float b);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_POINT2_H
