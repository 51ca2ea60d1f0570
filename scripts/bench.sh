#!/usr/bin/env bash
# Builds everything and times the waveform analysis on this machine's GL, with ffmpeg's waveform
# filter on the same pictures as an outside reference. Arguments go to the benchmark
# (--runs N, --quick, --no-ffmpeg).
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

"$root/scripts/setup.sh" --bench
"$root/scripts/build.sh" >/dev/null
"$root/build/bench/analysis_bench" "$@"
