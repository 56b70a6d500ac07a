#!/usr/bin/env bash
# Sets the machine up, builds, and runs the main job on the built-in demo sound.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)

"$here/scripts/setup.sh" --no-build
"$here/scripts/build.sh" release velm_tool
"$here/build/release/apps/velm/velm" info
