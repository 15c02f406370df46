// tests/linalg/linalg_reference.h -- what the linear algebra checks compare against: the seed
// of the randomized checks, and line-by-line transcriptions of the three elimination
// algorithms, written for clarity only (the library's versions are restructured for speed and
// must agree with these to the bit). Column-major, order n <= 20 (n >= 3 for the inverse,
// n >= 4 for the determinant); result 0 or 1, outputs written on success only.
#pragma once
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <vector>

#include "support/recording_services.h"

// Equal bit patterns, or both NaN; and the same for every element of want, traced by t.
inline bool same(double x, double y) {
  return bits(x) == bits(y) || (std::isnan(x) && std::isnan(y));
}
inline void expect_same(const std::vector<double>& got, const std::vector<double>& want, long t) {
  for (std::size_t e = 0; e < want.size(); ++e) EXPECT_TRUE(same(got[e], want[e])) << t << ":" << e;
}

// Seed of the randomized checks: ORVQ7_SEED from the environment, else a fixed value.
inline std::uint64_t test_seed() {
  const char* s = std::getenv("ORVQ7_SEED");
  return s ? std::strtoull(s, nullptr, 10) : 20240611u;
}

// Column-major copy of a square matrix of order n written by rows.
inline std::vector<double> by_rows(int n, std::vector<double> rows) {
  std::vector<double> c(rows.size());
  for (int e = 0; e < n * n; ++e) c[e] = rows[e % n * n + e / n];
  return c;
}

namespace plain {
using Mat = std::vector<double>;

// Complete pivot over rows and columns k..n-1, rows (or columns) in the outer loop, replaced
// only on a strictly larger magnitude, from `big`; returns that magnitude.
inline double pivot(const Mat& a, int n, int k, bool rows_outer, double big, int& r, int& q) {
  r = q = k;
  for (int u = k; u < n; ++u)
    for (int v = k; v < n; ++v) {
      const int i = rows_outer ? u : v, j = rows_outer ? v : u;
      if (std::fabs(a[i + j * n]) > big) big = std::fabs(a[i + j * n]), r = i, q = j;
    }
  return big;
}
// Whole rows (or columns) x and y: the parts the text leaves out are never read again.
inline void swap_lines(Mat& a, int n, int x, int y, bool rows) {
  for (int t = 0; t < n; ++t)
    std::swap(a[rows ? x + t * n : t + x * n], a[rows ? y + t * n : t + y * n]);
}

inline int solve(int n, Mat a, Mat b, Mat& x) {
  std::vector<int> perm(n);
  for (int j = 0; j < n; ++j) perm[j] = j;
  for (int k = 0, r, q; k < n - 1; ++k) {
    if (pivot(a, n, k, true, 0.0, r, q) <= 1e-38) return 1;
    swap_lines(a, n, k, r, true), std::swap(b[k], b[r]);
    swap_lines(a, n, k, q, false), std::swap(perm[k], perm[q]);
    for (int i = k + 1; i < n; ++i) {
      const double f = a[i + k * n] / a[k + k * n];
      for (int j = k + 1; j < n; ++j) a[i + j * n] -= f * a[k + j * n];
      b[i] -= f * b[k];
    }
  }
  if (std::fabs(a[n * n - 1]) <= 1e-30) return 1;
  b[n - 1] = b[n - 1] / a[n * n - 1];  // b(i) becomes the unknown of column i
  for (int i = n - 2; i >= 0; --i) {
    double s = a[i + (i + 1) * n] * b[i + 1];
    for (int j = i + 2; j < n; ++j) s += a[i + j * n] * b[j];
    b[i] = (b[i] - s) / a[i + i * n];
  }
  for (int i = 0; i < n; ++i) x[perm[i]] = b[i];
  return 0;
}

inline int invert(int n, Mat b, Mat& out) {
  std::vector<int> rows(n), cols(n);
  for (int k = 0; k < n; ++k) {
    if (pivot(b, n, k, true, 0.0, rows[k], cols[k]) < 1e-15) return 1;
    swap_lines(b, n, k, rows[k], true), swap_lines(b, n, k, cols[k], false);
    const double p = b[k + k * n];
    for (int e = 0; e < n * n; ++e)
      if (e % n != k && e / n != k) b[e] = b[e] - (b[e % n + k * n] * b[k + e / n * n]) / p;
    for (int j = 0; j < n; ++j)
      if (j != k) b[k + j * n] = b[k + j * n] / p, b[j + k * n] = -b[j + k * n] / p;
    b[k + k * n] = 1.0 / p;
  }
  for (int k = n - 1; k >= 0; --k)
    swap_lines(b, n, k, rows[k], false), swap_lines(b, n, k, cols[k], true);
  out = b;
  return 0;
}

inline double determinant(int n, Mat a) {
  double det = 1;
  int swaps = 0;
  for (int k = 0, r, q; k < n; ++k) {
    pivot(a, n, k, false, -1.0, r, q);
    if (a[r + q * n] == 0) return 0;
    swaps += (r != k) + (q != k);
    swap_lines(a, n, k, r, true), swap_lines(a, n, k, q, false);
    for (int i = k + 1; i < n; ++i) {
      const double f = a[i + k * n] / a[k + k * n];
      for (int j = k + 1; j < n; ++j) {
        const double v = a[i + j * n] - f * a[k + j * n];
        a[i + j * n] = std::fabs(a[i + j * n]) * 1e-12 > std::fabs(v) ? 0.0 : v;
      }
    }
    det = det * a[k + k * n];
  }
  return swaps % 2 ? -det : det;
}

}  // namespace plain
