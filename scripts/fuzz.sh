#!/usr/bin/env bash
# Builds one fuzz target (or all) with clang in build-fuzz/ and runs it for SECONDS over a copy
# of its seed corpus; new inputs go to build-fuzz/corpus/NAME, never into the repository.
# Ends with one line per target: "fuzz NAME: N executions in S s, no finding" or
# "..., FINDING: <artifact>" (and exit status 1).
#   scripts/fuzz.sh NAME SECONDS      scripts/fuzz.sh all SECONDS
# AMBREL_FUZZ_SEED fixes libFuzzer's random seed, so that a short run mutates the same way each
# time.
set -euo pipefail
cd "$(dirname "$0")/.."

if [ $# -ne 2 ] || ! [[ "$2" =~ ^[0-9]+$ ]]; then
  echo "usage: scripts/fuzz.sh NAME|all SECONDS" >&2
  exit 2
fi
name=$1
seconds=$2
targets=()
for source in fuzz/fuzz_*.cpp; do
  target=$(basename "$source" .cpp)
  targets+=("${target#fuzz_}")
done
if [ "$name" = all ]; then
  selected=("${targets[@]}")
elif [ -f "fuzz/fuzz_$name.cpp" ]; then
  selected=("$name")
else
  echo "no fuzz target '$name'; there are: ${targets[*]}" >&2
  exit 2
fi

scripts/setup.sh
if command -v ccache >/dev/null && [ -z "${CMAKE_CXX_COMPILER_LAUNCHER:-}" ]; then
  export CMAKE_CXX_COMPILER_LAUNCHER=ccache CCACHE_BASEDIR="$PWD" CCACHE_NOHASHDIR=true
fi
CC=clang-14 CXX=clang++-14 cmake -S . -B build-fuzz -DCMAKE_BUILD_TYPE=RelWithDebInfo \
  -DAMBREL_FUZZ=ON -DAMBREL_WERROR=ON -DBUILD_TESTING=OFF -DAMBREL_BENCHMARKS=OFF >/dev/null
build_targets=()
for target in "${selected[@]}"; do build_targets+=("fuzz_$target"); done
cmake --build build-fuzz --parallel "$(nproc)" --target "${build_targets[@]}"

export QT_QPA_PLATFORM=offscreen
export LSAN_OPTIONS="suppressions=$PWD/tests/sanitizer/lsan.supp:print_suppressions=0"
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1
status=0
for target in "${selected[@]}"; do
  corpus=build-fuzz/corpus/$target
  artifacts=build-fuzz/artifacts/$target
  mkdir -p "$corpus" "$artifacts"
  [ -d "fuzz/corpus/$target" ] && cp -n fuzz/corpus/"$target"/* "$corpus"/ 2>/dev/null || true
  options=(-max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 -print_final_stats=1
    -artifact_prefix="$artifacts/")
  [ -f "fuzz/dict/$target.dict" ] && options+=(-dict="fuzz/dict/$target.dict")
  [ -n "${AMBREL_FUZZ_SEED:-}" ] && options+=(-seed="$AMBREL_FUZZ_SEED")
  log=build-fuzz/fuzz-$target.log
  started=$(date +%s)
  # The target's temporary home goes with the run, even when it ends in a finding.
  scratch=$(mktemp -d)
  set +e
  TMPDIR=$scratch "build-fuzz/fuzz/fuzz_$target" "${options[@]}" "$corpus" >"$log" 2>&1
  result=$?
  set -e
  rm -rf "$scratch"
  elapsed=$(($(date +%s) - started))
  executions=$(sed -n 's/^stat::number_of_executed_units: *//p' "$log" | tail -n 1)
  artifact=$(sed -n 's/.*Test unit written to \(.*\)$/\1/p' "$log" | tail -n 1)
  if [ "$result" -eq 0 ] && [ -z "$artifact" ]; then
    echo "fuzz $target: ${executions:-0} executions in $elapsed s, no finding"
  else
    tail -n 40 "$log" >&2
    echo "fuzz $target: ${executions:-0} executions in $elapsed s, FINDING: ${artifact:-see $log}"
    status=1
  fi
done
exit $status
