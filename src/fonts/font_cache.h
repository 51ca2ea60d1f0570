// The process-wide catalogue of installed fonts: which families exist, whether a font of a name
// exists, and which file, face and metrics belong to a name. Filled once, on the first question,
// from the installed-font lists and the enumeration of installed faces, with names and metrics
// read from the font files themselves.
#ifndef WAVEFORM_FONTS_FONT_CACHE_H
#define WAVEFORM_FONTS_FONT_CACHE_H

#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <vector>

#include "fonts/font_file_reader.h"
#include "platform/system_services.h"

namespace vesk::project {

// One installed face, or one named instance of a variable font. Copied out on every lookup.
struct FontRecord {
  std::u16string familyName;
  std::u16string styleName;
  std::u16string fullName;
  std::u16string postScriptName;  // unique across the catalogue
  std::u16string filePath;        // empty when no file was found
  int32_t faceIndex = 0;
  int32_t instanceId = 0;  // the instance's subfamily name id; 0 for a plain face
  std::string sampleText;  // UTF-8
  bool embeddable = false;
  FontVector subscriptSize{};
  FontVector subscriptOffset{};
  FontVector superscriptSize{};
  FontVector superscriptOffset{};
  float strikeoutSize = 0;
  float strikeoutPosition = 0;
  float underlinePosition = 0;
  float underlineThickness = 0;
  std::u16string gdiFamilyName;  // the names the enumeration reported
  std::u16string gdiFullName;
};

// Where the font of a name lives, as the installed-font lists give it.
struct FontFileRef {
  int32_t instanceId = 0;
  int32_t faceIndex = 0;
  std::u16string filePath;
};

class FontCache {
 public:
  // The catalogue of this machine, created on first use. Throws std::runtime_error "Cannot get
  // system fonts path" when the fonts folder is unknown; a later call tries again.
  static std::shared_ptr<FontCache> instance();

  // A catalogue of the given system's fonts; nothing is read until the first question. Throws
  // like instance().
  explicit FontCache(std::shared_ptr<const platform::SystemServices> services);
  FontCache(const FontCache&) = delete;
  FontCache& operator=(const FontCache&) = delete;

  const std::u16string& fontsFolder() const { return fontsFolder_; }

  std::set<std::u16string> familyNames();
  // The record of the first name that matches: the PostScript name, then the full names, then
  // the family; the default font (an "Arial" face, else "Courier New", else the first) when none
  // does. An empty PostScript name stands for the full name. Never fails.
  FontRecord findFont(const std::u16string& postScriptName, const std::u16string& familyName,
                      const std::u16string& fullName);
  // Whether findFont would find a record before falling back to the default.
  bool hasFont(const std::u16string& postScriptName, const std::u16string& familyName,
               const std::u16string& fullName);
  // Every record, in PostScript-name order.
  std::vector<FontRecord> records();

 private:
  void ensureLoaded();
  void load();
  void readInstalledFonts(platform::FontHive hive);
  void enumerateFaces(std::map<std::u16string, FontRecord>& loaded);
  void addEnumeratedFace(const platform::EnumeratedFace& face, bool readFile,
                         std::map<std::u16string, FontRecord>& into);
  const FontFileReader& readerFor(const std::u16string& path);
  void index(std::map<std::u16string, FontRecord>& loaded);
  void chooseDefault();
  int32_t lookUp(const std::u16string& postScriptName, const std::u16string& familyName,
                 const std::u16string& fullName) const;
  FontRecord recordAt(int32_t index) const;

  std::shared_ptr<const platform::SystemServices> services_;
  std::u16string fontsFolder_;
  std::recursive_mutex mutex_;
  std::atomic<bool> loaded_{false};

  std::vector<FontRecord> records_;
  std::map<std::u16string, int32_t> byPostScriptName_;
  std::map<std::u16string, int32_t> byFullName_;
  std::map<std::u16string, int32_t> byGdiFullName_;
  std::map<std::u16string, int32_t> byFamily_;
  int32_t defaultIndex_ = 0;
  std::set<std::u16string> familyNames_;
  std::map<std::u16string, FontFileRef> registryFonts_;                // only while loading
  std::map<std::u16string, std::unique_ptr<FontFileReader>> readers_;  // only while loading

  std::u16string lastPostScriptName_;
  std::u16string lastFullName_;
  int32_t lastIndex_ = -1;
};

// The record of a single name (PostScript, full or family name); an empty record for an empty
// name.
FontRecord fontRecordForName(const std::u16string& name);
// Whether a font of that name is installed; false for a null name.
bool isFontAvailable(const char16_t* name);

// A font file name from an installed-font list as a path: a name relative to the fonts folder
// gets the folder in front; a drive path ("C:\...", upper-case drive letter) or an absolute
// POSIX path stays as it is.
std::u16string resolveFontFile(const std::u16string& fontsFolder, const std::u16string& file);
// An installed-font list's display name as a key: lower case, without " (truetype)" and
// " (opentype)".
std::u16string displayNameKey(const std::u16string& displayName);

}  // namespace vesk::project

#endif  // WAVEFORM_FONTS_FONT_CACHE_H
