// The bidi engine against the Unicode Character Database's own conformance files: every line of
// BidiTest.txt at every paragraph direction it lists, and every line of BidiCharacterTest.txt.
// Each failure is counted by reason; the first few are printed with input, expected and actual.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iostream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "ci_or_skip.h"
#include "text/bidi_levels.h"
#include "text/bidi_line.h"
#include "text/bidi_paragraph.h"

namespace waveform_test {
namespace {

using vesk::plugin::lib::BidiClass;
using vesk::plugin::lib::resetLineEndLevels;
using vesk::plugin::lib::visualOrder;
using Levels = std::vector<int16_t>;

constexpr int16_t kX = vesk::plugin::lib::kRemovedBidiLevel;
const std::string kUnicodeFolder = WAVEFORM_UNICODE_DIR "/";

BidiClass classNamed(const std::string& name) {
  static const std::map<std::string, BidiClass> classes = [] {
    const char* names[] = {"L",   "R",   "AL",  "EN",  "ES",  "ET",  "AN",  "CS",
                           "NSM", "BN",  "B",   "S",   "WS",  "ON",  "LRE", "LRO",
                           "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"};
    std::map<std::string, BidiClass> map;
    for (uint32_t i = 0; i < sizeof names / sizeof names[0]; ++i) {
      map[names[i]] = static_cast<BidiClass>(i);
    }
    return map;
  }();
  return classes.at(name);
}

std::vector<std::string> words(const std::string& text) {
  std::istringstream stream(text);
  std::vector<std::string> result;
  for (std::string word; stream >> word;) {
    result.push_back(word);
  }
  return result;
}

Levels levelsFrom(const std::string& text) {
  Levels levels;
  for (const std::string& word : words(text)) {
    levels.push_back(word == "x" ? kX : static_cast<int16_t>(std::stoi(word)));
  }
  return levels;
}

std::vector<int> numbersFrom(const std::string& text) {
  std::vector<int> numbers;
  for (const std::string& word : words(text)) {
    numbers.push_back(std::stoi(word));
  }
  return numbers;
}

std::string joined(const std::vector<int>& values) {
  std::string text;
  for (int value : values) {
    text += (text.empty() ? "" : " ") + (value == kX ? std::string("x") : std::to_string(value));
  }
  return text;
}

// The tally of one file.
struct Tally {
  size_t lines = 0;
  size_t cases = 0;
  size_t passed = 0;
  std::map<std::string, size_t> failedBy;
  std::vector<std::string> examples;

  void fail(const std::string& reason, const std::string& detail) {
    ++failedBy[reason];
    if (examples.size() < 5) {
      examples.push_back(reason + ": " + detail);
    }
  }
  size_t failed() const { return cases - passed; }
  std::string report(const std::string& file) const {
    std::ostringstream text;
    text << file << ": " << lines << " lines, " << cases << " cases, " << passed << " passed, "
         << failed() << " failed";
    for (const auto& [reason, count] : failedBy) {
      text << ", " << count << " by " << reason;
    }
    for (const std::string& example : examples) {
      text << "\n  " << example;
    }
    return text.str();
  }
};

// Resolves one case and checks levels, and the order where one is expected; true when both agree.
bool checkCase(const std::vector<BidiClass>& classes, const std::vector<uint32_t>& codePoints,
               int32_t direction, vesk::plugin::lib::BracketSource* brackets, int paragraphLevel,
               const Levels& expectedLevels, const std::vector<int>& expectedOrder,
               const std::string& input, Tally& tally) {
  std::vector<BidiClass> resolved(classes.size());
  Levels levels(classes.size());
  const int level = vesk::plugin::lib::resolveBidiClasses(
      classes.data(), codePoints.empty() ? nullptr : codePoints.data(), classes.size(), direction,
      brackets, resolved.data(), levels.data());
  resetLineEndLevels(classes, levels, level);
  const std::string where = input + " (direction " + std::to_string(direction) + ")";
  if (paragraphLevel >= 0 && level != paragraphLevel) {
    tally.fail("paragraph level", where + ": expected " + std::to_string(paragraphLevel) +
                                      ", got " + std::to_string(level));
    return false;
  }
  if (levels != expectedLevels) {
    tally.fail("levels", where + ": expected " +
                             joined({expectedLevels.begin(), expectedLevels.end()}) + ", got " +
                             joined({levels.begin(), levels.end()}));
    return false;
  }
  if (visualOrder(levels) != expectedOrder) {
    tally.fail("order", where + ": expected " + joined(expectedOrder) + ", got " +
                            joined(visualOrder(levels)));
    return false;
  }
  return true;
}

TEST(BidiConformance, EveryLineOfBidiTestPasses) {
  const std::string path = kUnicodeFolder + "BidiTest.txt";
  REQUIRE_FILE(path);
  std::ifstream file(path);
  Tally tally;
  Levels expectedLevels;
  std::vector<int> expectedOrder;
  const int32_t directions[] = {0, 1, -1};  // bits 1 (auto), 2 (left-to-right), 4 (right-to-left)
  for (std::string line; std::getline(file, line);) {
    line = line.substr(0, line.find('#'));
    if (line.rfind("@Levels:", 0) == 0) {
      expectedLevels = levelsFrom(line.substr(8));
    } else if (line.rfind("@Reorder:", 0) == 0) {
      expectedOrder = numbersFrom(line.substr(9));
    } else if (line.find(';') != std::string::npos) {
      ++tally.lines;
      std::vector<BidiClass> classes;
      for (const std::string& name : words(line.substr(0, line.find(';')))) {
        classes.push_back(classNamed(name));
      }
      const int bits = std::stoi(line.substr(line.find(';') + 1), nullptr, 16);
      for (int bit = 0; bit < 3; ++bit) {
        if ((bits >> bit & 1) != 0) {
          ++tally.cases;
          tally.passed += checkCase(classes, {}, directions[bit], nullptr, -1, expectedLevels,
                                    expectedOrder, line.substr(0, line.find(';')), tally);
        }
      }
    }
  }
  std::cout << tally.report("BidiTest.txt") << "\n";
  EXPECT_GT(tally.cases, 0u);
  EXPECT_EQ(tally.failed(), 0u) << tally.report("BidiTest.txt");
}

TEST(BidiConformance, EveryLineOfBidiCharacterTestPasses) {
  const std::string path = kUnicodeFolder + "BidiCharacterTest.txt";
  REQUIRE_FILE(path);
  REQUIRE_FILE(kUnicodeFolder + "UnicodeData.txt");
  vesk::plugin::lib::UnicodeHelper unicodeData(kUnicodeFolder);
  vesk::plugin::lib::UnicodeBracketSource brackets(unicodeData);
  std::ifstream file(path);
  Tally tally;
  const int32_t directions[] = {1, -1, 0};  // field 1: 0 left-to-right, 1 right-to-left, 2 auto
  for (std::string line; std::getline(file, line);) {
    std::vector<std::string> fields;
    std::istringstream stream(line.substr(0, line.find('#')));
    for (std::string field; std::getline(stream, field, ';');) {
      fields.push_back(field);
    }
    if (fields.size() < 5) {
      continue;
    }
    ++tally.lines;
    ++tally.cases;
    std::vector<uint32_t> codePoints;
    std::vector<BidiClass> classes;
    for (const std::string& word : words(fields[0])) {
      codePoints.push_back(static_cast<uint32_t>(std::stoul(word, nullptr, 16)));
      classes.push_back(unicodeData.bidiClass(codePoints.back()));
    }
    tally.passed += checkCase(classes, codePoints, directions[std::stoi(fields[1])], &brackets,
                              std::stoi(fields[2]), levelsFrom(fields[3]), numbersFrom(fields[4]),
                              fields[0], tally);
  }
  std::cout << tally.report("BidiCharacterTest.txt") << "\n";
  EXPECT_GT(tally.cases, 0u);
  EXPECT_EQ(tally.failed(), 0u) << tally.report("BidiCharacterTest.txt");
}

}  // namespace
}  // namespace waveform_test
