// tests/linalg/products_test.cpp -- checks for linalg/products.cpp: ynmpmm, ynmpmv, ynmrmm,
// ynmtvv, ynvpvv, ynvevv, ynvvvv (ynvvvv's workspace is in gauss_test.cpp).
#include <gtest/gtest.h>

#include <random>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"

TEST(Products, SizesBelowTheMinimumAreRefusedAndLeaveTheOutputUntouched) {
  RecordedFrames frames;
  double a[4] = {1, 2, 3, 4}, out[4] = {-5, -5, -5, -5};
  std::int32_t one = 1, zero = 0, ierr = -1;
  // clang-format off
  const int results[] = {
      ynmpmm(&one, &zero, &one, a, a, out, &ierr), ynmpmm(&zero, &one, &one, a, a, out, &ierr),
      ynmpmm(&one, &one, &zero, a, a, out, &ierr), ynmpmv(&one, &zero, a, a, out, &ierr),
      ynmpmv(&zero, &one, a, a, out, &ierr),       ynmrmm(&zero, &one, a, out, &ierr),
      ynmrmm(&one, &zero, a, out, &ierr),          ynmtvv(&zero, a, a, out, &ierr),
      ynvpvv(&zero, a, a, out, &ierr),             ynvevv(&one, a, a, out, &ierr),
      ynvvvv(&one, a, out, &ierr)};
  // clang-format on
  for (int r : results) EXPECT_EQ(r, 1);
  EXPECT_EQ(ierr, 4712);
  for (double v : out) EXPECT_EQ(v, -5.0);
  EXPECT_TRUE(frames.empty());
}

TEST(Products, AccumulateLeftToRightFromTheFirstTermAndTranspose) {
  // A = [1 1 1; 2 3 4], B = [1 5; h 6; h 7] with h = 2^-53. Left to right, (1 + h) + h = 1;
  // any other grouping of P(1,1) gives 1 + 2^-52. P(2,1): 2 + 3h -> 2 + 2^-51, + 4h -> 2 + 2^-50.
  std::int32_t m = 2, k = 3, n = 2, one = 1, ierr = -1;
  const double h = 0x1p-53, a[6] = {1, 2, 1, 3, 1, 4}, b[6] = {1, h, h, 5, 6, 7}, neg0 = -0.0,
               ones[3] = {1, 1, 1};
  std::vector<double> o(14);  // P, y, s, s for one term -0, then A transposed
  ASSERT_EQ(ynmpmm(&m, &k, &n, a, b, &o[0], &ierr), 0);
  ASSERT_EQ(ynmpmv(&m, &k, a, b, &o[4], &ierr), 0);       // the first column of B as x
  ASSERT_EQ(ynvpvv(&k, ones, b, &o[6], &ierr), 0);        // the same sum as P(1,1)
  ASSERT_EQ(ynvpvv(&one, &neg0, ones, &o[7], &ierr), 0);  // no leading +0 in the sum
  ASSERT_EQ(ynmrmm(&m, &k, a, &o[8], &ierr), 0);          // B(j,i) = A(i,j)
  expect_same(o, {1, 2 + 0x1p-50, 18, 56, 1, 2 + 0x1p-50, 1, -0.0, 1, 1, 1, 2, 3, 4}, 0);
}

TEST(Products, BoundsWedgeAndGeneralisedVectorProduct) {
  // ynmtvv ('t', in place): y(i) = x(i) - d(i), y(n+i) = x(n+i) + d(i), stopping after the
  // first crossing pair. ynvevv ('e'): u(i) v(j) - u(j) v(i) for (1,2) (1,3) ... (n-1,n), for
  // n = 3 not u x v. ynvvvv ('v'): n = 2 a quarter turn, 3 the cross product, 4 (-1)^(i+1)
  // det(minor).
  // clang-format off
  const struct { char r; std::int32_t n; std::vector<double> u, v, want; std::int32_t code; }
  cases[] = {
      {'t', 1, {0, 1}, {-0.5}, {0.5, 0.5}, 0},  // touching bounds are accepted
      {'t', 1, {0, 1}, {-0.75}, {0.75, 0.25}, 4712},
      {'t', 1, {NAN, 0}, {0}, {NAN, 0}, 0},  // a NaN bound never crosses
      {'t', 3, {0, 0, 0, 1, 1, 1}, {0.25, -1, 2}, {-0.25, 1, 0, 1.25, 0, 1}, 4712},  // 3rd kept
      {'t', 3, {0, 0, 0, 1, 1, 1}, {0.25, -0.5, 2}, {-0.25, 0.5, -2, 1.25, 0.5, 3}, 0},
      {'e', 3, {1, 0, 0}, {0, 0, 1}, {0, 1, 0}, 0},
      {'e', 4, {1, 2, 3, 4}, {2, 3, 5, 7}, {-1, -1, -1, 1, 2, 1}, 0},
      {'v', 2, {1, 0}, {}, {0, 1}, 0},
      {'v', 3, {1, 0, 0, 0, 1, 0}, {}, {0, 0, 1}, 0},
      {'v', 4, {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0}, {}, {0, 0, 0, -1}, 0}};
  // clang-format on
  for (const auto& c : cases) {
    std::int32_t n = c.n, ierr = -1;
    std::vector<double> w = c.r == 't' ? c.u : std::vector<double>(c.want.size());
    const int r = c.r == 't'   ? ynmtvv(&n, w.data(), c.v.data(), w.data(), &ierr)
                  : c.r == 'e' ? ynvevv(&n, c.u.data(), c.v.data(), w.data(), &ierr)
                               : ynvvvv(&n, c.u.data(), w.data(), &ierr);
    EXPECT_TRUE(r == !!c.code && ierr == c.code) << &c - cases;
    for (std::size_t e = 0; e < w.size(); ++e)  // -0 and 0 alike here
      EXPECT_TRUE(w[e] == c.want[e] || same(w[e], c.want[e])) << &c - cases;
  }
}

TEST(Ynvvvv, EachComponentIsTheSignedMinorToTheBit) {
  // Minors of order 3 expanded along their first row; from order 4 the elimination of the
  // plain transcription.
  std::mt19937_64 rng(test_seed());
  std::uniform_real_distribution<double> uniform(-1, 1);
  for (std::int32_t n = 4; n <= 21; ++n) {
    std::vector<double> a(n * (n - 1)), w(n), m;
    for (double& v : a) v = uniform(rng);
    std::int32_t ierr = -1;
    ASSERT_EQ(ynvvvv(&n, a.data(), w.data(), &ierr), 0);
    for (std::int32_t i = 0; i < n; ++i) {
      m.clear();
      for (std::int32_t e = 0; e < n * (n - 1); ++e)
        if (e % n != i) m.push_back(a[e]);
      const double d =
          n > 4 ? plain::determinant(n - 1, m)
                : (m[0] * (m[4] * m[8] - m[7] * m[5]) - m[3] * (m[1] * m[8] - m[7] * m[2])) +
                      m[6] * (m[1] * m[5] - m[4] * m[2]);
      EXPECT_EQ(bits(w[i]), bits(i % 2 ? -d : d)) << n << " " << i << " ORVQ7_SEED=" << test_seed();
    }
  }
}
