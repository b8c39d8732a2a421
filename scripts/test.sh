#!/usr/bin/env bash
# Builds the host library and runs the whole host test suite.
set -euo pipefail
cd "$(dirname "$0")/.."
cmake --preset host
cmake --build --preset host
ctest --preset host
