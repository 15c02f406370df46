// tests/path/path_events_test.cpp -- checks for path/path_events.cpp: wnctop, wnctes
// (with wnctob and the quadratic model), wnccar, wncver.
#include "curves.h"

const double kXd[4] = {1.0, 0.0, 0.0, 1.0};  // x0 = (1, 0), d0 = (0, 1)
const double kEps = 1e-20;
const std::int32_t kN = 2;

// A march record at `angle` on the unit circle, moving counter-clockwise.
Orvq7PathMarch on_circle(double angle, std::int32_t nstored) {
  Orvq7PathMarch m{};
  m.x[0] = std::cos(angle), m.x[1] = std::sin(angle);
  m.t[0] = m.tprev[0] = -m.x[1], m.t[1] = m.tprev[1] = m.x[0];
  m.h = m.hprev = 0.25, m.f = m.g = 1.0, m.nstored = nstored, m.treq = 2;
  return m;
}

TEST(Wnctop, KeepsTheFaceCrossedFirstAndLandsOnIt) {
  // From the origin in the box [-1, 1]^2. Ratios 2 (x) and 3 (y): y's lower face first, with
  // lambda = fl(1/3) and x = 2 fl(1/3); equal ratios keep x; an end on the face is kept.
  struct Case { Reals xb; std::int32_t result; Ints face; Reals xout; };
  const Case cases[] = {{{2.0, 0.5}, 0, {2, 1}, {1.0, 0.25}},
                        {{2.0, -3.0}, 0, {1, 2}, {0x1.5555555555555p-1, -1.0}},
                        {{2.0, 2.0}, 0, {2, 1}, {1.0, 1.0}},
                        {{0.375, 1.0}, 0, {2, 2}, {0.375, 1.0}},
                        {{0.5, NAN}, 1, {-7, -7}, {-2.5, -2.5}}};  // none outside: 4712
  const double xa[2] = {0.0, 0.0}, box[4] = {-1.0, -1.0, 1.0, 1.0};
  for (const Case& k : cases) {
    Ints face = {-7, -7};
    std::int32_t ierr = -1;
    double xout[2] = {-2.5, -2.5};
    EXPECT_EQ(wnctop(&kN, xa, k.xb.data(), box, face.data(), xout, &ierr), k.result);
    EXPECT_EQ(ierr, k.result == 0 ? 0 : 4712);
    EXPECT_EQ(face, k.face);
    EXPECT_EQ(bitsv(xout, 2), bitsv(k.xout)) << k.xb[0];
  }
}

TEST(Wnctes, CurveLeavingAndReturningWithinTheStepEndsOnTheFace) {
  // From angle -0.3 to 0.3 in the box x <= 0.99: both points inside (x = 0.955), the arc
  // between is not. The path ends at (0.99, -sqrt(1 - 0.99^2)), except at the first step,
  // where the new point is kept as an ordinary one with the step factor as it was.
  const double box[4] = {-2.0, -2.0, 0.99, 2.0}, pas[4] = {1e-4, 1e-4, 0.25, 0.25};
  const double xnew[2] = {std::cos(0.3), std::sin(0.3)};
  for (std::int32_t nstored : {1, 4}) {
    Curve c(Curve::kCircle, 2);
    Orvq7PathMarch m = on_circle(-0.3, nstored);
    std::int32_t redo = -1, special = 0, ierr = -1;
    double keep[2] = {};
    ASSERT_EQ(wnctes(&c, &kN, eval_curve, &kEps, kXd, xnew, box, pas, &m, &redo, keep, &special,
                     &ierr),
              0);
    EXPECT_EQ((Ints{redo, special}), (Ints{0, nstored == 1 ? 0 : 1}));
    EXPECT_EQ(bitsv({m.f, keep[0]}), bitsv({1.0, nstored == 1 ? xnew[0] : 0.99}));
    EXPECT_NEAR(keep[1], nstored == 1 ? xnew[1] : -std::sqrt(1 - 0.99 * 0.99), 1e-10);
  }
}

TEST(Wnccar, RedoesWithThreeQuartersOfTheFactorOrClassifiesThePoint) {
  const double k30 = 30.0 * 3.14159265358979323846 / 180.0;
  // The point kept at `angle` on the unit circle; the current point is (1, 0).
  struct Case { double angle; std::int32_t mode, special, nstored; double lo, hi; Ints want; };
  // A 30 degree turn: cos 30 = 0.866 < 0.92388; accepted with mode bit 18, unless the step
  // is beyond a maximum step. An end point within the minimum steps replaces the last point
  // of a longer path; closed: back to x0 with d0. want = (redo, accepted, special).
  const Case cases[] = {
      {k30, 2, 0, 3, 1e-3, 1.0, {1, 1, 0}}, {k30, 2 + 262144, 0, 3, 1e-3, 1.0, {0, 1, 0}},
      {k30, 2 + 262144, 1, 3, 1e-3, 0.3, {1, 1, 0}}, {0.005, 2, 1, 2, 0.01, 1.0, {0, 2, 1}},
      {0.05, 2, 1, 2, 0.01, 1.0, {0, 1, 1}}, {0.05, 2, 2, 9, 0.01, 1.0, {0, 1, 2}}};
  for (const Case& k : cases) {
    SCOPED_TRACE(testing::Message() << k.angle << " " << k.special << " " << k.hi);
    PathRecords r(2, k.mode, 2);
    Curve c(Curve::kCircle, 2);
    Orvq7PathMarch m = on_circle(0.0, k.nstored);
    const double keep[2] = {std::cos(k.angle), std::sin(k.angle)};
    const double pas[4] = {k.lo, k.lo, k.hi, k.hi};
    std::int32_t special = k.special, redo = -1, accepted = -1, ierr = -1;
    ASSERT_EQ(wnccar(&c, &kN, eval_curve, kXd, keep, pas, &r.options, r.limits, r.tol, &special,
                     &m, &redo, &accepted, &ierr),
              0);
    EXPECT_EQ((Ints{redo, accepted, special}), k.want);
    // A redo takes 0.75 of the step factor; else advanced to the point kept (x0 when closed),
    // with its tangent.
    const bool stays = k.want[0] != 0 || k.special == 2;
    EXPECT_EQ(bitsv({m.f, m.x[0]}), bitsv({k.want[0] != 0 ? 0.75 : 1.0, stays ? 1.0 : keep[0]}));
    EXPECT_NEAR(m.t[0], stays ? 0.0 : -keep[1], 1e-15);
  }
}

TEST(Wncver, TurnTestIsStrictAndTheChordTestScalesByTheTolerance) {
  const double limits[2] = {0.0, 0.92388}, tol[1] = {0.5}, tight[1] = {0.4};
  const double t[2] = {1.0, 0.0}, step[2] = {4.0, 0.0};
  // dot at the limit passes, the double below fails; flag 18 = 1 takes |dot|, 2 dot itself.
  const double at[2] = {0.92388, 0.3}, below[2] = {std::nextafter(0.92388, 0.0), 0.3};
  const double back[2] = {-1.0, 0.0}, chord[2] = {0.6, 0.8}, reversed[2] = {-0.6, -0.8};
  // K = 4 without turn test: L / 8 = 0.5 and t - tnew = (0.4, -0.8) (also for the reversed
  // tangent): sum (0.5 d_i / tol)^2 is 0.8 for tol 0.5, 1.25 for 0.4.
  struct Case { std::int32_t kind, flag18; const double *tnew, *tol; std::int32_t redo; };
  const Case cases[] = {{2, 1, at, tol, 0},      {2, 1, below, tol, 1},     {2, 1, back, tol, 0},
                        {2, 2, back, tol, 1},    {2, 0, below, tol, 0},     {4, 0, chord, tol, 0},
                        {4, 0, chord, tight, 2}, {4, 0, reversed, tight, 2}};
  for (const Case& k : cases) {
    Orvq7PathOptions o{};
    o.kind = k.kind, o.flag18 = k.flag18;
    std::int32_t redo = -1, ierr = -1;
    double dot = 0.0;
    EXPECT_EQ((Ints{wncver(&kN, step, t, k.tnew, &o, limits, k.tol, &redo, &dot, &ierr), redo}),
              (Ints{0, k.redo})) << k.kind << " " << k.flag18 << " " << k.tnew[0];
    EXPECT_EQ(bits(dot), bits(k.tnew[0]));
  }
}
