// tests/path/options_test.cpp -- checks for path/options.cpp: wnccmd, wnccim, wnccex.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>

#include "path/path_state.h"
#include "support/recording_services.h"

namespace {

// Step bounds (0.01, 0.2) and tolerances 0.1 for up to four unknowns (kPas2 for two).
const double kPas[8] = {0.01, 0.01, 0.01, 0.01, 0.2, 0.2, 0.2, 0.2};
const double kTol[4] = {0.1, 0.1, 0.1, 0.1};
const double* const kPas2 = kPas + 2;

struct Decoded {
  Orvq7PathOptions options{};
  double limits[2] = {-1.0, -1.0};
  Orvq7PathLayout layout{};
  std::int32_t pairs[22] = {};
  std::int32_t ierr = -1, result = -1;
};

Decoded decode(std::int32_t n, std::int32_t mode, std::int32_t store, std::int32_t variant,
               const double* tol = kTol, const double* pas = kPas) {
  Decoded d;
  d.result = wnccmd(&n, pas, &mode, tol, &store, &variant, &d.options, d.limits, &d.layout,
                    d.pairs, &d.ierr);
  return d;
}

struct WordCase {
  std::int32_t mode, store, variant, ierr, kind = 0, order = 0, n = 4;
  const double* tol = kTol;
  const double* pas = kPas;
};

class OptionWords : public ::testing::TestWithParam<WordCase> {};

TEST_P(OptionWords, AreAcceptedOrRefusedAsTabled) {
  const WordCase& w = GetParam();
  const Decoded d = decode(w.n, w.mode, w.store, w.variant, w.tol, w.pas);
  EXPECT_EQ(d.ierr, w.ierr);
  EXPECT_EQ(d.result, w.ierr == 0 ? 0 : 1);
  if (w.ierr == 0) {
    EXPECT_EQ(d.options.kind, w.kind);
    EXPECT_EQ(d.options.order, w.order);
  }
}

constexpr std::int32_t kB15 = 1 << 15, kB16 = 1 << 16, kB29 = 1 << 29;
const double kBadPas[4] = {0.3, 0.01, 0.2, 0.2};    // pas(1,1) > pas(1,2)
const double kEqualPas[4] = {0.1, 0.01, 0.1, 0.2};  // pas(1,1) = pas(1,2): strict
const double kBadTol[2] = {0.0, 0.1}, kTolPair[2] = {0.1, 0.2}, kTolNan[2] = {0.1, NAN};

// clang-format off
INSTANTIATE_TEST_SUITE_P(Wnccmd, OptionWords, ::testing::Values(
    WordCase{4, 2, 1, 0, 4, 1}, WordCase{4, 3, 1, 4718},           // store bit 0 refused
    WordCase{2, 2, 1, 0, 2, 0}, WordCase{8, 2 + 8, 1, 0, 8, 1},    // first group allowed
    WordCase{4 + kB15, 2, 1, 0, 4, 2}, WordCase{2 + kB15, 2, 1, 4718},  // level 2 needs K 4, 8
    WordCase{8 + kB16, 2, 1, 4718}, WordCase{8 + kB16, 2, 2, 4718},
    WordCase{4 + kB16, 2, 1, 0, 4, 1},                             // per-unknown with K = 4
    WordCase{1, 2, 1, 4718}, WordCase{1, 2, 2, 0, 1, 0},           // K = 1: extremum only
    WordCase{0, 2, 1, 4718}, WordCase{0, 2, 2, 4718}, WordCase{3, 2, 2, 4718},  // 0, 2 kinds
    WordCase{16, 2, 2, 4718}, WordCase{4 + 16384, 2, 1, 4718},     // bits 4, 14
    WordCase{4 + (1 << 20), 2, 1, 4718}, WordCase{int(0x80000004u), 2, 1, 4718},  // 20, 31
    WordCase{4, 2 + kB29, 1, 4718}, WordCase{1, 8 + kB29, 2, 4718},
    WordCase{4, 2 + kB15, 1, 4718}, WordCase{4, 0, 1, 4718},
    WordCase{4, 64 + 1024, 2, 4718},                               // no pair
    WordCase{4, int(0x80000042u), 1, 0, 4, 1},                     // ignored bits 6 and 31
    WordCase{4, 2 + 128, 1, 4718}, WordCase{2, 2 + 128, 2, 0, 2, 1},  // second group
    WordCase{4, 2, 3, 4718}, WordCase{4, 2, 0, 4718},
    // The checks in their order: n, step bounds, the words, tol, store.
    WordCase{4, 2, 1, 4712, 0, 0, 1}, WordCase{4, 2, 1, 4718, 0, 0, 21},
    WordCase{3, 0, 1, 4712, 0, 0, 2, kTol, kBadPas},
    WordCase{4, 2, 1, 4712, 0, 0, 2, kTol, kEqualPas},
    WordCase{3, 0, 1, 4718, 0, 0, 2, kBadTol, kPas2},
    WordCase{4, 0, 1, 4712, 0, 0, 2, kBadTol, kPas2},
    // Per-unknown tolerances: every one must be positive.
    WordCase{4 + kB16, 2, 1, 0, 4, 1, 2, kTolPair, kPas2},
    WordCase{4 + kB16, 2, 1, 4712, 0, 0, 2, kTolNan, kPas2}));
// clang-format on

TEST(Wnccmd, DerivedLimits) {
  // K = 8: cosine limit 1/sqrt(1.01) for tol 0.1; 0.92388 for tol 1 (1/sqrt(2) is smaller).
  // B = 1/h with h = pas(1,2) = 0.2.
  Decoded d = decode(2, 8, 2, 1, kTol, kPas2);
  ASSERT_EQ(d.ierr, 0);
  EXPECT_EQ(bits(d.limits[1]), bits(0x1.fd7583bc82e2ap-1));  // 0.995037...
  EXPECT_EQ(bits(d.limits[0]), bits(5.0));
  const double tol1[1] = {1.0};
  EXPECT_EQ(bits(decode(2, 8, 2, 1, tol1, kPas2).limits[1]), bits(0.92388));
  // K = 4 with per-unknown tolerance: h is the smallest pas(i,2); B = 1/h^2 = 1/(0.125^2).
  const double pas[6] = {0.01, 0.01, 0.01, 0.5, 0.125, 0.25};
  d = decode(3, 4 + kB16, 2, 1, kTol, pas);
  ASSERT_EQ(d.ierr, 0);
  EXPECT_EQ(bits(d.limits[0]), bits(64.0));
  EXPECT_EQ(bits(d.limits[1]), bits(0.92388));
  // K = 2: B is left as it was.
  EXPECT_EQ(bits(decode(2, 2, 2, 1, kTol, kPas2).limits[0]), bits(-1.0));
}

TEST(Wnccmd, StorageRequestBecomesPairsAndSlots) {
  // Implicit path, n = 3, store bits 1, 2 and 4 (one member of the first group): the first
  // group is forced into its second form, so all three members get values.
  const double pas[6] = {0.01, 0.01, 0.01, 0.2, 0.2, 0.2};
  const Decoded d = decode(3, 4, 2 + 4 + 16, 1, kTol, pas);
  ASSERT_EQ(d.ierr, 0);
  const std::int32_t want_pairs[22] = {6, 23, 6, 43, 0, 1, 0, 2, 0, 3};
  for (int k = 0; k < 22; ++k) EXPECT_EQ(d.pairs[k], want_pairs[k]) << k;
  EXPECT_EQ(d.layout.nused, 5);
  EXPECT_EQ(d.layout.form1, 2);
  const std::int32_t want_width[9] = {0, 6, 6, 1, 1, 3, 0, 0, 0};
  const std::int32_t want_offset[9] = {0, 0, 6, 12, 13, 14, 0, 0, 0};
  for (int s = 0; s < 9; ++s) {
    EXPECT_EQ(d.layout.slot[s].width, want_width[s]) << s;
    EXPECT_EQ(d.layout.slot[s].offset, want_offset[s]) << s;  // 0 when unused
  }
  EXPECT_EQ(d.layout.nvalues, 17);
  EXPECT_EQ(d.options.flag18, 1);
}

TEST(Wnccex, FirstFormKeepsOnlyTheRequestedMembersAndAdjustsOptions) {
  // Extremum path, K = 2, store bits 0, 3 (first group, first form) and 9 (second group).
  // mode bit 17 and 19 are recorded; flag 18 becomes 2; the second group raises the order.
  const Decoded d = decode(2, 2 + (1 << 17) + (1 << 19), 1 + 8 + 512, 2, kTol, kPas2);
  ASSERT_EQ(d.ierr, 0);
  EXPECT_EQ(d.options.flag17, 1);
  EXPECT_EQ(d.options.flag19, 1);
  EXPECT_EQ(d.options.flag18, 2);
  EXPECT_EQ(d.options.order, 1);
  const std::int32_t want_width[9] = {2, 0, 0, 1, 0, 0, 0, 0, 2};
  for (int s = 0; s < 9; ++s) EXPECT_EQ(d.layout.slot[s].width, want_width[s]) << s;
  EXPECT_EQ(d.layout.nused, 7);
  // Bit 18 set: no turn test, so flag 18 stays 0; bit 30: the first group's second form.
  const Decoded e = decode(2, 2 + (1 << 18), 8 + (1 << 30), 2, kTol, kPas2);
  ASSERT_EQ(e.ierr, 0);
  EXPECT_EQ(e.options.flag18, 0);
  EXPECT_EQ(e.layout.slot[4].width, 1);
  EXPECT_EQ(e.layout.slot[5].width, 2);
}

}  // namespace
