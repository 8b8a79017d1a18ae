#!/usr/bin/env bash
# Times avpost convert against ffmpeg doing the same work: a 10 s 1080p H.264 clip with AAC
# sound (made once by ffmpeg's test sources) to 720p H.264 at --preset veryfast with AAC sound,
# an MP4 with its index in front. ffmpeg gets -vf fps,scale,pad and the same encoder settings.
# The two run in turn, so that both see the same load; prints each run's wall and CPU times,
# the medians, their ratio and the load average before and after (the machine may be shared).
# With hyperfine installed it also runs hyperfine over both. Not part of the tests or CI.
# Usage: scripts/bench-convert.sh [RUNS]   (default 5)
set -euo pipefail
cd "$(dirname "$0")/.."
runs=${1:-5}

scripts/install-deps.sh
build="${AVPOST_BUILD_ROOT:-build}/release"
cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
  -DAVPOST_BUILD_TESTS=OFF -DAVPOST_BUILD_BENCHMARKS=OFF >/dev/null
cmake --build "$build" --target avpost_tool -j "$(nproc)" >/dev/null
avpost="$build/tools/avpost/avpost"

work="$build/convert-bench"
mkdir -p "$work"
clip="$work/clip-1080p-10s.mp4"
if [ ! -f "$clip" ]; then
  ffmpeg -hide_banner -loglevel error -f lavfi -i testsrc2=s=1920x1080:r=30:d=10 \
    -f lavfi -i sine=f=440:r=48000:d=10 -c:v libx264 -preset veryfast -pix_fmt yuv420p \
    -c:a aac -ac 2 "$clip"
fi

ours=("$avpost" convert "$clip" "$work/avpost.mp4" --size 1280x720 --fps 30 --preset veryfast -q)
peer=(ffmpeg -hide_banner -loglevel error -y -i "$clip" -vf fps=30,scale=1280:720,pad=1280:720
      -c:v libx264 -preset veryfast -c:a aac -movflags +faststart "$work/ffmpeg.mp4")

# Appends "wall user+sys" of one run of the command to a file.
timed() {
  local out=$1; shift
  local TIMEFORMAT='%R %U %S'
  { time "$@" >/dev/null; } 2>&1 | awk '{ printf "%.3f %.3f\n", $1, $2 + $3 }' >> "$out"
}

median() { sort -n | awk '{ v[NR] = $1 } END { print (NR % 2) ? v[(NR + 1) / 2] : (v[NR / 2] + v[NR / 2 + 1]) / 2 }'; }

echo "machine: $(nproc) cores; load average before: $(cut -d' ' -f1-3 /proc/loadavg)"
"${ours[@]}" && "${peer[@]}"  # once untimed: caches warm, both outputs checked to work
rm -f "$work/ours.times" "$work/peer.times"
for run in $(seq "$runs"); do
  timed "$work/ours.times" "${ours[@]}"
  timed "$work/peer.times" "${peer[@]}"
  echo "run $run: avpost $(tail -1 "$work/ours.times")  ffmpeg $(tail -1 "$work/peer.times")  (wall s, cpu s)"
done
ours_wall=$(cut -d' ' -f1 "$work/ours.times" | median)
peer_wall=$(cut -d' ' -f1 "$work/peer.times" | median)
ours_cpu=$(cut -d' ' -f2 "$work/ours.times" | median)
peer_cpu=$(cut -d' ' -f2 "$work/peer.times" | median)
echo "load average after: $(cut -d' ' -f1-3 /proc/loadavg)"
printf '%-8s %10s %10s\n' "" "wall s" "cpu s"
printf '%-8s %10s %10s\n' avpost "$ours_wall" "$ours_cpu" ffmpeg "$peer_wall" "$peer_cpu"
awk -v a="$ours_wall" -v b="$peer_wall" -v c="$ours_cpu" -v d="$peer_cpu" \
  'BEGIN { printf "avpost / ffmpeg: %.3f wall, %.3f cpu (medians of interleaved runs)\n", a / b, c / d }'

if command -v hyperfine >/dev/null; then
  hyperfine --warmup 1 --runs "$runs" -n avpost "$(printf '%q ' "${ours[@]}")" \
    -n ffmpeg "$(printf '%q ' "${peer[@]}")"
fi
