// tests/evaluators/affine_inverse_test.cpp -- checks for evaluators/affine_inverse.cpp: ynaitt.
#include <gtest/gtest.h>

#include "evaluators/evaluators_api.h"
#include "support/recording_services.h"

TEST(Ynaitt, CodesOutputsAndTheOrderOfTheTranslationSum) {
  RecordedFrames frames;
  const double h = 0x1p-53;
  const std::vector<double> z(441, 0.0), z21(21, 0.0), u21(21, -9.0);
  // Expected m and c: -9 untouched; m empty: not looked at. Kind 0: M = A^T, c = -A^T b, for a
  // quarter turn about z, then a singular A that is not looked at: c(1) = (-1 - h) - h = -1
  // with h = 2^-53 (ties to even), where -1 - (h + h) would be -1 - 2^-52.
  // clang-format off
  const struct { std::int32_t n, kind, code; std::vector<double> a, b, m, c; } cases[] = {
      {0, 5, 4712, {}, {}, {-9}, {-9}}, {1, 2, 4718, {}, {}, {-9}, {-9}},  // n before the kind
      {1, 1, 0, {2}, {4}, {0.5}, {-2}},
      {2, -3, 0, {2, 0, 0, 4}, {1, 1}, {0.5, 0, 0, 0.25}, {-0.5, -0.25}},
      {3, 0, 0, {0, 1, 0, -1, 0, 0, 0, 0, 1}, {1, 2, 3}, {0, -1, 0, 1, 0, 0, 0, 0, 1}, {-2, 1, -3}},
      {3, 0, 0, {1, h, h, 1, h, h, 0, 0, 0}, {1, 1, 1}, {1, 1, 0, h, h, 0, h, h, 0}, {-1, -1, 0}},
      {3, 1, 4703, {1, 2, 3, 2, 4, 6, 0, 1, 1}, {1, 2, 3}, {}, {-9, -9, -9}},  // ynmimr's code
      {21, 1, 4718, z, z21, {}, u21}, {21, 0, 0, z, z21, z, z21}};  // no capacity for kind 0
  // clang-format on
  for (const auto& c : cases) {
    std::int32_t n = c.n, kind = c.kind, ierr = -1;
    std::vector<double> m(std::max(n * n, 1), -9.0), t(std::max(n, 1), -9.0);
    const int r = ynaitt(&n, c.a.data(), c.b.data(), &kind, m.data(), t.data(), &ierr);
    EXPECT_TRUE(r == !!c.code && ierr == c.code && t == c.c && (c.m.empty() || m == c.m))
        << &c - cases;
  }
  EXPECT_TRUE(frames.empty());
}
