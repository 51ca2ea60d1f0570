// The installed fonts as one fontconfig configuration knows them, read once when the object is
// made: the fonts folder, the installed-font lists of both hives, the families and their faces,
// and the file of a family's best matching face. Private to the platform layer; the POSIX
// services answer their font questions from it.
#ifndef WAVEFORM_PLATFORM_FONTCONFIG_FONTS_H
#define WAVEFORM_PLATFORM_FONTCONFIG_FONTS_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/system_services.h"

namespace platform {

class FontconfigFonts {
 public:
  // Loads a fresh fontconfig configuration with its fonts; the environment (HOME,
  // XDG_DATA_HOME, FONTCONFIG_FILE...) is read now. When fontconfig cannot load a
  // configuration, the object knows no font and no folder.
  FontconfigFonts();
  ~FontconfigFonts();
  FontconfigFonts(const FontconfigFonts&) = delete;
  FontconfigFonts& operator=(const FontconfigFonts&) = delete;

  // The first system font directory (outside the user's font folders) that holds installed
  // fonts and lies inside no other such directory, ending in '/'. Falls back to the first
  // existing system directory, then to the first directory; none when fontconfig reports none.
  std::optional<std::u16string> fontsFolder() const;
  // One entry per TrueType or CFF-based outline file of the hive; none without a configuration.
  std::optional<std::vector<InstalledFont>> installedFonts(FontHive hive) const;
  // The enumeration reports the faces of the files the installed-font lists name and bitmap-only
  // faces, each by the full name its file's Windows name table gives in the user's language
  // (read from the environment on every call), as the font file reader would choose it.
  // One face per family, the most regular plain face (not a named instance), sorted by family.
  std::vector<EnumeratedFace> families() const;
  // Every face, named instances included, with `faceName` among its family names (both cut to
  // 31 UTF-16 units), without repeated (faceName, style, fullName).
  std::vector<EnumeratedFace> faces(const std::u16string& faceName) const;
  // The whole file of the family's face that fontconfig matches best to the weight and slant;
  // empty when no face has that family name.
  std::vector<uint8_t> fontData(const std::u16string& faceName, bool bold, bool italic) const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace platform

#endif  // WAVEFORM_PLATFORM_FONTCONFIG_FONTS_H
