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
 *
 * Affine transformation of space: 12 reals, the 3-by-3 linear part M by columns
 * (M(i, j) is element i + 3(j - 1)), then the translation T; it maps a point p to M p + T and
 * a vector v to M v. Affine transformation of the plane: 6 reals (m11, m21, m12, m22, t1, t2).
 * Line of space: 6 reals, a unit direction D then a point Q. Plane of space: 9 reals, a 3-by-3
 * array by columns whose rows are the origin O = (a1, a4, a7), the first direction
 * U = (a2, a5, a8) and the second direction V = (a3, a6, a9).
 * Singularity flag: 0 when an inverse was formed, 1 when the determinant was too small.
 * None of these routines reports failure or records a traceback frame. Unless a block says
 * otherwise, outputs may share storage with inputs (every input is read before any output
 * is written). Sums of products are formed left to right in the order written.
 * ======================================================================================== */

/** fmat6 -- applies a transformation of space to a point: p' = M p + T.
 *   x, y, z     in   real      the point
 *   a           in   real(12)  the transformation
 *   xp, yp, zp  out  real      x' = ((m11 x + m12 y) + m13 z) + t1, likewise y', z'
 * Result 0. State: none. */
ORVQ7_API int32_t fmat6(const double* x, const double* y, const double* z, const double* a,
                        double* xp, double* yp, double* zp);

/** fmat61 -- applies the linear part of a transformation to a vector: v' = M v.
 *   x, y, z     in   real      the vector
 *   a           in   real(12)  the transformation (translation not read)
 *   xp, yp, zp  out  real      x' = (m11 x + m12 y) + m13 z, likewise y', z'
 * Result 0. State: none. */
ORVQ7_API int32_t fmat61(const double* x, const double* y, const double* z, const double* a,
                         double* xp, double* yp, double* zp);

/** fmat8 -- inverse of a rigid transformation applied to a point: p' = M^T (p - T).
 *   x, y, z     in   real      the point
 *   a           in   real(12)  the transformation; M is assumed orthogonal (not checked)
 *   xp, yp, zp  out  real      with d = (x - t1, y - t2, z - t3):
 *                              x' = (m11 d1 + m21 d2) + m31 d3, likewise y', z'
 * Result 0. State: none. */
ORVQ7_API int32_t fmat8(const double* x, const double* y, const double* z, const double* a,
                        double* xp, double* yp, double* zp);

/** fmat81 -- transposed linear part applied to a vector: v' = M^T v.
 *   x, y, z     in   real      the vector
 *   a           in   real(12)  the transformation (translation not read)
 *   xp, yp, zp  out  real      x' = (m11 x + m21 y) + m31 z, likewise y', z'
 * Result 0. State: none. */
ORVQ7_API int32_t fmat81(const double* x, const double* y, const double* z, const double* a,
                         double* xp, double* yp, double* zp);

/** fmat3 -- inverse of a rigid transformation.
 *   a  in   real(12)  the transformation; M is assumed orthogonal (not checked)
 *   b  out  real(12)  linear part M^T; translation -(M^T T), that is
 *                     b10 = -((m11 t1 + m21 t2) + m31 t3), likewise b11, b12
 * Result 0.
 * State: the inverse is built in per-thread storage and copied to b; no later call reads it.
 */
ORVQ7_API int32_t fmat3(const double* a, double* b);

/** fmat4 -- composition of two transformations of space: r = b after a.
 *   a  in   real(12)  applied first
 *   b  in   real(12)  applied second
 *   r  out  real(12)  linear part M_B M_A, element (i, j) = (B(i,1) A(1,j) + B(i,2) A(2,j))
 *                     + B(i,3) A(3,j); translation M_B T_A + T_B formed as fmat6 forms it
 * Result 0. State: none. */
ORVQ7_API int32_t fmat4(const double* a, const double* b, double* r);

/** fmat2 -- composition of two transformations of the plane: r = b after a.
 *   a  in   real(6)  applied first
 *   b  in   real(6)  applied second
 *   r  out  real(6)  r1 = b1 a1 + b3 a2, r2 = b2 a1 + b4 a2, r3 = b1 a3 + b3 a4,
 *                    r4 = b2 a3 + b4 a4, r5 = (b1 a5 + b3 a6) + b5, r6 = (b2 a5 + b4 a6) + b6
 * Result 0. State: none. */
ORVQ7_API int32_t fmat2(const double* a, const double* b, double* r);

/** fmat1 -- inverse of a 3-by-3 matrix, through inmat3 with a zero translation.
 *   a     in   real(9)  the matrix by columns
 *   b     out  real(9)  the linear part of the inverse, written on both flags: after a
 *                       singular matrix (flag 1) b receives the inverse of this thread's
 *                       last regular matrix, zeros before any
 *   flag  out  int32    inmat3's flag: 0 inverted, 1 |det| < 1e-9
 * Result 0.
 * State: per thread, the transformation passed to inmat3 and the last inverse it formed;
 * a call with a singular matrix reads the inverse left by the previous regular one. */
ORVQ7_API int32_t fmat1(const double* a, double* b, int32_t* flag);

/** inmat3 -- inverse of a general affine transformation of space.
 *   a     in   real(12)  the transformation
 *   b     out  real(12)  the inverse; untouched when flag = 1
 *   flag  out  int32     1 when |det| < 1e-9 (strict: 1e-9 itself inverts), else 0
 * Method: cofactors C(i, j) = m(i+1, j+1) m(i+2, j+2) - m(i+2, j+1) m(i+1, j+2), indices
 * taken cyclically in 1..3 (so C(1,1) = m22 m33 - m32 m23); det = (m11 C(1,1) + m12 C(1,2))
 * + m13 C(1,3); r = 1 / det once; inverse(i, j) = C(j, i) r; translation = the inverse's
 * linear part applied (as fmat61) to (-t1, -t2, -t3). A NaN determinant passes the test
 * and gives a non-finite inverse with flag 0.
 * Result 0.
 * State: the inverse is built in per-thread storage and copied to b; no later call reads it.
 */
ORVQ7_API int32_t inmat3(const double* a, double* b, int32_t* flag);

/** inmat2 -- inverse of an affine transformation of the plane.
 *   a     in   real(6)  the transformation
 *   b     out  real(6)  the inverse; untouched when flag = 1
 *   flag  out  int32    1 when |det| < 1e-6 (strict), else 0
 * Method: det = a1 a4 - a2 a3; r = 1 / det; b1 = a4 r, b2 = -a2 r, b3 = -a3 r, b4 = a1 r,
 * b5 = (a3 a6 - a4 a5) r, b6 = (a2 a5 - a1 a6) r. A NaN determinant passes the test and
 * gives a non-finite inverse with flag 0.
 * Result 0.
 * State: the six values are built in per-thread storage and copied to b with crccop
 * (48 bytes); no later call reads them. */
ORVQ7_API int32_t inmat2(const double* a, double* b, int32_t* flag);

/** fmat23 -- general matrix product r = a b.
 *   n, m, p  in   int32       orders: a is n-by-m (leading dimension n), b is m-by-p
 *                             (leading dimension m), r is n-by-p (leading dimension n)
 *   a        in   real(n,m)
 *   b        in   real(m,p)
 *   r        out  real(n,p)   r(i, j) = a(i,1) b(1,j), then + a(i,k) b(k,j) for k = 2..m in
 *                             increasing k; must not overlap a or b
 * Nothing is read or written when n < 1, m < 1 or p < 1.
 * Result 0. State: none. */
ORVQ7_API int32_t fmat23(const int32_t* n, const int32_t* m, const int32_t* p, const double* a,
                         const double* b, double* r);

/** trapnt -- applies a transformation of space (as fmat6) to a grid of points.
 *   a       in   real(12)  the transformation
 *   dim     in   int32     reals per point; nothing is done unless dim = 3
 *   nu      in   int32     points per row of the grid; nothing is done when nu < 1
 *   ld      in   int32     leading dimension of the grid, in points; nothing is done
 *                          when nv > 1 and ld < 1
 *   nv      in   int32     number of rows; nothing is done when nv < 1
 *   unused  in   any       not read (may be null)
 *   p       in   real      point (i, j), i = 1..nu, j = 1..nv, starts at real
 *                          ((i - 1) + (j - 1) ld) dim + 1
 *   q       out  real      the transformed points at the same positions; other reals of q
 *                          are not written; q may be p itself
 * Result 0. State: none. */
ORVQ7_API int32_t trapnt(const double* a, const int32_t* dim, const int32_t* nu,
                         const int32_t* ld, const int32_t* nv, const void* unused,
                         const double* p, double* q);

/** rbctra -- transforms the control points of a curve record.
 * Curve record: seven 16-bit header fields in bytes 0..13 (field 2 the dimension of the
 * points, field 5 their number), the points as reals from byte 16; 8-byte aligned.
 *   a     in   real(12)  the transformation
 *   rin   in   record    the curve
 *   rout  out  record    its points are written by trapnt with dim = field 2 and
 *                        nu = ld = field 5, nv = 1 (so only curves of space, dimension 3,
 *                        are transformed); its header is not written; may be rin itself
 * Result 0. State: none. */
ORVQ7_API int32_t rbctra(const double* a, const void* rin, void* rout);

/** rbstra -- transforms the control points of a surface record.
 * Surface record: eleven 16-bit header fields in bytes 0..21 (fields 7 and 8 the numbers of
 * points in the two directions, field 7 also the leading dimension of the grid), the points
 * of space as reals from byte 24; 8-byte aligned.
 *   a     in   real(12)  the transformation
 *   rin   in   record    the surface
 *   rout  out  record    its points are written by trapnt with dim = 3, nu = ld = field 7,
 *                        nv = field 8; its header is not written; may be rin itself
 * Result 0. State: none. */
ORVQ7_API int32_t rbstra(const double* a, const void* rin, void* rout);

/** rbclcp -- unpacks the seven 16-bit header fields of a curve record.
 *   hdr             in   int16(7)  the header (a curve record starts with it)
 *   o1, o2, ..., o7  out  int32     fields 1, 2, 5, 7, 3, 4, 6 in this order, sign-extended
 * Result 0. State: none. */
ORVQ7_API int32_t rbclcp(const int16_t* hdr, int32_t* o1, int32_t* o2, int32_t* o3, int32_t* o4,
                         int32_t* o5, int32_t* o6, int32_t* o7);

/** rbslcp -- unpacks the eleven 16-bit header fields of a surface record.
 *   hdr               in   int16(11)  the header (a surface record starts with it)
 *   o1, o2, ..., o11  out  int32      fields 1, 2, 7, 8, 11, 3, 5, 9, 4, 6, 10 in this
 *                                     order, sign-extended
 * Result 0. State: none. */
ORVQ7_API int32_t rbslcp(const int16_t* hdr, int32_t* o1, int32_t* o2, int32_t* o3, int32_t* o4,
                         int32_t* o5, int32_t* o6, int32_t* o7, int32_t* o8, int32_t* o9,
                         int32_t* o10, int32_t* o11);

/** xptln -- orthogonal projection of a point onto a line of space.
 *   p   in   real(3)  the point
 *   l   in   real(6)  the line: unit direction D (not checked), then a point Q
 *   pp  out  real(3)  P' = Q + t D, t = prosca(P - Q, D)
 * Result 0. State: none. */
ORVQ7_API int32_t xptln(const double* p, const double* l, double* pp);

/** xptpln -- orthogonal projection of a point onto a plane of space.
 *   p       in   real(3)  the point
 *   pl      in   real(9)  the plane
 *   pp      out  real(3)  P' = P + t N, t = (d - prosca(N, P)) / prosca(N, N), with N and d
 *                         from provec (the plane is N . X = d). A degenerate plane (N = 0)
 *                         is not tested: the division gives a non-finite P'.
 *   status  out  int32    always 0
 * Result 0.
 * State: per thread, the normal and constant of the last plane; no later call reads them. */
ORVQ7_API int32_t xptpln(const double* p, const double* pl, double* pp, int32_t* status);

/** eqcarp -- implicit equation a x + b y + c z + d = 0 of a plane, (a, b, c) the unit normal.
 *   pl          in   real(9)  the plane
 *   a, b, c, d  out  real     a, b, c = N (below); d = 0 - q, so a plane through the global
 *                             origin gives d = +0. All four are 0 for a degenerate plane.
 * Method: N = U x V (N1 = U2 V3 - U3 V2, N2 = U3 V1 - U1 V3, N3 = U1 V2 - U2 V1);
 * s = (N1^2 + N2^2) + N3^2; degenerate when s < e^2 (strict), e = tolerance 12 of the
 * current set. Otherwise N := f N with f = 1 / sqrt(s) when |s - 1| > 3e-8, else
 * f = 1 + (s - 1)(-0.5 + 0.375 (s - 1)) when |s - 1| > 1e-10, else f = 1 - 0.5 (s - 1);
 * q = (N1 O1 + N2 O2) + N3 O3. A NaN s is not degenerate and gives NaN outputs.
 * Result 0 (carries no information). State: none. */
ORVQ7_API int32_t eqcarp(const double* pl, double* a, double* b, double* c, double* d);

/** provec -- unit normal N and constant p of a plane, the plane being N . X = p.
 *   pl  in   real(9)  the plane
 *   nv  out  real(3)  N, as eqcarp forms it; (0, 0, 0) for a degenerate plane
 *   p   out  real     q as eqcarp forms it; 0 for a degenerate plane
 * Result 0 (carries no information). State: none. */
ORVQ7_API int32_t provec(const double* pl, double* nv, double* p);

/** xptpl1 -- orthogonal projection of a point onto a plane, with its plane coordinates.
 *   p   in   real(3)  the point
 *   pl  in   real(9)  the plane
 *   pp  out  real(3)  P', as xptpln forms it
 *   uv  out  real(2)  u = prosca(P' - O, U), v = prosca(P' - O, V)
 * Result 0.
 * State: per thread, the normal and constant of the last plane; no later call reads them. */
ORVQ7_API int32_t xptpl1(const double* p, const double* pl, double* pp, double* uv);


/* ==========================================================================================
 * Plane (2D) transformations of elements
 *
 * T is an affine transformation of the plane: 6 reals t1..t6, the linear part (t1, t2, t3,
 * t4) by columns, then the translation (t5, t6); det = t1 t4 - t2 t3. Angles are radians from
 * the x axis; 2 pi is 6.283185307179586. Tolerances are those of the current set (tolerance
 * k is toler(decale(5) + k)), read at every call. None of these routines reports failure
 * or records a traceback frame. Outputs may be the inputs themselves (every input is read
 * before any output is written).
 *
 * Element layouts (reals, in order):
 *   vector        2      (vx, vy)
 *   point         2      (x, y)
 *   angle         1      radians
 *   axis system   6      first direction (2), second direction (2), origin (2)
 *   circle, arc   5      centre (2), radius, start angle, end angle; counter-clockwise
 *                        from start to end
 *   conic         7      shape value e (|e| <= 1 - tolerance 4 for the closed kind, whose
 *                        parameters are angles), centre (2), size, orientation angle, start
 *                        parameter, end parameter
 *   line          6      point Q (2), unit direction D (2), parameters t0, t1 of the ends:
 *                        the segment runs from Q + t0 D to Q + t1 D
 *   curve         1 + 2n the number n of points, then the n points (x, y)
 *   shape         1 + ... the number m of entries, then m entries one after another; an
 *                        entry is a header word, a length L, then L reals holding one
 *                        element of the type the header word gives
 * Counts, lengths and header words stored as reals must be whole numbers (counts and
 * lengths from 0 to 2147483647, header words in the range of int32); anything else (NaN
 * included) is "not a count" below.
 *
 * Header word of an element: bits 0 to 7 hold the type code; bit 8 (0x100) says that a
 * point of type 104 carries its angle; the other bits are not read. Types handled:
 *   80   point          2 reals  tr2pt
 *   81   line           6 reals  tr2ln with its flag preset to 255 (all parts)
 *   82   circle or arc  5 reals  tr2cir
 *   83   axis system    6 reals  tr2axs
 *   85                  8 reals  the eighth real copied unchanged, the first seven as 92
 *   86, 87, 88  conic   7 reals  tr2can
 *   89   curve   1 + 2n reals    tr2crv
 *   90, 95              8 reals  centre (2), angle, size, four reals copied unchanged
 *   92                  7 reals  centre (2), angle 1, size 1, angle 2, size 2, a seventh
 *                                real copied unchanged
 *   102  shape                   tr2sha
 *   104  point with angle  2 or 3 reals  the point by tr2pt; when bit 8 of the header word
 *                                is set, a third real, the angle, by tr2ang
 * Any other code (79, 84, 91, 105, ...) writes nothing.
 * Codes 90, 95, 92, 85: the map is similarity-preserving when |t4 t2 + t1 t3| <= tolerance 5
 * and |((t1^2 - t4^2) + t2^2) - t3^2| <= tolerance 4 (both inclusive). The centre goes by
 * tr2pt; each (angle, size) pair becomes, when det >= 0, (tr2ang(angle), k size), and
 * otherwise (a NaN det included) (tr2ang(pi) - angle, -(k size)), where k size is
 * sqrt(|det|) size for a similarity-preserving map and the size unchanged for any other.
 * ======================================================================================== */

/** tr2vec -- transforms a vector: v'1 = t1 vx + t3 vy, v'2 = t2 vx + t4 vy.
 *   v   in   real(2)
 *   t   in   real(6)  (translation not read)
 *   vp  out  real(2)
 * Result 0. State: none. */
ORVQ7_API int32_t tr2vec(const double* v, const double* t, double* vp);

/** tr2pt -- transforms a point: p'1 = (t1 x + t3 y) + t5, p'2 = (t2 x + t4 y) + t6.
 *   p   in   real(2)
 *   t   in   real(6)
 *   pp  out  real(2)
 * Result 0. State: none. */
ORVQ7_API int32_t tr2pt(const double* p, const double* t, double* pp);

/** tr2ang -- transforms an angle.
 *   a  in  real     the angle
 *   t  in  real(6)
 * Result the angle b = atan2(w2, w1) of w = tr2vec of (cos a, sin a), plus 2 pi when b < 0
 * (strict): in [0, 2 pi] (-0 stays -0; a NaN stays NaN). State: none. */
ORVQ7_API double tr2ang(const double* a, const double* t);

/** tr2axs -- transforms an axis system.
 *   ax   in   real(6)  first direction, second direction, origin
 *   t    in   real(6)
 *   axp  out  real(6)  origin' by tr2pt; each direction w = tr2vec of it, s = sqrt(w1^2 +
 *                      w2^2): w / s when s > tolerance 12 (strict); otherwise that
 *                      direction's two slots are left as they were
 * Result 0. State: none. */
ORVQ7_API int32_t tr2axs(const double* ax, const double* t, double* axp);

/** tr2cir -- transforms a circle or arc.
 *   c   in   real(5)  centre, radius, start, end
 *   t   in   real(6)
 *   cp  out  real(5)  centre' by tr2pt; radius' = sqrt(|det|) radius; sweep = end - start;
 *                     start' = tr2ang(end) when det < 0 (orientation reversed), else
 *                     tr2ang(start); end' = start' + sweep; when start' is not >= 0 (NaN),
 *                     2 pi is added to both; then when |end' - start'| < tolerance 5
 *                     (strict), end' += 2 pi (a zero sweep is a full circle and stays one)
 * Result 0. State: none. */
ORVQ7_API int32_t tr2cir(const double* c, const double* t, double* cp);

/** tr2can -- transforms a conic.
 *   c   in   real(7)  e, centre, size, orientation, start, end
 *   t   in   real(6)
 *   cp  out  real(7)  e copied; centre' by tr2pt; size' = sqrt(|det|) size; orientation' =
 *                     tr2ang(orientation); parameters: copied when det >= 0 (or NaN);
 *                     when det < 0 and |e| > 1 - tolerance 4 (open kinds):
 *                     (start', end') = (-end, -start); when det < 0 and |e| <= 1 - tol 4
 *                     (closed kind): (2 pi - end, 2 pi - start), plus 2 pi to both when
 *                     start' is not > 0
 * Result 0.
 * State: the seven reals are built in per-thread storage and copied out with crccop
 * (56 bytes); no later call reads them. */
ORVQ7_API int32_t tr2can(const double* c, const double* t, double* cp);

/** tr2ln -- transforms a line (segment) element.
 *   l     in      real(6)  Q, D, t0, t1
 *   t     in      real(6)
 *   lp    out     real(6)  the parts written, below; the others are left as they were
 *   flag  in/out  int32    on entry the parts to transform, as bits: 1 the point, 2 the
 *                          direction, 4 the parameters (255: all; higher bits not read);
 *                          on return the bits of the parts written
 * Method, tolerances k read at each call as tol k:
 *   point: Q' = tr2pt(Q).
 *   direction and parameters: w = tr2vec(D), s = sqrt(w1^2 + w2^2). When s <= tol 12 the
 *   direction has collapsed: neither is written and bits 2 and 4 are cleared. Otherwise
 *   D' = w / s, and the parameters are kept exactly when |s - 1| < tol 5 (a map that keeps
 *   lengths along the line) and multiplied by s otherwise; then each parameter with
 *   |t'| < tol 2 becomes 0, and when |t1' - t0'| < tol 3, t1' := t0' (a segment shorter than
 *   tol 3 becomes one point). All comparisons strict except s <= tol 12.
 * Result 0. State: none. */
ORVQ7_API int32_t tr2ln(const double* l, const double* t, double* lp, int32_t* flag);

/** tr2crv -- transforms a curve element, point by point with tr2pt.
 *   c   in   real(1 + 2n)  n, then the points
 *   t   in   real(6)
 *   cp  out  real(1 + 2n)  n copied, then the transformed points; nothing is written when
 *                          n is not a count
 * Result 0. State: none. */
ORVQ7_API int32_t tr2crv(const double* c, const double* t, double* cp);

/** tr2sha -- transforms a shape element, entry by entry.
 *   s   in   real  m, then the entries (header word, L, L reals)
 *   t   in   real(6)
 *   sp  out  real  m and each entry's header word and L copied; each entry's L reals are
 *                  transformed as traele transforms an element with that header word,
 *                  when the type is handled and the element fits in its L reals (a
 *                  curve's 1 + 2n, a shape's own entries); otherwise they are left as they
 *                  were. Shapes nest up to 8 levels below the outermost; a deeper shape is
 *                  left as it was. The walk stops at the first m, header word or L that is
 *                  not a count (nothing written from there on).
 * Result 0. State: none.
 * Precondition: s and sp hold the whole shape, 1 + the sum over entries of (2 + L). */
ORVQ7_API int32_t tr2sha(const double* s, const double* t, double* sp);

/** traele -- transforms one element of the plane, dispatching on its type code.
 *   hdr     in   int32    header word: type code in bits 0-7, flags as above
 *   t       in   real(6)
 *   e       in   real     the element, in the layout of its type
 *   unused  in   any      not read (may be null)
 *   ep      out  real     the transformed element; nothing is written for an unhandled code
 * Result 0. State: through tr2can (types 86 to 88) only. */
ORVQ7_API int32_t traele(const int32_t* hdr, const double* t, const double* e,
                         const void* unused, double* ep);

/** traels -- transforms a list of elements of the plane, as traele does each one.
 *   n    in   int32     number of elements; none is transformed when n < 1
 *   hdr  in   int32(n)  header word of each element
 *   t    in   real(6)
 *   e    in   real(lim) the elements
 *   pos  in   int32(n)  position (from 1) of the first real of element k in e and in ep
 *   lim  in   int32     number of reals in e and in ep
 *   ep   out  real(lim) the transformed elements, at the same positions
 * Element k is transformed only when its type is handled, pos(k) >= 1 and the whole
 * element (a curve's 1 + 2n reals, a shape's entries) lies within reals pos(k)..lim;
 * nothing is written for the others. Elements are taken in order k = 1..n; elements that
 * overlap in ep see each other's writes in that order.
 * Result the number of elements transformed. State: through tr2can only. */
ORVQ7_API int32_t traels(const int32_t* n, const int32_t* hdr, const double* t, const double* e,
                         const int32_t* pos, const int32_t* lim, double* ep);


ORVQ7_END_DECLS

#endif /* ORVQ7_VECTOR_VECTOR_API_H */
