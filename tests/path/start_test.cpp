// tests/path/start_test.cpp -- checks for path/start.cpp: wncini.
#include "curves.h"

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
  // Unit circle from (1, 0) along d0 = (0, 2), then along -d0; K = 4 (order level 1). The
  // computed tangent is (-0, 1): orientation sign 1, then -1; c is the curvature vector
  // (a, b) (2ab F_xy - b^2 F_xx - a^2 F_yy) / (a^2 + b^2)^2 = (-1, -0) at (a, b) = (2, 0).
  // Then x^2 + y^2 = 0 at the origin: residual 0, gradient 0 (ynumde's 4710 is cleared): d0
  // is the tangent, c the scale values 2 / ((box(i,2) - box(i,1)) sqrt(2)) for widths 2 and 4,
  // at order level 1 and 2 (treq 2).
  const double s1 = 2.0 / (2.0 * std::sqrt(2.0)), s2 = 2.0 / (4.0 * std::sqrt(2.0));
  struct Case { double p; int mode; Reals xd, box, c; Ints reqs_sign_treq; };
  const Reals origin = {0, 0, -3, 0.5}, box = {-1, -3, 1, 1};
  const Case cases[] = {{1, 4, {1, 0, 0, 2}, kBox, {-1, -0.0}, {1, 6, 1, 6}},
                        {1, 4, {1, 0, 0, -2}, kBox, {-1, -0.0}, {1, 6, -1, 6}},
                        {0, 4, origin, box, {s1, s2}, {1, 6, 1, 6}},
                        {0, 4 + (1 << 15), origin, box, {s1, s2}, {1, 2, 1, 2}}};
  for (const Case& k : cases) {
    PathRecords r(2, k.mode, 2 + 16);
    Curve c(Curve::kCircle, 2, k.p);
    ASSERT_EQ(start(r, c, 1e-12, k.xd, k.box), 0);
    const Orvq7PathMarch& m = r.march;
    EXPECT_EQ((Ints{r.ierr, c.reqs[0], c.reqs[1], m.sign, m.treq, m.nstored, r.tables.master != 0}),
              (Ints{0, 1, k.reqs_sign_treq[1], k.reqs_sign_treq[2], k.reqs_sign_treq[3], 1, 1}));
    // x0, then d0 itself (not normalised) as tangent and previous tangent, first steps 1e38.
    EXPECT_EQ(bitsv({m.x[0], m.x[1], m.t[0], m.t[1], m.tprev[0], m.tprev[1], m.h, m.hprev, m.f,
                     m.g}),
              bitsv({k.xd[0], k.xd[1], k.xd[2], k.xd[3], k.xd[2], k.xd[3], 1e38, 1e38, 1, 1}));
    EXPECT_EQ(bitsv(m.c, 2), bitsv(k.c));
  }
}

TEST(Wncini, ChecksRunUnknownByUnknownThenTheResidual) {
  struct Case { Reals xd, box; double eps; int ierr, evaluations, n = 2, fail_code = 0; };
  const Reals in = {1, 0, 0, 1};
  // Bounds out of order, equal, outside; unknown 1 on its lower face with d0 pointing out
  // (4721 before unknown 2 is looked at), the upper face, outside before the face; on the
  // upper face y = 1 moving along it: started, residual then tangent (K = 2); off the circle
  // (residual 0.25^2 above eps), eps not a number; the routine's failure passed on unchanged;
  // n = 1 and 21.
  const Case cases[] = {
      {in, {2, -2, -2, 2}, 1e-12, 4712, 0}, {in, {1, -2, 1, 2}, 1e-12, 4712, 0},
      {in, {-2, 0.5, 2, 2}, 1e-12, 4712, 0}, {{-2, 9, -1, 0}, kBox, 1e-12, 4721, 0},
      {{1, 2, 0, 0.5}, kBox, 1e-12, 4721, 0}, {{5, -2, 0, -1}, kBox, 1e-12, 4712, 0},
      {{0, 1, 1, 0}, {-2, -2, 2, 1}, 0.0, 0, 2}, {{1.5, 0, 0, 1}, kBox, 1e-3, 4712, 1},
      {in, kBox, NAN, 4712, 1}, {in, kBox, 1e-12, 4715, 1, 2, 4715},
      {in, kBox, 1e-12, 4712, 0, 1}, {in, kBox, 1e-12, 4718, 0, 21}};
  for (const Case& k : cases) {
    PathRecords r(2, 2, 2);
    Curve c(Curve::kCircle, 2);
    c.fail_code = k.fail_code, r.dim = k.n;
    EXPECT_EQ(start(r, c, k.eps, k.xd, k.box), k.ierr == 0 ? 0 : 1);
    EXPECT_EQ(r.ierr, k.ierr) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(int(c.reqs.size()), k.evaluations) << k.xd[0] << " " << k.box[0];
    EXPECT_EQ(r.itab == 0, k.ierr != 0);
  }
}

