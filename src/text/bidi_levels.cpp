#include "text/bidi_levels.h"

#include <algorithm>

namespace vesk::plugin::lib {
namespace {

using vesk::project::TextToken;

// The character tokens of one paragraph, resolved together.
struct Paragraph {
  std::shared_ptr<TextToken> token;  // empty for characters before the chain's first paragraph
  std::vector<std::shared_ptr<TextToken>> characters;
  std::vector<BidiClass> classes;
  std::vector<uint32_t> codePoints;
};

void resolveParagraph(Paragraph& paragraph, int32_t direction, UnicodeBracketSource& brackets,
                      std::vector<BidiEntry>& result) {
  const size_t count = paragraph.classes.size();
  std::vector<BidiClass> resolved(count);
  std::vector<int16_t> levels(count);
  const int level = resolveBidiClasses(paragraph.classes.data(), paragraph.codePoints.data(), count,
                                       direction, &brackets, resolved.data(), levels.data());
  if (paragraph.token) {
    BidiClass own = direction > 0 ? BidiClass::L : BidiClass::R;
    if (direction == 0) {
      own = firstStrongClass(paragraph.classes.data(), count);
      own = own == BidiClass::ON ? BidiClass::L : own;
    }
    result.push_back({paragraph.token, static_cast<uint32_t>(own), static_cast<int16_t>(level)});
  }
  for (size_t i = 0; i < count; ++i) {
    if (levels[i] != kRemovedBidiLevel) {
      result.push_back({paragraph.characters[i], static_cast<uint32_t>(resolved[i]), levels[i]});
    }
  }
  paragraph = Paragraph{};
}

}  // namespace

BracketRecord UnicodeBracketSource::bracket(uint32_t codePoint) {
  const auto found = data_.brackets().find(codePoint);
  return found == data_.brackets().end() ? BracketRecord{} : found->second;
}

uint32_t UnicodeBracketSource::canonical(uint32_t codePoint) {
  const uint32_t single = data_.decomposition(codePoint);
  return single != 0 ? single : codePoint;
}

void resolveLevels(UnicodeHelper& unicodeData, std::vector<BidiEntry>& result,
                   const std::shared_ptr<TextToken>& firstToken, int32_t direction) {
  result.clear();
  // One load classifies the whole text.
  uint32_t highest = 0;
  for (TextToken* token = firstToken.get(); token != nullptr; token = token->next.get()) {
    highest = token->kind == TextToken::kCharacter ? std::max(highest, token->codePoint) : highest;
  }
  unicodeData.ensureLoaded(highest);

  UnicodeBracketSource brackets(unicodeData);
  Paragraph paragraph;
  for (std::shared_ptr<TextToken> token = firstToken; token; token = token->next) {
    if (token->kind == TextToken::kParagraph) {
      if (paragraph.token || !paragraph.characters.empty()) {
        resolveParagraph(paragraph, direction, brackets, result);
      }
      paragraph.token = token;
    } else {
      paragraph.characters.push_back(token);
      paragraph.classes.push_back(unicodeData.bidiClass(token->codePoint));
      paragraph.codePoints.push_back(token->codePoint);
    }
  }
  if (paragraph.token || !paragraph.characters.empty()) {
    resolveParagraph(paragraph, direction, brackets, result);
  }
}

}  // namespace vesk::plugin::lib
