// tests/linalg/classify_test.cpp -- checks for linalg/classify.cpp.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <set>
#include <vector>

#include "linalg/linalg_api.h"
#include "support/recording_services.h"

namespace {

const std::int32_t kAllKinds[11] = {0x102,   0x202,   0x1103,  0x2103,  0x3103,  0x1203,
                                    0x2203,  0x11104, 0x21104, 0x12104, 0x111105};

// The level words of a matrix, found by offering each kind code alone: a code is accepted
// (index 1) exactly when it is one of the words.
std::set<std::int32_t> kinds(std::int32_t n, const std::vector<double>& a) {
  std::set<std::int32_t> found;
  for (std::int32_t c : kAllKinds) {
    std::int32_t m = 1, index = -1, ierr = -1;
    EXPECT_EQ(ynmnmr(&n, a.data(), &m, &c, &index, &ierr), 0);
    EXPECT_EQ(ierr, 0);
    if (index == 1) found.insert(c);
  }
  return found;
}

std::int32_t answer(std::int32_t n, const std::vector<double>& a,
                    const std::vector<std::int32_t>& codes) {
  std::int32_t m = static_cast<std::int32_t>(codes.size()), index = -1, ierr = -1;
  EXPECT_EQ(ynmnmr(&n, a.data(), &m, codes.data(), &index, &ierr), 0);
  return index;
}

std::int32_t flag_of(std::int32_t (*test)(const std::int32_t*, const double*, std::int32_t*,
                                          std::int32_t*),
                     std::int32_t n, const std::vector<double>& a) {
  std::int32_t flag = -1, ierr = -1;
  EXPECT_EQ(test(&n, a.data(), &flag, &ierr), 0);
  EXPECT_EQ(ierr, 0);
  return flag;
}

std::vector<double> diagonal(const std::vector<double>& d) {
  const std::size_t n = d.size();
  std::vector<double> a(n * n, 0.0);
  for (std::size_t i = 0; i < n; ++i) a[i * (n + 1)] = d[i];
  return a;
}

struct KindCase {
  const char* name;
  std::int32_t n;
  std::vector<double> a;  // by columns
  std::set<std::int32_t> words;
};

class YnmnmrKinds : public ::testing::TestWithParam<KindCase> {};

}  // namespace

TEST_P(YnmnmrKinds, LevelWordsOfEachKind) {
  const KindCase& k = GetParam();
  EXPECT_EQ(kinds(k.n, k.a), k.words) << k.name;
}

INSTANTIATE_TEST_SUITE_P(
    Table, YnmnmrKinds,
    ::testing::Values(
        KindCase{"identity 2", 2, {1, 0, 0, 1}, {0x102, 0x1103, 0x11104, 0x111105}},
        KindCase{"identity 3", 3, diagonal({1, 1, 1}), {0x102, 0x1103, 0x11104, 0x111105}},
        KindCase{"2 I", 2, {2, 0, 0, 2}, {0x102, 0x2103, 0x12104}},
        KindCase{"3 I", 3, diagonal({3, 3, 3}), {0x102, 0x2103, 0x12104}},
        KindCase{"rotation 90", 2, {0, 1, -1, 0}, {0x102, 0x1103, 0x11104}},
        KindCase{"rotation 3-4-5", 2, {0.6, 0.8, -0.8, 0.6}, {0x102, 0x1103, 0x11104}},
        KindCase{"reflection", 2, {1, 0, 0, -1}, {0x102, 0x1103, 0x21104}},
        KindCase{"reflection 3", 3, diagonal({1, 1, -1}), {0x102, 0x1103, 0x21104}},
        KindCase{"cyclic permutation", 3, {0, 1, 0, 0, 0, 1, 1, 0, 0}, {0x102, 0x1103, 0x11104}},
        KindCase{"2 rotation 90", 2, {0, 2, -2, 0}, {0x102, 0x2103}},
        KindCase{"2 permutation", 3, {0, 2, 0, 0, 0, 2, 2, 0, 0}, {0x102, 0x2103}},
        KindCase{"(x, 3y)", 2, {1, 0, 0, 3}, {0x102, 0x3103}},
        KindCase{"(x, y, 4z)", 3, diagonal({1, 1, 4}), {0x102, 0x3103}},
        // -I + 2P, P the projection onto the x axis along (1, 1): det -1, not orthogonal.
        KindCase{"oblique reflection", 2, {1, 0, -2, -1}, {0x102, 0x3103}},
        KindCase{"shear", 2, {1, 0, 1, 1}, {0x102}},
        KindCase{"zero", 2, {0, 0, 0, 0}, {0x202, 0x1203}},
        KindCase{"projection (x, 0)", 2, {1, 0, 0, 0}, {0x202, 0x2203}},
        KindCase{"projection 3", 3, diagonal({1, 1, 0}), {0x202, 0x2203}},
        KindCase{"singular", 2, {2, 0, 0, 0}, {0x202}}),
    [](const auto& info) {
      std::string s = info.param.name;
      for (char& c : s) c = std::isalnum(static_cast<unsigned char>(c)) ? c : '_';
      return s;
    });

TEST(Ynmnmr, NarrowestAcceptedKindWins) {
  const std::vector<double> id = diagonal({1, 1, 1});
  EXPECT_EQ(answer(3, id, {0x11104, 0x111105}), 2);
  EXPECT_EQ(answer(3, id, {0x1103}), 1);
  EXPECT_EQ(answer(3, id, {0x102, 0x1103}), 2);
  EXPECT_EQ(answer(3, id, {0x2103}), 0);
  EXPECT_EQ(answer(3, id, {0x1103, 0x1103}), 1);  // the first position of a level's word
  EXPECT_EQ(answer(3, id, {}), 0);
}

TEST(Ynmnmr, ALevelNotReachedMatchesAnAcceptedZero) {
  // diag(2, 0): level 1 only. Level 4's word 0 is searched first and matches the 0.
  EXPECT_EQ(answer(2, {2, 0, 0, 0}, {0x202, 0}), 2);
  // The identity reaches level 4, so the 0 is never matched.
  EXPECT_EQ(answer(2, {1, 0, 0, 1}, {0, 0x102}), 2);
}

TEST(Ynmnmr, DeterminantThresholdsAreStrict) {
  // diag(d, 1): det d. 2^-40 < 1e-12 is singular, and a projector within tolerance
  // (|2^-80 - 2^-40| < 1e-12); diag(0.25e-12, 2) is singular and no projector. det = 1e-12
  // exactly is regular: an affinity with lambda = 1e-12 (|lambda| < 1e-12 is strict too).
  EXPECT_EQ(kinds(2, {0x1p-40, 0, 0, 1}), (std::set<std::int32_t>{0x202, 0x2203}));
  EXPECT_EQ(kinds(2, {-0x1p-40, 0, 0, 1}), (std::set<std::int32_t>{0x202, 0x2203}));
  EXPECT_EQ(kinds(2, {0.25e-12, 0, 0, 2}), (std::set<std::int32_t>{0x202}));
  EXPECT_EQ(kinds(2, {1e-12, 0, 0, 1}), (std::set<std::int32_t>{0x102, 0x3103}));
  // det = 1 + 2^-40 is within 1e-12 of 1: wnmnm2 sees a column of length^2 1 + 2^-39
  // (|d| = 1.8e-12 > 1e-12), not orthonormal; and no element of B = A - I exceeds 1e-12,
  // so no ratio is found and it is no affinity: no level 2.
  EXPECT_EQ(kinds(2, {1 + 0x1p-40, 0, 0, 1}), (std::set<std::int32_t>{0x102}));
}

TEST(Ynmnmr, OrdersOutOfRangeFailWith4712AndWriteNothing) {
  RecordedFrames frames;
  const std::vector<double> a(441, 0.0);
  const std::int32_t code = 0x102, m = 1;
  for (std::int32_t n : {1, 4, 0}) {  // ynmnmr takes 2 and 3 only
    std::int32_t index = -7, ierr = -1;
    EXPECT_EQ(ynmnmr(&n, a.data(), &m, &code, &index, &ierr), 1);
    EXPECT_EQ(ierr, 4712);
    EXPECT_EQ(index, -7);
  }
  for (auto test : {wnmnm1, wnmnm2, wnmnm3, wnmnm4}) {  // the tests take 2 to 20
    for (std::int32_t n : {1, 21}) {
      std::int32_t flag = -7, ierr = -1;
      EXPECT_EQ(test(&n, a.data(), &flag, &ierr), 1);
      EXPECT_EQ(ierr, 4712);
      EXPECT_EQ(flag, -7);
    }
    EXPECT_GE(flag_of(test, 20, a), 0);
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Wnmnm1, MultiplesOfTheIdentityAndTheirTolerances) {
  EXPECT_EQ(flag_of(wnmnm1, 3, diagonal({1, 1, 1})), 1);
  EXPECT_EQ(flag_of(wnmnm1, 3, diagonal({-2.5, -2.5, -2.5})), 2);
  EXPECT_EQ(flag_of(wnmnm1, 3, diagonal({1, 1, 2})), 0);
  // Off-diagonal elements: 1e-12 is "at most", the next double is not.
  for (int at : {1, 2, 3, 5, 6, 7}) {
    std::vector<double> a = diagonal({2, 2, 2});
    a[at] = 1e-12;
    EXPECT_EQ(flag_of(wnmnm1, 3, a), 2) << at;
    a[at] = -std::nextafter(1e-12, 1.0);
    EXPECT_EQ(flag_of(wnmnm1, 3, a), 0) << at;
  }
  // |a11 - 1| < 1e-12: 4503 * 2^-52 = 0.99987e-12 is the identity, 4504 * 2^-52 is not.
  const double in = 1 + 4503 * 0x1p-52, out = 1 + 4504 * 0x1p-52;
  EXPECT_EQ(flag_of(wnmnm1, 2, {in, 0, 0, in}), 1);
  EXPECT_EQ(flag_of(wnmnm1, 2, {out, 0, 0, out}), 2);
}

TEST(Wnmnm2, OrthonormalColumns) {
  EXPECT_EQ(flag_of(wnmnm2, 2, {0.6, 0.8, -0.8, 0.6}), 1);
  EXPECT_EQ(flag_of(wnmnm2, 3, {0, 0, 1, 1, 0, 0, 0, -1, 0}), 1);
  EXPECT_EQ(flag_of(wnmnm2, 2, {1, 0, 1e-6, 1}), 0);   // not orthogonal
  EXPECT_EQ(flag_of(wnmnm2, 2, {1, 0, 0, 1 + 0x1p-39}), 0);  // |c|^2 - 1 = 2^-38 + ...
  EXPECT_EQ(flag_of(wnmnm2, 2, {1, 0, 0, 1 + 0x1p-41}), 1);  // 2^-40 + 2^-82 < 1e-12
}

TEST(Wnmnm3, ZeroMapProjectorOrNeither) {
  EXPECT_EQ(flag_of(wnmnm3, 2, {1e-12, -1e-12, 0, 1e-12}), 1);
  // One element just above the tolerance: not the zero map, but A A (about 1e-24) is within
  // 1e-12 of A, a projector; at 2e-12 the difference is above 1e-12.
  EXPECT_EQ(flag_of(wnmnm3, 2, {std::nextafter(1e-12, 1.0), 0, 0, 0}), 2);
  EXPECT_EQ(flag_of(wnmnm3, 2, {2e-12, 0, 0, 0}), 0);
  EXPECT_EQ(flag_of(wnmnm3, 2, {1, 0, 1, 0}), 2);  // (x + y, 0), oblique
  EXPECT_EQ(flag_of(wnmnm3, 3, diagonal({1, 0, 1})), 2);
  EXPECT_EQ(flag_of(wnmnm3, 2, {2, 0, 0, 2}), 0);
}

TEST(Wnmnm4, AffinitiesAndWhatIsNot) {
  EXPECT_EQ(flag_of(wnmnm4, 2, {1, 0, 0, 3}), 1);          // lambda 3
  EXPECT_EQ(flag_of(wnmnm4, 2, {1, 0, -2, -1}), 1);        // lambda -1, oblique
  EXPECT_EQ(flag_of(wnmnm4, 2, {0.5, 0, 0, 1}), 1);        // lambda 0.5
  EXPECT_EQ(flag_of(wnmnm4, 2, {1, 0, 0, 1}), 0);          // no element of B counts
  EXPECT_EQ(flag_of(wnmnm4, 2, {2, 0, 0, 2}), 0);          // P = 0 is not a projector
  EXPECT_EQ(flag_of(wnmnm4, 2, {2, 0, 0, 0.5}), 0);        // ratios 2 and 0.5 differ
  EXPECT_EQ(flag_of(wnmnm4, 2, {0, 0, 0, 1}), 0);          // lambda 0: a projector
  EXPECT_EQ(flag_of(wnmnm4, 2, {1, 0, 1, 1}), 0);          // shear: Q = B, lambda 1
  // Order 20: ten ones then ten fives on the diagonal.
  std::vector<double> d(20, 1.0);
  for (int i = 10; i < 20; ++i) d[i] = 5;
  EXPECT_EQ(flag_of(wnmnm4, 20, diagonal(d)), 1);
}
