// bench/linalg/bench_main.cpp -- the benchmark program of the linear algebra families.
#include <benchmark/benchmark.h>

BENCHMARK_MAIN();
