// tests/closest/seg_seg_test.cpp -- checks for closest/seg_seg.cpp (ynoall).
// Inputs are small dyadic numbers wherever the answer is compared to the bit, so that every
// operation is exact and the expected values follow by hand.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

#include "closest/closest_api.h"
#include "random_inputs.h"
#include "support/recording_services.h"

namespace {

struct Out {
  std::int32_t result, ierr;
  double dist2, t1, t2;
};

Out call(std::int32_t n, const std::vector<double>& seg1, const std::vector<double>& seg2) {
  Out o{-1, -1, -9.0, -9.0, -9.0};
  o.result = ynoall(&n, seg1.data(), seg2.data(), &o.dist2, &o.t1, &o.t2, &o.ierr);
  return o;
}

// Two points of dimension n as the columns of a segment.
std::vector<double> seg(std::vector<double> a, const std::vector<double>& b) {
  a.insert(a.end(), b.begin(), b.end());
  return a;
}

}  // namespace

TEST(Ynoall, DimensionBelowTwoLeavesOutputsAndRecordsNoFrame) {
  RecordedFrames frames;
  const double s[4] = {1.5, 2.5, 3.5, 4.5};
  for (std::int32_t n : {1, 0, -3}) {
    double dist2 = -1.5, t1 = 7.25, t2 = -0.0;
    std::int32_t ierr = -1;
    EXPECT_EQ(ynoall(&n, s, s, &dist2, &t1, &t2, &ierr), 1);
    EXPECT_EQ(ierr, 4712);
    EXPECT_EQ(bits(dist2), bits(-1.5));
    EXPECT_EQ(bits(t1), bits(7.25));
    EXPECT_EQ(bits(t2), bits(-0.0));
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Ynoall, CrossingSegmentsInThePlaneMeetAtTheirParameters) {
  // P(3/8) = (1.25, 0.5) = Q(5/8) with P1 = (-0.25, -1.75), d1 = (4, 6),
  // Q1 = (3.75, -2.625), d2 = (-4, 5).
  const Out o = call(2, seg({-0.25, -1.75}, {3.75, 4.25}), seg({3.75, -2.625}, {-0.25, 2.375}));
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t1, 0.375);
  EXPECT_EQ(o.t2, 0.625);
  EXPECT_EQ(bits(o.dist2), bits(0.0));
}

// Segment 1 runs from (x0, 0) to (x0 + 4, 0), segment 2 from (0, -1) to (0, 3), padded with
// zeros to dimension n: the lines meet at t1 = -x0 / 4, t2 = 1/4. Within 1e-15 of 0 or 1 the
// parameter snaps in dimensions 2 and 3 (the end point is then x0 or x0 + 4 away from Q(1/4),
// dist2 = 2^-96), never in dimension 4 (the meeting point itself, dist2 = 0).
struct SnapCase {
  std::int32_t n;
  double x0, t1, dist2;
};
class YnoallSnap : public ::testing::TestWithParam<SnapCase> {};

TEST_P(YnoallSnap, ParametersNearTheEndsSnapOnlyInTwoAndThreeDimensions) {
  const SnapCase c = GetParam();
  std::vector<double> p1(c.n, 0.0), p2(c.n, 0.0), q1(c.n, 0.0), q2(c.n, 0.0);
  p1[0] = c.x0;
  p2[0] = c.x0 + 4.0;
  q1[1] = -1.0;
  q2[1] = 3.0;
  const Out o = call(c.n, seg(p1, p2), seg(q1, q2));
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(bits(o.t1), bits(c.t1));
  EXPECT_EQ(o.t2, 0.25);
  EXPECT_EQ(bits(o.dist2), bits(c.dist2));
}

INSTANTIATE_TEST_SUITE_P(
    EndBands, YnoallSnap,
    ::testing::Values(SnapCase{2, -0x1p-48, 0.0, 0x1p-96},             // t1 = 2^-50 <= 1e-15
                      SnapCase{3, -0x1p-48, 0.0, 0x1p-96},
                      SnapCase{4, -0x1p-48, 0x1p-50, 0.0},
                      SnapCase{2, -0x1p-47, 0x1p-49, 0.0},             // 2^-49 > 1e-15: kept
                      SnapCase{2, -4.0 + 0x1p-48, 1.0, 0x1p-96},       // 1 - t1 = 2^-50
                      SnapCase{3, -4.0 + 0x1p-48, 1.0, 0x1p-96},
                      SnapCase{4, -4.0 + 0x1p-48, 1.0 - 0x1p-50, 0.0}));

// Parallel segments along the first axis, segment 2 offset by (1, 0.5): P1 = (0, 0, 0),
// P2 = (8, 0, 0); each case gives segment 2's first coordinates and the expected answer.
struct ParallelCase {
  const char* name;
  double q1x, q2x;
  std::int32_t result, ierr;
  double t1, t2, dist2;
};
class YnoallParallel : public ::testing::TestWithParam<ParallelCase> {};

TEST_P(YnoallParallel, ProjectionsDecideTheAnswer) {
  const ParallelCase c = GetParam();
  const Out o = call(3, seg({0, 0, 0}, {8, 0, 0}), seg({c.q1x, 1, 0.5}, {c.q2x, 1, 0.5}));
  EXPECT_EQ(o.result, c.result);
  EXPECT_EQ(o.ierr, c.ierr);
  EXPECT_EQ(o.t1, c.t1);
  EXPECT_EQ(o.t2, c.t2);
  EXPECT_EQ(o.dist2, c.dist2);
}

INSTANTIATE_TEST_SUITE_P(
    OverlapTable, YnoallParallel,
    ::testing::Values(
        // sQ = 1/8, 5/8: inside segment 1; t1 = (1/8 + 5/8)/2.
        ParallelCase{"Inside", 1, 5, 1, 4717, 0.375, 0.5, 1.25},
        // Reversed, sQ = 1/2, -1/2: upper end Q1 (u = 0), tP1 = 1/2; t1 = 1/4, t2 = 1/4.
        ParallelCase{"OverStart", 4, -4, 1, 4717, 0.25, 0.25, 1.25},
        // sQ = 3/4, 7/4: lower end Q1 (u = 0), tP2 = 1/4; t1 = 7/8, t2 = 1/8.
        ParallelCase{"OverEnd", 6, 14, 1, 4717, 0.875, 0.125, 1.25},
        // sQ = -1/4, 7/4: segment 1 inside; tP1 = 1/8, tP2 = 5/8.
        ParallelCase{"Around", -2, 14, 1, 4717, 0.5, 0.375, 1.25},
        // Wholly before P1: the end with the larger projection, Q2.
        ParallelCase{"Before", -6, -2, 0, 0, 0.0, 1.0, 5.25},
        // Wholly beyond P2: the end with the smaller projection, Q2.
        ParallelCase{"Beyond", 12, 10, 0, 0, 1.0, 1.0, 5.25}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(Ynoall, SquaredLengthOfExactlyOneEMinus15IsAPoint) {
  // d1 = (a, 0, 2^-51): a^2 rounds to 0x1.203af9ee75615p-50 and adding 2^-102 gives exactly
  // 1e-15. Segment 2 runs from (0, -1, 0) to (0, 3, 0).
  const double a = 0x1.0fa3389d6eb40p-25;
  const std::vector<double> s2 = seg({0, -1, 0}, {0, 3, 0});
  Out o = call(3, seg({0, 0, 0}, {a, 0, 0x1p-51}), s2);
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4717);
  EXPECT_EQ(o.t1, 0.5);
  EXPECT_EQ(o.t2, 0.25);  // ((P1 + P2)/2 - Q1).d2 / S2 = 4 / 16
  // (a/2)^2 + 0 + (2^-52)^2 = 1e-15 / 4 exactly.
  EXPECT_EQ(bits(o.dist2), bits(0x1.203af9ee75616p-52));
  // One ulp longer in the first component: an ordinary segment, closest at P1 = Q(1/4).
  o = call(3, seg({0, 0, 0}, {0x1.0fa3389d6eb41p-25, 0, 0x1p-51}), s2);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.t1, 0.0);
  EXPECT_EQ(o.t2, 0.25);
  EXPECT_EQ(o.dist2, 0.0);
}

TEST(Ynoall, DegenerateSegmentsGiveMidpointsAndClampedProjections) {
  // Two points: both parameters 1/2, their squared distance.
  Out o = call(2, seg({1.5, -0.5}, {1.5, -0.5}), seg({-0.5, 0.25}, {-0.5, 0.25}));
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4717);
  EXPECT_EQ(o.t1, 0.5);
  EXPECT_EQ(o.t2, 0.5);
  EXPECT_EQ(o.dist2, 4.5625);  // 2^2 + 0.75^2
  // Segment 2 a point beyond P2 along d1 = (4, 0): projection 1.5 is lowered to 1.
  o = call(2, seg({0, 0}, {4, 0}), seg({6, 1.5}, {6, 1.5}));
  EXPECT_EQ(o.ierr, 4717);
  EXPECT_EQ(o.t1, 1.0);
  EXPECT_EQ(o.t2, 0.5);
  EXPECT_EQ(o.dist2, 6.25);  // 2^2 + 1.5^2
  // Segment 1 a point before Q1 along d2: projection -1/4 is raised to 0.
  o = call(2, seg({-1, 3}, {-1, 3}), seg({0, 0}, {4, 0}));
  EXPECT_EQ(o.ierr, 4717);
  EXPECT_EQ(o.t1, 0.5);
  EXPECT_EQ(o.t2, 0.0);
  EXPECT_EQ(o.dist2, 10.0);
}

// Skew segments whose infinite lines meet outside both: segment 1 from (0.5, -1.25, 2.75)
// to (4.5, -1.25, 2.75), segment 2 one unit above it; every edge and corner of the
// parameter square is the answer once. Expected values: the minimum of the squared distance
// over the interior point and the four clamped edge minimisers, in exact arithmetic.
struct SkewCase {
  const char* name;
  double q1[3], q2[3];
  double t1, t2, dist2;
};
class YnoallSkew : public ::testing::TestWithParam<std::tuple<SkewCase, std::int32_t>> {};

TEST_P(YnoallSkew, BoundarySearchFindsTheEdgeOrCorner) {
  const auto& [c, n] = GetParam();
  // Dimension 5 pads every point with the same two coordinates: the normal-equation branch.
  auto pad = [n = n](std::vector<double> v) {
    v.resize(n, 0.375);
    return v;
  };
  const Out o = call(n, seg(pad({0.5, -1.25, 2.75}), pad({4.5, -1.25, 2.75})),
                     seg(pad({c.q1[0], c.q1[1], c.q1[2]}), pad({c.q2[0], c.q2[1], c.q2[2]})));
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t1, c.t1);
  EXPECT_EQ(o.t2, c.t2);
  EXPECT_EQ(o.dist2, c.dist2);
}

INSTANTIATE_TEST_SUITE_P(
    EdgesAndCorners, YnoallSkew,
    ::testing::Combine(
        ::testing::Values(SkewCase{"Edge0", {-2.5, -2.25, 3.75}, {-0.5, -4.25, 3.75}, 0, 0.5, 9},
                          SkewCase{"Corner01", {-5.5, -2.25, 3.75}, {-2.5, -4.25, 3.75}, 0, 1, 19},
                          SkewCase{"Corner00", {-5.5, -2.25, 3.75}, {-5.5, -4.25, 3.75}, 0, 0, 38},
                          SkewCase{"Edge1", {7.5, -2.25, 3.75}, {3.5, -4.25, 3.75}, 1, 0.5, 6},
                          SkewCase{"Corner11", {5.5, 0.75, 3.75}, {5.5, -0.25, 3.75}, 1, 1, 3},
                          SkewCase{"Corner10", {5.5, -2.25, 3.75}, {3.5, -4.25, 3.75}, 1, 0, 3},
                          SkewCase{"EdgeT20", {1.5, -2.25, 3.75}, {-5.5, -4.25, 3.75}, 0.25, 0, 2},
                          SkewCase{"EdgeT21", {-5.5, 0.75, 3.75}, {1.5, -0.25, 3.75}, 0.25, 1, 2}),
        ::testing::Values(3, 5)),
    [](const auto& info) {
      return std::string(std::get<0>(info.param).name) + "_n" +
             std::to_string(std::get<1>(info.param));
    });

TEST(Ynoall, NaNInOneEndFallsBackToTheNearestEndPairWithoutFailing) {
  // P2 carries a NaN: every test of the search fails, and of the end pairs only those from P1
  // are comparable; (0, 1) is strictly nearer than (0, 0).
  const double nan = std::numeric_limits<double>::quiet_NaN();
  Out o = call(3, seg({0, 0, 0}, {nan, 1, 1}), seg({3, 0, 0}, {0, 2, 0}));
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.t1, 0.0);
  EXPECT_EQ(o.t2, 1.0);
  EXPECT_EQ(o.dist2, 4.0);
  // Equal distances keep the earlier pair (0, 0).
  o = call(3, seg({0, 0, 0}, {nan, 1, 1}), seg({2, 0, 0}, {0, 2, 0}));
  EXPECT_EQ(o.t1, 0.0);
  EXPECT_EQ(o.t2, 0.0);
  EXPECT_EQ(o.dist2, 4.0);
}

namespace {

// True minimum of |P(t1) - Q(t2)|^2 over the unit square, in long double: the smallest of
// the interior stationary point (when inside) and the minimisers of the four edges.
long double true_minimum(std::int32_t n, const double* p1, const double* p2, const double* q1,
                         const double* q2) {
  auto f = [&](long double t1, long double t2) {
    long double s = 0;
    for (int i = 0; i < n; ++i) {
      const long double v = (1 - t1) * p1[i] + t1 * p2[i] - (1 - t2) * q1[i] - t2 * q2[i];
      s += v * v;
    }
    return s;
  };
  long double s1 = 0, s2 = 0, b = 0, d = 0, e = 0;
  for (int i = 0; i < n; ++i) {
    const long double a1 = (long double)p2[i] - p1[i], a2 = (long double)q2[i] - q1[i];
    const long double w = (long double)p1[i] - q1[i];
    s1 += a1 * a1, s2 += a2 * a2, b += a1 * a2, d += a2 * w, e += a1 * w;
  }
  auto clamp = [](long double t) { return std::min(std::max(t, 0.0L), 1.0L); };
  long double best = std::min({f(0, clamp(d / s2)), f(1, clamp((d + b) / s2)),
                               f(clamp(-e / s1), 0), f(clamp((b - e) / s1), 1)});
  const long double det = s1 * s2 - b * b;
  if (det > 0) {
    const long double t1 = (b * d - s2 * e) / det, t2 = (s1 * d - b * e) / det;
    if (t1 >= 0 && t1 <= 1 && t2 >= 0 && t2 <= 1) best = std::min(best, f(t1, t2));
  }
  return best;
}

}  // namespace

TEST(Ynoall, RandomPairsGiveTheTrueMinimum) {
  std::mt19937_64 rng(test_seed("Ynoall.RandomPairsGiveTheTrueMinimum", 61001));
  for (std::int32_t n : {2, 3, 4, 7}) {
    for (int trial = 0; trial < 4000; ++trial) {
      const std::vector<double> s1 = uniform(rng, 2 * n, -1.0, 1.0);
      const std::vector<double> s2 = uniform(rng, 2 * n, -1.0, 1.0);
      const Out o = call(n, s1, s2);
      ASSERT_EQ(o.result, 0) << "n " << n << " trial " << trial;  // never parallel here
      ASSERT_TRUE(o.t1 >= 0 && o.t1 <= 1 && o.t2 >= 0 && o.t2 <= 1);
      const long double truth = true_minimum(n, s1.data(), s1.data() + n, s2.data(), s2.data() + n);
      ASSERT_NEAR(o.dist2, static_cast<double>(truth), 1e-12) << "n " << n << " trial " << trial;
    }
  }
}
