#!/usr/bin/env bash
# scripts/run.sh -- installs what is missing, builds the library and runs the main job.
set -euo pipefail
cd "$(dirname "$0")/.."
bash scripts/deps.sh
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_BUILD_TESTS=OFF
cmake --build build -j "$(nproc)" --target orvq7-demo
./build/tools/orvq7-demo "$@"
