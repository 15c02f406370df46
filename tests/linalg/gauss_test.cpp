// tests/linalg/gauss_test.cpp -- checks for linalg/gauss.cpp: ynsega, ynsetr, yntrzr, yntrnr.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "support/recording_services.h"

namespace {
const double kNaN = std::numeric_limits<double>::quiet_NaN();
}  // namespace

// ---------------------------------------------------------------------------------------
// ynsega
// ---------------------------------------------------------------------------------------

TEST(Ynsega, ArgumentErrorsLeaveXUntouchedAndRecordNoFrame) {
  RecordedFrames frames;
  double x[2] = {-7.5, -7.5}, b[2] = {1, 2};
  std::int32_t ierr = -1;
  for (std::int32_t n : {0, -3}) {
    EXPECT_EQ(ynsega(&n, nullptr, b, x, &ierr), 1);
    EXPECT_EQ(ierr, 4712);
  }
  std::int32_t n = 21;  // refused before the matrix is looked at
  EXPECT_EQ(ynsega(&n, nullptr, nullptr, x, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  EXPECT_EQ(x[0], -7.5);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynsega, OrderOneAndBothSidesOfTheLastPivotThreshold) {
  std::int32_t n = 1, ierr = -1;
  double a = 2.0, b = 4.0, x = 0.0;
  ASSERT_EQ(ynsega(&n, &a, &b, &x, &ierr), 0);
  EXPECT_EQ(x, 2.0);
  EXPECT_EQ(ierr, 0);

  a = 1e-30;  // inclusive: a last pivot equal to 1e-30 is singular
  x = -1.0;
  EXPECT_EQ(ynsega(&n, &a, &b, &x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(x, -1.0);
  a = -std::nextafter(1e-30, 1.0);
  ASSERT_EQ(ynsega(&n, &a, &b, &x, &ierr), 0);
  EXPECT_EQ(x, 4.0 / a);
}

TEST(Ynsega, SearchThresholdIsInclusiveAndSeparateFromTheLastPivotOne) {
  std::int32_t n = 2, ierr = -1;
  double x[2] = {9, 9}, b[2] = {1, 1};
  // Largest element 1e-35 passes the search (> 1e-38) and fails at the last pivot.
  double tiny[4] = {1e-35, 0, 0, 1e-35};
  EXPECT_EQ(ynsega(&n, tiny, b, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  // A NaN is never taken as pivot, so only the search threshold can stop this matrix:
  // a largest magnitude of exactly 1e-38 fails; one ulp more goes on and yields NaN.
  double m[4] = {1e-38, 0, 0, kNaN};
  EXPECT_EQ(ynsega(&n, m, b, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(x[0], 9.0);
  m[0] = std::nextafter(1e-38, 1.0);
  EXPECT_EQ(ynsega(&n, m, b, x, &ierr), 0);
  EXPECT_TRUE(std::isnan(x[1]));
}

TEST(Ynsega, ExchangesRowsAndColumnsAndUndoesThePermutation) {
  std::int32_t n = 2, ierr = -1;
  const std::vector<double> a = by_columns(2, {0, 1, 1, 0});
  double b[2] = {3, 5}, x[2];
  ASSERT_EQ(ynsega(&n, a.data(), b, x, &ierr), 0);
  EXPECT_EQ(x[0], 5.0);
  EXPECT_EQ(x[1], 3.0);
}

TEST(Ynsega, TiesGoToTheLowestRowThenColumnAndBackSubstitutionSumsFirst) {
  // Magnitude 5 at (1,3), (2,2), (3,1), (3,3): the row-major first, (1,3), is the pivot.
  // Bits from a plain transcription of the elimination in Python. Taking the column-major
  // first, (3,1), or the last, changes the last bits, and so does accumulating the back
  // substitution as b(i) - a(i,j) x(j) - ... instead of b(i) - (sum): x(3) ends ...cbe3.
  std::int32_t n = 3, ierr = -1;
  const std::vector<double> a = by_columns(3, {3, 2, 5, 1, -5, 2, 5, 3, 5});
  const std::vector<double> a0 = a;
  double b[3] = {0.1, 0.7, 0.3};
  ASSERT_EQ(ynsega(&n, a.data(), b, b, &ierr), 0);  // x is the same array as b
  EXPECT_EQ(bits(b[0]), bits(0x1.46f61e8a546f6p-3));
  EXPECT_EQ(bits(b[1]), bits(-0x1.e8a546f61e8a6p-4));
  EXPECT_EQ(bits(b[2]), bits(-0x1.cbe6d9601cbe5p-6));
  EXPECT_EQ(a, a0);  // the caller's matrix is only read
}

TEST(Ynsega, RandomWellConditionedSystemsHaveSmallResiduals) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  for (std::int32_t n = 1; n <= 20; ++n) {
    for (int rep = 0; rep < 20; ++rep) {
      std::vector<double> a(n * n), b(n), x(n);
      for (double& v : a) v = u(rng);
      for (std::int32_t i = 0; i < n; ++i) a[i + i * n] += (rep % 2 ? -1 : 1) * n;  // dominant
      for (double& v : b) v = 100 * u(rng);
      std::int32_t ierr = -1;
      ASSERT_EQ(ynsega(&n, a.data(), b.data(), x.data(), &ierr), 0);
      for (std::int32_t i = 0; i < n; ++i) {
        long double r = -static_cast<long double>(b[i]), scale = std::fabs(b[i]);
        for (std::int32_t j = 0; j < n; ++j) {
          r += static_cast<long double>(a[i + j * n]) * x[j];
          scale += std::fabs(a[i + j * n] * x[j]);
        }
        EXPECT_LE(std::fabs(static_cast<double>(r)), 1e-14 * scale) << "n=" << n << " i=" << i;
      }
    }
  }
}

// ---------------------------------------------------------------------------------------
// ynsetr
// ---------------------------------------------------------------------------------------

TEST(Ynsetr, ErrorsAndThePivotThresholdOnBothSides) {
  RecordedFrames frames;
  std::int32_t n = 0, ierr = -1;
  double d[2] = {0, 1}, a[2] = {0, 1}, c[2] = {1, 0}, r[2] = {1, 1}, x[2] = {-2, -2};
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  // Regular ([0 1; 1 1]) but the first pivot is 0: no pivoting, so it fails.
  n = 2;
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(x[0], -2.0);
  d[0] = std::nextafter(1e-15, 0.0);  // strict: just below fails ...
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  d[0] = 1e-15;  // ... and 1e-15 itself is accepted
  c[0] = 0;
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 0);
  // A later pivot: beta(2) = 2 - 1 * (2 / 1) = 0. x(1) is already written.
  double d2[2] = {1, 2}, c2[2] = {2, 0};
  x[0] = x[1] = -2;
  EXPECT_EQ(ynsetr(&n, d2, a, c2, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(x[0], 1.0);
  EXPECT_EQ(x[1], -2.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynsetr, SolvesExactlyRepresentableSystemInPlace) {
  // Rows: 2x1 + 2x2 = 10; x1 + 4x2 + 4x3 = -11; -2x2 + 0.5x3 = -11.5. Solution (1, 4, -7):
  // g1 = 1, beta2 = 3, g2 = 4/3 is inexact, so check to a few ulps against the exact answer.
  std::int32_t n = 3, ierr = -1;
  double d[3] = {2, 4, 0.5}, a[3] = {99, 1, -2}, c[3] = {2, 4, 99}, r[3] = {10, -11, -11.5};
  ASSERT_EQ(ynsetr(&n, d, a, c, r, r, &ierr), 0);  // x is the same array as r
  EXPECT_NEAR(r[0], 1.0, 1e-14);
  EXPECT_NEAR(r[1], 4.0, 1e-14);
  EXPECT_NEAR(r[2], -7.0, 1e-14);
}

TEST(Ynsetr, LargeSystemsUseOneWorkspaceBlockReleasedOnEveryPath) {
  const std::int32_t big = 25;
  std::vector<double> d(big, 4.0), a(big, 1.0), c(big, 1.0), r(big), x(big, -1.0);
  for (std::int32_t i = 0; i < big; ++i) r[i] = 1.0 + i;
  std::int32_t n = big, ierr = -1;
  {
    WorkspaceWatch ws;
    ws.refuse_next(1);
    EXPECT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 1);
    EXPECT_EQ(ierr, 36);
    EXPECT_EQ(x[0], -1.0);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  {
    WorkspaceWatch ws;
    ASSERT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 0);
    EXPECT_EQ(ws.requests(), 1);
    EXPECT_EQ(ws.outstanding(), 0);
    for (std::int32_t i = 0; i < big; ++i) {
      const double lo = i > 0 ? x[i - 1] : 0.0, hi = i + 1 < big ? x[i + 1] : 0.0;
      EXPECT_NEAR(lo + 4.0 * x[i] + hi, r[i], 1e-13);
    }
    a[big - 1] = 0.0;  // the last pivot is d(n) = 1e-16 < 1e-15: the failure path
    d[big - 1] = 1e-16;
    EXPECT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 1);
    EXPECT_EQ(ierr, 4703);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  {
    WorkspaceWatch ws;
    n = 20;  // the local scratch suffices
    d.assign(big, 4.0);
    ASSERT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 0);
    EXPECT_EQ(ws.requests(), 0);
  }
}

// ---------------------------------------------------------------------------------------
// yntrzr
// ---------------------------------------------------------------------------------------

TEST(Yntrzr, ErrorsLeaveWUntouched) {
  std::int32_t n = 0, mode = 0, ierr = -1;
  double v[2] = {1, 2}, w[2] = {-3, -3}, tol = 0.1;
  EXPECT_EQ(yntrzr(&n, v, &tol, &mode, w, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  n = 2;
  for (std::int32_t bad : {-1, 3}) {
    mode = bad;
    EXPECT_EQ(yntrzr(&n, v, &tol, &mode, w, &ierr), 1);
    EXPECT_EQ(ierr, 4718);
  }
  EXPECT_EQ(w[0], -3.0);
}

TEST(Yntrzr, AbsoluteAndRelativeRulesAreInclusive) {
  const double t = 0.3;
  const double up = std::nextafter(t, 1.0);
  std::int32_t n = 4, mode = 0, ierr = -1;
  double v[4] = {-t, up, -0x1p-70, 2.5}, w[4];
  ASSERT_EQ(yntrzr(&n, v, &t, &mode, w, &ierr), 0);
  EXPECT_EQ(bits(w[0]), bits(0.0));  // exactly +0, also for negative components
  EXPECT_EQ(w[1], up);
  EXPECT_EQ(bits(w[2]), bits(0.0));
  EXPECT_EQ(w[3], 2.5);
  // Relative: limit = 0.5 * 4 = 2 (exact).
  mode = 2;
  const double half = 0.5;
  double r[4] = {2.0, -4.0, std::nextafter(2.0, 3.0), -1.0};
  ASSERT_EQ(yntrzr(&n, r, &half, &mode, r, &ierr), 0);  // in place
  EXPECT_EQ(r[0], 0.0);
  EXPECT_EQ(r[1], -4.0);
  EXPECT_EQ(r[2], std::nextafter(2.0, 3.0));
  EXPECT_EQ(r[3], 0.0);
}

TEST(Yntrzr, GapRuleCutsAtTheFirstJumpInDecreasingOrder) {
  std::int32_t n = 3, mode = 1, ierr = -1;
  double tol = 1e-15, v[3] = {1, 1e-20, 0.5}, w[3];
  ASSERT_EQ(yntrzr(&n, v, &tol, &mode, w, &ierr), 0);
  EXPECT_EQ(w[0], 1.0);
  EXPECT_EQ(w[1], 0.0);
  EXPECT_EQ(w[2], 0.5);
  // No jump: every component copied. The comparison is strict: 1 * 0.5 > 0.5 is false.
  double tol2 = 0.5, u[3] = {0.5, -1, 0.25};
  ASSERT_EQ(yntrzr(&n, u, &tol2, &mode, w, &ierr), 0);
  EXPECT_EQ(w[0], 0.5);
  EXPECT_EQ(w[1], -1.0);
  EXPECT_EQ(w[2], 0.25);
}

TEST(Yntrzr, GapRuleKeepsTiedComponentsInIndexOrder) {
  // With tol = 2 the jump is at position 2 of (0.5, -0.5, 0.25): only the first of the two
  // tied components survives, and it is the lower index.
  std::int32_t n = 3, mode = 1, ierr = -1;
  double tol = 2.0, v[3] = {0.5, -0.5, 0.25}, w[3];
  ASSERT_EQ(yntrzr(&n, v, &tol, &mode, w, &ierr), 0);
  EXPECT_EQ(w[0], 0.5);
  EXPECT_EQ(w[1], 0.0);
  EXPECT_EQ(w[2], 0.0);
  double r[3] = {0.25, -0.5, 0.5};  // the tie reversed: again the lower index wins
  ASSERT_EQ(yntrzr(&n, r, &tol, &mode, r, &ierr), 0);
  EXPECT_EQ(r[0], 0.0);
  EXPECT_EQ(r[1], -0.5);
  EXPECT_EQ(r[2], 0.0);
}

TEST(Yntrzr, GapRuleAbove100ComponentsUsesTheWorkspace) {
  std::int32_t n = 150, mode = 1, ierr = -1;
  std::vector<double> v(n), w(n, -1.0);
  for (std::int32_t i = 0; i < n; ++i) v[i] = (i % 3 - 1) * (1.0 + i);  // 0 at i = 1, 4, ...
  v[1] = 0.1;  // magnitudes ..., 3, 1, 0.1, 0, ...: the first jump (1 * 0.25 > 0.1) cuts 0.1
  const double tol = 0.25;
  {
    WorkspaceWatch ws;
    ws.refuse_next(1);
    EXPECT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 1);
    EXPECT_EQ(ierr, 36);
    EXPECT_EQ(w[0], -1.0);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  WorkspaceWatch ws;
  ASSERT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 0);
  EXPECT_EQ(ws.requests(), 1);
  EXPECT_EQ(ws.outstanding(), 0);
  for (std::int32_t i = 0; i < n; ++i) EXPECT_EQ(w[i], i == 1 ? 0.0 : v[i]) << i;
  n = 100;
  WorkspaceWatch ws2;
  ASSERT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 0);
  EXPECT_EQ(ws2.requests(), 0);
}

// ---------------------------------------------------------------------------------------
// yntrnr
// ---------------------------------------------------------------------------------------

TEST(Yntrnr, ThreeNormsOfTheSameVector) {
  std::int32_t n = 2, ierr = -1;
  const double v[2] = {3, -4};
  double w[2], norm = 0;
  const struct {
    std::int32_t mode;
    double norm;
  } cases[] = {{0, 4.0}, {1, 7.0}, {2, 5.0}};
  for (const auto& c : cases) {
    std::int32_t mode = c.mode;
    ASSERT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 0);
    EXPECT_EQ(norm, c.norm);
    EXPECT_EQ(w[0], 3.0 / c.norm);  // one correctly rounded division each
    EXPECT_EQ(w[1], -4.0 / c.norm);
    EXPECT_EQ(ierr, 0);
  }
}

TEST(Yntrnr, EuclideanNormIsThePlainSumOfSquares) {
  // No scaling: the squares overflow, the norm is +inf and w becomes zero.
  std::int32_t n = 2, mode = 2, ierr = -1;
  const double v[2] = {1e200, -1e200};
  double w[2], norm = 0;
  ASSERT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 0);
  EXPECT_TRUE(std::isinf(norm));
  EXPECT_EQ(bits(w[1]), bits(-0.0));
}

TEST(Yntrnr, ZeroVectorAndBadArguments) {
  std::int32_t n = 3, mode = 2, ierr = -1;
  const double v[3] = {0, -0.0, 0};
  double w[3] = {5, 5, 5}, norm = 9;
  EXPECT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4710);
  EXPECT_EQ(norm, 0.0);
  EXPECT_EQ(w[0], 5.0);
  mode = 7;
  norm = 9;
  EXPECT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  EXPECT_EQ(norm, 0.0);
  n = 0;
  norm = 9;
  EXPECT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(norm, 9.0);
}
