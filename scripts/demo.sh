#!/usr/bin/env bash
# Builds the release tree and runs the main job: `xal demo` (extra arguments go to xal demo).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/deps.sh
cmake --preset release >/dev/null
cmake --build --preset release
exec build/release/bin/xal demo "$@"
