// tests/closest/subspace_test.cpp -- checks for ynoaot, ynraoo and ynjont.
#include <gtest/gtest.h>

#include "closest/closest_api.h"
#include "support/real_checks.h"

namespace {
// Frame of space: origin Y and the directions e1, e3, so the subspace is the plane y = 0.25.
const double kY[3] = {0.5, 0.25, -1.0};
const double kU[6] = {1, 0, 0, 0, 0, 1};
const double kX[3] = {1.5, -2.25, 3.125};  // X - Y = (1, -2.5, 4.125)
}  // namespace

TEST(Ynoaot, InvalidCountsWriteOnlyTheCode) {
  RecordedFrames frames;
  const double in[9] = {1, 2, 3, 4, 5, 6, 7, 8, 9};
  for (auto [n, k] : {std::pair{0, 0}, {-1, 0}, {3, -1}, {3, 4}}) {
    double dist2 = -1.5, c[4] = {-2, -2, -2, -2}, x[4] = {-3, -3, -3, -3};
    std::int32_t ierr = -1, ierr2 = -1;
    EXPECT_EQ(ynoaot(&n, &k, in, in, in, &dist2, c, &ierr), 1);
    EXPECT_EQ(ynraoo(&n, &k, in, in, in, x, &ierr2), 1);
    EXPECT_EQ(ierr, 4712);
    EXPECT_EQ(ierr2, 4712);
    expect_bits(c, {-2.0, -2, -2, -2});
    expect_bits(x, {-3.0, -3, -3, -3});
    EXPECT_EQ(dist2, -1.5);
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Ynoaot, ProjectionCoordinatesAndBackWithYnraoo) {
  std::int32_t n = 3, k = 2, ierr = -1;
  double dist2 = 0, c[2] = {0, 0};
  ASSERT_EQ(ynoaot(&n, &k, kX, kY, kU, &dist2, c, &ierr), 0);
  expect_bits(c, {1.0, 4.125});
  EXPECT_EQ(dist2, 6.25);               // (-2.5)^2
  double y[3] = {kY[0], kY[1], kY[2]};  // written over in place: the projection of X
  ASSERT_EQ(ynraoo(&n, &k, c, y, kU, y, &ierr), 0);
  expect_bits(y, {1.5, 0.25, 3.125});
  // No direction: the distance to Y, c untouched.
  k = 0;
  c[0] = -7.5;
  ASSERT_EQ(ynoaot(&n, &k, kX, kY, kU, &dist2, c, &ierr), 0);
  EXPECT_EQ(dist2, 24.265625);  // 1 + 6.25 + 17.015625
  EXPECT_EQ(c[0], -7.5);
  // A frame that is not orthonormal gives the plain dot products: u = (1, 1), X - Y = (3, 1)
  // gives c = 4 and the residual (-1, -3).
  n = 2, k = 1;
  const double u[2] = {1, 1}, x[2] = {3, 1}, o[2] = {0, 0};
  ASSERT_EQ(ynoaot(&n, &k, x, o, u, &dist2, c, &ierr), 0);
  EXPECT_EQ(c[0], 4.0);
  EXPECT_EQ(dist2, 10.0);
}

TEST(Ynjont, CoordinatesOfSeveralPointsAndTheUncheckedCount) {
  const double pts[6] = {1.5, -2.25, 3.125, -0.5, 7.0, 0.0};
  std::int32_t n = 3, m = 2, k = 2, zero = 0, ierr = -1;
  double coords[4] = {0, 0, 0, 0};
  ASSERT_EQ(ynjont(&n, &m, pts, &k, kY, kU, coords, &ierr), 0);
  expect_bits(coords, {1.0, 4.125, -1.0, 1.0});
  for (std::int32_t kk : {0, -2}) {  // k is not checked: nothing is written
    double untouched[2] = {-6.5, -6.5};
    EXPECT_EQ(ynjont(&n, &m, pts, &kk, kY, kU, untouched, &ierr), 0);
    EXPECT_EQ(untouched[0], -6.5);
  }
  EXPECT_EQ(ynjont(&zero, &m, pts, &k, kY, kU, coords, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  ierr = -1;
  EXPECT_EQ(ynjont(&n, &zero, pts, &k, kY, kU, coords, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(coords[0], 1.0);
}
