#!/usr/bin/env bash
# Sets up the machine (once) and builds everything into $BUILD_DIR (default: build).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
BUILD_DIR=${BUILD_DIR:-build}
# shellcheck disable=SC2086
cmake -S . -B "$BUILD_DIR" -G Ninja ${CMAKE_EXTRA:-} >/dev/null
ninja -C "$BUILD_DIR"
