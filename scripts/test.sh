#!/usr/bin/env bash
# Sets up, builds everything (Debug, warnings as errors, in build-test/) and runs every test
# offscreen inside a private session bus. Extra arguments go to ctest (for example -R Name).
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh
cmake -S . -B build-test -DCMAKE_BUILD_TYPE=Debug -DBUILD_TESTING=ON -DAMBREL_WERROR=ON >/dev/null
cmake --build build-test --parallel "$(nproc)"

export QT_QPA_PLATFORM=offscreen
exec dbus-run-session -- ctest --test-dir build-test --output-on-failure --parallel "$(nproc)" "$@"
