// bench/fitting/bench_mean_plane.cpp -- plmoyn beside a centroid + scatter + 3x3 symmetric
// eigen-solve written with Eigen, on the same points (a noisy tilted slab).
#include <benchmark/benchmark.h>

#include <Eigen/Dense>
#include <random>
#include <vector>

#include "fitting/fitting_api.h"

namespace {

std::vector<double> slab(std::int32_t n) {
  std::mt19937_64 rng(20261122);
  std::uniform_real_distribution<double> u(-5.0, 5.0), h(-0.01, 0.01);
  std::vector<double> p(static_cast<std::size_t>(3 * n));
  for (std::int32_t j = 0; j < n; ++j) {
    const double x = u(rng), y = u(rng);
    p[3 * j] = x;
    p[3 * j + 1] = y;
    p[3 * j + 2] = 0.5 * x - 0.25 * y + 1.0 + h(rng);
  }
  return p;
}

void BM_plmoyn(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0)), ld = 3;
  const std::vector<double> p = slab(n);
  const double tol = 1e-6;
  double a, b, c, d, e;
  for (auto _ : state) {
    benchmark::DoNotOptimize(plmoyn(p.data(), &ld, &n, &tol, &a, &b, &c, &d, &e));
    benchmark::DoNotOptimize(d);
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(p.size() * sizeof(double)));
}
BENCHMARK(BM_plmoyn)->Arg(10)->Arg(1000)->Arg(1000000);

void BM_eigen_mean_plane(benchmark::State& state) {
  const std::int64_t n = state.range(0);
  const std::vector<double> p = slab(static_cast<std::int32_t>(n));
  const Eigen::Map<const Eigen::Matrix<double, 3, Eigen::Dynamic>> pts(p.data(), 3, n);
  Eigen::Matrix3Xd centred(3, n);  // scratch sized once, outside the timed loop
  for (auto _ : state) {
    const Eigen::Vector3d g = pts.rowwise().mean();
    centred.noalias() = pts.colwise() - g;
    Eigen::Matrix3d s;
    s.noalias() = centred * centred.transpose();
    Eigen::SelfAdjointEigenSolver<Eigen::Matrix3d> es;
    es.computeDirect(s);
    const Eigen::Vector3d normal = es.eigenvectors().col(0);
    benchmark::DoNotOptimize(normal.data());
    benchmark::DoNotOptimize(g.data());
  }
  state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(p.size() * sizeof(double)));
}
BENCHMARK(BM_eigen_mean_plane)->Arg(10)->Arg(1000)->Arg(1000000);

}  // namespace

BENCHMARK_MAIN();
