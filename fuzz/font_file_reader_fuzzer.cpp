// Feeds arbitrary bytes to the font file reader and asks every question of every face. The first
// input byte picks the file name's extension and the user's language; the rest is the file.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <iterator>
#include <string>
#include <vector>

#include "fonts/font_file_reader.h"

namespace {

using vesk::project::FontFileReader;
using vesk::project::FontVector;
using vesk::project::NamedInstance;

const char16_t* const kPaths[] = {u"fuzz.ttf", u"fuzz.otf", u"fuzz.ttc",
                                  u"fuzz.otc", u"FUZZ.TTF", u"fuzz.woff"};
const uint16_t kLanguages[] = {1033, 1031, 2052, 3076, 1047, 0x0C09, 1041, 0};

// Stops the run, so that libFuzzer keeps the input, when an answer contradicts another.
void check(bool holds) {
  if (!holds) {
    std::abort();
  }
}

size_t sink = 0;

void askEverything(const FontFileReader& reader, int32_t face) {
  for (const std::u16string& text : {reader.subfamilyNameUtf16(face), reader.fullNameUtf16(face),
                                     reader.postScriptNameUtf16(face), reader.familyNameUtf16(face),
                                     reader.styleNameUtf16(face)}) {
    sink += text.size();
  }
  sink += reader.styleName(face).size() + reader.sampleText(face).size();
  for (const FontVector& value : {reader.subscriptSize(face), reader.subscriptOffset(face),
                                  reader.superscriptSize(face), reader.superscriptOffset(face)}) {
    sink += static_cast<size_t>(value[0] != value[1]);
  }
  for (float value : {reader.strikeoutSize(face), reader.strikeoutPosition(face),
                      reader.underlinePosition(face), reader.underlineThickness(face)}) {
    sink += static_cast<size_t>(value > 0);
  }
  sink += reader.isEmbeddable(face);

  check(reader.postScriptName(face).empty() ==
        (reader.name(face, 6).empty() && reader.name(face, 4).empty()));
  for (const auto& [platform, byId] : reader.names(face)) {
    for (const auto& [id, byLanguage] : byId) {
      check(!byLanguage.empty());
      for (const auto& [language, text] : byLanguage) {
        check(!text.empty());
      }
      // A Windows name that is stored is always found for any user.
      check(platform != 3 || !reader.name(face, id).empty());
    }
  }
  for (const NamedInstance& instance : reader.namedInstances(face)) {
    sink += instance.subfamilyName.size() + instance.postScriptName.size();
    check(instance.postScriptNameID != 0 || instance.postScriptName.empty());
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) {
    return 0;
  }
  const std::u16string path = kPaths[data[0] % std::size(kPaths)];
  const uint16_t language = kLanguages[(data[0] / std::size(kPaths)) % std::size(kLanguages)];
  const FontFileReader reader(path, std::vector<uint8_t>(data + 1, data + size), language);
  check(reader.faceCount() >= 0);
  for (int32_t face = -1; face <= reader.faceCount(); ++face) {
    askEverything(reader, face);
  }
  return 0;
}
