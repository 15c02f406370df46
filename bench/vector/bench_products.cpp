// bench/vector/bench_products.cpp -- the vector primitives on the solvers' hot paths.
#include <benchmark/benchmark.h>

#include <random>
#include <vector>

#include "vector/vector_api.h"

namespace {

std::vector<double> random_vector(std::int32_t n) {
  std::mt19937_64 rng(20261122);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  std::vector<double> v(static_cast<std::size_t>(n));
  for (double& x : v) x = u(rng);
  return v;
}

void BM_vor(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0));
  const std::vector<double> v = random_vector(n);
  for (auto _ : state) {
    double s = vor(v.data(), &n);
    benchmark::DoNotOptimize(s);
  }
}
BENCHMARK(BM_vor)->Arg(3)->Arg(20)->Arg(1000);

void BM_devor(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0));
  const std::vector<double> v0 = random_vector(n);
  std::vector<double> v = v0;
  for (auto _ : state) {
    v = v0;
    double s = devor(v.data(), &n);
    benchmark::DoNotOptimize(s);
    benchmark::DoNotOptimize(v.data());
  }
}
BENCHMARK(BM_devor)->Arg(3)->Arg(20);

void BM_prosca(benchmark::State& state) {
  const std::vector<double> a = random_vector(3), b = random_vector(3);
  for (auto _ : state) {
    double s = prosca(a.data(), b.data());
    benchmark::DoNotOptimize(s);
  }
}
BENCHMARK(BM_prosca);

}  // namespace

BENCHMARK_MAIN();
