// tests/closest/seg_seg_test.cpp -- checks for closest/seg_seg.cpp (ynoall).
// Inputs are small dyadic numbers wherever a value is compared to the bit, so that every
// operation is exact and the expected values follow by hand.
#include <gtest/gtest.h>

#include <algorithm>
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

// Segments given by two points of dimension d = size / 2, each point padded to dimension n
// with the coordinate 0.375 (the same for all four points, so no difference changes).
Out call(std::int32_t n, const std::vector<double>& s1, const std::vector<double>& s2) {
  auto pad = [n](const std::vector<double>& s) {
    const std::size_t d = s.size() / 2;
    std::vector<double> v(s.begin(), s.begin() + d);
    v.resize(n, 0.375);
    v.insert(v.end(), s.begin() + d, s.end());
    v.resize(2 * n, 0.375);
    return v;
  };
  const std::vector<double> a = pad(s1), b = pad(s2);
  Out o{-1, -1, -9.0, -9.0, -9.0};
  o.result = ynoall(&n, a.data(), b.data(), &o.dist2, &o.t1, &o.t2, &o.ierr);
  return o;
}

struct Case {
  const char* name;
  std::int32_t n;
  std::vector<double> s1, s2;
  Out want;
};
class YnoallCases : public ::testing::TestWithParam<Case> {};

const double kNaN = std::numeric_limits<double>::quiet_NaN();
const double kA = 0x1.0fa3389d6eb40p-25;  // fl(kA^2) + 2^-102 is exactly 1e-15

}  // namespace

TEST(Ynoall, DimensionBelowTwoLeavesOutputsAndRecordsNoFrame) {
  RecordedFrames frames;
  const double s[4] = {1.5, 2.5, 3.5, 4.5};
  for (std::int32_t n : {1, 0, -3}) {
    double dist2 = -9.0, t1 = -9.0, t2 = -9.0;
    std::int32_t ierr = -1;
    EXPECT_EQ(ynoall(&n, s, s, &dist2, &t1, &t2, &ierr), 1);
    EXPECT_EQ(ierr, 4712);
    EXPECT_EQ(dist2, -9.0);
    EXPECT_EQ(t1, -9.0);
    EXPECT_EQ(t2, -9.0);
  }
  EXPECT_TRUE(frames.empty());
}

TEST_P(YnoallCases, Answer) {
  const Case& c = GetParam();
  const Out o = call(c.n, c.s1, c.s2);
  EXPECT_EQ(o.result, c.want.result);
  EXPECT_EQ(o.ierr, c.want.ierr);
  EXPECT_EQ(bits(o.t1), bits(c.want.t1)) << o.t1;
  EXPECT_EQ(bits(o.t2), bits(c.want.t2)) << o.t2;
  EXPECT_EQ(bits(o.dist2), bits(c.want.dist2)) << o.dist2;
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Table, YnoallCases,
    ::testing::Values(
        // Crossing in the plane: P(3/8) = Q(5/8) = (1.25, 0.5).
        Case{"Crossing", 2, {-0.25, -1.75, 3.75, 4.25}, {3.75, -2.625, -0.25, 2.375},
             {0, 0, 0.0, 0.375, 0.625}},
        // Segment 1 from (x0, 0) to (x0 + 4, 0), segment 2 from (0, -1) to (0, 3): the lines
        // meet at t1 = -x0/4, t2 = 1/4. Within 1e-15 of 0 or 1, t1 snaps in dimensions 2 and
        // 3 (the end point then lies 2^-48 from Q(1/4)), never in dimension 4.
        Case{"Snap0n2", 2, {-0x1p-48, 0, 4 - 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0x1p-96, 0.0, 0.25}},
        Case{"Snap0n3", 3, {-0x1p-48, 0, 4 - 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0x1p-96, 0.0, 0.25}},
        Case{"NoSnap0n4", 4, {-0x1p-48, 0, 4 - 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0.0, 0x1p-50, 0.25}},
        Case{"Kept2pow49", 2, {-0x1p-47, 0, 4 - 0x1p-47, 0}, {0, -1, 0, 3},
             {0, 0, 0.0, 0x1p-49, 0.25}},
        Case{"Snap1n2", 2, {-4 + 0x1p-48, 0, 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0x1p-96, 1.0, 0.25}},
        Case{"Snap1n3", 3, {-4 + 0x1p-48, 0, 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0x1p-96, 1.0, 0.25}},
        Case{"NoSnap1n4", 4, {-4 + 0x1p-48, 0, 0x1p-48, 0}, {0, -1, 0, 3},
             {0, 0, 0.0, 1 - 0x1p-50, 0.25}},
        // Parallel along the first axis, segment 1 from 0 to 8, segment 2 offset by (1, 0.5).
        // Overlaps give the middle of the overlap with 4717: sQ = 1/8, 5/8 (inside); sQ =
        // 1/2, -1/2 with tP1 = 1/2 (over P1); sQ = 3/4, 7/4 with tP2 = 1/4 (over P2);
        // sQ = -1/4, 7/4 with tP = 1/8, 5/8 (around). Disjoint ones give code 0: before P1
        // the end with the larger projection, beyond P2 the one with the smaller.
        Case{"Inside", 3, {0, 0, 0, 8, 0, 0}, {1, 1, 0.5, 5, 1, 0.5}, {1, 4717, 1.25, 0.375, 0.5}},
        Case{"OverP1", 3, {0, 0, 0, 8, 0, 0}, {4, 1, 0.5, -4, 1, 0.5}, {1, 4717, 1.25, 0.25, 0.25}},
        Case{"OverP2", 3, {0, 0, 0, 8, 0, 0}, {6, 1, 0.5, 14, 1, 0.5},
             {1, 4717, 1.25, 0.875, 0.125}},
        Case{"Around", 3, {0, 0, 0, 8, 0, 0}, {-2, 1, 0.5, 14, 1, 0.5},
             {1, 4717, 1.25, 0.5, 0.375}},
        Case{"Before", 3, {0, 0, 0, 8, 0, 0}, {-6, 1, 0.5, -2, 1, 0.5}, {0, 0, 5.25, 0.0, 1.0}},
        Case{"Beyond", 3, {0, 0, 0, 8, 0, 0}, {12, 1, 0.5, 10, 1, 0.5}, {0, 0, 5.25, 1.0, 1.0}},
        // Squared length exactly 1e-15 (kA^2 + 2^-102) is a point: t1 = 1/2, t2 the clamped
        // projection of its midpoint, 4/16; dist2 = (kA/2)^2 + (2^-52)^2 = 1e-15/4. One ulp
        // longer, an ordinary segment whose closest point P1 is Q(1/4).
        Case{"Length1e15", 3, {0, 0, 0, kA, 0, 0x1p-51}, {0, -1, 0, 0, 3, 0},
             {1, 4717, 0x1.203af9ee75616p-52, 0.5, 0.25}},
        Case{"Length1e15Plus", 3, {0, 0, 0, 0x1.0fa3389d6eb41p-25, 0, 0x1p-51}, {0, -1, 0, 0, 3, 0},
             {0, 0, 0.0, 0.0, 0.25}},
        // Two points; a point beyond P2 (projection 1.5 lowered to 1); a point before Q1
        // (projection -1/4 raised to 0).
        Case{"TwoPoints", 2, {1.5, -0.5, 1.5, -0.5}, {-0.5, 0.25, -0.5, 0.25},
             {1, 4717, 4.5625, 0.5, 0.5}},
        Case{"PointBeyond", 2, {0, 0, 4, 0}, {6, 1.5, 6, 1.5}, {1, 4717, 6.25, 1.0, 0.5}},
        Case{"PointBefore", 2, {-1, 3, -1, 3}, {0, 0, 4, 0}, {1, 4717, 10.0, 0.5, 0.0}},
        // Skew segments whose infinite lines meet outside both: segment 1 from
        // (0.5, -1.25, 2.75) to (4.5, -1.25, 2.75), segment 2 one unit above it; each edge and
        // corner of the parameter square is the answer once, in dimension 3 (closed form) and
        // 5 (normal equations). Expected: the minimum over the four clamped edge minimisers,
        // in exact arithmetic.
        Case{"Edge0", 3, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {-2.5, -2.25, 3.75, -0.5, -4.25, 3.75}, {0, 0, 9, 0, 0.5}},
        Case{"Corner01", 5, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {-5.5, -2.25, 3.75, -2.5, -4.25, 3.75}, {0, 0, 19, 0, 1}},
        Case{"Corner00", 3, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {-5.5, -2.25, 3.75, -5.5, -4.25, 3.75}, {0, 0, 38, 0, 0}},
        Case{"Edge1", 5, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75}, {7.5, -2.25, 3.75, 3.5, -4.25, 3.75},
             {0, 0, 6, 1, 0.5}},
        Case{"Corner11", 3, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {5.5, 0.75, 3.75, 5.5, -0.25, 3.75}, {0, 0, 3, 1, 1}},
        Case{"Corner10", 5, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {5.5, -2.25, 3.75, 3.5, -4.25, 3.75}, {0, 0, 3, 1, 0}},
        Case{"EdgeT20", 3, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {1.5, -2.25, 3.75, -5.5, -4.25, 3.75}, {0, 0, 2, 0.25, 0}},
        Case{"EdgeT21", 5, {0.5, -1.25, 2.75, 4.5, -1.25, 2.75},
             {-5.5, 0.75, 3.75, 1.5, -0.25, 3.75}, {0, 0, 2, 0.25, 1}},
        // A NaN in P2 fails every test of the search: the nearest end-point pair among the
        // comparable ones, (0, 1); with equal distances the earlier pair (0, 0).
        Case{"NaNFallback", 3, {0, 0, 0, kNaN, 1, 1}, {3, 0, 0, 0, 2, 0}, {0, 0, 4.0, 0.0, 1.0}},
        Case{"NaNFallbackTie", 3, {0, 0, 0, kNaN, 1, 1}, {2, 0, 0, 0, 2, 0},
             {0, 0, 4.0, 0.0, 0.0}}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on

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
  long double best = std::min({f(0, clamp(d / s2)), f(1, clamp((d + b) / s2)), f(clamp(-e / s1), 0),
                               f(clamp((b - e) / s1), 1)});
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
  for (std::int32_t n : {2, 3, 4, 7, 40}) {
    for (int trial = 0; trial < 3000; ++trial) {
      const std::vector<double> s1 = uniform(rng, 2 * n, -1.0, 1.0);
      const std::vector<double> s2 = uniform(rng, 2 * n, -1.0, 1.0);
      double dist2, t1, t2;
      std::int32_t ierr;
      ASSERT_EQ(ynoall(&n, s1.data(), s2.data(), &dist2, &t1, &t2, &ierr), 0) << n << " " << trial;
      const long double truth = true_minimum(n, s1.data(), s1.data() + n, s2.data(), s2.data() + n);
      ASSERT_NEAR(dist2, static_cast<double>(truth), 1e-12) << "n " << n << " trial " << trial;
    }
  }
}
