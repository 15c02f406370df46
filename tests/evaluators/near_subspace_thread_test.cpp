// tests/evaluators/near_subspace_thread_test.cpp -- yngcoa's visit counter is per thread.
#include <gtest/gtest.h>

#include <cstdint>
#include <thread>

#include "near_subspace_probe.h"

TEST(YngcoaThreads, EachThreadKeepsItsOwnVisitCounter) {
  // This thread leaves its counter at 4; a fresh thread has never visited a point, so its
  // counter designates point 1; after it visits up to point 2 this thread still sees 4.
  ASSERT_EQ(test_axis(6, points_off_axis(6, {4}), 17), 0);
  std::int32_t fresh = -1, after = -1;
  std::thread other([&] {
    fresh = counter_point(6);
    test_axis(6, points_off_axis(6, {2}), 17);
    after = counter_point(6);
  });
  other.join();
  EXPECT_EQ(fresh, 1);
  EXPECT_EQ(after, 2);
  EXPECT_EQ(counter_point(6), 4);
}

TEST(YngcoaThreads, ConcurrentCallsDoNotDisturbEachOther) {
  constexpr int kThreads = 4, kRounds = 300;
  int failures[kThreads] = {};
  std::thread pool[kThreads];
  for (int t = 0; t < kThreads; ++t) {
    pool[t] = std::thread([t, &failures] {
      const std::int32_t m = 8, mine = 1 + t;
      for (int r = 0; r < kRounds; ++r) {
        if (test_axis(m, points_off_axis(m, {mine, 8}), 17) != 0) ++failures[t];
        if (counter_point(m) != mine) ++failures[t];
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
}
