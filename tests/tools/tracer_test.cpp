// tests/tools/tracer_test.cpp -- checks for tools/orvq7/tracer.cpp (defaults, refusals,
// snapping, endings read back from the result table) and for the fit and closest reports'
// degenerate cases.
#include "tracer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "commands.h"
#include "input.h"

namespace {

using orvq7tool::Ending;
using orvq7tool::EquationSystem;
using orvq7tool::TracePlan;

TracePlan plan_for(std::vector<double> start, std::vector<double> lower,
                   std::vector<double> upper) {
  TracePlan plan;
  plan.start = std::move(start);
  plan.lower = std::move(lower);
  plan.upper = std::move(upper);
  plan.progress_after = -1.0;
  return plan;
}

TEST(CheckPlan, DefaultsFollowTheBoxAndThePathKind) {
  EquationSystem s({"x", "y"}, {"y - 0.25"});
  for (const auto& [kind, tol] : {std::pair{2, 0.005}, {4, 0.5 / 4000}, {8, 0.1}}) {
    TracePlan plan = plan_for({1.0, 0.25}, {-1.0, 0.0}, {3.0, 0.5});  // widths 4 and 0.5
    plan.kind = kind;
    orvq7tool::check_plan(s, plan);
    EXPECT_EQ(plan.tol, std::vector<double>{tol}) << "kind " << kind;
    EXPECT_EQ(plan.step_max, (std::vector<double>{0.4, 0.05}));
    EXPECT_EQ(plan.step_min, (std::vector<double>{4 * 1e-7, 0.5 * 1e-7}));
  }
}

struct Refusal {
  const char* name;
  std::vector<std::string> equations;
  std::vector<double> start;
  std::int32_t kind;
  std::vector<double> tol, step_min;
  const char* message;
};

class CheckPlanRefuses : public ::testing::TestWithParam<Refusal> {};

TEST_P(CheckPlanRefuses, NamingTheProblem) {
  const Refusal& c = GetParam();
  EquationSystem s({"x", "y", "z"}, c.equations);
  TracePlan plan = plan_for(c.start, {-1, -1, -1}, {1, 1, 1});
  plan.kind = c.kind;
  plan.tol = c.tol;
  plan.step_min = c.step_min;
  try {
    orvq7tool::check_plan(s, plan);
    ADD_FAILURE() << "accepted";
  } catch (const orvq7tool::ToolError& e) {
    EXPECT_NE(std::string(e.what()).find(c.message), std::string::npos) << e.what();
  }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Tracer, CheckPlanRefuses,
    ::testing::Values(
        Refusal{"EquationCount", {"x"}, {0, 0, 0}, 4, {}, {}, "1 equation in 3 unknowns"},
        Refusal{"StartSize", {"x", "y"}, {0, 0}, 4, {}, {},
                "start point: 2 values given, expected 3"},
        Refusal{"Kind8PerUnknown", {"x", "y"}, {0, 0, 0}, 8, {0.1, 0.1, 0.1}, {},
                "kind 8 takes a single"},
        Refusal{"TolSize", {"x", "y"}, {0, 0, 0}, 4, {0.1, 0.1}, {}, "tolerance: 2 values given"},
        Refusal{"StepOrder", {"x", "y"}, {0, 0, 0}, 4, {}, {0.5}, "need 0 < minimum < maximum"},
        Refusal{"StartOutside", {"x", "y"}, {0, 0, 1.5}, 4, {}, {},
                "z = 1.5 lies outside its box range"},
        Refusal{"OffCurve", {"x", "y - 0.125"}, {0, 0, 0}, 4, {}, {},
                "sum of squared residuals 0.0156 > eps 1e-20 (--snap"}),
    [](const ::testing::TestParamInfo<Refusal>& info) { return std::string(info.param.name); });
// clang-format on

TEST(CheckPlan, SnapMovesANearbyStartOntoTheCurve) {
  EquationSystem s({"x", "y"}, {"x^2 + y^2 - 1"});
  TracePlan plan = plan_for({1.2, 0.1}, {-2, -2}, {2, 2});
  plan.snap = true;
  orvq7tool::check_plan(s, plan);
  EXPECT_LE(s.residual_sum(plan.start.data()), 1e-20);
  // Least-length steps along the gradient (x, y): the point moves radially, to (1.2, 0.1) / r.
  const double r = std::sqrt(1.45);
  EXPECT_NEAR(plan.start[0], 1.2 / r, 1e-9);
  EXPECT_NEAR(plan.start[1], 0.1 / r, 1e-9);
  EXPECT_NEAR(plan.snapped, r - 1.0, 1e-9);
}

TEST(TracePath, NamesTheFaceThroughWhichTheLineLeaves) {
  // y = 1/2, z = -x/2 from (0, 1/2, 0) along +x: z reaches its lower bound -1/4 at x = 1/2,
  // before x reaches 1.
  EquationSystem s({"x", "y", "z"}, {"y - 0.5", "z + x/2"});
  TracePlan plan = plan_for({0, 0.5, 0}, {-1, 0, -0.25}, {1, 1, 1});
  plan.direction = {1, 0, -0.5};
  orvq7tool::check_plan(s, plan);
  const orvq7tool::TraceResult r = orvq7tool::trace_path(s, plan);
  ASSERT_EQ(r.ending, Ending::kLeftBox) << r.ending_text;
  EXPECT_EQ(r.face_unknown, 2u);
  EXPECT_FALSE(r.face_upper);
  EXPECT_EQ(r.ending_text, "left the box through the face z = -0.25 (lower bound of z)");
  const double* last = &r.points[(r.count() - 1) * 3];
  EXPECT_EQ(last[2], -0.25);
  EXPECT_NEAR(last[0], 0.5, 1e-12);
  EXPECT_EQ(r.phases.front(), 0);
  EXPECT_EQ(r.phases.back(), 2);
  // The direction is made unit: (1, 0, -1/2) / sqrt(5/4).
  EXPECT_NEAR(r.direction[0], 2 / std::sqrt(5.0), 1e-15);
}

TEST(TracePath, StartsAlongTheTangentAndClosesTheCircle) {
  // At (0, 1) the gradient is (0, 2): the tangent (-b, a) / |(a, b)| is (-1, 0).
  EquationSystem s({"x", "y"}, {"x^2 + y^2 - 1"});
  TracePlan plan = plan_for({0, 1}, {-2, -2}, {2, 2});
  orvq7tool::check_plan(s, plan);
  const orvq7tool::TraceResult r = orvq7tool::trace_path(s, plan);
  EXPECT_EQ(r.direction, (std::vector<double>{-1.0, 0.0}));
  ASSERT_EQ(r.ending, Ending::kClosed) << r.ending_text;
  EXPECT_LT(r.points[2], 0.0);  // the second point went left
  EXPECT_NEAR(r.length, 2 * M_PI, 1e-2);
}

TEST(TracePath, ReportsTheSolversFailureWithTheEvaluationRoutinesReason) {
  EquationSystem s({"x", "y"}, {"x^2 + y^2 - 1"});
  TracePlan plan = plan_for({1, 0}, {-2, -2}, {2, 2});
  plan.max_calls = 3;
  orvq7tool::check_plan(s, plan);
  const orvq7tool::TraceResult r = orvq7tool::trace_path(s, plan);
  EXPECT_EQ(r.ending, Ending::kFailed);
  EXPECT_EQ(r.result, 1);
  EXPECT_EQ(r.count(), 0u);
  EXPECT_NE(r.ending_text.find("stopped after 3 calls"), std::string::npos) << r.ending_text;
  EXPECT_NE(r.ending_text.find("YNCHEM"), std::string::npos) << r.ending_text;
}

TEST(Reports, DegenerateFitsAndClosestPairsSayWhatHappened) {
  // All points within tol / 2 of their centroid: no spread at all, a failure.
  const orvq7tool::Outcome same = orvq7tool::fit_report({1, 2, 3, 1, 2, 3}, 1e-6);
  EXPECT_FALSE(same.ok);
  EXPECT_NE(same.text.find("spread      none"), std::string::npos) << same.text;
  // Points on a line: a mean line through them, no mean plane.
  const orvq7tool::Outcome line = orvq7tool::fit_report({0, 0, 0, 1, 2, 2, 2, 4, 4, 3, 6, 6}, 1e-6);
  EXPECT_NE(line.text.find("mean plane  none"), std::string::npos) << line.text;
  EXPECT_NE(line.text.find("0.3333333333, "), std::string::npos) << line.text;  // (1, 2, 2) / 3
  EXPECT_NE(line.text.find("0.6666666667)"), std::string::npos) << line.text;   // either sign
  // Parallel overlapping segments: a usable pair with the warning code.
  const orvq7tool::Outcome par = orvq7tool::closest_report({0, 0, 2, 0}, {1, 1, 3, 1}, false, 2);
  EXPECT_TRUE(par.ok);
  EXPECT_NE(par.text.find("code 4717"), std::string::npos) << par.text;
  EXPECT_NE(par.text.find("distance    1 "), std::string::npos) << par.text;
}

}  // namespace
