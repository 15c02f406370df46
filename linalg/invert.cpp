// linalg/invert.cpp -- inversion and determinant of a square matrix of order <= 20 by
// elimination with complete pivoting: ynmimr, ynmxmr. Column-major, leading dimension n,
// indices from 1 in the comments. No state survives a call.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "frame/status.h"
#include "linalg/lanes.h"
#include "linalg/linalg_api.h"
#include "linalg/linalg_internal.h"

namespace {

using impl::Lanes;
using impl::steps;

// ---- ynmimr ----
constexpr std::int32_t kMimrCapacity = 20;
constexpr double kMimrScalarMin = 1e-15;  // order 1: |a| below it is singular (strict)
constexpr double kMimrDetMin = 1e-30;     // order 2: |det| below it is singular (strict)
constexpr double kMimrPivotMin = 1e-15;   // order >= 3: largest magnitude below it (strict)

// ---- ynmxmr ----
constexpr std::int32_t kMxmrCapacity = 20;
constexpr double kMxmrCancel = 1e-12;  // |old| * 1e-12 > |new| flushes new to exactly 0

// Phases (5)-(6) of ynmimr for order N (or the run-time order n when N is 0), n >= 3, in
// place on b, which holds a copy of A (column-major, leading dimension n). Returns false
// when a step finds its largest magnitude below the threshold (b is then partly
// transformed). row_max(i) is the largest magnitude of row i over the columns after the
// current step, kept as the step writes the row (a NaN never counts), so that the next
// pivot search reads n numbers instead of the whole block.
template <int N>
bool mimr_sweep(std::ptrdiff_t n, double* b) {
  const std::ptrdiff_t ld = N > 0 ? N : n;
  auto B = [b, ld](std::ptrdiff_t i, std::ptrdiff_t j) -> double& { return b[i + j * ld]; };
  double row_max[kMimrCapacity];
  alignas(16) Lanes pivot_row[kMimrCapacity];
  std::ptrdiff_t row_of[kMimrCapacity], col_of[kMimrCapacity];
  steps<N>(0, ld, [&](std::ptrdiff_t i) {
    double most = 0.0;
    steps<N>(0, ld, [&](std::ptrdiff_t j) {
      most = std::fabs(B(i, j)) > most ? std::fabs(B(i, j)) : most;
    });
    row_max[i] = most;
  });

  bool singular = false;
  steps<N>(0, ld, [&](std::ptrdiff_t k) {
    if (singular) return;
    // (5.1) Rows outer, columns inner, strictly larger replaces, from magnitude 0: the first
    // row whose maximum is strictly the largest, at the first column reaching it.
    double big = 0.0;
    std::ptrdiff_t r = k;
    steps<N>(k, ld, [&](std::ptrdiff_t i) {
      const bool larger = row_max[i] > big;
      r = larger ? i : r;
      big = larger ? row_max[i] : big;
    });
    // (5.2) Strict: a largest magnitude below 1e-15 is singular.
    if (big < kMimrPivotMin) {
      singular = true;
      return;
    }
    std::ptrdiff_t q = k;
    steps<N>(k, ld, [&](std::ptrdiff_t t) {  // backwards: the last hit is the first column
      const std::ptrdiff_t j = ld - 1 - (t - k);
      q = std::fabs(B(r, j)) == big ? j : q;
    });
    // (5.3) Whole rows k and r, whole columns k and q; both recorded.
    steps<N>(0, ld, [&](std::ptrdiff_t j) { std::swap(B(k, j), B(r, j)); });
    steps<N>(0, ld, [&](std::ptrdiff_t i) { std::swap(B(i, k), B(i, q)); });
    row_of[k] = r;
    col_of[k] = q;
    // (5.4) Exchange step with pivot p, from the values before the step:
    // b(i,j) - (b(i,k) b(k,j)) / p outside row and column k, two rows at a time (each lane
    // with exactly its row's operations); then row k divided by p, column k divided by p
    // with a change of sign, and the pivot replaced by 1 / p.
    const double p = B(k, k);
    const Lanes pp = impl::splat(p);
    steps<N>(0, ld, [&](std::ptrdiff_t j) { pivot_row[j] = impl::splat(B(k, j)); });
    auto two_rows = [&](std::ptrdiff_t i) {
      const Lanes bik = impl::load_lanes(&B(i, k));
      steps<N>(0, k, [&](std::ptrdiff_t j) {
        double* cell = &B(i, j);
        impl::store_lanes(cell, impl::load_lanes(cell) - (bik * pivot_row[j]) / pp);
      });
      Lanes most = impl::splat(0.0);
      steps<N>(k + 1, ld, [&](std::ptrdiff_t j) {
        double* cell = &B(i, j);
        const Lanes v = impl::load_lanes(cell) - (bik * pivot_row[j]) / pp;
        impl::store_lanes(cell, v);
        most = impl::keep_larger(most, impl::abs_lanes(v));
      });
      impl::store_lanes(row_max + i, most);
    };
    auto one_row = [&](std::ptrdiff_t i) {
      const double bik = B(i, k);
      double most = 0.0;
      steps<N>(0, ld, [&](std::ptrdiff_t j) {
        if (j == k) return;
        const double v = B(i, j) - (bik * pivot_row[j][0]) / p;
        B(i, j) = v;
        if (j > k) most = std::fabs(v) > most ? std::fabs(v) : most;
      });
      row_max[i] = most;
    };
    auto rows = [&](std::ptrdiff_t first, std::ptrdiff_t end) {
      steps<N, 2>(first, end, two_rows);
      if (end > first && (end - first) % 2 == 1) one_row(end - 1);
    };
    rows(0, k);
    rows(k + 1, ld);
    steps<N>(0, ld, [&](std::ptrdiff_t j) {
      if (j != k) B(k, j) = pivot_row[j][0] / p;
    });
    const std::ptrdiff_t odd = steps<N, 2>(0, ld, [&](std::ptrdiff_t i) {
      impl::store_lanes(&B(i, k), -impl::load_lanes(&B(i, k)) / pp);
    });
    if (odd < ld) B(odd, k) = -B(odd, k) / p;
    B(k, k) = 1.0 / p;  // after the column: the pair holding row k divided it too
  });
  if (singular) return false;

  // (6) Interchanges undone from the last step back: a row exchange as a column exchange,
  // a column exchange as a row exchange.
  for (std::ptrdiff_t k = ld - 1; k >= 0; --k) {
    const std::ptrdiff_t r = row_of[k], q = col_of[k];
    if (r != k) {
      for (std::ptrdiff_t i = 0; i < ld; ++i) std::swap(B(i, k), B(i, r));
    }
    if (q != k) {
      for (std::ptrdiff_t j = 0; j < ld; ++j) std::swap(B(k, j), B(q, j));
    }
  }
  return true;
}

// Phase (3)-(4) of ynmxmr for order N (or the run-time order n when N is 0), 4 <= n <= 20:
// the determinant of a (column-major, leading dimension n). col_max(j) is the largest
// magnitude of column j over the rows still to be eliminated, from -1 (a NaN never counts),
// kept as each step's update writes the column.
template <int N>
double mxmr_eliminate(std::ptrdiff_t n, const double* a) {
  const std::ptrdiff_t ld = N > 0 ? N : n;
  double w[kMxmrCapacity * kMxmrCapacity];
  double col_max[kMxmrCapacity];
  alignas(16) double factor[kMxmrCapacity + 1];
  auto W = [&w, ld](std::ptrdiff_t i, std::ptrdiff_t j) -> double& { return w[i + j * ld]; };
  // Largest magnitude of lanes and a tail, from -1; a NaN never counts.
  auto reduce = [](Lanes most) { return most[1] > most[0] ? most[1] : most[0]; };
  steps<N>(0, ld, [&](std::ptrdiff_t j) {
    Lanes most = impl::splat(-1.0);
    const std::ptrdiff_t odd = steps<N, 2>(0, ld, [&](std::ptrdiff_t i) {
      const Lanes v = impl::load_lanes(a + i + j * ld);
      impl::store_lanes(&W(i, j), v);
      most = impl::keep_larger(most, impl::abs_lanes(v));
    });
    double m = reduce(most);
    if (odd < ld) {
      W(odd, j) = a[odd + j * ld];
      m = std::fabs(W(odd, j)) > m ? std::fabs(W(odd, j)) : m;
    }
    col_max[j] = m;
  });

  double det = 1.0;
  std::int32_t swaps = 0;
  bool zero = false;
  steps<N>(0, ld, [&](std::ptrdiff_t k) {
    if (zero) return;
    // (3.1) Columns outer, rows inner, from a candidate of -1, strictly larger replaces: the
    // first column whose maximum is strictly the largest, at the first row reaching it;
    // (k, k) when every remaining element is a NaN.
    double big = -1.0;
    std::ptrdiff_t q = k;
    steps<N>(k, ld, [&](std::ptrdiff_t j) {
      const bool larger = col_max[j] > big;
      q = larger ? j : q;
      big = larger ? col_max[j] : big;
    });
    std::ptrdiff_t r = k;
    steps<N>(k, ld, [&](std::ptrdiff_t t) {  // backwards: the last hit is the first row
      const std::ptrdiff_t i = ld - 1 - (t - k);
      r = std::fabs(W(i, q)) == big ? i : r;
    });
    // (3.2) An exactly zero pivot: the determinant is 0.
    if (W(r, q) == 0.0) {
      zero = true;
      return;
    }
    // (3.3) Each exchange counts once; rows and columns before k are not read again.
    swaps += (r != k) + (q != k);
    steps<N>(k, ld, [&](std::ptrdiff_t j) { std::swap(W(k, j), W(r, j)); });
    steps<N>(k, ld, [&](std::ptrdiff_t i) { std::swap(W(i, k), W(i, q)); });
    // (3.4) For i > k: f = a(i,k) / p; new = a(i,j) - f a(k,j), flushed to exactly 0 when
    // |a(i,j)| * 1e-12 > |new| (strict). Column by column, two rows at a time.
    const double p = W(k, k);
    const std::ptrdiff_t odd = steps<N, 2>(k + 1, ld, [&](std::ptrdiff_t i) {
      impl::store_lanes(factor + i, impl::load_lanes(&W(i, k)) / impl::splat(p));
    });
    if (odd < ld) factor[odd] = W(odd, k) / p;
    const Lanes cancel = impl::splat(kMxmrCancel);
    auto update = [&](double* cell, Lanes f, Lanes akj, Lanes& most) {
      const Lanes old = impl::load_lanes(cell);
      const Lanes fresh = old - f * akj;
      const Lanes kept = impl::select_lanes(impl::abs_lanes(old) * cancel > impl::abs_lanes(fresh),
                                            impl::splat(0.0), fresh);
      impl::store_lanes(cell, kept);
      most = impl::keep_larger(most, impl::abs_lanes(kept));
    };
    // The odd last row of column j, then the column's maximum.
    auto finish = [&](std::ptrdiff_t j, Lanes most) {
      double m = reduce(most);
      if (odd < ld) {
        const double old = W(odd, j);
        const double fresh = old - factor[odd] * W(k, j);
        const double kept = std::fabs(old) * kMxmrCancel > std::fabs(fresh) ? 0.0 : fresh;
        W(odd, j) = kept;
        m = std::fabs(kept) > m ? std::fabs(kept) : m;
      }
      col_max[j] = m;
    };
    // Two columns at a time, two rows at a time.
    const std::ptrdiff_t last_col = steps<N, 2>(k + 1, ld, [&](std::ptrdiff_t j) {
      const Lanes akj0 = impl::splat(W(k, j)), akj1 = impl::splat(W(k, j + 1));
      Lanes most0 = impl::splat(-1.0), most1 = most0;
      steps<N, 2>(k + 1, ld, [&](std::ptrdiff_t i) {
        const Lanes f = impl::load_lanes(factor + i);
        update(&W(i, j), f, akj0, most0);
        update(&W(i, j + 1), f, akj1, most1);
      });
      finish(j, most0);
      finish(j + 1, most1);
    });
    if (last_col < ld) {
      const Lanes akj = impl::splat(W(k, last_col));
      Lanes most = impl::splat(-1.0);
      steps<N, 2>(k + 1, ld, [&](std::ptrdiff_t i) {
        update(&W(i, last_col), impl::load_lanes(factor + i), akj, most);
      });
      finish(last_col, most);
    }
    // (3.5)
    det = det * p;
  });
  if (zero) return 0.0;
  // (4) Sign of the permutation.
  return swaps % 2 == 1 ? -det : det;
}

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
  // (5)-(6) Small orders get their own copy of the sweep, with every loop bound known.
  bool done;
  switch (nn) {
    case 3: done = mimr_sweep<3>(3, b); break;
    case 4: done = mimr_sweep<4>(4, b); break;
    case 5: done = mimr_sweep<5>(5, b); break;
    case 6: done = mimr_sweep<6>(6, b); break;
    default: done = mimr_sweep<0>(ld, b); break;
  }
  if (!done) return impl::fail(ierr, impl::kErrSingular);
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

  // (3)-(4) Elimination on a local copy; the caller's matrix is only read. Small orders
  // get their own copy of the elimination, with every loop bound known.
  double d;
  switch (nn) {
    case 4: d = mxmr_eliminate<4>(4, a); break;
    case 5: d = mxmr_eliminate<5>(5, a); break;
    case 6: d = mxmr_eliminate<6>(6, a); break;
    default: d = mxmr_eliminate<0>(nn, a); break;
  }
  *det = d;
  *ierr = 0;
  return 0;
}

}  // extern "C"
