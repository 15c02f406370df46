// tests/evaluators/near_subspace_probe.h -- yngcoa on the x axis of the plane (k = 1, tol 0.5)
// with points (0.5 + j, 0), those listed in `outside` (from 1) lifted to (x, 1). With an
// unsupported order code the call tests the point of the visit counter m times, so
// axis(m, {q}, 0) answers 0 exactly when the counter designates q.
#pragma once
#include <vector>

#include "evaluators/evaluators_api.h"

inline std::int32_t axis(std::int32_t m, std::vector<int> outside, std::int32_t order) {
  std::vector<double> p(2 * m, 0.0);
  for (std::int32_t j = 0; j < m; ++j) p[2 * j] = 0.5 + j;
  for (int q : outside) p[2 * q - 1] = 1.0;
  const double origin_u[4] = {0, 0, 1, 0}, tol = 0.5;
  std::int32_t n = 2, k = 1, inside = -1, ierr = -1;
  yngcoa(&n, &m, p.data(), &order, &k, origin_u, origin_u + 2, &tol, &inside, &ierr);
  return inside;
}
