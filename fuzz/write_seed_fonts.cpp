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
using waveform_test::FvarAxis;
using waveform_test::FvarInstance;
using waveform_test::FvarTable;
using waveform_test::namedFont;
using waveform_test::Os2Fields;
using waveform_test::SfntFont;

// The first byte of a seed: the extension (0 .ttf, 2 .ttc) plus 6 times the language index
// (0 English, 1 German, 2 Simplified Chinese, 3 Hong Kong Chinese).
constexpr uint8_t kTtf = 0;
constexpr uint8_t kTtc = 2;
constexpr uint8_t kGermanUser = 6;
constexpr uint8_t kChineseUser = 12;
constexpr uint8_t kHongKongUser = 18;

SfntFont variableFont(bool postScriptNameIDs) {
  FvarTable fvar;
  fvar.axes = {FvarAxis{"wght", 100, 400, 900, 256}, FvarAxis{"wdth", 75, 100, 100, 257}};
  fvar.instances = {FvarInstance{258, 300, {400, 100}}, FvarInstance{259, 301, {700, 75}}};
  fvar.postScriptNameIDs = postScriptNameIDs;
  SfntFont font = namedFont(u"Var", u"Regular", u"Var Regular", u"Var-Regular");
  font.setFvar(fvar)
      .addName(3, 1033, 258, u"Regular")
      .addName(3, 1033, 259, u"Bold Condensed")
      .addName(3, 1031, 259, u"Fett Schmal")
      .addName(3, 1033, 300, u"Var-Regular")
      .addName(3, 1033, 301, u"Var-BoldCondensed");
  return font;
}

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

std::vector<std::pair<std::string, std::vector<uint8_t>>> seeds() {
  const SfntFont plain = namedFont(u"Plain", u"Regular", u"Plain Regular", u"Plain-Regular");
  const SfntFont bold = namedFont(u"Plain", u"Bold", u"Plain Bold", u"Plain-Bold");
  SfntFont odd = namedFont(u"Odd", u"Italic", u"Odd Italic", u"Odd-Italic");
  odd.setHead(0, 700, 20)
      .addTable("head", std::vector<uint8_t>(54, 0x11))
      .addNameBytes(3, 1, 1033, 2, {0xD8, 0x00, 0x00, 0x41})
      .setTrailingBytes({0xDE, 0xAD, 0xBE, 0xEF});
  return {
      {"plain-ttf", plain.build()},
      {"variable-with-postscript-ids", variableFont(true).build()},
      {"variable-without-postscript-ids", variableFont(false).build()},
      {"multilingual", multilingualFont().build()},
      {"odd-tables", odd.build()},
      {"collection", buildCollection({plain, bold, variableFont(true)})},
      {"collection-as-ttf", buildCollection({multilingualFont(), plain})},
  };
}

bool write(const std::filesystem::path& path, uint8_t selector, const std::vector<uint8_t>& font) {
  std::FILE* file = std::fopen(path.c_str(), "wb");
  if (!file) {
    return false;
  }
  bool written = std::fputc(selector, file) != EOF;
  written = written && std::fwrite(font.data(), 1, font.size(), file) == font.size();
  return std::fclose(file) == 0 && written;
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
  for (const auto& [name, font] : seeds()) {
    const bool collection = name.rfind("collection", 0) == 0 && name != "collection-as-ttf";
    const uint8_t extension = collection ? kTtc : kTtf;
    for (uint8_t language : {uint8_t{0}, kGermanUser, kChineseUser, kHongKongUser}) {
      const auto path = folder / (name + "-" + std::to_string(language));
      if (!write(path, static_cast<uint8_t>(extension + language), font)) {
        std::fprintf(stderr, "cannot write %s\n", path.c_str());
        return 1;
      }
      ++count;
    }
  }
  std::printf("%d seed fonts in %s\n", count, folder.c_str());
  return 0;
}
