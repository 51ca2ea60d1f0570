// Feeds arbitrary bytes to the Unicode data file readers. The input up to its first 0xFF byte
// becomes "UnicodeData.txt", the rest "BidiBrackets.txt" (both files are ASCII, so seeds made of
// real lines split cleanly); the helper is then made and asked about a spread of code points.
// Nothing may raise, every answer must be a valid value, and the loaded range only grows.
#include <stdlib.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include "text/unicode_helper.h"

namespace {

using vesk::plugin::lib::BracketType;
using vesk::plugin::lib::UnicodeHelper;

const std::filesystem::path& folder() {
  static const std::filesystem::path path = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "unicode_fuzz_XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
      std::perror("mkdtemp");
      std::abort();
    }
    return std::filesystem::path(pattern);
  }();
  return path;
}

void check(bool condition, const char* what) {
  if (!condition) {
    std::fprintf(stderr, "unicode_data_fuzzer: %s\n", what);
    std::abort();
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string input(reinterpret_cast<const char*>(data), size);
  const size_t split = std::min(input.find('\xff'), input.size());
  std::ofstream(folder() / "UnicodeData.txt", std::ios::binary) << input.substr(0, split);
  std::ofstream(folder() / "BidiBrackets.txt", std::ios::binary)
      << input.substr(std::min(split + 1, input.size()));

  UnicodeHelper helper(folder());
  for (const auto& [codePoint, bracket] : helper.brackets()) {
    check(codePoint <= 0x10FFFF && bracket.pair <= 0x10FFFF, "bracket beyond U+10FFFF");
    check(static_cast<uint32_t>(bracket.type) <= static_cast<uint32_t>(BracketType::kClosing),
          "bracket type");
  }
  const uint32_t queries[] = {0x0000, 0x0041, 0x00E9,  0x0041,   0x0627,   0x1F50,
                              0x4E00, 0xFB00, 0x1F600, 0x10FFFF, 0x110000, 0xFFFFFFFF};
  uint32_t loaded = 0;
  for (const uint32_t cp : queries) {
    check(static_cast<uint32_t>(helper.bidiClass(cp)) <= 22, "bidi class");
    check(static_cast<uint32_t>(helper.generalCategory(cp)) <= 29, "general category");
    check(helper.decomposition(cp) <= 0x10FFFF, "decomposition");
    check(helper.toUpper(cp) == cp || helper.toUpper(cp) <= 0x10FFFF, "upper-case mapping");
    helper.isWhitespace(cp);
    helper.toLower(cp);
    helper.toTitle(cp);
    check(helper.hasSpecialCasing(cp) == !helper.specialUpper(cp).empty(), "special casing");
    check(helper.loadedUpTo() >= loaded && helper.loadedUpTo() >= cp, "loaded range");
    loaded = helper.loadedUpTo();
  }
  return 0;
}
