// closest/seg_seg.cpp -- closest pair of two segments in dimension n: ynoall.
// Segments are (n, 2) arrays of end points as columns; parameters t in [0, 1] with
// P(t) = (1 - t) P1 + t P2. Squared distances only. Every sum over components starts from
// the first term and adds the others by increasing index.
// Notation: d1 = P2 - P1, d2 = Q2 - Q1, w = P1 - Q1, S1 = |d1|^2, S2 = |d2|^2, b = d1.d2,
// d = d2.w, e = d1.w, X = |d1 x d2|^2.
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

// The end points, addressed by component.
struct Ends {
  const double *p1, *p2, *q1, *q2;
};

// Sum over the n components of term(i), in the family's order.
template <class Term>
double sum_n(std::int32_t n, Term term) {
  return impl::sum_terms(n, term);
}

// A parameter within kNegligible of 0 becomes exactly 0, else within it of 1 exactly 1.
double snap(double t) {
  if (std::fabs(t) <= kNegligible) return 0.0;
  if (std::fabs(1.0 - t) <= kNegligible) return 1.0;
  return t;
}

bool in_unit(double t) { return t >= 0.0 && t <= 1.0; }  // inclusive; NaN is outside

// (9) Degenerate segments (either squared length <= kNegligible), code 4717: the midpoint
// of a degenerate segment, projected on the other one when that one is not degenerate, the
// projection clamped to [0, 1] (raised to 0 first, then lowered to 1; NaN stays).
[[gnu::noinline]] Pair degenerate_pair(std::int32_t n, const Ends& e, double s1, double s2) {
  auto clamp01 = [](double t) {
    if (t < 0.0) t = 0.0;
    if (t > 1.0) t = 1.0;
    return t;
  };
  Pair ans{0.5, 0.5, impl::kErrNotUnique};
  if (s2 <= kNegligible && !(s1 <= kNegligible)) {
    ans.t1 = clamp01(sum_n(n,
                           [&](std::int32_t i) {
                             return ((e.q1[i] + e.q2[i]) / 2.0 - e.p1[i]) * (e.p2[i] - e.p1[i]);
                           }) /
                     s1);
  } else if (s1 <= kNegligible && !(s2 <= kNegligible)) {
    ans.t2 = clamp01(sum_n(n,
                           [&](std::int32_t i) {
                             return ((e.p1[i] + e.p2[i]) / 2.0 - e.q1[i]) * (e.q2[i] - e.q1[i]);
                           }) /
                     s2);
  }
  return ans;
}

// (8) Parallel segments: each segment's end points projected on the other's line.
template <int Dim>
[[gnu::noinline]] Pair parallel_pair(std::int32_t n_arg, const Ends& e, double s1, double s2) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  auto along = [&](const double* dir0, const double* dir1, const double* from, const double* to) {
    return sum_n(n, [&](std::int32_t i) { return (dir1[i] - dir0[i]) * (to[i] - from[i]); });
  };
  const double tp1 = along(e.q1, e.q2, e.q1, e.p1) / s2;  // d2.(P1 - Q1) / S2
  const double tp2 = along(e.q1, e.q2, e.q1, e.p2) / s2;  // d2.(P2 - Q1) / S2
  const double sq1 = along(e.p1, e.p2, e.p1, e.q1) / s1;  // d1.(Q1 - P1) / S1
  const double sq2 = along(e.p1, e.p2, e.p1, e.q2) / s1;  // d1.(Q2 - P1) / S1
  double smax, smin, umax, umin;
  if (sq2 >= sq1) {  // inclusive: a tie makes Q2 the upper end
    smax = sq2, umax = 1.0, smin = sq1, umin = 0.0;
  } else {
    smax = sq1, umax = 0.0, smin = sq2, umin = 1.0;
  }
  if (smax <= 0.0) return {0.0, umax, 0};  // segment 2 wholly before P1
  if (smin >= 1.0) return {1.0, umin, 0};  // segment 2 wholly beyond P2
  // The projections overlap: the middle of the overlap, not unique.
  if (smax <= 1.0) {
    return smin >= 0.0 ? Pair{(sq1 + sq2) / 2.0, 0.5, impl::kErrNotUnique}
                       : Pair{smax / 2.0, (tp1 + umax) / 2.0, impl::kErrNotUnique};
  }
  return smin >= 0.0 ? Pair{(smin + 1.0) / 2.0, (tp2 + umin) / 2.0, impl::kErrNotUnique}
                     : Pair{0.5, (tp1 + tp2) / 2.0, impl::kErrNotUnique};
}

// (7.1)-(7.8) Boundary search: the checks in their fixed order, the first that holds giving
// the answer. Each edge check tests the derivative across the edge at the edge's own
// minimiser (and, only when that test fails, the edge's far corner); each corner check that
// both derivatives point outward. false when none holds.
bool boundary_search(double s1, double s2, double b, double d, double e, Pair* ans) {
  // (7.1) Edge t1 = 0, else corner (0, 1).
  if (e - b * d / s2 >= 0.0) {
    const double u = d / s2;
    if (in_unit(u)) return *ans = {0.0, u, 0}, true;
  } else if (e - b >= 0.0 && d - s2 >= 0.0) {
    return *ans = {0.0, 1.0, 0}, true;
  }
  // (7.2) Corner (0, 0).
  if (e >= 0.0 && -d >= 0.0) return *ans = {0.0, 0.0, 0}, true;
  // (7.3) Edge t1 = 1, else corner (1, 1).
  if (-(e + s1) + b * (d + b) / s2 >= 0.0) {
    const double u = (d + b) / s2;
    if (in_unit(u)) return *ans = {1.0, u, 0}, true;
  } else if (b - (e + s1) >= 0.0 && d - s2 + b >= 0.0) {
    return *ans = {1.0, 1.0, 0}, true;
  }
  // (7.4) Corner (1, 0).
  if (-(e + s1) >= 0.0 && -(d + b) >= 0.0) return *ans = {1.0, 0.0, 0}, true;
  // (7.5) Edge t2 = 0, else corner (0, 0).
  if (b * e / s1 - d >= 0.0) {
    const double u = e / (-s1);
    if (in_unit(u)) return *ans = {u, 0.0, 0}, true;
  } else if (e >= 0.0 && -d >= 0.0) {
    return *ans = {0.0, 0.0, 0}, true;
  }
  // (7.6) Deliberate: repeats the corner test of (7.4).
  if (-(e + s1) >= 0.0 && -(d + b) >= 0.0) return *ans = {1.0, 0.0, 0}, true;
  // (7.7) Edge t2 = 1, else corner (0, 1).
  if (-b * (e - b) / s1 + (d - s2) >= 0.0) {
    const double u = (e - b) / (-s1);
    if (in_unit(u)) return *ans = {u, 1.0, 0}, true;
  } else if (e - b >= 0.0 && d - s2 >= 0.0) {
    return *ans = {0.0, 1.0, 0}, true;
  }
  // (7.8) Corner (1, 1).
  if (b - (e + s1) >= 0.0 && b + (d - s2) >= 0.0) return *ans = {1.0, 1.0, 0}, true;
  return false;
}

// (7.9) Fallback when no check holds (rounding, or NaN input): the nearest end-point pair in
// the order (0,0), (0,1), (1,0), (1,1), a later pair only when strictly nearer; its squared
// distance is the answer (step (10) is not run).
[[gnu::noinline]] void end_pairs(std::int32_t n, const Ends& e, double* dist2, double* t1,
                                 double* t2) {
  auto sq = [n](const double* a, const double* c) {
    return sum_n(n, [=](std::int32_t i) {
      const double v = a[i] - c[i];
      return v * v;
    });
  };
  const double cand[4] = {sq(e.p1, e.q1), sq(e.p1, e.q2), sq(e.p2, e.q1), sq(e.p2, e.q2)};
  int best = 0;
  for (int k = 1; k < 4; ++k) {
    if (cand[k] < cand[best]) best = k;
  }
  *dist2 = cand[best];
  *t1 = best < 2 ? 0.0 : 1.0;
  *t2 = (best & 1) ? 1.0 : 0.0;
}

// (10) Squared distance of the chosen pair, sum over i of
// ((((1 - t1) P1i + t1 P2i) - (1 - t2) Q1i) - t2 Q2i)^2, and the outputs.
template <int Dim>
std::int32_t finish(std::int32_t n_arg, const Ends& e, const Pair& ans, double* dist2, double* t1,
                    double* t2, std::int32_t* ierr) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  const double a1 = 1.0 - ans.t1;
  const double a2 = 1.0 - ans.t2;
  *dist2 = sum_n(n, [&](std::int32_t i) {
    const double v = ((a1 * e.p1[i] + ans.t1 * e.p2[i]) - a2 * e.q1[i]) - ans.t2 * e.q2[i];
    return v * v;
  });
  *t1 = ans.t1;
  *t2 = ans.t2;
  *ierr = ans.code;
  return ans.code == 0 ? impl::kOk : impl::kFailed;
}

// n = 2 or 3 (Dim): X and the line parameters in closed form with cross products, the
// parameters snapped; b, d, e formed only for the boundary search.
template <int Dim>
[[gnu::noinline]] std::int32_t closest_pair_small(const Ends& ends, double* dist2, double* t1,
                                                  double* t2, std::int32_t* ierr) {
  constexpr std::int32_t n = Dim;
  const double *p1 = ends.p1, *p2 = ends.p2, *q1 = ends.q1, *q2 = ends.q2;
  auto d1 = [=](std::int32_t i) { return p2[i] - p1[i]; };
  auto d2 = [=](std::int32_t i) { return q2[i] - q1[i]; };
  auto w = [=](std::int32_t i) { return p1[i] - q1[i]; };
  auto dot = [](auto a, auto b) { return sum_n(n, [&](std::int32_t i) { return a(i) * b(i); }); };

  // (2) Squared lengths, segment 2 first; (3) degenerate.
  const double s2 = dot(d2, d2);
  const double s1 = dot(d1, d1);
  if (s2 <= kNegligible || s1 <= kNegligible) {
    return finish<Dim>(n, ends, degenerate_pair(n, ends, s1, s2), dist2, t1, t2, ierr);
  }
  // (4) X: the square of the scalar cross product (n = 2), or (c0^2 + c1^2) + c2^2 of the
  // vector product c = d1 x d2 (n = 3); parallel when |X| < (1e-12 S2) S1, strict.
  double x, c0, c1 = 0.0, c2 = 0.0;
  if constexpr (Dim == 2) {
    c0 = d1(0) * d2(1) - d1(1) * d2(0);
    x = c0 * c0;
  } else {
    c0 = d1(1) * d2(2) - d1(2) * d2(1);
    c1 = d1(2) * d2(0) - d1(0) * d2(2);
    c2 = d1(0) * d2(1) - d1(1) * d2(0);
    x = (c0 * c0 + c1 * c1) + c2 * c2;
  }
  if (std::fabs(x) < kParallel * s2 * s1) {
    return finish<Dim>(n, ends, parallel_pair<Dim>(n, ends, s1, s2), dist2, t1, t2, ierr);
  }
  // (5) t1 = ((d2 x w).c) / X and t2 = ((d1 x w).c) / X, each then snapped.
  Pair ans{0.0, 0.0, 0};
  if constexpr (Dim == 2) {
    ans.t1 = snap(((d2(0) * w(1) - d2(1) * w(0)) * c0) / x);
    ans.t2 = snap(((d1(0) * w(1) - d1(1) * w(0)) * c0) / x);
  } else {
    const double k0 = d2(1) * w(2) - d2(2) * w(1);
    const double k1 = d2(2) * w(0) - d2(0) * w(2);
    const double k2 = d2(0) * w(1) - d2(1) * w(0);
    const double l0 = d1(1) * w(2) - d1(2) * w(1);
    const double l1 = d1(2) * w(0) - d1(0) * w(2);
    const double l2 = d1(0) * w(1) - d1(1) * w(0);
    ans.t1 = snap(((k0 * c0 + k1 * c1) + k2 * c2) / x);
    ans.t2 = snap(((l0 * c0 + l1 * c1) + l2 * c2) / x);
  }
  // (6) Interior pair, inclusive on both parameters; else (7) the boundary.
  if (!(in_unit(ans.t1) && in_unit(ans.t2)) &&
      !boundary_search(s1, s2, dot(d1, d2), dot(d2, w), dot(d1, w), &ans)) {
    end_pairs(n, ends, dist2, t1, t2);
    *ierr = 0;
    return impl::kOk;
  }
  return finish<Dim>(n, ends, ans, dist2, t1, t2, ierr);
}

constexpr std::int32_t kCached = 32;  // n up to this keeps d1 and d2 in arrays for X

// Sum of (d1i d2j - d1j d2i)^2 over the pairs i < j, i outer, from arrays of d1 and d2,
// starting from the pair (0, 1). With n fixed at compile time (Dim > 0) the loops unroll
// completely; otherwise the squares of the pairs (i, j), (i, j + 1) are formed side by side
// and then added one at a time in the order of the pairs.
template <int Dim>
double pair_squares(std::int32_t n_arg, const double* a1, const double* a2) {
  const double c01 = a1[0] * a2[1] - a1[1] * a2[0];
  double s = c01 * c01;
  if constexpr (Dim > 0) {
#pragma GCC unroll 16
    for (std::int32_t i = 0; i + 1 < Dim; ++i) {
#pragma GCC unroll 16
      for (std::int32_t j = (i == 0 ? 2 : i + 1); j < Dim; ++j) {
        const double c = a1[i] * a2[j] - a1[j] * a2[i];
        s += c * c;
      }
    }
    (void)n_arg;
  } else {
    typedef double V2 __attribute__((vector_size(16)));
    const std::int32_t n = n_arg;
    for (std::int32_t i = 0; i + 1 < n; ++i) {
      const V2 ai = {a1[i], a1[i]}, bi = {a2[i], a2[i]};
      std::int32_t j = i == 0 ? 2 : i + 1;
      for (; j + 2 <= n; j += 2) {
        V2 aj, bj;
        __builtin_memcpy(&aj, a1 + j, sizeof aj);
        __builtin_memcpy(&bj, a2 + j, sizeof bj);
        const V2 c = ai * bj - aj * bi;
        const V2 sq = c * c;
        s += sq[0];
        s += sq[1];
      }
      if (j < n) {
        const double c = a1[i] * a2[j] - a1[j] * a2[i];
        s += c * c;
      }
    }
  }
  return s;
}

// n >= 4: X summed over the index pairs, the line parameters from the normal equations,
// never snapped. The five sums S1, S2, b, d, e run in one pass over the components, each in
// its own order; d1 and d2 are kept in arrays for X when n <= kCached. Dim fixes n at
// compile time for the small dimensions (0: n as given).
template <int Dim>
[[gnu::noinline]] std::int32_t closest_pair_general(std::int32_t n_arg, const Ends& ends,
                                                    double* dist2, double* t1, double* t2,
                                                    std::int32_t* ierr) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  const double *p1 = ends.p1, *p2 = ends.p2, *q1 = ends.q1, *q2 = ends.q2;
  double a1[kCached], a2[kCached];
  const bool cached = n <= kCached;
  double s1 = 0.0, s2 = 0.0, b = 0.0, d = 0.0, e = 0.0;
#pragma GCC unroll 16
  for (std::int32_t i = 0; i < n; ++i) {
    const double u = p2[i] - p1[i], v = q2[i] - q1[i], w = p1[i] - q1[i];
    if (cached) a1[i] = u, a2[i] = v;
    if (i == 0) {
      s2 = v * v, s1 = u * u, b = u * v, d = v * w, e = u * w;
    } else {
      s2 += v * v, s1 += u * u, b += u * v, d += v * w, e += u * w;
    }
  }
  // (3) Degenerate.
  if (s2 <= kNegligible || s1 <= kNegligible) {
    return finish<Dim>(n, ends, degenerate_pair(n, ends, s1, s2), dist2, t1, t2, ierr);
  }
  // (4) X over the pairs; parallel when |X| < (1e-12 S2) S1, strict.
  const double x = cached ? pair_squares<Dim>(n, a1, a2)
                          : impl::sum_pair_squares(
                                n, [=](std::int32_t i) { return p2[i] - p1[i]; },
                                [=](std::int32_t i) { return q2[i] - q1[i]; });
  if (std::fabs(x) < kParallel * s2 * s1) {
    return finish<Dim>(n, ends, parallel_pair<Dim>(n, ends, s1, s2), dist2, t1, t2, ierr);
  }
  // (5) Normal equations.
  Pair ans{(b * d - s2 * e) / x, (s1 * d - b * e) / x, 0};
  // (6) Interior pair, inclusive; else (7) the boundary.
  if (!(in_unit(ans.t1) && in_unit(ans.t2)) && !boundary_search(s1, s2, b, d, e, &ans)) {
    end_pairs(n, ends, dist2, t1, t2);
    *ierr = 0;
    return impl::kOk;
  }
  return finish<Dim>(n, ends, ans, dist2, t1, t2, ierr);
}

}  // namespace

extern "C" std::int32_t ynoall(const std::int32_t* n, const double* seg1, const double* seg2,
                               double* dist2, double* t1, double* t2, std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  const Ends ends{seg1, seg1 + nn, seg2, seg2 + nn};
  if (nn == 2) return closest_pair_small<2>(ends, dist2, t1, t2, ierr);
  if (nn == 3) return closest_pair_small<3>(ends, dist2, t1, t2, ierr);
  switch (nn) {
    case 4:
      return closest_pair_general<4>(4, ends, dist2, t1, t2, ierr);
    case 5:
      return closest_pair_general<5>(5, ends, dist2, t1, t2, ierr);
    case 6:
      return closest_pair_general<6>(6, ends, dist2, t1, t2, ierr);
    case 7:
      return closest_pair_general<7>(7, ends, dist2, t1, t2, ierr);
    case 8:
      return closest_pair_general<8>(8, ends, dist2, t1, t2, ierr);
    default:
      return closest_pair_general<0>(nn, ends, dist2, t1, t2, ierr);
  }
}
