// Glyphs of two installed fonts, one with TrueType (quadratic) and one with CFF (cubic) outlines,
// converted into curves and compared with FreeType's own outline of the same glyphs.
#include "fonts/glyph_conversion.h"

#include <gtest/gtest.h>

#include <memory>
#include <set>
#include <stdexcept>
#include <string>
#include <tuple>
#include <utility>

#include "ci_or_skip.h"
#include "freetype_face.h"
#include FT_FONT_FORMATS_H
#include FT_OUTLINE_H

namespace waveform_test {
namespace {

using vesk::plugin::lib::AbstractCurve;
using vesk::plugin::lib::convertGlyph;
using vesk::plugin::lib::CubicCurve;
using vesk::plugin::lib::GlyphDescriptor;
using vesk::plugin::lib::QuadraticCurve;

constexpr float kPixelSize = 48.0f;

TEST(ConvertGlyph, RejectsANullFace) {
  EXPECT_THROW(convertGlyph(nullptr, 0, kPixelSize, u"", 0), std::invalid_argument);
}

// One installed font opened with FreeType at 48 pixels.
class InstalledFont : public testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    REQUIRE_FILE(GetParam());
    face_ = std::make_unique<FreeTypeFace>(GetParam(), 0, static_cast<unsigned>(kPixelSize));
    ASSERT_NE(face_->get(), nullptr);
  }
  FT_Face face() const { return face_->get(); }
  GlyphDescriptor convert(uint32_t glyphIndex) const {
    return convertGlyph(face(), glyphIndex, kPixelSize, u"", 0);
  }

  std::unique_ptr<FreeTypeFace> face_;
};

// The space, and an index past the last glyph (which FreeType cannot load).
TEST_P(InstalledFont, GlyphWithoutOutlineHasNoContoursAndTheFaceMetrics) {
  const float em = face()->units_per_EM;
  for (uint32_t index :
       {FT_Get_Char_Index(face(), ' '), static_cast<uint32_t>(face()->num_glyphs) + 5}) {
    const GlyphDescriptor glyph = convert(index);
    EXPECT_TRUE(glyph.contours.empty()) << index;
    EXPECT_EQ(std::make_tuple(glyph.ascender, glyph.descender, glyph.lineHeight),
              std::make_tuple(face()->ascender / em, face()->descender / em, face()->height / em));
  }
}

using PointSet = std::set<std::pair<float, float>>;

// The curves of a contour join end to start and close it. Their points are FreeType's outline
// points in pixels: on-curve points are curve ends, off-curve points control points (of the
// cubic segments of a CFF font only the first is kept). TrueType outlines imply on-curve points
// halfway between two off-curve points: those are the only other curve ends.
TEST_P(InstalledFont, CurvesAreFreeTypesOutlineInPixels) {
  const bool cff = std::string(FT_Get_Font_Format(face())) == "CFF";
  for (char letter : {'o', 'g', 'S', '&'}) {
    SCOPED_TRACE(letter);
    const uint32_t index = FT_Get_Char_Index(face(), letter);
    const GlyphDescriptor glyph = convert(index);
    PointSet ends, controls;
    for (const auto& contour : glyph.contours) {
      ASSERT_FALSE(contour.empty());
      for (size_t i = 0; i < contour.size(); ++i) {
        const AbstractCurve& curve = *contour[i];
        EXPECT_EQ(curve.endPoint(), contour[(i + 1) % contour.size()]->startPoint()) << i;
        ends.insert({curve.startPoint().x, curve.startPoint().y});
        const auto* quadratic = dynamic_cast<const QuadraticCurve*>(&curve);
        const auto* cubic = dynamic_cast<const CubicCurve*>(&curve);
        EXPECT_TRUE(cff ? quadratic == nullptr : cubic == nullptr) << "a segment of the other kind";
        if (quadratic != nullptr || cubic != nullptr) {
          const auto control = quadratic ? quadratic->controlPoint() : cubic->controlPoint();
          controls.insert({control.x, control.y});
        }
      }
    }

    ASSERT_EQ(FT_Load_Glyph(face(), index, 0), 0);
    const FT_Outline& outline = face()->glyph->outline;
    ASSERT_EQ(static_cast<size_t>(outline.n_contours), glyph.contours.size());
    PointSet onCurve, offCurve;
    for (int i = 0; i < outline.n_points; ++i) {
      const std::pair<float, float> p{outline.points[i].x / 64.0f, outline.points[i].y / 64.0f};
      (FT_CURVE_TAG(outline.tags[i]) == FT_CURVE_TAG_ON ? onCurve : offCurve).insert(p);
    }
    EXPECT_FALSE(controls.empty());
    if (cff) {
      EXPECT_EQ(ends, onCurve);
      for (const auto& p : controls) {
        EXPECT_EQ(offCurve.count(p), 1u);
      }
      continue;
    }
    EXPECT_EQ(controls, offCurve);
    for (const auto& p : onCurve) {
      EXPECT_EQ(ends.count(p), 1u) << "on-curve point missing: " << p.first << ", " << p.second;
    }
    for (const auto& contour : glyph.contours) {
      for (size_t i = 0; i < contour.size(); ++i) {
        const auto end = contour[i]->endPoint();
        if (onCurve.count({end.x, end.y}) != 0) {
          continue;
        }
        const auto* before = dynamic_cast<const QuadraticCurve*>(contour[i].get());
        const auto* after =
            dynamic_cast<const QuadraticCurve*>(contour[(i + 1) % contour.size()].get());
        ASSERT_TRUE(before && after) << "stray curve end " << end.x << ", " << end.y;
        // FreeType halves the sum in 26.6 units, truncating.
        EXPECT_NEAR(end.x, (before->controlPoint().x + after->controlPoint().x) / 2, 1.0f / 64);
        EXPECT_NEAR(end.y, (before->controlPoint().y + after->controlPoint().y) / 2, 1.0f / 64);
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(
    TrueTypeAndCff, InstalledFont,
    testing::Values("/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf",
                    "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf"),
    [](const testing::TestParamInfo<const char*>& info) {
      return std::string(info.index == 0 ? "DejaVuSans" : "Cantarell");
    });

}  // namespace
}  // namespace waveform_test
