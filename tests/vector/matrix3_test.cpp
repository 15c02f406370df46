// tests/vector/matrix3_test.cpp -- checks for vector/matrix3.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {

// M with rows (-2, -1, -1), (-2, -2, 1), (-2, 1, -3), det 4, and T = (3, -5, 7). Its inverse
// by hand: rows (5/4, -1, -3/4), (-2, 1, 1), (-3/2, 1, 1/2), translation (-7/2, 4, 6).
const double kAffine[12] = {-2, -2, -2, -1, -2, 1, -1, 1, -3, 3, -5, 7};
const double kAffineInv[12] = {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, -3.5, 4, 6};
// A rigid map: e1 -> e2, e2 -> -e3, e3 -> -e1, then T = (2.5, -1.25, 4).
const double kRigid[12] = {0, 1, 0, 0, 0, -1, -1, 0, 0, 2.5, -1.25, 4};

}  // namespace

TEST(Fmat6, PointsAndTransposedMapsByHand) {
  double x = 1.5, y = -2, z = 0.25, r[3];
  fmat6(&x, &y, &z, kAffine, &r[0], &r[1], &r[2]);  // M p = (-1.25, 1.25, -5.75), plus T
  expect_bits(r, {1.75, -3.75, 1.25});
  fmat8(&x, &y, &z, kAffine, &r[0], &r[1], &r[2]);  // columns . (p - T) = (-1.5, 3, -6.75)
  expect_bits(r, {10.5, -11.25, 24.75});
  fmat81(&x, &y, &z, kAffine, &r[0], &r[1], &r[2]);
  expect_bits(r, {0.5, 2.75, -4.25});
  // Row (1, 1, 1), p = (1, e, e), t1 = e, e = 2^-53: left to right, each e is a tie rounded
  // back to 1; any other grouping keeps at least 2^-52. Outputs on the inputs.
  const double e = 0x1p-53;
  const double a[12] = {1, 0, 0, 1, 0, 0, 1, 0, 0, e, 0, 0};
  x = 1, y = e, z = e;
  fmat6(&x, &y, &z, a, &x, &y, &z);
  EXPECT_EQ(bits(x), bits(1.0));
}

TEST(Fmat3, RigidInverseComposesAndAgreesWithFmat8) {
  double inv[12], r[12];
  fmat3(kRigid, inv);
  expect_bits(inv, {0, 0, -1, 1, 0, 0, 0, -1, 0, 1.25, 4, 2.5});  // M^T, -(M^T T)
  for (const double* first : {kRigid, static_cast<const double*>(inv)}) {
    fmat4(first, first == kRigid ? inv : kRigid, r);
    expect_bits(r, {1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0});  // x + (-x) = +0
  }
  // A signed permutation: fmat8 and fmat6 of the inverse both round +-(p_k - t_k) once.
  double x = 0.3, y = -7.1, z = 2.9, u[3], v[3];
  fmat8(&x, &y, &z, kRigid, &u[0], &u[1], &u[2]);
  fmat6(&x, &y, &z, inv, &v[0], &v[1], &v[2]);
  expect_bits(u, {v[0], v[1], v[2]});
}

TEST(Fmat4, ComposesSecondAfterFirstInSpaceAndPlane) {
  double r[12], x = 0.5, y = -1.25, z = 3, a[3], want[3];
  fmat4(kAffine, kRigid, r);
  fmat6(&x, &y, &z, kAffine, &a[0], &a[1], &a[2]);
  fmat6(&a[0], &a[1], &a[2], kRigid, &want[0], &want[1], &want[2]);  // exact in dyadics
  fmat6(&x, &y, &z, r, &a[0], &a[1], &a[2]);
  expect_bits(a, {want[0], want[1], want[2]});
  // A p = (2x - y + 0.5, x + 3y - 2), B (u, v) = (4 - v, u + 1):
  // B after A = (-x - 3y + 6, 2x - y + 1.5).
  const double pa[6] = {2, 1, -1, 3, 0.5, -2}, pb[6] = {0, 1, -1, 0, 4, 1};
  r[6] = 99;
  fmat2(pa, pb, r);
  expect_bits(r, {-1, 2, -3, -1, 6, 1.5, 99});
}

TEST(Inmat3, InvertsExactlyAndMultipliesByOneReciprocal) {
  double b[13];
  b[12] = 99;
  std::int32_t flag = -1;
  inmat3(kAffine, b, &flag);
  EXPECT_EQ(flag, 0);
  expect_bits(b, {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, -3.5, 4, 6, 99});
  // diag(3, 5, 7): r = 1/105 rounded once; 35 r and 15 r end one bit above 35/105 and
  // 15/105 (...555p-2 and ...492p-3).
  const double d[12] = {3, 0, 0, 0, 5, 0, 0, 0, 7, 0, 0, 0};
  inmat3(d, b, &flag);
  EXPECT_EQ(bits(b[0]), bits(0x1.5555555555556p-2));
  EXPECT_EQ(bits(b[8]), bits(0x1.2492492492493p-3));
}

TEST(Inmat2, InvertsThroughOneReciprocalAndCopiesSixReals) {
  // det 3: b5 = (a3 a6 - a4 a5) r = -17 r = -0x1.6aaaaaaaaaaaap+2, where -17/3 = ...aabp+2.
  const double a[6] = {2, 1, 1, 2, 5, -7};
  double b[7];
  b[6] = 99;
  std::int32_t flag = -1;
  inmat2(a, b, &flag);
  EXPECT_EQ(flag, 0);
  expect_bits(b, {0x1.5555555555555p-1, -0x1.5555555555555p-2, -0x1.5555555555555p-2,
                  0x1.5555555555555p-1, -0x1.6aaaaaaaaaaaap+2, 0x1.9555555555555p+2, 99});
}

struct SingularCase {
  bool plane;         // inmat2 on (d, 0, 0, 1), else inmat3 on diag(d, 1, 1)
  double d;           // the determinant
  std::int32_t flag;  // expected
};

class SingularThreshold : public ::testing::TestWithParam<SingularCase> {};

TEST_P(SingularThreshold, StrictOnBothSidesNaNPassesAndBIsUntouchedOnFlag1) {
  const SingularCase k = GetParam();
  const double a3[12] = {k.d, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0}, a2[6] = {k.d, 0, 0, 1, 0, 0};
  double b[12] = {-7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5, -7.5};
  std::int32_t flag = -1;
  k.plane ? inmat2(a2, b, &flag) : inmat3(a3, b, &flag);
  EXPECT_EQ(flag, k.flag);
  // Flag 1: untouched. Flag 0: the first element is 1 times the rounded 1/d (NaN for NaN).
  EXPECT_EQ(bits(b[0]), bits(k.flag == 1 ? -7.5 : 1.0 / k.d));
}

INSTANTIATE_TEST_SUITE_P(
    Table, SingularThreshold,
    ::testing::Values(SingularCase{false, 1e-9, 0}, SingularCase{false, -1e-9, 0},
                      SingularCase{false, 0x1.12e0be826d694p-30, 1},  // one ulp below 1e-9
                      SingularCase{false, 1e-10, 1}, SingularCase{false, 1e-8, 0},
                      SingularCase{false, std::numeric_limits<double>::quiet_NaN(), 0},
                      SingularCase{true, 1e-6, 0}, SingularCase{true, -1e-6, 0},
                      SingularCase{true, 0x1.0c6f7a0b5ed8cp-20, 1},  // one ulp below 1e-6
                      SingularCase{true, 8.1e-7, 1},                 // 9e-4 squared
                      SingularCase{true, std::numeric_limits<double>::quiet_NaN(), 0}));

TEST(Fmat1, SingularCallCopiesTheLastRegularInverse) {
  // The main test thread: no earlier test calls fmat1 on it.
  double m[9], b[10];
  for (int k = 0; k < 9; ++k) m[k] = kAffine[k];
  b[9] = 99;
  std::int32_t flag = -1;
  fmat1(m, b, &flag);
  EXPECT_EQ(flag, 0);
  expect_bits(b, {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, 99});  // nine reals only
  const double zero[9] = {};
  for (double& v : b) v = -1;
  fmat1(zero, b, &flag);
  EXPECT_EQ(flag, 1);
  expect_bits(b, {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5});
}

TEST(Fmat23, ProductSummationOrderAndEmptyOrders) {
  // [[1, 2, 3], [4, 5, 6]] [[7, 8], [9, 10], [11, 12]] = [[58, 64], [139, 154]].
  const double a[6] = {1, 4, 2, 5, 3, 6}, b[6] = {7, 9, 11, 8, 10, 12};
  double r[5] = {0, 0, 0, 0, 99};
  std::int32_t n = 2, m = 3, p = 2, one = 1, zero = 0;
  fmat23(&n, &m, &p, a, b, r);
  expect_bits(r, {58, 139, 64, 154, 99});
  // Five rows (1, 1, 1) times (1, e, e), e = 2^-53: by increasing k both e are ties rounded
  // back to 1, in every row; (e, e, 1) keeps them.
  const double e = 0x1p-53, c1[3] = {1, e, e}, c2[3] = {e, e, 1};
  std::vector<double> ones(15, 1.0), col(5);
  std::int32_t five = 5;
  fmat23(&five, &m, &one, ones.data(), c1, col.data());
  expect_bits(col.data(), {1, 1, 1, 1, 1});
  fmat23(&five, &m, &one, ones.data(), c2, col.data());
  expect_bits(col.data(), {1 + 0x1p-52, 1 + 0x1p-52, 1 + 0x1p-52, 1 + 0x1p-52, 1 + 0x1p-52});
  for (std::int32_t* bad : {&n, &m, &p}) {
    std::int32_t keep = *bad;
    *bad = zero;
    fmat23(&n, &m, &p, a, b, r + 2);
    *bad = keep;
  }
  expect_bits(r + 2, {64, 154, 99});
}
