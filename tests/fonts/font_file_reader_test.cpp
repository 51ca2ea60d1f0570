// The font file reader on synthetic fonts (names, instances, metrics, layouts, damage) and on
// installed fonts, compared with FreeType's reading of the same files.
#include "fonts/font_file_reader.h"

#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <filesystem>
#include <functional>
#include <map>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "ci_or_skip.h"
#include "freetype_face.h"
#include "platform/utf16_text.h"
#include "sfnt_writer.h"
#include FT_MULTIPLE_MASTERS_H
#include FT_SFNT_NAMES_H
#include FT_TRUETYPE_TABLES_H

namespace waveform_test {
namespace {

using vesk::project::FontFileReader;
using vesk::project::macintoshLanguageCode;
using vesk::project::NameTable;
using vesk::project::utf8ToUtf16;

constexpr uint16_t kEnglishUS = 0x0409, kEnglishUK = 0x0809, kEnglishAustralia = 0x0C09;
constexpr uint16_t kGerman = 0x0407, kGermanAustria = 0x0C07, kFrench = 0x040C;
constexpr uint16_t kBelarusian = 0x0423, kRomansh = 0x0417, kJapanese = 0x0411;
constexpr uint16_t kChineseTaiwan = 0x0404, kChinesePrc = 0x0804, kChineseHongKong = 0x0C04;

FontFileReader readBytes(const std::vector<uint8_t>& bytes, uint16_t user = kEnglishUS,
                         const std::u16string& path = u"synthetic.ttf") {
  return FontFileReader(path, bytes, user);
}

size_t storedNameCount(const NameTable& names) {
  size_t count = 0;
  for (const auto& [platform, byId] : names) {
    for (const auto& [id, byLanguage] : byId) {
      count += byLanguage.size();
    }
  }
  return count;
}

std::set<uint16_t> windowsNameIds(const FontFileReader& reader) {
  std::set<uint16_t> ids;
  for (const auto& [id, byLanguage] : reader.names(0).at(3)) {
    ids.insert(id);
  }
  return ids;
}

// ---------------------------------------------------------------------------------------------
// Names and the user's language

TEST(FontFileReaderNames, KeepsTheCatalogueNameIdsOfEveryPlatform) {
  const std::set<uint16_t> kept = {1, 2, 3, 4, 6, 16, 17, 19, 25};
  SfntFont font;
  NameTable expected;
  for (uint16_t id = 0; id <= 30; ++id) {
    const std::string text = "id " + std::to_string(id);
    font.addName(3, kEnglishUS, id, utf8ToUtf16(text));
    if (kept.count(id) != 0) {
      expected[3][id][kEnglishUS] = text;
    }
  }
  // Unicode names are decoded; Macintosh ones stay the bytes they are, up to a zero byte.
  font.addName(3, kEnglishUS, 256, u"axis name")
      .addName(3, kGerman, 1, u"Muster")
      .addName(0, 0, 4, u"Caf\u00E9")
      .addNameBytes(1, 0, 0, 4, {'C', 'a', 'f', 0x8E, 0, 'x'});
  expected[3][1][kGerman] = "Muster";
  expected[0][4][0] = "Caf\xC3\xA9";
  expected[1][4][0] = "Caf\x8E";
  EXPECT_EQ(readBytes(font.build()).names(0), expected);
}

TEST(FontFileReaderNames, OnlyWindowsNamesAreReturned) {
  SfntFont font;
  font.addName(1, 0, 4, u"Mac English").addName(0, kGerman, 4, u"Unicode German");
  EXPECT_EQ(readBytes(font.build(), kGerman).fullName(0), "");
  font.addName(3, kEnglishUS, 4, u"Windows English");
  EXPECT_EQ(readBytes(font.build(), kGerman).fullName(0), "Windows English");
}

// UTF-16 big-endian up to the first zero unit; empty strings and unpaired surrogates are not
// stored.
TEST(FontFileReaderNames, DecodesUtf16UpToTheFirstZeroUnit) {
  const std::pair<std::vector<uint8_t>, std::string> cases[] = {
      {{0, 'A', 0, 0xE9, 0x65, 0x87}, "A\xC3\xA9\xE6\x96\x87"},
      {{0xD8, 0x3D, 0xDE, 0x00}, "\xF0\x9F\x98\x80"},
      {{0, 'A', 0, 0, 0, 'B'}, "A"},
      {{0, 'A', 0x01}, "A\xC4\x80"},  // an odd last byte is the high half of a unit
      {{0, 'A', 0}, "A"},
      {{0, 0, 0, 'A'}, ""},
      {{}, ""},
      {{0, 'A', 0xD8, 0x3D, 0, 'B'}, ""},
      {{0, 'A', 0xD8, 0x3D}, ""},
      {{0xDE, 0x00, 0, 'B'}, ""},
      {{0xDE, 0x00, 0xD8, 0x3D}, ""},
  };
  for (const auto& [bytes, text] : cases) {
    SfntFont font;
    font.addNameBytes(3, 1, kEnglishUS, 4, bytes);
    const FontFileReader reader = readBytes(font.build());
    EXPECT_EQ(reader.fullName(0), text) << testing::PrintToString(bytes);
    EXPECT_EQ(reader.names(0).empty(), text.empty()) << testing::PrintToString(bytes);
  }
}

// The encoding ID plays no part.
TEST(FontFileReaderNames, LaterRecordReplacesEarlierButEmptyOrBrokenOnesDoNot) {
  SfntFont font;
  font.addName(3, kEnglishUS, 4, u"First")
      .addNameBytes(3, 10, kEnglishUS, 4, {0, 'S', 0, 'e', 0, 'c'})
      .addName(3, kEnglishUS, 4, u"")
      .addNameBytes(3, 0, kEnglishUS, 4, {0xD8, 0x00})
      .addName(3, kEnglishUS, 1, u"Family")
      .addNameBytes(3, 1, kEnglishUS, 1, {0xDC, 0x00, 0, 'x'});
  const FontFileReader reader = readBytes(font.build());
  EXPECT_EQ(reader.fullName(0), "Sec");
  EXPECT_EQ(reader.familyName(0), "Family");
  EXPECT_EQ(storedNameCount(reader.names(0)), 2u);
}

TEST(FontFileReaderNames, ConvenienceNamesFallBackWhenTheFirstIdIsAbsent) {
  struct Case {
    const std::string& (FontFileReader::*query)(int32_t) const;
    uint16_t preferredId;  // 0: none
    uint16_t fallbackId;
  };
  const Case cases[] = {
      {&FontFileReader::postScriptName, 6, 4}, {&FontFileReader::familyName, 16, 1},
      {&FontFileReader::styleName, 17, 2},     {&FontFileReader::subfamilyName, 0, 2},
      {&FontFileReader::fullName, 0, 4},       {&FontFileReader::sampleText, 0, 19},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.fallbackId);
    const auto ask = [&c](const SfntFont& font) { return (readBytes(font.build()).*c.query)(0); };
    SfntFont font;
    font.addName(3, kEnglishUS, 3, u"unique id");
    EXPECT_EQ(ask(font), "");
    font.addName(3, kEnglishUS, c.fallbackId, u"fallback");
    EXPECT_EQ(ask(font), "fallback");
    if (c.preferredId != 0) {
      // A preferred name only in another language still wins: the choice is per name ID.
      font.addName(3, kGerman, c.preferredId, u"bevorzugt");
      EXPECT_EQ(ask(font), "bevorzugt");
    }
  }
}

// The only language there is; else the user's own; else the first (lowest identifier) of the
// same Macintosh code; else the first English one; else the first.
TEST(FontFileReaderNames, ChoosesTheNameForTheUsersLanguage) {
  struct Case {
    std::vector<uint16_t> languages;  // each names the font "lang <identifier>"
    uint16_t user;
    uint16_t chosen;
  };
  const Case cases[] = {
      {{kEnglishUS, kGerman}, kGerman, kGerman},
      {{kEnglishUS, kGerman}, kEnglishUS, kEnglishUS},
      {{kEnglishUS, kGerman}, kFrench, kEnglishUS},
      {{kEnglishUS, kGerman}, kGermanAustria, kGerman},
      {{kEnglishUS, kBelarusian}, kRomansh, kBelarusian},  // both without a Macintosh code
      {{kChineseTaiwan, kChinesePrc}, kChineseHongKong, kChineseTaiwan},
      {{kChineseTaiwan, kChinesePrc}, kChinesePrc, kChinesePrc},
      {{kGerman}, kEnglishUS, kGerman},
      {{kBelarusian}, kChineseHongKong, kBelarusian},
      // Identifiers without an entry count as English.
      {{kGerman, kEnglishUK}, kJapanese, kEnglishUK},
      {{kGerman, kEnglishUK}, kEnglishAustralia, kEnglishUK},
      {{kGerman, kEnglishUK, kEnglishUS}, kEnglishAustralia, kEnglishUS},
      {{kFrench, kGerman}, kJapanese, kGerman},
      {{kChinesePrc, kJapanese}, kBelarusian, kJapanese},
  };
  for (const Case& c : cases) {
    SfntFont font;
    for (uint16_t language : c.languages) {
      font.addName(3, language, 4, u"lang " + utf8ToUtf16(std::to_string(language)));
    }
    EXPECT_EQ(readBytes(font.build(), c.user).fullName(0), "lang " + std::to_string(c.chosen))
        << testing::PrintToString(c.languages) << ", user " << c.user;
  }
}

// The table is searched by bisection: its ends, entries between them, identifiers without an
// entry (English, 0) and languages without a Macintosh counterpart (65535).
TEST(FontFileReaderNames, WindowsIdentifiersMapToMacintoshCodes) {
  const std::pair<uint16_t, uint16_t> cases[] = {
      {0x0401, 12}, {0x540A, 6},  {0x0407, 2},     {0x0C07, 2},     {0x040C, 1}, {0x0411, 11},
      {0x0404, 33}, {0x0C04, 33}, {0x0417, 65535}, {0x0423, 65535}, {0x0000, 0}, {0x0400, 0},
      {0x0409, 0},  {0x0809, 0},  {0x540B, 0},     {0xFFFF, 0},
  };
  for (const auto& [windows, macintosh] : cases) {
    EXPECT_EQ(macintoshLanguageCode(windows), macintosh) << std::hex << windows;
  }
}

// ---------------------------------------------------------------------------------------------
// Named instances

// Subfamily name ID and name, PostScript name ID and name.
using Instance = std::tuple<uint16_t, std::string, uint16_t, std::string>;

std::vector<Instance> instancesOf(const FontFileReader& reader) {
  std::vector<Instance> instances;
  for (const auto& i : reader.namedInstances(0)) {
    instances.emplace_back(i.subfamilyNameID, i.subfamilyName, i.postScriptNameID,
                           i.postScriptName);
  }
  return instances;
}

TEST(FontFileReaderInstances, AreNamedAndKeepTheNamesTheyReferTo) {
  const FontFileReader without = readBytes(variableFont(false).build(), kGerman);
  EXPECT_EQ(instancesOf(without),
            (std::vector<Instance>{
                {258, "Regular", 0, ""}, {259, "Fett", 0, ""}, {260, "Bold Condensed", 0, ""}}));
  EXPECT_EQ(windowsNameIds(without), (std::set<uint16_t>{1, 2, 4, 6, 258, 259, 260}));
  const FontFileReader with = readBytes(variableFont(true).build());
  EXPECT_EQ(instancesOf(with), (std::vector<Instance>{{258, "Regular", 300, "Var-Regular"},
                                                      {259, "Bold", 301, "Var-Bold"},
                                                      {260, "Bold Condensed", 0, ""}}));
  EXPECT_EQ(windowsNameIds(with), (std::set<uint16_t>{1, 2, 4, 6, 258, 259, 260, 300, 301}));
}

// The PostScript name ID is read only when all of it lies inside the record: at (axisCount + 1)
// * 4, 2 bytes. The table has 2 axes and 3 records of 14 bytes; other sizes re-slice the same
// bytes, so only the first record keeps its fields.
TEST(FontFileReaderInstances, PostScriptNameIdNeedsRoomInTheRecord) {
  const std::tuple<uint16_t, size_t, uint16_t> cases[] = {
      {15, 3, 300}, {14, 3, 300}, {13, 3, 0}, {12, 3, 0}, {4, 3, 0}, {3, 0, 0}, {0, 0, 0}};
  for (const auto& [instanceSize, count, postScriptId] : cases) {
    std::vector<uint8_t> bytes = variableFont(true).build();
    putU16(bytes, findTable(bytes, "fvar")->offset + 14, instanceSize);
    const std::vector<Instance> instances = instancesOf(readBytes(bytes));
    ASSERT_EQ(instances.size(), count) << instanceSize;
    if (count > 0) {
      EXPECT_EQ(instances[0],
                Instance(258, "Regular", postScriptId, postScriptId != 0 ? "Var-Regular" : ""))
          << instanceSize;
    }
  }
}

TEST(FontFileReaderInstances, RecordsFollowTheAxesWhereverTheHeaderSays) {
  // The axes start 8 bytes later than usual.
  std::vector<uint8_t> bytes = variableFont(true).build();
  const TableInFile fvar = findTable(bytes, "fvar").value();
  std::vector<uint8_t> table(bytes.begin() + fvar.offset,
                             bytes.begin() + fvar.offset + fvar.length);
  table.insert(table.begin() + 16, 8, 0xEE);
  putU16(table, 4, 24);
  SfntFont font = variableFont(true);
  font.setTable("fvar", table);
  const std::vector<Instance> instances = instancesOf(readBytes(font.build()));
  ASSERT_EQ(instances.size(), 3u);
  EXPECT_EQ(instances[1], Instance(259, "Bold", 301, "Var-Bold"));
}

// ---------------------------------------------------------------------------------------------
// Metrics and embedding

// Subscript size x and y, offset x and y; the same of the superscript; strikeout size and
// position; underline position and thickness.
using Metrics = std::array<float, 12>;

Metrics metricsOf(const FontFileReader& r, int32_t face) {
  const auto a = r.subscriptSize(face), b = r.subscriptOffset(face);
  const auto c = r.superscriptSize(face), d = r.superscriptOffset(face);
  const float s = r.strikeoutSize(face), p = r.strikeoutPosition(face);
  const float u = r.underlinePosition(face), t = r.underlineThickness(face);
  return {a[0], a[1], b[0], b[1], c[0], c[1], d[0], d[1], s, p, u, t};
}

Metrics inEm(const std::array<int, 12>& units, float em) {
  Metrics metrics;
  for (size_t i = 0; i < units.size(); ++i) {
    metrics[i] = static_cast<float>(units[i]) / em;
  }
  return metrics;
}

const Metrics kDefaultMetrics = {0.583f, 0.583f, 0.0f,  -0.1914f, 0.583f,  0.583f,
                                 0.0f,   0.33f,  0.05f, 0.3f,     -0.075f, 0.05f};

// fsType 0, subscript 1331 x 1229 at (-12, 154), superscript 1300 x 1200 at (7, 717),
// strikeout 102 at 530.
const Os2Fields kDistinctOs2 = {0, 1331, 1229, -12, 154, 1300, 1200, 7, 717, 102, 530};

// Fields a short table or file does not hold read as 0 (an empty table is as good as none); the
// strikeout falls back to 0.05 em at a third of yMax, the underline to -0.075 and 0.05 em, and a
// face without a usable unitsPerEm has the default metrics.
TEST(FontFileReaderMetrics, EveryMetricIsItsFieldInEm) {
  Os2Fields extremes = kDistinctOs2;
  extremes.subscriptYOffset = -32768;
  extremes.superscriptYOffset = 32767;
  Os2Fields noStrikeout = kDistinctOs2;
  noStrikeout.strikeoutSize = 0;
  struct Case {
    const char* what;
    std::function<void(SfntFont&)> change;  // of kDistinctOs2, head (1000, 900), post (-100, 50)
    Metrics expected;
  };
  const Case cases[] = {
      {"all fields", [](SfntFont& f) { f.setHead(2048, 1900).setPost(-217, 150); },
       inEm({1331, 1229, -12, 154, 1300, 1200, 7, 717, 102, 530, -217, 150}, 2048)},
      {"signed 16-bit fields",
       [&](SfntFont& f) { f.setOs2(extremes).setHead(65535, 0).setPost(-32768, 1); },
       inEm({1331, 1229, -12, -32768, 1300, 1200, 7, 32767, 102, 530, -32768, 1}, 65535)},
      {"empty OS/2", [](SfntFont& f) { f.setOs2({}, 0); },
       inEm({0, 0, 0, 0, 0, 0, 0, 0, 50, 300, -100, 50}, 1000)},
      {"OS/2 of 20 bytes", [](SfntFont& f) { f.setOs2(kDistinctOs2, 20); },
       inEm({1331, 1229, -12, 154, 1300, 0, 0, 0, 50, 300, -100, 50}, 1000)},
      {"OS/2 of 27 bytes: half a strikeout size", [](SfntFont& f) { f.setOs2(kDistinctOs2, 27); },
       inEm({1331, 1229, -12, 154, 1300, 1200, 7, 717, 50, 300, -100, 50}, 1000)},
      {"no underline thickness", [](SfntFont& f) { f.setPost(-123, 0); },
       inEm({1331, 1229, -12, 154, 1300, 1200, 7, 717, 102, 530, -75, 50}, 1000)},
      {"post of 11 bytes: half a thickness", [](SfntFont& f) { f.setPost(-100, 0x0132, 11); },
       inEm({1331, 1229, -12, 154, 1300, 1200, 7, 717, 102, 530, -100, 0x0100}, 1000)},
      {"head of 43 bytes: half a yMax",
       [&](SfntFont& f) { f.setOs2(noStrikeout).setHead(1000, 0x0305, 43); },
       inEm({1331, 1229, -12, 154, 1300, 1200, 7, 717, 50, 0x0300 / 3, -100, 50}, 1000)},
      {"unitsPerEm 0", [](SfntFont& f) { f.setHead(0, 900); }, kDefaultMetrics},
      {"head of 18 bytes", [](SfntFont& f) { f.setHead(1000, 900, 18); }, kDefaultMetrics},
      {"the last of two heads",
       [](SfntFont& f) {
         f.addTable("head", std::vector<uint8_t>(54, 0))
             .addTable("glyf", std::vector<uint8_t>(37, 0xAB))
             .setTrailingBytes(std::vector<uint8_t>(19, 0xFF));
       },
       kDefaultMetrics},
  };
  for (const Case& c : cases) {
    SfntFont font;
    font.setOs2(kDistinctOs2).setHead(1000, 900).setPost(-100, 50);
    c.change(font);
    EXPECT_EQ(metricsOf(readBytes(font.build()), 0), c.expected) << c.what;
  }
  // 'head' ends the file in the middle of yMax (0x0384), although its length claims more.
  SfntFont font;
  font.setOs2(noStrikeout).setHead(1000, 0x0384).setTable("zzzz", {});
  std::vector<uint8_t> bytes = font.build();
  const TableInFile head = findTable(bytes, "head").value();
  putU32(bytes, head.recordOffset + 12, 0xFFFFFFFF);
  bytes.resize(head.offset + 43);
  EXPECT_EQ(readBytes(bytes).strikeoutPosition(0), (0x0300 / 3) / 1000.0f);
  // The fallback third of yMax is truncated.
  const std::pair<int16_t, int> thirds[] = {
      {1900, 633}, {2, 0}, {-7, -2}, {-32768, -10922}, {32767, 10922}};
  for (const auto& [yMax, third] : thirds) {
    font.setHead(1000, yMax);
    EXPECT_EQ(readBytes(font.build()).strikeoutPosition(0), third / 1000.0f) << yMax;
  }
}

TEST(FontFileReaderMetrics, FacesOutOfRangeGiveEmptyAnswersAndDefaultMetrics) {
  const FontFileReader reader = readBytes(namedFont(u"A", u"B", u"C", u"D").build());
  for (int32_t face : {-1, 1, INT32_MAX, INT32_MIN}) {
    EXPECT_EQ(reader.familyName(face), "") << face;
    EXPECT_TRUE(reader.names(face).empty()) << face;
    EXPECT_TRUE(reader.namedInstances(face).empty()) << face;
    EXPECT_FALSE(reader.isEmbeddable(face)) << face;
    EXPECT_EQ(metricsOf(reader, face), kDefaultMetrics) << face;
  }
}

// Restricted licence, preview & print, editable and bitmap-only (0x0207) forbid embedding.
TEST(FontFileReaderMetrics, EmbeddingFollowsTheRestrictionBits) {
  const std::pair<uint16_t, bool> cases[] = {{0x0000, true},  {0x0001, false}, {0x0002, false},
                                             {0x0004, false}, {0x0200, false}, {0x0008, true},
                                             {0x0100, true},  {0xFDF8, true}};
  for (const auto& [fsType, embeddable] : cases) {
    Os2Fields os2;
    os2.fsType = fsType;
    SfntFont font;
    font.setOs2(os2).setHead(1000, 900);
    EXPECT_EQ(readBytes(font.build()).isEmbeddable(0), embeddable) << std::hex << fsType;
  }
  SfntFont noOs2;
  noOs2.setHead(1000, 900);
  EXPECT_FALSE(readBytes(noOs2.build()).isEmbeddable(0));
  Os2Fields restricted;
  restricted.fsType = 2;
  SfntFont tinyOs2;  // too short to hold fsType: read as 0
  tinyOs2.setOs2(restricted, 8);
  EXPECT_TRUE(readBytes(tinyOs2.build()).isEmbeddable(0));
}

// ---------------------------------------------------------------------------------------------
// File layouts

std::vector<uint8_t> threeFontCollection() {
  return buildCollection({namedFont(u"Alpha", u"Regular", u"Alpha Regular", u"Alpha-Regular"),
                          namedFont(u"Beta", u"Bold", u"Beta Bold", u"Beta-Bold"),
                          namedFont(u"Gamma", u"Italic", u"Gamma Italic", u"Gamma-Italic")});
}

std::vector<std::string> familiesOf(const FontFileReader& reader) {
  std::vector<std::string> families;
  for (int32_t face = 0; face < reader.faceCount(); ++face) {
    families.push_back(reader.familyName(face));
  }
  return families;
}

TEST(FontFileReaderLayout, ExtensionDecidesTheLayout) {
  const std::vector<uint8_t> single = namedFont(u"Solo", u"Regular", u"Solo", u"Solo").build();
  const std::vector<uint8_t> collection = threeFontCollection();
  const std::tuple<std::u16string, int32_t, int32_t> cases[] = {
      {u"a.ttf", 1, 3},        {u"a.otf", 1, 3},
      {u"a.ttc", 0, 3},        {u"a.otc", 0, 3},
      {u"/fonts/A.TTF", 1, 3}, {u"C:\\Fonts\\a.OtF", 1, 3},
      {u"a.TtC", 0, 3},        {u"a.OTC", 0, 3},
      {u"a.woff", 0, 0},       {u"a.ttf.bak", 0, 0},
      {u"a.ttfx", 0, 0},       {u"a.tt", 0, 0},
      {u"attf", 0, 0},         {u"", 0, 0},
      {u"fonts.ttf/a", 0, 0},  {u"fonts.ttf\\a", 0, 0}};
  for (const auto& [path, singleFaces, collectionFaces] : cases) {
    const std::string shown = platform::toUtf8(path);
    EXPECT_EQ(FontFileReader(path, single, kEnglishUS).faceCount(), singleFaces) << shown;
    EXPECT_EQ(FontFileReader(path, collection, kEnglishUS).faceCount(), collectionFaces) << shown;
  }
  // Any first four bytes but "ttcf" make a single font.
  for (uint32_t version : {0x00010000u, 0x4F54544Fu /* OTTO */, 0x74727565u /* true */, 0u}) {
    SfntFont font = namedFont(u"V", u"Regular", u"V", u"V");
    EXPECT_EQ(familiesOf(readBytes(font.setSfntVersion(version).build())),
              std::vector<std::string>{"V"})
        << version;
  }
}

TEST(FontFileReaderLayout, CollectionsGiveTheirFacesInFileOrder) {
  const std::vector<uint8_t> bytes = threeFontCollection();
  const auto size = static_cast<uint32_t>(bytes.size());
  const uint32_t first = uint32_t{bytes[12]} << 24 | bytes[13] << 16 | bytes[14] << 8 | bytes[15];
  // One 32-bit field of the header changed: the version, numFonts or an offset (from byte 12).
  const std::tuple<size_t, uint32_t, std::vector<std::string>> cases[] = {
      {4, 0x12345678, {"Alpha", "Beta", "Gamma"}},
      {16, 0xFFFFFFFF, {"Alpha", "Gamma"}},
      {16, size - 8, {"Alpha", "Gamma"}},  // no room for an offset table
      {8, 0, {}},
      {8, 2, {"Alpha", "Beta"}},
      {20, first, {"Alpha", "Beta", "Alpha"}},
  };
  for (const auto& [at, value, families] : cases) {
    std::vector<uint8_t> changed = bytes;
    putU32(changed, at, value);
    EXPECT_EQ(familiesOf(readBytes(changed, kEnglishUS, u"x.ttc")), families) << at << " " << value;
  }
  // Bytes after the real offsets are read as offsets too, as far as the file goes.
  std::vector<uint8_t> huge = bytes;
  putU32(huge, 8, 0xFFFFFFFF);
  const FontFileReader reader = readBytes(huge, kEnglishUS, u"x.ttc");
  EXPECT_LE(reader.faceCount(), static_cast<int32_t>((huge.size() - 12) / 4));
  ASSERT_GE(reader.faceCount(), 3);
  EXPECT_EQ(reader.familyName(2), "Gamma");
  const std::vector<uint8_t> headerOnly = {'t', 't', 'c', 'f', 0, 1, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF};
  EXPECT_EQ(readBytes(headerOnly, kEnglishUS, u"x.ttc").faceCount(), 0);
}

TEST(FontFileReaderLayout, ReadsFilesByTheirUtf16PathAndOnlyRegularFiles) {
  const std::filesystem::path folder =
      std::filesystem::path(testing::TempDir()) / "font_file_reader_test";
  std::filesystem::remove_all(folder);
  std::filesystem::create_directories(folder / "folder.ttf");
  // "Schrift-\u00E4\U0001F600.TTF" reaches the file system as UTF-8.
  ASSERT_TRUE(writeFile((folder / "Schrift-\xC3\xA4\xF0\x9F\x98\x80.TTF").string(),
                        namedFont(u"Disk", u"Regular", u"Disk", u"Disk").build()));
  ASSERT_TRUE(writeFile((folder / "empty.ttf").string(), {}));
  std::filesystem::create_symlink("/dev/zero", folder / "zero.ttf");
  const std::u16string base = utf8ToUtf16(folder.string());
  const FontFileReader reader(base + u"/Schrift-\u00E4\U0001F600.TTF", kEnglishUS);
  EXPECT_EQ(familiesOf(reader), std::vector<std::string>{"Disk"});
  for (const std::u16string& path :
       {base + u"/missing.ttf", base + u"/folder.ttf", base + u"/empty.ttf", base + u"/zero.ttf",
        base + u"/bad\xD800surrogate.ttf"}) {
    EXPECT_EQ(FontFileReader(path, kEnglishUS).faceCount(), 0) << platform::toUtf8(path);
  }
  std::filesystem::remove_all(folder);
}

// ---------------------------------------------------------------------------------------------
// Truncated and damaged files

SfntFont richFont() {
  SfntFont font = variableFont(true);
  font.addName(3, kGerman, 4, u"Var Normal")
      .addName(1, 0, 4, u"Mac Var")
      .addName(3, kChinesePrc, 1, u"\u6587\u6CC9")
      .addTable("glyf", std::vector<uint8_t>(23, 0x5A));
  return font;
}

// Every name a damaged face still has is the intact face's text for the same keys.
void expectNamesWithin(const NameTable& damaged, const NameTable& intact) {
  for (const auto& [platform, byId] : damaged) {
    for (const auto& [id, byLanguage] : byId) {
      for (const auto& [language, text] : byLanguage) {
        EXPECT_EQ(text, intact.at(platform).at(id).at(language)) << id << " " << language;
      }
    }
  }
}

// A prefix keeps the first faces (one at least once its offset table is inside), each with
// some of its names and instances.
TEST(FontFileReaderDamage, EveryPrefixOfAFontAndOfACollection) {
  for (const auto& [bytes, path] :
       {std::pair(richFont().build(), u"x.ttf"), std::pair(threeFontCollection(), u"x.ttc")}) {
    const FontFileReader intact = readBytes(bytes, kEnglishUS, path);
    int32_t previousFaces = 0;
    for (size_t length = 0; length <= bytes.size(); ++length) {
      SCOPED_TRACE("prefix " + std::to_string(length));
      const FontFileReader reader =
          readBytes(std::vector<uint8_t>(bytes.begin(), bytes.begin() + length), kEnglishUS, path);
      ASSERT_GE(reader.faceCount(), previousFaces);
      ASSERT_LE(reader.faceCount(), intact.faceCount());
      previousFaces = reader.faceCount();
      for (int32_t face = 0; face < reader.faceCount(); ++face) {
        expectNamesWithin(reader.names(face), intact.names(face));
        const auto& instances = reader.namedInstances(face);
        ASSERT_LE(instances.size(), intact.namedInstances(face).size());
        for (size_t i = 0; i < instances.size(); ++i) {
          EXPECT_EQ(instances[i].subfamilyNameID, intact.namedInstances(face)[i].subfamilyNameID);
        }
      }
    }
    EXPECT_EQ(previousFaces, intact.faceCount());
  }
  EXPECT_EQ(readBytes(std::vector<uint8_t>(11)).faceCount(), 0);
  EXPECT_EQ(readBytes(std::vector<uint8_t>(12)).faceCount(), 1);
}

TEST(FontFileReaderDamage, DamagedFieldsOfASingleFont) {
  const auto field = [](const char* tag, size_t at, uint16_t value) {
    return [=](std::vector<uint8_t>& b) { putU16(b, findTable(b, tag)->offset + at, value); };
  };
  const auto record = [](const char* tag, size_t at, uint32_t value) {
    return [=](std::vector<uint8_t>& b) { putU32(b, findTable(b, tag)->recordOffset + at, value); };
  };
  const Metrics intact = inEm({650, 600, 0, 75, 650, 600, 0, 350, 50, 300, -100, 50}, 1000);
  const std::string full = "Var Regular";
  struct Case {
    const char* what;
    std::function<void(std::vector<uint8_t>&)> damage;
    size_t names;  // of 13 stored, 6 of them only for the 3 instances
    size_t instances;
    std::string fullName;
    Metrics metrics;
  };
  const Case cases[] = {
      {"numTables 0xFFFF", [](auto& b) { putU16(b, 4, 0xFFFF); }, 13, 3, full, intact},
      {"name offset past the end", record("name", 8, 0xFFFFFFF0), 0, 3, "", intact},
      {"name length unused", record("name", 12, 0xFFFFFFFF), 13, 3, full, intact},
      {"name stringOffset 0xFFFF", field("name", 4, 0xFFFF), 0, 3, "", intact},
      {"first name's length past the end", field("name", 6 + 8, 0xFFFF), 12, 3, full, intact},
      {"fvar offset past the end", record("fvar", 8, 0xFFFFFFFF), 7, 0, full, intact},
      {"fvar axisCount and axisSize 0xFFFF",
       [&](auto& b) {
         field("fvar", 8, 0xFFFF)(b);
         field("fvar", 10, 0xFFFF)(b);
       },
       7, 0, full, intact},
      {"fvar instanceSize 0xFFFF", field("fvar", 14, 0xFFFF), 7, 0, full, intact},
      {"OS/2 offset past the end: present, all zero", record("OS/2", 8, 0xFFFFFFFF), 13, 3, full,
       inEm({0, 0, 0, 0, 0, 0, 0, 0, 50, 300, -100, 50}, 1000)},
      {"head length 0", record("head", 12, 0), 13, 3, full, kDefaultMetrics},
  };
  const std::vector<uint8_t> bytes = richFont().build();
  for (const Case& c : cases) {
    std::vector<uint8_t> damaged = bytes;
    c.damage(damaged);
    const FontFileReader reader = readBytes(damaged);
    ASSERT_EQ(reader.faceCount(), 1) << c.what;
    EXPECT_EQ(storedNameCount(reader.names(0)), c.names) << c.what;
    EXPECT_EQ(reader.namedInstances(0).size(), c.instances) << c.what;
    EXPECT_EQ(reader.fullName(0), c.fullName) << c.what;
    EXPECT_EQ(metricsOf(reader, 0), c.metrics) << c.what;
  }
  // Huge counts: strings read as records may add names, and bytes after the instances may be
  // read as instances, but never more than the file holds.
  std::vector<uint8_t> damaged = bytes;
  field("name", 2, 0xFFFF)(damaged);
  field("fvar", 12, 0xFFFF)(damaged);
  const FontFileReader reader = readBytes(damaged);
  EXPECT_LE(storedNameCount(reader.names(0)), bytes.size() / 12);
  EXPECT_EQ(reader.familyName(0), "Var");
  EXPECT_GE(reader.namedInstances(0).size(), 3u);
  EXPECT_LE(reader.namedInstances(0).size(), bytes.size() / 14);
  EXPECT_EQ(reader.namedInstances(0)[1].subfamilyName, "Bold");
}

// 2000 collection entries name one face with many names and instances. Faces may reread the
// same bytes, but what they store together stays in proportion to the file's size.
TEST(FontFileReaderDamage, SharedTablesCannotMultiplyWhatIsStored) {
  SfntFont font;
  for (uint16_t language = 1; language <= 60; ++language) {
    font.addName(3, language, 4, u"Shared full name " + std::u16string(1, u'A' + language % 26));
  }
  font.setFvar({1, std::vector<std::pair<uint16_t, uint16_t>>(60, {4, 0}), false});
  constexpr uint32_t kFaces = 2000;
  std::vector<uint8_t> bytes = {'t', 't', 'c', 'f', 0, 1, 0, 0};
  bytes.resize(12 + 4 * kFaces, 0);
  putU32(bytes, 8, kFaces);
  const auto fontOffset = static_cast<uint32_t>(bytes.size());
  for (uint32_t i = 0; i < kFaces; ++i) {
    putU32(bytes, 12 + 4 * i, fontOffset);
  }
  const std::vector<uint8_t> single = font.build(fontOffset);
  bytes.insert(bytes.end(), single.begin(), single.end());

  const FontFileReader reader = readBytes(bytes, kEnglishUS, u"shared.ttc");
  ASSERT_GE(reader.faceCount(), 1);
  EXPECT_EQ(storedNameCount(reader.names(0)), 60u);
  ASSERT_EQ(reader.namedInstances(0).size(), 60u);
  EXPECT_EQ(reader.namedInstances(0)[59].subfamilyName, reader.fullName(0));
  size_t names = 0, instances = 0;
  for (int32_t face = 0; face < reader.faceCount(); ++face) {
    names += storedNameCount(reader.names(face));
    instances += reader.namedInstances(face).size();
  }
  EXPECT_LE(names, 4 * bytes.size() / 12);
  EXPECT_LE(instances, 4 * bytes.size() / 8);
}

// ---------------------------------------------------------------------------------------------
// Installed fonts, compared with FreeType's reading of the same files

// Names, named instances and metrics of every face of the file.
void compareWithFreeType(const std::string& path) {
  SCOPED_TRACE(path);
  const FontFileReader reader(utf8ToUtf16(path), kEnglishUS);
  ASSERT_EQ(reader.faceCount(), FreeTypeFace(path)->num_faces);
  for (int32_t index = 0; index < reader.faceCount(); ++index) {
    SCOPED_TRACE("face " + std::to_string(index));
    const FreeTypeFace face(path, index);
    ASSERT_NE(face.get(), nullptr);
    std::vector<std::pair<FT_UInt, FT_UInt>> instances;  // subfamily and PostScript name IDs
    FT_MM_Var* variation = nullptr;
    if (FT_HAS_MULTIPLE_MASTERS(face.get()) && FT_Get_MM_Var(face.get(), &variation) == 0) {
      for (FT_UInt i = 0; i < variation->num_namedstyles; ++i) {
        instances.emplace_back(variation->namedstyle[i].strid, variation->namedstyle[i].psid);
      }
      FT_Done_MM_Var(face.library(), variation);
    }
    std::set<FT_UInt> kept = {1, 2, 3, 4, 6, 16, 17, 19, 25};
    for (const auto& [subfamily, postScript] : instances) {
      kept.insert({subfamily, postScript});
    }
    std::map<uint16_t, std::map<uint16_t, std::string>> expected;  // ID -> language -> text
    for (FT_UInt i = 0; i < FT_Get_Sfnt_Name_Count(face.get()); ++i) {
      FT_SfntName name;
      ASSERT_EQ(FT_Get_Sfnt_Name(face.get(), i, &name), 0);
      std::u16string units;
      for (FT_UInt k = 0; k + 1 < name.string_len && (name.string[k] | name.string[k + 1]);
           k += 2) {
        units += static_cast<char16_t>(name.string[k] << 8 | name.string[k + 1]);
      }
      const std::optional<std::string> text = platform::toUtf8Strict(units);
      if (name.platform_id == 3 && kept.count(name.name_id) != 0 && text && !text->empty()) {
        expected[name.name_id][name.language_id] = *text;
      }
    }
    ASSERT_EQ(reader.names(index).count(3), 1u);
    EXPECT_EQ(reader.names(index).at(3), expected);

    const auto& read = reader.namedInstances(index);
    ASSERT_EQ(read.size(), instances.size());
    for (size_t i = 0; i < read.size(); ++i) {
      EXPECT_EQ(read[i].subfamilyNameID, instances[i].first);
      EXPECT_EQ(read[i].subfamilyName, reader.name(index, read[i].subfamilyNameID));
      EXPECT_FALSE(read[i].subfamilyName.empty());
      if (instances[i].second != 0xFFFF) {
        EXPECT_EQ(read[i].postScriptNameID, instances[i].second);
        EXPECT_EQ(read[i].postScriptName, reader.name(index, read[i].postScriptNameID));
      }
    }

    const auto* os2 = static_cast<const TT_OS2*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_OS2));
    const auto* post =
        static_cast<const TT_Postscript*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_POST));
    const auto* head = static_cast<const TT_Header*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_HEAD));
    ASSERT_TRUE(os2 && post && head);
    ASSERT_NE(os2->yStrikeoutSize, 0);  // the fonts have all their metrics: no fallbacks
    ASSERT_NE(post->underlineThickness, 0);
    EXPECT_EQ(metricsOf(reader, index),
              inEm({os2->ySubscriptXSize, os2->ySubscriptYSize, os2->ySubscriptXOffset,
                    os2->ySubscriptYOffset, os2->ySuperscriptXSize, os2->ySuperscriptYSize,
                    os2->ySuperscriptXOffset, os2->ySuperscriptYOffset, os2->yStrikeoutSize,
                    os2->yStrikeoutPosition, post->underlinePosition, post->underlineThickness},
                   head->Units_Per_EM));
    EXPECT_EQ(reader.isEmbeddable(index), (os2->fsType & 0x0207) == 0);
  }
}

const char kWenQuanYi[] = "/usr/share/fonts/truetype/wqy/wqy-microhei.ttc";

TEST(FontFileReaderInstalledFonts, MatchFreeType) {
  const std::string folders[] = {"/usr/share/fonts/truetype/dejavu",
                                 "/usr/share/fonts/truetype/inter-vf"};
  REQUIRE_FILE(folders[0] + "/DejaVuSans.ttf");
  REQUIRE_FILE(folders[1] + "/Inter.var.ttf");
  REQUIRE_FILE(kWenQuanYi);
  for (const std::string& folder : folders) {
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
      compareWithFreeType(entry.path().string());
    }
  }
  compareWithFreeType(kWenQuanYi);
  const FontFileReader inter(utf8ToUtf16(folders[1] + "/Inter.var.ttf"), kEnglishUS);
  EXPECT_GT(inter.namedInstances(0).size(), 1u);
}

// The collection names its faces in English and in both Chinese scripts.
TEST(FontFileReaderInstalledFonts, WenQuanYiFamilyInTheUsersLanguage) {
  REQUIRE_FILE(kWenQuanYi);
  const std::pair<uint16_t, std::string> cases[] = {
      {kEnglishUS, "WenQuanYi Micro Hei"},
      {kGerman, "WenQuanYi Micro Hei"},
      {kChinesePrc, "\u6587\u6CC9\u9A7F\u5FAE\u7C73\u9ED1"},
      {kChineseTaiwan, "\u6587\u6CC9\u9A5B\u5FAE\u7C73\u9ED1"},
      {kChineseHongKong, "\u6587\u6CC9\u9A5B\u5FAE\u7C73\u9ED1"},
  };
  for (const auto& [user, family] : cases) {
    EXPECT_EQ(FontFileReader(utf8ToUtf16(kWenQuanYi), user).familyName(0), family) << user;
  }
}

}  // namespace
}  // namespace waveform_test
