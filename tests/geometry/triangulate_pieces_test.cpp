#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "geometry/triangulate_pieces.h"
#include "geometry/triangulation.h"

namespace qvtl::geometry {
namespace {

PointList square(float x0, float y0, float x1, float y1) {
  return {{x0, y0}, {x1, y0}, {x1, y1}, {x0, y1}};
}

PointList reversed(PointList points) {
  std::reverse(points.begin(), points.end());
  return points;
}

CharacterOutline outlineOf(const std::vector<PointList>& contours) {
  CharacterOutline outline;
  for (size_t k = 0; k < contours.size(); ++k) {
    addPath(outline.shape, makePath(contours[k], static_cast<uint32_t>(k + 1)));
  }
  return outline;
}

// Sum of the triangles' signed areas, counter-clockwise positive.
float coveredArea(const CharacterOutline& outline) {
  float area = 0;
  for (size_t i = 0; i + 2 < outline.indices.size(); i += 3) {
    const Point2f a = outline.vertices[outline.indices[i]];
    const Point2f b = outline.vertices[outline.indices[i + 1]];
    const Point2f c = outline.vertices[outline.indices[i + 2]];
    area += 0.5f * ((b.x - a.x) * (c.y - a.y) - (b.y - a.y) * (c.x - a.x));
  }
  return area;
}

TEST(TriangulatePiecesTest, SquareGivesTwoTrianglesInReversedOrder) {
  CharacterOutline outline = outlineOf({square(0, 0, 1, 1)});
  triangulatePieces(outline);
  EXPECT_TRUE(outline.triangulated);
  const TriangulationResult direct = triangulatePolygon(square(0, 0, 1, 1), {}, 99999999);
  ASSERT_EQ(direct.triangles.size(), 2u);
  ASSERT_EQ(outline.indices.size(), 6u);
  for (size_t t = 0; t < 2; ++t) {
    EXPECT_EQ(outline.indices[3 * t], direct.triangles[t][2]);
    EXPECT_EQ(outline.indices[3 * t + 1], direct.triangles[t][1]);
    EXPECT_EQ(outline.indices[3 * t + 2], direct.triangles[t][0]);
  }
  EXPECT_EQ(outline.vertices, direct.vertices);
  EXPECT_EQ(outline.pieceIds, (std::vector<uint32_t>{1, 1}));
  EXPECT_FLOAT_EQ(coveredArea(outline), 1);
}

TEST(TriangulatePiecesTest, CacheIsComputedOnce) {
  CharacterOutline outline = outlineOf({square(0, 0, 1, 1)});
  triangulatePieces(outline);
  addPath(outline.shape, makePath(square(5, 5, 6, 6), 2));
  triangulatePieces(outline);
  EXPECT_EQ(outline.indices.size(), 6u);
}

TEST(TriangulatePiecesTest, LetterOLeavesItsHoleEmpty) {
  CharacterOutline outline = outlineOf({square(0, 0, 10, 10), reversed(square(3, 3, 7, 7))});
  triangulatePieces(outline);
  EXPECT_NEAR(coveredArea(outline), 100 - 16, 1e-3f);
  EXPECT_EQ(outline.pieceIds, std::vector<uint32_t>(outline.indices.size() / 3, 1));
}

TEST(TriangulatePiecesTest, PiecesAreConcatenatedWithOffsetIndices) {
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
  EXPECT_FLOAT_EQ(coveredArea(outline), 3);
}

// Found by fuzzing: a long thin contour whose end turns back by a tenth of a degree. Cleaning
// may treat that turn as a spike and drop its point when the loop is cut; whatever loop the
// shape keeps, the fill covers it exactly once.
TEST(TriangulatePiecesTest, HairlineSpikeIsCleanedAwayAndTheRestCoveredOnce) {
  const PointList thin = {{32.79f, -0.99f},
                          {22.36f, -0.96f},
                          {10.71f, -0.91f},
                          {-2.16f, -0.84f},
                          {-16.25f, -0.75f},
                          {-31.56f, -0.64f},
                          {-48.09f, -0.51f},
                          {-65.84f, -0.36f},
                          {-84.81f, -0.19f},
                          {-105, 0},
                          {0, 0},
                          {1.36f, -0.36f},
                          {3.36f, -0.51f},
                          {6.24f, -0.64f},
                          {10, -0.75f},
                          {14.64f, -0.84f},
                          {20.16f, -0.91f},
                          {26.56f, -0.96f}};
  CharacterOutline outline = outlineOf({reversed(thin)});
  const std::vector<const Shape2f*> pieces = collectFilledPieces(outline.shape);
  ASSERT_EQ(pieces.size(), 1u);
  const PointList& loop = pieces[0]->path.points;
  EXPECT_GE(loop.size(), thin.size() - 1);
  float loopArea = 0;
  for (size_t i = 0; i < loop.size(); ++i) {
    const Point2f a = loop[i];
    const Point2f b = loop[(i + 1) % loop.size()];
    loopArea += 0.5f * (a.x * b.y - b.x * a.y);
  }
  triangulatePieces(outline);
  EXPECT_NEAR(std::fabs(coveredArea(outline)), std::fabs(loopArea), 1e-3f * std::fabs(loopArea));
}

TEST(TriangulatePiecesTest, NoPieceGivesAnEmptyFilledCache) {
  CharacterOutline outline = outlineOf({{{0, 0}, {1, 1}}, {{0, 0}, {1, 0}, {2, 0}}});
  triangulatePieces(outline);
  EXPECT_TRUE(outline.triangulated);
  EXPECT_TRUE(outline.indices.empty());
  EXPECT_TRUE(outline.pieceIds.empty());
}

}  // namespace
}  // namespace qvtl::geometry
