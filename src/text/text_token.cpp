#include "text/text_token.h"

namespace vesk::project {

TextToken::~TextToken() {
  std::shared_ptr<TextToken> rest = std::move(next);
  // Only a token this one alone holds is released here; it hands its own successor over first.
  while (rest && rest.use_count() == 1) {
    rest = std::move(rest->next);
  }
}

bool isLineBreak(uint32_t codePoint) {
  return (codePoint >= 0x0A && codePoint <= 0x0D) || codePoint == 0x85 || codePoint == 0x2028 ||
         codePoint == 0x2029;
}

std::shared_ptr<TextToken> makeTokenChain(const std::u32string& codePoints) {
  auto first = std::make_shared<TextToken>(TextToken::kParagraph);
  std::shared_ptr<TextToken> current = first;
  auto append = [&current](std::shared_ptr<TextToken> token) {
    token->previous = current;
    current->next = token;
    current = std::move(token);
  };
  for (size_t i = 0; i < codePoints.size(); ++i) {
    const uint32_t c = codePoints[i];
    if (c == 0x0A && i > 0 && codePoints[i - 1] == 0x0D) {
      continue;
    }
    append(std::make_shared<TextToken>(
        isLineBreak(c) ? TextToken::kParagraph : TextToken::kCharacter, isLineBreak(c) ? 0 : c));
  }
  return first;
}

std::u32string codePointsOf(const std::u16string& text) {
  std::u32string codePoints;
  codePoints.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    const uint32_t unit = text[i];
    const bool high = unit >= 0xD800 && unit <= 0xDBFF;
    const uint32_t low = i + 1 < text.size() ? text[i + 1] : 0;
    if (high && low >= 0xDC00 && low <= 0xDFFF) {
      codePoints.push_back(0x10000 + ((unit - 0xD800) << 10) + (low - 0xDC00));
      ++i;
    } else {
      codePoints.push_back(unit >= 0xD800 && unit <= 0xDFFF ? 0xFFFD : unit);
    }
  }
  return codePoints;
}

std::shared_ptr<TextToken> makeTokenChain(const std::u16string& text) {
  return makeTokenChain(codePointsOf(text));
}

}  // namespace vesk::project
