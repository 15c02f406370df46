// tests/path/start_test.cpp -- checks for path/start.cpp: wncini.
#include "curves.h"

namespace {

// Starts the path of r on c, then releases what wncini stored: nothing may be left.
std::int32_t start(PathRecords& r, Curve& c, double eps, const Reals& xd, const Reals& box) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t result = wncini(&c, &r.dim, eval_curve, &eps, xd.data(), box.data(),
                                     &r.options, &r.layout, r.pairs, &r.march, &r.tables, &r.itab,
                                     &r.ierr);
  std::int32_t ierr = -1;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  return result;
}

const Reals kBox = {-2.0, -2.0, 2.0, 2.0};

TEST(Wncini, StartsAlongTheGivenDirectionAndStoresTheFirstPoint) {
  // Unit circle from (1, 0) along d0 = (0, 2), and along -d0; K = 4 (order level 1); kinds 23
  // and group 1. The computed tangent is (-0, 1): orientation sign 1, then -1.
  for (double dir : {2.0, -2.0}) {
    PathRecords r(2, 4, 2 + 16);
    Curve c(Curve::kCircle, 2);
    ASSERT_EQ(start(r, c, 1e-12, {1.0, 0.0, 0.0, dir}, kBox), 0);
    EXPECT_NE(r.tables.master, 0);  // the first point is stored
    EXPECT_EQ(r.ierr, 0);
    EXPECT_EQ(c.reqs, (Ints{1, 6}));  // residuals, then ynumde's req 6
    // x0, then d0 itself (not normalised) as tangent and previous tangent, first steps 1e38.
    const Orvq7PathMarch& m = r.march;
    EXPECT_EQ(bitsv({m.x[0], m.x[1], m.t[0], m.t[1], m.tprev[0], m.tprev[1], m.h, m.hprev, m.f,
                     m.g}),
              bitsv({1, 0, 0, dir, 0, dir, 1e38, 1e38, 1, 1}));
    EXPECT_DOUBLE_EQ(m.c[0], -1.0);  // towards the centre, curvature 1
    EXPECT_EQ(m.c[1], 0.0);
    EXPECT_EQ((Ints{m.sign, m.nstored, m.treq}), (Ints{dir > 0 ? 1 : -1, 1, 6}));
  }
}

TEST(Wncini, ChecksRunUnknownByUnknownThenTheResidual) {
  struct Case {
    Reals xd, box;
    double eps;
    std::int32_t ierr;
    std::size_t evaluations;
    std::int32_t n = 2, fail_code = 0;
  };
  const Reals in = {1, 0, 0, 1};
  const Case cases[] = {
      {in, {2, -2, -2, 2}, 1e-12, 4712, 0},   // bounds out of order
      {in, {1, -2, 1, 2}, 1e-12, 4712, 0},    // equal bounds
      {in, {-2, 0.5, 2, 2}, 1e-12, 4712, 0},  // outside
      // Unknown 1 on its lower face, d0 pointing out: 4721 before unknown 2 is looked at.
      {{-2, 9, -1, 0}, kBox, 1e-12, 4721, 0},
      {{1, 2, 0, 0.5}, kBox, 1e-12, 4721, 0},  // upper face
      {{5, -2, 0, -1}, kBox, 1e-12, 4712, 0},  // outside before the face
      // On the upper face y = 1, moving along it: started, residual then tangent (K = 2).
      {{0, 1, 1, 0}, {-2, -2, 2, 1}, 0.0, 0, 2},
      {{1.5, 0, 0, 1}, kBox, 1e-3, 4712, 1},  // off the circle: residual 0.25^2 above eps
      {in, kBox, NAN, 4712, 1},
      {in, kBox, 1e-12, 4715, 1, 2, 4715},  // the routine's failure is passed on unchanged
      {in, kBox, 1e-12, 4712, 0, 1},
      {in, kBox, 1e-12, 4718, 0, 21}};
  for (const Case& k : cases) {
    PathRecords r(2, 2, 2);
    Curve c(Curve::kCircle, 2);
    c.fail_code = k.fail_code, r.dim = k.n;
    EXPECT_EQ(start(r, c, k.eps, k.xd, k.box), k.ierr == 0 ? 0 : 1);
    EXPECT_EQ(r.ierr, k.ierr) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(c.reqs.size(), k.evaluations) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(r.itab == 0, k.ierr != 0);
  }
}

TEST(Wncini, NoTangentAtTheStartTakesD0AndTheScaleValues) {
  // x^2 + y^2 = 0 at the origin: residual 0, gradient 0 (ynumde's 4710 is cleared).
  // Scale values 2 / ((box(i,2) - box(i,1)) sqrt(2)) for widths 2 and 4.
  Curve c(Curve::kCircle, 2, 0.0);
  const double s1 = 2.0 / (2.0 * std::sqrt(2.0)), s2 = 2.0 / (4.0 * std::sqrt(2.0));
  for (std::int32_t mode : {4, 4 + (1 << 15)}) {  // order level 1, then 2
    PathRecords r(2, mode, 2);
    ASSERT_EQ(start(r, c, 0.0, {0.0, 0.0, -3.0, 0.5}, {-1.0, -3.0, 1.0, 1.0}), 0) << mode;
    EXPECT_EQ((Ints{r.ierr, r.march.sign, r.march.treq}), (Ints{0, 1, mode == 4 ? 6 : 2}));
    EXPECT_EQ(bitsv({r.march.t[0], r.march.c[0], r.march.c[1]}), bitsv({-3.0, s1, s2}));
  }
}

}  // namespace
