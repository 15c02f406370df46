// tests/evaluators/affine_inverse_test.cpp -- checks for evaluators/affine_inverse.cpp: ynaitt.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "evaluators/evaluators_api.h"
#include "support/recording_services.h"

TEST(Ynaitt, ArgumentErrorsLeaveTheOutputsUntouched) {
  RecordedFrames frames;
  std::int32_t n = 0, kind = 5, ierr = -1;
  double m = -9, c = -9;
  EXPECT_EQ(ynaitt(&n, nullptr, nullptr, &kind, &m, &c, &ierr), 1);
  EXPECT_EQ(ierr, 4712);  // n is tested before the kind
  n = 1;
  for (std::int32_t k : {2, 7}) {
    kind = k;
    EXPECT_EQ(ynaitt(&n, nullptr, nullptr, &kind, &m, &c, &ierr), 1);
    EXPECT_EQ(ierr, 4718);
  }
  EXPECT_EQ(m, -9.0);
  EXPECT_EQ(c, -9.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynaitt, GeneralKindInvertsAndNegativeKindsTakeTheSamePath) {
  std::int32_t n = 1, kind = 1, ierr = -1;
  double a = 2, b = 4, m = 0, c = 0;
  ASSERT_EQ(ynaitt(&n, &a, &b, &kind, &m, &c, &ierr), 0);
  EXPECT_EQ(m, 0.5);
  EXPECT_EQ(c, -2.0);
  n = 2;
  kind = -3;
  const double a2[4] = {2, 0, 0, 4}, b2[2] = {1, 1};
  double m2[4], c2[2];
  ASSERT_EQ(ynaitt(&n, a2, b2, &kind, m2, c2, &ierr), 0);
  EXPECT_EQ(m2[0], 0.5);
  EXPECT_EQ(m2[3], 0.25);
  EXPECT_EQ(c2[0], -0.5);
  EXPECT_EQ(c2[1], -0.25);
}

TEST(Ynaitt, OrthogonalKindTransposesWithoutElimination) {
  // Quarter turn about z: M = A^T and c = -A^T b = -(2, -1, 3).
  std::int32_t n = 3, kind = 0, ierr = -1;
  const double a[9] = {0, 1, 0, -1, 0, 0, 0, 0, 1}, b[3] = {1, 2, 3};
  double m[9], c[3];
  ASSERT_EQ(ynaitt(&n, a, b, &kind, m, c, &ierr), 0);
  const double mt[9] = {0, -1, 0, 1, 0, 0, 0, 0, 1};
  for (int e = 0; e < 9; ++e) EXPECT_EQ(m[e], mt[e]) << e;
  EXPECT_EQ(c[0], -2.0);
  EXPECT_EQ(c[1], 1.0);
  EXPECT_EQ(c[2], -3.0);
  // A singular matrix is not looked at with kind 0: its transpose is returned, and c is
  // accumulated column by column: c(1) = (-1 - h) - h = -1 with h = 2^-53 (ties to
  // even), where -1 - (h + h) would be -1 - 2^-52.
  const double h = 0x1p-53;
  const double s[9] = {1, h, h, 1, h, h, 0, 0, 0}, ones[3] = {1, 1, 1};
  ASSERT_EQ(ynaitt(&n, s, ones, &kind, m, c, &ierr), 0);
  EXPECT_EQ(c[0], -1.0);
  EXPECT_EQ(m[3], h);  // M(1,2) = A(2,1)
}

TEST(Ynaitt, InversionFailuresKeepTheCodeOfTheInversion) {
  std::int32_t n = 3, kind = 1, ierr = -1;
  const double singular[9] = {1, 2, 3, 2, 4, 6, 0, 1, 1};
  const double b[3] = {1, 2, 3};
  double m[9], c[3] = {-9, -9, -9};
  EXPECT_EQ(ynaitt(&n, singular, b, &kind, m, c, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(c[0], -9.0);
  n = 21;
  std::vector<double> big(21 * 21, 0.0), mb(21 * 21), bb(21, 1.0), cb(21);
  for (int i = 0; i < 21; ++i) big[i + 21 * i] = 1.0;
  EXPECT_EQ(ynaitt(&n, big.data(), bb.data(), &kind, mb.data(), cb.data(), &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  kind = 0;  // the orthogonal path has no capacity limit
  ASSERT_EQ(ynaitt(&n, big.data(), bb.data(), &kind, mb.data(), cb.data(), &ierr), 0);
  EXPECT_EQ(cb[20], -1.0);
}
