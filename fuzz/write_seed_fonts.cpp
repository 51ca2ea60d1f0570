// Writes the fuzzer's seed corpus: small synthetic fonts and collections, each preceded by the
// byte the fuzzer reads as its choice of extension and user language.
//   write_seed_fonts FOLDER
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "sfnt_writer.h"

namespace {

using waveform_test::buildCollection;
using waveform_test::namedFont;
using waveform_test::Os2Fields;
using waveform_test::SfntFont;
using waveform_test::variableFont;

// The first byte of a seed: the extension (0 .ttf, 2 .ttc) plus 6 times the language index
// (0 English, 1 German, 2 Simplified Chinese, 3 Hong Kong Chinese).
constexpr uint8_t kTtf = 0, kTtc = 2;
constexpr uint8_t kLanguages[] = {0, 6, 12, 18};

SfntFont multilingualFont() {
  SfntFont font;
  font.addName(3, 1033, 1, u"Sample")
      .addName(3, 1031, 1, u"Muster")
      .addName(3, 1028, 1, u"\u6A23\u672C")
      .addName(3, 2052, 1, u"\u6837\u672C")
      .addName(3, 1059, 4, u"\u0423\u0437\u043E\u0440")
      .addName(3, 1033, 16, u"Sample Typo")
      .addName(3, 1033, 17, u"Heavy")
      .addName(3, 1033, 19, u"The quick brown fox \U0001F98A")
      .addName(1, 0, 1, u"Mac Sample")
      .addName(0, 3, 4, u"Unicode Sample")
      .setHead(2048, 1900)
      .setPost(-150, 100);
  Os2Fields os2;
  os2.fsType = 0x0008;
  os2.strikeoutSize = 0;
  font.setOs2(os2, 78);
  return font;
}

struct Seed {
  std::string name;
  std::vector<uint8_t> font;
  uint8_t extension;
};

std::vector<Seed> seeds() {
  const SfntFont plain = namedFont(u"Plain", u"Regular", u"Plain Regular", u"Plain-Regular");
  const SfntFont bold = namedFont(u"Plain", u"Bold", u"Plain Bold", u"Plain-Bold");
  SfntFont odd = namedFont(u"Odd", u"Italic", u"Odd Italic", u"Odd-Italic");
  odd.setHead(0, 700, 20)
      .addTable("head", std::vector<uint8_t>(54, 0x11))
      .addNameBytes(3, 1, 1033, 2, {0xD8, 0x00, 0x00, 0x41})
      .setTrailingBytes({0xDE, 0xAD, 0xBE, 0xEF});
  return {
      {"plain-ttf", plain.build(), kTtf},
      {"variable-with-postscript-ids", variableFont(true).build(), kTtf},
      {"variable-without-postscript-ids", variableFont(false).build(), kTtf},
      {"multilingual", multilingualFont().build(), kTtf},
      {"odd-tables", odd.build(), kTtf},
      {"collection", buildCollection({plain, bold, variableFont(true)}), kTtc},
      {"collection-as-ttf", buildCollection({multilingualFont(), plain}), kTtf},
  };
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: write_seed_fonts FOLDER\n");
    return 2;
  }
  const std::filesystem::path folder = argv[1];
  std::filesystem::create_directories(folder);
  int count = 0;
  for (const Seed& seed : seeds()) {
    for (uint8_t language : kLanguages) {
      const auto path = folder / (seed.name + "-" + std::to_string(language));
      std::vector<uint8_t> bytes = {static_cast<uint8_t>(seed.extension + language)};
      bytes.insert(bytes.end(), seed.font.begin(), seed.font.end());
      if (!waveform_test::writeFile(path.string(), bytes)) {
        std::fprintf(stderr, "cannot write %s\n", path.c_str());
        return 1;
      }
      ++count;
    }
  }
  std::printf("%d seed fonts in %s\n", count, folder.c_str());
  return 0;
}
