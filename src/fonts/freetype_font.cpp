#include "fonts/freetype_font.h"

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_MULTIPLE_MASTERS_H

#include <algorithm>
#include <cmath>
#include <fstream>
#include <stdexcept>
#include <utility>

#include "fonts/glyph_conversion.h"
#include "platform/utf16_text.h"
#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

using vesk::project::FontRecord;

namespace {

// Tried in this order; the first under which the face has a character is kept. Unicode comes
// again at the end so that a face with no usable map is left on its Unicode map, if it has one.
const FT_Encoding kEncodings[] = {
    FT_ENCODING_UNICODE,      FT_ENCODING_MS_SYMBOL,      FT_ENCODING_SJIS,
    FT_ENCODING_PRC,          FT_ENCODING_BIG5,           FT_ENCODING_WANSUNG,
    FT_ENCODING_JOHAB,        FT_ENCODING_ADOBE_STANDARD, FT_ENCODING_ADOBE_EXPERT,
    FT_ENCODING_ADOBE_CUSTOM, FT_ENCODING_ADOBE_LATIN_1,  FT_ENCODING_OLD_LATIN_2,
    FT_ENCODING_APPLE_ROMAN,  FT_ENCODING_UNICODE};

// The platform is asked for a family name of at most this many UTF-16 units.
constexpr size_t kMaxFamilyNameLength = 31;

bool approximatelyEqual(float a, float b) {
  return std::fabs(a - b) <= 0.00001f * std::max(std::fabs(a) + 1.0f, std::fabs(b) + 1.0f);
}

bool contains(const std::u16string& text, const std::u16string& part) {
  return text.find(part) != std::u16string::npos;
}

}  // namespace

std::shared_ptr<FreeTypeFont> FreeTypeFont::instance() {
  static std::mutex creation;
  static std::shared_ptr<FreeTypeFont> font;
  std::lock_guard<std::mutex> lock(creation);
  if (!font) {
    font = std::make_shared<FreeTypeFont>(vesk::project::FontCache::instance(),
                                          platform::systemServices());
  }
  return font;
}

FreeTypeFont::FreeTypeFont(std::shared_ptr<vesk::project::FontCache> fontCache,
                           std::shared_ptr<const platform::SystemServices> services,
                           std::filesystem::path unicodeDataFolder)
    : characterCache_(std::make_shared<CharacterCache>(kCharacterCacheCapacity)),
      fontCache_(std::move(fontCache)),
      services_(std::move(services)),
      unicodeDataFolder_(std::move(unicodeDataFolder)),
      harfBuzz_(std::make_shared<HarfBuzzWrapper>()) {
  if (FT_Init_FreeType(&library_) != 0) {
    throw std::runtime_error("failed to initialise the freetype library");
  }
}

FreeTypeFont::~FreeTypeFont() {
  releaseFace();
  FT_Done_FreeType(library_);
}

void FreeTypeFont::chooseDefaultRecord() {
  if (!defaultFont_.fullName.empty() || !defaultFont_.postScriptName.empty() || !fontCache_) {
    return;
  }
  if (fontCache_->familyNames().empty()) {
    throw std::runtime_error("FreeTypeFont ctor - availableFonts is empty");
  }
  if (defaultFont_.familyName.empty()) {
    defaultFont_ = fontCache_->findFont(u"Arial", u"Arial", u"Arial");
  }
  if (defaultFont_.familyName.empty()) {
    throw std::runtime_error("FreeTypeFont ctor - cannot set m_defaultFont");
  }
}

FontRecord FreeTypeFont::defaultFont() {
  if (!defaultFont_.fullName.empty() || !defaultFont_.postScriptName.empty() || !fontCache_) {
    return defaultFont_;
  }
  chooseDefaultRecord();
  setFont(defaultFont_);
  return defaultFont_;
}

void FreeTypeFont::releaseFace() {
  if (face_ != nullptr) {
    harfBuzz_->releaseFont();
    FT_Done_Face(face_);
    face_ = nullptr;
  }
  // Only after the face that read from it is closed.
  fontData_.clear();
  fontData_.shrink_to_fit();
}

bool FreeTypeFont::readFile(const std::u16string& path) {
  fontData_.clear();
  if (path.empty()) {
    return false;
  }
  std::ifstream file(std::filesystem::path(platform::toUtf8(path)), std::ios::binary);
  if (!file) {
    return false;
  }
  file.seekg(0, std::ios::end);
  const std::streamoff size = file.tellg();
  if (size <= 0) {
    return false;
  }
  file.seekg(0, std::ios::beg);
  fontData_.resize(static_cast<size_t>(size));
  if (!file.read(reinterpret_cast<char*>(fontData_.data()), size)) {
    fontData_.clear();
    return false;
  }
  ++fileReads_;
  return true;
}

bool FreeTypeFont::readPlatformData(const FontRecord& record) {
  fontData_.clear();
  if (!services_ || record.familyName.empty()) {
    return false;
  }
  const std::u16string family = record.familyName.substr(0, kMaxFamilyNameLength);
  const bool bold = contains(record.styleName, u"Bold");
  const bool italic =
      contains(record.styleName, u"Italic") || contains(record.styleName, u"Oblique");
  fontData_ = services_->fontData(family, bold, italic);
  return !fontData_.empty();
}

bool FreeTypeFont::openFace(int32_t faceIndex) {
  // FreeType reads a negative index as "count the faces only" and the upper 16 bits as a named
  // instance; neither may come from a record.
  if (fontData_.empty() || faceIndex < 0 || faceIndex > 0xFFFF) {
    return false;
  }
  if (FT_New_Memory_Face(library_, fontData_.data(), static_cast<FT_Long>(fontData_.size()),
                         faceIndex, &face_) != 0) {
    face_ = nullptr;
    return false;
  }
  return true;
}

void FreeTypeFont::selectNamedInstance(int32_t instanceId) {
  FT_UInt instance = 0;
  FT_MM_Var* variation = nullptr;
  if (instanceId != 0 && FT_Get_MM_Var(face_, &variation) == 0) {
    for (FT_UInt i = 0; i < variation->num_namedstyles; ++i) {
      if (variation->namedstyle[i].strid == static_cast<FT_UInt>(instanceId)) {
        instance = i + 1;
        break;
      }
    }
    FT_Done_MM_Var(library_, variation);
  }
  FT_Set_Named_Instance(face_, instance);
}

void FreeTypeFont::selectCharacterMap() {
  for (const FT_Encoding encoding : kEncodings) {
    if (FT_Select_Charmap(face_, encoding) != 0) {
      continue;
    }
    FT_UInt glyph = 0;
    FT_Get_First_Char(face_, &glyph);
    if (glyph != 0) {
      return;
    }
  }
}

bool FreeTypeFont::setFont(const FontRecord& record) {
  // The same font as now only when its face is loaded: after a failure no face is, and the
  // request must be tried again.
  if (face_ != nullptr && record.postScriptName == currentFont_.postScriptName) {
    harfBuzz_->setFace(face_);
    return true;
  }
  releaseFace();
  currentFont_ = FontRecord();

  // Before the default is chosen no record is the default, not even one without a name.
  const bool defaultChosen = !defaultFont_.postScriptName.empty() || !defaultFont_.fullName.empty();
  bool isDefault = defaultChosen && record.postScriptName == defaultFont_.postScriptName;
  // The face (and named instance) to open in the data read: the record's, or the default
  // font's once the data are the default font's file.
  int32_t faceIndex = record.faceIndex;
  int32_t instanceId = record.instanceId;
  bool read = readFile(record.filePath) || readPlatformData(record);
  if (!read) {
    isDefault = true;
    chooseDefaultRecord();
    read = readFile(defaultFont_.filePath);
    faceIndex = defaultFont_.faceIndex;
    instanceId = defaultFont_.instanceId;
  }
  if (read && openFace(faceIndex)) {
    selectNamedInstance(instanceId);
  } else if (!isDefault) {
    chooseDefaultRecord();
    if (!readFile(defaultFont_.filePath) || !openFace(defaultFont_.faceIndex)) {
      releaseFace();
      return false;
    }
  } else {
    releaseFace();
    return false;
  }
  selectCharacterMap();
  FT_Set_Pixel_Sizes(face_, static_cast<FT_UInt>(pixelSize_), static_cast<FT_UInt>(pixelSize_));
  currentFont_ = record;
  harfBuzz_->setFace(face_);
  harfBuzz_->fontSizeChanged();
  return true;
}

void FreeTypeFont::setPixelSize(float size) {
  const float s = std::max(1.0f, size);
  if (!approximatelyEqual(s, pixelSize_)) {
    pixelSize_ = s;
    if (face_ != nullptr) {
      FT_Set_Pixel_Sizes(face_, static_cast<FT_UInt>(s), static_cast<FT_UInt>(s));
      harfBuzz_->fontSizeChanged();
    }
  }
  scale_ = size < 1.0f ? size : 1.0f;
}

ConvertedGlyph FreeTypeFont::convert(uint32_t glyphIndex, float size) {
  setPixelSize(size);
  return {convertGlyph(face_, glyphIndex, pixelSize_, currentFont_.filePath,
                       static_cast<uint32_t>(currentFont_.faceIndex)),
          scale_};
}

CharacterOutlinePtr FreeTypeFont::characterOutline(uint32_t glyphIndex, const FontRecord& record,
                                                   float size, float bandWidth) {
  if (face_ == nullptr) {
    throw std::runtime_error("FreeTypeFont: no font face is loaded");
  }
  return lib::characterOutline(
      *characterCache_, characterCacheKey(record), {glyphIndex, size, bandWidth},
      [this](uint32_t index, float glyphSize) { return convert(index, glyphSize); });
}

std::shared_ptr<UnicodeHelper> FreeTypeFont::unicodeHelper() {
  if (!unicodeHelper_) {
    unicodeHelper_ = std::make_shared<UnicodeHelper>(
        unicodeDataFolder_.empty() ? defaultUnicodeDataFolder() : unicodeDataFolder_);
  }
  return unicodeHelper_;
}

}  // namespace vesk::plugin::lib
