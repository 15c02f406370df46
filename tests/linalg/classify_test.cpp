// tests/linalg/classify_test.cpp -- checks for linalg/classify.cpp: ynmnmr and wnmnm1..4.
#include <gtest/gtest.h>

#include <set>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"

namespace {
std::int32_t answer(std::int32_t n, const std::vector<double>& a, std::vector<std::int32_t> codes) {
  std::int32_t m = static_cast<std::int32_t>(codes.size()), index = -1, ierr = -1;
  EXPECT_EQ(ynmnmr(&n, a.data(), &m, codes.data(), &index, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  return index;
}

std::vector<double> diag(std::vector<double> d) {
  std::vector<double> a(d.size() * d.size(), 0.0);
  for (std::size_t i = 0; i < d.size(); ++i) a[i * (d.size() + 1)] = d[i];
  return a;
}
}  // namespace

TEST(Ynmnmr, LevelWordsOfEachKindAndTheNarrowestAcceptedWins) {
  // clang-format off
  const struct { std::int32_t n; std::vector<double> a; std::set<std::int32_t> words; } cases[] = {
      {3, diag({1, 1, 1}), {0x102, 0x1103, 0x11104, 0x111105}},
      {3, diag({3, 3, 3}), {0x102, 0x2103, 0x12104}},
      {2, {0.6, 0.8, -0.8, 0.6}, {0x102, 0x1103, 0x11104}},        // rotation 3-4-5
      {3, {0, 1, 0, 0, 0, 1, 1, 0, 0}, {0x102, 0x1103, 0x11104}},  // cyclic permutation
      {3, diag({1, 1, -1}), {0x102, 0x1103, 0x21104}},             // reflection
      {2, {0, 2, -2, 0}, {0x102, 0x2103}},  // similarities: scaled by 1/sqrt|D| ...
      {3, {0, 2, 0, 0, 0, 2, 2, 0, 0}, {0x102, 0x2103}},  // ... and by |D|^(-1/3)
      {3, diag({1, 1, 4}), {0x102, 0x3103}}, {2, {1, 0, 1, 1}, {0x102}} /* shear */,
      {2, {1, 0, -2, -1}, {0x102, 0x3103}},  // -I + 2P, P oblique: det -1, not orthogonal
      {2, {0, 0, 0, 0}, {0x202, 0x1203}}, {3, diag({1, 1, 0}), {0x202, 0x2203}},
      {2, {2, 0, 0, 0}, {0x202}},
      // diag(d, 1): det 2^-40 < 1e-12 is singular, and a projector within tolerance; a
      // determinant of exactly 1e-12 is regular, an affinity with lambda = 1e-12 (|lambda|
      // < 1e-12 is strict too).
      {2, {0x1p-40, 0, 0, 1}, {0x202, 0x2203}}, {2, {-0x1p-40, 0, 0, 1}, {0x202, 0x2203}},
      {2, {0.25e-12, 0, 0, 2}, {0x202}}, {2, {1e-12, 0, 0, 1}, {0x102, 0x3103}},
      // det 1 + 2^-40 is within 1e-12 of 1, but a column of length^2 1 + 2^-39 is not
      // orthonormal, and no element of A - I exceeds 1e-12: no ratio, no affinity.
      {2, {1 + 0x1p-40, 0, 0, 1}, {0x102}}};
  // clang-format on
  for (const auto& c : cases) {
    std::set<std::int32_t> found;  // a code offered alone is accepted exactly when it is a word
    for (std::int32_t k : {0x102, 0x202, 0x1103, 0x2103, 0x3103, 0x1203, 0x2203, 0x11104, 0x21104,
                           0x12104, 0x111105})
      if (answer(c.n, c.a, {k}) == 1) found.insert(k);
    EXPECT_EQ(found, c.words) << &c - cases;
  }
  // The narrowest accepted kind wins, at the first position of its word. A level not
  // reached has the word 0, searched from level 4 down, so it matches an accepted 0.
  const std::vector<double> id = diag({1, 1, 1});
  EXPECT_EQ(answer(3, id, {0x11104, 0x111105}), 2);
  EXPECT_EQ(answer(3, id, {0x1103, 0x1103}), 1);
  EXPECT_EQ(answer(3, id, {0x2103}), 0);
  EXPECT_EQ(answer(3, id, {}), 0);
  EXPECT_EQ(answer(2, {2, 0, 0, 0}, {0x202, 0}), 2);
  EXPECT_EQ(answer(2, {1, 0, 0, 1}, {0, 0x102}), 2);
}

TEST(Wnmnm, FlagsTolerancesAndOrders) {
  RecordedFrames frames;
  const double up12 = std::nextafter(1e-12, 1.0);
  // |a11 - 1| < 1e-12: 4503 * 2^-52 = 0.99987e-12 is the identity, 4504 * 2^-52 is not.
  const double in = 1 + 4503 * 0x1p-52, out = 1 + 4504 * 0x1p-52;
  const std::vector<double> z(441, 0.0);
  using Check = std::int32_t (*)(const std::int32_t*, const double*, std::int32_t*, std::int32_t*);
  struct Case {
    Check test;
    std::int32_t n;
    std::vector<double> a;
    std::int32_t flag, code = 0;
  };
  // clang-format off
  std::vector<Case> cases = {
      // Orders 2 to 20: outside 4712 and the flag untouched (-7). The zero matrix of order
      // 20: a multiple of the identity, columns not orthonormal, the zero map, B = -I gives
      // ratios -0 that never fix lambda, so no affinity.
      {wnmnm1, 1, z, -7, 4712}, {wnmnm2, 1, z, -7, 4712}, {wnmnm3, 1, z, -7, 4712},
      {wnmnm4, 1, z, -7, 4712}, {wnmnm1, 21, z, -7, 4712}, {wnmnm2, 21, z, -7, 4712},
      {wnmnm3, 21, z, -7, 4712}, {wnmnm4, 21, z, -7, 4712},
      {wnmnm1, 20, z, 2}, {wnmnm2, 20, z, 0}, {wnmnm3, 20, z, 1}, {wnmnm4, 20, z, 0},
      {wnmnm1, 3, diag({-2.5, -2.5, -2.5}), 2}, {wnmnm1, 3, diag({1, 1, 2}), 0},
      {wnmnm1, 2, {in, 0, 0, in}, 1}, {wnmnm1, 2, {out, 0, 0, out}, 2},
      {wnmnm2, 2, {1, 0, 0, 1 + 0x1p-39}, 0},  // |c|^2 - 1 = 2^-38 + ...
      {wnmnm2, 2, {1, 0, 0, 1 + 0x1p-41}, 1},  // 2^-40 + 2^-82 < 1e-12
      // Zero map: at most 1e-12. Just above: A A (about 1e-24) is within 1e-12 of A, a
      // projector; at 2e-12 the difference is above 1e-12.
      {wnmnm3, 2, {1e-12, -1e-12, 0, 1e-12}, 1}, {wnmnm3, 2, {up12, 0, 0, 0}, 2},
      {wnmnm3, 2, {2e-12, 0, 0, 0}, 0}, {wnmnm3, 2, {1, 0, 1, 0}, 2} /* (x + y, 0) */,
      {wnmnm4, 2, {0.5, 0, 0, 1}, 1} /* lambda 0.5 */, {wnmnm4, 2, {1, 0, 0, 1}, 0} /* no ratio */,
      {wnmnm4, 2, {2, 0, 0, 2}, 0} /* P = 0 */, {wnmnm4, 2, {2, 0, 0, 0.5}, 0} /* 2 and 0.5 */,
      {wnmnm4, 2, {0, 0, 0, 1}, 0} /* lambda 0 */,
      // Ten ones and ten fives on the diagonal: lambda 5, P the projector on the first ten axes.
      {wnmnm4, 20, diag({1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 5, 5, 5, 5, 5, 5, 5, 5, 5, 5}), 1}};
  // clang-format on
  for (int at : {1, 2, 3, 5, 6, 7}) {  // off the diagonal 1e-12 is "at most", the next is not
    cases.push_back({wnmnm1, 3, diag({2, 2, 2}), 2});
    cases.back().a[at] = 1e-12;
    cases.push_back({wnmnm1, 3, diag({2, 2, 2}), 0});
    cases.back().a[at] = -up12;
  }
  for (const Case& c : cases) {
    std::int32_t n = c.n, flag = -7, ierr = -1;
    EXPECT_TRUE(c.test(&n, c.a.data(), &flag, &ierr) == !!c.code && ierr == c.code &&
                flag == c.flag)
        << &c - &cases[0];
  }
  for (std::int32_t n : {1, 4, 0}) {  // ynmnmr takes orders 2 and 3 only
    std::int32_t index = -7, ierr = -1, m = 1, code = 0x102;
    EXPECT_TRUE(ynmnmr(&n, z.data(), &m, &code, &index, &ierr) == 1 && ierr == 4712 && index == -7);
  }
  EXPECT_TRUE(frames.empty());
}
