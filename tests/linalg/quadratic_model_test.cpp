// tests/linalg/quadratic_model_test.cpp -- checks for linalg/quadratic_model.cpp: ynxxlv.
#include <gtest/gtest.h>

#include <cstdint>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"

TEST(Ynxxlv, ExtremesOfEachComponentOverTheUnitInterval) {
  // Components worked out by hand, q(s) = a + s (d + e s), e = (b - a) - d:
  //   1: a 0, d 1, b 0: e = -1, top 0.25 at s = 0.5; the bottom 0 at s = 0 and 1 keeps s = 0
  //   2: a 1, d -4, b 1: e = 4, bottom 0 at 0.5; the top 1 keeps s = 0
  //   3: a 0, d 2, b 2: e = 0 (a line): 0 at 0, 2 at 1
  //   4: a 0, d 1, b 3: e = 2, stationary at -0.25, outside: 0 at 0, 3 at 1
  //   5: a 3, d -1, b -0.5: e = -2.5, stationary at -0.2: 3 at 0, -0.5 at 1
  std::int32_t n = 5, ierr = -1;
  const double a[5] = {0, 1, 0, 0, 3}, d[5] = {1, -4, 2, 1, -1}, b[5] = {0, 1, 2, 3, -0.5};
  const double want[25] = {-1, 4, 0, 2,   -2.5, 0, 0, 0,   0, -0.5, 0.25, 1, 2,
                           3,  3, 0, 0.5, 0,    0, 1, 0.5, 0, 1,    1,    0};  // e, ext, sext
  double out[25];
  ASSERT_TRUE(ynxxlv(&n, a, d, b, out, out + 5, out + 15, &ierr) == 0 && ierr == 0);
  for (int i = 0; i < 25; ++i) EXPECT_EQ(bits(out[i]), bits(want[i])) << i;
  n = 0;  // nothing written
  EXPECT_TRUE(ynxxlv(&n, a, d, b, out, out + 5, out + 15, &ierr) == 1 && ierr == 4712);
  for (int i = 0; i < 25; ++i) EXPECT_EQ(bits(out[i]), bits(want[i])) << i;
}
