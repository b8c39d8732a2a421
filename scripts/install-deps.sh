#!/usr/bin/env bash
# Installs what the host and hexagon builds need, from Debian's packages.
set -euo pipefail
SUDO=""
if [ "$(id -u)" -ne 0 ]; then SUDO=sudo; fi
export DEBIAN_FRONTEND=noninteractive
$SUDO apt-get update -q
$SUDO apt-get install -y -q --no-install-recommends \
  cmake make g++ libgtest-dev libgmock-dev libbenchmark-dev libpng-dev libopencv-dev \
  clang-16 lld-16 llvm-16 qemu-user libclang-rt-16-dev libfuzzer-16-dev
