#!/usr/bin/env bash
# Sets up, builds the four programs (Release, in build-install/) and installs them under the
# given prefix (default /usr/local): the programs in <prefix>/lib/quillmark-ambrel/bin/, a link
# <prefix>/bin/ambrel-navigator, the desktop entry and the icon under <prefix>/share/.
set -euo pipefail
cd "$(dirname "$0")/.."

prefix="${1:-/usr/local}"
scripts/setup.sh
cmake -S . -B build-install -DCMAKE_BUILD_TYPE=Release -DBUILD_TESTING=OFF >/dev/null
cmake --build build-install --parallel "$(nproc)"
cmake --install build-install --prefix "$prefix"
