#include "geometry/triangulate_pieces.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <iterator>

#include "geometry/triangulation.h"
#include "polygon_area.h"

namespace qvtl::geometry {
namespace {

using waveform_test::reversed, waveform_test::signedArea, waveform_test::square,
    waveform_test::trianglesArea;

CharacterOutline outlineOf(const std::vector<PointList>& contours) {
  CharacterOutline outline;
  for (size_t k = 0; k < contours.size(); ++k) {
    addPath(outline.shape, makePath(contours[k], static_cast<uint32_t>(k + 1)));
  }
  return outline;
}

// Each triangle of the polygon triangulation, in reversed order, and computed once.
TEST(TriangulatePieces, SquareGivesTwoTrianglesInReversedOrderOnce) {
  CharacterOutline outline = outlineOf({square(0, 0, 1, 1)});
  triangulatePieces(outline);
  EXPECT_TRUE(outline.triangulated);
  const TriangulationResult direct = triangulatePolygon(square(0, 0, 1, 1), {}, 99999999);
  ASSERT_EQ(direct.triangles.size(), 2u);
  std::vector<uint32_t> reversedIndices;
  for (const Triangle& t : direct.triangles) {
    reversedIndices.insert(reversedIndices.end(), {t[2], t[1], t[0]});
  }
  EXPECT_EQ(outline.indices, reversedIndices);
  EXPECT_EQ(outline.vertices, direct.vertices);
  EXPECT_EQ(outline.pieceIds, (std::vector<uint32_t>{1, 1}));
  addPath(outline.shape, makePath(square(5, 5, 6, 6), 2));
  triangulatePieces(outline);
  EXPECT_EQ(outline.indices.size(), 6u);
}

TEST(TriangulatePieces, PiecesAreConcatenatedWithOffsetIndices) {
  CharacterOutline outline = outlineOf({square(0, 0, 1, 1), square(5, 0, 7, 1)});
  triangulatePieces(outline);
  ASSERT_EQ(outline.vertices.size(), 8u);
  ASSERT_EQ(outline.indices.size(), 12u);
  const auto pieces = collectFilledPieces(outline.shape);
  for (size_t t = 0; t < 4; ++t) {
    const uint32_t firstVertex = t < 2 ? 0 : 4;
    EXPECT_EQ(outline.pieceIds[t], pieces[t / 2]->path.id);
    for (size_t k = 0; k < 3; ++k) {
      EXPECT_GE(outline.indices[3 * t + k], firstVertex);
      EXPECT_LT(outline.indices[3 * t + k], firstVertex + 4);
    }
  }
  EXPECT_NEAR(trianglesArea(outline.vertices, outline.indices), 3, 1e-6);
}

// Found by fuzzing: a long thin contour whose end turns back by a tenth of a degree. Cleaning
// may treat that turn as a spike and drop its point when the loop is cut; whatever loop the
// shape keeps, the fill covers it exactly once.
TEST(TriangulatePieces, HairlineSpikeIsCleanedAwayAndTheRestCoveredOnce) {
  const float xy[] = {32.79f, -0.99f,  22.36f, -0.96f,  10.71f, -0.91f,  -2.16f, -0.84f,  -16.25f,
                      -0.75f, -31.56f, -0.64f, -48.09f, -0.51f, -65.84f, -0.36f, -84.81f, -0.19f,
                      -105,   0,       0,      0,       1.36f,  -0.36f,  3.36f,  -0.51f,  6.24f,
                      -0.64f, 10,      -0.75f, 14.64f,  -0.84f, 20.16f,  -0.91f, 26.56f,  -0.96f};
  PointList thin;
  for (size_t i = 0; i < std::size(xy); i += 2) {
    thin.push_back({xy[i], xy[i + 1]});
  }
  CharacterOutline outline = outlineOf({reversed(thin)});
  const std::vector<const Shape2f*> pieces = collectFilledPieces(outline.shape);
  ASSERT_EQ(pieces.size(), 1u);
  EXPECT_GE(pieces[0]->path.points.size(), thin.size() - 1);
  const double loopArea = std::fabs(signedArea(pieces[0]->path.points));
  triangulatePieces(outline);
  EXPECT_NEAR(trianglesArea(outline.vertices, outline.indices), loopArea, 1e-3 * loopArea);
}

TEST(TriangulatePieces, NoPieceGivesAnEmptyFilledCache) {
  CharacterOutline outline = outlineOf({{{0, 0}, {1, 1}}, {{0, 0}, {1, 0}, {2, 0}}});
  triangulatePieces(outline);
  EXPECT_TRUE(outline.triangulated);
  EXPECT_TRUE(outline.indices.empty());
  EXPECT_TRUE(outline.pieceIds.empty());
}

}  // namespace
}  // namespace qvtl::geometry
