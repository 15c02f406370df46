// tests/fitting/state_thread_test.cpp -- the fitting routines, whose codes are kept per
// thread, run on two threads at once with different point sets: each thread gets exactly its
// single-threaded results, codes and frames.
#include <gtest/gtest.h>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"
#include "support/thread_compare.h"

// Per variant: four points near a tilted plane, and two coincident points (every fit fails).
const double kPoints[2][12] = {{0, 0, 0.125, 2.385, 0, 1.25, 0, 1.5, -0.75, 3.25, 2.5, 0.5},
                               {1, -2, 3, -1.5, 0.25, 2, 4.125, 1, -0.5, 0.5, 3.5, 1.75}};
const double kSame[2][6] = {{2, -1, 0.5, 2, -1, 0.5}, {-3.25, 7, 1.5, -3.25, 7, 1.5}};

static Answer fit(int v) {
  const std::int32_t ld = 3, four = 4, two = 2;
  const double tol = 1e-3, *pts = kPoints[v];
  RecordedFrames frames;
  double g[3], s[6], l[3], dir[3], line[6], p[5];
  const std::int32_t r[5] = {solmpr(pts, &ld, &four, &tol, g, s, l), clvcpr(s, &l[2], dir),
                             drmoyn(pts, &ld, &four, &tol, line),
                             plmoyn(pts, &ld, &four, &tol, &p[0], &p[1], &p[2], &p[3], &p[4]),
                             drmoyn(kSame[v], &ld, &two, &tol, line)};
  Answer out = Answer().reals(g, 3).reals(s, 6).reals(l, 3).reals(dir, 3).reals(line, 6);
  out.reals(p, 5).ints({r[0], r[1], r[2], r[3], r[4]});
  for (const Frame& f : frames.frames()) out.ints({f.code, f.len, f.name[1]});
  return out;
}

TEST(FittingStateThreads, TwoThreadsGetTheirSingleThreadedAnswers) {
  ASSERT_FALSE(fit(0) == fit(1));
  EXPECT_EQ(rounds_differing_across_threads(fit), 0);
}
