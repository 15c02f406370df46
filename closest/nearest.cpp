// closest/nearest.cpp -- nearest point of a point list or of the polyline through it, in
// dimension n: ynoaon, and its bounded form with a box filter, ynoaod.
//
// Points are the columns of an (n, m) array; segment k joins points k and k + 1. Candidates
// are examined by increasing number and one is taken only when strictly nearer than the
// best so far, so ties keep the lower number.
//
// Speed (dimension 3): candidates are screened four at a time, never changing a result.
//   - Point mode computes the four squared distances side by side, each in its own fixed
//     order ((dx^2 + dy^2) + dz^2), and keeps per lane the strictly smaller distance with
//     its number; merging the lanes by (distance, number) gives what the sequential scan
//     gives, since that scan keeps the first number that reaches the smallest distance.
//   - Polyline mode computes for four segments a lower bound of the squared distance that
//     the per-segment rule would compute, and runs the rule, in order, only for segments
//     whose bound does not exceed the best so far. See segment_lower_bound.
// No state: everything is per call.
#include <cmath>
#include <cstdint>

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {

constexpr double kNegligible = 1e-15;      // degenerate squared length, inclusive
constexpr double kStartBest = 1e60;        // starting best distance of ynoaon
constexpr std::int32_t kPolyline = 8467;   // mode >= kPolyline selects the polyline

// Best candidate so far. index 0: none taken; u: parameter of the best segment (per call,
// starting at 0).
struct Best {
  double d;
  std::int64_t index;
  double u;
};

// ---- Per-candidate rules (Dim 3 fixes n = 3 at compile time; 0 takes n as given) ----

template <int Dim>
inline double point_distance(std::int32_t n_arg, const double* p, const double* x) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  return impl::sum_terms(n, [=](std::int32_t i) {
    const double v = p[i] - x[i];
    return v * v;
  });
}

// Segment from a to b, point x: p = (X - A).(B - A), L = |B - A|^2, tested in this order:
// degenerate (L <= 1e-15) the midpoint; p < 0 A; p > L B; otherwise the projection.
template <int Dim>
inline double segment_distance(std::int32_t n_arg, const double* x, const double* a,
                               const double* b, double* u) {
  const std::int32_t n = Dim > 0 ? Dim : n_arg;
  auto sq = [n](auto v) {
    return impl::sum_terms(n, [&](std::int32_t i) {
      const double c = v(i);
      return c * c;
    });
  };
  const double p = impl::sum_terms(n, [=](std::int32_t i) { return (x[i] - a[i]) * (b[i] - a[i]); });
  const double len2 = sq([=](std::int32_t i) { return b[i] - a[i]; });
  if (len2 <= kNegligible) {
    *u = 0.5;
    return sq([=](std::int32_t i) { return (a[i] + b[i]) / 2.0 - x[i]; });
  }
  if (p < 0.0) {
    *u = 0.0;
    return sq([=](std::int32_t i) { return a[i] - x[i]; });
  }
  if (p > len2) {
    *u = 1.0;
    return sq([=](std::int32_t i) { return b[i] - x[i]; });
  }
  const double uu = p / len2;
  *u = uu;
  return sq([=](std::int32_t i) { return (a[i] + uu * (b[i] - a[i])) - x[i]; });
}

// Box test of one coordinate: outside when c > xi + hw or c < xi - hw (so NaN is inside).
inline bool outside(double c, double xi, double hw) { return c > xi + hw || c < xi - hw; }

// ---- Sequential scans (any n): candidates first .. last-1, counted from 0 ----

// kBox: skip point j when outside the box of half-width hw on any axis, by increasing axis.
template <int Dim, bool kBox>
void scan_points(std::int32_t n, const double* x, const double* pts, std::int64_t first,
                 std::int64_t last, double hw, Best& best) {
  for (std::int64_t j = first; j < last; ++j) {
    const double* p = impl::column(pts, n, j);
    if constexpr (kBox) {
      bool skip = false;
      for (std::int32_t i = 0; i < n && !skip; ++i) skip = outside(p[i], x[i], hw);
      if (skip) continue;
    }
    const double d = point_distance<Dim>(n, p, x);
    if (d < best.d) {  // strict: ties keep the earlier point
      best.d = d;
      best.index = j + 1;
    }
  }
}

// kBox: skip segment k when on some axis both end points are beyond the same face of the
// box of half-width hw.
template <int Dim, bool kBox>
void scan_segments(std::int32_t n, const double* x, const double* pts, std::int64_t first,
                   std::int64_t last, double hw, Best& best) {
  for (std::int64_t k = first; k < last; ++k) {
    const double* a = impl::column(pts, n, k);
    const double* b = a + n;
    if constexpr (kBox) {
      bool skip = false;
      for (std::int32_t i = 0; i < n && !skip; ++i) {
        skip = (a[i] > x[i] + hw && b[i] > x[i] + hw) || (a[i] < x[i] - hw && b[i] < x[i] - hw);
      }
      if (skip) continue;
    }
    double u;
    const double d = segment_distance<Dim>(n, x, a, b, &u);
    if (d < best.d) {  // strict: ties keep the earlier segment
      best.d = d;
      best.index = k + 1;
      best.u = u;
    }
  }
}

// ---- Dimension 3, four candidates side by side ----

// 256-bit values stay inside this file's inlined helpers, so the ABI note about passing
// them without AVX does not apply.
#pragma GCC diagnostic ignored "-Wpsabi"
typedef double V4 __attribute__((vector_size(32)));
typedef std::int64_t M4 __attribute__((vector_size(32)));  // lane masks: 0 or -1

inline V4 splat(double v) { return V4{v, v, v, v}; }
// Coordinate c of the four consecutive points starting at p (layout x y z x y z ...).
inline V4 gather3(const double* p, int c) { return V4{p[c], p[c + 3], p[c + 6], p[c + 9]}; }
inline bool any(const M4& m) { return (m[0] | m[1] | m[2] | m[3]) != 0; }

// Lower bound g of |r| on one axis, where r is the coordinate difference (point of the
// segment) - X that the per-segment rule forms on that axis: alpha = A - X and beta = B - X
// as that rule rounds them. When A and B lie on the same side of X, every point the rule
// can form lies no nearer to X than the nearer end, less a few rounding units of |B - A|
// (the projection A + u (B - A) may overshoot by about 2^-52 |B - A|). The bound takes off
// kSlack = 2^-40 of the larger offset and kFloor = 1e-300, far more than those rounding
// errors, so g <= |r| holds for every branch of the rule. Rounding is monotone, so the
// squares and the sum in the rule's order then give a bound <= the rule's distance.
// A segment whose bound exceeds the best so far (strict) cannot be taken: skipping it
// leaves the answer unchanged. NaN or infinite coordinates give a bound of 0 or NaN, and
// such a segment is never skipped on that account.
constexpr double kSlack = 0x1p-40;
constexpr double kFloor = 1e-300;

[[gnu::always_inline]] inline V4 axis_gap(const V4& alpha, const V4& beta) {
  const V4 lo = alpha < beta ? alpha : beta;
  const V4 hi = alpha < beta ? beta : alpha;
  const V4 above = lo - (kSlack * hi + kFloor);  // both ends above X
  const V4 below = (kSlack * lo - hi) - kFloor;  // both ends below X
  const V4 g = above > below ? above : below;
  return g > 0.0 ? g : splat(0.0);
}

[[gnu::always_inline]] inline V4 segment_lower_bound(const double* x, const double* a) {
  const double* b = a + 3;
  const V4 gx = axis_gap(gather3(a, 0) - x[0], gather3(b, 0) - x[0]);
  const V4 gy = axis_gap(gather3(a, 1) - x[1], gather3(b, 1) - x[1]);
  const V4 gz = axis_gap(gather3(a, 2) - x[2], gather3(b, 2) - x[2]);
  return (gx * gx + gy * gy) + gz * gz;
}

// Point mode for the first 4 * (m / 4) points; returns the number of points done. The box
// (lo, hi per axis) is used when kBox. Expects best.index == 0 on entry.
template <bool kBox>
[[gnu::always_inline]] inline std::int64_t points3_blocks(const double* x, const double* pts,
                                                          std::int64_t m, const double* lo,
                                                          const double* hi, Best& best) {
  const V4 x0 = splat(x[0]), x1 = splat(x[1]), x2 = splat(x[2]);
  V4 bd = splat(best.d);
  M4 bi = {0, 0, 0, 0};
  M4 num = {1, 2, 3, 4};
  const M4 step = {4, 4, 4, 4};
  std::int64_t j = 0;
  for (; j + 4 <= m; j += 4) {
    const double* p = pts + 3 * j;
    const V4 px = gather3(p, 0), py = gather3(p, 1), pz = gather3(p, 2);
    const V4 dx = px - x0, dy = py - x1, dz = pz - x2;
    const V4 d = (dx * dx + dy * dy) + dz * dz;
    M4 take = d < bd;  // strict, per lane: a lane keeps its earliest point on ties
    if constexpr (kBox) {
      take &= ~((px > hi[0]) | (px < lo[0]) | (py > hi[1]) | (py < lo[1]) | (pz > hi[2]) |
                (pz < lo[2]));
    }
    bd = take ? d : bd;
    bi = take ? num : bi;
    num += step;
  }
  // Merge the lanes: smallest distance, then lowest number.
  for (int l = 0; l < 4; ++l) {
    if (bi[l] != 0 && (bd[l] < best.d || (bd[l] == best.d && bi[l] < best.index))) {
      best.d = bd[l];
      best.index = bi[l];
    }
  }
  return j;
}

// Polyline mode for the first 4 * (nseg / 4) segments; returns the number done.
template <bool kBox>
[[gnu::always_inline]] inline std::int64_t segments3_blocks(const double* x, const double* pts,
                                                            std::int64_t nseg, const double* lo,
                                                            const double* hi, Best& best) {
  std::int64_t k = 0;
  for (; k + 4 <= nseg; k += 4) {
    const double* a = pts + 3 * k;
    M4 keep = ~(segment_lower_bound(x, a) > best.d);
    if constexpr (kBox) {
      for (int c = 0; c < 3; ++c) {
        const V4 ac = gather3(a, c), bc = gather3(a + 3, c);
        keep &= ~(((ac > hi[c]) & (bc > hi[c])) | ((ac < lo[c]) & (bc < lo[c])));
      }
    }
    if (!any(keep)) continue;
    for (int l = 0; l < 4; ++l) {
      if (keep[l] == 0) continue;
      const double* al = a + 3 * l;
      double u;
      const double d = segment_distance<3>(3, x, al, al + 3, &u);
      if (d < best.d) {
        best.d = d;
        best.index = k + l + 1;
        best.u = u;
      }
    }
  }
  return k;
}

// One search in dimension 3: the blocks, then the rest sequentially. The box, when used,
// has half-width hw around x.
template <bool kPolylineMode, bool kBox>
[[gnu::always_inline]] inline void search3(const double* x, const double* pts, std::int64_t m,
                                           double hw, Best& best) {
  const double lo[3] = {x[0] - hw, x[1] - hw, x[2] - hw};
  const double hi[3] = {x[0] + hw, x[1] + hw, x[2] + hw};
  if constexpr (kPolylineMode) {
    const std::int64_t done = segments3_blocks<kBox>(x, pts, m - 1, lo, hi, best);
    scan_segments<3, kBox>(3, x, pts, done, m - 1, hw, best);
  } else {
    const std::int64_t done = points3_blocks<kBox>(x, pts, m, lo, hi, best);
    scan_points<3, kBox>(3, x, pts, done, m, hw, best);
  }
}

template <bool kPolylineMode, bool kBox>
void search3_base(const double* x, const double* pts, std::int64_t m, double hw, Best& best) {
  search3<kPolylineMode, kBox>(x, pts, m, hw, best);
}

#if defined(__x86_64__)
// The same source with 256-bit registers: the same operations, lane by lane.
template <bool kPolylineMode, bool kBox>
__attribute__((target("avx2"))) void search3_avx2(const double* x, const double* pts,
                                                  std::int64_t m, double hw, Best& best) {
  search3<kPolylineMode, kBox>(x, pts, m, hw, best);
}
#endif

template <bool kPolylineMode, bool kBox>
void search_dim3(const double* x, const double* pts, std::int64_t m, double hw, Best& best) {
#if defined(__x86_64__)
  if (__builtin_cpu_supports("avx2")) return search3_avx2<kPolylineMode, kBox>(x, pts, m, hw, best);
#endif
  search3_base<kPolylineMode, kBox>(x, pts, m, hw, best);
}

// Any dimension: n = 3 goes to the four-lane search, the others scan sequentially.
template <bool kPolylineMode, bool kBox>
void search(std::int32_t n, const double* x, const double* pts, std::int64_t m, double hw,
            Best& best) {
  if (n == 3) return search_dim3<kPolylineMode, kBox>(x, pts, m, hw, best);
  if constexpr (kPolylineMode) {
    scan_segments<0, kBox>(n, x, pts, 0, m - 1, hw, best);
  } else {
    scan_points<0, kBox>(n, x, pts, 0, m, hw, best);
  }
}

}  // namespace

extern "C" std::int32_t ynoaon(const std::int32_t* n, const double* x, const std::int32_t* m,
                               const double* pts, const std::int32_t* mode, double* dist2,
                               std::int32_t* index, double* t, std::int32_t* ierr) {
  // (1) Arguments.
  if (*n <= 0 || *m < 2) return impl::fail(ierr, impl::kErrBadArg);
  // (2) best starts at 1e60, the parameter of the best segment at 0.
  Best best{kStartBest, 0, 0.0};
  const bool polyline = *mode >= kPolyline;  // signed comparison
  if (polyline) {
    search<true, false>(*n, x, pts, *m, 0.0, best);  // (4)
  } else {
    search<false, false>(*n, x, pts, *m, 0.0, best);  // (3)
  }
  // (5) index only when a candidate improved on 1e60.
  *dist2 = best.d;
  if (best.index != 0) *index = static_cast<std::int32_t>(best.index);
  *t = polyline ? best.u : 0.0;
  *ierr = 0;
  return impl::kOk;
}

extern "C" std::int32_t ynoaod(const std::int32_t* n, const double* x, const std::int32_t* m,
                               const double* pts, const std::int32_t* mode, const double* r2,
                               const double* tol, double* dist2, std::int32_t* index, double* t,
                               std::int32_t* ierr) {
  // (1) Arguments: n first, then m.
  if (*n < 1) return impl::fail(ierr, impl::kErrBadArg);
  if (*m < 2) return impl::fail(ierr, impl::kErrBadArg);
  const double h = std::sqrt(*r2) + *tol;  // box half-width: sqrt(r2) + tol
  // (2) The bound is the starting best.
  Best best{*r2, 0, 0.0};
  const bool polyline = *mode >= kPolyline;
  if (polyline) {
    // (4) Half-width h in every dimension.
    search<true, true>(*n, x, pts, *m, h, best);
  } else {
    // (3) Half-width h for n = 3; deliberately the squared bound r2 itself otherwise.
    search<false, true>(*n, x, pts, *m, *n == 3 ? h : *r2, best);
  }
  // (5) Point mode writes index only when a point improved on r2; polyline mode writes 0
  // when no segment did.
  *dist2 = best.d;
  if (polyline || best.index != 0) *index = static_cast<std::int32_t>(best.index);
  *t = polyline ? best.u : 0.0;
  *ierr = 0;
  return impl::kOk;
}
