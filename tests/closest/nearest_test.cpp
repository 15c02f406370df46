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
  o.result =
      ynoaod(&n, x.data(), &m, pts.data(), &mode, &r2, &tol, &o.dist2, &o.index, &o.t, &o.ierr);
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

struct Case {
  const char* name;
  std::int32_t n;
  std::vector<double> x, pts;
  std::int32_t mode;
  bool bounded;
  double r2, tol;
  Out want;
};
class NearestCases : public ::testing::TestWithParam<Case> {};

TEST_P(NearestCases, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  expect_same(
      c.bounded ? bounded(c.n, c.x, c.pts, c.mode, c.r2, c.tol) : nearest(c.n, c.x, c.pts, c.mode),
      c.want);
  EXPECT_TRUE(frames.empty());
}

namespace {
const double kNaN = std::numeric_limits<double>::quiet_NaN();
// Points 1 to 4 all 1.25 from (0.5, 0.5); the polyline passes nearer, 0.78125 at u = 1/2 on
// segments 1, 2 and 3.
const std::vector<double> kTies = {-0.75, 0.5, 0.5, 1.75, 1.75, 0.5, 0.5, -0.75, 0.5, -3.0};
// Point 2 lies 0.375 from X along the first axis (squared 0.140625), the others far.
const std::vector<double> kX3 = {1.5, -0.5, 2.0};
const std::vector<double> kP3 = {9, 9, 9, 1.875, -0.5, 2.0, 9, 9, 9, 9, 9, 9, 9, 9, 9};
// Segment 2 from (0.75, -2) to (0.75, 2) passes 0.75 from the origin; segments 1 and 3 lie
// wholly beyond y = -1 and y = 1.
const std::vector<double> kBar = {5.0, -2.0, 0.75, -2.0, 0.75, 2.0, -1.0, 2.0};
}  // namespace

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Table, NearestCases,
    ::testing::Values(
        // Argument checks: only the code is written.
        Case{"OnePoint", 3, {1, 2, 3}, {1, 2, 3}, kPoints, false, 0, 0, {1, 4712, -7, -9.0, -9.0}},
        Case{"NoDimension", 0, {1}, {1, 2}, kPolyline, false, 0, 0, {1, 4712, -7, -9.0, -9.0}},
        Case{"BoundedOnePoint", 3, {1, 2, 3}, {1, 2, 3}, kPolyline, true, 1, 0,
             {1, 4712, -7, -9.0, -9.0}},
        Case{"BoundedNoDimension", 0, {1}, {1, 2}, kPoints, true, 1, 0, {1, 4712, -7, -9.0, -9.0}},
        // Ties keep the lower number; 8466 is point mode, 8467 and above the polyline, any
        // negative mode the points.
        Case{"PointTies", 2, {0.5, 0.5}, kTies, kPoints, false, 0, 0, {0, 0, 1, 1.5625, 0.0}},
        Case{"PolylineTies", 2, {0.5, 0.5}, kTies, kPolyline, false, 0, 0, {0, 0, 1, 0.78125, 0.5}},
        Case{"HugeMode", 2, {0.5, 0.5}, kTies, 2147483647, false, 0, 0, {0, 0, 1, 0.78125, 0.5}},
        Case{"NegativeMode", 2, {0.5, 0.5}, kTies, -2147483647, false, 0, 0,
             {0, 0, 1, 1.5625, 0.0}},
        // Beyond the last point: the last segment, t = 1.
        Case{"BeyondTheEnd", 2, {3, 0}, {-1, 0.5, 0, 0, 2, 0}, kPolyline, false, 0, 0,
             {0, 0, 2, 1.0, 1.0}},
        // A repeated point: its midpoint is only as near as the end of segment 1, not taken.
        // Reaching 2^-30 further (squared length 2^-60) it is strictly nearer, 1 - 2^-31
        // away; (1 - 2^-31)^2 rounds to 1 - 2^-30.
        Case{"RepeatedPoint", 2, {3, 0}, {0, 0, 2, 0, 2, 0}, kPolyline, false, 0, 0,
             {0, 0, 1, 1.0, 1.0}},
        Case{"TinySegment", 2, {3, 0}, {0, 0, 2, 0, 2 + 0x1p-30, 0}, kPolyline, false, 0, 0,
             {0, 0, 2, 1 - 0x1p-30, 0.5}},
        // Nothing below 1e60 (a NaN in X): index untouched, t = 0.
        Case{"NothingFoundPoints", 2, {0, kNaN}, {1, 2, 3, 4}, kPoints, false, 0, 0,
             {0, 0, -7, 1e60, 0.0}},
        Case{"NothingFoundPolyline", 2, {0, kNaN}, {1, 2, 3, 4}, kPolyline, false, 0, 0,
             {0, 0, -7, 1e60, 0.0}},
        // Bounded point mode, r2 = 0.25: for n = 2 the half-width is r2 itself, so the point
        // 0.375 away along an axis is skipped though within the bound (index untouched); for
        // n = 3 it is sqrt(r2) + tol: kept with tol = 0, kept on the face with tol = -0.125
        // (the box is inclusive), skipped with tol = -0.25. At exactly r2 it is not taken.
        Case{"HalfWidthR2", 2, {1.5, -0.5}, {1.875, -0.5, 9, 9}, kPoints, true, 0.25, 0,
             {0, 0, -7, 0.25, 0.0}},
        Case{"HalfWidthSqrt", 3, kX3, kP3, kPoints, true, 0.25, 0, {0, 0, 2, 0.140625, 0.0}},
        Case{"OnTheFace", 3, kX3, kP3, kPoints, true, 0.25, -0.125, {0, 0, 2, 0.140625, 0.0}},
        Case{"OutsideTheFace", 3, kX3, kP3, kPoints, true, 0.25, -0.25, {0, 0, -7, 0.25, 0.0}},
        Case{"AtTheBound", 3, kX3, kP3, kPoints, true, 0.140625, 0, {0, 0, -7, 0.140625, 0.0}},
        // Bounded polyline mode: segment 2 is found with r2 = 1; a margin of -0.5 puts both
        // its ends beyond the face x = 0.5 and nothing is found (index 0, dist2 = r2); at
        // exactly its distance it is not taken either.
        Case{"BoxAdmits", 2, {0, 0}, kBar, kPolyline, true, 1, 0, {0, 0, 2, 0.5625, 0.5}},
        Case{"BoxSkips", 2, {0, 0}, kBar, kPolyline, true, 1, -0.5, {0, 0, 0, 1.0, 0.0}},
        Case{"AtTheBoundPolyline", 2, {0, 0}, kBar, kPolyline, true, 0.5625, 0,
             {0, 0, 0, 0.5625, 0.0}}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on

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
      SCOPED_TRACE(::testing::Message() << "trial " << trial << " n " << n << " m " << m << " kind "
                                        << kind << " mode " << mode);
      expect_same(nearest(n, x, pts, mode), reference(n, x, pts, mode, false, 0, 0));
      expect_same(bounded(n, x, pts, mode, r2, tol), reference(n, x, pts, mode, true, r2, tol));
    }
    if (HasFailure()) break;
  }
}
