// bench/closest/bench_main.cpp -- the one entry point of bench_closest.
#include <benchmark/benchmark.h>

BENCHMARK_MAIN();
