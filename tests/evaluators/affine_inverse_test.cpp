// tests/evaluators/affine_inverse_test.cpp -- checks for evaluators/affine_inverse.cpp: ynaitt.
#include <gtest/gtest.h>

#include <vector>

#include "evaluators/evaluators_api.h"
#include "support/recording_services.h"

namespace {
struct Inverse {
  int result;
  std::int32_t ierr;
  std::vector<double> m, c;  // -9 where not written
};
Inverse invert(std::int32_t n, const std::vector<double>& a, const std::vector<double>& b,
               std::int32_t kind) {
  Inverse r{0, -1, std::vector<double>(n > 0 ? n * n : 1, -9.0), std::vector<double>(n > 0 ? n : 1, -9.0)};
  r.result = ynaitt(&n, a.empty() ? nullptr : a.data(), b.empty() ? nullptr : b.data(), &kind,
                    r.m.data(), r.c.data(), &r.ierr);
  return r;
}
}  // namespace

TEST(Ynaitt, ArgumentErrorsAreCheckedNThenKindAndLeaveTheOutputs) {
  RecordedFrames frames;
  const Inverse bad_n = invert(0, {}, {}, 5);
  EXPECT_EQ(bad_n.ierr, 4712);  // n before the kind
  for (std::int32_t kind : {2, 7}) {
    const Inverse r = invert(1, {}, {}, kind);
    EXPECT_EQ(r.result, 1);
    EXPECT_EQ(r.ierr, 4718);
    EXPECT_EQ(r.m[0], -9.0);
    EXPECT_EQ(r.c[0], -9.0);
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Ynaitt, GeneralKindInvertsAndNegativeKindsTakeTheSamePath) {
  const Inverse one = invert(1, {2}, {4}, 1);
  EXPECT_EQ(one.m, std::vector<double>{0.5});
  EXPECT_EQ(one.c, std::vector<double>{-2.0});
  const Inverse diag = invert(2, {2, 0, 0, 4}, {1, 1}, -3);
  EXPECT_EQ(diag.m, (std::vector<double>{0.5, 0, 0, 0.25}));
  EXPECT_EQ(diag.c, (std::vector<double>{-0.5, -0.25}));
}

TEST(Ynaitt, OrthogonalKindTransposesAndAccumulatesTheTranslationByColumns) {
  // Quarter turn about z: M = A^T and c = -A^T b = -(2, -1, 3).
  const Inverse turn = invert(3, {0, 1, 0, -1, 0, 0, 0, 0, 1}, {1, 2, 3}, 0);
  EXPECT_EQ(turn.m, (std::vector<double>{0, -1, 0, 1, 0, 0, 0, 0, 1}));
  EXPECT_EQ(turn.c, (std::vector<double>{-2, 1, -3}));
  // A singular matrix is not looked at: c(1) = (-1 - h) - h = -1 with h = 2^-53 (ties to
  // even), where -1 - (h + h) would be -1 - 2^-52.
  const double h = 0x1p-53;
  const Inverse odd = invert(3, {1, h, h, 1, h, h, 0, 0, 0}, {1, 1, 1}, 0);
  EXPECT_EQ(odd.result, 0);
  EXPECT_EQ(odd.c[0], -1.0);
  EXPECT_EQ(odd.m[3], h);  // M(1,2) = A(2,1)
}

TEST(Ynaitt, InversionFailuresKeepTheCodeOfTheInversion) {
  const Inverse singular = invert(3, {1, 2, 3, 2, 4, 6, 0, 1, 1}, {1, 2, 3}, 1);
  EXPECT_EQ(singular.result, 1);
  EXPECT_EQ(singular.ierr, 4703);
  EXPECT_EQ(singular.c[0], -9.0);
  std::vector<double> identity(21 * 21, 0.0), ones(21, 1.0);
  for (int i = 0; i < 21; ++i) identity[i + 21 * i] = 1.0;
  EXPECT_EQ(invert(21, identity, ones, 1).ierr, 4718);
  const Inverse big = invert(21, identity, ones, 0);  // no capacity on the orthogonal path
  EXPECT_EQ(big.result, 0);
  EXPECT_EQ(big.c[20], -1.0);
}
