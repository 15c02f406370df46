// closest/seg_seg.cpp -- closest pair of two segments in dimension n: ynoall.
// Segments are (n, 2) arrays of end points as columns; parameters t in [0, 1] with
// P(t) = (1 - t) P1 + t P2. Squared distances only. The body is instantiated for n = 2,
// n = 3 and n >= 4 so that the small dimensions unroll; the operations are the same.
#include <cmath>
#include <cstdint>

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {

constexpr double kNegligible = 1e-15;  // degenerate squared length and snap band, inclusive
constexpr double kParallel = 1e-12;    // parallel when |X| < (kParallel * S2) * S1, strict

struct Pair {
  double t1;
  double t2;
  std::int32_t code;
};

// A parameter within kNegligible of 0 becomes exactly 0, else within it of 1 exactly 1.
double snap(double t) {
  if (std::fabs(t) <= kNegligible) return 0.0;
  if (std::fabs(1.0 - t) <= kNegligible) return 1.0;
  return t;
}

bool in_unit(double t) { return t >= 0.0 && t <= 1.0; }  // inclusive; NaN is outside

// Dim is 2, 3, or 0 for any n >= 4.
template <int Dim>
std::int32_t closest_pair(std::int32_t n_arg, const double* seg1, const double* seg2,
                          double* dist2, double* t1_out, double* t2_out, std::int32_t* ierr) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  const double* p1 = seg1;
  const double* p2 = seg1 + n;
  const double* q1 = seg2;
  const double* q2 = seg2 + n;
  auto d1 = [=](std::int32_t i) { return p2[i] - p1[i]; };
  auto d2 = [=](std::int32_t i) { return q2[i] - q1[i]; };
  auto w = [=](std::int32_t i) { return p1[i] - q1[i]; };
  auto dot = [n](auto a, auto b) {
    return impl::sum_terms(n, [&](std::int32_t i) { return a(i) * b(i); });
  };

  // (2) Squared lengths, segment 2 first.
  const double s2 = dot(d2, d2);
  const double s1 = dot(d1, d1);

  Pair ans{0.0, 0.0, 0};
  if (s2 <= kNegligible || s1 <= kNegligible) {
    // (9) Degenerate segments (absolute test), code 4717 in every sub-case.
    ans = {0.5, 0.5, impl::kErrNotUnique};
    auto clamp01 = [](double t) {  // raised to 0 first, then lowered to 1; NaN stays
      if (t < 0.0) t = 0.0;
      if (t > 1.0) t = 1.0;
      return t;
    };
    if (s2 <= kNegligible && !(s1 <= kNegligible)) {
      ans.t1 = clamp01(dot([=](std::int32_t i) { return (q1[i] + q2[i]) / 2.0 - p1[i]; }, d1) /
                       s1);
    } else if (s1 <= kNegligible && !(s2 <= kNegligible)) {
      ans.t2 = clamp01(dot([=](std::int32_t i) { return (p1[i] + p2[i]) / 2.0 - q1[i]; }, d2) /
                       s2);
    }
  } else {
    // (4) X = |d1 x d2|^2 in the form of the dimension.
    double x;
    double c[3] = {0.0, 0.0, 0.0};  // d1 x d2 (n = 3), or its single component (n = 2)
    if constexpr (Dim == 2) {
      c[0] = d1(0) * d2(1) - d1(1) * d2(0);
      x = c[0] * c[0];
    } else if constexpr (Dim == 3) {
      c[0] = d1(1) * d2(2) - d1(2) * d2(1);
      c[1] = d1(2) * d2(0) - d1(0) * d2(2);
      c[2] = d1(0) * d2(1) - d1(1) * d2(0);
      x = (c[0] * c[0] + c[1] * c[1]) + c[2] * c[2];
    } else {
      x = impl::sum_pair_squares(n, d1, d2);
    }

    if (std::fabs(x) < kParallel * s2 * s1) {  // strict; (1e-12 * S2) * S1
      // (8) Parallel: project each segment's end points on the other's line.
      const double tp1 = dot(d2, w) / s2;
      const double tp2 = dot(d2, [=](std::int32_t i) { return p2[i] - q1[i]; }) / s2;
      const double sq1 = dot(d1, [=](std::int32_t i) { return q1[i] - p1[i]; }) / s1;
      const double sq2 = dot(d1, [=](std::int32_t i) { return q2[i] - p1[i]; }) / s1;
      double smax, smin, umax, umin;
      if (sq2 >= sq1) {  // inclusive: a tie makes Q2 the upper end
        smax = sq2, umax = 1.0, smin = sq1, umin = 0.0;
      } else {
        smax = sq1, umax = 0.0, smin = sq2, umin = 1.0;
      }
      if (smax <= 0.0) {
        ans = {0.0, umax, 0};  // segment 2 wholly before P1
      } else if (smin >= 1.0) {
        ans = {1.0, umin, 0};  // segment 2 wholly beyond P2
      } else if (smax <= 1.0) {  // overlap: the middle of it, not unique
        ans = smin >= 0.0 ? Pair{(sq1 + sq2) / 2.0, 0.5, impl::kErrNotUnique}
                          : Pair{smax / 2.0, (tp1 + umax) / 2.0, impl::kErrNotUnique};
      } else {
        ans = smin >= 0.0 ? Pair{(smin + 1.0) / 2.0, (tp2 + umin) / 2.0, impl::kErrNotUnique}
                          : Pair{0.5, (tp1 + tp2) / 2.0, impl::kErrNotUnique};
      }
    } else {
      // (5) Parameters of the two infinite lines.
      double b = 0.0, d = 0.0, e = 0.0;
      bool have_bde = false;
      auto form_bde = [&] {
        b = dot(d1, d2);
        d = dot(d2, w);
        e = dot(d1, w);
        have_bde = true;
      };
      if constexpr (Dim == 2) {
        ans.t1 = snap(((d2(0) * w(1) - d2(1) * w(0)) * c[0]) / x);
        ans.t2 = snap(((d1(0) * w(1) - d1(1) * w(0)) * c[0]) / x);
      } else if constexpr (Dim == 3) {
        const double k0 = d2(1) * w(2) - d2(2) * w(1);  // d2 x w
        const double k1 = d2(2) * w(0) - d2(0) * w(2);
        const double k2 = d2(0) * w(1) - d2(1) * w(0);
        const double l0 = d1(1) * w(2) - d1(2) * w(1);  // d1 x w
        const double l1 = d1(2) * w(0) - d1(0) * w(2);
        const double l2 = d1(0) * w(1) - d1(1) * w(0);
        ans.t1 = snap(((k0 * c[0] + k1 * c[1]) + k2 * c[2]) / x);
        ans.t2 = snap(((l0 * c[0] + l1 * c[1]) + l2 * c[2]) / x);
      } else {
        form_bde();  // normal equations; no snapping in this dimension
        ans.t1 = (b * d - s2 * e) / x;
        ans.t2 = (s1 * d - b * e) / x;
      }

      // (6) Interior pair, inclusive on both parameters.
      if (!(in_unit(ans.t1) && in_unit(ans.t2))) {
        // (7) Boundary search; the first check that holds gives the answer.
        if (!have_bde) form_bde();
        bool found = true;
        if (e - b * d / s2 >= 0.0) {  // (7.1) edge t1 = 0
          const double u = d / s2;
          found = in_unit(u);
          if (found) ans = {0.0, u, 0};
        } else if (e - b >= 0.0 && d - s2 >= 0.0) {
          ans = {0.0, 1.0, 0};
        } else {
          found = false;
        }
        if (!found && e >= 0.0 && -d >= 0.0) {  // (7.2) corner (0, 0)
          ans = {0.0, 0.0, 0};
          found = true;
        }
        if (!found) {  // (7.3) edge t1 = 1
          if (-(e + s1) + b * (d + b) / s2 >= 0.0) {
            const double u = (d + b) / s2;
            found = in_unit(u);
            if (found) ans = {1.0, u, 0};
          } else if (b - (e + s1) >= 0.0 && d - s2 + b >= 0.0) {
            ans = {1.0, 1.0, 0};
            found = true;
          }
        }
        if (!found && -(e + s1) >= 0.0 && -(d + b) >= 0.0) {  // (7.4) corner (1, 0)
          ans = {1.0, 0.0, 0};
          found = true;
        }
        if (!found) {  // (7.5) edge t2 = 0
          if (b * e / s1 - d >= 0.0) {
            const double u = e / (-s1);
            found = in_unit(u);
            if (found) ans = {u, 0.0, 0};
          } else if (e >= 0.0 && -d >= 0.0) {
            ans = {0.0, 0.0, 0};
            found = true;
          }
        }
        // (7.6) Deliberate: repeats the corner test of (7.4).
        if (!found && -(e + s1) >= 0.0 && -(d + b) >= 0.0) {
          ans = {1.0, 0.0, 0};
          found = true;
        }
        if (!found) {  // (7.7) edge t2 = 1
          if (-b * (e - b) / s1 + (d - s2) >= 0.0) {
            const double u = (e - b) / (-s1);
            found = in_unit(u);
            if (found) ans = {u, 1.0, 0};
          } else if (e - b >= 0.0 && d - s2 >= 0.0) {
            ans = {0.0, 1.0, 0};
            found = true;
          }
        }
        if (!found && b - (e + s1) >= 0.0 && b + (d - s2) >= 0.0) {  // (7.8) corner (1, 1)
          ans = {1.0, 1.0, 0};
          found = true;
        }
        if (!found) {
          // (7.9) Fallback: nearest end-point pair in the order (0,0), (0,1), (1,0), (1,1);
          // a later pair wins only when strictly nearer. Step (10) is not run.
          auto sq = [=](const double* a, const double* c2) {
            return impl::sum_terms(n, [=](std::int32_t i) {
              const double v = a[i] - c2[i];
              return v * v;
            });
          };
          const double cand[4] = {sq(p1, q1), sq(p1, q2), sq(p2, q1), sq(p2, q2)};
          int best = 0;
          for (int k = 1; k < 4; ++k) {
            if (cand[k] < cand[best]) best = k;
          }
          *dist2 = cand[best];
          *t1_out = best < 2 ? 0.0 : 1.0;
          *t2_out = (best & 1) ? 1.0 : 0.0;
          *ierr = 0;
          return impl::kOk;
        }
      }
    }
  }

  // (10) Squared distance of the chosen pair.
  const double a1 = 1.0 - ans.t1;
  const double a2 = 1.0 - ans.t2;
  *dist2 = impl::sum_terms(n, [&](std::int32_t i) {
    const double v = ((a1 * p1[i] + ans.t1 * p2[i]) - a2 * q1[i]) - ans.t2 * q2[i];
    return v * v;
  });
  *t1_out = ans.t1;
  *t2_out = ans.t2;
  *ierr = ans.code;
  return ans.code == 0 ? impl::kOk : impl::kFailed;
}

}  // namespace

extern "C" std::int32_t ynoall(const std::int32_t* n, const double* seg1, const double* seg2,
                               double* dist2, double* t1, double* t2, std::int32_t* ierr) {
  // (1) Arguments.
  if (*n < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (*n == 2) return closest_pair<2>(2, seg1, seg2, dist2, t1, t2, ierr);
  if (*n == 3) return closest_pair<3>(3, seg1, seg2, dist2, t1, t2, ierr);
  return closest_pair<0>(*n, seg1, seg2, dist2, t1, t2, ierr);
}
