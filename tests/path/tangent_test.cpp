// tests/path/tangent_test.cpp -- checks for path/tangent.cpp: ynumde.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "curves.h"
#include "support/recording_services.h"

namespace {

// Calls ynumde and returns its result; out must hold the values asked for.
std::int32_t tangent(Curve& c, std::int32_t npts, const double* x, std::int32_t req, double* out,
                     std::int32_t* ierr) {
  return ynumde(&c, &c.n, eval_curve, &npts, x, &req, out, ierr);
}

TEST(Ynumde, CircleTangentTurnsTheGradientAndCurvesToTheCentre) {
  // x^2 + y^2 = 25 at (3, 4): gradient (6, 8); tangent (-b, a)/|g| = (-0.8, 0.6); second
  // derivative -(x/R)/R = (-0.12, -0.16), towards the centre with curvature 1/5.
  Curve c{Curve::kCircle, 2, 25.0};
  const double x[2] = {3.0, 4.0};
  double out[4] = {};
  std::int32_t ierr = -1;
  ASSERT_EQ(tangent(c, 1, x, 6, out, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  EXPECT_EQ(bits(out[0]), bits(-0.8));
  EXPECT_EQ(bits(out[1]), bits(0.6));
  EXPECT_EQ(bits(out[2]), bits(-0.12));
  EXPECT_EQ(bits(out[3]), bits(-0.16));
  EXPECT_EQ(c.reqs, std::vector<std::int32_t>{6});
  // req 4 gives the second derivative alone; req 2 asks the routine for first derivatives.
  double c_only[2] = {};
  ASSERT_EQ(tangent(c, 1, x, 4, c_only, &ierr), 0);
  EXPECT_EQ(bits(c_only[1]), bits(-0.16));
  ASSERT_EQ(tangent(c, 1, x, 2, out, &ierr), 0);
  EXPECT_EQ(c.reqs.back(), 2);
}

TEST(Ynumde, SeveralPointsShareOneEvaluation) {
  // Points (5, 0) and (0, -5) of the circle of radius 5: tangents (0, 1) and (1, 0).
  Curve c{Curve::kCircle, 2, 25.0};
  const double x[4] = {5.0, 0.0, 0.0, -5.0};
  double out[4] = {};
  std::int32_t ierr = -1;
  ASSERT_EQ(tangent(c, 2, x, 2, out, &ierr), 0);
  EXPECT_EQ(c.npts, std::vector<std::int32_t>{2});
  EXPECT_DOUBLE_EQ(out[1], 1.0);
  EXPECT_DOUBLE_EQ(out[2], 1.0);
  EXPECT_EQ(out[0], 0.0);
  EXPECT_EQ(out[3], 0.0);
}

TEST(Ynumde, ThreeUnknownsUseTheCrossProductOfTheGradients) {
  // Sphere and plane z = 0 at (1, 0, 0): gradients (2, 0, 0) and (0, 0, 1); g1 x g2 =
  // (0, -2, 0); the unit circle's second derivative is -x = (-1, 0, 0).
  Curve c{Curve::kSpherePlane, 3, 1.0};
  const double x[3] = {1.0, 0.0, 0.0};
  double out[6] = {};
  std::int32_t ierr = -1;
  ASSERT_EQ(tangent(c, 1, x, 6, out, &ierr), 0);
  const double want[6] = {0.0, -1.0, 0.0, -1.0, 0.0, 0.0};
  for (int i = 0; i < 6; ++i) EXPECT_DOUBLE_EQ(out[i], want[i]) << i;
  // The plane's gradient of squared length 1e-12 (< 1e-10) is degenerate, although the cross
  // product's squared length 4e-12 is above 1e-24.
  c.p = 1e-6;
  EXPECT_EQ(tangent(c, 1, x, 2, out, &ierr), 1);
  EXPECT_EQ(ierr, 4710);
}

TEST(Ynumde, GeneralisedProductSignForFourAndMoreUnknowns) {
  // Gradients e1, e2, e3 (n = 4): t . y = det[y e1 e2 e3], so t = (0, 0, 0, -1); for n = 5,
  // det[e5 e1 e2 e3 e4] = +1, so t = e5.
  Curve lin4{Curve::kLinear, 4};
  const double zero[5] = {};
  double out[10] = {};
  std::int32_t ierr = -1;
  ASSERT_EQ(tangent(lin4, 1, zero, 2, out, &ierr), 0);
  EXPECT_EQ(bits(out[3]), bits(-1.0));
  EXPECT_EQ(out[0], 0.0);
  Curve lin5{Curve::kLinear, 5};
  ASSERT_EQ(tangent(lin5, 1, zero, 2, out, &ierr), 0);
  EXPECT_EQ(bits(out[4]), bits(1.0));
  // A circle in the (x1, x2) plane of R^4 at (1, 0, 0, 0): gradients 2e1, e3, e4, so
  // t . e2 = det[e2 2e1 e3 e4] = -2: t = (0, -1, 0, 0); second derivative (-1, 0, 0, 0).
  Curve circle4{Curve::kCircle4, 4};
  const double x[4] = {1.0, 0.0, 0.0, 0.0};
  ASSERT_EQ(tangent(circle4, 1, x, 6, out, &ierr), 0);
  const double want[8] = {0, -1, 0, 0, -1, 0, 0, 0};
  for (int i = 0; i < 8; ++i) EXPECT_DOUBLE_EQ(out[i], want[i]) << i;
}

TEST(Ynumde, DegenerateAndRefusedCalls) {
  Curve c{Curve::kCircle, 2, 0.0};
  const double origin[2] = {0.0, 0.0};
  double out[4] = {7.0, 7.0, 7.0, 7.0};
  std::int32_t ierr = 0;
  EXPECT_EQ(tangent(c, 1, origin, 2, out, &ierr), 1);  // zero gradient
  EXPECT_EQ(ierr, 4710);
  const double nan_point[2] = {std::nan(""), 1.0};
  EXPECT_EQ(tangent(c, 1, nan_point, 2, out, &ierr), 1);  // a NaN gradient has no direction
  EXPECT_EQ(ierr, 4710);
  EXPECT_EQ(bits(out[0]), bits(7.0));
  struct Refusal {
    std::int32_t n, npts, req, ierr;
  };
  for (const Refusal r : {Refusal{1, 1, 2, 4712}, Refusal{21, 1, 2, 4718}, Refusal{2, 1, 3, 4718},
                          Refusal{2, 1, 1, 4718}, Refusal{2, 0, 2, 4712}}) {
    Curve any{Curve::kCircle, r.n, 1.0};
    EXPECT_EQ(ynumde(&any, &r.n, eval_curve, &r.npts, origin, &r.req, out, &ierr), 1);
    EXPECT_EQ(ierr, r.ierr) << r.n << " " << r.req;
    EXPECT_TRUE(any.reqs.empty());
  }
  // The routine's failures: 4715 becomes 4718, any other code is passed on.
  const double x[2] = {1.0, 0.0};
  c.fail_code = 4715;
  EXPECT_EQ(tangent(c, 1, x, 2, out, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  c.fail_code = 777;
  EXPECT_EQ(tangent(c, 1, x, 6, out, &ierr), 1);
  EXPECT_EQ(ierr, 777);
}

TEST(Ynumde, WorkAreaAbove210RealsComesFromTheWorkspace) {
  // n = 2 keeps the generalised product (and its own workspace) out of the count. The area
  // covers all points: 2 reals a point for req 2, 3 * 2 * 1 for req 4 and 6.
  Curve line{Curve::kLinear, 2};
  const std::vector<double> pts(2 * 106, 0.0);
  std::vector<double> out(4 * 106, 0.0);
  std::int32_t ierr = -1;
  WorkspaceWatch ws;
  ASSERT_EQ(tangent(line, 105, pts.data(), 2, out.data(), &ierr), 0);  // 210: the stack
  ASSERT_EQ(tangent(line, 35, pts.data(), 6, out.data(), &ierr), 0);   // 210
  EXPECT_EQ(ws.requests(), 0);
  ASSERT_EQ(tangent(line, 106, pts.data(), 2, out.data(), &ierr), 0);  // 212
  ASSERT_EQ(tangent(line, 36, pts.data(), 4, out.data(), &ierr), 0);   // 216
  EXPECT_EQ(ws.requests(), 2);
  EXPECT_EQ(ws.outstanding(), 0);
  EXPECT_EQ(bits(out[35]), bits(0.0));  // the line's second derivative
  ws.refuse_next(1);
  EXPECT_EQ(tangent(line, 106, pts.data(), 2, out.data(), &ierr), 1);
  EXPECT_EQ(ierr, 36);
  EXPECT_EQ(line.reqs.size(), 4u);  // the refused call never evaluated
}

}  // namespace
