#include "platform/fontconfig_fonts.h"

#include <fontconfig/fontconfig.h>
#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_SFNT_NAMES_H

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <mutex>
#include <set>
#include <tuple>
#include <utility>

#include "platform/utf16_text.h"

namespace platform {
namespace {

// A face name as the enumeration takes it holds at most 31 UTF-16 units (a LOGFONT face name
// and its terminating nul); longer names are compared by their first 31 units.
constexpr size_t kFaceNameUnits = 31;

// One face (or named instance) fontconfig lists. The names are chosen once: the family is the
// first English family name, the style the first English style, the full name the first English
// full name that starts with the family. The enumeration names the face by the full names of
// the file's Windows name table instead when it has them (see enumeratedFullName).
struct Face {
  std::string file;  // absolute
  int index = 0;     // face index, with the named instance in the upper 16 bits
  bool namedInstance = false;
  bool outline = true;
  std::string format;  // FC_FONTFORMAT: "TrueType", "CFF", "PCF"...
  double weight = FC_WEIGHT_REGULAR;
  double slant = FC_SLANT_ROMAN;
  double width = FC_WIDTH_NORMAL;
  std::vector<std::u16string> familyNames;  // every family name, as fontconfig orders them
  std::vector<std::u16string> englishFamilies;
  std::vector<std::u16string> englishStyles;
  std::u16string family;
  std::u16string style;
  std::u16string fullName;
  std::map<uint16_t, std::u16string> windowsFullNames;  // name ID 4 by Windows language ID
  FcPattern* pattern = nullptr;                         // owned by the listed font set
};

std::vector<std::string> stringsOf(FcPattern* pattern, const char* object) {
  std::vector<std::string> values;
  FcChar8* value = nullptr;
  for (int i = 0; FcPatternGetString(pattern, object, i, &value) == FcResultMatch; ++i) {
    values.emplace_back(reinterpret_cast<const char*>(value));
  }
  return values;
}

bool isEnglish(const std::string& language) {
  return language == "en" || language.rfind("en-", 0) == 0;
}

// The values tagged English, in order; a value without a language tag is not English.
std::vector<std::u16string> englishValues(FcPattern* pattern, const char* object,
                                          const char* languageObject) {
  const std::vector<std::string> values = stringsOf(pattern, object);
  const std::vector<std::string> languages = stringsOf(pattern, languageObject);
  std::vector<std::u16string> english;
  for (size_t i = 0; i < values.size() && i < languages.size(); ++i) {
    if (isEnglish(languages[i])) {
      english.push_back(toUtf16(values[i]));
    }
  }
  return english;
}

std::u16string firstOf(const std::vector<std::u16string>& preferred, FcPattern* pattern,
                       const char* object) {
  if (!preferred.empty()) {
    return preferred.front();
  }
  const std::vector<std::string> all = stringsOf(pattern, object);
  return all.empty() ? std::u16string() : toUtf16(all.front());
}

double numberOf(FcPattern* pattern, const char* object, double missing) {
  double value = 0;
  return FcPatternGetDouble(pattern, object, 0, &value) == FcResultMatch ? value : missing;
}

bool startsWith(const std::u16string& text, const std::u16string& prefix) {
  return text.compare(0, prefix.size(), prefix) == 0;
}

bool endsWith(const std::u16string& text, const std::u16string& suffix) {
  return text.size() >= suffix.size() &&
         text.compare(text.size() - suffix.size(), suffix.size(), suffix) == 0;
}

std::u16string joined(const std::u16string& first, const std::u16string& second) {
  if (first.empty() || second.empty()) {
    return first + second;
  }
  return first + u' ' + second;
}

// A named instance's full name: its font's and its own style, the form the font catalogue keys
// instances by. Fontconfig gives a named instance the full name of its font.
std::u16string withInstanceStyle(const std::u16string& fullName, const Face& face) {
  if (face.namedInstance && !face.style.empty() && fullName != face.style &&
      !endsWith(fullName, u' ' + face.style)) {
    return joined(fullName, face.style);
  }
  return fullName;
}

// The face's full name: the first English full name that starts with its family (a collection
// face may list its sibling's name first), else the first English one, else any, else family and
// style; a named instance's with its style.
std::u16string fullNameOf(FcPattern* pattern, const Face& face) {
  const std::vector<std::u16string> english = englishValues(pattern, FC_FULLNAME, FC_FULLNAMELANG);
  std::u16string fullName;
  for (const std::u16string& name : english) {
    if (startsWith(name, face.family)) {
      fullName = name;
      break;
    }
  }
  if (fullName.empty()) {
    fullName = firstOf(english, pattern, FC_FULLNAME);
  }
  if (fullName.empty()) {
    return joined(face.family, face.style);
  }
  return withInstanceStyle(fullName, face);
}

// The full name the enumeration reports, as the installed-font lists' files name the face: the
// Windows-platform full name in the language the font file reader picks for the user. Fontconfig's
// own choice can be another name: the Macintosh table's ("Nimbus Sans Bold" where the Windows
// table says "NimbusSans-Bold"), or English where the user reads Chinese. The catalogue finds a
// face's file by this name, so it must be the file's own.
std::u16string enumeratedFullName(const Face& face, uint16_t userLanguageId) {
  if (face.windowsFullNames.empty()) {
    return face.fullName;
  }
  std::vector<uint16_t> languages;
  for (const auto& entry : face.windowsFullNames) {
    languages.push_back(entry.first);
  }
  const uint16_t language = languages[preferredNameLanguage(languages, userLanguageId)];
  return withInstanceStyle(face.windowsFullNames.at(language), face);
}

// A face from one listed pattern; none for the pattern of a whole variable font, which is no
// face of its own (its default and named instances are listed beside it).
std::optional<Face> faceOf(FcPattern* pattern) {
  FcBool variable = FcFalse;
  if (FcPatternGetBool(pattern, FC_VARIABLE, 0, &variable) == FcResultMatch && variable) {
    return std::nullopt;
  }
  FcChar8* file = nullptr;
  if (FcPatternGetString(pattern, FC_FILE, 0, &file) != FcResultMatch) {
    return std::nullopt;
  }
  Face face;
  face.file = reinterpret_cast<const char*>(file);
  FcPatternGetInteger(pattern, FC_INDEX, 0, &face.index);
  face.namedInstance = (face.index >> 16) != 0;
  FcBool outline = FcTrue;
  FcPatternGetBool(pattern, FC_OUTLINE, 0, &outline);
  face.outline = outline != FcFalse;
  FcChar8* format = nullptr;
  if (FcPatternGetString(pattern, FC_FONTFORMAT, 0, &format) == FcResultMatch) {
    face.format = reinterpret_cast<const char*>(format);
  }
  face.weight = numberOf(pattern, FC_WEIGHT, FC_WEIGHT_REGULAR);
  face.slant = numberOf(pattern, FC_SLANT, FC_SLANT_ROMAN);
  face.width = numberOf(pattern, FC_WIDTH, FC_WIDTH_NORMAL);
  for (const std::string& name : stringsOf(pattern, FC_FAMILY)) {
    face.familyNames.push_back(toUtf16(name));
  }
  face.englishFamilies = englishValues(pattern, FC_FAMILY, FC_FAMILYLANG);
  face.englishStyles = englishValues(pattern, FC_STYLE, FC_STYLELANG);
  face.family = firstOf(face.englishFamilies, pattern, FC_FAMILY);
  face.style = firstOf(face.englishStyles, pattern, FC_STYLE);
  face.fullName = fullNameOf(pattern, face);
  face.pattern = pattern;
  return face;
}

std::u16string faceNameKey(const std::u16string& name) {
  return name.substr(0, kFaceNameUnits);
}

// The family name of the face that the (cut) key names; none when the face is not of it.
std::optional<std::u16string> familyMatching(const Face& face, const std::u16string& key) {
  for (const std::u16string& name : face.familyNames) {
    if (faceNameKey(name) == key) {
      return name;
    }
  }
  return std::nullopt;
}

// The style that goes with one of the face's family names. Fontconfig lists the typographic
// family and style first and the legacy ones after them ("DejaVu Sans" / "Condensed Bold", then
// "DejaVu Sans Condensed" / "Bold"); when the English families and styles pair up one to one,
// the family's own style is the one at its position.
std::u16string styleFor(const Face& face, const std::u16string& family) {
  if (face.englishFamilies.size() == face.englishStyles.size()) {
    for (size_t i = 0; i < face.englishFamilies.size(); ++i) {
      if (face.englishFamilies[i] == family) {
        return face.englishStyles[i];
      }
    }
  }
  return face.style;
}

// Whether the enumeration reports the face: a face of a file the installed-font lists name, or a
// bitmap-only face (as a raster face). Other outline formats, such as Type 1, are left out: no
// list names their files, so the catalogue could give them none. (Debian installs the same
// families as Type 1 and as OpenType; listing the Type 1 faces would also hide the OpenType
// faces of the same names.)
bool isEnumerated(const Face& face) {
  return !face.outline || installedFontName(face.family, face.style, face.format, true);
}

int32_t fontTypeOf(const Face& face) {
  return face.outline ? kTrueTypeFontType : kRasterFontType;
}

// How far a face is from the upright, normal-width regular face; smaller is more regular.
std::tuple<bool, bool, double, double> irregularity(const Face& face) {
  return {face.namedInstance, face.slant != FC_SLANT_ROMAN,
          std::abs(face.weight - FC_WEIGHT_REGULAR), std::abs(face.width - FC_WIDTH_NORMAL)};
}

std::string lexicallyNormal(const std::string& path) {
  return std::filesystem::path(path).lexically_normal().string();
}

std::string withSlash(std::string folder) {
  if (folder.empty() || folder.back() != '/') {
    folder += '/';
  }
  return folder;
}

bool isInside(const std::string& path, const std::string& folder) {
  const std::string normalFolder = withSlash(lexicallyNormal(folder));
  return lexicallyNormal(path).compare(0, normalFolder.size(), normalFolder) == 0;
}

std::vector<std::string> fontDirectories(FcConfig* config) {
  std::vector<std::string> folders;
  FcStrList* list = FcConfigGetFontDirs(config);
  if (list == nullptr) {
    return folders;
  }
  while (FcChar8* folder = FcStrListNext(list)) {
    folders.push_back(withSlash(lexicallyNormal(reinterpret_cast<const char*>(folder))));
  }
  FcStrListDone(list);
  return folders;
}

// See FontconfigFonts::fontsFolder. Fontconfig reports its directories in no useful order (the
// user's folders and empty ones may come first), so the folder is chosen by what it holds.
std::optional<std::string> chooseFontsFolder(const std::vector<std::string>& folders,
                                             const std::vector<std::string>& userFolders,
                                             const std::vector<Face>& faces) {
  std::vector<std::string> system;
  for (const std::string& folder : folders) {
    if (fontHiveOfFile(folder, userFolders) == FontHive::kMachine) {
      system.push_back(folder);
    }
  }
  std::vector<std::string> holding;
  for (const std::string& folder : system) {
    const bool holds = std::any_of(faces.begin(), faces.end(),
                                   [&](const Face& face) { return isInside(face.file, folder); });
    if (holds) {
      holding.push_back(folder);
    }
  }
  for (const std::string& folder : holding) {
    const bool nested = std::any_of(holding.begin(), holding.end(), [&](const std::string& outer) {
      return outer != folder && isInside(folder, outer);
    });
    if (!nested) {
      return folder;
    }
  }
  for (const std::string& folder : system) {
    std::error_code error;
    if (std::filesystem::is_directory(folder, error)) {
      return folder;
    }
  }
  if (!folders.empty()) {
    return folders.front();
  }
  return std::nullopt;
}

// The faces of every listed pattern, in file and face order.
std::vector<Face> facesOf(FcFontSet* listed) {
  std::vector<Face> faces;
  for (int i = 0; listed != nullptr && i < listed->nfont; ++i) {
    if (std::optional<Face> face = faceOf(listed->fonts[i])) {
      faces.push_back(std::move(*face));
    }
  }
  std::sort(faces.begin(), faces.end(), [](const Face& a, const Face& b) {
    return std::tie(a.file, a.index) < std::tie(b.file, b.index);
  });
  return faces;
}

// The full names (name ID 4) of the Windows name table of a file's face, by language, read as
// the font file reader reads them: a later record of a language replaces an earlier one, a text
// ends at its first zero unit, and one that is not well-formed UTF-16 is passed over.
std::map<uint16_t, std::u16string> windowsFullNames(FT_Library library, const std::string& file,
                                                    int faceIndex) {
  constexpr FT_UShort kWindowsPlatform = 3;
  constexpr FT_UShort kFullNameId = 4;
  std::map<uint16_t, std::u16string> names;
  FT_Face face = nullptr;
  if (library == nullptr || FT_New_Face(library, file.c_str(), faceIndex, &face) != 0) {
    return names;
  }
  const FT_UInt count = FT_IS_SFNT(face) ? FT_Get_Sfnt_Name_Count(face) : 0;
  for (FT_UInt i = 0; i < count; ++i) {
    FT_SfntName name{};
    if (FT_Get_Sfnt_Name(face, i, &name) != 0 || name.platform_id != kWindowsPlatform ||
        name.name_id != kFullNameId) {
      continue;
    }
    std::u16string text;
    for (FT_UInt at = 0; at < name.string_len; at += 2) {
      const uint8_t low = at + 1 < name.string_len ? name.string[at + 1] : 0;
      const auto unit = static_cast<char16_t>((name.string[at] << 8) | low);
      if (unit == 0) {
        break;
      }
      text += unit;
    }
    if (!text.empty() && toUtf8Strict(text)) {
      names[name.language_id] = std::move(text);
    }
  }
  FT_Done_Face(face);
  return names;
}

// Reads the Windows full names of every face the enumeration reports by them; the named
// instances of a face share its names.
void readWindowsFullNames(std::vector<Face>& faces) {
  FT_Library library = nullptr;
  if (FT_Init_FreeType(&library) != 0) {
    return;
  }
  std::map<std::pair<std::string, int>, std::map<uint16_t, std::u16string>> read;
  for (Face& face : faces) {
    if (!face.outline || !isEnumerated(face)) {
      continue;
    }
    const std::pair<std::string, int> key(face.file, face.index & 0xFFFF);
    auto found = read.find(key);
    if (found == read.end()) {
      found = read.emplace(key, windowsFullNames(library, key.first, key.second)).first;
    }
    face.windowsFullNames = found->second;
  }
  FT_Done_FreeType(library);
}

std::vector<uint8_t> fileBytes(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    return {};
  }
  return std::vector<uint8_t>(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

}  // namespace

std::vector<std::string> userFontFolders() {
  const char* home = std::getenv("HOME");
  const std::string homeFolder = home != nullptr && home[0] != '\0' ? withSlash(home) : "";
  const char* dataHome = std::getenv("XDG_DATA_HOME");
  std::vector<std::string> folders;
  if (dataHome != nullptr && dataHome[0] == '/') {
    folders.push_back(withSlash(dataHome) + "fonts/");
  } else if (!homeFolder.empty()) {
    folders.push_back(homeFolder + ".local/share/fonts/");
  }
  if (!homeFolder.empty()) {
    folders.push_back(homeFolder + ".fonts/");
  }
  return folders;
}

std::optional<std::u16string> installedFontName(const std::u16string& family,
                                                const std::u16string& style,
                                                const std::string& format, bool outline) {
  if (!outline) {
    return std::nullopt;
  }
  if (format == "TrueType") {
    return joined(family, style) + u" (TrueType)";
  }
  if (format == "CFF") {
    return joined(family, style) + u" (OpenType)";
  }
  return std::nullopt;
}

FontHive fontHiveOfFile(const std::string& file, const std::vector<std::string>& userFolders) {
  for (const std::string& folder : userFolders) {
    if (isInside(file, folder)) {
      return FontHive::kUser;
    }
  }
  return FontHive::kMachine;
}

struct FontconfigFonts::State {
  FcConfig* config = nullptr;
  FcFontSet* listed = nullptr;  // owns the patterns the faces point at
  std::vector<std::string> userFolders;
  std::vector<Face> faces;
  std::optional<std::string> fontsFolder;
  std::mutex matchMutex;  // fontData's matching runs on the configuration one call at a time

  ~State() {
    if (listed != nullptr) {
      FcFontSetDestroy(listed);
    }
    if (config != nullptr) {
      FcConfigDestroy(config);
    }
  }
};

FontconfigFonts::FontconfigFonts() : state_(std::make_unique<State>()) {
  state_->userFolders = userFontFolders();
  state_->config = FcInitLoadConfigAndFonts();
  if (state_->config == nullptr) {
    return;
  }
  FcPattern* everything = FcPatternCreate();
  FcObjectSet* objects =
      FcObjectSetBuild(FC_FILE, FC_INDEX, FC_FAMILY, FC_FAMILYLANG, FC_STYLE, FC_STYLELANG,
                       FC_FULLNAME, FC_FULLNAMELANG, FC_FONTFORMAT, FC_OUTLINE, FC_VARIABLE,
                       FC_WEIGHT, FC_SLANT, FC_WIDTH, nullptr);
  state_->listed = FcFontList(state_->config, everything, objects);
  FcObjectSetDestroy(objects);
  FcPatternDestroy(everything);
  state_->faces = facesOf(state_->listed);
  readWindowsFullNames(state_->faces);
  state_->fontsFolder =
      chooseFontsFolder(fontDirectories(state_->config), state_->userFolders, state_->faces);
}

FontconfigFonts::~FontconfigFonts() = default;

std::optional<std::u16string> FontconfigFonts::fontsFolder() const {
  if (!state_->fontsFolder) {
    return std::nullopt;
  }
  return toUtf16(*state_->fontsFolder);
}

std::optional<std::vector<InstalledFont>> FontconfigFonts::installedFonts(FontHive hive) const {
  if (state_->config == nullptr) {
    return std::nullopt;
  }
  const std::string folder = state_->fontsFolder.value_or(std::string());
  std::vector<InstalledFont> fonts;
  // Faces are in file order; the first face met of a file is its lowest index, face 0 when the
  // file has one (a named instance's index is never below its face's).
  std::set<std::string> seen;
  for (const Face& face : state_->faces) {
    if (!seen.insert(face.file).second) {
      continue;
    }
    if (fontHiveOfFile(face.file, state_->userFolders) != hive) {
      continue;
    }
    const std::optional<std::u16string> name =
        installedFontName(face.family, face.style, face.format, face.outline);
    if (!name) {
      continue;
    }
    const bool inFolder = !folder.empty() && isInside(face.file, folder);
    const std::string file = inFolder ? face.file.substr(folder.size()) : face.file;
    fonts.push_back({*name, toUtf16(file)});
  }
  return fonts;
}

std::vector<EnumeratedFace> FontconfigFonts::families() const {
  std::map<std::u16string, const Face*> chosen;
  for (const Face& face : state_->faces) {
    if (face.family.empty() || !isEnumerated(face)) {
      continue;
    }
    const Face*& best = chosen[face.family];
    if (best == nullptr || irregularity(face) < irregularity(*best)) {
      best = &face;
    }
  }
  const uint16_t language = userLanguageIdFromEnvironment();
  std::vector<EnumeratedFace> families;
  for (const auto& [family, face] : chosen) {
    families.push_back(
        {family, face->style, enumeratedFullName(*face, language), fontTypeOf(*face)});
  }
  return families;
}

std::vector<EnumeratedFace> FontconfigFonts::faces(const std::u16string& faceName) const {
  const std::u16string key = faceNameKey(faceName);
  std::vector<EnumeratedFace> faces;
  const uint16_t language = userLanguageIdFromEnvironment();
  std::set<std::tuple<std::u16string, std::u16string, std::u16string>> seen;
  for (const Face& face : state_->faces) {
    const std::optional<std::u16string> family = familyMatching(face, key);
    if (!family || !isEnumerated(face)) {
      continue;
    }
    EnumeratedFace found{*family, styleFor(face, *family), enumeratedFullName(face, language),
                         fontTypeOf(face)};
    if (seen.emplace(found.faceName, found.style, found.fullName).second) {
      faces.push_back(std::move(found));
    }
  }
  return faces;
}

std::vector<uint8_t> FontconfigFonts::fontData(const std::u16string& faceName, bool bold,
                                               bool italic) const {
  const std::u16string key = faceNameKey(faceName);
  std::string family;
  FcFontSet* candidates = FcFontSetCreate();
  for (const Face& face : state_->faces) {
    const std::optional<std::u16string> matching = familyMatching(face, key);
    if (!matching) {
      continue;
    }
    if (family.empty()) {
      family = toUtf8(*matching);
    }
    FcPatternReference(face.pattern);
    FcFontSetAdd(candidates, face.pattern);
  }
  std::string file;
  if (candidates->nfont > 0) {
    // Only the family's own faces are candidates, so fontconfig cannot answer with a substitute.
    FcPattern* wanted = FcPatternCreate();
    FcPatternAddString(wanted, FC_FAMILY, reinterpret_cast<const FcChar8*>(family.c_str()));
    FcPatternAddInteger(wanted, FC_WEIGHT, bold ? FC_WEIGHT_BOLD : FC_WEIGHT_REGULAR);
    FcPatternAddInteger(wanted, FC_SLANT, italic ? FC_SLANT_ITALIC : FC_SLANT_ROMAN);
    FcPatternAddInteger(wanted, FC_WIDTH, FC_WIDTH_NORMAL);
    FcResult result = FcResultNoMatch;
    FcPattern* match = nullptr;
    {
      std::lock_guard<std::mutex> lock(state_->matchMutex);
      match = FcFontSetMatch(state_->config, &candidates, 1, wanted, &result);
    }
    FcChar8* path = nullptr;
    if (match != nullptr && FcPatternGetString(match, FC_FILE, 0, &path) == FcResultMatch) {
      file = reinterpret_cast<const char*>(path);
    }
    if (match != nullptr) {
      FcPatternDestroy(match);
    }
    FcPatternDestroy(wanted);
  }
  FcFontSetDestroy(candidates);
  return file.empty() ? std::vector<uint8_t>() : fileBytes(file);
}

}  // namespace platform
