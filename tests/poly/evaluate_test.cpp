// tests/poly/evaluate_test.cpp -- checks for poly/evaluate.cpp.
#include <gtest/gtest.h>

#include <cmath>

#include "poly/poly_api.h"
#include "support/recording_services.h"

TEST(Cor, HornerOrderAndEmptyPolynomial) {
  const double c[3] = {1, 2, 3}, d[3] = {-1, 0, 1};
  std::int32_t m = 3, zero = 0;
  double t = 2;
  EXPECT_EQ(cor(c, &m, &t), 17.0);
  EXPECT_EQ(cor(nullptr, &zero, &t), 0.0);  // c not read
  std::int32_t lowest = INT32_MIN;             // m - 1 is not formed for it
  EXPECT_EQ(bits(cor(nullptr, &lowest, &t)), bits(0.0));
  // t^2 - 1 at t = 1 + 2^-30 by Horner, (t * t) - 1: 2^-29 + 2^-60 rounds to 2^-29.
  t = 1 + 0x1p-30;
  EXPECT_EQ(bits(cor(d, &m, &t)), bits(0x1p-29));
}

TEST(Derivatives, ValuesAndRangeRules) {
  const double c[4] = {5, 1, 1, 1}, q[3] = {7, -3, 1};
  std::int32_t m = 4, two = 2, three = 3, big = 21, zero = 0;
  double t = 1;
  EXPECT_EQ(deriv(c, &m, &t), 6.0);   // 1 + 2t + 3t^2
  EXPECT_EQ(dersec(c, &m, &t), 8.0);  // 2 + 6t
  EXPECT_EQ(derter(c, &m, &t), 6.0);
  EXPECT_EQ(deriv(c, &two, &t), 1.0);
  EXPECT_EQ(derter(c, &three, &t), 0.0);
  EXPECT_EQ(deriv(nullptr, &big, &t), 0.0);  // outside 2..20: c not read
  EXPECT_EQ(dersec(nullptr, &zero, &t), 0.0);
  // dersec has no range check: m = 3 gives 2 c(2) for any t; m = 2 still reads c(1) and
  // gives 0 times it, -0 for a negative coefficient.
  t = 123.5;
  EXPECT_EQ(dersec(q, &three, &t), 2.0);
  EXPECT_EQ(bits(dersec(q, &two, &t)), bits(-0.0));
  // No upper limit for dersec and derter: t^24 gives 24*23 t^22 and 24*23*22 t^21.
  double p[25] = {};
  p[24] = 1;
  m = 25;
  t = 0.5;
  EXPECT_EQ(dersec(p, &m, &t), 552.0 * 0x1p-22);
  EXPECT_EQ(derter(p, &m, &t), 12144.0 * 0x1p-21);
}

TEST(Bernst, SmallCasesAndOutOfRange) {
  const auto b = [](std::int32_t i, std::int32_t n, double t) { return bernst(&i, &n, &t); };
  EXPECT_EQ(b(1, 2, 0.5), 0.5);
  EXPECT_EQ(b(0, 0, 0.37), 1.0);
  EXPECT_EQ(b(3, 3, 0.75), 0.421875);
  EXPECT_EQ(b(4, 3, 0.75), 0.0);
  EXPECT_EQ(b(-1, 3, 0.75), 0.0);
  EXPECT_EQ(b(0, 20, 0.75), 0.0);
}

TEST(Bernst, EveryTabulatedPolynomialMatchesTheProductForm) {
  // binom(n, i) t^i (1 - t)^(n - i) in long double, exact for t = 3/8. The expanded form
  // cancels, so the bound is 1e-14 times the sum of the magnitudes of its terms.
  const double t = 0.375;
  for (std::int32_t n = 1; n <= 19; ++n) {
    long double binom = 1;
    for (std::int32_t i = 0; i <= n; ++i) {
      if (i > 0) binom = binom * (n - i + 1) / i;
      const long double want = binom * std::pow(0.375L, i) * std::pow(0.625L, n - i);
      const long double bound = binom * std::pow(0.375L, i) * std::pow(1.375L, n - i) * 1e-14L;
      std::int32_t ii = i, nn = n;
      double tt = t;
      EXPECT_NEAR(bernst(&ii, &nn, &tt), static_cast<double>(want), static_cast<double>(bound))
          << i << " " << n;
    }
  }
}
