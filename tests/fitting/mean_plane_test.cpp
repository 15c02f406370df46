// tests/fitting/mean_plane_test.cpp -- checks for fitting/mean_plane.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"

namespace {
using Frames = std::vector<Frame>;
const Frame kSolmpr1{1, " SOLMPR;", 8}, kClvcpr1{1, " CLVCPR;", 8}, kClvcpr2{2, " CLVCPR;", 8};
const Frame kDrmoyn1{1, " DRMOYN;", 8}, kDrmoyn2{2, " DRMOYN;", 8};
const std::int32_t kZero = 0, kOne = 1, kTwo = 2, kLd = 3, kFour = 4, kSix = 6;
const double kTol = 1e-3;
// Points (0, 0, 0) + k (1, 2, 2), k = 0..3, centroid (1.5, 3, 3).
const double kLine[12] = {0, 0, 0, 1, 2, 2, 2, 4, 4, 3, 6, 6};
// The octahedron +-e1, +-e2, +-e3: scatter 2 I, a triple eigenvalue.
const double kOcta[18] = {1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1};
}  // namespace

TEST(Solmpr, CoincidenceAndMultipleEigenvalueThresholds) {
  // Two points 0.5 apart lie 0.25 from their centroid: with tol = 0.5, (tol / 2)^2 = 0.0625
  // is not exceeded (failure: g and s written, l untouched); one ulp less, it is. No point,
  // or a leading dimension below 3: the same failure, nothing written.
  const double p[6] = {0, 0, 0, 0.5, 0, 0}, tol[2] = {0.5, std::nextafter(0.5, 0.0)}, lambda = 0;
  double g[3], s[6], l[3] = {-1, -1, -1}, v[3] = {5, 5, 5};
  RecordedFrames frames;
  EXPECT_EQ(solmpr(p, &kLd, &kTwo, &tol[0], g, s, l), 1);
  EXPECT_TRUE(g[0] == 0.25 && s[0] == 0.125 && l[0] == -1);
  g[0] = 7;
  EXPECT_EQ(solmpr(p, &kLd, &kZero, &tol[1], g, s, l), 1);
  EXPECT_EQ(solmpr(p, &kTwo, &kOne, &tol[1], g, s, l), 1);
  EXPECT_EQ(g[0], 7.0);
  EXPECT_EQ(solmpr(p, &kLd, &kTwo, &tol[1], g, s, l), 0);
  for (int i = 0; i < 3; ++i) EXPECT_NEAR(l[i], i == 2 ? 0.125 : 0.0, 1e-15);
  // clvcpr on diag(x, 1, 0), lambda 0: only m3 = x is non-zero; failure (v untouched) up to
  // 1e-13 inclusive. A NaN in Syy makes m1 and m3 NaN: no minor equals the largest, code 2.
  double d[6] = {1e-13, 1, 0, 0, 0, 0};
  EXPECT_EQ(clvcpr(d, &lambda, v), 1);
  EXPECT_EQ(v[0], 5.0);
  d[0] = std::nextafter(1e-13, 1.0);
  EXPECT_EQ(clvcpr(d, &lambda, v), 0);
  EXPECT_TRUE(v[0] == 0 && v[1] == 0 && v[2] == 1);
  d[1] = NAN;
  EXPECT_EQ(clvcpr(d, &lambda, v), 1);
  EXPECT_EQ(frames.frames(), (Frames{kSolmpr1, kSolmpr1, kSolmpr1, kClvcpr1, kClvcpr2}));
}

TEST(Drmoyn, LineThroughTheCentroidAndBothFailureCodes) {
  // Coincident points: code 1 after solmpr's frame, the line untouched; the octahedron:
  // clvcpr finds the largest eigenvalue multiple, code 2.
  const double same[6] = {2, 2, 2, 2, 2, 2}, want[6] = {1.0 / 3, 2.0 / 3, 2.0 / 3, 1.5, 3, 3};
  double line[6] = {9, 9, 9, 9, 9, 9};
  RecordedFrames frames;
  EXPECT_EQ(drmoyn(same, &kLd, &kTwo, &kTol, line), 1);
  EXPECT_EQ(drmoyn(kOcta, &kLd, &kSix, &kTol, line), 1);
  EXPECT_EQ(line[0], 9.0);
  ASSERT_EQ(drmoyn(kLine, &kLd, &kFour, &kTol, line), 0);
  for (int i = 0; i < 6; ++i) EXPECT_NEAR(line[i], want[i], 1e-12) << i;
  EXPECT_EQ(frames.frames(), (Frames{kSolmpr1, kDrmoyn1, kClvcpr1, kDrmoyn2}));
}

TEST(Plmoyn, SquareSlabAndTheFailures) {
  double a = 7, b = 7, c = 7, d = 7, e = 7;
  const double sq[12] = {0, 0, 0, 1, 0, 0, 1, 1, 0, 0, 1, 0};
  ASSERT_EQ(plmoyn(sq, &kLd, &kFour, &kTol, &a, &b, &c, &d, &e), 0);
  EXPECT_TRUE(a == 0 && b == 0 && c == 1 && d == 0 && e == 0);
  // C + a U + b V + s h N with U = (2, 2, -1), V = (1, -2, -2), N = (2, -1, 2) orthogonal,
  // all of length 3, C = (1, 2, 3), h = 1/32, (a, b, s) = (2, 1, 1), (-2, 1, -1), (2, -1, -1),
  // (-2, -1, 1): the scatter is diagonal in (U, V, N), smallest along N, so the normal is
  // +-N / 3, N . C / 3 = 2 and the heights are +-3h.
  const double slab[12] = {6.0625, 3.96875, -0.9375, -2.0625, -3.96875, 2.9375,
                           3.9375, 8.03125, 2.9375,  -3.9375, -0.03125, 7.0625};
  ASSERT_EQ(plmoyn(slab, &kLd, &kFour, &kTol, &a, &b, &c, &d, &e), 0);
  const double sign = a > 0 ? 1.0 : -1.0, want[5] = {2.0 / 3, -1.0 / 3, 2.0 / 3, -2, 0.09375};
  const double got[5] = {sign * a, sign * b, sign * c, sign * d, e};
  for (int i = 0; i < 5; ++i) EXPECT_NEAR(got[i], want[i], 1e-12) << i;
  // Exactly collinear: L1 + L2 <= r2, nothing written, no frame. y = +-0.03 about the x
  // axis with tol 0.1: r2 = 0.0025 < L1 + L2 = 0.00288 <= n r2, and the farthest point lies
  // 0.00129606210337656 (squared) from the mean line (eigen-decomposition in 40-digit
  // arithmetic): failure with that distance in e. The octahedron: clvcpr fails for the
  // normal (its frame only).
  const double zig[12] = {0, 0.03, 0, 1, -0.03, 0, 2, 0.03, 0, 3, -0.03, 0}, wide = 0.1;
  a = e = 7;
  RecordedFrames frames;
  EXPECT_EQ(plmoyn(kLine, &kLd, &kFour, &kTol, &a, &b, &c, &d, &e), 1);
  EXPECT_TRUE(frames.empty() && e == 7);
  EXPECT_EQ(plmoyn(zig, &kLd, &kFour, &wide, &a, &b, &c, &d, &e), 1);
  EXPECT_NEAR(e, 0.0012960621033765633, 1e-15);
  EXPECT_EQ(plmoyn(kOcta, &kLd, &kSix, &kTol, &a, &b, &c, &d, &e), 1);
  EXPECT_EQ(a, 7.0);
  EXPECT_EQ(frames.frames(), Frames{kClvcpr1});
  // ecrdrt: the farthest point from the x axis, the first one of a tie; none gives 0 and 1.
  const double xaxis[6] = {1, 0, 0, 0, 0, 0}, q[9] = {5, 1, 0, -3, 0, -1, 2, 0, 0.5};
  for (std::int32_t n : {3, 0}) {
    std::int32_t k = -1;
    ecrdrt(q, &kLd, &n, xaxis, &e, &k);
    EXPECT_TRUE(e == (n == 3 ? 1 : 0) && k == 1) << n;
  }
}
