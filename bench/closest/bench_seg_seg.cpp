// bench/closest/bench_seg_seg.cpp -- ynoall on crossing, skew and parallel pairs in 3 and 7
// dimensions, beside a textbook clamped closest-points routine (which returns only the
// squared distance and the two parameters, without the library's degenerate and parallel
// cases, snapping or fixed order of the boundary tests).
#include <benchmark/benchmark.h>

#include <algorithm>
#include <random>
#include <vector>

#include "closest/closest_api.h"

namespace {

constexpr int kPairs = 1024;  // pairs per set, visited in turn

enum Kind { kCrossing, kSkew, kParallel };

// kPairs pairs of segments, each 4 n reals: seg1 (P1, P2) then seg2 (Q1, Q2).
std::vector<double> make_pairs(int n, Kind kind) {
  std::mt19937_64 rng(20261122 + n * 10 + kind);
  std::uniform_real_distribution<double> u(-1.0, 1.0), inner(0.1, 0.9);
  std::vector<double> v(static_cast<std::size_t>(kPairs) * 4 * n);
  for (int k = 0; k < kPairs; ++k) {
    double* p1 = &v[static_cast<std::size_t>(k) * 4 * n];
    double *p2 = p1 + n, *q1 = p1 + 2 * n, *q2 = p1 + 3 * n;
    for (int i = 0; i < n; ++i) p1[i] = u(rng), p2[i] = u(rng), q1[i] = u(rng), q2[i] = u(rng);
    if (kind == kCrossing) {
      // Both lines through one point C, at parameters inside (0.1, 0.9).
      const double s = inner(rng), t = inner(rng);
      for (int i = 0; i < n; ++i) {
        const double c = u(rng), d1 = p2[i] - p1[i], d2 = q2[i] - q1[i];
        p1[i] = c - s * d1, p2[i] = p1[i] + d1;
        q1[i] = c - t * d2, q2[i] = q1[i] + d2;
      }
    } else if (kind == kParallel) {
      for (int i = 0; i < n; ++i) q2[i] = q1[i] + 0.5 * (p2[i] - p1[i]);  // d2 = d1 / 2
    } else {
      // Skew: keep only pairs whose line-closest points lie outside both segments.
      double s1 = 0, s2 = 0, b = 0, d = 0, e = 0;
      for (int i = 0; i < n; ++i) {
        const double a1 = p2[i] - p1[i], a2 = q2[i] - q1[i], w = p1[i] - q1[i];
        s1 += a1 * a1, s2 += a2 * a2, b += a1 * a2, d += a2 * w, e += a1 * w;
      }
      const double x = s1 * s2 - b * b, t1 = (b * d - s2 * e) / x, t2 = (s1 * d - b * e) / x;
      if ((t1 >= 0 && t1 <= 1) || (t2 >= 0 && t2 <= 1)) --k;
    }
  }
  return v;
}

// Textbook clamped closest points of two segments, dimension n; called out of line, as
// a library routine would be.
[[gnu::noinline]] double textbook(int n, const double* p1, const double* p2, const double* q1,
                                  const double* q2, double* s_out, double* t_out) {
  constexpr double kEps = 1e-15;
  double a = 0, e = 0, f = 0, c = 0, b = 0;
  for (int i = 0; i < n; ++i) {
    const double d1 = p2[i] - p1[i], d2 = q2[i] - q1[i], r = p1[i] - q1[i];
    a += d1 * d1, e += d2 * d2, f += d2 * r, c += d1 * r, b += d1 * d2;
  }
  auto clamp = [](double x) { return std::min(std::max(x, 0.0), 1.0); };
  double s = 0, t = 0;
  if (a <= kEps && e <= kEps) {
    s = t = 0;
  } else if (a <= kEps) {
    t = clamp(f / e);
  } else if (e <= kEps) {
    s = clamp(-c / a);
  } else {
    const double denom = a * e - b * b;
    s = denom != 0 ? clamp((b * f - c * e) / denom) : 0.0;
    t = (b * s + f) / e;
    if (t < 0) {
      t = 0, s = clamp(-c / a);
    } else if (t > 1) {
      t = 1, s = clamp((b - c) / a);
    }
  }
  double d2 = 0;
  for (int i = 0; i < n; ++i) {
    const double v = (p1[i] + (p2[i] - p1[i]) * s) - (q1[i] + (q2[i] - q1[i]) * t);
    d2 += v * v;
  }
  *s_out = s, *t_out = t;
  return d2;
}

void BM_ynoall(benchmark::State& state) {
  const std::int32_t n = static_cast<std::int32_t>(state.range(0));
  const std::vector<double> v = make_pairs(n, static_cast<Kind>(state.range(1)));
  int k = 0;
  for (auto _ : state) {
    const double* p = &v[static_cast<std::size_t>(k) * 4 * n];
    double d2, t1, t2;
    std::int32_t ierr;
    benchmark::DoNotOptimize(ynoall(&n, p, p + 2 * n, &d2, &t1, &t2, &ierr));
    benchmark::DoNotOptimize(d2);
    benchmark::DoNotOptimize(t1);
    benchmark::DoNotOptimize(t2);
    k = (k + 1) % kPairs;
  }
}

void BM_textbook(benchmark::State& state) {
  const int n = static_cast<int>(state.range(0));
  const std::vector<double> v = make_pairs(n, static_cast<Kind>(state.range(1)));
  int k = 0;
  for (auto _ : state) {
    const double* p = &v[static_cast<std::size_t>(k) * 4 * n];
    double s, t;
    benchmark::DoNotOptimize(textbook(n, p, p + n, p + 2 * n, p + 3 * n, &s, &t));
    benchmark::DoNotOptimize(s);
    benchmark::DoNotOptimize(t);
    k = (k + 1) % kPairs;
  }
}

// Arguments: dimension, kind (0 crossing, 1 skew, 2 parallel).
void pairs_args(benchmark::internal::Benchmark* b) {
  b->ArgNames({"n", "kind"});
  for (int n : {3, 7}) {
    for (int kind : {kCrossing, kSkew, kParallel}) b->Args({n, kind});
  }
}
BENCHMARK(BM_ynoall)->Apply(pairs_args);
BENCHMARK(BM_textbook)->Apply(pairs_args);

}  // namespace
