#!/usr/bin/env bash
# Installs the Debian packages that building, running and testing the navigator need.
# Installs only what is missing; prints nothing when everything is there.
set -euo pipefail

packages=(
  build-essential cmake pkg-config ccache
  qt6-base-dev qt6-base-dev-tools libqt6dbus6 libqt6network6 qt6-qpa-plugins
  qt6-svg-dev libqt6svg6 qt6-pdf-dev
  libpugixml-dev
  qtkeychain-qt6-dev
  googletest libgtest-dev libgmock-dev libbenchmark-dev
  dbus-daemon dbus-bin xdg-utils desktop-file-utils
  fonts-dejavu-core
  clang-14 libfuzzer-14-dev
)

missing=()
for package in "${packages[@]}"; do
  if ! dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q 'install ok installed'; then
    missing+=("$package")
  fi
done
[ ${#missing[@]} -eq 0 ] && exit 0

echo "Installing: ${missing[*]}"
sudo=""
[ "$(id -u)" -eq 0 ] || sudo="sudo"
export DEBIAN_FRONTEND=noninteractive
$sudo apt-get update -qq
$sudo apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null
