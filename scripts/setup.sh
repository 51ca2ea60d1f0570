#!/usr/bin/env bash
# Installs every Debian package the project needs to build, test and run, and nothing when all
# are present. Safe to run again; uses sudo when not run as root.
set -euo pipefail
#   scripts/setup.sh          what building and testing need
#   scripts/setup.sh --bench  also what the benchmarks compare against
#   scripts/setup.sh --fuzz   also the compiler and runtime of the fuzz targets

packages=(
  build-essential cmake ninja-build pkg-config binutils clang-format
  libglew-dev libegl-dev libgl-dev libegl-mesa0 libgl1-mesa-dri
  libfreetype-dev libharfbuzz-dev libharfbuzz-bin zlib1g-dev libfontconfig-dev fontconfig fonts-dejavu-core
  fonts-cantarell fonts-inter-variable fonts-wqy-microhei fonts-urw-base35 libpolyclipping-dev
  libpng-dev unicode-data
  libgtest-dev libgmock-dev libbenchmark-dev
)
case "${1:-}" in
  --bench) packages+=(ffmpeg) ;;
  --fuzz) packages+=(clang libclang-rt-14-dev) ;;
esac

missing=()
for package in "${packages[@]}"; do
  status=$(dpkg-query -W -f='${Status}' "$package" 2>/dev/null || true)
  [[ "$status" == "install ok installed" ]] || missing+=("$package")
done

if ((${#missing[@]} == 0)); then
  exit 0
fi

echo "setup: installing ${missing[*]}"
sudo_cmd=()
if [[ $(id -u) -ne 0 ]]; then
  sudo_cmd=(sudo)
fi
export DEBIAN_FRONTEND=noninteractive
"${sudo_cmd[@]}" apt-get update -q
"${sudo_cmd[@]}" apt-get install -y -q --no-install-recommends "${missing[@]}"
