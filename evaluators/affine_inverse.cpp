// evaluators/affine_inverse.cpp -- inverse of an affine map y = A x + b of dimension n:
// ynaitt. Column-major, leading dimension n; indices from 1 in the comments. No state.
#include <cstddef>
#include <cstdint>

#include "evaluators/evaluators_api.h"
#include "frame/status.h"
#include "linalg/linalg_api.h"

namespace {
constexpr std::int32_t kKindOrthogonal = 0;
constexpr std::int32_t kKindFirstInvalid = 2;  // kinds from here on are refused
}  // namespace

extern "C" std::int32_t ynaitt(const std::int32_t* n, const double* a, const double* b,
                               const std::int32_t* kind, double* m, double* c,
                               std::int32_t* ierr) {
  // (1) Arguments: n first, then the kind; negative kinds take the general path.
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  if (*kind >= kKindFirstInvalid) return impl::fail(ierr, impl::kErrCapacity);
  // (2)
  *ierr = 0;
  const std::ptrdiff_t ld = nn;
  if (*kind != kKindOrthogonal) {
    // (3) General: M = inverse of A; a failure keeps ynmimr's code and its outputs.
    if (ynmimr(n, a, m, ierr) == 1) return 1;
  } else {
    // (4) Orthogonal (not tested): M = transpose of A.
    for (std::ptrdiff_t j = 0; j < ld; ++j)
      for (std::ptrdiff_t i = 0; i < ld; ++i) m[i + j * ld] = a[j + i * ld];
  }
  // (5) c = -b(1) M(:,1), then c = c - b(j) M(:,j) for j = 2..n in that order.
  for (std::ptrdiff_t i = 0; i < ld; ++i) c[i] = -b[0] * m[i];
  for (std::ptrdiff_t j = 1; j < ld; ++j) {
    const double bj = b[j];
    for (std::ptrdiff_t i = 0; i < ld; ++i) c[i] = c[i] - bj * m[i + j * ld];
  }
  // (6)
  return 0;
}
