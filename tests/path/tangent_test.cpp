// tests/path/tangent_test.cpp -- checks for path/tangent.cpp: ynumde.
#include "curves.h"

TEST(Ynumde, TangentsComeFromOneEvaluationForAllPoints) {
  // The outputs bit for bit, or to four ulps (zeros of either sign).
  struct Case { Curve::Kind kind; int n; double p; Ints npts_req; Reals x, want; bool bits; };
  const Case cases[] = {
      // x^2 + y^2 = 25 at (3, 4): gradient (6, 8); tangent (-b, a)/|g| = (-0.8, 0.6); second
      // derivative -(x/R)/R = (-0.12, -0.16), towards the centre with curvature 1/5.
      {Curve::kCircle, 2, 25, {1, 6}, {3, 4}, {-0.8, 0.6, -0.12, -0.16}, true},
      {Curve::kCircle, 2, 25, {1, 4}, {3, 4}, {-0.12, -0.16}, true},
      {Curve::kCircle, 2, 25, {2, 2}, {5, 0, 0, -5}, {0, 1, 1, 0}, false},  // two points
      // Sphere and plane z = 0 at (1, 0, 0): gradients (2, 0, 0) and (0, 0, 1); g1 x g2 =
      // (0, -2, 0); the unit circle's second derivative is -x = (-1, 0, 0).
      {Curve::kSpherePlane, 3, 1, {1, 6}, {1, 0, 0}, {0, -1, 0, -1, 0, 0}, false},
      // Gradients e1, e2, e3 (n = 4): t . y = det[y e1 e2 e3], so t = (0, 0, 0, -1); for
      // n = 5, det[e5 e1 e2 e3 e4] = +1, so t = e5.
      {Curve::kLinear, 4, 1, {1, 2}, {0, 0, 0, 0}, {0, 0, 0, -1}, false},
      {Curve::kLinear, 5, 1, {1, 2}, {0, 0, 0, 0, 0}, {0, 0, 0, 0, 1}, false},
      // A circle in the (x1, x2) plane of R^4 at (1, 0, 0, 0): gradients 2e1, e3, e4, so
      // t . e2 = det[e2 2e1 e3 e4] = -2: t = (0, -1, 0, 0); second derivative (-1, 0, 0, 0).
      {Curve::kCircle, 4, 1, {1, 6}, {1, 0, 0, 0}, {0, -1, 0, 0, -1, 0, 0, 0}, false}};
  for (const Case& k : cases) {
    SCOPED_TRACE(testing::Message() << k.kind << " " << k.n << " " << k.npts_req[1]);
    Curve c(k.kind, k.n, k.p);
    Reals out(k.want.size(), 7.0);
    std::int32_t ierr = -1, npts = k.npts_req[0], req = k.npts_req[1];
    EXPECT_EQ(ynumde(&c, &k.n, eval_curve, &npts, k.x.data(), &req, out.data(), &ierr), 0);
    EXPECT_EQ((Ints{ierr, c.reqs[0], c.npts[0], int(c.reqs.size())}),
              (Ints{0, req == 2 ? 2 : 6, npts, 1}));
    EXPECT_TRUE(!k.bits || bitsv(out) == bitsv(k.want));
    for (std::size_t i = 0; i < out.size(); ++i) EXPECT_DOUBLE_EQ(out[i], k.want[i]) << i;
  }
}

TEST(Ynumde, RefusalsLeaveTheOutputs) {
  // At the point (x1, 0, ...); the routine fails with `fail` when it is not 0.
  struct Case { Curve::Kind kind; int n; double p, x1; int npts, req, fail, ierr, evaluations; };
  // A zero gradient; a NaN gradient has no direction; the plane's gradient of squared length
  // 1e-12 (< 1e-10) is degenerate, although the cross product's squared length 4e-12 is above
  // 1e-24. n = 1, 21; req 3, 1; no point. The routine's failures: 4715 becomes 4718, any other
  // code is passed on.
  const Curve::Kind C = Curve::kCircle;
  const Case cases[] = {
      {C, 2, 0, 0, 1, 2, 0, 4710, 1}, {C, 2, 1, NAN, 1, 2, 0, 4710, 1},
      {Curve::kSpherePlane, 3, 1e-6, 1, 1, 2, 0, 4710, 1}, {C, 1, 1, 1, 1, 2, 0, 4712, 0},
      {C, 21, 1, 1, 1, 2, 0, 4718, 0}, {C, 2, 1, 1, 1, 3, 0, 4718, 0},
      {C, 2, 1, 1, 1, 1, 0, 4718, 0}, {C, 2, 1, 1, 0, 2, 0, 4712, 0},
      {C, 2, 1, 1, 1, 2, 4715, 4718, 1}, {C, 2, 1, 1, 1, 6, 777, 777, 1}};
  for (const Case& k : cases) {
    Curve c(k.kind, k.n, k.p);
    c.fail_code = k.fail;
    const double x[4] = {k.x1, 0.0, 0.0, 0.0};
    Reals out(8, 7.0);
    std::int32_t ierr = 0;
    EXPECT_EQ(ynumde(&c, &k.n, eval_curve, &k.npts, x, &k.req, out.data(), &ierr), 1);
    EXPECT_EQ((Ints{ierr, int(c.reqs.size())}), (Ints{k.ierr, k.evaluations})) << k.n << k.req;
    EXPECT_EQ(bitsv(out), bitsv(Reals(8, 7.0))) << k.ierr;
  }
}

TEST(Ynumde, WorkAreaAbove210RealsComesFromTheWorkspace) {
  // n = 2 keeps the generalised product (and its own workspace) out of the count. The area
  // covers all points: 2 reals a point for req 2, 3 * 2 * 1 for req 4 and 6.
  Curve line{Curve::kLinear, 2};
  const Reals pts(2 * 106, 0.0);
  Reals out(4 * 106, 0.0);
  std::int32_t ierr = -1;
  WorkspaceWatch ws;
  auto tangent = [&](std::int32_t npts, std::int32_t req) {
    return ynumde(&line, &line.n, eval_curve, &npts, pts.data(), &req, out.data(), &ierr);
  };
  ASSERT_EQ((Ints{tangent(105, 2), tangent(35, 6)}), (Ints{0, 0}));  // 210 each: the stack
  const std::int64_t on_stack = ws.requests();
  ASSERT_EQ((Ints{tangent(106, 2), tangent(36, 4)}), (Ints{0, 0}));  // 212, 216
  EXPECT_EQ((std::vector{on_stack, ws.requests(), ws.outstanding()}), (std::vector{0L, 2L, 0L}));
  EXPECT_EQ(bits(out[35]), bits(0.0));  // the line's second derivative
  ws.refuse_next(1);  // the refused call never evaluates
  EXPECT_EQ((Ints{tangent(106, 2), ierr, int(line.reqs.size())}), (Ints{1, 36, 4}));
}
