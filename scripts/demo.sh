#!/usr/bin/env bash
# Builds everything and shows the Waveform effect as the host sees it: its information and its
# parameter panel.
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

"$root/scripts/build.sh" >/dev/null
"$root/build/vtpl-host" info "$@"
