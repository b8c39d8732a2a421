#!/usr/bin/env bash
# Builds the host library and runs the whole host test suite, with the photographs that
# some kernel tests use (scripts/fetch-photos.sh).
set -euo pipefail
cd "$(dirname "$0")/.."
bash scripts/fetch-photos.sh || echo "test: no photographs (their tests skip)"
cmake --preset host
cmake --build --preset host
ctest --preset host
