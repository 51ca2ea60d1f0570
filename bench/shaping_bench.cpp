// Times shaping through the wrapper in DejaVu Sans at 48 pixels: each of the 15 scope labels
// ("120" down to "-20"), and a 2,000-character paragraph of Latin, digits and Arabic cut into
// one run per piece, as the layout engine hands runs over. The labels are timed quiet and
// verbose (HarfBuzz's messages written to standard output, sent to /dev/null here).
//   shaping_bench [--runs N]
#include <fcntl.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "bench_runs.h"
#include "fonts/harfbuzz_wrapper.h"
#include "freetype_face.h"

namespace {

using vesk::plugin::lib::HarfBuzzWrapper;
using waveform_bench::median;
using Clock = std::chrono::steady_clock;
using Run = std::pair<std::vector<uint32_t>, uint8_t>;  // code points, bidi level

std::vector<Run> scopeLabels() {
  std::vector<Run> labels;
  for (int value = 120; value >= -20; value -= 10) {
    const std::string text = std::to_string(value);
    labels.push_back({std::vector<uint32_t>(text.begin(), text.end()), 0});
  }
  return labels;
}

// Pieces of Latin, digits and Arabic (level 1) cycled up to `length` code points.
std::vector<Run> mixedParagraph(size_t length) {
  const std::pair<std::u32string, uint8_t> pieces[] = {
      {U"Waveform levels ", 0},
      {U"\u0645\u0631\u062D\u0628\u0627 \u0628\u0627\u0644\u0639\u0627\u0644\u0645 ", 1},
      {U"-20 to 120 IRE, ", 0},
      {U"\u0627\u0644\u0646\u0635 \u0627\u0644\u0639\u0631\u0628\u064A ", 1},
      {U"AVAWAY To Wa. ", 0}};
  std::vector<Run> runs;
  size_t total = 0;
  for (size_t i = 0; total < length; ++i) {
    const auto& piece = pieces[i % (sizeof pieces / sizeof pieces[0])];
    const size_t take = std::min(piece.first.size(), length - total);
    runs.push_back(
        {std::vector<uint32_t>(piece.first.begin(), piece.first.begin() + take), piece.second});
    total += take;
  }
  return runs;
}

// Median over `repeats` of the time to shape every run once, in nanoseconds.
double timeRuns(HarfBuzzWrapper& wrapper, const std::vector<Run>& runs, int repeats) {
  std::vector<double> nanoseconds;
  for (int r = 0; r < repeats; ++r) {
    const Clock::time_point start = Clock::now();
    for (const Run& run : runs) {
      wrapper.shape(run.first, run.second);
    }
    nanoseconds.push_back(std::chrono::duration<double, std::nano>(Clock::now() - start).count());
  }
  return median(nanoseconds);
}

}  // namespace

int main(int argc, char** argv) {
  const int repeats = waveform_bench::runsOption(argc, argv, 200, "shaping_bench");
  if (repeats < 0) {
    return 2;
  }
  waveform_test::FreeTypeFace face("/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf", 0, 48);
  if (face.get() == nullptr) {
    std::fprintf(stderr, "shaping_bench: cannot open DejaVu Sans (run scripts/setup.sh)\n");
    return 1;
  }
  HarfBuzzWrapper wrapper;
  wrapper.setFace(face.get());
  const std::vector<Run> labels = scopeLabels();
  const std::vector<Run> paragraph = mixedParagraph(2000);
  timeRuns(wrapper, paragraph, 3);  // warm-up: HarfBuzz's lookup accelerators are built lazily

  const double quiet = timeRuns(wrapper, labels, repeats);
  std::fflush(stdout);
  const int savedStdout = dup(STDOUT_FILENO);
  const int devNull = open("/dev/null", O_WRONLY);
  dup2(devNull, STDOUT_FILENO);
  wrapper.setVerbose(true);
  const double verbose = timeRuns(wrapper, labels, repeats);
  wrapper.setVerbose(false);
  std::fflush(stdout);
  dup2(savedStdout, STDOUT_FILENO);
  close(devNull);
  close(savedStdout);
  const double whole = timeRuns(wrapper, paragraph, repeats);

  std::printf("shaping, DejaVu Sans 48 px, median of %d repeats\n", repeats);
  std::printf("  15 scope labels, quiet:   %.2f us per label\n", quiet / labels.size() / 1e3);
  std::printf("  15 scope labels, verbose: %.2f us per label (messages to /dev/null)\n",
              verbose / labels.size() / 1e3);
  std::printf(
      "  2,000-character paragraph in %zu runs: %.3f ms per paragraph, %.2f us per run, "
      "%.1f ns per character\n",
      paragraph.size(), whole / 1e6, whole / paragraph.size() / 1e3, whole / 2000);
  return 0;
}
