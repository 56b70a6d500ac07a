#!/usr/bin/env bash
# Configures and builds one flavour of the tree.
#
#   scripts/build.sh release     -> build/release
#   scripts/build.sh sanitize    -> build/sanitize (AddressSanitizer + UBSan)
#
# Extra arguments go to ninja (for example a target name).
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
flavour=${1:-release}
shift || true

mkdir -p "$here/build"
case "$flavour" in
  release)  dir="$here/build/release";  opts=(-DCMAKE_BUILD_TYPE=RelWithDebInfo) ;;
  sanitize) dir="$here/build/sanitize"; opts=(-DCMAKE_BUILD_TYPE=Debug -DVELM_SANITIZE=ON -DVELM_BUILD_BENCH=OFF) ;;
  *) echo "build.sh: unknown flavour '$flavour' (release or sanitize)" >&2; exit 2 ;;
esac

# Configure every time: source folders join the build when they appear, and
# CMake only notices that on a fresh configure.
cmake -S "$here" -B "$dir" -G Ninja "${opts[@]}" > "$dir.configure.log" 2>&1 || {
  cat "$dir.configure.log" >&2
  exit 1
}
# Let ccache share results between clones of the tree in other folders.
export CCACHE_BASEDIR="$here" CCACHE_NOHASHDIR=1
jobs=${VELM_JOBS:-$(nproc)}
cmake --build "$dir" -j "$jobs" -- "$@"
