// linalg/quadratic_model.cpp -- local quadratic models: ynxxlv. The quadratic
// q(s) = a + s (d + e s) with value a and derivative d at s = 0 and value b at s = 1, and the
// extremes of each component over 0 <= s <= 1.
#include <cstdint>

#include "frame/status.h"
#include "linalg/linalg_api.h"

extern "C" std::int32_t ynxxlv(const std::int32_t* n, const double* a, const double* d,
                               const double* b, double* e, double* ext, double* sext,
                               std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  for (std::int32_t i = 0; i < nn; ++i) {
    // (2) e = (b - a) - d.
    const double ei = (b[i] - a[i]) - d[i];
    // (3) Candidates in increasing s: 0 (value a), the stationary point -d / (2e) when
    // strictly inside (0, 1), then 1 (value b itself). A later candidate replaces the extreme
    // only when strictly beyond it, so ties keep the smaller parameter.
    double lo = a[i], hi = a[i], slo = 0.0, shi = 0.0;
    if (ei != 0.0) {
      const double s = -d[i] / (2.0 * ei);
      if (0.0 < s && s < 1.0) {
        const double v = a[i] + s * (d[i] + ei * s);
        if (v < lo) lo = v, slo = s;
        if (v > hi) hi = v, shi = s;
      }
    }
    if (b[i] < lo) lo = b[i], slo = 1.0;
    if (b[i] > hi) hi = b[i], shi = 1.0;
    // (4) Outputs of component i.
    e[i] = ei;
    ext[i] = lo;
    ext[nn + i] = hi;
    sext[i] = slo;
    sext[nn + i] = shi;
  }
  *ierr = 0;
  return 0;
}
