// tests/linalg/invert_test.cpp -- checks for linalg/invert.cpp: ynmimr, ynmxmr.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "support/recording_services.h"

// ---------------------------------------------------------------------------------------
// ynmxmr
// ---------------------------------------------------------------------------------------

TEST(Ynmxmr, ArgumentErrorsLeaveDetUntouched) {
  RecordedFrames frames;
  double det = -9.0;
  std::int32_t ierr = -1;
  for (std::int32_t n : {0, -1, 21}) {
    EXPECT_EQ(ynmxmr(&n, nullptr, &det, &ierr), 1);
    EXPECT_EQ(ierr, n < 1 ? 4712 : 4718);
  }
  EXPECT_EQ(det, -9.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynmxmr, ClosedFormsForOrdersOneToThree) {
  std::int32_t n = 1, ierr = -1;
  double det = 0, a1 = 1e-16;  // no threshold: a tiny determinant is a result
  ASSERT_EQ(ynmxmr(&n, &a1, &det, &ierr), 0);
  EXPECT_EQ(det, 1e-16);
  n = 2;
  const std::vector<double> a2 = by_columns(2, {1, 2, 3, 4});
  ASSERT_EQ(ynmxmr(&n, a2.data(), &det, &ierr), 0);
  EXPECT_EQ(det, -2.0);
  // Order 3 expands along the first row; along the first column the last bit is ...b44.
  // Bits from the first-row formula evaluated in Python.
  n = 3;
  const std::vector<double> a3 = by_columns(3, {0.7, 0.3, -0.3, 2.5, 0.2, 0.1, 2.5, 1.1, 0.7});
  ASSERT_EQ(ynmxmr(&n, a3.data(), &det, &ierr), 0);
  EXPECT_EQ(bits(det), bits(-0x1.1a9fbe76c8b43p+0));
}

TEST(Ynmxmr, ExchangesFlipTheSignAndDependentRowsGiveExactZero) {
  std::int32_t n = 4, ierr = -1;
  double det = 9;
  const std::vector<double> swapped =
      by_columns(4, {0, 1, 0, 0, 1, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1});
  ASSERT_EQ(ynmxmr(&n, swapped.data(), &det, &ierr), 0);
  EXPECT_EQ(det, -1.0);
  const std::vector<double> twins =
      by_columns(4, {0.3, 1.7, -2.9, 0.11, 5.3, 0.7, 1.3, -4.1, 0.3, 1.7, -2.9, 0.11, 2, 3, 5, 7});
  ASSERT_EQ(ynmxmr(&n, twins.data(), &det, &ierr), 0);
  EXPECT_EQ(bits(det), bits(0.0));
  EXPECT_EQ(ierr, 0);
}

TEST(Ynmxmr, CancellationFlushIsStrictAtOneEMinusTwelveOfTheOldValue) {
  // Rows (2, y, 0, 0), (2, 1, 0, 0), e3, e4 with y = 1 - m 2^-53: the first step leaves
  // 1 - y = m 2^-53 exactly in (2,2). For m = 9007 that is below 1e-12 * |1| and becomes 0,
  // so the determinant is exactly 0; for m = 9008 it is kept and det = 2 * 9008 * 2^-53.
  for (int m : {9007, 9008}) {
    const double y = 1.0 - m * 0x1p-53;
    const std::vector<double> a =
        by_columns(4, {2, y, 0, 0, 2, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1});
    std::int32_t n = 4, ierr = -1;
    double det = 9;
    ASSERT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
    EXPECT_EQ(det, m == 9007 ? 0.0 : 9008 * 0x1p-52) << m;
  }
}

TEST(Ynmxmr, PivotTiesGoToTheFirstInColumnMajorOrder) {
  // Magnitude 7 at several places. Bits from a plain transcription of the elimination in
  // Python; scanning rows in the outer loop instead would end in ...97.
  std::int32_t n = 4, ierr = -1;
  const std::vector<double> a =
      by_columns(4, {0.2, -1, -7, 3, 2, -3, 5, 2, -7, 2, 1, -3, 7, -7, -5, 5});
  double det = 0;
  ASSERT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
  EXPECT_EQ(bits(det), bits(-0x1.5399999999998p+9));
}

TEST(Ynmxmr, RandomMatricesAgreeWithAnExtendedPrecisionDeterminant) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  for (std::int32_t n = 1; n <= 20; ++n) {
    std::vector<double> a(n * n);
    for (double& v : a) v = u(rng);
    std::int32_t ierr = -1;
    double det = 0;
    ASSERT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
    const long double ref = det_extended(n, std::vector<long double>(a.begin(), a.end()));
    EXPECT_NEAR(det, static_cast<double>(ref), 1e-12 * std::fabs(static_cast<double>(ref)))
        << "n=" << n;
  }
}

// ---------------------------------------------------------------------------------------
// ynmimr
// ---------------------------------------------------------------------------------------

TEST(Ynmimr, ArgumentErrorsAndSmallOrderThresholds) {
  RecordedFrames frames;
  std::int32_t ierr = -1, n = 0;
  double b[4] = {-9, -9, -9, -9};
  EXPECT_EQ(ynmimr(&n, nullptr, b, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  n = 21;
  EXPECT_EQ(ynmimr(&n, nullptr, b, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  // Order 1: strict, 1e-15 itself is accepted.
  n = 1;
  double a = -std::nextafter(1e-15, 0.0);
  EXPECT_EQ(ynmimr(&n, &a, b, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  a = 1e-16;
  EXPECT_EQ(ynmimr(&n, &a, b, &ierr), 1);
  EXPECT_EQ(b[0], -9.0);
  a = 1e-15;
  ASSERT_EQ(ynmimr(&n, &a, b, &ierr), 0);
  EXPECT_EQ(b[0], 1.0 / 1e-15);
  // Order 2: det = a11 a22 - a21 a12 = 1e-30 exactly is accepted (strict), one ulp less not.
  n = 2;
  double m2[4] = {1, 0, 0, 1e-30};
  ASSERT_EQ(ynmimr(&n, m2, b, &ierr), 0);
  EXPECT_EQ(b[3], 1.0 / 1e-30);
  m2[3] = std::nextafter(1e-30, 0.0);
  b[0] = -9;
  EXPECT_EQ(ynmimr(&n, m2, b, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(b[0], -9.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Ynmimr, TwoByTwoClosedForm) {
  std::int32_t n = 2, ierr = -1;
  std::vector<double> a = by_columns(2, {1, 2, 3, 4});
  ASSERT_EQ(ynmimr(&n, a.data(), a.data(), &ierr), 0);  // in place
  const std::vector<double> expect = by_columns(2, {-2, 1, 1.5, -0.5});
  EXPECT_EQ(a, expect);
}

TEST(Ynmimr, PivotThresholdFromOrderThreeLeavesThePartlyTransformedArray) {
  // diag(1, 1e-15, 1): the last step's largest magnitude is 1e-15 (accepted); one ulp
  // less fails after the first two exchange steps.
  std::int32_t n = 3, ierr = -1;
  std::vector<double> a = by_columns(3, {1, 0, 0, 0, 1e-15, 0, 0, 0, 1}), b(9, -9.0);
  ASSERT_EQ(ynmimr(&n, a.data(), b.data(), &ierr), 0);
  EXPECT_EQ(b[4], 1.0 / 1e-15);
  a[4] = std::nextafter(1e-15, 0.0);
  EXPECT_EQ(ynmimr(&n, a.data(), b.data(), &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(b[0], 1.0);  // written by the copy and the first step
}

TEST(Ynmimr, PivotTiesAndTheGroupingOfTheExchangeStep) {
  // Bits from a plain transcription in Python: the first maximum in row-major order as
  // pivot, and b(i,j) - (b(i,k) b(k,j)) / p. Column-major ties change most entries;
  // b(i,k) (b(k,j) / p) changes the entry (3,1) to ...b5a.
  std::int32_t n = 3, ierr = -1;
  const std::vector<double> a = by_columns(3, {5, 5, 7, 7, 2, 2, -1, 7, 2});
  std::vector<double> b(9);
  ASSERT_EQ(ynmimr(&n, a.data(), b.data(), &ierr), 0);
  const std::vector<double> expect = by_columns(
      3, {-0x1.68e18cf81b10ep-5, 0x1.5fdbe971e7308p-3, -0x1.20b470c67c0d9p-6,
          -0x1.20b470c67c0d9p-4, 0x1.32bfb7d2e3ce7p-4, 0x1.5fdbe971e7308p-3,
          0x1.cc1f93bc55b59p-3, -0x1.68e18cf81b110p-3, -0x1.c319f03621d53p-4});
  for (int e = 0; e < 9; ++e) EXPECT_EQ(bits(b[e]), bits(expect[e])) << e;
}

TEST(Ynmimr, RandomWellConditionedMatricesTimesTheirInverseGiveTheIdentity) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  std::uniform_real_distribution<double> u(-1.0, 1.0);
  for (std::int32_t n = 1; n <= 20; ++n) {
    for (int rep = 0; rep < 10; ++rep) {
      std::vector<double> a(n * n), b(n * n);
      for (double& v : a) v = u(rng);
      for (std::int32_t i = 0; i < n; ++i) a[i + i * n] += (rep % 2 ? -1 : 1) * n;
      std::int32_t ierr = -1;
      ASSERT_EQ(ynmimr(&n, a.data(), b.data(), &ierr), 0);
      for (std::int32_t i = 0; i < n; ++i) {
        for (std::int32_t j = 0; j < n; ++j) {
          long double s = 0;
          for (std::int32_t l = 0; l < n; ++l)
            s += static_cast<long double>(a[i + l * n]) * b[l + j * n];
          EXPECT_NEAR(static_cast<double>(s), i == j ? 1.0 : 0.0, 1e-14 * n)
              << "n=" << n << " (" << i << "," << j << ")";
        }
      }
    }
  }
}
