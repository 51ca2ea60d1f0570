// The POSIX system services on this machine: the locale table and environment, the user's font
// folders, the fonts fontconfig knows (the installed ones and ones a test configuration points
// at), the module folder, GUIDs and the wide-space classification.
#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <cstring>
#include <cwctype>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "platform/system_services.h"

namespace {

namespace fs = std::filesystem;
using platform::EnumeratedFace;
using platform::FontHive;
using platform::InstalledFont;

const std::string kDejaVuSans = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
const std::string kDejaVuSansBold = "/usr/share/fonts/truetype/dejavu/DejaVuSans-Bold.ttf";
const std::string kDejaVuSansOblique = "/usr/share/fonts/truetype/dejavu/DejaVuSans-Oblique.ttf";
const std::string kDejaVuSansBoldOblique =
    "/usr/share/fonts/truetype/dejavu/DejaVuSans-BoldOblique.ttf";
const std::string kDejaVuSansCondensedBold =
    "/usr/share/fonts/truetype/dejavu/DejaVuSansCondensed-Bold.ttf";
const std::string kDejaVuSerif = "/usr/share/fonts/truetype/dejavu/DejaVuSerif.ttf";
const std::string kWqyMicroHei = "/usr/share/fonts/truetype/wqy/wqy-microhei.ttc";
const std::string kInterVariable = "/usr/share/fonts/truetype/inter-vf/Inter.var.ttf";
const std::string kCantarell = "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf";

bool underCi() {
  const char* ci = std::getenv("CI");
  return ci != nullptr && std::strcmp(ci, "true") == 0;
}

// The installed font files the tests read come with the project's setup; under CI a missing one
// is a failure, elsewhere the test is skipped.
#define REQUIRE_FONT_FILE(path)                                         \
  do {                                                                  \
    if (!fs::exists(path)) {                                            \
      if (underCi()) {                                                  \
        FAIL() << "font file required under CI is missing: " << (path); \
      }                                                                 \
      GTEST_SKIP() << "font file not installed: " << (path);            \
    }                                                                   \
  } while (0)

std::string narrow(const std::u16string& text) {
  std::string out;
  for (char16_t unit : text) {
    out += unit < 0x80 ? static_cast<char>(unit) : '?';
  }
  return out;
}

std::u16string wide(const std::string& ascii) {
  return std::u16string(ascii.begin(), ascii.end());
}

std::vector<uint8_t> fileBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::vector<uint8_t>(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// Sets and unsets environment variables for one test and puts every one back afterwards.
class ScopedEnvironment {
 public:
  explicit ScopedEnvironment(std::vector<std::string> names) {
    for (std::string& name : names) {
      const char* value = std::getenv(name.c_str());
      saved_.emplace_back(std::move(name),
                          value != nullptr ? std::optional<std::string>(value) : std::nullopt);
    }
  }
  ~ScopedEnvironment() {
    for (const auto& [name, value] : saved_) {
      set(name, value);
    }
  }
  ScopedEnvironment(const ScopedEnvironment&) = delete;
  ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

  static void set(const std::string& name, const std::optional<std::string>& value) {
    if (value) {
      setenv(name.c_str(), value->c_str(), 1);
    } else {
      unsetenv(name.c_str());
    }
  }

 private:
  std::vector<std::pair<std::string, std::optional<std::string>>> saved_;
};

// A fresh folder under the system's temporary folder, removed with everything in it.
class TemporaryFolder {
 public:
  TemporaryFolder() {
    std::string pattern = (fs::temp_directory_path() / "platform_test_XXXXXX").string();
    if (mkdtemp(pattern.data()) != nullptr) {
      path_ = pattern;
    }
  }
  ~TemporaryFolder() {
    std::error_code error;
    fs::remove_all(path_, error);
  }
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  const fs::path& path() const { return path_; }

 private:
  fs::path path_;
};

// ---------------------------------------------------------------------------------------------
// Locale names and the environment.

TEST(LanguageIdForLocale, MapsLocaleNamesToWindowsLanguageIds) {
  const std::vector<std::pair<std::string, uint16_t>> cases = {
      {"de_DE", 0x0407},
      {"de_CH", 0x0807},
      {"de_AT", 0x0C07},
      {"de_AT.UTF-8", 0x0C07},
      {"de_LU", 0x1007},
      {"de_LI", 0x1407},
      {"de", 0x0407},
      {"de_XX", 0x0407},
      {"fr_FR", 0x040C},
      {"fr_BE", 0x080C},
      {"fr_CA.UTF-8", 0x0C0C},
      {"fr_CH", 0x100C},
      {"fr_XX", 0x040C},
      {"en_US.UTF-8", 0x0409},
      {"en_GB@euro", 0x0809},
      {"en_AU", 0x0C09},
      {"en_CA", 0x1009},
      {"en_IN", 0x4009},
      {"es_ES", 0x0C0A},
      {"es", 0x0C0A},
      {"es_MX", 0x080A},
      {"es_419", 0x580A},
      {"it_IT", 0x0410},
      {"it_CH", 0x0810},
      {"pt_BR", 0x0416},
      {"pt_PT", 0x0816},
      {"nl_NL", 0x0413},
      {"nl_BE", 0x0813},
      {"ja_JP.eucJP", 0x0411},
      {"ko_KR", 0x0412},
      {"zh_CN.GB18030", 0x0804},
      {"zh_TW.Big5", 0x0404},
      {"zh_HK", 0x0C04},
      {"zh_SG", 0x1004},
      {"zh_MO", 0x1404},
      {"zh", 0x0404},
      {"ru_RU.KOI8-R", 0x0419},
      {"pl_PL", 0x0415},
      {"sv_SE", 0x041D},
      {"sv_FI", 0x081D},
      {"fi_FI", 0x040B},
      {"da_DK", 0x0406},
      {"nb_NO", 0x0414},
      {"no_NO", 0x0414},
      {"nn_NO", 0x0814},
      {"cs_CZ", 0x0405},
      {"hu_HU", 0x040E},
      {"tr_TR", 0x041F},
      {"el_GR", 0x0408},
      {"he_IL", 0x040D},
      {"iw_IL", 0x040D},
      {"ar_SA", 0x0401},
      {"ar_EG", 0x0C01},
      {"th_TH", 0x041E},
      {"uk_UA", 0x0422},
      {"be_BY", 0x0423},
      {"rm_CH", 0x0417},
      {"ca_ES@valencia", 0x0803},
      {"sr_RS", 0x281A},
      {"sr_RS@latin", 0x241A},
      {"sr-Latn-RS", 0x241A},
      {"uz_UZ@cyrillic", 0x0843},
      {"de-AT", 0x0C07},
      {"DE_at", 0x0C07},
      {"xx_YY", 0x0409},
      {"", 0x0409},
      {"C", 0x0409},
      {"POSIX", 0x0409},
      {"C.UTF-8", 0x0409},
  };
  for (const auto& [locale, expected] : cases) {
    EXPECT_EQ(platform::languageIdForLocale(locale), expected) << "locale \"" << locale << "\"";
  }
}

TEST(UserLanguageIdFromEnvironment, TakesLcAllThenLcMessagesThenLang) {
  ScopedEnvironment environment({"LC_ALL", "LC_MESSAGES", "LANG"});
  struct Case {
    std::optional<std::string> lcAll;
    std::optional<std::string> lcMessages;
    std::optional<std::string> lang;
    uint16_t expected;
  };
  const std::vector<Case> cases = {
      {std::nullopt, std::nullopt, std::nullopt, 0x0409},
      {std::nullopt, std::nullopt, "de_AT.UTF-8", 0x0C07},
      {std::nullopt, "fr_CA", "de_AT.UTF-8", 0x0C0C},
      {"ja_JP.UTF-8", "fr_CA", "de_AT.UTF-8", 0x0411},
      {"", "fr_CA", "de_AT.UTF-8", 0x0C0C},
      {"", "", "de_AT.UTF-8", 0x0C07},
      {"", "", "", 0x0409},
      {"zh_HK", std::nullopt, std::nullopt, 0x0C04},
  };
  for (const Case& c : cases) {
    ScopedEnvironment::set("LC_ALL", c.lcAll);
    ScopedEnvironment::set("LC_MESSAGES", c.lcMessages);
    ScopedEnvironment::set("LANG", c.lang);
    EXPECT_EQ(platform::userLanguageIdFromEnvironment(), c.expected)
        << "LC_ALL=" << c.lcAll.value_or("(unset)")
        << " LC_MESSAGES=" << c.lcMessages.value_or("(unset)")
        << " LANG=" << c.lang.value_or("(unset)");
  }
}

TEST(UserLanguageId, FollowsTheEnvironmentOnEveryCall) {
  ScopedEnvironment environment({"LC_ALL", "LC_MESSAGES", "LANG"});
  const auto services = platform::systemServices();
  unsetenv("LC_ALL");
  unsetenv("LC_MESSAGES");
  setenv("LANG", "pt_BR.UTF-8", 1);
  EXPECT_EQ(services->userLanguageId(), 0x0416);
  setenv("LC_ALL", "ko_KR.UTF-8", 1);
  EXPECT_EQ(services->userLanguageId(), 0x0412);
}

// ---------------------------------------------------------------------------------------------
// The user's font folders.

TEST(UserFontFolders, FollowXdgDataHomeAndHome) {
  ScopedEnvironment environment({"HOME", "XDG_DATA_HOME"});
  struct Case {
    std::optional<std::string> home;
    std::optional<std::string> dataHome;
    std::vector<std::string> expected;
  };
  const std::vector<Case> cases = {
      {"/home/ada", std::nullopt, {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
      {"/home/ada/", "", {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
      {"/home/ada", "/data/ada", {"/data/ada/fonts/", "/home/ada/.fonts/"}},
      {"/home/ada", "relative/data", {"/home/ada/.local/share/fonts/", "/home/ada/.fonts/"}},
      {std::nullopt, "/data/ada/", {"/data/ada/fonts/"}},
      {"", std::nullopt, {}},
  };
  for (const Case& c : cases) {
    ScopedEnvironment::set("HOME", c.home);
    ScopedEnvironment::set("XDG_DATA_HOME", c.dataHome);
    EXPECT_EQ(platform::userFontFolders(), c.expected)
        << "HOME=" << c.home.value_or("(unset)")
        << " XDG_DATA_HOME=" << c.dataHome.value_or("(unset)");
  }
}

TEST(FontHiveOfFile, IsUserOnlyInsideAUserFontFolder) {
  const std::vector<std::string> userFolders = {"/home/ada/.local/share/fonts/",
                                                "/home/ada/.fonts/"};
  const std::vector<std::pair<std::string, FontHive>> cases = {
      {"/home/ada/.local/share/fonts/a.ttf", FontHive::kUser},
      {"/home/ada/.local/share/fonts/sub/dir/a.otf", FontHive::kUser},
      {"/home/ada/.fonts/a.ttf", FontHive::kUser},
      {"/home/ada//.fonts/./a.ttf", FontHive::kUser},
      {"/home/ada/.fontsextra/a.ttf", FontHive::kMachine},
      {"/home/ada/.fonts/../a.ttf", FontHive::kMachine},
      {"/home/ada/a.ttf", FontHive::kMachine},
      {"/usr/share/fonts/truetype/a.ttf", FontHive::kMachine},
  };
  for (const auto& [file, expected] : cases) {
    EXPECT_EQ(platform::fontHiveOfFile(file, userFolders), expected) << file;
  }
  EXPECT_EQ(platform::fontHiveOfFile("/home/ada/.fonts/a.ttf", {}), FontHive::kMachine);
}

TEST(InstalledFontName, NamesTrueTypeAndOpenTypeOutlinesOnly) {
  const struct {
    std::u16string family;
    std::u16string style;
    std::string format;
    bool outline;
    std::optional<std::u16string> expected;
  } cases[] = {
      {u"DejaVu Sans", u"Book", "TrueType", true, u"DejaVu Sans Book (TrueType)"},
      {u"Cantarell", u"Bold", "CFF", true, u"Cantarell Bold (OpenType)"},
      {u"Plain", u"", "TrueType", true, u"Plain (TrueType)"},
      {u"Emoji", u"Regular", "TrueType", false, std::nullopt},
      {u"Pixel", u"Regular", "BDF", false, std::nullopt},
      {u"Type One", u"Regular", "Type 1", true, std::nullopt},
      {u"Nothing", u"Regular", "", true, std::nullopt},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(platform::installedFontName(c.family, c.style, c.format, c.outline), c.expected)
        << narrow(c.family) << " / " << c.format;
  }
}

// ---------------------------------------------------------------------------------------------
// The fonts installed on this machine.

std::string resolved(const std::u16string& folder, const InstalledFont& font) {
  const std::string file = narrow(font.file);
  return !file.empty() && file[0] == '/' ? file : narrow(folder) + file;
}

std::vector<InstalledFont> entriesFor(const std::vector<InstalledFont>& fonts,
                                      const std::u16string& folder, const std::string& path) {
  std::vector<InstalledFont> found;
  for (const InstalledFont& font : fonts) {
    if (resolved(folder, font) == path) {
      found.push_back(font);
    }
  }
  return found;
}

TEST(SystemFonts, FontsFolderEndsWithSlashAndExists) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  const std::optional<std::u16string> folder = platform::systemServices()->fontsFolder();
  ASSERT_TRUE(folder.has_value());
  ASSERT_FALSE(folder->empty());
  EXPECT_EQ(folder->back(), u'/');
  EXPECT_TRUE(fs::is_directory(narrow(*folder))) << narrow(*folder);
  // The installed fonts live in it, so it is not a user folder nor an empty system folder.
  EXPECT_EQ(kDejaVuSans.rfind(narrow(*folder), 0), 0u) << narrow(*folder);
}

TEST(SystemFonts, MachineHiveListsDejaVuSansRelativeToTheFontsFolder) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  const auto services = platform::systemServices();
  const std::u16string folder = services->fontsFolder().value_or(u"");
  const auto machine = services->installedFonts(FontHive::kMachine);
  ASSERT_TRUE(machine.has_value());
  const std::vector<InstalledFont> found = entriesFor(*machine, folder, kDejaVuSans);
  ASSERT_EQ(found.size(), 1u);
  EXPECT_EQ(narrow(found[0].name), "DejaVu Sans Book (TrueType)");
  EXPECT_NE(found[0].file.front(), u'/') << narrow(found[0].file);
}

TEST(SystemFonts, EveryMachineEntryIsAnExistingTrueTypeOrOpenTypeFile) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  const auto services = platform::systemServices();
  const std::u16string folder = services->fontsFolder().value_or(u"");
  const auto machine = services->installedFonts(FontHive::kMachine);
  ASSERT_TRUE(machine.has_value());
  EXPECT_FALSE(machine->empty());
  std::set<std::string> files;
  for (const InstalledFont& font : *machine) {
    const std::string path = resolved(folder, font);
    EXPECT_TRUE(fs::is_regular_file(path)) << path;
    EXPECT_TRUE(files.insert(path).second) << "listed twice: " << path;
    const std::string name = narrow(font.name);
    const bool typed = name.size() > 11 && (name.substr(name.size() - 11) == " (TrueType)" ||
                                            name.substr(name.size() - 11) == " (OpenType)");
    EXPECT_TRUE(typed) << name;
  }
}

TEST(SystemFonts, CffFontsAreListedAsOpenType) {
  REQUIRE_FONT_FILE(kCantarell);  // CFF outlines
  const auto services = platform::systemServices();
  const std::u16string folder = services->fontsFolder().value_or(u"");
  const auto machine = services->installedFonts(FontHive::kMachine);
  ASSERT_TRUE(machine.has_value());
  int checked = 0;
  for (const InstalledFont& font : *machine) {
    const std::string path = resolved(folder, font);
    const std::vector<uint8_t> bytes = fileBytes(path);
    // An sfnt with CFF outlines starts with "OTTO".
    if (bytes.size() >= 4 && std::equal(bytes.begin(), bytes.begin() + 4, "OTTO")) {
      EXPECT_EQ(narrow(font.name).substr(narrow(font.name).size() - 11), " (OpenType)") << path;
      ++checked;
    }
  }
  EXPECT_GE(checked, 1);
}

TEST(SystemFonts, CollectionsAndVariableFontsAppearOnceUnderTheirFirstFace) {
  REQUIRE_FONT_FILE(kWqyMicroHei);
  REQUIRE_FONT_FILE(kInterVariable);
  const auto services = platform::systemServices();
  const std::u16string folder = services->fontsFolder().value_or(u"");
  const auto machine = services->installedFonts(FontHive::kMachine);
  ASSERT_TRUE(machine.has_value());
  const struct {
    std::string path;
    std::string name;
  } cases[] = {
      {kWqyMicroHei, "WenQuanYi Micro Hei Regular (TrueType)"},
      {kInterVariable, "Inter Regular (TrueType)"},
  };
  for (const auto& c : cases) {
    const std::vector<InstalledFont> found = entriesFor(*machine, folder, c.path);
    ASSERT_EQ(found.size(), 1u) << c.path;
    EXPECT_EQ(narrow(found[0].name), c.name);
  }
}

TEST(SystemFonts, FamiliesListDejaVuSansOnceAsTrueType) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  const std::vector<EnumeratedFace> families = platform::systemServices()->enumerateFamilies();
  int count = 0;
  std::set<std::u16string> names;
  for (const EnumeratedFace& face : families) {
    EXPECT_TRUE(names.insert(face.faceName).second) << "twice: " << narrow(face.faceName);
    if (face.faceName == u"DejaVu Sans") {
      ++count;
      // The family's most regular face stands for it.
      EXPECT_EQ(face.style, u"Book");
      EXPECT_EQ(face.fullName, u"DejaVu Sans");
      EXPECT_EQ(face.fontType, platform::kTrueTypeFontType);
    }
  }
  EXPECT_EQ(count, 1);
}

TEST(SystemFonts, FacesOfAFamilyIncludeEachStyleOnce) {
  REQUIRE_FONT_FILE(kDejaVuSansBold);
  REQUIRE_FONT_FILE(kDejaVuSansCondensedBold);
  REQUIRE_FONT_FILE(kInterVariable);
  const auto services = platform::systemServices();
  const struct {
    std::u16string family;
    EnumeratedFace expected;
  } cases[] = {
      {u"DejaVu Sans", {u"DejaVu Sans", u"Bold", u"DejaVu Sans Bold", platform::kTrueTypeFontType}},
      {u"DejaVu Sans",
       {u"DejaVu Sans", u"Condensed Bold", u"DejaVu Sans Condensed Bold",
        platform::kTrueTypeFontType}},
      // The legacy family name goes with the legacy style.
      {u"DejaVu Sans Condensed",
       {u"DejaVu Sans Condensed", u"Bold", u"DejaVu Sans Condensed Bold",
        platform::kTrueTypeFontType}},
      // A named instance of a variable font is a face with its style in its full name.
      {u"Inter", {u"Inter", u"Bold", u"Inter Bold", platform::kTrueTypeFontType}},
      {u"Inter",
       {u"Inter", u"Semi Bold Italic", u"Inter Semi Bold Italic", platform::kTrueTypeFontType}},
  };
  for (const auto& c : cases) {
    const std::vector<EnumeratedFace> faces = services->enumerateFaces(c.family);
    std::set<std::tuple<std::u16string, std::u16string, std::u16string>> seen;
    int matches = 0;
    for (const EnumeratedFace& face : faces) {
      EXPECT_EQ(face.faceName, c.family);
      EXPECT_TRUE(seen.emplace(face.faceName, face.style, face.fullName).second)
          << "repeated: " << narrow(face.style) << " / " << narrow(face.fullName);
      if (face.style == c.expected.style && face.fullName == c.expected.fullName &&
          face.fontType == c.expected.fontType) {
        ++matches;
      }
    }
    EXPECT_EQ(matches, 1) << narrow(c.family) << ": " << narrow(c.expected.style) << " / "
                          << narrow(c.expected.fullName);
  }
}

TEST(SystemFonts, UnknownFamilyHasNoFacesAndNoData) {
  const auto services = platform::systemServices();
  EXPECT_TRUE(services->enumerateFaces(u"No Such Family 1f3a").empty());
  EXPECT_TRUE(services->fontData(u"No Such Family 1f3a", false, false).empty());
  EXPECT_TRUE(services->fontData(u"No Such Family 1f3a", true, true).empty());
  // fontconfig would substitute a generic family for this one; the services must not.
  EXPECT_TRUE(services->fontData(u"sans-serif", false, false).empty());
}

TEST(SystemFonts, FontDataIsTheWholeFileOfTheBestMatchingFace) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  REQUIRE_FONT_FILE(kDejaVuSansBold);
  REQUIRE_FONT_FILE(kDejaVuSansOblique);
  REQUIRE_FONT_FILE(kDejaVuSansBoldOblique);
  const auto services = platform::systemServices();
  const struct {
    bool bold;
    bool italic;
    std::string file;
  } cases[] = {
      {false, false, kDejaVuSans},
      {true, false, kDejaVuSansBold},
      {false, true, kDejaVuSansOblique},
      {true, true, kDejaVuSansBoldOblique},
  };
  for (const auto& c : cases) {
    const std::vector<uint8_t> data = services->fontData(u"DejaVu Sans", c.bold, c.italic);
    ASSERT_GE(data.size(), 4u);
    EXPECT_EQ(std::vector<uint8_t>(data.begin(), data.begin() + 4),
              (std::vector<uint8_t>{0x00, 0x01, 0x00, 0x00}));
    EXPECT_TRUE(data == fileBytes(c.file))
        << "bold " << c.bold << " italic " << c.italic << ": not the bytes of " << c.file;
  }
}

// ---------------------------------------------------------------------------------------------
// Fonts that a test configuration or the user's own folders hold.

// A one-glyph bitmap font in BDF.
const char* const kBitmapFont = R"(STARTFONT 2.1
FONT -test-Pixel Test-Medium-R-Normal--8-80-75-75-C-80-ISO10646-1
SIZE 8 75 75
FONTBOUNDINGBOX 8 8 0 0
STARTPROPERTIES 9
FOUNDRY "test"
FAMILY_NAME "Pixel Test"
WEIGHT_NAME "Medium"
SLANT "R"
PIXEL_SIZE 8
FONT_ASCENT 8
FONT_DESCENT 0
CHARSET_REGISTRY "ISO10646"
CHARSET_ENCODING "1"
ENDPROPERTIES
CHARS 1
STARTCHAR A
ENCODING 65
SWIDTH 1000 0
DWIDTH 8 0
BBX 8 8 0 0
BITMAP
18
24
42
42
7E
42
42
00
ENDCHAR
ENDFONT
)";

void writeText(const fs::path& path, const std::string& text) {
  fs::create_directories(path.parent_path());
  std::ofstream(path) << text;
}

void copyInto(const std::string& from, const fs::path& to) {
  fs::create_directories(to.parent_path());
  fs::copy_file(from, to, fs::copy_options::overwrite_existing);
}

// A fontconfig configuration of its own: one machine folder and the user's usual folders,
// with a private cache, in a temporary HOME. (The system configuration's XDG font folder also
// brings in every folder of XDG_DATA_DIRS, machine-wide ones included, so the user's folder is
// named here by its path.)
class ConfiguredFonts : public ::testing::Test {
 protected:
  void SetUp() override {
    ASSERT_FALSE(folder_.path().empty());
    home_ = folder_.path() / "home";
    machine_ = folder_.path() / "machine";
    fs::create_directories(home_);
    fs::create_directories(machine_);
    writeText(folder_.path() / "fonts.conf",
              "<?xml version=\"1.0\"?>\n<!DOCTYPE fontconfig SYSTEM \"urn:fontconfig:fonts.dtd\">\n"
              "<fontconfig>\n  <dir>" +
                  machine_.string() +
                  "</dir>\n  <dir>~/.local/share/fonts</dir>\n  <dir>~/.fonts</dir>\n"
                  "  <cachedir>" +
                  (folder_.path() / "cache").string() + "</cachedir>\n</fontconfig>\n");
    ScopedEnvironment::set("FONTCONFIG_FILE", (folder_.path() / "fonts.conf").string());
    ScopedEnvironment::set("FONTCONFIG_PATH", std::nullopt);
    ScopedEnvironment::set("FONTCONFIG_SYSROOT", std::nullopt);
    ScopedEnvironment::set("HOME", home_.string());
    ScopedEnvironment::set("XDG_DATA_HOME", std::nullopt);
    ScopedEnvironment::set("XDG_CACHE_HOME", (folder_.path() / "xdg-cache").string());
  }

  ScopedEnvironment environment_{{"FONTCONFIG_FILE", "FONTCONFIG_PATH", "FONTCONFIG_SYSROOT",
                                  "HOME", "XDG_DATA_HOME", "XDG_CACHE_HOME"}};
  TemporaryFolder folder_;
  fs::path home_;
  fs::path machine_;
};

TEST_F(ConfiguredFonts, SplitsFilesIntoMachineAndUserHives) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  REQUIRE_FONT_FILE(kDejaVuSansBold);
  REQUIRE_FONT_FILE(kDejaVuSerif);
  copyInto(kDejaVuSans, machine_ / "sub" / "Machine.ttf");
  writeText(machine_ / "pixel.bdf", kBitmapFont);
  const fs::path dataFile = home_ / ".local/share/fonts/Data.ttf";
  const fs::path legacyFile = home_ / ".fonts/Legacy.ttf";
  copyInto(kDejaVuSansBold, dataFile);
  copyInto(kDejaVuSerif, legacyFile);

  const auto services = platform::createSystemServices();
  EXPECT_EQ(services->fontsFolder(), wide(machine_.string() + "/"));
  const auto machine = services->installedFonts(FontHive::kMachine);
  const auto user = services->installedFonts(FontHive::kUser);
  ASSERT_TRUE(machine.has_value());
  ASSERT_TRUE(user.has_value());
  // The bitmap font is no installed font; the machine file is named relative to the folder.
  ASSERT_EQ(machine->size(), 1u);
  EXPECT_EQ((*machine)[0].name, u"DejaVu Sans Book (TrueType)");
  EXPECT_EQ((*machine)[0].file, u"sub/Machine.ttf");
  // User files are named by their absolute paths, in path order.
  ASSERT_EQ(user->size(), 2u);
  EXPECT_EQ((*user)[0].name, u"DejaVu Serif Book (TrueType)");
  EXPECT_EQ((*user)[0].file, wide(legacyFile.string()));
  EXPECT_EQ((*user)[1].name, u"DejaVu Sans Bold (TrueType)");
  EXPECT_EQ((*user)[1].file, wide(dataFile.string()));
}

TEST_F(ConfiguredFonts, BitmapFontsAreRasterFaces) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  copyInto(kDejaVuSans, machine_ / "Machine.ttf");
  writeText(machine_ / "pixel.bdf", kBitmapFont);

  const auto services = platform::createSystemServices();
  const std::vector<EnumeratedFace> families = services->enumerateFamilies();
  ASSERT_EQ(families.size(), 2u);
  EXPECT_EQ(families[0].faceName, u"DejaVu Sans");
  EXPECT_EQ(families[0].fontType, platform::kTrueTypeFontType);
  EXPECT_EQ(families[1].faceName, u"Pixel Test");
  EXPECT_EQ(families[1].fontType, platform::kRasterFontType);
  const std::vector<EnumeratedFace> faces = services->enumerateFaces(u"Pixel Test");
  ASSERT_EQ(faces.size(), 1u);
  EXPECT_EQ(faces[0].fontType, platform::kRasterFontType);
  EXPECT_EQ(services->installedFonts(FontHive::kMachine)->size(), 1u);
}

TEST_F(ConfiguredFonts, EmptyHivesAreEmptyLists) {
  const auto services = platform::createSystemServices();
  const auto machine = services->installedFonts(FontHive::kMachine);
  const auto user = services->installedFonts(FontHive::kUser);
  ASSERT_TRUE(machine.has_value());
  ASSERT_TRUE(user.has_value());
  EXPECT_TRUE(machine->empty());
  EXPECT_TRUE(user->empty());
  EXPECT_TRUE(services->enumerateFamilies().empty());
}

// The system's own configuration in a temporary HOME: a font in the user's XDG folder is a user
// font, named by its absolute path, while the installed fonts stay in the machine hive.
TEST(DefaultConfiguration, UserFontLandsInTheUserHive) {
  REQUIRE_FONT_FILE(kDejaVuSans);
  REQUIRE_FONT_FILE(kDejaVuSerif);
  ScopedEnvironment environment({"HOME", "XDG_DATA_HOME", "XDG_CACHE_HOME"});
  TemporaryFolder folder;
  ASSERT_FALSE(folder.path().empty());
  const fs::path userFile = folder.path() / "data/fonts/Copied Serif.ttf";
  copyInto(kDejaVuSerif, userFile);
  setenv("HOME", (folder.path() / "home").c_str(), 1);
  setenv("XDG_DATA_HOME", (folder.path() / "data").c_str(), 1);
  setenv("XDG_CACHE_HOME", (folder.path() / "cache").c_str(), 1);

  const auto services = platform::createSystemServices();
  const std::u16string fontsFolder = services->fontsFolder().value_or(u"");
  const auto user = services->installedFonts(FontHive::kUser);
  const auto machine = services->installedFonts(FontHive::kMachine);
  ASSERT_TRUE(user.has_value());
  ASSERT_TRUE(machine.has_value());
  ASSERT_EQ(user->size(), 1u);
  EXPECT_EQ((*user)[0].name, u"DejaVu Serif Book (TrueType)");
  EXPECT_EQ((*user)[0].file, wide(userFile.string()));
  EXPECT_TRUE(entriesFor(*machine, fontsFolder, userFile.string()).empty());
  EXPECT_EQ(entriesFor(*machine, fontsFolder, kDejaVuSans).size(), 1u);
}

// ---------------------------------------------------------------------------------------------
// Module folder, GUIDs, white space.

TEST(ModuleFolder, IsTheFolderOfTheExecutableHoldingTheCode) {
  const std::u16string folder = platform::systemServices()->moduleFolder();
  ASSERT_FALSE(folder.empty());
  EXPECT_EQ(folder.back(), u'/');
  const fs::path executable = fs::read_symlink("/proc/self/exe");
  EXPECT_EQ(narrow(folder), executable.parent_path().string() + "/");
}

TEST(NewGuid, GivesDistinctVersion4Guids) {
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

TEST(GuidText, WritesLowerCaseHexInFiveGroups) {
  const std::array<uint8_t, 16> guid = {0x00, 0x11, 0x22, 0x33, 0x44, 0x55, 0x46, 0x77,
                                        0x88, 0x99, 0xAA, 0xBB, 0xCC, 0xDD, 0xEE, 0xFF};
  EXPECT_EQ(platform::guidText(guid), "00112233-4455-4677-8899-aabbccddeeff");
  const std::string text = platform::guidText(platform::systemServices()->newGuid());
  ASSERT_EQ(text.size(), 36u);
  for (size_t i = 0; i < text.size(); ++i) {
    if (i == 8 || i == 13 || i == 18 || i == 23) {
      EXPECT_EQ(text[i], '-') << text;
    } else {
      EXPECT_TRUE(std::strchr("0123456789abcdef", text[i]) != nullptr) << text;
    }
  }
  EXPECT_EQ(text[14], '4') << text;
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
      ADD_FAILURE() << std::hex << "U+" << static_cast<uint32_t>(c) << ": glibc " << glibc
                    << ", services " << !glibc;
    }
  }
  std::setlocale(LC_CTYPE, previous.c_str());
  EXPECT_EQ(mismatches, 0);
  // The set is not empty nor everything.
  EXPECT_TRUE(services->isWideSpace(U' '));
  EXPECT_TRUE(services->isWideSpace(0x3000));
  EXPECT_FALSE(services->isWideSpace(0x00A0));
  EXPECT_FALSE(services->isWideSpace(U'a'));
}

TEST(SystemServices, IsCreatedOnceAndShared) {
  EXPECT_EQ(platform::systemServices().get(), platform::systemServices().get());
  EXPECT_NE(platform::createSystemServices().get(), platform::systemServices().get());
}

}  // namespace
