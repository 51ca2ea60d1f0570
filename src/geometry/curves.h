// Glyph contours as curves: straight segments and quadratic and cubic Bezier segments in pixels
// (y up), flattened into points by forward differencing; and the glyph as the font layer hands it
// to the geometry code.
#ifndef WAVEFORM_GEOMETRY_CURVES_H
#define WAVEFORM_GEOMETRY_CURVES_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "geometry/point2.h"

namespace vesk::plugin::lib {

using qvtl::geometry::Point2f;
using qvtl::geometry::PointList;

// Immutable after construction; held by shared ownership.
class AbstractCurve {
 public:
  virtual ~AbstractCurve() = default;
  // Appends sample points of the curve to `points`: its start point, then the points of
  // `steps` forward-difference steps that lie more than one pixel (in x or in y) from the last
  // appended point; never the end point, which the next curve of the contour starts with.
  virtual void flatten(float steps, float step, float step2, float step3,
                       PointList& points) const = 0;
  virtual Point2f startPoint() const = 0;
  virtual Point2f endPoint() const = 0;
};

class LinearCurve : public AbstractCurve {
 public:
  LinearCurve(Point2f start, Point2f end);
  void flatten(float steps, float step, float step2, float step3,
               PointList& points) const override;
  Point2f startPoint() const override { return start_; }
  Point2f endPoint() const override { return end_; }

 private:
  Point2f start_, end_;
};

class QuadraticCurve : public AbstractCurve {
 public:
  QuadraticCurve(Point2f start, Point2f control, Point2f end);
  void flatten(float steps, float step, float step2, float step3,
               PointList& points) const override;
  Point2f startPoint() const override { return start_; }
  Point2f endPoint() const override { return end_; }
  virtual Point2f controlPoint() const { return control_; }

 private:
  Point2f start_, control_, end_;
};

class CubicCurve : public AbstractCurve {
 public:
  CubicCurve(Point2f start, Point2f control1, Point2f control2, Point2f end);
  void flatten(float steps, float step, float step2, float step3,
               PointList& points) const override;
  Point2f startPoint() const override { return start_; }
  Point2f endPoint() const override { return end_; }
  virtual Point2f controlPoint() const { return control1_; }

 private:
  Point2f start_, control1_, control2_, end_;
};

// A closed contour: curves in drawing order, each starting where the previous one ends, the last
// ending where the first starts.
using CurveContour = std::vector<std::shared_ptr<const AbstractCurve>>;

// One glyph of one face at one size.
struct GlyphDescriptor {
  uint32_t glyphIndex = 0;
  std::u16string filePath;
  uint32_t faceIndex = 0;
  float pixelSize = 0;
  float ascender = 0;    // in em
  float descender = 0;   // in em, negative below the baseline
  float lineHeight = 0;  // in em
  std::vector<CurveContour> contours;
};

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_GEOMETRY_CURVES_H
