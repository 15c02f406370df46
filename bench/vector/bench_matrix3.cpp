// bench/vector/bench_matrix3.cpp -- small matrix product, inverses and element transforms,
// with Eigen's product as the peer of fmat23.
#include <benchmark/benchmark.h>

#include <Eigen/Dense>
#include <random>
#include <vector>

#include "vector/vector_api.h"

namespace {

std::vector<double> random_reals(std::size_t n, unsigned seed) {
  std::mt19937_64 rng(seed);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  std::vector<double> v(n);
  for (double& x : v) x = u(rng);
  return v;
}

void BM_fmat23(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0));
  const std::size_t nn = static_cast<std::size_t>(n) * n;
  const std::vector<double> a = random_reals(nn, 1), b = random_reals(nn, 2);
  std::vector<double> r(nn);
  for (auto _ : state) {
    fmat23(&n, &n, &n, a.data(), b.data(), r.data());
    benchmark::DoNotOptimize(r.data());
  }
}
BENCHMARK(BM_fmat23)->Arg(3)->Arg(20)->Arg(100);

void BM_eigen_product(benchmark::State& state) {
  const int n = static_cast<int>(state.range(0));
  const std::size_t nn = static_cast<std::size_t>(n) * n;
  const std::vector<double> a = random_reals(nn, 1), b = random_reals(nn, 2);
  const Eigen::Map<const Eigen::MatrixXd> ma(a.data(), n, n), mb(b.data(), n, n);
  Eigen::MatrixXd r(n, n);
  for (auto _ : state) {
    r.noalias() = ma * mb;
    benchmark::DoNotOptimize(r.data());
  }
}
BENCHMARK(BM_eigen_product)->Arg(3)->Arg(20)->Arg(100);

void BM_inmat3(benchmark::State& state) {
  std::vector<double> a = random_reals(12, 3);
  a[0] += 2, a[4] += 2, a[8] += 2;  // well away from singular
  double b[12];
  std::int32_t flag = 0;
  for (auto _ : state) {
    inmat3(a.data(), b, &flag);
    benchmark::DoNotOptimize(b);
  }
}
BENCHMARK(BM_inmat3);

void BM_traele_conic(benchmark::State& state) {
  const std::vector<double> t = random_reals(6, 4);
  const double conic[7] = {0.5, 1, 2, 3, 0.25, 0.5, 2};
  const std::int32_t hdr = 87;
  double out[7];
  for (auto _ : state) {
    traele(&hdr, t.data(), conic, nullptr, out);
    benchmark::DoNotOptimize(out);
  }
}
BENCHMARK(BM_traele_conic);

}  // namespace
