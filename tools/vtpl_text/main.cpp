// vtpl-text: the effect's own text engine on a text typed at the command line, for a user whose
// label comes out in an unexpected order.
//   vtpl-text bidi [--ltr | --rtl] TEXT
// TEXT may hold \uXXXX and \U00XXXXXX escapes (and \\ for a backslash), so that right-to-left
// text can be typed on any terminal.
#include <cstdio>
#include <exception>
#include <filesystem>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "platform/utf16_text.h"
#include "text/bidi_levels.h"
#include "text/bidi_line.h"
#include "text/bidi_paragraph.h"

namespace {

using vesk::plugin::lib::BidiClass;
using vesk::plugin::lib::BidiEntry;
using vesk::plugin::lib::UnicodeHelper;
using vesk::project::TextToken;

const char* const kClassNames[] = {"L",   "R",   "AL",  "EN",  "ES",  "ET",  "AN",  "CS",
                                   "NSM", "BN",  "B",   "S",   "WS",  "ON",  "LRE", "LRO",
                                   "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"};

int usage(const char* problem) {
  std::fprintf(stderr,
               "vtpl-text: %s\n"
               "usage: vtpl-text bidi [--ltr | --rtl] TEXT\n"
               "  prints every character of TEXT with its bidi class and resolved level, and the\n"
               "  visual order of each paragraph; TEXT may hold \\uXXXX and \\U00XXXXXX escapes\n"
               "  --ltr, --rtl  the paragraph direction (default: from the text)\n",
               problem);
  return 2;
}

// The code points of `text` with its escapes replaced; nothing when an escape is malformed.
std::optional<std::u32string> unescaped(const std::string& text) {
  const std::u32string in = vesk::project::codePointsOf(platform::toUtf16(text));
  std::u32string out;
  for (size_t i = 0; i < in.size(); ++i) {
    if (in[i] != U'\\') {
      out += in[i];
      continue;
    }
    if (i + 1 < in.size() && in[i + 1] == U'\\') {
      out += U'\\';
      ++i;
      continue;
    }
    const size_t digits = i + 1 < in.size() && in[i + 1] == U'u'   ? 4
                          : i + 1 < in.size() && in[i + 1] == U'U' ? 8
                                                                   : 0;
    if (digits == 0 || i + 2 + digits > in.size()) {
      return std::nullopt;
    }
    uint32_t value = 0;
    for (size_t k = i + 2; k < i + 2 + digits; ++k) {
      const char32_t c = in[k];
      const int digit = c >= U'0' && c <= U'9'   ? int(c - U'0')
                        : c >= U'a' && c <= U'f' ? int(c - U'a' + 10)
                        : c >= U'A' && c <= U'F' ? int(c - U'A' + 10)
                                                 : -1;
      if (digit < 0) {
        return std::nullopt;
      }
      value = value * 16 + static_cast<uint32_t>(digit);
    }
    if (value > 0x10FFFF || (value >= 0xD800 && value <= 0xDFFF)) {
      return std::nullopt;
    }
    out += static_cast<char32_t>(value);
    i += 1 + digits;
  }
  return out;
}

// The build copies the data files beside the tool; elsewhere Debian's copies are read.
std::filesystem::path dataFolder() {
  std::error_code error;
  const std::filesystem::path self = std::filesystem::read_symlink("/proc/self/exe", error);
  if (!error && std::filesystem::exists(self.parent_path() / "UnicodeData.txt")) {
    return self.parent_path();
  }
  return "/usr/share/unicode";
}

// One paragraph as printed: its characters in logical order, with the removed ones.
struct PrintedParagraph {
  int level = 0;
  std::vector<uint32_t> codePoints;
  std::vector<BidiClass> classes;
  std::vector<int16_t> levels;
};

void print(const PrintedParagraph& paragraph, size_t number) {
  std::printf("paragraph %zu: level %d\n", number, paragraph.level);
  for (size_t i = 0; i < paragraph.codePoints.size(); ++i) {
    const int16_t level = paragraph.levels[i];
    std::printf(
        "  U+%04X  %-3s  %s\n", paragraph.codePoints[i],
        kClassNames[static_cast<uint32_t>(paragraph.classes[i])],
        level == vesk::plugin::lib::kRemovedBidiLevel ? "x" : std::to_string(level).c_str());
  }
  std::vector<int16_t> lineLevels = paragraph.levels;
  vesk::plugin::lib::resetLineEndLevels(paragraph.classes, lineLevels, paragraph.level);
  std::printf("  visual order:");
  for (int index : vesk::plugin::lib::visualOrder(lineLevels)) {
    std::printf(" U+%04X", paragraph.codePoints[index]);
  }
  std::printf("\n");
}

int bidi(const std::u32string& text, int32_t direction) {
  UnicodeHelper unicodeData(dataFolder());
  const std::shared_ptr<TextToken> first = vesk::project::makeTokenChain(text);
  std::vector<BidiEntry> entries;
  vesk::plugin::lib::resolveLevels(unicodeData, entries, first, direction);
  std::map<const TextToken*, const BidiEntry*> resolved;
  for (const BidiEntry& entry : entries) {
    resolved[entry.token.get()] = &entry;
  }
  std::vector<PrintedParagraph> paragraphs;
  for (const TextToken* token = first.get(); token != nullptr; token = token->next.get()) {
    const BidiEntry* entry = resolved.count(token) ? resolved[token] : nullptr;
    if (token->kind == TextToken::kParagraph) {
      paragraphs.push_back({entry->level, {}, {}, {}});
    } else {
      paragraphs.back().codePoints.push_back(token->codePoint);
      paragraphs.back().classes.push_back(unicodeData.bidiClass(token->codePoint));
      paragraphs.back().levels.push_back(entry ? entry->level
                                               : vesk::plugin::lib::kRemovedBidiLevel);
    }
  }
  for (size_t i = 0; i < paragraphs.size(); ++i) {
    print(paragraphs[i], i + 1);
  }
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2 || std::string(argv[1]) != "bidi") {
    return usage(argc < 2 ? "no command given" : "unknown command (only \"bidi\" is known)");
  }
  int32_t direction = 0;
  std::optional<std::string> text;
  for (int i = 2; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--ltr" || argument == "--rtl") {
      direction = argument == "--ltr" ? 1 : -1;
    } else if (argument.rfind("--", 0) == 0 || text) {
      return usage(text ? "more than one text given" : "unknown option");
    } else {
      text = argument;
    }
  }
  if (!text) {
    return usage("no text given");
  }
  const std::optional<std::u32string> codePoints = unescaped(*text);
  if (!codePoints) {
    return usage("malformed escape (\\uXXXX or \\U00XXXXXX, a scalar value, or \\\\)");
  }
  try {
    return bidi(*codePoints, direction);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "vtpl-text: %s\n", error.what());
    return 1;
  }
}
