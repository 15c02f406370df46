// tests/closest/closest_calls.h -- one call of any closest-point routine with its outputs
// gathered for comparison, and seeded random inputs.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <random>
#include <vector>

#include "closest/closest_api.h"
#include "support/recording_services.h"

// The seed of a random check: ORVQ7_SEED from the environment when set, else `fallback`;
// printed so that a failure can be replayed.
inline std::uint64_t test_seed(const char* check, std::uint64_t fallback) {
  const char* env = std::getenv("ORVQ7_SEED");
  const std::uint64_t seed = env ? std::strtoull(env, nullptr, 10) : fallback;
  std::cout << check << ": seed " << seed << " (set ORVQ7_SEED to replay)\n";
  return seed;
}

inline std::vector<double> uniform(std::mt19937_64& rng, std::size_t count, double lo, double hi) {
  std::vector<double> v(count);
  for (double& x : v) x = std::uniform_real_distribution<double>(lo, hi)(rng);
  return v;
}

constexpr std::int32_t kPoints = 8466, kPolyline = 8467;

// The code, ierr and up to three outputs, compared bit for bit; outputs not written stay -9.
struct Out {
  std::int32_t result, ierr;
  double o[3];
  bool operator==(const Out& w) const {
    return std::memcmp(this, &w, sizeof w) == 0;  // no padding: the codes, then the bits
  }
};
inline std::ostream& operator<<(std::ostream& s, const Out& w) {
  return s << w.result << " " << w.ierr << " (" << w.o[0] << ", " << w.o[1] << ", " << w.o[2]
           << ")";
}

// routine, arguments a, b, extra p            outputs
// 'L' ynoall(seg1 a, seg2 b)                  dist2, t1, t2
// '2' ynoal2(seg a, line b)                   dist2, t, s
// 'P' ynoapl(x a, seg b)                      dist2, t
// 'N' ynoaon(x a, pts b, mode p0)             dist2, t, index (untouched: -7)
// 'D' ynoaod(x a, pts b, mode p0, r2 p1, tol p2)   the same
// 'O' ynoaot(x a, y and u b, k p0)            dist2, c
// 'R' ynraoo(c a, y and u b, k p0)            the point, written over y in place
// 'J' ynjont(pts a, y and u b, k p0)          coords (m = size of a / n)
// ynoall pads each point of a and b (d = size / 2 coordinates) to dimension n with the
// coordinate 0.375, the same for all four points, so no difference changes.
inline Out call(char routine, std::int32_t n, const std::vector<double>& a,
                const std::vector<double>& b, const std::vector<double>& p = {}) {
  std::int32_t ierr = -1, index = -7, r = -1, k = p.empty() ? 0 : static_cast<std::int32_t>(p[0]);
  double o[6] = {-9.0, -9.0, -9.0, -9.0, -9.0, -9.0};
  const double* u = b.data() + std::min<std::size_t>(std::max(n, 0), b.size());  // O, R, J
  auto pad = [n](std::vector<double> s) {
    const std::size_t d = s.size() / 2, w = std::max<std::size_t>(d, std::max(n, 0));
    s.insert(s.begin() + d, w - d, 0.375);
    s.insert(s.end(), w - d, 0.375);
    return s;
  };
  if (routine == 'L') {
    r = ynoall(&n, pad(a).data(), pad(b).data(), &o[0], &o[1], &o[2], &ierr);
  } else if (routine == '2') {
    r = ynoal2(&n, a.data(), b.data(), &o[0], &o[1], &o[2], &ierr);
  } else if (routine == 'P') {
    r = ynoapl(&n, a.data(), b.data(), &o[0], &o[1], &ierr);
  } else if (routine == 'O') {
    r = ynoaot(&n, &k, a.data(), b.data(), u, &o[0], &o[1], &ierr);
  } else if (routine == 'R') {
    std::copy(b.data(), u, o);  // n <= 3
    r = ynraoo(&n, &k, a.data(), o, u, o, &ierr);
  } else if (routine == 'J') {
    std::int32_t m = static_cast<std::int32_t>(a.size()) / std::max(n, 1);
    r = ynjont(&n, &m, a.data(), &k, b.data(), u, o, &ierr);
  } else {
    std::int32_t m = static_cast<std::int32_t>(b.size()) / std::max(n, 1);
    r = routine == 'D'
            ? ynoaod(&n, a.data(), &m, b.data(), &k, &p[1], &p[2], &o[0], &index, &o[1], &ierr)
            : ynoaon(&n, a.data(), &m, b.data(), &k, &o[0], &index, &o[1], &ierr);
    o[2] = index;
  }
  return {r, ierr, {o[0], o[1], o[2]}};
}
