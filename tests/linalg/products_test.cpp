// tests/linalg/products_test.cpp -- checks for linalg/products.cpp: ynmpmm, ynmpmv, ynmrmm,
// ynmtvv, ynvpvv, ynvevv, ynvvvv.
#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "support/recording_services.h"

namespace {
const double kHalfUlp = 0x1p-53;  // 1 + kHalfUlp rounds back to 1 (ties to even)
}  // namespace

TEST(Products, SizesBelowTheMinimumAreRefusedAndLeaveTheOutputUntouched) {
  RecordedFrames frames;
  double a[4] = {1, 2, 3, 4}, out[4] = {-5, -5, -5, -5};
  std::int32_t one = 1, zero = 0, ierr = -1;
  const int results[] = {
      ynmpmm(&one, &zero, &one, a, a, out, &ierr), ynmpmm(&zero, &one, &one, a, a, out, &ierr),
      ynmpmm(&one, &one, &zero, a, a, out, &ierr), ynmpmv(&one, &zero, a, a, out, &ierr),
      ynmpmv(&zero, &one, a, a, out, &ierr),       ynmrmm(&zero, &one, a, out, &ierr),
      ynmrmm(&one, &zero, a, out, &ierr),          ynmtvv(&zero, a, a, out, &ierr),
      ynvpvv(&zero, a, a, out, &ierr),             ynvevv(&one, a, a, out, &ierr),
      ynvvvv(&one, a, out, &ierr)};
  for (int r : results) EXPECT_EQ(r, 1);
  EXPECT_EQ(ierr, 4712);
  for (double v : out) EXPECT_EQ(v, -5.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Products, AccumulateLeftToRightFromTheFirstTerm) {
  // A = [1 1 1; 2 3 4], B = [1 5; h 6; h 7] with h = 2^-53. Left to right, (1 + h) + h = 1;
  // any other grouping of P(1,1) gives 1 + 2^-52. P(2,1): 2 + 3h -> 2 + 2^-51, + 4h -> 2 + 2^-50.
  std::int32_t m = 2, k = 3, n = 2, ierr = -1;
  const double a[6] = {1, 2, 1, 3, 1, 4}, b[6] = {1, kHalfUlp, kHalfUlp, 5, 6, 7};
  double p[4], y[2], s;
  ASSERT_EQ(ynmpmm(&m, &k, &n, a, b, p, &ierr), 0);
  const double expect[4] = {1.0, 2.0 + 0x1p-50, 18.0, 56.0};
  for (int e = 0; e < 4; ++e) EXPECT_EQ(p[e], expect[e]) << e;
  ASSERT_EQ(ynmpmv(&m, &k, a, b, y, &ierr), 0);  // the first column of B as x
  EXPECT_EQ(y[0], 1.0);
  EXPECT_EQ(y[1], 2.0 + 0x1p-50);
  const double ones[3] = {1, 1, 1};
  ASSERT_EQ(ynvpvv(&k, ones, b, &s, &ierr), 0);  // the same sum as P(1,1)
  EXPECT_EQ(s, 1.0);
  const double neg0 = -0.0, one = 1.0;
  std::int32_t n1 = 1;
  ASSERT_EQ(ynvpvv(&n1, &neg0, &one, &s, &ierr), 0);
  EXPECT_EQ(bits(s), bits(-0.0));  // no leading +0 in the sum
}

TEST(Ynmrmm, TransposesAndKeepsARowsStorageOrder) {
  std::int32_t m = 2, n = 3, ierr = -1;
  const double a[6] = {11, 21, 12, 22, 13, 23};  // A(i,j) = 10 i + j
  double b[6];
  ASSERT_EQ(ynmrmm(&m, &n, a, b, &ierr), 0);
  const double expect[6] = {11, 12, 13, 21, 22, 23};
  for (int e = 0; e < 6; ++e) EXPECT_EQ(b[e], expect[e]);
  m = 1;
  ASSERT_EQ(ynmrmm(&m, &n, a, b, &ierr), 0);  // a 1 x 3 row becomes the same 3 x 1 column
  for (int e = 0; e < 3; ++e) EXPECT_EQ(b[e], a[e]);
}

TEST(Ynmtvv, WidensShrinksAndStopsAtTheFirstCrossingPair) {
  std::int32_t n = 1, ierr = -1;
  const double x[2] = {0, 1};
  double d = -0.5, y[2];
  ASSERT_EQ(ynmtvv(&n, x, &d, y, &ierr), 0);  // touching bounds are accepted
  EXPECT_EQ(y[0], 0.5);
  EXPECT_EQ(y[1], 0.5);
  d = -0.6;
  EXPECT_EQ(ynmtvv(&n, x, &d, y, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  n = 3;  // the second pair crosses: it is written, the third is not
  double xx[6] = {0, 0, 0, 1, 1, 1}, dd[3] = {0.25, -1, 2}, yy[6] = {9, 9, 9, 9, 9, 9};
  EXPECT_EQ(ynmtvv(&n, xx, dd, yy, &ierr), 1);
  const double crossed[6] = {-0.25, 1, 9, 1.25, 0, 9};
  for (int e = 0; e < 6; ++e) EXPECT_EQ(yy[e], crossed[e]) << e;
  dd[1] = -0.5;
  ASSERT_EQ(ynmtvv(&n, xx, dd, xx, &ierr), 0);  // in place
  const double widened[6] = {-0.25, 0.5, -2, 1.25, 0.5, 3};
  for (int e = 0; e < 6; ++e) EXPECT_EQ(xx[e], widened[e]) << e;
}

TEST(Ynvevv, PairsInLexicographicOrder) {
  std::int32_t n = 3, ierr = -1;
  const double u[4] = {1, 0, 0, 0}, v[4] = {0, 0, 1, 0};
  double w[6];
  ASSERT_EQ(ynvevv(&n, u, v, w, &ierr), 0);
  EXPECT_EQ(std::vector<double>(w, w + 3), (std::vector<double>{0, 1, 0}));  // not u x v
  n = 4;  // u(i) v(j) - u(j) v(i) for (1,2) (1,3) (1,4) (2,3) (2,4) (3,4)
  const double p[4] = {1, 2, 3, 4}, q[4] = {2, 3, 5, 7}, expect[6] = {-1, -1, -1, 1, 2, 1};
  ASSERT_EQ(ynvevv(&n, p, q, w, &ierr), 0);
  for (int e = 0; e < 6; ++e) EXPECT_EQ(w[e], expect[e]) << e;
}

TEST(Ynvvvv, SignRulesForTwoThreeAndFourUnknowns) {
  const struct {
    std::int32_t n;
    std::vector<double> a, w;
  } cases[] = {
      {2, {1, 0}, {0, 1}},                                      // a quarter turn
      {3, {1, 0, 0, 0, 1, 0}, {0, 0, 1}},                       // cross product
      {4, {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0}, {0, 0, 0, -1}}  // (-1)^(4+1) det(I3)
  };
  for (const auto& c : cases) {
    std::int32_t n = c.n, ierr = -1;
    std::vector<double> w(c.n);
    ASSERT_EQ(ynvvvv(&n, c.a.data(), w.data(), &ierr), 0);
    EXPECT_EQ(w, c.w) << "n=" << n;
  }
}

TEST(Ynvvvv, SignedMinorsAgreeWithAnExtendedPrecisionDeterminant) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  for (std::int32_t n = 4; n <= 21; ++n) {
    const std::vector<double> a = sample(rng, n * (n - 1));
    std::vector<double> w(n);
    std::int32_t ierr = -1;
    ASSERT_EQ(ynvvvv(&n, a.data(), w.data(), &ierr), 0) << n;
    for (std::int32_t i = 0; i < n; ++i) {
      std::vector<long double> minor;
      for (std::int32_t e = 0; e < n * (n - 1); ++e)
        if (e % n != i) minor.push_back(a[e]);
      const double d = (i % 2 == 0 ? 1 : -1) * static_cast<double>(det_extended(n - 1, minor));
      EXPECT_NEAR(w[i], d, 1e-12 * (1 + std::fabs(d))) << "n=" << n << " i=" << i;
    }
  }
}

TEST(Ynvvvv, WorkspaceFromElevenUnknownsAndNoneAboveTheCapacity) {
  for (std::int32_t n : {10, 11, 21}) {
    // Columns e2..en: the only non-zero minor is the one without row 1, so w = e1.
    std::vector<double> a(n * (n - 1), 0.0), w(n, -3.0), e1(n, 0.0);
    for (std::int32_t j = 0; j < n - 1; ++j) a[(j + 1) + j * n] = 1.0;
    e1[0] = 1.0;
    std::int32_t ierr = -1;
    WorkspaceWatch ws;
    ws.refuse_next(1);
    EXPECT_EQ(ynvvvv(&n, a.data(), w.data(), &ierr), n >= 11 ? 1 : 0);
    EXPECT_EQ(ierr, n >= 11 ? 36 : 0);
    ws.refuse_next(0);
    ASSERT_EQ(ynvvvv(&n, a.data(), w.data(), &ierr), 0);
    EXPECT_EQ(w, e1);
    EXPECT_EQ(ws.requests(), n >= 11 ? 2 : 0);
    EXPECT_EQ(ws.outstanding(), 0);
  }
  std::int32_t n = 22, ierr = -1;
  double w = -3.0;
  WorkspaceWatch ws;
  EXPECT_EQ(ynvvvv(&n, nullptr, &w, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  EXPECT_EQ(ws.requests(), 0);
  EXPECT_EQ(w, -3.0);
}
