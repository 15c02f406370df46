// tests/fitting/mean_plane_test.cpp -- checks for fitting/mean_plane.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "fitting/fitting_api.h"
#include "support/recording_services.h"

namespace {

const Frame kSolmpr1{1, " SOLMPR;", 8};
const Frame kClvcpr1{1, " CLVCPR;", 8};

// Points on the line (0, 0, 0) + k (1, 2, 2), k = 0..3; centroid (1.5, 3, 3).
const std::vector<double> kLine = {0, 0, 0, 1, 2, 2, 2, 4, 4, 3, 6, 6};
// The octahedron +-e1, +-e2, +-e3: scatter 2 I, a triple eigenvalue.
const std::vector<double> kOctahedron = {1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1, 0, 0, 0, 1, 0, 0, -1};

}  // namespace

TEST(Solmpr, CoincidentPointsFailWithCodeOneAndAFrame) {
  RecordedFrames frames;
  const double p[12] = {1.5, -2, 0.25, 9, 1.5, -2, 0.25, 9, 1.5, -2, 0.25, 9};  // ld = 4
  const std::int32_t ld = 4, n = 3;
  const double tol = 1e-6;
  double g[3], s[6], l[3] = {-1, -1, -1};
  EXPECT_EQ(solmpr(p, &ld, &n, &tol, g, s, l), 1);
  EXPECT_EQ(frames.frames(), std::vector<Frame>{kSolmpr1});
  EXPECT_EQ(g[0], 1.5);  // centroid and scatter written, eigenvalues not
  EXPECT_EQ(s[0], 0.0);
  EXPECT_EQ(l[0], -1.0);
}

TEST(Solmpr, SpreadTestIsStrictAtHalfTheTolerance) {
  // Two points 0.5 apart: each lies 0.25 from the centroid; r2 = (tol / 2)^2 = 0.0625 with
  // tol = 0.5 is not exceeded, one ulp less is.
  const double p[6] = {0, 0, 0, 0.5, 0, 0};
  const std::int32_t ld = 3, n = 2;
  double g[3], s[6], l[3];
  double tol = 0.5;
  EXPECT_EQ(solmpr(p, &ld, &n, &tol, g, s, l), 1);
  tol = std::nextafter(0.5, 0.0);
  RecordedFrames frames;
  EXPECT_EQ(solmpr(p, &ld, &n, &tol, g, s, l), 0);
  EXPECT_TRUE(frames.empty());
  EXPECT_NEAR(l[0], 0.0, 1e-15);
  EXPECT_NEAR(l[1], 0.0, 1e-15);
  EXPECT_NEAR(l[2], 0.125, 1e-15);  // Sxx = 2 * 0.25^2
}

TEST(Solmpr, NoPointsOrShortLeadingDimensionCountAsCoincident) {
  RecordedFrames frames;
  const double p[3] = {1, 2, 3}, tol = 1e-3;
  double g[3] = {7, 7, 7}, s[6], l[3];
  std::int32_t ld = 3, n = 0;
  EXPECT_EQ(solmpr(p, &ld, &n, &tol, g, s, l), 1);
  ld = 2;
  n = 1;
  EXPECT_EQ(solmpr(p, &ld, &n, &tol, g, s, l), 1);
  EXPECT_EQ(g[0], 7.0);
  EXPECT_EQ(frames.frames(), (std::vector<Frame>{kSolmpr1, kSolmpr1}));
}

TEST(Clvcpr, MinorThresholdAndNaN) {
  // S - 0 I = diag(x, 1, 0): only m3 = x is non-zero; the threshold is 1e-13, inclusive.
  double s[6] = {1e-13, 1, 0, 0, 0, 0}, v[3] = {5, 5, 5};
  const double lambda = 0;
  RecordedFrames frames;
  EXPECT_EQ(clvcpr(s, &lambda, v), 1);
  EXPECT_EQ(frames.frames(), std::vector<Frame>{kClvcpr1});
  EXPECT_EQ(v[0], 5.0);
  s[0] = std::nextafter(1e-13, 1.0);
  EXPECT_EQ(clvcpr(s, &lambda, v), 0);
  EXPECT_EQ(v[0], 0.0);
  EXPECT_EQ(v[1], 0.0);
  EXPECT_EQ(v[2], 1.0);
  // A NaN in Syy makes m1 and m3 NaN: no minor equals the largest, code 2.
  RecordedFrames nan_frames;
  s[1] = NAN;
  EXPECT_EQ(clvcpr(s, &lambda, v), 1);
  EXPECT_EQ(nan_frames.frames(), (std::vector<Frame>{{2, " CLVCPR;", 8}}));
}

TEST(Drmoyn, LineThroughTheCentroidAndBothFailureCodes) {
  const std::int32_t ld = 3, n = 4;
  const double tol = 1e-3;
  double line[6];
  RecordedFrames frames;
  ASSERT_EQ(drmoyn(kLine.data(), &ld, &n, &tol, line), 0);
  EXPECT_TRUE(frames.empty());
  const double want[6] = {1.0 / 3, 2.0 / 3, 2.0 / 3, 1.5, 3, 3};
  for (int i = 0; i < 6; ++i) EXPECT_NEAR(line[i], want[i], 1e-12) << i;
  // Coincident points: code 1 after solmpr's frame; the line is untouched.
  const double same[6] = {2, 2, 2, 2, 2, 2};
  const std::int32_t two = 2;
  double keep[6] = {9, 9, 9, 9, 9, 9};
  RecordedFrames f1;
  EXPECT_EQ(drmoyn(same, &ld, &two, &tol, keep), 1);
  EXPECT_EQ(f1.frames(), (std::vector<Frame>{kSolmpr1, {1, " DRMOYN;", 8}}));
  EXPECT_EQ(keep[0], 9.0);
  // The octahedron: a triple eigenvalue, clvcpr fails, code 2.
  const std::int32_t six = 6;
  RecordedFrames f2;
  EXPECT_EQ(drmoyn(kOctahedron.data(), &ld, &six, &tol, keep), 1);
  EXPECT_EQ(f2.frames(), (std::vector<Frame>{kClvcpr1, {2, " DRMOYN;", 8}}));
}

TEST(Plmoyn, UnitSquareAndATiltedSlab) {
  const double sq[12] = {0, 0, 0, 1, 0, 0, 1, 1, 0, 0, 1, 0};
  const std::int32_t ld = 3, n = 4;
  const double tol = 1e-3;
  double a, b, c, d, e;
  ASSERT_EQ(plmoyn(sq, &ld, &n, &tol, &a, &b, &c, &d, &e), 0);
  EXPECT_EQ(a, 0.0);
  EXPECT_EQ(b, 0.0);
  EXPECT_EQ(c, 1.0);
  EXPECT_EQ(d, 0.0);
  EXPECT_EQ(e, 0.0);
  // C + a U + b V + s h N with (U, V, N) orthonormal, N = (2, -1, 2) / 3, C = (1, 2, 3),
  // h = 0.1, (a, b, s) = (2, 1, 1), (-2, 1, -1), (2, -1, -1), (-2, -1, 1): the scatter is
  // diagonal in (U, V, N) with 16, 4, 0.04, so the normal is +-N, N . C = 2 and e = h.
  const double uu[3] = {2.0 / 3, 2.0 / 3, -1.0 / 3}, vv[3] = {1.0 / 3, -2.0 / 3, -2.0 / 3};
  const double nn[3] = {2.0 / 3, -1.0 / 3, 2.0 / 3}, cc[3] = {1, 2, 3};
  const double abs_[4][3] = {{2, 1, 1}, {-2, 1, -1}, {2, -1, -1}, {-2, -1, 1}};
  double pts[12];
  for (int j = 0; j < 4; ++j) {
    for (int i = 0; i < 3; ++i) {
      pts[3 * j + i] = cc[i] + abs_[j][0] * uu[i] + abs_[j][1] * vv[i] + abs_[j][2] * 0.1 * nn[i];
    }
  }
  ASSERT_EQ(plmoyn(pts, &ld, &n, &tol, &a, &b, &c, &d, &e), 0);
  const double sign = a > 0 ? 1.0 : -1.0;
  EXPECT_NEAR(sign * a, nn[0], 1e-12);
  EXPECT_NEAR(sign * b, nn[1], 1e-12);
  EXPECT_NEAR(sign * c, nn[2], 1e-12);
  EXPECT_NEAR(sign * d, -2.0, 1e-12);
  EXPECT_NEAR(e, 0.1, 1e-12);
}

TEST(Plmoyn, LinesAndSpheresFail) {
  const std::int32_t ld = 3;
  double a = 7, b = 7, c = 7, d = 7, e = 7;
  // Exactly collinear: L1 + L2 <= r2, nothing written, no frame of its own.
  std::int32_t n = 4;
  const double tol = 1e-3;
  RecordedFrames frames;
  EXPECT_EQ(plmoyn(kLine.data(), &ld, &n, &tol, &a, &b, &c, &d, &e), 1);
  EXPECT_TRUE(frames.empty());
  EXPECT_EQ(a, 7.0);
  EXPECT_EQ(e, 7.0);
  // Nearly collinear, y = +-0.03 about the x axis with tol 0.1: r2 = 0.0025 < L1 + L2 =
  // 0.00288 <= n r2, and the farthest point lies 0.0012960621... (squared) from the mean
  // line (eigen-decomposition in 40-digit arithmetic): failure, e holds that distance.
  const double zig[12] = {0, 0.03, 0, 1, -0.03, 0, 2, 0.03, 0, 3, -0.03, 0};
  const double wide = 0.1;
  EXPECT_EQ(plmoyn(zig, &ld, &n, &wide, &a, &b, &c, &d, &e), 1);
  EXPECT_NEAR(e, 0.0012960621033765633, 1e-15);
  EXPECT_EQ(a, 7.0);
  // The octahedron: clvcpr fails for the normal (its frame only).
  n = 6;
  RecordedFrames f2;
  EXPECT_EQ(plmoyn(kOctahedron.data(), &ld, &n, &tol, &a, &b, &c, &d, &e), 1);
  EXPECT_EQ(f2.frames(), std::vector<Frame>{kClvcpr1});
}

TEST(Ecrdrt, FarthestPointFirstWinsATie) {
  const double line[6] = {1, 0, 0, 0, 0, 0};
  const double p[9] = {5, 1, 0, -3, 0, -1, 2, 0, 0.5};
  const std::int32_t ld = 3;
  std::int32_t n = 3, k = -1;
  double e = -1;
  ecrdrt(p, &ld, &n, line, &e, &k);
  EXPECT_EQ(e, 1.0);
  EXPECT_EQ(k, 1);
  n = 0;
  ecrdrt(p, &ld, &n, line, &e, &k);
  EXPECT_EQ(e, 0.0);
  EXPECT_EQ(k, 1);
}
