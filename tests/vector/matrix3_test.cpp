// tests/vector/matrix3_test.cpp -- checks for vector/matrix3.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "support/recording_services.h"
#include "vector/vector_api.h"

namespace {

const double kNaN = std::numeric_limits<double>::quiet_NaN();

// M with rows (-2, -1, -1), (-2, -2, 1), (-2, 1, -3) by columns, det 4, and T = (3, -5, 7).
// Its inverse (by hand, exact): rows (5/4, -1, -3/4), (-2, 1, 1), (-3/2, 1, 1/2); the
// inverse's translation -(M^-1 T) = (-7/2, 4, 6).
const double kAffine[12] = {-2, -2, -2, -1, -2, 1, -1, 1, -3, 3, -5, 7};
const double kAffineInv[12] = {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, -3.5, 4, 6};

// A rigid map: e1 -> e2, e2 -> -e3, e3 -> -e1, then T = (2.5, -1.25, 4).
const double kRigid[12] = {0, 1, 0, 0, 0, -1, -1, 0, 0, 2.5, -1.25, 4};

void expect_bits12(const double* got, const double* want) {
  for (int k = 0; k < 12; ++k) EXPECT_EQ(bits(got[k]), bits(want[k])) << "element " << k + 1;
}

}  // namespace

TEST(Fmat6, AppliesPointsVectorsAndTransposesByHand) {
  const double x = 1.5, y = -2, z = 0.25;
  double u, v, w;
  fmat6(&x, &y, &z, kAffine, &u, &v, &w);  // M p = (-1.25, 1.25, -5.75), plus T
  EXPECT_EQ(u, 1.75);
  EXPECT_EQ(v, -3.75);
  EXPECT_EQ(w, 1.25);
  fmat61(&x, &y, &z, kAffine, &u, &v, &w);
  EXPECT_EQ(u, -1.25);
  EXPECT_EQ(v, 1.25);
  EXPECT_EQ(w, -5.75);
  fmat81(&x, &y, &z, kAffine, &u, &v, &w);  // columns of M dotted with p
  EXPECT_EQ(u, 0.5);
  EXPECT_EQ(v, 2.75);
  EXPECT_EQ(w, -4.25);
  fmat8(&x, &y, &z, kAffine, &u, &v, &w);  // columns of M dotted with p - T = (-1.5, 3, -6.75)
  EXPECT_EQ(u, 10.5);
  EXPECT_EQ(v, -11.25);
  EXPECT_EQ(w, 24.75);
}

TEST(Fmat6, SumsLeftToRightWithTheTranslationLastAndMayWorkInPlace) {
  // Row 1 of M is (1, 1, 1), p = (1, e, e), t1 = e with e = 2^-53: each addition of e to 1
  // is a tie that rounds back to 1, so left to right gives exactly 1; adding the small terms
  // first would give 1 + 2^-52 or more.
  const double e = 0x1p-53;
  const double a[12] = {1, 0, 0, 1, 0, 0, 1, 0, 0, e, 0, 0};
  double x = 1, y = e, z = e;
  fmat6(&x, &y, &z, a, &x, &y, &z);  // outputs on the inputs
  EXPECT_EQ(bits(x), bits(1.0));
  EXPECT_EQ(y, 0.0);
  EXPECT_EQ(z, 0.0);
}

TEST(Fmat3, RigidInverseComposesToTheIdentityBothWays) {
  double inv[12], r[12];
  EXPECT_EQ(fmat3(kRigid, inv), 0);
  // M^T, and -(M^T T) = -(-1.25, -4, -2.5).
  const double want[12] = {0, 0, -1, 1, 0, 0, 0, -1, 0, 1.25, 4, 2.5};
  expect_bits12(inv, want);
  const double identity[12] = {1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0};
  fmat4(kRigid, inv, r);
  expect_bits12(r, identity);  // the translation is x + (-x) = +0
  fmat4(inv, kRigid, r);
  expect_bits12(r, identity);
}

TEST(Fmat8, AgreesWithFmat6OfTheRigidInverse) {
  double inv[12];
  fmat3(kRigid, inv);
  const double x = 0.3, y = -7.1, z = 2.9;
  double a, b, c, u, v, w;
  fmat8(&x, &y, &z, kRigid, &a, &b, &c);
  fmat6(&x, &y, &z, inv, &u, &v, &w);
  // A signed permutation: both reduce to +-(p_k - t_k), rounded once.
  EXPECT_EQ(bits(a), bits(u));
  EXPECT_EQ(bits(b), bits(v));
  EXPECT_EQ(bits(c), bits(w));
  // A rotation by the 3-4-5 angle about z: equal up to rounding.
  const double rot[12] = {0.6, 0.8, 0, -0.8, 0.6, 0, 0, 0, 1, 1.5, -2.25, 0.5};
  fmat3(rot, inv);
  fmat8(&x, &y, &z, rot, &a, &b, &c);
  fmat6(&x, &y, &z, inv, &u, &v, &w);
  EXPECT_NEAR(a, u, 1e-14);
  EXPECT_NEAR(b, v, 1e-14);
  EXPECT_NEAR(c, w, 1e-14);
}

TEST(Fmat4, ComposesSecondArgumentAfterFirst) {
  double r[12];
  fmat4(kAffine, kRigid, r);
  const double x = 0.5, y = -1.25, z = 3;
  double a, b, c, u, v, w;
  fmat6(&x, &y, &z, kAffine, &a, &b, &c);
  fmat6(&a, &b, &c, kRigid, &u, &v, &w);  // rigid after affine, exact in small dyadics
  fmat6(&x, &y, &z, r, &a, &b, &c);
  EXPECT_EQ(a, u);
  EXPECT_EQ(b, v);
  EXPECT_EQ(c, w);
}

TEST(Fmat2, ComposesPlaneMapsByHand) {
  // A p = (2x - y + 0.5, x + 3y - 2); B (u, v) = (-v + 4, u + 1);
  // B after A = (-x - 3y + 6, 2x - y + 1.5).
  const double a[6] = {2, 1, -1, 3, 0.5, -2}, b[6] = {0, 1, -1, 0, 4, 1};
  double r[7];
  r[6] = 99;
  EXPECT_EQ(fmat2(a, b, r), 0);
  const double want[6] = {-1, 2, -3, -1, 6, 1.5};
  for (int k = 0; k < 6; ++k) EXPECT_EQ(r[k], want[k]) << k;
  EXPECT_EQ(r[6], 99.0);
}

TEST(Inmat3, InvertsExactlyAndMultipliesByOneReciprocal) {
  double b[13];
  b[12] = 99;
  std::int32_t flag = -1;
  EXPECT_EQ(inmat3(kAffine, b, &flag), 0);
  EXPECT_EQ(flag, 0);
  expect_bits12(b, kAffineInv);
  EXPECT_EQ(b[12], 99.0);
  // diag(3, 5, 7): det 105, r = 1/105 rounded once; 35 r and 15 r differ in the last bit
  // from 35/105 and 15/105 (0x1.5555555555555p-2 and 0x1.2492492492492p-3).
  const double d[12] = {3, 0, 0, 0, 5, 0, 0, 0, 7, 0, 0, 0};
  inmat3(d, b, &flag);
  EXPECT_EQ(bits(b[0]), bits(0x1.5555555555556p-2));
  EXPECT_EQ(bits(b[4]), bits(0x1.999999999999ap-3));
  EXPECT_EQ(bits(b[8]), bits(0x1.2492492492493p-3));
}

struct SingularCase {
  double d;           // the determinant, placed as diag(d, 1, 1) or (d, 0, 0, 1)
  std::int32_t flag;  // expected flag
};

class Inmat3Threshold : public ::testing::TestWithParam<SingularCase> {};

TEST_P(Inmat3Threshold, StrictOnBothSidesAndNaNPasses) {
  const SingularCase k = GetParam();
  const double a[12] = {k.d, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0};
  double b[12];
  for (double& v : b) v = -7.5;
  std::int32_t flag = -1;
  EXPECT_EQ(inmat3(a, b, &flag), 0);
  EXPECT_EQ(flag, k.flag);
  if (k.flag == 1) {
    for (double v : b) EXPECT_EQ(v, -7.5);  // untouched
  } else if (std::isnan(k.d)) {
    EXPECT_TRUE(std::isnan(b[0]));
  } else {
    EXPECT_EQ(bits(b[0]), bits(1.0 / k.d));  // cofactor 1 times the rounded reciprocal
  }
}

INSTANTIATE_TEST_SUITE_P(
    Table, Inmat3Threshold,
    ::testing::Values(SingularCase{1e-9, 0}, SingularCase{-1e-9, 0},
                      SingularCase{0x1.12e0be826d694p-30, 1},  // one ulp below 1e-9
                      SingularCase{-0x1.12e0be826d694p-30, 1}, SingularCase{1e-10, 1},
                      SingularCase{1e-8, 0}, SingularCase{0.0, 1}, SingularCase{kNaN, 0}));

TEST(Inmat3, AtTheThresholdTheInverseIsTheRoundedReciprocal) {
  const double a[12] = {1e-9, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0};
  double b[12];
  std::int32_t flag = -1;
  inmat3(a, b, &flag);
  EXPECT_EQ(bits(b[0]), bits(0x1.dcd64ffffffffp+29));  // 1/1e-9, rounded
}

TEST(Inmat2, InvertsThroughOneReciprocalAndCopiesSixReals) {
  // det = 3: b5 = (a3 a6 - a4 a5) r = -17 r, which is 0x1.6aaaaaaaaaaaap+2 in magnitude,
  // where -17/3 would round to ...aabp+2.
  const double a[6] = {2, 1, 1, 2, 5, -7};
  double b[7];
  b[6] = 99;
  std::int32_t flag = -1;
  EXPECT_EQ(inmat2(a, b, &flag), 0);
  EXPECT_EQ(flag, 0);
  EXPECT_EQ(bits(b[0]), bits(0x1.5555555555555p-1));
  EXPECT_EQ(bits(b[1]), bits(-0x1.5555555555555p-2));
  EXPECT_EQ(bits(b[2]), bits(-0x1.5555555555555p-2));
  EXPECT_EQ(bits(b[3]), bits(0x1.5555555555555p-1));
  EXPECT_EQ(bits(b[4]), bits(-0x1.6aaaaaaaaaaaap+2));
  EXPECT_EQ(bits(b[5]), bits(0x1.9555555555555p+2));
  EXPECT_EQ(b[6], 99.0);  // 48 bytes, no more
}

class Inmat2Threshold : public ::testing::TestWithParam<SingularCase> {};

TEST_P(Inmat2Threshold, StrictOnBothSidesAndNaNPasses) {
  const SingularCase k = GetParam();
  const double a[6] = {k.d, 0, 0, 1, 0, 0};
  double b[6] = {-7.5, -7.5, -7.5, -7.5, -7.5, -7.5};
  std::int32_t flag = -1;
  inmat2(a, b, &flag);
  EXPECT_EQ(flag, k.flag);
  if (k.flag == 1) {
    for (double v : b) EXPECT_EQ(v, -7.5);
  } else if (std::isnan(k.d)) {
    EXPECT_TRUE(std::isnan(b[0]));
  } else {
    EXPECT_EQ(bits(b[0]), bits(1.0 / k.d));  // b1 = a4 r with a4 = 1
  }
}

INSTANTIATE_TEST_SUITE_P(Table, Inmat2Threshold,
                         ::testing::Values(SingularCase{1e-6, 0},
                                           SingularCase{std::nextafter(1e-6, 0.0), 1},
                                           SingularCase{-1e-6, 0}, SingularCase{1e-9, 1},
                                           SingularCase{kNaN, 0}));

TEST(Inmat2, ThresholdIsAThousandTimesThatOfInmat3) {
  // m11 = m22 = 1e-3: det = 1e-3 * 1e-3 rounds to exactly 1e-6 and inverts; 9e-4 does not.
  double a[6] = {1e-3, 0, 0, 1e-3, 2, 3}, b[6];
  std::int32_t flag = -1;
  inmat2(a, b, &flag);
  EXPECT_EQ(flag, 0);
  a[0] = a[3] = 9e-4;
  inmat2(a, b, &flag);
  EXPECT_EQ(flag, 1);
}

TEST(Fmat1, SingularCallCopiesTheLastRegularInverse) {
  // This test's thread is the main test thread: earlier tests never call fmat1 there.
  double m[9], b[10];
  for (int k = 0; k < 9; ++k) m[k] = kAffine[k];
  b[9] = 99;
  std::int32_t flag = -1;
  EXPECT_EQ(fmat1(m, b, &flag), 0);
  EXPECT_EQ(flag, 0);
  for (int k = 0; k < 9; ++k) EXPECT_EQ(bits(b[k]), bits(kAffineInv[k])) << k;
  EXPECT_EQ(b[9], 99.0);  // nine reals only
  const double zero[9] = {};
  for (double& v : b) v = -1;
  fmat1(zero, b, &flag);
  EXPECT_EQ(flag, 1);
  for (int k = 0; k < 9; ++k) EXPECT_EQ(bits(b[k]), bits(kAffineInv[k])) << k;
  const double twice[9] = {2, 0, 0, 0, 2, 0, 0, 0, 2};
  fmat1(twice, b, &flag);
  EXPECT_EQ(flag, 0);
  EXPECT_EQ(b[0], 0.5);
  EXPECT_EQ(b[1], 0.0);
}

TEST(Fmat23, ProductsByHandWithTheirLeadingDimensions) {
  // A (2x3) = [[1, 2, 3], [4, 5, 6]], B (3x2) = [[7, 8], [9, 10], [11, 12]];
  // A B = [[58, 64], [139, 154]].
  const double a[6] = {1, 4, 2, 5, 3, 6}, b[6] = {7, 9, 11, 8, 10, 12};
  double r[5] = {0, 0, 0, 0, 99};
  std::int32_t n = 2, m = 3, p = 2;
  EXPECT_EQ(fmat23(&n, &m, &p, a, b, r), 0);
  EXPECT_EQ(r[0], 58.0);
  EXPECT_EQ(r[1], 139.0);
  EXPECT_EQ(r[2], 64.0);
  EXPECT_EQ(r[3], 154.0);
  EXPECT_EQ(r[4], 99.0);
}

TEST(Fmat23, SumsOverKInIncreasingOrder) {
  // (1, 1, 1) . (1, e, e), e = 2^-53: in increasing k each e is a tie rounded back to 1.
  const double e = 0x1p-53;
  const double a[3] = {1, 1, 1}, b[3] = {1, e, e};
  double r = 0;
  std::int32_t n = 1, m = 3, p = 1;
  fmat23(&n, &m, &p, a, b, &r);
  EXPECT_EQ(bits(r), bits(1.0));
  const double bb[3] = {e, e, 1};  // the small ones first do count
  fmat23(&n, &m, &p, a, bb, &r);
  EXPECT_EQ(bits(r), bits(1.0 + 0x1p-52));
}

TEST(Fmat23, CountsBelowOneWriteNothing) {
  const double a[4] = {1, 2, 3, 4};
  double r[4] = {5, 5, 5, 5};
  for (std::int32_t bad : {0, -3}) {
    std::int32_t one = 1, two = 2;
    fmat23(&bad, &two, &two, a, a, r);
    fmat23(&two, &bad, &two, a, a, r);
    fmat23(&two, &two, &bad, a, a, r);
    fmat23(&one, &bad, &one, a, a, r);
  }
  for (double v : r) EXPECT_EQ(v, 5.0);
}
