// tests/evaluators/near_subspace_thread_test.cpp -- yngcoa's visit counter is per thread.
#include <gtest/gtest.h>

#include <thread>

#include "near_subspace_probe.h"
#include "support/thread_compare.h"

TEST(YngcoaThreads, EachThreadKeepsItsOwnVisitCounter) {
  std::int32_t fresh = -1;  // a thread that never visited a point tests point 1
  std::thread([&] { fresh = axis(3, {1}, 0); }).join();
  EXPECT_EQ(fresh, 0);
  // Variant v leaves its counter at 2 + v, then reads it back.
  const auto run = [](int v) { return Answer().ints({axis(6, {2 + v}, 17), axis(6, {2}, 0)}); };
  ASSERT_FALSE(run(0) == run(1));
  EXPECT_EQ(rounds_differing_across_threads(run), 0);
}
