#!/usr/bin/env bash
# Sets up, builds the benchmarks (Release, in build-bench/) and runs them. Extra arguments go
# to every benchmark program (for example --benchmark_filter=Open).
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh
cmake -S . -B build-bench -DCMAKE_BUILD_TYPE=Release -DBUILD_TESTING=OFF -DAMBREL_BENCHMARKS=ON >/dev/null
cmake --build build-bench --parallel "$(nproc)" >/dev/null

export QT_QPA_PLATFORM=offscreen
shopt -s nullglob
for program in build-bench/bench/bench_*; do
  if [ -f "$program" ] && [ -x "$program" ]; then
    "$program" "$@"
  fi
done
