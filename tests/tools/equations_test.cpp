// tests/tools/equations_test.cpp -- checks for tools/orvq7/equations.cpp: parsing of typed
// equations, derivatives by differences against derivatives worked out by hand, and the
// evaluation routine's layout and failures.
#include "equations.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "input.h"

namespace {

using orvq7tool::EquationSystem;
using orvq7tool::ToolError;

// Message of the ToolError that constructing the system throws ("" when none).
std::string parse_error(const std::vector<std::string>& names,
                        const std::vector<std::string>& eqs) {
  try {
    EquationSystem s(names, eqs);
  } catch (const ToolError& e) {
    return e.what();
  }
  return "";
}

TEST(EquationSystem, RefusesBadExpressionsNamingTheEquation) {
  EXPECT_NE(parse_error({"x", "y"}, {"x + y", "x^2 +"}).find("equation 2 'x^2 +'"),
            std::string::npos);
  EXPECT_NE(parse_error({"x", "y"}, {"x + q"}).find("\"q\""), std::string::npos);
  EXPECT_NE(parse_error({"x", "y"}, {"x, y"}).find("gives 2 values"), std::string::npos);
  EXPECT_NE(parse_error({"x", "y"}, {"x = y = 1"}).find("more than one '='"), std::string::npos);
  EXPECT_NE(parse_error({"x", "y"}, {""}).find("equation 1"), std::string::npos);
  EXPECT_EQ(parse_error({"x", "y"}, {"x <= y", "x == y", "x >= y", "x != y"}), "");
}

TEST(EquationSystem, SplitsLhsEqualsRhsIntoADifference) {
  EquationSystem s({"x", "y"}, {"x^2 = y + 3", "x <= y"});
  const double x[2] = {2.5, -1.25};
  double f[2];
  s.residuals(x, f);
  EXPECT_EQ(f[0], 6.25 - 1.75);  // (x^2) - (y + 3), exact in binary
  EXPECT_EQ(f[1], 0.0);          // a comparison stays a comparison
  EXPECT_EQ(s.shown(0), "x^2 = y + 3");
  EXPECT_EQ(s.shown(1), "x <= y = 0");
  EXPECT_EQ(s.residual_sum(x), 4.5 * 4.5);
}

// F1 = sin(x) exp(y) + x^3 z,  F2 = sqrt(x^2 + y^2 + z^2), derivatives by hand.
struct Smooth {
  double x, y, z;
  double j(int k, int i) const {
    const double r = std::sqrt(x * x + y * y + z * z);
    const double g1[3] = {std::cos(x) * std::exp(y) + 3 * x * x * z, std::sin(x) * std::exp(y),
                          x * x * x};
    const double g2[3] = {x / r, y / r, z / r};
    return k == 0 ? g1[i] : g2[i];
  }
  double h(int k, int i, int j) const {
    const double v[3] = {x, y, z};
    const double r = std::sqrt(x * x + y * y + z * z);
    if (k == 1) return ((i == j ? 1.0 : 0.0) - v[i] * v[j] / (r * r)) / r;
    const double s = std::sin(x) * std::exp(y), c = std::cos(x) * std::exp(y);
    const double m[3][3] = {{-s + 6 * x * z, c, 3 * x * x}, {c, s, 0}, {3 * x * x, 0, 0}};
    return m[i][j];
  }
};

TEST(EquationSystem, DerivativesMatchThoseWorkedOutByHand) {
  EquationSystem s({"x", "y", "z"}, {"sin(x)*exp(y) + x^3*z", "sqrt(x^2 + y^2 + z^2)"});
  const Smooth a{0.7316, -0.3852, 1.9043};
  const double x[3] = {a.x, a.y, a.z};
  double jac[6], hes[18];
  s.jacobian(x, jac);
  s.hessian(x, hes);
  for (int k = 0; k < 2; ++k)
    for (int i = 0; i < 3; ++i) {
      EXPECT_NEAR(jac[k + 2 * i], a.j(k, i), 1e-11) << "k " << k << " i " << i;
      for (int j = 0; j < 3; ++j)
        EXPECT_NEAR(hes[k + 2 * (i + 3 * j)], a.h(k, i, j), 1e-8)
            << "k " << k << " i " << i << " j " << j;
    }
}

TEST(EquationSystem, DerivativeStepsFollowTheScaleOfEachUnknown) {
  // x varies on a scale of 1e-6: a step of the default scale 1 would miss the sine entirely.
  EquationSystem s({"x", "y"}, {"sin(x * 1e6) + y"});
  const double x[2] = {3.1e-7, 0.25};
  double jac[2], hes[4];
  s.set_scales({1e-6, 1.0});
  s.jacobian(x, jac);
  s.hessian(x, hes);
  EXPECT_NEAR(jac[0] / 1e6, std::cos(0.31), 1e-9);
  EXPECT_NEAR(jac[1], 1.0, 1e-12);
  EXPECT_NEAR(hes[0] / 1e12, -std::sin(0.31), 1e-6);
  EXPECT_NEAR(hes[1] / 1e6, 0.0, 1e-6);
}

TEST(EvaluateSystem, WritesTheRequestedBlocksPointAfterPoint) {
  // F1 = x y, F2 = y + 2 z^2: n = 3, m = 2. Polynomials of degree <= 4 are differentiated
  // exactly by the stencils, up to rounding.
  EquationSystem s({"x", "y", "z"}, {"x*y", "y + 2*z^2"});
  orvq7tool::EvalContext ctx;
  ctx.system = &s;
  const double pts[6] = {1.5, -2.0, 0.5, 3.0, 0.25, -1.0};
  const std::int32_t npts = 2, req = 7;
  std::int32_t ierr = -1;
  std::vector<double> out(2 * (2 + 6 + 18), -99.0);
  ASSERT_EQ(orvq7tool::evaluate_system(&ctx, &npts, pts, &req, out.data(), &ierr), 0);
  EXPECT_EQ(ierr, 0);
  for (int p = 0; p < 2; ++p) {
    const double x = pts[3 * p], y = pts[3 * p + 1], z = pts[3 * p + 2];
    const double* o = out.data() + 26 * p;
    EXPECT_EQ(o[0], x * y);
    EXPECT_EQ(o[1], y + 2 * z * z);
    const double jac[6] = {y, 0, x, 1, 0, 4 * z};  // (k, i) at k + 2 i
    for (int e = 0; e < 6; ++e) EXPECT_NEAR(o[2 + e], jac[e], 1e-12) << "point " << p;
    for (int e = 0; e < 18; ++e) {
      const int k = e % 2, i = (e / 2) % 3, j = e / 6;
      const double want = (k == 0 && i + j == 1) ? 1.0 : (k == 1 && i == 2 && j == 2) ? 4.0 : 0.0;
      EXPECT_NEAR(o[8 + e], want, 1e-9) << "point " << p << " (k, i, j) " << k << i << j;
    }
  }
  EXPECT_EQ(ctx.calls, 1u);
}

TEST(EvaluateSystem, FailsWith4715AndAReasonInsteadOfThrowing) {
  EquationSystem s({"x", "y"}, {"x + y"});
  orvq7tool::EvalContext ctx;
  ctx.system = &s;
  ctx.max_calls = 2;
  const double x[2] = {0.5, 0.5};
  double out[8];
  std::int32_t npts = 1, req = 1, ierr = 0;
  EXPECT_EQ(orvq7tool::evaluate_system(&ctx, &npts, x, &req, out, &ierr), 0);
  req = 8;  // no such block
  EXPECT_EQ(orvq7tool::evaluate_system(&ctx, &npts, x, &req, out, &ierr), 1);
  EXPECT_EQ(ierr, 4715);
  EXPECT_NE(ctx.failure.find("req 8"), std::string::npos);
  req = 1;
  EXPECT_EQ(orvq7tool::evaluate_system(&ctx, &npts, x, &req, out, &ierr), 1);  // third call
  EXPECT_EQ(ierr, 4715);
  EXPECT_NE(ctx.failure.find("stopped after 2 calls"), std::string::npos);
}

}  // namespace
