// Character properties for the text engine, read at run time from the Unicode Character
// Database's "UnicodeData.txt" (block by block, as higher code points are asked for) and
// "BidiBrackets.txt" (once). Without the files every question still has an answer: all text is
// left-to-right, white space follows the platform's classification and no brackets pair.
#ifndef WAVEFORM_TEXT_UNICODE_HELPER_H
#define WAVEFORM_TEXT_UNICODE_HELPER_H

#include <cstdint>
#include <filesystem>
#include <map>
#include <vector>

namespace vesk::plugin::lib {

// The bidirectional classes, in the order of their values.
enum class BidiClass : uint32_t {
  L, R, AL, EN, ES, ET, AN, CS, NSM, BN, B, S, WS, ON, LRE, LRO, RLE, RLO, PDF, LRI, RLI, FSI, PDI
};

// The general categories, in the order of their values.
enum class GeneralCategory : uint32_t {
  Lu, Ll, Lt, Lm, Lo, Mn, Mc, Me, Nd, Nl, No, Pc, Pd, Ps, Pe, Pi, Pf, Po, Sm, Sc, Sk, So, Zs, Zl,
  Zp, Cc, Cf, Cs, Co, Cn
};

struct CharacterRecord {
  BidiClass bidiClass = BidiClass::L;
  uint32_t decomposition = 0;  // the one code point of a singleton decomposition, else 0
  GeneralCategory category = GeneralCategory::Cn;
  uint32_t upper = 0;  // simple case mappings; 0 when the data give none
  uint32_t lower = 0;
  uint32_t title = 0;
};

enum class BracketType : uint32_t { kNone = 0, kOpening = 1, kClosing = 2 };

struct BracketRecord {
  BracketType type = BracketType::kNone;
  uint32_t pair = 0;  // the paired bracket's code point
};

struct SpecialCasingRecord {
  std::vector<uint32_t> lower, title, upper;
};

// The folder the plug-in's data files lie in: two folders above the module's own.
std::filesystem::path defaultUnicodeDataFolder();

// Not locked: its users serialise loads and queries (the font object's mutex).
class UnicodeHelper {
 public:
  // Reads "BidiBrackets.txt" of `dataFolder` at once; "UnicodeData.txt" is read when asked.
  explicit UnicodeHelper(std::filesystem::path dataFolder = defaultUnicodeDataFolder());

  // Reads the character file up to the end of the Unicode block holding `codePoint`, unless
  // that block is loaded already. Every query below calls it first.
  void ensureLoaded(uint32_t codePoint);

  BidiClass bidiClass(uint32_t codePoint);
  uint32_t decomposition(uint32_t codePoint);
  GeneralCategory generalCategory(uint32_t codePoint);
  bool isWhitespace(uint32_t codePoint);
  uint32_t toUpper(uint32_t codePoint);
  uint32_t toLower(uint32_t codePoint);
  uint32_t toTitle(uint32_t codePoint);
  bool hasSpecialCasing(uint32_t codePoint);
  std::vector<uint32_t> specialLower(uint32_t codePoint);
  std::vector<uint32_t> specialTitle(uint32_t codePoint);
  std::vector<uint32_t> specialUpper(uint32_t codePoint);

  // The bracket pairs, read by the bidi engine.
  const std::map<uint32_t, BracketRecord>& brackets() const { return brackets_; }

  // What was read so far, for tests and tools.
  uint32_t loadedUpTo() const { return loadedUpTo_; }
  bool characterFileOpened() const { return characterFileOpened_; }
  bool bracketFileOpened() const { return bracketFileOpened_; }
  size_t characterCount() const { return characters_.size(); }
  // Lines of either file passed over as malformed (a bad number, an overlong line).
  size_t skippedLines() const { return skippedLines_; }

 private:
  void readBracketFile();
  void readCharacterFile(uint32_t limit);
  // The record of a code point once its block is loaded; null when the data give none.
  const CharacterRecord* record(uint32_t codePoint);

  std::filesystem::path dataFolder_;
  bool characterFileOpened_ = false;
  bool bracketFileOpened_ = false;
  uint32_t loadedUpTo_ = 0;
  // Whether a load has happened: loadedUpTo_ 0 alone cannot tell, and U+0000 has data too.
  bool loadedAny_ = false;
  size_t skippedLines_ = 0;
  // Where the next load goes on reading the character file: the start of the first line that
  // lay beyond the last load's block (the file's end once it has been read through).
  uint64_t characterFileResume_ = 0;
  std::map<uint32_t, CharacterRecord> characters_;
  std::map<uint32_t, BracketRecord> brackets_;
  std::map<uint32_t, SpecialCasingRecord> specialCasing_;
};

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_UNICODE_HELPER_H
