// tests/vector/primitives_test.cpp -- checks for vector/products.cpp and vector/angles.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "support/recording_services.h"
#include "vector/vector_api.h"

namespace {
const double kNaN = std::numeric_limits<double>::quiet_NaN();
const double kInf = std::numeric_limits<double>::infinity();
}  // namespace

TEST(Prosca, LeadingZeroTurnsASumOfNegativeZerosIntoPlusZero) {
  const double a[3] = {-0.0, -0.0, -0.0}, b[3] = {1.0, 2.0, 3.0};
  EXPECT_EQ(bits(prosca(a, b)), bits(0.0));
  const double c[3] = {1.5, -2.0, 0.25}, d[3] = {2.0, 0.5, 8.0};
  EXPECT_EQ(prosca(c, d), 4.0);  // 3 - 1 + 2
}

TEST(Promix, IsTheDeterminantOfTheThreeVectors) {
  const double a[3] = {1, 2, 3}, b[3] = {4, 5, 6.5}, c[3] = {7, 8.25, 10};
  // By cofactors of the first row, in exact arithmetic: 1*(50-53.625)-2*(40-45.5)+3*(33-35)
  EXPECT_EQ(promix(a, b, c), 1.375);
}

TEST(Parvis, SpaceAndPlaneCases) {
  const double a[3] = {1, 2, 3}, b[3] = {-2, 0.5, 4};
  double w[3] = {9, 9, 9};
  std::int32_t dim = 3;
  EXPECT_EQ(parvis(a, b, w, &dim), 0);
  EXPECT_EQ(w[0], 6.5);
  EXPECT_EQ(w[1], -10.0);
  EXPECT_EQ(w[2], 4.5);
  dim = 2;
  EXPECT_EQ(parvis(a, b, w, &dim), 0);
  EXPECT_EQ(w[0], 0.0);
  EXPECT_EQ(w[1], 0.0);
  EXPECT_EQ(w[2], 4.5);  // the perpendicular component of the plane vectors' product
}

TEST(Parvis, ProductsAreRoundedBeforeTheyAreSubtracted) {
  // x = 1 + 2^-30: x*x = 1 + 2^-29 + 2^-60 rounds to 1 + 2^-29, so b2 a1 - a2 b1 is exactly
  // 0. A fused multiply-add would keep the 2^-60.
  const double x = 0x1.00000004p+0, y = 0x1.00000008p+0;
  const double a[3] = {x, y, 0}, b[3] = {1, x, 0};
  double w[3];
  std::int32_t dim = 2;
  parvis(a, b, w, &dim);
  EXPECT_EQ(bits(w[2]), bits(0.0));
}

TEST(Parbis, UnitProductParallelInputsAndPlaneCase) {
  const double a[3] = {2, 0, 0}, b[3] = {0, 0, -3};
  double w[3];
  std::int32_t dim = 3;
  EXPECT_EQ(parbis(a, b, w, &dim), 0);
  EXPECT_EQ(w[0], 0.0);
  EXPECT_EQ(w[1], 1.0);
  EXPECT_EQ(w[2], 0.0);
  const double p[3] = {1, 2, 3}, q[3] = {-2, -4, -6};
  EXPECT_EQ(parbis(p, q, w, &dim), 0);
  EXPECT_EQ(w[0], 0.0);
  EXPECT_EQ(w[1], 0.0);
  EXPECT_EQ(w[2], 0.0);
  dim = 2;
  double v[3] = {7, 7, 7};
  EXPECT_EQ(parbis(a, b, v, &dim), 0);
  EXPECT_EQ(v[0], 0.0);
  EXPECT_EQ(v[1], 0.0);
  EXPECT_EQ(v[2], 0.0);
}

TEST(Vor, AccumulatesByIncreasingIndex) {
  // 1 then seven squares of 2^-54: each addition to 1 is below half an ulp, so the sum by
  // increasing index is exactly 1; any other order that adds the small ones first is not.
  const double t = 0x1p-27;
  const double v[8] = {1, t, t, t, t, t, t, t};
  std::int32_t n = 8;
  EXPECT_EQ(bits(vor(v, &n)), bits(1.0));
  n = 0;
  EXPECT_EQ(vor(v, &n), 0.0);
  n = -4;
  EXPECT_EQ(vor(v, &n), 0.0);
  const double w[5] = {1, 2, 3, 4, 5};
  n = 5;
  EXPECT_EQ(vor(w, &n), 55.0);
}

TEST(Devor, NormalisesAndReturnsTheSquaredNorm) {
  double v[2] = {3, 4};
  std::int32_t n = 2;
  EXPECT_EQ(devor(v, &n), 25.0);
  EXPECT_EQ(v[0], 0.6);
  EXPECT_EQ(v[1], 0.8);
  double z[3] = {0.0, -0.0, 0.0};
  n = 3;
  EXPECT_EQ(devor(z, &n), 0.0);
  EXPECT_EQ(bits(z[1]), bits(-0.0));  // untouched
  double u[2] = {5, 6};
  n = 0;
  EXPECT_EQ(devor(u, &n), 0.0);
  EXPECT_EQ(u[0], 5.0);
}

struct ParcosCase {
  double c;
  double want;  // pi, 0, or NaN meaning "acos(c)"
  std::int32_t flag;
};

class ParcosBand : public ::testing::TestWithParam<ParcosCase> {};

TEST_P(ParcosBand, ResultAndFlagOnEachSideOfEachBound) {
  const ParcosCase k = GetParam();
  const double tol = 1e-3;
  std::int32_t flag = -1;
  const double r = parcos(&k.c, &tol, &flag);
  EXPECT_EQ(flag, k.flag) << k.c;
  if (std::isnan(k.want)) {
    EXPECT_EQ(bits(r), bits(std::acos(k.c))) << k.c;
  } else {
    EXPECT_EQ(bits(r), bits(k.want)) << k.c;
  }
}

const double kPi = 3.141592653589793;
INSTANTIATE_TEST_SUITE_P(
    Table, ParcosBand,
    ::testing::Values(ParcosCase{-1.0 - 2e-3, kPi, 2},
                      ParcosCase{std::nextafter(-1.0 - 1e-3, -2.0), kPi, 2},
                      ParcosCase{-1.0 - 1e-3, kPi, 1},
                      ParcosCase{std::nextafter(-1.0, -2.0), kPi, 1},
                      ParcosCase{-1.0, kNaN, 0}, ParcosCase{0.5, kNaN, 0},
                      ParcosCase{1.0, kNaN, 0}, ParcosCase{std::nextafter(1.0, 2.0), 0.0, 1},
                      ParcosCase{1.0 + 1e-3 / 2, 0.0, 1}, ParcosCase{1.0 + 1e-3, 0.0, 1},
                      ParcosCase{std::nextafter(1.0 + 1e-3, 2.0), 0.0, 2},
                      ParcosCase{kNaN, 0.0, 2}, ParcosCase{kInf, 0.0, 2},
                      ParcosCase{-kInf, kPi, 2}));

TEST(Parcos, ExactCosinesGiveTheirAngles) {
  const double tol = 0.0, half = 0.5;
  std::int32_t flag = -1;
  EXPECT_EQ(parcos(&half, &tol, &flag), 0x1.0c152382d7366p+0);  // pi / 3, rounded
  EXPECT_EQ(flag, 0);
}

TEST(Darcos, PassesStraightToTheArcFunctionsWithoutClamping) {
  const double over = 1.0000001, half = 0.5, minus = -1.0;
  EXPECT_TRUE(std::isnan(darcos(&over)));
  EXPECT_TRUE(std::isnan(darsin(&over)));
  EXPECT_EQ(darcos(&minus), kPi);
  EXPECT_EQ(darsin(&half), 0x1.0c152382d7366p-1);  // pi / 6, rounded
}

TEST(Vectp2, CandidateChoiceTieAndDegenerateMatrix) {
  const double identity[4] = {1, 0, 0, 1}, one = 1.0;
  double v[2] = {7, 7};
  EXPECT_EQ(vectp2(identity, &one, v), 0.0);
  EXPECT_EQ(v[0], 0.0);
  EXPECT_EQ(v[1], 0.0);
  // p = (M12, l - M11) = (3, 4) and q = (l - M22, M21) = (4, 3) tie: the first row's wins.
  const double m[4] = {0, 3, 3, 0}, four = 4.0;
  EXPECT_EQ(vectp2(m, &four, v), 25.0);
  EXPECT_EQ(v[0], 0.6);
  EXPECT_EQ(v[1], 0.8);
  // |q| larger: (l - M22, M21) = (0, -2) wins over p = (0, 1).
  const double n[4] = {2, -2, 0, 3}, three = 3.0;
  EXPECT_EQ(vectp2(n, &three, v), 4.0);
  EXPECT_EQ(v[0], 0.0);
  EXPECT_EQ(v[1], -1.0);
}
