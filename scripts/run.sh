#!/usr/bin/env bash
# Sets up, builds, and runs the main job on the project's sample store.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/build.sh >/dev/null
BUILD_DIR=${BUILD_DIR:-build}
"$BUILD_DIR"/src/brindlewick --help
