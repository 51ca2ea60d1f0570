// The shaping wrapper against HarfBuzz's own command-line shaper, hb-shape, on installed fonts:
// every run's glyph ids, clusters, advances and offsets must be the same. Both shape with
// FreeType's glyph functions (hb-shape --font-funcs=ft) at the same scale: the wrapper's face is
// set to 48 pixels, which HarfBuzz's FreeType integration turns into a scale of 48 * 64 units,
// and hb-shape is given that scale as its font size.
#include <gtest/gtest.h>

#include <cctype>
#include <cstdio>
#include <sstream>
#include <string>
#include <vector>

#include "ci_or_skip.h"
#include "fonts/harfbuzz_wrapper.h"
#include "freetype_face.h"

namespace waveform_test {
namespace {

using vesk::plugin::lib::HarfBuzzWrapper;
using vesk::plugin::lib::ShapedGlyph;

constexpr unsigned kPixelSize = 48;

struct TextRun {
  const char* text;  // UTF-8
  uint8_t level;     // even: left to right, odd: right to left
};

struct FontRuns {
  const char* path;
  long faceIndex;
  std::vector<TextRun> runs;
};

// clang-format off
const FontRuns kFonts[] = {
    {"/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf", 0,
     {// Latin with kerning pairs, digits and signs, combining marks.
      {"AV", 0}, {"To", 0}, {"Wa", 0}, {"VA", 0}, {"Ty", 0}, {"Yo", 0}, {"LT", 0}, {"P.", 0},
      {"AVAWAY", 0}, {"Tokyo", 0}, {"We", 0}, {"Fa", 0}, {"r.", 0}, {"yo", 0}, {"T,", 0},
      {"-20", 0}, {"100", 0}, {"1 000,5", 0}, {"120", 0}, {"110", 0}, {"0", 0}, {"-10", 0},
      {"3.14", 0}, {"+5%", 0}, {"1/2", 0}, {"e\u0301", 0}, {"a\u0308o\u0308", 0},
      {"n\u0303", 0}, {"A\u030A", 0}, {"i\u0307\u0323", 0}, {"x\u0336y", 0},
      // Arabic: joining forms, lam-alef, Arabic-Indic digits, vowel marks.
      {"\u0644\u0627", 1}, {"\u0633\u0644\u0627\u0645", 1}, {"\u0628\u064A\u0628", 1},
      {"\u0639\u0631\u0628\u064A", 1}, {"\u0645\u0631\u062D\u0628\u0627", 1},
      {"\u0644\u0622", 1}, {"\u0647\u0647\u0647", 1}, {"\u0643\u062A\u0627\u0628 \u0661\u0662", 1},
      {"\u0628\u0650\u0633\u0652\u0645", 1},
      // Hebrew, with digits and points.
      {"\u05E9\u05DC\u05D5\u05DD", 1}, {"\u05E2\u05DE\u05D5\u05D3 12", 1}, {"\u05D0 100", 1},
      {"\u05D1\u05BC", 1}, {"\u05E9\u05C1\u05B8", 1}, {"-20 \u05DE", 1}}},
    {"/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf", 0,
     {{"AV", 0}, {"To", 0}, {"Wa", 0}, {"Ta", 0}, {"Ye", 0}, {"fi", 0}, {"ff", 0}, {"-20", 0},
      {"100", 0}, {"1 000,5", 0}, {"120", 0}, {"e\u0301", 0}}},
    {"/usr/share/fonts/truetype/inter-vf/Inter.var.ttf", 0,
     {{"AV", 0}, {"To", 0}, {"Wa", 0}, {"LT", 0}, {"fi", 0}, {"-20", 0}, {"100", 0},
      {"1 000,5", 0}, {"-> ", 0}, {"a\u0308", 0}, {"1/2", 0}, {"Ly", 0}}},
    {"/usr/share/fonts/truetype/wqy/wqy-microhei.ttc", 0,
     {{"\u4E2D\u6587", 0}, {"\u6C34\u5E73\u6CE2\u5F62", 0}, {"\u65E5\u672C\u8A9E", 0},
      {"\u3042\u3044\u3046", 0}, {"\uD55C\uAD6D\uC5B4", 0}, {"\u3001\u3002\u300C\u300D", 0},
      {"ABC 123", 0}, {"\uFF11\uFF12\uFF13", 0}}},
};
// clang-format on

void PrintTo(const FontRuns& font, std::ostream* out) {
  *out << font.path;
}

// Decodes well-formed UTF-8 (the table above).
std::vector<uint32_t> codePointsOf(const std::string& utf8) {
  std::vector<uint32_t> codePoints;
  for (size_t i = 0; i < utf8.size();) {
    const auto lead = static_cast<unsigned char>(utf8[i]);
    const int length = lead < 0x80 ? 1 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
    uint32_t value = length == 1 ? lead : lead & (0x3F >> (length - 1));
    for (int k = 1; k < length; ++k) {
      value = (value << 6) | (static_cast<unsigned char>(utf8[i + k]) & 0x3F);
    }
    codePoints.push_back(value);
    i += length;
  }
  return codePoints;
}

// One glyph as hb-shape's text output prints it: [id=cluster@dx,dy+ax,ay].
std::string glyphText(uint32_t id, uint32_t cluster, int dx, int dy, int ax, int ay) {
  std::ostringstream out;
  out << '[' << id << '=' << cluster << '@' << dx << ',' << dy << '+' << ax << ',' << ay << ']';
  return out.str();
}

// The glyphs of hb-shape's JSON output with glyph ids:
// [{"g":36,"cl":0,"dx":0,"dy":0,"ax":1906,"ay":0},...]; empty when hb-shape could not be run.
std::string referenceGlyphs(const FontRuns& font, const TextRun& run) {
  std::ostringstream command;
  command << "LC_ALL=C hb-shape --font-funcs=ft --font-size=" << kPixelSize * 64
          << " --face-index=" << font.faceIndex << " --no-glyph-names --output-format=json"
          << " --direction=" << (run.level % 2 != 0 ? "rtl" : "ltr") << " --unicodes=";
  const char* separator = "";
  for (uint32_t c : codePointsOf(run.text)) {
    command << separator << "U+" << std::hex << c << std::dec;
    separator = ",";
  }
  command << " '" << font.path << "' 2>&1";
  std::string output;
  if (FILE* pipe = popen(command.str().c_str(), "r")) {
    char chunk[4096];
    for (size_t n; (n = fread(chunk, 1, sizeof chunk, pipe)) > 0;) {
      output.append(chunk, n);
    }
    pclose(pipe);
  }
  std::string glyphs;
  for (size_t at = output.find('{'); at != std::string::npos; at = output.find('{', at + 1)) {
    unsigned id, cluster;
    int dx, dy, ax, ay;
    if (std::sscanf(output.c_str() + at, R"({"g":%u,"cl":%u,"dx":%d,"dy":%d,"ax":%d,"ay":%d})", &id,
                    &cluster, &dx, &dy, &ax, &ay) == 6) {
      glyphs += glyphText(id, cluster, dx, dy, ax, ay);
    }
  }
  return glyphs;
}

std::string wrapperGlyphs(HarfBuzzWrapper& wrapper, const TextRun& run) {
  wrapper.shape(codePointsOf(run.text), run.level);
  std::string glyphs;
  for (const ShapedGlyph& g : wrapper.shapedGlyphs()) {
    glyphs += glyphText(g.info.glyphIndex, g.info.cluster, g.position.xOffset, g.position.yOffset,
                        g.position.xAdvance, g.position.yAdvance);
  }
  return glyphs;
}

class ShapingReference : public testing::TestWithParam<FontRuns> {};

TEST_P(ShapingReference, EveryRunShapesAsHbShapeDoes) {
  const FontRuns& font = GetParam();
  REQUIRE_FILE(font.path);
  REQUIRE_FILE("/usr/bin/hb-shape");
  FreeTypeFace face(font.path, font.faceIndex, kPixelSize);
  ASSERT_NE(face.get(), nullptr) << font.path;
  HarfBuzzWrapper wrapper;
  wrapper.setFace(face.get());
  for (const TextRun& run : font.runs) {
    const std::string expected = referenceGlyphs(font, run);
    ASSERT_FALSE(expected.empty()) << "hb-shape gave no glyphs for \"" << run.text << '"';
    EXPECT_EQ(wrapperGlyphs(wrapper, run), expected)
        << font.path << " \"" << run.text << "\" level " << int{run.level};
  }
}

// Test names from the font file's name: "DejaVuSans", "Cantarell_Regular"...
std::string fontName(const testing::TestParamInfo<FontRuns>& info) {
  std::string name = info.param.path;
  name = name.substr(name.rfind('/') + 1);
  name = name.substr(0, name.find('.'));
  for (char& c : name) {
    c = std::isalnum(static_cast<unsigned char>(c)) ? c : '_';
  }
  return name;
}

INSTANTIATE_TEST_SUITE_P(InstalledFonts, ShapingReference, testing::ValuesIn(kFonts), fontName);

}  // namespace
}  // namespace waveform_test
