// tests/vector/plane2_test.cpp -- checks for vector/plane2.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
const double kPi = 3.141592653589793, kTwoPi = 6.283185307179586;
const double kNaN = std::numeric_limits<double>::quiet_NaN();
// Rotation by 90 degrees scaled by 2, then (1, 1): (x, y) -> (1 - 2y, 1 + 2x), det 4.
const double kRot2[6] = {0, 2, -2, 0, 1, 1};
const double kFlipY[6] = {1, 0, 0, -1, 0, 0};  // (x, y) -> (x, -y), det -1
const double kIdentity[6] = {1, 0, 0, 1, 0, 0};
}  // namespace

TEST(Tr2pt, VectorsPointsAndAnglesByHand) {
  const double t[6] = {2, 1, -1, 3, 0.5, -2}, v[2] = {1.5, -2};
  double w[2];
  tr2vec(v, t, w);
  expect_bits(w, {5, -4.5});
  tr2pt(v, t, w);
  expect_bits(w, {5.5, -6.5});
  // (t1 x + t3 y) + t5 with x = 1, y = t5 = 2^-53: two ties that round back to 1.
  const double e = 0x1p-53, u[6] = {1, 0, 1, 0, e, 0};
  double p[2] = {1, e};
  tr2pt(p, u, p);
  EXPECT_EQ(bits(p[0]), bits(1.0));
  // Angle 0 under a rotation by -90 degrees: atan2(-1, 0) + 2 pi, never negative; -0 stays.
  const double down[6] = {0, -1, 1, 0, 0, 0}, negzero[6] = {1, -0.0, 0, 1, 0, 0};
  const double zero = 0.0, minus0 = -0.0;
  EXPECT_EQ(bits(tr2ang(&zero, down)), bits(0x1.2d97c7f3321d2p+2));
  EXPECT_EQ(bits(tr2ang(&minus0, negzero)), bits(-0.0));  // atan2(-0, 1) is not below 0
}

TEST(Tr2axs, NormalisesDirectionsAndLeavesACollapsedOneAlone) {
  const double ax[6] = {1, 0, 0, 1, 3, 4}, ax2[6] = {0.6, 0.8, 0, 1, 3, 4};
  double out[6];
  tr2axs(ax, kRot2, out);
  expect_bits(out, {0, 1, -1, 0, -7, 7});
  const double proj[6] = {1, 0, 0, 0, 0, 0};  // onto the x axis: the second one collapses
  double kept[6] = {9, 9, 9, 9, 9, 9};
  tr2axs(ax2, proj, kept);
  expect_bits(kept, {1, 0, 9, 9, 3, 0});
  ToleranceGuard tol12(12, 0.5);  // |w| must exceed the tolerance strictly
  const double half[6] = {std::nextafter(0.5, 1.0), 0, 0, 0.5, 0, 0};
  for (double& v : kept) v = 9;
  tr2axs(ax, half, kept);
  expect_bits(kept, {1, 0, 9, 9});
}

TEST(Tr2cir, ReflectionsScalingAndFullCircles) {
  const double c[5] = {1, 2, 3, 0.5, 2.0};
  double out[5];
  tr2cir(c, kFlipY, out);  // the image of 0.5..2 is -2..-0.5: start at the old end's image
  expect_bits(out, {1, -2, 3});
  EXPECT_NEAR(out[3], kTwoPi - 2.0, 1e-15);
  EXPECT_NEAR(out[4], kTwoPi - 0.5, 1e-15);
  tr2cir(c, kRot2, out);
  expect_bits(out, {-3, 3, 6});
  EXPECT_NEAR(out[3], 0.5 + kPi / 2, 1e-15);
  const double full[5] = {0, 0, 1, 1.0, 1.0};
  tr2cir(full, kFlipY, out);
  EXPECT_NEAR(out[4] - out[3], kTwoPi, 1e-15);
  // Start 0 under the identity gives start' = +0, so end' - start' is the sweep: a sweep of
  // tol5 stays, one ulp less becomes a full circle.
  ToleranceGuard tol5(5, 0x1p-10);
  const double at[5] = {0, 0, 1, 0, 0x1p-10}, below[5] = {0, 0, 1, 0, 0x1.fffffffffffffp-11};
  tr2cir(at, kIdentity, out);
  EXPECT_EQ(bits(out[4]), bits(0x1p-10));
  tr2cir(below, kIdentity, out);
  EXPECT_EQ(bits(out[4]), bits(0x1.fffffffffffffp-11 + kTwoPi));
}

TEST(Tr2can, ParametersUnderAReflectionForEachKind) {
  ToleranceGuard tol4(4, 0x1p-10);
  double out[8];
  out[7] = 99;
  const double closed[7] = {1 - 0x1p-10, 1, 2, 3, 0, 1, 2};  // |e| = 1 - tol4: closed
  tr2can(closed, kFlipY, out);
  expect_bits(out, {1 - 0x1p-10, 1, -2, 3, 0, 0x1.121fb54442d18p+2, 0x1.521fb54442d18p+2, 99});
  const double open[7] = {-0x1.ff80000000001p-1, 1, 2, 3, 0, -1, 3};  // one ulp beyond
  tr2can(open, kFlipY, out);
  expect_bits(out + 5, {-3, 1});
  const double wrap[7] = {0.5, 0, 0, 1, 0, 1, kTwoPi};  // start' = 0 moves by 2 pi
  tr2can(wrap, kFlipY, out);
  expect_bits(out + 5, {kTwoPi, 0x1.721fb54442d18p+3});
  tr2can(closed, kRot2, out);  // det > 0: size doubled, parameters copied
  expect_bits(out + 3, {6});
  expect_bits(out + 5, {1, 2});
}

TEST(Tr2ln, PartsAskedForAndWritten) {
  // Q = (1, 0), D = (1, 0), ends at t = -1 and 2.5, i.e. (0, 0) and (3.5, 0), which go to
  // (1, 1) and (1, 8): Q' = (1, 3), D' = (0, 1), parameters doubled.
  const double l[6] = {1, 0, 1, 0, -1, 2.5};
  double out[6] = {9, 9, 9, 9, 9, 9};
  std::int32_t flag = 1;
  tr2ln(l, kRot2, out, &flag);
  EXPECT_EQ(flag, 1);
  expect_bits(out, {1, 3, 9, 9, 9, 9});
  flag = 255;
  tr2ln(l, kRot2, out, &flag);
  EXPECT_EQ(flag, 7);
  expect_bits(out, {1, 3, 0, 1, -2, 5});
  const double proj[6] = {1, 0, 0, 0, 0, 0}, up[6] = {2, 5, 0, 1, 0, 1};
  flag = 255;
  tr2ln(up, proj, out, &flag);  // the direction collapses: only the point is written
  EXPECT_EQ(flag, 1);
  expect_bits(out, {2, 0, 0, 1, -2, 5});
}

TEST(Tr2ln, ParameterTolerancesOnBothSides) {
  ToleranceGuard tol5(5, 0x1p-10), tol2(2, 0x1p-19), tol3(3, 0x1p-30);
  auto params = [](const double* t, double t0, double t1) {
    const double l[6] = {0, 0, 1, 0, t0, t1};
    double out[6];
    std::int32_t flag = 4;
    tr2ln(l, t, out, &flag);
    return std::vector<double>{out[4], out[5]};
  };
  const double s1 = 1 + 0x1p-11, s2 = 1 + 0x1p-10;
  const double near1[6] = {s1, 0, 0, s1, 0, 0}, far1[6] = {s2, 0, 0, s2, 0, 0};
  const double twice[6] = {2, 0, 0, 2, 0, 0};
  // |s - 1| < tol5: kept exactly; = tol5: scaled.
  EXPECT_EQ(params(near1, 3, 5), (std::vector<double>{3, 5}));
  EXPECT_EQ(params(far1, 3, 5), (std::vector<double>{3 * s2, 5 * s2}));
  // Scaled to 2^-19 = tol2: stays; one ulp less snaps to 0.
  expect_bits(params(twice, 0x1p-20, -0x1.fffffffffffffp-21).data(), {0x1p-19, 0});
  ToleranceGuard tol3b(3, 0x1p-10);  // a length of tol3 stays, shorter collapses
  EXPECT_EQ(params(kIdentity, 1, 1 + 0x1p-10)[1], 1 + 0x1p-10);
  EXPECT_EQ(params(kIdentity, 1, 1 + 0x1p-11)[1], 1.0);
}

TEST(Tr2crv, TransformsEachPointAndRefusesBadCounts) {
  const double c[5] = {2, 1, 0, 0, 1};
  double out[6] = {9, 9, 9, 9, 9, 9};
  tr2crv(c, kRot2, out);
  expect_bits(out, {2, 1, 3, -1, 1, 9});
  for (double bad : {-1.0, 1.5, kNaN, 3e9}) {
    const double b[5] = {bad, 1, 0, 0, 1};
    double o[1] = {9};
    tr2crv(b, kRot2, o);
    EXPECT_EQ(o[0], 9.0) << bad;
  }
}

struct CodeCase {
  std::int32_t hdr;
  int size;  // reals written; 0 for a code that writes nothing
};

class TraeleWrites : public ::testing::TestWithParam<CodeCase> {};

TEST_P(TraeleWrites, ExactlyTheRealsOfItsTypeAndNothingForOtherCodes) {
  const CodeCase k = GetParam();
  double e[12] = {0.5, 1.5, 0.25, 2, 0.75, 3, 0.125, 4, 5, 6, 7, 8}, out[12];
  if ((k.hdr & 0xFF) == 89) e[0] = 2;  // a curve of two points
  for (double& v : out) v = kNaN;
  traele(&k.hdr, kRot2, e, nullptr, out);
  for (int i = 0; i < 12; ++i) EXPECT_EQ(std::isnan(out[i]), i >= k.size) << "real " << i + 1;
}

INSTANTIATE_TEST_SUITE_P(
    Table, TraeleWrites,
    ::testing::Values(CodeCase{79, 0}, CodeCase{80, 2}, CodeCase{81, 6}, CodeCase{82, 5},
                      CodeCase{83, 6}, CodeCase{84, 0}, CodeCase{85, 8}, CodeCase{86, 7},
                      CodeCase{87, 7}, CodeCase{88, 7}, CodeCase{89, 5}, CodeCase{90, 8},
                      CodeCase{91, 0}, CodeCase{92, 7}, CodeCase{95, 8}, CodeCase{103, 0},
                      CodeCase{104, 2}, CodeCase{104 | 0x100, 3}, CodeCase{105, 0},
                      CodeCase{80 | 0x7A00, 2}, CodeCase{-256 + 80, 2}, CodeCase{0x100, 0}));

TEST(Traele, APointCarriesItsAngleWhenBit8IsSet) {
  const std::int32_t c104 = 104 | 0x100;
  const double pa[3] = {3, 4, 0};
  double a[3];
  traele(&c104, kRot2, pa, nullptr, a);
  expect_bits(a, {-7, 7});
  EXPECT_NEAR(a[2], kPi / 2, 1e-15);
}

TEST(Traele, CentreAngleSizeElements) {
  const std::int32_t c90 = 90, c95 = 95, c92 = 92, c85 = 85;
  const double e[8] = {3, 4, 0, 1.5, 11, 12, 13, 14}, f[8] = {3, 4, 0.25, 1.5};
  const double g[8] = {3, 4, 0, 1.5, 0, -2, 77, 88}, stretch[6] = {2, 0, 0, 1, 0, 0};
  double out[8], h[8];
  traele(&c90, kRot2, e, nullptr, out);  // a similarity, det 4: size doubled
  expect_bits(out, {-7, 7});
  expect_bits(out + 3, {3, 11, 12, 13, 14});
  EXPECT_NEAR(out[2], kPi / 2, 1e-15);
  traele(&c95, stretch, e, nullptr, out);  // not similarity-preserving: size as it was
  expect_bits(out + 3, {1.5});
  traele(&c90, kFlipY, f, nullptr, out);  // det < 0: tr2ang(pi) - angle, size negated
  EXPECT_NEAR(out[2], kPi - 0.25, 1e-15);
  expect_bits(out + 3, {-1.5});
  traele(&c92, kRot2, g, nullptr, out);  // both pairs, the seventh real copied
  expect_bits(out + 3, {3});
  expect_bits(out + 5, {-4, 77});
  traele(&c85, kRot2, g, nullptr, h);  // as 92, and the eighth real copied
  expect_bits(h, {out[0], out[1], out[2], out[3], out[4], out[5], out[6], 88});
}

TEST(Traele, SimilarityTestsAreInclusive) {
  const std::int32_t c90 = 90;
  const double e[8] = {0, 0, 0, 2};
  double out[8];
  auto size_under = [&](const double* t) {
    traele(&c90, t, e, nullptr, out);
    return out[3];
  };
  {
    // |t4 t2 + t1 t3| = 2 c against tol5 = 2^-10, T = (2, 0, c, 2): det 4, size doubled.
    ToleranceGuard tol5(5, 0x1p-10), tol4(4, 1.0);
    const double at[6] = {2, 0, 0x1p-11, 2}, past[6] = {2, 0, 0x1.0000000000001p-11, 2};
    EXPECT_EQ(size_under(at), 4.0);
    EXPECT_EQ(size_under(past), 2.0);
  }
  // |t1^2 - t4^2 + t2^2 - t3^2| = 1.5625 - 1 against tol4, T = diag(1.25, 1).
  const double diag[6] = {1.25, 0, 0, 1};
  ToleranceGuard tol4(4, 0.5625);
  EXPECT_EQ(bits(size_under(diag)), bits(0x1.1e3779b97f4a8p+0 * 2.0));  // sqrt(1.25) 2
  ToleranceGuard tol4b(4, 0x1.1ffffffffffffp-1);
  EXPECT_EQ(size_under(diag), 2.0);
}

namespace {
// A shape holding one point (x, y), nested `depth` shapes below the outermost.
std::vector<double> nested_point(int depth, double x, double y) {
  std::vector<double> s = {1, 80, 2, x, y};
  for (int d = 0; d < depth; ++d) {
    std::vector<double> outer = {1, 102, static_cast<double>(s.size())};
    outer.insert(outer.end(), s.begin(), s.end());
    s = outer;
  }
  return s;
}
}  // namespace

TEST(Tr2sha, TransformsEntriesThatFitAndStopsAtBadCounts) {
  // A point; type 84 (unhandled); a curve of 2 points in 3 reals (does not fit); a circle;
  // then a negative length that ends the walk.
  const std::vector<double> s = {5,  80, 2, 1, 0, 84, 3, 5, 6, 7, 89, 3, 2, 0,
                                 0,  82, 5, 0, 0, 1,  0.5, 1, 80, -2, 1, 0};
  std::vector<double> out(s.size(), kNaN);
  tr2sha(s.data(), kRot2, out.data());
  expect_bits(out.data(), {5, 80, 2, 1, 3, 84, 3, kNaN, kNaN, kNaN, 89, 3, kNaN, kNaN, kNaN,
                           82, 5, 1, 1, 2});
  for (std::size_t k = 22; k < out.size(); ++k) EXPECT_TRUE(std::isnan(out[k])) << k;
  for (int depth : {8, 9}) {  // eight levels below the outermost, not nine
    const std::vector<double> n = nested_point(depth, 1, 0);
    std::vector<double> o(n.size(), kNaN);
    tr2sha(n.data(), kRot2, o.data());
    EXPECT_EQ(bits(o.back()), bits(depth == 8 ? 3.0 : kNaN)) << depth;
  }
}

TEST(Traels, TransformsTheElementsThatFitAndCountsThem) {
  // A point at real 1, a circle at 3, type 84 at 8, a point at 10 past lim = 10, a
  // position 0.
  const std::int32_t n = 5, lim = 10, hdr[5] = {80, 82, 84, 80, 80}, pos[5] = {1, 3, 8, 10, 0};
  const double e[10] = {1, 0, 0, 0, 1, 0.5, 1, 5, 6, 7};
  std::vector<double> out(10, kNaN);
  EXPECT_EQ(traels(&n, hdr, kRot2, e, pos, &lim, out.data()), 2);
  expect_bits(out.data(), {1, 3, 1, 1, 2, out[5], out[6], kNaN, kNaN, kNaN});
  // In place, a shape that fits exactly; one real less and its inner entry no longer fits.
  const std::int32_t one = 1, c102 = 102, at = 1;
  std::vector<double> s = nested_point(2, 1, 0);
  const std::int32_t len = static_cast<std::int32_t>(s.size()), shorter = len - 1;
  EXPECT_EQ(traels(&one, &c102, kRot2, s.data(), &at, &len, s.data()), 1);
  EXPECT_EQ(s.back(), 3.0);
  EXPECT_EQ(traels(&one, &c102, kRot2, s.data(), &at, &shorter, s.data()), 1);
  EXPECT_EQ(s.back(), 3.0);
}
