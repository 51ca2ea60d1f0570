// The operating-system services the font and text code needs, behind one interface: the fonts
// folder, the list of installed font files, the enumeration of installed faces, whole-font data,
// the user's language, the module's folder, new GUIDs and the wide-space test. The POSIX
// implementation answers them from fontconfig and the environment; tests give the font catalogue
// a fake system instead.
#ifndef WAVEFORM_PLATFORM_SYSTEM_SERVICES_H
#define WAVEFORM_PLATFORM_SYSTEM_SERVICES_H

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

// Where an installed-font list comes from: fonts installed for every user, or for this user only.
enum class FontHive { kMachine, kUser };

// One entry of an installed-font list: a display name such as "DejaVu Sans Bold (TrueType)" and
// the font file, relative to the fonts folder when it lies inside it, otherwise absolute.
struct InstalledFont {
  std::u16string name;
  std::u16string file;
};

// How an enumerated face is drawn.
enum FontType : int32_t {
  kRasterFontType = 1,    // bitmap only
  kDeviceFontType = 2,    // a face the output device provides
  kTrueTypeFontType = 4,  // scalable outlines (TrueType or OpenType)
};

// One face as an enumeration reports it.
struct EnumeratedFace {
  std::u16string faceName;  // the family the face belongs to
  std::u16string style;     // e.g. "Bold Italic"
  std::u16string fullName;  // the face's full name, e.g. "DejaVu Sans Bold"
  int32_t fontType = kTrueTypeFontType;
};

class SystemServices {
 public:
  virtual ~SystemServices() = default;

  // The folder most installed fonts live in, ending in a path separator; none when unknown.
  virtual std::optional<std::u16string> fontsFolder() const = 0;
  // The installed-font list of a hive; none when the hive's list cannot be read.
  virtual std::optional<std::vector<InstalledFont>> installedFonts(FontHive hive) const = 0;
  // First enumeration pass: one face of every installed family.
  virtual std::vector<EnumeratedFace> enumerateFamilies() const = 0;
  // Second pass: every face of one family (`faceName` at most 31 UTF-16 units).
  virtual std::vector<EnumeratedFace> enumerateFaces(const std::u16string& faceName) const = 0;
  // The whole font file of a family's face that best matches the style; empty when unknown.
  virtual std::vector<uint8_t> fontData(const std::u16string& faceName, bool bold,
                                        bool italic) const = 0;
  // The user's language as a Windows language identifier (0x0409 when unknown).
  virtual uint16_t userLanguageId() const = 0;
  // The folder of the module that holds this code, ending in a path separator.
  virtual std::u16string moduleFolder() const = 0;
  // A new random (version 4) GUID, as 16 bytes.
  virtual std::array<uint8_t, 16> newGuid() const = 0;
  // Whether the character is white space in the platform's wide-character classification.
  virtual bool isWideSpace(char32_t character) const = 0;
};

// This machine's services; created on first use and shared.
std::shared_ptr<const SystemServices> systemServices();

// Whether the character is white space in the platform's wide-character classification; what
// SystemServices::isWideSpace answers on this platform, without making the services.
bool isWideSpace(char32_t character);

// A locale name as the environment gives it ("de_AT.UTF-8", "fr", "zh_HK@variant") as a Windows
// language identifier; 0x0409 (English, United States) when it is unknown, empty, "C" or "POSIX".
uint16_t languageIdForLocale(const std::string& locale);

// The locale of the user's messages: LC_ALL, else LC_MESSAGES, else LANG (the first that is set
// and not empty), as a Windows language identifier.
uint16_t userLanguageIdFromEnvironment();

// The Macintosh language code of a Windows language identifier: 0 (English) for identifiers
// without an entry, 65535 for languages without a Macintosh counterpart.
uint16_t macintoshLanguageCode(uint16_t windowsLanguageId);

// Which of the languages a font name is given in (Windows language identifiers, ascending) a user
// of `userLanguageId` reads it in, as a position in `languages`: the only one there is; else the
// user's own; else the first with the user's Macintosh language code (related languages, and
// languages without a Macintosh counterpart, stand in for one another); else the first English
// one; else the first. 0 for an empty list.
size_t preferredNameLanguage(const std::vector<uint16_t>& languages, uint16_t userLanguageId);

// The GUID in its usual text form, "xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx", lower case.
std::string guidText(const std::array<uint8_t, 16>& guid);

// A new set of this machine's services that reads the font configuration and the user's font
// folders as the environment gives them now (HOME, XDG_DATA_HOME, the fontconfig variables).
// systemServices() shares one such set, made on first use; code that changes the environment
// afterwards, as tests do, makes its own.
std::shared_ptr<const SystemServices> createSystemServices();

// The folders that hold the user's own fonts, each ending in '/': $XDG_DATA_HOME/fonts
// (~/.local/share/fonts when XDG_DATA_HOME is unset, empty or not absolute) and ~/.fonts; the
// second is left out when HOME is unset or empty.
std::vector<std::string> userFontFolders();

// The hive a font file (an absolute path) belongs to: kUser when it lies inside one of
// `userFolders` (folders as userFontFolders() gives them), otherwise kMachine. Paths are compared
// after lexical normalisation ("//", "/./", "/../"), without resolving links.
FontHive fontHiveOfFile(const std::string& file, const std::vector<std::string>& userFolders);

// The name an installed-font list gives a font file, from its first face: "<family> <style>"
// followed by " (TrueType)" for TrueType outlines or " (OpenType)" for CFF outlines (`format` as
// fontconfig names it: "TrueType", "CFF"); the style is left out when empty. None for a file the
// list leaves out: bitmap-only (`outline` false, even in an sfnt wrapper) or another format.
std::optional<std::u16string> installedFontName(const std::u16string& family,
                                                const std::u16string& style,
                                                const std::string& format, bool outline);

}  // namespace platform

#endif  // WAVEFORM_PLATFORM_SYSTEM_SERVICES_H
