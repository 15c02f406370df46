// tests/poly/evaluate_test.cpp -- checks for poly/evaluate.cpp.
#include <gtest/gtest.h>

#include <cmath>

#include "poly/poly_api.h"
#include "support/recording_services.h"

TEST(Cor, HornerAndEmptyPolynomial) {
  const double c[3] = {1, 2, 3};
  std::int32_t m = 3;
  double t = 2;
  EXPECT_EQ(cor(c, &m, &t), 17.0);
  m = 0;
  EXPECT_EQ(cor(nullptr, &m, &t), 0.0);  // c not read
  // Horner order: ((0 t + 1) t + 0) t + (-1) at t = 1 + 2^-30 is 2^-29 + 2^-60 rounded once
  // per step; expanding t^2 - 1 the other way would lose the 2^-60.
  const double d[3] = {-1, 0, 1};
  m = 3;
  t = 1 + 0x1p-30;
  EXPECT_EQ(bits(cor(d, &m, &t)), bits(0x1p-29));
}

TEST(Derivatives, ValuesAndRangeRules) {
  const double c[4] = {5, 1, 1, 1};
  std::int32_t m = 4;
  double t = 1;
  EXPECT_EQ(deriv(c, &m, &t), 6.0);  // 1 + 2t + 3t^2
  EXPECT_EQ(dersec(c, &m, &t), 8.0);  // 2 + 6t
  EXPECT_EQ(derter(c, &m, &t), 6.0);
  m = 2;
  EXPECT_EQ(deriv(c, &m, &t), 1.0);
  EXPECT_EQ(derter(c, &m, &t), 0.0);
  m = 21;
  EXPECT_EQ(deriv(nullptr, &m, &t), 0.0);  // outside 2..20: c not read
  m = 1;
  EXPECT_EQ(deriv(nullptr, &m, &t), 0.0);
  // dersec has no range check: m = 3 gives 2 c(2) for any t, m = 2 still reads c(1) and
  // gives 0 times it (-0 for a negative coefficient).
  const double q[3] = {7, -3, 1};
  m = 3;
  t = 123.5;
  EXPECT_EQ(dersec(q, &m, &t), 2.0);
  m = 2;
  EXPECT_EQ(bits(dersec(q, &m, &t)), bits(-0.0));
  m = 0;
  EXPECT_EQ(dersec(nullptr, &m, &t), 0.0);
}

TEST(Derivatives, NoUpperLimitForDersecAndDerter) {
  // c = t^24 only: second derivative 24*23 t^22, third 24*23*22 t^21; at t = 1.
  double c[25] = {};
  c[24] = 1;
  std::int32_t m = 25;
  double t = 1;
  EXPECT_EQ(dersec(c, &m, &t), 552.0);
  EXPECT_EQ(derter(c, &m, &t), 12144.0);
  t = 0.5;
  EXPECT_EQ(derter(c, &m, &t), 12144.0 * 0x1p-21);
}

TEST(Bernst, SmallCasesExactly) {
  std::int32_t i = 1, n = 2;
  double t = 0.5;
  EXPECT_EQ(bernst(&i, &n, &t), 0.5);
  i = 0;
  n = 0;
  t = 0.37;
  EXPECT_EQ(bernst(&i, &n, &t), 1.0);
  i = 3;
  n = 3;
  t = 0.75;
  EXPECT_EQ(bernst(&i, &n, &t), 0.421875);
  // Outside 0 <= i <= n <= 19: 0, the table is not read.
  for (const auto& [bi, bn] : {std::pair{4, 3}, std::pair{-1, 3}, std::pair{0, 20},
                               std::pair{25, 30}}) {
    i = bi;
    n = bn;
    EXPECT_EQ(bernst(&i, &n, &t), 0.0) << bi << " " << bn;
  }
}

TEST(Bernst, EveryTabulatedPolynomialMatchesTheProductForm) {
  // binom(n, i) t^i (1 - t)^(n - i) in long double, exact for t = 3/8 and these n. The
  // expanded form cancels, so the bound is eps times the sum of the terms' magnitudes.
  const double t = 0.375;
  for (std::int32_t n = 1; n <= 19; ++n) {
    long double binom = 1;
    for (std::int32_t i = 0; i <= n; ++i) {
      if (i > 0) binom = binom * (n - i + 1) / i;
      const long double want =
          binom * std::pow(static_cast<long double>(t), i) * std::pow(0.625L, n - i);
      const double bound = static_cast<double>(binom * std::pow(0.375L, i) *
                                               std::pow(1.375L, n - i)) * 1e-14;
      std::int32_t ii = i, nn = n;
      double tt = t;
      EXPECT_NEAR(bernst(&ii, &nn, &tt), static_cast<double>(want), bound) << i << " " << n;
    }
  }
}
