// tests/poly/evaluate_test.cpp -- checks for poly/evaluate.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <tuple>

#include "poly/poly_api.h"
#include "support/recording_services.h"

// cor and its derivatives, bit for bit: Horner order, range rules (c not read), and
// dersec's and derter's lack of an upper limit.
TEST(Cor, ValuesDerivativesAndRangeRules) {
  using Fn = double (*)(const double*, const std::int32_t*, const double*);
  const double c[4] = {5, 1, 1, 1}, q[3] = {7, -3, 1}, sq[3] = {1, 2, 3}, d[3] = {-1, 0, 1};
  double p[25] = {};  // t^24: 24*23 t^22 and 24*23*22 t^21
  p[24] = 1;
  const std::tuple<Fn, const double*, std::int32_t, double, double> cases[] = {
      {cor, sq, 3, 2, 17.0}, {cor, nullptr, 0, 2, 0.0},
      {cor, nullptr, INT32_MIN, 2, 0.0},  // m - 1 is not formed for it
      // t^2 - 1 at t = 1 + 2^-30 by Horner, (t * t) - 1: 2^-29 + 2^-60 rounds to 2^-29.
      {cor, d, 3, 1 + 0x1p-30, 0x1p-29},
      {deriv, c, 4, 1, 6.0}, {dersec, c, 4, 1, 8.0}, {derter, c, 4, 1, 6.0},  // 1 + 2t + 3t^2
      {deriv, c, 2, 1, 1.0}, {derter, c, 3, 1, 0.0},
      {deriv, nullptr, 21, 1, 0.0}, {dersec, nullptr, 0, 1, 0.0},  // outside 2..20, below 1
      // dersec: m = 3 gives 2 c(2) for any t; m = 2 still reads c(1) and gives 0 times it,
      // -0 for a negative coefficient.
      {dersec, q, 3, 123.5, 2.0}, {dersec, q, 2, 123.5, -0.0},
      {dersec, p, 25, 0.5, 552.0 * 0x1p-22}, {derter, p, 25, 0.5, 12144.0 * 0x1p-21}};
  int row = 0;
  for (auto [f, coef, m, t, want] : cases) {
    EXPECT_EQ(bits(f(coef, &m, &t)), bits(want)) << "row " << row++;
  }
}

TEST(Bernst, SmallCasesAndOutOfRange) {
  const std::tuple<std::int32_t, std::int32_t, double, double> cases[] = {
      {1, 2, 0.5, 0.5}, {0, 0, 0.37, 1.0},  {3, 3, 0.75, 0.421875},
      {4, 3, 0.75, 0.0}, {-1, 3, 0.75, 0.0}, {0, 20, 0.75, 0.0}};
  for (auto [i, n, t, want] : cases) EXPECT_EQ(bernst(&i, &n, &t), want) << i << " " << n;
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
