// bench/poly/bench_gauss_legendre.cpp -- gauleg beside GSL's fixed Gauss-Legendre rule with a
// precomputed table, on the same integrand.
#include <benchmark/benchmark.h>
#include <gsl/gsl_integration.h>

#include <cmath>

#include "poly/poly_api.h"

namespace {

double integrand(const double* x) { return std::exp(-*x) * *x; }
double gsl_integrand(double x, void*) { return std::exp(-x) * x; }

void BM_gauleg(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0));
  const double a = 0.25, b = 3.5;
  for (auto _ : state) benchmark::DoNotOptimize(gauleg(integrand, &a, &b, &n));
}
BENCHMARK(BM_gauleg)->Arg(2)->Arg(8)->Arg(20);

void BM_gsl_integration_glfixed(benchmark::State& state) {
  gsl_integration_glfixed_table* t =
      gsl_integration_glfixed_table_alloc(static_cast<std::size_t>(state.range(0)));
  gsl_function f{gsl_integrand, nullptr};
  for (auto _ : state) benchmark::DoNotOptimize(gsl_integration_glfixed(&f, 0.25, 3.5, t));
  gsl_integration_glfixed_table_free(t);
}
BENCHMARK(BM_gsl_integration_glfixed)->Arg(2)->Arg(8)->Arg(20);

}  // namespace
// main: bench_roots.cpp (one program per directory).
