// tests/vector/matrix3_thread_test.cpp -- the routines that keep results between calls, used
// from several threads at once: each thread sees only its own kept values.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "support/recording_services.h"
#include "vector/vector_api.h"

TEST(Fmat1Threads, ASingularCallSeesOnlyItsOwnThreadsLastInverse) {
  // Thread t inverts (t + 1) I, then a singular matrix: it must get back 1 / (t + 1) on the
  // diagonal, never another thread's. A fresh thread with no regular call gets zeros.
  constexpr int kThreads = 4, kRounds = 300;
  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> pool;
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, &failures] {
      const double zero[9] = {};
      double b[9];
      std::int32_t flag = -1;
      fmat1(zero, b, &flag);
      for (double v : b) failures[t] += bits(v) != bits(0.0);
      const double s = t + 1;
      const double m[9] = {s, 0, 0, 0, s, 0, 0, 0, s};
      for (int r = 0; r < kRounds; ++r) {
        fmat1(m, b, &flag);
        failures[t] += flag != 0;
        fmat1(zero, b, &flag);
        failures[t] += flag != 1 || b[0] != 1.0 / s || b[4] != 1.0 / s || b[1] != 0.0;
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
}

TEST(KeptResultsThreads, ConcurrentCallsGiveEachThreadItsOwnResult) {
  // inmat2, inmat3, fmat3, tr2can and xptpln build their results in per-thread storage
  // before copying them out; each thread's inputs differ, so a shared buffer would show.
  constexpr int kThreads = 4, kRounds = 300;
  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> pool;
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, &failures] {
      const double s = 1 << t;  // powers of two: every inverse is exact
      const double a2[6] = {s, 0, 0, s, s, -s};
      const double a3[12] = {s, 0, 0, 0, s, 0, 0, 0, s, s, 0, 0};
      const double flip[6] = {s, 0, 0, -s, 0, 0};
      const double conic[7] = {0.5, 1, 1, 1, 0, 1, 2};
      const double o[9] = {0, 1, 0, 0, 0, 1, s, 0, 0};  // plane z = s
      const double p[3] = {1, 2, 3};
      for (int r = 0; r < kRounds; ++r) {
        double b[12], c[7], q[3];
        std::int32_t flag = -1, status = -1;
        inmat2(a2, b, &flag);
        failures[t] += b[0] != 1 / s || b[4] != -1.0 || b[5] != 1.0;
        inmat3(a3, b, &flag);
        failures[t] += b[0] != 1 / s || b[9] != -1.0;
        fmat3(a3, b);
        failures[t] += b[9] != -s * s;
        tr2can(conic, flip, c);
        failures[t] += c[1] != s || c[2] != -s || c[3] != s;
        xptpln(p, o, q, &status);
        failures[t] += q[2] != s;
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
}
