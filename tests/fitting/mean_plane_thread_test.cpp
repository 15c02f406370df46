// tests/fitting/mean_plane_thread_test.cpp -- the fitting routines' codes are per thread: a
// failing fit on one thread and a succeeding one on another record only their own frames.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"

TEST(FittingThreads, CodesAndFramesStayWithTheirThread) {
  constexpr int kRounds = 300;
  const std::int32_t ld = 3;
  const double tol = 1e-3;
  int bad_fail = 0, bad_ok = 0;
  std::thread failing([&] {
    const double same[6] = {2, -1, 0.5, 2, -1, 0.5};
    const std::int32_t n = 2;
    const std::vector<Frame> want = {{1, " SOLMPR;", 8}, {1, " DRMOYN;", 8}};
    for (int r = 0; r < kRounds; ++r) {
      RecordedFrames frames;
      double line[6];
      if (drmoyn(same, &ld, &n, &tol, line) != 1 || frames.frames() != want) ++bad_fail;
    }
  });
  std::thread succeeding([&] {
    const double pts[12] = {0, 0, 0, 1, 2, 2, 2, 4, 4, 3, 6, 6};
    const double sq[12] = {0, 0, 0, 1, 0, 0, 1, 1, 0, 0, 1, 0};
    const std::int32_t n = 4;
    for (int r = 0; r < kRounds; ++r) {
      RecordedFrames frames;
      double line[6], a, b, c, d, e;
      if (drmoyn(pts, &ld, &n, &tol, line) != 0) ++bad_ok;
      if (plmoyn(sq, &ld, &n, &tol, &a, &b, &c, &d, &e) != 0) ++bad_ok;
      if (!frames.empty()) ++bad_ok;
    }
  });
  failing.join();
  succeeding.join();
  EXPECT_EQ(bad_fail, 0);
  EXPECT_EQ(bad_ok, 0);
}
