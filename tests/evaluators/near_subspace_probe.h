// tests/evaluators/near_subspace_probe.h -- reads yngcoa's per-thread visit counter through
// the routine itself: with an unsupported order code the call tests the counter's point m
// times, so a probe list whose only outlying point is q answers "outside" exactly when the
// counter designates q.
#pragma once
#include <cstdint>
#include <vector>

#include "evaluators/evaluators_api.h"

// Points (x, 0) lie on the x axis, (x, 1) lie at distance 1 from it.
inline std::vector<double> points_off_axis(std::int32_t m, std::initializer_list<int> outside) {
  std::vector<double> p(2 * m, 0.0);
  for (std::int32_t j = 0; j < m; ++j) p[2 * j] = 0.5 + j;
  for (int q : outside) p[2 * (q - 1) + 1] = 1.0;
  return p;
}

// Runs yngcoa on the x axis of the plane (n = 2, k = 1) with tol 0.5; returns inside.
inline std::int32_t test_axis(std::int32_t m, const std::vector<double>& pts, std::int32_t order) {
  const std::int32_t n = 2, k = 1;
  const double origin[2] = {0, 0}, u[2] = {1, 0}, tol = 0.5;
  std::int32_t inside = -1, ierr = -1;
  yngcoa(&n, &m, pts.data(), &order, &k, origin, u, &tol, &inside, &ierr);
  return inside;
}

// The point (1..m) that the visit counter designates for a list of m points.
inline std::int32_t counter_point(std::int32_t m) {
  for (std::int32_t q = 1; q <= m; ++q) {
    if (test_axis(m, points_off_axis(m, {q}), 0) == 0) return q;
  }
  return 0;
}
