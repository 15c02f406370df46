// closest/closest_internal.h -- sums shared by the closest-point routines (internal header).
#pragma once
#include <cstddef>
#include <cstdint>

namespace impl {

// term(0) + term(1) + ... + term(n - 1) for n >= 1, each term rounded before it is added:
// the sum starts from the first term (no leading zero, so -0 terms give -0) and adds the
// others by increasing index. With n known at compile time the loop unrolls.
template <class Term>
inline double sum_terms(std::int32_t n, Term term) {
  double s = term(0);
  for (std::int32_t i = 1; i < n; ++i) s += term(i);
  return s;
}

// Sum of (a_i b_j - a_j b_i)^2 over the index pairs i < j of 0 .. n-1, n >= 2: i is the
// outer index, both increase, and the sum starts from the pair (0, 1).
template <class A, class B>
inline double sum_pair_squares(std::int32_t n, A a, B b) {
  double s = 0.0;
  bool first = true;
  for (std::int32_t i = 0; i + 1 < n; ++i) {
    for (std::int32_t j = i + 1; j < n; ++j) {
      const double c = a(i) * b(j) - a(j) * b(i);
      if (first) {
        s = c * c;
        first = false;
      } else {
        s += c * c;
      }
    }
  }
  return s;
}

// Column j (from 0) of an array with leading dimension ld, addressed without int32 overflow.
inline const double* column(const double* a, std::int32_t ld, std::int64_t j) {
  return a + static_cast<std::ptrdiff_t>(j) * static_cast<std::ptrdiff_t>(ld);
}

}  // namespace impl
