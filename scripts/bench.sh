#!/usr/bin/env bash
# scripts/bench.sh [bench_<dir> [benchmark args...]] -- builds the benchmarks with their peers
# (Eigen, LAPACK, GSL) and runs one program, or all of them.
set -euo pipefail
cd "$(dirname "$0")/.."
bash scripts/deps.sh cmake ninja-build g++ libgtest-dev libbenchmark-dev libeigen3-dev \
  liblapack-dev libgsl-dev
cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DORVQ7_BUILD_BENCH=ON \
  -DORVQ7_BUILD_TESTS=OFF
cmake --build build-bench -j "$(nproc)"
if [ $# -gt 0 ]; then
  prog=$1; shift
  "./build-bench/bench/$prog" "$@"
else
  for p in build-bench/bench/bench_*; do "$p"; done
fi
