// tests/closest/nearest_test.cpp -- checks for closest/nearest.cpp (ynoaon, ynoaod).
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "closest/closest_api.h"
#include "random_inputs.h"
#include "support/recording_services.h"

namespace {

constexpr std::int32_t kPoints = 8466, kPolyline = 8467;

struct Out {
  std::int32_t result, ierr, index;
  double dist2, t;
};

Out nearest(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
            std::int32_t mode) {
  Out o{-1, -1, -7, -9.0, -9.0};
  std::int32_t m = static_cast<std::int32_t>(pts.size()) / (n > 0 ? n : 1);
  o.result = ynoaon(&n, x.data(), &m, pts.data(), &mode, &o.dist2, &o.index, &o.t, &o.ierr);
  return o;
}

Out bounded(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
            std::int32_t mode, double r2, double tol) {
  Out o{-1, -1, -7, -9.0, -9.0};
  std::int32_t m = static_cast<std::int32_t>(pts.size()) / (n > 0 ? n : 1);
  o.result = ynoaod(&n, x.data(), &m, pts.data(), &mode, &r2, &tol, &o.dist2, &o.index, &o.t,
                    &o.ierr);
  return o;
}

void expect_same(const Out& a, const Out& b) {
  EXPECT_EQ(a.result, b.result);
  EXPECT_EQ(a.ierr, b.ierr);
  EXPECT_EQ(a.index, b.index);
  EXPECT_EQ(bits(a.dist2), bits(b.dist2));
  EXPECT_EQ(bits(a.t), bits(b.t));
}

}  // namespace

TEST(Ynoaon, TooFewPointsOrNoDimensionWritesOnlyTheCode) {
  RecordedFrames frames;
  const std::vector<double> x = {1, 2, 3}, pts = {1, 2, 3, 4, 5, 6};
  Out o = nearest(3, x, {1, 2, 3}, kPoints);  // m = 1
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4712);
  EXPECT_EQ(o.index, -7);
  EXPECT_EQ(o.dist2, -9.0);
  EXPECT_EQ(o.t, -9.0);
  std::int32_t n = 0, m = 2, mode = kPolyline, index = -7, ierr = -1;
  double dist2 = -9.0, t = -9.0, r2 = 1.0, tol = 0.0;
  EXPECT_EQ(ynoaon(&n, x.data(), &m, pts.data(), &mode, &dist2, &index, &t, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  ierr = -1;
  EXPECT_EQ(ynoaod(&n, x.data(), &m, pts.data(), &mode, &r2, &tol, &dist2, &index, &t, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  o = bounded(3, x, {1, 2, 3}, kPolyline, 1.0, 0.0);
  EXPECT_EQ(o.ierr, 4712);
  EXPECT_EQ(o.index, -7);
  EXPECT_EQ(dist2, -9.0);
  EXPECT_EQ(index, -7);
  EXPECT_EQ(t, -9.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynoaon, ModeThresholdAndTiesKeepTheLowerNumber) {
  // Points 1 to 4 are all 1.25 away (squared 1.5625); the polyline passes nearer.
  const std::vector<double> x = {0.5, 0.5};
  const std::vector<double> pts = {-0.75, 0.5, 0.5, 1.75, 1.75, 0.5, 0.5, -0.75, 0.5, -3.0};
  Out o = nearest(2, x, pts, kPoints);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.index, 1);  // point 1 ties too, and comes first
  EXPECT_EQ(o.dist2, 1.5625);
  EXPECT_EQ(bits(o.t), bits(0.0));
  o = nearest(2, x, pts, kPolyline);
  // Segment 1 from (-0.75, 0.5) to (0.5, 1.75): p = 1.5625, L = 3.125, u = 1/2, at
  // (-0.125, 1.125), squared distance 0.78125; segment 2 gives the same and is not taken.
  EXPECT_EQ(o.index, 1);
  EXPECT_EQ(o.t, 0.5);
  EXPECT_EQ(o.dist2, 0.78125);
  // A huge mode is still the polyline; a negative one the points.
  EXPECT_EQ(nearest(2, x, pts, 2147483647).t, 0.5);
  EXPECT_EQ(nearest(2, x, pts, -2147483647 - 1).dist2, 1.5625);
}

TEST(Ynoaon, PolylineEndsAndDegenerateSegments) {
  const std::vector<double> x = {3.0, 0.0};
  // Beyond the last point: the last segment, t = 1, the end point's distance.
  Out o = nearest(2, x, {-1.0, 0.5, 0.0, 0.0, 2.0, 0.0}, kPolyline);
  EXPECT_EQ(o.index, 2);
  EXPECT_EQ(o.t, 1.0);
  EXPECT_EQ(o.dist2, 1.0);
  // A repeated point: its midpoint is as near as the end of segment 1, so not taken.
  o = nearest(2, x, {0.0, 0.0, 2.0, 0.0, 2.0, 0.0}, kPolyline);
  EXPECT_EQ(o.index, 1);
  EXPECT_EQ(o.t, 1.0);
  // A segment of squared length 2^-60 reaching 2^-30 further: its midpoint, 1 - 2^-31 away,
  // is strictly nearer; (1 - 2^-31)^2 rounds to 1 - 2^-30.
  o = nearest(2, x, {0.0, 0.0, 2.0, 0.0, 2.0 + 0x1p-30, 0.0}, kPolyline);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.index, 2);
  EXPECT_EQ(o.t, 0.5);
  EXPECT_EQ(bits(o.dist2), bits(1.0 - 0x1p-30));
}

TEST(Ynoaon, NothingBelowTheStartLeavesIndexAndGivesTZero) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const std::vector<double> x = {0.0, nan};
  for (std::int32_t mode : {kPoints, kPolyline}) {
    const Out o = nearest(2, x, {1, 2, 3, 4, 5, 6}, mode);
    EXPECT_EQ(o.result, 0);
    EXPECT_EQ(o.dist2, 1e60);
    EXPECT_EQ(o.index, -7);
    EXPECT_EQ(bits(o.t), bits(0.0));
  }
}

TEST(Ynoaod, PointBoxHalfWidthIsTheSquaredBoundExceptInSpace) {
  // r2 = 0.25: the point 0.375 away along the first axis (squared 0.140625) is within the
  // bound, but outside the box of half-width 0.25 used for n = 2; n = 3 uses sqrt(0.25) + tol.
  Out o = bounded(2, {1.5, -0.5}, {1.875, -0.5, 9.0, 9.0}, kPoints, 0.25, 0.0);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.ierr, 0);
  EXPECT_EQ(o.dist2, 0.25);
  EXPECT_EQ(o.index, -7);  // untouched: nothing found in point mode
  EXPECT_EQ(bits(o.t), bits(0.0));
  const std::vector<double> x3 = {1.5, -0.5, 2.0};
  const std::vector<double> p3 = {9, 9, 9, 1.875, -0.5, 2.0, 9, 9, 9, 9, 9, 9, 9, 9, 9};
  o = bounded(3, x3, p3, kPoints, 0.25, 0.0);
  EXPECT_EQ(o.index, 2);
  EXPECT_EQ(o.dist2, 0.140625);
  // The margin narrows the box in space: with h = 0.375 the point lies on the face and is
  // kept (the box is inclusive), with h = 0.25 it is outside.
  EXPECT_EQ(bounded(3, x3, p3, kPoints, 0.25, -0.125).index, 2);
  EXPECT_EQ(bounded(3, x3, p3, kPoints, 0.25, -0.25).index, -7);
  // A point exactly at the bound is not taken (strict).
  o = bounded(3, x3, p3, kPoints, 0.140625, 0.0);
  EXPECT_EQ(o.index, -7);
  EXPECT_EQ(o.dist2, 0.140625);
}

TEST(Ynoaod, PolylineBoxAndNothingFoundGiveIndexZero) {
  // Segment 2 runs from (0.75, -2) to (0.75, 2), squared distance 0.5625 from X = 0; with
  // r2 = 1 the box of half-width 1 admits it, a margin of -0.5 puts both ends beyond the face
  // x = 0.5. Segments 1 and 3 lie wholly beyond y = -1 and y = 1.
  const std::vector<double> x = {0.0, 0.0};
  const std::vector<double> pts = {5.0, -2.0, 0.75, -2.0, 0.75, 2.0, -1.0, 2.0};
  Out o = bounded(2, x, pts, kPolyline, 1.0, 0.0);
  EXPECT_EQ(o.index, 2);
  EXPECT_EQ(o.t, 0.5);
  EXPECT_EQ(o.dist2, 0.5625);
  o = bounded(2, x, pts, kPolyline, 1.0, -0.5);
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.index, 0);
  EXPECT_EQ(o.dist2, 1.0);
  EXPECT_EQ(bits(o.t), bits(0.0));
  // The same bound met exactly by segment 2 is not taken either.
  EXPECT_EQ(bounded(2, x, pts, kPolyline, 0.5625, 0.0).index, 0);
}

namespace {

// Sequential reference: the rules written out plainly, one candidate after another.
Out reference(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
              std::int32_t mode, bool bound, double r2, double tol) {
  const std::int64_t m = static_cast<std::int64_t>(pts.size()) / n;
  auto at = [&](std::int64_t j, int i) { return pts[j * n + i]; };
  Out o{0, 0, -7, bound ? r2 : 1e60, 0.0};
  const double h = std::sqrt(r2) + tol;
  if (mode < kPolyline) {
    const double hw = (n == 3) ? h : r2;
    for (std::int64_t j = 0; j < m; ++j) {
      bool skip = false;
      for (int i = 0; bound && i < n; ++i) {
        if (at(j, i) > x[i] + hw || at(j, i) < x[i] - hw) skip = true;
      }
      if (skip) continue;
      double d = 0;
      for (int i = 0; i < n; ++i) {
        const double v = at(j, i) - x[i];
        d = i == 0 ? v * v : d + v * v;
      }
      if (d < o.dist2) o.dist2 = d, o.index = static_cast<std::int32_t>(j + 1);
    }
    return o;
  }
  if (bound) o.index = 0;
  for (std::int64_t k = 0; k + 1 < m; ++k) {
    bool skip = false;
    for (int i = 0; bound && i < n; ++i) {
      const double a = at(k, i), b = at(k + 1, i);
      if ((a > x[i] + h && b > x[i] + h) || (a < x[i] - h && b < x[i] - h)) skip = true;
    }
    if (skip) continue;
    double p = 0, len = 0;
    for (int i = 0; i < n; ++i) {
      const double ab = at(k + 1, i) - at(k, i);
      p = i == 0 ? (x[i] - at(k, i)) * ab : p + (x[i] - at(k, i)) * ab;
      len = i == 0 ? ab * ab : len + ab * ab;
    }
    double u = 0.0, d = 0;
    for (int i = 0; i < n; ++i) {
      const double a = at(k, i), b = at(k + 1, i);
      double v;
      if (len <= 1e-15) {
        u = 0.5, v = (a + b) / 2.0 - x[i];
      } else if (p < 0) {
        u = 0.0, v = a - x[i];
      } else if (p > len) {
        u = 1.0, v = b - x[i];
      } else {
        u = p / len, v = (a + u * (b - a)) - x[i];
      }
      d = i == 0 ? v * v : d + v * v;
    }
    if (d < o.dist2) o.dist2 = d, o.index = static_cast<std::int32_t>(k + 1), o.t = u;
  }
  return o;
}

// Random inputs of several kinds: a cloud, a walk (a polyline as drawn), a walk far from
// the origin (large coordinates, small distances), repeated points for ties and degenerate
// segments, and now and then a NaN or an infinity.
std::vector<double> random_points(std::mt19937_64& rng, std::int32_t n, std::int32_t m, int kind) {
  std::vector<double> v = uniform(rng, static_cast<std::size_t>(n) * m, -1.0, 1.0);
  if (kind == 1 || kind == 2) {
    const double offset = kind == 2 ? 1.0e8 : 0.0;
    for (std::int32_t j = 0; j < m; ++j) {
      for (std::int32_t i = 0; i < n; ++i) {
        const double prev = j == 0 ? offset : v[(j - 1) * n + i];
        v[j * n + i] = prev + 0.05 * v[j * n + i];
      }
    }
  }
  if (kind == 3) {  // snap to a coarse grid: repeated points and equal distances
    for (double& c : v) c = std::round(c * 2.0) / 2.0;
  }
  if (kind == 4) {
    std::uniform_int_distribution<std::size_t> pick(0, v.size() - 1);
    v[pick(rng)] = std::numeric_limits<double>::quiet_NaN();
    v[pick(rng)] = std::numeric_limits<double>::infinity();
    v[pick(rng)] = -std::numeric_limits<double>::infinity();
  }
  return v;
}

}  // namespace

TEST(NearestSearch, FourLaneSearchMatchesTheSequentialRulesToTheBit) {
  std::mt19937_64 rng(test_seed("NearestSearch.FourLaneSearchMatchesTheSequentialRules", 65065));
  std::uniform_int_distribution<std::int32_t> count(2, 41);
  std::uniform_real_distribution<double> unit(0.0, 1.0);
  for (int trial = 0; trial < 3000; ++trial) {
    const std::int32_t n = 2 + trial % 3, m = count(rng), kind = (trial / 3) % 5;
    const std::vector<double> pts = random_points(rng, n, m, kind);
    std::vector<double> x = random_points(rng, n, 1, kind == 4 ? 0 : kind);
    if (kind == 3 && trial % 2 == 0) x.assign(pts.begin() + n, pts.begin() + 2 * n);
    const double r2 = (kind == 2 ? 1e-4 : 0.5) * unit(rng);
    const double tol = 0.1 * (unit(rng) - 0.5);
    for (std::int32_t mode : {kPoints, kPolyline}) {
      SCOPED_TRACE(::testing::Message() << "trial " << trial << " n " << n << " m " << m
                                        << " kind " << kind << " mode " << mode);
      expect_same(nearest(n, x, pts, mode), reference(n, x, pts, mode, false, 0, 0));
      expect_same(bounded(n, x, pts, mode, r2, tol), reference(n, x, pts, mode, true, r2, tol));
    }
    if (HasFailure()) break;
  }
}
