#!/usr/bin/env bash
# The velm tool beside common command-line tools on one hour of 44.1 kHz
# stereo 16-bit WAV: the whole-hour waveform at 1920x400 against ffmpeg's
# showwavespic, and the whole-hour spectrogram at 1920 columns against sox.
# Prints each run's time and peak memory, then the ratios against the goals:
# waveform at least 4 times faster than ffmpeg with at most an eighth of its
# peak memory; spectrogram at least 2 times faster than sox.
#
#   bench/side_by_side.sh [BUILD_DIR]   (default build/release; needs sox,
#                                        ffmpeg: scripts/setup.sh --bench)
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)
build=${1:-$here/build/release}
tool="$build/apps/velm/velm"
for needed in sox ffmpeg /usr/bin/time; do
  command -v "$needed" > /dev/null || { echo "side_by_side: $needed is missing (scripts/setup.sh --bench)" >&2; exit 1; }
done
[ -x "$tool" ] || { echo "side_by_side: no $tool; build velm_tool first" >&2; exit 1; }
work=$(mktemp -d "${TMPDIR:-/tmp}/velm-side-by-side.XXXXXX")
trap 'rm -rf "$work"' EXIT
hour="$work/hour.wav"

echo "making one hour of tones and noise (about 635 MB)..."
sox -n -r 44100 -c 2 -b 16 "$hour" synth 3600 sine 440 pinknoise gain -6
cat "$hour" > /dev/null  # every run starts with the file in the page cache

echo "1920x400 pictures of the whole hour; the page cache is warm; load: $(cut -d' ' -f1-3 /proc/loadavg)"
# measure NAME COMMAND...: runs the command under /usr/bin/time -v and keeps
# its wall-clock seconds and peak resident kilobytes in seconds_NAME, kb_NAME.
measure() {
  local name=$1; shift
  /usr/bin/time -v -o "$work/time.$name" "$@" > /dev/null 2> "$work/err.$name" ||
    { echo "side_by_side: $name failed:" >&2; cat "$work/err.$name" >&2; exit 1; }
  local clock kb cpu
  clock=$(sed -n 's/.*Elapsed (wall clock) time.*: //p' "$work/time.$name")
  kb=$(sed -n 's/.*Maximum resident set size (kbytes): //p' "$work/time.$name")
  cpu=$(awk -F': ' '/User time|System time/ { s += $2 } END { print s }' "$work/time.$name")
  # h:mm:ss or m:ss.cc to seconds
  printf -v "seconds_$name" '%s' "$(awk -F: '{ s = 0; for (i = 1; i <= NF; i++) s = s * 60 + $i; print s }' <<< "$clock")"
  printf -v "kb_$name" '%s' "$kb"
  local seconds_var="seconds_$name"
  printf '%-18s %7.2f s (CPU %6.2f s)   peak memory %6d MB\n' "$name" "${!seconds_var}" "$cpu" $((kb / 1024))
}

measure velm_waveform "$tool" render "$hour" -o "$work/velm_waveform.png" --size 1920x400 --lanes waveform
measure ffmpeg_waveform ffmpeg -v error -y -i "$hour" -filter_complex showwavespic=s=1920x400 -frames:v 1 \
  "$work/ffmpeg_waveform.png"
measure velm_spectrogram "$tool" render "$hour" -o "$work/velm_spectrogram.png" --size 1920x400 --lanes spectrogram
measure sox_spectrogram sox "$hour" -n spectrogram -x 1920 -o "$work/sox_spectrogram.png"

# verdict LABEL RATIO GOAL: RATIO against GOAL, "met" or "missed".
verdict() {
  awk -v label="$1" -v ratio="$2" -v goal="$3" \
    'BEGIN { printf "%-44s %6.2fx (goal %sx) %s\n", label, ratio, goal, (ratio >= goal ? "met" : "MISSED") }'
}
echo
verdict "waveform: ffmpeg time / velm time" "$(awk "BEGIN { print $seconds_ffmpeg_waveform / $seconds_velm_waveform }")" 4
verdict "waveform: ffmpeg memory / velm memory" "$(awk "BEGIN { print $kb_ffmpeg_waveform / $kb_velm_waveform }")" 8
verdict "spectrogram: sox time / velm time" "$(awk "BEGIN { print $seconds_sox_spectrogram / $seconds_velm_spectrogram }")" 2
