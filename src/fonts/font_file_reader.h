// Reads what the font catalogue needs straight from a TrueType or OpenType file or collection:
// the names of every face, the named instances of a variable font, and a few typographic
// metrics. Everything is read at construction; afterwards the reader answers from memory. Font
// files are untrusted: every read is checked against the file's size, and a damaged file only
// yields fewer faces, fewer names or default metrics.
#ifndef WAVEFORM_FONTS_FONT_FILE_READER_H
#define WAVEFORM_FONTS_FONT_FILE_READER_H

#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "platform/system_services.h"

namespace vesk::project {

// One named instance of a variable font, from its 'fvar' table.
struct NamedInstance {
  uint16_t subfamilyNameID = 0;
  uint16_t postScriptNameID = 0;  // 0: the instance record has none
  std::string subfamilyName;      // UTF-8
  std::string postScriptName;     // UTF-8
};

// platformID -> nameID -> languageID -> text (UTF-8; bytes as stored for non-Unicode platforms).
using NameTable = std::map<uint16_t, std::map<uint16_t, std::map<uint16_t, std::string>>>;

using FontVector = std::array<float, 2>;  // x, y

class FontFileReader {
 public:
  // Reads the file; a file that cannot be read, or of another kind, has no faces. Names are
  // chosen for the user's language, a Windows language identifier.
  FontFileReader(std::u16string path, uint16_t userLanguageId);
  // Reads a font held in memory; `path` decides the layout by its extension as above.
  FontFileReader(std::u16string path, std::vector<uint8_t> bytes, uint16_t userLanguageId);
  ~FontFileReader();
  FontFileReader(const FontFileReader&);
  FontFileReader& operator=(const FontFileReader&);
  FontFileReader(FontFileReader&&) noexcept;
  FontFileReader& operator=(FontFileReader&&) noexcept;

  const std::u16string& path() const;
  int32_t faceCount() const;

  // The text of a Windows-platform name for the user's language, or an empty string.
  const std::string& name(int32_t face, uint16_t nameID) const;
  const std::string& subfamilyName(int32_t face) const;   // 2
  const std::string& fullName(int32_t face) const;        // 4
  const std::string& postScriptName(int32_t face) const;  // 6, else 4
  const std::string& familyName(int32_t face) const;      // 16, else 1
  const std::string& styleName(int32_t face) const;       // 17, else 2
  const std::string& sampleText(int32_t face) const;      // 19
  // The same names as UTF-16.
  std::u16string subfamilyNameUtf16(int32_t face) const;
  std::u16string fullNameUtf16(int32_t face) const;
  std::u16string postScriptNameUtf16(int32_t face) const;
  std::u16string familyNameUtf16(int32_t face) const;
  std::u16string styleNameUtf16(int32_t face) const;

  // Every stored name of a face, all platforms and languages; empty for a face out of range.
  const NameTable& names(int32_t face) const;
  // Empty for a face out of range.
  const std::vector<NamedInstance>& namedInstances(int32_t face) const;
  // Whether the OS/2 table permits embedding; false for a face out of range.
  bool isEmbeddable(int32_t face) const;
  // How the face is drawn, from OS/2; zero classes and upright without the table.
  struct StyleClass {
    uint16_t weight = 0;   // 400 regular, 700 bold
    uint16_t width = 0;    // 5 normal, below condensed, above expanded
    bool slanted = false;  // the italic or the oblique bit of fsSelection
  };
  // All zero for a face out of range.
  StyleClass styleClass(int32_t face) const;

  // Metrics in em. A face out of range, or without a usable unitsPerEm, gives the defaults
  // (subscript size 0.583, 0.583; offset 0, -0.1914; superscript size 0.583, 0.583; offset 0,
  // 0.33; strikeout size 0.05, position 0.3; underline position -0.075, thickness 0.05).
  FontVector subscriptSize(int32_t face) const;
  FontVector subscriptOffset(int32_t face) const;
  FontVector superscriptSize(int32_t face) const;
  FontVector superscriptOffset(int32_t face) const;
  float strikeoutSize(int32_t face) const;
  float strikeoutPosition(int32_t face) const;
  float underlinePosition(int32_t face) const;
  float underlineThickness(int32_t face) const;

  struct Face;  // the parsed tables of one face

 private:
  // The face at that index, or null when the index is out of range.
  const Face* face(int32_t index) const;
  // The face when its metrics can be computed (index in range, unitsPerEm not 0), else null.
  const Face* faceWithMetrics(int32_t index) const;

  std::u16string path_;
  uint16_t userLanguageId_;
  std::vector<Face> faces_;
};

using platform::macintoshLanguageCode;

// UTF-8 to UTF-16; malformed sequences become U+FFFD.
std::u16string utf8ToUtf16(const std::string& text);

}  // namespace vesk::project

#endif  // WAVEFORM_FONTS_FONT_FILE_READER_H
