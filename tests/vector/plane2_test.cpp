// tests/vector/plane2_test.cpp -- checks for vector/plane2.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {
const double kPi = 3.141592653589793, kTwoPi = 6.283185307179586;
const double kHalfPi = 0x1.921fb54442d18p+0;  // atan2(y > 0, +0), the rounded pi / 2
const double kNaN = std::nan("");
// Rotation by 90 degrees scaled by 2, then (1, 1): (x, y) -> (1 - 2y, 1 + 2x), det 4.
const double kRot2[6] = {0, 2, -2, 0, 1, 1};
const double kFlipY[6] = {1, 0, 0, -1, 0, 0};  // (x, y) -> (x, -y), det -1
const double kIdentity[6] = {1, 0, 0, 1, 0, 0};
const double kOntoX[6] = {1, 0, 0, 0, 0, 0};  // projection onto the x axis, det 0
}  // namespace

TEST(Traele, EachTypeByHandAtItsTolerances) {
  ToleranceGuard g2(2, 0x1p-19), g3(3, 0x1p-30), g4(4, 0.5625), g5(5, 0x1p-10), g12(12, 0.5);
  const double e = 0x1p-53, below = 0x1.fffffffffffffp-11, s1 = 1 + 0x1p-11, s2 = 1 + 0x1p-10;
  const double tie[6] = {1, 0, 1, 0, e, 0}, half[6] = {std::nextafter(0.5, 1.0), 0, 0, 0.5};
  const double near1[6] = {s1, 0, 0, s1}, far1[6] = {s2, 0, 0, s2}, twice[6] = {2, 0, 0, 2};
  const double stretch[6] = {2, 0, 0, 1}, at5[6] = {2, 0, 0x1p-11, 2}, diag[6] = {1.25, 0, 0, 1};
  const double past5[6] = {2, 0, 0x1.0000000000001p-11, 2}, past4[6] = {1.25, 0, 0, 1 - e};
  const std::vector<double> g = {3, 4, 0, 1.5, 0, -2, 77, 88}, z2 = {0, 0, 0, 2};  // size 2
  const double beyond = -0x1.c000000000001p-2;  // one ulp beyond 1 - 0.5625, negated
  // {header word, T, element, reals written (the rest stays NaN)}.
  const struct {
    std::int32_t hdr;
    const double* t;
    std::vector<double> in, want;
  } cases[] = {
      // Points: (t1 x + t3 y) + t5 with x = 1, y = t5 = 2^-53 is two ties back to 1. Bits 9
      // and up of the header word are ignored; bit 8 adds a point's angle.
      {80, tie, {1, e}, {1, 0}}, {80, kRot2, {3, 4, 0}, {-7, 7}},
      {80 | 0x7A00, kRot2, {3, 4, 0}, {-7, 7}}, {-256 + 80, kRot2, {3, 4, 0}, {-7, 7}},
      {104, kRot2, {3, 4, 0}, {-7, 7}}, {104 | 0x100, kRot2, {3, 4, 0}, {-7, 7, kHalfPi}},
      // Lines: Q = (1, 0), D = (1, 0), ends at t = -1 and 2.5 go to Q' = (1, 3), D' = (0, 1),
      // parameters doubled. A collapsed direction: only the point. |s - 1| < tol5 keeps the
      // parameters exactly, = tol5 scales them; scaled to tol2 stays, one ulp less snaps to
      // 0; a length of tol3 stays, shorter collapses.
      {81, kRot2, {1, 0, 1, 0, -1, 2.5}, {1, 3, 0, 1, -2, 5}},
      {81, kOntoX, {2, 5, 0, 1, 0, 1}, {2, 0}},
      {81, near1, {0, 0, 1, 0, 3, 5}, {0, 0, 1, 0, 3, 5}},
      {81, far1, {0, 0, 1, 0, 3, 5}, {0, 0, 1, 0, 3 * s2, 5 * s2}},
      {81, twice, {0, 0, 1, 0, 0x1p-20, -0x1.fffffffffffffp-21}, {0, 0, 1, 0, 0x1p-19, 0}},
      {81, kIdentity, {0, 0, 1, 0, 1, 1 + 0x1p-30}, {0, 0, 1, 0, 1, 1 + 0x1p-30}},
      {81, kIdentity, {0, 0, 1, 0, 1, 1 + 0x1p-31}, {0, 0, 1, 0, 1, 1}},
      // Circles: a reflection starts at the image of the old end. A sweep of tol5 stays,
      // one ulp less becomes a full circle.
      {82, kRot2, {1, 2, 3, 0, 1.5}, {-3, 3, 6, kHalfPi, kHalfPi + 1.5}},
      {82, kFlipY, {1, 2, 3, -1.5, 0}, {1, -2, 3, 0, 1.5}},
      {82, kIdentity, {0, 0, 1, 0, 0x1p-10}, {0, 0, 1, 0, 0x1p-10}},
      {82, kIdentity, {0, 0, 1, 0, below}, {0, 0, 1, 0, below + kTwoPi}},
      // Axes: normalised directions; a collapsed one (|w| > tol12 strictly) keeps its slots.
      {83, kRot2, {1, 0, 0, 1, 3, 4}, {0, 1, -1, 0, -7, 7}},
      {83, kOntoX, {0.6, 0.8, 0, 1, 3, 4}, {1, 0, kNaN, kNaN, 3, 0}},
      {83, half, {1, 0, 0, 1, 0, 0}, {1, 0, kNaN, kNaN, 0, 0}},
      // Conics under a reflection: |e| = 1 - tol4 is closed (angular parameters), one ulp
      // beyond is open (negated); a start' of 0 moves by 2 pi; det > 0 copies them.
      {86, kFlipY, {0.4375, 1, 2, 3, 0, 1, 2},
       {0.4375, 1, -2, 3, 0, 0x1.121fb54442d18p+2, 0x1.521fb54442d18p+2}},
      {87, kFlipY, {beyond, 1, 2, 3, 0, -1, 3}, {beyond, 1, -2, 3, 0, -3, 1}},
      {88, kFlipY, {0.25, 0, 0, 1, 0, 1, kTwoPi}, {0.25, 0, 0, 1, 0, kTwoPi, 0x1.721fb54442d18p+3}},
      {86, kRot2, {0.4375, 1, 2, 3, 0, 1, 2}, {0.4375, -3, 3, 6, kHalfPi, 1, 2}},
      {89, kRot2, {2, 1, 0, 0, 1}, {2, 1, 3, -1, 1}},
      // Centre, (angle, size) pairs: a similarity (det 4) doubles sizes, a stretch keeps
      // them; 92 copies its seventh real, 85 also its eighth. Both similarity tests are
      // inclusive: |t4 t2 + t1 t3| = 2^-10 = tol5, |t1^2 - t4^2 + t2^2 - t3^2| = 0.5625 =
      // tol4 for diag(1.25, 1) (size 2 sqrt(1.25)), then one ulp and two ulps beyond.
      {90, kRot2, {3, 4, 0, 1.5, 11, 12, 13, 14}, {-7, 7, kHalfPi, 3, 11, 12, 13, 14}},
      {95, stretch, {3, 4, 0, 1.5, 11, 12, 13, 14}, {6, 4, 0, 1.5, 11, 12, 13, 14}},
      {92, kRot2, g, {-7, 7, kHalfPi, 3, kHalfPi, -4, 77}},
      {85, kRot2, g, {-7, 7, kHalfPi, 3, kHalfPi, -4, 77, 88}},
      {90, at5, z2, {0, 0, 0, 4, 0, 0, 0, 0}}, {90, past5, z2, {0, 0, 0, 2, 0, 0, 0, 0}},
      {90, diag, z2, {0, 0, 0, 0x1.1e3779b97f4a8p+1, 0, 0, 0, 0}},
      {90, past4, z2, {0, 0, 0, 2, 0, 0, 0, 0}},
      // Types with nothing to do.
      {79, kRot2, g, {}}, {84, kRot2, g, {}}, {91, kRot2, g, {}}, {103, kRot2, g, {}},
      {105, kRot2, g, {}}, {0x100, kRot2, g, {}}};
  for (const auto& k : cases) {
    std::vector<double> in = k.in, want = k.want, out(12, kNaN);
    in.resize(12, 0.0);
    want.resize(12, kNaN);
    traele(&k.hdr, k.t, in.data(), nullptr, out.data());
    for (int i = 0; i < 12; ++i) EXPECT_EQ(bits(out[i]), bits(want[i])) << k.hdr << ": " << i;
  }
}

TEST(Tr2pt, DirectCallsAndAnglesNotExactlyRounded) {
  // Angle 0 under a rotation by -90 degrees: atan2(-1, 0) + 2 pi, never negative; -0 stays.
  const double down[6] = {0, -1, 1, 0, 0, 0}, nz[6] = {1, -0.0, 0, 1, 0, 0}, a0[2] = {0.0, -0.0};
  EXPECT_EQ(bits(tr2ang(&a0[0], down)), bits(0x1.2d97c7f3321d2p+2));
  EXPECT_EQ(bits(tr2ang(&a0[1], nz)), bits(-0.0));  // atan2(-0, 1) is not below 0
  // Only the parts asked for are written, and the flag says which were.
  const double l[6] = {1, 0, 1, 0, -1, 2.5};
  double out[8] = {9, 9, 9, 9, 9, 9};
  for (std::int32_t ask : {1, 252}) {  // the point; then the parameters alone (bits 4 and up
    std::int32_t flag = ask;            // are not parts)
    tr2ln(l, kRot2, out, &flag);
    EXPECT_EQ(flag, ask == 1 ? 1 : 4);
    expect_bits(out, {1, 3, 9, 9, ask == 1 ? 9.0 : -2.0, ask == 1 ? 9.0 : 5.0});
  }
  for (double bad : {-1.0, 1.5, kNaN, 3e9}) {  // a count that is not a whole number
    const double b[5] = {bad, 1, 0, 0, 1};
    tr2crv(b, kRot2, out);
    EXPECT_EQ(out[0], 1.0) << bad;
  }
  // det < 0: angles become tr2ang(pi) - angle, sizes are negated.
  const std::int32_t c90 = 90;
  const double f[8] = {3, 4, 0.25, 1.5};
  traele(&c90, kFlipY, f, nullptr, out);
  expect_bits(out, {3, -4, out[2], -1.5});
  EXPECT_NEAR(out[2], kPi - 0.25, 1e-15);
}

TEST(Tr2sha, TransformsEntriesThatFitAndStopsAtBadCounts) {
  // A point; type 84 (unhandled); a curve of 2 points in 3 reals (does not fit); a circle;
  // then a negative length that ends the walk.
  const std::vector<double> s = {5,  80, 2, 1, 0, 84, 3, 5, 6, 7, 89, 3, 2, 0,
                                 0,  82, 5, 0, 0, 1,  0, 1, 80, -2, 1, 0};
  std::vector<double> out(s.size(), kNaN);
  tr2sha(s.data(), kRot2, out.data());
  expect_bits(out.data(), {5, 80, 2, 1, 3, 84, 3, kNaN, kNaN, kNaN, 89, 3, kNaN, kNaN, kNaN,
                           82, 5, 1, 1, 2, kHalfPi, kHalfPi + 1, kNaN, kNaN, kNaN, kNaN});
  // traels: a point at real 1, a circle at 3, type 84 at 8, a point at 10 past lim = 10, a
  // position 0.
  const std::int32_t n = 5, lim = 10, hdr[5] = {80, 82, 84, 80, 80}, pos[5] = {1, 3, 8, 10, 0};
  const double e[10] = {1, 0, 0, 0, 1, 0, 1, 5, 6, 7};
  out.assign(10, kNaN);
  EXPECT_EQ(traels(&n, hdr, kRot2, e, pos, &lim, out.data()), 2);
  expect_bits(out.data(), {1, 3, 1, 1, 2, kHalfPi, kHalfPi + 1, kNaN, kNaN, kNaN});
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
