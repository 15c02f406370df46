// linalg/gauss.cpp -- small linear solvers and vector conditioning: ynsega (dense, complete
// pivoting, order <= 20), ynsetr (tridiagonal, no pivoting), yntrzr (cleaning), yntrnr
// (normalisation). Matrices are column-major with leading dimension n, indices from 1 in
// the comments. No state survives a call: every work array is a local or a workspace block.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "frame/status.h"
#include "frame/workspace.h"
#include "linalg/linalg_api.h"

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

// Elimination state of ynsega: the working copy of A (leading dimension 20), of b, and the
// column permutation (perm[j] = original unknown, from 0, now in column j).
struct SegaWork {
  double a[kSegaCapacity * kSegaCapacity];
  double b[kSegaCapacity];
  std::int32_t perm[kSegaCapacity];
};

// Complete pivot search over rows and columns k..n-1 (from 0): rows in the outer loop,
// columns in the inner loop, a candidate replaced only on a strictly larger magnitude, so
// among equal magnitudes the lowest row, then the lowest column, wins. The search starts
// from magnitude 0 at (k, k): a NaN is never taken. Returns the largest magnitude.
double sega_pivot(const SegaWork& w, std::int32_t n, std::int32_t k, std::int32_t* pr,
                  std::int32_t* pc) {
  double big = 0.0;
  std::int32_t r = k, c = k;
  for (std::int32_t i = k; i < n; ++i) {
    for (std::int32_t j = k; j < n; ++j) {
      const double m = std::fabs(w.a[i + j * kSegaCapacity]);
      if (m > big) {
        big = m;
        r = i;
        c = j;
      }
    }
  }
  *pr = r;
  *pc = c;
  return big;
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

  // (2) Working copies; the caller's A and b are only read, so x may be b.
  SegaWork w;
  auto A = [&w](std::int32_t i, std::int32_t j) -> double& {
    return w.a[(i - 1) + (j - 1) * kSegaCapacity];
  };
  for (std::int32_t j = 1; j <= nn; ++j) {
    for (std::int32_t i = 1; i <= nn; ++i) A(i, j) = a[(i - 1) + (j - 1) * nn];
    w.b[j - 1] = b[j - 1];
    w.perm[j - 1] = j - 1;
  }

  // (3) Elimination, k = 1..n-1.
  for (std::int32_t k = 1; k < nn; ++k) {
    std::int32_t r0, c0;
    const double big = sega_pivot(w, nn, k - 1, &r0, &c0);
    if (big <= kSegaSearchMin) return impl::fail(ierr, impl::kErrSingular);  // inclusive
    const std::int32_t r = r0 + 1, q = c0 + 1;
    if (r != k) {  // rows k and r over columns k..n, and the right-hand side
      for (std::int32_t j = k; j <= nn; ++j) std::swap(A(k, j), A(r, j));
      std::swap(w.b[k - 1], w.b[r - 1]);
    }
    if (q != k) {  // columns k and q over all n rows, and the permutation
      for (std::int32_t i = 1; i <= nn; ++i) std::swap(A(i, k), A(i, q));
      std::swap(w.perm[k - 1], w.perm[q - 1]);
    }
    // Entries below the diagonal are left as they are: they are never read again.
    for (std::int32_t i = k + 1; i <= nn; ++i) {
      const double f = A(i, k) / A(k, k);
      for (std::int32_t j = k + 1; j <= nn; ++j) A(i, j) -= f * A(k, j);
      w.b[i - 1] -= f * w.b[k - 1];
    }
  }

  // (4) Last pivot, with its own (larger) threshold; inclusive.
  if (std::fabs(A(nn, nn)) <= kSegaLastPivotMin) return impl::fail(ierr, impl::kErrSingular);

  // (5) Back substitution: the sum over j = i+1..n is accumulated by increasing j, then
  // subtracted from b(i), then divided by the diagonal.
  double y[kSegaCapacity];
  y[nn - 1] = w.b[nn - 1] / A(nn, nn);
  for (std::int32_t i = nn - 1; i >= 1; --i) {
    double s = A(i, i + 1) * y[i];
    for (std::int32_t j = i + 2; j <= nn; ++j) s += A(i, j) * y[j - 1];
    y[i - 1] = (w.b[i - 1] - s) / A(i, i);
  }

  // (6) Undo the column permutation: column i holds unknown perm(i).
  for (std::int32_t i = 0; i < nn; ++i) x[w.perm[i]] = y[i];
  return 0;
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
