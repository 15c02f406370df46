// bench/closest/bench_nearest.cpp -- ynoaon and ynoaod in point and polyline mode over 1e3,
// 1e5 and 1e6 points of dimension 3, beside a plain loop doing the same search and a plain
// vectorised read of the same bytes. Bytes per second count the point array once per call.
#include <benchmark/benchmark.h>

#include <cmath>
#include <random>
#include <vector>

#include "closest/closest_api.h"

namespace {

constexpr std::int32_t kPointMode = 0, kPolylineMode = 8467;
constexpr double kBound = 0.01;  // r2 of the bounded search (box half-width 0.1)

// A cloud in the unit cube (point mode) or a walk with steps of about 0.01 (polyline mode,
// a curve as drawn), and a query point inside it.
struct Input {
  std::vector<double> pts, x;
};
Input make_input(std::int64_t m, bool walk) {
  std::mt19937_64 rng(20261122 + m + walk);
  std::uniform_real_distribution<double> u(0.0, 1.0), step(-0.01, 0.01);
  Input in;
  in.pts.resize(static_cast<std::size_t>(3 * m));
  for (std::int64_t j = 0; j < m; ++j) {
    for (int i = 0; i < 3; ++i) {
      const double prev = j == 0 ? 0.5 : in.pts[3 * (j - 1) + i];
      double c = walk ? prev + step(rng) : u(rng);
      if (walk && (c < 0.0 || c > 1.0)) c = prev;  // stay in the cube
      in.pts[3 * j + i] = c;
    }
  }
  in.x = {u(rng), u(rng), u(rng)};
  return in;
}

// ---- Plain loops: the same searches, one candidate at a time ----

double plain_points(const double* x, const double* p, std::int64_t m, bool bound,
                    std::int32_t* index) {
  double best = bound ? kBound : 1e60;
  const double h = std::sqrt(kBound);
  for (std::int64_t j = 0; j < m; ++j, p += 3) {
    if (bound && (p[0] > x[0] + h || p[0] < x[0] - h || p[1] > x[1] + h || p[1] < x[1] - h ||
                  p[2] > x[2] + h || p[2] < x[2] - h)) {
      continue;
    }
    const double dx = p[0] - x[0], dy = p[1] - x[1], dz = p[2] - x[2];
    const double d = (dx * dx + dy * dy) + dz * dz;
    if (d < best) best = d, *index = static_cast<std::int32_t>(j + 1);
  }
  return best;
}

double plain_polyline(const double* x, const double* p, std::int64_t m, bool bound,
                      std::int32_t* index, double* t) {
  double best = bound ? kBound : 1e60;
  const double h = std::sqrt(kBound);
  for (std::int64_t k = 0; k + 1 < m; ++k, p += 3) {
    const double* a = p;
    const double* b = p + 3;
    if (bound) {
      bool skip = false;
      for (int i = 0; i < 3 && !skip; ++i) {
        skip = (a[i] > x[i] + h && b[i] > x[i] + h) || (a[i] < x[i] - h && b[i] < x[i] - h);
      }
      if (skip) continue;
    }
    double ab[3], pr = 0, len = 0;
    for (int i = 0; i < 3; ++i) {
      ab[i] = b[i] - a[i];
      pr += (x[i] - a[i]) * ab[i];
      len += ab[i] * ab[i];
    }
    double u = len <= 1e-15 ? 0.5 : pr < 0 ? 0.0 : pr > len ? 1.0 : pr / len, d = 0;
    for (int i = 0; i < 3; ++i) {
      const double v = a[i] + u * ab[i] - x[i];
      d += v * v;
    }
    if (d < best) best = d, *index = static_cast<std::int32_t>(k + 1), *t = u;
  }
  return best;
}

// ---- Plain vectorised read: the sum of every real of the array ----

typedef double V4 __attribute__((vector_size(32)));
#pragma GCC diagnostic ignored "-Wpsabi"
template <int Dummy>
[[gnu::always_inline]] inline double read_all(const double* p, std::size_t count) {
  V4 s0 = {0, 0, 0, 0}, s1 = s0;
  std::size_t i = 0;
  for (; i + 8 <= count; i += 8) {
    V4 a, b;
    __builtin_memcpy(&a, p + i, sizeof a);
    __builtin_memcpy(&b, p + i + 4, sizeof b);
    s0 += a, s1 += b;
  }
  s0 += s1;
  double s = (s0[0] + s0[1]) + (s0[2] + s0[3]);
  for (; i < count; ++i) s += p[i];
  return s;
}
double read_base(const double* p, std::size_t count) { return read_all<0>(p, count); }
#if defined(__x86_64__)
__attribute__((target("avx2"))) double read_avx2(const double* p, std::size_t count) {
  return read_all<1>(p, count);
}
#endif
double plain_read(const double* p, std::size_t count) {
#if defined(__x86_64__)
  if (__builtin_cpu_supports("avx2")) return read_avx2(p, count);
#endif
  return read_base(p, count);
}

// ---- Benchmarks; arguments: number of points ----

void set_bytes(benchmark::State& state, std::int64_t m) {
  state.SetBytesProcessed(state.iterations() * m * 3 * static_cast<std::int64_t>(sizeof(double)));
}

template <bool kWalk, bool kBounded>
void BM_library(benchmark::State& state) {
  const std::int64_t m = state.range(0);
  const Input in = make_input(m, kWalk);
  std::int32_t n = 3, mm = static_cast<std::int32_t>(m), mode = kWalk ? kPolylineMode : kPointMode;
  std::int32_t index = 0, ierr = 0;
  double d2 = 0, t = 0, r2 = kBound, tol = 0.0;
  for (auto _ : state) {
    if (kBounded) {
      ynoaod(&n, in.x.data(), &mm, in.pts.data(), &mode, &r2, &tol, &d2, &index, &t, &ierr);
    } else {
      ynoaon(&n, in.x.data(), &mm, in.pts.data(), &mode, &d2, &index, &t, &ierr);
    }
    benchmark::DoNotOptimize(d2);
    benchmark::DoNotOptimize(index);
    benchmark::DoNotOptimize(t);
  }
  set_bytes(state, m);
}

template <bool kWalk, bool kBounded>
void BM_plain_loop(benchmark::State& state) {
  const std::int64_t m = state.range(0);
  const Input in = make_input(m, kWalk);
  std::int32_t index = 0;
  double t = 0;
  for (auto _ : state) {
    const double d2 = kWalk ? plain_polyline(in.x.data(), in.pts.data(), m, kBounded, &index, &t)
                            : plain_points(in.x.data(), in.pts.data(), m, kBounded, &index);
    benchmark::DoNotOptimize(d2);
    benchmark::DoNotOptimize(index);
    benchmark::DoNotOptimize(t);
  }
  set_bytes(state, m);
}

void BM_plain_read(benchmark::State& state) {
  const std::int64_t m = state.range(0);
  const Input in = make_input(m, false);
  for (auto _ : state) benchmark::DoNotOptimize(plain_read(in.pts.data(), in.pts.size()));
  set_bytes(state, m);
}

void sizes(benchmark::internal::Benchmark* b) {
  b->ArgName("m")->Arg(1000)->Arg(100000)->Arg(1000000);
}

BENCHMARK(BM_plain_read)->Apply(sizes);
BENCHMARK(BM_library<false, false>)->Name("BM_ynoaon_points")->Apply(sizes);
BENCHMARK(BM_plain_loop<false, false>)->Name("BM_plain_points")->Apply(sizes);
BENCHMARK(BM_library<true, false>)->Name("BM_ynoaon_polyline")->Apply(sizes);
BENCHMARK(BM_plain_loop<true, false>)->Name("BM_plain_polyline")->Apply(sizes);
BENCHMARK(BM_library<false, true>)->Name("BM_ynoaod_points")->Apply(sizes);
BENCHMARK(BM_plain_loop<false, true>)->Name("BM_plain_bounded_points")->Apply(sizes);
BENCHMARK(BM_library<true, true>)->Name("BM_ynoaod_polyline")->Apply(sizes);
BENCHMARK(BM_plain_loop<true, true>)->Name("BM_plain_bounded_polyline")->Apply(sizes);

}  // namespace
