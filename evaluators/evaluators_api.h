/* evaluators/evaluators_api.h -- geometric tests and evaluators of dimension n
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_EVALUATORS_EVALUATORS_API_H
#define ORVQ7_EVALUATORS_EVALUATORS_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Points near a subspace
 * ======================================================================================== */

/** yngcoa -- tells whether every point of a list lies within a distance tol of the affine
 * subspace through `origin` spanned by k orthonormal directions (k = 0 a point, 1 a line,
 * 2 a plane, ...); stops at the first point found outside.
 * Arguments (all by reference; "in" arguments are never written)
 *   n       in   int32      dimension, n >= 1
 *   m       in   int32      number of points, m >= 1
 *   pts     in   real(n,m)  the points as columns, leading dimension n
 *   order   in   int32      visiting order when 0 < k < n: 17 list order; >= 274 alternately
 *                           from both ends (1, m, 2, m-1, 3, ...); any other code tests the
 *                           same point m times: the point of the counter left by this
 *                           thread's last visit (below), taken as 1 when the counter is
 *                           below 1 (no earlier visit on this thread) and as m when it
 *                           exceeds m (an earlier call with a longer list)
 *   k       in   int32      number of directions, 0 <= k <= n, k <= 20
 *   origin  in   real(n)    origin O of the subspace
 *   u       in   real(n,k)  the directions as columns, orthonormal (not tested); not read
 *                           when k = 0 or k = n
 *   tol     in   real       distance tolerance; squared residuals are compared with tol*tol
 *   inside  out  int32      1 when every point is within tol (a point at exactly tol is
 *                           inside: the test r2 > tol*tol is strict), 0 otherwise
 *   ierr    out  int32      status code, below
 * Method: k = 0: r2 = |P(:,j) - O|^2 by increasing component, points in list order for any
 *   order code. k = n: inside = 1 without reading the points. 0 < k < n: for each visit,
 *   c(i) = sum over l of (P(l,j) - O(l)) U(l,i), then r2 = sum over l of
 *   ((P(l,j) - O(l)) - s(l))^2 with s(l) = sum over i of c(i) U(l,i); every sum by increasing
 *   index.
 * Result  0 the test ran, 1 failure (the code is in ierr)
 *   ierr   result  when                                   outputs
 *   0      0       the test ran                           inside = 0 or 1
 *   4712   1       n <= 0, k < 0, k > n or m <= 0         inside = 1 (look at the result)
 *   4718   1       k >= 21                                inside = 1
 * Traceback: none.
 * State: the visit counter, one per thread: the list index of the last point visited with
 *   order 17 or >= 274 (written at every such visit, kept after the call); read only at the
 *   start of a call with 0 < k < n and another order code. Calls on different threads never
 *   see each other's counter.
 */
ORVQ7_API int32_t yngcoa(const int32_t* n, const int32_t* m, const double* pts,
                         const int32_t* order, const int32_t* k, const double* origin,
                         const double* u, const double* tol, int32_t* inside, int32_t* ierr);

/* ==========================================================================================
 * Affine map inverse
 * ======================================================================================== */

/** ynaitt -- inverse of the affine map y = A x + b: x = M y + c with M = inverse of A and
 * c = -M b.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32      dimension, n >= 1 (n <= 20 for the general kind from n = 3 on)
 *   a     in   real(n,n)  linear part A, column-major, leading dimension n
 *   b     in   real(n)    translation b
 *   kind  in   int32      0: A is orthogonal (not tested) and M is its transpose, no
 *                         elimination; 1 or any negative value: M = inverse of A by ynmimr
 *   m     out  real(n,n)  linear part M; must not overlap a when kind = 0 (with another kind
 *                         it may be the same array as a)
 *   c     out  real(n)    translation c = -b(1) M(:,1), then c = c - b(j) M(:,j) for
 *                         j = 2..n in that order; must not overlap b or m
 *   ierr  out  int32      status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr     result  when                                   outputs
 *   0        0       success                                m, c written
 *   4712     1       n < 1                                  m, c untouched
 *   4718     1       kind >= 2 (tested after n)             m, c untouched
 *   ynmimr's 1       kind != 0 and the inversion failed     m as ynmimr left it, c untouched
 *   code             (4703 singular, 4718 n > 20)
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynaitt(const int32_t* n, const double* a, const double* b,
                         const int32_t* kind, double* m, double* c, int32_t* ierr);

ORVQ7_END_DECLS

#endif /* ORVQ7_EVALUATORS_EVALUATORS_API_H */
