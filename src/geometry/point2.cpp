#include "geometry/point2.h"

#include <algorithm>
#include <cmath>

namespace qvtl::geometry {

bool approxEqual(float a, float b) {
  return std::fabs(a - b) <= 0.00001f * (std::min(std::fabs(a), std::fabs(b)) + 1.0f);
}

}  // namespace qvtl::geometry
