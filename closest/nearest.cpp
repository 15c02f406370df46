// closest/nearest.cpp -- nearest point of a point list or of the polyline through it, in
// dimension n: ynoaon, and its bounded form with a box filter, ynoaod.
//
// Points are the columns of an (n, m) array; segment k joins points k and k + 1. Candidates
// are examined by increasing number and one is taken only when strictly nearer than the
// best so far, so ties keep the lower number.
//
// Speed (dimension 3, on processors with AVX2; elsewhere the sequential scans): candidates
// are screened four at a time, never changing a result.
//   - Point mode computes four squared distances side by side, each in its own fixed order
//     ((dx^2 + dy^2) + dz^2), and keeps per lane the strictly smaller distance with its
//     number; merging the lanes by (distance, number) gives what the sequential scan gives,
//     since that scan keeps the first number that reaches the smallest distance.
//   - Polyline mode computes for four segments a lower bound of the squared distance that
//     the per-segment rule would compute, and runs the rule, in order, only for segments
//     whose bound does not exceed the best so far (see axis_gap). The bounded search first
//     applies its box to four points at a time (see boxed_segments3_blocks).
// No state: everything is per call.
#include <cmath>
#include <cstdint>
#if defined(__x86_64__)
#include <immintrin.h>
#endif

#include "closest/closest_api.h"
#include "closest/closest_internal.h"
#include "frame/status.h"

namespace {

constexpr double kNegligible = 1e-15;     // degenerate squared length, inclusive
constexpr double kStartBest = 1e60;       // starting best distance of ynoaon
constexpr std::int32_t kPolyline = 8467;  // mode >= kPolyline selects the polyline

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
  const double p =
      impl::sum_terms(n, [=](std::int32_t i) { return (x[i] - a[i]) * (b[i] - a[i]); });
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

// ---- Dimension 3, four candidates side by side, with 256-bit registers ----
// Compiled for the AVX2 instruction set and chosen at run time when the processor has it;
// without it the sequential scans above do the same search. Both perform the same
// operations candidate by candidate, so they give the same results.

#if defined(__x86_64__)
#if defined(__clang__)
#pragma clang attribute push(__attribute__((target("avx2"))), apply_to = function)
#else
#pragma GCC push_options
#pragma GCC target("avx2")
#endif
namespace lanes {

typedef double V4 __attribute__((vector_size(32)));
typedef std::int64_t M4 __attribute__((vector_size(32)));  // lane masks: 0 or -1

inline V4 splat(double v) { return V4{v, v, v, v}; }

// Lanes i0..i3 of the eight lanes of (a, b); exact. Clang spells the builtin differently.
#if defined(__clang__)
#define LANES_PICK(a, b, i0, i1, i2, i3) __builtin_shufflevector(a, b, i0, i1, i2, i3)
#else
#define LANES_PICK(a, b, i0, i1, i2, i3) __builtin_shuffle(a, b, M4{i0, i1, i2, i3})
#endif

// The coordinates of the four consecutive points at p (layout x y z x y z ...), one vector
// per axis: three loads, then lanes moved into place.
struct Points4 {
  V4 x, y, z;
};
[[gnu::always_inline]] inline Points4 load4(const double* p) {
  V4 r0, r1, r2;  // (x0 y0 z0 x1), (y1 z1 x2 y2), (z2 x3 y3 z3)
  __builtin_memcpy(&r0, p, sizeof r0);
  __builtin_memcpy(&r1, p + 4, sizeof r1);
  __builtin_memcpy(&r2, p + 8, sizeof r2);
  const V4 tx = LANES_PICK(r0, r1, 0, 3, 6, 7);
  const V4 ty = LANES_PICK(r0, r1, 1, 4, 7, 0);
  const V4 tz = LANES_PICK(r0, r1, 2, 5, 0, 0);
  return {LANES_PICK(tx, r2, 0, 1, 2, 5), LANES_PICK(ty, r2, 0, 1, 2, 6),
          LANES_PICK(tz, r2, 0, 1, 4, 7)};
}
// Lanes 1..3 of a, then lane 0 of b: the points one further on.
[[gnu::always_inline]] inline V4 next_lane(const V4& a, const V4& b) {
  return LANES_PICK(a, b, 1, 2, 3, 4);
}

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

constexpr std::int64_t kPrefetchAhead = 192;  // reals ahead of the scan to fetch early

// Point mode for the first 4 * (m / 4) points; returns the number of points done. The box
// (lo, hi per axis) is used when kBox. Expects best.index == 0 on entry.
template <bool kBox>
[[gnu::always_inline]] inline std::int64_t points3_blocks(const double* x, const double* pts,
                                                          std::int64_t m, const double* lo,
                                                          const double* hi, Best& best) {
  const V4 x0 = splat(x[0]), x1 = splat(x[1]), x2 = splat(x[2]);
  // Two sets of lanes, for alternate groups of four, so that consecutive groups do not wait
  // on each other; each lane keeps its strictly smaller distance, so its earliest point on
  // ties.
  V4 bd[2] = {splat(best.d), splat(best.d)};
  M4 bi[2] = {{0, 0, 0, 0}, {0, 0, 0, 0}};
  M4 num = {1, 2, 3, 4};
  const M4 step = {4, 4, 4, 4};
  auto group = [&](std::int64_t j, int set) {
    const Points4 p = load4(pts + 3 * j);
    const V4 dx = p.x - x0, dy = p.y - x1, dz = p.z - x2;
    const V4 d = (dx * dx + dy * dy) + dz * dz;
    M4 take = d < bd[set];
    if constexpr (kBox) {
      take &= ~((p.x > hi[0]) | (p.x < lo[0]) | (p.y > hi[1]) | (p.y < lo[1]) | (p.z > hi[2]) |
                (p.z < lo[2]));
    }
    bd[set] = take ? d : bd[set];
    bi[set] = take ? num : bi[set];
    num += step;
  };
  std::int64_t j = 0;
  for (; j + 8 <= m; j += 8) {
    __builtin_prefetch(pts + 3 * j + kPrefetchAhead);
    group(j, 0);
    group(j + 4, 1);
  }
  if (j + 4 <= m) {
    group(j, 0);
    j += 4;
  }
  // Merge the lanes: smallest distance, then lowest number.
  for (int set = 0; set < 2; ++set) {
    for (int l = 0; l < 4; ++l) {
      const double d = bd[set][l];
      const std::int64_t i = bi[set][l];
      if (i != 0 && (d < best.d || (d == best.d && i < best.index))) {
        best.d = d;
        best.index = i;
      }
    }
  }
  return j;
}

// Lane signs of a mask as bits 0..3 (a lane of -1 has its sign bit set).
inline unsigned mask_bits(const M4& m) {
  return static_cast<unsigned>(_mm256_movemask_pd(reinterpret_cast<__m256d>(m)));
}

// Polyline mode, four segments at a time while the points of the next four are there;
// returns the number of segments done. Segments k .. k+3 run from the points of the group
// at k to the same points one further on.
[[gnu::always_inline]] inline std::int64_t segments3_blocks(const double* x, const double* pts,
                                                            std::int64_t nseg, Best& best) {
  if (nseg + 1 < 8) return 0;  // the first group and the next one
  const V4 x0 = splat(x[0]), x1 = splat(x[1]), x2 = splat(x[2]);
  Points4 a = load4(pts);
  std::int64_t k = 0;
  for (; k + 8 <= nseg + 1; k += 4) {  // points k .. k+7 exist
    __builtin_prefetch(pts + 3 * k + kPrefetchAhead);
    const Points4 an = load4(pts + 3 * (k + 4));
    const V4 gx = axis_gap(a.x - x0, next_lane(a.x, an.x) - x0);
    const V4 gy = axis_gap(a.y - x1, next_lane(a.y, an.y) - x1);
    const V4 gz = axis_gap(a.z - x2, next_lane(a.z, an.z) - x2);
    const unsigned open = ~mask_bits((gx * gx + gy * gy) + gz * gz > best.d) & 0xFu;
    a = an;
    if (open == 0) continue;
    for (int l = 0; l < 4; ++l) {
      if ((open >> l & 1u) == 0) continue;
      const double* al = pts + 3 * (k + l);
      double u;
      const double d = segment_distance<3>(3, x, al, al + 3, &u);
      if (d < best.d) {  // strict: ties keep the earlier segment
        best.d = d;
        best.index = k + l + 1;
        best.u = u;
      }
    }
  }
  return k;
}

// Bounded polyline mode: the box test on four points at a time, straight from the point
// array (12 coordinates, three loads, each compared with the faces of its own axis). Bit
// 3p + i of `above` says that coordinate i of point p is > Xi + h, of `below` that it is
// < Xi - h. Segment l of a group is skipped when points l and l + 1 share a bit; the others
// go through the bound of axis_gap, then the per-segment rule, in order. Returns the number
// of segments done.
[[gnu::always_inline]] inline std::int64_t boxed_segments3_blocks(const double* x,
                                                                  const double* pts,
                                                                  std::int64_t nseg,
                                                                  const double* lo,
                                                                  const double* hi, Best& best) {
  if (nseg + 1 < 8) return 0;  // the first group and the next one
  const V4 h0 = {hi[0], hi[1], hi[2], hi[0]}, h1 = {hi[1], hi[2], hi[0], hi[1]},
           h2 = {hi[2], hi[0], hi[1], hi[2]};
  const V4 l0 = {lo[0], lo[1], lo[2], lo[0]}, l1 = {lo[1], lo[2], lo[0], lo[1]},
           l2 = {lo[2], lo[0], lo[1], lo[2]};
  auto faces = [&](const double* p, unsigned* above, unsigned* below) {
    V4 r0, r1, r2;
    __builtin_memcpy(&r0, p, sizeof r0);
    __builtin_memcpy(&r1, p + 4, sizeof r1);
    __builtin_memcpy(&r2, p + 8, sizeof r2);
    *above = mask_bits(r0 > h0) | mask_bits(r1 > h1) << 4 | mask_bits(r2 > h2) << 8;
    *below = mask_bits(r0 < l0) | mask_bits(r1 < l1) << 4 | mask_bits(r2 < l2) << 8;
  };
  unsigned above, below;
  faces(pts, &above, &below);
  std::int64_t k = 0;
  for (; k + 8 <= nseg + 1; k += 4) {  // points k .. k+7 exist
    unsigned above_n, below_n;
    __builtin_prefetch(pts + 3 * k + kPrefetchAhead);
    faces(pts + 3 * (k + 4), &above_n, &below_n);
    const unsigned wa = above | (above_n & 7u) << 12, wb = below | (below_n & 7u) << 12;
    const unsigned shared = (wa & (wa >> 3)) | (wb & (wb >> 3));
    // Bit 3l set: segment l shares no face on any axis.
    unsigned open = ~(shared | (shared >> 1) | (shared >> 2)) & 0x249u;
    if (open != 0) {
      const Points4 a = load4(pts + 3 * k), an = load4(pts + 3 * (k + 4));
      const V4 gx = axis_gap(a.x - x[0], next_lane(a.x, an.x) - x[0]);
      const V4 gy = axis_gap(a.y - x[1], next_lane(a.y, an.y) - x[1]);
      const V4 gz = axis_gap(a.z - x[2], next_lane(a.z, an.z) - x[2]);
      const M4 bound_skips = (gx * gx + gy * gy) + gz * gz > best.d;
      for (int l = 0; l < 4; ++l) {
        if ((open >> (3 * l) & 1u) == 0 || bound_skips[l] != 0) continue;
        const double* al = pts + 3 * (k + l);
        double u;
        const double d = segment_distance<3>(3, x, al, al + 3, &u);
        if (d < best.d) {  // strict: ties keep the earlier segment
          best.d = d;
          best.index = k + l + 1;
          best.u = u;
        }
      }
    }
    above = above_n;
    below = below_n;
  }
  return k;
}

// One search in dimension 3: the blocks, then the rest sequentially. The box, when used,
// has half-width hw around x.
template <bool kPolylineMode, bool kBox>
void search3(const double* x, const double* pts, std::int64_t m, double hw, Best& best) {
  const double lo[3] = {x[0] - hw, x[1] - hw, x[2] - hw};
  const double hi[3] = {x[0] + hw, x[1] + hw, x[2] + hw};
  if constexpr (kPolylineMode) {
    const std::int64_t done = kBox ? boxed_segments3_blocks(x, pts, m - 1, lo, hi, best)
                                   : segments3_blocks(x, pts, m - 1, best);
    scan_segments<3, kBox>(3, x, pts, done, m - 1, hw, best);
  } else {
    const std::int64_t done = points3_blocks<kBox>(x, pts, m, lo, hi, best);
    scan_points<3, kBox>(3, x, pts, done, m, hw, best);
  }
}

}  // namespace lanes
#undef LANES_PICK
#if defined(__clang__)
#pragma clang attribute pop
#else
#pragma GCC pop_options
#endif
#endif

template <bool kPolylineMode, bool kBox>
void search_dim3(const double* x, const double* pts, std::int64_t m, double hw, Best& best) {
#if defined(__x86_64__)
  if (__builtin_cpu_supports("avx2"))
    return lanes::search3<kPolylineMode, kBox>(x, pts, m, hw, best);
#endif
  if constexpr (kPolylineMode) {
    scan_segments<3, kBox>(3, x, pts, 0, m - 1, hw, best);
  } else {
    scan_points<3, kBox>(3, x, pts, 0, m, hw, best);
  }
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
