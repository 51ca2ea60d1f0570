// The outline cache: eviction of whole fonts by least recent use with the capacity counted in
// outlines, hits and misses counted by the producer's calls, outlines of an installed font equal
// to a direct build, and two threads sharing one cache.
#include "fonts/character_cache.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cmath>
#include <map>
#include <set>
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

// A put ('p', n outlines, expected result) or a get ('g', expected hit) of one key.
struct CacheStep {
  char op;
  std::u16string key;
  int outlines;
  bool expected;
};

TEST(LFUCache, EvictsWholeFontsLeastRecentlyUsedFirst) {
  struct Case {
    const char* name;
    std::vector<CacheStep> steps;
    std::vector<std::u16string> keys;  // least recent first
    int32_t count;
  };
  const std::vector<Case> cases = {
      {"a lookup moves a font last",
       {{'p', u"A", 2, true},
        {'p', u"B", 1, true},
        {'g', u"A", 0, true},
        {'p', u"C", 1, true},
        {'p', u"D", 1, true}},
       {u"A", u"C", u"D"},
       4},
      {"a new font drops whole fonts until it fits",
       {{'p', u"A", 2, true}, {'p', u"B", 2, true}, {'p', u"C", 3, true}, {'g', u"A", 0, false}},
       {u"C"},
       3},
      {"an item above the capacity is refused",
       {{'p', u"A", 1, true}, {'p', u"B", 5, false}, {'g', u"B", 0, false}},
       {u"A"},
       1},
      {"a put under a cached key replaces it",
       {{'p', u"A", 1, true}, {'p', u"B", 1, true}, {'p', u"A", 3, true}},
       {u"B", u"A"},
       4},
  };
  for (const Case& c : cases) {
    CharacterCache cache(4);
    for (const CacheStep& step : c.steps) {
      CharacterCacheItemPtr item;
      const bool result =
          step.op == 'p' ? cache.put(step.key, itemOf(step.outlines)) : cache.get(step.key, item);
      EXPECT_EQ(result, step.expected) << c.name << ": " << step.op;
    }
    EXPECT_EQ(cache.keys(), c.keys) << c.name;
    EXPECT_EQ(cache.count(), c.count) << c.name;
  }
}

// Puts and gets from two threads at once: the count stays the sum of the cached items.
TEST(LFUCache, TwoThreadsKeepTheCountOfTheCachedItems) {
  CharacterCache cache(5);
  const std::vector<std::u16string> keys = {u"A", u"B", u"C", u"D", u"E", u"F"};
  const std::vector<CharacterCacheItemPtr> items = {itemOf(1), itemOf(2), itemOf(3)};
  const auto hammer = [&](int thread) {
    CharacterCacheItemPtr item;
    for (int i = 0; i < 500000; ++i) {
      const std::u16string& key = keys[(i + thread) % keys.size()];
      if (i % 3 == thread) {
        cache.put(key, items[i % items.size()]);
      } else {
        cache.get(key, item);
      }
    }
  };
  std::thread other(hammer, 1);
  hammer(0);
  other.join();
  int32_t held = 0;
  const std::vector<std::u16string> cached = cache.keys();
  for (const std::u16string& key : cached) {
    CharacterCacheItemPtr item;
    ASSERT_TRUE(cache.get(key, item));
    held += static_cast<int32_t>(item->size());
  }
  EXPECT_EQ(std::set<std::u16string>(cached.begin(), cached.end()).size(), cached.size());
  EXPECT_EQ(cache.count(), held);
  EXPECT_LE(held, 5);
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

// A square glyph of side `size` whose glyph index and pixel size the descriptor records.
ConvertedGlyph squareGlyph(uint32_t glyphIndex, float size) {
  ConvertedGlyph glyph;
  glyph.descriptor.glyphIndex = glyphIndex;
  glyph.descriptor.pixelSize = size;
  const qvtl::geometry::PointList ring = reversed(square(0, 0, 8 * size, 8 * size));
  CurveContour contour;
  for (size_t i = 0; i < ring.size(); ++i) {
    contour.push_back(std::make_shared<LinearCurve>(ring[i], ring[(i + 1) % ring.size()]));
  }
  glyph.descriptor.contours = {contour};
  return glyph;
}

struct Request {
  std::u16string font;
  CharacterRequest request;
};

TEST(CharacterOutline, BuildsEachFontGlyphSizeAndBandWidthOnce) {
  struct Case {
    const char* name;
    std::vector<Request> requests;  // each asked for twice, in this order
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
    for (int round = 0; round < 2; ++round) {
      for (size_t i = 0; i < c.requests.size(); ++i) {
        const Request& r = c.requests[i];
        const CharacterOutlinePtr outline = characterOutline(cache, r.font, r.request, produce);
        EXPECT_EQ(std::tie(outline->glyphIndex, outline->pixelSize, outline->innerBandWidth),
                  std::tie(r.request.glyphIndex, r.request.size, r.request.bandWidth))
            << c.name;
        if (round == 0) {
          first.push_back(outline);
        } else {
          EXPECT_EQ(outline, first[i]) << c.name << ": a hit hands out the same object";
        }
      }
    }
    EXPECT_EQ(builds, c.builds) << c.name;
    EXPECT_EQ(cache.count(), c.builds) << c.name;
  }
}

TEST(CharacterOutline, AHitLeavesTheOutlineUntouched) {
  CharacterCache cache(kCharacterCacheCapacity);
  const GlyphProducer produce = squareGlyph;
  const CharacterOutlinePtr narrow = characterOutline(cache, u"F", {3, 20, 1}, produce);
  const std::vector<std::array<float, 4>> bands = narrow->contours[0].bandVertices;
  const qvtl::geometry::PointList points = narrow->contours[0].path.points;
  const CharacterOutlinePtr wide = characterOutline(cache, u"F", {3, 20, 4}, produce);
  EXPECT_EQ(characterOutline(cache, u"F", {3, 20, 1}, produce), narrow);
  EXPECT_NE(wide, narrow);
  EXPECT_EQ(std::tie(narrow->innerBandWidth, narrow->outerBandWidth), std::make_tuple(1.0f, 1.0f));
  EXPECT_EQ(narrow->contours[0].bandVertices, bands);
  EXPECT_EQ(narrow->contours[0].path.points, points);
  EXPECT_EQ(wide->outerBandWidth, 4.0f);
}

// The other thread caches the same outline while this one builds it: both get the cached one.
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
  // As the font does: the face is set to whole pixels, at least one, and sizes below one pixel
  // are scaled down from the one-pixel face.
  const auto convert = [&](uint32_t index, float size) {
    FT_Set_Pixel_Sizes(face.get(), 0, static_cast<FT_UInt>(std::max(1.0f, size)));
    return ConvertedGlyph{convertGlyph(face.get(), index, std::max(1.0f, size), u"", 0),
                          size < 1 ? size : 1.0f};
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
      ASSERT_EQ(cached->contours.size(), direct->contours.size()) << letter << " " << size;
      ASSERT_FALSE(cached->vertices.empty()) << letter << " " << size;
      for (size_t i = 0; i < direct->contours.size(); ++i) {
        EXPECT_EQ(cached->contours[i].path.points, direct->contours[i].path.points) << letter;
      }
      EXPECT_EQ(std::tie(cached->vertices, cached->indices, cached->pixelSize),
                std::tie(direct->vertices, direct->indices, direct->pixelSize))
          << letter << " " << size;
      // Drawn at `size` pixels: no glyph of these is taller than the size.
      for (const qvtl::geometry::Point2f& p : cached->vertices) {
        EXPECT_LE(std::abs(p.y), size) << letter << " " << size;
      }
    }
  }
}

TEST(CharacterOutline, TwoThreadsShareOneCache) {
  // Plenty of room: both threads end up with the same object for every request. Little room:
  // fonts are evicted while the other thread reads, and the count stays that of the items.
  for (const int32_t capacity : {kCharacterCacheCapacity, 5}) {
    CharacterCache cache(capacity);
    const std::vector<std::u16string> fonts = {u"A", u"B", u"C", u"D"};
    std::vector<std::map<std::tuple<int, uint32_t, float>, CharacterOutlinePtr>> seen(2);
    std::atomic<int> wrong{0};
    const auto hammer = [&](int thread) {
      for (int i = 0; i < 3000; ++i) {
        const int font = (i * 7 + thread) % 4;
        const CharacterRequest request{static_cast<uint32_t>(i % 5), (i % 3) + 10.5f, 1};
        const CharacterOutlinePtr outline =
            characterOutline(cache, fonts[font], request, squareGlyph);
        wrong += outline->glyphIndex != request.glyphIndex || outline->pixelSize != request.size;
        seen[thread][{font, request.glyphIndex, request.size}] = outline;
      }
    };
    std::thread other(hammer, 1);
    hammer(0);
    other.join();
    EXPECT_EQ(wrong, 0) << capacity;
    int32_t held = 0;
    for (const std::u16string& key : cache.keys()) {
      CharacterCacheItemPtr item;
      ASSERT_TRUE(cache.get(key, item));
      held += static_cast<int32_t>(item->size());
    }
    EXPECT_EQ(cache.count(), held) << capacity;
    EXPECT_LE(held, capacity);
    if (capacity == kCharacterCacheCapacity) {
      EXPECT_EQ(held, 4 * 5 * 3);
      EXPECT_EQ(seen[0], seen[1]);
    }
  }
}

}  // namespace
}  // namespace waveform_test
