// tests/closest/point_seg_test.cpp -- checks for closest/point_seg.cpp (ynoapl).
#include <gtest/gtest.h>

#include "closest/closest_api.h"
#include "support/recording_services.h"

namespace {
struct Out {
  std::int32_t result, ierr;
  double dist2, t;
};
Out call(std::int32_t n, const double* x, const double* seg) {
  Out o{-1, -1, -9.0, -9.0};
  o.result = ynoapl(&n, x, seg, &o.dist2, &o.t, &o.ierr);
  return o;
}
}  // namespace

TEST(Ynoapl, DimensionZeroLeavesOutputsAndRecordsNoFrame) {
  RecordedFrames frames;
  const double x[2] = {1, 2}, seg[4] = {0, 0, 1, 1};
  const Out o = call(0, x, seg);
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4712);
  EXPECT_EQ(o.dist2, -9.0);
  EXPECT_EQ(o.t, -9.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynoapl, BehindInsideAndBeyondTheSegment) {
  const double seg[6] = {0.5, 0.25, -1.5, 4.5, 0.25, -1.5};  // along the first axis
  const double behind[3] = {-1.5, 2.25, -1.5};
  Out o = call(3, behind, seg);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t, 0.0);
  EXPECT_EQ(o.dist2, 8.0);  // 2^2 + 2^2
  const double inside[3] = {1.5, -0.75, 0.5};
  o = call(3, inside, seg);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t, 0.25);
  EXPECT_EQ(o.dist2, 5.0);  // 1 + 4
  const double beyond[3] = {5.5, 0.25, -3.5};
  o = call(3, beyond, seg);
  EXPECT_EQ(o.t, 1.0);
  EXPECT_EQ(o.dist2, 5.0);  // 1 + 4
}

TEST(Ynoapl, ProjectionOnTheEndIsDividedNotClamped) {
  // n = 1, S1 = 0.2, S2 = X = 0.9: p = L exactly, so t = p / L = 1 and the distance is that of
  // S1 + 1 (S2 - S1) = 0x1.cccccccccccccp-1, one ulp (2^-53) below S2: dist2 = 2^-106, where
  // the end point itself would give 0.
  const double x[1] = {0.9}, seg[2] = {0.2, 0.9};
  const Out o = call(1, x, seg);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.t, 1.0);
  EXPECT_EQ(bits(o.dist2), bits(0x1p-106));
}

TEST(Ynoapl, DegenerateSegmentIsTestedAfterTheSideOfS1) {
  // S1 = S2: p = 0, so the length test decides: the midpoint with 4717.
  const double x[2] = {1.5, -2.0}, point[4] = {-0.5, 1.0, -0.5, 1.0};
  Out o = call(2, x, point);
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4717);
  EXPECT_EQ(o.t, 0.5);
  EXPECT_EQ(o.dist2, 13.0);  // 2^2 + 3^2
  // A segment of squared length 2^-100 with X behind S1 (p < 0) is answered from S1 with
  // code 0 before its length is looked at.
  const double tiny[4] = {-0.5, 1.0, -0.5 - 0x1p-50, 1.0};
  o = call(2, x, tiny);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t, 0.0);
  EXPECT_EQ(o.dist2, 13.0);
}
