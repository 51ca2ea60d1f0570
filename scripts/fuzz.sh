#!/usr/bin/env bash
# Fuzzes the font file reader with libFuzzer, built with clang under AddressSanitizer and
# UndefinedBehaviorSanitizer, starting from seed fonts written by the sfnt test writer.
#   scripts/fuzz.sh [SECONDS [LIBFUZZER-OPTION...]]   run for SECONDS (default 600)
# Inputs that crash, leak or time out are saved under build-fuzz/fuzz/artifacts/; the corpus
# grows in build-fuzz/fuzz/corpus/ and is reused by the next run.
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
seconds="${1:-600}"
shift $(($# > 0 ? 1 : 0))
if ! [[ "$seconds" =~ ^[0-9]+$ ]]; then
  echo "usage: scripts/fuzz.sh [SECONDS [LIBFUZZER-OPTION...]]" >&2
  exit 2
fi

"$root/scripts/setup.sh" --fuzz
build_dir="$root/build-fuzz"
cmake -S "$root" -B "$build_dir" -G Ninja \
  -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++ \
  -DWAVEFORM_SANITIZE=ON -DWAVEFORM_FUZZ=ON -DWAVEFORM_BUILD_TESTS=OFF >/dev/null
cmake --build "$build_dir" --target font_file_reader_fuzzer write_seed_fonts

work="$build_dir/fuzz"
mkdir -p "$work/corpus" "$work/artifacts"
"$work/write_seed_fonts" "$work/seeds"
export ASAN_OPTIONS="${ASAN_OPTIONS:-detect_leaks=1}"
export UBSAN_OPTIONS="${UBSAN_OPTIONS:-print_stacktrace=1}"
"$work/font_file_reader_fuzzer" "$work/corpus" "$work/seeds" \
  -max_len=65536 -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
  -artifact_prefix="$work/artifacts/" -print_final_stats=1 "$@"
