// tests/poly/roots_test.cpp -- checks for poly/roots_closed.cpp and poly/roots_dispatch.cpp.
// Expected roots are derived by hand from factored polynomials; where the closed forms round,
// roots are compared within a small absolute tolerance and checked against the polynomial.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <complex>
#include <vector>

#include "poly/poly_api.h"
#include "support/recording_services.h"

namespace {

using Cx = std::complex<double>;
constexpr double kSentinel = -7.25;

std::vector<Cx> slots(const double* roots, int k) {
  std::vector<Cx> v;
  for (int j = 0; j < k; ++j) v.emplace_back(roots[2 * j], roots[2 * j + 1]);
  return v;
}

// |p(z)| relative to the sum of |c_k z^k| (coefficients by decreasing power).
double residual(const std::vector<double>& c, Cx z) {
  Cx v = 0.0;
  double scale = 0.0;
  for (double ck : c) {
    scale = scale * std::abs(z) + std::fabs(ck);
    v = v * z + ck;
  }
  return scale == 0.0 ? std::abs(v) : std::abs(v) / scale;
}

void expect_slots(const double* roots, const std::vector<Cx>& want, double tol = 1e-12) {
  for (std::size_t j = 0; j < want.size(); ++j) {
    EXPECT_NEAR(roots[2 * j], want[j].real(), tol) << "slot " << j;
    EXPECT_NEAR(roots[2 * j + 1], want[j].imag(), tol) << "slot " << j;
  }
}

}  // namespace

// ---- duos ----

struct DuosCase {
  double c[3];
  std::int32_t flag;
  bool written;
  double want[4];
};
void PrintTo(const DuosCase& k, std::ostream* os) {
  *os << k.c[0] << "," << k.c[1] << "," << k.c[2];
}
class DuosTable : public ::testing::TestWithParam<DuosCase> {};
TEST_P(DuosTable, FlagAndExactRoots) {
  const DuosCase& k = GetParam();
  double r[4] = {kSentinel, kSentinel, kSentinel, kSentinel};
  std::int32_t flag = -1;
  duos(k.c, r, &flag);
  EXPECT_EQ(flag, k.flag);
  for (int j = 0; j < 4; ++j) EXPECT_EQ(bits(r[j]), bits(k.written ? k.want[j] : kSentinel));
}
INSTANTIATE_TEST_SUITE_P(
    Duos, DuosTable,
    ::testing::Values(DuosCase{{0, 0, 0}, 2, false, {}}, DuosCase{{0, 0, 5}, 1, false, {}},
                      DuosCase{{0, 2, 4}, 3, true, {-2, 0, -2, 0}},
                      // b < 0: q = -h (b - s) = 2 in slot 1, c / (a q) = 1 in slot 0.
                      DuosCase{{1, -3, 2}, 0, true, {1, 0, 2, 0}},
                      // b = -0 counts as positive: q = -h (b + s) = -3, then 9 / -3.
                      DuosCase{{1, -0.0, -9}, 0, true, {3, 0, -3, 0}},
                      // d = 20 > 4: (-1, +-sqrt(16) h); with a < 0, h < 0 puts -2 first.
                      DuosCase{{1, 2, 5}, 4, true, {-1, 2, -1, -2}},
                      DuosCase{{-1, -2, -5}, 4, true, {-1, -2, -1, 2}},
                      // b = c = 0: q = -0.5 (0 + 0) = -0, so slot 0 = (0, 0) without dividing.
                      DuosCase{{1, 0, 0}, 0, true, {0, 0, -0.0, 0}}));

// ---- cardan ----

TEST(Cardan, ThreeRealRootsAreSortedDecreasing) {
  const double c[4] = {1, -6, 11, -6};
  const std::int32_t mode = 1;
  double r[6];
  std::int32_t flag = 0;
  cardan(c, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  expect_slots(r, {3.0, 2.0, 1.0});
}

TEST(Cardan, DegenerateCasesKeepTheirFlagsAndSlots) {
  const std::int32_t mode = 1;
  double r[6];
  std::int32_t flag = 0;
  // x^3: d = 0, so the root 0 and duos on x^2, whose q = -0.5 (0 + 0) is -0: three zeros,
  // the last one negative, unshifted.
  const double cube[4] = {1, 0, 0, 0};
  cardan(cube, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  const double zeros[6] = {0, 0, 0, 0, -0.0, 0};
  for (int j = 0; j < 6; ++j) EXPECT_EQ(bits(r[j]), bits(zeros[j]));
  // Leading 1e-16 < 1e-15: the quadratic x^2 - 3x + 2 by duos, slot 2 zeroed.
  const double lead[4] = {1e-16, 1, -3, 2};
  cardan(lead, &mode, r, &flag);
  EXPECT_EQ(flag, 2);
  const double want[6] = {1, 0, 2, 0, 0, 0};
  for (int j = 0; j < 6; ++j) EXPECT_EQ(r[j], want[j]);
  // d = 0 with real quadratic x^2 - 3x + 2: roots 2, 1, 0 unshifted.
  const double dz[4] = {1, -3, 2, 0};
  cardan(dz, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  const double want_dz[6] = {2, 0, 1, 0, 0, 0};
  for (int j = 0; j < 6; ++j) EXPECT_EQ(r[j], want_dz[j]);
  // d = 0 with x^2 + 1: the root 0 and a pair, flag 1.
  const double dc[4] = {1, 0, 1, 0};
  cardan(dc, &mode, r, &flag);
  EXPECT_EQ(flag, 1);
  expect_slots(r, {0.0, Cx(0, 1), Cx(0, -1)}, 0.0);
}

TEST(Cardan, DoubleRootAndTheFirstRootOnlyMode) {
  // (x - 1)^2 (x + 2): p = -3, q = 2, discriminant 0; y1 = -2 cbrt(1) = -2.
  const double c[4] = {1, 0, -3, 2};
  double r[6];
  std::int32_t flag = 0, mode = 1;
  cardan(c, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  expect_slots(r, {1.0, 1.0, -2.0}, 0.0);
  // (x - 1)^3: p = q = 0 after depressing, every slot 0 - t = 1.
  const double triple[4] = {1, -3, 3, -1};
  cardan(triple, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  expect_slots(r, {1.0, 1.0, 1.0}, 0.0);
  // Mode 2: only slot 0 is formed, and it is not sorted away.
  mode = 2;
  cardan(c, &mode, r, &flag);
  EXPECT_EQ(flag, 3);
  EXPECT_EQ(r[0], -2.0);
}

TEST(Cardan, OneRealRootAcrossTheDominanceThreshold) {
  // q dominates (x^3 + 1e-6 x + 1) and does not (x^3 + x + 1); both solve their cubic.
  for (const double p : {1e-6, 1e-3, 1.0}) {
    const std::vector<double> c = {1, 0, p, 1};
    double r[6];
    std::int32_t flag = 0, mode = 1;
    cardan(c.data(), &mode, r, &flag);
    EXPECT_EQ(flag, 1);
    for (const Cx& z : slots(r, 3)) EXPECT_LT(residual(c, z), 1e-14) << p;
    // Mode 0 forms the real root only (the pair only with mode 1 itself).
    mode = 0;
    double r0[6];
    cardan(c.data(), &mode, r0, &flag);
    EXPECT_EQ(bits(r0[0]), bits(r[0]));
  }
}

// ---- ferari and quadr ----

TEST(Quartics, FourRealRootsAndAComplexQuartic) {
  // (x-1)(x-2)(x-3)(x-4) and x^4 + 1 = 0, roots (+-1 +-i) / sqrt 2.
  const std::vector<double> real4 = {1, -10, 35, -50, 24}, cplx = {1, 0, 0, 0, 1};
  for (auto* solve : {&ferari, &quadr}) {
    double r[8];
    std::int32_t flag = -1;
    solve(real4.data(), r, &flag);
    EXPECT_EQ(flag, 0);
    std::vector<double> re;
    for (const Cx& z : slots(r, 4)) {
      EXPECT_EQ(z.imag(), 0.0);
      re.push_back(z.real());
    }
    std::sort(re.begin(), re.end());
    for (int j = 0; j < 4; ++j) EXPECT_NEAR(re[j], j + 1.0, 1e-12);
    solve(cplx.data(), r, &flag);
    for (const Cx& z : slots(r, 4)) {
      EXPECT_NEAR(std::fabs(z.real()), std::sqrt(0.5), 1e-12);
      EXPECT_NEAR(std::fabs(z.imag()), std::sqrt(0.5), 1e-12);
    }
  }
}

TEST(Quartics, NegligibleLeadingCoefficientLeavesRootsUntouched) {
  double r[8] = {kSentinel, kSentinel, kSentinel, kSentinel, kSentinel, kSentinel, kSentinel,
                 kSentinel};
  std::int32_t flag = -1;
  const double tiny[5] = {1e-16, 1, -3, 2, 0};
  ferari(tiny, r, &flag);  // |c0| < 1e-15
  EXPECT_EQ(flag, 3);
  quadr(tiny, r, &flag);   // quadr tests c0 = 0 exactly: it solves this one
  EXPECT_NE(flag, 3);
  for (double& x : r) x = kSentinel;
  const double zero[5] = {0, 1, -3, 2, 0};
  quadr(zero, r, &flag);
  EXPECT_EQ(flag, 3);
  for (double x : r) EXPECT_EQ(x, kSentinel);
}

TEST(Quartics, ShortcutsOfEachVariant) {
  // ferari, c4 = 0: slot 0 = (0, 0), then cardan's sorted roots, no shift.
  const double e0[5] = {1, -6, 11, -6, 0};
  double r[8];
  std::int32_t flag = -1;
  ferari(e0, r, &flag);
  EXPECT_EQ(flag, 0);
  expect_slots(r, {0.0, 3.0, 2.0, 1.0});
  // quadr on x^4 - 5x^2 + 4: resolvent roots 9, 1, 0, so z = 9, s = 1.5, w = 0 and
  // u = v = 1: the roots 2, 1, -1, -2 come out exactly.
  const double re4[5] = {1, 0, -5, 0, 4};
  quadr(re4, r, &flag);
  EXPECT_EQ(flag, 0);
  expect_slots(r, {2.0, 1.0, -1.0, -2.0}, 0.0);
  // x^4 + 5x^2 + 4: resolvent roots 0, -1, -9, so z = 0 < 1e-30 (biquadratic): duos gives
  // u = -1, -4, and the roots are sqrt(u1), sqrt(u2), -sqrt(u1), -sqrt(u2).
  const double bq[5] = {1, 0, 5, 0, 4};
  quadr(bq, r, &flag);
  EXPECT_EQ(flag, 0);  // duos's flag: two real u
  expect_slots(r, {Cx(0, 1), Cx(0, 2), Cx(0, -1), Cx(0, -2)}, 1e-15);
}

// ---- tresor and itdeg3 ----

TEST(Tresor, ClosedFormCases) {
  double r[6];
  std::int32_t code = -1;
  const std::vector<double> three = {1, -6, 11, -6};  // 3, 2, 1
  tresor(three.data(), r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {3.0, 2.0, 1.0});
  // x^3 + 1, P = 0: u = cbrt(-1) = -1, m = P / u = -0, v = m + u / 2 = -0.5, so the
  // pair's first slot carries the negative imaginary part sqrt(3) v.
  const std::vector<double> one = {1, 0, 0, 1};
  tresor(one.data(), r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {-1.0, Cx(0.5, -std::sqrt(0.75)), Cx(0.5, std::sqrt(0.75))});
  const std::vector<double> dbl = {1, 0, -3, 2};  // D = 0: 1, 1, -2 in decreasing order
  tresor(dbl.data(), r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {1.0, 1.0, -2.0});
}

TEST(Tresor, ReductionsToAQuadratic) {
  double r[6];
  std::int32_t code = -1;
  // c0 = 0: roots 2, 1 in decreasing order; slot 2 keeps its start (1, 0).
  const double lin[4] = {0, 1, -3, 2};
  tresor(lin, r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {2.0, 1.0, 1.0}, 0.0);
  // |c3| <= 1e-30: the root 0 split off and {0, 2, 1} sorted.
  const double small[4] = {1, -3, 2, 1e-30};
  tresor(small, r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {2.0, 1.0, 0.0}, 0.0);
  // Degenerate quadratics: code 13; duos flag 1 returns at once, flag 2 sets (1, 0).
  const double none[4] = {0, 0, 0, 5}, all[4] = {0, 0, 0, 0};
  tresor(none, r, &code);
  EXPECT_EQ(code, 13);
  expect_slots(r, {0.0, 0.0, 1.0}, 0.0);
  r[0] = kSentinel;
  tresor(all, r, &code);
  EXPECT_EQ(code, 13);
  expect_slots(r, {1.0, 1.0, 1.0}, 0.0);
}

TEST(Tresor, NewtonNearZeroAndForHugeCoefficients) {
  double r[6];
  std::int32_t code = -1;
  // x^3 - 3x^2 + 2x + c3, |c3 / c2| <= 1e-6: itdeg3 from 0. The root near 0 has the sign
  // of -c3: a positive one converges, a negative one runs to the count of 30.
  const std::vector<double> pos = {1, -3, 2, -1e-7}, neg = {1, -3, 2, 1e-7};
  tresor(pos.data(), r, &code);
  EXPECT_EQ(code, 0);
  EXPECT_NEAR(r[0], 5e-8, 1e-14);
  tresor(neg.data(), r, &code);
  EXPECT_EQ(code, 11);
  EXPECT_NEAR(r[0], -5e-8, 1e-14);
  for (const Cx& z : slots(r, 3)) EXPECT_LT(residual(neg, z), 1e-12);
  // |P| >= 1e25: code 33 whatever itdeg3 reported.
  const double huge[4] = {1, 0, 6e25, 1};
  tresor(huge, r, &code);
  EXPECT_EQ(code, 33);
}

TEST(Itdeg3, ConvergenceSignedTestAndFlatStart) {
  double r[6];
  std::int32_t code = -1;
  const double zero = 0.0;
  // x^3 + x - 2 = (x - 1)(x^2 + x + 2): converges to 1.
  const std::vector<double> pos = {1, 0, 1, -2};
  itdeg3(pos.data(), &zero, r, &code);
  EXPECT_EQ(code, 0);
  expect_slots(r, {1.0, Cx(-0.5, std::sqrt(1.75)), Cx(-0.5, -std::sqrt(1.75))});
  // x^3 + x + 2 = (x + 1)(x^2 - x + 2): reaches -1, but the signed test never passes.
  const std::vector<double> neg = {1, 0, 1, 2};
  itdeg3(neg.data(), &zero, r, &code);
  EXPECT_EQ(code, 11);
  expect_slots(r, {-1.0, Cx(0.5, std::sqrt(1.75)), Cx(0.5, -std::sqrt(1.75))});
  // x^3 - 8 from 0: f' = 0 at once: slot 0 = (0, 0), slots 1 and 2 as started.
  const double flat[4] = {1, 0, 0, -8};
  itdeg3(flat, &zero, r, &code);
  EXPECT_EQ(code, 12);
  expect_slots(r, {0.0, 0.0, 1.0}, 0.0);
  // A NaN coefficient ends after the count of 30.
  const double bad[4] = {1, NAN, 1, 1};
  itdeg3(bad, &zero, r, &code);
  EXPECT_EQ(code, 11);
}

// ---- ynze2r, ynze3r, ynzenr ----

TEST(Ynze2r, RootsAndTheDoubleRootThreshold) {
  double r[4];
  std::int32_t err = -1;
  const double dbl[3] = {1, -2, 1}, cpx[3] = {1, 0, 1};
  EXPECT_EQ(ynze2r(dbl, r, &err), 0);
  EXPECT_EQ(err, 0);
  expect_slots(r, {1.0, 1.0}, 0.0);
  EXPECT_EQ(ynze2r(cpx, r, &err), 0);
  expect_slots(r, {Cx(0, 1), Cx(0, -1)}, 0.0);
  // x^2 - 2x + (1 - e): D = e exactly. e = 2^-50 <= 1e-15 is a double root, 2^-49 is not.
  const double below[3] = {1, -2, 1 - 0x1p-50}, above[3] = {1, -2, 1 - 0x1p-49};
  ynze2r(below, r, &err);
  EXPECT_EQ(r[0], 1.0);
  EXPECT_EQ(r[2], 1.0);
  ynze2r(above, r, &err);
  EXPECT_NEAR(r[0], 1 + 0x1p-25 * std::sqrt(2.0), 1e-15);
  EXPECT_NEAR(r[2], 1 - 0x1p-25 * std::sqrt(2.0), 1e-15);
}

TEST(Ynze3r, RootsPolishedAndDeflated) {
  double r[6];
  std::int32_t err = -1;
  // Depressed y^3 - y (q = 0): the root of largest magnitude is -1, so slot 0 = 1.
  const std::vector<double> c = {1, -6, 11, -6};
  EXPECT_EQ(ynze3r(c.data(), r, &err), 0);
  EXPECT_EQ(err, 0);
  expect_slots(r, {1.0, 3.0, 2.0});
  // A triple root, a dominant q and a dominant p: each root solves its cubic.
  for (const std::vector<double>& k : {std::vector<double>{2, -6, 6, -2},
                                       std::vector<double>{1, 0, 1e-9, 8},
                                       std::vector<double>{1, 0, 1e6, 1}}) {
    ASSERT_EQ(ynze3r(k.data(), r, &err), 0);
    EXPECT_LT(residual(k, Cx(r[0], r[1])), 1e-12);
  }
}

TEST(ZeroLeading, Ynze2rAndYnze3rFailWith4709AndLeaveRoots) {
  double r[6] = {kSentinel, kSentinel, kSentinel, kSentinel, kSentinel, kSentinel};
  std::int32_t err = -1;
  const double c[4] = {0, 1, 1, 1};
  EXPECT_EQ(ynze2r(c, r, &err), 1);
  EXPECT_EQ(err, 4709);
  err = -1;
  EXPECT_EQ(ynze3r(c, r, &err), 1);
  EXPECT_EQ(err, 4709);
  for (double x : r) EXPECT_EQ(x, kSentinel);
}

struct YnzenrCase {
  std::int32_t n;
  std::vector<double> c;
  std::int32_t result, err, nroots;
  std::vector<Cx> roots;
};
void PrintTo(const YnzenrCase& k, std::ostream* os) {
  *os << "n=" << k.n;
  for (double c : k.c) *os << "," << c;
}
class YnzenrTable : public ::testing::TestWithParam<YnzenrCase> {};
TEST_P(YnzenrTable, DispatchByDegree) {
  const YnzenrCase& k = GetParam();
  RecordedFrames frames;
  double r[8] = {kSentinel, kSentinel, kSentinel, kSentinel, kSentinel, kSentinel, kSentinel,
                 kSentinel};
  std::int32_t nroots = -9, err = -1;
  EXPECT_EQ(ynzenr(&k.n, k.c.data(), &nroots, r, &err), k.result);
  EXPECT_EQ(err, k.err);
  EXPECT_EQ(nroots, k.nroots);
  expect_slots(r, k.roots);
  EXPECT_TRUE(frames.empty());
}
INSTANTIATE_TEST_SUITE_P(
    Ynzenr, YnzenrTable,
    ::testing::Values(
        YnzenrCase{0, {1}, 1, 4712, 0, {}}, YnzenrCase{5, {1}, 1, 4718, 5, {}},
        YnzenrCase{1, {0, 0}, 1, 4717, 1, {}}, YnzenrCase{1, {0, 3}, 0, 0, 0, {Cx(kSentinel, kSentinel)}},
        // The quotient b / a as it stands: 4 / 2 = 2, not -2.
        YnzenrCase{1, {2, 4}, 0, 0, 1, {2.0}},
        // The gap rule drops b = 1e-20 next to a = 1.
        YnzenrCase{1, {1, 1e-20}, 0, 0, 1, {0.0}},
        YnzenrCase{2, {0, 2, 4}, 0, 0, 1, {2.0}}, YnzenrCase{2, {1, -3, 2}, 0, 0, 2, {2.0, 1.0}},
        YnzenrCase{3, {0, 1, -3, 2}, 0, 0, 2, {2.0, 1.0}},
        // ferari refuses 1e-16: the cubic x^3 - 3x^2 + 2x by ynze3r.
        YnzenrCase{4, {1e-16, 1, -3, 2, 0}, 0, 0, 3, {}},
        YnzenrCase{4, {0, 0, 0, 0, 5}, 0, 0, 0, {Cx(kSentinel, kSentinel)}}));

TEST(Ynzenr, CubicAfterARefusedQuarticSolvesTheTrailingCoefficients) {
  const std::int32_t n = 4;
  const std::vector<double> c = {1e-16, 1, -3, 2, 0}, cubic = {1, -3, 2, 0};
  double r[8];
  std::int32_t nroots = 0, err = -1;
  ASSERT_EQ(ynzenr(&n, c.data(), &nroots, r, &err), 0);
  ASSERT_EQ(nroots, 3);
  for (const Cx& z : slots(r, 3)) EXPECT_LT(residual(cubic, z), 1e-14);
}
