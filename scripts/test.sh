#!/usr/bin/env bash
# Sets the machine up, then builds and runs the whole test suite twice: a normal
# build and an AddressSanitizer + UndefinedBehaviorSanitizer build.
set -euo pipefail
here=$(cd "$(dirname "$0")/.." && pwd)

"$here/scripts/setup.sh" --no-build

status=0
for flavour in release sanitize; do
  echo "== $flavour build"
  "$here/scripts/build.sh" "$flavour"
  echo "== $flavour tests"
  if ! ctest --test-dir "$here/build/$flavour" --output-on-failure -j "$(nproc)"; then
    status=1
  fi
done
exit $status
