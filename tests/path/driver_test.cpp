// tests/path/driver_test.cpp -- checks for path/driver.cpp: ynchem, end to end.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <thread>
#include <vector>

#include "curves.h"

namespace {

// One call of ynchem and what it left: the points and tangents (kind 23), phases and numbers
// (kinds 1, 2) read back, then the result released.
struct Traced {
  std::int32_t result = -1, ierr = -1, itab = -1, count = 0;
  std::vector<double> xt;  // 2n reals per point: x, then t
  std::vector<std::int32_t> phase, number;
  std::vector<Frame> frames;
  const double* x(std::int32_t j) const { return xt.data() + 2 * n * j; }  // point j from 0
  std::int32_t n = 0;
};

struct PathSetup {
  std::vector<double> xd, box, pas, tol;
  std::int32_t mode = 4, store = 2 + 8;
  double eps = 1e-20;
};

// A box of half-width `half` and steps (lo, hi) for every unknown.
PathSetup setup(std::vector<double> x0, std::vector<double> d0, double half, double lo, double hi) {
  PathSetup s;
  const std::size_t n = x0.size();
  s.xd = x0;
  s.xd.insert(s.xd.end(), d0.begin(), d0.end());
  s.box.assign(n, -half);
  s.box.insert(s.box.end(), n, half);
  s.pas.assign(n, lo);
  s.pas.insert(s.pas.end(), n, hi);
  s.tol.assign(n, 0.01);
  return s;
}

template <class T>
std::vector<T> as(const std::vector<unsigned char>& bytes) {
  std::vector<T> v(bytes.size() / sizeof(T));
  if (!v.empty()) std::memcpy(v.data(), bytes.data(), bytes.size());
  return v;
}

Traced trace(Curve& c, const PathSetup& s) {
  Traced t;
  t.n = c.n;
  const std::int64_t live0 = orvq7sys_table_live();
  RecordedFrames rec;
  std::int32_t n = c.n;
  t.result = ynchem(&c, &n, eval_curve, &s.eps, s.xd.data(), s.box.data(), s.pas.data(), &s.mode,
                    s.tol.data(), &s.store, &t.itab, &t.ierr);
  t.frames = rec.frames();
  if (t.itab != 0) {
    std::int32_t count = 0;
    t.xt = as<double>(read_kind(t.itab, 23, &t.count));
    t.phase = as<std::int32_t>(read_kind(t.itab, 1, &count));
    t.number = as<std::int32_t>(read_kind(t.itab, 2, &count));
    std::int32_t ierr = -1;
    EXPECT_EQ(yncend(&t.itab, &ierr), 0);
  }
  EXPECT_EQ(orvq7sys_table_live(), live0);  // nothing left after a failure or a release
  return t;
}

// Sum of squared residuals of the curve at x, evaluated here in long double.
long double residual(const Curve& c, const double* x) {
  Curve probe(c.kind, c.n, c.p);
  std::vector<double> f(c.n - 1);
  const std::int32_t one = 1, req = 1;
  std::int32_t ierr = 0;
  eval_curve(&probe, &one, x, &req, f.data(), &ierr);
  long double s = 0;
  for (double v : f) s += static_cast<long double>(v) * v;
  return s;
}

// Every point on the curve, every step within its maximum, numbers 1..count, the phases
// 0, 1, ..., 1, last_phase.
void expect_sound_path(const Curve& c, const PathSetup& s, const Traced& t, std::int32_t last_phase) {
  const std::int32_t n = c.n;
  ASSERT_EQ(t.xt.size(), static_cast<std::size_t>(2 * n * t.count));
  ASSERT_EQ(t.number.size(), static_cast<std::size_t>(t.count));
  for (std::int32_t j = 0; j < t.count; ++j) {
    EXPECT_LE(residual(c, t.x(j)), s.eps) << "point " << j + 1;
    EXPECT_EQ(t.number[j], j + 1);
    EXPECT_EQ(t.phase[j], j == 0 ? 0 : j + 1 == t.count ? last_phase : 1) << j + 1;
    for (std::int32_t i = 0; j > 0 && i < n; ++i) {
      EXPECT_LE(std::fabs(t.x(j)[i] - t.x(j - 1)[i]), s.pas[n + i]) << j + 1;
    }
  }
}

struct ClosedCase {
  const char* what;
  Curve::Kind kind;
  std::int32_t n, mode;
};

class ClosedCurves : public ::testing::TestWithParam<ClosedCase> {};

TEST_P(ClosedCurves, CloseExactlyOnTheirStartPoint) {
  const ClosedCase& k = GetParam();
  Curve c(k.kind, k.n);
  std::vector<double> x0(k.n, 0.0), d0(k.n, 0.0);
  if (k.kind == Curve::kViviani) {
    x0[2] = 2.0, d0[1] = 1.0;  // (0, 0, 2) along y, through the crossing at (2, 0, 0)
  } else {
    x0[0] = 1.0, d0[1] = 1.0;  // (1, 0, ...) along x2
  }
  PathSetup s = setup(x0, d0, 3.0, 1e-4, 0.25);
  s.mode = k.mode;
  const Traced t = trace(c, s);
  ASSERT_EQ(t.result, 0) << k.what;
  EXPECT_EQ(t.ierr, 0);
  EXPECT_GT(t.count, 20);
  EXPECT_TRUE(t.frames.empty());
  expect_sound_path(c, s, t, 2);
  const double* last = t.x(t.count - 1);
  for (std::int32_t i = 0; i < k.n; ++i) {
    EXPECT_EQ(bits(last[i]), bits(x0[i])) << k.what;      // x0 itself
    EXPECT_EQ(bits(last[k.n + i]), bits(d0[i])) << k.what;  // with d0 as its tangent
  }
}

INSTANTIATE_TEST_SUITE_P(
    Ynchem, ClosedCurves,
    ::testing::Values(ClosedCase{"circle K2", Curve::kCircle, 2, 2},
                      ClosedCase{"circle K4", Curve::kCircle, 2, 4},
                      ClosedCase{"circle K4 bit 15", Curve::kCircle, 2, 4 + 32768},
                      ClosedCase{"circle K8", Curve::kCircle, 2, 8},
                      ClosedCase{"circle n4 K8 bit 15", Curve::kCircle4, 4, 8 + 32768},
                      ClosedCase{"viviani K4", Curve::kViviani, 3, 4},
                      ClosedCase{"viviani K2 bit 18", Curve::kViviani, 3, 2 + 262144}));

TEST(Ynchem, EllipseEndsExactlyOnTheFaceItLeaves) {
  // x^2/4 + y^2 = 1 from (0, 1) to the right: leaves the box |x| <= 1.5 at
  // (1.5, sqrt(1 - 2.25/4)) = (1.5, 0.661437827766147...).
  Curve c(Curve::kEllipse, 2, 4.0);
  PathSetup s = setup({0.0, 1.0}, {1.0, 0.0}, 2.0, 1e-4, 0.25);
  s.box[0] = -1.5, s.box[2] = 1.5;
  const Traced t = trace(c, s);
  ASSERT_EQ(t.result, 0);
  EXPECT_EQ(t.ierr, 0);
  expect_sound_path(c, s, t, 2);
  const double* last = t.x(t.count - 1);
  EXPECT_EQ(bits(last[0]), bits(1.5));
  EXPECT_NEAR(last[1], 0.66143782776614765, 1e-9);
  EXPECT_GT(last[2], 0.0);  // still heading right
}

TEST(Ynchem, PointLimitHoldsForSmallSystemsOnly) {
  // A unit circle with steps of 0.9 * 0.001: about 6981 points. n = 3 stops at the 5001st.
  for (std::int32_t n : {3, 5}) {
    Curve c(Curve::kCircleN, n);
    std::vector<double> x0(n, 0.0), d0(n, 0.0);
    x0[0] = 1.0, d0[1] = 1.0;
    PathSetup s = setup(x0, d0, 3.0, 1e-5, 0.25);
    s.mode = 2;
    s.tol[0] = 0.001;
    const Traced t = trace(c, s);
    if (n == 3) {
      EXPECT_EQ(t.result, 1);
      EXPECT_EQ(t.ierr, 4720);
      EXPECT_EQ(t.itab, 0);
      EXPECT_EQ(t.frames, (std::vector<Frame>{{4720, "YNCHEM  ", 8}}));
    } else {
      ASSERT_EQ(t.result, 0);
      EXPECT_GT(t.count, 6900);
      EXPECT_LT(t.count, 7100);
    }
  }
}

struct RefusedCase {
  const char* what;
  std::vector<double> x0, d0;
  double pas_lo;
  std::int32_t n, mode, store, ierr;
  std::vector<Frame> frames;
};

class Refusals : public ::testing::TestWithParam<RefusedCase> {};

TEST_P(Refusals, LeaveNoTableAndTheirFrame) {
  const RefusedCase& k = GetParam();
  Curve c(Curve::kCircle, 2);
  PathSetup s = setup(k.x0, k.d0, 1.0, k.pas_lo, 0.25);
  s.mode = k.mode;
  s.store = k.store;
  s.xd.resize(40, 0.0), s.box.resize(40, 1.0), s.pas.resize(40, 0.5), s.tol.resize(20, 0.01);
  c.n = k.n;
  const Traced t = trace(c, s);
  EXPECT_EQ(t.result, 1) << k.what;
  EXPECT_EQ(t.ierr, k.ierr) << k.what;
  EXPECT_EQ(t.itab, 0) << k.what;
  EXPECT_EQ(t.frames, k.frames) << k.what;
}

const std::vector<Frame> kNone;

INSTANTIATE_TEST_SUITE_P(
    Ynchem, Refusals,
    ::testing::Values(
        RefusedCase{"n 1", {1, 0}, {0, 1}, 1e-4, 1, 4, 10, 4712, {{4712, "YNCHEM  ", 8}}},
        RefusedCase{"n 21", {1, 0}, {0, 1}, 1e-4, 21, 4, 10, 4718, {{4718, "YNCHEM  ", 8}}},
        RefusedCase{"kind 1", {1, 0}, {0, 1}, 1e-4, 2, 1, 10, 4718, {{4718, "YNCHEM  ", 8}}},
        RefusedCase{"store bit 0", {1, 0}, {0, 1}, 1e-4, 2, 4, 3, 4718, {{4718, "YNCHEM  ", 8}}},
        RefusedCase{"off the curve", {0.5, 0}, {0, 1}, 1e-4, 2, 4, 10, 4712,
                    {{4712, "YNCHEM  ", 8}}},
        // On the face x = 1 pointing out: no table, no frame.
        RefusedCase{"face pointing out", {1, 0}, {1, 0}, 1e-4, 2, 4, 10, 4721, kNone},
        // Every move below the minimum steps: the first step collapses, one point.
        RefusedCase{"first step collapses", {1, 0}, {0, 1}, 0.2, 2, 2, 10, 4721, kNone},
        // A start direction that is not a number: the first prediction is not finite.
        RefusedCase{"d0 not a number", {1, 0}, {0, NAN}, 1e-4, 2, 4, 10, 4713,
                    {{4713, "WNCGOO  ", 8}, {4713, "YNCHEM  ", 8}}}));

TEST(Ynchem, EvaluationRoutineSeesTheContextAndTheStatedRequests) {
  // n = 2, K = 4: residuals at x0 (1), tangents with second derivatives (6), Newton (3).
  // n = 3, K = 2: residuals (1), tangents (2), frozen gradients and Newton (2, 3).
  for (std::int32_t n : {2, 3}) {
    Curve c(n == 2 ? Curve::kCircle : Curve::kSpherePlane, n);
    std::vector<double> x0(n, 0.0), d0(n, 0.0);
    x0[0] = 1.0, d0[1] = 1.0;
    PathSetup s = setup(x0, d0, 2.0, 1e-4, 0.25);
    s.mode = n == 2 ? 4 : 2;
    ASSERT_EQ(trace(c, s).result, 0);
    EXPECT_EQ(c.reqs[0], 1);
    EXPECT_EQ(c.reqs[1], n == 2 ? 6 : 2);
    for (std::size_t k = 0; k < c.reqs.size(); ++k) {
      const std::int32_t r = c.reqs[k];
      EXPECT_TRUE(r == 1 || r == 3 || r == (n == 2 ? 6 : 2)) << k << ": " << r;
      EXPECT_EQ(c.npts[k], 1);
    }
  }
}

TEST(Ynchem, FailuresOfTheEvaluationRoutineArePassedOnWithTheirFrames) {
  struct Case {
    std::int32_t n, code;
    std::size_t after;
    std::int32_t ierr;
    std::vector<Frame> frames;
  };
  const Case cases[] = {
      // In the first correction of a two-unknown path: wncgf2, wncgoo, ynchem.
      {2, 4242, 2, 4242, {{4242, "WNCGF2;", 7}, {4242, "WNCGOO  ", 8}, {4242, "YNCHEM  ", 8}}},
      {3, 4242, 2, 4242, {{4242, "WNCGOO  ", 8}, {4242, "YNCHEM  ", 8}}},
      // 4716 in a two-unknown correction reads as an iterate leaving the box (no frame):
      // the step halves until it collapses, at the first step.
      {2, 4716, 2, 4721, {}},
      // 4715 to the tangent request at x0 becomes 4718.
      {2, 4715, 1, 4718, {{4718, "YNCHEM  ", 8}}},
  };
  for (const Case& k : cases) {
    Curve c(k.n == 2 ? Curve::kCircle : Curve::kSpherePlane, k.n);
    c.fail_code = k.code;
    c.fail_after = k.after;
    std::vector<double> x0(k.n, 0.0), d0(k.n, 0.0);
    x0[0] = 1.0, d0[1] = 1.0;
    const Traced t = trace(c, setup(x0, d0, 2.0, 1e-4, 0.25));
    EXPECT_EQ(t.result, 1) << k.code;
    EXPECT_EQ(t.ierr, k.ierr);
    EXPECT_EQ(t.itab, 0);
    EXPECT_EQ(t.frames, k.frames) << k.n << " " << k.code;
  }
}

TEST(Ynchem, ValuesThatAreNotFiniteEndThePathByCollapse) {
  // From some call on, every value the routine gives is NaN or infinite: the corrections
  // fail, the step halves down to the minimum steps and the path ends with what it holds.
  for (double poison : {std::nan(""), HUGE_VAL, -HUGE_VAL}) {
    for (std::int32_t n : {2, 3}) {
      Curve c(n == 2 ? Curve::kCircle : Curve::kSpherePlane, n);
      c.poison = poison;
      c.poison_after = 40;
      std::vector<double> x0(n, 0.0), d0(n, 0.0);
      x0[0] = 1.0, d0[1] = 1.0;
      PathSetup s = setup(x0, d0, 2.0, 1e-4, 0.25);
      const Traced t = trace(c, s);
      ASSERT_EQ(t.result, 0) << poison << " " << n;
      EXPECT_GT(t.count, 1);
      expect_sound_path(c, s, t, 1);  // no end point: the last one keeps phase 1
      // From the first step on: the start point alone, 4721.
      Curve d(c.kind, n);
      d.poison = poison;
      d.poison_after = 2;
      const Traced u = trace(d, s);
      EXPECT_EQ(u.result, 1);
      EXPECT_EQ(u.ierr, 4721);
    }
  }
}

TEST(Ynchem, WithoutRecordKind2TheLookupQuirkDecides) {
  // Fresh threads, so the lookup count starts at 0.
  std::thread([] {
    Curve c(Curve::kCircle, 2);
    PathSetup s = setup({1.0, 0.0}, {0.0, 1.0}, 2.0, 1e-4, 0.25);
    s.store = 2;  // kind 23 only: yncrea fails, the path is returned with 4712
    const Traced t = trace(c, s);
    EXPECT_EQ(t.result, 0);
    EXPECT_EQ(t.ierr, 4712);
    EXPECT_GT(t.count, 20);
    EXPECT_EQ(t.frames, (std::vector<Frame>{{4712, " YNCREA ", 8}}));
  }).join();
  std::thread([] {
    Curve c(Curve::kCircle, 2);
    PathSetup collapse = setup({1.0, 0.0}, {0.0, 1.0}, 2.0, 0.2, 0.25);
    EXPECT_EQ(trace(c, collapse).ierr, 4721);  // leaves the count 1 behind
    PathSetup s = setup({1.0, 0.0}, {0.0, 1.0}, 2.0, 1e-4, 0.25);
    s.store = 2;
    const Traced t = trace(c, s);  // the whole circle, then released as a single point
    EXPECT_EQ(t.result, 1);
    EXPECT_EQ(t.ierr, 4721);
    EXPECT_EQ(t.itab, 0);
  }).join();
}

TEST(Ynchem, LeavesNoWorkspaceBlockBehind) {
  // n = 12 with second derivatives: the tangent routine takes workspace at every point.
  Curve c(Curve::kCircleN, 12);
  std::vector<double> x0(12, 0.0), d0(12, 0.0);
  x0[0] = 1.0, d0[1] = 1.0;
  const WorkspaceWatch ws;
  const Traced t = trace(c, setup(x0, d0, 2.0, 1e-4, 0.25));
  EXPECT_EQ(t.result, 0);
  EXPECT_GT(ws.requests(), t.count);
  EXPECT_EQ(ws.outstanding(), 0);
  ws.refuse_next(1);  // refused at the tangent of x0: 36
  const Traced u = trace(c, setup(x0, d0, 2.0, 1e-4, 0.25));
  EXPECT_EQ(u.ierr, 36);
  EXPECT_EQ(ws.outstanding(), 0);
}

}  // namespace
