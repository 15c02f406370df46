// tests/vector/projection_test.cpp -- checks for vector/projection.cpp.
#include <gtest/gtest.h>

#include <cmath>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
// A plane array (rows O, U, V of a 3-by-3 array by columns).
struct Plane {
  double a[9];
  Plane(std::initializer_list<double> o, std::initializer_list<double> u,
        std::initializer_list<double> v) {
    for (int i = 0; i < 3; ++i) {
      a[3 * i] = o.begin()[i];
      a[3 * i + 1] = u.begin()[i];
      a[3 * i + 2] = v.begin()[i];
    }
  }
};
}  // namespace

TEST(Xptln, ProjectsOntoTheLineAndKeepsItsOwnPoints) {
  const double l[6] = {0, 1, 0, 1, 2, 3};  // direction y through (1, 2, 3)
  double p[3] = {4, -1, 7}, on[3] = {1, 5.5, 3};
  xptln(p, l, p);
  expect_bits(p, {1, -1, 3});
  xptln(on, l, on);
  expect_bits(on, {1, 5.5, 3});
}

TEST(Provec, NormalConstantAndThePlusZeroOfEqcarp) {
  double n[3], p, e[4];
  provec(Plane({0, 0, 5}, {1, 0, 0}, {0, 1, 0}).a, n, &p);
  expect_bits(n, {0, 0, 1});
  EXPECT_EQ(p, 5.0);
  // U x V = (4, 0, 0), normalised by 1/sqrt(16); d = -(N . O) = -3.
  eqcarp(Plane({3, 7, 7}, {0, 2, 0}, {0, 0, 2}).a, &e[0], &e[1], &e[2], &e[3]);
  expect_bits(e, {1, 0, 0, -3});
  // Through the origin, d = 0 - (+0) = +0 where -(+0) would be -0.
  eqcarp(Plane({0, 0, 0}, {1, 0, 0}, {0, 1, 0}).a, &e[0], &e[1], &e[2], &e[3]);
  EXPECT_EQ(bits(e[3]), bits(0.0));
}

TEST(Eqcarp, DegenerateBelowTheSquareOfTolerance12ReadAtEachCall) {
  // N = (0, 0, c), s = c^2. With e = 2^-20, s = e^2 is kept (strict); one ulp of c less is
  // degenerate; a smaller tolerance set afterwards keeps it again.
  const Plane keep({1, 2, 3}, {1, 0, 0}, {0, 0x1p-20, 0});
  const Plane drop({1, 2, 3}, {1, 0, 0}, {0, std::nextafter(0x1p-20, 0.0), 0});
  double e[4], n[4];  // provec's normal, then its constant
  {
    ToleranceGuard tol12(12, 0x1p-20);
    eqcarp(keep.a, &e[0], &e[1], &e[2], &e[3]);
    expect_bits(e, {0, 0, 1, -3});
    eqcarp(drop.a, &e[0], &e[1], &e[2], &e[3]);
    expect_bits(e, {0, 0, 0, 0});
    provec(drop.a, n, &n[3]);
    expect_bits(n, {0, 0, 0, 0});
  }
  ToleranceGuard tol12(12, 0x1p-30);
  provec(drop.a, n, &n[3]);
  expect_bits(n, {0, 0, 1, 3});
  eqcarp(Plane({1, 2, 3}, {1, 0, 0}, {-2, 0, 0}).a, &e[0], &e[1], &e[2], &e[3]);  // parallel
  expect_bits(e, {0, 0, 0, 0});
}

struct BandCase {
  double slope;  // U = (1, 0, 0), V = (0, 1, slope): N = (0, -slope, 1), s = 1 + slope^2
  double f;      // the factor of the band that s - 1 falls in
  double n2;     // f * (-slope)
};

class EqcarpBands : public ::testing::TestWithParam<BandCase> {};

TEST_P(EqcarpBands, FactorFromTheBandOfSMinusOne) {
  // Expected: each band's formula in correctly rounded double arithmetic, one operation at
  // a time; at these points the neighbouring bands end in other bits.
  const BandCase k = GetParam();
  double e[4];
  eqcarp(Plane({0, 0, 0}, {1, 0, 0}, {0, 1, k.slope}).a, &e[0], &e[1], &e[2], &e[3]);
  expect_bits(e, {0, k.n2, k.f});
}

INSTANTIATE_TEST_SUITE_P(
    Table, EqcarpBands,
    ::testing::Values(
        // s - 1 = 3.0000000026e-8 > 3e-8: 1/sqrt(s) (the series would give ...a6d).
        BandCase{0x1.6b3cc5239d16cp-13, 0x1.ffffff7f26a6ep-1, -0x1.6b3cc4c833b30p-13},
        // s - 1 = 2.9999999374e-8: second order (sqrt ...a72, first order ...a6e).
        BandCase{0x1.6b3cc4c967140p-13, 0x1.ffffff7f26a71p-1, -0x1.6b3cc46dfdb07p-13},
        // s - 1 = 9.99993e-11 <= 1e-10: first order (sqrt ...920cc).
        BandCase{0x1.4f8b1039137bbp-17, 0x1.ffffffff920cbp-1, -0x1.4f8b1038cb6d2p-17}));

TEST(Xptpln, ProjectsAndGivesPlaneCoordinates) {
  const double p[3] = {-1, 2, 3};
  double q[3], uv[2];
  std::int32_t status = -1;
  // Plane x = 3 spanned by (0, 2, 0), (0, 0, 2) from O = (3, 7, 7): t = 4, P' = (3, 2, 3);
  // P' - O = (0, -5, -4) gives u = -10, v = -8 (the directions are not unit).
  const Plane pl({3, 7, 7}, {0, 2, 0}, {0, 0, 2});
  xptpln(p, pl.a, q, &status);
  EXPECT_EQ(status, 0);
  expect_bits(q, {3, 2, 3});
  xptpl1(p, pl.a, q, uv);
  expect_bits(uv, {-10, -8});
  xptpln(p, Plane({3, 7, 7}, {0, 2, 0}, {0, 4, 0}).a, q, &status);  // degenerate: no check
  EXPECT_FALSE(std::isfinite(q[0]));
}
