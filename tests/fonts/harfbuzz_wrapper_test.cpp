// The shaping wrapper on installed fonts: when the HarfBuzz font is recreated, the buffer reused
// between runs, direction from the embedding level, size changes, and HarfBuzz's messages only
// when verbose.
#include "fonts/harfbuzz_wrapper.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ci_or_skip.h"
#include "freetype_face.h"

namespace waveform_test {
namespace {

using vesk::plugin::lib::HarfBuzzWrapper;
using vesk::plugin::lib::ShapedGlyph;

const char* const kDejaVu = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
const char* const kCantarell = "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf";

std::vector<uint32_t> clustersOf(const std::vector<ShapedGlyph>& glyphs) {
  std::vector<uint32_t> clusters;
  for (const ShapedGlyph& glyph : glyphs) {
    clusters.push_back(glyph.info.cluster);
  }
  return clusters;
}

class HarfBuzzWrapperTest : public testing::Test {
 protected:
  void SetUp() override {
    REQUIRE_FILE(kDejaVu);
    REQUIRE_FILE(kCantarell);
    wrapper_.setFace(dejaVu_.get());
  }
  FreeTypeFace dejaVu_{kDejaVu, 0, 48};
  FreeTypeFace cantarell_{kCantarell, 0, 48};
  HarfBuzzWrapper wrapper_;
};

TEST_F(HarfBuzzWrapperTest, RecreatesTheFontOnlyWhenTheFaceChanges) {
  struct Step {
    FT_Face face;
    bool releaseFirst;
    uint32_t creations;
  };
  const Step steps[] = {{dejaVu_.get(), false, 1},    {dejaVu_.get(), false, 1},
                        {cantarell_.get(), false, 2}, {cantarell_.get(), false, 2},
                        {dejaVu_.get(), false, 3},    {dejaVu_.get(), true, 4}};
  for (const Step& step : steps) {
    if (step.releaseFirst) {
      wrapper_.releaseFont();
    }
    wrapper_.setFace(step.face);
    EXPECT_EQ(wrapper_.fontCreations(), step.creations) << step.face->family_name;
  }
}

TEST_F(HarfBuzzWrapperTest, DirectionFollowsTheLevelWhateverTheScript) {
  struct Case {
    std::u32string text;
    uint8_t level;
    std::vector<uint32_t> clusters;
  };
  const Case cases[] = {{U"abc", 0, {0, 1, 2}},
                        {U"abc", 1, {2, 1, 0}},
                        {U"abc", 3, {2, 1, 0}},
                        {U"\u05D0\u05D1\u05D2", 1, {2, 1, 0}},
                        {U"\u05D0\u05D1\u05D2", 2, {0, 1, 2}}};
  for (const Case& c : cases) {
    wrapper_.shape(std::vector<uint32_t>(c.text.begin(), c.text.end()), c.level);
    EXPECT_EQ(clustersOf(wrapper_.shapedGlyphs()), c.clusters) << "level " << int{c.level};
  }
}

TEST_F(HarfBuzzWrapperTest, ShapingARunTwiceGivesTheSameGlyphs) {
  const std::vector<uint32_t> text = {'A', 'V', '-', '2', '0'};
  wrapper_.shape(text, 0);
  const std::vector<ShapedGlyph> first = wrapper_.shapedGlyphs();
  wrapper_.shape(text, 0);
  const std::vector<ShapedGlyph> second = wrapper_.shapedGlyphs();
  ASSERT_EQ(second.size(), text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    EXPECT_EQ(second[i].info.glyphIndex, first[i].info.glyphIndex) << i;
    EXPECT_EQ(second[i].position.xAdvance, first[i].position.xAdvance) << i;
  }
}

TEST_F(HarfBuzzWrapperTest, AnUnpairedSurrogateBecomesTheReplacementGlyph) {
  wrapper_.shape({'a', 0xD800, 'b'}, 0);
  const std::vector<ShapedGlyph> glyphs = wrapper_.shapedGlyphs();
  ASSERT_EQ(glyphs.size(), 3u);
  EXPECT_EQ(glyphs[1].info.glyphIndex, FT_Get_Char_Index(dejaVu_.get(), 0xFFFD));
  EXPECT_NE(glyphs[1].info.glyphIndex, 0u);
}

TEST_F(HarfBuzzWrapperTest, WithoutAFaceARunGivesNoGlyphs) {
  for (bool released : {false, true}) {
    HarfBuzzWrapper wrapper;
    if (released) {
      wrapper.setFace(dejaVu_.get());
      wrapper.shape({'-', '2'}, 0);
      wrapper.releaseFont();
    }
    wrapper.shape({'-', '2'}, 0);
    EXPECT_TRUE(wrapper.shapedGlyphs().empty()) << released;
  }
}

TEST_F(HarfBuzzWrapperTest, AdvancesFollowTheFaceSizeAfterASizeChange) {
  wrapper_.shape({'H'}, 0);
  const int32_t at48 = wrapper_.shapedGlyphs()[0].position.xAdvance;
  FT_Set_Pixel_Sizes(dejaVu_.get(), 0, 24);
  wrapper_.fontSizeChanged();
  wrapper_.shape({'H'}, 0);
  EXPECT_NEAR(wrapper_.shapedGlyphs()[0].position.xAdvance, at48 / 2.0, 1.0) << at48;
}

// HarfBuzz reports every lookup it applies; those lines belong only to verbose output.
TEST_F(HarfBuzzWrapperTest, WritesHarfBuzzMessagesOnlyWhenVerbose) {
  struct Case {
    bool atConstruction;
    bool afterwards;
  };
  const Case cases[] = {{false, false}, {true, true}, {true, false}, {false, true}};
  for (const Case& c : cases) {
    HarfBuzzWrapper wrapper(c.atConstruction);
    wrapper.setVerbose(c.afterwards);
    wrapper.setFace(dejaVu_.get());
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    wrapper.shape({'-', '2', '0'}, 0);
    std::fflush(nullptr);
    const std::string err = testing::internal::GetCapturedStderr();
    const std::string out = testing::internal::GetCapturedStdout();
    EXPECT_EQ(err, "");
    if (c.afterwards) {
      EXPECT_EQ(out.rfind("HB Message: ", 0), 0u) << out;
    } else {
      EXPECT_EQ(out, "");
    }
  }
}

}  // namespace
}  // namespace waveform_test
