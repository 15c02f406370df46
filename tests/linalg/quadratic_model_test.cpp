// tests/linalg/quadratic_model_test.cpp -- checks for linalg/quadratic_model.cpp: ynxxlv.
#include <gtest/gtest.h>

#include <cstdint>

#include "linalg/linalg_api.h"
#include "support/recording_services.h"

namespace {

TEST(Ynxxlv, ExtremesOfEachComponentOverTheUnitInterval) {
  // Components worked out by hand, q(s) = a + s (d + e s), e = (b - a) - d:
  //   1: a 0, d 1, b 0: e = -1, top 0.25 at s = 0.5; the bottom 0 at s = 0 and 1 keeps s = 0
  //   2: a 1, d -4, b 1: e = 4, bottom 0 at 0.5; the top 1 keeps s = 0
  //   3: a 0, d 2, b 2: e = 0 (a line): 0 at 0, 2 at 1
  //   4: a 0, d 1, b 3: e = 2, stationary at -0.25, outside: 0 at 0, 3 at 1
  //   5: a 3, d -1, b -0.5: e = -2.5, stationary at -0.2: 3 at 0, -0.5 at 1
  const std::int32_t n = 5;
  const double a[5] = {0, 1, 0, 0, 3}, d[5] = {1, -4, 2, 1, -1}, b[5] = {0, 1, 2, 3, -0.5};
  const double want_e[5] = {-1, 4, 0, 2, -2.5};
  const double want_ext[10] = {0, 0, 0, 0, -0.5, 0.25, 1, 2, 3, 3};
  const double want_s[10] = {0, 0.5, 0, 0, 1, 0.5, 0, 1, 1, 0};
  double e[5], ext[10], sext[10];
  std::int32_t ierr = -1;
  ASSERT_EQ(ynxxlv(&n, a, d, b, e, ext, sext, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  for (int i = 0; i < 5; ++i) EXPECT_EQ(bits(e[i]), bits(want_e[i])) << i;
  for (int i = 0; i < 10; ++i) {
    EXPECT_EQ(bits(ext[i]), bits(want_ext[i])) << i;
    EXPECT_EQ(bits(sext[i]), bits(want_s[i])) << i;
  }
}

TEST(Ynxxlv, CountBelowOneIs4712WithOutputsUntouched) {
  const std::int32_t n = 0;
  const double v[1] = {1.0};
  double e[1] = {-3.5}, ext[2] = {-3.5, -3.5}, sext[2] = {-3.5, -3.5};
  std::int32_t ierr = -1;
  EXPECT_EQ(ynxxlv(&n, v, v, v, e, ext, sext, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(bits(e[0]), bits(-3.5));
  EXPECT_EQ(bits(ext[1]), bits(-3.5));
}

}  // namespace
