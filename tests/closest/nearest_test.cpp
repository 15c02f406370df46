// tests/closest/nearest_test.cpp -- checks for ynoaon and its bounded form ynoaod.
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
  bool operator==(const Out& o) const {
    return result == o.result && ierr == o.ierr && index == o.index &&
           bits(dist2) == bits(o.dist2) && bits(t) == bits(o.t);
  }
};
std::ostream& operator<<(std::ostream& s, const Out& o) {
  return s << o.result << " " << o.ierr << " " << o.index << " " << o.dist2 << " " << o.t;
}

// ynoaod when bounded, else ynoaon; m from the size of pts.
Out nearest(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
            std::int32_t mode, bool bounded, double r2 = 0, double tol = 0) {
  Out o{-1, -1, -7, -9.0, -9.0};
  std::int32_t m = static_cast<std::int32_t>(pts.size()) / (n > 0 ? n : 1);
  o.result = bounded ? ynoaod(&n, x.data(), &m, pts.data(), &mode, &r2, &tol, &o.dist2, &o.index,
                              &o.t, &o.ierr)
                     : ynoaon(&n, x.data(), &m, pts.data(), &mode, &o.dist2, &o.index, &o.t, &o.ierr);
  return o;
}

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
const Out kOnlyCode = {1, 4712, -7, -9.0, -9.0};

}  // namespace

TEST_P(NearestCases, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  EXPECT_EQ(nearest(c.n, c.x, c.pts, c.mode, c.bounded, c.r2, c.tol), c.want);
  EXPECT_TRUE(frames.empty());
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Table, NearestCases, ::testing::Values(
    // Argument checks: only the code is written.
    Case{"OnePoint", 3, {1, 2, 3}, {1, 2, 3}, kPoints, false, 0, 0, kOnlyCode},
    Case{"NoDimension", 0, {1}, {1, 2}, kPolyline, false, 0, 0, kOnlyCode},
    Case{"BoundedOnePoint", 3, {1, 2, 3}, {1, 2, 3}, kPolyline, true, 1, 0, kOnlyCode},
    Case{"BoundedNoDimension", 0, {1}, {1, 2}, kPoints, true, 1, 0, kOnlyCode},
    // Ties keep the lower number; 8466 is point mode, 8467 and above the polyline, any
    // negative mode the points.
    Case{"PointTies", 2, {0.5, 0.5}, kTies, kPoints, false, 0, 0, {0, 0, 1, 1.5625, 0.0}},
    Case{"PolylineTies", 2, {0.5, 0.5}, kTies, kPolyline, false, 0, 0, {0, 0, 1, 0.78125, 0.5}},
    Case{"HugeMode", 2, {0.5, 0.5}, kTies, 2147483647, false, 0, 0, {0, 0, 1, 0.78125, 0.5}},
    Case{"NegativeMode", 2, {0.5, 0.5}, kTies, -2147483647, false, 0, 0, {0, 0, 1, 1.5625, 0.0}},
    // Beyond the last point: the last segment, t = 1.
    Case{"BeyondTheEnd", 2, {3, 0}, {-1, 0.5, 0, 0, 2, 0}, kPolyline, false, 0, 0,
         {0, 0, 2, 1.0, 1.0}},
    // A repeated point: its midpoint is only as near as the end of segment 1, not taken.
    // Reaching 2^-30 further (squared length 2^-60) it is strictly nearer, 1 - 2^-31 away;
    // (1 - 2^-31)^2 rounds to 1 - 2^-30.
    Case{"RepeatedPoint", 2, {3, 0}, {0, 0, 2, 0, 2, 0}, kPolyline, false, 0, 0,
         {0, 0, 1, 1.0, 1.0}},
    Case{"TinySegment", 2, {3, 0}, {0, 0, 2, 0, 2 + 0x1p-30, 0}, kPolyline, false, 0, 0,
         {0, 0, 2, 1 - 0x1p-30, 0.5}},
    // Nothing below 1e60 (a NaN in X): index untouched, t = 0.
    Case{"NothingPoints", 2, {0, kNaN}, {1, 2, 3, 4}, kPoints, false, 0, 0, {0, 0, -7, 1e60, 0.0}},
    Case{"NothingPolyline", 2, {0, kNaN}, {1, 2, 3, 4}, kPolyline, false, 0, 0,
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
    // Bounded polyline mode: segment 2 is found with r2 = 1; a margin of -0.5 puts both its
    // ends beyond the face x = 0.5 and nothing is found (index 0, dist2 = r2); at exactly
    // its distance it is not taken either.
    Case{"BoxAdmits", 2, {0, 0}, kBar, kPolyline, true, 1, 0, {0, 0, 2, 0.5625, 0.5}},
    Case{"BoxSkips", 2, {0, 0}, kBar, kPolyline, true, 1, -0.5, {0, 0, 0, 1.0, 0.0}},
    Case{"AtTheBoundPolyline", 2, {0, 0}, kBar, kPolyline, true, 0.5625, 0,
         {0, 0, 0, 0.5625, 0.0}}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on

namespace {

// Sequential reference: the rules written out plainly, one candidate after another, each
// sum from its first term by increasing index.
Out reference(std::int32_t n, const std::vector<double>& x, const std::vector<double>& pts,
              std::int32_t mode, bool bound, double r2, double tol) {
  const bool line = mode >= kPolyline;
  Out o{0, 0, bound && line ? 0 : -7, bound ? r2 : 1e60, 0.0};
  const double h = (line || n == 3) ? std::sqrt(r2) + tol : r2;
  auto sum = [n](auto term) {
    double s = term(0);
    for (int i = 1; i < n; ++i) s += term(i);
    return s;
  };
  const std::int64_t m = static_cast<std::int64_t>(pts.size()) / n;
  for (std::int64_t j = 0; j + line < m; ++j) {
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
      const double v = !line ? a[i] - x[i]
                       : len <= 1e-15 ? (a[i] + b[i]) / 2.0 - x[i]
                       : p < 0        ? a[i] - x[i]
                       : p > len      ? b[i] - x[i]
                                      : (a[i] + u * (b[i] - a[i])) - x[i];
      return v * v;
    });
    if (d < o.dist2) o.dist2 = d, o.index = static_cast<std::int32_t>(j + 1), o.t = u;
  }
  return o;
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
  if (kind == 4) {
    std::uniform_int_distribution<std::size_t> pick(0, v.size() - 1);
    v[pick(rng)] = std::numeric_limits<double>::quiet_NaN();
    v[pick(rng)] = std::numeric_limits<double>::infinity();
    v[pick(rng)] = -std::numeric_limits<double>::infinity();
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
      EXPECT_EQ(nearest(n, x, pts, mode, false), reference(n, x, pts, mode, false, 0, 0));
      EXPECT_EQ(nearest(n, x, pts, mode, true, r2, tol), reference(n, x, pts, mode, true, r2, tol));
    }
  }
}
