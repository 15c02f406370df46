// bench/linalg/bench_gauss.cpp -- ynsega beside the complete-pivoting solvers of LAPACK
// (dgetc2 + dgesc2) and Eigen (FullPivLU), with Eigen's PartialPivLU for reference, on the
// same systems in the same run. Eigen uses fixed-size matrices up to order 8.
#include <benchmark/benchmark.h>

#include <Eigen/Dense>
#include <string>
#include <vector>

#include "bench_systems.h"
#include "linalg/linalg_api.h"

extern "C" {
void dgetc2_(const int* n, double* a, const int* lda, int* ipiv, int* jpiv, int* info);
void dgesc2_(const int* n, const double* a, const int* lda, double* rhs, const int* ipiv,
             const int* jpiv, double* scale);
}

namespace {

void BM_ynsega(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<double> x(n);
  int s = 0;
  for (auto _ : state) {
    std::int32_t ierr;
    ynsega(&n, p.a[s].data(), p.b[s].data(), x.data(), &ierr);
    benchmark::DoNotOptimize(x.data());
    s = (s + 1) % kPool;
  }
}

void BM_lapack_dgetc2_dgesc2(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<double> a(static_cast<std::size_t>(n) * n), x(n);
  std::vector<int> ipiv(n), jpiv(n);
  const int nn = n;
  int s = 0;
  for (auto _ : state) {
    a = p.a[s];
    x = p.b[s];
    int info;
    double scale;
    dgetc2_(&nn, a.data(), &nn, ipiv.data(), jpiv.data(), &info);
    dgesc2_(&nn, a.data(), &nn, x.data(), ipiv.data(), jpiv.data(), &scale);
    benchmark::DoNotOptimize(x.data());
    s = (s + 1) % kPool;
  }
}

template <class Mat, class Vec, template <class> class Lu>
void run_eigen(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<Mat> as;
  std::vector<Vec> bs;
  for (int s = 0; s < kPool; ++s) {
    as.push_back(Eigen::Map<const Eigen::MatrixXd>(p.a[s].data(), n, n));
    bs.push_back(Eigen::Map<const Eigen::VectorXd>(p.b[s].data(), n));
  }
  Vec x(n);
  int s = 0;
  for (auto _ : state) {
    Lu<Mat> lu(as[s]);
    x = lu.solve(bs[s]);
    benchmark::DoNotOptimize(x.data());
    s = (s + 1) % kPool;
  }
}

template <template <class> class Lu, int N>
void register_eigen(const char* name) {
  using Fixed = Eigen::Matrix<double, N, N>;
  using FixedVec = Eigen::Matrix<double, N, 1>;
  benchmark::RegisterBenchmark((std::string(name) + "/n" + std::to_string(N)).c_str(),
                               run_eigen<Fixed, FixedVec, Lu>, N);
}

template <template <class> class Lu>
void register_eigen_all(const char* name) {
  register_eigen<Lu, 2>(name);
  register_eigen<Lu, 3>(name);
  register_eigen<Lu, 4>(name);
  register_eigen<Lu, 6>(name);
  register_eigen<Lu, 8>(name);
  for (std::int32_t n : {12, 16, 20}) {
    benchmark::RegisterBenchmark((std::string(name) + "/n" + std::to_string(n)).c_str(),
                                 run_eigen<Eigen::MatrixXd, Eigen::VectorXd, Lu>, n);
  }
}

template <class M>
using FullPiv = Eigen::FullPivLU<M>;
template <class M>
using PartialPiv = Eigen::PartialPivLU<M>;

// Registered at load time; the program's main is in bench_main.cpp.
const bool registered = [] {
  for (std::int32_t n : {2, 3, 4, 6, 8, 12, 16, 20}) {
    const std::string suffix = "/n" + std::to_string(n);
    benchmark::RegisterBenchmark(("ynsega" + suffix).c_str(), BM_ynsega, n);
    benchmark::RegisterBenchmark(("lapack_dgetc2_dgesc2" + suffix).c_str(),
                                 BM_lapack_dgetc2_dgesc2, n);
  }
  register_eigen_all<FullPiv>("eigen_FullPivLU");
  register_eigen_all<PartialPiv>("eigen_PartialPivLU");
  return true;
}();

}  // namespace
