#!/usr/bin/env bash
# Sets up, builds and runs every test twice: a Debug build in build-test/ and a build with
# AddressSanitizer and UndefinedBehaviorSanitizer in build-asan/, both with warnings as errors,
# offscreen inside a private session bus; then, where clang-14 is installed, builds the fuzz
# targets in build-fuzz/ and runs each for 10 s over its seed corpus. AMBREL_TEST_BUILD=debug,
# =asan or =fuzz runs one of the three.
# Extra arguments go to ctest (for example -R Name).
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh

builds=(debug asan)
fuzz=yes
if [ -n "${AMBREL_TEST_BUILD:-}" ]; then
  case "$AMBREL_TEST_BUILD" in
    debug | asan) builds=("$AMBREL_TEST_BUILD"); fuzz=no ;;
    fuzz) builds=() ;;
    *) echo "AMBREL_TEST_BUILD is debug, asan or fuzz, not '$AMBREL_TEST_BUILD'." >&2; exit 2 ;;
  esac
fi

# A compiler cache, when the machine has one, makes the second and later runs quick; paths are
# taken relative to this folder, so a clone elsewhere finds the same entries.
if command -v ccache >/dev/null && [ -z "${CMAKE_CXX_COMPILER_LAUNCHER:-}" ]; then
  export CMAKE_CXX_COMPILER_LAUNCHER=ccache CCACHE_BASEDIR="$PWD" CCACHE_NOHASHDIR=true
fi

export QT_QPA_PLATFORM=offscreen
# Leaks that belong to the libraries below the program are listed, each with its reason, in
# the suppression file; everything else fails the test that leaked.
export ASAN_OPTIONS=detect_leaks=1:abort_on_error=0:strict_string_checks=1:detect_stack_use_after_return=1
export LSAN_OPTIONS="suppressions=$PWD/tests/sanitizer/lsan.supp:print_suppressions=0"
export UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1

for build in ${builds[@]+"${builds[@]}"}; do
  directory=build-test
  options=()
  if [ "$build" = asan ]; then
    directory=build-asan
    # Line tables are all a sanitizer report needs, and they build much faster than full
    # debugging information.
    options=(-DAMBREL_SANITIZE=ON -DCMAKE_CXX_FLAGS_DEBUG=-g1)
  fi
  echo "== $build build, in $directory/"
  cmake -S . -B "$directory" -DCMAKE_BUILD_TYPE=Debug -DBUILD_TESTING=ON -DAMBREL_WERROR=ON \
    "${options[@]}" >/dev/null
  cmake --build "$directory" --parallel "$(nproc)"
  dbus-run-session -- ctest --test-dir "$directory" --output-on-failure --parallel "$(nproc)" "$@"
done

if [ "$fuzz" = yes ] && command -v clang++-14 >/dev/null; then
  echo "== fuzz build, in build-fuzz/"
  # A fixed seed: the short run is a check of every target, the long runs are the search.
  AMBREL_FUZZ_SEED=1 scripts/fuzz.sh all 10
fi
