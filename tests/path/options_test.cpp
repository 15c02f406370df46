// tests/path/options_test.cpp -- checks for path/options.cpp: wnccmd, wnccim, wnccex.
#include "curves.h"

// Step bounds (0.01, 0.2) and tolerances 0.1 for up to four unknowns (kPas2 for two).
const double kPas[8] = {0.01, 0.01, 0.01, 0.01, 0.2, 0.2, 0.2, 0.2};
const double kTol[4] = {0.1, 0.1, 0.1, 0.1};
const double* const kPas2 = kPas + 2;

struct Decoded {
  Decoded(std::int32_t n, std::int32_t mode, std::int32_t store, std::int32_t variant,
          const double* tol = kTol, const double* pas = kPas) {
    result = wnccmd(&n, pas, &mode, tol, &store, &variant, &options, limits, &layout, pairs, &ierr);
  }
  Ints slots(std::int32_t Orvq7PathSlot::*field) const {
    Ints v;
    for (const Orvq7PathSlot& s : layout.slot) v.push_back(s.*field);
    return v;
  }
  Orvq7PathOptions options{};
  Orvq7PathLayout layout{};
  double limits[2] = {-1.0, -1.0};
  std::int32_t pairs[22] = {}, ierr = -1, result = -1;
};

TEST(Wnccmd, OptionWordsAreAcceptedOrRefusedAsTabled) {
  constexpr std::int32_t kB15 = 1 << 15, kB16 = 1 << 16, kB29 = 1 << 29;
  const double bad_pas[4] = {0.3, 0.01, 0.2, 0.2};    // pas(1,1) > pas(1,2)
  const double equal_pas[4] = {0.1, 0.01, 0.1, 0.2};  // pas(1,1) = pas(1,2): strict
  const double bad_tol[2] = {0.0, 0.1}, tol_pair[2] = {0.1, 0.2}, tol_nan[2] = {0.1, NAN};
  struct Case {
    int mode, store, variant, ierr, kind = 0, order = 0, n = 4;
    const double *tol = kTol, *pas = kPas;
  };
  // clang-format off
  // Store bit 0 refused; the first group allowed; order level 2 needs K = 4 or 8; per unknown
  // tolerances with K = 4 only; K = 1 for the extremum path only; no kind, two kinds, mode bits
  // 4, 14, 20 and 31; store bits 29 and 15, no store bit, no pair; store bits 6 and 31
  // ignored; the second group for the extremum path only; variants 3 and 0. Then the checks
  // in their order: n, step bounds, the words, tol (every one when per unknown), store.
  const Case cases[] = {
      {4, 2, 1, 0, 4, 1}, {4, 3, 1, 4718}, {2, 2, 1, 0, 2, 0}, {8, 2 + 8, 1, 0, 8, 1},
      {4 + kB15, 2, 1, 0, 4, 2}, {2 + kB15, 2, 1, 4718}, {8 + kB16, 2, 1, 4718},
      {8 + kB16, 2, 2, 4718}, {4 + kB16, 2, 1, 0, 4, 1}, {1, 2, 1, 4718}, {1, 2, 2, 0, 1, 0},
      {0, 2, 1, 4718}, {0, 2, 2, 4718}, {3, 2, 2, 4718}, {16, 2, 2, 4718}, {4 + 16384, 2, 1, 4718},
      {4 + (1 << 20), 2, 1, 4718}, {int(0x80000004u), 2, 1, 4718}, {4, 2 + kB29, 1, 4718},
      {1, 8 + kB29, 2, 4718}, {4, 2 + kB15, 1, 4718}, {4, 0, 1, 4718}, {4, 64 + 1024, 2, 4718},
      {4, int(0x80000042u), 1, 0, 4, 1}, {4, 2 + 128, 1, 4718}, {2, 2 + 128, 2, 0, 2, 1},
      {4, 2, 3, 4718}, {4, 2, 0, 4718}, {4, 2, 1, 4712, 0, 0, 1}, {4, 2, 1, 4718, 0, 0, 21},
      {3, 0, 1, 4712, 0, 0, 2, kTol, bad_pas}, {4, 2, 1, 4712, 0, 0, 2, kTol, equal_pas},
      {3, 0, 1, 4718, 0, 0, 2, bad_tol, kPas2}, {4, 0, 1, 4712, 0, 0, 2, bad_tol, kPas2},
      {4 + kB16, 2, 1, 0, 4, 1, 2, tol_pair, kPas2},
      {4 + kB16, 2, 1, 4712, 0, 0, 2, tol_nan, kPas2}};
  // clang-format on
  for (const Case& w : cases) {
    const Decoded d(w.n, w.mode, w.store, w.variant, w.tol, w.pas);
    SCOPED_TRACE(testing::Message() << w.mode << " " << w.store << " " << w.variant);
    EXPECT_EQ((Ints{d.ierr, d.result}), (Ints{w.ierr, w.ierr == 0 ? 0 : 1}));
    if (w.ierr != 0) continue;
    EXPECT_EQ((Ints{d.options.kind, d.options.order}), (Ints{w.kind, w.order}));
  }
}

TEST(Wnccmd, DerivedLimits) {
  // K = 8: cosine limit 1/sqrt(1.01) for tol 0.1; 0.92388 for tol 1 (1/sqrt(2) is smaller).
  // B = 1/h with h = pas(1,2) = 0.2.
  const double tol1[1] = {1.0}, pas[6] = {0.01, 0.01, 0.01, 0.5, 0.125, 0.25};
  EXPECT_EQ(bitsv(Decoded(2, 8, 2, 1, kTol, kPas2).limits, 2), bitsv({5.0, 0x1.fd7583bc82e2ap-1}));
  EXPECT_EQ(bits(Decoded(2, 8, 2, 1, tol1, kPas2).limits[1]), bits(0.92388));
  // K = 4 with per-unknown tolerance: h is the smallest pas(i,2); B = 1/h^2 = 1/(0.125^2).
  EXPECT_EQ(bitsv(Decoded(3, 4 + (1 << 16), 2, 1, kTol, pas).limits, 2), bitsv({64.0, 0.92388}));
  // K = 2: B is left as it was.
  EXPECT_EQ(bits(Decoded(2, 2, 2, 1, kTol, kPas2).limits[0]), bits(-1.0));
}

TEST(Wnccmd, StorageRequestBecomesPairsAndSlots) {
  // Implicit path, n = 3, store bits 1, 2 and 4 (one member of the first group): the first
  // group is forced into its second form, so all three members get values.
  const double pas[6] = {0.01, 0.01, 0.01, 0.2, 0.2, 0.2};
  const Decoded d(3, 4, 2 + 4 + 16, 1, kTol, pas);
  ASSERT_EQ(d.ierr, 0);
  EXPECT_EQ(Ints(d.pairs, d.pairs + 22),
            (Ints{6, 23, 6, 43, 0, 1, 0, 2, 0, 3, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}));
  EXPECT_EQ((Ints{d.layout.nused, d.layout.form1, d.layout.nvalues}), (Ints{5, 2, 17}));
  EXPECT_EQ(d.slots(&Orvq7PathSlot::width), (Ints{0, 6, 6, 1, 1, 3, 0, 0, 0, 0, 0}));
  EXPECT_EQ(d.slots(&Orvq7PathSlot::offset), (Ints{0, 0, 6, 12, 13, 14, 0, 0, 0, 0, 0}));
  EXPECT_EQ(d.options.flag18, 1);
}

TEST(Wnccex, FirstFormKeepsOnlyTheRequestedMembersAndAdjustsOptions) {
  // Extremum path, K = 2, store bits 0, 3 (first group, first form) and 9 (second group).
  // mode bit 17 and 19 are recorded; flag 18 becomes 2; the second group raises the order.
  const Decoded d(2, 2 + (1 << 17) + (1 << 19), 1 + 8 + 512, 2, kTol, kPas2);
  ASSERT_EQ(d.ierr, 0);
  const Orvq7PathOptions& o = d.options;
  EXPECT_EQ((Ints{o.flag17, o.flag18, o.flag19, o.order}), (Ints{1, 2, 1, 1}));
  EXPECT_EQ(d.slots(&Orvq7PathSlot::width), (Ints{2, 0, 0, 1, 0, 0, 0, 0, 2, 0, 0}));
  EXPECT_EQ(d.layout.nused, 7);
  // Bit 18 set: no turn test, so flag 18 stays 0; bit 30: the first group's second form.
  const Decoded e(2, 2 + (1 << 18), 8 + (1 << 30), 2, kTol, kPas2);
  ASSERT_EQ(e.ierr, 0);
  EXPECT_EQ(e.options.flag18, 0);
  EXPECT_EQ(e.slots(&Orvq7PathSlot::width), (Ints{0, 0, 0, 1, 1, 2, 0, 0, 0, 0, 0}));
}
