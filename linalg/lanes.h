// linalg/lanes.h -- pairs of reals for updates that apply the same operations to independent
// elements (internal). Each lane rounds exactly as the scalar expression would: no lane ever
// combines with another, so results are bit-identical to the scalar loops they replace.
#pragma once
#include <cstdint>
#if defined(__SSE2__)
#include <emmintrin.h>
#endif

namespace impl {

using Lanes = double __attribute__((vector_size(16)));
using LaneMask = std::int64_t __attribute__((vector_size(16)));

// Unaligned access to two consecutive reals. With GCC the vector type of reduced alignment
// aliases double only (unlike a byte copy, which could alias anything and would force every
// other value to be reloaded). Clang keeps 16-byte alignment for that type, which would make
// the access misaligned, so there the access is a 16-byte copy.
#if defined(__clang__)
inline Lanes load_lanes(const double* p) {
  Lanes v;
  __builtin_memcpy(&v, p, sizeof v);
  return v;
}
inline void store_lanes(double* p, Lanes v) { __builtin_memcpy(p, &v, sizeof v); }
#else
using LanesAt = double __attribute__((vector_size(16), aligned(8)));
inline Lanes load_lanes(const double* p) { return *reinterpret_cast<const LanesAt*>(p); }
inline void store_lanes(double* p, Lanes v) { *reinterpret_cast<LanesAt*>(p) = v; }
#endif
inline Lanes splat(double x) { return Lanes{x, x}; }
inline LaneMask as_mask(Lanes v) { return __builtin_bit_cast(LaneMask, v); }
inline Lanes as_lanes(LaneMask m) { return __builtin_bit_cast(Lanes, m); }

// |v| per lane (the sign bit cleared, as std::fabs does).
inline Lanes abs_lanes(Lanes v) {
  return as_lanes(as_mask(v) & LaneMask{INT64_MAX, INT64_MAX});
}
// Per lane: a where the mask is set, else b.
inline Lanes select_lanes(LaneMask m, Lanes a, Lanes b) {
  return as_lanes((as_mask(a) & m) | (as_mask(b) & ~m));
}
// Per lane: x when x > m (strict), else m; a NaN never replaces m. (maxpd computes exactly
// "first > second ? first : second", returning the second operand for a NaN.)
inline Lanes keep_larger(Lanes m, Lanes x) {
#if defined(__SSE2__)
  return _mm_max_pd(x, m);
#else
  return select_lanes(x > m, x, m);
#endif
}

}  // namespace impl
