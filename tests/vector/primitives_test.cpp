// tests/vector/primitives_test.cpp -- checks for vector/products.cpp, vector/angles.cpp and
// vector/projection.cpp.
#include <gtest/gtest.h>

#include <array>
#include <cmath>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
const double kNaN = std::nan(""), kInf = HUGE_VAL;
const double kPi = 3.141592653589793, kPiOver3 = 0x1.0c152382d7366p+0;  // both rounded
using Triple = std::array<double, 3>;
// A plane array from its origin O and directions U, V (rows of a 3-by-3 array by columns).
std::array<double, 9> plane(Triple o, Triple u, Triple v) {
  return {o[0], u[0], v[0], o[1], u[1], v[1], o[2], u[2], v[2]};
}
}  // namespace

TEST(Products, ByHandWithSignedZerosAndSummationOrder) {
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
  // vor: 1 then seven times (2^-27)^2 = 2^-54, each addition to 1 below half an ulp: only
  // the order by increasing index gives exactly 1.
  const double t = 0x1p-27, sq[8] = {1, t, t, t, t, t, t, t}, ints[5] = {1, 2, 3, 4, 5};
  const std::int32_t n[4] = {8, 0, -4, 5};
  const double norm2[4] = {1, 0, 0, 55};
  for (int k = 0; k < 4; ++k) EXPECT_EQ(bits(vor(k < 3 ? sq : ints, &n[k])), bits(norm2[k])) << k;
  // devor returns the squared norm from before; a zero vector or n < 1 stays untouched.
  double d[3] = {3, 4, 7}, z[3] = {0.0, -0.0, 0.0};
  const std::int32_t zero = 0, two = 2, three = 3;
  EXPECT_TRUE(devor(d, &zero) == 0 && devor(d, &two) == 25);
  expect_bits(d, {0.6, 0.8, 7});
  EXPECT_EQ(devor(z, &three), 0.0);
  expect_bits(z, {0.0, -0.0, 0.0});
}

TEST(Angles, ArcCosinesAndEigenDirections) {
  // parcos with tol 1e-3 on each side of each bound: {c, result, flag}.
  const double c[14] = {-1.0 - 2e-3, std::nextafter(-1.0 - 1e-3, -2.0), -1.0 - 1e-3,
                        std::nextafter(-1.0, -2.0), -1, 0.5, 1, std::nextafter(1.0, 2.0),
                        1.0 + 1e-3 / 2, 1.0 + 1e-3, std::nextafter(1.0 + 1e-3, 2.0), kNaN,
                        kInf, -kInf};
  const double tol = 1e-3, want[14] = {kPi, kPi, kPi, kPi, kPi, kPiOver3, 0, 0, 0, 0, 0, 0, 0, kPi};
  const std::int32_t flags[14] = {2, 2, 1, 1, 0, 0, 0, 1, 1, 1, 2, 2, 2, 2};
  for (int k = 0; k < 14; ++k) {
    std::int32_t flag = -1;
    EXPECT_EQ(bits(parcos(&c[k], &tol, &flag)), bits(want[k])) << k;
    EXPECT_EQ(flag, flags[k]) << k;
  }
  const double over = 1.0000001, half = 0.5, minus = -1.0;  // no clamping
  EXPECT_TRUE(std::isnan(darcos(&over)) && std::isnan(darsin(&over)));
  EXPECT_TRUE(darcos(&minus) == kPi && darsin(&half) == 0x1.0c152382d7366p-1);  // pi / 6
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

TEST(Projection, PlaneEquationsNormalsAndProjections) {
  // {O, U, V, tolerance 12, (a, b, c, d) of eqcarp}; provec gives the same normal and the
  // constant N . O = -d. With e = 2^-20 and N = (0, 0, c), s = c^2 = e^2 is kept (strict),
  // one ulp of c less is degenerate, until a smaller tolerance is set. The last three: U =
  // (1, 0, 0), V = (0, 1, slope), N = (0, -slope, 1), s = 1 + slope^2; the factor from the
  // band of s - 1, each band's formula in correctly rounded arithmetic one operation at a
  // time (at these points the neighbouring bands end in other bits).
  const double e = 0x1p-20, e0 = std::nextafter(e, 0.0), tiny = 0x1p-30;
  const double k1 = 0x1.6b3cc5239d16cp-13, k2 = 0x1.6b3cc4c967140p-13, k3 = 0x1.4f8b1039137bbp-17;
  const Triple o0 = {0, 0, 0}, ex = {1, 0, 0};
  const struct {
    Triple o, u, v;
    double tol, want[4];
  } cases[] = {
      {{0, 0, 5}, {1, 0, 0}, {0, 1, 0}, tiny, {0, 0, 1, -5}},
      {{3, 7, 7}, {0, 2, 0}, {0, 0, 2}, tiny, {1, 0, 0, -3}},  // 1/sqrt(16) (4, 0, 0)
      {{0, 0, 0}, {1, 0, 0}, {0, 1, 0}, tiny, {0, 0, 1, 0}},   // 0 - (+0), not -(+0) = -0
      {{1, 2, 3}, {1, 0, 0}, {-2, 0, 0}, tiny, {0, 0, 0, 0}},  // parallel directions
      {{1, 2, 3}, {1, 0, 0}, {0, e, 0}, e, {0, 0, 1, -3}},
      {{1, 2, 3}, {1, 0, 0}, {0, e0, 0}, e, {0, 0, 0, 0}},
      {{1, 2, 3}, {1, 0, 0}, {0, e0, 0}, tiny, {0, 0, 1, -3}},
      // s - 1 = 3.0000000026e-8 > 3e-8: 1/sqrt(s) (the series would give ...a6d).
      {o0, ex, {0, 1, k1}, tiny, {0, -0x1.6b3cc4c833b30p-13, 0x1.ffffff7f26a6ep-1, 0}},
      // s - 1 = 2.9999999374e-8: second order (sqrt ...a72, first order ...a6e).
      {o0, ex, {0, 1, k2}, tiny, {0, -0x1.6b3cc46dfdb07p-13, 0x1.ffffff7f26a71p-1, 0}},
      // s - 1 = 9.99993e-11 <= 1e-10: first order (sqrt ...920cc).
      {o0, ex, {0, 1, k3}, tiny, {0, -0x1.4f8b1038cb6d2p-17, 0x1.ffffffff920cbp-1, 0}}};
  for (const auto& k : cases) {
    ToleranceGuard tol12(12, k.tol);
    const auto pl = plane(k.o, k.u, k.v);
    double q[4], n[4];
    eqcarp(pl.data(), &q[0], &q[1], &q[2], &q[3]);
    provec(pl.data(), n, &n[3]);
    expect_bits(q, {k.want[0], k.want[1], k.want[2], k.want[3]});
    expect_bits(n, {k.want[0], k.want[1], k.want[2], 0.0 - k.want[3]});
  }
  // xptln onto the line of direction y through (1, 2, 3).
  const double l[6] = {0, 1, 0, 1, 2, 3}, pt[3] = {-1, 2, 3};
  double p[3] = {4, -1, 7}, on[3] = {1, 5.5, 3}, q[5];
  xptln(p, l, p);
  expect_bits(p, {1, -1, 3});
  xptln(on, l, on);  // its own points stay
  expect_bits(on, {1, 5.5, 3});
  // Plane x = 3 spanned by (0, 2, 0), (0, 0, 2) from O = (3, 7, 7), P = (-1, 2, 3): t = 4,
  // P' = (3, 2, 3); P' - O = (0, -5, -4) gives u = -10, v = -8 (the directions are not unit).
  const auto pl = plane({3, 7, 7}, {0, 2, 0}, {0, 0, 2});
  std::int32_t status = -1;
  xptpln(pt, pl.data(), q, &status);
  EXPECT_EQ(status, 0);
  expect_bits(q, {3, 2, 3});
  xptpl1(pt, pl.data(), q, q + 3);
  expect_bits(q, {3, 2, 3, -10, -8});
  xptpln(pt, plane({3, 7, 7}, {0, 2, 0}, {0, 4, 0}).data(), q, &status);  // degenerate
  EXPECT_FALSE(std::isfinite(q[0]));
}
