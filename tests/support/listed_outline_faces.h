// The TrueType and OpenType faces (collections included) fontconfig lists on this machine, read
// through a configuration of their own that is destroyed afterwards, as the catalogue loads one
// (the default configuration's parse leaks inside fontconfig).
#ifndef WAVEFORM_TESTS_SUPPORT_LISTED_OUTLINE_FACES_H
#define WAVEFORM_TESTS_SUPPORT_LISTED_OUTLINE_FACES_H

#include <fontconfig/fontconfig.h>

#include <set>
#include <string>
#include <utility>

namespace waveform_test {

// (file, face index) pairs; the named instances of a variable face count once, as their face.
inline std::set<std::pair<std::string, int>> listedOutlineFaces() {
  std::set<std::pair<std::string, int>> faces;
  FcPattern* everything = FcPatternCreate();
  FcObjectSet* objects = FcObjectSetBuild(FC_FILE, FC_INDEX, FC_FONTFORMAT, nullptr);
  FcConfig* config = FcInitLoadConfigAndFonts();
  FcFontSet* listed = FcFontList(config, everything, objects);
  for (int i = 0; listed != nullptr && i < listed->nfont; ++i) {
    FcChar8* file = nullptr;
    FcChar8* format = nullptr;
    int index = 0;
    if (FcPatternGetString(listed->fonts[i], FC_FILE, 0, &file) != FcResultMatch ||
        FcPatternGetString(listed->fonts[i], FC_FONTFORMAT, 0, &format) != FcResultMatch) {
      continue;
    }
    const std::string kind = reinterpret_cast<const char*>(format);
    FcPatternGetInteger(listed->fonts[i], FC_INDEX, 0, &index);
    if (kind == "TrueType" || kind == "CFF") {
      faces.emplace(reinterpret_cast<const char*>(file), index & 0xFFFF);
    }
  }
  if (listed != nullptr) {
    FcFontSetDestroy(listed);
  }
  FcObjectSetDestroy(objects);
  FcPatternDestroy(everything);
  FcConfigDestroy(config);
  return faces;
}

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_SUPPORT_LISTED_OUTLINE_FACES_H
