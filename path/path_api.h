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
