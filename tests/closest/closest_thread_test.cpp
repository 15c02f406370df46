// tests/closest/closest_thread_test.cpp -- the closest-point routines called from two threads
// at once give, call for call, the answers of a single thread.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "closest/closest_api.h"
#include "random_inputs.h"
#include "support/thread_compare.h"

namespace {

struct Case {
  std::int32_t n, m;
  std::vector<double> a, b, x, pts;
  double r2, tol;
};

// Random cases of dimensions 2 to 5, every tenth with a NaN in X (nothing is found).
std::vector<Case> make_cases(std::uint64_t seed) {
  std::mt19937_64 rng(seed);
  std::vector<Case> cases;
  for (int i = 0; i < 30; ++i) {
    const std::int32_t n = 2 + i % 4, m = 2 + (i * 7) % 300;
    cases.push_back({n, m, uniform(rng, 2 * n, -1, 1), uniform(rng, 2 * n, -1, 1),
                     uniform(rng, n, -1, 1), uniform(rng, std::size_t(n) * m, -1, 1),
                     0.05 * (i % 5), 0.01 * (i % 3)});
    if (i % 10 == 9) cases.back().x[0] = std::numeric_limits<double>::quiet_NaN();
  }
  return cases;
}

}  // namespace

TEST(ClosestThreads, ConcurrentCallsMatchSingleThreadedAnswers) {
  const std::uint64_t seed = test_seed("ClosestThreads", 66066);
  const std::vector<Case> sets[2] = {make_cases(seed), make_cases(seed + 1)};
  const Sequence run = [&sets](int variant) {
    Answer out;
    for (const Case& c : sets[variant]) {
      std::int32_t n = c.n, m = c.m, k = 2, ierr = -1, r, index;
      double d[3] = {-1, -1, -1};
      r = ynoall(&n, c.a.data(), c.b.data(), &d[0], &d[1], &d[2], &ierr);
      out.ints({r, ierr}).reals(d, 3);
      r = ynoal2(&n, c.a.data(), c.b.data(), &d[0], &d[1], &d[2], &ierr);
      out.ints({r, ierr}).reals(d, 3);
      r = ynoapl(&n, c.x.data(), c.a.data(), &d[0], &d[1], &ierr);
      out.ints({r, ierr}).reals(d, 2);
      r = ynoaot(&n, &k, c.x.data(), c.a.data(), c.b.data(), &d[0], &d[1], &ierr);
      out.ints({r, ierr}).reals(d, 3);
      for (std::int32_t mode : {8466, 8467}) {
        index = -7;
        r = ynoaon(&n, c.x.data(), &m, c.pts.data(), &mode, &d[0], &index, &d[1], &ierr);
        out.ints({r, ierr, index}).reals(d, 2);
        index = -7;
        r = ynoaod(&n, c.x.data(), &m, c.pts.data(), &mode, &c.r2, &c.tol, &d[0], &index, &d[1],
                   &ierr);
        out.ints({r, ierr, index}).reals(d, 2);
      }
    }
    return out;
  };
  EXPECT_EQ(rounds_differing_across_threads(run, 200), 0);
}
