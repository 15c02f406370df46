// tests/evaluators/near_subspace_test.cpp -- checks for evaluators/near_subspace.cpp: yngcoa.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "evaluators/evaluators_api.h"
#include "near_subspace_probe.h"
#include "support/recording_services.h"

namespace {
struct BadArgs {
  std::int32_t n, m, k, code;
};
class YngcoaErrors : public testing::TestWithParam<BadArgs> {};
}  // namespace

TEST_P(YngcoaErrors, FailWithInsideSetToOne) {
  RecordedFrames frames;
  const BadArgs c = GetParam();
  std::int32_t n = c.n, m = c.m, k = c.k, order = 17, inside = -1, ierr = -1;
  const double tol = 1;
  EXPECT_EQ(yngcoa(&n, &m, nullptr, &order, &k, nullptr, nullptr, &tol, &inside, &ierr), 1);
  EXPECT_EQ(ierr, c.code);
  EXPECT_EQ(inside, 1);
  EXPECT_TRUE(frames.empty());
}
INSTANTIATE_TEST_SUITE_P(Table, YngcoaErrors,
                         testing::Values(BadArgs{0, 1, 0, 4712}, BadArgs{3, 1, -1, 4712},
                                         BadArgs{2, 1, 3, 4712}, BadArgs{3, 0, 1, 4712},
                                         BadArgs{21, 0, 21, 4712}, BadArgs{21, 1, 21, 4718},
                                         BadArgs{30, 1, 21, 4718}));

TEST(Yngcoa, WholeSpaceAcceptsWithoutReadingThePoints) {
  std::int32_t n = 3, m = 4, k = 3, order = 17, inside = -1, ierr = -1;
  const double tol = 0;
  ASSERT_EQ(yngcoa(&n, &m, nullptr, &order, &k, nullptr, nullptr, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 1);
  EXPECT_EQ(ierr, 0);
}

TEST(Yngcoa, PointCaseIsInclusiveAtTheTolerance) {
  std::int32_t n = 2, m = 2, k = 0, order = 999, inside = -1, ierr = -1;
  const double origin[2] = {1, -2};
  double pts[4] = {1, -2, 4, 2};  // the origin, then a point at distance 5
  double tol = 5;
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, nullptr, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 1);
  tol = std::nextafter(5.0, 0.0);
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, nullptr, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 0);
  tol = 0;  // only points equal to the origin pass
  m = 1;
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, nullptr, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 1);
  pts[1] = std::nextafter(-2.0, 0.0);
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, nullptr, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 0);
}

TEST(Yngcoa, LineAndPlaneResidualsAreInclusiveAtTheTolerance) {
  // Line through (1, 2, 3) along z; the plane through it spanned by z and (0.6, 0.8, 0).
  std::int32_t n = 3, m = 3, k = 1, order = 17, inside = -1, ierr = -1;
  const double origin[3] = {1, 2, 3}, u[6] = {0, 0, 1, 0.6, 0.8, 0};
  const double pts[9] = {1, 2, 40.25, 1.5, 2, 3, 1, 2, -7};  // the second is 0.5 off
  double tol = 0.5;
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, u, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 1);
  tol = std::nextafter(0.5, 0.0);
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, u, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 0);
  // In the plane, (1.5, 2, 3) has coordinates (0, 0.3) and residual (0.32, -0.24, 0):
  // squared 0.16 up to rounding, so tol 0.41 accepts it and 0.39 does not.
  k = 2;
  tol = 0.41;
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, u, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 1);
  tol = 0.39;
  ASSERT_EQ(yngcoa(&n, &m, pts, &order, &k, origin, u, &tol, &inside, &ierr), 0);
  EXPECT_EQ(inside, 0);
}

TEST(Yngcoa, AlternateOrderVisitsBothEndsFirst) {
  // With two outlying points the call stops at whichever is visited first, and the
  // counter keeps it. m = 5: 1, 5, 2, 4, 3. m = 4: 1, 4, 2, 3.
  const struct {
    std::int32_t m;
    int a, b, first;
  } cases[] = {{5, 2, 5, 5}, {5, 2, 4, 2}, {5, 3, 4, 4}, {4, 2, 4, 4}, {4, 2, 3, 2}};
  for (const auto& c : cases) {
    EXPECT_EQ(test_axis(c.m, points_off_axis(c.m, {c.a, c.b}), 274), 0);
    EXPECT_EQ(counter_point(c.m), c.first) << c.m << ": " << c.a << ", " << c.b;
    EXPECT_EQ(test_axis(c.m, points_off_axis(c.m, {c.a, c.b}), 17), 0);  // list order
    EXPECT_EQ(counter_point(c.m), c.a);
  }
  // All inside: the counter ends on the last visit, the middle point.
  EXPECT_EQ(test_axis(5, points_off_axis(5, {}), 1000), 1);
  EXPECT_EQ(counter_point(5), 3);
}

TEST(Yngcoa, OtherOrderCodesRetestTheCounterPointWithinTheList) {
  // The counter is left at 5 by a list of 5; a list of 3 cannot reach point 5 and tests its
  // last point instead, m times, without moving the counter.
  EXPECT_EQ(test_axis(5, points_off_axis(5, {}), 17), 1);
  EXPECT_EQ(test_axis(3, points_off_axis(3, {3}), 18), 0);
  EXPECT_EQ(test_axis(3, points_off_axis(3, {1, 2}), 273), 1);
  EXPECT_EQ(counter_point(5), 5);
  // A negative code is another unsupported code: point 5 again, not the outlying point 2.
  EXPECT_EQ(test_axis(5, points_off_axis(5, {2}), -4), 1);
}
