// tests/closest/closest_thread_test.cpp -- the closest-point routines called from several
// threads at once give, call for call, the answers of a single thread.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <thread>
#include <vector>

#include "closest/closest_api.h"
#include "random_inputs.h"
#include "support/recording_services.h"

namespace {

// One call of each routine on one random case; every output as bits, with the codes.
struct Case {
  std::int32_t n, m;
  std::vector<double> a, b, x, pts;
  double r2, tol;
};

using Answer = std::vector<std::uint64_t>;

Answer run(const Case& c) {
  Answer out;
  std::int32_t n = c.n, m = c.m, k = 2, ierr = -1, index = -7;
  double d2 = -1, t1 = -1, t2 = -1, coords[2] = {0, 0};
  auto keep = [&](std::int32_t result, std::initializer_list<double> v) {
    out.push_back(static_cast<std::uint64_t>(result) << 32 | static_cast<std::uint32_t>(ierr));
    for (double d : v) out.push_back(bits(d));
  };
  keep(ynoall(&n, c.a.data(), c.b.data(), &d2, &t1, &t2, &ierr), {d2, t1, t2});
  keep(ynoal2(&n, c.a.data(), c.b.data(), &d2, &t1, &t2, &ierr), {d2, t1, t2});
  keep(ynoapl(&n, c.x.data(), c.a.data(), &d2, &t1, &ierr), {d2, t1});
  keep(ynoaot(&n, &k, c.x.data(), c.a.data(), c.b.data(), &d2, coords, &ierr),
       {d2, coords[0], coords[1]});
  for (std::int32_t mode : {8466, 8467}) {
    index = -7;
    keep(ynoaon(&n, c.x.data(), &m, c.pts.data(), &mode, &d2, &index, &t1, &ierr),
         {d2, t1, static_cast<double>(index)});
    index = -7;
    keep(ynoaod(&n, c.x.data(), &m, c.pts.data(), &mode, &c.r2, &c.tol, &d2, &index, &t1, &ierr),
         {d2, t1, static_cast<double>(index)});
  }
  return out;
}

std::vector<Case> make_cases() {
  std::mt19937_64 rng(test_seed("ClosestThreads", 66066));
  std::vector<Case> cases;
  for (int i = 0; i < 60; ++i) {
    Case c;
    c.n = 2 + i % 4;
    c.m = 2 + (i * 7) % 300;
    c.a = uniform(rng, 2 * c.n, -1, 1);
    c.b = uniform(rng, 2 * c.n, -1, 1);
    c.x = uniform(rng, c.n, -1, 1);
    c.pts = uniform(rng, static_cast<std::size_t>(c.n) * c.m, -1, 1);
    c.r2 = 0.05 * (i % 5);
    c.tol = 0.01 * (i % 3);
    if (i % 10 == 9) c.x[0] = std::numeric_limits<double>::quiet_NaN();  // nothing is found
    cases.push_back(c);
  }
  return cases;
}

}  // namespace

TEST(ClosestThreads, ConcurrentCallsMatchSingleThreadedAnswers) {
  const std::vector<Case> cases = make_cases();
  std::vector<Answer> expected;
  for (const Case& c : cases) expected.push_back(run(c));

  constexpr int kThreads = 4, kRounds = 20;
  std::vector<int> mismatches(kThreads, 0);
  std::vector<std::thread> pool;
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, &cases, &expected, &mismatches] {
      for (int r = 0; r < kRounds; ++r) {
        // Each thread walks the cases in its own order, so different calls overlap.
        for (std::size_t i = 0; i < cases.size(); ++i) {
          const std::size_t j = (i * (2 * t + 1) + r) % cases.size();
          if (run(cases[j]) != expected[j]) ++mismatches[t];
        }
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(mismatches[t], 0) << "thread " << t;
}
