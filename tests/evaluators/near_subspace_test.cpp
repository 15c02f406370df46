// tests/evaluators/near_subspace_test.cpp -- checks for evaluators/near_subspace.cpp: yngcoa.
#include <gtest/gtest.h>

#include <cmath>

#include "near_subspace_probe.h"
#include "support/recording_services.h"

TEST(Yngcoa, CodesTolerancesVisitOrdersAndTheCounter) {
  RecordedFrames frames;
  const double u[6] = {0, 0, 1, 0.6, 0.8, 0};  // the z axis, then (0.6, 0.8, 0)
  const auto in = [](double x) { return std::nextafter(x, 0.0); };  // one ulp toward 0
  // clang-format off
  const std::vector<double> pt = {1, -2, 4, 2}, o = {1, 2, 3}, ln = {1, 2, 9, 1.5, 2, 3, 1, 2, -7};
  struct { std::int32_t n, m, k, order, code, inside; double tol; std::vector<double> p{}, o{}; }
  cases[] = {
      {0, 1, 0, 17, 4712, 1, 1}, {3, 1, -1, 17, 4712, 1, 1}, {2, 1, 3, 17, 4712, 1, 1},
      {3, 0, 1, 17, 4712, 1, 1}, {21, 0, 21, 17, 4712, 1, 1}, {21, 1, 21, 17, 4718, 1, 1},
      {30, 1, 21, 17, 4718, 1, 1}, {3, 4, 3, 17, 0, 1, 0},  // the whole space: no point read
      // A point: (1, -2) itself, then (4, 2) at distance 5, in list order for any code.
      {2, 2, 0, 999, 0, 1, 5, pt, {1, -2}}, {2, 2, 0, 999, 0, 0, in(5), pt, {1, -2}},
      {2, 1, 0, 17, 0, 1, 0, pt, {1, -2}}, {2, 1, 0, 17, 0, 0, 0, pt, {1, in(-2)}},
      // The line through (1, 2, 3), the second point 0.5 off; in the plane (1.5, 2, 3) has
      // coordinates (0, 0.3), residual (0.32, -0.24, 0), squared 0.16 up to rounding.
      {3, 3, 1, 17, 0, 1, 0.5, ln, o}, {3, 3, 1, 17, 0, 0, in(0.5), ln, o},
      {3, 3, 2, 17, 0, 1, 0.41, ln, o}, {3, 3, 2, 17, 0, 0, 0.39, ln, o}};
  // clang-format on
  for (const auto& c : cases) {
    std::int32_t n = c.n, m = c.m, k = c.k, order = c.order, inside = -1, ierr = -1;
    const int r = yngcoa(&n, &m, c.p.data(), &order, &k, c.o.data(), u, &c.tol, &inside, &ierr);
    EXPECT_TRUE(r == !!c.code && ierr == c.code && inside == c.inside) << &c - cases;
  }
  EXPECT_TRUE(frames.empty());
  // In sequence. 274: 1, m, 2, m-1, ...; 17: list order; the call stops at the first point
  // outside and the counter keeps it. Other codes test the counter's point (m when the
  // counter exceeds m) m times, without moving the counter.
  // clang-format off
  const struct { std::int32_t m, order, inside, at; std::vector<int> out; } calls[] = {
      {5, 274, 0, 5, {2, 5}}, {5, 274, 0, 2, {2, 4}}, {5, 274, 0, 4, {3, 4}},
      {4, 274, 0, 4, {2, 4}}, {4, 274, 0, 2, {2, 3}}, {5, 17, 0, 2, {2, 5}},
      {5, 1000, 1, 3, {}} /* ends in the middle */, {5, 17, 1, 5, {}}, {3, 18, 0, 5, {3}},
      {3, 273, 1, 5, {1, 2}}, {5, -4, 1, 5, {2}}};
  // clang-format on
  for (const auto& c : calls)
    EXPECT_TRUE(axis(c.m, c.out, c.order) == c.inside && axis(5, {c.at}, 0) == 0) << &c - calls;
}
