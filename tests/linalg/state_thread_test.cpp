// tests/linalg/state_thread_test.cpp -- the classification routines that keep their products
// and level words per thread, run on two threads at once with different matrices: each thread
// gets exactly its single-threaded answers.
#include <gtest/gtest.h>

#include "linalg/linalg_api.h"
#include "support/thread_compare.h"

TEST(ClassifyStateThreads, TwoThreadsGetTheirSingleThreadedAnswers) {
  // Per variant, of order 3: a projector (wnmnm3 flag 2), an affinity 2.5 I - 1.5 P (wnmnm4
  // flag 1), and a matrix that is neither.
  // clang-format off
  static const double kMats[2][3][9] = {
      {{1, 0, 0, 0, 1, 0, 0, 0, 0}, {1, 0, 0, 0, 1, 0, 0, 0, 2.5}, {2, 1, 0, 0, 3, 1, 1, 0, 4}},
      {{0, 0, 0, 0, 1, 0, 0, 0, 1}, {-.75, 0, 0, 0, 1, 0, 0, 0, 1}, {0, 1, 0, -1, 0, 0, 0, 0, 1}}};
  static const std::int32_t kCodes[11] = {0x102, 0x202, 0x1103, 0x2103, 0x3103, 0x1203, 0x2203,
                                          0x11104, 0x21104, 0x12104, 0x111105};
  // clang-format on
  const auto classify = [](int v) {
    Answer out;
    for (const double* a : kMats[v]) {
      std::int32_t n = 3, m = 11, f3 = -1, f4 = -1, index = -1, e3 = -1, e4 = -1, e = -1;
      wnmnm3(&n, a, &f3, &e3), wnmnm4(&n, a, &f4, &e4), ynmnmr(&n, a, &m, kCodes, &index, &e);
      out.ints({f3, e3, f4, e4, index, e});
    }
    return out;
  };
  ASSERT_FALSE(classify(0) == classify(1));  // a mix-up between the threads would show
  EXPECT_EQ(rounds_differing_across_threads(classify), 0);
}
