// tests/fitting/mean_plane_test.cpp -- checks for fitting/mean_plane.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"

namespace {

using Frames = std::vector<Frame>;
const Frame kSolmpr1{1, " SOLMPR;", 8}, kClvcpr1{1, " CLVCPR;", 8};
const std::int32_t kLd = 3;
const double kTol = 1e-3;
// Points (0, 0, 0) + k (1, 2, 2), k = 0..3, centroid (1.5, 3, 3).
const double kLine[12] = {0, 0, 0, 1, 2, 2, 2, 4, 4, 3, 6, 6};
// The octahedron +-e1, +-e2, +-e3: scatter 2 I, a triple eigenvalue.
const double kOcta[18] = {1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1};

}  // namespace

TEST(Solmpr, CoincidenceTestIsStrictAtHalfTheToleranceAndFailsWithAFrame) {
  // Two points 0.5 apart lie 0.25 from their centroid: with tol = 0.5, (tol / 2)^2 = 0.0625
  // is not exceeded (failure: g and s written, l untouched); one ulp less, it is.
  const double p[6] = {0, 0, 0, 0.5, 0, 0};
  const std::int32_t n = 2;
  double g[3], s[6], l[3] = {-1, -1, -1}, tol = 0.5;
  RecordedFrames frames;
  EXPECT_EQ(solmpr(p, &kLd, &n, &tol, g, s, l), 1);
  EXPECT_EQ(frames.frames(), Frames{kSolmpr1});
  EXPECT_EQ(g[0], 0.25);
  EXPECT_EQ(s[0], 0.125);
  EXPECT_EQ(l[0], -1.0);
  tol = std::nextafter(0.5, 0.0);
  RecordedFrames ok;
  EXPECT_EQ(solmpr(p, &kLd, &n, &tol, g, s, l), 0);
  EXPECT_TRUE(ok.empty());
  EXPECT_NEAR(l[0], 0.0, 1e-15);
  EXPECT_NEAR(l[1], 0.0, 1e-15);
  EXPECT_NEAR(l[2], 0.125, 1e-15);
  // No point, or a leading dimension below 3: the same failure, nothing written.
  const std::int32_t zero = 0, one = 1, two = 2;
  g[0] = 7;
  EXPECT_EQ(solmpr(p, &kLd, &zero, &tol, g, s, l), 1);
  EXPECT_EQ(solmpr(p, &two, &one, &tol, g, s, l), 1);
  EXPECT_EQ(g[0], 7.0);
}

TEST(Clvcpr, MinorThresholdAndNaN) {
  // S - 0 I = diag(x, 1, 0): only m3 = x is non-zero; failure up to 1e-13 inclusive.
  double s[6] = {1e-13, 1, 0, 0, 0, 0}, v[3] = {5, 5, 5};
  const double lambda = 0;
  RecordedFrames frames;
  EXPECT_EQ(clvcpr(s, &lambda, v), 1);
  EXPECT_EQ(v[0], 5.0);
  s[0] = std::nextafter(1e-13, 1.0);
  EXPECT_EQ(clvcpr(s, &lambda, v), 0);
  EXPECT_TRUE(v[0] == 0 && v[1] == 0 && v[2] == 1);
  // A NaN in Syy makes m1 and m3 NaN: no minor equals the largest, code 2.
  s[1] = NAN;
  EXPECT_EQ(clvcpr(s, &lambda, v), 1);
  EXPECT_EQ(frames.frames(), (Frames{kClvcpr1, {2, " CLVCPR;", 8}}));
}

TEST(Drmoyn, LineThroughTheCentroidAndBothFailureCodes) {
  double line[6];
  const std::int32_t four = 4, two = 2, six = 6;
  RecordedFrames frames;
  ASSERT_EQ(drmoyn(kLine, &kLd, &four, &kTol, line), 0);
  EXPECT_TRUE(frames.empty());
  const double want[6] = {1.0 / 3, 2.0 / 3, 2.0 / 3, 1.5, 3, 3};
  for (int i = 0; i < 6; ++i) EXPECT_NEAR(line[i], want[i], 1e-12) << i;
  // Coincident points: code 1 after solmpr's frame, the line untouched; the octahedron:
  // clvcpr finds the largest eigenvalue multiple, code 2.
  const double same[6] = {2, 2, 2, 2, 2, 2};
  double keep[6] = {9, 9, 9, 9, 9, 9};
  EXPECT_EQ(drmoyn(same, &kLd, &two, &kTol, keep), 1);
  EXPECT_EQ(drmoyn(kOcta, &kLd, &six, &kTol, keep), 1);
  EXPECT_EQ(keep[0], 9.0);
  EXPECT_EQ(frames.frames(),
            (Frames{kSolmpr1, {1, " DRMOYN;", 8}, kClvcpr1, {2, " DRMOYN;", 8}}));
}

TEST(Plmoyn, UnitSquareAndATiltedSlab) {
  const double sq[12] = {0, 0, 0, 1, 0, 0, 1, 1, 0, 0, 1, 0};
  const std::int32_t n = 4;
  double a, b, c, d, e;
  ASSERT_EQ(plmoyn(sq, &kLd, &n, &kTol, &a, &b, &c, &d, &e), 0);
  EXPECT_TRUE(a == 0 && b == 0 && c == 1 && d == 0 && e == 0);
  // C + a U + b V + s h N with (U, V, N) orthonormal, N = (2, -1, 2) / 3, C = (1, 2, 3),
  // h = 0.1 and (a, b, s) = (2, 1, 1), (-2, 1, -1), (2, -1, -1), (-2, -1, 1): the scatter is
  // diagonal in (U, V, N) with 16, 4, 0.04, so the normal is +-N, N . C = 2 and e = h.
  const double u[3] = {2.0 / 3, 2.0 / 3, -1.0 / 3}, v[3] = {1.0 / 3, -2.0 / 3, -2.0 / 3};
  const double nn[3] = {2.0 / 3, -1.0 / 3, 2.0 / 3}, co[4][3] = {{2, 1, 1}, {-2, 1, -1},
                                                                 {2, -1, -1}, {-2, -1, 1}};
  double p[12];
  for (int j = 0; j < 4; ++j) {
    for (int i = 0; i < 3; ++i) {
      p[3 * j + i] = (i + 1.0) + co[j][0] * u[i] + co[j][1] * v[i] + co[j][2] * 0.1 * nn[i];
    }
  }
  ASSERT_EQ(plmoyn(p, &kLd, &n, &kTol, &a, &b, &c, &d, &e), 0);
  const double sign = a > 0 ? 1.0 : -1.0;
  EXPECT_NEAR(sign * a, nn[0], 1e-12);
  EXPECT_NEAR(sign * b, nn[1], 1e-12);
  EXPECT_NEAR(sign * c, nn[2], 1e-12);
  EXPECT_NEAR(sign * d, -2.0, 1e-12);
  EXPECT_NEAR(e, 0.1, 1e-12);
}

TEST(Plmoyn, LinesAndSpheresFail) {
  double a = 7, b = 7, c = 7, d = 7, e = 7;
  const std::int32_t four = 4, six = 6;
  // Exactly collinear: L1 + L2 <= r2; nothing written, no frame.
  RecordedFrames frames;
  EXPECT_EQ(plmoyn(kLine, &kLd, &four, &kTol, &a, &b, &c, &d, &e), 1);
  EXPECT_TRUE(frames.empty());
  EXPECT_TRUE(a == 7 && e == 7);
  // y = +-0.03 about the x axis with tol 0.1: r2 = 0.0025 < L1 + L2 = 0.00288 <= n r2, and
  // the farthest point lies 0.00129606210337656 (squared) from the mean line (eigen-
  // decomposition in 40-digit arithmetic): failure, with that distance in e.
  const double zig[12] = {0, 0.03, 0, 1, -0.03, 0, 2, 0.03, 0, 3, -0.03, 0}, wide = 0.1;
  EXPECT_EQ(plmoyn(zig, &kLd, &four, &wide, &a, &b, &c, &d, &e), 1);
  EXPECT_NEAR(e, 0.0012960621033765633, 1e-15);
  EXPECT_EQ(a, 7.0);
  // The octahedron: clvcpr fails for the normal (its frame only).
  EXPECT_EQ(plmoyn(kOcta, &kLd, &six, &kTol, &a, &b, &c, &d, &e), 1);
  EXPECT_EQ(frames.frames(), Frames{kClvcpr1});
}

TEST(Ecrdrt, FarthestPointFirstWinsATie) {
  const double line[6] = {1, 0, 0, 0, 0, 0}, p[9] = {5, 1, 0, -3, 0, -1, 2, 0, 0.5};
  std::int32_t n = 3, k = -1;
  double e = -1;
  ecrdrt(p, &kLd, &n, line, &e, &k);
  EXPECT_TRUE(e == 1 && k == 1);
  n = 0;
  ecrdrt(p, &kLd, &n, line, &e, &k);
  EXPECT_TRUE(e == 0 && k == 1);
}
