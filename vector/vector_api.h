/** \file
 * \brief Vector, matrix and transformation primitives of space and the plane
 * (public header; compiles as C11 and as C++).
 *
 * Vectors of space are 3 reals (x, y, z), of the plane 2 reals; a general vector is n reals
 * with n passed by reference. A 2-by-2 matrix is 4 reals by columns (M11, M21, M12, M22).
 * A dimension flag equal to 3 selects the space case; any other value the plane case.
 */
#ifndef ORVQ7_VECTOR_VECTOR_API_H
#define ORVQ7_VECTOR_VECTOR_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Vector primitives: products, norms, angles, eigen-direction.
 * None reports failure: degenerate input gives the defined result stated in its block.
 * State: none; all are safe to call concurrently on distinct arguments.
 * ======================================================================================== */

/** prosca -- dot product of two vectors of space.
 *   a  in  real(3)
 *   b  in  real(3)
 * Result ((0 + a1 b1) + a2 b2) + a3 b3, in that order (a sum of signed zeros gives +0). */
ORVQ7_API double prosca(const double* a, const double* b);

/** promix -- mixed product (a x b) . c of three vectors of space.
 *   a, b, c  in  real(3)
 * Result ((a2 b3 - a3 b2) c1 + (a3 b1 - a1 b3) c2) + (a1 b2 - a2 b1) c3: each bracket first,
 * then the three terms summed left to right. */
ORVQ7_API double promix(const double* a, const double* b, const double* c);

/** parvis -- cross product.
 *   a    in   real(3)
 *   b    in   real(3)
 *   w    out  real(3)  dim = 3: w = (a2 b3 - b2 a3, a3 b1 - a1 b3, b2 a1 - a2 b1);
 *                      otherwise w = (0, 0, b2 a1 - a2 b1), the perpendicular component
 *                      of the cross product of the two plane vectors (a1, a2), (b1, b2)
 *   dim  in   int32    dimension flag
 * Result 0. w may not overlap a or b. */
ORVQ7_API int32_t parvis(const double* a, const double* b, double* w, const int32_t* dim);

/** parbis -- unit cross product.
 *   a, b  in   real(3)
 *   w     out  real(3)  dim = 3: (a x b) / |a x b|, or (0, 0, 0) when |a x b| is exactly 0
 *                       (parallel inputs; no tolerance); dim != 3: (0, 0, 0)
 *   dim   in   int32    dimension flag
 * Result 0. w may not overlap a or b. */
ORVQ7_API int32_t parbis(const double* a, const double* b, double* w, const int32_t* dim);

/** vor -- squared Euclidean norm of v(1..n), accumulated by increasing index; no square root.
 *   v  in  real(n)
 *   n  in  int32    n < 1 gives 0 (v not read)
 * Result the sum of v(i)^2. */
ORVQ7_API double vor(const double* v, const int32_t* n);

/** devor -- normalises v in place.
 *   v  in/out  real(n)  divided by its norm, from the last component to the first; untouched
 *                       when n < 1 or the squared norm is exactly 0
 *   n  in      int32
 * Result the squared norm before normalisation (not the norm), accumulated by increasing
 * index; 0 when n < 1. */
ORVQ7_API double devor(double* v, const int32_t* n);

/** parcos -- arc cosine of a cosine that may have drifted outside [-1, 1].
 *   c     in   real   the cosine
 *   tol   in   real   width of the tolerance band beyond -1 and 1
 *   flag  out  int32  0 exact, 1 clamped within tolerance, 2 outside the band
 * Result, tested in this order:
 *   c < -1 - tol                   pi, flag 2
 *   -1 - tol <= c < -1             pi, flag 1
 *   -1 <= c <= 1                   acos(c), flag 0
 *   1 < c <= 1 + tol               0, flag 1
 *   c > 1 + tol, or c is NaN       0, flag 2 */
ORVQ7_API double parcos(const double* c, const double* tol, int32_t* flag);

/** darcos -- arc cosine of x in radians; no clamping: |x| > 1 gives NaN.
 *   x  in  real */
ORVQ7_API double darcos(const double* x);

/** darsin -- arc sine of x in radians; no clamping: |x| > 1 gives NaN.
 *   x  in  real */
ORVQ7_API double darsin(const double* x);

/** vectp2 -- unit eigen-direction of a 2-by-2 matrix M for a known eigenvalue lambda.
 *   m       in   real(4)  M by columns (M11, M21, M12, M22)
 *   lambda  in   real
 *   v       out  real(2)  p = (M12, lambda - M11) when |p|^2 >= |q|^2 (ties go to p),
 *                         else q = (lambda - M22, M21); then normalised by devor
 * Result what devor returns: the squared length before normalisation; 0 (and v = (0, 0))
 * when M = lambda I. */
ORVQ7_API double vectp2(const double* m, const double* lambda, double* v);

/* ==========================================================================================
 * Small matrices and 3D transformations
 * ======================================================================================== */

/* ==========================================================================================
 * Plane (2D) transformations of elements
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_VECTOR_VECTOR_API_H */
