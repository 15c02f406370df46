// bench/poly/bench_roots.cpp -- the closed-form root solvers beside GSL's quadratic, complex
// cubic and general (companion matrix) solvers, on the same batches of polynomials.
#include <benchmark/benchmark.h>
#include <gsl/gsl_poly.h>

#include <random>
#include <vector>

#include "poly/poly_api.h"

namespace {

constexpr int kBatch = 256;

// kBatch polynomials of degree `deg` with leading coefficient 1 and the others in [-4, 4],
// by decreasing power, deg + 1 coefficients each.
std::vector<double> random_polys(int deg) {
  std::mt19937_64 rng(20261122 + deg);
  std::uniform_real_distribution<double> u(-4.0, 4.0);
  std::vector<double> c(static_cast<std::size_t>(kBatch * (deg + 1)));
  for (int k = 0; k < kBatch; ++k) {
    c[k * (deg + 1)] = 1.0;
    for (int j = 1; j <= deg; ++j) c[k * (deg + 1) + j] = u(rng);
  }
  return c;
}

void set_items(benchmark::State& state) { state.SetItemsProcessed(state.iterations() * kBatch); }

void BM_duos(benchmark::State& state) {
  const std::vector<double> c = random_polys(2);
  double r[4];
  std::int32_t flag;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      duos(&c[k * 3], r, &flag);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_duos);

void BM_ynze2r(benchmark::State& state) {
  const std::vector<double> c = random_polys(2);
  double r[4];
  std::int32_t err;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      ynze2r(&c[k * 3], r, &err);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_ynze2r);

void BM_gsl_poly_solve_quadratic(benchmark::State& state) {
  const std::vector<double> c = random_polys(2);
  double x0, x1;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      benchmark::DoNotOptimize(gsl_poly_solve_quadratic(c[k * 3], c[k * 3 + 1], c[k * 3 + 2], &x0, &x1));
      benchmark::DoNotOptimize(x0);
      benchmark::DoNotOptimize(x1);
    }
  }
  set_items(state);
}
BENCHMARK(BM_gsl_poly_solve_quadratic);

void BM_cardan(benchmark::State& state) {
  const std::vector<double> c = random_polys(3);
  const std::int32_t mode = 1;
  double r[6];
  std::int32_t flag;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      cardan(&c[k * 4], &mode, r, &flag);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_cardan);

void BM_ynze3r(benchmark::State& state) {
  const std::vector<double> c = random_polys(3);
  double r[6];
  std::int32_t err;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      ynze3r(&c[k * 4], r, &err);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_ynze3r);

void BM_gsl_poly_complex_solve_cubic(benchmark::State& state) {
  const std::vector<double> c = random_polys(3);
  gsl_complex z0, z1, z2;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      gsl_poly_complex_solve_cubic(c[k * 4 + 1], c[k * 4 + 2], c[k * 4 + 3], &z0, &z1, &z2);
      benchmark::DoNotOptimize(z0);
      benchmark::DoNotOptimize(z1);
      benchmark::DoNotOptimize(z2);
    }
  }
  set_items(state);
}
BENCHMARK(BM_gsl_poly_complex_solve_cubic);

void BM_ferari(benchmark::State& state) {
  const std::vector<double> c = random_polys(4);
  double r[8];
  std::int32_t flag;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      ferari(&c[k * 5], r, &flag);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_ferari);

// ynzenr on degrees 2 to 4.
void BM_ynzenr(benchmark::State& state) {
  const std::int32_t deg = static_cast<std::int32_t>(state.range(0));
  const std::vector<double> c = random_polys(deg);
  double r[8];
  std::int32_t nroots, err;
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      ynzenr(&deg, &c[k * (deg + 1)], &nroots, r, &err);
      benchmark::DoNotOptimize(r);
    }
  }
  set_items(state);
}
BENCHMARK(BM_ynzenr)->DenseRange(2, 4);

// GSL's general solver (companion matrix, QR) by degree; workspace allocated once.
void BM_gsl_poly_complex_solve(benchmark::State& state) {
  const int deg = static_cast<int>(state.range(0));
  std::vector<double> c = random_polys(deg);
  std::vector<double> inc(static_cast<std::size_t>(deg + 1));  // GSL takes increasing powers
  gsl_poly_complex_workspace* w = gsl_poly_complex_workspace_alloc(static_cast<std::size_t>(deg + 1));
  double z[8];
  for (auto _ : state) {
    for (int k = 0; k < kBatch; ++k) {
      for (int j = 0; j <= deg; ++j) inc[j] = c[k * (deg + 1) + deg - j];
      gsl_poly_complex_solve(inc.data(), static_cast<std::size_t>(deg + 1), w, z);
      benchmark::DoNotOptimize(z);
    }
  }
  gsl_poly_complex_workspace_free(w);
  set_items(state);
}
BENCHMARK(BM_gsl_poly_complex_solve)->DenseRange(2, 4);

}  // namespace

BENCHMARK_MAIN();
