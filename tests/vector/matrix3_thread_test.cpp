// tests/vector/matrix3_thread_test.cpp -- the routines that keep results between calls, used
// from several threads at once: each thread sees only its own kept values.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "support/recording_services.h"
#include "vector/vector_api.h"

TEST(KeptResultsThreads, EachThreadSeesOnlyItsOwnResults) {
  // Thread t works with the scale s = 2^t, so every result is exact and differs between
  // threads. fmat1 after a singular matrix gives back this thread's last inverse (zeros on a
  // fresh thread); inmat2 and tr2can build their results in per-thread storage.
  constexpr int kThreads = 4, kRounds = 300;
  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> pool;
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, &failures] {
      const double s = 1 << t, zero[9] = {};
      const double m[9] = {s, 0, 0, 0, s, 0, 0, 0, s}, a2[6] = {s, 0, 0, s, s, -s};
      const double flip[6] = {s, 0, 0, -s, 0, 0}, conic[7] = {0.5, 1, 1, 1, 0, 1, 2};
      double b[9], c[7];
      std::int32_t flag = -1;
      fmat1(zero, b, &flag);
      for (double v : b) failures[t] += bits(v) != bits(0.0);
      for (int r = 0; r < kRounds; ++r) {
        fmat1(m, b, &flag);
        fmat1(zero, b, &flag);
        failures[t] += flag != 1 || b[0] != 1 / s || b[4] != 1 / s;
        inmat2(a2, b, &flag);
        failures[t] += b[0] != 1 / s || b[4] != -1.0;
        tr2can(conic, flip, c);
        failures[t] += c[1] != s || c[2] != -s || c[3] != s;
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
}
