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
sox -n -r 44100 -c 2 -b 16 "$work/ten.w64" synth 36000 sine 440 pinknoise gain -6

measure() {
  local label=$1; shift
  /usr/bin/time -f "%e %M" -o "$work/time" "$@" > /dev/null
  read -r seconds kilobytes < "$work/time"
  printf '%-34s %8.1f s   peak memory %6d MB\n' "$label" "$seconds" $((kilobytes / 1024))
}

measure "open and measure every sample" "$tool" info "$work/ten.w64"
measure "open, read and save as WAV" "$tool" convert "$work/ten.w64" "$work/copy.wav"
# Plain WAV cannot hold more than 4 GB, so the source is a Wave64 file; the copy
# is an RF64 file, which sox does not read: compare what the library reads back
# from both, their lengths and one second in the first and in the last hour.
same=yes
[ "$("$tool" info "$work/ten.w64" | grep '^length')" = "$("$tool" info "$work/copy.wav" | grep '^length')" ] || same=no
for at in 1800 34200; do
  a=$("$tool" info "$work/ten.w64" --from $at --to $((at + 1)) | grep '^channel')
  b=$("$tool" info "$work/copy.wav" --from $at --to $((at + 1)) | grep '^channel')
  [ "$a" = "$b" ] || same=no
done
[ $same = yes ] && echo "the saved copy reads back the same" || { echo "the saved copy differs"; exit 1; }
