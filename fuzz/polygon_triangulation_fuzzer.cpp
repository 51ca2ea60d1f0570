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
#include "polygon_area.h"

namespace {

using qvtl::geometry::Point2f;
using qvtl::geometry::PointList;
using waveform_test::isSimple, waveform_test::ringsApart, waveform_test::signedArea;

bool inside(const PointList& ring, const Point2f& p) {
  return waveform_test::insideRing(ring, p.x, p.y);
}

struct Reader {
  const uint8_t* data;
  size_t size;
  size_t at = 0;
  uint8_t next() { return at < size ? data[at++] : 0; }
};

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

// The rings are valid when each is simple (with room to spare: on this integer grid, segments
// that do not touch are more than the room apart) and of some area, no two touch, every hole
// lies inside the outer ring and no hole lies inside another.
bool valid(const PointList& outer, const std::vector<PointList>& holes) {
  bool ok = isSimple(outer) && signedArea(outer) != 0;
  for (size_t h = 0; h < holes.size() && ok; ++h) {
    ok = isSimple(holes[h]) && signedArea(holes[h]) != 0 && ringsApart(outer, holes[h]) &&
         inside(outer, holes[h][0]);
    for (size_t k = 0; k < h && ok; ++k) {
      ok = ringsApart(holes[h], holes[k]) && !inside(holes[h], holes[k][0]) &&
           !inside(holes[k], holes[h][0]);
    }
  }
  return ok;
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
  std::vector<uint32_t> indices;
  for (const auto& t : result.triangles) {
    indices.insert(indices.end(), t.begin(), t.end());
  }
  for (uint32_t index : indices) {
    if (index >= result.vertices.size()) {
      std::abort();
    }
  }
  if (!valid(outer, holes)) {
    return 0;
  }
  double expected = std::fabs(signedArea(outer));
  for (const PointList& hole : holes) {
    expected -= std::fabs(signedArea(hole));
  }
  const double covered = waveform_test::trianglesArea(result.vertices, indices);
  if (std::fabs(covered - expected) > 1e-4 * expected) {
    std::fprintf(stderr, "covered %f, expected %f\n", covered, expected);
    std::abort();
  }
  return 0;
}
