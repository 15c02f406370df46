// tests/path/driver_test.cpp -- checks for path/driver.cpp: ynchem, end to end.
#include <thread>

#include "curves.h"


// Traces the path; whatever the outcome, no table and no workspace block may be left. Returns
// the frames recorded by ynchem.
std::vector<Frame> trace(Path& r) {
  const std::int64_t live0 = orvq7sys_table_live();
  const WorkspaceWatch ws;
  r.run();
  EXPECT_EQ(orvq7sys_table_live(), live0);
  EXPECT_EQ(ws.outstanding(), 0);
  return r.frames;
}

// Every stored point on the curve, no step above its maximum, numbers 1..count, phases
// 0, 1, ..., 1, last_phase.
void expect_sound(const Path& r, std::int32_t last_phase) {
  const std::int32_t n = r.c.n;
  ASSERT_EQ((Ints{int(r.xt.size()), int(r.phase.size())}), (Ints{2 * n * r.count, r.count}));
  for (std::int32_t j = 0; j < r.count; ++j) {
    EXPECT_LE(r.c.residual2(r.x(j)), 1e-20) << j + 1;
    EXPECT_EQ(r.number[j], j + 1);
    EXPECT_EQ(r.phase[j], j == 0 ? 0 : j + 1 == r.count ? last_phase : 1) << j + 1;
    for (std::int32_t i = 0; j > 0 && i < n; ++i) {
      EXPECT_LE(std::fabs(r.x(j)[i] - r.x(j - 1)[i]), 0.25) << j + 1;
    }
  }
}

const Reals e1 = {1, 0}, e2 = {0, 1};

TEST(Ynchem, PathsEndExactlyOnTheirStartPointOrOnTheFaceTheyLeave) {
  struct Case { Path r; Ints reqs; };  // the requests the evaluation routine may see
  const Curve circle(Curve::kCircle, 2), viviani(Curve::kViviani, 3);
  Reals x12(12), d12(12);
  x12[0] = d12[1] = 1.0;
  // clang-format off
  Case cases[] = {
      {{circle, e1, e2, {3}, 1e-4, 0.01, 2}, {1, 2, 3}},
      {{circle, e1, e2, {3}, 1e-4, 0.01, 4}, {1, 3, 6}},
      {{circle, e1, e2, {3}, 1e-4, 0.01, 4 + 32768}, {1, 2, 3}},
      {{circle, e1, e2, {3}, 1e-4, 0.01, 8}, {1, 3, 6}},
      {{Curve(Curve::kCircle, 4), {1, 0, 0, 0}, {0, 1, 0, 0}, {3}, 1e-4, 0.01, 8}, {1, 2, 3, 6}},
      {{Curve(Curve::kCircle, 12), x12, d12}, {1, 2, 3, 6}},  // n = 12: workspace
      // Viviani's curve from (0, 0, 2) along y, through its crossing at (2, 0, 0).
      {{viviani, {0, 0, 2}, {0, 1, 0}, {3}, 1e-4, 0.01, 4}, {1, 2, 3, 6}},
      {{viviani, {0, 0, 2}, {0, 1, 0}, {3}, 1e-4, 0.01, 2 + 262144}, {1, 2, 3}},
      // x^2/4 + y^2 = 1 from (0, 1) to the right leaves |x| <= 1.5 at (1.5, sqrt(0.4375)).
      {{Curve(Curve::kEllipse, 2, 4.0), e2, e1, {1.5, 2.0}}, {1, 2, 3, 6}}};
  // clang-format on
  for (Case& k : cases) {
    Path& r = k.r;
    const std::int32_t n = r.c.n;
    SCOPED_TRACE(testing::Message() << n << " " << r.mode);
    EXPECT_TRUE(trace(r).empty());
    EXPECT_EQ(r.ierr, 0);
    expect_sound(r, 2);
    const double* end = r.x(r.count - 1);
    if (r.half[0] == 1.5) {
      EXPECT_EQ(bits(end[0]), bits(1.5));
      EXPECT_NEAR(end[1], std::sqrt(0.4375), 1e-9);
    } else {  // the last point is x0 itself, with d0
      EXPECT_GT(r.count, 20);
      EXPECT_EQ(bitsv(end, n), bitsv(r.x0));
      EXPECT_EQ(bitsv(end + n, n), bitsv(r.d0));
    }
    EXPECT_EQ(r.c.reqs[0], 1);  // then only the requests of the case, each for one point
    for (std::int32_t req : r.c.reqs) EXPECT_TRUE(std::count(k.reqs.begin(), k.reqs.end(), req));
    EXPECT_EQ(r.c.npts, Ints(r.c.npts.size(), 1));
  }
}

TEST(Ynchem, PointLimitHoldsForSmallSystemsOnly) {
  // A unit circle in steps of 0.9 * 0.001: x0, 6981 full steps (2 pi / 0.0009 = 6981.3), then
  // x0 again, 6983 points (n = 3 stops at the 5001st, among the failures).
  Path r{Curve(Curve::kCircle, 5), {1, 0, 0, 0, 0}, {0, 1, 0, 0, 0}, {3.0}, 1e-5, 0.001, 2};
  EXPECT_EQ((Ints{int(trace(r).size()), r.ierr}), (Ints{0, 0}));  // no frame
  EXPECT_NEAR(r.count, 6983, 1);
}

TEST(Ynchem, FailuresLeaveNoTableAndTheirFrames) {
  // From x0 = (1, 0, ...) in the box |x_i| <= 1 but for the point limit; the names of the
  // frames, all with code ierr.
  struct Case { Path r; int fail, after, ierr; std::vector<const char*> frames; };
  const Curve circle(Curve::kCircle, 2), circle3(Curve::kCircle, 3);
  const Reals nan = {0, NAN}, e13 = {1, 0, 0}, e23 = {0, 1, 0};
  // clang-format off
  // Store bit 0; on a face pointing out; the first step collapses; d0 not a number; the point
  // limit; the routine fails in a correction (n = 2, 3); wncgf2 takes the routine's 4716 for an
  // iterate leaving the box (the steps collapse); 4715 for the tangent.
  Case cases[] = {
      {{circle, e1, e2, {1}, 1e-4, 0.01, 4, 3}, 0, 0, 4718, {"YNCHEM  "}},
      {{circle, e1, e1, {1}}, 0, 0, 4721, {}},
      {{circle, e1, e2, {1}, 0.2, 0.01, 2}, 0, 0, 4721, {}},
      {{circle, e1, nan, {1}}, 0, 0, 4713, {"WNCGOO  ", "YNCHEM  "}},
      {{circle3, e13, e23, {3}, 1e-5, 0.001, 2}, 0, 0, 4720, {"YNCHEM  "}},
      {{circle, e1, e2, {1}}, 4242, 2, 4242, {"WNCGF2;", "WNCGOO  ", "YNCHEM  "}},
      {{circle3, e13, e23, {1}}, 4242, 2, 4242, {"WNCGOO  ", "YNCHEM  "}},
      {{circle, e1, e2, {1}}, 4716, 2, 4721, {}},
      {{circle, e1, e2, {1}}, 4715, 1, 4718, {"YNCHEM  "}}};
  // clang-format on
  for (Case& k : cases) {
    k.r.c.fail_code = k.fail, k.r.c.fail_after = k.after;
    std::vector<Frame> want;
    for (const char* name : k.frames) want.push_back({k.ierr, name, std::int32_t(strlen(name))});
    EXPECT_EQ(trace(k.r), want) << k.ierr;
    EXPECT_EQ((Ints{k.r.result, k.r.ierr, k.r.itab, k.r.count}), (Ints{1, k.ierr, 0, 0}));
  }
}

TEST(Ynchem, ValuesThatAreNotFiniteEndThePathByCollapse) {
  // From call 40 on every value is NaN or infinite: corrections fail, the step halves down to
  // the minimum steps and the path ends with what it holds; from call 2 on, at its start.
  for (double poison : {std::nan(""), HUGE_VAL, -HUGE_VAL}) {
    for (std::size_t after : {40, 2}) {
      Path r{Curve(Curve::kSpherePlane, 3), {1, 0, 0}, {0, 1, 0}, {2.0}};
      r.c.poison = poison, r.c.poison_after = after;
      trace(r);
      EXPECT_EQ(r.ierr, after == 2 ? 4721 : 0) << poison;
      if (after == 40) expect_sound(r, 1);  // no end point: the last keeps phase 1
    }
  }
}

TEST(Ynchem, WithoutRecordKind2TheLookupQuirkDecides) {
  std::thread([] {  // a fresh thread: the lookup count starts at 0
    // Kind 23 only: returned with 4712 and yncrea's frame.
    Path r{Curve(Curve::kCircle, 2), {1, 0}, {0, 1}, {3.0}, 1e-4, 0.01, 4, 2};
    EXPECT_EQ(trace(r), (std::vector<Frame>{{4712, " YNCREA ", 8}}));
    EXPECT_EQ((Ints{r.result, r.ierr}), (Ints{0, 4712}));
    EXPECT_GT(r.count, 20);
    Path collapse{Curve(Curve::kCircle, 2), {1, 0}, {0, 1}, {3.0}, 0.2};
    trace(collapse);  // one point: leaves the count 1 behind
    trace(r);         // the whole circle again, now released as a single point
    EXPECT_EQ((Ints{r.result, r.ierr}), (Ints{1, 4721}));
  }).join();
}
