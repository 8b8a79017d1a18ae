#!/usr/bin/env bash
# Installs the packages the build needs, builds the avpost command-line tool (Release, without
# tests and benchmarks) and prints the tool's path on standard output; the build's own
# messages go to standard error.
# Usage: tool=$(scripts/build-tool.sh)
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh >&2

build="${AVPOST_BUILD_ROOT:-build}/release"
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
  -DAVPOST_BUILD_TESTS=OFF -DAVPOST_BUILD_BENCHMARKS=OFF >/dev/null
cmake --build "$build" --target avpost_tool -j "$(nproc)" >&2
realpath "$build/tools/avpost/avpost"
