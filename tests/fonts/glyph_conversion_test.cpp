#include "fonts/glyph_conversion.h"

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_FONT_FORMATS_H
#include FT_OUTLINE_H

#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <set>
#include <stdexcept>
#include <string>
#include <utility>

namespace {

using qvtl::geometry::Point2f;
using vesk::plugin::lib::AbstractCurve;
using vesk::plugin::lib::convertGlyph;
using vesk::plugin::lib::CubicCurve;
using vesk::plugin::lib::fixed26Dot6ToFloat;
using vesk::plugin::lib::GlyphDescriptor;
using vesk::plugin::lib::LinearCurve;
using vesk::plugin::lib::QuadraticCurve;

constexpr const char* kDejaVuSans = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
constexpr const char* kCantarell = "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf";
constexpr float kPixelSize = 48.0f;

TEST(Fixed26Dot6, BecomesPixelsExactly) {
  const std::pair<long, float> cases[] = {{-1, -0.015625f}, {-65, -1.015625f}, {0, 0.0f},
                                          {64, 1.0f},       {63, 0.984375f},   {-64, -1.0f},
                                          {1, 0.015625f}};
  for (const auto& [fixed, pixels] : cases) {
    EXPECT_EQ(fixed26Dot6ToFloat(fixed), pixels) << fixed;
  }
}

TEST(ConvertGlyph, RejectsANullFace) {
  EXPECT_THROW(convertGlyph(nullptr, 0, kPixelSize, u"", 0), std::invalid_argument);
}

bool underContinuousIntegration() {
  const char* ci = std::getenv("CI");
  return ci != nullptr && std::string(ci) == "true";
}

// One installed font opened with FreeType at 48 pixels; the test fails under CI when the font is
// missing (setup installs it) and is skipped elsewhere.
class InstalledFont : public testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    const char* path = GetParam();
    if (!std::filesystem::exists(path)) {
      if (underContinuousIntegration()) {
        FAIL() << "missing " << path << ": run scripts/setup.sh";
      }
      GTEST_SKIP() << "missing " << path << " (install it with scripts/setup.sh)";
    }
    ASSERT_EQ(FT_Init_FreeType(&library_), 0);
    ASSERT_EQ(FT_New_Face(library_, path, 0, &face_), 0) << path;
    ASSERT_EQ(FT_Set_Pixel_Sizes(face_, 0, static_cast<FT_UInt>(kPixelSize)), 0);
  }
  void TearDown() override {
    if (face_ != nullptr) {
      FT_Done_Face(face_);
    }
    if (library_ != nullptr) {
      FT_Done_FreeType(library_);
    }
  }

  bool isCff() const { return std::string(FT_Get_Font_Format(face_)) == "CFF"; }
  GlyphDescriptor convert(uint32_t glyphIndex) {
    return convertGlyph(face_, glyphIndex, kPixelSize, u"/fonts/test.ttf", 3);
  }

  FT_Library library_ = nullptr;
  FT_Face face_ = nullptr;
};

// Glyphs without an outline: the space, and an index past the last glyph (which FreeType
// cannot load). Both give no contours but the face's metrics.
TEST_P(InstalledFont, GlyphWithoutOutlineHasNoContoursAndTheFaceMetrics) {
  const uint32_t glyphs[] = {FT_Get_Char_Index(face_, ' '),
                             static_cast<uint32_t>(face_->num_glyphs) + 5};
  ASSERT_NE(glyphs[0], 0u);
  for (uint32_t index : glyphs) {
    const GlyphDescriptor glyph = convert(index);
    EXPECT_TRUE(glyph.contours.empty()) << index;
    EXPECT_EQ(glyph.glyphIndex, index);
    EXPECT_EQ(glyph.filePath, u"/fonts/test.ttf");
    EXPECT_EQ(glyph.faceIndex, 3u);
    EXPECT_EQ(glyph.pixelSize, kPixelSize);
    const float unitsPerEm = face_->units_per_EM;
    EXPECT_FLOAT_EQ(glyph.ascender, face_->ascender / unitsPerEm);
    EXPECT_FLOAT_EQ(glyph.descender, face_->descender / unitsPerEm);
    EXPECT_FLOAT_EQ(glyph.lineHeight, face_->height / unitsPerEm);
    EXPECT_GT(glyph.ascender, 0.5f);
    EXPECT_LT(glyph.descender, 0.0f);
    EXPECT_GT(glyph.lineHeight, glyph.ascender - glyph.descender - 0.01f);
  }
}

// The letter o: two closed contours whose curves connect end to start; quadratic segments in a
// TrueType font, cubic ones in a CFF font.
TEST_P(InstalledFont, LetterOIsTwoClosedContoursOfTheFontsCurveKind) {
  const GlyphDescriptor glyph = convert(FT_Get_Char_Index(face_, 'o'));
  ASSERT_EQ(glyph.contours.size(), 2u);
  int linear = 0, quadratic = 0, cubic = 0;
  for (const auto& contour : glyph.contours) {
    ASSERT_FALSE(contour.empty());
    EXPECT_EQ(contour.back()->endPoint(), contour.front()->startPoint());
    for (size_t i = 0; i + 1 < contour.size(); ++i) {
      EXPECT_EQ(contour[i]->endPoint(), contour[i + 1]->startPoint()) << "curve " << i;
    }
    for (const auto& curve : contour) {
      linear += dynamic_cast<const LinearCurve*>(curve.get()) != nullptr;
      quadratic += dynamic_cast<const QuadraticCurve*>(curve.get()) != nullptr;
      cubic += dynamic_cast<const CubicCurve*>(curve.get()) != nullptr;
    }
  }
  if (isCff()) {
    EXPECT_GT(cubic, 0);
    EXPECT_EQ(quadratic, 0);
  } else {
    EXPECT_GT(quadratic, 0);
    EXPECT_EQ(cubic, 0);
  }
  EXPECT_EQ(linear + quadratic + cubic,
            static_cast<int>(glyph.contours[0].size() + glyph.contours[1].size()));
}

using PointSet = std::set<std::pair<float, float>>;

// Every point of the converted curves is one of FreeType's outline points divided by 64: the
// on-curve points are curve ends and the off-curve points are the control points. TrueType
// outlines also imply on-curve points halfway between two off-curve points; those are the only
// other curve ends.
TEST_P(InstalledFont, CurvePointsAreTheOutlinePointsInPixels) {
  const char letters[] = {'o', 'g', 'S', '&'};
  for (char letter : letters) {
    const uint32_t index = FT_Get_Char_Index(face_, letter);
    const GlyphDescriptor glyph = convert(index);
    PointSet ends, controls;
    for (const auto& contour : glyph.contours) {
      for (const auto& curve : contour) {
        ends.insert({curve->startPoint().x, curve->startPoint().y});
        if (auto* q = dynamic_cast<const QuadraticCurve*>(curve.get())) {
          controls.insert({q->controlPoint().x, q->controlPoint().y});
        } else if (auto* c = dynamic_cast<const CubicCurve*>(curve.get())) {
          controls.insert({c->controlPoint().x, c->controlPoint().y});
        }
      }
    }

    ASSERT_EQ(FT_Load_Glyph(face_, index, 0), 0);
    const FT_Outline& outline = face_->glyph->outline;
    ASSERT_EQ(static_cast<size_t>(outline.n_contours), glyph.contours.size()) << letter;
    PointSet onCurve, offCurve;
    for (int i = 0; i < outline.n_points; ++i) {
      const std::pair<float, float> p{outline.points[i].x / 64.0f, outline.points[i].y / 64.0f};
      (FT_CURVE_TAG(outline.tags[i]) == FT_CURVE_TAG_ON ? onCurve : offCurve).insert(p);
    }
    for (const auto& p : onCurve) {
      EXPECT_EQ(ends.count(p), 1u)
          << letter << " on-curve point missing: " << p.first << ", " << p.second;
    }
    if (isCff()) {
      // Cubic control points come in pairs; only the first of each is exposed.
      EXPECT_EQ(ends, onCurve) << letter;
      for (const auto& p : controls) {
        EXPECT_EQ(offCurve.count(p), 1u) << letter;
      }
    } else {
      EXPECT_EQ(controls, offCurve) << letter;
      for (const auto& contour : glyph.contours) {
        for (size_t i = 0; i < contour.size(); ++i) {
          const auto* before = dynamic_cast<const QuadraticCurve*>(contour[i].get());
          const auto* after =
              dynamic_cast<const QuadraticCurve*>(contour[(i + 1) % contour.size()].get());
          const Point2f end = contour[i]->endPoint();
          if (onCurve.count({end.x, end.y}) == 0) {
            ASSERT_TRUE(before && after) << letter << " stray curve end " << end.x << ", " << end.y;
            // FreeType halves the sum in 26.6 units, truncating.
            EXPECT_NEAR(end.x, (before->controlPoint().x + after->controlPoint().x) / 2, 1.0f / 64);
            EXPECT_NEAR(end.y, (before->controlPoint().y + after->controlPoint().y) / 2, 1.0f / 64);
          }
        }
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(TrueTypeAndCff, InstalledFont, testing::Values(kDejaVuSans, kCantarell),
                         [](const testing::TestParamInfo<const char*>& info) {
                           return std::string(info.index == 0 ? "DejaVuSans" : "Cantarell");
                         });

}  // namespace
