#!/usr/bin/env bash
# Runs the fuzz targets under libFuzzer with AddressSanitizer and UndefinedBehaviorSanitizer.
# Usage: scripts/fuzz.sh TARGET [SECONDS]   one target, 600 s unless told (e.g. wav_reader 60)
#        scripts/fuzz.sh --all [SECONDS]    every target in turn, SECONDS each (CI runs a few each)
#        scripts/fuzz.sh --list             the targets
# Each target starts from its seed inputs and its kept findings (fuzz/regressions/TARGET/) and
# grows a corpus in build/fuzz/corpus/TARGET/. A crash, a hang over one second (the time
# AVPOST_FUZZ_TIMEOUT says, in seconds), a leak, or an allocation over 1 GiB stops the run with
# status 1 and names the reproducer, written to build/fuzz/findings/TARGET/. Once the cause is
# fixed, keep the reproducer as fuzz/regressions/TARGET/<what-it-found>; the test suite replays
# it from then on.
set -euo pipefail
cd "$(dirname "$0")/.."

[ $# -ge 1 ] || { sed -n '2,11p' "$0" >&2; exit 2; }
what=$1
seconds=${2:-600}

scripts/install-deps.sh
build=${AVPOST_BUILD_ROOT:-build}/fuzz
flags="-fsanitize=fuzzer-no-link,address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer"
CC=clang CXX=clang++ cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo \
  -DAVPOST_BUILD_FUZZERS=ON -DAVPOST_BUILD_TESTS=OFF -DAVPOST_BUILD_BENCHMARKS=OFF \
  -DCMAKE_C_FLAGS="$flags" -DCMAKE_CXX_FLAGS="$flags" \
  -DCMAKE_EXE_LINKER_FLAGS="-fsanitize=address,undefined" >/dev/null
cmake --build "$build" --target avpost_fuzzers

targets=$(cd "$build/fuzz" && ls fuzz_replay_* | sed 's/^fuzz_replay_//')
if [ "$what" = "--list" ]; then echo "$targets"; exit 0; fi
[ "$what" = "--all" ] || targets=$what

run() {
  local target=$1
  local program="$build/fuzz/fuzz_$target"
  [ -x "$program" ] || { echo "no fuzz target '$target' (scripts/fuzz.sh --list)" >&2; exit 2; }
  local corpus="$build/corpus/$target" seeds="$build/seeds/$target"
  local findings="$build/findings/$target" kept="fuzz/regressions/$target"
  mkdir -p "$corpus" "$findings" "$kept"
  "$build/fuzz/fuzz_replay_$target" --write-seeds "$seeds" >/dev/null
  local dictionary=()
  [ -f "fuzz/dictionaries/$target.dict" ] && dictionary=("-dict=fuzz/dictionaries/$target.dict")
  echo "== fuzz $target: ${seconds} s"
  if ! ASAN_OPTIONS=detect_leaks=1 "$program" "${dictionary[@]+"${dictionary[@]}"}" \
      -max_total_time="$seconds" -timeout="${AVPOST_FUZZ_TIMEOUT:-1}" -max_len=16384 -rss_limit_mb=2048 -malloc_limit_mb=1024 \
      -artifact_prefix="$findings/" -print_final_stats=1 "$corpus" "$seeds" "$kept" >/dev/null 2>"$findings/log"; then
    tail -n 40 "$findings/log" >&2
    echo "fuzz $target found a problem; reproducer: $(ls -t "$findings" | grep -v '^log$' | head -n 1)" >&2
    exit 1
  fi
  grep -E '^(Done|stat::number_of_executed_units)' "$findings/log" || true
  rmdir "$kept" 2>/dev/null || true
}

for target in $targets; do run "$target"; done
