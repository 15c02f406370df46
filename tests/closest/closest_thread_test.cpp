// tests/closest/closest_thread_test.cpp -- the closest-point routines called from two threads
// at once give, call for call, the answers of a single thread.
#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <vector>

#include "closest_calls.h"
#include "support/thread_compare.h"

TEST(ClosestThreads, ConcurrentCallsMatchSingleThreadedAnswers) {
  // Per variant, 30 random cases of dimensions 2 to 5: segments a and b, X, and 2 to 296
  // points; every tenth has a NaN in X, so that the nearest searches find nothing.
  std::vector<std::array<std::vector<double>, 4>> sets[2];
  for (int v = 0; v < 2; ++v) {
    std::mt19937_64 rng(test_seed("ClosestThreads", 66066 + v));
    for (std::size_t i = 0; i < 30; ++i) {
      const std::size_t n = 2 + i % 4;
      sets[v].push_back({uniform(rng, 2 * n, -1, 1), uniform(rng, 2 * n, -1, 1),
                         uniform(rng, n, -1, 1), uniform(rng, n * (2 + (i * 7) % 300), -1, 1)});
      if (i % 10 == 9) sets[v].back()[2][0] = std::numeric_limits<double>::quiet_NaN();
    }
  }
  const Sequence run = [&sets](int v) {
    Answer out;
    for (std::size_t i = 0; i < sets[v].size(); ++i) {
      const auto& [a, b, x, pts] = sets[v][i];
      const std::int32_t n = static_cast<std::int32_t>(x.size());
      const double r2 = 0.05 * (i % 5), tol = 0.01 * (i % 3);
      for (const Out& o :
           {call('L', n, a, b), call('2', n, a, b), call('P', n, x, a), call('O', n, x, a, {1}),
            call('N', n, x, pts, {kPoints}), call('N', n, x, pts, {kPolyline}),
            call('D', n, x, pts, {kPoints, r2, tol}), call('D', n, x, pts, {kPolyline, r2, tol})}) {
        out.ints({o.result, o.ierr}).reals(o.o, 3);
      }
    }
    return out;
  };
  EXPECT_EQ(rounds_differing_across_threads(run, 200), 0);
}
