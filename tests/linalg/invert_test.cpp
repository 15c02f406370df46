// tests/linalg/invert_test.cpp -- checks for linalg/invert.cpp: ynmimr, ynmxmr.
#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "support/recording_services.h"

namespace {
// ynmxmr of a matrix written by rows; returns the determinant (ierr checked to be 0).
double det_of(std::int32_t n, std::initializer_list<double> rows) {
  const std::vector<double> a = by_columns(n, rows);
  std::int32_t ierr = -1;
  double det = 9;
  EXPECT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  return det;
}
}  // namespace

TEST(Ynmxmr, ArgumentErrorsAndClosedFormsForOrdersOneToThree) {
  RecordedFrames frames;
  double det = -9.0;
  std::int32_t ierr = -1;
  for (std::int32_t n : {0, 21}) {
    EXPECT_EQ(ynmxmr(&n, nullptr, &det, &ierr), 1);
    EXPECT_EQ(ierr, n < 1 ? 4712 : 4718);
  }
  EXPECT_EQ(det, -9.0);
  EXPECT_TRUE(frames.empty());
  EXPECT_EQ(det_of(1, {1e-16}), 1e-16);  // no threshold: a tiny determinant is a result
  EXPECT_EQ(det_of(2, {1, 2, 3, 4}), -2.0);
  // Order 3 expands along the first row (bits of that formula evaluated in Python); along
  // the first column the last digit would be ...b44.
  EXPECT_EQ(bits(det_of(3, {0.7, 0.3, -0.3, 2.5, 0.2, 0.1, 2.5, 1.1, 0.7})),
            bits(-0x1.1a9fbe76c8b43p+0));
}

TEST(Ynmxmr, ExchangesFlipTheSignAndTiesGoToTheFirstInColumnMajorOrder) {
  EXPECT_EQ(det_of(4, {0, 1, 0, 0, 1, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1}), -1.0);
  EXPECT_EQ(bits(det_of(4, {0.3, 1.7, -2.9, 0.11, 5.3, 0.7, 1.3, -4.1,  // two equal rows
                            0.3, 1.7, -2.9, 0.11, 2, 3, 5, 7})),
            bits(0.0));
  // Magnitude 7 at several places; bits from a plain transcription in Python. Scanning rows
  // in the outer loop instead would end in ...97.
  EXPECT_EQ(bits(det_of(4, {0.2, -1, -7, 3, 2, -3, 5, 2, -7, 2, 1, -3, 7, -7, -5, 5})),
            bits(-0x1.5399999999998p+9));
}

TEST(Ynmxmr, CancellationFlushIsStrictAtOneEMinusTwelveOfTheOldValue) {
  // Rows (2, y, 0, 0), (2, 1, 0, 0), e3, e4 with y = 1 - m 2^-53: the first step leaves
  // 1 - y = m 2^-53 exactly in (2,2). For m = 9007 that is below 1e-12 * |1| and becomes 0,
  // so the determinant is exactly 0; for m = 9008 it is kept and det = 2 * 9008 * 2^-53.
  for (int m : {9007, 9008}) {
    const double y = 1.0 - m * 0x1p-53;
    EXPECT_EQ(det_of(4, {2, y, 0, 0, 2, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1}),
              m == 9007 ? 0.0 : 9008 * 0x1p-52);
  }
}

TEST(Ynmxmr, RandomMatricesAgreeWithAnExtendedPrecisionDeterminant) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  for (std::int32_t n = 1; n <= 20; ++n) {
    const std::vector<double> a = sample(rng, n * n);
    std::int32_t ierr = -1;
    double det = 0;
    ASSERT_EQ(ynmxmr(&n, a.data(), &det, &ierr), 0);
    const double ref =
        static_cast<double>(det_extended(n, std::vector<long double>(a.begin(), a.end())));
    EXPECT_NEAR(det, ref, 1e-12 * std::fabs(ref)) << "n=" << n;
  }
}

TEST(Ynmimr, ArgumentErrorsAndTheThresholdOfEachOrder) {
  RecordedFrames frames;
  const struct {
    std::int32_t n;
    std::vector<double> a;  // by columns
    std::int32_t code;
  } cases[] = {
      {0, {}, 4712},
      {21, {}, 4718},
      {1, {-std::nextafter(1e-15, 0.0)}, 4703},  // strict: |a| < 1e-15
      {1, {1e-15}, 0},
      {2, {1, 0, 0, std::nextafter(1e-30, 0.0)}, 4703},  // strict: |det| < 1e-30
      {2, {1, 0, 0, 1e-30}, 0},
      {3, {1, 0, 0, 0, std::nextafter(1e-15, 0.0), 0, 0, 0, 1}, 4703},  // largest remaining
      {3, {1, 0, 0, 0, 1e-15, 0, 0, 0, 1}, 0},
  };
  for (const auto& c : cases) {
    std::int32_t n = c.n, ierr = -1;
    std::vector<double> b(9, -9.0);
    EXPECT_EQ(ynmimr(&n, c.a.empty() ? nullptr : c.a.data(), b.data(), &ierr), c.code ? 1 : 0);
    EXPECT_EQ(ierr, c.code) << "n=" << n;
    // Success: the last diagonal entry inverted. Failure: orders 1 and 2 fail before
    // writing, order 3 after dividing by the first pivot 1.
    EXPECT_EQ(c.code ? b[0] : b[n * n - 1], c.code ? (n == 3 ? 1.0 : -9.0) : 1.0 / c.a.back());
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Ynmimr, TwoByTwoInPlaceAndThePivotTiesAndGroupingFromOrderThree) {
  std::int32_t n = 2, ierr = -1;
  std::vector<double> a = by_columns(2, {1, 2, 3, 4});
  ASSERT_EQ(ynmimr(&n, a.data(), a.data(), &ierr), 0);
  EXPECT_EQ(a, by_columns(2, {-2, 1, 1.5, -0.5}));
  // Bits from a plain transcription in Python: the first maximum in row-major order as
  // pivot, and b(i,j) - (b(i,k) b(k,j)) / p. Column-major ties change most entries;
  // b(i,k) (b(k,j) / p) changes the entry (3,1) to ...b5a.
  n = 3;
  const std::vector<double> m = by_columns(3, {5, 5, 7, 7, 2, 2, -1, 7, 2});
  std::vector<double> b(9);
  ASSERT_EQ(ynmimr(&n, m.data(), b.data(), &ierr), 0);
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
  for (std::int32_t n = 1; n <= 20; ++n) {
    for (int rep = 0; rep < 10; ++rep) {
      const std::vector<double> a = dominant_matrix(rng, n, rep % 2 ? -1 : 1);
      std::vector<double> b(n * n);
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
