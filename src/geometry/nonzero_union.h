// Overlapping contours filled by the non-zero winding rule, as fonts fill them: finding glyphs
// whose contours cross or touch, and replacing their contours by the boundary of the area they
// fill, nested as a containment tree.
#ifndef WAVEFORM_GEOMETRY_NONZERO_UNION_H
#define WAVEFORM_GEOMETRY_NONZERO_UNION_H

#include <cstddef>
#include <vector>

#include "geometry/qv_path.h"
#include "geometry/qv_shape.h"

namespace qvtl::geometry {

// Segment-pair tests spent looking for a crossing; past it the paths are taken to intersect.
constexpr std::size_t kMaxIntersectionTests = 4'000'000;

// Whether any segment of the paths crosses or touches another, two segments that follow each
// other in one path excepted. Paths of fewer than 3 points take no part.
bool pathsIntersect(const std::vector<const Path2f*>& paths);

// Whether some path lies inside another that winds the same way as it, with no path between
// them (a counter inside a counter, a letter inside a ring's hole drawn like the hole): the
// non-zero rule fills what a containment tree, alternating filled and empty by depth, would
// leave empty. Meant for paths that do not intersect; paths without area take no part.
bool nestedWithTheirParentsWinding(const std::vector<const Path2f*>& paths);

// Adds to `shape` (an empty root) the boundary of the area the paths fill under the non-zero
// rule: its outer loops counter-clockwise as the root's children, the holes in each clockwise
// as its children, islands in holes below them, and so on. Each loop carries the id of the path
// that most of its points come from. At most `maxLoops` loops are added. False, with the shape
// untouched, when no union can be made of the paths.
bool addNonZeroUnion(Shape2f& shape, const std::vector<const Path2f*>& paths, std::size_t maxLoops);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_NONZERO_UNION_H
