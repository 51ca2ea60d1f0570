// The token chain a text is made of before layout: one paragraph token at the start of every
// paragraph and one character token for every code point, linked forwards by shared pointers and
// backwards by weak ones so that the chain frees itself when its first token goes.
#ifndef WAVEFORM_TEXT_TEXT_TOKEN_H
#define WAVEFORM_TEXT_TEXT_TOKEN_H

#include <cstdint>
#include <memory>
#include <string>

namespace vesk::project {

struct TextToken {
  static constexpr uint32_t kCharacter = 0;
  static constexpr uint32_t kParagraph = 1;

  explicit TextToken(uint32_t tokenKind, uint32_t character = 0)
      : kind(tokenKind), codePoint(character) {}
  // Unlinks the rest of the chain one token at a time: a long chain released by recursive
  // destructors would overflow the stack.
  ~TextToken();
  TextToken(const TextToken&) = delete;
  TextToken& operator=(const TextToken&) = delete;

  uint32_t kind = kCharacter;
  std::shared_ptr<TextToken> next;
  std::weak_ptr<TextToken> previous;
  uint32_t codePoint = 0;  // 0 in a paragraph token
};

// U+000A, U+000B, U+000C, U+000D, U+0085, U+2028 and U+2029: each starts a new paragraph
// (a U+000A directly after a U+000D belongs to the same break).
bool isLineBreak(uint32_t codePoint);

// The chain of `codePoints`: a paragraph token first and after every break, a character token
// for every other code point. An empty text gives one empty paragraph.
std::shared_ptr<TextToken> makeTokenChain(const std::u32string& codePoints);
// The same for UTF-16: a surrogate pair is one code point, an unpaired surrogate U+FFFD.
std::shared_ptr<TextToken> makeTokenChain(const std::u16string& text);
std::u32string codePointsOf(const std::u16string& text);

}  // namespace vesk::project

#endif  // WAVEFORM_TEXT_TEXT_TOKEN_H
