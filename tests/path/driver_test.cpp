// tests/path/driver_test.cpp -- checks for path/driver.cpp: ynchem, end to end.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <thread>
#include <vector>

#include "curves.h"

namespace {

// A path from x0 along d0 in the box |x_i| <= half, steps (lo, hi), tol 0.01, and what ynchem
// left: result, code, frames, and the points with their tangents (kind 23), phases and
// numbers (kinds 1, 2), read back before the result is released.
struct Traced {
  std::vector<double> xd, box, pas, tol;
  std::int32_t mode = 4, store = 2 + 8;
  double eps = 1e-20;
  std::int32_t result = -1, ierr = -1, itab = -1, count = 0;
  std::vector<double> xt;
  std::vector<std::int32_t> phase, number;
  std::vector<Frame> frames;
  Traced(std::vector<double> x0, std::vector<double> d0, double half, double lo, double hi) {
    const std::size_t n = x0.size();
    xd = x0, xd.insert(xd.end(), d0.begin(), d0.end());
    box.assign(n, -half), box.insert(box.end(), n, half);
    pas.assign(n, lo), pas.insert(pas.end(), n, hi);
    tol.assign(n, 0.01);
  }
  const double* x(std::int32_t j, std::int32_t n) const { return xt.data() + 2 * n * j; }
};

template <class T>
std::vector<T> as(const std::vector<unsigned char>& bytes) {
  std::vector<T> v(bytes.size() / sizeof(T));
  if (!v.empty()) std::memcpy(v.data(), bytes.data(), bytes.size());
  return v;
}

void trace(Curve& c, Traced& r) {
  const std::int64_t live0 = orvq7sys_table_live();
  const WorkspaceWatch ws;
  RecordedFrames rec;
  std::int32_t n = c.n, count = 0;
  r.result = ynchem(&c, &n, eval_curve, &r.eps, r.xd.data(), r.box.data(), r.pas.data(), &r.mode,
                    r.tol.data(), &r.store, &r.itab, &r.ierr);
  r.frames = rec.frames();
  if (r.itab != 0) {
    r.xt = as<double>(read_kind(r.itab, 23, &r.count));
    r.phase = as<std::int32_t>(read_kind(r.itab, 1, &count));
    r.number = as<std::int32_t>(read_kind(r.itab, 2, &count));
    std::int32_t ierr = -1;
    EXPECT_EQ(yncend(&r.itab, &ierr), 0);
  }
  EXPECT_EQ(orvq7sys_table_live(), live0);  // nothing left after a failure or a release
  EXPECT_EQ(ws.outstanding(), 0);
}

// Every stored point on the curve (residuals evaluated here in long double), no step above
// its maximum, numbers 1..count, phases 0, 1, ..., 1, last_phase.
void expect_sound_path(const Curve& c, const Traced& r, std::int32_t last_phase) {
  const std::int32_t n = c.n;
  ASSERT_EQ(r.xt.size(), static_cast<std::size_t>(2 * n * r.count));
  for (std::int32_t j = 0; j < r.count; ++j) {
    Curve probe(c.kind, n, c.p);
    std::vector<double> f(n - 1);
    const std::int32_t one = 1;
    std::int32_t ierr = 0;
    eval_curve(&probe, &one, r.x(j, n), &one, f.data(), &ierr);
    long double s = 0;
    for (double v : f) s += static_cast<long double>(v) * v;
    EXPECT_LE(s, r.eps) << j + 1;
    EXPECT_EQ(r.number[j], j + 1);
    EXPECT_EQ(r.phase[j], j == 0 ? 0 : j + 1 == r.count ? last_phase : 1) << j + 1;
    for (std::int32_t i = 0; j > 0 && i < n; ++i) {
      EXPECT_LE(std::fabs(r.x(j, n)[i] - r.x(j - 1, n)[i]), r.pas[n + i]) << j + 1;
    }
  }
}

struct ClosedCase {
  Curve::Kind kind;
  std::int32_t n, mode;
  std::vector<std::int32_t> reqs;  // the requests the evaluation routine may see
};

class ClosedCurves : public ::testing::TestWithParam<ClosedCase> {};

TEST_P(ClosedCurves, CloseExactlyOnTheirStartPoint) {
  const ClosedCase& k = GetParam();
  Curve c(k.kind, k.n);
  std::vector<double> x0(k.n, 0.0), d0(k.n, 0.0);
  if (k.kind == Curve::kViviani) {
    x0[2] = 2.0, d0[1] = 1.0;  // (0, 0, 2) along y, through the crossing at (2, 0, 0)
  } else {
    x0[0] = 1.0, d0[1] = 1.0;
  }
  Traced r(x0, d0, 3.0, 1e-4, 0.25);
  r.mode = k.mode;
  trace(c, r);
  ASSERT_EQ(r.result, 0) << k.mode;
  EXPECT_EQ(r.ierr, 0);
  EXPECT_GT(r.count, 20);
  EXPECT_TRUE(r.frames.empty());
  expect_sound_path(c, r, 2);
  for (std::int32_t i = 0; i < k.n; ++i) {  // the last point is x0 itself, with d0
    EXPECT_EQ(bits(r.x(r.count - 1, k.n)[i]), bits(x0[i]));
    EXPECT_EQ(bits(r.x(r.count - 1, k.n)[k.n + i]), bits(d0[i]));
  }
  EXPECT_EQ(c.reqs[0], 1);
  for (std::size_t j = 0; j < c.reqs.size(); ++j) {
    EXPECT_NE(std::find(k.reqs.begin(), k.reqs.end(), c.reqs[j]), k.reqs.end()) << c.reqs[j];
    EXPECT_EQ(c.npts[j], 1);
  }
}

INSTANTIATE_TEST_SUITE_P(Ynchem, ClosedCurves,
                         ::testing::Values(ClosedCase{Curve::kCircle, 2, 2, {1, 2, 3}},
                                           ClosedCase{Curve::kCircle, 2, 4, {1, 3, 6}},
                                           ClosedCase{Curve::kCircle, 2, 4 + 32768, {1, 2, 3}},
                                           ClosedCase{Curve::kCircle, 2, 8, {1, 3, 6}},
                                           ClosedCase{Curve::kCircle4, 4, 8, {1, 2, 3, 6}},
                                           // n = 12: workspace at every tangent
                                           ClosedCase{Curve::kCircleN, 12, 4, {1, 2, 3, 6}},
                                           ClosedCase{Curve::kViviani, 3, 4, {1, 2, 3, 6}},
                                           ClosedCase{Curve::kViviani, 3, 2 + 262144, {1, 2, 3}}));

TEST(Ynchem, EllipseEndsExactlyOnTheFaceItLeaves) {
  // x^2/4 + y^2 = 1 from (0, 1) to the right leaves |x| <= 1.5 at (1.5, sqrt(0.4375)).
  Curve c(Curve::kEllipse, 2, 4.0);
  Traced r({0.0, 1.0}, {1.0, 0.0}, 2.0, 1e-4, 0.25);
  r.box[0] = -1.5, r.box[2] = 1.5;
  trace(c, r);
  ASSERT_EQ(r.result, 0);
  expect_sound_path(c, r, 2);
  EXPECT_EQ(bits(r.x(r.count - 1, 2)[0]), bits(1.5));
  EXPECT_NEAR(r.x(r.count - 1, 2)[1], 0.66143782776614765, 1e-9);
}

TEST(Ynchem, PointLimitHoldsForSmallSystemsOnly) {
  // A unit circle in steps of 0.9 * 0.001: x0, 6981 full steps (2 pi / 0.0009 = 6981.3), then
  // x0 again, 6983 points; n = 3 stops at the 5001st.
  for (std::int32_t n : {3, 5}) {
    Curve c(Curve::kCircleN, n);
    std::vector<double> x0(n, 0.0), d0(n, 0.0);
    x0[0] = 1.0, d0[1] = 1.0;
    Traced r(x0, d0, 3.0, 1e-5, 0.25);
    r.mode = 2, r.tol[0] = 0.001;
    trace(c, r);
    EXPECT_EQ(r.ierr, n == 3 ? 4720 : 0);
    EXPECT_NEAR(r.count, n == 3 ? 0 : 6983, 1);
    const std::vector<Frame> frames{{4720, "YNCHEM  ", 8}};
    EXPECT_EQ(r.frames, n == 3 ? frames : std::vector<Frame>{});
  }
}

struct FailCase {
  const char* what;
  std::int32_t n, mode, store;
  double dx, dy, pas_lo;  // d0 = (dx, dy, 0...) from x0 = (1, 0, ...) in the box |x_i| <= 1
  std::int32_t fail_code;
  std::size_t fail_after;
  std::int32_t ierr;
  std::vector<Frame> frames;
};

class Failures : public ::testing::TestWithParam<FailCase> {};

TEST_P(Failures, LeaveNoTableAndTheirFrames) {
  const FailCase& k = GetParam();
  Curve c(k.n == 2 ? Curve::kCircle : Curve::kCircleN, k.n);
  c.fail_code = k.fail_code, c.fail_after = k.fail_after;
  std::vector<double> x0(k.n, 0.0), d0(k.n, 0.0);
  x0[0] = 1.0, d0[0] = k.dx, d0[1] = k.dy;
  Traced r(x0, d0, 1.0, k.pas_lo, 0.25);
  r.mode = k.mode, r.store = k.store;
  trace(c, r);
  EXPECT_EQ(r.result, 1) << k.what;
  EXPECT_EQ(r.ierr, k.ierr) << k.what;
  EXPECT_EQ(r.itab, 0) << k.what;
  EXPECT_EQ(r.frames, k.frames) << k.what;
}

Frame ynchem_frame(std::int32_t code) { return {code, "YNCHEM  ", 8}; }

// clang-format off
INSTANTIATE_TEST_SUITE_P(Ynchem, Failures, ::testing::Values(
    FailCase{"store bit 0", 2, 4, 3, 0, 1, 1e-4, 0, 0, 4718, {ynchem_frame(4718)}},
    FailCase{"face pointing out", 2, 4, 10, 1, 0, 1e-4, 0, 0, 4721, {}},
    FailCase{"first step collapses", 2, 2, 10, 0, 1, 0.2, 0, 0, 4721, {}},
    FailCase{"d0 not a number", 2, 4, 10, 0, NAN, 1e-4, 0, 0, 4713,
             {{4713, "WNCGOO  ", 8}, ynchem_frame(4713)}},
    FailCase{"routine fails in a correction, n 2", 2, 4, 10, 0, 1, 1e-4, 4242, 2, 4242,
             {{4242, "WNCGF2;", 7}, {4242, "WNCGOO  ", 8}, ynchem_frame(4242)}},
    FailCase{"routine fails in a correction, n 3", 3, 4, 10, 0, 1, 1e-4, 4242, 2, 4242,
             {{4242, "WNCGOO  ", 8}, ynchem_frame(4242)}},
    // wncgf2 takes the routine's 4716 for an iterate leaving the box: the steps collapse.
    FailCase{"routine gives 4716, n 2", 2, 4, 10, 0, 1, 1e-4, 4716, 2, 4721, {}},
    FailCase{"routine gives 4715 for the tangent", 2, 4, 10, 0, 1, 1e-4, 4715, 1, 4718,
             {ynchem_frame(4718)}}));
// clang-format on

TEST(Ynchem, ValuesThatAreNotFiniteEndThePathByCollapse) {
  // From call 40 on every value is NaN or infinite: corrections fail, the step halves down to
  // the minimum steps and the path ends with what it holds; from call 2 on, at its start.
  for (double poison : {std::nan(""), HUGE_VAL, -HUGE_VAL}) {
    for (std::size_t after : {std::size_t{40}, std::size_t{2}}) {
      Curve c(Curve::kSpherePlane, 3);
      c.poison = poison, c.poison_after = after;
      Traced r({1, 0, 0}, {0, 1, 0}, 2.0, 1e-4, 0.25);
      trace(c, r);
      EXPECT_EQ(r.ierr, after == 2 ? 4721 : 0) << poison;
      if (after == 40) expect_sound_path(c, r, 1);  // no end point: the last keeps phase 1
    }
  }
}

TEST(Ynchem, WithoutRecordKind2TheLookupQuirkDecides) {
  std::thread([] {  // a fresh thread: the lookup count starts at 0
    Curve c(Curve::kCircle, 2);
    Traced r({1.0, 0.0}, {0.0, 1.0}, 2.0, 1e-4, 0.25);
    r.store = 2;  // kind 23 only: returned with 4712 and yncrea's frame
    trace(c, r);
    EXPECT_EQ(r.result, 0);
    EXPECT_EQ(r.ierr, 4712);
    EXPECT_GT(r.count, 20);
    EXPECT_EQ(r.frames, (std::vector<Frame>{{4712, " YNCREA ", 8}}));
    Traced collapse({1.0, 0.0}, {0.0, 1.0}, 2.0, 0.2, 0.25);
    trace(c, collapse);  // one point: leaves the count 1 behind
    trace(c, r);         // the whole circle again, now released as a single point
    EXPECT_EQ(r.result, 1);
    EXPECT_EQ(r.ierr, 4721);
  })
      .join();
}

}  // namespace
