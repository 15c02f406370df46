// closest/seg_line.cpp -- closest pair of a segment and an infinite line, dimension n:
// ynoal2. The segment is (P1, P2) as columns, the line (U, O) with U of unit length (never
// divided by: the caller's duty). No state.
#include <cmath>
#include <cstdint>

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {
constexpr double kNegligible = 1e-15;  // degenerate squared length, inclusive
constexpr double kParallel = 1e-12;    // parallel when |X| < kParallel * S1, strict
}  // namespace

extern "C" std::int32_t ynoal2(const std::int32_t* n, const double* seg, const double* line,
                               double* dist2, double* t, double* s, std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  const double* p1 = seg;
  const double* p2 = seg + nn;
  const double* dir = line;
  const double* org = line + nn;
  auto d1 = [=](std::int32_t i) { return p2[i] - p1[i]; };
  auto dot = [nn](auto a, auto b) {
    return impl::sum_terms(nn, [&](std::int32_t i) { return a(i) * b(i); });
  };
  auto u = [=](std::int32_t i) { return dir[i]; };

  // Projection of the point with offsets off(i) = point_i - O_i on the line, and its squared
  // distance |off - s U|^2.
  auto project = [&](auto off, double* s_out, double* d_out) {
    const double ss = dot(off, u);
    *s_out = ss;
    *d_out = impl::sum_terms(nn, [&](std::int32_t i) {
      const double v = off(i) - ss * dir[i];
      return v * v;
    });
  };

  // (2) Degenerate segment (absolute), then (3) the parallel test.
  const double s1 = dot(d1, d1);
  bool unique = !(s1 <= kNegligible);
  double b = 0.0, e = 0.0, f = 0.0, x = 0.0;
  if (unique) {
    auto o_p1 = [=](std::int32_t i) { return org[i] - p1[i]; };
    b = dot(d1, u);
    e = dot(d1, o_p1);
    f = dot(u, o_p1);
    x = impl::sum_pair_squares(nn, d1, u);
    unique = !(std::fabs(x) < kParallel * s1);
  }
  double tt, ss, d;
  if (!unique) {
    // (7) Degenerate or parallel: the pair at the segment's midpoint M, code 4717.
    tt = 0.5;
    project([=](std::int32_t i) { return (p1[i] + p2[i]) / 2.0 - org[i]; }, &ss, &d);
  } else {
    // (4) Minimiser over both unbounded parameters.
    tt = (e - b * f) / x;
    ss = (b * e - f * s1) / x;
    if (tt >= 0.0 && tt <= 1.0) {
      // (5) Inside the segment.
      const double a1 = 1.0 - tt;
      d = impl::sum_terms(nn, [&](std::int32_t i) {
        const double v = ((a1 * p1[i] + tt * p2[i]) - org[i]) - ss * dir[i];
        return v * v;
      });
    } else if (tt > 1.0) {
      // (6) Clamped to the end passed, re-projected on the line; the answer is final.
      tt = 1.0;
      project([=](std::int32_t i) { return p2[i] - org[i]; }, &ss, &d);
    } else {  // t < 0, and a NaN t
      tt = 0.0;
      project([=](std::int32_t i) { return p1[i] - org[i]; }, &ss, &d);
    }
  }
  *dist2 = d;
  *t = tt;
  *s = ss;
  *ierr = unique ? 0 : impl::kErrNotUnique;
  return unique ? impl::kOk : impl::kFailed;
}
