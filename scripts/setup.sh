#!/usr/bin/env bash
# Installs every Debian package that building, testing and benchmarking libvelm need,
# then configures and builds. Safe to run again: installed packages are skipped.
#
#   scripts/setup.sh [--bench] [--no-build]
#
# --bench adds the tools bench/side_by_side.sh compares against; the tests never need them.
set -euo pipefail

bench=0
build=1
for arg in "$@"; do
  case "$arg" in
    --bench) bench=1 ;;
    --no-build) build=0 ;;
    *) echo "usage: scripts/setup.sh [--bench] [--no-build]" >&2; exit 2 ;;
  esac
done

packages=(
  build-essential g++ cmake ninja-build pkg-config ccache
  qt6-base-dev qt6-qpa-plugins fonts-dejavu-core
  libsqlite3-dev liblua5.1-0-dev lua5.1
  libsndfile1-dev libfftw3-dev libsoxr-dev libasound2-dev
  libgtest-dev libgmock-dev libbenchmark-dev
  sox time
)
[ "$bench" -eq 1 ] && packages+=(ffmpeg)

missing=()
for p in "${packages[@]}"; do
  if ! dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed'; then
    missing+=("$p")
  fi
done

if [ ${#missing[@]} -gt 0 ]; then
  echo "setup: installing ${missing[*]}"
  sudo_cmd=()
  [ "$(id -u)" -ne 0 ] && sudo_cmd=(sudo)
  export DEBIAN_FRONTEND=noninteractive
  "${sudo_cmd[@]}" apt-get update -qq
  "${sudo_cmd[@]}" apt-get install -y -qq --no-install-recommends "${missing[@]}"
fi

[ "$build" -eq 0 ] && exit 0

here=$(cd "$(dirname "$0")/.." && pwd)
"$here/scripts/build.sh" release
