// linalg/linalg_internal.h -- helpers shared by the linear algebra families (internal).
#pragma once
#include <cstddef>

namespace impl {

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
