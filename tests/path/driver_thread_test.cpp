// tests/path/driver_thread_test.cpp -- two paths traced by ynchem at once, on two threads.
#include <gtest/gtest.h>

#include <cstdint>
#include <thread>
#include <vector>

#include "curves.h"

namespace {

// The points and tangents of the circle (n = 2) or of Viviani's curve (n = 3), K = 4.
std::vector<unsigned char> trace(std::int32_t n) {
  Curve c(n == 2 ? Curve::kCircle : Curve::kViviani, n);
  const double xd2[4] = {1, 0, 0, 1}, xd3[6] = {0, 0, 2, 0, 1, 0}, tol = 0.01, eps = 1e-20;
  double box[6], pas[6];
  for (std::int32_t i = 0; i < n; ++i)
    box[i] = -3, box[n + i] = 3, pas[i] = 1e-4, pas[n + i] = 0.25;
  const std::int32_t mode = 4, store = 2 + 8;
  std::int32_t itab = 0, ierr = -1, count = 0;
  if (ynchem(&c, &n, eval_curve, &eps, n == 2 ? xd2 : xd3, box, pas, &mode, &tol, &store, &itab,
             &ierr) != 0) {
    return {};
  }
  auto points = read_kind(itab, 23, &count);
  yncend(&itab, &ierr);
  return points;
}

TEST(YnchemThreads, TwoPathsAtOnceMatchTheirSequentialRuns) {
  const auto circle = trace(2), viviani = trace(3);
  ASSERT_FALSE(circle.empty() || viviani.empty());
  const std::int64_t live0 = orvq7sys_table_live();
  int mismatches[2] = {0, 0};
  auto rounds = [&](std::int32_t n, const std::vector<unsigned char>& want, int* bad) {
    for (int k = 0; k < 10; ++k) *bad += trace(n) != want;
  };
  std::thread a(rounds, 2, std::cref(circle), &mismatches[0]);
  std::thread b(rounds, 3, std::cref(viviani), &mismatches[1]);
  a.join();
  b.join();
  EXPECT_EQ(mismatches[0], 0);
  EXPECT_EQ(mismatches[1], 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

}  // namespace
