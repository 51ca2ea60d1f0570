// Times bidi resolution of one 10,000-character paragraph of mixed Arabic, Latin, digits,
// punctuation and brackets: the token chain through resolveLevels, with the Unicode data loaded
// beforehand (the first load is unicode_data_bench's subject).
//   bidi_bench [--runs N]
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "bench_runs.h"
#include "text/bidi_levels.h"

namespace {

using waveform_bench::median;

using Clock = std::chrono::steady_clock;

// Words of Arabic and Latin, numbers of both kinds, brackets and punctuation, cycled.
std::u32string mixedParagraph(size_t length) {
  const std::u32string pieces[] = {U"\u0645\u0631\u062D\u0628\u0627 ",
                                   U"waveform ",
                                   U"123.45 ",
                                   U"(\u0627\u0644\u0646\u0635) ",
                                   U"[level 2] ",
                                   U"\u0661\u0662\u0663, ",
                                   U"- 7% "};
  std::u32string text;
  for (size_t i = 0; text.size() < length; ++i) {
    text += pieces[i % (sizeof pieces / sizeof pieces[0])];
  }
  text.resize(length);
  return text;
}

}  // namespace

int main(int argc, char** argv) {
  const int runs = waveform_bench::runsOption(argc, argv, 50, "bidi_bench");
  if (runs < 0) {
    return 2;
  }
  constexpr size_t kLength = 10000;
  vesk::plugin::lib::UnicodeHelper unicodeData(WAVEFORM_BUILD_DIR);
  const auto chain = vesk::project::makeTokenChain(mixedParagraph(kLength));
  std::vector<vesk::plugin::lib::BidiEntry> entries;
  vesk::plugin::lib::resolveLevels(unicodeData, entries, chain, 0);  // loads the data
  std::vector<double> nanoseconds;
  for (int run = 0; run < runs; ++run) {
    const Clock::time_point start = Clock::now();
    vesk::plugin::lib::resolveLevels(unicodeData, entries, chain, 0);
    nanoseconds.push_back(std::chrono::duration<double, std::nano>(Clock::now() - start).count());
  }
  std::printf(
      "bidi resolution, %zu characters (%zu entries), median of %d runs: %.3f ms, "
      "%.1f ns per character\n",
      kLength, entries.size(), runs, median(nanoseconds) / 1e6, median(nanoseconds) / kLength);
  return 0;
}
