// vector/products.cpp -- products and norms of vectors: prosca, promix, parvis, parbis, vor,
// devor. Allocation-free, no state. Every sum is written in its fixed order.
#include <cstdint>
#include <cmath>

#include "vector/vector_api.h"

namespace {
constexpr std::int32_t kSpace = 3;  // dimension flag of the space case
}  // namespace

extern "C" {

double prosca(const double* a, const double* b) {
  // The leading 0 is kept: a sum of signed zeros gives +0.
  double s = 0.0 + a[0] * b[0];
  s = s + a[1] * b[1];
  return s + a[2] * b[2];
}

double promix(const double* a, const double* b, const double* c) {
  const double t1 = a[1] * b[2] - a[2] * b[1];
  const double t2 = a[2] * b[0] - a[0] * b[2];
  const double t3 = a[0] * b[1] - a[1] * b[0];
  return (t1 * c[0] + t2 * c[1]) + t3 * c[2];
}

std::int32_t parvis(const double* a, const double* b, double* w, const std::int32_t* dim) {
  if (*dim == kSpace) {
    w[0] = a[1] * b[2] - b[1] * a[2];
    w[1] = a[2] * b[0] - a[0] * b[2];
  } else {
    w[0] = 0.0;
    w[1] = 0.0;
  }
  w[2] = b[1] * a[0] - a[1] * b[0];
  return 0;
}

std::int32_t parbis(const double* a, const double* b, double* w, const std::int32_t* dim) {
  // (1) Plane case: the zero vector.
  if (*dim != kSpace) {
    w[0] = 0.0;
    w[1] = 0.0;
    w[2] = 0.0;
    return 0;
  }
  // (2) The cross product.
  w[0] = a[1] * b[2] - a[2] * b[1];
  w[1] = a[2] * b[0] - b[2] * a[0];
  w[2] = a[0] * b[1] - a[1] * b[0];
  // (3) Exactly zero length (parallel inputs): keep the zero vector, no tolerance.
  const double s = std::sqrt((w[0] * w[0] + w[1] * w[1]) + w[2] * w[2]);
  if (s == 0.0) return 0;
  // (4) Normalise.
  w[0] = w[0] / s;
  w[1] = w[1] / s;
  w[2] = w[2] / s;
  return 0;
}

double vor(const double* v, const std::int32_t* n) {
  // By increasing index, one accumulator; unrolled by four without changing that order.
  const std::int32_t m = *n;
  double s = 0.0;
  std::int32_t i = 0;
  for (; i + 4 <= m; i += 4) {
    s += v[i] * v[i];
    s += v[i + 1] * v[i + 1];
    s += v[i + 2] * v[i + 2];
    s += v[i + 3] * v[i + 3];
  }
  for (; i < m; ++i) s += v[i] * v[i];
  return s;
}

double devor(double* v, const std::int32_t* n) {
  // (1) Squared norm by increasing index (n < 1 gives 0 and leaves v).
  const double x = vor(v, n);
  // (2) Exactly zero: v untouched.
  if (x == 0.0) return 0.0;
  // (3) Divide by the norm, from the last component to the first.
  const double s = std::sqrt(x);
  for (std::int32_t i = *n - 1; i >= 0; --i) v[i] = v[i] / s;
  // (4) The squared norm before normalisation, on purpose.
  return x;
}

}  // extern "C"
