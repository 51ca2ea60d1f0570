// Turns bytes into glyph contours of straight and curved segments, builds the character outline
// from them and triangulates it. For a glyph of one contour that becomes one simple loop the
// triangles must cover exactly the loop's area; for any input the work must end (libFuzzer's
// timeout catches a hang) without a crash, and every index must name a vertex.
//
// Input: the first byte gives the number of contours (1 + byte % 4); each contour is a count byte
// (3 + byte % 61 points) and two signed bytes (x, y) per point, as many as the input holds; a
// point with an odd x becomes the control point of a quadratic segment.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <vector>

#include "geometry/character_outline.h"
#include "geometry/curves.h"
#include "geometry/qv_shape.h"
#include "geometry/triangulate_pieces.h"

namespace {

using qvtl::geometry::Point2f;
using qvtl::geometry::PointList;
using vesk::plugin::lib::CurveContour;
using vesk::plugin::lib::LinearCurve;
using vesk::plugin::lib::QuadraticCurve;

class Bytes {
 public:
  Bytes(const uint8_t* data, size_t size) : data_(data), size_(size) {}
  bool empty() const { return at_ >= size_; }
  uint8_t next() { return at_ < size_ ? data_[at_++] : 0; }

 private:
  const uint8_t* data_;
  size_t size_;
  size_t at_ = 0;
};

CurveContour readContour(Bytes& bytes) {
  const int count = 3 + bytes.next() % 61;
  std::vector<Point2f> points;
  std::vector<bool> controls;
  for (int i = 0; i < count && !bytes.empty(); ++i) {
    const auto x = static_cast<int8_t>(bytes.next());
    const auto y = static_cast<int8_t>(bytes.next());
    points.push_back({static_cast<float>(x), static_cast<float>(y)});
    controls.push_back((x & 1) != 0);
  }
  CurveContour contour;
  const size_t n = points.size();
  for (size_t i = 0; i < n;) {
    const Point2f start = points[i];
    if (controls[(i + 1) % n] && n > 2) {
      contour.push_back(
          std::make_shared<QuadraticCurve>(start, points[(i + 1) % n], points[(i + 2) % n]));
      i += 2;
    } else {
      contour.push_back(std::make_shared<LinearCurve>(start, points[(i + 1) % n]));
      i += 1;
    }
  }
  return contour;
}

double shoelace(const PointList& points) {
  double twice = 0;
  for (size_t i = 0; i < points.size(); ++i) {
    const Point2f& a = points[i];
    const Point2f& b = points[(i + 1) % points.size()];
    twice += static_cast<double>(a.x) * b.y - static_cast<double>(b.x) * a.y;
  }
  return twice / 2;
}

double cross(Point2f o, Point2f a, Point2f b) {
  return static_cast<double>(a.x - o.x) * (b.y - o.y) -
         static_cast<double>(a.y - o.y) * (b.x - o.x);
}

double distanceToSegment(Point2f p, Point2f a, Point2f b) {
  const double dx = b.x - a.x, dy = b.y - a.y;
  const double length2 = dx * dx + dy * dy;
  double t = length2 > 0 ? ((p.x - a.x) * dx + (p.y - a.y) * dy) / length2 : 0;
  t = t < 0 ? 0 : t > 1 ? 1 : t;
  const double ex = a.x + t * dx - p.x, ey = a.y + t * dy - p.y;
  return std::sqrt(ex * ex + ey * ey);
}

// Whether the polygon is simple with some room to spare: no two non-adjacent edges come within
// a thousandth of a pixel of each other, and no corner turns back along its own edge. A loop
// that is simple only by float rounding (a path retraced a hair's breadth away) is no reference:
// ear clipping may cover such a sliver more than once, as it is allowed to on degenerate rings.
bool isSimple(const PointList& points) {
  constexpr double kRoom = 1e-3;
  const size_t n = points.size();
  for (size_t i = 0; i < n; ++i) {
    const Point2f a = points[(i + n - 1) % n], b = points[i], c = points[(i + 1) % n];
    const double dot =
        static_cast<double>(b.x - a.x) * (c.x - b.x) + static_cast<double>(b.y - a.y) * (c.y - b.y);
    if (dot < 0 && std::fabs(cross(a, b, c)) < kRoom * std::sqrt(-dot)) {
      return false;  // a spike: the corner turns back along its edge
    }
  }
  for (size_t i = 0; i < n; ++i) {
    for (size_t j = i + 1; j < n; ++j) {
      if (j == i + 1 || (i == 0 && j == n - 1)) {
        continue;
      }
      const Point2f a = points[i], b = points[(i + 1) % n], c = points[j], d = points[(j + 1) % n];
      const double d1 = cross(a, b, c), d2 = cross(a, b, d), d3 = cross(c, d, a),
                   d4 = cross(c, d, b);
      const bool crossing = ((d1 <= 0 && d2 >= 0) || (d1 >= 0 && d2 <= 0)) &&
                            ((d3 <= 0 && d4 >= 0) || (d3 >= 0 && d4 <= 0));
      if (crossing || distanceToSegment(a, c, d) < kRoom || distanceToSegment(b, c, d) < kRoom ||
          distanceToSegment(c, a, b) < kRoom || distanceToSegment(d, a, b) < kRoom) {
        return false;
      }
    }
  }
  return true;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  Bytes bytes(data, size);
  vesk::plugin::lib::GlyphDescriptor descriptor;
  const int contours = 1 + bytes.next() % 4;
  for (int i = 0; i < contours && !bytes.empty(); ++i) {
    descriptor.contours.push_back(readContour(bytes));
  }
  const auto outline = qvtl::geometry::makeCharacterOutline(descriptor, {});
  qvtl::geometry::triangulatePieces(*outline);
  double triangles = 0;
  for (size_t i = 0; i + 2 < outline->indices.size(); i += 3) {
    for (size_t k = 0; k < 3; ++k) {
      if (outline->indices[i + k] >= outline->vertices.size()) {
        std::abort();  // an index past the vertices
      }
    }
    triangles += std::fabs(shoelace({outline->vertices[outline->indices[i]],
                                     outline->vertices[outline->indices[i + 1]],
                                     outline->vertices[outline->indices[i + 2]]}));
  }
  // One contour that the shape keeps as one simple loop: its triangles cover that loop. (The
  // loop is the contour after cleaning, which may drop a spike that turns back within a hair's
  // breadth, so the contour's own path is not the reference.)
  const std::vector<const qvtl::geometry::Shape2f*> pieces =
      qvtl::geometry::collectFilledPieces(outline->shape);
  if (outline->contours.size() == 1 && pieces.size() == 1 &&
      qvtl::geometry::pieceHoles(*pieces[0]).empty()) {
    const PointList& points = pieces[0]->path.points;
    const double area = std::fabs(shoelace(points));
    if (points.size() >= 3 && area > 1.0 && isSimple(points) &&
        std::fabs(triangles - area) > 1e-3 * area + 1e-2) {
      std::abort();  // a simple loop's triangles do not cover it exactly once
    }
  }
  return 0;
}
