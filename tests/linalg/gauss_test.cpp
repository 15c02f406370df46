// tests/linalg/gauss_test.cpp -- ynsetr, yntrzr, yntrnr (ynsega is in elimination_test.cpp),
// and the workspace of ynsetr, yntrzr and ynvvvv. The tables work in place (output over the
// input vector), so an untouched output equals its input.
#include <gtest/gtest.h>

#include "linalg/linalg_api.h"
#include "linalg_reference.h"

namespace {
const double kNaN = NAN, kUp = std::nextafter(0.3, 1.0), kUp2 = std::nextafter(2.0, 3.0);
}  // namespace

TEST(Ynsetr, CodesThresholdsAndNoPivoting) {
  // a(1) and c(n) are not read (99); x empty: untouched.
  // clang-format off
  const struct { std::int32_t n, code; std::vector<double> d, a, c, r, x; } cases[] = {
      {0, 4712, {0}, {99}, {99}, {1}, {}},
      {2, 4703, {0, 1}, {99, 1}, {1, 99}, {1, 1}, {}},  // regular, but the first pivot is 0
      {2, 4703, {-std::nextafter(1e-15, 0.0), 1}, {99, 1}, {1, 99}, {1, 1}, {}},  // strict
      {2, 0, {1e-15, 1}, {99, 1}, {1, 99}, {1, 1}, {0, 1}},  // g = 1/1e-15: x(1) = g - g * 1
      {2, 4703, {2, 2}, {99, 1}, {4, 99}, {3, 1}, {1.5, 1}},  // beta(2) = 0: x(1) written
      // 2x1 + 2x2 = 10, 2x1 + 4x2 + 4x3 = -10, -1.5x2 + x3 = -13: every step exact, (1, 4, -7).
      {3, 0, {2, 4, 1}, {99, 2, -1.5}, {2, 4, 99}, {10, -10, -13}, {1, 4, -7}}};
  // clang-format on
  for (const auto& c : cases) {
    std::int32_t n = c.n, ierr = -1;
    std::vector<double> x = c.r;
    const int r = ynsetr(&n, c.d.data(), c.a.data(), c.c.data(), x.data(), x.data(), &ierr);
    EXPECT_TRUE(r == !!c.code && ierr == c.code) << &c - cases;
    expect_same(x, c.x.empty() ? c.r : c.x, &c - cases);
  }
}

TEST(YntrzrYntrnr, CleaningRulesNormsAndCodes) {
  // yntrzr ('z') and yntrnr ('n') in place; w empty: untouched; the norm nm 9: untouched.
  // clang-format off
  struct { char r; std::int32_t n, mode, code; double tol; std::vector<double> v, w; double nm{9}; }
  cases[] = {
      {'z', 0, 0, 4712, 0.3, {1}, {}}, {'z', 1, -1, 4718, 0.3, {1}, {}},
      {'z', 1, 3, 4718, 0.3, {1}, {}},
      {'z', 4, 0, 0, 0.3, {-0.3, kUp, -0x1p-70, 2.5}, {0, kUp, 0, 2.5}},  // inclusive; zeros are +0
      {'z', 4, 2, 0, 0.5, {2, -4, kUp2, -1}, {0, -4, kUp2, 0}},  // limit 0.5 * 4 = 2
      {'z', 3, 2, 0, 0.5, {kNaN, 1, 0.5}, {kNaN, 1, 0}},        // a NaN is never the largest
      // Gap rule on decreasing magnitudes, ties in index order: |previous| * tol > |current|.
      {'z', 3, 1, 0, 1e-15, {1, 1e-20, 0.5}, {1, 0, 0.5}},    // 1, 0.5 | 1e-20
      {'z', 3, 1, 0, 0.5, {0.5, -1, 0.25}, {0.5, -1, 0.25}},  // strict: 1 * 0.5 > 0.5 is false
      {'z', 3, 1, 0, 2.0, {0.5, -0.5, 0.25}, {0.5, 0, 0}},    // the tie keeps index 1 first
      {'z', 3, 1, 0, 2.0, {0.25, -0.5, 0.5}, {0, -0.5, 0}},   // and here index 2
      {'n', 2, 0, 0, 0, {3, -4}, {0.75, -1}, 4}, {'n', 2, 1, 0, 0, {3, -4}, {3.0 / 7, -4.0 / 7}, 7},
      {'n', 2, 2, 0, 0, {3, -4}, {0.6, -0.8}, 5}, {'n', 2, 0, 0, 0, {kNaN, -2}, {kNaN, -1}, 2},
      {'n', 2, 2, 0, 0, {1e200, -1e200}, {0, -0.0}, INFINITY},  // no scaling: the squares overflow
      {'n', 2, 2, 4710, 0, {0, -0.0}, {}, 0}, {'n', 2, 7, 4718, 0, {3, -4}, {}, 0},
      {'n', 0, 7, 4712, 0, {3, -4}, {}, 9}};
  // clang-format on
  for (const auto& c : cases) {
    std::int32_t n = c.n, mode = c.mode, ierr = -1;
    std::vector<double> w = c.v;
    double norm = 9;
    const int r = c.r == 'z' ? yntrzr(&n, w.data(), &c.tol, &mode, w.data(), &ierr)
                             : yntrnr(&n, w.data(), &mode, w.data(), &norm, &ierr);
    EXPECT_TRUE(r == !!c.code && ierr == c.code && norm == c.nm) << &c - cases;
    expect_same(w, c.w.empty() ? c.v : c.w, &c - cases);
  }
}

TEST(Workspace, AboveTheLocalSizesARefusalIs36AndNoBlockIsLeft) {
  // ynsetr above 20 unknowns (4 on the diagonal, 1 beside), yntrzr's gap rule above 100
  // components, ynvvvv from order 11 (columns e2..en, so w = e1): refused, then run.
  std::vector<double> ones(441, 1.0), fours(441, 4.0), v(441), cols, w;
  for (int i = 0; i < 441; ++i) v[i] = i == 1 ? 0.1 : (i % 3 - 1) * (1.0 + i);  // 0 at 4, 7, ...
  const double tol = 0.25;  // magnitudes ..., 3, 1, 0.1, 0, ...: 1 * 0.25 > 0.1 cuts from 0.1
  const std::int32_t mode = 1, local[3] = {20, 100, 10};
  for (int r = 0; r < 3; ++r) {
    for (std::int32_t n : {local[r], local[r] + 1}) {
      cols.assign(n * n, 0.0);
      for (std::int32_t j = 0; j + 1 < n; ++j) cols[j + 1 + j * n] = 1.0;
      auto call = [&](std::int32_t* ierr) {
        w.assign(n, -3.0);
        return r == 0
                   ? ynsetr(&n, fours.data(), ones.data(), ones.data(), ones.data(), w.data(), ierr)
               : r == 1 ? yntrzr(&n, v.data(), &tol, &mode, w.data(), ierr)
                        : ynvvvv(&n, cols.data(), w.data(), ierr);
      };
      std::int32_t ierr = -1, big = n > local[r];
      WorkspaceWatch ws;
      ws.refuse_next(1);
      EXPECT_TRUE(call(&ierr) == big && ierr == (big ? 36 : 0) && (w[0] == -3.0) == big) << r << n;
      ws.refuse_next(0);
      ASSERT_EQ(call(&ierr), 0);
      EXPECT_TRUE(r == 0 || (r == 1 ? w[1] == 0 && w[2] == 3 && w[n - 1] == v[n - 1]
                                    : w[0] == 1 && w[n - 1] == 0));
      EXPECT_TRUE(ws.requests() == 2 * big && ws.outstanding() == 0) << r << n;
    }
  }
  std::int32_t n = 22, ierr = -1;  // ynvvvv above its capacity: 4718 at once, no workspace
  WorkspaceWatch ws;
  w.assign(n, -3.0);
  EXPECT_TRUE(ynvvvv(&n, nullptr, w.data(), &ierr) == 1 && ierr == 4718 && w[0] == -3.0);
  n = 21;  // ynsetr failing late, a(n) = 0 and d(n) = 1e-16: the block is released
  fours[20] = 1e-16, ones[20] = 0.0;
  EXPECT_EQ(ynsetr(&n, fours.data(), ones.data(), ones.data(), ones.data(), w.data(), &ierr), 1);
  EXPECT_TRUE(ierr == 4703 && ws.requests() == 1 && ws.outstanding() == 0);
}
