// tests/path/tangent_test.cpp -- checks for path/tangent.cpp: ynumde.
#include "curves.h"

namespace {

TEST(Ynumde, TangentsComeFromOneEvaluationForAllPoints) {
  struct Case {
    Curve::Kind kind;
    std::int32_t n;
    double p;
    std::int32_t npts, req;
    std::vector<double> x, want;
    bool bitwise;  // else to four ulps (zeros of either sign)
  };
  const Case cases[] = {
      // x^2 + y^2 = 25 at (3, 4): gradient (6, 8); tangent (-b, a)/|g| = (-0.8, 0.6); second
      // derivative -(x/R)/R = (-0.12, -0.16), towards the centre with curvature 1/5.
      {Curve::kCircle, 2, 25, 1, 6, {3, 4}, {-0.8, 0.6, -0.12, -0.16}, true},
      {Curve::kCircle, 2, 25, 1, 4, {3, 4}, {-0.12, -0.16}, true},
      {Curve::kCircle, 2, 25, 2, 2, {5, 0, 0, -5}, {0, 1, 1, 0}, false},  // two points
      // Sphere and plane z = 0 at (1, 0, 0): gradients (2, 0, 0) and (0, 0, 1); g1 x g2 =
      // (0, -2, 0); the unit circle's second derivative is -x = (-1, 0, 0).
      {Curve::kSpherePlane, 3, 1, 1, 6, {1, 0, 0}, {0, -1, 0, -1, 0, 0}, false},
      // Gradients e1, e2, e3 (n = 4): t . y = det[y e1 e2 e3], so t = (0, 0, 0, -1); for
      // n = 5, det[e5 e1 e2 e3 e4] = +1, so t = e5.
      {Curve::kLinear, 4, 1, 1, 2, {0, 0, 0, 0}, {0, 0, 0, -1}, false},
      {Curve::kLinear, 5, 1, 1, 2, {0, 0, 0, 0, 0}, {0, 0, 0, 0, 1}, false},
      // A circle in the (x1, x2) plane of R^4 at (1, 0, 0, 0): gradients 2e1, e3, e4, so
      // t . e2 = det[e2 2e1 e3 e4] = -2: t = (0, -1, 0, 0); second derivative (-1, 0, 0, 0).
      {Curve::kCircle, 4, 1, 1, 6, {1, 0, 0, 0}, {0, -1, 0, 0, -1, 0, 0, 0}, false}};
  for (const Case& k : cases) {
    SCOPED_TRACE(testing::Message() << k.kind << " " << k.n << " " << k.req);
    Curve c(k.kind, k.n, k.p);
    std::vector<double> out(k.want.size(), 7.0);
    std::int32_t ierr = -1;
    ASSERT_EQ(ynumde(&c, &k.n, eval_curve, &k.npts, k.x.data(), &k.req, out.data(), &ierr), 0);
    EXPECT_EQ(ierr, 0);
    EXPECT_EQ(c.reqs, std::vector<std::int32_t>{k.req == 2 ? 2 : 6});
    EXPECT_EQ(c.npts, std::vector<std::int32_t>{k.npts});
    EXPECT_TRUE(!k.bitwise || bitsv(out) == bitsv(k.want));
    for (std::size_t i = 0; i < out.size(); ++i) EXPECT_DOUBLE_EQ(out[i], k.want[i]) << i;
  }
}

TEST(Ynumde, RefusalsLeaveTheOutputs) {
  struct Case {
    Curve::Kind kind;
    std::int32_t n;
    double p, x1;  // the point (x1, 0, ...)
    std::int32_t npts, req, fail_code, ierr;
    std::size_t evaluations;
  };
  const Case cases[] = {
      {Curve::kCircle, 2, 0, 0, 1, 2, 0, 4710, 1},    // zero gradient
      {Curve::kCircle, 2, 1, NAN, 1, 2, 0, 4710, 1},  // a NaN gradient has no direction
      // The plane's gradient of squared length 1e-12 (< 1e-10) is degenerate, although the
      // cross product's squared length 4e-12 is above 1e-24.
      {Curve::kSpherePlane, 3, 1e-6, 1, 1, 2, 0, 4710, 1},
      {Curve::kCircle, 1, 1, 1, 1, 2, 0, 4712, 0},  {Curve::kCircle, 21, 1, 1, 1, 2, 0, 4718, 0},
      {Curve::kCircle, 2, 1, 1, 1, 3, 0, 4718, 0},  {Curve::kCircle, 2, 1, 1, 1, 1, 0, 4718, 0},
      {Curve::kCircle, 2, 1, 1, 0, 2, 0, 4712, 0},  // no point
      // The routine's failures: 4715 becomes 4718, any other code is passed on.
      {Curve::kCircle, 2, 1, 1, 1, 2, 4715, 4718, 1}, {Curve::kCircle, 2, 1, 1, 1, 6, 777, 777, 1}};
  for (const Case& k : cases) {
    Curve c(k.kind, k.n, k.p);
    c.fail_code = k.fail_code;
    const double x[4] = {k.x1, 0.0, 0.0, 0.0};
    std::vector<double> out(8, 7.0);
    std::int32_t ierr = 0;
    EXPECT_EQ(ynumde(&c, &k.n, eval_curve, &k.npts, x, &k.req, out.data(), &ierr), 1);
    EXPECT_EQ(ierr, k.ierr) << k.n << " " << k.req << " " << k.npts;
    EXPECT_EQ(c.reqs.size(), k.evaluations) << k.ierr;
    EXPECT_EQ(bitsv(out), bitsv(std::vector<double>(8, 7.0))) << k.ierr;
  }
}

TEST(Ynumde, WorkAreaAbove210RealsComesFromTheWorkspace) {
  // n = 2 keeps the generalised product (and its own workspace) out of the count. The area
  // covers all points: 2 reals a point for req 2, 3 * 2 * 1 for req 4 and 6.
  Curve line{Curve::kLinear, 2};
  const std::vector<double> pts(2 * 106, 0.0);
  std::vector<double> out(4 * 106, 0.0);
  std::int32_t ierr = -1;
  WorkspaceWatch ws;
  auto tangent = [&](std::int32_t npts, std::int32_t req) {
    return ynumde(&line, &line.n, eval_curve, &npts, pts.data(), &req, out.data(), &ierr);
  };
  ASSERT_EQ(tangent(105, 2) + tangent(35, 6), 0);  // 210 each: the stack
  EXPECT_EQ(ws.requests(), 0);
  ASSERT_EQ(tangent(106, 2) + tangent(36, 4), 0);  // 212, 216
  EXPECT_EQ(ws.requests(), 2);
  EXPECT_EQ(ws.outstanding(), 0);
  EXPECT_EQ(bits(out[35]), bits(0.0));  // the line's second derivative
  ws.refuse_next(1);
  EXPECT_EQ(tangent(106, 2), 1);
  EXPECT_EQ(ierr, 36);
  EXPECT_EQ(line.reqs.size(), 4u);  // the refused call never evaluated
}

}  // namespace
