// tests/closest/seg_line_test.cpp -- checks for closest/seg_line.cpp (ynoal2).
// The line runs along the first axis through O = (-2, 1, 0) unless a case says otherwise.
#include <gtest/gtest.h>

#include <vector>

#include "closest/closest_api.h"
#include "support/recording_services.h"

namespace {
struct Out {
  std::int32_t result, ierr;
  double dist2, t, s;
};
Out call(std::int32_t n, const std::vector<double>& seg, const std::vector<double>& line) {
  Out o{-1, -1, -9.0, -9.0, -9.0};
  o.result = ynoal2(&n, seg.data(), line.data(), &o.dist2, &o.t, &o.s, &o.ierr);
  return o;
}
const std::vector<double> kLine = {1, 0, 0, -2, 1, 0};
}  // namespace

TEST(Ynoal2, DimensionOneLeavesOutputsAndRecordsNoFrame) {
  RecordedFrames frames;
  const Out o = call(1, {0, 1}, {1, 0});
  EXPECT_EQ(o.result, 1);
  EXPECT_EQ(o.ierr, 4712);
  EXPECT_EQ(o.dist2, -9.0);
  EXPECT_EQ(o.t, -9.0);
  EXPECT_EQ(o.s, -9.0);
  EXPECT_TRUE(frames.empty());
}

struct SegLineCase {
  const char* name;
  std::vector<double> seg;
  std::int32_t result, ierr;
  double t, s, dist2;
};
class Ynoal2Cases : public ::testing::TestWithParam<SegLineCase> {};

TEST_P(Ynoal2Cases, Answer) {
  const SegLineCase& c = GetParam();
  const Out o = call(3, c.seg, kLine);
  EXPECT_EQ(o.result, c.result);
  EXPECT_EQ(o.ierr, c.ierr);
  EXPECT_EQ(o.t, c.t);
  EXPECT_EQ(o.s, c.s);
  EXPECT_EQ(o.dist2, c.dist2);
}

INSTANTIATE_TEST_SUITE_P(
    Table, Ynoal2Cases,
    ::testing::Values(
        // x = 0.5, y from -1 to 3, z = 0.75: passes over the line at (0.5, 1).
        SegLineCase{"Crossing", {0.5, -1, 0.75, 0.5, 3, 0.75}, 0, 0, 0.5, 2.5, 0.5625},
        // Wholly above the line: the free minimiser t = -1/4 is clamped to P1.
        SegLineCase{"ClampedToP1", {0.5, 2, 0.75, 0.5, 6, 0.75}, 0, 0, 0.0, 2.5, 1.5625},
        // Wholly below: t = 7/4 is clamped to P2, which is 3 below the line.
        SegLineCase{"ClampedToP2", {0.5, -6, 0.75, 0.5, -2, 0.75}, 0, 0, 1.0, 2.5, 9.5625},
        // Parallel to the line: the midpoint M = (2, 3, 0.75), s = (M - O).U = 4.
        SegLineCase{"Parallel", {-1, 3, 0.75, 5, 3, 0.75}, 1, 4717, 0.5, 4.0, 4.5625},
        // A point (squared length 0): the same midpoint rule.
        SegLineCase{"Degenerate", {1.5, 3, 0.75, 1.5, 3, 0.75}, 1, 4717, 0.5, 3.5, 4.5625}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(Ynoal2, DirectionIsNotNormalised) {
  // U = (2, 0, 0): with b = 0, e = 8, f = -5 and X = 64 the routine gives t = 1/8 and
  // s = 5/4, half the abscissa of a unit direction; P(1/8) = (0.5, -0.5, 0.75) lies 1.5 from
  // O + s U = (0.5, 1, 0) in y.
  const Out o = call(3, {0.5, -1, 0.75, 0.5, 3, 0.75}, {2, 0, 0, -2, 1, 0});
  EXPECT_EQ(o.result, 0);
  EXPECT_EQ(o.t, 0.125);
  EXPECT_EQ(o.s, 1.25);
  EXPECT_EQ(o.dist2, 2.8125);  // 1.5^2 + 0.75^2
}
