// Reads the character file lazily: each load goes on from where the last one stopped, up to the
// end of the block asked for, so a label of Latin text reads only Basic Latin. A malformed line
// (a bad number, an unknown alias, too few fields, an overlong line) is passed over and counted:
// a damaged data file costs the characters it damages and never fails a render.
#include "text/unicode_helper.h"

#include <array>
#include <optional>
#include <string_view>

#include "platform/system_services.h"
#include "text/builtin_special_casing.h"
#include "text/data_file_lines.h"
#include "text/unicode_blocks.h"

namespace vesk::plugin::lib {
namespace {

constexpr std::array<std::string_view, 30> kCategoryAliases = {
    "Lu", "Ll", "Lt", "Lm", "Lo", "Mn", "Mc", "Me", "Nd", "Nl", "No", "Pc", "Pd", "Ps", "Pe",
    "Pi", "Pf", "Po", "Sm", "Sc", "Sk", "So", "Zs", "Zl", "Zp", "Cc", "Cf", "Cs", "Co", "Cn"};
constexpr std::array<std::string_view, 23> kBidiAliases = {
    "L",  "R",  "AL",  "EN",  "ES",  "ET",  "AN",  "CS",  "NSM", "BN",  "B",  "S",
    "WS", "ON", "LRE", "LRO", "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"};

template <size_t N>
std::optional<uint32_t> aliasValue(const std::array<std::string_view, N>& aliases,
                                   std::string_view alias) {
  for (size_t i = 0; i < N; ++i) {
    if (aliases[i] == alias) {
      return static_cast<uint32_t>(i);
    }
  }
  return std::nullopt;
}

// An optional code point field: 0 when empty, none when malformed.
std::optional<uint32_t> optionalCodePoint(std::string_view field) {
  return field.empty() ? std::optional<uint32_t>(0) : parseCodePoint(field);
}

// The one code point of a singleton canonical decomposition; 0 for none, for a tagged
// (compatibility) one and for one of several code points.
std::optional<uint32_t> singletonDecomposition(std::string_view field) {
  if (field.empty() || field.find(' ') != std::string_view::npos) {
    return 0;
  }
  return parseCodePoint(field);
}

// Fields 2 (category), 4 (bidi class), 5 (decomposition), 12 to 14 (simple case mappings) of a
// character line; none when one of them is malformed.
std::optional<CharacterRecord> characterRecord(const DataFields& fields) {
  const auto category = aliasValue(kCategoryAliases, fields[2]);
  const auto bidi = aliasValue(kBidiAliases, fields[4]);
  const auto decomposition = singletonDecomposition(fields[5]);
  const auto upper = optionalCodePoint(fields[12]);
  const auto lower = optionalCodePoint(fields[13]);
  const auto title = optionalCodePoint(fields[14]);
  if (!category || !bidi || !decomposition || !upper || !lower || !title) {
    return std::nullopt;
  }
  CharacterRecord record;
  record.category = static_cast<GeneralCategory>(*category);
  record.bidiClass = static_cast<BidiClass>(*bidi);
  record.decomposition = *decomposition;
  record.upper = *upper;
  record.lower = *lower;
  record.title = *title;
  return record;
}

BracketType bracketType(std::string_view field) {
  return field == "o"   ? BracketType::kOpening
         : field == "c" ? BracketType::kClosing
                        : BracketType::kNone;
}

}  // namespace

UnicodeHelper::UnicodeHelper(std::filesystem::path dataFolder)
    : dataFolder_(std::move(dataFolder)), specialCasing_(builtInSpecialCasing()) {
  readBracketFile();
}

void UnicodeHelper::readBracketFile() {
  DataFileLines lines;
  if (!lines.open(dataFolder_ / "BidiBrackets.txt", 0)) {
    return;
  }
  bracketFileOpened_ = true;
  while (const DataFields* line = lines.nextFields(skippedLines_)) {
    const DataFields& fields = *line;
    const auto codePoint = parseCodePoint(fields[0]);
    const auto pair = parseCodePoint(fields[1]);
    if (fields.count < 3 || !codePoint || !pair) {
      ++skippedLines_;
      continue;
    }
    // The first line for a code point wins.
    brackets_.emplace(*codePoint, BracketRecord{bracketType(fields[2]), *pair});
  }
}

void UnicodeHelper::ensureLoaded(uint32_t codePoint) {
  if (loadedAny_ && codePoint <= loadedUpTo_) {
    return;
  }
  const uint32_t limit = unicodeBlockEnd(codePoint);
  readCharacterFile(limit);
  // Also when the file is missing or unreadable: it is tried once per block, then taken as read.
  loadedUpTo_ = limit;
  loadedAny_ = true;
}

void UnicodeHelper::readCharacterFile(uint32_t limit) {
  DataFileLines lines;
  if (!lines.open(dataFolder_ / "UnicodeData.txt", characterFileResume_)) {
    return;
  }
  characterFileOpened_ = true;
  while (const DataFields* line = lines.nextFields(skippedLines_)) {
    const DataFields& fields = *line;
    const auto codePoint = parseCodePoint(fields[0]);
    if (!codePoint) {
      ++skippedLines_;
      continue;
    }
    // A line out of order, for a block loaded before, stays unread as if the block were whole.
    if (loadedAny_ && *codePoint <= loadedUpTo_) {
      continue;
    }
    if (*codePoint > limit) {
      characterFileResume_ = lines.lineStart();
      return;
    }
    const auto record = fields.count < 5 ? std::nullopt : characterRecord(fields);
    if (!record) {
      ++skippedLines_;
      continue;
    }
    // A later line for the same code point replaces the record.
    characters_[*codePoint] = *record;
  }
  characterFileResume_ = lines.lineStart();
}

const CharacterRecord* UnicodeHelper::record(uint32_t codePoint) {
  ensureLoaded(codePoint);
  const auto found = characters_.find(codePoint);
  return found == characters_.end() ? nullptr : &found->second;
}

BidiClass UnicodeHelper::bidiClass(uint32_t codePoint) {
  if (const CharacterRecord* found = record(codePoint)) {
    return found->bidiClass;
  }
  if (codePoint == 0x000A) {
    return BidiClass::B;
  }
  if (codePoint > 0xFFFF) {
    return BidiClass::L;
  }
  return platform::isWideSpace(codePoint) ? BidiClass::WS : BidiClass::L;
}

uint32_t UnicodeHelper::decomposition(uint32_t codePoint) {
  const CharacterRecord* found = record(codePoint);
  return found ? found->decomposition : 0;
}

GeneralCategory UnicodeHelper::generalCategory(uint32_t codePoint) {
  const CharacterRecord* found = record(codePoint);
  return found ? found->category : GeneralCategory::Cn;
}

bool UnicodeHelper::isWhitespace(uint32_t codePoint) {
  if (const CharacterRecord* found = record(codePoint)) {
    return found->bidiClass == BidiClass::WS || found->bidiClass == BidiClass::S;
  }
  return codePoint <= 0xFFFF && platform::isWideSpace(codePoint);
}

uint32_t UnicodeHelper::toUpper(uint32_t codePoint) {
  const CharacterRecord* found = record(codePoint);
  return found && found->upper != 0 ? found->upper : codePoint;
}

uint32_t UnicodeHelper::toLower(uint32_t codePoint) {
  const CharacterRecord* found = record(codePoint);
  return found && found->lower != 0 ? found->lower : codePoint;
}

uint32_t UnicodeHelper::toTitle(uint32_t codePoint) {
  const CharacterRecord* found = record(codePoint);
  return found && found->title != 0 ? found->title : codePoint;
}

bool UnicodeHelper::hasSpecialCasing(uint32_t codePoint) {
  ensureLoaded(codePoint);
  return specialCasing_.count(codePoint) != 0;
}

std::vector<uint32_t> UnicodeHelper::specialLower(uint32_t codePoint) {
  ensureLoaded(codePoint);
  const auto found = specialCasing_.find(codePoint);
  return found == specialCasing_.end() ? std::vector<uint32_t>() : found->second.lower;
}

std::vector<uint32_t> UnicodeHelper::specialTitle(uint32_t codePoint) {
  ensureLoaded(codePoint);
  const auto found = specialCasing_.find(codePoint);
  return found == specialCasing_.end() ? std::vector<uint32_t>() : found->second.title;
}

std::vector<uint32_t> UnicodeHelper::specialUpper(uint32_t codePoint) {
  ensureLoaded(codePoint);
  const auto found = specialCasing_.find(codePoint);
  return found == specialCasing_.end() ? std::vector<uint32_t>() : found->second.upper;
}

}  // namespace vesk::plugin::lib
