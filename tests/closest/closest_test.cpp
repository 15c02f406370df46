// tests/closest/closest_test.cpp -- checks for the closest-point routines: ynoall (two
// segments), ynoal2 (segment and line), ynoapl (point and segment), ynoaon and ynoaod
// (nearest of a point list or polyline), ynoaot, ynraoo and ynjont (subspace coordinates).
// Inputs are small dyadic numbers wherever a value is compared to the bit, so that every
// operation is exact and the expected values follow by hand.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "closest/closest_api.h"
#include "closest_calls.h"

namespace {

struct Case {
  const char* name;
  char routine;
  std::int32_t n;
  std::vector<double> a, b;
  Out want;
  std::vector<double> p = {};
};
class Closest : public ::testing::TestWithParam<Case> {};

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
// Points 1 to 4 all 1.25 from (0.5, 0.5); the polyline passes nearer, 0.78125 at u = 1/2 on
// segments 1, 2 and 3.
const std::vector<double> kTies = {-0.75, 0.5, 0.5, 1.75, 1.75, 0.5, 0.5, -0.75, 0.5, -3.0};
// Point 2 lies 0.375 from kX3 along the first axis (squared 0.140625), the others far.
const std::vector<double> kX3 = {1.5, -0.5, 2.0};
const std::vector<double> kP3 = {9, 9, 9, 1.875, -0.5, 2.0, 9, 9, 9, 9, 9, 9, 9, 9, 9};
// Segment 2 from (0.75, -2) to (0.75, 2) passes 0.75 from the origin; segments 1 and 3 lie
// wholly beyond y = -1 and y = 1.
const std::vector<double> kBar = {5.0, -2.0, 0.75, -2.0, 0.75, 2.0, -1.0, 2.0};
// Frame of space: origin Y = (0.5, 0.25, -1) and the directions e1, e3, so the subspace is
// the plane y = 0.25; X - Y = (1, -2.5, 4.125) for X = (1.5, -2.25, 3.125).
const std::vector<double> kYU = {0.5, 0.25, -1.0, 1, 0, 0, 0, 0, 1};
const std::vector<double> kX = {1.5, -2.25, 3.125};
const std::vector<double> kBad(9, -9.0);

}  // namespace

TEST_P(Closest, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  EXPECT_EQ(call(c.routine, c.n, c.a, c.b, c.p), c.want);
  EXPECT_TRUE(frames.empty());
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Table, Closest, ::testing::Values(
    // Counts out of range: only the code is written.
    Case{"AllN1", 'L', 1, {1, 2, 3, 4}, {1, 2, 3, 4}, 1, 4712, {-9, -9, -9}},
    Case{"LineN1", '2', 1, {0, 1}, {1, 0}, 1, 4712, {-9, -9, -9}},
    Case{"PointN0", 'P', 0, {1}, {0, 1}, 1, 4712, {-9, -9, -9}},
    Case{"OnePoint", 'N', 3, {1, 2, 3}, {1, 2, 3}, 1, 4712, {-9, -9, -7}, {kPoints}},
    Case{"NearestN0", 'N', 0, {1}, {1, 2}, 1, 4712, {-9, -9, -7}, {kPolyline}},
    Case{"BoundedOnePoint", 'D', 3, {1, 2, 3}, {1, 2, 3}, 1, 4712, {-9, -9, -7}, {kPolyline, 1, 0}},
    Case{"BoundedN0", 'D', 0, {1}, {1, 2}, 1, 4712, {-9, -9, -7}, {kPoints, 1, 0}},
    Case{"SubspaceN0", 'O', 0, kBad, kBad, 1, 4712, {-9, -9, -9}, {0}},
    Case{"SubspaceKNegative", 'O', 3, kBad, kBad, 1, 4712, {-9, -9, -9}, {-1}},
    Case{"SubspaceKAboveN", 'O', 3, kBad, kBad, 1, 4712, {-9, -9, -9}, {4}},
    Case{"BackN0", 'R', 0, kBad, kBad, 1, 4712, {-9, -9, -9}, {0}},
    Case{"BackKNegative", 'R', 3, kBad, kBad, 1, 4712, {-9, -9, -9}, {-1}},
    Case{"BackKAboveN", 'R', 3, kBad, kBad, 1, 4712, {-9, -9, -9}, {4}},
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
         {13.0, 0.0, -9}},
    // ynoaon: ties keep the lower number; 8466 is point mode, 8467 and above the polyline,
    // any negative mode the points.
    Case{"PointTies", 'N', 2, {0.5, 0.5}, kTies, 0, 0, {1.5625, 0.0, 1}, {kPoints}},
    Case{"PolylineTies", 'N', 2, {0.5, 0.5}, kTies, 0, 0, {0.78125, 0.5, 1}, {kPolyline}},
    Case{"HugeMode", 'N', 2, {0.5, 0.5}, kTies, 0, 0, {0.78125, 0.5, 1}, {2147483647}},
    Case{"NegativeMode", 'N', 2, {0.5, 0.5}, kTies, 0, 0, {1.5625, 0.0, 1}, {-2147483647}},
    // Beyond the last point: the last segment, t = 1.
    Case{"BeyondTheEnd", 'N', 2, {3, 0}, {-1, 0.5, 0, 0, 2, 0}, 0, 0, {1.0, 1.0, 2}, {kPolyline}},
    // A repeated point: its midpoint is only as near as the end of segment 1, not taken.
    // Reaching 2^-30 further (squared length 2^-60) it is strictly nearer, 1 - 2^-31 away;
    // (1 - 2^-31)^2 rounds to 1 - 2^-30.
    Case{"RepeatedPoint", 'N', 2, {3, 0}, {0, 0, 2, 0, 2, 0}, 0, 0, {1.0, 1.0, 1}, {kPolyline}},
    Case{"TinySegment", 'N', 2, {3, 0}, {0, 0, 2, 0, 2 + 0x1p-30, 0}, 0, 0, {1 - 0x1p-30, 0.5, 2},
         {kPolyline}},
    // Nothing below 1e60 (a NaN in X): index untouched, t = 0.
    Case{"NothingPoints", 'N', 2, {0, kNaN}, {1, 2, 3, 4}, 0, 0, {1e60, 0.0, -7}, {kPoints}},
    Case{"NothingPolyline", 'N', 2, {0, kNaN}, {1, 2, 3, 4}, 0, 0, {1e60, 0.0, -7}, {kPolyline}},
    // ynoaod, point mode, r2 = 0.25: for n = 2 the half-width is r2 itself, so the point
    // 0.375 away along an axis is skipped though within the bound (index untouched); for
    // n = 3 it is sqrt(r2) + tol: kept with tol = 0, kept on the face with tol = -0.125
    // (the box is inclusive), skipped with tol = -0.25. At exactly r2 it is not taken.
    Case{"HalfWidthR2", 'D', 2, {1.5, -0.5}, {1.875, -0.5, 9, 9}, 0, 0, {0.25, 0.0, -7},
         {kPoints, 0.25, 0}},
    Case{"HalfWidthSqrt", 'D', 3, kX3, kP3, 0, 0, {0.140625, 0.0, 2}, {kPoints, 0.25, 0}},
    Case{"OnTheFace", 'D', 3, kX3, kP3, 0, 0, {0.140625, 0.0, 2}, {kPoints, 0.25, -0.125}},
    Case{"OutsideTheFace", 'D', 3, kX3, kP3, 0, 0, {0.25, 0.0, -7}, {kPoints, 0.25, -0.25}},
    Case{"AtTheBound", 'D', 3, kX3, kP3, 0, 0, {0.140625, 0.0, -7}, {kPoints, 0.140625, 0}},
    // Polyline mode: segment 2 is found with r2 = 1; a margin of -0.5 puts both its ends
    // beyond the face x = 0.5 and nothing is found (index 0, dist2 = r2); at exactly its
    // distance it is not taken either.
    Case{"BoxAdmits", 'D', 2, {0, 0}, kBar, 0, 0, {0.5625, 0.5, 2}, {kPolyline, 1, 0}},
    Case{"BoxSkips", 'D', 2, {0, 0}, kBar, 0, 0, {1.0, 0.0, 0}, {kPolyline, 1, -0.5}},
    Case{"AtTheBoundPolyline", 'D', 2, {0, 0}, kBar, 0, 0, {0.5625, 0.0, 0},
         {kPolyline, 0.5625, 0}},
    // ynoaot: dist2 = (-2.5)^2 and c = (1, 4.125); ynraoo maps c back to the projection of X.
    // No direction: the distance to Y (1 + 6.25 + 17.015625), c untouched; ynraoo gives Y.
    Case{"Subspace", 'O', 3, kX, kYU, 0, 0, {6.25, 1.0, 4.125}, {2}},
    Case{"Back", 'R', 3, {1.0, 4.125}, kYU, 0, 0, {1.5, 0.25, 3.125}, {2}},
    Case{"NoDirection", 'O', 3, kX, kYU, 0, 0, {24.265625, -9, -9}, {0}},
    Case{"BackNoDirection", 'R', 3, {-9.0}, kYU, 0, 0, {0.5, 0.25, -1.0}, {0}},
    // A frame that is not orthonormal gives the plain dot products: u = (1, 1), X - Y = (3, 1)
    // gives c = 4 and the residual (-1, -3).
    Case{"NotOrthonormal", 'O', 2, {3, 1}, {0, 0, 1, 1}, 0, 0, {10.0, 4.0, -9}, {1}},
    // ynjont: the coordinates of X, then of X and (-0.5, 7, 0) along e1 only; k is not
    // checked (below 1 nothing is written), n and m are.
    Case{"Coordinates", 'J', 3, kX, kYU, 0, 0, {1.0, 4.125, -9}, {2}},
    Case{"SeveralPoints", 'J', 3, {1.5, -2.25, 3.125, -0.5, 7, 0}, kYU, 0, 0, {1.0, -1.0, -9}, {1}},
    Case{"NegativeK", 'J', 3, kX, kYU, 0, 0, {-9, -9, -9}, {-2}},
    Case{"PointsN0", 'J', 0, kX, kYU, 1, 4712, {-9, -9, -9}, {2}},
    Case{"PointsM0", 'J', 3, {}, kYU, 1, 4712, {-9, -9, -9}, {2}}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on

// True minimum of |P(t1) - Q(t2)|^2 over the unit square, in long double: the smallest of
// the interior stationary point (when inside) and the minimisers of the four edges.
TEST(Ynoall, RandomPairsGiveTheTrueMinimum) {
  std::mt19937_64 rng(test_seed("Ynoall.RandomPairsGiveTheTrueMinimum", 61001));
  using LD = long double;
  for (std::int32_t n : {2, 3, 4, 7, 40}) {
    for (int trial = 0; trial < 3000; ++trial) {
      const std::vector<double> s1v = uniform(rng, 2 * n, -1, 1), s2v = uniform(rng, 2 * n, -1, 1);
      const Out o = call('L', n, s1v, s2v);
      ASSERT_EQ(o.result, 0) << n << " " << trial;
      const double *p1 = s1v.data(), *p2 = p1 + n, *q1 = s2v.data(), *q2 = q1 + n;
      LD s1 = 0, s2 = 0, b = 0, d = 0, e = 0, ww = 0;
      for (int i = 0; i < n; ++i) {
        const LD a1 = (LD)p2[i] - p1[i], a2 = (LD)q2[i] - q1[i], w = (LD)p1[i] - q1[i];
        s1 += a1 * a1, s2 += a2 * a2, b += a1 * a2, d += a2 * w, e += a1 * w, ww += w * w;
      }
      // |P(u1) - Q(u2)|^2 = |w + u1 d1 - u2 d2|^2
      auto f = [&](LD u1, LD u2) {
        return ww + u1 * u1 * s1 + u2 * u2 * s2 + 2 * (u1 * e - u2 * d - u1 * u2 * b);
      };
      auto cl = [](LD t) { return std::min(std::max(t, 0.0L), 1.0L); };
      LD best = std::min(
          {f(0, cl(d / s2)), f(1, cl((d + b) / s2)), f(cl(-e / s1), 0), f(cl((b - e) / s1), 1)});
      const LD det = s1 * s2 - b * b, u1 = (b * d - s2 * e) / det, u2 = (s1 * d - b * e) / det;
      if (det > 0 && u1 >= 0 && u1 <= 1 && u2 >= 0 && u2 <= 1) best = std::min(best, f(u1, u2));
      ASSERT_NEAR(o.o[0], static_cast<double>(best), 1e-12) << "n " << n << " trial " << trial;
    }
  }
}

namespace {

// Sequential reference of ynoaon / ynoaod: the rules written out plainly, one candidate after
// another, each sum from its first term by increasing index.
Out reference(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
              std::int32_t mode, bool bound, double r2, double tol) {
  const bool line = mode >= kPolyline;
  double best = bound ? r2 : 1e60, t = 0.0, index = bound && line ? 0 : -7;
  const double h = (line || n == 3) ? std::sqrt(r2) + tol : r2;
  auto sum = [n](auto term) {
    double s = term(0);
    for (int i = 1; i < n; ++i) s += term(i);
    return s;
  };
  for (std::int64_t j = 0; j + line < std::int64_t(pts.size()) / n; ++j) {
    const double *a = &pts[j * n], *b = line ? a + n : a;
    bool skip = false;
    for (int i = 0; bound && i < n; ++i) {
      skip |= (a[i] > x[i] + h && b[i] > x[i] + h) || (a[i] < x[i] - h && b[i] < x[i] - h);
    }
    if (skip) continue;
    const double p = sum([&](int i) { return (x[i] - a[i]) * (b[i] - a[i]); });
    const double len = sum([&](int i) { return (b[i] - a[i]) * (b[i] - a[i]); });
    const double u = !line ? 0.0 : len <= 1e-15 ? 0.5 : p < 0 ? 0.0 : p > len ? 1.0 : p / len;
    const double d = sum([&](int i) {
      const double v = !line          ? a[i] - x[i]
                       : len <= 1e-15 ? (a[i] + b[i]) / 2.0 - x[i]
                       : p < 0        ? a[i] - x[i]
                       : p > len      ? b[i] - x[i]
                                      : (a[i] + u * (b[i] - a[i])) - x[i];
      return v * v;
    });
    if (d < best) best = d, index = static_cast<double>(j + 1), t = u;
  }
  return {0, 0, {best, t, index}};
}

// Random points of several kinds: a cloud, a walk (a polyline as drawn), a walk far from the
// origin (large coordinates, small distances), snapped to a coarse grid (repeated points,
// equal distances), and a cloud with a NaN and infinities.
std::vector<double> random_points(std::mt19937_64& rng, std::int32_t n, std::int32_t m, int kind) {
  std::vector<double> v = uniform(rng, static_cast<std::size_t>(n) * m, -1.0, 1.0);
  for (std::size_t k = 0; (kind == 1 || kind == 2) && k < v.size(); ++k) {
    v[k] = (k < std::size_t(n) ? (kind == 2 ? 1.0e8 : 0.0) : v[k - n]) + 0.05 * v[k];
  }
  for (double& c : v) c = kind == 3 ? std::round(c * 2.0) / 2.0 : c;
  std::uniform_int_distribution<std::size_t> pick(0, v.size() - 1);
  for (double w : {kNaN, HUGE_VAL, -HUGE_VAL}) {
    if (kind == 4) v[pick(rng)] = w;
  }
  return v;
}

}  // namespace

// Dimension 3 runs the four-lane search where the processor has AVX2: to the bit the same.
TEST(NearestSearch, FourLaneSearchMatchesTheSequentialRulesToTheBit) {
  std::mt19937_64 rng(test_seed("NearestSearch.FourLaneSearchMatchesTheSequentialRules", 65065));
  std::uniform_int_distribution<std::int32_t> count(2, 41);
  std::uniform_real_distribution<double> unit(0.0, 1.0);
  for (int trial = 0; trial < 3000 && !HasFailure(); ++trial) {
    const std::int32_t n = 2 + trial % 3, m = count(rng), kind = (trial / 3) % 5;
    const std::vector<double> pts = random_points(rng, n, m, kind);
    std::vector<double> x = random_points(rng, n, 1, kind == 4 ? 0 : kind);
    if (kind == 3 && trial % 2 == 0) x.assign(pts.begin() + n, pts.begin() + 2 * n);
    const double r2 = (kind == 2 ? 1e-4 : 0.5) * unit(rng), tol = 0.1 * (unit(rng) - 0.5);
    for (std::int32_t mode : {kPoints, kPolyline}) {
      SCOPED_TRACE(::testing::Message() << "trial " << trial << " mode " << mode);
      EXPECT_EQ(call('N', n, x, pts, {double(mode)}), reference(n, x, pts, mode, false, 0, 0));
      EXPECT_EQ(call('D', n, x, pts, {double(mode), r2, tol}),
                reference(n, x, pts, mode, true, r2, tol));
    }
  }
}
