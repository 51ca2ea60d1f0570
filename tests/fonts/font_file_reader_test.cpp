#include "fonts/font_file_reader.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <limits>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_MULTIPLE_MASTERS_H
#include FT_SFNT_NAMES_H
#include FT_TRUETYPE_TABLES_H

#include "sfnt_writer.h"

namespace {

using vesk::project::FontFileReader;
using vesk::project::FontVector;
using vesk::project::macintoshLanguageCode;
using vesk::project::NamedInstance;
using vesk::project::NameTable;
using vesk::project::utf8ToUtf16;
using waveform_test::buildCollection;
using waveform_test::findTable;
using waveform_test::FvarAxis;
using waveform_test::FvarInstance;
using waveform_test::FvarTable;
using waveform_test::namedFont;
using waveform_test::Os2Fields;
using waveform_test::putU16;
using waveform_test::putU32;
using waveform_test::SfntFont;

constexpr uint16_t kEnglishUS = 1033;
constexpr uint16_t kGerman = 1031;
constexpr uint16_t kFrench = 1036;
constexpr uint16_t kGermanAustria = 3079;
constexpr uint16_t kBelarusian = 1059;
constexpr uint16_t kRomansh = 1047;
constexpr uint16_t kChineseTraditional = 1028;
constexpr uint16_t kChineseSimplified = 2052;
constexpr uint16_t kChineseHongKong = 3076;
constexpr uint16_t kJapanese = 1041;
constexpr uint16_t kEnglishUK = 0x0809;
constexpr uint16_t kEnglishAustralia = 0x0C09;

FontFileReader readBytes(const std::vector<uint8_t>& bytes, uint16_t userLanguage = kEnglishUS,
                         const std::u16string& path = u"synthetic.ttf") {
  return FontFileReader(path, bytes, userLanguage);
}

std::string utf8(const std::u16string& text) {
  std::string out;
  for (char16_t unit : text) {
    out += static_cast<char>(unit);  // ASCII texts only
  }
  return out;
}

// The stored names of platform 3 for one name ID: language -> text.
std::map<uint16_t, std::string> windowsNames(const FontFileReader& reader, int32_t face,
                                             uint16_t nameID) {
  const NameTable& names = reader.names(face);
  const auto platform = names.find(3);
  if (platform == names.end() || platform->second.count(nameID) == 0) {
    return {};
  }
  return platform->second.at(nameID);
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

// ---------------------------------------------------------------------------------------------
// Names and the user's language

TEST(FontFileReaderNames, StoresEveryKeptNameByPlatformAndLanguage) {
  SfntFont font;
  font.addName(3, kEnglishUS, 1, u"Sample")
      .addName(3, kGerman, 1, u"Muster")
      .addName(3, kFrench, 1, u"Exemple")
      .addName(3, kEnglishUS, 4, u"Sample Bold")
      .addName(0, 0, 4, u"Unicode Sample")
      .addName(1, 0, 4, u"Mac Sample");
  const FontFileReader reader = readBytes(font.build());
  ASSERT_EQ(reader.faceCount(), 1);
  const NameTable expected = {
      {0, {{4, {{0, "Unicode Sample"}}}}},
      {1, {{4, {{0, "Mac Sample"}}}}},
      {3,
       {{1, {{kGerman, "Muster"}, {kEnglishUS, "Sample"}, {kFrench, "Exemple"}}},
        {4, {{kEnglishUS, "Sample Bold"}}}}},
  };
  EXPECT_EQ(reader.names(0), expected);
}

TEST(FontFileReaderNames, KeepsOnlyTheNameIdsTheCatalogueUses) {
  SfntFont font;
  for (uint16_t id = 0; id <= 30; ++id) {
    font.addName(3, kEnglishUS, id, u"id " + std::u16string(1, static_cast<char16_t>('A' + id)));
  }
  font.addName(3, kEnglishUS, 256, u"axis name");
  const FontFileReader reader = readBytes(font.build());
  std::set<uint16_t> kept;
  for (const auto& [id, byLanguage] : reader.names(0).at(3)) {
    kept.insert(id);
  }
  EXPECT_EQ(kept, (std::set<uint16_t>{1, 2, 3, 4, 6, 16, 17, 19, 25}));
  EXPECT_EQ(reader.name(0, 25), "id Z");
  EXPECT_EQ(reader.name(0, 5), "");
}

TEST(FontFileReaderNames, MacintoshNamesAreStoredUnchangedButNeverReturned) {
  // Mac Roman bytes: "Caf\x8E" is "Café"; stored as they are, up to the first zero byte.
  SfntFont font;
  font.addNameBytes(1, 0, 0, 4, {'C', 'a', 'f', 0x8E, 0, 'x'}).addNameBytes(1, 0, 0, 1, {0xA5});
  const FontFileReader reader = readBytes(font.build());
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_EQ(reader.names(0).at(1).at(4).at(0), "Caf\x8E");
  EXPECT_EQ(reader.names(0).at(1).at(1).at(0), "\xA5");
  EXPECT_EQ(reader.name(0, 4), "");
  EXPECT_EQ(reader.fullName(0), "");
  EXPECT_EQ(reader.familyName(0), "");
}

TEST(FontFileReaderNames, UnicodePlatformNamesAreDecodedButNeverReturned) {
  SfntFont font;
  font.addName(0, 0, 4, u"Caf\u00E9");
  const FontFileReader reader = readBytes(font.build());
  EXPECT_EQ(reader.names(0).at(0).at(4).at(0), "Caf\xC3\xA9");
  EXPECT_EQ(reader.name(0, 4), "");
}

struct Utf16NameCase {
  const char* what;
  std::vector<uint8_t> bytes;  // UTF-16 big-endian as stored
  std::optional<std::string> stored;
};

void PrintTo(const Utf16NameCase& c, std::ostream* out) {
  *out << c.what;
}

class FontFileReaderUtf16Names : public testing::TestWithParam<Utf16NameCase> {};

TEST_P(FontFileReaderUtf16Names, DecodesUpToTheFirstZeroUnit) {
  const Utf16NameCase& c = GetParam();
  SfntFont font;
  font.addNameBytes(3, 1, kEnglishUS, 4, c.bytes);
  const FontFileReader reader = readBytes(font.build());
  const auto names = windowsNames(reader, 0, 4);
  if (c.stored) {
    ASSERT_EQ(names.size(), 1u) << c.what;
    EXPECT_EQ(names.at(kEnglishUS), *c.stored) << c.what;
    EXPECT_EQ(reader.fullName(0), *c.stored) << c.what;
  } else {
    EXPECT_TRUE(names.empty()) << c.what;
    EXPECT_EQ(reader.fullName(0), "") << c.what;
  }
}

INSTANTIATE_TEST_SUITE_P(
    FontFileReader, FontFileReaderUtf16Names,
    testing::Values(
        Utf16NameCase{"ascii", {0, 'A', 0, 'b'}, "Ab"},
        Utf16NameCase{"two-byte", {0, 0xE9}, "\xC3\xA9"},
        Utf16NameCase{"cjk", {0x65, 0x87, 0x6C, 0xC9}, "\xE6\x96\x87\xE6\xB3\x89"},
        Utf16NameCase{"pair", {0xD8, 0x3D, 0xDE, 0x00}, "\xF0\x9F\x98\x80"},
        Utf16NameCase{"zero unit ends", {0, 'A', 0, 0, 0, 'B'}, "A"},
        Utf16NameCase{"odd length: last byte is a high half", {0, 'A', 0x01}, "A\xC4\x80"},
        Utf16NameCase{"odd length ending in zero", {0, 'A', 0}, "A"},
        Utf16NameCase{"leading zero unit: empty, not stored", {0, 0, 0, 'A'}, std::nullopt},
        Utf16NameCase{"empty string: not stored", {}, std::nullopt},
        Utf16NameCase{"lone high surrogate", {0, 'A', 0xD8, 0x3D, 0, 'B'}, std::nullopt},
        Utf16NameCase{"high surrogate at the end", {0, 'A', 0xD8, 0x3D}, std::nullopt},
        Utf16NameCase{"lone low surrogate", {0xDE, 0x00, 0, 'B'}, std::nullopt},
        Utf16NameCase{"reversed pair", {0xDE, 0x00, 0xD8, 0x3D}, std::nullopt}),
    [](const testing::TestParamInfo<Utf16NameCase>& info) {
      return "case" + std::to_string(info.index);
    });

TEST(FontFileReaderNames, LaterRecordReplacesEarlierButEmptyOrBrokenOnesDoNot) {
  SfntFont font;
  font.addName(3, kEnglishUS, 4, u"First")
      .addName(3, kEnglishUS, 4, u"Second")
      .addName(3, kEnglishUS, 4, u"")
      .addNameBytes(3, 1, kEnglishUS, 4, {0xD8, 0x00})  // unpaired surrogate
      .addName(3, kEnglishUS, 1, u"Family")
      .addNameBytes(3, 1, kEnglishUS, 1, {0xDC, 0x00, 0, 'x'});
  const FontFileReader reader = readBytes(font.build());
  EXPECT_EQ(reader.fullName(0), "Second");
  EXPECT_EQ(reader.familyName(0), "Family");
  EXPECT_EQ(storedNameCount(reader.names(0)), 2u);
}

TEST(FontFileReaderNames, EncodingIdIsNotUsed) {
  SfntFont font;
  font.addNameBytes(3, 10, kEnglishUS, 4, {0, 'U', 0, 'C', 0, 'S', 0, '4'})
      .addNameBytes(3, 0, kEnglishUS, 1, {0, 'S', 0, 'y'});
  const FontFileReader reader = readBytes(font.build());
  EXPECT_EQ(reader.fullName(0), "UCS4");
  EXPECT_EQ(reader.familyName(0), "Sy");
}

struct FallbackCase {
  const char* query;
  std::function<std::string(const FontFileReader&)> ask;
  uint16_t preferredId;  // 0: no preferred ID
  uint16_t fallbackId;
};

TEST(FontFileReaderNames, ConvenienceNamesFallBackWhenTheFirstIdIsAbsent) {
  const std::vector<FallbackCase> cases = {
      {"postScriptName", [](const FontFileReader& r) { return r.postScriptName(0); }, 6, 4},
      {"familyName", [](const FontFileReader& r) { return r.familyName(0); }, 16, 1},
      {"styleName", [](const FontFileReader& r) { return r.styleName(0); }, 17, 2},
      {"subfamilyName", [](const FontFileReader& r) { return r.subfamilyName(0); }, 0, 2},
      {"fullName", [](const FontFileReader& r) { return r.fullName(0); }, 0, 4},
      {"sampleText", [](const FontFileReader& r) { return r.sampleText(0); }, 0, 19},
  };
  for (const FallbackCase& c : cases) {
    SfntFont onlyFallback;
    onlyFallback.addName(3, kEnglishUS, c.fallbackId, u"fallback");
    EXPECT_EQ(c.ask(readBytes(onlyFallback.build())), "fallback") << c.query;

    SfntFont neither;
    neither.addName(3, kEnglishUS, 3, u"unique id");
    EXPECT_EQ(c.ask(readBytes(neither.build())), "") << c.query;

    if (c.preferredId != 0) {
      SfntFont both;
      both.addName(3, kEnglishUS, c.fallbackId, u"fallback")
          .addName(3, kEnglishUS, c.preferredId, u"preferred");
      EXPECT_EQ(c.ask(readBytes(both.build())), "preferred") << c.query;

      // A preferred name only in another language still wins: the choice is per name ID.
      SfntFont preferredInGerman;
      preferredInGerman.addName(3, kEnglishUS, c.fallbackId, u"fallback")
          .addName(3, kGerman, c.preferredId, u"bevorzugt");
      EXPECT_EQ(c.ask(readBytes(preferredInGerman.build())), "bevorzugt") << c.query;
    }
  }
}

TEST(FontFileReaderNames, Utf16FormsMatchTheUtf8Names) {
  SfntFont font;
  font.addName(3, kEnglishUS, 16, u"Typo Fam\u00EDly")
      .addName(3, kEnglishUS, 1, u"Fam")
      .addName(3, kEnglishUS, 2, u"Bold")
      .addName(3, kEnglishUS, 17, u"Heavy \u6587")
      .addName(3, kEnglishUS, 4, u"Fam Bold \U0001F600")
      .addName(3, kEnglishUS, 6, u"Fam-Bold");
  const FontFileReader reader = readBytes(font.build());
  EXPECT_EQ(reader.familyNameUtf16(0), u"Typo Fam\u00EDly");
  EXPECT_EQ(reader.subfamilyNameUtf16(0), u"Bold");
  EXPECT_EQ(reader.styleNameUtf16(0), u"Heavy \u6587");
  EXPECT_EQ(reader.fullNameUtf16(0), u"Fam Bold \U0001F600");
  EXPECT_EQ(reader.postScriptNameUtf16(0), u"Fam-Bold");
  EXPECT_EQ(reader.familyNameUtf16(1), u"");
}

TEST(FontFileReaderNames, QueriesOutOfRangeGiveEmptyResults) {
  const FontFileReader reader = readBytes(namedFont(u"A", u"B", u"C", u"D").build());
  for (int32_t face :
       {-1, 1, 2, std::numeric_limits<int32_t>::max(), std::numeric_limits<int32_t>::min()}) {
    EXPECT_EQ(reader.name(face, 1), "") << face;
    EXPECT_EQ(reader.familyName(face), "") << face;
    EXPECT_EQ(reader.postScriptNameUtf16(face), u"") << face;
    EXPECT_TRUE(reader.names(face).empty()) << face;
    EXPECT_TRUE(reader.namedInstances(face).empty()) << face;
    EXPECT_FALSE(reader.isEmbeddable(face)) << face;
  }
  EXPECT_EQ(reader.familyName(0), "A");
}

struct LanguageCase {
  std::vector<uint16_t> languages;  // names present, each with the text "lang <id>"
  uint16_t user;
  uint16_t chosen;
};

void PrintTo(const LanguageCase& c, std::ostream* out) {
  *out << "names in";
  for (uint16_t language : c.languages) {
    *out << " " << language;
  }
  *out << ", user " << c.user << ", chosen " << c.chosen;
}

class FontFileReaderLanguage : public testing::TestWithParam<LanguageCase> {};

TEST_P(FontFileReaderLanguage, ChoosesTheNameForTheUsersLanguage) {
  const LanguageCase& c = GetParam();
  SfntFont font;
  for (uint16_t language : c.languages) {
    const std::string text = "lang " + std::to_string(language);
    font.addName(3, language, 4, std::u16string(text.begin(), text.end()));
  }
  const FontFileReader reader = readBytes(font.build(), c.user);
  EXPECT_EQ(reader.fullName(0), "lang " + std::to_string(c.chosen)) << "user " << c.user;
}

INSTANTIATE_TEST_SUITE_P(
    FontFileReader, FontFileReaderLanguage,
    testing::Values(
        // The user's own language.
        LanguageCase{{kEnglishUS, kGerman}, kGerman, kGerman},
        LanguageCase{{kEnglishUS, kGerman}, kEnglishUS, kEnglishUS},
        // French has no name: English, the first language with Macintosh code 0.
        LanguageCase{{kEnglishUS, kGerman}, kFrench, kEnglishUS},
        // Austrian German shares German's Macintosh code.
        LanguageCase{{kEnglishUS, kGerman}, kGermanAustria, kGerman},
        // Romansh and Belarusian both lack a Macintosh counterpart, and match each other.
        LanguageCase{{kEnglishUS, kBelarusian}, kRomansh, kBelarusian},
        // Every Chinese identifier maps to one code: the lowest identifier comes first.
        LanguageCase{
            {kChineseTraditional, kChineseSimplified}, kChineseHongKong, kChineseTraditional},
        LanguageCase{
            {kChineseTraditional, kChineseSimplified}, kChineseSimplified, kChineseSimplified},
        // A single language is returned whatever the user's language.
        LanguageCase{{kGerman}, kEnglishUS, kGerman},
        LanguageCase{{kChineseSimplified}, kFrench, kChineseSimplified},
        LanguageCase{{kBelarusian}, kChineseHongKong, kBelarusian},
        // Identifiers without an entry count as English.
        LanguageCase{{kGerman, kEnglishUK}, kJapanese, kEnglishUK},
        LanguageCase{{kGerman, kEnglishUK, kEnglishUS}, kEnglishAustralia, kEnglishUS},
        LanguageCase{{kGerman, kEnglishUK}, kEnglishAustralia, kEnglishUK},
        LanguageCase{{kGerman, kFrench, kEnglishUS}, kJapanese, kEnglishUS},
        // Nothing related and nothing English: the lowest identifier.
        LanguageCase{{kFrench, kGerman}, kJapanese, kGerman},
        LanguageCase{{kChineseSimplified, kJapanese}, kBelarusian, kJapanese}));

TEST(FontFileReaderNames, OnlyWindowsNamesAreChosenFrom) {
  SfntFont font;
  font.addName(1, 0, 4, u"Mac English")
      .addName(0, kGerman, 4, u"Unicode German")
      .addName(3, kEnglishUS, 4, u"Windows English");
  EXPECT_EQ(readBytes(font.build(), kGerman).fullName(0), "Windows English");
}

// ---------------------------------------------------------------------------------------------
// Named instances

FvarTable weightAxisTable(bool postScriptNameIDs) {
  FvarTable fvar;
  fvar.axes = {FvarAxis{"wght", 100, 400, 900, 256}, FvarAxis{"wdth", 75, 100, 100, 257}};
  fvar.instances = {FvarInstance{258, 300, {400, 100}}, FvarInstance{259, 301, {700, 100}},
                    FvarInstance{260, 0, {700, 75}}};
  fvar.postScriptNameIDs = postScriptNameIDs;
  return fvar;
}

void setFvarInstanceSize(std::vector<uint8_t>& bytes, uint16_t instanceSize) {
  putU16(bytes, findTable(bytes, "fvar").value().offset + 14, instanceSize);
}

SfntFont variableFont(bool postScriptNameIDs) {
  SfntFont font = namedFont(u"Var", u"Regular", u"Var Regular", u"Var-Regular");
  font.setFvar(weightAxisTable(postScriptNameIDs))
      .addName(3, kEnglishUS, 256, u"Weight")
      .addName(3, kEnglishUS, 258, u"Regular")
      .addName(3, kEnglishUS, 259, u"Bold")
      .addName(3, kGerman, 259, u"Fett")
      .addName(3, kEnglishUS, 260, u"Bold Condensed")
      .addName(3, kEnglishUS, 300, u"Var-Regular")
      .addName(3, kEnglishUS, 301, u"Var-Bold")
      .addName(3, kEnglishUS, 999, u"unreferenced");
  return font;
}

TEST(FontFileReaderInstances, RecordsWithoutPostScriptNameIds) {
  const FontFileReader reader = readBytes(variableFont(false).build(), kGerman);
  const std::vector<NamedInstance>& instances = reader.namedInstances(0);
  ASSERT_EQ(instances.size(), 3u);
  const uint16_t ids[] = {258, 259, 260};
  const char* names[] = {"Regular", "Fett", "Bold Condensed"};
  for (size_t i = 0; i < 3; ++i) {
    EXPECT_EQ(instances[i].subfamilyNameID, ids[i]) << i;
    EXPECT_EQ(instances[i].subfamilyName, names[i]) << i;
    EXPECT_EQ(instances[i].postScriptNameID, 0) << i;
    EXPECT_EQ(instances[i].postScriptName, "") << i;
  }
  // The instance names are kept, names nothing refers to are not.
  const auto& windows = reader.names(0).at(3);
  EXPECT_EQ(windows.count(259), 1u);
  EXPECT_EQ(windows.count(300), 0u);
  EXPECT_EQ(windows.count(256), 0u);
  EXPECT_EQ(windows.count(999), 0u);
}

TEST(FontFileReaderInstances, RecordsWithPostScriptNameIds) {
  const FontFileReader reader = readBytes(variableFont(true).build(), kEnglishUS);
  const std::vector<NamedInstance>& instances = reader.namedInstances(0);
  ASSERT_EQ(instances.size(), 3u);
  EXPECT_EQ(instances[0].subfamilyName, "Regular");
  EXPECT_EQ(instances[0].postScriptNameID, 300);
  EXPECT_EQ(instances[0].postScriptName, "Var-Regular");
  EXPECT_EQ(instances[1].subfamilyName, "Bold");
  EXPECT_EQ(instances[1].postScriptNameID, 301);
  EXPECT_EQ(instances[1].postScriptName, "Var-Bold");
  EXPECT_EQ(instances[2].subfamilyName, "Bold Condensed");
  EXPECT_EQ(instances[2].postScriptNameID, 0);
  EXPECT_EQ(instances[2].postScriptName, "");
  EXPECT_EQ(reader.names(0).at(3).count(301), 1u);
  EXPECT_EQ(reader.name(0, 300), "Var-Regular");
}

// The PostScript name ID is read only when all of it lies inside the record: at (axisCount + 1)
// * 4, 2 bytes. The table written has 2 axes and 3 instances of 14 bytes; other sizes re-slice
// the same bytes, so only the first record keeps its fields.
TEST(FontFileReaderInstances, PostScriptNameIdNeedsRoomInTheRecord) {
  struct Case {
    uint16_t instanceSize;
    size_t instances;
    uint16_t firstPostScriptId;
  };
  const Case cases[] = {
      {15, 3, 300}, {14, 3, 300}, {13, 3, 0},
      {12, 3, 0},   {4, 3, 0},  // just the subfamily name ID and flags
      {3, 0, 0},                // too short to hold them
      {0, 0, 0},
  };
  for (const Case& c : cases) {
    std::vector<uint8_t> bytes = variableFont(true).build();
    setFvarInstanceSize(bytes, c.instanceSize);
    const FontFileReader reader = readBytes(bytes);
    const auto& instances = reader.namedInstances(0);
    ASSERT_EQ(instances.size(), c.instances) << c.instanceSize;
    if (c.instances == 0) {
      continue;
    }
    EXPECT_EQ(instances[0].subfamilyNameID, 258) << c.instanceSize;
    EXPECT_EQ(instances[0].subfamilyName, "Regular") << c.instanceSize;
    EXPECT_EQ(instances[0].postScriptNameID, c.firstPostScriptId) << c.instanceSize;
    EXPECT_EQ(instances[0].postScriptName, c.firstPostScriptId ? "Var-Regular" : "")
        << c.instanceSize;
  }
}

TEST(FontFileReaderInstances, InstanceRecordsFollowTheAxesWhereverTheHeaderSays) {
  // Axes start 8 bytes later than usual: the table grows by 8 bytes in front of the axes.
  std::vector<uint8_t> bytes = variableFont(true).build();
  const auto fvar = findTable(bytes, "fvar");
  ASSERT_TRUE(fvar);
  std::vector<uint8_t> table(bytes.begin() + fvar->offset,
                             bytes.begin() + fvar->offset + fvar->length);
  table.insert(table.begin() + 16, 8, 0xEE);
  putU16(table, 4, 24);
  SfntFont font = variableFont(true);
  font.setTable("fvar", table);
  const FontFileReader reader = readBytes(font.build());
  ASSERT_EQ(reader.namedInstances(0).size(), 3u);
  EXPECT_EQ(reader.namedInstances(0)[1].subfamilyName, "Bold");
  EXPECT_EQ(reader.namedInstances(0)[1].postScriptName, "Var-Bold");
}

TEST(FontFileReaderInstances, AFontWithoutFvarHasNoInstances) {
  const FontFileReader reader = readBytes(namedFont(u"A", u"B", u"C", u"D").build());
  EXPECT_TRUE(reader.namedInstances(0).empty());
}

// ---------------------------------------------------------------------------------------------
// Metrics and embedding

struct MetricValues {
  FontVector subscriptSize;
  FontVector subscriptOffset;
  FontVector superscriptSize;
  FontVector superscriptOffset;
  float strikeoutSize;
  float strikeoutPosition;
  float underlinePosition;
  float underlineThickness;
};

MetricValues metricsOf(const FontFileReader& reader, int32_t face) {
  return {reader.subscriptSize(face),     reader.subscriptOffset(face),
          reader.superscriptSize(face),   reader.superscriptOffset(face),
          reader.strikeoutSize(face),     reader.strikeoutPosition(face),
          reader.underlinePosition(face), reader.underlineThickness(face)};
}

const MetricValues kDefaultMetrics = {{0.583f, 0.583f},
                                      {0.0f, -0.1914f},
                                      {0.583f, 0.583f},
                                      {0.0f, 0.33f},
                                      0.05f,
                                      0.3f,
                                      -0.075f,
                                      0.05f};

void expectMetrics(const MetricValues& actual, const MetricValues& expected,
                   const std::string& what) {
  EXPECT_FLOAT_EQ(actual.subscriptSize[0], expected.subscriptSize[0]) << what;
  EXPECT_FLOAT_EQ(actual.subscriptSize[1], expected.subscriptSize[1]) << what;
  EXPECT_FLOAT_EQ(actual.subscriptOffset[0], expected.subscriptOffset[0]) << what;
  EXPECT_FLOAT_EQ(actual.subscriptOffset[1], expected.subscriptOffset[1]) << what;
  EXPECT_FLOAT_EQ(actual.superscriptSize[0], expected.superscriptSize[0]) << what;
  EXPECT_FLOAT_EQ(actual.superscriptSize[1], expected.superscriptSize[1]) << what;
  EXPECT_FLOAT_EQ(actual.superscriptOffset[0], expected.superscriptOffset[0]) << what;
  EXPECT_FLOAT_EQ(actual.superscriptOffset[1], expected.superscriptOffset[1]) << what;
  EXPECT_FLOAT_EQ(actual.strikeoutSize, expected.strikeoutSize) << what;
  EXPECT_FLOAT_EQ(actual.strikeoutPosition, expected.strikeoutPosition) << what;
  EXPECT_FLOAT_EQ(actual.underlinePosition, expected.underlinePosition) << what;
  EXPECT_FLOAT_EQ(actual.underlineThickness, expected.underlineThickness) << what;
}

Os2Fields distinctOs2() {
  Os2Fields os2;
  os2.subscriptXSize = 1331;
  os2.subscriptYSize = 1229;
  os2.subscriptXOffset = -12;
  os2.subscriptYOffset = 154;
  os2.superscriptXSize = 1300;
  os2.superscriptYSize = 1200;
  os2.superscriptXOffset = 7;
  os2.superscriptYOffset = 717;
  os2.strikeoutSize = 102;
  os2.strikeoutPosition = 530;
  return os2;
}

TEST(FontFileReaderMetrics, EveryMetricIsItsFieldInEm) {
  SfntFont font;
  font.setOs2(distinctOs2()).setHead(2048, 1900).setPost(-217, 150);
  const FontFileReader reader = readBytes(font.build());
  const float em = 2048.0f;
  expectMetrics(metricsOf(reader, 0),
                {{1331 / em, 1229 / em},
                 {-12 / em, 154 / em},
                 {1300 / em, 1200 / em},
                 {7 / em, 717 / em},
                 102 / em,
                 530 / em,
                 -217 / em,
                 150 / em},
                "all fields");
}

TEST(FontFileReaderMetrics, FieldsAreSigned16Bit) {
  Os2Fields os2 = distinctOs2();
  os2.subscriptYOffset = -32768;
  os2.superscriptYOffset = 32767;
  SfntFont font;
  font.setOs2(os2).setHead(65535, 0).setPost(-32768, 1);
  const FontFileReader reader = readBytes(font.build());
  EXPECT_FLOAT_EQ(reader.subscriptOffset(0)[1], -32768.0f / 65535.0f);
  EXPECT_FLOAT_EQ(reader.superscriptOffset(0)[1], 32767.0f / 65535.0f);
  EXPECT_FLOAT_EQ(reader.underlinePosition(0), -32768.0f / 65535.0f);
}

// Without a strikeout size, the position is a third of yMax (truncated toward zero) in em.
TEST(FontFileReaderMetrics, StrikeoutFallsBackToAThirdOfTheFontHeight) {
  struct Case {
    int16_t yMax;
    int16_t third;
  };
  for (const Case& c : {Case{1900, 633}, Case{1000, 333}, Case{2, 0}, Case{-7, -2},
                        Case{-32768, -10922}, Case{32767, 10922}}) {
    Os2Fields os2 = distinctOs2();
    os2.strikeoutSize = 0;
    SfntFont font;
    font.setOs2(os2).setHead(1000, c.yMax).setPost(-100, 50);
    const FontFileReader reader = readBytes(font.build());
    EXPECT_FLOAT_EQ(reader.strikeoutSize(0), 0.05f) << c.yMax;
    EXPECT_FLOAT_EQ(reader.strikeoutPosition(0), c.third / 1000.0f) << c.yMax;
  }
}

TEST(FontFileReaderMetrics, UnderlineFallsBackWithoutAThickness) {
  SfntFont font;
  font.setOs2(distinctOs2()).setHead(1000, 900).setPost(-123, 0);
  const FontFileReader reader = readBytes(font.build());
  EXPECT_FLOAT_EQ(reader.underlinePosition(0), -0.075f);
  EXPECT_FLOAT_EQ(reader.underlineThickness(0), 0.05f);
}

TEST(FontFileReaderMetrics, DefaultsForFacesOutOfRangeOrWithoutUnitsPerEm) {
  SfntFont withHead;
  withHead.setOs2(distinctOs2()).setHead(1000, 900).setPost(-100, 50);
  const FontFileReader reader = readBytes(withHead.build());
  for (int32_t face :
       {-1, 1, std::numeric_limits<int32_t>::max(), std::numeric_limits<int32_t>::min()}) {
    expectMetrics(metricsOf(reader, face), kDefaultMetrics, "face " + std::to_string(face));
  }

  SfntFont zeroUnits;
  zeroUnits.setOs2(distinctOs2()).setHead(0, 900).setPost(-100, 50);
  expectMetrics(metricsOf(readBytes(zeroUnits.build()), 0), kDefaultMetrics, "unitsPerEm 0");

  SfntFont noHead;
  noHead.setOs2(distinctOs2()).setPost(-100, 50);
  expectMetrics(metricsOf(readBytes(noHead.build()), 0), kDefaultMetrics, "no head");

  // unitsPerEm lies in bytes 18 and 19: a head cut before them has none.
  SfntFont shortHead;
  shortHead.setOs2(distinctOs2()).setHead(1000, 900, 18).setPost(-100, 50);
  expectMetrics(metricsOf(readBytes(shortHead.build()), 0), kDefaultMetrics, "head of 18 bytes");
}

TEST(FontFileReaderMetrics, MissingOrShortTablesReadAsZero) {
  struct Case {
    const char* what;
    std::function<void(SfntFont&)> build;
    MetricValues expected;
  };
  const float em = 1000.0f;
  const std::vector<Case> cases = {
      {"no OS/2",
       [](SfntFont& f) { f.setHead(1000, 900).setPost(-100, 50); },
       {{0, 0}, {0, 0}, {0, 0}, {0, 0}, 0.05f, 300 / em, -100 / em, 50 / em}},
      {"no post",
       [](SfntFont& f) { f.setOs2(distinctOs2()).setHead(1000, 900); },
       {{1331 / em, 1229 / em},
        {-12 / em, 154 / em},
        {1300 / em, 1200 / em},
        {7 / em, 717 / em},
        102 / em,
        530 / em,
        -0.075f,
        0.05f}},
      {"OS/2 of 20 bytes: superscript y size onwards missing",
       [](SfntFont& f) { f.setOs2(distinctOs2(), 20).setHead(1000, 900).setPost(-100, 50); },
       {{1331 / em, 1229 / em},
        {-12 / em, 154 / em},
        {1300 / em, 0},
        {0, 0},
        0.05f,
        300 / em,
        -100 / em,
        50 / em}},
      {"OS/2 of 27 bytes: half a strikeout size",
       [](SfntFont& f) { f.setOs2(distinctOs2(), 27).setHead(1000, 900).setPost(-100, 50); },
       {{1331 / em, 1229 / em},
        {-12 / em, 154 / em},
        {1300 / em, 1200 / em},
        {7 / em, 717 / em},
        0.05f,  // 102 = 0x0066: only the high byte 0x00 is inside, so the size reads as 0
        300 / em,
        -100 / em,
        50 / em}},
      {"post of 11 bytes: half a thickness",
       [](SfntFont& f) { f.setOs2(distinctOs2()).setHead(1000, 900).setPost(-100, 0x0132, 11); },
       {{1331 / em, 1229 / em},
        {-12 / em, 154 / em},
        {1300 / em, 1200 / em},
        {7 / em, 717 / em},
        102 / em,
        530 / em,
        -100 / em,
        0x0100 / em}},
      {"head of 43 bytes: half a yMax",
       [](SfntFont& f) {
         Os2Fields os2 = distinctOs2();
         os2.strikeoutSize = 0;
         f.setOs2(os2).setHead(1000, 0x0305, 43).setPost(-100, 50);
       },
       {{1331 / em, 1229 / em},
        {-12 / em, 154 / em},
        {1300 / em, 1200 / em},
        {7 / em, 717 / em},
        0.05f,
        (0x0300 / 3) / em,
        -100 / em,
        50 / em}},
  };
  for (const Case& c : cases) {
    SfntFont font;
    c.build(font);
    const std::vector<uint8_t> bytes = font.build();
    expectMetrics(metricsOf(readBytes(bytes), 0), c.expected, c.what);
  }
}

TEST(FontFileReaderMetrics, ATableLongerThanTheFileIsReadAsFarAsTheFileGoes) {
  // 'head' holds the last bytes of the file; its length claims far more, and the file ends in
  // the middle of yMax (0x0384): what is missing reads as zero, so yMax is 0x0300.
  Os2Fields os2 = distinctOs2();
  os2.strikeoutSize = 0;
  SfntFont font;
  font.setOs2(os2).setHead(1000, 0x0384).setTable("zzzz", {});
  std::vector<uint8_t> bytes = font.build();
  const auto head = findTable(bytes, "head");
  ASSERT_TRUE(head);
  putU32(bytes, head->recordOffset + 12, 0xFFFFFFFF);
  bytes.resize(head->offset + 43);
  const FontFileReader reader = readBytes(bytes);
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_FLOAT_EQ(reader.subscriptSize(0)[0], 1331 / 1000.0f);
  EXPECT_FLOAT_EQ(reader.strikeoutPosition(0), (0x0300 / 3) / 1000.0f);
}

TEST(FontFileReaderMetrics, EmbeddingFollowsTheRestrictionBits) {
  struct Case {
    uint16_t fsType;
    bool embeddable;
  };
  const Case cases[] = {
      {0x0000, true},  {0x0001, false}, {0x0002, false}, {0x0004, false},
      {0x0008, true},  {0x0200, false}, {0x0100, true},  {0x000C, false},
      {0x0208, false}, {0x0108, true},  {0xFDF8, true},  {0xFFFF, false},
  };
  for (const Case& c : cases) {
    Os2Fields os2;
    os2.fsType = c.fsType;
    SfntFont font;
    font.setOs2(os2).setHead(1000, 900);
    EXPECT_EQ(readBytes(font.build()).isEmbeddable(0), c.embeddable) << std::hex << c.fsType;
  }
  SfntFont noOs2;
  noOs2.setHead(1000, 900);
  EXPECT_FALSE(readBytes(noOs2.build()).isEmbeddable(0)) << "no OS/2 table";
  Os2Fields restricted;
  restricted.fsType = 2;
  SfntFont tinyOs2;  // present but too short to hold fsType: read as 0
  tinyOs2.setOs2(restricted, 8).setHead(1000, 900);
  EXPECT_TRUE(readBytes(tinyOs2.build()).isEmbeddable(0));
}

// ---------------------------------------------------------------------------------------------
// File layouts

std::vector<uint8_t> threeFontCollection() {
  return buildCollection({namedFont(u"Alpha", u"Regular", u"Alpha Regular", u"Alpha-Regular"),
                          namedFont(u"Beta", u"Bold", u"Beta Bold", u"Beta-Bold"),
                          namedFont(u"Gamma", u"Italic", u"Gamma Italic", u"Gamma-Italic")});
}

TEST(FontFileReaderLayout, ExtensionDecidesTheLayout) {
  const std::vector<uint8_t> single = namedFont(u"Solo", u"Regular", u"Solo", u"Solo").build();
  const std::vector<uint8_t> collection = threeFontCollection();
  struct Case {
    std::u16string path;
    int32_t singleFaces;
    int32_t collectionFaces;
  };
  const Case cases[] = {
      {u"a.ttf", 1, 3},        {u"a.otf", 1, 3},
      {u"a.ttc", 0, 3},        {u"a.otc", 0, 3},
      {u"/fonts/A.TTF", 1, 3}, {u"C:\\Fonts\\a.OtF", 1, 3},
      {u"a.TtC", 0, 3},        {u"a.OTC", 0, 3},
      {u"a.woff", 0, 0},       {u"a.ttf.bak", 0, 0},
      {u"a.ttfx", 0, 0},       {u"a.tt", 0, 0},
      {u"attf", 0, 0},         {u"", 0, 0},
      {u"fonts.ttf/a", 0, 0},  {u"fonts.ttf\\a", 0, 0},
  };
  for (const Case& c : cases) {
    const std::string shown = utf8(c.path);
    EXPECT_EQ(FontFileReader(c.path, single, kEnglishUS).faceCount(), c.singleFaces) << shown;
    EXPECT_EQ(FontFileReader(c.path, collection, kEnglishUS).faceCount(), c.collectionFaces)
        << shown;
    EXPECT_EQ(FontFileReader(c.path, single, kEnglishUS).path(), c.path) << shown;
  }
}

TEST(FontFileReaderLayout, CollectionFacesComeInFileOrder) {
  const FontFileReader reader = readBytes(threeFontCollection(), kEnglishUS, u"x.ttc");
  ASSERT_EQ(reader.faceCount(), 3);
  EXPECT_EQ(reader.familyName(0), "Alpha");
  EXPECT_EQ(reader.styleName(1), "Bold");
  EXPECT_EQ(reader.fullName(2), "Gamma Italic");
  EXPECT_EQ(reader.postScriptName(1), "Beta-Bold");
  EXPECT_FLOAT_EQ(reader.underlineThickness(2), 0.05f);
}

TEST(FontFileReaderLayout, ATtfThatIsReallyACollectionIsReadAsOne) {
  const FontFileReader reader = readBytes(threeFontCollection(), kEnglishUS, u"x.ttf");
  ASSERT_EQ(reader.faceCount(), 3);
  EXPECT_EQ(reader.familyName(1), "Beta");
}

TEST(FontFileReaderLayout, CollectionVersionIsNotChecked) {
  std::vector<uint8_t> bytes = threeFontCollection();
  putU32(bytes, 4, 0x12345678);
  EXPECT_EQ(readBytes(bytes, kEnglishUS, u"x.ttc").faceCount(), 3);
}

TEST(FontFileReaderLayout, AnyFirstFourBytesButTtcfMakeASingleFont) {
  for (uint32_t version : {0x00010000u, 0x4F54544Fu /* OTTO */, 0x74727565u /* true */, 0u}) {
    SfntFont font = namedFont(u"V", u"Regular", u"V", u"V");
    font.setSfntVersion(version);
    const FontFileReader reader = readBytes(font.build());
    ASSERT_EQ(reader.faceCount(), 1) << std::hex << version;
    EXPECT_EQ(reader.familyName(0), "V");
  }
}

TEST(FontFileReaderLayout, RepeatedTagsAndUnknownTablesAndTrailingBytes) {
  SfntFont font;
  font.setHead(1000, 900)
      .addTable("head", std::vector<uint8_t>(54, 0))  // unitsPerEm 0 in the last 'head'
      .addTable("glyf", std::vector<uint8_t>(37, 0xAB))
      .addName(3, kEnglishUS, 1, u"Family")
      .setTrailingBytes(std::vector<uint8_t>(19, 0xFF));
  const FontFileReader reader = readBytes(font.build());
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_EQ(reader.familyName(0), "Family");
  expectMetrics(metricsOf(reader, 0), kDefaultMetrics, "last head has unitsPerEm 0");
}

class FontFileReaderDisk : public testing::Test {
 protected:
  void SetUp() override {
    folder_ = std::filesystem::temp_directory_path() /
              ("font_file_reader_test_" + std::to_string(::getpid()));
    std::filesystem::create_directories(folder_);
  }
  void TearDown() override { std::filesystem::remove_all(folder_); }

  std::filesystem::path folder_;
};

TEST_F(FontFileReaderDisk, ReadsAFileByItsUtf16Path) {
  const std::vector<uint8_t> bytes = namedFont(u"Disk", u"Regular", u"Disk", u"Disk").build();
  // "Schrift-\u00E4\U0001F600.TTF": the name reaches the file system as UTF-8.
  const std::string name = "Schrift-\xC3\xA4\xF0\x9F\x98\x80.TTF";
  ASSERT_TRUE(waveform_test::writeFile((folder_ / name).string(), bytes));
  const std::u16string path = utf8ToUtf16(folder_.string()) + u"/Schrift-\u00E4\U0001F600.TTF";
  const FontFileReader reader(path, kEnglishUS);
  EXPECT_EQ(reader.path(), path);
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_EQ(reader.familyName(0), "Disk");
}

TEST_F(FontFileReaderDisk, UnreadablePathsHaveNoFaces) {
  std::filesystem::create_directories(folder_ / "folder.ttf");
  ASSERT_TRUE(waveform_test::writeFile((folder_ / "empty.ttf").string(), {}));
  std::filesystem::create_symlink("/dev/zero", folder_ / "zero.ttf");
  const std::u16string base = utf8ToUtf16(folder_.string());
  for (const std::u16string& path :
       {base + u"/missing.ttf", base + u"/folder.ttf", base + u"/empty.ttf", base + u"/zero.ttf",
        base + u"/bad\xD800surrogate.ttf"}) {
    EXPECT_EQ(FontFileReader(path, kEnglishUS).faceCount(), 0) << utf8(path);
  }
}

// ---------------------------------------------------------------------------------------------
// Truncated and damaged files

// Every name a damaged face still has is the intact face's text for the same keys.
void expectNamesWithin(const NameTable& damaged, const NameTable& intact, const std::string& what) {
  for (const auto& [platform, byId] : damaged) {
    for (const auto& [id, byLanguage] : byId) {
      for (const auto& [language, text] : byLanguage) {
        const auto p = intact.find(platform);
        ASSERT_NE(p, intact.end()) << what;
        const auto i = p->second.find(id);
        ASSERT_NE(i, p->second.end()) << what << " id " << id;
        const auto l = i->second.find(language);
        ASSERT_NE(l, i->second.end()) << what << " id " << id << " language " << language;
        EXPECT_EQ(text, l->second) << what << " id " << id << " language " << language;
      }
    }
  }
}

SfntFont richFont() {
  SfntFont font = variableFont(true);
  font.addName(3, kGerman, 4, u"Var Normal")
      .addName(1, 0, 4, u"Mac Var")
      .addName(3, kChineseSimplified, 1, u"\u6587\u6CC9")
      .addTable("glyf", std::vector<uint8_t>(23, 0x5A));
  return font;
}

TEST(FontFileReaderDamage, EveryPrefixOfASingleFont) {
  const std::vector<uint8_t> bytes = richFont().build();
  const FontFileReader intact = readBytes(bytes);
  ASSERT_EQ(intact.faceCount(), 1);
  ASSERT_EQ(intact.namedInstances(0).size(), 3u);
  ASSERT_EQ(storedNameCount(intact.names(0)), 13u);
  for (size_t length = 0; length <= bytes.size(); ++length) {
    const std::vector<uint8_t> prefix(bytes.begin(), bytes.begin() + length);
    const FontFileReader reader = readBytes(prefix);
    const std::string what = "prefix " + std::to_string(length);
    ASSERT_EQ(reader.faceCount(), length >= 12 ? 1 : 0) << what;
    if (reader.faceCount() == 0) {
      continue;
    }
    expectNamesWithin(reader.names(0), intact.names(0), what);
    EXPECT_LE(reader.namedInstances(0).size(), 3u) << what;
    for (size_t i = 0; i < reader.namedInstances(0).size(); ++i) {
      EXPECT_EQ(reader.namedInstances(0)[i].subfamilyNameID,
                intact.namedInstances(0)[i].subfamilyNameID)
          << what;
    }
  }
  EXPECT_EQ(readBytes(bytes).names(0), intact.names(0));
}

TEST(FontFileReaderDamage, EveryPrefixOfACollection) {
  const std::vector<uint8_t> bytes = threeFontCollection();
  const FontFileReader intact = readBytes(bytes, kEnglishUS, u"x.ttc");
  ASSERT_EQ(intact.faceCount(), 3);
  int32_t previousFaces = 0;
  for (size_t length = 0; length <= bytes.size(); ++length) {
    const std::vector<uint8_t> prefix(bytes.begin(), bytes.begin() + length);
    const FontFileReader reader = readBytes(prefix, kEnglishUS, u"x.ttc");
    const std::string what = "prefix " + std::to_string(length);
    EXPECT_LE(reader.faceCount(), 3) << what;
    EXPECT_GE(reader.faceCount(), previousFaces) << what;
    previousFaces = reader.faceCount();
    // The faces that remain are the first ones, each with a part of its names.
    for (int32_t face = 0; face < reader.faceCount(); ++face) {
      expectNamesWithin(reader.names(face), intact.names(face),
                        what + " face " + std::to_string(face));
    }
  }
  EXPECT_EQ(previousFaces, 3);
}

struct DamageCase {
  const char* what;
  std::function<void(std::vector<uint8_t>&)> damage;
  std::function<void(const FontFileReader&, const FontFileReader& intact,
                     const std::vector<uint8_t>&)>
      check;
};

uint32_t tableOffset(const std::vector<uint8_t>& bytes, const char* tag) {
  return findTable(bytes, tag).value().offset;
}

void setTableField(std::vector<uint8_t>& bytes, const char* tag, size_t field, uint16_t value) {
  putU16(bytes, tableOffset(bytes, tag) + field, value);
}

void setRecordField(std::vector<uint8_t>& bytes, const char* tag, size_t field, uint32_t value) {
  putU32(bytes, findTable(bytes, tag).value().recordOffset + field, value);
}

void expectIntactNames(const FontFileReader& reader, const FontFileReader& intact) {
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_EQ(reader.names(0), intact.names(0));
}

void expectNoNames(const FontFileReader& reader, const FontFileReader&,
                   const std::vector<uint8_t>&) {
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_TRUE(reader.names(0).empty());
}

TEST(FontFileReaderDamage, DamagedFieldsOfASingleFont) {
  const std::vector<DamageCase> cases = {
      {"numTables 0xFFFF", [](auto& b) { putU16(b, 4, 0xFFFF); },
       [](const auto& r, const auto& intact, const auto&) {
         expectIntactNames(r, intact);
         EXPECT_EQ(r.namedInstances(0).size(), 3u);
       }},
      {"numTables 0", [](auto& b) { putU16(b, 4, 0); },
       [](const auto& r, const auto&, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_TRUE(r.names(0).empty());
         EXPECT_TRUE(r.namedInstances(0).empty());
         expectMetrics(metricsOf(r, 0), kDefaultMetrics, "numTables 0");
       }},
      {"name offset past the end", [](auto& b) { setRecordField(b, "name", 8, 0xFFFFFFF0); },
       expectNoNames},
      {"name offset at the very end",
       [](auto& b) { setRecordField(b, "name", 8, static_cast<uint32_t>(b.size())); },
       expectNoNames},
      {"name length 0xFFFFFFFF: the length of 'name' is not used",
       [](auto& b) { setRecordField(b, "name", 12, 0xFFFFFFFF); },
       [](const auto& r, const auto& intact, const auto&) { expectIntactNames(r, intact); }},
      {"name count 0xFFFF", [](auto& b) { setTableField(b, "name", 2, 0xFFFF); },
       [](const auto& r, const auto& intact, const auto& bytes) {
         ASSERT_EQ(r.faceCount(), 1);
         // Strings read as records may add names, but never more than fit in the file.
         EXPECT_LE(storedNameCount(r.names(0)), bytes.size() / 12);
         EXPECT_EQ(r.names(0).at(3).at(1), intact.names(0).at(3).at(1));
       }},
      {"name stringOffset 0xFFFF", [](auto& b) { setTableField(b, "name", 4, 0xFFFF); },
       expectNoNames},
      {"first name record's string past the end",
       [](auto& b) { setTableField(b, "name", 6 + 10, 0xFFF0); },
       [](const auto& r, const auto& intact, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_EQ(storedNameCount(r.names(0)), storedNameCount(intact.names(0)) - 1);
         // Only the Chinese family name is left, so it is the family name for everyone.
         EXPECT_EQ(r.names(0).at(3).at(1).count(kEnglishUS), 0u);
         EXPECT_EQ(r.familyName(0), "\xE6\x96\x87\xE6\xB3\x89");
       }},
      {"first name record's length past the end",
       [](auto& b) { setTableField(b, "name", 6 + 8, 0xFFFF); },
       [](const auto& r, const auto& intact, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_EQ(storedNameCount(r.names(0)), storedNameCount(intact.names(0)) - 1);
       }},
      {"fvar offset past the end", [](auto& b) { setRecordField(b, "fvar", 8, 0xFFFFFFFF); },
       [](const auto& r, const auto&, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_TRUE(r.namedInstances(0).empty());
         EXPECT_EQ(r.names(0).at(3).count(259), 0u);  // no instance refers to it now
         EXPECT_EQ(r.fullName(0), "Var Regular");
       }},
      {"fvar instanceCount 0xFFFF", [](auto& b) { setTableField(b, "fvar", 12, 0xFFFF); },
       [](const auto& r, const auto&, const auto& bytes) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_GE(r.namedInstances(0).size(), 3u);
         EXPECT_LE(r.namedInstances(0).size(), bytes.size() / 14);
         EXPECT_EQ(r.namedInstances(0)[1].subfamilyName, "Bold");
       }},
      {"fvar axisCount and axisSize 0xFFFF",
       [](auto& b) {
         setTableField(b, "fvar", 8, 0xFFFF);
         setTableField(b, "fvar", 10, 0xFFFF);
       },
       [](const auto& r, const auto&, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_TRUE(r.namedInstances(0).empty());
       }},
      {"fvar axesArrayOffset 0xFFFF", [](auto& b) { setTableField(b, "fvar", 4, 0xFFFF); },
       [](const auto& r, const auto&, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_TRUE(r.namedInstances(0).empty());
       }},
      {"fvar instanceSize 0xFFFF", [](auto& b) { setTableField(b, "fvar", 14, 0xFFFF); },
       [](const auto& r, const auto&, const auto&) {
         ASSERT_EQ(r.faceCount(), 1);
         EXPECT_TRUE(r.namedInstances(0).empty());
       }},
      {"OS/2 offset past the end: present, all zero",
       [](auto& b) { setRecordField(b, "OS/2", 8, 0xFFFFFFFF); },
       [](const auto& r, const auto& intact, const auto&) {
         expectIntactNames(r, intact);
         EXPECT_TRUE(r.isEmbeddable(0));
         EXPECT_FLOAT_EQ(r.subscriptSize(0)[0], 0.0f);
         EXPECT_FLOAT_EQ(r.strikeoutSize(0), 0.05f);
         EXPECT_FLOAT_EQ(r.strikeoutPosition(0), 300 / 1000.0f);
       }},
      {"post offset past the end", [](auto& b) { setRecordField(b, "post", 8, 0x7FFFFFFF); },
       [](const auto& r, const auto&, const auto&) {
         EXPECT_FLOAT_EQ(r.underlinePosition(0), -0.075f);
         EXPECT_FLOAT_EQ(r.underlineThickness(0), 0.05f);
       }},
      {"head offset past the end", [](auto& b) { setRecordField(b, "head", 8, 0x80000000); },
       [](const auto& r, const auto&, const auto&) {
         expectMetrics(metricsOf(r, 0), kDefaultMetrics, "no usable head");
       }},
      {"head length 0", [](auto& b) { setRecordField(b, "head", 12, 0); },
       [](const auto& r, const auto&, const auto&) {
         expectMetrics(metricsOf(r, 0), kDefaultMetrics, "empty head");
       }},
  };
  const std::vector<uint8_t> bytes = richFont().build();
  const FontFileReader intact = readBytes(bytes);
  for (const DamageCase& c : cases) {
    SCOPED_TRACE(c.what);
    std::vector<uint8_t> damaged = bytes;
    c.damage(damaged);
    const FontFileReader reader = readBytes(damaged);
    c.check(reader, intact, damaged);
  }
}

TEST(FontFileReaderDamage, DamagedCollections) {
  const std::vector<uint8_t> bytes = threeFontCollection();
  struct Case {
    const char* what;
    std::function<void(std::vector<uint8_t>&)> damage;
    std::vector<std::string> families;  // of the faces read, in order
  };
  const std::vector<Case> cases = {
      {"second offset past the end",
       [](auto& b) { putU32(b, 16, 0xFFFFFFFF); },
       {"Alpha", "Gamma"}},
      {"second offset where only 8 bytes remain",
       [](auto& b) { putU32(b, 16, static_cast<uint32_t>(b.size() - 8)); },
       {"Alpha", "Gamma"}},
      {"numFonts 0", [](auto& b) { putU32(b, 8, 0); }, {}},
      {"numFonts 2", [](auto& b) { putU32(b, 8, 2); }, {"Alpha", "Beta"}},
      {"first offset repeated",
       [](auto& b) { putU32(b, 20, uint32_t{b[12]} << 24 | b[13] << 16 | b[14] << 8 | b[15]); },
       {"Alpha", "Beta", "Alpha"}},
  };
  for (const Case& c : cases) {
    std::vector<uint8_t> damaged = bytes;
    c.damage(damaged);
    const FontFileReader reader = readBytes(damaged, kEnglishUS, u"x.ttc");
    std::vector<std::string> families;
    for (int32_t face = 0; face < reader.faceCount(); ++face) {
      families.push_back(reader.familyName(face));
    }
    EXPECT_EQ(families, c.families) << c.what;
  }
}

TEST(FontFileReaderDamage, HugeNumFontsReadsOnlyTheOffsetsInTheFile) {
  std::vector<uint8_t> bytes = threeFontCollection();
  putU32(bytes, 8, 0xFFFFFFFF);
  const FontFileReader reader = readBytes(bytes, kEnglishUS, u"x.ttc");
  // Bytes after the three real offsets are read as offsets too; the real faces come first.
  EXPECT_LE(reader.faceCount(), static_cast<int32_t>((bytes.size() - 12) / 4));
  ASSERT_GE(reader.faceCount(), 3);
  EXPECT_EQ(reader.familyName(2), "Gamma");

  std::vector<uint8_t> headerOnly = {'t', 't', 'c', 'f', 0, 1, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF};
  EXPECT_EQ(readBytes(headerOnly, kEnglishUS, u"x.ttc").faceCount(), 0);
  headerOnly.resize(20, 0);  // two offsets, both 0: the face at 0 is the header itself
  const FontFileReader twoAtZero = readBytes(headerOnly, kEnglishUS, u"x.ttc");
  EXPECT_EQ(twoAtZero.faceCount(), 2);
  EXPECT_TRUE(twoAtZero.names(1).empty());
}

TEST(FontFileReaderDamage, HugeCountsInTinyFiles) {
  // An offset table claiming 0xFFFF tables with nothing after it.
  std::vector<uint8_t> directoryOnly = {0, 1, 0, 0, 0xFF, 0xFF, 0, 0, 0, 0, 0, 0};
  const FontFileReader noTables = readBytes(directoryOnly);
  ASSERT_EQ(noTables.faceCount(), 1);
  EXPECT_TRUE(noTables.names(0).empty());

  // A name table claiming 0xFFFF records that holds 40, each naming the family "N" in its own
  // language: only the records inside the file are read.
  std::vector<uint8_t> name = {0, 0, 0xFF, 0xFF, 0, 0};
  putU16(name, 4, 6 + 12 * 40);
  for (uint16_t language = 1; language <= 40; ++language) {
    const std::vector<uint8_t> record = {0, 3, 0, 1, 0, static_cast<uint8_t>(language),
                                         0, 1, 0, 2, 0, 0};
    name.insert(name.end(), record.begin(), record.end());
  }
  name.insert(name.end(), {0, 'N'});
  SfntFont font;
  font.setTable("name", name);
  const FontFileReader manyNames = readBytes(font.build());
  ASSERT_EQ(manyNames.faceCount(), 1);
  EXPECT_EQ(storedNameCount(manyNames.names(0)), 40u);
  EXPECT_EQ(manyNames.familyName(0), "N");

  // 0xFFFF instances of 4 bytes in an fvar table of 16: only those inside the file.
  SfntFont variable;
  variable
      .setTable("fvar",
                {0, 1, 0, 0, 0, 16, 0, 2, 0, 0, 0, 20, 0xFF, 0xFF, 0, 4, 1, 0, 0, 0, 1, 1, 0, 0})
      .addName(3, kEnglishUS, 256, u"Light");
  const std::vector<uint8_t> variableBytes = variable.build();
  const FontFileReader manyInstances = readBytes(variableBytes);
  ASSERT_EQ(manyInstances.faceCount(), 1);
  EXPECT_LE(manyInstances.namedInstances(0).size(), (variableBytes.size() - 16) / 4);
  EXPECT_EQ(manyInstances.namedInstances(0).at(0).subfamilyName, "Light");
}

// Faces that share their tables: 2000 collection entries naming one face with many names. Each
// face may reread the same bytes, but what all faces store together stays in proportion to the
// file: at most four times the file's size counted as 12 bytes per name record.
TEST(FontFileReaderDamage, SharedTablesCannotMultiplyWhatIsStored) {
  SfntFont font;
  for (uint16_t language = 1; language <= 60; ++language) {
    font.addName(3, language, 4, u"Shared full name " + std::u16string(1, u'A' + language % 26));
  }
  FvarTable fvar;
  fvar.axes = {FvarAxis{}};
  for (int i = 0; i < 60; ++i) {
    fvar.instances.push_back(FvarInstance{4, 0, {400}});
  }
  font.setFvar(fvar);
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
  EXPECT_LE(reader.faceCount(), static_cast<int32_t>(kFaces));
  EXPECT_EQ(storedNameCount(reader.names(0)), 60u);
  ASSERT_EQ(reader.namedInstances(0).size(), 60u);
  EXPECT_EQ(reader.namedInstances(0)[59].subfamilyName, reader.name(0, 4));
  size_t names = 0;
  size_t instances = 0;
  for (int32_t face = 0; face < reader.faceCount(); ++face) {
    names += storedNameCount(reader.names(face));
    instances += reader.namedInstances(face).size();
  }
  EXPECT_LE(names, 4 * bytes.size() / 12);
  EXPECT_LE(instances, 4 * bytes.size() / 8);
  EXPECT_LT(names, 60u * kFaces);
}

// ---------------------------------------------------------------------------------------------
// Language codes and UTF-8

TEST(FontFileReaderMacintoshCodes, WindowsIdentifiersMapToMacintoshCodes) {
  struct Case {
    uint16_t windows;
    uint16_t macintosh;
  };
  const Case cases[] = {
      {0x0409, 0},     {0x0809, 0},     {0x0C09, 0},     {0x0000, 0},     {0xFFFF, 0},
      {0x040C, 1},     {0x0484, 1},     {0x180C, 1},     {0x0407, 2},     {0x1407, 2},
      {0x0410, 3},     {0x0813, 4},     {0x041D, 5},     {0x040A, 6},     {0x540A, 6},
      {0x0406, 7},     {0x0816, 8},     {0x0814, 9},     {0x040D, 10},    {0x0411, 11},
      {0x0401, 12},    {0x4001, 12},    {0x040B, 13},    {0x0408, 14},    {0x040F, 15},
      {0x043A, 16},    {0x041F, 17},    {0x101A, 18},    {0x0420, 20},    {0x0439, 21},
      {0x041E, 22},    {0x0412, 23},    {0x0427, 24},    {0x0415, 25},    {0x040E, 26},
      {0x0425, 27},    {0x0426, 28},    {0x043B, 29},    {0x243B, 29},    {0x0438, 30},
      {0x0419, 32},    {0x0404, 33},    {0x0804, 33},    {0x0C04, 33},    {0x1004, 33},
      {0x1404, 33},    {0x083C, 35},    {0x041C, 36},    {0x0418, 37},    {0x0405, 38},
      {0x041B, 39},    {0x0424, 40},    {0x081A, 42},    {0x1C1A, 42},    {0x042F, 43},
      {0x0402, 44},    {0x0422, 45},    {0x0843, 47},    {0x043F, 48},    {0x042B, 51},
      {0x0437, 52},    {0x0428, 55},    {0x0442, 56},    {0x0850, 57},    {0x0450, 58},
      {0x0463, 59},    {0x0451, 63},    {0x0461, 64},    {0x044F, 65},    {0x044E, 66},
      {0x0845, 67},    {0x044D, 68},    {0x0447, 69},    {0x0446, 70},    {0x044C, 72},
      {0x044B, 73},    {0x0449, 74},    {0x044A, 75},    {0x0453, 78},    {0x0454, 79},
      {0x042A, 80},    {0x0421, 81},    {0x083E, 83},    {0x045E, 85},    {0x0441, 89},
      {0x0487, 90},    {0x0452, 128},   {0x042D, 129},   {0x0403, 130},   {0x0C6B, 132},
      {0x0444, 135},   {0x0480, 136},   {0x0456, 140},   {0x0436, 141},   {0x047E, 142},
      {0x085D, 143},   {0x046F, 149},   {0x0417, 65535}, {0x0423, 65535}, {0x048C, 65535},
      {0x081D, 65535}, {0x085F, 65535}, {0x141A, 65535}, {0x201A, 65535}, {0x0C1A, 42},
      {0x041A, 18},    {0x181A, 42},    {0x0C0A, 6},     {0x080A, 6},     {0x0C0C, 1},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(macintoshLanguageCode(c.windows), c.macintosh) << std::hex << c.windows;
  }
}

struct Utf8Case {
  std::string utf8;
  std::u16string utf16;
};

TEST(FontFileReaderUtf8, ConvertsAndReplacesMalformedSequences) {
  const Utf8Case cases[] = {
      {"", u""},
      {"Abc", u"Abc"},
      {"\xC3\xA9", u"\u00E9"},
      {"\xE6\x96\x87", u"\u6587"},
      {"\xF0\x9F\x98\x80", u"\U0001F600"},
      {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"},
      {"\xEF\xBF\xBD", u"\uFFFD"},
      {"\x80", u"\uFFFD"},
      {"a\xBFz", u"a\uFFFDz"},
      {"\xC0\x80", u"\uFFFD\uFFFD"},                      // overlong NUL
      {"\xC1\xBF", u"\uFFFD\uFFFD"},                      // overlong
      {"\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},            // overlong
      {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},            // encoded surrogate
      {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},  // past U+10FFFF
      {"\xF5\x80", u"\uFFFD\uFFFD"},
      {"\xFF", u"\uFFFD"},
      {"\xE6\x96", u"\uFFFD"},    // cut short at the end
      {"\xE6\x96z", u"\uFFFDz"},  // cut short before another character
      {"\xF0\x9F\x98", u"\uFFFD"},
      {"\xF0\x9F\x98\xC3\xA9", u"\uFFFD\u00E9"},
  };
  for (const Utf8Case& c : cases) {
    EXPECT_EQ(utf8ToUtf16(c.utf8), c.utf16) << testing::PrintToString(c.utf8);
  }
}

// ---------------------------------------------------------------------------------------------
// Installed fonts, compared with FreeType's reading of the same files

bool underContinuousIntegration() {
  const char* ci = std::getenv("CI");
  return ci && std::string(ci) == "true";
}

// Fails under CI, where the packages must be installed; skips elsewhere.
#define REQUIRE_FILE(path)                                                           \
  do {                                                                               \
    if (!std::filesystem::exists(path)) {                                            \
      if (underContinuousIntegration()) {                                            \
        FAIL() << "missing " << (path) << ": run scripts/setup.sh";                  \
      }                                                                              \
      GTEST_SKIP() << "missing " << (path) << " (install it with scripts/setup.sh)"; \
    }                                                                                \
  } while (false)

// UTF-16 big-endian up to the first zero unit, as UTF-8; nothing for an unpaired surrogate.
std::optional<std::string> decodeUtf16BigEndian(const FT_Byte* bytes, FT_UInt length) {
  std::u16string units;
  for (FT_UInt i = 0; i < length; i += 2) {
    const char16_t unit =
        static_cast<char16_t>(bytes[i] << 8 | (i + 1 < length ? bytes[i + 1] : 0));
    if (unit == 0) {
      break;
    }
    units += unit;
  }
  std::string out;
  for (size_t i = 0; i < units.size(); ++i) {
    char32_t c = units[i];
    if (c >= 0xDC00 && c <= 0xDFFF) {
      return std::nullopt;
    }
    if (c >= 0xD800 && c <= 0xDBFF) {
      if (i + 1 == units.size() || units[i + 1] < 0xDC00 || units[i + 1] > 0xDFFF) {
        return std::nullopt;
      }
      c = 0x10000 + ((c - 0xD800) << 10) + (units[++i] - 0xDC00);
    }
    if (c < 0x80) {
      out += static_cast<char>(c);
    } else if (c < 0x800) {
      out += static_cast<char>(0xC0 | c >> 6);
      out += static_cast<char>(0x80 | (c & 0x3F));
    } else if (c < 0x10000) {
      out += static_cast<char>(0xE0 | c >> 12);
      out += static_cast<char>(0x80 | (c >> 6 & 0x3F));
      out += static_cast<char>(0x80 | (c & 0x3F));
    } else {
      out += static_cast<char>(0xF0 | c >> 18);
      out += static_cast<char>(0x80 | (c >> 12 & 0x3F));
      out += static_cast<char>(0x80 | (c >> 6 & 0x3F));
      out += static_cast<char>(0x80 | (c & 0x3F));
    }
  }
  return out;
}

// The text a user of `user` sees among the languages of one name (ascending identifiers).
std::string chosenFor(const std::map<uint16_t, std::string>& byLanguage, uint16_t user) {
  if (byLanguage.empty()) {
    return "";
  }
  if (byLanguage.size() == 1 || byLanguage.count(user)) {
    return byLanguage.size() == 1 ? byLanguage.begin()->second : byLanguage.at(user);
  }
  for (uint16_t wanted : {macintoshLanguageCode(user), uint16_t{0}}) {
    for (const auto& [language, text] : byLanguage) {
      if (macintoshLanguageCode(language) == wanted) {
        return text;
      }
    }
  }
  return byLanguage.begin()->second;
}

class FreeTypeLibrary {
 public:
  FreeTypeLibrary() { FT_Init_FreeType(&library_); }
  ~FreeTypeLibrary() { FT_Done_FreeType(library_); }
  FT_Library get() const { return library_; }

 private:
  FT_Library library_ = nullptr;
};

class FreeTypeFace {
 public:
  FreeTypeFace(FT_Library library, const std::string& path, FT_Long index) {
    if (FT_New_Face(library, path.c_str(), index, &face_) != 0) {
      face_ = nullptr;
    }
  }
  ~FreeTypeFace() {
    if (face_) {
      FT_Done_Face(face_);
    }
  }
  FT_Face get() const { return face_; }

 private:
  FT_Face face_ = nullptr;
};

struct FreeTypeInstance {
  FT_UInt strid;
  FT_UInt psid;
};

std::vector<FreeTypeInstance> freeTypeInstances(FT_Library library, FT_Face face) {
  std::vector<FreeTypeInstance> instances;
  FT_MM_Var* variation = nullptr;
  if (!FT_HAS_MULTIPLE_MASTERS(face) || FT_Get_MM_Var(face, &variation) != 0) {
    return instances;
  }
  for (FT_UInt i = 0; i < variation->num_namedstyles; ++i) {
    instances.push_back({variation->namedstyle[i].strid, variation->namedstyle[i].psid});
  }
  FT_Done_MM_Var(library, variation);
  return instances;
}

// Every check of one file: names per face and language, chosen names, instances, metrics.
void compareWithFreeType(const std::string& path, const std::vector<uint16_t>& userLanguages) {
  SCOPED_TRACE(path);
  FreeTypeLibrary library;
  FreeTypeFace first(library.get(), path, 0);
  ASSERT_NE(first.get(), nullptr);
  const FontFileReader reader(utf8ToUtf16(path), kEnglishUS);
  ASSERT_EQ(reader.faceCount(), first.get()->num_faces);

  for (int32_t index = 0; index < reader.faceCount(); ++index) {
    SCOPED_TRACE("face " + std::to_string(index));
    FreeTypeFace face(library.get(), path, index);
    ASSERT_NE(face.get(), nullptr);
    const std::vector<FreeTypeInstance> instances = freeTypeInstances(library.get(), face.get());

    std::set<uint16_t> kept = {1, 2, 3, 4, 6, 16, 17, 19, 25};
    for (const FreeTypeInstance& instance : instances) {
      kept.insert(static_cast<uint16_t>(instance.strid));
      if (instance.psid != 0xFFFF) {
        kept.insert(static_cast<uint16_t>(instance.psid));
      }
    }
    std::map<uint16_t, std::map<uint16_t, std::string>> expected;  // nameID -> language -> text
    for (FT_UInt i = 0; i < FT_Get_Sfnt_Name_Count(face.get()); ++i) {
      FT_SfntName name;
      ASSERT_EQ(FT_Get_Sfnt_Name(face.get(), i, &name), 0);
      if (name.platform_id != 3 || kept.count(name.name_id) == 0) {
        continue;
      }
      const std::optional<std::string> text = decodeUtf16BigEndian(name.string, name.string_len);
      if (text && !text->empty()) {
        expected[name.name_id][name.language_id] = *text;
      }
    }
    ASSERT_FALSE(expected.empty());
    const NameTable& names = reader.names(index);
    ASSERT_EQ(names.count(3), 1u);
    EXPECT_EQ(names.at(3), expected);

    for (uint16_t user : userLanguages) {
      const FontFileReader forUser(utf8ToUtf16(path), user);
      for (const auto& [id, byLanguage] : expected) {
        EXPECT_EQ(forUser.name(index, id), chosenFor(byLanguage, user))
            << "name " << id << " for user language " << user;
      }
      EXPECT_EQ(forUser.familyName(index),
                chosenFor(expected.count(16) ? expected.at(16) : expected[1], user));
    }

    const std::vector<NamedInstance>& read = reader.namedInstances(index);
    ASSERT_EQ(read.size(), instances.size());
    for (size_t i = 0; i < read.size(); ++i) {
      EXPECT_EQ(read[i].subfamilyNameID, instances[i].strid) << "instance " << i;
      EXPECT_EQ(read[i].subfamilyName, chosenFor(expected[read[i].subfamilyNameID], kEnglishUS))
          << "instance " << i;
      EXPECT_FALSE(read[i].subfamilyName.empty()) << "instance " << i;
      if (instances[i].psid != 0xFFFF) {
        EXPECT_EQ(read[i].postScriptNameID, instances[i].psid) << "instance " << i;
        EXPECT_EQ(read[i].postScriptName, chosenFor(expected[instances[i].psid], kEnglishUS));
      }
    }

    const auto* os2 = static_cast<const TT_OS2*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_OS2));
    const auto* post =
        static_cast<const TT_Postscript*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_POST));
    const auto* head = static_cast<const TT_Header*>(FT_Get_Sfnt_Table(face.get(), FT_SFNT_HEAD));
    ASSERT_TRUE(os2 && post && head);
    const float em = head->Units_Per_EM;
    EXPECT_FLOAT_EQ(reader.subscriptSize(index)[0], os2->ySubscriptXSize / em);
    EXPECT_FLOAT_EQ(reader.subscriptSize(index)[1], os2->ySubscriptYSize / em);
    EXPECT_FLOAT_EQ(reader.subscriptOffset(index)[0], os2->ySubscriptXOffset / em);
    EXPECT_FLOAT_EQ(reader.subscriptOffset(index)[1], os2->ySubscriptYOffset / em);
    EXPECT_FLOAT_EQ(reader.superscriptSize(index)[0], os2->ySuperscriptXSize / em);
    EXPECT_FLOAT_EQ(reader.superscriptSize(index)[1], os2->ySuperscriptYSize / em);
    EXPECT_FLOAT_EQ(reader.superscriptOffset(index)[0], os2->ySuperscriptXOffset / em);
    EXPECT_FLOAT_EQ(reader.superscriptOffset(index)[1], os2->ySuperscriptYOffset / em);
    if (os2->yStrikeoutSize != 0) {
      EXPECT_FLOAT_EQ(reader.strikeoutSize(index), os2->yStrikeoutSize / em);
      EXPECT_FLOAT_EQ(reader.strikeoutPosition(index), os2->yStrikeoutPosition / em);
    } else {
      EXPECT_FLOAT_EQ(reader.strikeoutPosition(index), (head->yMax / 3) / em);
    }
    if (post->underlineThickness != 0) {
      EXPECT_FLOAT_EQ(reader.underlinePosition(index), post->underlinePosition / em);
      EXPECT_FLOAT_EQ(reader.underlineThickness(index), post->underlineThickness / em);
    }
    EXPECT_EQ(reader.isEmbeddable(index), (os2->fsType & 0x0207) == 0);
  }
}

const std::vector<uint16_t> kUserLanguages = {
    kEnglishUS,          kGerman,          kFrench,  kChineseSimplified,
    kChineseTraditional, kChineseHongKong, kRomansh, kJapanese};

TEST(FontFileReaderInstalledFonts, DejaVuMatchesFreeType) {
  const std::string folder = "/usr/share/fonts/truetype/dejavu";
  REQUIRE_FILE(folder + "/DejaVuSans.ttf");
  size_t files = 0;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() == ".ttf") {
      compareWithFreeType(entry.path().string(), kUserLanguages);
      ++files;
    }
  }
  EXPECT_GE(files, 1u);
}

TEST(FontFileReaderInstalledFonts, InterVariableMatchesFreeTypeWithItsNamedInstances) {
  const std::string folder = "/usr/share/fonts/truetype/inter-vf";
  REQUIRE_FILE(folder + "/Inter.var.ttf");
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() == ".ttf") {
      compareWithFreeType(entry.path().string(), kUserLanguages);
    }
  }
  const FontFileReader reader(u"/usr/share/fonts/truetype/inter-vf/Inter.var.ttf", kEnglishUS);
  ASSERT_EQ(reader.faceCount(), 1);
  EXPECT_GT(reader.namedInstances(0).size(), 1u);
}

TEST(FontFileReaderInstalledFonts, WenQuanYiCollectionMatchesFreeType) {
  const std::string path = "/usr/share/fonts/truetype/wqy/wqy-microhei.ttc";
  REQUIRE_FILE(path);
  compareWithFreeType(path, kUserLanguages);
  const FontFileReader english(utf8ToUtf16(path), kEnglishUS);
  const FontFileReader chinese(utf8ToUtf16(path), kChineseSimplified);
  ASSERT_EQ(english.faceCount(), 2);
  EXPECT_NE(english.familyName(0), chinese.familyName(0));
}

}  // namespace
