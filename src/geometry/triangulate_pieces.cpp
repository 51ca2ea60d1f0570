#include "geometry/triangulate_pieces.h"

#include "geometry/triangulation.h"

namespace qvtl::geometry {
namespace {

constexpr uint32_t kMaxEarIterations = 99999999;

}  // namespace

void triangulatePieces(CharacterOutline& outline) {
  if (outline.triangulated) {
    return;
  }
  for (const Shape2f* piece : collectFilledPieces(outline.shape)) {
    const TriangulationResult result =
        triangulatePolygon(piece->path.points, pieceHoles(*piece), kMaxEarIterations);
    const auto base = static_cast<uint32_t>(outline.vertices.size());
    outline.vertices.insert(outline.vertices.end(), result.vertices.begin(), result.vertices.end());
    for (const Triangle& t : result.triangles) {
      outline.indices.insert(outline.indices.end(), {t[2] + base, t[1] + base, t[0] + base});
      outline.pieceIds.push_back(piece->path.id);
    }
  }
  outline.triangulated = true;
}

}  // namespace qvtl::geometry
