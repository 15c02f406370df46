// tests/vector/primitives_test.cpp -- checks for vector/products.cpp and vector/angles.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
const double kNaN = std::numeric_limits<double>::quiet_NaN();
const double kInf = std::numeric_limits<double>::infinity();
const double kPi = 3.141592653589793, kPiOver3 = 0x1.0c152382d7366p+0;  // both rounded
}  // namespace

TEST(Products, ByHandWithSignedZerosAndRoundingOrder) {
  const double a[3] = {1, 2, 3}, b[3] = {-2, 0.5, 4}, m0[3] = {-0.0, -0.0, -0.0};
  EXPECT_EQ(prosca(a, b), 11.0);
  EXPECT_EQ(bits(prosca(m0, a)), bits(0.0));  // the leading +0 makes -0 + -0 + -0 into +0
  // Cofactors of the first row, exactly: 1 (50 - 53.625) - 2 (40 - 45.5) + 3 (33 - 35).
  const double pb[3] = {4, 5, 6.5}, pc[3] = {7, 8.25, 10};
  EXPECT_EQ(promix(a, pb, pc), 1.375);
  // x = 1 + 2^-30: x x rounds to 1 + 2^-29 = y before y is subtracted (a fused multiply-add
  // would keep 2^-60). (2, 0, 0) x (0, 0, -3) = (-0, 6, 0); parallel inputs keep the zero
  // vector; the plane cases write zeros, parvis its third component.
  const double x = 0x1.00000004p+0, px[3] = {x, 0x1.00000008p+0, 0}, qx[3] = {1, x, 0};
  const double e1[3] = {2, 0, 0}, e3[3] = {0, 0, -3}, par[3] = {-2, -4, -6};
  const decltype(&parvis) f[6] = {parvis, parvis, parvis, parbis, parbis, parbis};
  const double *u[6] = {a, a, px, e1, a, e1}, *v[6] = {b, b, qx, e3, par, e3};
  const std::int32_t dim[6] = {3, 2, 2, 3, 3, 2};
  const double want[6][3] = {{6.5, -10, 4.5}, {0, 0, 4.5}, {0, 0, 0},
                             {-0.0, 1, 0},    {0, 0, 0},   {0, 0, 0}};
  for (int k = 0; k < 6; ++k) {
    double w[3] = {9, 9, 9};
    EXPECT_EQ(f[k](u[k], v[k], w, &dim[k]), 0);
    expect_bits(w, {want[k][0], want[k][1], want[k][2]});
  }
}

TEST(Products, SquaredNormsByIncreasingIndex) {
  // 1 then seven times (2^-27)^2 = 2^-54: each addition to 1 is below half an ulp, so only
  // the order by increasing index gives exactly 1.
  const double t = 0x1p-27, v[8] = {1, t, t, t, t, t, t, t}, w[5] = {1, 2, 3, 4, 5};
  const std::int32_t n[4] = {8, 0, -4, 5};
  const double want[4] = {1, 0, 0, 55};
  for (int k = 0; k < 4; ++k) EXPECT_EQ(bits(vor(k < 3 ? v : w, &n[k])), bits(want[k])) << k;
  // devor returns the squared norm from before; a zero vector or n < 1 stays untouched.
  double u[3] = {3, 4, 7}, z[3] = {0.0, -0.0, 0.0};
  const std::int32_t zero = 0, two = 2, three = 3;
  EXPECT_EQ(devor(u, &zero), 0.0);
  EXPECT_EQ(devor(u, &two), 25.0);
  expect_bits(u, {0.6, 0.8, 7});
  EXPECT_EQ(devor(z, &three), 0.0);
  expect_bits(z, {0.0, -0.0, 0.0});
}

TEST(Angles, ArcCosinesAndEigenDirections) {
  // parcos with tol 1e-3 on each side of each bound: {c, result, flag}.
  const double c[14] = {-1.0 - 2e-3, std::nextafter(-1.0 - 1e-3, -2.0), -1.0 - 1e-3,
                        std::nextafter(-1.0, -2.0), -1, 0.5, 1, std::nextafter(1.0, 2.0),
                        1.0 + 1e-3 / 2, 1.0 + 1e-3, std::nextafter(1.0 + 1e-3, 2.0), kNaN,
                        kInf, -kInf};
  const double want[14] = {kPi, kPi, kPi, kPi, kPi, kPiOver3, 0, 0, 0, 0, 0, 0, 0, kPi};
  const std::int32_t flags[14] = {2, 2, 1, 1, 0, 0, 0, 1, 1, 1, 2, 2, 2, 2};
  const double tol = 1e-3;
  for (int k = 0; k < 14; ++k) {
    std::int32_t flag = -1;
    EXPECT_EQ(bits(parcos(&c[k], &tol, &flag)), bits(want[k])) << k;
    EXPECT_EQ(flag, flags[k]) << k;
  }
  const double over = 1.0000001, half = 0.5, minus = -1.0;  // no clamping
  EXPECT_TRUE(std::isnan(darcos(&over)) && std::isnan(darsin(&over)));
  EXPECT_EQ(darcos(&minus), kPi);
  EXPECT_EQ(darsin(&half), 0x1.0c152382d7366p-1);  // pi / 6, rounded
  // vectp2 {M11, M21, M12, M22, lambda, |v|^2, v}. Identity, lambda 1: both candidates
  // zero, left as they are. p = (M12, l - M11) = (3, 4) and q = (l - M22, M21) = (4, 3)
  // tie: the first row's wins. q = (0, -2) is longer than p = (0, 1).
  const double m[3][8] = {
      {1, 0, 0, 1, 1, 0, 0, 0}, {0, 3, 3, 0, 4, 25, 0.6, 0.8}, {2, -2, 0, 3, 3, 4, 0, -1}};
  for (const auto& k : m) {
    double v[2] = {7, 7};
    EXPECT_EQ(vectp2(k, &k[4], v), k[5]);
    expect_bits(v, {k[6], k[7]});
  }
}
