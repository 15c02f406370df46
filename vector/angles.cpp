// vector/angles.cpp -- arc cosines and sines, and the eigen-direction of a 2-by-2 matrix:
// parcos, darcos, darsin, vectp2. No state.
#include <cstdint>
#include <cmath>

#include "frame/tolerances.h"
#include "vector/vector_api.h"

extern "C" {

double parcos(const double* c, const double* tol, std::int32_t* flag) {
  // Tested in this order; a NaN fails every comparison and lands in the last case.
  const double x = *c;
  if (x < -1.0 - *tol) {  // strict: -1 - tol itself is within the band
    *flag = 2;
    return impl::kPi;
  }
  if (x < -1.0) {
    *flag = 1;
    return impl::kPi;
  }
  if (x <= 1.0) {
    *flag = 0;
    return std::acos(x);
  }
  if (x <= 1.0 + *tol) {  // inclusive
    *flag = 1;
    return 0.0;
  }
  *flag = 2;
  return 0.0;
}

double darcos(const double* x) { return std::acos(*x); }

double darsin(const double* x) { return std::asin(*x); }

double vectp2(const double* m, const double* lambda, double* v) {
  // (1)-(2) Candidates from the two rows of M - lambda I; m = (M11, M21, M12, M22).
  const double p1 = m[2], p2 = *lambda - m[0];
  const double q1 = *lambda - m[3], q2 = m[1];
  // (3) Inclusive: a tie keeps the first row's candidate.
  if (p1 * p1 + p2 * p2 >= q1 * q1 + q2 * q2) {
    v[0] = p1;
    v[1] = p2;
  } else {
    v[0] = q1;
    v[1] = q2;
  }
  // (4) Normalise; devor leaves a zero vector as it is.
  const std::int32_t two = 2;
  return devor(v, &two);
}

}  // extern "C"
