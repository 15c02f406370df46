// tests/path/newton_test.cpp -- checks for path/newton.cpp: wncgcv with its correctors, wncgf2.
// (wncgoo's halving and collapse are exercised through ynchem.)
#include "curves.h"

// F(x, y) = (x - 1)^k + shift, one equation in two unknowns (req 1 and 2 blocks only).
struct Power { int k; double shift; int calls = 0; };
std::int32_t eval_power(void* ctx, const std::int32_t*, const double* x, const std::int32_t* req,
                        double* out, std::int32_t* ierr) {
  Power& p = *static_cast<Power*>(ctx);
  ++p.calls;
  if (*req & 1) *out++ = std::pow(x[0] - 1.0, p.k) + p.shift;
  if (*req & 2) *out++ = p.k * std::pow(x[0] - 1.0, p.k - 1), *out++ = 0.0;
  return *ierr = 0;
}

TEST(Wncgcv, JudgesByTheFinalResidualNormInclusively) {
  std::int32_t n = 2, ierr = -1, which = 0;
  const double u[2] = {0.0, 1.0}, w[2] = {1.0, 1.0}, p[2] = {0.25, 0.0}, q[2] = {1.0, 0.0};
  double x[3] = {}, eps = 0.0;
  // F = x1 along the line through p orthogonal to u: solved exactly, accepted at eps = 0.
  Curve line(Curve::kLinear, 2);
  ASSERT_EQ(wncgcv(&line, &n, eval_curve, &eps, &which, u, p, p, w, x, &ierr), 0);
  EXPECT_EQ(bits(x[0]), bits(0.0));
  // (x - 1)^8 + 2^-20 never reaches 0: from x = 1 (zero derivative) the squared residual
  // stays 2^-40, refused below it, accepted at it.
  Power pw{8, 0x1p-20};
  eps = 0x1p-41;
  EXPECT_EQ(wncgcv(&pw, &n, eval_power, &eps, &which, u, q, q, w, x, &ierr), 1);
  EXPECT_EQ(ierr, 4713);
  eps = 0x1p-40;
  EXPECT_EQ(wncgcv(&pw, &n, eval_power, &eps, &which, u, q, q, w, x, &ierr), 0);
  // n = 3, F = (x1, x2) in the box p +- w with x1 >= 0.25: the Newton step to x1 = 0 leaves
  // it (4716), which is a failed correction (4713).
  std::int32_t n3 = 3, which1 = 1;
  Curve lin3(Curve::kLinear, 3);
  const double p3[3] = {0.375, -0.25, 0.5}, w3[3] = {0.125, 0.5, 0.5};
  eps = 1.0;
  EXPECT_EQ(wncgcv(&lin3, &n3, eval_curve, &eps, &which1, p3, p3, p3, w3, x, &ierr), 1);
  EXPECT_EQ(ierr, 4713);
}

TEST(Wncgf2, IterationLimitIsTracedWithLength7AndStillJudgedByTheResidual) {
  // (x - 1)^9 from x = 2 along the line x = 2 - s: Newton shrinks x - 1 by 8/9 per step and
  // the residual keeps decreasing, so the 101st iteration is refused.
  Power pw{9, 0.0};
  std::int32_t n = 2, ierr = -1, which = 0;
  const double p[2] = {2.0, 0.0}, u[2] = {0.0, 1.0}, box[4] = {-9, 9, -9, 9}, w[2] = {9, 9};
  const double eps = 1e-20;
  double x[2] = {}, rnorm = -1;
  RecordedFrames frames;
  EXPECT_EQ((Ints{wncgf2(&pw, eval_power, u, p, box, x, &rnorm, &ierr), ierr, pw.calls}),
            (Ints{1, 4701, 100}));
  EXPECT_EQ(frames.frames(), (std::vector<Frame>{{4701, "WNCGF2;", 7}}));
  // x - 1 = (8/9)^99 after 99 steps, squared residual (8/9)^1782, about 7e-92.
  EXPECT_NEAR(x[0] - 1.0, std::pow(8.0 / 9.0, 99), 1e-12);
  EXPECT_LT(rnorm, 1e-90);
  EXPECT_EQ(wncgcv(&pw, &n, eval_power, &eps, &which, u, p, p, w, x, &ierr), 0);
}

TEST(Wncgf2, SafeguardedSearchBracketsAnOvershootingNewtonStep) {
  // x^2 + y^2 = 1 along the line y = 0.75 from x = 0.01: the first Newton step overshoots to a
  // larger residual of the other sign; the bracket is bisected onto the root sqrt(0.4375).
  Curve c(Curve::kCircle, 2);
  const double p[2] = {0.01, 0.75}, u[2] = {0.0, -1.0}, box[4] = {-99, 99, -99, 99};
  double x[2] = {}, rnorm = -1;
  std::int32_t ierr = -1;
  ASSERT_EQ(wncgf2(&c, eval_curve, u, p, box, x, &rnorm, &ierr), 0);
  EXPECT_LE(rnorm, 1e-15);
  EXPECT_NEAR(x[0], std::sqrt(0.4375), 1e-8);
  EXPECT_EQ(bits(x[1]), bits(0.75));
}
