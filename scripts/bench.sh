#!/usr/bin/env bash
# Builds everything and runs the benchmarks on this machine's GL:
#   analysis_bench  the waveform analysis of HD and UHD frames, with ffmpeg's waveform filter on
#                   the same pictures as an outside reference (--runs N, --quick, --no-ffmpeg,
#                   --folder DIR)
#   scope_bench     whole HD frames through the reference host: render, scope control drawing,
#                   both, for each mode and layout (--runs N)
#   font_cache_bench  the font catalogue's first load and its lookups (--runs N)
#   glyph_geometry_bench  outline building and triangulation of every DejaVu Sans glyph
#   character_cache_bench  outline requests for the labels' glyphs, empty and filled cache (--runs N)
#   unicode_data_bench  the first Basic Latin query and loading the whole UnicodeData.txt (--runs N)
#   bidi_bench      bidi resolution of a 10,000-character mixed Arabic and Latin paragraph (--runs N)
#   shaping_bench   shaping the 15 scope labels (quiet and verbose) and a 2,000-character mixed
#                   paragraph (--runs N)
#   scripts/bench.sh [--only analysis|scope|fonts|glyphs|cache|unicode|bidi|shaping] [--runs N]
#                    [--quick] [--no-ffmpeg] [--folder DIR]
set -euo pipefail
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

usage() {
  echo "usage: scripts/bench.sh [--only analysis|scope|fonts|glyphs|cache|unicode|bidi|shaping] [--runs N] [--quick] [--no-ffmpeg] [--folder DIR]" >&2
  exit 2
}

only=""
analysis_arguments=()
scope_arguments=()
while (($# > 0)); do
  case "$1" in
    --only | --runs | --folder)
      (($# >= 2)) || usage
      ;;&
    --only)
      only="$2"
      shift 2
      ;;
    --runs)
      analysis_arguments+=("$1" "$2")
      scope_arguments+=("$1" "$2")
      shift 2
      ;;
    --folder)
      analysis_arguments+=("$1" "$2")
      shift 2
      ;;
    --quick | --no-ffmpeg)
      analysis_arguments+=("$1")
      shift
      ;;
    *)
      usage
      ;;
  esac
done
if [[ -n "$only" && ! "$only" =~ ^(analysis|scope|fonts|glyphs|cache|unicode|bidi|shaping)$ ]]; then
  echo "bench: --only takes analysis, scope, fonts, glyphs, cache, unicode, bidi or shaping, not '$only'" >&2
  usage
fi

"$root/scripts/setup.sh" --bench
"$root/scripts/build.sh" >/dev/null
if [[ -z "$only" || "$only" == analysis ]]; then
  "$root/build/bench/analysis_bench" "${analysis_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == scope ]]; then
  "$root/build/bench/scope_bench" "${scope_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == fonts ]]; then
  "$root/build/bench/font_cache_bench" "${scope_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == glyphs ]]; then
  "$root/build/bench/glyph_geometry_bench"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == cache ]]; then
  "$root/build/bench/character_cache_bench" "${scope_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == unicode ]]; then
  "$root/build/bench/unicode_data_bench" "${scope_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == bidi ]]; then
  "$root/build/bench/bidi_bench" "${scope_arguments[@]}"
  [[ -n "$only" ]] || echo
fi
if [[ -z "$only" || "$only" == shaping ]]; then
  "$root/build/bench/shaping_bench" "${scope_arguments[@]}"
fi
