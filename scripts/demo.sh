#!/usr/bin/env bash
# Sets everything up on a Debian machine (the packages the build needs), builds the avpost
# command-line tool and runs its demo, which writes its results into a folder.
# Usage: scripts/demo.sh [FOLDER]   (default: avpost-demo in the current folder)
set -euo pipefail
folder=$(realpath -m "${1:-avpost-demo}")
cd "$(dirname "$0")/.."

scripts/install-deps.sh

build="${AVPOST_BUILD_ROOT:-build}/release"
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
  -DAVPOST_BUILD_TESTS=OFF -DAVPOST_BUILD_BENCHMARKS=OFF >/dev/null
cmake --build "$build" --target avpost_tool -j "$(nproc)"
"$build/tools/avpost/avpost" demo "$folder"
