#include "fonts/character_cache.h"

#include <cmath>
#include <stdexcept>
#include <utility>

#include "fonts/glyph_conversion.h"
#include "platform/utf16_text.h"

namespace vesk::plugin::lib {

namespace {

bool sameRequest(const CharacterRequest& a, const CharacterRequest& b) {
  return a.glyphIndex == b.glyphIndex && a.size == b.size && a.bandWidth == b.bandWidth;
}

void checkRequest(const CharacterRequest& request) {
  if (!std::isfinite(request.size) || request.size <= 0) {
    throw std::invalid_argument("characterOutline: size must be a positive finite number");
  }
  if (!std::isfinite(request.bandWidth) || request.bandWidth < 0) {
    throw std::invalid_argument("characterOutline: band width must be finite and not negative");
  }
}

// `item`'s characters (none for null) followed by `added`.
CharacterCacheItemPtr extended(const CharacterCacheItemPtr* item, CachedCharacter added) {
  std::vector<CachedCharacter> characters;
  if (item != nullptr) {
    characters = (*item)->characters();
  }
  characters.push_back(std::move(added));
  return std::make_shared<const CharacterCacheItem>(std::move(characters));
}

}  // namespace

CharacterOutlinePtr CharacterCacheItem::find(const CharacterRequest& request) const {
  for (const CachedCharacter& character : characters_) {
    if (sameRequest(character.request, request)) {
      return character.outline;
    }
  }
  return nullptr;
}

std::u16string characterCacheKey(const vesk::project::FontRecord& record) {
  const std::u16string& name =
      record.postScriptName.empty() ? record.fullName : record.postScriptName;
  return name + u"/" + platform::toUtf16(std::to_string(record.faceIndex)) + u"/" +
         platform::toUtf16(std::to_string(record.instanceId));
}

qvtl::geometry::GlyphOutlineRequest glyphOutlineRequest(float bandWidth, float scale) {
  qvtl::geometry::GlyphOutlineRequest request;
  request.innerBandWidth = bandWidth;
  request.outerBandWidth = bandWidth;
  const FlatteningParameters flattening;
  request.steps = flattening.steps;
  request.step = flattening.step;
  request.step2 = flattening.step2;
  request.step3 = flattening.step3;
  request.scale = scale;
  return request;
}

CharacterOutlinePtr characterOutline(CharacterCache& cache, const std::u16string& fontKey,
                                     const CharacterRequest& request,
                                     const GlyphProducer& produce) {
  checkRequest(request);
  CharacterCacheItemPtr item;
  if (cache.get(fontKey, item)) {
    if (CharacterOutlinePtr found = item->find(request)) {
      return found;
    }
  }
  // Built outside the lock and complete before any other thread can see it.
  const ConvertedGlyph glyph = produce(request.glyphIndex, request.size);
  CharacterOutlinePtr built = qvtl::geometry::makeCharacterOutline(
      glyph.descriptor, glyphOutlineRequest(request.bandWidth, glyph.scale));
  // Another thread may have cached the same outline meanwhile: its object wins, so that every
  // caller shares one; otherwise the font's item is replaced by one that also holds ours.
  CharacterOutlinePtr result = built;
  cache.update(fontKey, [&](const CharacterCacheItemPtr* current) {
    if (current != nullptr) {
      if (CharacterOutlinePtr cached = (*current)->find(request)) {
        result = cached;
        return *current;
      }
    }
    return extended(current, {request, built});
  });
  return result;
}

}  // namespace vesk::plugin::lib
