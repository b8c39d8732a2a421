#!/usr/bin/env bash
# Builds the hexagon library and its tests and runs them under qemu-hexagon. The
# comparison with the host's bytes needs the host build (scripts/test.sh) first.
set -euo pipefail
cd "$(dirname "$0")/.."
cmake --preset hexagon
cmake --build --preset hexagon
ctest --preset hexagon
