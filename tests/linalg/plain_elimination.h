// tests/linalg/plain_elimination.h -- line-by-line transcriptions of the three elimination
// algorithms, written for clarity only; the library's versions are restructured for speed and
// must agree with these to the bit. Column-major, order n <= 20 (n >= 3 for the inverse,
// n >= 4 for the determinant); result 0 or 1, outputs written on success only.
#pragma once
#include <cmath>
#include <utility>
#include <vector>

namespace plain {

// Complete pivot over rows and columns k..n-1, strictly larger replaces, from `start`.
inline double search(std::vector<double>& a, int n, int k, bool rows_outer, double start,
                     int* r, int* q) {
  double big = start;
  *r = *q = k;
  for (int u = k; u < n; ++u)
    for (int v = k; v < n; ++v) {
      const int i = rows_outer ? u : v, j = rows_outer ? v : u;
      if (std::fabs(a[i + j * n]) > big) big = std::fabs(a[i + j * n]), *r = i, *q = j;
    }
  return big;
}
inline void swap_rows(std::vector<double>& a, int n, int r1, int r2, int from) {
  for (int j = from; j < n; ++j) std::swap(a[r1 + j * n], a[r2 + j * n]);
}
inline void swap_cols(std::vector<double>& a, int n, int c1, int c2, int from) {
  for (int i = from; i < n; ++i) std::swap(a[i + c1 * n], a[i + c2 * n]);
}

inline int solve(int n, const double* a0, const double* b0, double* x) {
  std::vector<double> a(a0, a0 + n * n), b(b0, b0 + n), y(n);
  std::vector<int> perm(n);
  for (int j = 0; j < n; ++j) perm[j] = j;
  auto A = [&](int i, int j) -> double& { return a[i + j * n]; };
  for (int k = 0, r, q; k < n - 1; ++k) {
    if (search(a, n, k, true, 0.0, &r, &q) <= 1e-38) return 1;
    swap_rows(a, n, k, r, k);
    std::swap(b[k], b[r]);
    swap_cols(a, n, k, q, 0);
    std::swap(perm[k], perm[q]);
    for (int i = k + 1; i < n; ++i) {
      const double f = A(i, k) / A(k, k);
      for (int j = k + 1; j < n; ++j) A(i, j) -= f * A(k, j);
      b[i] -= f * b[k];
    }
  }
  if (std::fabs(A(n - 1, n - 1)) <= 1e-30) return 1;
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
    if (search(b, n, k, true, 0.0, &rows[k], &cols[k]) < 1e-15) return 1;
    swap_rows(b, n, k, rows[k], 0);
    swap_cols(b, n, k, cols[k], 0);
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
    swap_cols(b, n, k, rows[k], 0);
    swap_rows(b, n, k, cols[k], 0);
  }
  for (int e = 0; e < n * n; ++e) out[e] = b[e];
  return 0;
}

inline double determinant(int n, const double* a0) {
  std::vector<double> a(a0, a0 + n * n);
  auto A = [&](int i, int j) -> double& { return a[i + j * n]; };
  double det = 1;
  int swaps = 0;
  for (int k = 0, r, q; k < n; ++k) {
    search(a, n, k, false, -1.0, &r, &q);
    if (A(r, q) == 0) return 0;
    swaps += (r != k) + (q != k);
    swap_rows(a, n, k, r, 0);
    swap_cols(a, n, k, q, 0);
    for (int i = k + 1; i < n; ++i) {
      const double f = A(i, k) / A(k, k);
      for (int j = k + 1; j < n; ++j) {
        const double v = A(i, j) - f * A(k, j);
        A(i, j) = std::fabs(A(i, j)) * 1e-12 > std::fabs(v) ? 0.0 : v;
      }
    }
    det = det * A(k, k);
  }
  return swaps % 2 ? -det : det;
}

}  // namespace plain
