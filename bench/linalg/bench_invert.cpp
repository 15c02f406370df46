// bench/linalg/bench_invert.cpp -- ynmimr and ynmxmr beside Eigen's inverse() and
// determinant() and LAPACK's dgetrf + dgetri (the determinant from dgetrf's diagonal), on
// the same matrices in the same run. Eigen uses fixed-size matrices up to order 8.
#include <benchmark/benchmark.h>

#include <Eigen/Dense>
#include <string>
#include <vector>

#include "bench_systems.h"
#include "linalg/linalg_api.h"

extern "C" {
void dgetrf_(const int* m, const int* n, double* a, const int* lda, int* ipiv, int* info);
void dgetri_(const int* n, double* a, const int* lda, const int* ipiv, double* work,
             const int* lwork, int* info);
}

namespace {

void BM_ynmimr(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<double> inv(static_cast<std::size_t>(n) * n);
  int s = 0;
  for (auto _ : state) {
    std::int32_t ierr;
    ynmimr(&n, p.a[s].data(), inv.data(), &ierr);
    benchmark::DoNotOptimize(inv.data());
    s = (s + 1) % kPool;
  }
}

void BM_ynmxmr(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  int s = 0;
  for (auto _ : state) {
    std::int32_t ierr;
    double det;
    ynmxmr(&n, p.a[s].data(), &det, &ierr);
    benchmark::DoNotOptimize(det);
    s = (s + 1) % kPool;
  }
}

void BM_lapack_dgetrf_dgetri(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<double> a(static_cast<std::size_t>(n) * n), work(64 * n);
  std::vector<int> ipiv(n);
  const int nn = n, lwork = 64 * n;
  int s = 0;
  for (auto _ : state) {
    a = p.a[s];
    int info;
    dgetrf_(&nn, &nn, a.data(), &nn, ipiv.data(), &info);
    dgetri_(&nn, a.data(), &nn, ipiv.data(), work.data(), &lwork, &info);
    benchmark::DoNotOptimize(a.data());
    s = (s + 1) % kPool;
  }
}

void BM_lapack_dgetrf_det(benchmark::State& state, std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<double> a(static_cast<std::size_t>(n) * n);
  std::vector<int> ipiv(n);
  const int nn = n;
  int s = 0;
  for (auto _ : state) {
    a = p.a[s];
    int info;
    dgetrf_(&nn, &nn, a.data(), &nn, ipiv.data(), &info);
    double det = 1.0;
    for (int i = 0; i < nn; ++i) det *= ipiv[i] != i + 1 ? -a[i + i * nn] : a[i + i * nn];
    benchmark::DoNotOptimize(det);
    s = (s + 1) % kPool;
  }
}

template <class Mat>
std::vector<Mat> eigen_pool(std::int32_t n) {
  const SystemPool p = make_pool(n);
  std::vector<Mat> as;
  for (int s = 0; s < kPool; ++s) as.push_back(Eigen::Map<const Eigen::MatrixXd>(p.a[s].data(), n, n));
  return as;
}

template <class Mat>
void BM_eigen_inverse(benchmark::State& state, std::int32_t n) {
  const std::vector<Mat> as = eigen_pool<Mat>(n);
  Mat inv(n, n);
  int s = 0;
  for (auto _ : state) {
    inv = as[s].inverse();
    benchmark::DoNotOptimize(inv.data());
    s = (s + 1) % kPool;
  }
}

template <class Mat>
void BM_eigen_determinant(benchmark::State& state, std::int32_t n) {
  const std::vector<Mat> as = eigen_pool<Mat>(n);
  int s = 0;
  for (auto _ : state) {
    double det = as[s].determinant();
    benchmark::DoNotOptimize(det);
    s = (s + 1) % kPool;
  }
}

template <class Mat>
void register_eigen(std::int32_t n) {
  const std::string suffix = "/n" + std::to_string(n);
  benchmark::RegisterBenchmark(("eigen_inverse" + suffix).c_str(), BM_eigen_inverse<Mat>, n);
  benchmark::RegisterBenchmark(("eigen_determinant" + suffix).c_str(), BM_eigen_determinant<Mat>,
                               n);
}

// Registered at load time; the program's main is in bench_main.cpp.
const bool registered = [] {
  for (std::int32_t n : {3, 6, 12, 20}) {
    const std::string suffix = "/n" + std::to_string(n);
    benchmark::RegisterBenchmark(("ynmimr" + suffix).c_str(), BM_ynmimr, n);
    benchmark::RegisterBenchmark(("lapack_dgetrf_dgetri" + suffix).c_str(),
                                 BM_lapack_dgetrf_dgetri, n);
    benchmark::RegisterBenchmark(("ynmxmr" + suffix).c_str(), BM_ynmxmr, n);
    benchmark::RegisterBenchmark(("lapack_dgetrf_det" + suffix).c_str(), BM_lapack_dgetrf_det, n);
  }
  register_eigen<Eigen::Matrix<double, 3, 3>>(3);
  register_eigen<Eigen::Matrix<double, 6, 6>>(6);
  register_eigen<Eigen::MatrixXd>(12);
  register_eigen<Eigen::MatrixXd>(20);
  return true;
}();

}  // namespace
