// linalg/linalg_internal.h -- helpers shared by the linear algebra families (internal).
#pragma once
#include <cstddef>

namespace impl {

// Runs body(i) for i = first, first + Step, ... while i + Step <= end, and returns the first
// index not run. For a fixed order (N > 0) the loop is unrolled completely, so that small
// systems run without loop branches; N = 0 (order known only at run time) keeps a plain loop.
template <int N, int Step = 1, class Body>
inline std::ptrdiff_t steps(std::ptrdiff_t first, std::ptrdiff_t end, Body&& body) {
  const std::ptrdiff_t count = end > first ? (end - first) / Step : 0;
  if constexpr (N > 0) {
#pragma GCC unroll 20
    for (std::ptrdiff_t t = 0; t < count; ++t) body(first + t * Step);
  } else {
    for (std::ptrdiff_t t = 0; t < count; ++t) body(first + t * Step);
  }
  return first + count * Step;
}

// Determinant of the 3-by-3 matrix formed by rows r1, r2, r3 (from 0) and columns 0..2 of
// a column-major array with leading dimension ld, expanded along its first row:
//   (m11 (m22 m33 - m23 m32) - m12 (m21 m33 - m23 m31)) + m13 (m21 m32 - m22 m31)
// each minor first, then the three terms left to right. No pivoting, no flushing.
inline double det3_rows(const double* a, std::ptrdiff_t ld, std::ptrdiff_t r1,
                        std::ptrdiff_t r2, std::ptrdiff_t r3) {
  auto m = [a, ld](std::ptrdiff_t r, std::ptrdiff_t c) { return a[r + c * ld]; };
  const double c1 = m(r2, 1) * m(r3, 2) - m(r2, 2) * m(r3, 1);
  const double c2 = m(r2, 0) * m(r3, 2) - m(r2, 2) * m(r3, 0);
  const double c3 = m(r2, 0) * m(r3, 1) - m(r2, 1) * m(r3, 0);
  return (m(r1, 0) * c1 - m(r1, 1) * c2) + m(r1, 2) * c3;
}

}  // namespace impl
