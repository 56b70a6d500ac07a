#!/usr/bin/env bash
# Sets the machine up, builds, and runs the main job on the built-in demo sound:
# what the sound is and how loud each channel is, then a picture of its view.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)

"$here/scripts/setup.sh" --no-build
"$here/scripts/build.sh" release velm_tool
tool="$here/build/release/apps/velm/velm"
"$tool" info
"$tool" render -o "$here/build/demo.png" --size 1200x400
echo "velm: the demo sound's view is in $here/build/demo.png"
