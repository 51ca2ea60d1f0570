// Times outline requests for the glyphs of the scope's 15 guideline labels ("120" down to "-20")
// in DejaVu Sans at 20 pixels: a cold pass on an empty cache (every distinct glyph converted and
// built once, repeats hit) and a warm pass on the filled cache (every request a hit), per glyph.
//   character_cache_bench [--runs N]
#include <chrono>
#include <cstdio>
#include <string>
#include <vector>

#include "bench_runs.h"
#include "fonts/character_cache.h"
#include "fonts/glyph_conversion.h"
#include "freetype_face.h"

namespace {

using namespace vesk::plugin::lib;
using Clock = std::chrono::steady_clock;

constexpr float kSize = 20.0f;
constexpr float kBandWidth = 1.0f;

double microsecondsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::micro>(Clock::now() - start).count();
}

// One request per character of every label, in label order.
double requestAll(CharacterCache& cache, const std::vector<uint32_t>& glyphs,
                  const GlyphProducer& produce) {
  const Clock::time_point start = Clock::now();
  for (const uint32_t glyph : glyphs) {
    characterOutline(cache, u"DejaVuSans/0/0", {glyph, kSize, kBandWidth}, produce);
  }
  return microsecondsSince(start);
}

}  // namespace

int main(int argc, char** argv) {
  const int runs = waveform_bench::runsOption(argc, argv, 20, "character_cache_bench");
  if (runs < 0) {
    return 2;
  }
  const waveform_test::FreeTypeFace face("/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf", 0,
                                         static_cast<unsigned>(kSize));
  if (face.get() == nullptr) {
    std::fprintf(stderr, "character_cache_bench: cannot open DejaVu Sans\n");
    return 1;
  }
  std::vector<uint32_t> glyphs;
  for (int label = 120; label >= -20; label -= 10) {
    for (const char c : std::to_string(label)) {
      glyphs.push_back(FT_Get_Char_Index(face.get(), static_cast<FT_ULong>(c)));
    }
  }
  int builds = 0;
  const GlyphProducer produce = [&](uint32_t glyph, float size) {
    ++builds;
    return ConvertedGlyph{convertGlyph(face.get(), glyph, size, u"", 0), 1.0f};
  };
  std::vector<double> cold;
  std::vector<double> warm;
  for (int run = 0; run < runs; ++run) {
    CharacterCache cache(kCharacterCacheCapacity);
    builds = 0;
    cold.push_back(requestAll(cache, glyphs, produce) / glyphs.size());
    warm.push_back(requestAll(cache, glyphs, produce) / glyphs.size());
  }
  std::printf(
      "character cache, 15 labels, %zu glyph requests, %d distinct glyphs built (%d runs)\n",
      glyphs.size(), builds, runs);
  std::printf("  cold  %8.3f us per glyph request\n", waveform_bench::median(cold));
  std::printf("  warm  %8.3f us per glyph request\n", waveform_bench::median(warm));
  return 0;
}
