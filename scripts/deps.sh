#!/usr/bin/env bash
# scripts/deps.sh [package...] -- installs the Debian packages that are missing (through sudo
# when not root). With no arguments: what the library, its tests and the demonstration program
# (CLI11, muParser, fmt) need.
set -euo pipefail
packages=("$@")
if [ ${#packages[@]} -eq 0 ]; then
  packages=(cmake ninja-build g++ gfortran python3 libgtest-dev libbenchmark-dev libcli11-dev
    libmuparser-dev libfmt-dev)
fi
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
done
[ ${#missing[@]} -eq 0 ] && exit 0
sudo=""
[ "$(id -u)" -ne 0 ] && sudo="sudo"
echo "installing: ${missing[*]}"
export DEBIAN_FRONTEND=noninteractive
$sudo apt-get update -q
$sudo apt-get install -y -q --no-install-recommends "${missing[@]}"
