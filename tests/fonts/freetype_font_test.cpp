// The font object on installed fonts and on broken files: faces and named instances selected,
// shaping and outlines equal to the same work done directly on the same face, and no face left
// half-selected after a failure.
#include "fonts/freetype_font.h"

#include <gtest/gtest.h>

#include <ft2build.h>
#include FT_FREETYPE_H

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

#include "ci_or_skip.h"
#include "fonts/glyph_conversion.h"
#include "freetype_face.h"
#include "text/unicode_helper.h"

namespace waveform_test {
namespace {

using namespace vesk::plugin::lib;
using vesk::project::FontRecord;

const char* const kDejaVu = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
const char* const kInter = "/usr/share/fonts/truetype/inter-vf/Inter-roman.var.ttf";

FontRecord recordFor(const std::string& path, const std::u16string& postScriptName,
                     int32_t faceIndex = 0, int32_t instanceId = 0,
                     const std::u16string& family = u"") {
  FontRecord record;
  record.filePath = std::u16string(path.begin(), path.end());
  record.postScriptName = postScriptName;
  record.faceIndex = faceIndex;
  record.instanceId = instanceId;
  record.familyName = family;
  return record;
}

// Glyph indices, clusters and positions of a run as text, for comparing and printing.
std::string shapedText(HarfBuzzWrapper& wrapper, const std::u32string& text) {
  wrapper.shape(std::vector<uint32_t>(text.begin(), text.end()), 0);
  std::ostringstream out;
  for (const ShapedGlyph& g : wrapper.shapedGlyphs()) {
    out << g.info.glyphIndex << "@" << g.info.cluster << "+" << g.position.xAdvance << ","
        << g.position.xOffset << "," << g.position.yOffset << " ";
  }
  return out.str();
}

std::string fileBytes(const std::string& path) {
  std::ostringstream bytes;
  bytes << std::ifstream(path, std::ios::binary).rdbuf();
  return bytes.str();
}

// A copy of `font` with the directory entry of table `table` renamed (its last letter 'q').
std::string withoutTable(std::string font, const std::string& table) {
  font[font.find(table, 12) + 3] = 'q';
  return font;
}

class FreeTypeFontTest : public testing::Test {
 protected:
  void SetUp() override {
    REQUIRE_FILE(kDejaVu);
    REQUIRE_FILE(kInter);
    char pattern[] = "/tmp/freetype_font_test_XXXXXX";
    ASSERT_NE(mkdtemp(pattern), nullptr);
    folder_ = pattern;
  }
  void TearDown() override {
    if (!folder_.empty()) {
      std::filesystem::remove_all(folder_);
    }
  }
  std::string write(const std::string& name, const std::string& bytes) {
    const std::string path = folder_ + "/" + name;
    std::ofstream(path, std::ios::binary) << bytes;
    return path;
  }

  std::string folder_;
  // No catalogue and no platform services: a face that cannot be opened has no fallback.
  FreeTypeFont font_{nullptr};
};

TEST_F(FreeTypeFontTest, SelectsTheRecordsFaceAndNamedInstance) {
  struct Case {
    const char* path;
    int32_t instanceId;
    const char* family;
    FT_Long instance;  // the named instance FreeType reports selected (1-based, 0 = none)
  };
  const Case cases[] = {{kDejaVu, 0, "DejaVu Sans", 0},
                        {kInter, 272, "Inter", 1},  // Thin
                        {kInter, 280, "Inter", 9},  // Black
                        {kInter, 999, "Inter", 0},  // no such instance: the default one
                        {kInter, 0, "Inter", 0}};
  std::vector<std::string> advances;
  for (const Case& c : cases) {
    const std::u16string name = u"N" + std::u16string(1, char16_t('0' + advances.size()));
    ASSERT_TRUE(font_.setFont(recordFor(c.path, name, 0, c.instanceId))) << c.path;
    EXPECT_STREQ(font_.face()->family_name, c.family);
    EXPECT_EQ(font_.face()->face_index >> 16, c.instance) << c.instanceId;
    advances.push_back(shapedText(*font_.harfBuzz(), U"W"));
  }
  // The instance changes the glyphs' metrics, not just FreeType's bookkeeping.
  EXPECT_NE(advances[1], advances[2]);
  EXPECT_EQ(advances[3], advances[4]);
}

TEST_F(FreeTypeFontTest, ShapesLikeAWrapperOnTheSameFaceAndSize) {
  font_.setVerbose(true);
  EXPECT_TRUE(font_.harfBuzz()->verbose());
  font_.setVerbose(false);
  ASSERT_TRUE(font_.setFont(recordFor(kDejaVu, u"DejaVuSans")));
  for (const unsigned size : {48u, 20u, 7u}) {
    font_.setPixelSize(static_cast<float>(size));
    FreeTypeFace face(kDejaVu, 0, size);
    HarfBuzzWrapper standalone;
    standalone.setFace(face.get());
    const std::u32string label = U"IRE 100 \u2212 AVTo";
    EXPECT_EQ(shapedText(*font_.harfBuzz(), label), shapedText(standalone, label)) << size;
  }
}

TEST_F(FreeTypeFontTest, HandsOutOutlinesAsBuiltDirectlyFromTheFace) {
  const FontRecord record = recordFor(kDejaVu, u"DejaVuSans");
  ASSERT_TRUE(font_.setFont(record));
  FreeTypeFace face(kDejaVu);
  for (const float size : {20.0f, 12.5f, 0.5f}) {
    for (const char letter : std::string("0g&")) {
      const uint32_t index = FT_Get_Char_Index(face.get(), letter);
      FT_Set_Pixel_Sizes(face.get(), 0, static_cast<FT_UInt>(std::max(1.0f, size)));
      const auto direct = qvtl::geometry::makeCharacterOutline(
          convertGlyph(face.get(), index, std::max(1.0f, size), record.filePath, 0),
          glyphOutlineRequest(2, std::min(1.0f, size)));
      const CharacterOutlinePtr outline = font_.characterOutline(index, record, size, 2);
      ASSERT_FALSE(direct->vertices.empty());
      EXPECT_EQ(std::tie(outline->vertices, outline->indices, outline->pixelSize),
                std::tie(direct->vertices, direct->indices, direct->pixelSize))
          << letter << " at " << size;
    }
  }
}

TEST_F(FreeTypeFontTest, AFailedSelectionLeavesNoFontCurrent) {
  const FontRecord missing = recordFor(folder_ + "/missing.ttf", u"Missing");
  const FontRecord dejaVu = recordFor(kDejaVu, u"DejaVuSans");
  struct Step {
    FontRecord record;
    bool selected;
    uint32_t fileReads;
  };
  const Step steps[] = {{missing, false, 0},      {missing, false, 0},  // asked again, fails again
                        {FontRecord(), false, 0},                       // empty name, no face
                        {dejaVu, true, 1},        {dejaVu, true, 1},    // the same font: no read
                        {missing, false, 1},      {dejaVu, true, 2}};
  for (const Step& s : steps) {
    EXPECT_EQ(font_.setFont(s.record), s.selected);
    EXPECT_EQ(font_.face() != nullptr, s.selected);
    EXPECT_EQ(font_.currentFont().postScriptName, s.selected ? s.record.postScriptName : u"");
    EXPECT_EQ(font_.fileReads(), s.fileReads);
    if (!s.selected) {
      EXPECT_EQ(shapedText(*font_.harfBuzz(), U"AB"), "");
      EXPECT_THROW(font_.characterOutline(36, s.record, 20, 1), std::runtime_error);
    }
  }
}

TEST_F(FreeTypeFontTest, UntrustedFilesFailOrGiveEmptyResults) {
  const std::string dejaVu = fileBytes(kDejaVu);
  // FreeType makes a Unicode map from the glyph names in 'post' when there is no 'cmap'.
  const std::string noCmap = withoutTable(withoutTable(dejaVu, "cmap"), "post");
  // Only a Microsoft symbol map: the Windows Unicode subtable relabelled (3, 0), every other
  // subtable moved to an unknown platform.
  std::string symbol = dejaVu;
  const auto cmapEntry = reinterpret_cast<const uint8_t*>(&symbol[symbol.find("cmap", 12)]);
  auto* cmap =
      reinterpret_cast<uint8_t*>(&symbol[uint32_t{cmapEntry[8]} << 24 | cmapEntry[9] << 16 |
                                         cmapEntry[10] << 8 | cmapEntry[11]]);
  for (int i = 0; i < (cmap[2] << 8 | cmap[3]); ++i) {
    uint8_t* entry = cmap + 4 + 8 * i;
    entry[1] = entry[1] == 3 && entry[3] == 1 ? 3 : 99;
    entry[3] = 0;
  }
  struct Case {
    std::string name;
    std::string bytes;
    int32_t faceIndex;
    bool selected;
    bool mapped = false;  // whether "A" maps to a glyph
  };
  const Case cases[] = {
      {"garbage", std::string(5000, '\xA5'), 0, false},
      {"header", dejaVu.substr(0, 12), 0, false},
      {"directory", dejaVu.substr(0, 400), 0, false},
      {"half", dejaVu.substr(0, dejaVu.size() / 2), 0, false},
      {"tail", dejaVu.substr(0, dejaVu.size() - 2000), 0, true, true},
      {"nocmap", noCmap, 0, true},
      {"symbol", symbol, 0, true, true},
      {"past", dejaVu, 5, false},
      {"negative", dejaVu, -1, false},
      {"instance", dejaVu, 0x10000, false},
  };
  for (const Case& c : cases) {
    const FontRecord record = recordFor(write(c.name + ".ttf", c.bytes),
                                        std::u16string(c.name.begin(), c.name.end()), c.faceIndex);
    ASSERT_EQ(font_.setFont(record), c.selected) << c.name;
    if (!c.selected) {
      EXPECT_EQ(font_.face(), nullptr) << c.name;
      continue;
    }
    EXPECT_EQ(shapedText(*font_.harfBuzz(), U"A").rfind("0@", 0) != 0, c.mapped) << c.name;
    // Whatever the face gives, shaping and outlines of its glyphs come back.
    shapedText(*font_.harfBuzz(), U"AW\u05D0");
    for (const ShapedGlyph& g : font_.harfBuzz()->shapedGlyphs()) {
      EXPECT_NE(font_.characterOutline(g.info.glyphIndex, record, 20, 1), nullptr) << c.name;
    }
    EXPECT_NE(font_.characterOutline(36, record, 20, 1), nullptr) << c.name;
  }
}

TEST_F(FreeTypeFontTest, MakesOneUnicodeHelperFromItsFolder) {
  write("UnicodeData.txt", "0041;A;Lu;0;L;;;;;N;;;;0061;\n");
  FreeTypeFont font(nullptr, nullptr, folder_);
  const std::shared_ptr<UnicodeHelper> helper = font.unicodeHelper();
  EXPECT_EQ(font.unicodeHelper(), helper);
  EXPECT_EQ(helper->toLower('A'), uint32_t{'a'});
  EXPECT_TRUE(helper->characterFileOpened());
}

TEST_F(FreeTypeFontTest, SizesBelowOnePixelScaleAOnePixelFace) {
  ASSERT_TRUE(font_.setFont(recordFor(kDejaVu, u"DejaVuSans")));
  struct Case {
    float size, pixelSize, scale;
    FT_UShort facePixels;
  };
  const Case cases[] = {{0.5f, 1, 0.5f, 1}, {1.0f, 1, 1, 1}, {20.7f, 20.7f, 1, 20}, {-3, 1, -3, 1}};
  for (const Case& c : cases) {
    font_.setPixelSize(c.size);
    EXPECT_EQ(std::make_tuple(font_.pixelSize(), font_.scale(), font_.face()->size->metrics.y_ppem),
              std::make_tuple(c.pixelSize, c.scale, c.facePixels))
        << c.size;
  }
}

TEST_F(FreeTypeFontTest, FallsBackToThePlatformsDataThenToTheDefaultFont) {
  FreeTypeFont font(std::make_shared<vesk::project::FontCache>(platform::systemServices()),
                    platform::systemServices());
  // A nameless record of a file FreeType cannot open, before the default is chosen.
  const FontRecord nameless = recordFor(write("nameless.ttf", std::string(100, 7)), u"");
  ASSERT_TRUE(font.setFont(nameless));
  const FontRecord fallback = font.defaultFont();
  ASSERT_NE(font.face(), nullptr);
  const std::string defaultFamily = font.face()->family_name;
  const std::u16string unknown = u"No Such Family Anywhere";
  const std::tuple<FontRecord, std::string> cases[] = {
      {recordFor(folder_ + "/moved.ttf", u"DejaVuSans", 0, 0, u"DejaVu Sans"), "DejaVu Sans"},
      {recordFor(write("bad.ttf", std::string(100, 7)), u"Bad", 0, 0, unknown), defaultFamily},
      {recordFor(folder_ + "/lost.ttf", u"Lost", 0, 0, unknown), defaultFamily}};
  for (const auto& [record, family] : cases) {
    ASSERT_TRUE(font.setFont(record)) << family;
    EXPECT_EQ(font.face()->family_name, family);
    EXPECT_EQ(font.currentFont().postScriptName, record.postScriptName);
  }
  EXPECT_FALSE(fallback.postScriptName.empty());
}

}  // namespace
}  // namespace waveform_test
