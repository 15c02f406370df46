// tests/path/driver_thread_test.cpp -- two paths traced by ynchem at once, on two threads.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <thread>
#include <vector>

#include "curves.h"

namespace {

// Traces the circle (n = 2) or Viviani's curve (n = 3) and returns its points and tangents.
std::vector<double> trace(std::int32_t n) {
  Curve c(n == 2 ? Curve::kCircle : Curve::kViviani, n);
  const double xd2[4] = {1, 0, 0, 1}, xd3[6] = {0, 0, 2, 0, 1, 0};
  double box[6], pas[6];
  for (std::int32_t i = 0; i < n; ++i) {
    box[i] = -3, box[n + i] = 3, pas[i] = 1e-4, pas[n + i] = 0.25;
  }
  const double tol[3] = {0.01, 0.01, 0.01}, eps = 1e-20;
  const std::int32_t mode = 4, store = 2 + 8;
  std::int32_t itab = 0, ierr = -1, count = 0;
  if (ynchem(&c, &n, eval_curve, &eps, n == 2 ? xd2 : xd3, box, pas, &mode, tol, &store, &itab,
             &ierr) != 0) {
    return {};
  }
  const auto bytes = read_kind(itab, 23, &count);
  std::vector<double> xt(bytes.size() / sizeof(double));
  std::memcpy(xt.data(), bytes.data(), bytes.size());
  yncend(&itab, &ierr);
  return xt;
}

TEST(YnchemThreads, TwoPathsAtOnceMatchTheirSequentialRuns) {
  const std::vector<double> circle = trace(2), viviani = trace(3);
  ASSERT_FALSE(circle.empty());
  ASSERT_FALSE(viviani.empty());
  const std::int64_t live0 = orvq7sys_table_live();
  constexpr int kRounds = 10;
  int mismatches[2] = {0, 0};
  std::thread a([&] {
    for (int k = 0; k < kRounds; ++k) mismatches[0] += trace(2) != circle;
  });
  std::thread b([&] {
    for (int k = 0; k < kRounds; ++k) mismatches[1] += trace(3) != viviani;
  });
  a.join();
  b.join();
  EXPECT_EQ(mismatches[0], 0);
  EXPECT_EQ(mismatches[1], 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}

}  // namespace
