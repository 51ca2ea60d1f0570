// The cache of glyph outlines: building a glyph's geometry costs far more than drawing it, and
// labels are redrawn every frame, so each outline is built once per font, glyph, requested size
// and band width and the same shared object is handed out again. Entries are whole fonts; the
// capacity is counted in outlines. An outline is complete when it enters the cache and is handed
// out const, so the render and interface threads can share it; items are replaced, never changed.
#ifndef WAVEFORM_FONTS_CHARACTER_CACHE_H
#define WAVEFORM_FONTS_CHARACTER_CACHE_H

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "fonts/font_cache.h"
#include "fonts/lfu_cache.h"
#include "geometry/character_outline.h"
#include "geometry/curves.h"

namespace vesk::plugin::lib {

using CharacterOutlinePtr = std::shared_ptr<const qvtl::geometry::CharacterOutline>;

// What identifies an outline within one font. Sizes and band widths match exactly as requested
// (float equality), so a size below one pixel finds its outline again.
struct CharacterRequest {
  uint32_t glyphIndex = 0;
  float size = 0;       // pixels, > 0
  float bandWidth = 0;  // the distance band's inner and outer width, >= 0
};

struct CachedCharacter {
  CharacterRequest request;
  CharacterOutlinePtr outline;
};

// The outlines built so far for one font, in the order they were added. Never changed once made.
class CharacterCacheItem {
 public:
  CharacterCacheItem() = default;
  explicit CharacterCacheItem(std::vector<CachedCharacter> characters)
      : characters_(std::move(characters)) {}

  // The outline made for `request`, or null.
  CharacterOutlinePtr find(const CharacterRequest& request) const;
  std::size_t size() const { return characters_.size(); }
  const std::vector<CachedCharacter>& characters() const { return characters_; }

 private:
  std::vector<CachedCharacter> characters_;
};

using CharacterCacheItemPtr = std::shared_ptr<const CharacterCacheItem>;
using CharacterCache = LFUCache<CharacterCacheItemPtr>;

// The font's cache holds this many outlines.
constexpr int32_t kCharacterCacheCapacity = 2000;

// A converted glyph and the factor its flattened points are scaled by (below one pixel the font
// converts at one pixel and scales down).
struct ConvertedGlyph {
  GlyphDescriptor descriptor;
  float scale = 1.0f;
};

// Converts glyph `glyphIndex` of the caller's current face at `size` pixels; called on a miss.
using GlyphProducer = std::function<ConvertedGlyph(uint32_t glyphIndex, float size)>;

// The key of a font: its PostScript name (the full name when that is empty), "/", the face
// index, "/", the instance id.
std::u16string characterCacheKey(const vesk::project::FontRecord& record);

// The request an outline is built with: inner and outer band width `bandWidth`, the font's
// flattening parameters and `scale`.
qvtl::geometry::GlyphOutlineRequest glyphOutlineRequest(float bandWidth, float scale);

// The outline of `request` in the font under `fontKey`: the cached one, or one built from
// `produce` with makeCharacterOutline and cached (if it fits) before it is returned. `produce`
// runs outside the cache's lock. Throws std::invalid_argument for a size that is not a positive
// finite number or a band width that is negative or not finite.
CharacterOutlinePtr characterOutline(CharacterCache& cache, const std::u16string& fontKey,
                                     const CharacterRequest& request, const GlyphProducer& produce);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_FONTS_CHARACTER_CACHE_H
