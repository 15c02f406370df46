/* fitting/fitting_api.h -- mean planes and mean lines of point sets
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_FITTING_FITTING_API_H
#define ORVQ7_FITTING_FITTING_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Mean plane and mean line fitting
 *
 * Points of space as a 3-by-n array with leading dimension ld (point j, from 1, at elements
 * (j - 1) ld + 1 .. (j - 1) ld + 3); the array holds at least (n - 1) ld + 3 reals.
 * Scatter matrix: 6 reals (Sxx, Syy, Szz, Sxy, Sxz, Syz), sums over the points of the
 * products of coordinates relative to the centroid (not divided by n). A line is 6 reals: a
 * unit direction, then a point.
 * State: solmpr, clvcpr and drmoyn keep their status code (reset on entry, passed to the
 * traceback) in storage of their own, one copy per thread; intermediate arrays are locals.
 * So two threads may call any of these routines at the same time.
 * ======================================================================================== */

/** solmpr -- centroid, scatter matrix and eigenvalues of the scatter matrix of n points.
 *   p    in   real(ld, n)  the points
 *   ld   in   int32        leading dimension, >= 3
 *   n    in   int32        number of points, >= 1
 *   tol  in   real         points within tol / 2 of the centroid count as coincident
 *   g    out  real(3)      centroid, sums in point order divided by n
 *   s    out  real(6)      scatter matrix, unscaled
 *   l    out  real(3)      eigenvalues in increasing order: the real parts of tresor's roots
 *                          of the characteristic cubic of S / tr, times tr = Sxx + Syy + Szz,
 *                          sorted by sorr8 (tresor's code is not examined)
 * Result  0 success; 1 failure, when no point lies farther than tol / 2 from the centroid
 * (strict: |P - G|^2 > (tol / 2)^2): then g and s are written, l untouched.
 * n < 1 or ld < 3 count as that failure with g, s and l untouched.
 * Traceback: on failure one frame, code 1, name " SOLMPR;" (length 8). */
ORVQ7_API int32_t solmpr(const double* p, const int32_t* ld, const int32_t* n, const double* tol,
                         double* g, double* s, double* l);

/** clvcpr -- unit eigen-direction of the symmetric matrix S for the eigenvalue lambda.
 *   s       in   real(6)  (Sxx, Syy, Szz, Sxy, Sxz, Syz)
 *   lambda  in   real
 *   v       out  real(3)  the cross product of the two rows of S - lambda I whose 2-by-2
 *                         minor is largest (m1 = b c - r^2 first, then m2 = c a - q^2, then
 *                         m3 = b a - p^2 on ties), divided by sqrt(v . v)
 * Result  0 success; 1 failure, v untouched:
 *   code 1  the largest |minor| is <= 1e-13: lambda is a multiple eigenvalue
 *   code 2  no minor equals the largest (a NaN)
 * Traceback: on failure one frame, the code, name " CLVCPR;" (length 8). */
ORVQ7_API int32_t clvcpr(const double* s, const double* lambda, double* v);

/** drmoyn -- mean line of n points: the direction of the largest eigenvalue of the scatter
 * matrix (clvcpr on S and the eigenvalues divided by the largest), through the centroid.
 *   p, ld, n, tol  as for solmpr
 *   line           out  real(6)  unit direction, then the centroid; untouched on failure
 * Result  0 success; 1 failure:
 *   code 1  solmpr failed (all points within tol / 2 of the centroid)
 *   code 2  clvcpr failed (the largest eigenvalue is multiple)
 * Traceback: on failure the callee's frame (" SOLMPR;" or " CLVCPR;"), then one frame with
 * the code, name " DRMOYN;" (length 8). */
ORVQ7_API int32_t drmoyn(const double* p, const int32_t* ld, const int32_t* n, const double* tol,
                         double* line);

/** plmoyn -- mean plane a x + b y + c z + d = 0 of n points, centred in their slab.
 *   p, ld, n, tol  as for solmpr; r2 = tol^2 / 4
 *   a, b, c        out  real  unit normal: clvcpr for the smallest eigenvalue
 *   d              out  real  d0 - (hmin + hmax) / 2, d0 = -(N . G), h = N . P + d0 over
 *                             the points, hmin and hmax starting at 0
 *   e              out  real  half-thickness (hmax - hmin) / 2
 * Result  0 success, a, b, c, d, e written; 1 failure, a, b, c, d untouched:
 *   solmpr failed; r2 >= L1 + L2 (points on a line); or, when n r2 >= L1 + L2, the points
 *   lie within r2 (squared) of the mean line: e then holds ecrdrt's greatest squared
 *   distance from that line (the only failure that writes e); or clvcpr failed for the
 *   normal. When clvcpr fails for the mean line's direction, the largest eigenvalue is
 *   multiple, the points are not near a line, and that test is skipped.
 * Traceback: none of its own; solmpr's and clvcpr's frames. */
ORVQ7_API int32_t plmoyn(const double* p, const int32_t* ld, const int32_t* n, const double* tol,
                         double* a, double* b, double* c, double* d, double* e);

/** ecrdrt -- spread of n points about a line.
 *   p, ld, n  as for solmpr (n < 1 or ld < 3: no point is read)
 *   line      in   real(6)  direction D, then a point Q
 *   e         out  real     largest |(Q - P(j)) x D|^2 (the squared distance when D is unit);
 *                           0 when no point is read
 *   k         out  int32    index (from 1) of that point; the first wins a tie; 1 when no
 *                           point is read
 * No result; never fails. State: none. */
ORVQ7_API void ecrdrt(const double* p, const int32_t* ld, const int32_t* n, const double* line,
                      double* e, int32_t* k);

ORVQ7_END_DECLS

#endif /* ORVQ7_FITTING_FITTING_API_H */
