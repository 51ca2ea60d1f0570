// What the timing programs share: the median of repeated timings, and the --runs N option of the
// programs that take no other.
#ifndef WAVEFORM_BENCH_BENCH_RUNS_H
#define WAVEFORM_BENCH_BENCH_RUNS_H

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

namespace waveform_bench {

inline double median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values[values.size() / 2];
}

// The run count of "--runs N" (at least 1), `runs` without it; -1 after printing the usage of
// `program` for any other argument.
inline int runsOption(int argc, char** argv, int runs, const char* program) {
  for (int i = 1; i < argc; ++i) {
    if (std::string(argv[i]) == "--runs" && i + 1 < argc) {
      runs = std::max(1, std::atoi(argv[++i]));
    } else {
      std::fprintf(stderr, "usage: %s [--runs N]\n", program);
      return -1;
    }
  }
  return runs;
}

}  // namespace waveform_bench

#endif  // WAVEFORM_BENCH_BENCH_RUNS_H
