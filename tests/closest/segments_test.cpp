// tests/closest/segments_test.cpp -- checks for ynoall (two segments), ynoal2 (segment and
// line) and ynoapl (point and segment). Inputs are small dyadic numbers wherever a value is
// compared to the bit, so that every operation is exact and the expected values follow by hand.
#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <vector>

#include "closest/closest_api.h"
#include "random_inputs.h"
#include "support/recording_services.h"

namespace {

// routine 'L' ynoall(a, b), outputs (dist2, t1, t2); '2' ynoal2(seg a, line b), (dist2, t, s);
// 'P' ynoapl(x a, seg b), (dist2, t). Outputs not written stay -9.
struct Case {
  const char* name;
  char routine;
  std::int32_t n;
  std::vector<double> a, b;
  std::int32_t result, ierr;
  double out[3];
};
class Segments : public ::testing::TestWithParam<Case> {};

// ynoall segments of d = size / 2 points, each point padded to dimension n with the coordinate
// 0.375 (the same for all four points, so no difference changes).
std::vector<double> pad(std::int32_t n, const std::vector<double>& s) {
  const std::size_t d = s.size() / 2, w = std::max<std::size_t>(d, n > 0 ? n : 0);
  std::vector<double> v(s.begin(), s.begin() + d);
  v.resize(w, 0.375);
  v.insert(v.end(), s.begin() + d, s.end());
  v.resize(2 * w, 0.375);
  return v;
}

const double kNaN = std::numeric_limits<double>::quiet_NaN();
const double kA = 0x1.0fa3389d6eb40p-25;  // fl(kA^2) + 2^-102 is exactly 1e-15
// Segment 2 of the snap cases: from (0, -1) to (0, 3).
const std::vector<double> kV = {0, -1, 0, 3};
// Segment 1 of the parallel cases, along the first axis from 0 to 8.
const std::vector<double> kPar = {0, 0, 0, 8, 0, 0};
// Segment 1 of the skew cases, from (0.5, -1.25, 2.75) to (4.5, -1.25, 2.75).
const std::vector<double> kSkew = {0.5, -1.25, 2.75, 4.5, -1.25, 2.75};
// Line along the first axis through (-2, 1, 0); segment along the first axis for ynoapl.
const std::vector<double> kLine = {1, 0, 0, -2, 1, 0};
const std::vector<double> kSeg = {0.5, 0.25, -1.5, 4.5, 0.25, -1.5};

}  // namespace

TEST_P(Segments, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  std::int32_t n = c.n, ierr = -1, r;
  double o[3] = {-9.0, -9.0, -9.0};
  if (c.routine == 'L') {
    const std::vector<double> a = pad(n, c.a), b = pad(n, c.b);
    r = ynoall(&n, a.data(), b.data(), &o[0], &o[1], &o[2], &ierr);
  } else if (c.routine == '2') {
    r = ynoal2(&n, c.a.data(), c.b.data(), &o[0], &o[1], &o[2], &ierr);
  } else {
    r = ynoapl(&n, c.a.data(), c.b.data(), &o[0], &o[1], &ierr);
  }
  EXPECT_EQ(r, c.result);
  EXPECT_EQ(ierr, c.ierr);
  for (int k = 0; k < 3; ++k) EXPECT_EQ(bits(o[k]), bits(c.out[k])) << k << ": " << o[k];
  EXPECT_TRUE(frames.empty());
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Table, Segments, ::testing::Values(
    // Counts out of range: only the code is written.
    Case{"AllN1", 'L', 1, {1, 2, 3, 4}, {1, 2, 3, 4}, 1, 4712, {-9, -9, -9}},
    Case{"AllN0", 'L', 0, {1, 2, 3, 4}, {1, 2, 3, 4}, 1, 4712, {-9, -9, -9}},
    Case{"AllNNegative", 'L', -3, {1, 2, 3, 4}, {1, 2, 3, 4}, 1, 4712, {-9, -9, -9}},
    Case{"LineN1", '2', 1, {0, 1}, {1, 0}, 1, 4712, {-9, -9, -9}},
    Case{"PointN0", 'P', 0, {1}, {0, 1}, 1, 4712, {-9, -9, -9}},
    // ynoall. Crossing in the plane: P(3/8) = Q(5/8) = (1.25, 0.5).
    Case{"Crossing", 'L', 2, {-0.25, -1.75, 3.75, 4.25}, {3.75, -2.625, -0.25, 2.375}, 0, 0,
         {0.0, 0.375, 0.625}},
    // Segment 1 from (x0, 0) to (x0 + 4, 0) meets kV's line at t1 = -x0/4, t2 = 1/4. Within
    // 1e-15 of 0 or 1, t1 snaps in dimensions 2 and 3 (the end point then lies 2^-48 from
    // Q(1/4)), never in dimension 4.
    Case{"Snap0n2", 'L', 2, {-0x1p-48, 0, 4 - 0x1p-48, 0}, kV, 0, 0, {0x1p-96, 0.0, 0.25}},
    Case{"Snap0n3", 'L', 3, {-0x1p-48, 0, 4 - 0x1p-48, 0}, kV, 0, 0, {0x1p-96, 0.0, 0.25}},
    Case{"NoSnap0n4", 'L', 4, {-0x1p-48, 0, 4 - 0x1p-48, 0}, kV, 0, 0, {0.0, 0x1p-50, 0.25}},
    Case{"Kept2pow49", 'L', 2, {-0x1p-47, 0, 4 - 0x1p-47, 0}, kV, 0, 0, {0.0, 0x1p-49, 0.25}},
    Case{"Snap1n2", 'L', 2, {-4 + 0x1p-48, 0, 0x1p-48, 0}, kV, 0, 0, {0x1p-96, 1.0, 0.25}},
    Case{"Snap1n3", 'L', 3, {-4 + 0x1p-48, 0, 0x1p-48, 0}, kV, 0, 0, {0x1p-96, 1.0, 0.25}},
    Case{"NoSnap1n4", 'L', 4, {-4 + 0x1p-48, 0, 0x1p-48, 0}, kV, 0, 0, {0.0, 1 - 0x1p-50, 0.25}},
    // Parallel, segment 2 offset by (1, 0.5). Overlaps give the middle of the overlap with
    // 4717: sQ = 1/8, 5/8 (inside); sQ = 1/2, -1/2 with tP1 = 1/2 (over P1); sQ = 3/4, 7/4
    // with tP2 = 1/4 (over P2); sQ = -1/4, 7/4 with tP = 1/8, 5/8 (around). Disjoint ones
    // give code 0: before P1 the end with the larger projection, beyond P2 the smaller.
    Case{"Inside", 'L', 3, kPar, {1, 1, 0.5, 5, 1, 0.5}, 1, 4717, {1.25, 0.375, 0.5}},
    Case{"OverP1", 'L', 3, kPar, {4, 1, 0.5, -4, 1, 0.5}, 1, 4717, {1.25, 0.25, 0.25}},
    Case{"OverP2", 'L', 3, kPar, {6, 1, 0.5, 14, 1, 0.5}, 1, 4717, {1.25, 0.875, 0.125}},
    Case{"Around", 'L', 3, kPar, {-2, 1, 0.5, 14, 1, 0.5}, 1, 4717, {1.25, 0.5, 0.375}},
    Case{"Before", 'L', 3, kPar, {-6, 1, 0.5, -2, 1, 0.5}, 0, 0, {5.25, 0.0, 1.0}},
    Case{"Beyond", 'L', 3, kPar, {12, 1, 0.5, 10, 1, 0.5}, 0, 0, {5.25, 1.0, 1.0}},
    // Squared length exactly 1e-15 (kA^2 + 2^-102) is a point: t1 = 1/2, t2 the clamped
    // projection of its midpoint, 4/16; dist2 = (kA/2)^2 + (2^-52)^2 = 1e-15/4. One ulp
    // longer, an ordinary segment whose closest point P1 is Q(1/4).
    Case{"Length1e15", 'L', 3, {0, 0, 0, kA, 0, 0x1p-51}, {0, -1, 0, 0, 3, 0}, 1, 4717,
         {0x1.203af9ee75616p-52, 0.5, 0.25}},
    Case{"Length1e15Plus", 'L', 3, {0, 0, 0, 0x1.0fa3389d6eb41p-25, 0, 0x1p-51},
         {0, -1, 0, 0, 3, 0}, 0, 0, {0.0, 0.0, 0.25}},
    // Two points; a point beyond P2 (projection 1.5 lowered to 1); a point before Q1
    // (projection -1/4 raised to 0).
    Case{"TwoPoints", 'L', 2, {1.5, -0.5, 1.5, -0.5}, {-0.5, 0.25, -0.5, 0.25}, 1, 4717,
         {4.5625, 0.5, 0.5}},
    Case{"PointBeyond", 'L', 2, {0, 0, 4, 0}, {6, 1.5, 6, 1.5}, 1, 4717, {6.25, 1.0, 0.5}},
    Case{"PointBefore", 'L', 2, {-1, 3, -1, 3}, {0, 0, 4, 0}, 1, 4717, {10.0, 0.5, 0.0}},
    // Skew segments whose lines meet outside both, segment 2 one unit above kSkew: each edge
    // and corner of the parameter square is the answer once, in dimension 3 (closed form)
    // and 5 (normal equations). Expected: the minimum over the four clamped edge
    // minimisers, in exact arithmetic.
    Case{"Edge0", 'L', 3, kSkew, {-2.5, -2.25, 3.75, -0.5, -4.25, 3.75}, 0, 0, {9, 0, 0.5}},
    Case{"Corner01", 'L', 5, kSkew, {-5.5, -2.25, 3.75, -2.5, -4.25, 3.75}, 0, 0, {19, 0, 1}},
    Case{"Corner00", 'L', 3, kSkew, {-5.5, -2.25, 3.75, -5.5, -4.25, 3.75}, 0, 0, {38, 0, 0}},
    Case{"Edge1", 'L', 5, kSkew, {7.5, -2.25, 3.75, 3.5, -4.25, 3.75}, 0, 0, {6, 1, 0.5}},
    Case{"Corner11", 'L', 3, kSkew, {5.5, 0.75, 3.75, 5.5, -0.25, 3.75}, 0, 0, {3, 1, 1}},
    Case{"Corner10", 'L', 5, kSkew, {5.5, -2.25, 3.75, 3.5, -4.25, 3.75}, 0, 0, {3, 1, 0}},
    Case{"EdgeT20", 'L', 3, kSkew, {1.5, -2.25, 3.75, -5.5, -4.25, 3.75}, 0, 0, {2, 0.25, 0}},
    Case{"EdgeT21", 'L', 5, kSkew, {-5.5, 0.75, 3.75, 1.5, -0.25, 3.75}, 0, 0, {2, 0.25, 1}},
    // A NaN in P2 fails every test of the search: the nearest end-point pair among the
    // comparable ones, (0, 1); with equal distances the earlier pair (0, 0).
    Case{"NaNFallback", 'L', 3, {0, 0, 0, kNaN, 1, 1}, {3, 0, 0, 0, 2, 0}, 0, 0, {4.0, 0.0, 1.0}},
    Case{"NaNFallbackTie", 'L', 3, {0, 0, 0, kNaN, 1, 1}, {2, 0, 0, 0, 2, 0}, 0, 0,
         {4.0, 0.0, 0.0}},
    // ynoal2 with kLine. x = 0.5, y from -1 to 3, z = 0.75: passes over the line at (0.5, 1).
    Case{"LineCrossing", '2', 3, {0.5, -1, 0.75, 0.5, 3, 0.75}, kLine, 0, 0, {0.5625, 0.5, 2.5}},
    // Wholly above the line: t = -1/4 clamped to P1; wholly below, t = 7/4 clamped to P2.
    Case{"LineToP1", '2', 3, {0.5, 2, 0.75, 0.5, 6, 0.75}, kLine, 0, 0, {1.5625, 0.0, 2.5}},
    Case{"LineToP2", '2', 3, {0.5, -6, 0.75, 0.5, -2, 0.75}, kLine, 0, 0, {9.5625, 1.0, 2.5}},
    // Parallel: the midpoint M = (2, 3, 0.75), s = (M - O).U = 4; a point likewise.
    Case{"LineParallel", '2', 3, {-1, 3, 0.75, 5, 3, 0.75}, kLine, 1, 4717, {4.5625, 0.5, 4.0}},
    Case{"LinePoint", '2', 3, {1.5, 3, 0.75, 1.5, 3, 0.75}, kLine, 1, 4717, {4.5625, 0.5, 3.5}},
    // U = (2, 0, 0) is used as given: b = 0, e = 8, f = -5, X = 64 give t = 1/8 and s = 5/4;
    // P(1/8) = (0.5, -0.5, 0.75) lies 1.5 from O + s U = (0.5, 1, 0) in y.
    Case{"LineUNotUnit", '2', 3, {0.5, -1, 0.75, 0.5, 3, 0.75}, {2, 0, 0, -2, 1, 0}, 0, 0,
         {2.8125, 0.125, 1.25}},
    // ynoapl along kSeg, length 4: behind S1, inside, beyond S2.
    Case{"Behind", 'P', 3, {-1.5, 2.25, -1.5}, kSeg, 0, 0, {8.0, 0.0, -9}},
    Case{"Within", 'P', 3, {1.5, -0.75, 0.5}, kSeg, 0, 0, {5.0, 0.25, -9}},
    Case{"Past", 'P', 3, {5.5, 0.25, -3.5}, kSeg, 0, 0, {5.0, 1.0, -9}},
    // X = S2 = 0.9, S1 = 0.2: p = L, so t = p / L = 1 and the point is 0.2 + (0.9 - 0.2) =
    // 0x1.cccccccccccccp-1, one ulp (2^-53) below S2: dist2 = 2^-106, not 0.
    Case{"ProjectionOnTheEnd", 'P', 1, {0.9}, {0.2, 0.9}, 0, 0, {0x1p-106, 1.0, -9}},
    // S1 = S2: p = 0 is not behind, so the length test gives the midpoint with 4717.
    // Squared length 2^-100 but X behind S1 (p < 0): answered from S1 with code 0.
    Case{"Degenerate", 'P', 2, {1.5, -2.0}, {-0.5, 1.0, -0.5, 1.0}, 1, 4717, {13.0, 0.5, -9}},
    Case{"DegenerateBehind", 'P', 2, {1.5, -2.0}, {-0.5, 1.0, -0.5 - 0x1p-50, 1.0}, 0, 0,
         {13.0, 0.0, -9}}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on

// True minimum of |P(t1) - Q(t2)|^2 over the unit square, in long double: the smallest of
// the interior stationary point (when inside) and the minimisers of the four edges.
TEST(Ynoall, RandomPairsGiveTheTrueMinimum) {
  std::mt19937_64 rng(test_seed("Ynoall.RandomPairsGiveTheTrueMinimum", 61001));
  using LD = long double;
  for (std::int32_t n : {2, 3, 4, 7, 40}) {
    for (int trial = 0; trial < 3000; ++trial) {
      const std::vector<double> s = uniform(rng, 4 * n, -1.0, 1.0);
      const double *p1 = s.data(), *p2 = p1 + n, *q1 = p2 + n, *q2 = q1 + n;
      double dist2, t1, t2;
      std::int32_t ierr;
      ASSERT_EQ(ynoall(&n, p1, q1, &dist2, &t1, &t2, &ierr), 0) << n << " " << trial;
      auto f = [&](LD u1, LD u2) {
        LD r = 0;
        for (int i = 0; i < n; ++i) {
          const LD v = (1 - u1) * p1[i] + u1 * p2[i] - (1 - u2) * q1[i] - u2 * q2[i];
          r += v * v;
        }
        return r;
      };
      LD s1 = 0, s2 = 0, b = 0, d = 0, e = 0;
      for (int i = 0; i < n; ++i) {
        const LD a1 = (LD)p2[i] - p1[i], a2 = (LD)q2[i] - q1[i], w = (LD)p1[i] - q1[i];
        s1 += a1 * a1, s2 += a2 * a2, b += a1 * a2, d += a2 * w, e += a1 * w;
      }
      auto cl = [](LD t) { return std::min(std::max(t, 0.0L), 1.0L); };
      LD best = std::min({f(0, cl(d / s2)), f(1, cl((d + b) / s2)), f(cl(-e / s1), 0),
                          f(cl((b - e) / s1), 1)});
      const LD det = s1 * s2 - b * b, u1 = (b * d - s2 * e) / det, u2 = (s1 * d - b * e) / det;
      if (det > 0 && u1 >= 0 && u1 <= 1 && u2 >= 0 && u2 <= 1) best = std::min(best, f(u1, u2));
      ASSERT_NEAR(dist2, static_cast<double>(best), 1e-12) << "n " << n << " trial " << trial;
    }
  }
}
