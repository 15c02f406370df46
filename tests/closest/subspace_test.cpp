// tests/closest/subspace_test.cpp -- checks for closest/subspace.cpp (ynoaot, ynraoo, ynjont).
#include <gtest/gtest.h>

#include <cmath>
#include <tuple>

#include "closest/closest_api.h"
#include "support/recording_services.h"

namespace {
// Frame of space: origin Y and the directions e1, e3 (columns), so the subspace is the plane
// y = 0.25 through Y.
const double kY[3] = {0.5, 0.25, -1.0};
const double kU[6] = {1, 0, 0, 0, 0, 1};
}  // namespace

class FrameArgs : public ::testing::TestWithParam<std::tuple<std::int32_t, std::int32_t>> {};

TEST_P(FrameArgs, InvalidDimensionOrDirectionCountWritesOnlyTheCode) {
  RecordedFrames frames;
  const auto [n, k] = GetParam();
  const double in[9] = {1, 2, 3, 4, 5, 6, 7, 8, 9};
  double dist2 = -1.5, c[4] = {-2, -2, -2, -2}, x[4] = {-3, -3, -3, -3};
  std::int32_t ierr = -1;
  EXPECT_EQ(ynoaot(&n, &k, in, in, in, &dist2, c, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  ierr = -1;
  EXPECT_EQ(ynraoo(&n, &k, in, in, in, x, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(dist2, -1.5);
  for (int i = 0; i < 4; ++i) {
    EXPECT_EQ(c[i], -2.0);
    EXPECT_EQ(x[i], -3.0);
  }
  EXPECT_TRUE(frames.empty());
}

INSTANTIATE_TEST_SUITE_P(Ynoaot, FrameArgs,
                         ::testing::Values(std::make_tuple(0, 0), std::make_tuple(-1, 0),
                                           std::make_tuple(3, -1), std::make_tuple(3, 4)));

TEST(Ynoaot, ProjectionOnAPlaneAndBackWithYnraoo) {
  const std::int32_t n = 3, k = 2;
  const double x[3] = {1.5, -2.25, 3.125};
  double dist2 = 0, c[2] = {0, 0}, back[3] = {0, 0, 0};
  std::int32_t ierr = -1;
  ASSERT_EQ(ynoaot(&n, &k, x, kY, kU, &dist2, c, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  EXPECT_EQ(c[0], 1.0);    // (X - Y).e1
  EXPECT_EQ(c[1], 4.125);  // (X - Y).e3
  EXPECT_EQ(dist2, 6.25);  // (-2.5)^2
  ierr = -1;
  ASSERT_EQ(ynraoo(&n, &k, c, kY, kU, back, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  EXPECT_EQ(back[0], 1.5);  // the projection of X
  EXPECT_EQ(back[1], 0.25);
  EXPECT_EQ(back[2], 3.125);
}

TEST(Ynoaot, NoDirectionGivesTheDistanceToTheOriginAndLeavesC) {
  const std::int32_t n = 3, k = 0;
  const double x[3] = {1.5, -2.25, 3.125};
  double dist2 = 0, c[1] = {-7.5};
  std::int32_t ierr = -1;
  ASSERT_EQ(ynoaot(&n, &k, x, kY, kU, &dist2, c, &ierr), 0);
  EXPECT_EQ(dist2, 24.265625);  // 1 + 6.25 + 17.015625
  EXPECT_EQ(c[0], -7.5);
  double x2[3] = {9, 9, 9};
  ASSERT_EQ(ynraoo(&n, &k, c, kY, kU, x2, &ierr), 0);
  EXPECT_EQ(x2[0], 0.5);
  EXPECT_EQ(x2[1], 0.25);
  EXPECT_EQ(x2[2], -1.0);
}

TEST(Ynoaot, FullOrthonormalBasisLeavesNothingUpToRounding) {
  // Rotation by the 3-4-5 angle: the residual of X - Y is rounding only.
  const std::int32_t n = 2, k = 2;
  const double u[4] = {0.6, 0.8, -0.8, 0.6}, y[2] = {0.25, -0.5}, x[2] = {2.25, 1.0};
  double dist2 = -1, c[2];
  std::int32_t ierr = -1;
  ASSERT_EQ(ynoaot(&n, &k, x, y, u, &dist2, c, &ierr), 0);
  EXPECT_NEAR(c[0], 2.4, 1e-15);  // (2, 1.5).(0.6, 0.8)
  EXPECT_NEAR(c[1], -0.7, 1e-15);  // (2, 1.5).(-0.8, 0.6)
  EXPECT_LT(dist2, 1e-30);
}

TEST(Ynoaot, FrameThatIsNotOrthonormalGivesPlainDotProducts) {
  // u = (1, 1): c = (3, 1).(1, 1) = 4, residual (3 - 4, 1 - 4), not a projection.
  const std::int32_t n = 2, k = 1;
  const double u[2] = {1, 1}, y[2] = {0, 0}, x[2] = {3, 1};
  double dist2 = 0, c[1];
  std::int32_t ierr = -1;
  ASSERT_EQ(ynoaot(&n, &k, x, y, u, &dist2, c, &ierr), 0);
  EXPECT_EQ(c[0], 4.0);
  EXPECT_EQ(dist2, 10.0);
}

TEST(Ynraoo, MayWriteOverTheOrigin) {
  const std::int32_t n = 3, k = 2;
  const double c[2] = {1.0, 4.125};
  double y[3] = {0.5, 0.25, -1.0};
  std::int32_t ierr = -1;
  ASSERT_EQ(ynraoo(&n, &k, c, y, kU, y, &ierr), 0);
  EXPECT_EQ(y[0], 1.5);
  EXPECT_EQ(y[1], 0.25);
  EXPECT_EQ(y[2], 3.125);
}

TEST(Ynjont, CoordinatesOfSeveralPointsAndTheUncheckedCount) {
  const std::int32_t n = 3, m = 2;
  const double pts[6] = {1.5, -2.25, 3.125, -0.5, 7.0, 0.0};
  double coords[4] = {0, 0, 0, 0};
  std::int32_t k = 2, ierr = -1;
  ASSERT_EQ(ynjont(&n, &m, pts, &k, kY, kU, coords, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  EXPECT_EQ(coords[0], 1.0);  // point 1
  EXPECT_EQ(coords[1], 4.125);
  EXPECT_EQ(coords[2], -1.0);  // point 2
  EXPECT_EQ(coords[3], 1.0);
  // k is not checked: k < 1 succeeds and writes nothing.
  for (std::int32_t kk : {0, -2}) {
    double untouched[2] = {-6.5, -6.5};
    ierr = -1;
    EXPECT_EQ(ynjont(&n, &m, pts, &kk, kY, kU, untouched, &ierr), 0);
    EXPECT_EQ(ierr, 0);
    EXPECT_EQ(untouched[0], -6.5);
  }
  // n and m are.
  const std::int32_t zero = 0;
  EXPECT_EQ(ynjont(&zero, &m, pts, &k, kY, kU, coords, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  ierr = -1;
  EXPECT_EQ(ynjont(&n, &zero, pts, &k, kY, kU, coords, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(coords[0], 1.0);
}
