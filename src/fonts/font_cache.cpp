#include "fonts/font_cache.h"

#include <cstdlib>
#include <cwctype>
#include <stdexcept>
#include <tuple>

namespace vesk::project {
namespace {

constexpr char16_t kVerticalFaceMark = u'@';
constexpr size_t kLongestFaceName = 31;  // what the enumeration of one family takes
constexpr int32_t kNoIndex = -1;

bool isEnumerable(const platform::EnumeratedFace& face) {
  const bool scalableOrDevice =
      face.fontType == platform::kDeviceFontType || face.fontType == platform::kTrueTypeFontType;
  return scalableOrDevice && (face.faceName.empty() || face.faceName[0] != kVerticalFaceMark);
}

bool isRegularStyle(const std::u16string& style) {
  return style.empty() || style == u"Regular";
}

// How far a face is from the upright, normal-width face of weight 400: a face without a file
// farthest, then a named instance, then a slanted face, then by weight, then by width.
using Irregularity = std::tuple<bool, bool, bool, int, int>;
Irregularity irregularityOf(const FontRecord& record, const FontFileReader* reader) {
  const FontFileReader::StyleClass style =
      reader != nullptr ? reader->styleClass(record.faceIndex) : FontFileReader::StyleClass{};
  return {reader == nullptr, record.instanceId != 0, style.slanted, std::abs(style.weight - 400),
          std::abs(style.width - 5)};
}

// The record an enumeration reports before anything is read from the file.
FontRecord enumeratedRecord(const platform::EnumeratedFace& face) {
  FontRecord record;
  record.familyName = record.gdiFamilyName = face.faceName;
  record.styleName = face.style;
  record.fullName = record.postScriptName = record.gdiFullName = face.fullName;
  return record;
}

void fillFromFile(FontRecord& record, const FontFileReader& reader) {
  const int32_t face = record.faceIndex;
  record.sampleText = reader.sampleText(face);
  if (const std::u16string family = reader.familyNameUtf16(face); !family.empty()) {
    record.familyName = family;
  }
  record.embeddable = reader.isEmbeddable(face);
  record.subscriptSize = reader.subscriptSize(face);
  record.subscriptOffset = reader.subscriptOffset(face);
  record.superscriptSize = reader.superscriptSize(face);
  record.superscriptOffset = reader.superscriptOffset(face);
  record.strikeoutSize = reader.strikeoutSize(face);
  record.strikeoutPosition = reader.strikeoutPosition(face);
  record.underlinePosition = reader.underlinePosition(face);
  record.underlineThickness = reader.underlineThickness(face);

  if (record.instanceId > 0) {
    for (const NamedInstance& instance : reader.namedInstances(face)) {
      if (instance.subfamilyNameID != record.instanceId) {
        continue;
      }
      record.styleName = utf8ToUtf16(instance.subfamilyName);
      record.fullName = reader.fullNameUtf16(face) + u" " + record.styleName;
      record.postScriptName =
          instance.postScriptName.empty() ? record.fullName : utf8ToUtf16(instance.postScriptName);
      return;
    }
  }
  if (std::u16string style = reader.styleNameUtf16(face); !style.empty()) {
    record.styleName = std::move(style);
  }
  if (std::u16string full = reader.fullNameUtf16(face); !full.empty()) {
    record.fullName = std::move(full);
  }
  if (std::u16string postScript = reader.postScriptNameUtf16(face); !postScript.empty()) {
    record.postScriptName = std::move(postScript);
  }
}

void removeAll(std::u16string& text, const std::u16string& part) {
  for (size_t at = text.find(part); at != std::u16string::npos; at = text.find(part, at)) {
    text.erase(at, part.size());
  }
}

}  // namespace

std::u16string resolveFontFile(const std::u16string& fontsFolder, const std::u16string& file) {
  const bool drivePath =
      file.size() >= 4 && file[0] >= u'A' && file[0] <= u'Z' && file[1] == u':' && file[2] == u'\\';
  const bool posixPath = !file.empty() && file[0] == u'/';
  return drivePath || posixPath ? file : fontsFolder + file;
}

std::u16string displayNameKey(const std::u16string& displayName) {
  std::u16string key = displayName;
  for (char16_t& unit : key) {
    // Surrogate halves are not characters of their own; they stay as they are.
    if (unit < 0xD800 || unit > 0xDFFF) {
      unit = static_cast<char16_t>(std::towlower(static_cast<wint_t>(unit)));
    }
  }
  removeAll(key, u" (truetype)");
  removeAll(key, u" (opentype)");
  return key;
}

std::shared_ptr<FontCache> FontCache::instance() {
  static std::mutex creation;
  static std::shared_ptr<FontCache> cache;
  const std::lock_guard<std::mutex> guard(creation);
  if (cache == nullptr) {
    cache = std::make_shared<FontCache>(platform::systemServices());
  }
  return cache;
}

FontCache::FontCache(std::shared_ptr<const platform::SystemServices> services)
    : services_(std::move(services)) {
  const std::optional<std::u16string> folder =
      services_ != nullptr ? services_->fontsFolder() : std::nullopt;
  if (!folder || folder->empty()) {
    throw std::runtime_error("Cannot get system fonts path");
  }
  fontsFolder_ = *folder;
  if (fontsFolder_.back() != u'/' && fontsFolder_.back() != u'\\') {
    fontsFolder_ += u'/';
  }
}

void FontCache::ensureLoaded() {
  if (loaded_) {
    return;
  }
  const std::lock_guard<std::recursive_mutex> guard(mutex_);
  if (loaded_) {
    return;
  }
  // Set first: a load that fails part-way is not repeated.
  loaded_ = true;
  load();
}

void FontCache::load() {
  records_.clear();
  byPostScriptName_.clear();
  byFullName_.clear();
  byGdiFullName_.clear();
  byFamily_.clear();
  familyNames_.clear();
  registryFonts_.clear();
  defaultIndex_ = 0;
  lastIndex_ = kNoIndex;

  // A per-user font replaces a machine font of the same name.
  readInstalledFonts(platform::FontHive::kMachine);
  readInstalledFonts(platform::FontHive::kUser);
  std::map<std::u16string, FontRecord> loaded;  // by PostScript name; the first one stays
  enumerateFaces(loaded);
  index(loaded);
  chooseDefault();
  registryFonts_.clear();
  readers_.clear();
}

const FontFileReader& FontCache::readerFor(const std::u16string& path) {
  std::unique_ptr<FontFileReader>& reader = readers_[path];
  if (reader == nullptr) {
    reader = std::make_unique<FontFileReader>(path, services_->userLanguageId());
  }
  return *reader;
}

void FontCache::readInstalledFonts(platform::FontHive hive) {
  const std::optional<std::vector<platform::InstalledFont>> fonts = services_->installedFonts(hive);
  if (!fonts) {
    return;
  }
  for (const platform::InstalledFont& font : *fonts) {
    const std::u16string path = resolveFontFile(fontsFolder_, font.file);
    const FontFileReader& reader = readerFor(path);
    bool named = false;
    for (int32_t face = 0; face < reader.faceCount(); ++face) {
      const std::vector<NamedInstance>& instances = reader.namedInstances(face);
      for (const NamedInstance& instance : instances) {
        if (!instance.postScriptName.empty()) {
          registryFonts_[utf8ToUtf16(instance.postScriptName)] = {instance.subfamilyNameID, face,
                                                                  path};
        }
      }
      // The face and each of its instances under a name, the instance's style appended.
      const auto addNames = [&](const std::u16string& name) {
        registryFonts_[name] = {0, face, path};
        for (const NamedInstance& instance : instances) {
          registryFonts_[name + u" " + utf8ToUtf16(instance.subfamilyName)] = {
              instance.subfamilyNameID, face, path};
        }
      };
      const std::u16string postScriptName = reader.postScriptNameUtf16(face);
      if (!postScriptName.empty()) {
        named = true;
        addNames(postScriptName);
      }
      const std::u16string fullName = reader.fullNameUtf16(face);
      if (!fullName.empty() && fullName != postScriptName) {
        addNames(fullName);
      }
    }
    // A file without names is still known under its display name.
    if (!named) {
      registryFonts_[displayNameKey(font.name)] = {0, 0, path};
    }
  }
}

void FontCache::enumerateFaces(std::map<std::u16string, FontRecord>& loaded) {
  // One face per family first, then every face of each of those families.
  std::map<std::u16string, FontRecord> families;
  for (const platform::EnumeratedFace& face : services_->enumerateFamilies()) {
    addEnumeratedFace(face, false, families);
  }
  for (const auto& [postScriptName, family] : families) {
    if (family.familyName.empty()) {
      continue;
    }
    for (const platform::EnumeratedFace& face :
         services_->enumerateFaces(family.familyName.substr(0, kLongestFaceName))) {
      addEnumeratedFace(face, true, loaded);
    }
  }
}

void FontCache::addEnumeratedFace(const platform::EnumeratedFace& face, bool readFile,
                                  std::map<std::u16string, FontRecord>& into) {
  if (!isEnumerable(face)) {
    return;
  }
  FontRecord record = enumeratedRecord(face);
  const auto entry = registryFonts_.find(face.fullName);
  if (readFile && entry != registryFonts_.end()) {
    record.filePath = resolveFontFile(fontsFolder_, entry->second.filePath);
    record.faceIndex = entry->second.faceIndex;
    record.instanceId = entry->second.instanceId;
    fillFromFile(record, readerFor(record.filePath));
  }
  into.emplace(record.postScriptName, std::move(record));
}

void FontCache::index(std::map<std::u16string, FontRecord>& loaded) {
  records_.reserve(loaded.size());
  std::set<std::u16string> withRegularStyle;
  std::map<std::u16string, Irregularity> named;  // of the face a family names, while it has none
  for (auto& [postScriptName, record] : loaded) {
    const auto at = static_cast<int32_t>(records_.size());
    if (!record.postScriptName.empty()) {
      byPostScriptName_[record.postScriptName] = at;
    }
    if (!record.fullName.empty()) {
      byFullName_[record.fullName] = at;
    }
    if (!record.gdiFullName.empty()) {
      byGdiFullName_[record.gdiFullName] = at;
    }
    // A family names its last face styled "Regular" (or not styled). A family without one, such
    // as one whose regular face is its "Roman" or "Book", names its most regular face, the
    // first of equals.
    if (isRegularStyle(record.styleName)) {
      withRegularStyle.insert(record.familyName);
      byFamily_[record.familyName] = at;
    } else if (withRegularStyle.count(record.familyName) == 0) {
      const Irregularity irregularity =
          irregularityOf(record, record.filePath.empty() ? nullptr : &readerFor(record.filePath));
      const auto best = named.find(record.familyName);
      if (best == named.end() || irregularity < best->second) {
        named[record.familyName] = irregularity;
        byFamily_[record.familyName] = at;
      }
    }
    familyNames_.insert(record.familyName);
    records_.push_back(std::move(record));
  }
}

void FontCache::chooseDefault() {
  for (const std::u16string family : {u"Arial", u"Courier New"}) {
    bool matched = false;
    for (size_t i = 0; i < records_.size(); ++i) {
      const FontRecord& record = records_[i];
      if (record.familyName != family && record.gdiFamilyName != family) {
        continue;
      }
      matched = true;
      defaultIndex_ = static_cast<int32_t>(i);
      if (isRegularStyle(record.styleName)) {
        break;
      }
    }
    if (matched) {
      return;
    }
  }
  defaultIndex_ = 0;
}

int32_t FontCache::lookUp(const std::u16string& postScriptName, const std::u16string& familyName,
                          const std::u16string& fullName) const {
  const std::pair<const std::map<std::u16string, int32_t>*, const std::u16string*> tries[] = {
      {&byPostScriptName_, &postScriptName},
      {&byFullName_, &postScriptName},
      {&byFullName_, &fullName},
      {&byGdiFullName_, &fullName},
      {&byFamily_, &familyName},
  };
  for (const auto& [map, name] : tries) {
    if (const auto found = map->find(*name); found != map->end()) {
      return found->second;
    }
  }
  return kNoIndex;
}

FontRecord FontCache::recordAt(int32_t index) const {
  // Nothing installed at all: an empty record.
  return index >= 0 && static_cast<size_t>(index) < records_.size() ? records_[index]
                                                                    : FontRecord{};
}

std::set<std::u16string> FontCache::familyNames() {
  ensureLoaded();
  const std::lock_guard<std::recursive_mutex> guard(mutex_);
  return familyNames_;
}

FontRecord FontCache::findFont(const std::u16string& postScriptName,
                               const std::u16string& familyName, const std::u16string& fullName) {
  ensureLoaded();
  const std::lock_guard<std::recursive_mutex> guard(mutex_);
  const std::u16string& postScript = postScriptName.empty() ? fullName : postScriptName;
  // The memo looks at the two names only, not at the family.
  if (lastIndex_ != kNoIndex && postScript == lastPostScriptName_ && fullName == lastFullName_) {
    return recordAt(lastIndex_);
  }
  lastPostScriptName_ = postScript;
  lastFullName_ = fullName;
  const int32_t found = lookUp(postScript, familyName, fullName);
  lastIndex_ = found != kNoIndex ? found : defaultIndex_;
  return recordAt(lastIndex_);
}

bool FontCache::hasFont(const std::u16string& postScriptName, const std::u16string& familyName,
                        const std::u16string& fullName) {
  ensureLoaded();
  const std::lock_guard<std::recursive_mutex> guard(mutex_);
  const std::u16string& postScript = postScriptName.empty() ? fullName : postScriptName;
  return lookUp(postScript, familyName, fullName) != kNoIndex;
}

std::vector<FontRecord> FontCache::records() {
  ensureLoaded();
  const std::lock_guard<std::recursive_mutex> guard(mutex_);
  return records_;
}

FontRecord fontRecordForName(const std::u16string& name) {
  return name.empty() ? FontRecord{} : FontCache::instance()->findFont(name, name, name);
}

bool isFontAvailable(const char16_t* name) {
  if (name == nullptr) {
    return false;
  }
  const std::u16string text(name);
  return FontCache::instance()->hasFont(text, text, text);
}

}  // namespace vesk::project
