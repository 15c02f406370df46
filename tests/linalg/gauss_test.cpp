// tests/linalg/gauss_test.cpp -- checks for linalg/gauss.cpp: ynsega, ynsetr, yntrzr, yntrnr.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>
#include <vector>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"
#include "support/recording_services.h"

namespace {
const double kNaN = std::numeric_limits<double>::quiet_NaN();
const double kUp38 = std::nextafter(1e-38, 1.0), kUp30 = std::nextafter(1e-30, 1.0);

struct SegaCase {
  std::int32_t n;
  std::vector<double> a, b;  // a by columns
  std::int32_t code;         // 0: success with x = want
  std::vector<double> want;
};
class YnsegaTable : public testing::TestWithParam<SegaCase> {};
}  // namespace

TEST_P(YnsegaTable, ResultCodeAndSolution) {
  RecordedFrames frames;
  const SegaCase& c = GetParam();
  std::int32_t n = c.n, ierr = -1;
  std::vector<double> x(c.b.size(), -7.5);
  EXPECT_EQ(ynsega(&n, c.a.empty() ? nullptr : c.a.data(), c.b.data(), x.data(), &ierr),
            c.code == 0 ? 0 : 1);
  EXPECT_EQ(ierr, c.code);
  for (std::size_t i = 0; i < x.size(); ++i) {  // failures leave x untouched
    const double want = c.code ? -7.5 : c.want[i];
    EXPECT_TRUE(x[i] == want || (std::isnan(x[i]) && std::isnan(want))) << i;
  }
  EXPECT_TRUE(frames.empty());
}
INSTANTIATE_TEST_SUITE_P(
    Cases, YnsegaTable,
    testing::Values(
        SegaCase{0, {}, {1}, 4712, {}}, SegaCase{21, {}, {1}, 4718, {}},  // A not read
        SegaCase{1, {2}, {4}, 0, {2}},                                     // no elimination step
        SegaCase{1, {1e-30}, {4}, 4703, {}},                   // last pivot <= 1e-30 ...
        SegaCase{1, {-kUp30}, {4}, 0, {4 / -kUp30}},           // ... one ulp above passes
        SegaCase{2, {1e-35, 0, 0, 1e-35}, {1, 1}, 4703, {}},  // search passes, last pivot fails
        // A NaN is never a pivot, so only the search (<= 1e-38, inclusive) stops these.
        SegaCase{2, {1e-38, 0, 0, kNaN}, {1, 1}, 4703, {}},
        SegaCase{2, {kUp38, 0, 0, kNaN}, {1, 1}, 0, {kNaN, kNaN}},
        SegaCase{2, {0, 1, 1, 0}, {3, 5}, 0, {5, 3}}));  // both exchanges, permutation undone

TEST(Ynsega, TiesGoToTheLowestRowThenColumnAndBackSubstitutionSumsFirst) {
  // Magnitude 5 at (1,3), (2,2), (3,1), (3,3): the row-major first, (1,3), is the pivot.
  // Bits from a plain transcription of the elimination in Python. Taking the column-major
  // first, (3,1), or the last, changes the last bits, and so does accumulating the back
  // substitution as b(i) - a(i,j) x(j) - ... instead of b(i) - (sum): x(3) ends ...cbe3.
  std::int32_t n = 3, ierr = -1;
  const std::vector<double> a = by_columns(3, {3, 2, 5, 1, -5, 2, 5, 3, 5}), a0 = a;
  double b[3] = {0.1, 0.7, 0.3};
  ASSERT_EQ(ynsega(&n, a.data(), b, b, &ierr), 0);  // x is the same array as b
  EXPECT_EQ(bits(b[0]), bits(0x1.46f61e8a546f6p-3));
  EXPECT_EQ(bits(b[1]), bits(-0x1.e8a546f61e8a6p-4));
  EXPECT_EQ(bits(b[2]), bits(-0x1.cbe6d9601cbe5p-6));
  EXPECT_EQ(a, a0);  // the caller's matrix is only read
}

TEST(Ynsega, RandomWellConditionedSystemsHaveSmallResiduals) {
  const std::uint64_t seed = test_seed();
  SCOPED_TRACE(testing::Message() << "ORVQ7_SEED=" << seed);
  std::mt19937_64 rng(seed);
  for (std::int32_t n = 1; n <= 20; ++n) {
    for (int rep = 0; rep < 20; ++rep) {
      const std::vector<double> a = dominant_matrix(rng, n, rep % 2 ? -1 : 1), b = sample(rng, n);
      std::vector<double> x(n);
      std::int32_t ierr = -1;
      ASSERT_EQ(ynsega(&n, a.data(), b.data(), x.data(), &ierr), 0);
      for (std::int32_t i = 0; i < n; ++i) {
        long double r = -static_cast<long double>(b[i]), scale = std::fabs(b[i]);
        for (std::int32_t j = 0; j < n; ++j) {
          r += static_cast<long double>(a[i + j * n]) * x[j];
          scale += std::fabs(a[i + j * n] * x[j]);
        }
        EXPECT_LE(std::fabs(static_cast<double>(r)), 1e-14 * scale) << "n=" << n << " i=" << i;
      }
    }
  }
}

TEST(Ynsetr, ErrorsThresholdsAndNoPivoting) {
  std::int32_t n = 0, ierr = -1;
  double d[2] = {0, 1}, a[2] = {0, 1}, c[2] = {1, 0}, r[2] = {1, 1}, x[2] = {-2, -2};
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  n = 2;  // [0 1; 1 1] is regular, but its first pivot is 0
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  d[0] = std::nextafter(1e-15, 0.0);  // strict: one ulp below 1e-15 fails, 1e-15 passes
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 1);
  EXPECT_EQ(x[0], -2.0);
  d[0] = 1e-15;
  EXPECT_EQ(ynsetr(&n, d, a, c, r, x, &ierr), 0);
  double d2[2] = {1, 2}, c2[2] = {2, 0};  // beta(2) = 2 - 1 * (2 / 1) = 0: x(1) is written
  x[1] = -2;
  EXPECT_EQ(ynsetr(&n, d2, a, c2, r, x, &ierr), 1);
  EXPECT_EQ(ierr, 4703);
  EXPECT_EQ(x[0], 1.0);
  EXPECT_EQ(x[1], -2.0);
  // Rows 2x1 + 2x2 = 10, x1 + 4x2 + 4x3 = -11, -2x2 + 0.5x3 = -11.5: solution (1, 4, -7).
  n = 3;
  double d3[3] = {2, 4, 0.5}, a3[3] = {99, 1, -2}, c3[3] = {2, 4, 99}, r3[3] = {10, -11, -11.5};
  ASSERT_EQ(ynsetr(&n, d3, a3, c3, r3, r3, &ierr), 0);  // x is the same array as r
  EXPECT_NEAR(r3[0], 1.0, 1e-14);
  EXPECT_NEAR(r3[1], 4.0, 1e-14);
  EXPECT_NEAR(r3[2], -7.0, 1e-14);
}

TEST(Ynsetr, AboveTwentyUnknownsOneWorkspaceBlockIsReleasedOnEveryPath) {
  const std::int32_t big = 25;
  std::vector<double> d(big, 4.0), a(big, 1.0), c(big, 1.0), r(big, 1.0), x(big, -1.0);
  for (std::int32_t n : {20, 25}) {
    std::int32_t ierr = -1;
    WorkspaceWatch ws;
    ws.refuse_next(1);  // refused: code 36 above 20, unused at 20
    EXPECT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), n > 20);
    EXPECT_EQ(ierr, n > 20 ? 36 : 0);
    ws.refuse_next(0);
    ASSERT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 0);
    for (std::int32_t i = 0; i < n; ++i) {
      const double lo = i > 0 ? x[i - 1] : 0.0, hi = i + 1 < n ? x[i + 1] : 0.0;
      EXPECT_NEAR(lo + 4.0 * x[i] + hi, 1.0, 1e-14);
    }
    a[n - 1] = 0.0;  // the last pivot becomes d(n) = 1e-16: fails late
    d[n - 1] = 1e-16;
    EXPECT_EQ(ynsetr(&n, d.data(), a.data(), c.data(), r.data(), x.data(), &ierr), 1);
    EXPECT_EQ(ierr, 4703);
    EXPECT_EQ(ws.outstanding(), 0);
    EXPECT_EQ(ws.requests(), n > 20 ? 3 : 0);
    d.assign(big, 4.0);
    a.assign(big, 1.0);
  }
}

TEST(Yntrzr, ErrorsAndTheInclusiveAbsoluteAndRelativeRules) {
  const double t = 0.3, up = std::nextafter(t, 1.0), half = 0.5;
  std::int32_t n = 0, mode = 0, ierr = -1;
  double v[4] = {-t, up, -0x1p-70, 2.5}, w[4] = {-3, -3, -3, -3};
  EXPECT_EQ(yntrzr(&n, v, &t, &mode, w, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  n = 4;
  for (std::int32_t bad : {-1, 3}) {
    mode = bad;
    EXPECT_EQ(yntrzr(&n, v, &t, &mode, w, &ierr), 1);
    EXPECT_EQ(ierr, 4718);
  }
  EXPECT_EQ(w[0], -3.0);
  mode = 0;
  ASSERT_EQ(yntrzr(&n, v, &t, &mode, w, &ierr), 0);
  const double absolute[4] = {0.0, up, 0.0, 2.5};  // zeros are +0, also for negative inputs
  for (int i = 0; i < 4; ++i) EXPECT_EQ(bits(w[i]), bits(absolute[i])) << i;
  mode = 2;  // limit = 0.5 * 4 = 2
  double r[4] = {2.0, -4.0, std::nextafter(2.0, 3.0), -1.0};
  ASSERT_EQ(yntrzr(&n, r, &half, &mode, r, &ierr), 0);  // in place
  const double relative[4] = {0.0, -4.0, std::nextafter(2.0, 3.0), 0.0};
  for (int i = 0; i < 4; ++i) EXPECT_EQ(r[i], relative[i]) << i;
}

TEST(Yntrzr, GapRuleCutsAtTheFirstJumpAndKeepsTiesInIndexOrder) {
  const struct {
    double tol;
    std::vector<double> v, want;
  } cases[] = {
      {1e-15, {1, 1e-20, 0.5}, {1, 0, 0.5}},   // order 1, 0.5, 1e-20: cut before 1e-20
      {0.5, {0.5, -1, 0.25}, {0.5, -1, 0.25}},  // strict: 1 * 0.5 > 0.5 is false, no cut
      {2.0, {0.5, -0.5, 0.25}, {0.5, 0, 0}},    // cut at position 2: the tie keeps index 1
      {2.0, {0.25, -0.5, 0.5}, {0, -0.5, 0}},   // and here index 2
  };
  for (const auto& c : cases) {
    std::int32_t n = 3, mode = 1, ierr = -1;
    std::vector<double> w(3);
    ASSERT_EQ(yntrzr(&n, c.v.data(), &c.tol, &mode, w.data(), &ierr), 0);
    EXPECT_EQ(w, c.want);
  }
}

TEST(Yntrzr, GapRuleAbove100ComponentsUsesTheWorkspace) {
  std::int32_t n = 150, mode = 1, ierr = -1;
  std::vector<double> v(n), w(n, -1.0);
  for (std::int32_t i = 0; i < n; ++i) v[i] = (i % 3 - 1) * (1.0 + i);  // 0 at i = 1, 4, ...
  v[1] = 0.1;  // magnitudes ..., 3, 1, 0.1, 0, ...: the first jump (1 * 0.25 > 0.1) cuts 0.1
  const double tol = 0.25;
  WorkspaceWatch ws;
  ws.refuse_next(1);
  EXPECT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 1);
  EXPECT_EQ(ierr, 36);
  EXPECT_EQ(w[0], -1.0);
  ASSERT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 0);
  for (std::int32_t i = 0; i < n; ++i) EXPECT_EQ(w[i], i == 1 ? 0.0 : v[i]) << i;
  n = 100;
  ASSERT_EQ(yntrzr(&n, v.data(), &tol, &mode, w.data(), &ierr), 0);
  EXPECT_EQ(ws.requests(), 2);
  EXPECT_EQ(ws.outstanding(), 0);
}

TEST(Yntrnr, ThreeNormsZeroVectorAndBadArguments) {
  std::int32_t n = 2, ierr = -1;
  const double v[2] = {3, -4};
  double w[2], norm = 0;
  const double norms[3] = {4.0, 7.0, 5.0};  // max, sum, Euclidean
  for (std::int32_t mode = 0; mode < 3; ++mode) {
    ASSERT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 0);
    EXPECT_EQ(norm, norms[mode]);
    EXPECT_EQ(w[0], 3.0 / norms[mode]);
    EXPECT_EQ(w[1], -4.0 / norms[mode]);
  }
  const double huge[2] = {1e200, -1e200};  // no scaling: the squares overflow
  std::int32_t mode = 2;
  ASSERT_EQ(yntrnr(&n, huge, &mode, w, &norm, &ierr), 0);
  EXPECT_TRUE(std::isinf(norm));
  EXPECT_EQ(bits(w[1]), bits(-0.0));
  const double zero[2] = {0, -0.0};
  w[0] = 5;
  EXPECT_EQ(yntrnr(&n, zero, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4710);
  EXPECT_EQ(norm, 0.0);
  EXPECT_EQ(w[0], 5.0);
  mode = 7;
  norm = 9;
  EXPECT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4718);
  EXPECT_EQ(norm, 0.0);
  n = 0;
  norm = 9;
  EXPECT_EQ(yntrnr(&n, v, &mode, w, &norm, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(norm, 9.0);
}
