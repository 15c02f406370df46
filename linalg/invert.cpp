// linalg/invert.cpp -- inversion and determinant of a square matrix of order <= 20 by
// elimination with complete pivoting: ynmimr, ynmxmr. Column-major, leading dimension n,
// indices from 1 in the comments. No state survives a call.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "frame/status.h"
#include "linalg/linalg_api.h"
#include "linalg/linalg_internal.h"

namespace {

// ---- ynmimr ----
constexpr std::int32_t kMimrCapacity = 20;
constexpr double kMimrScalarMin = 1e-15;  // order 1: |a| below it is singular (strict)
constexpr double kMimrDetMin = 1e-30;     // order 2: |det| below it is singular (strict)
constexpr double kMimrPivotMin = 1e-15;   // order >= 3: largest magnitude below it (strict)

// ---- ynmxmr ----
constexpr std::int32_t kMxmrCapacity = 20;
constexpr double kMxmrCancel = 1e-12;  // |old| * 1e-12 > |new| flushes new to exactly 0

}  // namespace

extern "C" {

std::int32_t ynmimr(const std::int32_t* n, const double* a, double* b, std::int32_t* ierr) {
  // (1)-(3) Orders 1 and 2 in closed form; a is read in full before b is written.
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  if (nn == 1) {
    if (std::fabs(a[0]) < kMimrScalarMin) return impl::fail(ierr, impl::kErrSingular);
    b[0] = 1.0 / a[0];
    *ierr = 0;
    return 0;
  }
  if (nn == 2) {
    const double a11 = a[0], a21 = a[1], a12 = a[2], a22 = a[3];
    const double det = a11 * a22 - a21 * a12;
    if (std::fabs(det) < kMimrDetMin) return impl::fail(ierr, impl::kErrSingular);
    b[0] = a22 / det;
    b[1] = -a21 / det;
    b[2] = -a12 / det;
    b[3] = a11 / det;
    *ierr = 0;
    return 0;
  }
  // (4) Capacity, then the copy into b where the inversion runs in place.
  if (nn > kMimrCapacity) return impl::fail(ierr, impl::kErrCapacity);
  *ierr = 0;
  const std::ptrdiff_t ld = nn;
  for (std::ptrdiff_t e = 0; e < ld * ld; ++e) b[e] = a[e];
  auto B = [b, ld](std::int32_t i, std::int32_t j) -> double& {
    return b[(i - 1) + (j - 1) * ld];
  };

  // (5) Gauss-Jordan exchange steps, k = 1..n.
  std::int32_t row_of[kMimrCapacity], col_of[kMimrCapacity];
  for (std::int32_t k = 1; k <= nn; ++k) {
    // (5.1) Rows outer, columns inner, strictly larger replaces: the first maximum in that
    // order wins. Starts from magnitude 0 at (k, k), so a NaN is never taken.
    double big = 0.0;
    std::int32_t r = k, q = k;
    for (std::int32_t i = k; i <= nn; ++i) {
      for (std::int32_t j = k; j <= nn; ++j) {
        if (std::fabs(B(i, j)) > big) {
          big = std::fabs(B(i, j));
          r = i;
          q = j;
        }
      }
    }
    // (5.2) Strict: a largest magnitude below 1e-15 is singular; b stays partly transformed.
    if (big < kMimrPivotMin) return impl::fail(ierr, impl::kErrSingular);
    // (5.3) Whole rows and whole columns are exchanged, and both indices recorded.
    if (r != k) {
      for (std::int32_t j = 1; j <= nn; ++j) std::swap(B(k, j), B(r, j));
    }
    if (q != k) {
      for (std::int32_t i = 1; i <= nn; ++i) std::swap(B(i, k), B(i, q));
    }
    row_of[k - 1] = r;
    col_of[k - 1] = q;
    // (5.4) Exchange step with pivot p: b(i,j) - (b(i,k) * b(k,j)) / p outside row and
    // column k, from the values before the step; then the row divided by p, the column
    // divided by p with a change of sign, and the pivot replaced by 1 / p.
    const double p = B(k, k);
    for (std::int32_t j = 1; j <= nn; ++j) {
      if (j == k) continue;
      const double bkj = B(k, j);
      for (std::int32_t i = 1; i <= nn; ++i) {
        if (i != k) B(i, j) = B(i, j) - (B(i, k) * bkj) / p;
      }
    }
    for (std::int32_t j = 1; j <= nn; ++j) {
      if (j != k) B(k, j) = B(k, j) / p;
    }
    for (std::int32_t i = 1; i <= nn; ++i) {
      if (i != k) B(i, k) = -B(i, k) / p;
    }
    B(k, k) = 1.0 / p;
  }

  // (6) Interchanges undone from the last step back: a row exchange as a column exchange,
  // a column exchange as a row exchange.
  for (std::int32_t k = nn; k >= 1; --k) {
    const std::int32_t r = row_of[k - 1], q = col_of[k - 1];
    if (r != k) {
      for (std::int32_t i = 1; i <= nn; ++i) std::swap(B(i, k), B(i, r));
    }
    if (q != k) {
      for (std::int32_t j = 1; j <= nn; ++j) std::swap(B(k, j), B(q, j));
    }
  }
  return 0;
}

std::int32_t ynmxmr(const std::int32_t* n, const double* a, double* det, std::int32_t* ierr) {
  // (1) Orders 1 to 3 in closed form, without pivoting or flushing.
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  if (nn <= 3) {
    if (nn == 1) {
      *det = a[0];
    } else if (nn == 2) {
      *det = a[0] * a[3] - a[1] * a[2];  // a11 a22 - a21 a12
    } else {
      *det = impl::det3_rows(a, 3, 0, 1, 2);
    }
    *ierr = 0;
    return 0;
  }
  // (2) Capacity.
  if (nn > kMxmrCapacity) return impl::fail(ierr, impl::kErrCapacity);

  // (3) Elimination on a local copy; the caller's matrix is only read.
  const std::ptrdiff_t ld = nn;
  double work[kMxmrCapacity * kMxmrCapacity];
  for (std::ptrdiff_t e = 0; e < ld * ld; ++e) work[e] = a[e];
  auto W = [&work, ld](std::int32_t i, std::int32_t j) -> double& {
    return work[(i - 1) + (j - 1) * ld];
  };
  double d = 1.0;
  std::int32_t swaps = 0;
  for (std::int32_t k = 1; k <= nn; ++k) {
    // (3.1) Columns outer, rows inner, from a candidate magnitude of -1 (the first element
    // is taken unless it is a NaN); strictly larger replaces.
    double big = -1.0;
    std::int32_t r = k, q = k;
    for (std::int32_t j = k; j <= nn; ++j) {
      for (std::int32_t i = k; i <= nn; ++i) {
        if (std::fabs(W(i, j)) > big) {
          big = std::fabs(W(i, j));
          r = i;
          q = j;
        }
      }
    }
    // (3.2) An exactly zero pivot: the determinant is 0, a successful result.
    if (W(r, q) == 0.0) {
      *det = 0.0;
      *ierr = 0;
      return 0;
    }
    // (3.3) Each exchange counts once; rows and columns before k are not read again.
    if (r != k) {
      for (std::int32_t j = k; j <= nn; ++j) std::swap(W(k, j), W(r, j));
      ++swaps;
    }
    if (q != k) {
      for (std::int32_t i = k; i <= nn; ++i) std::swap(W(i, k), W(i, q));
      ++swaps;
    }
    // (3.4) Update with the flush: a difference that cancelled more than twelve digits
    // (|old| * 1e-12 > |new|, strict) becomes exactly 0.
    const double p = W(k, k);
    for (std::int32_t i = k + 1; i <= nn; ++i) {
      const double f = W(i, k) / p;
      for (std::int32_t j = k + 1; j <= nn; ++j) {
        const double fresh = W(i, j) - f * W(k, j);
        W(i, j) = std::fabs(W(i, j)) * kMxmrCancel > std::fabs(fresh) ? 0.0 : fresh;
      }
    }
    // (3.5)
    d = d * p;
  }
  // (4) Sign of the permutation.
  if (swaps % 2 == 1) d = -d;
  *det = d;
  *ierr = 0;
  return 0;
}

}  // extern "C"
