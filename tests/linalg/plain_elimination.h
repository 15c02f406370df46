// tests/linalg/plain_elimination.h -- line-by-line transcriptions of the three elimination
// algorithms (solve, invert, determinant), written for clarity only. The library's versions
// are restructured for speed and must agree with these to the bit. Column-major, order
// 1 <= n <= 20 (3 <= n for the inverse, 4 <= n for the determinant); results 0 or 1 as in the
// library, outputs written on success only.
#pragma once
#include <cmath>
#include <cstdint>
#include <utility>
#include <vector>

namespace plain {

inline int solve(int n, const double* a0, const double* b0, double* x) {
  std::vector<double> a(a0, a0 + n * n), b(b0, b0 + n);
  std::vector<int> perm(n);
  auto A = [&](int i, int j) -> double& { return a[i + j * n]; };
  for (int j = 0; j < n; ++j) perm[j] = j;
  for (int k = 0; k < n - 1; ++k) {
    double big = 0;
    int r = k, q = k;
    for (int i = k; i < n; ++i)
      for (int j = k; j < n; ++j)
        if (std::fabs(A(i, j)) > big) big = std::fabs(A(i, j)), r = i, q = j;
    if (big <= 1e-38) return 1;
    for (int j = k; j < n; ++j) std::swap(A(k, j), A(r, j));
    std::swap(b[k], b[r]);
    for (int i = 0; i < n; ++i) std::swap(A(i, k), A(i, q));
    std::swap(perm[k], perm[q]);
    for (int i = k + 1; i < n; ++i) {
      const double f = A(i, k) / A(k, k);
      for (int j = k + 1; j < n; ++j) A(i, j) -= f * A(k, j);
      b[i] -= f * b[k];
    }
  }
  if (std::fabs(A(n - 1, n - 1)) <= 1e-30) return 1;
  std::vector<double> y(n);
  y[n - 1] = b[n - 1] / A(n - 1, n - 1);
  for (int i = n - 2; i >= 0; --i) {
    double s = A(i, i + 1) * y[i + 1];
    for (int j = i + 2; j < n; ++j) s += A(i, j) * y[j];
    y[i] = (b[i] - s) / A(i, i);
  }
  for (int i = 0; i < n; ++i) x[perm[i]] = y[i];
  return 0;
}

inline int invert(int n, const double* a, double* out) {
  std::vector<double> b(a, a + n * n);
  std::vector<int> rows(n), cols(n);
  auto B = [&](int i, int j) -> double& { return b[i + j * n]; };
  for (int k = 0; k < n; ++k) {
    double big = 0;
    int r = k, q = k;
    for (int i = k; i < n; ++i)
      for (int j = k; j < n; ++j)
        if (std::fabs(B(i, j)) > big) big = std::fabs(B(i, j)), r = i, q = j;
    if (big < 1e-15) return 1;
    for (int j = 0; j < n; ++j) std::swap(B(k, j), B(r, j));
    for (int i = 0; i < n; ++i) std::swap(B(i, k), B(i, q));
    rows[k] = r;
    cols[k] = q;
    const double p = B(k, k);
    for (int i = 0; i < n; ++i)
      for (int j = 0; j < n; ++j)
        if (i != k && j != k) B(i, j) = B(i, j) - (B(i, k) * B(k, j)) / p;
    for (int j = 0; j < n; ++j)
      if (j != k) B(k, j) = B(k, j) / p;
    for (int i = 0; i < n; ++i)
      if (i != k) B(i, k) = -B(i, k) / p;
    B(k, k) = 1.0 / p;
  }
  for (int k = n - 1; k >= 0; --k) {
    for (int i = 0; i < n; ++i) std::swap(B(i, k), B(i, rows[k]));
    for (int j = 0; j < n; ++j) std::swap(B(k, j), B(cols[k], j));
  }
  for (int e = 0; e < n * n; ++e) out[e] = b[e];
  return 0;
}

inline double determinant(int n, const double* a0) {
  std::vector<double> a(a0, a0 + n * n);
  auto A = [&](int i, int j) -> double& { return a[i + j * n]; };
  double det = 1;
  int swaps = 0;
  for (int k = 0; k < n; ++k) {
    double big = -1;
    int r = k, q = k;
    for (int j = k; j < n; ++j)
      for (int i = k; i < n; ++i)
        if (std::fabs(A(i, j)) > big) big = std::fabs(A(i, j)), r = i, q = j;
    if (A(r, q) == 0) return 0;
    if (r != k) ++swaps;
    if (q != k) ++swaps;
    for (int j = 0; j < n; ++j) std::swap(A(k, j), A(r, j));
    for (int i = 0; i < n; ++i) std::swap(A(i, k), A(i, q));
    const double p = A(k, k);
    for (int i = k + 1; i < n; ++i) {
      const double f = A(i, k) / p;
      for (int j = k + 1; j < n; ++j) {
        const double v = A(i, j) - f * A(k, j);
        A(i, j) = std::fabs(A(i, j)) * 1e-12 > std::fabs(v) ? 0.0 : v;
      }
    }
    det = det * p;
  }
  return swaps % 2 ? -det : det;
}

}  // namespace plain
