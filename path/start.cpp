// path/start.cpp -- start of an implicit path: wncini. Checks the start data in a fixed order
// (box, face pointing out, residual), orients the path along the start direction, rebuilds
// the march record and stores the first point.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "frame/tolerances.h"
#include "path/path_api.h"
#include "path/path_state.h"

extern "C" std::int32_t wncini(void* ctx, const std::int32_t* n, Orvq7PathFct fct,
                               const double* eps, const double* xd, const double* box,
                               const Orvq7PathOptions* options, const Orvq7PathLayout* layout,
                               const std::int32_t* /*pairs*/, Orvq7PathMarch* march,
                               Orvq7PathTables* tables, std::int32_t* itab, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > impl::kPathMaxN) return impl::fail(ierr, impl::kErrCapacity);
  const double* x0 = xd;
  const double* d0 = xd + nn;
  // (1) Step factor and tangent request.
  march->f = 1.0;
  march->treq = 2;
  // (2) Box, unknown by unknown: bounds in order and x0 inside (inclusive), then a face with
  // the start direction pointing out of the box.
  for (std::int32_t i = 0; i < nn; ++i) {
    const double lo = box[i], hi = box[nn + i];
    if (!(lo < hi && lo <= x0[i] && x0[i] <= hi)) return impl::fail(ierr, impl::kErrBadArg);
    if ((x0[i] == lo && d0[i] < 0.0) || (x0[i] == hi && d0[i] > 0.0)) {
      return impl::fail(ierr, impl::kErrPathAtStart);
    }
  }
  // (3) x0 on the curve: the sum of squared residuals, in equation order, at most eps (a NaN
  // sum is not on the curve).
  const std::int32_t one = 1, req_residuals = 1;
  double res[impl::kPathMaxN];
  if (fct(ctx, &one, x0, &req_residuals, res, ierr) == 1) return 1;
  double sum = 0.0;
  for (std::int32_t k = 0; k < nn - 1; ++k) sum += res[k] * res[k];
  if (!(sum <= *eps)) return impl::fail(ierr, impl::kErrBadArg);
  // (4) Tangent at x0, with the second derivative at order level 1.
  const std::int32_t order = options->order;
  if (order == 1) march->treq = 6;
  double tan[2 * impl::kPathMaxN];
  // Scale values s(i) = 2 / ((box(i,2) - box(i,1)) * sqrt(n)).
  double scale[impl::kPathMaxN];
  const double root_n = std::sqrt(static_cast<double>(nn));
  for (std::int32_t i = 0; i < nn; ++i) scale[i] = 2.0 / ((box[nn + i] - box[i]) * root_n);
  if (ynumde(ctx, n, fct, &one, x0, &march->treq, tan, ierr) == 1) {
    // (5) No tangent at x0 (4710) is no error: d0 stands for it, and at order level 1 the
    // scale values for the second block.
    if (*ierr != impl::kErrDegenerate) return 1;
    *ierr = 0;
    for (std::int32_t i = 0; i < nn; ++i) tan[i] = d0[i];
    if (order == 1) {
      for (std::int32_t i = 0; i < nn; ++i) tan[nn + i] = scale[i];
    }
  }
  // (6) Orientation: -1 when the computed tangent points against d0 (strict), else +1.
  double dot = 0.0;
  for (std::int32_t i = 0; i < nn; ++i) dot += tan[i] * d0[i];
  march->sign = dot < 0.0 ? -1 : 1;
  // (7) March record: the first prediction runs along d0 itself, not normalised.
  for (std::int32_t i = 0; i < nn; ++i) {
    march->x[i] = x0[i];
    march->t[i] = d0[i];
    march->tprev[i] = d0[i];
    march->c[i] = order == 1 ? tan[nn + i] : order == 2 ? scale[i] : 0.0;
  }
  march->h = impl::kHuge;
  march->hprev = impl::kHuge;
  march->g = 1.0;
  march->close_prev = 0.0;
  march->close = 0.0;
  // (8) The first point: counted, then stored in phase 0.
  march->nstored = 1;
  const std::int32_t accepted = 1, phase = 0;
  return wncflu(&phase, &accepted, options, layout, march, tables, itab, ierr);
}
