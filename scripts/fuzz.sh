#!/usr/bin/env bash
# Fuzzes the font file reader with libFuzzer, built with clang under AddressSanitizer and
# UndefinedBehaviorSanitizer, starting from seed fonts written by the sfnt test writer.
#   scripts/fuzz.sh [SECONDS [LIBFUZZER-OPTION...]]   run for SECONDS (default 600)
# Inputs that crash, leak or time out are saved under build-fuzz/fuzz/artifacts/; the corpus
# grows in build-fuzz/fuzz/corpus/ and is reused by the next run.
# FUZZ_TARGET=polygon_triangulation fuzzes the triangulator instead, FUZZ_TARGET=glyph_outline
# the whole glyph geometry (contours to loops, containment tree and triangles); neither has seeds,
# and their corpus and artifacts live in build-fuzz/fuzz/<target>_corpus/ and _artifacts/.
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
  font_file_reader | polygon_triangulation | glyph_outline) ;;
  *)
    echo "FUZZ_TARGET must be font_file_reader, polygon_triangulation or glyph_outline" >&2
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
