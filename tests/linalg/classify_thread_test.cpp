// tests/linalg/classify_thread_test.cpp -- ynmnmr and its tests from several threads at once:
// the level words and the products kept per thread never mix.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "linalg/linalg_api.h"

TEST(YnmnmrThreads, EachThreadGetsTheKindOfItsOwnMatrix) {
  // Four kinds, one per thread, each reached through a different path: the identity
  // (level 4), a homothety (level 3), an affinity (wnmnm4's products), a projector
  // (wnmnm3's product).
  struct Job {
    double a[4];
    std::int32_t want;
  };
  const Job jobs[4] = {{{1, 0, 0, 1}, 0x111105},
                       {{2, 0, 0, 2}, 0x12104},
                       {{1, 0, 0, 3}, 0x3103},
                       {{1, 0, 1, 0}, 0x2203}};
  const std::int32_t codes[11] = {0x102,   0x202,   0x1103,  0x2103,  0x3103,  0x1203,
                                  0x2203,  0x11104, 0x21104, 0x12104, 0x111105};
  constexpr int kRounds = 300;
  std::vector<int> failures(4, 0);
  std::vector<std::thread> pool;
  for (int t = 0; t < 4; ++t) {
    pool.emplace_back([t, &jobs, &codes, &failures] {
      const std::int32_t n = 2, m = 11;
      for (int r = 0; r < kRounds; ++r) {
        std::int32_t index = -1, ierr = -1;
        failures[t] += ynmnmr(&n, jobs[t].a, &m, codes, &index, &ierr) != 0;
        failures[t] += index < 1 || codes[index - 1] != jobs[t].want;
      }
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < 4; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
}
