#include "platform/system_services.h"

#include <gtest/gtest.h>

#include <clocale>
#include <cwctype>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "ci_or_skip.h"
#include "platform/utf16_text.h"

namespace waveform_test {
namespace {

namespace fs = std::filesystem;
using platform::EnumeratedFace, platform::FontHive, platform::InstalledFont, platform::toUtf16,
    platform::toUtf8;

const std::string kDejaVu = "/usr/share/fonts/truetype/dejavu/";
const std::string kDejaVuSans = kDejaVu + "DejaVuSans.ttf";
const std::string kCantarell = "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf";
const std::string kInter = "/usr/share/fonts/truetype/inter-vf/Inter.var.ttf";
const std::string kWenQuanYi = "/usr/share/fonts/truetype/wqy/wqy-microhei.ttc";

std::vector<uint8_t> fileBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::vector<uint8_t>(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// An installed-font list as (name, file) pairs; a list that cannot be read fails.
using Entries = std::vector<std::pair<std::u16string, std::u16string>>;
Entries entries(const std::optional<std::vector<InstalledFont>>& list) {
  Entries pairs;
  EXPECT_TRUE(list.has_value());
  for (const InstalledFont& font : list.value_or(std::vector<InstalledFont>{})) {
    pairs.emplace_back(font.name, font.file);
  }
  return pairs;
}

// Sets and unsets environment variables for one test and puts every one back afterwards.
class ScopedEnvironment {
 public:
  explicit ScopedEnvironment(const std::vector<std::string>& names) {
    for (const std::string& name : names) {
      const char* value = std::getenv(name.c_str());
      saved_.emplace_back(name, value ? std::optional<std::string>(value) : std::nullopt);
    }
  }
  ~ScopedEnvironment() {
    for (const auto& [name, value] : saved_) {
      set(name, value);
    }
  }

  static void set(const std::string& name, const std::optional<std::string>& value) {
    value ? setenv(name.c_str(), value->c_str(), 1) : unsetenv(name.c_str());
  }

 private:
  std::vector<std::pair<std::string, std::optional<std::string>>> saved_;
};

// A fresh, empty folder under the test's temporary folder.
fs::path freshFolder(const std::string& name) {
  const fs::path folder = fs::path(testing::TempDir()) / name;
  fs::remove_all(folder);
  fs::create_directories(folder);
  return folder;
}

void copyInto(const std::string& from, const fs::path& to) {
  fs::create_directories(to.parent_path());
  fs::copy_file(from, to, fs::copy_options::overwrite_existing);
}

// Codesets and unknown modifiers are ignored; a missing or unknown territory gives the
// language's first row; aliases, BCP 47 script subtags, case and '-' for '_' are understood.
TEST(LanguageIdForLocale, ParsesLocaleNames) {
  const std::pair<std::string, uint16_t> cases[] = {
      {"de_DE", 0x0407},      {"de_AT.UTF-8@euro", 0x0C07},
      {"de", 0x0407},         {"de_XX", 0x0407},
      {"es", 0x0C0A},         {"es_419", 0x580A},
      {"zh_HK.Big5", 0x0C04}, {"iw_IL", 0x040D},
      {"no_NO", 0x0414},      {"ca_ES@valencia", 0x0803},
      {"sr_RS", 0x281A},      {"sr_RS@latin", 0x241A},
      {"sr-Latn-RS", 0x241A}, {"uz_UZ@cyrillic", 0x0843},
      {"DE_at", 0x0C07},      {"de-AT", 0x0C07},
      {"xx_YY", 0x0409},      {"", 0x0409},
      {"C", 0x0409},          {"POSIX", 0x0409},
      {"C.UTF-8", 0x0409},
  };
  for (const auto& [locale, expected] : cases) {
    EXPECT_EQ(platform::languageIdForLocale(locale), expected) << "\"" << locale << "\"";
  }
}

TEST(UserLanguageId, TakesLcAllThenLcMessagesThenLangOnEveryCall) {
  ScopedEnvironment environment({"LC_ALL", "LC_MESSAGES", "LANG"});
  const std::optional<std::string> unset;
  const std::tuple<std::optional<std::string>, std::optional<std::string>,
                   std::optional<std::string>, uint16_t>
      cases[] = {
          {unset, unset, unset, 0x0409},           {unset, unset, "de_AT.UTF-8", 0x0C07},
          {unset, "fr_CA", "de_AT.UTF-8", 0x0C0C}, {"ja_JP.UTF-8", "fr_CA", "de_AT.UTF-8", 0x0411},
          {"", "fr_CA", "de_AT.UTF-8", 0x0C0C},    {"", "", "", 0x0409},
      };
  const auto services = platform::systemServices();
  for (const auto& [lcAll, lcMessages, lang, expected] : cases) {
    ScopedEnvironment::set("LC_ALL", lcAll);
    ScopedEnvironment::set("LC_MESSAGES", lcMessages);
    ScopedEnvironment::set("LANG", lang);
    EXPECT_EQ(services->userLanguageId(), expected)
        << lcAll.value_or("-") << " " << lcMessages.value_or("-") << " " << lang.value_or("-");
  }
}

TEST(UserFontFolders, FollowXdgDataHomeAndHome) {
  ScopedEnvironment environment({"HOME", "XDG_DATA_HOME"});
  const std::optional<std::string> unset;
  const std::tuple<std::optional<std::string>, std::optional<std::string>, std::vector<std::string>>
      cases[] = {
          {"/home/ada", unset, {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
          {"/home/ada/", "", {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
          {"/home/ada", "/data/ada", {"/data/ada/fonts/", "/home/ada/.fonts/"}},
          {"/home/ada", "relative/data", {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
          {unset, "/data/ada/", {"/data/ada/fonts/"}},
          {"", unset, {}},
      };
  for (const auto& [home, dataHome, expected] : cases) {
    ScopedEnvironment::set("HOME", home);
    ScopedEnvironment::set("XDG_DATA_HOME", dataHome);
    EXPECT_EQ(platform::userFontFolders(), expected)
        << home.value_or("-") << " " << dataHome.value_or("-");
  }
}

TEST(FontHiveOfFile, IsUserOnlyInsideAUserFontFolder) {
  const std::vector<std::string> userFolders = {"/home/ada/.local/share/fonts/",
                                                "/home/ada/.fonts/"};
  const std::pair<std::string, FontHive> cases[] = {
      {"/home/ada/.local/share/fonts/a.ttf", FontHive::kUser},
      {"/home/ada/.local/share/fonts/sub/dir/a.otf", FontHive::kUser},
      {"/home/ada//.fonts/./a.ttf", FontHive::kUser},
      {"/home/ada/.fontsextra/a.ttf", FontHive::kMachine},
      {"/home/ada/.fonts/../a.ttf", FontHive::kMachine},
      {"/usr/share/fonts/truetype/a.ttf", FontHive::kMachine},
  };
  for (const auto& [file, expected] : cases) {
    EXPECT_EQ(platform::fontHiveOfFile(file, userFolders), expected) << file;
  }
  EXPECT_EQ(platform::fontHiveOfFile("/home/ada/.fonts/a.ttf", {}), FontHive::kMachine);
}

TEST(InstalledFontName, NamesTrueTypeAndOpenTypeOutlinesOnly) {
  const std::tuple<std::u16string, std::string, bool, std::optional<std::u16string>> cases[] = {
      {u"Book", "TrueType", true, u"DejaVu Sans Book (TrueType)"},
      {u"Book", "CFF", true, u"DejaVu Sans Book (OpenType)"},
      {u"", "TrueType", true, u"DejaVu Sans (TrueType)"},
      {u"Book", "TrueType", false, std::nullopt},
      {u"Book", "BDF", false, std::nullopt},
      {u"Book", "Type 1", true, std::nullopt},
      {u"Book", "", true, std::nullopt},
  };
  for (const auto& [style, format, outline, expected] : cases) {
    EXPECT_EQ(platform::installedFontName(u"DejaVu Sans", style, format, outline), expected)
        << format << " " << outline;
  }
}

TEST(SystemFonts, FontDataIsTheWholeFileOfTheBestMatchingFace) {
  const std::tuple<bool, bool, std::string> cases[] = {
      {false, false, "DejaVuSans.ttf"},
      {true, false, "DejaVuSans-Bold.ttf"},
      {false, true, "DejaVuSans-Oblique.ttf"},
      {true, true, "DejaVuSans-BoldOblique.ttf"},
  };
  const auto services = platform::systemServices();
  for (const auto& [bold, italic, file] : cases) {
    REQUIRE_FILE(kDejaVu + file);
    EXPECT_TRUE(services->fontData(u"DejaVu Sans", bold, italic) == fileBytes(kDejaVu + file))
        << "not the bytes of " << file;
  }
}

// A one-glyph bitmap font in BDF.
const char* const kBitmapFont = R"(STARTFONT 2.1
FONT -test-Pixel Test-Medium-R-Normal--8-80-75-75-C-80-ISO10646-1
SIZE 8 75 75
FONTBOUNDINGBOX 8 1 0 0
STARTPROPERTIES 3
FAMILY_NAME "Pixel Test"
FONT_ASCENT 1
FONT_DESCENT 0
ENDPROPERTIES
CHARS 1
STARTCHAR A
ENCODING 65
SWIDTH 1000 0
DWIDTH 8 0
BBX 8 1 0 0
BITMAP
7E
ENDCHAR
ENDFONT
)";

// A configuration of the test's own with a private cache in a temporary HOME. (The system one's
// XDG folder brings in every folder of XDG_DATA_DIRS, so the user's folders are named by path.)
class ConfiguredFonts : public testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(machine_);
    std::ofstream(root_ / "fonts.conf")
        << "<?xml version=\"1.0\"?>\n<!DOCTYPE fontconfig SYSTEM \"urn:fontconfig:fonts.dtd\">\n"
        << "<fontconfig><dir>" << machine_.string() << "</dir><dir>~/.local/share/fonts</dir>"
        << "<dir>~/.fonts</dir><cachedir>" << (root_ / "cache").string()
        << "</cachedir></fontconfig>\n";
    ScopedEnvironment::set("FONTCONFIG_FILE", (root_ / "fonts.conf").string());
    ScopedEnvironment::set("FONTCONFIG_PATH", std::nullopt);
    ScopedEnvironment::set("FONTCONFIG_SYSROOT", std::nullopt);
    ScopedEnvironment::set("HOME", (root_ / "home").string());
    ScopedEnvironment::set("XDG_DATA_HOME", std::nullopt);
    ScopedEnvironment::set("XDG_CACHE_HOME", (root_ / "xdg-cache").string());
  }

  ScopedEnvironment environment_{{"FONTCONFIG_FILE", "FONTCONFIG_PATH", "FONTCONFIG_SYSROOT",
                                  "HOME", "XDG_DATA_HOME", "XDG_CACHE_HOME"}};
  const fs::path root_ = freshFolder("platform_configured_fonts");
  const fs::path machine_ = root_ / "machine";
};

TEST_F(ConfiguredFonts, ListsOutlineFontsByHiveAndEnumeratesEveryFace) {
  for (const std::string& file :
       {kDejaVuSans, kDejaVu + "DejaVuSans-Bold.ttf", kDejaVu + "DejaVuSansCondensed-Bold.ttf",
        kDejaVu + "DejaVuSerif.ttf", kCantarell, kInter, kWenQuanYi}) {
    REQUIRE_FILE(file);
  }
  copyInto(kDejaVuSans, machine_ / "sub" / "Machine.ttf");
  copyInto(kDejaVu + "DejaVuSansCondensed-Bold.ttf", machine_ / "Condensed.ttf");
  copyInto(kCantarell, machine_ / "Cantarell.otf");
  copyInto(kInter, machine_ / "Inter.ttf");
  copyInto(kWenQuanYi, machine_ / "wqy.ttc");
  std::ofstream(machine_ / "pixel.bdf") << kBitmapFont;
  const fs::path dataFile = root_ / "home/.local/share/fonts/Data.ttf";
  const fs::path legacyFile = root_ / "home/.fonts/Legacy.ttf";
  copyInto(kDejaVu + "DejaVuSans-Bold.ttf", dataFile);
  copyInto(kDejaVu + "DejaVuSerif.ttf", legacyFile);

  const auto services = platform::createSystemServices();
  EXPECT_EQ(services->fontsFolder(), toUtf16(machine_.string() + "/"));
  // Machine files are named relative to the folder, user files by their absolute paths, in path
  // order; a collection or a variable font once, by its first face; the bitmap font not at all.
  EXPECT_EQ(entries(services->installedFonts(FontHive::kMachine)),
            (Entries{{u"Cantarell Regular (OpenType)", u"Cantarell.otf"},
                     {u"DejaVu Sans Condensed Bold (TrueType)", u"Condensed.ttf"},
                     {u"Inter Regular (TrueType)", u"Inter.ttf"},
                     {u"DejaVu Sans Book (TrueType)", u"sub/Machine.ttf"},
                     {u"WenQuanYi Micro Hei Regular (TrueType)", u"wqy.ttc"}}));
  EXPECT_EQ(entries(services->installedFonts(FontHive::kUser)),
            (Entries{{u"DejaVu Serif Book (TrueType)", toUtf16(legacyFile.string())},
                     {u"DejaVu Sans Bold (TrueType)", toUtf16(dataFile.string())}}));

  // One face stands for each family, the most regular one.
  std::vector<std::string> families;
  for (const EnumeratedFace& face : services->enumerateFamilies()) {
    families.push_back(toUtf8(face.faceName + u" / " + face.style + u" / " + face.fullName) +
                       (face.fontType == platform::kRasterFontType ? " (raster)" : ""));
  }
  EXPECT_EQ(families, (std::vector<std::string>{
                          "Cantarell / Regular / Cantarell Regular",
                          "DejaVu Sans / Book / DejaVu Sans",
                          "DejaVu Serif / Book / DejaVu Serif",
                          "Inter / Regular / Inter",
                          "Pixel Test / Regular / Pixel Test Regular (raster)",
                          "WenQuanYi Micro Hei / Regular / WenQuanYi Micro Hei",
                          "WenQuanYi Micro Hei Mono / Regular / WenQuanYi Micro Hei Mono",
                      }));
  // Each style once; the legacy family with the legacy style; named instances with their style
  // in their full name; a bitmap face as a raster face.
  const std::tuple<std::u16string, std::u16string, std::u16string, int32_t> faces[] = {
      {u"DejaVu Sans", u"Bold", u"DejaVu Sans Bold", platform::kTrueTypeFontType},
      {u"DejaVu Sans", u"Condensed Bold", u"DejaVu Sans Condensed Bold",
       platform::kTrueTypeFontType},
      {u"DejaVu Sans Condensed", u"Bold", u"DejaVu Sans Condensed Bold",
       platform::kTrueTypeFontType},
      {u"Inter", u"Bold", u"Inter Bold", platform::kTrueTypeFontType},
      {u"Inter", u"Semi Bold Italic", u"Inter Semi Bold Italic", platform::kTrueTypeFontType},
      {u"Pixel Test", u"Regular", u"Pixel Test Regular", platform::kRasterFontType},
  };
  for (const auto& [family, style, fullName, fontType] : faces) {
    std::set<std::pair<std::u16string, std::u16string>> seen;
    int matches = 0;
    for (const EnumeratedFace& face : services->enumerateFaces(family)) {
      EXPECT_EQ(face.faceName, family);
      EXPECT_TRUE(seen.emplace(face.style, face.fullName).second) << toUtf8(face.fullName);
      matches += face.style == style && face.fullName == fullName && face.fontType == fontType;
    }
    EXPECT_EQ(matches, 1) << toUtf8(family) << " / " << toUtf8(style);
  }
  // Unknown families have no faces and no data; fontconfig would substitute a generic family
  // for one, but the services must not.
  EXPECT_TRUE(services->enumerateFaces(u"No Such Family").empty());
  EXPECT_TRUE(services->fontData(u"No Such Family", true, true).empty());
  EXPECT_TRUE(services->fontData(u"sans-serif", false, false).empty());
}

TEST_F(ConfiguredFonts, EmptyHivesAreEmptyLists) {
  const auto services = platform::createSystemServices();
  EXPECT_EQ(entries(services->installedFonts(FontHive::kMachine)), Entries{});
  EXPECT_EQ(entries(services->installedFonts(FontHive::kUser)), Entries{});
  EXPECT_TRUE(services->enumerateFamilies().empty());
}

TEST(SystemServices, KnowsItsModuleFolder) {
  EXPECT_EQ(toUtf8(platform::systemServices()->moduleFolder()),
            fs::read_symlink("/proc/self/exe").parent_path().string() + "/");
}

TEST(NewGuid, GivesDistinctVersion4GuidsWrittenInFiveGroups) {
  EXPECT_EQ(platform::guidText({0x00, 0x11, 0x22, 0x33, 0x44, 0x55, 0x46, 0x77, 0x88, 0x99, 0xAA,
                                0xBB, 0xCC, 0xDD, 0xEE, 0xFF}),
            "00112233-4455-4677-8899-aabbccddeeff");
  const auto services = platform::systemServices();
  std::set<std::array<uint8_t, 16>> guids;
  for (int i = 0; i < 1000; ++i) {
    const std::array<uint8_t, 16> guid = services->newGuid();
    EXPECT_EQ(guid[6] >> 4, 4) << platform::guidText(guid);
    EXPECT_EQ(guid[8] >> 6, 2) << platform::guidText(guid);
    guids.insert(guid);
  }
  EXPECT_EQ(guids.size(), 1000u);
}

TEST(IsWideSpace, MatchesGlibcInAUtf8Locale) {
  const std::string previous = std::setlocale(LC_CTYPE, nullptr);
  if (std::setlocale(LC_CTYPE, "C.UTF-8") == nullptr) {
    GTEST_SKIP() << "no C.UTF-8 locale";
  }
  const auto services = platform::systemServices();
  int mismatches = 0;
  for (char32_t c = 0; c <= 0x10FFFF; ++c) {
    const bool glibc = std::iswspace(static_cast<wint_t>(c)) != 0;
    if (services->isWideSpace(c) != glibc && ++mismatches <= 20) {
      ADD_FAILURE() << std::hex << "U+" << static_cast<uint32_t>(c) << ": glibc " << glibc;
    }
  }
  std::setlocale(LC_CTYPE, previous.c_str());
  EXPECT_EQ(mismatches, 0);
}

// Each malformed sequence becomes one U+FFFD: a byte that starts none, or the longest
// well-formed beginning of a sequence cut short.
TEST(Utf16Text, ConvertsUtf8AndReplacesMalformedSequences) {
  const std::pair<std::string, std::u16string> cases[] = {
      {"Abc", u"Abc"},
      {"\xC3\xA9\xE6\x96\x87", u"\u00E9\u6587"},
      {"\xF0\x9F\x98\x80\xF4\x8F\xBF\xBF", u"\U0001F600\U0010FFFF"},
      {"a\x80z\xFF", u"a\uFFFDz\uFFFD"},
      {"\xC0\x80", u"\uFFFD\uFFFD"},                      // overlong
      {"\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},            // overlong
      {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},            // an encoded surrogate
      {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},  // past U+10FFFF
      {"\xE6\x96", u"\uFFFD"},                            // cut short at the end
      {"\xE6\x96z", u"\uFFFDz"},
      {"\xF0\x9F\x98\xC3\xA9", u"\uFFFD\u00E9"},
  };
  for (const auto& [utf8, utf16] : cases) {
    EXPECT_EQ(toUtf16(utf8), utf16) << testing::PrintToString(utf8);
  }
  EXPECT_EQ(toUtf8(u"\u00E9\U0001F600"), "\xC3\xA9\xF0\x9F\x98\x80");
  EXPECT_EQ(toUtf8(u"a\xD800"), "a\xEF\xBF\xBD");
  EXPECT_EQ(platform::toUtf8Strict(u"a\xD800"), std::nullopt);
}

}  // namespace
}  // namespace waveform_test
