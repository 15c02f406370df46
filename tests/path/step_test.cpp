// tests/path/step_test.cpp -- checks for path/step.cpp: wncpas.
#include <thread>

#include "curves.h"

const double kPas[6] = {0.01, 0.01, 0.01, 0.5, 0.3, 0.7};  // read for n = 3 only

struct Step { std::int32_t n, kind, per_unknown, variant; double b, g, tol[3], t[3], c[3]; };

// Runs wncpas on a march record before its first step (H = 1e38, f = 1), or on m when given.
std::int32_t step(const Step& s, Orvq7PathMarch* m, std::int32_t* ierr, bool first = true) {
  if (first) {
    *m = Orvq7PathMarch{};
    for (std::int32_t i = 0; i < s.n; ++i) m->t[i] = s.t[i], m->c[i] = s.c[i];
    m->h = m->hprev = 1e38, m->f = 1.0, m->g = s.g;
  }
  Orvq7PathOptions o{};
  o.kind = s.kind, o.first_order = 1, o.per_unknown = s.per_unknown;
  const double limits[2] = {s.b, 0.92388};
  return wncpas(&s.n, &s.variant, &o, limits, s.tol, kPas, m, ierr);
}

TEST(Wncpas, FirstStepIsTheBoundAndGrowthAtMostDoubles) {
  // K = 2, tol 0.1: T = 0.9 * 0.1 (0x1.70a3d70a3d70bp-4, just above 0.09).
  const Step s{2, 2, 0, 1, 0.0, 1.0, {0.1}, {1.0, 0.0}, {}};
  const double T = 0x1.70a3d70a3d70bp-4;
  Orvq7PathMarch m;
  std::int32_t ierr = -1;
  ASSERT_EQ((Ints{step(s, &m, &ierr), ierr}), (Ints{0, 0}));
  const double h1 = m.h;
  ASSERT_EQ(step(s, &m, &ierr, false), 0);  // min(2T, T)
  const double h2 = m.h;
  m.f = 0.25;  // two halvings: min(2 * 0.25 * T, T) = T / 2
  ASSERT_EQ(step(s, &m, &ierr, false), 0);
  EXPECT_EQ(bitsv({h1, h2, m.h, m.f}), bitsv({T, T, T / 2, 1.0}));
}

TEST(Wncpas, FirstStepEqualsTheBoundOfTheKind) {
  struct Case { Step s; double want; bool exact; };  // else within 4e-16 relative
  // Expected values worked out by hand from the bounds of each kind.
  // clang-format off
  const Case cases[] = {
      // K = 1: |tol(1)|, no factor 0.9.
      {{2, 1, 0, 2, 0, 1, {-0.3}, {1, 0}, {0, 0}}, 0.3, true},
      // K = 2 per unknown: 0.9 sqrt((0.1 * 0.6)^2 + (0.2 * 0.8)^2) = 0.9 sqrt(0.0292).
      {{2, 2, 1, 1, 0, 1, {0.1, 0.2}, {0.6, 0.8}, {0, 0}}, 0.9 * 0.17088007490635062, false},
      // K = 4, variant 1: 0.9 sqrt(1 / (0.5 * 5 / 0.5 + 4)) = 0.9 / 3.
      {{2, 4, 0, 1, 4, 1, {0.5}, {0.6, 0.8}, {3, 4}}, 0.3, false},
      // Per unknown, straight (c = 0) along e2: T0 = pas(2,2) / 1 = 0.3, the move 0.3 is not
      // above pas(2,2); exactly 0.9 * 0.3.
      {{3, 4, 1, 1, 0, 1, {0.1, 0.1, 0.1}, {0, 1, 0}, {}}, 0x1.147ae147ae148p-2, true},
      // Straight, t = (0.6, 0.8, 0): T0 = 0.5 / 0.6 from unknown 1, then held by unknown 2
      // to 0.3 / 0.8 = 0.375.
      {{3, 4, 1, 1, 0, 1, {0.1, 0.1, 0.1}, {0.6, 0.8, 0}, {}}, 0.9 * 0.375, false},
      // q = (0.3/0.1)^2 + (0.4/0.1)^2 = 25: T0 = sqrt(1 / 2.5) = 0.632..., held by unknown 2
      // (move 0.8 T0 > 0.3) to 0.375.
      {{3, 4, 1, 1, 0, 1, {0.1, 0.1, 0.1}, {0, 0.8, 0.6}, {0.3, 0.4, 0}}, 0.9 * 0.375, false},
      // Variant 2: t ^ c for t = e1, c = (3, 4, 0): (4, 0, 0), norm 4:
      // 0.9 sqrt(1 / (2 * 0.5^2 + 4 / 1)).
      {{3, 4, 0, 2, 2, 0.5, {0.5}, {1, 0, 0}, {3, 4, 0}}, 0.9 * 0.47140452079103168, false},
      // Per unknown: w_i = c_1 / tol(i) = (2, 4, 1) (c_1 on purpose); t ^ w = (4, 1, 0):
      // 0.9 sqrt(2 / sqrt(17)).
      {{3, 4, 1, 2, 0, 1, {0.5, 0.25, 1}, {1, 0, 0}, {1, 5, 7}}, 0.9 * 0.69647056655157075, false},
      // K = 8, variant 1: 0.9 / (5 / 0.5 + 5) = 0.06; straight: 0.9 / 5, rounded once.
      {{2, 8, 0, 1, 5, 1, {0.5}, {0.6, 0.8}, {3, 4}}, 0.06, false},
      {{2, 8, 0, 1, 5, 1, {0.1}, {0, 1}, {}}, 0x1.70a3d70a3d70ap-3, true},
      // Variant 2: t ^ c = 0.6 * 0.25 - 0.8 * 0.5 = -0.25, norm 0.25; only t_n c_n = 0.2 is
      // subtracted: 0.9 / ((0.25 - 0.2 * 0.5) / (0.5 + 2)) = 15 (the dot product would give 0).
      {{2, 8, 0, 2, 2, 1, {0.5}, {0.6, 0.8}, {0.5, 0.25}}, 15.0, false}};
  // clang-format on
  for (const Case& k : cases) {
    Orvq7PathMarch m;
    std::int32_t ierr = -1;
    ASSERT_EQ(step(k.s, &m, &ierr), 0) << k.want;
    EXPECT_NEAR(m.h, k.want, 4e-16 * k.want);
    EXPECT_TRUE(!k.exact || bits(m.h) == bits(k.want)) << std::hexfloat << m.h;
  }
}

TEST(Wncpas, OtherVariantsReuseTheLastBoundOfThisThread) {
  const Step kind8{2, 8, 0, 1, 5.0, 1.0, {0.5}, {0.6, 0.8}, {3.0, 4.0}};  // T = 0.06, kept
  const Step fallback{2, 4, 0, 7, 5.0, 1.0, {0.5}, {0.6, 0.8}, {3.0, 4.0}};
  Orvq7PathMarch m;
  std::int32_t ierr = -1;
  ASSERT_EQ((Ints{step(kind8, &m, &ierr), step(fallback, &m, &ierr)}), (Ints{0, 0}));
  EXPECT_NEAR(m.h, 0.054, 1e-17);
  ASSERT_EQ(step(fallback, &m, &ierr), 0);  // and it decays: 0.9 * 0.054
  EXPECT_NEAR(m.h, 0.0486, 1e-17);
  double other = -1.0;  // another thread starts from 0
  std::thread([&] {
    if (Orvq7PathMarch mm; step(fallback, &mm, &ierr) == 0) other = mm.h;
  }).join();
  EXPECT_EQ(bits(other), bits(0.0));
}

TEST(Wncpas, RefusalsRecordTheirFramesAndLeaveTheStep) {
  Orvq7PathMarch m{};
  m.h = 0.125, m.f = 0.5;
  std::int32_t e1 = 0, e2 = 0, e3 = 0;
  RecordedFrames frames;
  EXPECT_EQ((Ints{step({2, 3, 0, 1, 0, 1, {0.1}, {1, 0}, {}}, &m, &e1, false),  // no such kind
                  step({21, 2, 0, 1, 0, 1, {0.1}, {1, 0}, {}}, &m, &e2, false),
                  step({1, 2, 0, 1, 0, 1, {0.1}, {1, 0}, {}}, &m, &e3, false), e1, e2, e3}),
            (Ints{1, 1, 1, 4718, 4718, 4712}));
  // None for n < 2.
  EXPECT_EQ(frames.frames(), (std::vector<Frame>{{4718, "WNCPAS  ", 8}, {4718, "WNCPAS  ", 8}}));
  EXPECT_EQ(bitsv({m.h, m.f}), bitsv({0.125, 0.5}));
}
