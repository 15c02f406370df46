// tests/vector/projection_test.cpp -- checks for vector/projection.cpp.
#include <gtest/gtest.h>

#include <cmath>

#include "support/recording_services.h"
#include "support/tolerance_guard.h"
#include "vector/vector_api.h"

namespace {

// A plane array from its origin and two directions (rows of a 3-by-3 array by columns).
struct Plane {
  double a[9];
  Plane(const double o[3], const double u[3], const double v[3]) {
    for (int i = 0; i < 3; ++i) {
      a[3 * i] = o[i];
      a[3 * i + 1] = u[i];
      a[3 * i + 2] = v[i];
    }
  }
};

}  // namespace

TEST(Xptln, ProjectsOntoTheLineAndKeepsItsOwnPoints) {
  const double l[6] = {0, 1, 0, 1, 2, 3};  // direction y through (1, 2, 3)
  const double p[3] = {4, -1, 7};
  double q[3];
  EXPECT_EQ(xptln(p, l, q), 0);
  EXPECT_EQ(q[0], 1.0);
  EXPECT_EQ(q[1], -1.0);
  EXPECT_EQ(q[2], 3.0);
  double on[3] = {1, 5.5, 3};
  xptln(on, l, on);  // in place
  EXPECT_EQ(on[0], 1.0);
  EXPECT_EQ(on[1], 5.5);
  EXPECT_EQ(on[2], 3.0);
  // A slanted line: the foot of a point offset perpendicularly by 3 from Q + 5 D.
  const double s[6] = {0.6, 0.8, 0, 1, 2, 3};
  const double off[3] = {1 + 3 + 2.4, 2 + 4 - 1.8, 3};
  xptln(off, s, q);
  EXPECT_NEAR(q[0], 4.0, 1e-14);
  EXPECT_NEAR(q[1], 6.0, 1e-14);
  EXPECT_EQ(q[2], 3.0);
}

TEST(Provec, NormalAndConstantOfAPlane) {
  const double o[3] = {0, 0, 5}, u[3] = {1, 0, 0}, v[3] = {0, 1, 0};
  Plane pl(o, u, v);
  double n[3], p = -1;
  EXPECT_EQ(provec(pl.a, n, &p), 0);
  EXPECT_EQ(n[0], 0.0);
  EXPECT_EQ(n[1], 0.0);
  EXPECT_EQ(n[2], 1.0);
  EXPECT_EQ(p, 5.0);
  // U x V = (4, 0, 0) normalised by 1/sqrt(16); q = N . O = 3.
  const double o2[3] = {3, 7, 7}, u2[3] = {0, 2, 0}, v2[3] = {0, 0, 2};
  Plane p2(o2, u2, v2);
  double a, b, c, d;
  EXPECT_EQ(eqcarp(p2.a, &a, &b, &c, &d), 0);
  EXPECT_EQ(a, 1.0);
  EXPECT_EQ(b, 0.0);
  EXPECT_EQ(c, 0.0);
  EXPECT_EQ(d, -3.0);
}

TEST(Eqcarp, ThroughTheOriginGivesPlusZeroConstant) {
  const double o[3] = {0, 0, 0}, u[3] = {1, 0, 0}, v[3] = {0, 1, 0};
  Plane pl(o, u, v);
  double a, b, c, d;
  eqcarp(pl.a, &a, &b, &c, &d);
  EXPECT_EQ(bits(d), bits(0.0));  // 0 - (+0), where -(+0) would be -0
}

TEST(Eqcarp, DegenerateBelowTheSquareOfTolerance12AndReadsItEachCall) {
  // N = U x V = (0, 0, c), s = c^2. With e = 2^-20, s = 2^-40 = e^2 is kept (strict) and
  // one ulp of c less is degenerate.
  const double o[3] = {1, 2, 3}, u[3] = {1, 0, 0};
  const double at[3] = {0, 0x1p-20, 0}, below[3] = {0, std::nextafter(0x1p-20, 0.0), 0};
  Plane keep(o, u, at), drop(o, u, below);
  double a = 9, b = 9, c = 9, d = 9, n[3] = {9, 9, 9}, p = 9;
  {
    ToleranceGuard tol12(12, 0x1p-20);
    eqcarp(keep.a, &a, &b, &c, &d);
    EXPECT_EQ(c, 1.0);
    EXPECT_EQ(d, -3.0);
    eqcarp(drop.a, &a, &b, &c, &d);
    EXPECT_EQ(bits(a), bits(0.0));
    EXPECT_EQ(bits(b), bits(0.0));
    EXPECT_EQ(bits(c), bits(0.0));
    EXPECT_EQ(bits(d), bits(0.0));
    provec(drop.a, n, &p);
    EXPECT_EQ(n[2], 0.0);
    EXPECT_EQ(p, 0.0);
  }
  // A smaller tolerance, read on the next call, keeps the same plane.
  ToleranceGuard tol12(12, 0x1p-30);
  provec(drop.a, n, &p);
  EXPECT_EQ(n[2], 1.0);
  EXPECT_EQ(p, 3.0);
  // Parallel directions: always degenerate.
  const double par[3] = {-2, 0, 0};
  Plane flat(o, u, par);
  eqcarp(flat.a, &a, &b, &c, &d);
  EXPECT_EQ(a, 0.0);
  EXPECT_EQ(c, 0.0);
  EXPECT_EQ(d, 0.0);
}

struct BandCase {
  double slope;   // V = (0, 1, slope), U = (1, 0, 0): N = (0, -slope, 1), s = 1 + slope^2
  double f;       // the factor of the band that s - 1 falls in
  double n2;      // f * (-slope)
  const char* band;
};

class EqcarpBands : public ::testing::TestWithParam<BandCase> {};

TEST_P(EqcarpBands, FactorFromTheBandOfSMinusOne) {
  // Expected values: each band's formula evaluated in correctly rounded double arithmetic,
  // one operation at a time. Neighbouring bands give other last bits at these points.
  const BandCase k = GetParam();
  const double o[3] = {0, 0, 0}, u[3] = {1, 0, 0}, v[3] = {0, 1, k.slope};
  Plane pl(o, u, v);
  double a, b, c, d;
  eqcarp(pl.a, &a, &b, &c, &d);
  EXPECT_EQ(bits(c), bits(k.f)) << k.band;
  EXPECT_EQ(bits(b), bits(k.n2)) << k.band;
}

INSTANTIATE_TEST_SUITE_P(
    Table, EqcarpBands,
    ::testing::Values(
        // s - 1 = 3.0000000026e-8 > 3e-8: 1/sqrt(s) (the series would end in ...a6d).
        BandCase{0x1.6b3cc5239d16cp-13, 0x1.ffffff7f26a6ep-1, -0x1.6b3cc4c833b30p-13, "sqrt"},
        // s - 1 = 2.9999999374e-8, just inside: second-order series (sqrt: ...a72,
        // first order: ...a6e).
        BandCase{0x1.6b3cc4c967140p-13, 0x1.ffffff7f26a71p-1, -0x1.6b3cc46dfdb07p-13,
                 "second order"},
        // s - 1 = 9.99993e-11 <= 1e-10: first order (sqrt would give ...920cc).
        BandCase{0x1.4f8b1039137bbp-17, 0x1.ffffffff920cbp-1, -0x1.4f8b1038cb6d2p-17,
                 "first order"}));

TEST(Xptpln, ProjectsAndGivesPlaneCoordinates) {
  const double o[3] = {1, 1, 5}, u[3] = {1, 0, 0}, v[3] = {0, 1, 0};
  Plane pl(o, u, v);
  const double p[3] = {2.5, -3, 9};
  double q[3], uv[2];
  std::int32_t status = -1;
  EXPECT_EQ(xptpln(p, pl.a, q, &status), 0);
  EXPECT_EQ(status, 0);
  EXPECT_EQ(q[0], 2.5);
  EXPECT_EQ(q[1], -3.0);
  EXPECT_EQ(q[2], 5.0);
  EXPECT_EQ(xptpl1(p, pl.a, q, uv), 0);
  EXPECT_EQ(q[2], 5.0);
  EXPECT_EQ(uv[0], 1.5);
  EXPECT_EQ(uv[1], -4.0);
  // Plane x = 3 spanned by (0, 2, 0) and (0, 0, 2): t = 4, P' = (3, 2, 3); (P' - O) = (0,
  // -5, -4) gives u = -10, v = -8 (the directions are not unit).
  const double o2[3] = {3, 7, 7}, u2[3] = {0, 2, 0}, v2[3] = {0, 0, 2};
  Plane p2(o2, u2, v2);
  const double r[3] = {-1, 2, 3};
  xptpl1(r, p2.a, q, uv);
  EXPECT_EQ(q[0], 3.0);
  EXPECT_EQ(q[1], 2.0);
  EXPECT_EQ(q[2], 3.0);
  EXPECT_EQ(uv[0], -10.0);
  EXPECT_EQ(uv[1], -8.0);
}

TEST(Xptpln, DegeneratePlaneGivesNonFiniteWithoutFailing) {
  const double o[3] = {1, 1, 5}, u[3] = {1, 0, 0}, v[3] = {2, 0, 0};
  Plane pl(o, u, v);
  const double p[3] = {2.5, -3, 9};
  double q[3];
  std::int32_t status = -1;
  EXPECT_EQ(xptpln(p, pl.a, q, &status), 0);
  EXPECT_EQ(status, 0);
  EXPECT_FALSE(std::isfinite(q[0]));
}
