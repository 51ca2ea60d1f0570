// The Unicode Bidirectional Algorithm (UAX #9, with isolates and bracket pairs) on a text given as
// a sequence of bidi classes, with code points only where brackets are to pair. The token-chain
// door (bidi_levels.h) and the conformance tests both feed it.
#ifndef WAVEFORM_TEXT_BIDI_PARAGRAPH_H
#define WAVEFORM_TEXT_BIDI_PARAGRAPH_H

#include <cstddef>
#include <cstdint>

#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

// The deepest explicit embedding level (BD2).
inline constexpr int kMaxBidiDepth = 125;
// The level given to characters removed by rule X9 (embedding controls, PDF, BN).
inline constexpr int16_t kRemovedBidiLevel = -1;

// What bracket pairing (BD16, N0) asks about a code point.
class BracketSource {
 public:
  virtual ~BracketSource() = default;
  virtual BracketRecord bracket(uint32_t codePoint) = 0;
  // The code point a singleton canonical decomposition maps it to, else itself.
  virtual uint32_t canonical(uint32_t codePoint) = 0;
};

// P2/P3: the first L, R or AL of `classes` outside isolates, or ON when there is none.
BidiClass firstStrongClass(const BidiClass* classes, size_t count);

// Resolves `count` characters; a B ends a paragraph (P1) and the next character starts another.
// `direction`: 0 takes each paragraph's level from its text (P2, P3), above 0 left-to-right, below
// 0 right-to-left. `codePoints` may be null (no bracket pairs), and so may `brackets`. Writes the
// resolved class and level of every character: kRemovedBidiLevel for those rule X9 removes,
// the paragraph level for segment and paragraph separators (that much of L1). Returns the level
// of the first paragraph.
int resolveBidiClasses(const BidiClass* classes, const uint32_t* codePoints, size_t count,
                       int32_t direction, BracketSource* brackets, BidiClass* resolvedClasses,
                       int16_t* levels);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_BIDI_PARAGRAPH_H
