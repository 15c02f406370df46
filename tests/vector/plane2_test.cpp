// tests/vector/plane2_test.cpp -- checks for vector/plane2.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
const double kPi = 3.141592653589793, kTwoPi = 6.283185307179586;
const double kHalfPi = 0x1.921fb54442d18p+0;  // atan2(y > 0, +0), the rounded pi / 2
const double kNaN = std::numeric_limits<double>::quiet_NaN();
// Rotation by 90 degrees scaled by 2, then (1, 1): (x, y) -> (1 - 2y, 1 + 2x), det 4.
const double kRot2[6] = {0, 2, -2, 0, 1, 1};
const double kFlipY[6] = {1, 0, 0, -1, 0, 0};  // (x, y) -> (x, -y), det -1
const double kIdentity[6] = {1, 0, 0, 1, 0, 0};
const double kOntoX[6] = {1, 0, 0, 0, 0, 0};  // projection onto the x axis, det 0

// traele on one element; the output starts as NaN, so untouched reals stay NaN.
std::vector<double> elem(std::int32_t hdr, const double* t, std::vector<double> e) {
  e.resize(12, 0.0);
  std::vector<double> out(12, kNaN);
  traele(&hdr, t, e.data(), nullptr, out.data());
  return out;
}
}  // namespace

TEST(Tr2pt, VectorsPointsAndAngles) {
  const double t[6] = {2, 1, -1, 3, 0.5, -2}, v[2] = {1.5, -2};
  double w[2];
  tr2vec(v, t, w);
  expect_bits(w, {5, -4.5});
  tr2pt(v, t, w);
  expect_bits(w, {5.5, -6.5});
  // (t1 x + t3 y) + t5 with x = 1, y = t5 = 2^-53: two ties that round back to 1.
  const double e = 0x1p-53, u[6] = {1, 0, 1, 0, e, 0};
  expect_bits(elem(80, u, {1, e}).data(), {1, 0, kNaN});
  // Angle 0 under a rotation by -90 degrees: atan2(-1, 0) + 2 pi, never negative; -0 stays.
  const double down[6] = {0, -1, 1, 0, 0, 0}, negzero[6] = {1, -0.0, 0, 1, 0, 0};
  const double zero = 0.0, minus0 = -0.0;
  EXPECT_EQ(bits(tr2ang(&zero, down)), bits(0x1.2d97c7f3321d2p+2));
  EXPECT_EQ(bits(tr2ang(&minus0, negzero)), bits(-0.0));  // atan2(-0, 1) is not below 0
  // Bits 9 and up of the header word are ignored; bit 8 adds a point's angle.
  for (std::int32_t h : {80, 104, 80 | 0x7A00, -256 + 80}) {
    expect_bits(elem(h, kRot2, {3, 4, 0}).data(), {-7, 7, kNaN});
  }
  expect_bits(elem(104 | 0x100, kRot2, {3, 4, 0}).data(), {-7, 7, kHalfPi, kNaN});
  for (std::int32_t h : {79, 84, 91, 103, 105, 0x100}) {
    for (double x : elem(h, kRot2, {3, 4, 0, 1, 1, 1, 1, 1})) EXPECT_TRUE(std::isnan(x)) << h;
  }
}

TEST(Traele, AxesCirclesAndConics) {
  // Axes: normalised directions; a collapsed one leaves its slots; |w| > tol12 strictly.
  expect_bits(elem(83, kRot2, {1, 0, 0, 1, 3, 4}).data(), {0, 1, -1, 0, -7, 7, kNaN});
  expect_bits(elem(83, kOntoX, {0.6, 0.8, 0, 1, 3, 4}).data(), {1, 0, kNaN, kNaN, 3, 0});
  {
    ToleranceGuard tol12(12, 0.5);
    const double half[6] = {std::nextafter(0.5, 1.0), 0, 0, 0.5, 0, 0};
    expect_bits(elem(83, half, {1, 0, 0, 1, 0, 0}).data(), {1, 0, kNaN, kNaN, 0, 0});
  }
  // Circles: a reflection starts at the image of the old end (0.5..2 goes to -2..-0.5).
  std::vector<double> o = elem(82, kFlipY, {1, 2, 3, 0.5, 2.0});
  expect_bits(o.data(), {1, -2, 3, o[3], o[4], kNaN});
  EXPECT_NEAR(o[3], kTwoPi - 2.0, 1e-15);
  EXPECT_NEAR(o[4], kTwoPi - 0.5, 1e-15);
  o = elem(82, kRot2, {1, 2, 3, 0.5, 2.0});
  expect_bits(o.data(), {-3, 3, 6});
  EXPECT_NEAR(o[3], 0.5 + kPi / 2, 1e-15);
  o = elem(82, kFlipY, {0, 0, 1, 1.0, 1.0});
  EXPECT_NEAR(o[4] - o[3], kTwoPi, 1e-15);
  // Start 0 under the identity gives start' = +0, so end' - start' is the sweep: a sweep of
  // tol5 stays, one ulp less becomes a full circle.
  {
    ToleranceGuard tol5(5, 0x1p-10);
    const double below = 0x1.fffffffffffffp-11;
    EXPECT_EQ(bits(elem(82, kIdentity, {0, 0, 1, 0, 0x1p-10})[4]), bits(0x1p-10));
    EXPECT_EQ(bits(elem(82, kIdentity, {0, 0, 1, 0, below})[4]), bits(below + kTwoPi));
  }
  // Conics under a reflection: |e| = 1 - tol4 is closed (angular parameters), one ulp
  // beyond is open (negated); a start' of 0 moves by 2 pi; det > 0 copies the parameters.
  ToleranceGuard tol4(4, 0x1p-10);
  const std::vector<double> closed = {1 - 0x1p-10, 1, 2, 3, 0, 1, 2};
  expect_bits(elem(86, kFlipY, closed).data(),
              {1 - 0x1p-10, 1, -2, 3, 0, 0x1.121fb54442d18p+2, 0x1.521fb54442d18p+2, kNaN});
  expect_bits(elem(87, kFlipY, {-0x1.ff80000000001p-1, 1, 2, 3, 0, -1, 3}).data() + 5, {-3, 1});
  expect_bits(elem(88, kFlipY, {0.5, 0, 0, 1, 0, 1, kTwoPi}).data() + 5,
              {kTwoPi, 0x1.721fb54442d18p+3});
  expect_bits(elem(86, kRot2, closed).data() + 3, {6, kHalfPi, 1, 2});
}

TEST(Tr2ln, PartsAskedForAndTolerances) {
  // Q = (1, 0), D = (1, 0), ends at t = -1 and 2.5, i.e. (0, 0) and (3.5, 0), which go to
  // (1, 1) and (1, 8): Q' = (1, 3), D' = (0, 1), parameters doubled. Under kOntoX the
  // direction (0, 1) collapses: only the point is written.
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
  expect_bits(elem(81, kOntoX, {2, 5, 0, 1, 0, 1}).data(), {2, 0, kNaN});
  // |s - 1| < tol5 keeps the parameters exactly, = tol5 scales them (s2 = 1 + tol5); scaled
  // to tol2 = 2^-19 stays, one ulp less snaps to 0; a length of tol3 stays, shorter
  // collapses.
  ToleranceGuard tol5(5, 0x1p-10), tol2(2, 0x1p-19), tol3(3, 0x1p-30);
  const double s1 = 1 + 0x1p-11, s2 = 1 + 0x1p-10;
  const double near1[6] = {s1, 0, 0, s1}, far1[6] = {s2, 0, 0, s2}, twice[6] = {2, 0, 0, 2};
  const struct {
    const double* t;
    double p0, p1, w0, w1;
  } cases[] = {{near1, 3, 5, 3, 5},
               {far1, 3, 5, 3 * s2, 5 * s2},
               {twice, 0x1p-20, -0x1.fffffffffffffp-21, 0x1p-19, 0},
               {kIdentity, 1, 1 + 0x1p-30, 1, 1 + 0x1p-30},
               {kIdentity, 1, 1 + 0x1p-31, 1, 1}};
  for (const auto& k : cases) {
    expect_bits(elem(81, k.t, {0, 0, 1, 0, k.p0, k.p1}).data() + 4, {k.w0, k.w1, kNaN});
  }
}

TEST(Traele, CurvesAndCentreAngleSizeElements) {
  expect_bits(elem(89, kRot2, {2, 1, 0, 0, 1}).data(), {2, 1, 3, -1, 1, kNaN});
  for (double bad : {-1.0, 1.5, kNaN, 3e9}) {  // a count that is not a whole number
    const double b[5] = {bad, 1, 0, 0, 1};
    double o[1] = {9};
    tr2crv(b, kRot2, o);
    EXPECT_EQ(o[0], 9.0) << bad;
  }
  // A similarity (det 4) doubles sizes; a stretch keeps them; det < 0 gives the angle
  // tr2ang(pi) - angle and a negated size. Type 92 copies its seventh real, 85 also its
  // eighth.
  const std::vector<double> e = {3, 4, 0, 1.5, 11, 12, 13, 14}, g = {3, 4, 0, 1.5, 0, -2, 77, 88};
  const double stretch[6] = {2, 0, 0, 1, 0, 0};
  expect_bits(elem(90, kRot2, e).data(), {-7, 7, kHalfPi, 3, 11, 12, 13, 14, kNaN});
  expect_bits(elem(95, stretch, e).data(), {6, 4, 0, 1.5, 11, 12, 13, 14, kNaN});
  std::vector<double> o = elem(90, kFlipY, {3, 4, 0.25, 1.5});
  EXPECT_NEAR(o[2], kPi - 0.25, 1e-15);
  expect_bits(o.data() + 3, {-1.5});
  expect_bits(elem(92, kRot2, g).data(), {-7, 7, kHalfPi, 3, kHalfPi, -4, 77, kNaN});
  expect_bits(elem(85, kRot2, g).data(), {-7, 7, kHalfPi, 3, kHalfPi, -4, 77, 88, kNaN});
  // Both similarity tests are inclusive. |t4 t2 + t1 t3| = 2 c against tol5 = 2^-10 with
  // T = (2, 0, c, 2): det 4, size doubled; |t1^2 - t4^2 + t2^2 - t3^2| = 0.5625 against tol4
  // with T = diag(1.25, 1): size 2 sqrt(1.25), or kept with tol4 one ulp less.
  const double at[6] = {2, 0, 0x1p-11, 2}, past[6] = {2, 0, 0x1.0000000000001p-11, 2};
  const double diag[6] = {1.25, 0, 0, 1};
  const struct {
    const double* t;
    double tol4, size;
  } cases[] = {{at, 1.0, 4},
               {past, 1.0, 2},
               {diag, 0.5625, 0x1.1e3779b97f4a8p+0 * 2.0},
               {diag, 0x1.1ffffffffffffp-1, 2}};
  ToleranceGuard tol5(5, 0x1p-10);
  for (const auto& k : cases) {
    ToleranceGuard tol4(4, k.tol4);
    EXPECT_EQ(bits(elem(90, k.t, {0, 0, 0, 2})[3]), bits(k.size)) << k.tol4;
  }
}

TEST(Tr2sha, TransformsEntriesThatFitAndStopsAtBadCounts) {
  // A point; type 84 (unhandled); a curve of 2 points in 3 reals (does not fit); a circle;
  // then a negative length that ends the walk.
  const std::vector<double> s = {5,  80, 2, 1, 0, 84, 3, 5, 6, 7, 89, 3, 2, 0,
                                 0,  82, 5, 0, 0, 1,  0.5, 1, 80, -2, 1, 0};
  std::vector<double> out(s.size(), kNaN);
  tr2sha(s.data(), kRot2, out.data());
  expect_bits(out.data(), {5, 80, 2, 1, 3, 84, 3, kNaN, kNaN, kNaN, 89, 3, kNaN, kNaN, kNaN,
                           82, 5, 1, 1, 2, out[20], out[21], kNaN, kNaN, kNaN, kNaN});
  // traels: a point at real 1, a circle at 3, type 84 at 8, a point at 10 past lim = 10, a
  // position 0.
  const std::int32_t n = 5, lim = 10, hdr[5] = {80, 82, 84, 80, 80}, pos[5] = {1, 3, 8, 10, 0};
  const double e[10] = {1, 0, 0, 0, 1, 0.5, 1, 5, 6, 7};
  out.assign(10, kNaN);
  EXPECT_EQ(traels(&n, hdr, kRot2, e, pos, &lim, out.data()), 2);
  expect_bits(out.data(), {1, 3, 1, 1, 2, out[5], out[6], kNaN, kNaN, kNaN});
  // A point nested in shapes: transformed eight levels below the outermost, not nine. With
  // two levels, in place through traels: it fits exactly; one real less and it does not.
  std::vector<double> p = {1, 80, 2, 1, 0};
  for (int depth = 1; depth <= 9; ++depth) {
    p.insert(p.begin(), {1, 102, static_cast<double>(p.size())});
    std::vector<double> o(p.size(), kNaN);
    tr2sha(p.data(), kRot2, o.data());
    EXPECT_EQ(bits(o.back()), bits(depth <= 8 ? 3.0 : kNaN)) << depth;
    if (depth != 2) continue;
    const std::int32_t one = 1, c102 = 102, at = 1, len = static_cast<std::int32_t>(p.size());
    for (std::int32_t l : {len, len - 1}) {
      std::vector<double> q = p;
      EXPECT_EQ(traels(&one, &c102, kRot2, q.data(), &at, &l, q.data()), 1);
      EXPECT_EQ(q.back(), l == len ? 3.0 : 0.0) << l;
    }
  }
}
