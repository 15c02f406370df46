// tests/linalg/elimination_test.cpp -- ynsega, ynmimr, ynmxmr: codes and thresholds one ulp
// either side, untouched or partly written outputs, pivot tie-breaks and grouping pinned by
// hand-derived bits, and bit-for-bit agreement with the plain transcriptions.
#include <gtest/gtest.h>

#include <random>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"

namespace {
const double kNaN = NAN, kUp38 = std::nextafter(1e-38, 1.0), kUp30 = std::nextafter(1e-30, 1.0);
const double kDown15 = std::nextafter(1e-15, 0.0), kDown30 = std::nextafter(1e-30, 0.0);
const double h = 0x1p-53, d = 1e-15;
const std::vector<double> kZero9(9, 0.0);

// Routine 's' ynsega with x over b, 'i' ynmimr with b over a, 'd' ynmxmr; a by columns; want
// the output, empty: untouched.
// clang-format off
struct Case { char routine; std::int32_t n; std::vector<double> a, b; std::int32_t code;
              std::vector<double> want; };
const Case kCases[] = {
    {'s', 0, {}, {1}, 4712, {}}, {'s', 21, {}, {1}, 4718, {}} /* a not read */,
    {'s', 3, kZero9, {1, 1, 1}, 4703, {}}, {'i', 3, kZero9, {}, 4703, {}},  // singular at step 1
    {'s', 1, {1e-30}, {4}, 4703, {}},  // last pivot <= 1e-30 fails, one ulp above passes
    {'s', 1, {-kUp30}, {4}, 0, {4 / -kUp30}},
    {'s', 2, {1e-35, 0, 0, 1e-35}, {1, 1}, 4703, {}},  // the search passes, the last pivot not
    // A NaN is never a pivot, so only the search (<= 1e-38, inclusive) stops these.
    {'s', 2, {1e-38, 0, 0, kNaN}, {1, 1}, 4703, {}},
    {'s', 2, {kUp38, 0, 0, kNaN}, {1, 1}, 0, {kNaN, kNaN}},
    {'s', 2, {0, 1, 1, 0}, {3, 5}, 0, {5, 3}},  // both exchanges, permutation undone
    // Magnitude 5 at (1,3), (2,2), (3,1), (3,3): the row-major first, (1,3), is the pivot.
    // Bits from a plain transcription in Python; the column-major first, or the last, or
    // b(i) - a(i,j) x(j) - ... in place of b(i) - (sum), change the last bits.
    {'s', 3, by_rows(3, {3, 2, 5, 1, -5, 2, 5, 3, 5}), {0.1, 0.7, 0.3}, 0,
     {0x1.46f61e8a546f6p-3, -0x1.e8a546f61e8a6p-4, -0x1.cbe6d9601cbe5p-6}},
    {'i', 0, {}, {}, 4712, {}}, {'i', 21, {}, {}, 4718, {}},
    {'i', 1, {-kDown15}, {}, 4703, {}},  // strict: |a| < 1e-15
    {'i', 1, {1e-15}, {}, 0, {1 / 1e-15}},
    {'i', 2, {1, 0, 0, kDown30}, {}, 4703, {}},  // strict: |det| < 1e-30
    {'i', 2, {1, 0, 0, 1e-30}, {}, 0, {1, -0.0, -0.0, 1 / 1e-30}},
    {'i', 2, by_rows(2, {1, 2, 3, 4}), {}, 0, by_rows(2, {-2, 1, 1.5, -0.5})},
    // diag(1, d, 1) by hand: the third step finds d alone; below 1e-15 it stops there, partly
    // transformed; at 1e-15 it goes on and the exchanges of the second step are undone.
    {'i', 3, {1, 0, 0, 0, kDown15, 0, 0, 0, 1}, {}, 4703,
     {1, -0.0, 0, -0.0, 1, -0.0, 0, 0, kDown15}},
    {'i', 3, {1, 0, 0, 0, d, 0, 0, 0, 1}, {}, 0, {1, 0, -0.0, -0.0, 1 / d, -0.0, 0, -0.0, 1}},
    // Bits from a plain transcription in Python: the first maximum in row-major order, and
    // b(i,j) - (b(i,k) b(k,j)) / p. Column-major ties change most entries; b(i,k) (b(k,j) / p)
    // changes the entry (3,1) to ...b5a.
    {'i', 3, by_rows(3, {5, 5, 7, 7, 2, 2, -1, 7, 2}), {}, 0,
     by_rows(3, {-0x1.68e18cf81b10ep-5, 0x1.5fdbe971e7308p-3, -0x1.20b470c67c0d9p-6,
              -0x1.20b470c67c0d9p-4, 0x1.32bfb7d2e3ce7p-4, 0x1.5fdbe971e7308p-3,
              0x1.cc1f93bc55b59p-3, -0x1.68e18cf81b110p-3, -0x1.c319f03621d53p-4})},
    {'d', 0, {}, {}, 4712, {}}, {'d', 21, {}, {}, 4718, {}},
    // No threshold: a tiny determinant is a result; a zero matrix ends at the first step.
    {'d', 1, {1e-16}, {}, 0, {1e-16}}, {'d', 2, by_rows(2, {1, 2, 3, 4}), {}, 0, {-2}},
    {'d', 5, std::vector<double>(25), {}, 0, {0}}, {'d', 6, std::vector<double>(36), {}, 0, {0}},
    // Order 3 expands along the first row (bits of that formula in Python); along the first
    // column the last digit would be ...b44.
    {'d', 3, by_rows(3, {.7, .3, -.3, 2.5, .2, .1, 2.5, 1.1, .7}), {}, 0, {-0x1.1a9fbe76c8b43p+0}},
    // A permutation with one exchange, then two equal rows.
    {'d', 4, by_rows(4, {0, 1, 0, 0, 1, 0, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1}), {}, 0, {-1}},
    {'d', 4, by_rows(4, {1, 2, 3, 4, 5, 6, 7, 8, 1, 2, 3, 4, 2, 3, 5, 7}), {}, 0, {0}},
    // Magnitude 7 at several places; bits from a plain transcription in Python. Rows in the
    // outer loop would end in ...97.
    {'d', 4, by_rows(4, {0.2, -1, -7, 3, 2, -3, 5, 2, -7, 2, 1, -3, 7, -7, -5, 5}), {}, 0,
     {-0x1.5399999999998p+9}},
    // Rows (2, y), (2, 1) with y = 1 - m 2^-53: the first step leaves m 2^-53 in (2,2), which
    // is flushed to 0 for m = 9007 (below 1e-12 * 1) and kept for m = 9008.
    {'d', 4, by_rows(4, {2, 1 - 9007 * h, 0, 0, 2, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1}), {}, 0, {0}},
    {'d', 4, by_rows(4, {2, 1 - 9008 * h, 0, 0, 2, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1}), {}, 0,
     {9008 * 2 * h}},
};
// clang-format on
}  // namespace

TEST(Elimination, CodesThresholdsTieBreaksAndGrouping) {
  RecordedFrames frames;
  int t = 0;
  for (const Case& c : kCases) {
    std::int32_t n = c.n, ierr = -1;
    std::vector<double> out = c.routine == 's' ? c.b : c.routine == 'i' ? c.a : std::vector{-7.5};
    if (out.empty()) out.assign(441, -7.5);
    const std::vector<double> before = out, &want = c.want.empty() ? before : c.want;
    const double* a = c.a.data();  // nullptr when empty: not read
    EXPECT_TRUE((c.routine == 's'   ? ynsega(&n, a, out.data(), out.data(), &ierr)
                 : c.routine == 'i' ? ynmimr(&n, out.data(), out.data(), &ierr)
                                    : ynmxmr(&n, a, out.data(), &ierr)) == !!c.code &&
                ierr == c.code)
        << t;
    expect_same(out, want, t++);
  }
  EXPECT_TRUE(frames.empty());
}

TEST(Elimination, AgreesToTheBitWithThePlainTranscriptions) {
  std::mt19937_64 rng(test_seed());
  std::uniform_real_distribution<double> uniform(-1, 1);
  std::uniform_int_distribution<int> small(-3, 3), pick(0, 40);
  for (int rep = 0; rep < 4000; ++rep) {
    // Kinds: 0 uniform; 1 small integers, full of pivot ties; 2 the same with zeros, -inf and
    // NaN; 3 a last row nearly dependent on the first two (the determinant's flush).
    const int kind = rep % 4;
    std::int32_t n = 1 + rep / 4 % 20, ierr = -1;
    std::vector<double> a(n * n), b(n), x(n), x0(n), inv(n * n), inv0(n * n);
    for (double& v : b) v = uniform(rng);
    for (double& v : a) {
      const int p = kind == 2 ? pick(rng) : 99;
      v = p == 0 ? kNaN : p == 1 ? -INFINITY : p < 8 ? 0.0 : kind == 0 ? uniform(rng) : small(rng);
    }
    for (int j = 0; kind == 3 && j < n; ++j)
      a[n - 1 + j * n] = a[j * n] * 0.3 + a[1 % n + j * n] * 0.1;
    ASSERT_EQ(ynsega(&n, a.data(), b.data(), x.data(), &ierr), plain::solve(n, a, b, x0));
    const int inverted = n >= 3 ? ynmimr(&n, a.data(), inv.data(), &ierr) : 0;
    ASSERT_EQ(inverted, n >= 3 ? plain::invert(n, a, inv0) : 0);
    double det = 0;
    if (n >= 4) ynmxmr(&n, a.data(), &det, &ierr);
    bool ok = same(det, n >= 4 ? plain::determinant(n, a) : 0.0);
    for (int e = 0; e < n * n; ++e)
      ok = ok && (e >= n || same(x[e], x0[e])) && (inverted || same(inv[e], inv0[e]));
    ASSERT_TRUE(ok) << "n=" << n << " rep=" << rep << " ORVQ7_SEED=" << test_seed();
  }
}
