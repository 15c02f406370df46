// evaluators/near_subspace.cpp -- test of a point list against an affine subspace given by
// an origin and k orthonormal directions: yngcoa. Points and directions are columns of
// column-major arrays with leading dimension n; indices from 1 in the comments.
#include <cstddef>
#include <cstdint>

#include "evaluators/evaluators_api.h"
#include "frame/status.h"

namespace {

// ---- State of yngcoa kept between calls, one copy per thread ----
//   visit  list index (from 1) of the last point visited with an order code of 17 or
//          >= 274; written at every such visit, read at the start of a call with 0 < k < n
//          and any other order code. 0 until the thread's first visit.
struct YngcoaState {
  std::int32_t visit = 0;
};
thread_local YngcoaState s_yngcoa;

constexpr std::int32_t kGcoaCapacity = 20;   // coordinates of a point in the frame
constexpr std::int32_t kOrderList = 17;      // visit the points in list order
constexpr std::int32_t kOrderBothEnds = 274;  // and above: alternately from both ends

}  // namespace

extern "C" std::int32_t yngcoa(const std::int32_t* n, const std::int32_t* m, const double* pts,
                               const std::int32_t* order, const std::int32_t* k,
                               const double* origin, const double* u, const double* tol,
                               std::int32_t* inside, std::int32_t* ierr) {
  // (1) Arguments, in the order n, k, m; failures answer inside = 1.
  const std::int32_t nn = *n, kk = *k, mm = *m;
  if (nn <= 0 || kk < 0 || kk > nn || mm <= 0) {
    *inside = 1;
    return impl::fail(ierr, impl::kErrBadArg);
  }
  if (kk > kGcoaCapacity) {
    *inside = 1;
    return impl::fail(ierr, impl::kErrCapacity);
  }
  // (2)
  *ierr = 0;
  const double t2 = *tol * *tol;
  const std::ptrdiff_t ld = nn;
  auto P = [pts, ld](std::ptrdiff_t l, std::ptrdiff_t j) { return pts[(l - 1) + (j - 1) * ld]; };
  auto U = [u, ld](std::ptrdiff_t l, std::ptrdiff_t i) { return u[(l - 1) + (i - 1) * ld]; };

  // (3) A point: squared distances summed by increasing component; strict test, so a
  // point at exactly tol is inside. List order whatever the order code.
  if (kk == 0) {
    for (std::ptrdiff_t j = 1; j <= mm; ++j) {
      double r2 = 0.0;
      for (std::ptrdiff_t l = 1; l <= nn; ++l) {
        const double e = P(l, j) - origin[l - 1];
        r2 += e * e;
      }
      if (r2 > t2) {
        *inside = 0;
        return 0;
      }
    }
    *inside = 1;
    return 0;
  }
  // (4) The whole space: the points are not read.
  if (kk == nn) {
    *inside = 1;
    return 0;
  }

  // (5) 0 < k < n. With an order code other than 17 or >= 274 the index is the counter
  // left by this thread's previous visit, unchanged for the whole call; a counter outside
  // 1..m (no earlier visit, or one in a longer list) is taken as the nearest of 1 and m.
  const std::int32_t code = *order;
  const bool stepping = code == kOrderList || code >= kOrderBothEnds;
  std::int32_t j = s_yngcoa.visit;
  if (j < 1) j = 1;
  if (j > mm) j = mm;
  double c[kGcoaCapacity];
  for (std::int32_t v = 1; v <= mm; ++v) {
    if (code == kOrderList) {
      j = v;
    } else if (code >= kOrderBothEnds) {
      j = v % 2 == 1 ? v / 2 + 1 : mm - v / 2 + 1;  // 1, m, 2, m - 1, 3, ...
    }
    if (stepping) s_yngcoa.visit = j;
    // Coordinates c(i) = sum over l of (P(l,j) - O(l)) U(l,i), by increasing l.
    for (std::ptrdiff_t i = 1; i <= kk; ++i) {
      double s = 0.0;
      for (std::ptrdiff_t l = 1; l <= nn; ++l) s += (P(l, j) - origin[l - 1]) * U(l, i);
      c[i - 1] = s;
    }
    // Residual: sum over l of ((P(l,j) - O(l)) - sum over i of c(i) U(l,i))^2, both sums by
    // increasing index; the inner sum is formed before it is subtracted.
    double r2 = 0.0;
    for (std::ptrdiff_t l = 1; l <= nn; ++l) {
      double s = 0.0;
      for (std::ptrdiff_t i = 1; i <= kk; ++i) s += c[i - 1] * U(l, i);
      const double e = (P(l, j) - origin[l - 1]) - s;
      r2 += e * e;
    }
    if (r2 > t2) {  // strict
      *inside = 0;
      return 0;
    }
  }
  // (6)
  *inside = 1;
  return 0;
}
