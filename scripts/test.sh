#!/usr/bin/env bash
# Installs what is missing, builds everything and runs every test.
#   scripts/test.sh              the normal build
#   scripts/test.sh --sanitize   the whole suite built with ASan and UBSan
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

build_dir="$root/build"
for argument in "$@"; do
  [[ "$argument" == "--sanitize" ]] && build_dir="$root/build-sanitize"
done

"$root/scripts/build.sh" "$@"
export ASAN_OPTIONS="${ASAN_OPTIONS:-detect_leaks=1:strict_string_checks=1}"
export LSAN_OPTIONS="${LSAN_OPTIONS:-suppressions=$root/tests/sanitizer/lsan.supp}"
export UBSAN_OPTIONS="${UBSAN_OPTIONS:-print_stacktrace=1}"
ctest --test-dir "$build_dir" --output-on-failure --no-tests=error -j "$(nproc)"
