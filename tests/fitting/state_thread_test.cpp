// tests/fitting/state_thread_test.cpp -- the fitting routines, whose codes are kept per
// thread, run on two threads at once with different point sets: each thread gets exactly its
// single-threaded results, codes and frames.
#include <gtest/gtest.h>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"
#include "support/thread_compare.h"

namespace {

// Per variant: four points near a tilted plane, and two coincident points (every fit fails).
const double kPoints[2][12] = {{0, 0, 0.125, 2.385, 0, 1.25, 0, 1.5, -0.75, 3.25, 2.5, 0.5},
                               {1, -2, 3, -1.5, 0.25, 2, 4.125, 1, -0.5, 0.5, 3.5, 1.75}};
const double kSame[2][6] = {{2, -1, 0.5, 2, -1, 0.5}, {-3.25, 7, 1.5, -3.25, 7, 1.5}};

Answer fit(int v) {
  const std::int32_t ld = 3, four = 4, two = 2;
  const double tol = 1e-3;
  Answer out;
  RecordedFrames frames;
  double g[3], s[6], l[3], line[6], p[5], e = -1, dir[3];
  std::int32_t k = -1;
  const std::int32_t r1 = solmpr(kPoints[v], &ld, &four, &tol, g, s, l);
  const std::int32_t r2 = clvcpr(s, &l[2], dir);
  const std::int32_t r3 = drmoyn(kPoints[v], &ld, &four, &tol, line);
  const std::int32_t r4 = plmoyn(kPoints[v], &ld, &four, &tol, &p[0], &p[1], &p[2], &p[3], &p[4]);
  ecrdrt(kPoints[v], &ld, &four, line, &e, &k);
  const std::int32_t r5 = drmoyn(kSame[v], &ld, &two, &tol, line);
  out.reals(g, 3).reals(s, 6).reals(l, 3).reals(dir, 3).reals(line, 6).reals(p, 5).reals(&e, 1);
  out.ints({r1, r2, r3, r4, r5, k});
  for (const Frame& f : frames.frames()) out.ints({f.code, f.len, static_cast<std::int64_t>(f.name[1])});
  return out;
}

TEST(FittingStateThreads, TwoThreadsGetTheirSingleThreadedAnswers) {
  ASSERT_FALSE(fit(0) == fit(1));
  EXPECT_EQ(rounds_differing_across_threads(fit), 0);
}

}  // namespace
