// linalg/gauss.cpp -- small linear solvers and vector conditioning: ynsega (dense, complete
// pivoting, order <= 20), ynsetr (tridiagonal, no pivoting), yntrzr (cleaning), yntrnr
// (normalisation). Matrices are column-major with leading dimension n, indices from 1 in
// the comments. No state survives a call: every work array is a local or a workspace block.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <utility>

#include "frame/status.h"
#include "frame/workspace.h"
#include "linalg/lanes.h"
#include "linalg/linalg_api.h"
#include "linalg/linalg_internal.h"

namespace {

// ---- ynsega ----
constexpr std::int32_t kSegaCapacity = 20;
constexpr double kSegaSearchMin = 1e-38;  // largest remaining magnitude must exceed this
constexpr double kSegaLastPivotMin = 1e-30;  // and so must the last pivot

// ---- ynsetr ----
constexpr std::int32_t kSetrLocal = 20;  // above this the scratch comes from the workspace
constexpr double kSetrPivotMin = 1e-15;  // strict: a pivot below it fails

// ---- yntrzr ----
constexpr std::int32_t kTrzrLocal = 100;  // mode 1 above this takes its index array from the workspace

// The elimination of ynsega for order N, or for the run-time order n when N is 0; n >= 1.
// Phases (2)-(6) of ynsega; ierr is written only on failure.
template <int N>
std::int32_t sega_solve(std::ptrdiff_t n, const double* a, const double* b, double* x,
                        std::int32_t* ierr) {
  using impl::Lanes;
  using impl::steps;
  // (2) Working copies (column-major, leading dimension n); the caller's A and b are only
  // read, so x may be b. row_max(i) is the largest magnitude of row i over the columns
  // still to be eliminated, kept as each step's update writes the row (a NaN never
  // counts), so that the pivot search reads n numbers instead of the whole block.
  const std::ptrdiff_t ld = N > 0 ? N : n;
  double w[kSegaCapacity * kSegaCapacity];
  double rhs[kSegaCapacity], row_max[kSegaCapacity];
  alignas(16) Lanes pivot_row[kSegaCapacity];
  std::int32_t perm[kSegaCapacity];
  auto W = [&w, ld](std::ptrdiff_t i, std::ptrdiff_t j) -> double& { return w[i + j * ld]; };
  std::memcpy(rhs, b, sizeof(double) * static_cast<std::size_t>(ld));
  steps<N>(0, ld, [&](std::ptrdiff_t i) { perm[i] = static_cast<std::int32_t>(i); });
  const std::ptrdiff_t odd = steps<N, 2>(0, ld, [&](std::ptrdiff_t i) {
    Lanes most = impl::splat(0.0);
    steps<N>(0, ld, [&](std::ptrdiff_t j) {
      const Lanes v = impl::load_lanes(a + i + j * ld);
      impl::store_lanes(&W(i, j), v);
      most = impl::keep_larger(most, impl::abs_lanes(v));
    });
    impl::store_lanes(row_max + i, most);
  });
  if (odd < ld) {
    double most = 0.0;
    steps<N>(0, ld, [&](std::ptrdiff_t j) {
      const double v = a[odd + j * ld];
      W(odd, j) = v;
      most = std::fabs(v) > most ? std::fabs(v) : most;
    });
    row_max[odd] = most;
  }

  // (3) Elimination, steps k = 1..n-1 (0-based k below).
  bool singular = false;
  steps<N>(0, ld - 1, [&](std::ptrdiff_t k) {
    if (singular) return;
    // (3.1) Complete pivot: rows scanned in the outer loop, columns in the inner loop,
    // replaced only on a strictly larger magnitude, from magnitude 0. That element is the
    // first row whose maximum is strictly the largest, at the first column reaching it.
    double big = 0.0;
    std::ptrdiff_t r = k;
    steps<N>(k, ld, [&](std::ptrdiff_t i) {
      const double m = row_max[i];
      const bool larger = m > big;  // strict: the first row keeps a tie
      r = larger ? i : r;
      big = larger ? m : big;
    });
    // (3.2) Inclusive: a largest magnitude <= 1e-38 is singular.
    if (big <= kSegaSearchMin) {
      singular = true;
      return;
    }
    // The first column of row r that reaches it (scanned backwards, the last hit wins).
    std::ptrdiff_t q = k;
    steps<N>(k, ld, [&](std::ptrdiff_t t) {
      const std::ptrdiff_t j = ld - 1 - (t - k);
      q = std::fabs(W(r, j)) == big ? j : q;
    });
    // (3.3) Rows k and r over columns k..n, and the right-hand side (r = k swaps nothing).
    steps<N>(k, ld, [&](std::ptrdiff_t j) { std::swap(W(k, j), W(r, j)); });
    std::swap(rhs[k], rhs[r]);
    // (3.4) Columns k and q over all rows, and the permutation.
    steps<N>(0, ld, [&](std::ptrdiff_t i) { std::swap(W(i, k), W(i, q)); });
    std::swap(perm[k], perm[q]);
    // (3.5) For i > k: f = a(i,k) / a(k,k); a(i,j) = a(i,j) - f a(k,j) for j > k;
    // b(i) = b(i) - f b(k). The entries below the diagonal are left as they are (never read
    // again). Rows are updated four or two at a time, each lane with exactly its row's
    // operations.
    const double p = W(k, k), bk = rhs[k];
    steps<N>(k + 1, ld, [&](std::ptrdiff_t j) { pivot_row[j] = impl::splat(W(k, j)); });
    std::ptrdiff_t i = steps<N, 4>(k + 1, ld, [&](std::ptrdiff_t i4) {
      const Lanes f0 = impl::load_lanes(&W(i4, k)) / impl::splat(p);
      const Lanes f1 = impl::load_lanes(&W(i4 + 2, k)) / impl::splat(p);
      Lanes most0 = impl::splat(0.0), most1 = most0;
      steps<N>(k + 1, ld, [&](std::ptrdiff_t j) {
        double* cell = &W(i4, j);
        const Lanes v0 = impl::load_lanes(cell) - f0 * pivot_row[j];
        const Lanes v1 = impl::load_lanes(cell + 2) - f1 * pivot_row[j];
        impl::store_lanes(cell, v0);
        impl::store_lanes(cell + 2, v1);
        most0 = impl::keep_larger(most0, impl::abs_lanes(v0));
        most1 = impl::keep_larger(most1, impl::abs_lanes(v1));
      });
      impl::store_lanes(row_max + i4, most0);
      impl::store_lanes(row_max + i4 + 2, most1);
      rhs[i4] = rhs[i4] - f0[0] * bk;
      rhs[i4 + 1] = rhs[i4 + 1] - f0[1] * bk;
      rhs[i4 + 2] = rhs[i4 + 2] - f1[0] * bk;
      rhs[i4 + 3] = rhs[i4 + 3] - f1[1] * bk;
    });
    if (i + 1 < ld) {
      const Lanes f = impl::load_lanes(&W(i, k)) / impl::splat(p);
      Lanes most = impl::splat(0.0);
      steps<N>(k + 1, ld, [&](std::ptrdiff_t j) {
        double* cell = &W(i, j);
        const Lanes v = impl::load_lanes(cell) - f * pivot_row[j];
        impl::store_lanes(cell, v);
        most = impl::keep_larger(most, impl::abs_lanes(v));
      });
      impl::store_lanes(row_max + i, most);
      rhs[i] = rhs[i] - f[0] * bk;
      rhs[i + 1] = rhs[i + 1] - f[1] * bk;
      i += 2;
    }
    if (i < ld) {
      const double f = W(i, k) / p;
      double most = 0.0;
      steps<N>(k + 1, ld, [&](std::ptrdiff_t j) {
        const double v = W(i, j) - f * pivot_row[j][0];
        W(i, j) = v;
        most = std::fabs(v) > most ? std::fabs(v) : most;
      });
      row_max[i] = most;
      rhs[i] = rhs[i] - f * bk;
    }
  });
  if (singular) return impl::fail(ierr, impl::kErrSingular);

  // (4) Last pivot, with its own (larger) threshold; inclusive.
  const std::ptrdiff_t last = ld - 1;
  if (std::fabs(W(last, last)) <= kSegaLastPivotMin) return impl::fail(ierr, impl::kErrSingular);

  // (5) Back substitution, i = n-1 down to 1: the sum over j = i+1..n is accumulated by
  // increasing j, then subtracted from b(i), then divided by the diagonal.
  double y[kSegaCapacity];
  y[last] = rhs[last] / W(last, last);
  steps<N>(1, ld, [&](std::ptrdiff_t t) {
    const std::ptrdiff_t i = last - t;
    double s = W(i, i + 1) * y[i + 1];
    steps<N>(i + 2, ld, [&](std::ptrdiff_t j) { s += W(i, j) * y[j]; });
    y[i] = (rhs[i] - s) / W(i, i);
  });

  // (6) Undo the column permutation: column i holds unknown perm(i).
  steps<N>(0, ld, [&](std::ptrdiff_t i) { x[perm[i]] = y[i]; });
  return 0;
}

// Stable insertion sort of idx[0..n) by decreasing |v|: an element moves only past
// strictly smaller magnitudes, so ties keep their index order.
void sort_by_decreasing_magnitude(const double* v, std::int32_t n, std::int32_t* idx) {
  for (std::int32_t i = 0; i < n; ++i) idx[i] = i;
  for (std::int32_t i = 1; i < n; ++i) {
    const std::int32_t cur = idx[i];
    const double m = std::fabs(v[cur]);
    std::int32_t p = i;
    while (p > 0 && std::fabs(v[idx[p - 1]]) < m) {
      idx[p] = idx[p - 1];
      --p;
    }
    idx[p] = cur;
  }
}

}  // namespace

extern "C" {

std::int32_t ynsega(const std::int32_t* n, const double* a, const double* b, double* x,
                    std::int32_t* ierr) {
  // (1) Arguments; the capacity is fixed, there is no fall-back above it.
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kSegaCapacity) return impl::fail(ierr, impl::kErrCapacity);
  *ierr = 0;
  // Small orders get their own copy of the elimination, with every loop bound known.
  switch (nn) {
    case 1: return sega_solve<1>(1, a, b, x, ierr);
    case 2: return sega_solve<2>(2, a, b, x, ierr);
    case 3: return sega_solve<3>(3, a, b, x, ierr);
    case 4: return sega_solve<4>(4, a, b, x, ierr);
    case 5: return sega_solve<5>(5, a, b, x, ierr);
    case 6: return sega_solve<6>(6, a, b, x, ierr);
    case 7: return sega_solve<7>(7, a, b, x, ierr);
    case 8: return sega_solve<8>(8, a, b, x, ierr);
    default: return sega_solve<0>(nn, a, b, x, ierr);
  }
}

std::int32_t ynsetr(const std::int32_t* n, const double* d, const double* a, const double* c,
                    const double* r, double* x, std::int32_t* ierr) {
  // (1)-(2) Arguments, then the first pivot (strict: below the threshold fails).
  const std::int32_t nn = *n;
  if (nn <= 0) return impl::fail(ierr, impl::kErrBadArg);
  if (std::fabs(d[0]) < kSetrPivotMin) return impl::fail(ierr, impl::kErrSingular);

  // (3) Scratch for the n quotients gamma: a local up to 20, else n reals of workspace.
  *ierr = 0;
  double local[kSetrLocal];
  double* gamma = local;
  impl::WorkspaceBlock block;
  if (nn > kSetrLocal) {
    if (!block.take(impl::kWsReal, nn)) return impl::fail(ierr, impl::kErrWorkspace);
    gamma = block.get<double>();
  }

  // (4)-(5) Forward elimination without pivoting.
  double beta = d[0];
  x[0] = r[0] / beta;
  for (std::int32_t i = 2; i <= nn; ++i) {
    gamma[i - 2] = c[i - 2] / beta;
    beta = d[i - 1] - a[i - 1] * gamma[i - 2];
    if (std::fabs(beta) < kSetrPivotMin) return impl::fail(ierr, impl::kErrSingular);
    x[i - 1] = (r[i - 1] - a[i - 1] * x[i - 2]) / beta;
  }

  // (6) Back substitution; the guard releases the block on every path.
  for (std::int32_t i = nn - 1; i >= 1; --i) x[i - 1] -= gamma[i - 1] * x[i];
  return 0;
}

std::int32_t yntrzr(const std::int32_t* n, const double* v, const double* tol,
                    const std::int32_t* mode, double* w, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  const double t = *tol;
  switch (*mode) {
    case 0:  // absolute: inclusive
      for (std::int32_t i = 0; i < nn; ++i) w[i] = std::fabs(v[i]) <= t ? 0.0 : v[i];
      break;
    case 2: {  // relative to the largest magnitude (a NaN is never the largest); inclusive
      double big = 0.0;
      for (std::int32_t i = 0; i < nn; ++i) {
        if (std::fabs(v[i]) > big) big = std::fabs(v[i]);
      }
      const double limit = t * big;
      for (std::int32_t i = 0; i < nn; ++i) w[i] = std::fabs(v[i]) <= limit ? 0.0 : v[i];
      break;
    }
    case 1: {  // gap rule on the order of decreasing magnitude
      std::int32_t local[kTrzrLocal];
      std::int32_t* idx = local;
      impl::WorkspaceBlock block;
      if (nn > kTrzrLocal) {
        if (!block.take(impl::kWsInt32, nn)) return impl::fail(ierr, impl::kErrWorkspace);
        idx = block.get<std::int32_t>();
      }
      sort_by_decreasing_magnitude(v, nn, idx);
      // First position s (from 2) where |previous| * tol > |current| (strict); n + 1 if none.
      std::int32_t s = 2;
      while (s <= nn && !(std::fabs(v[idx[s - 2]]) * t > std::fabs(v[idx[s - 1]]))) ++s;
      // v is fully read before w is written, so w may be v.
      for (std::int32_t p = 1; p <= nn; ++p) {
        const std::int32_t i = idx[p - 1];
        w[i] = p < s ? v[i] : 0.0;
      }
      break;
    }
    default:
      return impl::fail(ierr, impl::kErrCapacity);
  }
  *ierr = 0;
  return 0;
}

std::int32_t yntrnr(const std::int32_t* n, const double* v, const std::int32_t* mode, double* w,
                    double* norm, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  double s = 0.0;
  switch (*mode) {
    case 0:  // largest magnitude (a NaN is never the largest)
      for (std::int32_t i = 0; i < nn; ++i) {
        if (std::fabs(v[i]) > s) s = std::fabs(v[i]);
      }
      break;
    case 1:  // sum of magnitudes by increasing index
      for (std::int32_t i = 0; i < nn; ++i) s += std::fabs(v[i]);
      break;
    case 2:  // square root of the plain sum of squares by increasing index, no scaling
      for (std::int32_t i = 0; i < nn; ++i) s += v[i] * v[i];
      s = std::sqrt(s);
      break;
    default:
      *norm = 0.0;
      return impl::fail(ierr, impl::kErrCapacity);
  }
  // The norm is written before it is tested; w stays untouched when it is exactly 0.
  *norm = s;
  if (s == 0.0) return impl::fail(ierr, impl::kErrDegenerate);
  for (std::int32_t i = 0; i < nn; ++i) w[i] = v[i] / s;
  *ierr = 0;
  return 0;
}

}  // extern "C"
