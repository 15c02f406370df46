// tests/path/start_test.cpp -- checks for path/start.cpp: wncini.
#include <functional>

#include "curves.h"

namespace {

// Starts the path of r on c; what wncini stored is looked at by `inspect`, then released:
// nothing may be left.
std::int32_t start(PathRecords& r, Curve& c, double eps, const std::vector<double>& xd,
                   const double* box, const std::function<void()>& inspect = [] {}) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t result = wncini(&c, &r.dim, eval_curve, &eps, xd.data(), box, &r.options,
                                     &r.layout, r.pairs, &r.march, &r.tables, &r.itab, &r.ierr);
  inspect();
  std::int32_t ierr = -1;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  return result;
}

const double kBox[4] = {-2.0, -2.0, 2.0, 2.0};

TEST(Wncini, StartsAlongTheGivenDirectionAndStoresTheFirstPoint) {
  // Unit circle from (1, 0) along d0 = (0, 2), and along -d0; K = 4 (order level 1); kinds 23
  // and group 1. The computed tangent is (-0, 1): orientation sign 1, then -1.
  for (double dir : {2.0, -2.0}) {
    PathRecords r(2, 4, 2 + 16);
    Curve c(Curve::kCircle, 2);
    const std::int64_t live0 = orvq7sys_table_live();
    std::int32_t count = -1;
    ASSERT_EQ(start(r, c, 1e-12, {1.0, 0.0, 0.0, dir}, kBox, [&] {
      // The result holds the first point: kind 23 = (x, t), group 1 = (phase 0, number 1, x).
      EXPECT_EQ(orvq7sys_table_live(), live0 + 5);  // master, kind 23, three group members
      EXPECT_EQ(r.tables.master, r.itab);
      EXPECT_EQ(read_kind<double>(r.itab, 23, &count), (std::vector<double>{1, 0, 0, dir}));
      EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1), std::vector<std::int32_t>{0});
      EXPECT_EQ(read_kind<std::int32_t>(r.itab, 2), std::vector<std::int32_t>{1});
    }), 0);
    EXPECT_EQ(count, 0);  // recorded only when the path ends
    EXPECT_EQ(r.ierr, 0);
    EXPECT_EQ(c.reqs, (std::vector<std::int32_t>{1, 6}));  // residuals, then ynumde's req 6
    const Orvq7PathMarch& m = r.march;
    EXPECT_EQ(m.sign, dir > 0 ? 1 : -1);
    EXPECT_EQ(bitsv(m.x, 2), bitsv({1.0, 0.0}));
    EXPECT_EQ(bitsv(m.t, 2), bitsv({0.0, dir}));  // d0 itself, not normalised
    EXPECT_EQ(bitsv(m.tprev, 2), bitsv({0.0, dir}));
    EXPECT_DOUBLE_EQ(m.c[0], -1.0);  // towards the centre, curvature 1
    EXPECT_EQ(m.c[1], 0.0);
    EXPECT_EQ(bitsv({m.h, m.hprev, m.f, m.g}), bitsv({1e38, 1e38, 1.0, 1.0}));
    EXPECT_EQ(m.nstored, 1);
    EXPECT_EQ(m.treq, 6);
  }
}

TEST(Wncini, ChecksRunUnknownByUnknownThenTheResidual) {
  struct Case {
    std::vector<double> xd, box;
    double eps;
    std::int32_t ierr;
    std::size_t evaluations;
    std::int32_t n = 2, fail_code = 0;
  };
  const std::vector<double> in = {1, 0, 0, 1}, box = {-2, -2, 2, 2};
  const Case cases[] = {
      {in, {2, -2, -2, 2}, 1e-12, 4712, 0},   // bounds out of order
      {in, {1, -2, 1, 2}, 1e-12, 4712, 0},    // equal bounds
      {in, {-2, 0.5, 2, 2}, 1e-12, 4712, 0},  // outside
      // Unknown 1 on its lower face, d0 pointing out: 4721 before unknown 2 is looked at.
      {{-2, 9, -1, 0}, box, 1e-12, 4721, 0},
      {{1, 2, 0, 0.5}, box, 1e-12, 4721, 0},  // upper face
      {{5, -2, 0, -1}, box, 1e-12, 4712, 0},  // outside before the face
      {{1.5, 0, 0, 1}, box, 1e-3, 4712, 1},   // off the circle: residual 0.25^2 above eps
      {in, box, NAN, 4712, 1},
      {in, box, 1e-12, 4715, 1, 2, 4715},  // the routine's failure is passed on unchanged
      {in, box, 1e-12, 4712, 0, 1},
      {in, box, 1e-12, 4718, 0, 21}};
  for (const Case& k : cases) {
    PathRecords r(2, 4, 2);
    Curve c(Curve::kCircle, 2);
    c.fail_code = k.fail_code;
    r.dim = k.n;
    EXPECT_EQ(start(r, c, k.eps, k.xd, k.box.data()), 1);
    EXPECT_EQ(r.ierr, k.ierr) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(c.reqs.size(), k.evaluations) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(r.itab, 0);
  }
}

TEST(Wncini, PointOnAFaceMovingAlongItStarts) {
  PathRecords r(2, 2, 2);  // K = 2: order level 0, c = 0
  Curve c(Curve::kCircle, 2);
  const double box[4] = {-2.0, -2.0, 2.0, 1.0};  // on the upper face y = 1, moving along it
  ASSERT_EQ(start(r, c, 0.0, {0.0, 1.0, 1.0, 0.0}, box), 0);
  EXPECT_EQ(c.reqs, (std::vector<std::int32_t>{1, 2}));
  EXPECT_EQ(bits(r.march.c[0]), bits(0.0));
}

TEST(Wncini, NoTangentAtTheStartTakesD0AndTheScaleValues) {
  // x^2 + y^2 = 0 at the origin: residual 0, gradient 0 (ynumde's 4710 is cleared).
  // Scale values 2 / ((box(i,2) - box(i,1)) sqrt(2)) for widths 2 and 4.
  Curve c(Curve::kCircle, 2, 0.0);
  const double box[4] = {-1.0, -3.0, 1.0, 1.0};
  const double s1 = 2.0 / (2.0 * std::sqrt(2.0)), s2 = 2.0 / (4.0 * std::sqrt(2.0));
  for (std::int32_t mode : {4, 4 + (1 << 15)}) {  // order level 1, then 2
    PathRecords r(2, mode, 2);
    ASSERT_EQ(start(r, c, 0.0, {0.0, 0.0, -3.0, 0.5}, box), 0) << mode;
    EXPECT_EQ(r.ierr, 0);
    EXPECT_EQ(r.march.sign, 1);
    EXPECT_EQ(bits(r.march.t[0]), bits(-3.0));
    EXPECT_EQ(bitsv(r.march.c, 2), bitsv({s1, s2}));
    EXPECT_EQ(r.march.treq, mode == 4 ? 6 : 2);
  }
}

}  // namespace
