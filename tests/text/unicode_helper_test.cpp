#include "text/unicode_helper.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "text/unicode_blocks.h"

namespace waveform_test {
namespace {

namespace fs = std::filesystem;
using vesk::plugin::lib::BidiClass, vesk::plugin::lib::BracketType,
    vesk::plugin::lib::GeneralCategory, vesk::plugin::lib::UnicodeHelper;

// A fresh folder of its own for every test (the tests run in parallel), removed afterwards.
class TempFolder {
 public:
  TempFolder() {
    std::string pattern = (fs::temp_directory_path() / "unicode_helper_XXXXXX").string();
    path_ = mkdtemp(pattern.data());
  }
  ~TempFolder() { fs::remove_all(path_); }
  const fs::path& path() const { return path_; }
  void write(const std::string& name, const std::string& text) const {
    std::ofstream(path_ / name, std::ios::binary) << text;
  }

 private:
  fs::path path_;
};

// A character line with the given category, bidi class and simple upper-case mapping.
std::string line(const std::string& cp, const std::string& category = "Lu",
                 const std::string& bidi = "L", const std::string& upper = "") {
  return cp + ";NAME;" + category + ";0;" + bidi + ";;;;;N;;;" + upper + ";;\n";
}

std::vector<std::string> fieldsOf(const std::string& text) {
  std::vector<std::string> fields;
  std::stringstream stream(text);
  for (std::string field; std::getline(stream, field, ';');) {
    const size_t first = field.find_first_not_of(' ');
    fields.push_back(first == std::string::npos ? "" : field.substr(first));
  }
  return fields;
}

std::vector<uint32_t> codePoints(const std::string& text) {
  std::vector<uint32_t> result;
  std::stringstream stream(text);
  for (std::string part; stream >> part;) {
    result.push_back(static_cast<uint32_t>(std::stoul(part, nullptr, 16)));
  }
  return result;
}

TEST(UnicodeHelper, WithoutFilesEveryQueryFallsBack) {
  TempFolder empty;
  UnicodeHelper helper(empty.path());
  const struct {
    uint32_t cp;
    BidiClass bidi;
    bool white;
  } cases[] = {{0x0627, BidiClass::L, false}, {0x0020, BidiClass::WS, true},
               {0x000A, BidiClass::B, true},  {0x3000, BidiClass::WS, true},
               {0x00A0, BidiClass::L, false}, {0x10000, BidiClass::L, false}};
  for (const auto& c : cases) {
    EXPECT_EQ(helper.bidiClass(c.cp), c.bidi) << std::hex << c.cp;
    EXPECT_EQ(helper.isWhitespace(c.cp), c.white) << std::hex << c.cp;
  }
  EXPECT_EQ(helper.generalCategory('A'), GeneralCategory::Cn);
  EXPECT_EQ(helper.toUpper('a'), uint32_t('a'));
  EXPECT_EQ(helper.decomposition(0x00C5), 0u);
  EXPECT_EQ(helper.specialUpper(0x00DF), (std::vector<uint32_t>{0x53, 0x53}));
  EXPECT_FALSE(helper.characterFileOpened() || helper.bracketFileOpened());
  EXPECT_TRUE(helper.brackets().empty());
}

TEST(UnicodeHelper, LoadsBlockByBlockWithoutRereading) {
  TempFolder data;
  // The second U+0041 line comes after Latin-1 and must stay unread once Basic Latin is loaded.
  data.write("UnicodeData.txt", line("0041") + line("0042") + line("00E9", "Ll") +
                                    line("0041", "Ll") + "bad line\n" + line("0100"));
  UnicodeHelper helper(data.path());
  EXPECT_EQ(helper.generalCategory(0x41), GeneralCategory::Lu);
  EXPECT_EQ(helper.loadedUpTo(), 0x7Fu);
  EXPECT_EQ(helper.characterCount(), 2u);
  EXPECT_EQ(helper.skippedLines(), 0u);  // reading stopped before the bad line
  EXPECT_EQ(helper.generalCategory(0xE9), GeneralCategory::Ll);
  EXPECT_EQ(helper.loadedUpTo(), 0xFFu);
  EXPECT_EQ(helper.characterCount(), 3u);
  EXPECT_EQ(helper.generalCategory(0x41), GeneralCategory::Lu);
  helper.ensureLoaded(0x10FFFF);
  helper.ensureLoaded(0xFFFFFFFF);
  EXPECT_EQ(helper.characterCount(), 4u);
  EXPECT_EQ(helper.skippedLines(), 1u);  // counted once, however many loads pass it
}

TEST(UnicodeHelper, CaseMappingsAndSpecialCasing) {
  TempFolder data;
  data.write("UnicodeData.txt", line("0041") + line("0061", "Ll", "L", "0041"));
  UnicodeHelper helper(data.path());
  EXPECT_EQ(helper.toUpper(0x61), 0x41u);
  EXPECT_EQ(helper.toUpper(0x41), 0x41u);  // empty field: the code point itself
  EXPECT_EQ(helper.toLower(0x61), 0x61u);
  EXPECT_EQ(helper.specialUpper(0xDF), (std::vector<uint32_t>{0x53, 0x53}));
  EXPECT_TRUE(helper.specialUpper(0x41).empty());
  EXPECT_FALSE(helper.hasSpecialCasing(0x41));
}

TEST(UnicodeHelper, BracketTypesAndFirstLineWins) {
  TempFolder data;
  data.write("BidiBrackets.txt",
             "# comment\n\n0028; 0029; o # (\n0029; 0028;c\n005B; 005D; x\n0028; 005D; c\n");
  UnicodeHelper helper(data.path());
  const auto& brackets = helper.brackets();
  ASSERT_EQ(brackets.size(), 3u);
  EXPECT_EQ(brackets.at(0x28).type, BracketType::kOpening);
  EXPECT_EQ(brackets.at(0x28).pair, 0x29u);
  EXPECT_EQ(brackets.at(0x29).type, BracketType::kClosing);
  EXPECT_EQ(brackets.at(0x5B).type, BracketType::kNone);
  EXPECT_EQ(helper.skippedLines(), 0u);
}

// Each damaged line sits between two good ones: it is passed over, counted, and nothing raises.
TEST(UnicodeHelper, MalformedLinesAreSkippedAndCounted) {
  const std::string overlong = "0042;X;Lu;0;L;;;;;N;;;;;#" + std::string(5000, 'x');
  const std::string cases[] = {"0G42;X;Lu;0;L;;;;;N;;;;;\n",
                               "100000000;X;Lu;0;L;;;;;N;;;;;\n",
                               "0042;X;Lu;0;L;;;;;N;;;ZZ;;\n",
                               "0042;X;Qq;0;L;;;;;N;;;;;\n",
                               "0042;X;Lu;0;Q;;;;;N;;;;;\n",
                               "0042;X;Lu\n",
                               "0042;X;Lu;0;L;<tag>;;;;N;;;;;\n",
                               overlong + "\n",
                               overlong + std::string(1 << 20, 'y') + "\n"};
  for (const std::string& bad : cases) {
    TempFolder data;
    data.write("UnicodeData.txt", line("0041") + bad + line("0043"));
    data.write("BidiBrackets.txt", "0028; 0029; o\n" + bad + "005B; 005D; o\n");
    UnicodeHelper helper(data.path());
    const size_t bracketSkips = helper.skippedLines();
    EXPECT_EQ(helper.generalCategory(0x42), GeneralCategory::Cn) << bad.substr(0, 40);
    EXPECT_EQ(helper.generalCategory(0x43), GeneralCategory::Lu) << bad.substr(0, 40);
    EXPECT_EQ(helper.characterCount(), 2u) << bad.substr(0, 40);
    EXPECT_EQ(helper.skippedLines(), bracketSkips + 1) << bad.substr(0, 40);
    EXPECT_EQ(helper.brackets().count(0x5B), 1u) << bad.substr(0, 40);
  }
}

// The longest line kept is 4095 bytes, its line end not counted; one byte more is overlong.
TEST(UnicodeHelper, LineLengthLimit) {
  for (const size_t length : {4095u, 4096u}) {
    TempFolder data;
    std::string longLine = line("0042");
    longLine.pop_back();
    longLine += "#" + std::string(length - longLine.size() - 1, 'x') + "\n";
    data.write("UnicodeData.txt", line("0041") + longLine + line("0043"));
    UnicodeHelper helper(data.path());
    helper.ensureLoaded(0x7F);
    EXPECT_EQ(helper.characterCount(), length == 4095 ? 3u : 2u) << length;
  }
}

TEST(UnicodeHelper, FoldersAndFifosInPlaceOfTheFilesAreNotRead) {
  TempFolder data;
  fs::create_directory(data.path() / "UnicodeData.txt");
  const fs::path fifo = data.path() / "BidiBrackets.txt";
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  // Should the helper open the FIFO, a writer comes along and closes it, so the test fails
  // instead of hanging.
  std::atomic<bool> done{false}, readerOpened{false};
  std::thread writer([&] {
    while (!done) {
      const int fd = open(fifo.c_str(), O_WRONLY | O_NONBLOCK);
      if (fd >= 0) {
        readerOpened = true;
        close(fd);
      }
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
  });
  UnicodeHelper helper(data.path());
  EXPECT_EQ(helper.bidiClass(0x0627), BidiClass::L);
  done = true;
  writer.join();
  EXPECT_FALSE(readerOpened);
  EXPECT_FALSE(helper.bracketFileOpened() || helper.characterFileOpened());
}

TEST(UnicodeHelper, BlockEndsAreUnicodeBlockEnds) {
  const auto& ends = vesk::plugin::lib::unicodeBlockEnds();
  std::set<uint32_t> fileEnds;
  std::ifstream blocks(WAVEFORM_UNICODE_DIR "/Blocks.txt");
  for (std::string text; std::getline(blocks, text);) {
    if (text.find("..") != std::string::npos && text[0] != '#') {
      fileEnds.insert(codePoints(text.substr(text.find("..") + 2, 6)).front());
    }
  }
  EXPECT_EQ(ends.front(), 0x7Fu);
  EXPECT_EQ(ends.back(), 0x10FFFFu);
  for (size_t i = 0; i < ends.size(); ++i) {
    EXPECT_TRUE(i == 0 || ends[i - 1] < ends[i]) << i;
    EXPECT_EQ(fileEnds.count(ends[i]), 1u) << std::hex << ends[i];
  }
}

// The built-in table against the unconditional lines of Unicode's own SpecialCasing.txt.
TEST(UnicodeHelper, BuiltInSpecialCasingIsTheStandardOne) {
  TempFolder empty;
  UnicodeHelper helper(empty.path());
  std::ifstream file(WAVEFORM_UNICODE_DIR "/SpecialCasing.txt");
  std::set<uint32_t> expected;
  for (std::string text; std::getline(file, text);) {
    const std::vector<std::string> f = fieldsOf(text.substr(0, text.find('#')));
    if (f.size() < 5 || !f[4].empty() || f[0] == "0130") {
      continue;  // comments, conditional mappings and U+0130
    }
    const uint32_t cp = codePoints(f[0]).front();
    expected.insert(cp);
    EXPECT_EQ(helper.specialLower(cp), codePoints(f[1])) << std::hex << cp;
    EXPECT_EQ(helper.specialTitle(cp), codePoints(f[2])) << std::hex << cp;
    EXPECT_EQ(helper.specialUpper(cp), codePoints(f[3])) << std::hex << cp;
  }
  EXPECT_EQ(expected.size(), 102u);
  for (uint32_t cp = 0; cp <= 0x10FFFF; ++cp) {
    ASSERT_EQ(helper.hasSpecialCasing(cp), expected.count(cp) == 1) << std::hex << cp;
  }
}

// Every line of the real character file, read here independently, against the answers.
TEST(UnicodeHelper, AnswersMatchTheWholeCharacterFile) {
  const std::vector<std::string> categories = {
      "Lu", "Ll", "Lt", "Lm", "Lo", "Mn", "Mc", "Me", "Nd", "Nl", "No", "Pc", "Pd", "Ps", "Pe",
      "Pi", "Pf", "Po", "Sm", "Sc", "Sk", "So", "Zs", "Zl", "Zp", "Cc", "Cf", "Cs", "Co", "Cn"};
  const std::vector<std::string> classes = {"L",   "R",   "AL",  "EN",  "ES",  "ET",  "AN",  "CS",
                                            "NSM", "BN",  "B",   "S",   "WS",  "ON",  "LRE", "LRO",
                                            "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"};
  const auto indexOf = [](const std::vector<std::string>& names, const std::string& name) {
    return static_cast<uint32_t>(std::find(names.begin(), names.end(), name) - names.begin());
  };
  UnicodeHelper helper(WAVEFORM_BUILD_DIR);
  std::ifstream file(WAVEFORM_BUILD_DIR "/UnicodeData.txt");
  size_t lines = 0;
  for (std::string text; std::getline(file, text); ++lines) {
    std::vector<std::string> f = fieldsOf(text + ";");
    f.resize(15);
    const uint32_t cp = codePoints(f[0]).front();
    const auto mapping = [&](const std::string& field) {
      return field.empty() ? cp : codePoints(field).front();
    };
    const bool singleton = !f[5].empty() && f[5].find_first_of("< ") == std::string::npos;
    ASSERT_EQ(uint32_t(helper.generalCategory(cp)), indexOf(categories, f[2])) << text;
    ASSERT_EQ(uint32_t(helper.bidiClass(cp)), indexOf(classes, f[4])) << text;
    ASSERT_EQ(helper.decomposition(cp), singleton ? codePoints(f[5])[0] : 0u) << text;
    ASSERT_EQ(helper.toUpper(cp), mapping(f[12])) << text;
    ASSERT_EQ(helper.toLower(cp), mapping(f[13])) << text;
    ASSERT_EQ(helper.toTitle(cp), mapping(f[14])) << text;
  }
  EXPECT_EQ(helper.characterCount(), lines);
  EXPECT_EQ(helper.skippedLines(), 0u);
  EXPECT_EQ(helper.brackets().at(0x28).pair, 0x29u);
  // Ranges are not expanded: inside the CJK ideographs only the fallbacks answer.
  EXPECT_EQ(helper.generalCategory(0x4E01), GeneralCategory::Cn);
  EXPECT_EQ(helper.bidiClass(0x4E01), BidiClass::L);
}

TEST(UnicodeHelper, DefaultFolderIsTwoAboveTheModule) {
  const fs::path executable = fs::read_symlink("/proc/self/exe");
  EXPECT_EQ(fs::canonical(vesk::plugin::lib::defaultUnicodeDataFolder()),
            fs::canonical(executable.parent_path() / ".." / ".."));
}

}  // namespace
}  // namespace waveform_test
