// The containment tree of a glyph's simple closed loops: outer boundaries, holes inside them,
// islands inside holes. Built by splitting each contour into simple loops and inserting them.
#ifndef WAVEFORM_GEOMETRY_QV_SHAPE_H
#define WAVEFORM_GEOMETRY_QV_SHAPE_H

#include <cstddef>
#include <vector>

#include "geometry/qv_path.h"

namespace qvtl::geometry {

template <typename T, typename PathType>
struct QvShape {
  PathType path;                  // empty at the root
  std::vector<QvShape> children;  // each lies inside this node's path
};

using Shape2f = QvShape<float, Path2f>;

// Limits that keep a hostile contour from costing more than a fraction of a second. Well-formed
// glyphs stay far below all of them.
// A path with more points is not split at its crossings (it is still split at revisited points).
constexpr std::size_t kMaxSplitPoints = 4096;
// Segment-pair crossing tests spent on splitting one path; when used up the loops still to be
// examined are kept as they are.
constexpr std::size_t kMaxCrossingTests = 8'000'000;
// Loops one path may be split into; the remainder is kept as one loop.
constexpr std::size_t kMaxLoopsPerPath = 512;
// Nesting depth of the tree; a loop that would go deeper becomes a sibling at this depth.
constexpr std::size_t kMaxShapeDepth = 64;
// Points of a node summed by the overlap test of containsPath (evenly spread over the node).
constexpr std::size_t kMaxOverlapSamples = 64;

// Whether `outer` contains `inner`. Paths with fewer than 3 points, or an empty `inner`, contain
// nothing. With `allowOverlapTest`, a larger path whose bounds only overlap `inner`'s decides by
// the summed signed distances of `inner`'s points.
bool containsPath(const Path2f& inner, const Path2f& outer, bool allowOverlapTest);
bool containsPath(const Shape2f& node, const Path2f& outer, bool allowOverlapTest);

// Inserts the path below the deepest node containing it; existing children that the new path
// contains move under it.
void insertIntoShape(Shape2f& node, Path2f path);

// Cuts the path at its crossings into loops, each made with makePath and carrying the path's id.
// The loops keep the path's direction of travel.
// At most `maxLoops` loops come out; the last holds what is left unsplit.
std::vector<Path2f> splitSelfIntersections(Path2f path);
std::vector<Path2f> splitSelfIntersections(Path2f path, std::size_t maxLoops);
// Cuts out every stretch between a point and a later exact repeat of it as a loop of its own.
// At most `maxLoops` loops come out; the last holds what is left.
std::vector<Path2f> splitTouchingPoints(Path2f path);
std::vector<Path2f> splitTouchingPoints(Path2f path, std::size_t maxLoops);

// Splits the path into simple loops and inserts each into the shape. An empty path contributes
// nothing; a path of fewer than 3 points is inserted as it is. Inserts at most `maxLoops` loops
// and returns how many.
std::size_t addPath(Shape2f& shape, Path2f path, std::size_t maxLoops = kMaxLoopsPerPath);

// Reverses the points of the node and all its descendants, swapping orientations 0 and 1.
void flipOrientation(Shape2f& node);

// The nodes to fill, children before their parents: every node of at least 3 points whose
// orientation is not clockwise.
std::vector<const Shape2f*> collectFilledPieces(const Shape2f& shape);

// The holes of a piece: its direct children with orientation 1 as they are, its direct children
// with another orientation and a different id reversed. Children with the piece's id are not
// holes.
std::vector<PointList> pieceHoles(const Shape2f& piece);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_QV_SHAPE_H
