/* path/path_api.h -- the path-following (marching) solver and its result tables
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_PATH_PATH_API_H
#define ORVQ7_PATH_PATH_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

struct Orvq7PathOptions;
struct Orvq7PathLayout;
struct Orvq7PathMarch;
struct Orvq7PathTables;

/* ==========================================================================================
 * Path-following solver
 * ======================================================================================== */

/* The equations F(x) = 0 (n - 1 equations, n unknowns) come from the caller's evaluation
 * routine. Arguments, all by reference:
 *   ctx   the caller's context, handed back unchanged
 *   npts  number of points (n reals each) in x; the solver passes 1, ynumde its own npts
 *   x     the points
 *   req   what to compute, a bit set: 1 the n - 1 residuals; 2 the first derivatives, an
 *         (n - 1) by n matrix; 4 the second derivatives, (n - 1) by n by n
 *   out   per point, the blocks asked for in the order residuals, first derivatives, second
 *         derivatives, each column-major with the equation index fastest: element (k, i) of
 *         the first block is dF_k/dx_i, element (k, i, j) of the second is d2F_k/dx_i dx_j
 *   ierr  its error code when it fails
 * Result 0 success, 1 failure. */
typedef int32_t (*Orvq7PathFct)(void* ctx, const int32_t* npts, const double* x,
                                const int32_t* req, double* out, int32_t* ierr);

/** ynchem -- traces the solution curve of F(x) = 0, n - 1 equations in n unknowns, inside a
 * box: point by point from a start point along a start direction, until the curve closes on
 * its start point, leaves the box or can be followed no further. The points come back in a
 * result table, which the caller reads with yncrea and yutrea and releases with yncend.
 * Arguments (all by reference; "in" arguments are never written)
 *   ctx    in   opaque     the caller's context, handed to fct unchanged (may be NULL)
 *   n      in   int32      number of unknowns, 2 <= n <= 20
 *   fct    in   routine    the evaluation routine (Orvq7PathFct above)
 *   eps    in   real       a point is on the curve when the sum of the squares of its n - 1
 *                          residuals is at most eps (inclusive); e.g. 1e-20 for a curve of
 *                          size about 1
 *   xd     in   real(n,2)  column 1 the start point x0, on the curve and in the box; column
 *                          2 the start direction d0, the sense in which the curve is followed.
 *                          Give d0 of unit length: it is the tangent of the first step as
 *                          given (its length scales the first prediction and the turn test)
 *   box    in   real(n,2)  column 1 the lower, column 2 the upper bounds of the unknowns,
 *                          box(i,1) < box(i,2)
 *   pas    in   real(n,2)  column 1 the minimum, column 2 the maximum step of each unknown,
 *                          0 < pas(i,1) < pas(i,2): no step moves unknown i by more than
 *                          pas(i,2); a step that moves no unknown by more than pas(i,1) has
 *                          collapsed and ends the path
 *   mode   in   int32      option word, below
 *   tol    in   real(n)    tolerance of the step length, > 0: tol(1), or tol(1..n) with mode
 *                          bit 16
 *   store  in   int32      what to keep with each point, below
 *   itab   out  int32      the result table; 0 when none was made (always 0 after a failure)
 *   ierr   out  int32      status code, below
 * Option word mode, the sum of:
 *   path kind, exactly one of:
 *     2      K = 2: steps of at most 0.9 tol(1) (with bit 16, 0.9 sqrt(sum (tol(i) t_i)^2),
 *            t the unit tangent); fct is asked for residuals and first derivatives only
 *     4      K = 4: steps from the curvature, at most 0.9 sqrt(1 / (0.5 |c| / tol(1) + 1/h^2))
 *            (|c| the curvature, h = pas(1,2), or the smallest pas(i,2) with bit 16), so the
 *            chord stays within about tol(1) / 5 of the curve; a step whose chord is found
 *            farther is retried shorter. fct is asked for second derivatives (req 6)
 *     8      K = 8: at most 0.9 / (|c| / tol(1) + 1/h): the tangent turns by at most about
 *            0.9 tol(1) radians per step; not with bit 16. Second derivatives as for 4
 *   32768    (bit 15, with 4 or 8) the curvature from the change of the tangent over the last
 *            step instead of second derivatives: fct is never asked for req 6
 *   65536    (bit 16) tol holds one tolerance per unknown
 *   262144   (bit 18) no turn test; without it a step is retried shorter when the tangent
 *            turns by more than 22.5 degrees (for K = 8: acos(1 / sqrt(tol(1)^2 + 1)) when
 *            that is smaller)
 *   131072, 524288  (bits 17, 19) recorded, no effect
 *   Refused (4718): no kind or two kinds, kind 1, bits 4-14 and 20-31, bit 15 with kind 2.
 * Storage word store, the sum of:
 *   2        (required) record kind 23: per point the point x(1..n), then the tangent
 *            t(1..n), 2n reals
 *   4        record kind 43: per point x(1..n), then the vector c(1..n), 2n reals
 *   8        (or 16 or 32, any of them; 8 is recommended, see 4712 below) record kinds 1, 2
 *            and 3: per point the flush phase (one int32: 0 the start point, 1 a point along
 *            the path, 2 the end point of a closed path or of a box exit), the point's number
 *            (one int32, 1 for the start point), and x(1..n) (n reals)
 *   Refused (4718): 1, 128, 256, 512, bits 15-29. Ignored: 64, bits 10-14, 30, 31.
 *   A typical call: mode = 4, store = 2 + 8.
 * What the result holds: the points in the order of the path, the start point x0 first. The
 * tangent t is unit and points in the direction of travel, except at x0, where it is d0 as
 * given. c is the curve's second derivative with respect to arc length for mode 4 or 8; with
 * bit 15 the change of the tangent over the last step divided by the step length (at x0:
 * 2 / ((box(i,2) - box(i,1)) sqrt(n))); 0 for mode 2. Consecutive points are apart by more
 * than a minimum step in some unknown, except that an end point within the minimum steps of
 * the last point replaces that point (keeping its number). The path ends:
 *   closed    the path came back to x0 (after crossing the hyperplane through x0 orthogonal
 *             to d0, within a relative 1e-6 in every unknown): the last point is x0 itself,
 *             to the bit, with the tangent d0;
 *   box exit  the curve leaves the box: the last point lies on the face, its coordinate equal
 *             to the bound to the bit, its residual sum at most eps;
 *   collapse  the step could not be corrected even when halved down to the minimum steps (the
 *             curve ends, turns back sharply, or fct gives no usable values there): the last
 *             point is the last one reached, with phase 1.
 * Reading it back (yutinf, yutrea, yutend: companions/system/system_api.h, also included by
 * the umbrella header OrvQ7Maths/OrvQ7Maths.h). The master table itab holds one triple of
 * int32 per kept quantity, (record kind, sub-table handle, number of points); yncrea finds the
 * triple of a kind. A sub-table holds one entry per point, entry j (from 1) for point j:
 *     int32_t kind = 23, h = 0, count = 0, e = 0, first = 1;
 *     yncrea(&itab, &kind, &h, &count, &e);     h: the sub-table, count: points stored
 *     double* xt = malloc(sizeof(double) * 2 * n * count);
 *     yutrea(&h, &first, &count, xt, &e);      point j: x_i = xt[(j-1)*2*n + i-1],
 *                                               t_i = xt[(j-1)*2*n + n + i-1]
 *     yncend(&itab, &e);                        releases the master and every sub-table
 * (yutinf(&h, &esize, &count, &e) gives the entry size in bytes, 16 n for kind 23, 4 for kinds
 * 1 and 2.) After yncend the handles are unknown to every table service. A result belongs to
 * the caller: it may be read, and must be released, on any thread.
 * The evaluation routine is called with npts = 1 and req 1 (residuals: at x0 and at end
 * points on a face), req 2 (first derivatives: at the current point before each correction
 * when n >= 3, and for tangents), req 3 (residuals, then first derivatives: each Newton
 * iterate), req 6 (first, then second derivatives: tangents with mode 4 or 8 without bit 15).
 * ctx comes back unchanged. It must not call ynchem on the same thread.
 * Values that are not finite: a residual sum that is not a number is not on the curve (the
 * correction fails and the step is halved, so such values end the path by collapse); first
 * derivatives that give no tangent at a new point (not finite, or degenerate as at a singular
 * point) do not stop the path: it goes on with the previous tangent; a prediction that is not finite (from d0, or from a step length that
 * is not a number) fails with 4713. The call always ends, but with n >= 5 the number of points
 * is not limited: a curve that neither closes nor leaves the box (or collapses) is followed
 * until 2^31 - 1 points have been accepted (4720) or its storage is refused (36). A caller who
 * wants a tighter bound counts the calls of its evaluation routine and fails it with a code of
 * its own past the count it allows (ynchem then fails with that code).
 * Result  0 the path ended and the result is in itab, 1 failure
 *   ierr  result  when                                                         itab
 *   0     0       closed, box exit or collapse after at least one step          the result
 *   4712  0       deliberate: the storage word has none of 8, 16, 32, so the     the result
 *                 result has no record kind 2 (yncrea's frame " YNCREA " is
 *                 recorded); but if the last lookup of record kind 2 on this
 *                 thread (at the end of an earlier path) found a count of 1,
 *                 the call instead ends as the 4721 below
 *   4712  1       n < 2; some pas(i,1) <= 0 or >= pas(i,2); tol(1) <= 0 (every  0
 *                 tol(i) with bit 16); box(i,1) >= box(i,2); x0 outside the box;
 *                 the residual sum at x0 above eps or not a number
 *   4718  1       n > 20; mode or store refused (above); fct returned 4715 to    0
 *                 a tangent request (its other codes, and 4715 elsewhere, pass)
 *   4713  1       a prediction that is not finite                               0
 *   4720  1       n <= 4 and a 5001st point (counting x0) was accepted; n >= 5   0
 *                 has no such limit, only the 2^31 - 1 points of the count
 *   4721  1       x0 on a face with d0 pointing out of the box (d0(i) < 0 at     0
 *                 box(i,1), > 0 at box(i,2)); or the path ended with its start
 *                 point alone (the first step collapsed)
 *   36    1       a table or the workspace could not grow                       0
 *   any   1       the code of fct, when it returned 1; except that its codes     0
 *                 4701, 4702, 4713 and 4716 during a correction count as the
 *                 corrector's own (the correction is judged by its residual, or
 *                 fails and the step is halved)
 *   Checked in this order: n, pas, mode, tol, store, then the box unknown by unknown, x0.
 * Traceback: on result 1 a frame "YNCHEM  " (length 8) with ierr, except for 4721. Below it:
 * "WNCGOO  " (length 8) when fct failed during a correction or for 4713, above "WNCGF2;"
 * (length 7) when n = 2 and fct failed during a correction (not for its code 4716);
 * "WNCPAS  " (length 8) when the step control failed.
 * State: the path being traced lives in this thread's storage, rebuilt at every call, so
 * several threads may trace paths at once. Kept between calls on a thread: the count of the
 * last record kind 2 lookup (above) and the step control's last bound. Nothing is left
 * allocated after a failure: no table, no workspace block.
 */
ORVQ7_API int32_t ynchem(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* xd, const double* box, const double* pas,
                         const int32_t* mode, const double* tol, const int32_t* store,
                         int32_t* itab, int32_t* ierr);

/* Records of a path. The driver keeps one of each per thread and passes them to the routines
 * below; a caller of these routines passes records that wnccmd and wncini filled. Their fields
 * are defined in path/path_state.h; in outline:
 *   options (Orvq7PathOptions)  7 int32: path kind K (1, 2, 4, 8), first-order flag, order
 *                                level (0, 1, 2), per-unknown tolerance flag, flags 17, 18, 19
 *   limits (real(2))             the bound B (1/h^2 for K = 4, 1/h for K = 8) and the cosine
 *                                limit of the turn test
 *   layout (Orvq7PathLayout)     the storage request decoded: 11 slots of fixed position
 *                                (kind, width, type, offset), see "Result tables" below
 *   pairs (int32(2, 11))         the (count, code) pairs of the storage request, in order
 *   march (Orvq7PathMarch)       current point x, tangent t, previous tangent, the vector c
 *                                kept with the tangent (all real(20)), step H, previous step,
 *                                factors f and g, closure values, orientation sign, points
 *                                stored, tangent request
 *   tables (Orvq7PathTables)     handles of the result table and of its sub-tables
 *
 * Result tables. A traced path is returned as the handle itab of a master table of 4-byte
 * integers (entry size 4) holding one triple per kept quantity, in slot order: (record kind,
 * sub-table handle or 0, number of entries written, recorded when the path ended). Each
 * sub-table holds one entry per stored point, in the order of the path; an entry is `width`
 * values, 4-byte integers or 8-byte reals (entry size 4 * width or 8 * width bytes):
 *   store bit(s)  kind  width  type  values of one entry, in order
 *   0             22    2      real  the step f*H that reached the point (0 at the start
 *                                    point); the closure value at the point
 *   1             23    2n     real  the point x(1..n); the tangent t(1..n)
 *   2             43    2n     real  the point x(1..n); the vector c(1..n)
 *   3, 4, 5       1     1      int   first group: the flush phase when the point was stored
 *                                    (0 start point, 1 along the path, 2 end of the path)
 *                 2     1      int   the point's number along the path, 1 for the start
 *                 3     n      real  the point x(1..n)
 *   7, 8, 9       1     1      int   second group: the orientation sign (+1 or -1)
 *                 2     1      real  the step f*H that reached the point (0 at the start)
 *                 3     n      real  the vector c(1..n)
 * The tangent t is the direction of travel: unit length, except at the start point, where it
 * is the start direction d0 as given. c is the curve's second derivative with respect to arc
 * length at order level 1; at order level 2 the scale values at the start and then the
 * difference quotient of the last two tangents; 0 at order level 0.
 * A group has two forms. In its first form a member holds values only when its own bit is set
 * (kinds 1, 2, 3: bits 3, 4, 5, or 7, 8, 9); a member without values keeps its triple, with
 * handle 0 and count 0. In its second form all three members hold values. ynchem always uses
 * the second form of the first group.
 * Reading a path back: yncrea(itab, kind, handle, count) gives a quantity's sub-table and its
 * number of entries; yutinf(handle) its entry size; yutrea(handle, 1, count, buffer) copies its
 * entries, entry after entry (or yuttab gives direct access). yncend(itab) releases it all. */

/** wnccmd -- decodes and checks the option words of a path.
 * Arguments
 *   n        in   int32      number of unknowns, 2 <= n <= 20
 *   pas      in   real(n,2)  minimum (column 1) and maximum (column 2) step of each unknown
 *   mode     in   int32      option word: bits 0-3 exactly one set, its value is the path kind
 *                            K; 4-14 clear; 15 (K = 4 or 8 only) raises the order level from
 *                            1 to 2; 16 tol holds n values; 17 sets flag 17; 18 clears flag
 *                            18; 19 sets flag 19; 20-31 clear
 *   tol      in   real(n)    tolerance: tol(1), or tol(1..n) with mode bit 16
 *   store    in   int32      storage request: bit 0 adds (2, 22), bit 1 (2n, 23), bit 2
 *                            (2n, 43); any of bits 3-5 the first group (0, 1), (0, 2), (0, 3);
 *                            any of bits 7-9 the second group; bits 6, 10-14 and 31 ignored;
 *                            bits 15-29 must be clear; bit 30 puts the first group in its
 *                            second form
 *   variant  in   int32      1 the implicit path (wnccim), 2 the extremum path (wnccex)
 *   options  out  options record: cleared on entry, then filled
 *   limits   out  real(2)    [1] the bound B: 1/h^2 (K = 4) or 1/h (K = 8), h = pas(1,2), or
 *                            the smallest pas(i,2) with mode bit 16; left untouched for K = 1
 *                            and 2. [2] the cosine limit 0.92388, for K = 8 the larger of that
 *                            and 1/sqrt(tol(1)^2 + 1)
 *   layout   out  storage layout: cleared on entry, then filled
 *   pairs    out  int32(2,11) the (count, code) pairs in the order of the store bits: cleared
 *                            on entry, then filled
 *   ierr     out  int32      status code
 * Result  0 success, 1 failure
 *   ierr  when (checked in this order)
 *   4712  n < 2
 *   4718  n > 20
 *   4712  some pas(i,1) <= 0 or pas(i,1) >= pas(i,2) (or not a number)
 *   4718  mode, scanned from bit 0 up: a set bit among 0-14 other than one first kind bit
 *         (two kind bits, or any of 4-14), bit 15 with an order level other than 1, a set
 *         bit among 20-31
 *   4712  tol(1) <= 0, or with mode bit 16 some tol(i) <= 0 (or not a number)
 *   4718  store: no quantity requested; a set bit among 15-29
 *   4718  variant not 1 or 2, or the combination refused by the variant check
 * On failure the records hold what was decoded before the failing check (limits are written
 * only after the tolerance check). Traceback: none. State: none.
 */
ORVQ7_API int32_t wnccmd(const int32_t* n, const double* pas, const int32_t* mode,
                         const double* tol, const int32_t* store, const int32_t* variant,
                         struct Orvq7PathOptions* options, double* limits,
                         struct Orvq7PathLayout* layout, int32_t* pairs, int32_t* ierr);

/** wnccim -- variant check of the implicit path (ynchem); called by wnccmd as its last step.
 * Accepts K = 2 at order level 0, K = 4 at order level 1 or 2, K = 8 at order level 1 or 2
 * without per-unknown tolerance; refuses K = 1 and K = 0. Then puts the first group in its
 * second form, and requires store bit 1, no store bit 0 and no second group. On success the
 * widths and offsets of the layout's slots are made for n unknowns.
 *   n        in      int32   number of unknowns, 2 <= n <= 20
 *   options  in      options record from wnccmd
 *   layout   in/out  storage layout from wnccmd
 * Result 0 (ierr 0) or 1 with ierr 4718 (any refusal; the form may already be set; n out of
 * range is refused the same way). Traceback: none. State: none.
 */
ORVQ7_API int32_t wnccim(const int32_t* n, const struct Orvq7PathOptions* options,
                         struct Orvq7PathLayout* layout, int32_t* ierr);

/** wnccex -- variant check of the extremum path; called by wnccmd as its last step.
 * Accepts K = 1 at order level 0 without per-unknown tolerance, K = 2 at order level 0, K = 4
 * at order level 1 or 2, K = 8 at order level 1 or 2 without per-unknown tolerance; refuses
 * K = 0. Then turns a set flag 18 into 2, and raises the order level to at least 1 when the
 * second group is requested. On success the widths and offsets are made for n unknowns.
 *   n        in      int32   number of unknowns, 2 <= n <= 20
 *   options  in/out  options record from wnccmd
 *   layout   in/out  storage layout from wnccmd
 * Result 0 (ierr 0) or 1 with ierr 4718, options and layout untouched.
 * Traceback: none. State: none.
 */
ORVQ7_API int32_t wnccex(const int32_t* n, struct Orvq7PathOptions* options,
                         struct Orvq7PathLayout* layout, int32_t* ierr);

/** wncini -- starts an implicit path: checks the start data, shows that x0 lies on the curve,
 * orients the path, rebuilds the march record and stores the first point.
 * Arguments
 *   ctx      in      opaque     handed to fct unchanged
 *   n        in      int32      number of unknowns, 2 <= n <= 20
 *   fct      in      routine    the evaluation routine
 *   eps      in      real       x0 is on the curve when its sum of squared residuals is <= eps
 *   xd       in      real(n,2)  column 1 the start point x0, column 2 the start direction d0
 *   box      in      real(n,2)  lower (column 1) and upper (column 2) bounds
 *   options  in      options record from wnccmd
 *   layout   in      storage layout from wnccmd
 *   pairs    in      not read
 *   march    out     march record: f = 1, tangent request 2 (6 at order level 1), then
 *                    rebuilt as below
 *   tables   out     table handles, written by wncflu
 *   itab     in/out  int32      must be 0 on entry; the result table holding the first point
 *   ierr     out     int32      status code
 * Steps: (1) for each unknown in order: box(i,1) < box(i,2) and box(i,1) <= x0(i) <= box(i,2),
 * else 4712; then x0(i) = box(i,1) with d0(i) < 0, or x0(i) = box(i,2) with d0(i) > 0, gives
 * 4721. (2) The residuals at x0 (npts 1, req 1): a sum of squares (in equation order) above
 * eps, or not a number, gives 4712. (3) ynumde at x0 (req 2, or 6 at order level 1); its 4710
 * is cleared: the tangent is then d0, and at order level 1 the second block holds the scale
 * values s(i) = 2 / ((box(i,2) - box(i,1)) * sqrt(n)). (4) Orientation sign -1 when tangent .
 * d0 < 0, else +1. (5) March record: x = x0; t = tprev = d0 as given (not normalised); c = the
 * second block (order level 1), the scale values (order level 2) or 0; H = H_prev = 1e38;
 * g = 1; closure values 0; points stored 1. (6) wncflu stores the point (phase 0, accepted 1).
 * Result  0 success, 1 failure
 *   ierr  when                                                   outputs
 *   4712  n < 2; a box pair out of order; x0 outside the box;    march partly written
 *         residual sum above eps
 *   4718  n > 20
 *   4721  x0 on a face with d0 pointing out of the box
 *   any   the code of fct, of ynumde (but 4710) or of the table services
 * Traceback: none. State: none of its own (the records are the caller's).
 */
ORVQ7_API int32_t wncini(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* xd, const double* box,
                         const struct Orvq7PathOptions* options,
                         const struct Orvq7PathLayout* layout, const int32_t* pairs,
                         struct Orvq7PathMarch* march, struct Orvq7PathTables* tables,
                         int32_t* itab, int32_t* ierr);

/** ynumde -- unit tangent and second derivative (with respect to arc length) of the curve
 * F(x) = 0 at each of npts points.
 * Arguments
 *   ctx   in   opaque        handed to fct unchanged
 *   n     in   int32         number of unknowns, 2 <= n <= 20
 *   fct   in   routine       the evaluation routine, called once for all the points, with
 *                            req 2 (for req 2) or req 6 (for req 4 and 6)
 *   npts  in   int32         number of points, >= 1
 *   x     in   real(n,npts)  the points
 *   req   in   int32         2 the tangent; 4 the second derivative; 6 both, tangent first
 *   out   out  real          per point, n values (req 2, 4) or 2n values (req 6)
 *   ierr  out  int32         status code
 * Tangent: n = 2, with the gradient (a, b): (-b, a) / sqrt(a^2 + b^2). n = 3: the cross product
 * g1 x g2 of the two gradients, normalised. n >= 4: the generalised vector product of the
 * gradients (ynvvvv), normalised; its sign makes t . y = det[y g1 ... g(n-1)].
 * Second derivative c: n = 2: the gradient times (2ab F_xy - b^2 F_xx - a^2 F_yy) /
 * (a^2 + b^2)^2, F_xy being element (1, 1, 2) of the second block. n >= 3: the solution, by
 * ynsega, of J c = -(t' H_k t)_k, t . c = 0 (rows: the Jacobian, then t), where t' H_k t sums
 * t_i H(k,i,j) t_j over i within j, both ascending.
 * Degenerate (4710): n = 2 when a^2 + b^2 < 1e-24; n = 3 when a gradient's squared length is
 * below 1e-10 or the product's below 1e-24; n >= 4 when the product's squared length is below
 * 1e-24; any of these not a finite number; ynsega failing for c.
 * Work area: npts * n(n-1) reals (req 2) or npts * (n+1)n(n-1) (req 4, 6); up to 210 on the
 * stack, more from the workspace service (type 3, relative to dynar), released on every return.
 * Result  0 success, 1 failure
 *   ierr  when                                 outputs
 *   4712  n < 2, or npts < 1                   out untouched
 *   4718  n > 20; req not 2, 4 or 6; fct returned 4715 (fct's other codes are passed on)
 *   4710  degenerate at some point             points before it written
 *   36    the workspace was refused            out untouched
 *   any   ynvvvv's code (n >= 4)
 * Traceback: none. State: none.
 */
ORVQ7_API int32_t ynumde(void* ctx, const int32_t* n, Orvq7PathFct fct, const int32_t* npts,
                         const double* x, const int32_t* req, double* out, int32_t* ierr);

/** wncpas -- chooses the length H of the next step: H := min(2 f H, T), then f := 1.
 * Arguments
 *   n        in      int32    number of unknowns, 2 <= n <= 20
 *   variant  in      int32    1 implicit path, 2 extremum path; another value uses the
 *                             fallback bound for K = 4 and 8
 *   options  in      options record
 *   limits   in      real(2)  the bound B and the cosine limit, from wnccmd
 *   tol      in      real(n)  tolerance, as given to wnccmd
 *   pas      in      real(n,2) step bounds, as given to wnccmd
 *   march    in/out  reads t, c, g; H and f are written on success only
 *   ierr     out     int32    status code
 * Bound T (|t ^ v| is the Euclidean norm of the exterior product by ynvevv, |c| that of c):
 *   K = 1: |tol(1)| (no factor 0.9)
 *   K = 2: 0.9 |tol(1)|; per-unknown: 0.9 sqrt(sum (tol(i) t_i)^2)
 *   K = 4, variant 1: 0.9 sqrt(1 / (0.5 |c| / tol(1) + B)); per-unknown: q = sum (c_i/tol(i))^2;
 *          T0 = pas(k,2) / |t_k| for the first k with |t_k| >= 1e-15 when q = 0 (the smallest
 *          pas(i,2) when there is no such k), else sqrt(1 / (0.5 sqrt(q))); then for each i in
 *          order, r = |t_i| T0 / pas(i,2), T0 := T0 / r when r > 1; T = 0.9 T0
 *   K = 4, variant 2: 0.9 sqrt(1 / (B g^2 + |t ^ c| / (2 tol(1)))); per-unknown: with
 *          w_i = c_1 / tol(i) (c_1 on purpose), 0.9 sqrt(1 / (B g^2 + |t ^ w| / 2))
 *   K = 8, variant 1: 0.9 / (|c| / tol(1) + B)
 *   K = 8, variant 2: 0.9 / (g (|t ^ c| - t_n c_n tol(1)) / (tol(1) + B)) (only the last
 *          components, on purpose)
 *   K = 4 or 8, other variant: 0.9 times the bound kept from this thread's previous call
 * The bound computed is kept, per thread, for the next call (0 before the first); it survives
 * from one path to the next. When T is not a number, H becomes not a number.
 * Result  0 success, 1 failure (H and f untouched)
 *   ierr  when                                    traceback
 *   4712  n < 2                                   none
 *   4718  n > 20, or K not 1, 2, 4 or 8           "WNCPAS  " (length 8)
 *   any   ynvevv's code                           "WNCPAS  " (length 8)
 * State: the last bound T, per thread.
 */
ORVQ7_API int32_t wncpas(const int32_t* n, const int32_t* variant,
                         const struct Orvq7PathOptions* options, const double* limits,
                         const double* tol, const double* pas, struct Orvq7PathMarch* march,
                         int32_t* ierr);

/** wncgoo -- predicts the next point of a path and corrects it onto the curve, halving the
 * step while the correction fails.
 * Arguments
 *   ctx      in      opaque     handed to fct unchanged
 *   n        in      int32      number of unknowns, 2 <= n <= 20
 *   fct      in      routine    the evaluation routine
 *   eps      in      real       residual threshold of the correction
 *   spare    in      real       not read
 *   pas      in      real(n,2)  minimum (column 1) and maximum (column 2) steps
 *   march    in/out  march record: reads x, t, tprev, h, hprev; f is halved at each failed
 *                    correction
 *   special  out     int32      0, or 3 when the step collapsed (no new point)
 *   xnew     out     real(n)    the corrected point (result 0, special 0)
 *   ierr     out     int32      status code
 * Steps: h = H f, r = h / (2 H_prev). (a) u_i = t_i + (t_i - tprev_i) r, p_i = x_i + h u_i.
 * (b) Every |h u_i| <= pas(i,1) (inclusive), or h = 0: special 3, result 0. (c) wncgcv with
 * which 1, direction u, the Jacobian frozen at x, box half-widths pas(i,2). (d) A correction
 * refused with 4713, or one whose every unknown lies strictly within pas(i,1) of x, has
 * failed: h, r and f are halved (times 0.5) and (a) follows.
 * Result  0 success (xnew, or special 3), 1 failure
 *   ierr  when                                                   traceback
 *   4712  n < 2                                                  none
 *   4718  n > 20                                                 none
 *   4713  a predicted point that is not finite (checked after    "WNCGOO  " (length 8)
 *         (b)): halving cannot mend it
 *   any   the code of wncgcv other than 4713 (fct's codes)        "WNCGOO  " (length 8)
 * State: none of its own.
 */
ORVQ7_API int32_t wncgoo(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* spare, const double* pas, struct Orvq7PathMarch* march,
                         int32_t* special, double* xnew, int32_t* ierr);

/** wncgcv -- corrects a predicted point onto the curve inside the box p - w .. p + w and
 * decides whether the correction is accepted.
 * Arguments
 *   ctx    in   opaque     handed to fct unchanged
 *   n      in   int32      number of unknowns, 2 <= n <= 20
 *   fct    in   routine    the evaluation routine
 *   eps    in   real       the corrected point's residual norm must be at most eps
 *   which  in   int32      1: wncgnn with the gradients at xbase frozen (fct req 2 at xbase);
 *                          0: wncgnr in the hyperplane through p orthogonal to u; for n = 2
 *                          wncgf2 is used whatever which is
 *   u      in   real(n)    the direction of the prediction
 *   xbase  in   real(n)    where the gradients are frozen (which 1)
 *   p      in   real(n)    the predicted point
 *   w      in   real(n)    half-widths of the search box
 *   xnew   out  real(n)    the corrected point (written by the corrector, also on 4713)
 *   ierr   out  int32      status code
 * Acceptance: the corrector's 4716 gives 4713; after success, 4701 or 4702 the final residual
 * norm decides: at most eps (inclusive) accepts, anything else (a NaN too) gives 4713.
 * Result  0 accepted, 1 failure
 *   ierr  when
 *   4712  n < 2, or which not 0 or 1
 *   4718  n > 20
 *   4713  the correction did not reach the curve
 *   any   fct's code (at xbase, or in the corrector)
 * Traceback: none of its own (wncgf2's frames). State: none.
 */
ORVQ7_API int32_t wncgcv(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const int32_t* which, const double* u, const double* xbase,
                         const double* p, const double* w, double* xnew, int32_t* ierr);

/** wncgnn -- Newton correction in the span of frozen directions: x = p + V z, z in R^(n-1).
 * Arguments
 *   ctx    in   opaque     handed to fct unchanged
 *   n      in   int32      number of unknowns, 2 <= n <= 20
 *   fct    in   routine    the evaluation routine, called with req 3
 *   v      in   real(n,n-1)  the correction directions V as columns
 *   p      in   real(n)    the start of the iteration
 *   box    in   real(2,n)  (lower, upper) of each unknown
 *   xnew   out  real(n)    the kept iterate: the last whose residual norm decreased
 *                          strictly, p before any; written on every return but the argument
 *                          errors (also when fct fails)
 *   rnorm  out  real       its residual norm (sum of squares of the n-1 residuals); 1e38 for
 *                          p before its evaluation
 *   ierr   out  int32      status code
 * Iteration, from z = 0: (a) more than 100 iterations: 4701; (b) x outside the box
 * (inclusive bounds; a NaN is outside): 4716; (c) fct at x, req 3; (d) a norm not strictly
 * below the kept one ends the iteration with the kept iterate (tested against the box once
 * more); (e) (J V) dz = F by ynsega, (J V)(k,l) summed over i ascending; z := z - dz;
 * x := p + V z.
 * Result  0 success, 1 failure
 *   ierr  when
 *   4712  n < 2
 *   4718  n > 20
 *   4701  more than 100 iterations
 *   4702  ynsega failed
 *   4716  an iterate left the box
 *   any   fct's code
 * Traceback: none. State: none (work vectors are locals).
 */
ORVQ7_API int32_t wncgnn(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* v,
                         const double* p, const double* box, double* xnew, double* rnorm,
                         int32_t* ierr);

/** wncgnr -- Newton correction on F(x) = 0 augmented with u . (x - p) = 0.
 * Arguments as for wncgnn, with
 *   u      in   real(n)    the normal of the hyperplane through p holding the corrected point
 * and the residual norm (u . (x - p))^2 + (sum of squares of F). Each Newton system has the
 * Jacobian as rows 1..n-1 and u as row n, right-hand side (F, u . (x - p)); x := x - dx.
 * Iteration, codes and outputs as for wncgnn. Traceback: none. State: none.
 */
ORVQ7_API int32_t wncgnr(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* u,
                         const double* p, const double* box, double* xnew, double* rnorm,
                         int32_t* ierr);

/** wncgf2 -- correction for two unknowns: a safeguarded one-dimensional root search along the
 * line through p orthogonal to u, the points (p1 - u2 s, p2 + u1 s).
 * Arguments
 *   ctx    in   opaque     handed to fct unchanged
 *   fct    in   routine    the evaluation routine (n = 2), called with req 3
 *   u      in   real(2)    the direction orthogonal to the search line
 *   p      in   real(2)    the start point (s = 0)
 *   box    in   real(2,2)  (lower, upper) of each unknown
 *   xnew   out  real(2)    the point of the best s (not written when fct fails)
 *   rnorm  out  real       its squared residual
 *   ierr   out  int32      status code
 * (1) Newton in s from 0 with the derivative F_y u1 - F_x u2. Each iteration: more than 100
 * gives 4701; the point outside the box (inclusive bounds, NaN outside) gives 4716; a squared
 * residual not strictly below the best ends Newton; a zero derivative ends it too (no search
 * follows then).
 * (2) When Newton ended on a rejected step and the best squared residual exceeds 1e-15: the
 * residual at the rejected point is compared in sign with the best one; while the signs do not
 * differ (a zero has no sign) the step is halved, at most five times, and evaluated again. With
 * a sign change, the bracket is bisected at a + 0.5 (b - a) while wider than 1e-15 and while
 * the best squared residual exceeds 1e-15 (both strict), keeping the end with the best's sign;
 * at most 200 bisections, and a midpoint equal to an end stops it. Every point evaluated
 * competes for the best (strictly smaller squared residual); a residual that is not finite
 * ends the search.
 * Result  0 success, 1 failure
 *   ierr  when                           traceback
 *   4701  more than 100 Newton steps     "WNCGF2;" (length 7)
 *   4716  an iterate left the box        none
 *   any   fct's code                     "WNCGF2;" (length 7), unless the code is 4716
 * State: none.
 */
ORVQ7_API int32_t wncgf2(void* ctx, Orvq7PathFct fct, const double* u, const double* p,
                         const double* box, double* xnew, double* rnorm, int32_t* ierr);

/** wnctes -- tests a corrected point for the end of the path: closure on x0, an exit from the
 * box, or an exit and return within the step.
 * Arguments
 *   ctx      in      opaque     handed to fct unchanged
 *   n        in      int32      number of unknowns, 2 <= n <= 20
 *   fct      in      routine    the evaluation routine
 *   eps      in      real       residual threshold
 *   xd       in      real(n,2)  the start point x0 and the start direction d0
 *   xnew     in      real(n)    the corrected point
 *   box      in      real(n,2)  lower (column 1) and upper (column 2) bounds
 *   pas      in      real(n,2)  minimum and maximum steps
 *   march    in/out  march record: reads x, t, close_prev, nstored; writes close (wnctfe),
 *                    f (wnctob)
 *   redo     out     int32      1 when the step is to be corrected again, else 0
 *   xkeep    out     real(n)    the point kept: x0, the end point on a face, or xnew
 *                               (not written when redo is 1)
 *   special  out     int32      2 closed, 1 ends on a face; untouched otherwise
 *   ierr     out     int32      status code
 * Steps: (1) redo 0. (2) wnctfe: closed gives special 2 and xkeep = x0 (from xd). (3) xnew
 * strictly outside the box: wnctob from x to xnew; found gives special 1 and its end point,
 * not found or undecided gives redo 1 (the step factor was halved). (4) Otherwise the
 * quadratic model of the curve over the step: value x and derivative L t at 0, xnew at 1,
 * L = |xnew - x| (ynxxlv). When some component's extreme lies strictly beyond its bound, the
 * outermost point is the model at the extreme of the largest excursion (strictly; ties keep
 * the earlier unknown, the lower bound first), and wnctob runs from x to it: found ends the
 * path there (special 1); otherwise redo and special are cleared, f is doubled back (times
 * 2.0) and xnew is kept. (5) Otherwise xkeep = xnew.
 * Result  0 success, 1 failure with the code of wnctfe, wnctob or ynxxlv (fct's codes, 4712
 * for n < 2, 4718 for n > 20). Traceback: none. State: none of its own.
 */
ORVQ7_API int32_t wnctes(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* xd, const double* xnew, const double* box,
                         const double* pas, struct Orvq7PathMarch* march, int32_t* redo,
                         double* xkeep, int32_t* special, int32_t* ierr);

/** wnctfe -- closure test: has the path come back to its start point x0?
 * Arguments
 *   ctx    in      opaque     handed to fct unchanged
 *   n      in      int32      number of unknowns, 2 <= n <= 20
 *   fct    in      routine    the evaluation routine
 *   eps    in      real       residual threshold
 *   xd     in      real(n,2)  x0 and d0
 *   xnew   in      real(n)    the new point
 *   pas    in      real(n,2)  column 2: half-widths of the correction box
 *   march  in/out  march record: reads x and close_prev (g_prev); writes close (g), unless
 *                  fct fails
 *   hit    out     int32      1 closed, else 0
 *   ierr   out     int32      status code
 * (1) g = (xnew - x0) . d0, summed by increasing index. (2) No crossing unless g_prev < 0
 * <= g. (3) lambda = -g_prev / (g - g_prev), or 1 when g - g_prev < 1e-15; q = (1 - lambda) x
 * + lambda xnew. (4) wncgcv with which 0, direction d0, at q; its 4713 means no closure.
 * (5) hit 1 when every |x0_i - r_i| <= max(|x0_i|, 1) 1e-6 (inclusive) for the corrected r.
 * Result  0 success, 1 failure with wncgcv's code other than 4713 (4712 for n < 2, 4718 for
 * n > 20). Traceback: none. State: none of its own.
 */
ORVQ7_API int32_t wnctfe(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* xd, const double* xnew, const double* pas,
                         struct Orvq7PathMarch* march, int32_t* hit, int32_t* ierr);

/** wnctop -- the point where the segment from xa to xb leaves the box.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32      number of unknowns, n >= 1
 *   xa    in   real(n)    start of the segment (normally inside the box)
 *   xb    in   real(n)    end of the segment
 *   box   in   real(n,2)  lower (column 1) and upper (column 2) bounds
 *   face  out  int32(2)   face(1): 1 the lower, 2 the upper bound; face(2): the unknown k
 *                         (from 1)
 *   xout  out  real(n)    (1 - lambda) xa + lambda xb, then xout(k) = the bound exactly
 *   ierr  out  int32      status code
 * Candidates: the unknowns with xb_i <= lower_i (tested first) or xb_i >= upper_i, both
 * inclusive; the bound b crossed and the ratio |xb_i - xa_i| / |b - xa_i| (1 when both are 0:
 * the segment lies in the face). The largest ratio wins (strictly; ties keep the earlier
 * unknown). lambda = |b - xa_k| / |xb_k - xa_k|, or 1 when xb_k = xa_k.
 * Result  0 success, 1 failure (face, xout untouched)
 *   ierr  when
 *   4712  n < 1, or no unknown on or beyond a bound (a NaN coordinate is never one)
 * Traceback: none. State: none.
 */
ORVQ7_API int32_t wnctop(const int32_t* n, const double* xa, const double* xb,
                         const double* box, int32_t* face, double* xout, int32_t* ierr);

/** wnctob -- the end point of the path on the box face between the current point and xfar.
 * Arguments
 *   ctx     in      opaque     handed to fct unchanged
 *   n       in      int32      number of unknowns, 2 <= n <= 20
 *   fct     in      routine    the evaluation routine
 *   eps     in      real       residual threshold
 *   xfar    in      real(n)    a point beyond the face
 *   box     in      real(n,2)  lower (column 1) and upper (column 2) bounds
 *   pas     in      real(n,2)  column 2: half-widths of the correction box
 *   march   in/out  march record: reads x, t, nstored; f is halved unless the status is 0
 *   status  out     int32      0 found (in xend); 1 not found; 2 undecided: the path holds
 *                              only its start point and never ends at its first step
 *   xend    out     real(n)    the end point (status 0 only)
 *   ierr    out     int32      status code
 * Up to n attempts: (a) wnctop from x to the far end gives q on the face of unknown j (its
 * failure: not found); (b) wncgcv with which 0 and direction e_j corrects q within the face
 * (4713: not found), then r_j = the bound exactly; (c) another coordinate outside the box by
 * more than 1e-12: r becomes the far end, next attempt; (d) the residuals at r (req 1): a sum
 * of squares at most eps (inclusive) finds r, else r becomes the far end. After n attempts,
 * not found. A found r with (r - x) . t < 0 is not found after all; the tangent at r is
 * computed in both cases (ynumde, req 2; its 4710 is no error).
 * Result  0 success (any status), 1 failure with the code of fct, wncgcv or ynumde (4712 for
 * n < 2, 4718 for n > 20). Traceback: none. State: none of its own.
 */
ORVQ7_API int32_t wnctob(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* eps,
                         const double* xfar, const double* box, const double* pas,
                         struct Orvq7PathMarch* march, int32_t* status, double* xend,
                         int32_t* ierr);

/** wnccar -- accepts or rejects the step to the point kept, classifies it for storage and
 * advances the march record to it.
 * Arguments
 *   ctx       in      opaque     handed to fct unchanged
 *   n         in      int32      number of unknowns, 2 <= n <= 20
 *   fct       in      routine    the evaluation routine
 *   xd        in      real(n,2)  x0 and d0
 *   xkeep     in      real(n)    the point kept by wnctes
 *   pas       in      real(n,2)  minimum and maximum steps
 *   options   in      options record
 *   limits    in      real(2)    the bound B and the cosine limit
 *   tol       in      real(n)    tolerance as given to wnccmd
 *   special   in/out  int32      0 ordinary, 1 end on a face, 2 closed; cleared on a redo
 *   march     in/out  march record
 *   redo      out     int32      0, or 1 or 2 (as set by the step test) to correct again
 *   accepted  out     int32      1 store as a new point; 2 the end point replaces the last
 *                                stored point
 *   ierr      out     int32      status code
 * Steps, with s = xkeep - x, L = |s|: (2) accepted 1, except for an end point with every
 * |s_i| <= pas(i,1) on a path holding two points or more: 2. (3) Some |s_i| > pas(i,2)
 * (strict): redo 1, f := 0.75 f, special 0. (5) Closed: tprev := t, x := x0, t := d0,
 * H_prev := f H, g_prev := g. (6) ynumde at xkeep with the tangent request (2, or 6 at order
 * level 1); its 4710 (no tangent there) is no error: the current tangent stands for the new
 * one and c is kept. (7) wncver; a redo gives f := 0.75 f, special 0. (8) t . tnew < 0
 * (strict) reverses tnew. (9) tprev := t, t := tnew, x := xkeep, H_prev := f H, g_prev := g;
 * c := the second block (order level 1) or, at order level 2 with L > 1e-12, (t - tprev) / L.
 * Result  0 success, 1 failure with ynumde's code other than 4710 (4712 for n < 2, 4718 for
 * n > 20). Traceback: none. State: none of its own.
 */
ORVQ7_API int32_t wnccar(void* ctx, const int32_t* n, Orvq7PathFct fct, const double* xd,
                         const double* xkeep, const double* pas,
                         const struct Orvq7PathOptions* options, const double* limits,
                         const double* tol, int32_t* special, struct Orvq7PathMarch* march,
                         int32_t* redo, int32_t* accepted, int32_t* ierr);

/** wncver -- step test: the turn of the tangent and, for K = 4, the distance between chord
 * and curve.
 * Arguments (all by reference; "in" arguments are never written)
 *   n        in   int32    number of unknowns, 2 <= n <= 20
 *   step     in   real(n)  the step s from the current point to the new one
 *   t        in   real(n)  the current tangent
 *   tnew     in   real(n)  the tangent at the new point, as computed (either orientation)
 *   options  in   options record: kind, per-unknown flag, flag 18
 *   limits   in   real(2)  limits(2) is the cosine limit
 *   tol      in   real(n)  tol(1), or tol(1..n) with the per-unknown flag
 *   redo     out  int32    0 accepted; 1 the tangent turned too much; 2 the chord is too far
 *                          from the curve (K = 4)
 *   dot      out  real     t . tnew
 *   ierr     out  int32    status code
 * Turn test (strict): flag 18 = 1 rejects |dot| < limit, 2 rejects dot < limit, 0 none.
 * K = 4, after a passed turn test: the chord-to-curve distance estimated from the tangents,
 * D_i = ((L / 8) (t_i / |t| - sigma tnew_i)) / tol_i with L = |step|, sigma = -1 when dot < 0
 * (else 1), tol_i = tol(i) or tol(1) (t used as given when |t| = 0); redo 2 when the sum of
 * D_i^2 exceeds 1 (strict).
 * Result  0 success, 1 failure (4712 n < 2, 4718 n > 20; outputs untouched).
 * Traceback: none. State: none.
 */
ORVQ7_API int32_t wncver(const int32_t* n, const double* step, const double* t,
                         const double* tnew, const struct Orvq7PathOptions* options,
                         const double* limits, const double* tol, int32_t* redo, double* dot,
                         int32_t* ierr);

/** wncflu -- stores the current point of the march record in the result.
 * Arguments
 *   phase     in      int32  flush phase: 0 the start point, 1 along the path, 2 end seen
 *   accepted  in      int32  0 store nothing; 1 append the point; 2 the point replaces the
 *                            last stored one (appended when nothing is stored yet)
 *   options   in      not read
 *   layout    in      storage layout made by the variant check
 *   march     in/out  read: x, t, c, sign, hprev, close, nstored; nstored + 1 when a point
 *                     is appended in phase 1 or 2
 *   tables    out     master and sub-table handles, written when the result is created
 *   itab      in/out  int32  the result table; 0 before the first point (it is then created)
 *   ierr      out     int32  status code
 * Values of the point are gathered into the entry layout of "Result tables" (the point's
 * number is nstored after the update; its phase is `phase`); wncfst appends them (accepted 1).
 * For accepted 2 they overwrite the last entry of every sub-table. In phase 2 the number of
 * entries of each sub-table is recorded in its triple, also when nothing is stored.
 * Result  0 success, 1 failure
 *   ierr  when
 *   4712  phase not 0..2, accepted not 0..2
 *   any   the code of a table service (the result keeps what was written before)
 * Traceback: none. State: none of its own.
 */
ORVQ7_API int32_t wncflu(const int32_t* phase, const int32_t* accepted,
                         const struct Orvq7PathOptions* options,
                         const struct Orvq7PathLayout* layout, struct Orvq7PathMarch* march,
                         struct Orvq7PathTables* tables, int32_t* itab, int32_t* ierr);

/** wncfst -- appends one point to a result, creating the result when itab is 0.
 * Arguments
 *   phase   in      int32  flush phase; in phase 2 each triple records its entry count
 *   layout  in      storage layout made by the variant check
 *   values  in      real   the point's values: the quantity of slot s starts at
 *                          values[offset_s] (from 0); a real quantity's width values follow,
 *                          an integer quantity's width 4-byte integers are packed in the
 *                          bytes from there
 *   itab    in/out  int32  the result table; written only when it is created
 *   ierr    out     int32  status code
 * First call (itab 0): a master table of 3q 4-byte entries; for each used slot in order its
 * triple (kind, sub-table or 0, entry count in phase 2 else 0), each sub-table created holding
 * the point as its entry 1. A failure releases everything created, leaving itab 0.
 * Later calls: the triples are read; each sub-table is extended by one entry (yutinf, yutmnc)
 * and the point written there (yutwri); a used slot with values but no sub-table gets one;
 * triples are rewritten when a sub-table was created, and in phase 2 with the counts.
 * Result  0 success, 1 failure with the table service's code (4712 when the layout has no
 * quantity). Traceback: none. State: none.
 */
ORVQ7_API int32_t wncfst(const int32_t* phase, const struct Orvq7PathLayout* layout,
                         const double* values, int32_t* itab, int32_t* ierr);

/** yncrea -- finds the quantity of a record kind in a result.
 * Arguments
 *   itab    in   int32     the result table (0: an empty result)
 *   kind    in   int32     a record whose first element is the record kind; nothing else
 *                          is read
 *   handle  out  int32     the quantity's sub-table (0 when it has no values)
 *   count   out  int32     its number of entries, as recorded when the path ended
 *   ierr    out  int32     status code
 * The triples are scanned in order; the first with the kind wins.
 * Result  0 success, 1 failure (handle and count untouched)
 *   ierr  when                            traceback
 *   4712  no triple of that kind          " YNCREA " (length 8)
 *   any   the code of yuttab              none
 * State: none.
 */
ORVQ7_API int32_t yncrea(const int32_t* itab, const int32_t* kind, int32_t* handle,
                         int32_t* count, int32_t* ierr);

/** yncend -- releases a result: every non-zero sub-table of its triples, in order, then the
 * master table. itab = 0 does nothing (result 0, ierr 0). itab itself is not written.
 * Result 0, or 1 with the table service's code at the first release that fails (the tables
 * not yet released are then left). Traceback: none. State: none.
 */
ORVQ7_API int32_t yncend(const int32_t* itab, int32_t* ierr);

ORVQ7_END_DECLS

#endif /* ORVQ7_PATH_PATH_API_H */
