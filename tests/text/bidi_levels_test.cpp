// resolveLevels over token chains: paragraph entries, removed characters, and the cases where the
// chain or the Unicode data decide what the conformance files cannot show.
#include <gtest/gtest.h>

#include <string>

#include "ci_or_skip.h"
#include "text/bidi_levels.h"

namespace waveform_test {
namespace {

using vesk::plugin::lib::BidiEntry;
using vesk::plugin::lib::resolveLevels;

// "P<level>" for a paragraph entry, "<code point>:<level>" for a character entry.
std::string describe(const std::vector<BidiEntry>& entries) {
  std::string text;
  for (const BidiEntry& entry : entries) {
    char word[24];
    if (entry.token->kind == vesk::project::TextToken::kParagraph) {
      std::snprintf(word, sizeof word, "P%d", entry.level);
    } else {
      std::snprintf(word, sizeof word, "%X:%d", entry.token->codePoint, entry.level);
    }
    text += (text.empty() ? "" : " ") + std::string(word);
  }
  return text;
}

TEST(BidiLevels, ChainsResolveParagraphByParagraph) {
  REQUIRE_FILE(WAVEFORM_UNICODE_DIR "/UnicodeData.txt");
  vesk::plugin::lib::UnicodeHelper unicodeData(WAVEFORM_UNICODE_DIR);
  const struct {
    std::u16string text;
    int direction;
    const char* entries;
  } cases[] = {
      // Hebrew inside an isolate does not decide the paragraph; the Latin after it does.
      {u"\u2067\u05D0\u2069a", 0, "P0 2067:0 5D0:1 2069:0 61:0"},
      // An FSI whose first strong character is Arabic is an RLI.
      {u"\u2068\u0627a\u2069", 0, "P0 2068:0 627:1 61:2 2069:0"},
      // U+2329 pairs with U+3009: after Latin the pair takes L in a right-to-left paragraph.
      {u"a\u2329b\u3009", -1, "P1 61:2 2329:2 62:2 3009:2"},
      // An opener without a closer is left to N1 and N2.
      {u"a(b", -1, "P1 61:2 28:2 62:2"},
      // A zero-width joiner and an LRE are left out; the LRE still raises what follows.
      {u"a\u200Db\u202Ac", 0, "P0 61:0 62:0 63:2"},
      // A tab takes the paragraph level wherever it is.
      {u"a\tb", -1, "P1 61:2 9:1 62:2"},
      {u"\u05D0\nabc\u2029", 0, "P1 5D0:1 P0 61:0 62:0 63:0 P0"},
      // A character of class B inside the token's paragraph ends a paragraph of the algorithm:
      // the text after it takes its own direction (found by fuzzing).
      {u"\u202D\u05D0\u001C\u001Ca", 0, "P1 5D0:2 1C:1 1C:0 61:0"},
      {u"abc", 1, "P0 61:0 62:0 63:0"},
      {u"\u05D0", 1, "P0 5D0:1"},
  };
  for (const auto& c : cases) {
    std::vector<BidiEntry> result;
    resolveLevels(unicodeData, result, vesk::project::makeTokenChain(c.text), c.direction);
    EXPECT_EQ(describe(result), c.entries);
  }
}

}  // namespace
}  // namespace waveform_test
