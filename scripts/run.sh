#!/usr/bin/env bash
# Sets up, builds, and runs the main job on the project's sample store.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/build.sh >/dev/null
BUILD_DIR=${BUILD_DIR:-build}
bin="$BUILD_DIR"/src/brindlewick
# Three days of a simulated laptop, generated once.
[[ -d sample-store ]] || "$BUILD_DIR"/tools/samplestore/brindlewick-samplestore --days 3 --output sample-store
# The dashboard over all of it.
"$bin" --from ./sample-store
