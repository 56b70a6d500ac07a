#!/usr/bin/env bash
# Ten hours of 44.1 kHz stereo 16-bit audio: opened, read end to end and saved
# by the velm tool, with the peak memory of the process reported.
#
#   bench/ten_hours.sh [BUILD_DIR]      (default build/release; needs sox)
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
build=${1:-$here/build/release}
tool="$build/apps/velm/velm"
work=$(mktemp -d "${TMPDIR:-/tmp}/velm-ten-hours.XXXXXX")
trap 'rm -rf "$work"' EXIT

echo "making ten hours of noise and tones (about 6.4 GB)..."
sox -n -r 44100 -c 2 -b 16 "$work/ten.wav" synth 36000 sine 440 pinknoise gain -6

measure() {
  local label=$1; shift
  /usr/bin/time -f "%e %M" -o "$work/time" "$@" > /dev/null
  read -r seconds kilobytes < "$work/time"
  printf '%-34s %8.1f s   peak memory %6d MB\n' "$label" "$seconds" $((kilobytes / 1024))
}

measure "open and measure every sample" "$tool" info "$work/ten.wav"
measure "open, read and save as WAV" "$tool" convert "$work/ten.wav" "$work/copy.wav"
cmp -s <(head -c 1000000 "$work/ten.wav" | tail -c 100000) <(head -c 1000000 "$work/copy.wav" | tail -c 100000) \
  && echo "the saved copy holds the same samples at 1 MB in" || echo "the copy differs"
