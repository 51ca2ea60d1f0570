// Feeds arbitrary text to the bidi engine through a token chain. The first byte picks the
// reading: even, the bytes are UTF-16 units (little-endian, unpaired surrogates included); odd,
// each pair of bytes is one of the characters that stress the engine (embeddings, overrides,
// isolates, brackets, strong and weak classes, breaks) repeated up to 64 times, so that a short
// input nests thousands of levels. The result must hold every paragraph token and exactly the
// characters X9 keeps, with levels between the paragraph level and 126 (down to 0 after a
// character of class B, which ends a paragraph of the algorithm inside the token's paragraph).
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "text/bidi_levels.h"

namespace {

using vesk::plugin::lib::BidiClass;
using vesk::plugin::lib::BidiEntry;
using vesk::project::TextToken;

void check(bool condition, const char* what) {
  if (!condition) {
    std::fprintf(stderr, "bidi_fuzzer: %s\n", what);
    std::abort();
  }
}

const char16_t kAlphabet[] = {
    u'\u202A', u'\u202B', u'\u202C', u'\u202D', u'\u202E', u'\u2066', u'\u2067', u'\u2068',
    u'\u2069', u'(',      u')',      u'[',      u']',      u'\u2329', u'\u3009', u'\u3008',
    u'\u232A', u'a',      u'\u05D0', u'\u0627', u'1',      u'\u0661', u'+',      u',',
    u'$',      u' ',      u'\t',     u'\u0300', u'\u200D', u'\n',     u'\r',     u'\u2029',
    0xD800,    0xDC00,    u'\u001C', u'\u00A0', u'\u06F1', u'\u2212', u'%',      u'.'};

std::u16string textOf(const uint8_t* data, size_t size) {
  std::u16string text;
  if (size == 0) {
    return text;
  }
  const bool alphabet = (data[0] & 1) != 0;
  for (size_t i = 1; i + 1 < size; i += 2) {
    if (alphabet) {
      text.append(data[i + 1] % 64 + 1, kAlphabet[data[i] % (sizeof kAlphabet / 2)]);
    } else {
      text += static_cast<char16_t>(data[i] | data[i + 1] << 8);
    }
  }
  return text;
}

bool removedByX9(BidiClass c) {
  return c == BidiClass::RLE || c == BidiClass::LRE || c == BidiClass::RLO || c == BidiClass::LRO ||
         c == BidiClass::PDF || c == BidiClass::BN;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static vesk::plugin::lib::UnicodeHelper unicodeData("/usr/share/unicode");
  const std::shared_ptr<TextToken> first = vesk::project::makeTokenChain(textOf(data, size));
  const int32_t direction = size > 0 ? (data[0] >> 1) % 3 - 1 : 0;
  std::vector<BidiEntry> entries;
  vesk::plugin::lib::resolveLevels(unicodeData, entries, first, direction);

  size_t next = 0;
  int lowest = 0;
  for (const TextToken* token = first.get(); token != nullptr; token = token->next.get()) {
    const bool kept = token->kind == TextToken::kParagraph ||
                      !removedByX9(unicodeData.bidiClass(token->codePoint));
    if (!kept) {
      continue;
    }
    check(next < entries.size() && entries[next].token.get() == token, "a kept token is missing");
    const int level = entries[next++].level;
    if (token->kind == TextToken::kParagraph) {
      check(level == 0 || level == 1, "a paragraph level is neither 0 nor 1");
      lowest = level;
    } else {
      check(level >= lowest && level <= 126, "a level is out of range");
      lowest = unicodeData.bidiClass(token->codePoint) == BidiClass::B ? 0 : lowest;
    }
  }
  check(next == entries.size(), "the result holds more than the kept tokens");
  return 0;
}
