// Times the font catalogue on this machine: the first load (installed-font lists, the two
// enumeration passes and reading every font file), and lookups answered from the memo and not.
//   font_cache_bench [--runs N]
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "bench_runs.h"
#include "fonts/font_cache.h"

namespace {

using waveform_bench::median;

using Clock = std::chrono::steady_clock;
using vesk::project::FontCache;

double millisecondsSince(Clock::time_point start) {
  return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

}  // namespace

int main(int argc, char** argv) {
  const int runs = waveform_bench::runsOption(argc, argv, 3, "font_cache_bench");
  if (runs < 0) {
    return 2;
  }
  std::vector<double> services;
  std::vector<double> loads;
  size_t faces = 0;
  for (int run = 0; run < runs; ++run) {
    // Fresh services and a fresh catalogue each run: what the first label of a session pays,
    // fontconfig's configuration and font list first, then the catalogue's load.
    const Clock::time_point created = Clock::now();
    const std::shared_ptr<const platform::SystemServices> system = platform::createSystemServices();
    services.push_back(millisecondsSince(created));
    FontCache cache(system);
    const Clock::time_point start = Clock::now();
    faces = cache.records().size();
    loads.push_back(millisecondsSince(start));
  }
  FontCache cache(platform::systemServices());
  const std::vector<vesk::project::FontRecord> records = cache.records();
  if (records.size() < 2) {
    std::fprintf(stderr, "font_cache_bench: fewer than two fonts installed\n");
    return 1;
  }
  const std::u16string first = records.front().postScriptName;
  const std::u16string last = records.back().postScriptName;
  constexpr int kLookups = 200000;
  const auto timeLookups = [&](bool alternate) {
    const Clock::time_point start = Clock::now();
    size_t found = 0;
    for (int i = 0; i < kLookups; ++i) {
      const std::u16string& name = alternate && i % 2 == 1 ? last : first;
      found += cache.findFont(name, u"", name).faceIndex >= 0 ? 1 : 0;
    }
    const double microseconds = millisecondsSince(start) * 1000.0 / kLookups;
    return found == static_cast<size_t>(kLookups) ? microseconds : -1.0;
  };
  const double memoised = timeLookups(false);
  const double unmemoised = timeLookups(true);
  std::printf("font catalogue on this machine: %zu faces in %zu families\n", faces,
              cache.familyNames().size());
  std::printf("system font services (fontconfig) %10.1f ms (median of %d)\n", median(services),
              runs);
  std::printf("first catalogue load              %10.1f ms (median of %d)\n", median(loads), runs);
  std::printf("findFont, same names (memo)       %10.3f us per lookup\n", memoised);
  std::printf("findFont, alternating (no memo)   %10.3f us per lookup\n", unmemoised);
  return 0;
}
