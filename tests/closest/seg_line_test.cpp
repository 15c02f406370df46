// tests/closest/seg_line_test.cpp -- checks for closest/seg_line.cpp (ynoal2).
#include <gtest/gtest.h>

#include <vector>

#include "closest/closest_api.h"
#include "support/recording_services.h"

namespace {
struct Case {
  const char* name;
  std::int32_t n;
  std::vector<double> seg, line;
  std::int32_t result, ierr;
  double t, s, dist2;
};
class Ynoal2Cases : public ::testing::TestWithParam<Case> {};
const std::vector<double> kLine = {1, 0, 0, -2, 1, 0};  // along the first axis through (-2, 1, 0)
}  // namespace

TEST_P(Ynoal2Cases, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  std::int32_t n = c.n, ierr = -1;
  double dist2 = -9.0, t = -9.0, s = -9.0;
  EXPECT_EQ(ynoal2(&n, c.seg.data(), c.line.data(), &dist2, &t, &s, &ierr), c.result);
  EXPECT_EQ(ierr, c.ierr);
  EXPECT_EQ(t, c.t);
  EXPECT_EQ(s, c.s);
  EXPECT_EQ(dist2, c.dist2);
  EXPECT_TRUE(frames.empty());
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Table, Ynoal2Cases,
    ::testing::Values(
        Case{"DimensionOne", 1, {0, 1}, {1, 0}, 1, 4712, -9.0, -9.0, -9.0},
        // x = 0.5, y from -1 to 3, z = 0.75: passes over the line at (0.5, 1).
        Case{"Crossing", 3, {0.5, -1, 0.75, 0.5, 3, 0.75}, kLine, 0, 0, 0.5, 2.5, 0.5625},
        // Wholly above the line: the free minimiser t = -1/4 is clamped to P1.
        Case{"ClampedToP1", 3, {0.5, 2, 0.75, 0.5, 6, 0.75}, kLine, 0, 0, 0.0, 2.5, 1.5625},
        // Wholly below: t = 7/4 is clamped to P2, 3 below the line.
        Case{"ClampedToP2", 3, {0.5, -6, 0.75, 0.5, -2, 0.75}, kLine, 0, 0, 1.0, 2.5, 9.5625},
        // Parallel: the midpoint M = (2, 3, 0.75), s = (M - O).U = 4.
        Case{"Parallel", 3, {-1, 3, 0.75, 5, 3, 0.75}, kLine, 1, 4717, 0.5, 4.0, 4.5625},
        Case{"Degenerate", 3, {1.5, 3, 0.75, 1.5, 3, 0.75}, kLine, 1, 4717, 0.5, 3.5, 4.5625},
        // U = (2, 0, 0) is used as given: b = 0, e = 8, f = -5, X = 64 give t = 1/8 and
        // s = 5/4; P(1/8) = (0.5, -0.5, 0.75) lies 1.5 from O + s U = (0.5, 1, 0) in y.
        Case{"DirectionNotNormalised", 3, {0.5, -1, 0.75, 0.5, 3, 0.75}, {2, 0, 0, -2, 1, 0}, 0, 0,
             0.125, 1.25, 2.8125}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on
