#!/usr/bin/env bash
# Configures and builds the module, the reference host, the tool and the tests.
#   scripts/build.sh              into build/
#   scripts/build.sh --sanitize   into build-sanitize/, everything with ASan and UBSan
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

build_dir="$root/build"
cmake_options=()
for argument in "$@"; do
  case "$argument" in
    --sanitize)
      build_dir="$root/build-sanitize"
      cmake_options+=(-DWAVEFORM_SANITIZE=ON)
      ;;
    *)
      echo "usage: scripts/build.sh [--sanitize]" >&2
      exit 2
      ;;
  esac
done

"$root/scripts/setup.sh"
cmake -S "$root" -B "$build_dir" -G Ninja "${cmake_options[@]}" >/dev/null
cmake --build "$build_dir" -j "$(nproc)"
