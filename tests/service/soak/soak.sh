#!/usr/bin/env bash
# Soak run of the analysis service on a private dbus-daemon (not part of the
# test suite). Usage: tests/service/soak/soak.sh [BUILD_DIR] [REQUESTS]
set -euo pipefail
build=${1:-build}
ninja -C "$build" service_soak brindlewick >/dev/null
exec "$build/tests/service_soak" "${2:-10000}"
