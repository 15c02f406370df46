// tests/path/special_points_test.cpp -- checks for path/special_points.cpp: wnctop, wnctfe,
// wnctes (with wnctob), wnccar, wncver.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <vector>

#include "curves.h"

namespace {

struct ExitCase {
  const char* what;
  double xb[2];
  std::int32_t face[2];
  double xout[2];
};

class BoxExits : public ::testing::TestWithParam<ExitCase> {};

TEST_P(BoxExits, KeepTheFaceCrossedFirstAndLandOnIt) {
  const ExitCase& k = GetParam();
  const std::int32_t n = 2;
  const double xa[2] = {0.0, 0.0}, box[4] = {-1.0, -1.0, 1.0, 1.0};
  std::int32_t face[2] = {0, 0}, ierr = -1;
  double xout[2] = {};
  ASSERT_EQ(wnctop(&n, xa, k.xb, box, face, xout, &ierr), 0) << k.what;
  EXPECT_EQ(face[0], k.face[0]) << k.what;
  EXPECT_EQ(face[1], k.face[1]) << k.what;
  for (int i = 0; i < 2; ++i) EXPECT_EQ(bits(xout[i]), bits(k.xout[i])) << k.what << i;
}

INSTANTIATE_TEST_SUITE_P(
    Wnctop, BoxExits,
    ::testing::Values(
        ExitCase{"upper face", {2.0, 0.5}, {2, 1}, {1.0, 0.25}},
        // Ratios 2 (x) and 3 (y): y's lower face first; lambda = fl(1/3), x = 2 fl(1/3).
        ExitCase{"lower face first", {2.0, -3.0}, {1, 2}, {0x1.5555555555555p-1, -1.0}},
        ExitCase{"tie keeps the earlier unknown", {2.0, 2.0}, {2, 1}, {1.0, 1.0}},
        ExitCase{"end on the face", {0.375, 1.0}, {2, 2}, {0.375, 1.0}}));

TEST(Wnctop, NoUnknownOutsideIs4712WithOutputsUntouched) {
  const std::int32_t n = 2;
  const double xa[2] = {0.0, 0.0}, xb[2] = {0.5, std::nan("")}, box[4] = {-1, -1, 1, 1};
  std::int32_t face[2] = {-7, -7}, ierr = -1;
  double xout[2] = {-2.5, -2.5};
  EXPECT_EQ(wnctop(&n, xa, xb, box, face, xout, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
  EXPECT_EQ(face[0], -7);
  EXPECT_EQ(bits(xout[0]), bits(-2.5));
}

// A march record at x on the unit circle, moving counter-clockwise, with closure value g_prev.
Orvq7PathMarch on_circle(double angle, double g_prev, std::int32_t nstored) {
  Orvq7PathMarch m{};
  m.x[0] = std::cos(angle), m.x[1] = std::sin(angle);
  m.t[0] = -m.x[1], m.t[1] = m.x[0];
  m.tprev[0] = m.t[0], m.tprev[1] = m.t[1];
  m.h = 0.25, m.hprev = 0.25, m.f = 1.0, m.g = 1.0;
  m.close_prev = g_prev;
  m.nstored = nstored;
  m.treq = 2;
  return m;
}

const double kXd[4] = {1.0, 0.0, 0.0, 1.0};  // x0 = (1, 0), d0 = (0, 1)
const double kPas[4] = {1e-4, 1e-4, 0.25, 0.25};
const double kEps = 1e-20;

TEST(Wnctfe, CrossingBehindTheStartClosesOnlyWhenItMeetsX0) {
  // From angle -0.1 to +0.1: g goes from sin(-0.1) < 0 to sin(0.1) >= 0, lambda 1/2, and the
  // crossing corrected along y = 0 is (1, 0).
  const std::int32_t n = 2;
  const double xnew[2] = {std::cos(0.1), std::sin(0.1)};
  for (double radius2 : {1.0, 1.001}) {  // 1.001: passes at x = 1.0005, not within 1e-6
    Curve c(Curve::kCircle, 2, radius2);
    Orvq7PathMarch m = on_circle(-0.1, std::sin(-0.1), 5);
    std::int32_t hit = -1, ierr = -1;
    ASSERT_EQ(wnctfe(&c, &n, eval_curve, &kEps, kXd, xnew, kPas, &m, &hit, &ierr), 0);
    EXPECT_EQ(hit, radius2 == 1.0 ? 1 : 0);
    EXPECT_EQ(bits(m.close), bits(std::sin(0.1)));
  }
  // No crossing from a point ahead of the start hyperplane: no evaluation.
  Curve c(Curve::kCircle, 2);
  Orvq7PathMarch m = on_circle(-0.1, 0.0, 5);
  std::int32_t hit = -1, ierr = -1;
  ASSERT_EQ(wnctfe(&c, &n, eval_curve, &kEps, kXd, xnew, kPas, &m, &hit, &ierr), 0);
  EXPECT_EQ(hit, 0);
  EXPECT_TRUE(c.reqs.empty());
}

TEST(Wnctes, BoxExitEndsOnTheFaceButNeverAtTheFirstStep) {
  // Unit circle from angle -0.3 to 0.3 in the box x <= 0.99: the new point (x = 0.955) is
  // inside, the arc between is not. The path ends at (0.99, -sqrt(1 - 0.99^2)).
  const std::int32_t n = 2;
  const double box[4] = {-2.0, -2.0, 0.99, 2.0};
  const double xnew[2] = {std::cos(0.3), std::sin(0.3)};
  for (std::int32_t nstored : {1, 4}) {
    Curve c(Curve::kCircle, 2);
    Orvq7PathMarch m = on_circle(-0.3, 0.0, nstored);
    std::int32_t redo = -1, special = 0, ierr = -1;
    double keep[2] = {};
    ASSERT_EQ(wnctes(&c, &n, eval_curve, &kEps, kXd, xnew, box, kPas, &m, &redo, keep, &special,
                     &ierr),
              0);
    EXPECT_EQ(redo, 0);
    if (nstored == 1) {  // undecided: the point is kept as an ordinary one, f as it was
      EXPECT_EQ(special, 0);
      EXPECT_EQ(bits(m.f), bits(1.0));
      EXPECT_EQ(bits(keep[0]), bits(xnew[0]));
    } else {
      EXPECT_EQ(special, 1);
      EXPECT_EQ(bits(keep[0]), bits(0.99));
      EXPECT_NEAR(keep[1], -0.14106735979665885, 1e-10);
    }
  }
  // The new point itself outside (from angle -0.6 to -0.35, box x <= 0.9): at the first step
  // the step is redone with half the step factor; later the path ends at (0.9, -sqrt(0.19)).
  const double box2[4] = {-2.0, -2.0, 0.9, 2.0};
  for (std::int32_t nstored : {1, 4}) {
    Curve c(Curve::kCircle, 2);
    Orvq7PathMarch m = on_circle(-0.6, 0.0, nstored);
    const double out[2] = {std::cos(-0.35), std::sin(-0.35)};
    std::int32_t redo = -1, special = 0, ierr = -1;
    double keep[2] = {};
    ASSERT_EQ(wnctes(&c, &n, eval_curve, &kEps, kXd, out, box2, kPas, &m, &redo, keep, &special,
                     &ierr),
              0);
    EXPECT_EQ(redo, nstored == 1 ? 1 : 0);
    EXPECT_EQ(special, nstored == 1 ? 0 : 1);
    EXPECT_EQ(bits(m.f), bits(nstored == 1 ? 0.5 : 1.0));
    if (nstored != 1) {
      EXPECT_EQ(bits(keep[0]), bits(0.9));
      EXPECT_NEAR(keep[1], -0.43588989435406736, 1e-10);
    }
  }
}

// wnccar on the unit circle from angle 0 (tangent (0, 1)) to the point at `angle`.
struct Car {
  std::int32_t result, redo, accepted, special;
  Orvq7PathMarch m;
  std::size_t evaluations;
};
Car car(double angle, std::int32_t mode, std::int32_t special, std::int32_t nstored,
        const double* pas, double from = 0.0) {
  PathRecords r(2, mode, 2);
  Curve c(Curve::kCircle, 2);
  Car out{};
  out.m = on_circle(from, 0.0, nstored);
  out.special = special;
  const std::int32_t n = 2;
  const double keep[2] = {std::cos(angle), std::sin(angle)};
  std::int32_t ierr = -1;
  out.result = wnccar(&c, &n, eval_curve, kXd, keep, pas, &r.options, r.limits, r.tol,
                      &out.special, &out.m, &out.redo, &out.accepted, &ierr);
  out.evaluations = c.reqs.size();
  return out;
}

TEST(Wnccar, TangentTurningTooMuchIsRetriedWithThreeQuartersOfTheStepFactor) {
  const double pas[4] = {1e-3, 1e-3, 1.0, 1.0};
  const double turn = 30.0 * 3.14159265358979323846 / 180.0;
  const Car rejected = car(turn, 2, 0, 3, pas);  // cos 30 = 0.866 < 0.92388
  EXPECT_EQ(rejected.redo, 1);
  EXPECT_EQ(bits(rejected.m.f), bits(0.75));
  EXPECT_EQ(bits(rejected.m.x[0]), bits(1.0));  // not advanced
  const Car free_turn = car(turn, 2 + 262144, 0, 3, pas);  // bit 18: no turn test
  EXPECT_EQ(free_turn.redo, 0);
  EXPECT_EQ(free_turn.accepted, 1);
  EXPECT_EQ(bits(free_turn.m.x[0]), bits(std::cos(turn)));
  EXPECT_NEAR(free_turn.m.t[0], -0.5, 1e-15);
  EXPECT_EQ(bits(free_turn.m.tprev[1]), bits(1.0));
  EXPECT_EQ(bits(free_turn.m.hprev), bits(0.25));  // f H
  // Longer than a maximum step (|dy| = 0.5 > 0.3): redone before any evaluation.
  const double short_pas[4] = {1e-3, 1e-3, 1.0, 0.3};
  const Car too_long = car(turn, 2 + 262144, 1, 3, short_pas);
  EXPECT_EQ(too_long.redo, 1);
  EXPECT_EQ(too_long.special, 0);
  EXPECT_EQ(bits(too_long.m.f), bits(0.75));
  EXPECT_EQ(too_long.evaluations, 0u);
}

TEST(Wnccar, EndPointWithinTheMinimumStepsReplacesTheLastPoint) {
  const double pas[4] = {0.01, 0.01, 1.0, 1.0};
  EXPECT_EQ(car(0.005, 2, 1, 2, pas).accepted, 2);  // two points held: replaces
  EXPECT_EQ(car(0.005, 2, 1, 1, pas).accepted, 1);  // only the start point: appended
  EXPECT_EQ(car(0.005, 2, 0, 2, pas).accepted, 1);  // an ordinary point: appended
  EXPECT_EQ(car(0.05, 2, 1, 2, pas).accepted, 1);   // beyond the minimum step
  // Closed: the record moves to x0 with d0, without an evaluation.
  const Car closed = car(0.05, 2, 2, 9, pas, -0.05);
  EXPECT_EQ(closed.evaluations, 0u);
  EXPECT_EQ(bits(closed.m.x[0]), bits(1.0));
  EXPECT_EQ(bits(closed.m.x[1]), bits(0.0));
  EXPECT_EQ(bits(closed.m.t[1]), bits(1.0));
  EXPECT_EQ(bits(closed.m.tprev[0]), bits(-std::sin(-0.05)));
}

TEST(Wnccar, KeepsTheOrientationAndGoesOnWithoutATangent) {
  const double pas[4] = {1e-3, 1e-3, 1.0, 1.0};
  // Moving clockwise (t = (0, -1)) to angle -0.1: the computed tangent points up, reversed.
  PathRecords r(2, 2, 2);
  Curve c(Curve::kCircle, 2);
  Orvq7PathMarch m = on_circle(0.0, 0.0, 3);
  m.t[1] = -1.0;
  const std::int32_t n = 2;
  const double keep[2] = {std::cos(-0.1), std::sin(-0.1)};
  std::int32_t special = 0, redo = -1, accepted = -1, ierr = -1;
  ASSERT_EQ(wnccar(&c, &n, eval_curve, kXd, keep, pas, &r.options, r.limits, r.tol, &special, &m,
                   &redo, &accepted, &ierr),
            0);
  EXPECT_LT(m.t[1], -0.99);
  // x^2 + y^2 = 0 has no tangent at the origin (4710): the current tangent goes on.
  Curve flat(Curve::kCircle, 2, 0.0);
  const double origin[2] = {0.0, 0.0};
  Orvq7PathMarch m2 = on_circle(-0.1, 0.0, 3);
  const double t_before = m2.t[0];
  ASSERT_EQ(wnccar(&flat, &n, eval_curve, kXd, origin, pas, &r.options, r.limits, r.tol,
                   &special, &m2, &redo, &accepted, &ierr),
            0);
  EXPECT_EQ(ierr, 0);
  EXPECT_EQ(bits(m2.x[0]), bits(0.0));
  EXPECT_EQ(bits(m2.t[0]), bits(t_before));
}

TEST(Wncver, TurnTestIsStrictAndTheChordTestScalesByTheTolerance) {
  const std::int32_t n = 2;
  const double limits[2] = {0.0, 0.92388}, tol[2] = {0.5, 0.5};
  const double t[2] = {1.0, 0.0}, step[2] = {4.0, 0.0};
  Orvq7PathOptions o{};
  o.kind = 2, o.flag18 = 1;
  std::int32_t redo = -1, ierr = -1;
  double dot = 0.0;
  // dot exactly at the limit passes; the next double below fails; |dot| counts for flag 1,
  // dot itself for flag 2.
  const double at[2] = {0.92388, 0.3}, below[2] = {std::nextafter(0.92388, 0.0), 0.3};
  const double back[2] = {-1.0, 0.0};
  struct Turn {
    const double* tnew;
    std::int32_t flag18, redo;
  };
  for (const Turn& k : {Turn{at, 1, 0}, Turn{below, 1, 1}, Turn{back, 1, 0}, Turn{back, 2, 1},
                        Turn{below, 0, 0}}) {
    o.flag18 = k.flag18;
    ASSERT_EQ(wncver(&n, step, t, k.tnew, &o, limits, tol, &redo, &dot, &ierr), 0);
    EXPECT_EQ(redo, k.redo) << k.tnew[0] << " flag " << k.flag18;
    EXPECT_EQ(bits(dot), bits(k.tnew[0]));
  }
  // K = 4 (no turn test): L / 8 = 0.5, t - tnew = (0.4, -0.8): sum (0.5 d_i / 0.5)^2 = 0.8
  // passes; with tolerance 0.4, 1.25 fails (redo 2). A reversed tnew gives the same.
  o.kind = 4, o.flag18 = 0;
  const double tnew[2] = {0.6, 0.8}, reversed[2] = {-0.6, -0.8}, tight[1] = {0.4};
  ASSERT_EQ(wncver(&n, step, t, tnew, &o, limits, tol, &redo, &dot, &ierr), 0);
  EXPECT_EQ(redo, 0);
  ASSERT_EQ(wncver(&n, step, t, tnew, &o, limits, tight, &redo, &dot, &ierr), 0);
  EXPECT_EQ(redo, 2);
  ASSERT_EQ(wncver(&n, step, t, reversed, &o, limits, tight, &redo, &dot, &ierr), 0);
  EXPECT_EQ(redo, 2);
  const std::int32_t bad = 1;
  EXPECT_EQ(wncver(&bad, step, t, tnew, &o, limits, tol, &redo, &dot, &ierr), 1);
  EXPECT_EQ(ierr, 4712);
}

}  // namespace
