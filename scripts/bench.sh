#!/usr/bin/env bash
# Builds an optimised x86-64 tree and runs the side-by-side benchmark: each work of ours beside
# libyuv, libswscale/libswresample and libjpeg-turbo on identical input, interleaved, medians of
# 5 repetitions, one thread, ending with a table of ratios ours / fastest peer.
# Usage: scripts/bench.sh [benchmark flags...], e.g. --benchmark_filter=resize
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh --bench
build=${AVPOST_BUILD_ROOT:-build}/bench
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DAVPOST_BUILD_TESTS=OFF >/dev/null
cmake --build "$build" --target peer_bench
"$build/benchmarks/peers/peer_bench" "$@"
