#!/usr/bin/env bash
# Checks that the sources keep the house format (scripts/format.sh), then builds and tests the
# library four ways: x86-64 (with its Debian packages, and a smoke run of every benchmark), 32-bit
# x86 (-m32), x86-64 with AddressSanitizer and UndefinedBehaviorSanitizer, and the tests labelled
# "threads" under ThreadSanitizer, each with every compiler warning an error; then runs every
# fuzz target briefly over its kept corpus (clang's libFuzzer). Exits non-zero on the first
# failure.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/install-deps.sh --i386 --bench
echo "== format =="
scripts/format.sh --check

jobs=$(nproc)
build_root=${AVPOST_BUILD_ROOT:-build}

# variant <name> <cmake arguments>...; build_target and test_label narrow what is built and run.
variant() {
  local name=$1; shift
  echo "== ${name} =="
  cmake -S . -B "${build_root}/${name}" -G Ninja -DAVPOST_WARNINGS_AS_ERRORS=ON "$@" >/dev/null
  cmake --build "${build_root}/${name}" -j "${jobs}" ${build_target:+--target "${build_target}"}
  ctest --test-dir "${build_root}/${name}" -j "${jobs}" --output-on-failure --no-tests=error \
    ${test_label:+-L "${test_label}"}
}

# A few iterations of each benchmark, so that none can rot; the figures are printed, not judged.
smoke_benchmarks() {
  local bench
  for bench in "${build_root}"/x86-64/benchmarks/*_bench "${build_root}"/x86-64/benchmarks/peers/peer_bench; do
    [ -x "${bench}" ] || continue
    echo "== smoke run of ${bench##*/} =="
    "${bench}" --benchmark_min_time=0.001 --benchmark_repetitions=1
  done
}

variant x86-64 -DCMAKE_BUILD_TYPE=RelWithDebInfo -DAVPOST_TEST_DEB_PACKAGES=ON
smoke_benchmarks
variant i386 -DCMAKE_BUILD_TYPE=RelWithDebInfo \
  -DCMAKE_TOOLCHAIN_FILE="$PWD/cmake/toolchains/i386-linux-gnu.cmake" -DAVPOST_BUILD_BENCHMARKS=OFF
sanitizers="-fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer"
variant sanitize -DCMAKE_BUILD_TYPE=Debug -DAVPOST_BUILD_BENCHMARKS=OFF \
  -DCMAKE_CXX_FLAGS="${sanitizers}" -DCMAKE_C_FLAGS="${sanitizers}" \
  -DCMAKE_EXE_LINKER_FLAGS="${sanitizers}" -DCMAKE_SHARED_LINKER_FLAGS="${sanitizers}"
tsan="-fsanitize=thread -fno-omit-frame-pointer"
build_target=avpost_thread_tests test_label=threads \
  variant tsan -DCMAKE_BUILD_TYPE=Debug -DAVPOST_BUILD_BENCHMARKS=OFF \
  -DCMAKE_CXX_FLAGS="${tsan}" -DCMAKE_C_FLAGS="${tsan}" \
  -DCMAKE_EXE_LINKER_FLAGS="${tsan}" -DCMAKE_SHARED_LINKER_FLAGS="${tsan}"
# The hang limit is generous here: on a shared CI machine a pause of the process is no hang.
AVPOST_BUILD_ROOT="${build_root}" AVPOST_FUZZ_TIMEOUT=10 scripts/fuzz.sh --all "${AVPOST_FUZZ_SECONDS:-8}"
echo "All builds passed."
