// tests/vector/matrix3_test.cpp -- checks for vector/matrix3.cpp and vector/records.cpp.
#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <vector>

#include "support/real_checks.h"
#include "vector/vector_api.h"

namespace {

// M with rows (-2, -1, -1), (-2, -2, 1), (-2, 1, -3), det 4, and T = (3, -5, 7). Its inverse
// by hand: rows (5/4, -1, -3/4), (-2, 1, 1), (-3/2, 1, 1/2), translation (-7/2, 4, 6).
const double kAffine[12] = {-2, -2, -2, -1, -2, 1, -1, 1, -3, 3, -5, 7};
// A rigid map: e1 -> e2, e2 -> -e3, e3 -> -e1, then T = (2.5, -1.25, 4).
const double kRigid[12] = {0, 1, 0, 0, 0, -1, -1, 0, 0, 2.5, -1.25, 4};
// Identity plus the translation (1, -2, 0.5): every transformed coordinate is exact.
const double kShift[12] = {1, 0, 0, 0, 1, 0, 0, 0, 1, 1, -2, 0.5};
using Point = std::array<double, 3>;
using Apply = decltype(&fmat6);
using Ints = std::vector<std::int32_t>;
template <int F, int P>
struct Record {  // F 16-bit header fields (two bytes of padding), then P reals
  std::int16_t field[F];
  double point[P];
};

Point apply(Apply f, Point p, const double* a) {
  Point r;
  f(&p[0], &p[1], &p[2], a, &r[0], &r[1], &r[2]);
  return r;
}

}  // namespace

TEST(Fmat6, AppliesComposesAndInverts) {
  double inv[12], ab[12], r[12];
  fmat3(kRigid, inv);
  expect_bits(inv, {0, 0, -1, 1, 0, 0, 0, -1, 0, 1.25, 4, 2.5});  // M^T, -(M^T T)
  fmat4(kAffine, kRigid, ab);
  // p = (1.5, -2, 0.25): M p = (-1.25, 1.25, -5.75), columns . p = (0.5, 2.75, -4.25),
  // columns . (p - T) with p - T = (-1.5, 3, -6.75). (0.5, -1.25, 3) goes to (0.25, -0.5,
  // -4.25) under kAffine, then to (6.75, -1, 4.5) under kRigid. A signed permutation and its
  // inverse round each +-(p_k - t_k) once.
  const Point p = {1.5, -2, 0.25}, q = {0.3, -7.1, 2.9}, perm = {-7.1 + 1.25, 4 - 2.9, 2.5 - 0.3};
  const Apply f[7] = {fmat6, fmat61, fmat8, fmat81, fmat6, fmat8, fmat6};
  const double* a[7] = {kAffine, kAffine, kAffine, kAffine, ab, kRigid, inv};
  const Point in[7] = {p, p, p, p, {0.5, -1.25, 3}, q, q};
  const Point want[7] = {{1.75, -3.75, 1.25}, {-1.25, 1.25, -5.75}, {10.5, -11.25, 24.75},
                         {0.5, 2.75, -4.25},  {6.75, -1, 4.5},      perm, perm};
  for (int k = 0; k < 7; ++k) EXPECT_EQ(apply(f[k], in[k], a[k]), want[k]) << k;
  fmat4(kRigid, inv, r);
  expect_bits(r, {1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0});  // M^T T + (-(M^T T)) = +0
  // Row (1, 1, 1), p = (1, e, e), t1 = e, e = 2^-53: left to right, each e is a tie rounded
  // back to 1; any other grouping keeps at least 2^-52. Outputs on the inputs.
  const double e = 0x1p-53, ones[12] = {1, 0, 0, 1, 0, 0, 1, 0, 0, e, 0, 0};
  double x = 1, y = e, z = e;
  fmat6(&x, &y, &z, ones, &x, &y, &z);
  EXPECT_EQ(bits(x), bits(1.0));
  // A p = (2x - y + 0.5, x + 3y - 2), B (u, v) = (4 - v, u + 1):
  // B after A = (-x - 3y + 6, 2x - y + 1.5).
  const double pa[6] = {2, 1, -1, 3, 0.5, -2}, pb[6] = {0, 1, -1, 0, 4, 1};
  r[6] = 99;
  fmat2(pa, pb, r);
  expect_bits(r, {-1, 2, -3, -1, 6, 1.5, 99});
}

TEST(Inmat3, InversesThroughOneReciprocalAndSingularThresholds) {
  double b[13] = {0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 99};
  std::int32_t flag = -1;
  inmat3(kAffine, b, &flag);
  EXPECT_EQ(flag, 0);
  expect_bits(b, {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, -3.5, 4, 6, 99});
  // diag(3, 5, 7): r = 1/105 rounded once; 35 r and 15 r end one bit above 35/105 and
  // 15/105 (...555p-2 and ...492p-3).
  const double d[12] = {3, 0, 0, 0, 5, 0, 0, 0, 7, 0, 0, 0};
  inmat3(d, b, &flag);
  EXPECT_TRUE(bits(b[0]) == bits(0x1.5555555555556p-2) && bits(b[8]) == bits(0x1.2492492492493p-3));
  // det 3: b5 = (a3 a6 - a4 a5) r = -17 r = -0x1.6aaaaaaaaaaaap+2, where -17/3 = ...aabp+2.
  const double a2[6] = {2, 1, 1, 2, 5, -7};
  b[6] = 99;
  inmat2(a2, b, &flag);
  EXPECT_EQ(flag, 0);
  expect_bits(b, {0x1.5555555555555p-1, -0x1.5555555555555p-2, -0x1.5555555555555p-2,
                  0x1.5555555555555p-1, -0x1.6aaaaaaaaaaaap+2, 0x1.9555555555555p+2, 99});
  // Determinant d: inmat3 on diag(d, 1, 1) (first six), inmat2 on (d, 0, 0, 1). Strict on
  // both sides (one ulp below 1e-9 and 1e-6; 8.1e-7 = (9e-4)^2), NaN goes on; on flag 1 the
  // output is untouched, on flag 0 its first real is 1 times the rounded 1/d.
  const double nan = std::nan(""), det[11] = {1e-9, -1e-9, 1e-10, 1e-8, 0x1.12e0be826d694p-30, nan,
                                              1e-6, -1e-6, 0x1.0c6f7a0b5ed8cp-20, 8.1e-7, nan};
  const std::int32_t want[11] = {0, 0, 1, 0, 1, 0, 0, 0, 1, 1, 0};
  for (int k = 0; k < 11; ++k) {
    const double m3[12] = {det[k], 0, 0, 0, 1, 0, 0, 0, 1}, m2[6] = {det[k], 0, 0, 1};
    b[0] = -7.5;
    k < 6 ? inmat3(m3, b, &flag) : inmat2(m2, b, &flag);
    EXPECT_EQ(flag, want[k]) << k;
    EXPECT_EQ(bits(b[0]), bits(want[k] ? -7.5 : 1.0 / det[k])) << k;
  }
  // fmat1: the nine reals of the inverse; a singular call gives back the last regular one.
  const double zero[9] = {};
  for (const double* m : {kAffine, zero}) {
    for (double& v : b) v = -1;
    fmat1(m, b, &flag);
    EXPECT_EQ(flag, m == zero ? 1 : 0);
    expect_bits(b, {1.25, -2, -1.5, -1, 1, 1, -0.75, 1, 0.5, -1});
  }
}

TEST(Fmat23, ProductSummationOrderAndEmptyOrders) {
  // [[1, 2, 3], [4, 5, 6]] [[7, 8], [9, 10], [11, 12]] = [[58, 64], [139, 154]].
  const double a[6] = {1, 4, 2, 5, 3, 6}, b[6] = {7, 9, 11, 8, 10, 12};
  double r[5] = {0, 0, 0, 0, 99};
  const std::int32_t n = 2, m = 3, p = 2, one = 1, five = 5;
  fmat23(&n, &m, &p, a, b, r);
  expect_bits(r, {58, 139, 64, 154, 99});
  const std::int32_t empty[3][3] = {{0, 3, 2}, {2, 0, 2}, {2, 3, 0}};
  for (const auto& d : empty) fmat23(&d[0], &d[1], &d[2], a, b, r + 2);
  expect_bits(r + 2, {64, 154, 99});
  // Five rows (1, 1, 1) times (1, e, e), e = 2^-53: by increasing k both e are ties rounded
  // back to 1 in every row; with (e, e, 1) they add up first and stay.
  const double e = 0x1p-53, c[2][3] = {{1, e, e}, {e, e, 1}}, sum[2] = {1, 1 + 0x1p-52};
  const std::vector<double> ones(15, 1.0);
  for (int k = 0; k < 2; ++k) {
    double col[5];
    fmat23(&five, &m, &one, ones.data(), c[k], col);
    for (double v : col) EXPECT_EQ(bits(v), bits(sum[k])) << k;
  }
}

TEST(Records, GridsAndRecordsMoveOnlyTheirPoints) {
  // nu = 2 points per row, ld = 3, nv = 2 rows: points at reals 1-6 and 10-15. Then a
  // plane grid, no point, no row, ld 0 with two rows: nothing is done.
  double p[18], q[18];
  for (int k = 0; k < 18; ++k) p[k] = k, q[k] = -1;
  const std::int32_t shapes[5][4] = {{3, 2, 3, 2}, {2, 2, 3, 2}, {3, 0, 3, 2}, {3, 2, 3, 0},
                                     {3, 2, 0, 2}};
  for (const auto& s : shapes) trapnt(kShift, &s[0], &s[1], &s[2], &s[3], nullptr, p, q);
  expect_bits(q, {1, -1, 2.5, 4, 2, 5.5, -1, -1, -1, 10, 8, 11.5, 13, 11, 14.5, -1, -1, -1});
  // A curve record: seven 16-bit fields, then the points from byte 16; dimension in field
  // 2, point count in field 5. A surface: eleven fields, points from byte 24, counts in
  // fields 7 and 8. The output header is not written; a plane curve is left alone.
  Record<8, 9> curve{{0, 3, 0, 0, 2}, {0, 1, 2, 3, 4, 5, 6, 7, 8}}, cout{{77}, {}};
  rbctra(kShift, &curve, &cout);
  expect_bits(cout.point, {1, -1, 2.5, 4, 2, 5.5, 0});
  curve.field[1] = 2;
  rbctra(kShift, &curve, &curve);
  EXPECT_TRUE(cout.field[0] == 77 && curve.point[0] == 0.0);
  Record<12, 15> surf{{0, 0, 0, 0, 0, 0, 2, 2}, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12}}, sout{};
  rbstra(kShift, &surf, &sout);
  expect_bits(sout.point + 9, {10, 8, 11.5, 0});
  // Header fields in their order, sign-extended: 1 2 5 7 3 4 6 and 1 2 7 8 11 3 5 9 4 6 10.
  const std::int16_t c[11] = {11, -12, 13, 14, 15, 16, -32768, -108, 109, 110, 111};
  std::int32_t o[11];
  rbclcp(c, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6]);
  EXPECT_EQ(Ints(o, o + 7), (Ints{11, -12, 15, -32768, 13, 14, 16}));
  rbslcp(c, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6], &o[7], &o[8], &o[9], &o[10]);
  EXPECT_EQ(Ints(o, o + 11), (Ints{11, -12, -32768, -108, 111, 13, 15, 109, 14, 16, 110}));
}
