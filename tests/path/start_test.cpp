// tests/path/start_test.cpp -- checks for path/start.cpp: wncini.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "curves.h"

namespace {

// Starts the path of r on c, then releases what it stored (the table count back to where
// it was).
std::int32_t start(PathRecords& r, Curve& c, double eps, const double* xd, const double* box) {
  const std::int64_t live0 = orvq7sys_table_live();
  const std::int32_t result = wncini(&c, &r.dim, eval_curve, &eps, xd, box, &r.options,
                                     &r.layout, r.pairs, &r.march, &r.tables, &r.itab, &r.ierr);
  std::int32_t ierr = -1;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  return result;
}

const double kBox[4] = {-2.0, -2.0, 2.0, 2.0};

TEST(Wncini, StartsAlongTheGivenDirectionAndStoresTheFirstPoint) {
  // Unit circle from (1, 0) along d0 = (0, 2); K = 4 (order level 1); kinds 23 and group 1.
  PathRecords r(2, 4, 2 + 16);
  ASSERT_EQ(r.result, 0);
  Curve c(Curve::kCircle, 2);
  const double xd[4] = {1.0, 0.0, 0.0, 2.0}, eps = 1e-12;
  const std::int64_t live0 = orvq7sys_table_live();
  ASSERT_EQ(wncini(&c, &r.dim, eval_curve, &eps, xd, kBox, &r.options, &r.layout, r.pairs,
                   &r.march, &r.tables, &r.itab, &r.ierr),
            0);
  EXPECT_EQ(r.ierr, 0);
  EXPECT_EQ(c.reqs, (std::vector<std::int32_t>{1, 6}));  // residuals, then ynumde's req 6
  const Orvq7PathMarch& m = r.march;
  EXPECT_EQ(m.sign, 1);  // computed tangent (-0, 1) along d0
  const double want_x[2] = {1.0, 0.0}, want_t[2] = {0.0, 2.0}, want_c[2] = {-1.0, 0.0};
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(bits(m.x[i]), bits(want_x[i]));
    EXPECT_EQ(bits(m.t[i]), bits(want_t[i]));  // d0 itself, not normalised
    EXPECT_EQ(bits(m.tprev[i]), bits(want_t[i]));
    EXPECT_DOUBLE_EQ(m.c[i], want_c[i]);  // towards the centre, curvature 1
  }
  for (double v : {m.h, m.hprev}) EXPECT_EQ(bits(v), bits(1e38));
  for (double v : {m.f, m.g}) EXPECT_EQ(bits(v), bits(1.0));
  EXPECT_EQ(m.nstored, 1);
  EXPECT_EQ(m.treq, 6);
  // The result holds the first point: kind 23 = (x, t), group 1 = (phase 0, number 1, x).
  EXPECT_EQ(orvq7sys_table_live(), live0 + 5);  // master, kind 23, three group members
  EXPECT_EQ(r.tables.master, r.itab);
  std::int32_t count = -1;
  EXPECT_EQ(read_kind<double>(r.itab, 23, &count), (std::vector<double>{1.0, 0.0, 0.0, 2.0}));
  EXPECT_EQ(count, 0);  // recorded only when the path ends
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 1, &count)[0], 0);
  EXPECT_EQ(read_kind<std::int32_t>(r.itab, 2, &count)[0], 1);
  std::int32_t ierr = -1;
  EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  // Against the computed tangent: orientation sign -1, the path still follows d0.
  PathRecords back(2, 4, 2);
  const double xd_back[4] = {1.0, 0.0, 0.0, -2.0};
  ASSERT_EQ(start(back, c, 1e-12, xd_back, kBox), 0);
  EXPECT_EQ(back.march.sign, -1);
  EXPECT_EQ(back.march.t[1], -2.0);
}

struct StartRefusal {
  const char* what;
  double xd[4], box[4], eps;
  std::int32_t ierr;
  std::size_t evaluations;
  std::int32_t n = 2, fail_code = 0;
};

class StartChecks : public ::testing::TestWithParam<StartRefusal> {};

TEST_P(StartChecks, RunUnknownByUnknownThenTheResidual) {
  const StartRefusal& s = GetParam();
  PathRecords r(2, 4, 2);
  Curve c(Curve::kCircle, 2);
  c.fail_code = s.fail_code;
  r.dim = s.n;
  EXPECT_EQ(start(r, c, s.eps, s.xd, s.box), 1) << s.what;
  EXPECT_EQ(r.ierr, s.ierr) << s.what;
  EXPECT_EQ(c.reqs.size(), s.evaluations) << s.what;
  EXPECT_EQ(r.itab, 0);
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Wncini, StartChecks, ::testing::Values(
    StartRefusal{"bounds out of order", {1, 0, 0, 1}, {2, -2, -2, 2}, 1e-12, 4712, 0},
    StartRefusal{"equal bounds", {1, 0, 0, 1}, {1, -2, 1, 2}, 1e-12, 4712, 0},
    StartRefusal{"outside", {1, 0, 0, 1}, {-2, 0.5, 2, 2}, 1e-12, 4712, 0},
    // Unknown 1 on its lower face, d0 pointing out: 4721 before unknown 2 is looked at.
    StartRefusal{"face out first", {-2, 9, -1, 0}, {-2, -2, 2, 2}, 1e-12, 4721, 0},
    StartRefusal{"upper face out", {1, 2, 0, 0.5}, {-2, -2, 2, 2}, 1e-12, 4721, 0},
    StartRefusal{"outside before face", {5, -2, 0, -1}, {-2, -2, 2, 2}, 1e-12, 4712, 0},
    // Inside the box but off the circle: residual 0.25^2 above eps.
    StartRefusal{"off the curve", {1.5, 0, 0, 1}, {-2, -2, 2, 2}, 1e-3, 4712, 1},
    StartRefusal{"eps not a number", {1, 0, 0, 1}, {-2, -2, 2, 2}, NAN, 4712, 1},
    // The routine's failure at the residual evaluation is passed on unchanged.
    StartRefusal{"routine fails", {1, 0, 0, 1}, {-2, -2, 2, 2}, 1e-12, 4715, 1, 2, 4715},
    StartRefusal{"n 1", {1, 0, 0, 1}, {-2, -2, 2, 2}, 1e-12, 4712, 0, 1},
    StartRefusal{"n 21", {1, 0, 0, 1}, {-2, -2, 2, 2}, 1e-12, 4718, 0, 21}));
// clang-format on

TEST(Wncini, PointOnAFaceMovingAlongItOrInwardStarts) {
  PathRecords r(2, 2, 2);  // K = 2: order level 0, c = 0
  Curve c(Curve::kCircle, 2);
  const double xd[4] = {0.0, 1.0, 1.0, 0.0};  // on the upper face y = 1, moving along it
  const double box[4] = {-2.0, -2.0, 2.0, 1.0};
  ASSERT_EQ(start(r, c, 0.0, xd, box), 0);
  EXPECT_EQ(c.reqs, (std::vector<std::int32_t>{1, 2}));
  EXPECT_EQ(bits(r.march.c[0]), bits(0.0));
}

TEST(Wncini, NoTangentAtTheStartTakesD0AndTheScaleValues) {
  // x^2 + y^2 = 0 at the origin: residual 0, gradient 0 (ynumde's 4710 is cleared).
  // Scale values 2 / ((box(i,2) - box(i,1)) sqrt(2)) for widths 2 and 4.
  Curve c(Curve::kCircle, 2, 0.0);
  const double xd[4] = {0.0, 0.0, -3.0, 0.5}, box[4] = {-1.0, -3.0, 1.0, 1.0};
  const double s1 = 2.0 / (2.0 * std::sqrt(2.0)), s2 = 2.0 / (4.0 * std::sqrt(2.0));
  for (std::int32_t mode : {4, 4 + (1 << 15)}) {  // order level 1, then 2
    PathRecords r(2, mode, 2);
    ASSERT_EQ(start(r, c, 0.0, xd, box), 0) << mode;
    EXPECT_EQ(r.ierr, 0);
    EXPECT_EQ(r.march.sign, 1);
    EXPECT_EQ(bits(r.march.t[0]), bits(-3.0));
    EXPECT_EQ(bits(r.march.c[0]), bits(s1));
    EXPECT_EQ(bits(r.march.c[1]), bits(s2));
    EXPECT_EQ(r.march.treq, mode == 4 ? 6 : 2);
  }
}

}  // namespace
