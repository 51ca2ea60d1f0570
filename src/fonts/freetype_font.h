// The one font object through which the process shapes text and gets glyph outlines. It owns the
// FreeType library and one face at a time (the face of the record selected last), read whole into
// memory and opened from there; the HarfBuzz wrapper bound to that face; the glyph outline cache;
// and the process's UnicodeHelper. It does not lock itself: whoever uses it holds mutex() for
// the whole of a text's set-up and layout.
#ifndef WAVEFORM_FONTS_FREETYPE_FONT_H
#define WAVEFORM_FONTS_FREETYPE_FONT_H

#include <cstdint>
#include <filesystem>
#include <memory>
#include <mutex>
#include <vector>

#include "fonts/character_cache.h"
#include "fonts/font_cache.h"
#include "fonts/harfbuzz_wrapper.h"
#include "platform/system_services.h"

struct FT_LibraryRec_;
typedef struct FT_LibraryRec_* FT_Library;

namespace vesk::plugin::lib {

class UnicodeHelper;

class FreeTypeFont {
 public:
  // The process-wide font, made on first use from the process-wide catalogue and this machine's
  // services.
  static std::shared_ptr<FreeTypeFont> instance();

  // No face is loaded until the first setFont or defaultFont. Without a catalogue there is no
  // default font; without services there is no platform font data to fall back on. An empty
  // `unicodeDataFolder` stands for defaultUnicodeDataFolder(). Throws std::runtime_error "failed
  // to initialise the freetype library".
  explicit FreeTypeFont(std::shared_ptr<vesk::project::FontCache> fontCache,
                        std::shared_ptr<const platform::SystemServices> services = nullptr,
                        std::filesystem::path unicodeDataFolder = {});
  ~FreeTypeFont();
  FreeTypeFont(const FreeTypeFont&) = delete;
  FreeTypeFont& operator=(const FreeTypeFont&) = delete;

  // The default font's record, chosen (and selected) on first use. Throws std::runtime_error when
  // the catalogue has no fonts or no family for it.
  vesk::project::FontRecord defaultFont();

  // Makes the record's face current: its file, else the platform's data for its family, else the
  // default font. False when none opens; then no face is loaded and no font is current. Throws
  // like defaultFont() when the default is needed and cannot be chosen.
  bool setFont(const vesk::project::FontRecord& record);
  // The face is set to max(1, size) whole pixels; below one pixel outlines are scaled down.
  void setPixelSize(float size);

  // The outline of glyph `glyphIndex` of the current face at `size` pixels, cached under
  // `record`'s key. Throws std::runtime_error when no face is loaded, std::invalid_argument for a
  // size or band width that cannot be built.
  CharacterOutlinePtr characterOutline(uint32_t glyphIndex, const vesk::project::FontRecord& record,
                                       float size, float bandWidth);

  // Created on the first call.
  std::shared_ptr<UnicodeHelper> unicodeHelper();

  // Follows the host's verbose flag: HarfBuzz's messages while shaping.
  void setVerbose(bool verbose) { harfBuzz_->setVerbose(verbose); }

  const std::shared_ptr<HarfBuzzWrapper>& harfBuzz() const { return harfBuzz_; }
  FT_Face face() const { return face_; }
  const vesk::project::FontRecord& currentFont() const { return currentFont_; }
  float pixelSize() const { return pixelSize_; }
  float scale() const { return scale_; }
  std::recursive_mutex& mutex() { return mutex_; }
  // How many font files were read whole: shows that selecting the current font again reads none.
  uint32_t fileReads() const { return fileReads_; }

 private:
  void chooseDefaultRecord();
  void releaseFace();
  bool readFile(const std::u16string& path);
  bool readPlatformData(const vesk::project::FontRecord& record);
  bool openFace(int32_t faceIndex);
  void selectNamedInstance(int32_t instanceId);
  void selectCharacterMap();
  ConvertedGlyph convert(uint32_t glyphIndex, float size);

  std::shared_ptr<CharacterCache> characterCache_;
  FT_Library library_ = nullptr;
  FT_Face face_ = nullptr;
  float pixelSize_ = 48.0f;
  float scale_ = 1.0f;
  vesk::project::FontRecord currentFont_;
  std::vector<uint8_t> fontData_;  // the face reads from this memory while it is open
  vesk::project::FontRecord defaultFont_;
  std::shared_ptr<vesk::project::FontCache> fontCache_;
  std::shared_ptr<const platform::SystemServices> services_;
  std::filesystem::path unicodeDataFolder_;
  std::shared_ptr<UnicodeHelper> unicodeHelper_;
  std::shared_ptr<HarfBuzzWrapper> harfBuzz_;
  std::recursive_mutex mutex_;
  uint32_t fileReads_ = 0;
};

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_FONTS_FREETYPE_FONT_H
