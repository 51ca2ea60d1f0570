// The font catalogue on a fake system (installed-font lists, enumerated faces and font files the
// tests write) and on this machine.
#include "fonts/font_cache.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "ci_or_skip.h"
#include "listed_outline_faces.h"
#include "platform/utf16_text.h"
#include "sfnt_writer.h"

namespace waveform_test {
namespace {

using platform::EnumeratedFace;
using platform::FontHive;
using platform::InstalledFont;
using vesk::project::FontCache;
using vesk::project::FontRecord;

using platform::toUtf16;
using platform::toUtf8;

// A system whose fonts the test chooses.
class FakeSystem : public platform::SystemServices {
 public:
  std::optional<std::u16string> folder;
  std::map<FontHive, std::vector<InstalledFont>> lists;
  std::vector<EnumeratedFace> faces;
  mutable std::vector<std::u16string> askedFaceNames;  // by the second enumeration pass

  std::optional<std::u16string> fontsFolder() const override { return folder; }
  std::optional<std::vector<InstalledFont>> installedFonts(FontHive hive) const override {
    const auto found = lists.find(hive);
    return found != lists.end() ? found->second : std::vector<InstalledFont>{};
  }
  std::vector<EnumeratedFace> enumerateFamilies() const override {
    std::vector<EnumeratedFace> families;
    std::set<std::u16string> seen;
    for (const EnumeratedFace& face : faces) {
      if (seen.insert(face.faceName).second) {
        families.push_back(face);
      }
    }
    return families;
  }
  std::vector<EnumeratedFace> enumerateFaces(const std::u16string& faceName) const override {
    askedFaceNames.push_back(faceName);
    std::vector<EnumeratedFace> found;
    for (const EnumeratedFace& face : faces) {
      if (face.faceName.substr(0, 31) == faceName) {
        found.push_back(face);
      }
    }
    return found;
  }
  std::vector<uint8_t> fontData(const std::u16string&, bool, bool) const override { return {}; }
  uint16_t userLanguageId() const override { return 0x0409; }
  std::u16string moduleFolder() const override { return u"/"; }
  std::array<uint8_t, 16> newGuid() const override { return {}; }
  bool isWideSpace(char32_t) const override { return false; }
};

// A fake system with its fonts folder in a fresh temporary folder.
class FontCacheOnFakeSystem : public testing::Test {
 protected:
  void SetUp() override {
    root_ = std::filesystem::path(testing::TempDir()) /
            ("font_cache_" +
             std::string(testing::UnitTest::GetInstance()->current_test_info()->name()));
    std::filesystem::remove_all(root_);
    std::filesystem::create_directories(root_ / "fonts");
    system_ = std::make_shared<FakeSystem>();
    system_->folder = toUtf16((root_ / "fonts").string() + "/");
  }
  void TearDown() override { std::filesystem::remove_all(root_); }

  // Writes a font with these Windows English names under the root (a path relative to it).
  std::u16string writeFont(const std::string& relativePath, const std::u16string& family,
                           const std::u16string& style, const std::u16string& fullName,
                           const std::u16string& postScriptName) {
    return writeBytes(relativePath, namedFont(family, style, fullName, postScriptName).build());
  }
  std::u16string writeBytes(const std::string& relativePath, const std::vector<uint8_t>& bytes) {
    const std::filesystem::path path = root_ / relativePath;
    std::filesystem::create_directories(path.parent_path());
    EXPECT_TRUE(writeFile(path.string(), bytes));
    return toUtf16(path.string());
  }
  void install(FontHive hive, const std::u16string& name, const std::u16string& file) {
    system_->lists[hive].push_back({name, file});
  }
  void enumerate(const std::u16string& family, const std::u16string& style,
                 const std::u16string& fullName, int32_t type = platform::kTrueTypeFontType) {
    system_->faces.push_back({family, style, fullName, type});
  }
  // A family of faces, each in its own file in the fonts folder, installed and enumerated; the
  // OS/2 fields of a style as given, else the defaults (weight 400, normal width, upright).
  void addFamily(const std::u16string& family, const std::vector<std::u16string>& styles,
                 const std::map<std::u16string, Os2Fields>& os2 = {}) {
    for (const std::u16string& style : styles) {
      const std::u16string postScript = family + u"-" + style;
      const std::u16string full = family + u" " + style;
      const std::string file = toUtf8(postScript) + ".ttf";
      const auto fields = os2.find(style);
      writeBytes("fonts/" + file, namedFont(family, style, full, postScript)
                                      .setOs2(fields != os2.end() ? fields->second : Os2Fields{})
                                      .build());
      install(FontHive::kMachine, full + u" (TrueType)", toUtf16(file));
      enumerate(family, style, full);
    }
  }
  std::u16string fontsFolder() const { return *system_->folder; }

  std::filesystem::path root_;
  std::shared_ptr<FakeSystem> system_;
};

TEST(FontCacheNames, DisplayNamesBecomeLowerCaseKeysWithoutTheFormat) {
  using vesk::project::displayNameKey;
  EXPECT_EQ(displayNameKey(u"Foo Bold (TrueType)"), u"foo bold");
  EXPECT_EQ(displayNameKey(u"Bar Sans (OpenType)"), u"bar sans");
  EXPECT_EQ(displayNameKey(u"A (TrueType) & B (TrueType)"), u"a & b");
  EXPECT_EQ(displayNameKey(u"Plain"), u"plain");
}

TEST(FontCacheNames, FileNamesResolveAgainstTheFontsFolder) {
  using vesk::project::resolveFontFile;
  const std::u16string folder = u"/fonts/";
  const std::pair<std::u16string, std::u16string> cases[] = {
      {u"arial.ttf", u"/fonts/arial.ttf"},
      {u"c:\\fonts\\x.ttf", u"/fonts/c:\\fonts\\x.ttf"},  // a lower-case drive is relative
      {u"C:\\Fonts\\x.ttf", u"C:\\Fonts\\x.ttf"},
      {u"D:/x.ttf", u"/fonts/D:/x.ttf"},
      {u"C:\\", u"/fonts/C:\\"},  // too short to be a drive path
      {u"/usr/share/fonts/x.ttf", u"/usr/share/fonts/x.ttf"},
      {u"sub/dir/y.otf", u"/fonts/sub/dir/y.otf"},
  };
  for (const auto& [file, path] : cases) {
    EXPECT_EQ(resolveFontFile(folder, file), path) << toUtf8(file);
  }
}

TEST_F(FontCacheOnFakeSystem, FileThatCannotBeReadIsKnownByItsDisplayName) {
  writeBytes("fonts/foo.ttf", {'n', 'o', 't', ' ', 'a', ' ', 'f', 'o', 'n', 't'});
  install(FontHive::kMachine, u"Foo Bold (TrueType)", u"foo.ttf");
  enumerate(u"Foo", u"Bold", u"foo bold");
  FontCache cache(system_);
  const FontRecord r = cache.findFont(u"foo bold", u"", u"");
  // Nothing could be read from the file: the enumeration's names stay.
  EXPECT_EQ(std::tie(r.filePath, r.familyName, r.styleName, r.postScriptName, r.gdiFullName),
            std::make_tuple(fontsFolder() + u"foo.ttf", u"Foo", u"Bold", u"foo bold", u"foo bold"));
}

TEST_F(FontCacheOnFakeSystem, NamesComeFromTheFileAndPathsResolve) {
  writeFont("fonts/rel.ttf", u"Rel Sans", u"Bold", u"Rel Sans Bold", u"RelSans-Bold");
  const std::u16string outside =
      writeFont("elsewhere/abs.ttf", u"Abs Serif", u"Regular", u"Abs Serif", u"AbsSerif");
  install(FontHive::kMachine, u"Rel Sans Bold (TrueType)", u"rel.ttf");
  install(FontHive::kMachine, u"Abs Serif (TrueType)", outside);
  // The enumeration knows the faces by other names; the files' names win.
  enumerate(u"RelSans", u"Bold", u"Rel Sans Bold");
  enumerate(u"AbsSerif", u"Normal", u"Abs Serif");
  enumerate(u"Unfiled", u"Regular", u"Unfiled Regular");
  FontCache cache(system_);

  const FontRecord rel = cache.findFont(u"RelSans-Bold", u"", u"");
  EXPECT_EQ(std::tie(rel.filePath, rel.familyName, rel.gdiFamilyName, rel.styleName, rel.fullName),
            std::make_tuple(fontsFolder() + u"rel.ttf", u"Rel Sans", u"RelSans", u"Bold",
                            u"Rel Sans Bold"));
  EXPECT_GT(rel.strikeoutSize, 0.0f);
  const FontRecord abs = cache.findFont(u"", u"", u"Abs Serif");
  EXPECT_EQ(std::tie(abs.filePath, abs.postScriptName, abs.styleName),
            std::make_tuple(outside, u"AbsSerif", u"Regular"));
  // A face no list names keeps the enumeration's names, no file and no metrics.
  const FontRecord unfiled = cache.findFont(u"Unfiled Regular", u"", u"");
  EXPECT_EQ(unfiled.postScriptName, u"Unfiled Regular");
  EXPECT_TRUE(unfiled.filePath.empty());
  EXPECT_EQ(unfiled.strikeoutSize, 0.0f);
  EXPECT_FALSE(unfiled.embeddable);
  EXPECT_EQ(cache.familyNames(), (std::set<std::u16string>{u"Abs Serif", u"Rel Sans", u"Unfiled"}));
}

TEST_F(FontCacheOnFakeSystem, NamedInstancesOfAVariableFontAreFacesOfTheirOwn) {
  SfntFont font = namedFont(u"Var Sans", u"Regular", u"Var Sans Regular", u"VarSans-Regular");
  font.addName(3, 1033, 257, u"Light")
      .addName(3, 1033, 258, u"Bold")
      .addName(3, 1033, 259, u"VarSans-BoldInstance")
      .setFvar({1, {{257, 0}, {258, 259}}, true});
  writeBytes("fonts/var.ttf", font.build());
  install(FontHive::kMachine, u"Var Sans (TrueType)", u"var.ttf");
  enumerate(u"Var Sans", u"Regular", u"Var Sans Regular");
  enumerate(u"Var Sans", u"Light", u"Var Sans Regular Light");
  enumerate(u"Var Sans", u"Bold", u"VarSans-BoldInstance");
  FontCache cache(system_);

  const FontRecord plain = cache.findFont(u"VarSans-Regular", u"", u"");
  EXPECT_EQ(std::tie(plain.instanceId, plain.styleName), std::make_tuple(0, u"Regular"));
  // An instance without a PostScript name of its own is known by its full name.
  const FontRecord light = cache.findFont(u"Var Sans Regular Light", u"", u"");
  EXPECT_EQ(std::tie(light.instanceId, light.styleName, light.fullName, light.postScriptName),
            std::make_tuple(257, u"Light", u"Var Sans Regular Light", u"Var Sans Regular Light"));
  const FontRecord bold = cache.findFont(u"VarSans-BoldInstance", u"", u"");
  EXPECT_EQ(std::tie(bold.instanceId, bold.styleName, bold.fullName, bold.filePath),
            std::make_tuple(258, u"Bold", u"Var Sans Regular Bold", fontsFolder() + u"var.ttf"));
  EXPECT_EQ(cache.records().size(), 3u);
  // The family names its plain regular face.
  EXPECT_EQ(cache.findFont(u"x", u"Var Sans", u"y").postScriptName, u"VarSans-Regular");
}

TEST_F(FontCacheOnFakeSystem, UserFontReplacesAMachineFontOfTheSameName) {
  writeFont("fonts/shared.ttf", u"Shared", u"Regular", u"Shared Regular", u"Shared-Regular");
  const std::u16string mine = writeFont("home/fonts/shared.ttf", u"Shared", u"Regular",
                                        u"Shared Regular", u"Shared-Regular");
  install(FontHive::kMachine, u"Shared Regular (TrueType)", u"shared.ttf");
  install(FontHive::kUser, u"Shared Regular (TrueType)", mine);
  enumerate(u"Shared", u"Regular", u"Shared Regular");
  FontCache cache(system_);
  EXPECT_EQ(cache.findFont(u"Shared-Regular", u"", u"").filePath, mine);
}

TEST_F(FontCacheOnFakeSystem, LookupsTryPostScriptThenFullNamesThenFamily) {
  addFamily(u"Fam", {u"Bold", u"Regular", u"Italic"});
  addFamily(u"Other", {u"Bold", u"Black"});  // no "Regular" face, equally regular: the first
  // No "Regular" face: the upright face of weight 400 and normal width, wherever it comes.
  Os2Fields bold, condensed, italic;
  bold.weightClass = 700;
  condensed.widthClass = 3;
  italic.fsSelection = 1;
  addFamily(u"Serif", {u"Bold", u"Condensed", u"Italic", u"Roman"},
            {{u"Bold", bold}, {u"Condensed", condensed}, {u"Italic", italic}});
  FontCache cache(system_);
  EXPECT_TRUE(cache.hasFont(u"", u"Other", u"nothing"));
  EXPECT_FALSE(cache.hasFont(u"nothing", u"No Such Family", u"nothing"));
  struct Case {
    std::u16string postScript, family, full, expected;
  };
  const Case cases[] = {
      {u"Fam-Bold", u"Fam", u"Fam Regular", u"Fam-Bold"},  // PostScript name first
      {u"Fam Bold", u"", u"", u"Fam-Bold"},                // a full name given as PostScript
      {u"", u"", u"Fam Bold", u"Fam-Bold"},                // the full name alone
      {u"x", u"", u"Fam Bold", u"Fam-Bold"},
      {u"x", u"Fam", u"y", u"Fam-Regular"},  // only the family matches
      {u"", u"Other", u"nothing else", u"Other-Black"},
      {u"", u"Serif", u"nothing at all", u"Serif-Roman"},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(cache.findFont(c.postScript, c.family, c.full).postScriptName, c.expected)
        << toUtf8(c.postScript) << " / " << toUtf8(c.family) << " / " << toUtf8(c.full);
  }
}

TEST_F(FontCacheOnFakeSystem, TheMemoLooksAtTheNamesNotTheFamily) {
  addFamily(u"Fam", {u"Regular"});
  addFamily(u"Other", {u"Bold"});
  FontCache cache(system_);
  EXPECT_EQ(cache.findFont(u"none", u"Fam", u"none").postScriptName, u"Fam-Regular");
  // The same two names with another family: the remembered record.
  EXPECT_EQ(cache.findFont(u"none", u"Other", u"none").postScriptName, u"Fam-Regular");
  EXPECT_EQ(cache.findFont(u"none", u"Other", u"none2").postScriptName, u"Other-Bold");
  // hasFont does not use the memo.
  EXPECT_TRUE(cache.hasFont(u"none", u"Other", u"none2"));
}

TEST_F(FontCacheOnFakeSystem, DefaultIsRegularArialThenCourierNewThenTheFirst) {
  addFamily(u"Aardvark", {u"Regular"});
  addFamily(u"Courier New", {u"Regular"});
  addFamily(u"Arial", {u"Bold", u"Regular", u"Black"});
  // Each round drops the family the round before chose.
  for (const std::u16string family : {u"Arial", u"Courier New", u"Aardvark"}) {
    FontCache cache(system_);
    EXPECT_EQ(cache.findFont(u"zzz", u"zzz", u"zzz").postScriptName, family + u"-Regular");
    EXPECT_FALSE(cache.hasFont(u"zzz", u"zzz", u"zzz"));
    while (!system_->faces.empty() && system_->faces.back().faceName == family) {
      system_->faces.pop_back();
    }
  }
}

TEST_F(FontCacheOnFakeSystem, RasterAndVerticalFacesAreNeverListed) {
  addFamily(u"Shown", {u"Regular"});
  enumerate(u"Bitmap", u"Regular", u"Bitmap Regular", platform::kRasterFontType);
  enumerate(u"@Shown", u"Regular", u"@Shown Regular");
  enumerate(u"Printer", u"Regular", u"Printer Regular", platform::kDeviceFontType);
  FontCache cache(system_);
  EXPECT_EQ(cache.familyNames(), (std::set<std::u16string>{u"Printer", u"Shown"}));
  EXPECT_FALSE(cache.hasFont(u"Bitmap Regular", u"Bitmap", u""));
  EXPECT_FALSE(cache.hasFont(u"@Shown Regular", u"@Shown", u""));
  EXPECT_EQ(cache.records().size(), 2u);
}

TEST_F(FontCacheOnFakeSystem, LongFamilyNamesAreEnumeratedByTheirFirst31Units) {
  const std::u16string family = u"A Family Name Longer Than Thirty-One Units";
  addFamily(family, {u"Regular"});
  FontCache cache(system_);
  EXPECT_EQ(cache.familyNames(), std::set<std::u16string>{family});
  EXPECT_EQ(cache.findFont(u"", family, u"x").styleName, u"Regular");
  EXPECT_EQ(system_->askedFaceNames, std::vector<std::u16string>{family.substr(0, 31)});
}

TEST_F(FontCacheOnFakeSystem, NothingInstalledGivesEmptyRecordsAndNoFontsFolderAnError) {
  FontCache cache(system_);
  EXPECT_TRUE(cache.familyNames().empty());
  EXPECT_FALSE(cache.hasFont(u"Arial", u"Arial", u"Arial"));
  EXPECT_EQ(cache.findFont(u"Arial", u"Arial", u"Arial").filePath, u"");
  system_->folder.reset();
  try {
    FontCache failing(system_);
    FAIL() << "expected an error";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ(error.what(), "Cannot get system fonts path");
  }
}

// This machine's catalogue through fontconfig: every DejaVu face by each of its names.
TEST(FontCacheOnThisMachine, EveryDejaVuFaceIsFoundByEachOfItsNames) {
  const std::filesystem::path folder = "/usr/share/fonts/truetype/dejavu";
  REQUIRE_FILE(folder);
  FontCache cache(platform::systemServices());
  const std::set<std::u16string> families = cache.familyNames();
  int faces = 0;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    const vesk::project::FontFileReader reader(toUtf16(entry.path().string()), 0x0409);
    for (int32_t face = 0; face < reader.faceCount(); ++face, ++faces) {
      const std::u16string postScript = reader.postScriptNameUtf16(face);
      const std::u16string full = reader.fullNameUtf16(face);
      const std::u16string family = reader.familyNameUtf16(face);
      const std::string what = entry.path().string();
      EXPECT_EQ(cache.findFont(postScript, u"", u"").filePath, toUtf16(entry.path().string()))
          << what;
      EXPECT_EQ(cache.findFont(u"", u"", full).postScriptName, postScript) << what;
      EXPECT_EQ(cache.findFont(u"x", family, u"y").familyName, family) << what;
      EXPECT_TRUE(cache.hasFont(postScript, u"", u"")) << what;
      EXPECT_EQ(families.count(family), 1u) << what;
    }
  }
  EXPECT_GE(faces, 6);
}

// The files of the TrueType and OpenType faces fontconfig lists.
std::set<std::string> listedOutlineFiles() {
  std::set<std::string> files;
  for (const auto& [file, index] : listedOutlineFaces()) {
    files.insert(file);
  }
  return files;
}

// Every record has a file and every listed file a record, in the user's language too: the
// installed-font lists and the enumeration must name each face alike. Debian's URW fonts come as
// Type 1 and OpenType files of the same names; the WenQuanYi faces have Chinese names. A file
// whose every face repeats the PostScript name of another file's face cannot have a record of
// its own, as records are told apart by that name.
TEST(FontCacheOnThisMachine, EveryRecordHasAFileAndEveryListedFileARecordInEachLocale) {
  REQUIRE_FILE("/usr/share/fonts/opentype/urw-base35/NimbusSans-Regular.otf");
  REQUIRE_FILE("/usr/share/fonts/truetype/wqy/wqy-microhei.ttc");
  const char* const saved = std::getenv("LC_ALL");
  const std::set<std::string> listed = listedOutlineFiles();
  for (const char* locale : {"C", "zh_CN.UTF-8", "zh_TW.UTF-8"}) {
    setenv("LC_ALL", locale, 1);
    FontCache cache(platform::createSystemServices());
    std::set<std::string> files;
    std::set<std::u16string> postScriptNames;
    for (const FontRecord& record : cache.records()) {
      EXPECT_TRUE(std::ifstream(toUtf8(record.filePath)).good())
          << locale << ": " << toUtf8(record.postScriptName) << " has no readable file";
      files.insert(toUtf8(record.filePath));
      postScriptNames.insert(record.postScriptName);
    }
    for (const std::string& file : listed) {
      const vesk::project::FontFileReader reader(toUtf16(file), 0x0409);
      bool repeated = reader.faceCount() > 0;
      for (int32_t face = 0; face < reader.faceCount(); ++face) {
        repeated = repeated && postScriptNames.count(reader.postScriptNameUtf16(face)) > 0;
      }
      EXPECT_TRUE(files.count(file) > 0 || repeated) << locale << ": " << file;
    }
    EXPECT_FALSE(cache.findFont(u"No Such Font", u"", u"").filePath.empty()) << locale;
  }
  saved != nullptr ? setenv("LC_ALL", saved, 1) : unsetenv("LC_ALL");
}

}  // namespace
}  // namespace waveform_test
