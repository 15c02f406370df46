#!/usr/bin/env bash
# scripts/run.sh [orvq7 arguments] -- installs what is missing, builds the library and the
# demonstration program orvq7, and runs it in the current folder: with no arguments, its
# gallery (text and SVG pictures in ./orvq7-gallery).
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
bash "$root/scripts/deps.sh" cmake ninja-build g++ python3 libcli11-dev libmuparser-dev \
  libfmt-dev
cmake -S "$root" -B "$root/build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_BUILD_TESTS=OFF \
  >/dev/null
cmake --build "$root/build" -j "$(nproc)" --target orvq7 >/dev/null
exec "$root/build/tools/orvq7" "$@"
