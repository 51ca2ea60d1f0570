// Bidirectional levels of a token chain: every paragraph token starts a paragraph, every character
// token is classified by the Unicode data and resolved by UAX #9 (bidi_paragraph.h).
#ifndef WAVEFORM_TEXT_BIDI_LEVELS_H
#define WAVEFORM_TEXT_BIDI_LEVELS_H

#include <cstdint>
#include <memory>
#include <vector>

#include "text/bidi_paragraph.h"
#include "text/text_token.h"
#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

// One resolved token, in logical order.
struct BidiEntry {
  std::shared_ptr<vesk::project::TextToken> token;
  uint32_t bidiClass = 0;  // a BidiClass value; the paragraph's own direction in a paragraph entry
  int16_t level = 0;
};

// Bracket records and singleton canonical equivalents from the Unicode data.
class UnicodeBracketSource : public BracketSource {
 public:
  explicit UnicodeBracketSource(UnicodeHelper& data) : data_(data) {}
  BracketRecord bracket(uint32_t codePoint) override;
  uint32_t canonical(uint32_t codePoint) override;

 private:
  UnicodeHelper& data_;
};

// Fills `result` with every paragraph token and every character token that rule X9 keeps
// (embedding controls, PDF and BN are left out), each with its resolved class and level.
// `direction`: 0 takes each paragraph's direction from its text, above 0 left-to-right, below 0
// right-to-left.
void resolveLevels(UnicodeHelper& unicodeData, std::vector<BidiEntry>& result,
                   const std::shared_ptr<vesk::project::TextToken>& firstToken, int32_t direction);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_BIDI_LEVELS_H
