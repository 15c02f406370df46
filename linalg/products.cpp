// linalg/products.cpp -- matrix and vector products, transpose and bound widening: ynmpmm,
// ynmpmv, ynmrmm, ynmtvv, ynvpvv, ynvevv, ynvvvv. Matrices are column-major with leading
// dimension equal to their row count; indices from 1 in the comments. No state.
#include <cstddef>
#include <cstdint>

#include "frame/status.h"
#include "frame/workspace.h"
#include "linalg/linalg_api.h"
#include "linalg/linalg_internal.h"

namespace {

// ---- ynvvvv ----
constexpr std::int32_t kVvvvLocal = 10;     // up to this order the minors fit a local square
constexpr std::int32_t kVvvvCapacity = 21;  // minors of order n - 1 <= 20 (ynmxmr's capacity)

}  // namespace

extern "C" {

std::int32_t ynmpmm(const std::int32_t* m, const std::int32_t* k, const std::int32_t* n,
                    const double* a, const double* b, double* p, std::int32_t* ierr) {
  if (*m < 1 || *k < 1 || *n < 1) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t mm = *m, kk = *k, nn = *n;
  // Column by column: P(:,j) = A(:,1) B(1,j), then += A(:,l) B(l,j) for l = 2..k ascending.
  for (std::ptrdiff_t j = 0; j < nn; ++j) {
    double* pj = p + j * mm;
    const double* bj = b + j * kk;
    for (std::ptrdiff_t i = 0; i < mm; ++i) pj[i] = a[i] * bj[0];
    for (std::ptrdiff_t l = 1; l < kk; ++l) {
      const double* al = a + l * mm;
      const double blj = bj[l];
      for (std::ptrdiff_t i = 0; i < mm; ++i) pj[i] += al[i] * blj;
    }
  }
  *ierr = 0;
  return 0;
}

std::int32_t ynmpmv(const std::int32_t* m, const std::int32_t* n, const double* a,
                    const double* x, double* y, std::int32_t* ierr) {
  if (*m < 1 || *n < 1) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t mm = *m, nn = *n;
  // y = A(:,1) x(1), then += A(:,l) x(l) for l = 2..n ascending.
  for (std::ptrdiff_t i = 0; i < mm; ++i) y[i] = a[i] * x[0];
  for (std::ptrdiff_t l = 1; l < nn; ++l) {
    const double* al = a + l * mm;
    const double xl = x[l];
    for (std::ptrdiff_t i = 0; i < mm; ++i) y[i] += al[i] * xl;
  }
  *ierr = 0;
  return 0;
}

std::int32_t ynmrmm(const std::int32_t* m, const std::int32_t* n, const double* a, double* b,
                    std::int32_t* ierr) {
  if (*m < 1 || *n < 1) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t mm = *m, nn = *n;
  for (std::ptrdiff_t j = 0; j < nn; ++j) {
    for (std::ptrdiff_t i = 0; i < mm; ++i) b[j + i * nn] = a[i + j * mm];  // B(j,i) = A(i,j)
  }
  *ierr = 0;
  return 0;
}

std::int32_t ynmtvv(const std::int32_t* n, const double* x, const double* d, double* y,
                    std::int32_t* ierr) {
  if (*n < 1) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t nn = *n;
  // By increasing index; a crossing pair (lower > upper, strict) stops at once, after that
  // pair is written and before any later one. Both bounds are read before either is
  // written, so y may be x.
  for (std::ptrdiff_t i = 0; i < nn; ++i) {
    const double lo = x[i] - d[i];
    const double hi = x[nn + i] + d[i];
    y[i] = lo;
    y[nn + i] = hi;
    if (lo > hi) return impl::fail(ierr, impl::kErrBadArg);
  }
  *ierr = 0;
  return 0;
}

std::int32_t ynvpvv(const std::int32_t* n, const double* u, const double* v, double* s,
                    std::int32_t* ierr) {
  if (*n < 1) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t nn = *n;
  // Left to right from the first term (no leading 0, so a single -0 term stays -0).
  double sum = u[0] * v[0];
  for (std::ptrdiff_t i = 1; i < nn; ++i) sum += u[i] * v[i];
  *s = sum;
  *ierr = 0;
  return 0;
}

std::int32_t ynvevv(const std::int32_t* n, const double* u, const double* v, double* w,
                    std::int32_t* ierr) {
  if (*n < 2) return impl::fail(ierr, impl::kErrBadArg);
  const std::ptrdiff_t nn = *n;
  // Pairs i < j in lexicographic order: u(i) v(j) - u(j) v(i).
  std::ptrdiff_t pos = 0;
  for (std::ptrdiff_t i = 0; i < nn - 1; ++i) {
    for (std::ptrdiff_t j = i + 1; j < nn; ++j) w[pos++] = u[i] * v[j] - u[j] * v[i];
  }
  *ierr = 0;
  return 0;
}

std::int32_t ynvvvv(const std::int32_t* n, const double* a, double* w, std::int32_t* ierr) {
  // (1) Arguments. Above order 21 the first minor already exceeds the determinant's
  // capacity: 4718 at once, without asking for workspace.
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kVvvvCapacity) return impl::fail(ierr, impl::kErrCapacity);
  auto A = [a, nn](std::int32_t i, std::int32_t j) { return a[(i - 1) + (j - 1) * nn]; };

  // (2) The single column turned a quarter turn counter-clockwise.
  if (nn == 2) {
    const double a11 = A(1, 1), a21 = A(2, 1);
    w[0] = -a21;
    w[1] = a11;
    *ierr = 0;
    return 0;
  }
  // (3) The cross product of the two columns.
  if (nn == 3) {
    const double a1 = A(1, 1), a2 = A(2, 1), a3 = A(3, 1);
    const double b1 = A(1, 2), b2 = A(2, 2), b3 = A(3, 2);
    w[0] = a2 * b3 - a3 * b2;
    w[1] = a3 * b1 - a1 * b3;
    w[2] = a1 * b2 - a2 * b1;
    *ierr = 0;
    return 0;
  }
  // (4)-(5) w(i) = (-1)^(i+1) det(A without row i), the minor keeping its rows in order.
  if (nn == 4) {
    const std::ptrdiff_t rows[4][3] = {{1, 2, 3}, {0, 2, 3}, {0, 1, 3}, {0, 1, 2}};
    for (int i = 0; i < 4; ++i) {
      const double minor = impl::det3_rows(a, 4, rows[i][0], rows[i][1], rows[i][2]);
      w[i] = i % 2 == 0 ? minor : -minor;
    }
    *ierr = 0;
    return 0;
  }
  // Orders 5 to 10: a local square of order n - 1; from 11 on, (n-1)^2 reals of workspace.
  const std::int32_t order = nn - 1;
  double local[(kVvvvLocal - 1) * (kVvvvLocal - 1)];
  double* minor = local;
  impl::WorkspaceBlock block;
  if (nn > kVvvvLocal) {
    if (!block.take(impl::kWsReal, order * order)) return impl::fail(ierr, impl::kErrWorkspace);
    minor = block.get<double>();
  }
  for (std::int32_t i = 1; i <= nn; ++i) {
    for (std::int32_t j = 1; j <= order; ++j) {
      std::int32_t row = 0;
      for (std::int32_t r = 1; r <= nn; ++r) {
        if (r != i) minor[row++ + (j - 1) * order] = A(r, j);
      }
    }
    double det = 0.0;
    // (6) A failure of the determinant ends the routine with its code; w partly written.
    if (ynmxmr(&order, minor, &det, ierr) == 1) return 1;
    w[i - 1] = i % 2 == 1 ? det : -det;
  }
  *ierr = 0;
  return 0;
}

}  // extern "C"
