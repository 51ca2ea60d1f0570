#!/usr/bin/env bash
# Builds everything and shows the Waveform effect as the host sees it: its information and its
# parameter panel. Extra arguments go to vtpl-host (for example --set waveformMode=RGB).
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

log=$(mktemp)
trap 'rm -f "$log"' EXIT
echo "Building (this takes a minute the first time)..."
if ! "$root/scripts/build.sh" >"$log" 2>&1; then
  cat "$log"
  echo "demo: the build failed" >&2
  exit 1
fi
"$root/build/vtpl-host" info "$@"
