#!/usr/bin/env bash
# Installs the Debian packages the build, the host and the tests need, and only those that are
# missing. Safe to run any number of times; uses sudo when not run as root.
set -euo pipefail

packages=(
  build-essential cmake ninja-build pkg-config
  qtbase5-dev qtscript5-dev libqt5opengl5-dev libglu1-mesa-dev
  xvfb xauth libgl1-mesa-dri
  libbenchmark-dev clang-format
  libassimp-dev assimp-testmodels
)

missing=()
for p in "${packages[@]}"; do
  if ! dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed"; then
    missing+=("$p")
  fi
done

if [ ${#missing[@]} -eq 0 ]; then
  exit 0
fi

echo "setup: installing ${missing[*]}"
sudo=""
if [ "$(id -u)" -ne 0 ]; then
  sudo="sudo"
fi
export DEBIAN_FRONTEND=noninteractive
$sudo apt-get update -qq
$sudo apt-get install -y -qq --no-install-recommends "${missing[@]}"
