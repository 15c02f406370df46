// tests/vector/plane2_test.cpp -- checks for vector/plane2.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "support/recording_services.h"
#include "support/tolerance_guard.h"
#include "vector/vector_api.h"

namespace {

const double kPi = 3.141592653589793;
const double kTwoPi = 6.283185307179586;
const double kNaN = std::numeric_limits<double>::quiet_NaN();

// Rotation by 90 degrees scaled by 2, then the translation (1, 1): (x, y) -> (1 - 2y, 1 + 2x).
const double kRot2[6] = {0, 2, -2, 0, 1, 1};
// Reflection in the x axis: (x, y) -> (x, -y), det -1.
const double kFlipY[6] = {1, 0, 0, -1, 0, 0};
const double kIdentity[6] = {1, 0, 0, 1, 0, 0};

std::int32_t code(std::int32_t c) { return c; }

}  // namespace

TEST(Tr2vec, VectorsAndPointsByHandWithTheTranslationLast) {
  const double t[6] = {2, 1, -1, 3, 0.5, -2};
  const double v[2] = {1.5, -2};
  double w[2];
  EXPECT_EQ(tr2vec(v, t, w), 0);
  EXPECT_EQ(w[0], 5.0);
  EXPECT_EQ(w[1], -4.5);
  EXPECT_EQ(tr2pt(v, t, w), 0);
  EXPECT_EQ(w[0], 5.5);
  EXPECT_EQ(w[1], -6.5);
  // (t1 x + t3 y) + t5 with x = 1, y = t5 = 2^-53: two ties that round back to 1.
  const double e = 0x1p-53;
  const double u[6] = {1, 0, 1, 0, e, 0};
  double p[2] = {1, e};
  tr2pt(p, u, p);  // in place
  EXPECT_EQ(bits(p[0]), bits(1.0));
}

TEST(Tr2ang, ResultLiesInZeroToTwoPi) {
  // Rotation by -90 degrees: angle 0 goes to atan2(-1, 0) = -pi/2, plus 2 pi.
  const double down[6] = {0, -1, 1, 0, 0, 0};
  const double zero = 0.0;
  EXPECT_EQ(bits(tr2ang(&zero, down)), bits(0x1.2d97c7f3321d2p+2));
  EXPECT_EQ(bits(tr2ang(&zero, kIdentity)), bits(0.0));
  EXPECT_NEAR(tr2ang(&zero, kRot2), kPi / 2, 1e-15);
  // Angle -0 under t2 = -0: the direction (1, -0) gives atan2(-0, 1) = -0, not below 0.
  const double negzero[6] = {1, -0.0, 0, 1, 0, 0}, minus0 = -0.0;
  EXPECT_EQ(bits(tr2ang(&minus0, negzero)), bits(-0.0));
  EXPECT_TRUE(std::isnan(tr2ang(&kNaN, kIdentity)));
}

TEST(Tr2axs, NormalisesDirectionsAndLeavesACollapsedOneAlone) {
  const double ax[6] = {1, 0, 0, 1, 3, 4};
  double out[6];
  EXPECT_EQ(tr2axs(ax, kRot2, out), 0);
  const double want[6] = {0, 1, -1, 0, -7, 7};
  for (int k = 0; k < 6; ++k) EXPECT_EQ(out[k], want[k]) << k;
  // Projection onto the x axis: the second direction collapses to (0, 0).
  const double proj[6] = {1, 0, 0, 0, 0, 0};
  const double ax2[6] = {0.6, 0.8, 0, 1, 3, 4};
  double out2[6] = {9, 9, 9, 9, 9, 9};
  tr2axs(ax2, proj, out2);
  EXPECT_EQ(out2[0], 1.0);
  EXPECT_EQ(out2[1], 0.0);
  EXPECT_EQ(out2[2], 9.0);
  EXPECT_EQ(out2[3], 9.0);
  EXPECT_EQ(out2[4], 3.0);
  EXPECT_EQ(out2[5], 0.0);
}

TEST(Tr2axs, CollapseTestIsInclusiveOnTolerance12) {
  ToleranceGuard tol12(12, 0.5);
  const double ax[6] = {1, 0, 0, 1, 0, 0};
  const double half[6] = {0.5, 0, 0, 0.5, 0, 0};
  double out[6] = {9, 9, 9, 9, 9, 9};
  tr2axs(ax, half, out);  // |w| = 0.5: not longer than the tolerance
  EXPECT_EQ(out[0], 9.0);
  EXPECT_EQ(out[3], 9.0);
  const double more[6] = {std::nextafter(0.5, 1.0), 0, 0, 0.5, 0, 0};
  tr2axs(ax, more, out);
  EXPECT_EQ(out[0], 1.0);
  EXPECT_EQ(out[3], 9.0);
}

TEST(Tr2cir, ScalesTheRadiusAndKeepsTheSweepUnderAReflection) {
  const double c[5] = {1, 2, 3, 0.5, 2.0};
  double out[5];
  EXPECT_EQ(tr2cir(c, kFlipY, out), 0);
  EXPECT_EQ(out[0], 1.0);
  EXPECT_EQ(out[1], -2.0);
  EXPECT_EQ(out[2], 3.0);
  // The image of the arc 0.5..2 is -2..-0.5: it starts at the image of the old end.
  EXPECT_NEAR(out[3], kTwoPi - 2.0, 1e-15);
  EXPECT_NEAR(out[4], kTwoPi - 0.5, 1e-15);
  tr2cir(c, kRot2, out);  // det 4: radius 6, start turned by 90 degrees
  EXPECT_EQ(out[0], -3.0);
  EXPECT_EQ(out[1], 3.0);
  EXPECT_EQ(out[2], 6.0);
  EXPECT_NEAR(out[3], 0.5 + kPi / 2, 1e-15);
  EXPECT_NEAR(out[4] - out[3], 1.5, 1e-15);
}

TEST(Tr2cir, AZeroSweepStaysAFullCircleAndTheTestIsStrict) {
  const double full[5] = {0, 0, 1, 1.0, 1.0};
  double out[5];
  tr2cir(full, kFlipY, out);
  EXPECT_NEAR(out[4] - out[3], kTwoPi, 1e-15);
  // Start 0 under the identity gives start' = 0 exactly, so end' - start' is the sweep.
  ToleranceGuard tol5(5, 0x1p-10);
  const double at[5] = {0, 0, 1, 0, 0x1p-10};
  tr2cir(at, kIdentity, out);
  EXPECT_EQ(bits(out[4]), bits(0x1p-10));
  const double below[5] = {0, 0, 1, 0, std::nextafter(0x1p-10, 0.0)};
  tr2cir(below, kIdentity, out);
  EXPECT_EQ(bits(out[4]), bits(std::nextafter(0x1p-10, 0.0) + kTwoPi));
}

TEST(Tr2can, ParametersUnderAReflectionForEachKind) {
  double out[8];
  out[7] = 99;
  // Closed kind: (2 pi - end, 2 pi - start).
  const double closed[7] = {0.5, 1, 2, 3, 0, 1, 2};
  EXPECT_EQ(tr2can(closed, kFlipY, out), 0);
  EXPECT_EQ(out[0], 0.5);
  EXPECT_EQ(out[1], 1.0);
  EXPECT_EQ(out[2], -2.0);
  EXPECT_EQ(out[3], 3.0);
  EXPECT_EQ(bits(out[4]), bits(0.0));
  EXPECT_EQ(bits(out[5]), bits(0x1.121fb54442d18p+2));  // 2 pi - 2
  EXPECT_EQ(bits(out[6]), bits(0x1.521fb54442d18p+2));  // 2 pi - 1
  EXPECT_EQ(out[7], 99.0);                              // 56 bytes, no more
  // Open kinds: (-end, -start).
  const double open[7] = {-1.5, 1, 2, 3, 0, -1, 3};
  tr2can(open, kFlipY, out);
  EXPECT_EQ(out[0], -1.5);
  EXPECT_EQ(out[5], -3.0);
  EXPECT_EQ(out[6], 1.0);
  // A closed start that comes out at 0 (end = 2 pi) is moved by 2 pi with the end.
  const double wrap[7] = {0.5, 0, 0, 1, 0, 1, kTwoPi};
  tr2can(wrap, kFlipY, out);
  EXPECT_EQ(bits(out[5]), bits(kTwoPi));
  EXPECT_EQ(bits(out[6]), bits(0x1.721fb54442d18p+3));  // (2 pi - 1) + 2 pi
  // det > 0: parameters copied; size scaled by sqrt(4).
  tr2can(closed, kRot2, out);
  EXPECT_EQ(out[3], 6.0);
  EXPECT_EQ(out[5], 1.0);
  EXPECT_EQ(out[6], 2.0);
}

TEST(Tr2can, OpenOrClosedIsAStrictTestOnOneMinusTolerance4) {
  ToleranceGuard tol4(4, 0x1p-10);
  double c[7] = {1 - 0x1p-10, 0, 0, 1, 0, 1, 2}, out[7];
  tr2can(c, kFlipY, out);  // |e| = 1 - tol4: closed
  EXPECT_EQ(bits(out[5]), bits(0x1.121fb54442d18p+2));
  c[0] = -std::nextafter(1 - 0x1p-10, 2.0);  // one ulp beyond: open
  tr2can(c, kFlipY, out);
  EXPECT_EQ(out[5], -2.0);
}

TEST(Tr2ln, TransformsAllPartsAndReportsThem) {
  // Q = (1, 0), D = (1, 0), ends at t = -1 and 2.5: the ends (0, 0) and (3.5, 0) go to
  // (1, 1) and (1, 8); Q' = (1, 3), D' = (0, 1), parameters scaled by 2.
  const double l[6] = {1, 0, 1, 0, -1, 2.5};
  double out[6];
  std::int32_t flag = 255;
  EXPECT_EQ(tr2ln(l, kRot2, out, &flag), 0);
  EXPECT_EQ(flag, 7);
  const double want[6] = {1, 3, 0, 1, -2, 5};
  for (int k = 0; k < 6; ++k) EXPECT_EQ(out[k], want[k]) << k;
  // Only the point asked for.
  double only[6] = {9, 9, 9, 9, 9, 9};
  flag = 1;
  tr2ln(l, kRot2, only, &flag);
  EXPECT_EQ(flag, 1);
  EXPECT_EQ(only[1], 3.0);
  EXPECT_EQ(only[2], 9.0);
  EXPECT_EQ(only[4], 9.0);
  // A collapsed direction: direction and parameters stay, their bits are cleared.
  const double proj[6] = {1, 0, 0, 0, 0, 0};
  const double up[6] = {2, 5, 0, 1, 0, 1};
  double col[6] = {9, 9, 9, 9, 9, 9};
  flag = 255;
  tr2ln(up, proj, col, &flag);
  EXPECT_EQ(flag, 1);
  EXPECT_EQ(col[0], 2.0);
  EXPECT_EQ(col[1], 0.0);
  for (int k = 2; k < 6; ++k) EXPECT_EQ(col[k], 9.0);
}

TEST(Tr2ln, ParameterTolerancesOnBothSides) {
  ToleranceGuard tol5(5, 0x1p-10), tol2(2, 0x1p-19);
  std::int32_t flag = 4;
  double out[6];
  // Scale 1 + 2^-11 counts as length-preserving (strict < 2^-10): parameters kept exactly.
  const double s1 = 1 + 0x1p-11, s2 = 1 + 0x1p-10;
  const double near1[6] = {s1, 0, 0, s1, 0, 0}, far1[6] = {s2, 0, 0, s2, 0, 0};
  const double l[6] = {0, 0, 1, 0, 3, 5};
  tr2ln(l, near1, out, &flag);
  EXPECT_EQ(flag, 4);
  EXPECT_EQ(out[4], 3.0);
  EXPECT_EQ(out[5], 5.0);
  flag = 4;
  tr2ln(l, far1, out, &flag);
  EXPECT_EQ(out[4], 3 * s2);
  EXPECT_EQ(out[5], 5 * s2);
  // Scaled by 2: 2^-20 becomes 2^-19 = tol2 and stays; one ulp less snaps to 0 (the
  // segment, 2^-19 long, is longer than tol3).
  ToleranceGuard tol3_small(3, 0x1p-30);
  const double twice[6] = {2, 0, 0, 2, 0, 0};
  const double small[6] = {0, 0, 1, 0, 0x1p-20, std::nextafter(-0x1p-20, 0.0)};
  flag = 4;
  tr2ln(small, twice, out, &flag);
  EXPECT_EQ(out[4], 0x1p-19);
  EXPECT_EQ(bits(out[5]), bits(0.0));
  // A segment of length 2^-10 = tol3 stays; shorter collapses onto its first end.
  ToleranceGuard tol3(3, 0x1p-10);
  const double shortl[6] = {0, 0, 1, 0, 1, 1 + 0x1p-10};
  flag = 4;
  tr2ln(shortl, kIdentity, out, &flag);
  EXPECT_EQ(out[5], 1 + 0x1p-10);
  const double shorter[6] = {0, 0, 1, 0, 1, std::nextafter(1 + 0x1p-10, 0.0)};
  flag = 4;
  tr2ln(shorter, kIdentity, out, &flag);
  EXPECT_EQ(out[5], 1.0);
}

TEST(Tr2crv, TransformsEachPointAndRefusesBadCounts) {
  const double c[5] = {2, 1, 0, 0, 1};
  double out[6] = {9, 9, 9, 9, 9, 9};
  EXPECT_EQ(tr2crv(c, kRot2, out), 0);
  const double want[5] = {2, 1, 3, -1, 1};
  for (int k = 0; k < 5; ++k) EXPECT_EQ(out[k], want[k]) << k;
  EXPECT_EQ(out[5], 9.0);
  for (double bad : {-1.0, 1.5, kNaN, 3e9}) {
    double b[5] = {bad, 1, 0, 0, 1}, o[5] = {9, 9, 9, 9, 9};
    tr2crv(b, kRot2, o);
    for (double v : o) EXPECT_EQ(v, 9.0) << bad;
  }
}

struct CodeCase {
  std::int32_t hdr;
  int size;  // reals written; 0 for a code that writes nothing
};

class TraeleWrites : public ::testing::TestWithParam<CodeCase> {};

TEST_P(TraeleWrites, ExactlyTheRealsOfItsTypeAndNothingForOtherCodes) {
  const CodeCase k = GetParam();
  double e[12] = {0.5, 1.5, 0.25, 2, 0.75, 3, 0.125, 4, 5, 6, 7, 8};
  if ((k.hdr & 0xFF) == 89) e[0] = 2;  // a curve of two points
  double out[12];
  for (double& v : out) v = kNaN;
  EXPECT_EQ(traele(&k.hdr, kRot2, e, nullptr, out), 0);
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

TEST(Traele, DispatchesToTheElementRoutines) {
  const double e[8] = {0.5, 1, 2, 3, 0.25, 1, 2, 0.5};
  double a[8], b[8];
  const std::int32_t c82 = 82, c83 = 83, c87 = 87, c81 = 81;
  traele(&c82, kFlipY, e, nullptr, a);
  tr2cir(e, kFlipY, b);
  for (int k = 0; k < 5; ++k) EXPECT_EQ(bits(a[k]), bits(b[k])) << k;
  traele(&c83, kRot2, e, nullptr, a);
  tr2axs(e, kRot2, b);
  for (int k = 0; k < 6; ++k) EXPECT_EQ(bits(a[k]), bits(b[k])) << k;
  traele(&c87, kFlipY, e, nullptr, a);
  tr2can(e, kFlipY, b);
  for (int k = 0; k < 7; ++k) EXPECT_EQ(bits(a[k]), bits(b[k])) << k;
  std::int32_t flag = 255;
  traele(&c81, kRot2, e, nullptr, a);
  tr2ln(e, kRot2, b, &flag);
  for (int k = 0; k < 6; ++k) EXPECT_EQ(bits(a[k]), bits(b[k])) << k;
  // Type 104 with bit 8: the point, then its angle by tr2ang.
  const std::int32_t c104 = 104 | 0x100;
  const double pa[3] = {3, 4, 0};
  traele(&c104, kRot2, pa, nullptr, a);
  EXPECT_EQ(a[0], -7.0);
  EXPECT_EQ(a[1], 7.0);
  EXPECT_NEAR(a[2], kPi / 2, 1e-15);
}

TEST(Traele, CentreAngleSizeElements) {
  const std::int32_t c90 = code(90), c95 = code(95), c92 = code(92), c85 = code(85);
  const double e[8] = {3, 4, 0, 1.5, 11, 12, 13, 14};
  double out[8];
  // A similarity with det 4: centre mapped, angle turned, size doubled, four reals copied.
  traele(&c90, kRot2, e, nullptr, out);
  EXPECT_EQ(out[0], -7.0);
  EXPECT_EQ(out[1], 7.0);
  EXPECT_NEAR(out[2], kPi / 2, 1e-15);
  EXPECT_EQ(out[3], 3.0);
  for (int k = 4; k < 8; ++k) EXPECT_EQ(out[k], e[k]) << k;
  // Not similarity-preserving (diag(2, 1)): the size is left as it was.
  const double stretch[6] = {2, 0, 0, 1, 0, 0};
  traele(&c95, stretch, e, nullptr, out);
  EXPECT_EQ(out[3], 1.5);
  // det < 0: tr2ang of pi, minus the angle; the size changes sign.
  const double f[8] = {3, 4, 0.25, 1.5, 0, 0, 0, 0};
  traele(&c90, kFlipY, f, nullptr, out);
  EXPECT_NEAR(out[2], kPi - 0.25, 1e-15);
  EXPECT_EQ(out[3], -1.5);
  // Type 92: both pairs alike, the seventh real copied; type 85 also copies the eighth.
  const double g[8] = {3, 4, 0, 1.5, 0, -2, 77, 88};
  traele(&c92, kRot2, g, nullptr, out);
  EXPECT_EQ(out[3], 3.0);
  EXPECT_EQ(out[5], -4.0);
  EXPECT_NEAR(out[4], kPi / 2, 1e-15);
  EXPECT_EQ(out[6], 77.0);
  double h[8];
  traele(&c85, kRot2, g, nullptr, h);
  for (int k = 0; k < 7; ++k) EXPECT_EQ(bits(h[k]), bits(out[k])) << k;
  EXPECT_EQ(h[7], 88.0);
}

TEST(Traele, SimilarityTestsAreInclusive) {
  const std::int32_t c90 = 90;
  const double e[8] = {0, 0, 0, 2, 0, 0, 0, 0};
  double out[8];
  {
    // |t4 t2 + t1 t3| = 2 c against tol5 = 2^-10, with T = (2, 0, c, 2), det 4.
    ToleranceGuard tol5(5, 0x1p-10), tol4(4, 1.0);
    const double at[6] = {2, 0, 0x1p-11, 2, 0, 0};
    traele(&c90, at, e, nullptr, out);
    EXPECT_EQ(out[3], 4.0);
    const double past[6] = {2, 0, std::nextafter(0x1p-11, 1.0), 2, 0, 0};
    traele(&c90, past, e, nullptr, out);
    EXPECT_EQ(out[3], 2.0);
  }
  // |t1^2 - t4^2 + t2^2 - t3^2| = 1.5625 - 1 against tol4, with T = diag(1.25, 1).
  const double diag[6] = {1.25, 0, 0, 1, 0, 0};
  {
    ToleranceGuard tol4(4, 0.5625);
    traele(&c90, diag, e, nullptr, out);
    EXPECT_EQ(bits(out[3]), bits(0x1.1e3779b97f4a8p+0 * 2.0));  // sqrt(1.25) times 2
  }
  ToleranceGuard tol4(4, std::nextafter(0.5625, 0.0));
  traele(&c90, diag, e, nullptr, out);
  EXPECT_EQ(out[3], 2.0);
}

namespace {

// A shape holding one point (x, y), nested `depth` shapes deep below the outermost.
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

TEST(Tr2sha, TransformsEachEntryAndCopiesCountsAndHeaders) {
  // Four entries: a point; an entry of unhandled type 84; a curve whose count does not fit
  // its length; a circle.
  const std::vector<double> s = {4,  80, 2, 1, 0,          //
                                 84, 3,  5, 6, 7,          //
                                 89, 3,  2, 0, 0,          //
                                 82, 5,  0, 0, 1, 0.5, 1};
  std::vector<double> out(s.size(), kNaN);
  EXPECT_EQ(tr2sha(s.data(), kRot2, out.data()), 0);
  EXPECT_EQ(out[0], 4.0);
  EXPECT_EQ(out[1], 80.0);
  EXPECT_EQ(out[3], 1.0);  // (1, 0) -> (1, 3)
  EXPECT_EQ(out[4], 3.0);
  EXPECT_EQ(out[5], 84.0);
  EXPECT_EQ(out[6], 3.0);
  for (int k = 7; k < 10; ++k) EXPECT_TRUE(std::isnan(out[k])) << k;
  EXPECT_EQ(out[10], 89.0);
  for (int k = 12; k < 15; ++k) EXPECT_TRUE(std::isnan(out[k])) << k;
  EXPECT_EQ(out[15], 82.0);
  EXPECT_EQ(out[19], 2.0);  // radius doubled
}

TEST(Tr2sha, StopsAtTheFirstValueThatIsNotACount) {
  const std::vector<double> s = {3, 80, 2, 1, 0, 80, -2, 1, 0, 80, 2, 1, 0};
  std::vector<double> out(s.size(), kNaN);
  tr2sha(s.data(), kRot2, out.data());
  EXPECT_EQ(out[4], 3.0);
  for (std::size_t k = 5; k < out.size(); ++k) EXPECT_TRUE(std::isnan(out[k])) << k;
  const double bad[3] = {0.5, 80, 2};
  double o[3] = {kNaN, kNaN, kNaN};
  tr2sha(bad, kRot2, o);
  EXPECT_TRUE(std::isnan(o[0]));
}

TEST(Tr2sha, NestsEightLevelsBelowTheOutermost) {
  for (int depth : {8, 9}) {
    const std::vector<double> s = nested_point(depth, 1, 0);
    std::vector<double> out(s.size(), kNaN);
    tr2sha(s.data(), kRot2, out.data());
    if (depth == 8) {
      EXPECT_EQ(out[out.size() - 1], 3.0);
    } else {
      EXPECT_TRUE(std::isnan(out[out.size() - 1]));
    }
  }
}

TEST(Traels, TransformsTheElementsThatFitAndCountsThem) {
  // A point at real 1, a circle at 3, type 84 at 8, a point at 10 that runs past lim = 10,
  // and a position 0.
  const std::int32_t n = 5, lim = 10;
  const std::int32_t hdr[5] = {80, 82, 84, 80, 80};
  const std::int32_t pos[5] = {1, 3, 8, 10, 0};
  double e[10] = {1, 0, 0, 0, 1, 0.5, 1, 5, 6, 7};
  std::vector<double> out(10, kNaN);
  EXPECT_EQ(traels(&n, hdr, kRot2, e, pos, &lim, out.data()), 2);
  EXPECT_EQ(out[0], 1.0);
  EXPECT_EQ(out[1], 3.0);
  EXPECT_EQ(out[4], 2.0);
  for (int k = 7; k < 10; ++k) EXPECT_TRUE(std::isnan(out[k])) << k;
  const std::int32_t none = 0;
  EXPECT_EQ(traels(&none, hdr, kRot2, e, pos, &lim, out.data()), 0);
  // In place, with a shape that fits exactly.
  const std::int32_t one = 1, c102 = 102, at = 1;
  std::vector<double> s = nested_point(2, 1, 0);
  const std::int32_t len = static_cast<std::int32_t>(s.size());
  EXPECT_EQ(traels(&one, &c102, kRot2, s.data(), &at, &len, s.data()), 1);
  EXPECT_EQ(s.back(), 3.0);
  const std::int32_t shorter = len - 1;
  EXPECT_EQ(traels(&one, &c102, kRot2, s.data(), &at, &shorter, s.data()), 1);
  EXPECT_EQ(s.back(), 3.0);  // the outer count fits; the inner entry no longer does
}
