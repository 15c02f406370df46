// tests/closest/point_seg_test.cpp -- checks for closest/point_seg.cpp (ynoapl).
#include <gtest/gtest.h>

#include <vector>

#include "closest/closest_api.h"
#include "support/recording_services.h"

namespace {
struct Case {
  const char* name;
  std::int32_t n;
  std::vector<double> x, seg;
  std::int32_t result, ierr;
  double t, dist2;
};
class YnoaplCases : public ::testing::TestWithParam<Case> {};
}  // namespace

TEST_P(YnoaplCases, Answer) {
  const Case& c = GetParam();
  RecordedFrames frames;
  std::int32_t n = c.n, ierr = -1;
  double dist2 = -9.0, t = -9.0;
  EXPECT_EQ(ynoapl(&n, c.x.data(), c.seg.data(), &dist2, &t, &ierr), c.result);
  EXPECT_EQ(ierr, c.ierr);
  EXPECT_EQ(bits(t), bits(c.t));
  EXPECT_EQ(bits(dist2), bits(c.dist2));
  EXPECT_TRUE(frames.empty());
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Table, YnoaplCases,
    ::testing::Values(
        // n = 0: only the code is written.
        Case{"NoDimension", 0, {1}, {0, 1}, 1, 4712, -9.0, -9.0},
        // Along the first axis from (0.5, 0.25, -1.5), length 4: behind S1, inside, beyond S2.
        Case{"Behind", 3, {-1.5, 2.25, -1.5}, {0.5, 0.25, -1.5, 4.5, 0.25, -1.5}, 0, 0, 0.0, 8.0},
        Case{"Inside", 3, {1.5, -0.75, 0.5}, {0.5, 0.25, -1.5, 4.5, 0.25, -1.5}, 0, 0, 0.25, 5.0},
        Case{"Beyond", 3, {5.5, 0.25, -3.5}, {0.5, 0.25, -1.5, 4.5, 0.25, -1.5}, 0, 0, 1.0, 5.0},
        // X = S2 = 0.9, S1 = 0.2: p = L, so t = p / L = 1 and the point is
        // 0.2 + (0.9 - 0.2) = 0x1.cccccccccccccp-1, one ulp (2^-53) below S2: dist2 = 2^-106
        // where the end point itself would give 0.
        Case{"ProjectionOnTheEnd", 1, {0.9}, {0.2, 0.9}, 0, 0, 1.0, 0x1p-106},
        // S1 = S2: p = 0 is not behind, so the length test gives the midpoint with 4717.
        Case{"Degenerate", 2, {1.5, -2.0}, {-0.5, 1.0, -0.5, 1.0}, 1, 4717, 0.5, 13.0},
        // Squared length 2^-100 but X behind S1 (p < 0): answered from S1 with code 0.
        Case{"DegenerateBehind", 2, {1.5, -2.0}, {-0.5, 1.0, -0.5 - 0x1p-50, 1.0}, 0, 0, 0.0,
             13.0}),
    [](const auto& info) { return std::string(info.param.name); });
// clang-format on
