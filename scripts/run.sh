#!/usr/bin/env bash
# Sets up, builds the navigator and its companion programs (Release, in build/) and starts the
# navigator with the given arguments; the companions lie beside it, as in the installed tree.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh
cmake -S . -B build -DCMAKE_BUILD_TYPE=Release -DBUILD_TESTING=OFF >/dev/null
cmake --build build --parallel "$(nproc)"

if [ -z "${DISPLAY:-}" ] && [ -z "${WAYLAND_DISPLAY:-}" ]; then
  echo "No display found (DISPLAY and WAYLAND_DISPLAY are empty): running offscreen." >&2
  export QT_QPA_PLATFORM=offscreen
fi
exec build/src/ambrel-navigator "$@"
