// tests/linalg/linalg_reference.h -- independent computations the linear algebra checks
// compare against, and the seed of the randomized checks.
#pragma once
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <random>
#include <utility>
#include <vector>

// Seed of the randomized checks: ORVQ7_SEED from the environment, else a fixed value.
inline std::uint64_t test_seed() {
  const char* s = std::getenv("ORVQ7_SEED");
  return s ? std::strtoull(s, nullptr, 10) : 20240611u;
}

// Determinant in extended precision by elimination with partial pivoting (a different
// algorithm from the library's, in higher precision). a is column-major, order n.
inline long double det_extended(std::int32_t n, std::vector<long double> a) {
  long double det = 1;
  for (std::int32_t k = 0; k < n; ++k) {
    std::int32_t p = k;
    for (std::int32_t i = k + 1; i < n; ++i)
      if (std::fabs(a[i + k * n]) > std::fabs(a[p + k * n])) p = i;
    if (a[p + k * n] == 0) return 0;
    if (p != k) {
      for (std::int32_t j = 0; j < n; ++j) std::swap(a[k + j * n], a[p + j * n]);
      det = -det;
    }
    det *= a[k + k * n];
    for (std::int32_t i = k + 1; i < n; ++i) {
      const long double f = a[i + k * n] / a[k + k * n];
      for (std::int32_t j = k + 1; j < n; ++j) a[i + j * n] -= f * a[k + j * n];
    }
  }
  return det;
}

// Column-major copy of a square matrix of order n written by rows.
inline std::vector<double> by_columns(std::int32_t n, std::initializer_list<double> rows) {
  std::vector<double> r(rows), c(rows.size());
  for (std::int32_t i = 0; i < n; ++i)
    for (std::int32_t j = 0; j < n; ++j) c[i + j * n] = r[i * n + j];
  return c;
}

// n uniform reals in [-1, 1).
inline std::vector<double> sample(std::mt19937_64& rng, std::int32_t n) {
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  std::vector<double> v(static_cast<std::size_t>(n));
  for (double& x : v) x = u(rng);
  return v;
}

// A random matrix of order n made well conditioned by adding sign * n to its diagonal.
inline std::vector<double> dominant_matrix(std::mt19937_64& rng, std::int32_t n, int sign) {
  std::vector<double> a = sample(rng, n * n);
  for (std::int32_t i = 0; i < n; ++i) a[i + i * n] += sign * n;
  return a;
}
