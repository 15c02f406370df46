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

std::vector<double> axis(std::int32_t n, std::int32_t i, double len = 1.0) {
  std::vector<double> v(n, 0.0);
  v[i] = len;
  return v;
}

// Traces the path; whatever the outcome, no table and no workspace block may be left. Returns
// the frames recorded by ynchem.
std::vector<Frame> trace(Curve& c, Path& r) {
  const std::int64_t live0 = orvq7sys_table_live();
  const WorkspaceWatch ws;
  RecordedFrames rec;
  run_path(c, r);
  EXPECT_EQ(orvq7sys_table_live(), live0);
  EXPECT_EQ(ws.outstanding(), 0);
  return rec.frames();
}

// Every stored point on the curve, no step above its maximum, numbers 1..count, phases
// 0, 1, ..., 1, last_phase.
void expect_sound(const Curve& c, const Path& r, std::int32_t last_phase) {
  const std::int32_t n = c.n;
  ASSERT_EQ(r.xt.size(), static_cast<std::size_t>(2 * n * r.count));
  ASSERT_EQ(r.phase.size(), static_cast<std::size_t>(r.count));
  for (std::int32_t j = 0; j < r.count; ++j) {
    EXPECT_LE(c.residual2(r.x(j)), 1e-20) << j + 1;
    EXPECT_EQ(r.number[j], j + 1);
    EXPECT_EQ(r.phase[j], j == 0 ? 0 : j + 1 == r.count ? last_phase : 1) << j + 1;
    for (std::int32_t i = 0; j > 0 && i < n; ++i) {
      EXPECT_LE(std::fabs(r.x(j)[i] - r.x(j - 1)[i]), 0.25) << j + 1;
    }
  }
}

struct PathCase {
  Curve::Kind kind;
  std::int32_t n, mode;
  double p;
  std::int32_t x0_axis, d0_axis;  // x0 = x0_len e(x0_axis), d0 = e(d0_axis)
  double x0_len;
  std::vector<double> half;
  double face;  // 0: closes on x0 with d0; else the path ends on the face x = face
  std::vector<std::int32_t> reqs;  // the requests the evaluation routine may see
};

class Paths : public ::testing::TestWithParam<PathCase> {};

TEST_P(Paths, EndExactlyOnTheirStartPointOrOnTheFaceTheyLeave) {
  const PathCase& k = GetParam();
  Curve c(k.kind, k.n, k.p);
  Path r{axis(k.n, k.x0_axis, k.x0_len), axis(k.n, k.d0_axis), k.half};
  r.mode = k.mode;
  const std::vector<Frame> frames = trace(c, r);
  ASSERT_EQ(r.result, 0);
  EXPECT_EQ(r.ierr, 0);
  EXPECT_TRUE(frames.empty());
  expect_sound(c, r, 2);
  const double* end = r.x(r.count - 1);
  if (k.face == 0.0) {
    EXPECT_GT(r.count, 20);
    for (std::int32_t i = 0; i < k.n; ++i) {  // the last point is x0 itself, with d0
      EXPECT_EQ(bits(end[i]), bits(r.x0[i]));
      EXPECT_EQ(bits(end[k.n + i]), bits(r.d0[i]));
    }
  } else {  // x^2 / p + y^2 = 1 at x = face
    EXPECT_EQ(bits(end[0]), bits(k.face));
    EXPECT_NEAR(end[1], std::sqrt(1.0 - k.face * k.face / k.p), 1e-9);
  }
  EXPECT_EQ(c.reqs[0], 1);
  for (std::size_t j = 0; j < c.reqs.size(); ++j) {
    EXPECT_NE(std::find(k.reqs.begin(), k.reqs.end(), c.reqs[j]), k.reqs.end()) << c.reqs[j];
    EXPECT_EQ(c.npts[j], 1);
  }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Ynchem, Paths, ::testing::Values(
    PathCase{Curve::kCircle, 2, 2, 1, 0, 1, 1, {3}, 0, {1, 2, 3}},
    PathCase{Curve::kCircle, 2, 4, 1, 0, 1, 1, {3}, 0, {1, 3, 6}},
    PathCase{Curve::kCircle, 2, 4 + 32768, 1, 0, 1, 1, {3}, 0, {1, 2, 3}},
    PathCase{Curve::kCircle, 2, 8, 1, 0, 1, 1, {3}, 0, {1, 3, 6}},
    PathCase{Curve::kCircle, 4, 8, 1, 0, 1, 1, {3}, 0, {1, 2, 3, 6}},
    PathCase{Curve::kCircle, 12, 4, 1, 0, 1, 1, {3}, 0, {1, 2, 3, 6}},  // workspace per tangent
    // Viviani's curve from (0, 0, 2) along y, through its crossing at (2, 0, 0).
    PathCase{Curve::kViviani, 3, 4, 1, 2, 1, 2, {3}, 0, {1, 2, 3, 6}},
    PathCase{Curve::kViviani, 3, 2 + 262144, 1, 2, 1, 2, {3}, 0, {1, 2, 3}},
    // x^2/4 + y^2 = 1 from (0, 1) to the right leaves |x| <= 1.5 at (1.5, sqrt(0.4375)).
    PathCase{Curve::kEllipse, 2, 4, 4, 1, 0, 1, {1.5, 2}, 1.5, {1, 2, 3, 6}}));
// clang-format on

TEST(Ynchem, PointLimitHoldsForSmallSystemsOnly) {
  // A unit circle in steps of 0.9 * 0.001: x0, 6981 full steps (2 pi / 0.0009 = 6981.3), then
  // x0 again, 6983 points; n = 3 stops at the 5001st.
  for (std::int32_t n : {3, 5}) {
    Curve c(Curve::kCircle, n);
    Path r{axis(n, 0), axis(n, 1)};
    r.mode = 2, r.lo = 1e-5, r.tol = 0.001;
    const std::vector<Frame> frames = trace(c, r);
    EXPECT_EQ(r.ierr, n == 3 ? 4720 : 0);
    EXPECT_NEAR(r.count, n == 3 ? 0 : 6983, 1);
    const std::vector<Frame> limit{{4720, "YNCHEM  ", 8}};
    EXPECT_EQ(frames, n == 3 ? limit : std::vector<Frame>{});
  }
}

struct FailCase {
  const char* what;
  std::int32_t n, mode, store;
  double dx, dy, lo;  // d0 = (dx, dy, 0...) from x0 = (1, 0, ...) in the box |x_i| <= 1
  std::int32_t fail_code, fail_after, ierr;
  std::vector<const char*> frames;  // names of the frames, all with code ierr
};

class Failures : public ::testing::TestWithParam<FailCase> {};

TEST_P(Failures, LeaveNoTableAndTheirFrames) {
  const FailCase& k = GetParam();
  SCOPED_TRACE(k.what);
  Curve c(Curve::kCircle, k.n);
  c.fail_code = k.fail_code, c.fail_after = k.fail_after;
  Path r{axis(k.n, 0), axis(k.n, 0, k.dx), {1.0}, k.lo};
  r.d0[1] = k.dy, r.mode = k.mode, r.store = k.store;
  const std::vector<Frame> frames = trace(c, r);
  EXPECT_EQ(r.result, 1);
  EXPECT_EQ(r.ierr, k.ierr);
  EXPECT_EQ(r.itab, 0);
  std::vector<Frame> want;
  for (const char* name : k.frames) want.push_back({k.ierr, name, std::int32_t(strlen(name))});
  EXPECT_EQ(frames, want);
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(Ynchem, Failures, ::testing::Values(
    FailCase{"store bit 0", 2, 4, 3, 0, 1, 1e-4, 0, 0, 4718, {"YNCHEM  "}},
    FailCase{"face pointing out", 2, 4, 10, 1, 0, 1e-4, 0, 0, 4721, {}},
    FailCase{"first step collapses", 2, 2, 10, 0, 1, 0.2, 0, 0, 4721, {}},
    FailCase{"d0 not a number", 2, 4, 10, 0, NAN, 1e-4, 0, 0, 4713, {"WNCGOO  ", "YNCHEM  "}},
    FailCase{"routine fails in a correction, n 2", 2, 4, 10, 0, 1, 1e-4, 4242, 2, 4242,
             {"WNCGF2;", "WNCGOO  ", "YNCHEM  "}},
    FailCase{"routine fails in a correction, n 3", 3, 4, 10, 0, 1, 1e-4, 4242, 2, 4242,
             {"WNCGOO  ", "YNCHEM  "}},
    // wncgf2 takes the routine's 4716 for an iterate leaving the box: the steps collapse.
    FailCase{"routine gives 4716, n 2", 2, 4, 10, 0, 1, 1e-4, 4716, 2, 4721, {}},
    FailCase{"routine gives 4715 for the tangent", 2, 4, 10, 0, 1, 1e-4, 4715, 1, 4718,
             {"YNCHEM  "}}));
// clang-format on

TEST(Ynchem, ValuesThatAreNotFiniteEndThePathByCollapse) {
  // From call 40 on every value is NaN or infinite: corrections fail, the step halves down to
  // the minimum steps and the path ends with what it holds; from call 2 on, at its start.
  for (double poison : {std::nan(""), HUGE_VAL, -HUGE_VAL}) {
    for (std::size_t after : {40, 2}) {
      Curve c(Curve::kSpherePlane, 3);
      c.poison = poison, c.poison_after = after;
      Path r{{1, 0, 0}, {0, 1, 0}, {2.0}};
      trace(c, r);
      EXPECT_EQ(r.ierr, after == 2 ? 4721 : 0) << poison;
      if (after == 40) expect_sound(c, r, 1);  // no end point: the last keeps phase 1
    }
  }
}

TEST(Ynchem, WithoutRecordKind2TheLookupQuirkDecides) {
  std::thread([] {  // a fresh thread: the lookup count starts at 0
    Curve c(Curve::kCircle, 2);
    Path r{{1.0, 0.0}, {0.0, 1.0}};
    r.store = 2;  // kind 23 only: returned with 4712 and yncrea's frame
    EXPECT_EQ(trace(c, r), (std::vector<Frame>{{4712, " YNCREA ", 8}}));
    EXPECT_EQ(r.result, 0);
    EXPECT_EQ(r.ierr, 4712);
    EXPECT_GT(r.count, 20);
    Path collapse{{1.0, 0.0}, {0.0, 1.0}, {3.0}, 0.2};
    trace(c, collapse);  // one point: leaves the count 1 behind
    trace(c, r);         // the whole circle again, now released as a single point
    EXPECT_EQ(r.result, 1);
    EXPECT_EQ(r.ierr, 4721);
  }).join();
}

}  // namespace
