/* closest/closest_api.h -- closest points and squared distances in dimension n
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_CLOSEST_CLOSEST_API_H
#define ORVQ7_CLOSEST_CLOSEST_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Closest points and distances
 *
 * Family conventions (every routine below):
 *   - Points of dimension n are n reals; a segment is an (n, 2) array of its two end points
 *     as columns, P(t) = (1 - t) P1 + t P2 for t in [0, 1]; a set of m points is an (n, m)
 *     array, point j in column j. Indices returned count from 1.
 *   - Distances are squared distances; no square root is taken except the one of ynoaod.
 *   - Every sum over components starts from the first term (no leading zero, so a sum of
 *     -0 terms stays -0) and adds the others by increasing index; each term is rounded before
 *     it is added. Products are never fused.
 *   - Thresholds are absolute and fixed: 1e-15 (degenerate squared length, inclusive; snap
 *     band of ynoall) and 1e-12 (parallel test, strict).
 *   - No traceback frame is recorded and no workspace is taken. No routine keeps anything
 *     between calls, so all are safe to call from several threads at once on distinct
 *     outputs.
 *   - Outputs may not overlap inputs unless the routine's block allows it.
 * ======================================================================================== */

/** ynoall -- closest pair of points of two segments in dimension n.
 * Arguments (all by reference; "in" arguments are never written)
 *   n      in   int32       dimension, n >= 2
 *   seg1   in   real(n,2)   segment 1: P1, P2 as columns
 *   seg2   in   real(n,2)   segment 2: Q1, Q2 as columns
 *   dist2  out  real        |P(t1) - Q(t2)|^2, or the end-point distance of the fallback
 *   t1     out  real        parameter on segment 1
 *   t2     out  real        parameter on segment 2
 *   ierr   out  int32      status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                           outputs
 *   0      0       a unique closest pair                          dist2, t1, t2 written
 *   4712   1       n < 2                                          all untouched
 *   4717   1       a segment is degenerate (squared length        dist2, t1, t2 written with a
 *                  <= 1e-15) or the segments are parallel and     representative pair (usable)
 *                  their projections overlap
 * Method, with d1 = P2 - P1, d2 = Q2 - Q1, w = P1 - Q1, S1 = |d1|^2, S2 = |d2|^2, b = d1.d2,
 * d = d2.w, e = d1.w:
 *   (1) Degenerate when S2 <= 1e-15 or S1 <= 1e-15: both give t1 = t2 = 0.5; only segment 2
 *       gives t2 = 0.5, t1 = ((Q1 + Q2)/2 - P1).d1 / S1 clamped to [0, 1] (raised to 0 first,
 *       then lowered to 1); only segment 1 the same with the roles exchanged.
 *   (2) X = |d1 x d2|^2: n = 2 the square of d1x d2y - d1y d2x; n = 3 (c1^2 + c2^2) + c3^2 of
 *       the vector product c = (d1y d2z - d1z d2y, d1z d2x - d1x d2z, d1x d2y - d1y d2x);
 *       n >= 4 the sum of (d1i d2j - d1j d2i)^2 over the pairs i < j, i the outer index, both
 *       increasing. Parallel when |X| < (1e-12 S2) S1 (strict).
 *   (3) Parallel: end points projected, tP1 = d2.(P1 - Q1)/S2, tP2 = d2.(P2 - Q1)/S2,
 *       sQ1 = d1.(Q1 - P1)/S1, sQ2 = d1.(Q2 - P1)/S1; the upper projection is sQ2 when
 *       sQ2 >= sQ1 (ties make Q2 the upper end). Segment 2 wholly before P1 (upper <= 0) gives
 *       t1 = 0 and t2 at its upper end; wholly beyond P2 (lower >= 1) gives t1 = 1 and t2 at
 *       its lower end, both with code 0; otherwise the middle of the overlap with code 4717.
 *       The middle is formed from the projections, so for segments parallel only within the
 *       test above (or by rounding) its parameters may lie slightly outside [0, 1].
 *   (4) Lines: n = 2, 3: t1 = ((d2 x w).(d1 x d2))/X, t2 = ((d1 x w).(d1 x d2))/X, each then
 *       snapped to exactly 0 when |t| <= 1e-15, else to exactly 1 when |1 - t| <= 1e-15.
 *       n >= 4: t1 = (b d - S2 e)/X, t2 = (S1 d - b e)/X, never snapped.
 *   (5) Both in [0, 1] (inclusive): that pair. Otherwise the edges and corners of the square
 *       are tried in a fixed order (edge t1 = 0 or its corner (0, 1); corner (0, 0); edge
 *       t1 = 1 or corner (1, 1); corner (1, 0); edge t2 = 0 or corner (0, 0); corner (1, 0)
 *       again; edge t2 = 1 or corner (0, 1); corner (1, 1)), the first whose optimality test
 *       holds giving the answer. When none holds (rounding, or NaN input) the nearest of the
 *       end-point pairs (0,0), (0,1), (1,0), (1,1) is taken, a later pair only when strictly
 *       nearer, and dist2 is that pair's |end - end|^2.
 *   (6) dist2 = sum of (((1 - t1) P1i + t1 P2i) - (1 - t2) Q1i) - t2 Q2i, squared.
 * Traceback: none.  State: none; safe on distinct arguments. The input values of t1, t2 are
 * never read.
 */
ORVQ7_API int32_t ynoall(const int32_t* n, const double* seg1, const double* seg2, double* dist2,
                         double* t1, double* t2, int32_t* ierr);

/** ynoaot -- projection of a point on an affine subspace: frame coordinates and squared
 * distance.
 * Arguments (all by reference)
 *   n      in   int32      dimension of the space, n >= 1
 *   k      in   int32      number of directions, 0 <= k <= n
 *   x      in   real(n)    the point X
 *   y      in   real(n)    origin Y of the subspace
 *   u      in   real(n,k)  directions as columns, expected orthonormal (not checked: with
 *                          another frame the results are the plain dot products below)
 *   dist2  out  real       squared distance from X to the subspace, sum over i of r_i^2 with
 *                          r_i = (((Xi - Yi) - c1 U(i,1)) - c2 U(i,2)) ... - ck U(i,k);
 *                          k = 0 gives |X - Y|^2
 *   c      out  real(k)    c_j = sum over i of (Xi - Yi) U(i,j); untouched when k = 0
 *   ierr   out  int32      status code, below
 * Result  0 success, 1 failure
 *   ierr   result  when                      outputs
 *   0      0       success                   dist2, c written
 *   4712   1       n <= 0, k < 0 or k > n    dist2, c untouched
 * Traceback: none.  State: none. c may not overlap x, y or u.
 */
ORVQ7_API int32_t ynoaot(const int32_t* n, const int32_t* k, const double* x, const double* y,
                         const double* u, double* dist2, double* c, int32_t* ierr);

/** ynraoo -- point of an affine frame from its coordinates: x = Y + sum of c_j U(:, j).
 * Arguments (all by reference)
 *   n      in   int32      dimension, n >= 1
 *   k      in   int32      number of directions, 0 <= k <= n
 *   c      in   real(k)    coordinates
 *   y      in   real(n)    origin Y
 *   u      in   real(n,k)  directions as columns
 *   x      out  real(n)    x_i = ((Yi + c1 U(i,1)) + c2 U(i,2)) ... + ck U(i,k); k = 0 gives Y
 *   ierr   out  int32      status code, below
 * Result  0 success, 1 failure
 *   ierr   result  when                      outputs
 *   0      0       success                   x written
 *   4712   1       n <= 0, k < 0 or k > n    x untouched
 * Traceback: none.  State: none. x may be the same array as y; it may not overlap c or u.
 */
ORVQ7_API int32_t ynraoo(const int32_t* n, const int32_t* k, const double* c, const double* y,
                         const double* u, double* x, int32_t* ierr);

/** ynjont -- frame coordinates of m points at once.
 * Arguments (all by reference)
 *   n       in   int32      dimension, n >= 1
 *   m       in   int32      number of points, m >= 1
 *   pts     in   real(n,m)  the points as columns
 *   k       in   int32      number of directions; not checked: k < 1 writes nothing
 *   y       in   real(n)    origin Y
 *   u       in   real(n,k)  directions as columns
 *   coords  out  real(k,m)  coords(i,j) = sum over l of (P(l,j) - Yl) U(l,i), the sum of
 *                           ynoaot; column j for point j
 *   ierr    out  int32      status code, below
 * Result  0 success, 1 failure
 *   ierr   result  when               outputs
 *   0      0       success            coords written (nothing when k < 1)
 *   4712   1       n <= 0 or m <= 0   coords untouched
 * Traceback: none.  State: none. coords may not overlap the inputs.
 */
ORVQ7_API int32_t ynjont(const int32_t* n, const int32_t* m, const double* pts, const int32_t* k,
                         const double* y, const double* u, double* coords, int32_t* ierr);

/** ynoapl -- nearest point of a segment to a point X, dimension n.
 * Arguments (all by reference)
 *   n      in   int32      dimension, n >= 1
 *   x      in   real(n)    the point X
 *   seg    in   real(n,2)  the segment S1, S2 as columns; S(t) = S1 + t (S2 - S1)
 *   dist2  out  real       squared distance from X to S(t)
 *   t      out  real       parameter of the nearest point
 *   ierr   out  int32      status code, below
 * Method, with p = (X - S1).(S2 - S1) and L = |S2 - S1|^2, tested in this order:
 *   p < 0 (strict)     t = 0, dist2 = |X - S1|^2, code 0 (even for a degenerate segment)
 *   L <= 1e-15         t = 0.5, dist2 = |X - (S1 + S2)/2|^2, code 4717
 *   p > L (strict)     t = 1, dist2 = |X - S2|^2, code 0
 *   otherwise          t = p / L (so p = L gives t = 1 from the division),
 *                      dist2 = |(S1 + t (S2 - S1)) - X|^2, code 0
 * Result  0 success, 1 failure
 *   ierr   result  when                          outputs
 *   0      0       success                       dist2, t written
 *   4712   1       n <= 0                        dist2, t untouched
 *   4717   1       degenerate segment, p >= 0    dist2, t written (the midpoint; usable)
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynoapl(const int32_t* n, const double* x, const double* seg, double* dist2,
                         double* t, int32_t* ierr);

/** ynoal2 -- closest pair of a segment and an infinite line, dimension n.
 * Arguments (all by reference)
 *   n      in   int32      dimension, n >= 2
 *   seg    in   real(n,2)  segment P1, P2 as columns
 *   line   in   real(n,2)  unit direction U, then a point O of the line; L(s) = O + s U.
 *                          |U| = 1 is the caller's duty: it is never divided by, so another
 *                          length scales s and the parallel test
 *   dist2  out  real       squared distance between P(t) and L(s)
 *   t      out  real       parameter on the segment, in [0, 1]
 *   s      out  real       abscissa on the line, unbounded
 *   ierr   out  int32      status code, below
 * Method, with d1 = P2 - P1, S1 = |d1|^2, b = d1.U, e = d1.(O - P1), f = U.(O - P1) and
 * X = the sum of (d1i Uj - d1j Ui)^2 over the pairs i < j (i outer, both increasing):
 *   S1 <= 1e-15 or |X| < 1e-12 S1 (strict): the midpoint M = (P1 + P2)/2, t = 0.5,
 *     s = (M - O).U, dist2 = |(M - O) - s U|^2, code 4717.
 *   Otherwise t = (e - b f)/X, s = (b e - f S1)/X; t in [0, 1] (inclusive) gives
 *     dist2 = |(((1 - t) P1 + t P2) - O) - s U|^2. t > 1 gives t = 1, s = (P2 - O).U,
 *     dist2 = |(P2 - O) - s U|^2; any other t (t < 0, and a NaN t) gives t = 0 with P1.
 * Result  0 success, 1 failure
 *   ierr   result  when                          outputs
 *   0      0       a unique closest pair         dist2, t, s written
 *   4712   1       n < 2                         all untouched
 *   4717   1       degenerate or parallel        dist2, t, s written (usable)
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynoal2(const int32_t* n, const double* seg, const double* line, double* dist2,
                         double* t, double* s, int32_t* ierr);

/** ynoaon -- nearest of a list of points, or nearest point of the polyline through them.
 * Arguments (all by reference)
 *   n      in   int32      dimension, n >= 1
 *   x      in   real(n)    the point X
 *   m      in   int32      number of points, m >= 2
 *   pts    in   real(n,m)  the points as columns; segment k joins points k and k + 1
 *   mode   in   int32      below 8467: point mode; 8467 or more: polyline mode
 *   dist2  out  real       smallest squared distance found; 1e60 when no candidate is below it
 *   index  out  int32      number (from 1) of the nearest point or segment; untouched when no
 *                          candidate is below 1e60 (only with non-finite input)
 *   t      out  real       point mode 0; polyline mode the parameter on the nearest segment,
 *                          0 when no segment is below 1e60
 *   ierr   out  int32      status code, below
 * Method: point mode d_j = |P(:,j) - X|^2. Polyline mode, segment k from A = P(:,k) to
 * B = P(:,k+1), with p = (X - A).(B - A), L = |B - A|^2, tested in this order:
 *   L <= 1e-15: u = 0.5, d = |(A + B)/2 - X|^2 (a normal candidate, no code)
 *   p < 0:      u = 0, d = |A - X|^2
 *   p > L:      u = 1, d = |B - X|^2
 *   otherwise   u = p / L, d = |(A + u (B - A)) - X|^2
 * Candidates by increasing number; one is taken only when strictly nearer than the best so
 * far (start 1e60), so ties keep the lower number. Points with NaN never win.
 * Result  0 success, 1 failure
 *   ierr   result  when               outputs
 *   0      0       success            dist2, t written; index as above
 *   4712   1       n <= 0 or m < 2    all untouched
 * Traceback: none.  State: none (the parameter of the best segment is kept per call).
 */
ORVQ7_API int32_t ynoaon(const int32_t* n, const double* x, const int32_t* m, const double* pts,
                         const int32_t* mode, double* dist2, int32_t* index, double* t,
                         int32_t* ierr);

/** ynoaod -- ynoaon bounded by a squared distance r2, with a box filter around X.
 * Arguments (all by reference)
 *   n      in   int32      dimension, n >= 1
 *   x      in   real(n)    the point X
 *   m      in   int32      number of points, m >= 2
 *   pts    in   real(n,m)  the points as columns; segment k joins points k and k + 1
 *   mode   in   int32      below 8467: point mode; 8467 or more: polyline mode
 *   r2     in   real       squared distance bound, also the starting best distance
 *   tol    in   real       margin of the box
 *   dist2  out  real       best squared distance; r2 when no candidate is strictly below it
 *   index  out  int32      number (from 1) of the nearest point or segment. When nothing is
 *                          below r2: point mode leaves index untouched, polyline mode
 *                          writes 0
 *   t      out  real       point mode 0; polyline mode as in ynoaon (0 when nothing found)
 *   ierr   out  int32      status code, below
 * Box filter, applied before any distance, axis by axis: with h = sqrt(r2) + tol,
 *   point mode, n = 3:    point j skipped when P(i,j) > Xi + h or P(i,j) < Xi - h on an axis
 *   point mode, n != 3:   the same test with the squared bound r2 itself as half-width
 *                         (deliberate: for n != 3 the half-width is r2, not sqrt(r2) + tol)
 *   polyline mode, any n: segment k skipped when on some axis both end points are > Xi + h,
 *                         or both are < Xi - h.
 * Candidates not skipped follow the rules of ynoaon (strict improvement, lower number on
 * ties). A NaN r2 or tol makes the box accept everything and a NaN r2 finds nothing.
 * Result  0 success, 1 failure
 *   ierr   result  when               outputs
 *   0      0       success            dist2, t written; index as above
 *   4712   1       n < 1 or m < 2     all untouched
 * Traceback: none.  State: none (the box and the best segment's parameter are kept per call).
 */
ORVQ7_API int32_t ynoaod(const int32_t* n, const double* x, const int32_t* m, const double* pts,
                         const int32_t* mode, const double* r2, const double* tol, double* dist2,
                         int32_t* index, double* t, int32_t* ierr);

ORVQ7_END_DECLS

#endif /* ORVQ7_CLOSEST_CLOSEST_API_H */
