// tests/vector/projection_test.cpp -- checks for vector/projection.cpp.
#include <gtest/gtest.h>

#include <array>
#include <cmath>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
using Triple = std::array<double, 3>;
// A plane array from its origin O and directions U, V (rows of a 3-by-3 array by columns).
std::array<double, 9> plane(Triple o, Triple u, Triple v) {
  return {o[0], u[0], v[0], o[1], u[1], v[1], o[2], u[2], v[2]};
}
}  // namespace

TEST(Projection, EquationAndNormalOfAPlane) {
  // {O, U, V, tolerance 12, (a, b, c, d) of eqcarp}; provec gives the same normal and the
  // constant N . O = -d. With e = 2^-20 and N = (0, 0, c), s = c^2 = e^2 is kept (strict),
  // one ulp of c less is degenerate, until a smaller tolerance is set. The last three: U =
  // (1, 0, 0), V = (0, 1, slope), N = (0, -slope, 1), s = 1 + slope^2; the factor from the
  // band of s - 1, each band's formula in correctly rounded arithmetic one operation at a
  // time (at these points the neighbouring bands end in other bits).
  const double e = 0x1p-20, e0 = std::nextafter(e, 0.0), tiny = 0x1p-30;
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
      {{0, 0, 0}, {1, 0, 0}, {0, 1, 0x1.6b3cc5239d16cp-13}, tiny,
       {0, -0x1.6b3cc4c833b30p-13, 0x1.ffffff7f26a6ep-1, 0}},
      // s - 1 = 2.9999999374e-8: second order (sqrt ...a72, first order ...a6e).
      {{0, 0, 0}, {1, 0, 0}, {0, 1, 0x1.6b3cc4c967140p-13}, tiny,
       {0, -0x1.6b3cc46dfdb07p-13, 0x1.ffffff7f26a71p-1, 0}},
      // s - 1 = 9.99993e-11 <= 1e-10: first order (sqrt ...920cc).
      {{0, 0, 0}, {1, 0, 0}, {0, 1, 0x1.4f8b1039137bbp-17}, tiny,
       {0, -0x1.4f8b1038cb6d2p-17, 0x1.ffffffff920cbp-1, 0}}};
  for (const auto& k : cases) {
    ToleranceGuard tol12(12, k.tol);
    const auto pl = plane(k.o, k.u, k.v);
    double q[4], n[4];
    eqcarp(pl.data(), &q[0], &q[1], &q[2], &q[3]);
    provec(pl.data(), n, &n[3]);
    expect_bits(q, {k.want[0], k.want[1], k.want[2], k.want[3]});
    expect_bits(n, {k.want[0], k.want[1], k.want[2], 0.0 - k.want[3]});
  }
}

TEST(Projection, PointsOntoLinesAndPlanes) {
  const double l[6] = {0, 1, 0, 1, 2, 3};  // direction y through (1, 2, 3)
  double p[3] = {4, -1, 7}, on[3] = {1, 5.5, 3}, q[5];
  xptln(p, l, p);
  expect_bits(p, {1, -1, 3});
  xptln(on, l, on);  // its own points stay
  expect_bits(on, {1, 5.5, 3});
  // Plane x = 3 spanned by (0, 2, 0), (0, 0, 2) from O = (3, 7, 7), P = (-1, 2, 3): t = 4,
  // P' = (3, 2, 3); P' - O = (0, -5, -4) gives u = -10, v = -8 (the directions are not unit).
  const auto pl = plane({3, 7, 7}, {0, 2, 0}, {0, 0, 2});
  const double pt[3] = {-1, 2, 3};
  std::int32_t status = -1;
  xptpln(pt, pl.data(), q, &status);
  EXPECT_EQ(status, 0);
  expect_bits(q, {3, 2, 3});
  xptpl1(pt, pl.data(), q, q + 3);
  expect_bits(q, {3, 2, 3, -10, -8});
  xptpln(pt, plane({3, 7, 7}, {0, 2, 0}, {0, 4, 0}).data(), q, &status);  // degenerate
  EXPECT_FALSE(std::isfinite(q[0]));
}
