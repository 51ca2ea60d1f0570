// Times the Unicode data of the build folder: what the first label of Latin text pays (make the
// helper, which reads the bracket file, and ask about U+0041, which reads Basic Latin), what
// reading the whole character file at once costs (ask about U+10FFFF), and the same file read
// block by block by one query per block, as text of ever higher code points would read it.
//   unicode_data_bench [--runs N]
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>
#include <vector>

#include "bench_runs.h"
#include "text/unicode_blocks.h"
#include "text/unicode_helper.h"

namespace {

using Clock = std::chrono::steady_clock;
using vesk::plugin::lib::UnicodeHelper;

// The median of `runs` timings of `work`, in milliseconds.
double medianMilliseconds(int runs, const std::function<void()>& work) {
  std::vector<double> times;
  for (int run = 0; run < runs; ++run) {
    const Clock::time_point start = Clock::now();
    work();
    times.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
  }
  return waveform_bench::median(times);
}

}  // namespace

int main(int argc, char** argv) {
  const int runs = waveform_bench::runsOption(argc, argv, 9, "unicode_data_bench");
  if (runs < 0) {
    return 2;
  }
  const char* folder = WAVEFORM_BUILD_DIR;
  size_t latin = 0;
  size_t whole = 0;
  size_t blockwise = 0;
  const double first = medianMilliseconds(runs, [&] {
    UnicodeHelper helper(folder);
    helper.generalCategory(0x41);
    latin = helper.characterCount();
  });
  const double all = medianMilliseconds(runs, [&] {
    UnicodeHelper helper(folder);
    helper.generalCategory(0x10FFFF);
    whole = helper.characterCount();
  });
  const double byBlock = medianMilliseconds(runs, [&] {
    UnicodeHelper helper(folder);
    for (const uint32_t end : vesk::plugin::lib::unicodeBlockEnds()) {
      helper.generalCategory(end);
    }
    blockwise = helper.characterCount();
  });
  if (latin == 0 || whole == 0 || whole != blockwise) {
    std::fprintf(stderr, "unicode_data_bench: no data files in %s\n", folder);
    return 1;
  }
  std::printf("median of %d runs, data of %s\n", runs, folder);
  std::printf("construct + U+0041 (Basic Latin, %zu records): %8.3f ms\n", latin, first);
  std::printf("construct + U+10FFFF (whole file, %zu records): %8.3f ms\n", whole, all);
  std::printf("construct + one query per block (291 loads):     %8.3f ms\n", byBlock);
  return 0;
}
