// A glyph's geometry for the GPU text passes: its contours flattened into paths with room for
// band geometry, the containment tree of its simple loops, and its triangles. Complete when
// built and never changed afterwards, so that threads may share it.
#ifndef WAVEFORM_GEOMETRY_CHARACTER_OUTLINE_H
#define WAVEFORM_GEOMETRY_CHARACTER_OUTLINE_H

#include <array>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "geometry/curves.h"
#include "geometry/qv_path.h"
#include "geometry/qv_shape.h"

namespace qvtl::geometry {

// One source contour.
struct OutlineContour {
  Path2f path;                       // flattened, cleaned and scaled
  PointList outerOffsets;            // two per point: band geometry inputs
  PointList innerOffsets;            // two per point
  std::vector<uint32_t> outerFlags;  // one per point: the band builder's flags
  std::vector<uint32_t> innerFlags;  // one per point
  float innerWidth = 0;
  float outerWidth = 0;
  std::vector<std::array<float, 4>> bandVertices;  // emitted band triangles
  float scale = 1;
  Point2f centre{};
};

struct CharacterOutline {
  uint32_t glyphIndex = 0;
  std::vector<OutlineContour> contours;
  Shape2f shape;
  // The filled area as triangles, made when the outline is built.
  bool triangulated = false;
  std::vector<uint32_t> indices;   // 3 per triangle, all pieces concatenated
  PointList vertices;              // all pieces' vertices concatenated
  std::vector<uint32_t> pieceIds;  // one per triangle: the id of its piece's path
  std::u16string filePath;
  float pixelSize = 0;
  float innerBandWidth = 0;
  float outerBandWidth = 0;
  float ascender = 0;
  float descender = 0;
  float lineHeight = 0;
  std::vector<vesk::plugin::lib::CurveContour> curves;  // the descriptor's contours
};

struct GlyphOutlineRequest {
  float innerBandWidth = 0;
  float outerBandWidth = 0;
  // Handed unchanged to every curve's flatten.
  float steps = 10.0f;
  float step = 0.1f;
  float step2 = 0.01f;
  float step3 = 0.001f;
  float scale = 1.0f;  // applied to every flattened point
};

// A contour flattening to more points is dropped; so is every contour once the glyph holds this
// many points in all. Both keep a hostile glyph's splitting and insertion work bounded.
constexpr std::size_t kMaxContourPoints = 8192;
constexpr std::size_t kMaxGlyphPoints = 65536;
// Loops the glyph's shape may hold (insertion is quadratic in their number); contours past it
// are split less or, once it is used up, not inserted at all.
constexpr std::size_t kMaxLoopsPerGlyph = 1024;

// Builds the outline: each contour gets id (its index + 1); the shape's outermost loops end up
// counter-clockwise with their subtrees flipped to match; the filled pieces are triangulated.
std::shared_ptr<CharacterOutline> makeCharacterOutline(
    const vesk::plugin::lib::GlyphDescriptor& descriptor, const GlyphOutlineRequest& request);

}  // namespace qvtl::geometry

#endif  // WAVEFORM_GEOMETRY_CHARACTER_OUTLINE_H
