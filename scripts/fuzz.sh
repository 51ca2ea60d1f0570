#!/usr/bin/env bash
# Fuzzes the font file reader with libFuzzer, built with clang under AddressSanitizer and
# UndefinedBehaviorSanitizer, starting from seed fonts written by the sfnt test writer.
#   scripts/fuzz.sh [SECONDS [LIBFUZZER-OPTION...]]   run for SECONDS (default 600)
# Inputs that crash, leak or time out are saved under build-fuzz/fuzz/artifacts/; the corpus
# grows in build-fuzz/fuzz/corpus/ and is reused by the next run.
# FUZZ_TARGET=polygon_triangulation fuzzes the triangulator instead, FUZZ_TARGET=glyph_outline
# the whole glyph geometry (contours to loops, containment tree and triangles); neither has seeds,
# and their corpus and artifacts live in build-fuzz/fuzz/<target>_corpus/ and _artifacts/.
# FUZZ_TARGET=unicode_data fuzzes the Unicode data file readers, seeded with the first lines of
# the installed UnicodeData.txt and BidiBrackets.txt (joined by a 0xFF byte, as the target splits
# its input).
# FUZZ_TARGET=bidi fuzzes the bidi engine over token chains built from UTF-16 text (no seeds).
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
seconds="${1:-600}"
shift $(($# > 0 ? 1 : 0))
if ! [[ "$seconds" =~ ^[0-9]+$ ]]; then
  echo "usage: scripts/fuzz.sh [SECONDS [LIBFUZZER-OPTION...]]" >&2
  exit 2
fi

target="${FUZZ_TARGET:-font_file_reader}"
case "$target" in
  font_file_reader | polygon_triangulation | glyph_outline | unicode_data | bidi) ;;
  *)
    echo "FUZZ_TARGET must be font_file_reader, polygon_triangulation, glyph_outline," \
      "unicode_data or bidi" >&2
    exit 2
    ;;
esac

"$root/scripts/setup.sh" --fuzz
build_dir="$root/build-fuzz"
cmake -S "$root" -B "$build_dir" -G Ninja \
  -DCMAKE_C_COMPILER=clang -DCMAKE_CXX_COMPILER=clang++ \
  -DWAVEFORM_SANITIZE=ON -DWAVEFORM_FUZZ=ON -DWAVEFORM_BUILD_TESTS=OFF >/dev/null
work="$build_dir/fuzz"
export ASAN_OPTIONS="${ASAN_OPTIONS:-detect_leaks=1}"
export UBSAN_OPTIONS="${UBSAN_OPTIONS:-print_stacktrace=1}"
if [[ "$target" == unicode_data ]]; then
  cmake --build "$build_dir" --target unicode_data_fuzzer
  corpus="$work/unicode_data_corpus"
  artifacts="$work/unicode_data_artifacts"
  seeds="$work/unicode_data_seeds"
  mkdir -p "$corpus" "$artifacts" "$seeds"
  for lines in 5 40 300; do
    { head -n "$lines" /usr/share/unicode/UnicodeData.txt
      printf '\xff'
      head -n "$((lines + 40))" /usr/share/unicode/BidiBrackets.txt; } >"$seeds/first_$lines"
  done
  "$work/unicode_data_fuzzer" "$corpus" "$seeds" \
    -max_len=16384 -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
    -artifact_prefix="$artifacts/" -print_final_stats=1 "$@"
  exit
fi
if [[ "$target" != font_file_reader ]]; then
  cmake --build "$build_dir" --target "${target}_fuzzer"
  corpus="$work/${target}_corpus"
  artifacts="$work/${target}_artifacts"
  mkdir -p "$corpus" "$artifacts"
  "$work/${target}_fuzzer" "$corpus" \
    -max_len=1024 -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
    -artifact_prefix="$artifacts/" -print_final_stats=1 "$@"
  exit
fi

cmake --build "$build_dir" --target font_file_reader_fuzzer write_seed_fonts
mkdir -p "$work/corpus" "$work/artifacts"
"$work/write_seed_fonts" "$work/seeds"
"$work/font_file_reader_fuzzer" "$work/corpus" "$work/seeds" \
  -max_len=65536 -max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 \
  -artifact_prefix="$work/artifacts/" -print_final_stats=1 "$@"
