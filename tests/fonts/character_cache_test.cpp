// The outline cache: whole fonts evicted by least recent use with the capacity counted in
// outlines, hits and misses counted by the producer's calls, installed-font outlines equal to a
// direct build, and two threads on one cache.
#include "fonts/character_cache.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <set>
#include <sstream>
#include <string>
#include <thread>
#include <tuple>
#include <vector>

#include "ci_or_skip.h"
#include "fonts/glyph_conversion.h"
#include "freetype_face.h"
#include "polygon_area.h"

namespace waveform_test {
namespace {

using namespace vesk::plugin::lib;

CharacterCacheItemPtr itemOf(int outlines) {
  return std::make_shared<const CharacterCacheItem>(std::vector<CachedCharacter>(outlines));
}

// The sum of the cached items' outlines, with each key once.
int32_t heldOutlines(CharacterCache& cache) {
  const std::vector<std::u16string> keys = cache.keys();
  EXPECT_EQ(std::set<std::u16string>(keys.begin(), keys.end()).size(), keys.size());
  int32_t held = 0;
  for (const std::u16string& key : keys) {
    CharacterCacheItemPtr item;
    held += cache.get(key, item) ? static_cast<int32_t>(item->size()) : 1000;
  }
  return held;
}

// Steps on a cache of 4 outlines: "A2" puts 2 outlines under A, "A" gets A. The keys are then
// cached in the given order, least recent first.
TEST(LFUCache, EvictsWholeFontsLeastRecentlyUsedFirst) {
  const std::vector<std::tuple<const char*, std::string, std::u16string>> cases = {
      {"a lookup moves a font last", "A2 B1 A C1 D1", u"ACD"},
      {"a new font drops whole fonts until it fits", "A2 B2 C3", u"C"},
      {"an item above the capacity is refused", "A1 B5 B", u"A"},
      {"a put under a cached key replaces it", "A1 B1 A3", u"BA"},
  };
  for (const auto& [name, steps, keys] : cases) {
    CharacterCache cache(4);
    std::istringstream in(steps);
    for (std::string step; in >> step;) {
      const std::u16string key(1, step[0]);
      CharacterCacheItemPtr item;
      if (step.size() > 1) {
        EXPECT_EQ(cache.put(key, itemOf(step[1] - '0')), step[1] <= '4') << name << ": " << step;
      } else {
        EXPECT_EQ(cache.get(key, item), keys.find(key) != std::u16string::npos) << name;
      }
    }
    std::u16string cached;
    for (const std::u16string& key : cache.keys()) {
      cached += key;
    }
    EXPECT_EQ(cached, keys) << name;
    EXPECT_EQ(cache.count(), heldOutlines(cache)) << name;
  }
}

TEST(LFUCache, TwoThreadsKeepTheCountOfTheCachedItems) {
  CharacterCache cache(5);
  const std::vector<std::u16string> keys = {u"A", u"B", u"C", u"D", u"E", u"F"};
  const auto hammer = [&](int thread) {
    CharacterCacheItemPtr item;
    for (int i = 0; i < 500000; ++i) {
      const std::u16string& key = keys[(i + thread) % keys.size()];
      if (i % 3 == thread) {
        cache.put(key, itemOf(1 + i % 3));
      } else {
        cache.get(key, item);
      }
    }
  };
  std::thread other(hammer, 1);
  hammer(0);
  other.join();
  EXPECT_EQ(cache.count(), heldOutlines(cache));
  EXPECT_LE(cache.count(), 5);
}

TEST(CharacterCacheKey, NamesTheFaceAndInstance) {
  vesk::project::FontRecord record;
  record.fullName = u"Face Full";
  EXPECT_EQ(characterCacheKey(record), u"Face Full/0/0");
  record.postScriptName = u"Face-PS";
  record.faceIndex = 2;
  record.instanceId = 261;
  EXPECT_EQ(characterCacheKey(record), u"Face-PS/2/261");
}

// A square glyph of side 8 × `size` whose descriptor records its glyph index and pixel size.
ConvertedGlyph squareGlyph(uint32_t glyphIndex, float size) {
  ConvertedGlyph glyph;
  glyph.descriptor.glyphIndex = glyphIndex;
  glyph.descriptor.pixelSize = size;
  const qvtl::geometry::PointList ring = reversed(square(0, 0, 8 * size, 8 * size));
  glyph.descriptor.contours.emplace_back();
  for (size_t i = 0; i < ring.size(); ++i) {
    glyph.descriptor.contours[0].push_back(
        std::make_shared<LinearCurve>(ring[i], ring[(i + 1) % ring.size()]));
  }
  return glyph;
}

// Every request twice: the second round hands out the first round's objects, still carrying the
// glyph, size and band width they were built for.
TEST(CharacterOutline, BuildsEachFontGlyphSizeAndBandWidthOnce) {
  struct Request {
    std::u16string font;
    CharacterRequest request;
  };
  struct Case {
    const char* name;
    std::vector<Request> requests;
    int builds;
  };
  const std::vector<Case> cases = {
      {"one glyph", {{u"F", {3, 20, 2}}}, 1},
      {"12 and 12.5 pixels", {{u"F", {3, 12, 2}}, {u"F", {3, 12.5f, 2}}}, 2},
      {"below one pixel", {{u"F", {3, 0.5f, 2}}, {u"F", {3, 0.25f, 2}}}, 2},
      {"two band widths", {{u"F", {3, 20, 1}}, {u"F", {3, 20, 2}}}, 2},
      {"two glyphs, two fonts", {{u"F", {3, 20, 2}}, {u"F", {4, 20, 2}}, {u"G", {3, 20, 2}}}, 3},
  };
  for (const Case& c : cases) {
    CharacterCache cache(kCharacterCacheCapacity);
    int builds = 0;
    const GlyphProducer produce = [&](uint32_t index, float size) {
      ++builds;
      return squareGlyph(index, size);
    };
    std::vector<CharacterOutlinePtr> first;
    for (size_t i = 0; i < 2 * c.requests.size(); ++i) {
      const Request& r = c.requests[i % c.requests.size()];
      const CharacterOutlinePtr outline = characterOutline(cache, r.font, r.request, produce);
      EXPECT_EQ(std::tie(outline->glyphIndex, outline->pixelSize, outline->innerBandWidth),
                std::tie(r.request.glyphIndex, r.request.size, r.request.bandWidth))
          << c.name;
      if (i < c.requests.size()) {
        first.push_back(outline);
      } else {
        EXPECT_EQ(outline, first[i % c.requests.size()]) << c.name;
      }
    }
    EXPECT_EQ(builds, c.builds) << c.name;
    EXPECT_EQ(cache.count(), c.builds) << c.name;
  }
}

// Another thread caches the same outline during this build: both callers get the cached one.
TEST(CharacterOutline, AnOutlineCachedDuringABuildWins) {
  CharacterCache cache(kCharacterCacheCapacity);
  CharacterOutlinePtr other;
  const GlyphProducer produce = [&](uint32_t index, float size) {
    if (other == nullptr) {
      other = characterOutline(cache, u"F", {index, size, 1}, squareGlyph);
    }
    return squareGlyph(index, size);
  };
  EXPECT_EQ(characterOutline(cache, u"F", {3, 20, 1}, produce), other);
  EXPECT_EQ(cache.count(), 1);
}

TEST(CharacterOutline, RejectsSizesAndBandWidthsThatCannotBeBuilt) {
  CharacterCache cache(kCharacterCacheCapacity);
  for (const CharacterRequest& request : std::vector<CharacterRequest>{
           {3, 0, 1}, {3, -2, 1}, {3, NAN, 1}, {3, 20, -1}, {3, 20, INFINITY}}) {
    EXPECT_THROW(characterOutline(cache, u"F", request, squareGlyph), std::invalid_argument)
        << request.size << " " << request.bandWidth;
  }
}

TEST(CharacterOutline, InstalledFontGlyphsEqualADirectBuild) {
  const std::string path = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";
  REQUIRE_FILE(path);
  FreeTypeFace face(path);
  ASSERT_NE(face.get(), nullptr);
  // As the font does: the face at whole pixels, at least one; smaller sizes scaled down from it.
  const auto convert = [&](uint32_t index, float size) {
    FT_Set_Pixel_Sizes(face.get(), 0, static_cast<FT_UInt>(std::max(1.0f, size)));
    return ConvertedGlyph{convertGlyph(face.get(), index, std::max(1.0f, size), u"", 0),
                          std::min(1.0f, size)};
  };
  CharacterCache cache(kCharacterCacheCapacity);
  for (const char letter : std::string("0-8")) {
    for (const float size : {20.0f, 12.5f, 0.5f}) {
      const CharacterRequest request{FT_Get_Char_Index(face.get(), letter), size, 2};
      const CharacterOutlinePtr cached =
          characterOutline(cache, u"DejaVuSans/0/0", request, convert);
      const ConvertedGlyph glyph = convert(request.glyphIndex, size);
      const auto direct = qvtl::geometry::makeCharacterOutline(
          glyph.descriptor, {2, 2, 10.0f, 0.1f, 0.01f, 0.001f, glyph.scale});
      ASSERT_FALSE(direct->vertices.empty()) << letter << " " << size;
      EXPECT_EQ(std::tie(cached->vertices, cached->indices, cached->pixelSize),
                std::tie(direct->vertices, direct->indices, direct->pixelSize))
          << letter << " " << size;
    }
  }
}

}  // namespace
}  // namespace waveform_test
