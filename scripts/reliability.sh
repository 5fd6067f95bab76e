#!/usr/bin/env bash
# Runs the long form of the reliability suite: the navigator and the note tool killed during
# saves, full disks and read-only folders, hostile input through every door, load, and every
# fuzz target for AMBREL_FUZZ_SECONDS (600 unless told). Prints one line of figures per check.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh
if command -v ccache >/dev/null && [ -z "${CMAKE_CXX_COMPILER_LAUNCHER:-}" ]; then
  export CMAKE_CXX_COMPILER_LAUNCHER=ccache CCACHE_BASEDIR="$PWD" CCACHE_NOHASHDIR=true
fi
export QT_QPA_PLATFORM=offscreen

cmake -S . -B build-test -DCMAKE_BUILD_TYPE=Debug -DBUILD_TESTING=ON -DAMBREL_WERROR=ON >/dev/null
cmake --build build-test --parallel "$(nproc)" --target test_reliability >/dev/null

report=$(mktemp)
trap 'rm -f "$report"' EXIT
status=0
AMBREL_RELIABILITY=long AMBREL_RELIABILITY_REPORT="$report" \
  ctest --test-dir build-test --output-on-failure --timeout 3600 \
  -R '^(CrashDuringSaveTest|NoteToolCrashTest|DiskFullTest|HostileInputTest|LoadTest)\.' \
  >"$report.ctest" 2>&1 || { status=1; cat "$report.ctest"; }
rm -f "$report.ctest"

if ! scripts/fuzz.sh all "${AMBREL_FUZZ_SECONDS:-600}" >"$report.fuzz" 2>&1; then
  status=1
fi
grep '^fuzz ' "$report.fuzz" >>"$report" || true
rm -f "$report.fuzz"

echo "== reliability, long form"
cat "$report"
exit $status
