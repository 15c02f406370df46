// bench/path/bench_driver.cpp -- whole paths traced by ynchem: a unit circle (n = 2) and
// Viviani's curve (n = 3) at a few tolerances, and a circle embedded in R^n by n - 2 extra
// linear equations (n = 5, 12) with tolerances giving about 1e4, 1e5 and 1e6 stored points.
// Counters: points (stored, per second), evals_per_point (calls of the evaluation routine),
// outside_us_per_point (CPU time per point less the time the evaluation routine itself takes,
// the latter measured by replaying the same mix of requests on their own), bytes_per_point
// (table storage held by the result, capacity included).
#include <benchmark/benchmark.h>
#include <time.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "companions/system/system_api.h"
#include "path/path_api.h"

namespace {

// CPU time of the calling thread, in seconds (other processes on the machine do not count).
double thread_seconds() {
  timespec ts;
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &ts);
  return static_cast<double>(ts.tv_sec) + 1e-9 * static_cast<double>(ts.tv_nsec);
}

enum class Shape { kCircle, kViviani, kEmbedded };

// The system and the calls it received, by request (1, 2, 3, 6).
struct System {
  Shape shape;
  std::int32_t n;
  double a[20] = {}, b[20] = {};  // embedded: x(k) = a(k) x1 + b(k) x2 for k = 3..n
  std::int64_t calls[8] = {};
};

std::int32_t evaluate(void* ctx, const std::int32_t*, const double* x, const std::int32_t* req,
                      double* out, std::int32_t* ierr) {
  System& s = *static_cast<System*>(ctx);
  const std::int32_t n = s.n, m = n - 1, r = *req;
  ++s.calls[r & 7];
  double* f = out;
  double* jac = (r & 1) ? out + m : out;
  double* hes = jac + ((r & 2) ? m * n : 0);
  if (r & 1) {
    switch (s.shape) {
      case Shape::kCircle:
        f[0] = x[0] * x[0] + x[1] * x[1] - 1.0;
        break;
      case Shape::kViviani:
        f[0] = x[0] * x[0] + x[1] * x[1] + x[2] * x[2] - 4.0;
        f[1] = (x[0] - 1.0) * (x[0] - 1.0) + x[1] * x[1] - 1.0;
        break;
      case Shape::kEmbedded:
        f[0] = x[0] * x[0] + x[1] * x[1] - 1.0;
        for (std::int32_t k = 2; k < n; ++k) f[k - 1] = x[k] - s.a[k] * x[0] - s.b[k] * x[1];
        break;
    }
  }
  if (r & 2) {
    for (std::int32_t i = 0; i < m * n; ++i) jac[i] = 0.0;
    jac[0] = 2.0 * x[0];
    jac[m] = 2.0 * x[1];
    if (s.shape == Shape::kViviani) {
      jac[2 * m] = 2.0 * x[2];
      jac[1] = 2.0 * (x[0] - 1.0);
      jac[1 + m] = 2.0 * x[1];
    } else if (s.shape == Shape::kEmbedded) {
      for (std::int32_t k = 2; k < n; ++k) {
        jac[(k - 1)] = -s.a[k];
        jac[(k - 1) + m] = -s.b[k];
        jac[(k - 1) + m * k] = 1.0;
      }
    }
  }
  if (r & 4) {
    for (std::int32_t i = 0; i < m * n * n; ++i) hes[i] = 0.0;
    hes[0] = 2.0;            // d2F1/dx1dx1
    hes[m * (1 + n)] = 2.0;  // d2F1/dx2dx2
    if (s.shape == Shape::kViviani) {
      hes[m * (2 + 2 * n)] = 2.0;
      hes[1] = 2.0;
      hes[1 + m * (1 + n)] = 2.0;
    }
  }
  *ierr = 0;
  return 0;
}

struct Path {
  System sys;
  std::vector<double> xd, box, pas, tol;
  std::int32_t mode;
};

Path make_path(Shape shape, std::int32_t n, double tol, std::int32_t mode) {
  Path p{
      System{shape, n}, std::vector<double>(2 * n, 0.0), {}, {}, std::vector<double>(n, tol), mode};
  p.box.assign(n, -3.0);
  p.box.insert(p.box.end(), n, 3.0);
  p.pas.assign(n, 1e-9);
  p.pas.insert(p.pas.end(), n, 0.25);
  if (shape == Shape::kViviani) {
    p.xd[2] = 2.0, p.xd[n + 1] = 1.0;  // from (0, 0, 2) along y
    return p;
  }
  // x1 = 1, x2 = 0; x(k) = a(k), the direction (0, 1, b(3), ..., b(n)) normalised.
  double len2 = 1.0;
  for (std::int32_t k = 2; k < n; ++k) {
    p.sys.a[k] = 0.05 * k;
    p.sys.b[k] = 0.5 / k;
    len2 += p.sys.b[k] * p.sys.b[k];
  }
  p.xd[0] = 1.0;
  p.xd[n + 1] = 1.0 / std::sqrt(len2);
  for (std::int32_t k = 2; k < n; ++k) {
    p.xd[k] = p.sys.a[k];
    p.xd[n + k] = p.sys.b[k] / std::sqrt(len2);
  }
  return p;
}

// Length of the embedded circle (for the tolerance that gives a number of points).
double embedded_length(const System& s) {
  const int steps = 100000;
  double len = 0.0;
  for (int j = 0; j < steps; ++j) {
    const double t = 2.0 * 3.141592653589793 * (j + 0.5) / steps;
    double v = 1.0;
    for (std::int32_t k = 2; k < s.n; ++k) {
      const double d = -s.a[k] * std::sin(t) + s.b[k] * std::cos(t);
      v += d * d;
    }
    len += std::sqrt(v);
  }
  return len * 2.0 * 3.141592653589793 / steps;
}

// Seconds per call of the evaluation routine for request r, at points on the curve.
double seconds_per_call(const Path& p, std::int32_t r) {
  System s = p.sys;
  std::vector<double> out(static_cast<std::size_t>(s.n * s.n * s.n + s.n));
  const std::int32_t one = 1;
  std::int32_t ierr = 0;
  constexpr int kCalls = 200000;
  double x[20];
  for (std::int32_t i = 0; i < s.n; ++i) x[i] = p.xd[i];
  const double t0 = thread_seconds();
  for (int k = 0; k < kCalls; ++k) {
    x[1] = 1e-9 * (k & 1023);
    evaluate(&s, &one, x, &r, out.data(), &ierr);
    benchmark::DoNotOptimize(out.data());
  }
  return (thread_seconds() - t0) / kCalls;
}

void run(benchmark::State& state, Path p) {
  const std::int32_t n = p.sys.n, store = 2 + 8;
  const double eps = 1e-20;
  std::int64_t points = 0, bytes = 0;
  System counted = p.sys;
  double seconds = 0.0;
  for (auto _ : state) {
    System s = p.sys;
    std::int32_t itab = 0, ierr = 0, count = 0, h = 0;
    const double t0 = thread_seconds();
    const std::int32_t result = ynchem(&s, &n, evaluate, &eps, p.xd.data(), p.box.data(),
                                       p.pas.data(), &p.mode, p.tol.data(), &store, &itab, &ierr);
    seconds += thread_seconds() - t0;
    if (result != 0) {
      state.SkipWithError("ynchem failed");
      return;
    }
    state.PauseTiming();
    const std::int32_t kind = 23;
    yncrea(&itab, &kind, &h, &count, &ierr);
    points += count;
    bytes = 0;
    for (std::int32_t k : {23, 1, 2, 3}) {
      std::int32_t hk = 0, ck = 0, esize = 0, entries = 0;
      yncrea(&itab, &k, &hk, &ck, &ierr);
      yutinf(&hk, &esize, &entries, &ierr);
      bytes += orvq7sys_table_capacity(hk) * esize;
    }
    bytes /= count;
    for (int r = 0; r < 8; ++r) counted.calls[r] += s.calls[r];
    yncend(&itab, &ierr);
    state.ResumeTiming();
  }
  std::int64_t calls = 0;
  double eval_seconds = 0.0;
  for (std::int32_t r : {1, 2, 3, 6}) {
    calls += counted.calls[r];
    if (counted.calls[r] > 0) eval_seconds += counted.calls[r] * seconds_per_call(p, r);
  }
  state.counters["points"] =
      benchmark::Counter(static_cast<double>(points), benchmark::Counter::kIsRate);
  state.counters["points_per_path"] = static_cast<double>(points) / state.iterations();
  state.counters["evals_per_point"] = static_cast<double>(calls) / points;
  state.counters["outside_us_per_point"] = 1e6 * (seconds - eval_seconds) / points;
  state.counters["bytes_per_point"] = static_cast<double>(bytes);
}

void BM_ynchem_circle(benchmark::State& state) {
  run(state, make_path(Shape::kCircle, 2, 1.0 / state.range(0), 4));
}
BENCHMARK(BM_ynchem_circle)->Arg(100)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);

void BM_ynchem_viviani(benchmark::State& state) {
  run(state, make_path(Shape::kViviani, 3, 1.0 / state.range(0), 4));
}
BENCHMARK(BM_ynchem_viviani)->Arg(100)->Arg(1000)->Arg(10000)->Unit(benchmark::kMicrosecond);

// K = 2: steps of 0.9 tol, so the tolerance for `points` points is length / (0.9 points).
void BM_ynchem_embedded(benchmark::State& state) {
  Path p = make_path(Shape::kEmbedded, static_cast<std::int32_t>(state.range(0)), 1.0, 2);
  const double tol = embedded_length(p.sys) / (0.9 * static_cast<double>(state.range(1)));
  for (double& t : p.tol) t = tol;
  run(state, p);
}
BENCHMARK(BM_ynchem_embedded)
    ->Args({5, 10000})
    ->Args({5, 100000})
    ->Args({5, 1000000})
    ->Args({12, 10000})
    ->Args({12, 100000})
    ->Args({12, 1000000})
    ->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
