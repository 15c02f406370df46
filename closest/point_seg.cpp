// closest/point_seg.cpp -- nearest point of a segment to a point, dimension n: ynoapl.
// The segment is an (n, 2) array S1, S2; S(t) = S1 + t (S2 - S1). No state.
#include <cstdint>

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {
constexpr double kNegligible = 1e-15;  // degenerate squared length, inclusive
}  // namespace

extern "C" std::int32_t ynoapl(const std::int32_t* n, const double* x, const double* seg,
                               double* dist2, double* t, std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n;
  if (nn <= 0) return impl::fail(ierr, impl::kErrBadArg);
  const double* s1 = seg;
  const double* s2 = seg + nn;
  auto sq = [nn](auto v) {
    return impl::sum_terms(nn, [&](std::int32_t i) {
      const double c = v(i);
      return c * c;
    });
  };
  // (2) Behind S1 (strict): decided before the length test, so a degenerate segment with
  // p < 0 is answered from S1 with code 0.
  const double p =
      impl::sum_terms(nn, [=](std::int32_t i) { return (x[i] - s1[i]) * (s2[i] - s1[i]); });
  if (p < 0.0) {
    *dist2 = sq([=](std::int32_t i) { return x[i] - s1[i]; });
    *t = 0.0;
    *ierr = 0;
    return impl::kOk;
  }
  // (3) Degenerate segment: its midpoint, code 4717 (a usable answer).
  const double len2 = sq([=](std::int32_t i) { return s2[i] - s1[i]; });
  if (len2 <= kNegligible) {
    *dist2 = sq([=](std::int32_t i) { return x[i] - (s1[i] + s2[i]) / 2.0; });
    *t = 0.5;
    *ierr = impl::kErrNotUnique;
    return impl::kFailed;
  }
  // (4) Beyond S2 (strict), else (5) the projection; p = L gives t = 1 from the division.
  double tt, d;
  if (p > len2) {
    tt = 1.0;
    d = sq([=](std::int32_t i) { return x[i] - s2[i]; });
  } else {
    tt = p / len2;
    d = sq([=](std::int32_t i) { return (s1[i] + tt * (s2[i] - s1[i])) - x[i]; });
  }
  *dist2 = d;
  *t = tt;
  *ierr = 0;
  return impl::kOk;
}
