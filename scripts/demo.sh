#!/usr/bin/env bash
# Builds everything and shows the Waveform scope at work: vtpl-host renders its built-in test
# frame (colour bars over a grey ramp) with the scope control attached and writes the frame, the
# rendered output and the control's picture into out/demo/; then it renders the same frame with
# the scope screened into its lower-right quarter. Extra arguments go to the first vtpl-host run
# (for example --set waveformMode=RGB).
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
out="$root/out/demo"

log=$(mktemp)
trap 'rm -f "$log"' EXIT
echo "Building (this takes a minute the first time)..."
if ! "$root/scripts/build.sh" >"$log" 2>&1; then
  cat "$log"
  echo "demo: the build failed" >&2
  exit 1
fi
"$root/build/vtpl-host" demo -o "$out" "$@" >/dev/null
# The test frame is 1280 x 720; positions are frame pixels from its centre, x right and y up, so
# (0, 0) to (640, -360) is the lower-right quarter.
"$root/build/vtpl-host" render "$out/test-frame.png" -o "$out/render-to-layer.png" \
  --set blendType=Screen --set scopePositionTL=0,0 --set scopePositionBR=640,-360 \
  --set renderToLayerShowGuidelines=true --set renderToLayerShowStandardColorBars=true
cat <<TEXT
The pictures are in $out:
  test-frame.png       the built-in test frame: nine 75 % colour bars over a grey ramp
  output.png           the frame rendered through the effect (unchanged without a blend)
  scope.png            the scope control the editor shows in the effect's panel
  render-to-layer.png  the frame with the scope screened into its lower-right quarter
TEXT
