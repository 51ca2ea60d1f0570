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
#include "polygon_area.h"

namespace {

using qvtl::geometry::Point2f;
using qvtl::geometry::PointList;
using vesk::plugin::lib::CurveContour;
using vesk::plugin::lib::LinearCurve;
using vesk::plugin::lib::QuadraticCurve;
using waveform_test::signedArea;

struct Bytes {
  const uint8_t* data;
  size_t size;
  size_t at = 0;
  bool empty() const { return at >= size; }
  uint8_t next() { return at < size ? data[at++] : 0; }
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

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  Bytes bytes{data, size};
  vesk::plugin::lib::GlyphDescriptor descriptor;
  const int contours = 1 + bytes.next() % 4;
  for (int i = 0; i < contours && !bytes.empty(); ++i) {
    descriptor.contours.push_back(readContour(bytes));
  }
  const auto outline = qvtl::geometry::makeCharacterOutline(descriptor, {});
  qvtl::geometry::triangulatePieces(*outline);
  for (uint32_t index : outline->indices) {
    if (index >= outline->vertices.size()) {
      std::abort();  // an index past the vertices
    }
  }
  const double triangles = waveform_test::trianglesArea(outline->vertices, outline->indices);
  // One contour that the shape keeps as one simple loop: its triangles cover that loop. (The
  // loop is the contour after cleaning, which may drop a spike that turns back within a hair's
  // breadth, so the contour's own path is not the reference.)
  const std::vector<const qvtl::geometry::Shape2f*> pieces =
      qvtl::geometry::collectFilledPieces(outline->shape);
  if (outline->contours.size() == 1 && pieces.size() == 1 &&
      qvtl::geometry::pieceHoles(*pieces[0]).empty()) {
    const PointList& points = pieces[0]->path.points;
    const double area = std::fabs(signedArea(points));
    if (points.size() >= 3 && area > 1.0 && waveform_test::isSimple(points) &&
        std::fabs(triangles - area) > 1e-3 * area + 1e-2) {
      std::abort();  // a simple loop's triangles do not cover it exactly once
    }
  }
  return 0;
}
