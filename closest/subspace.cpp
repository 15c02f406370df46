// closest/subspace.cpp -- affine frames of dimension n: projection of a point with its frame
// coordinates and squared distance (ynoaot), point from frame coordinates (ynraoo), frame
// coordinates of several points (ynjont). The frame is an origin Y and k directions, the
// columns of an (n, k) array, expected orthonormal and never checked. No state.
#include <cstdint>

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {

// Coordinate of (P - Y) along direction dir: sum over l of (P_l - Y_l) dir_l, by increasing l.
double frame_coordinate(std::int32_t n, const double* p, const double* y, const double* dir) {
  return impl::sum_terms(n, [=](std::int32_t l) { return (p[l] - y[l]) * dir[l]; });
}

bool bad_frame(std::int32_t n, std::int32_t k) { return n <= 0 || k < 0 || k > n; }

}  // namespace

extern "C" std::int32_t ynoaot(const std::int32_t* n, const std::int32_t* k, const double* x,
                               const double* y, const double* u, double* dist2, double* c,
                               std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n, kk = *k;
  if (bad_frame(nn, kk)) return impl::fail(ierr, impl::kErrBadArg);
  // (3) Coordinates, written straight into c (no failure can follow).
  for (std::int32_t j = 0; j < kk; ++j) c[j] = frame_coordinate(nn, x, y, impl::column(u, nn, j));
  // (4) Residual component by component, the directions subtracted in order of j.
  *dist2 = impl::sum_terms(nn, [=](std::int32_t i) {
    double r = x[i] - y[i];
    for (std::int32_t j = 0; j < kk; ++j) r = r - c[j] * impl::column(u, nn, j)[i];
    return r * r;
  });
  *ierr = 0;
  return impl::kOk;
}

extern "C" std::int32_t ynraoo(const std::int32_t* n, const std::int32_t* k, const double* c,
                               const double* y, const double* u, double* x, std::int32_t* ierr) {
  const std::int32_t nn = *n, kk = *k;
  if (bad_frame(nn, kk)) return impl::fail(ierr, impl::kErrBadArg);
  // x = Y, then c_j U(:, j) added for j = 1 .. k in order; x may be y itself.
  for (std::int32_t i = 0; i < nn; ++i) {
    double v = y[i];
    for (std::int32_t j = 0; j < kk; ++j) v = v + c[j] * impl::column(u, nn, j)[i];
    x[i] = v;
  }
  *ierr = 0;
  return impl::kOk;
}

extern "C" std::int32_t ynjont(const std::int32_t* n, const std::int32_t* m, const double* pts,
                               const std::int32_t* k, const double* y, const double* u,
                               double* coords, std::int32_t* ierr) {
  // Only n and m are checked; k < 1 leaves coords unwritten.
  const std::int32_t nn = *n, mm = *m, kk = *k;
  if (nn <= 0 || mm <= 0) return impl::fail(ierr, impl::kErrBadArg);
  for (std::int32_t j = 0; j < mm; ++j) {
    const double* p = impl::column(pts, nn, j);
    double* out = coords + static_cast<std::ptrdiff_t>(j) * (kk > 0 ? kk : 0);
    for (std::int32_t i = 0; i < kk; ++i)
      out[i] = frame_coordinate(nn, p, y, impl::column(u, nn, i));
  }
  *ierr = 0;
  return impl::kOk;
}
