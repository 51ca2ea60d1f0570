// The token chain: paragraph tokens at the breaks, one character token per code point, links both
// ways, and release of long chains.
#include <gtest/gtest.h>

#include <string>

#include "text/text_token.h"

namespace waveform_test {
namespace {

using vesk::project::makeTokenChain;
using vesk::project::TextToken;

// "P" for a paragraph token, the code point in hexadecimal for a character token.
std::string describe(const std::shared_ptr<TextToken>& first) {
  std::string text;
  const TextToken* previous = nullptr;
  for (const TextToken* token = first.get(); token != nullptr; token = token->next.get()) {
    EXPECT_EQ(token->previous.lock().get(), previous);
    char word[16];
    std::snprintf(word, sizeof word, token->kind == TextToken::kParagraph ? "P" : "%X",
                  token->codePoint);
    text += (text.empty() ? "" : " ") + std::string(word);
    previous = token;
  }
  return text;
}

TEST(TextToken, ChainsHaveAParagraphTokenAtEveryBreak) {
  const struct {
    std::u16string text;
    const char* chain;
  } cases[] = {
      {u"", "P"},
      {u"ab", "P 61 62"},
      {u"a\r\nb", "P 61 P 62"},
      {u"a\n\rb", "P 61 P P 62"},
      {u"\u2029", "P P"},
      {u"\r\u2028\n", "P P P P"},
      {u"\v\f\u0085x", "P P P P 78"},
      {u"\U0001F600", "P 1F600"},
      {u"a\xD800"
       u"b\xDC00",
       "P 61 FFFD 62 FFFD"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(describe(makeTokenChain(c.text)), c.chain);
  }
}

TEST(TextToken, ALongChainIsReleasedWithoutDeepRecursion) {
  std::weak_ptr<TextToken> last;
  {
    std::shared_ptr<TextToken> first = makeTokenChain(std::u32string(1000000, U'a'));
    TextToken* token = first.get();
    while (token->next) {
      token = token->next.get();
    }
    last = token->previous.lock()->next;
  }
  EXPECT_TRUE(last.expired());
}

}  // namespace
}  // namespace waveform_test
