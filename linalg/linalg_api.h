/* linalg/linalg_api.h -- dense linear algebra of small order
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_LINALG_LINALG_API_H
#define ORVQ7_LINALG_LINALG_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Gaussian elimination, tridiagonal solve and vector conditioning
 * ======================================================================================== */

/** ynsega -- solves the dense square system A x = b of order n <= 20 by Gaussian
 * elimination with complete pivoting.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32       order, 1 <= n <= 20
 *   a     in   real(n,n)   the matrix, column-major, leading dimension n
 *   b     in   real(n)     the right-hand side
 *   x     out  real(n)     the solution; x may be the same array as b
 *   ierr  out  int32       status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                                     outputs
 *   0      0       success                                                  x written
 *   4712   1       n < 1                                                    x untouched
 *   4718   1       n > 20 (a is not read)                                   x untouched
 *   4703   1       at an elimination step k < n the largest remaining       x untouched
 *                  magnitude is <= 1e-38, or |last pivot| <= 1e-30
 * Method, in this order of operations:
 *   step k = 1..n-1: pivot = the largest magnitude over rows and columns k..n, rows scanned
 *   in the outer loop and columns in the inner loop, replaced only on a strictly larger
 *   magnitude (ties: lowest row, then lowest column; a NaN element is never taken); rows k
 *   and r exchanged over columns k..n with b(k), b(r); columns k and q over all rows with the
 *   permutation; then for i > k: f = a(i,k) / a(k,k), a(i,j) -= f * a(k,j) (j > k),
 *   b(i) -= f * b(k).
 *   back substitution: x(n) = b(n) / a(n,n); x(i) = (b(i) - s) / a(i,i) with
 *   s = a(i,i+1) x(i+1) + ... + a(i,n) x(n) summed by increasing j; the permutation undone.
 * Traceback: none.  State: none; all work arrays are locals, so calls are reentrant. No
 * workspace is used.
 */
ORVQ7_API int32_t ynsega(const int32_t* n, const double* a, const double* b, double* x,
                         int32_t* ierr);

/** ynsetr -- solves a tridiagonal system by forward elimination without pivoting.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32    order, n >= 1
 *   d     in   real(n)  main diagonal
 *   a     in   real(n)  sub-diagonal: a(i) multiplies x(i-1) in row i; a(1) is not read
 *   c     in   real(n)  super-diagonal: c(i) multiplies x(i+1) in row i; c(n) is not read
 *   r     in   real(n)  right-hand side
 *   x     out  real(n)  the solution; x may be the same array as r (not as d, a or c)
 *   ierr  out  int32    status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                         outputs
 *   0      0       success                                      x written
 *   4712   1       n <= 0                                       x untouched
 *   4703   1       |d(1)| < 1e-15                               x untouched
 *   36     1       n > 20 and the workspace refused n reals     x untouched
 *   4703   1       a later pivot beta(i) has |beta(i)| < 1e-15  x(1..i-1) written
 * Method: beta = d(1), x(1) = r(1) / beta; for i = 2..n: g(i-1) = c(i-1) / beta,
 *   beta = d(i) - a(i) g(i-1), x(i) = (r(i) - a(i) x(i-1)) / beta; then for i = n-1..1:
 *   x(i) -= g(i) x(i+1). No pivoting: a regular system that meets a small pivot fails.
 * Workspace: for n > 20 one block of n reals (type 3) relative to dynar, released on every
 *   path out. Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynsetr(const int32_t* n, const double* d, const double* a, const double* c,
                         const double* r, double* x, int32_t* ierr);

/** yntrzr -- cleans a vector: components found negligible by the rule of `mode` become +0.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32    dimension, n >= 1
 *   v     in   real(n)  the vector
 *   tol   in   real     the tolerance of the rule
 *   mode  in   int32    0 absolute: w(i) = 0 where |v(i)| <= tol
 *                       2 relative: w(i) = 0 where |v(i)| <= tol * max|v| (a NaN is never
 *                         the maximum)
 *                       1 gap rule: order the indices by decreasing |v| (stable: ties keep
 *                         index order); s = the first position, from 2, where
 *                         |v(previous)| * tol > |v(current)| (strict); the components at
 *                         positions s and after become 0, the others are copied
 *   w     out  real(n)  the cleaned vector; other components equal v; w may be v
 *   ierr  out  int32    status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                                  outputs
 *   0      0       success                                               w written
 *   4712   1       n < 1                                                 w untouched
 *   4718   1       mode not 0, 1 or 2                                    w untouched
 *   36     1       mode 1, n > 100 and the workspace refused n integers  w untouched
 * Workspace: mode 1 with n > 100 takes one block of n integers (type 2) relative to dynar,
 *   released on every path out. Traceback: none.  State: none.
 */
ORVQ7_API int32_t yntrzr(const int32_t* n, const double* v, const double* tol,
                         const int32_t* mode, double* w, int32_t* ierr);

/** yntrnr -- normalises a vector by one of three norms.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32    dimension, n >= 1
 *   v     in   real(n)  the vector
 *   mode  in   int32    0: max |v(i)| (a NaN is never the maximum); 1: sum of |v(i)|;
 *                       2: sqrt of the plain sum of v(i)^2 (no scaling); sums by
 *                       increasing index
 *   w     out  real(n)  w(i) = v(i) / norm; w may be v
 *   norm  out  real     the norm
 *   ierr  out  int32    status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                      outputs
 *   0      0       success                   norm, w written
 *   4712   1       n < 1                     norm, w untouched
 *   4718   1       mode not 0, 1 or 2        norm = 0, w untouched
 *   4710   1       the norm is exactly 0     norm = 0, w untouched
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t yntrnr(const int32_t* n, const double* v, const int32_t* mode, double* w,
                         double* norm, int32_t* ierr);

/* ==========================================================================================
 * Matrix inversion and determinant
 * ======================================================================================== */

/** ynmimr -- inverse of a square matrix of order n <= 20 (Gauss-Jordan exchange steps with
 * complete pivoting).
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32      order, n >= 1 (n <= 20 from order 3 on)
 *   a     in   real(n,n)  the matrix, column-major, leading dimension n
 *   b     out  real(n,n)  the inverse; b may be the same array as a (not a partial overlap)
 *   ierr  out  int32      status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                             outputs
 *   0      0       success                                          b written
 *   4712   1       n < 1                                            b untouched
 *   4703   1       n = 1 and |a| < 1e-15                            b untouched
 *   4703   1       n = 2 and |a11 a22 - a21 a12| < 1e-30            b untouched
 *   4718   1       n > 20 (only reached for n >= 3)                 b untouched
 *   4703   1       n >= 3 and the largest remaining magnitude at    b partly transformed
 *                  some step is < 1e-15
 * Method: n = 1: b = 1/a. n = 2: det = a11 a22 - a21 a12; b11 = a22/det, b21 = -a21/det,
 *   b12 = -a12/det, b22 = a11/det. n >= 3: a is copied to b; at step k = 1..n the pivot is
 *   the largest magnitude over rows and columns k..n, rows scanned in the outer loop and
 *   columns in the inner loop, replaced only on a strictly larger magnitude (the first
 *   maximum in that order wins; a NaN is never taken); whole rows k, r and whole columns
 *   k, q are exchanged; then with p the pivot: b(i,j) = b(i,j) - (b(i,k) b(k,j)) / p for
 *   i != k, j != k; b(k,j) = b(k,j) / p; b(i,k) = -b(i,k) / p; b(k,k) = 1 / p. Finally the
 *   interchanges are undone from k = n down to 1, a row exchange as a column exchange and
 *   a column exchange as a row exchange.
 * Traceback: none.  State: none; work arrays are locals.
 */
ORVQ7_API int32_t ynmimr(const int32_t* n, const double* a, double* b, int32_t* ierr);

/** ynmxmr -- determinant of a square matrix of order n <= 20.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32      order, 1 <= n <= 20
 *   a     in   real(n,n)  the matrix, column-major, leading dimension n
 *   det   out  real       the determinant
 *   ierr  out  int32      status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when          outputs
 *   0      0       success       det written (a singular matrix gives 0: not an error)
 *   4712   1       n < 1         det untouched
 *   4718   1       n > 20        det untouched
 * Method: n = 1: a11. n = 2: a11 a22 - a21 a12. n = 3: expansion along the first row,
 *   (a11 (a22 a33 - a23 a32) - a12 (a21 a33 - a23 a31)) + a13 (a21 a32 - a22 a31).
 *   4 <= n <= 20: elimination on a local copy; at step k the pivot is the largest magnitude
 *   over rows and columns k..n, columns scanned in the outer loop and rows in the inner
 *   loop, starting from a candidate of -1 (the element (k,k) is taken first unless it is a
 *   NaN) and replaced only on a strictly larger magnitude; an exactly zero pivot gives
 *   det = 0 at once; a row and a column exchange each count one interchange; for i > k:
 *   f = a(i,k) / p, new = a(i,j) - f a(k,j) for j > k, set to exactly 0 when
 *   |a(i,j)| * 1e-12 > |new| (strict); det = det * p from det = 1; an odd count of
 *   interchanges negates det. No singularity threshold.
 * Traceback: none.  State: none; work arrays are locals.
 */
ORVQ7_API int32_t ynmxmr(const int32_t* n, const double* a, double* det, int32_t* ierr);

/* ==========================================================================================
 * Matrix and vector products, transpose and bound widening
 * ======================================================================================== */

/** ynmpmm -- matrix product P = A B.
 * Arguments (all by reference; "in" arguments are never written)
 *   m, k, n  in   int32      sizes, each >= 1
 *   a        in   real(m,k)  leading dimension m
 *   b        in   real(k,n)  leading dimension k
 *   p        out  real(m,n)  leading dimension m; must not overlap a or b
 *   ierr     out  int32      0, or 4712 when m, k or n is below 1 (p untouched)
 * Result 0 success, 1 failure. Each P(i,j) = A(i,1) B(1,j) + A(i,2) B(2,j) + ... + A(i,k) B(k,j),
 *   accumulated left to right.
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynmpmm(const int32_t* m, const int32_t* k, const int32_t* n, const double* a,
                         const double* b, double* p, int32_t* ierr);

/** ynmpmv -- matrix-vector product y = A x.
 * Arguments (all by reference; "in" arguments are never written)
 *   m, n  in   int32      sizes, each >= 1
 *   a     in   real(m,n)  leading dimension m
 *   x     in   real(n)
 *   y     out  real(m)    must not overlap a or x
 *   ierr  out  int32      0, or 4712 when m or n is below 1 (y untouched)
 * Result 0 success, 1 failure. y(i) = A(i,1) x(1) + ... + A(i,n) x(n), left to right.
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynmpmv(const int32_t* m, const int32_t* n, const double* a, const double* x,
                         double* y, int32_t* ierr);

/** ynmrmm -- transpose: B(j,i) = A(i,j).
 * Arguments (all by reference; "in" arguments are never written)
 *   m, n  in   int32      sizes, each >= 1
 *   a     in   real(m,n)  leading dimension m
 *   b     out  real(n,m)  leading dimension n; must not overlap a
 *   ierr  out  int32      0, or 4712 when m or n is below 1 (b untouched)
 * Result 0 success, 1 failure.  Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynmrmm(const int32_t* m, const int32_t* n, const double* a, double* b,
                         int32_t* ierr);

/** ynmtvv -- widens a pair of bound vectors by margins and checks that no pair crosses.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32    dimension, n >= 1
 *   x     in   real(2n) the n lower bounds, then the n upper bounds
 *   d     in   real(n)  margins; negative margins shrink the bounds
 *   y     out  real(2n) y(i) = x(i) - d(i), y(n+i) = x(n+i) + d(i); y may be x
 *   ierr  out  int32    status code, below
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                   outputs
 *   0      0       success (equal bounds are accepted)    y written
 *   4712   1       n < 1                                  y untouched
 *   4712   1       for the first i in increasing order,   y(1..i) and y(n+1..n+i) written,
 *                  y(i) > y(n+i) (strict)                 later components untouched
 * A NaN bound never counts as crossing.  Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynmtvv(const int32_t* n, const double* x, const double* d, double* y,
                         int32_t* ierr);

/** ynvpvv -- scalar product s = u(1) v(1) + ... + u(n) v(n), added left to right from the
 * first term (a single term -0 stays -0).
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32    dimension, n >= 1
 *   u, v  in   real(n)
 *   s     out  real     the product
 *   ierr  out  int32    0, or 4712 when n < 1 (s untouched)
 * Result 0 success, 1 failure.  Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynvpvv(const int32_t* n, const double* u, const double* v, double* s,
                         int32_t* ierr);

/** ynvevv -- exterior (wedge) product of two vectors.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32           dimension, n >= 2
 *   u, v  in   real(n)
 *   w     out  real(n(n-1)/2)  u(i) v(j) - u(j) v(i) for the pairs i < j in lexicographic
 *                              order (1,2), (1,3), ..., (1,n), (2,3), ..., (n-1,n); for n = 3
 *                              this is not the cross product (order and middle sign differ);
 *                              must not overlap u or v
 *   ierr  out  int32           0, or 4712 when n < 2 (w untouched)
 * Result 0 success, 1 failure.  Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynvevv(const int32_t* n, const double* u, const double* v, double* w,
                         int32_t* ierr);

/** ynvvvv -- generalised vector product: the vector orthogonal to the n-1 columns of A.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32         dimension, n >= 2
 *   a     in   real(n,n-1)   the n-1 vectors as columns, leading dimension n
 *   w     out  real(n)       not normalised: its length is the (n-1)-volume of the columns,
 *                            zero when they are dependent; must not overlap a
 *   ierr  out  int32         status code, below
 * Method: n = 2: w = (-a21, a11), the column turned a quarter turn counter-clockwise, so
 *   w . x = det[a x]. n = 3: the cross product (a2 b3 - a3 b2, a3 b1 - a1 b3, a1 b2 - a2 b1).
 *   n >= 4: w(i) = (-1)^(i+1) det(A without row i), so w . x = det[x a(1) ... a(n-1)] (for
 *   n = 2 the rule above has the opposite sign, on purpose). n = 4: each minor expanded along
 *   its first row as in ynmxmr of order 3. 5 <= n <= 21: each minor's determinant by ynmxmr,
 *   in a local square up to n = 10 and in a workspace block of (n-1)^2 reals (type 3,
 *   relative to dynar, released on every path out) from n = 11.
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                                               outputs
 *   0      0       success                                            w written
 *   4712   1       n < 2                                              w untouched
 *   4718   1       n > 21 (the minors exceed ynmxmr's capacity;       w untouched
 *                  decided at once, no workspace is asked for)
 *   36     1       n >= 11 and the workspace refused the block        w untouched
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynvvvv(const int32_t* n, const double* a, double* w, int32_t* ierr);

/* ==========================================================================================
 * Classification of linear maps
 *
 * Matrices are n-by-n, by columns, leading dimension n. Every comparison uses the fixed
 * absolute tolerance 1e-12. "Within 1e-12" and "at most 1e-12" are inclusive; a NaN fails
 * no "greater than" test, so a NaN element passes the tests stated that way.
 * Kind codes (hexadecimal digits: lowest = level + 1, next = 0, then the class chosen at
 * level 1, level 2, ... from the lower digits up):
 *   level 1  0x102 regular map               0x202 singular map
 *   level 2  0x1103 isometry (orthogonal)    0x2103 similarity     0x3103 affinity
 *            0x1203 zero map                 0x2203 projector
 *   level 3  0x11104 rotation (det > 0)      0x21104 improper isometry (det < 0)
 *            0x12104 homothety (multiple of the identity)
 *   level 4  0x111105 identity
 * None of these routines records a traceback frame.
 * ======================================================================================== */

/** ynmnmr -- the narrowest accepted kind of a 2-by-2 or 3-by-3 linear map.
 *   n      in   int32      order, 2 or 3
 *   a      in   real(n,n)  the matrix
 *   m      in   int32      number of accepted codes (none searched when m < 1)
 *   codes  in   int32(m)   the accepted kind codes
 *   index  out  int32      position (from 1) in codes of the answer; 0 when none matches
 *   ierr   out  int32      status code, below
 * Method: D = a11 a22 - a21 a12 (n = 2), or ((a21 a32 - a31 a22) a13 + (a22 a33 - a32 a23)
 * a11) + (a31 a23 - a21 a33) a12 (n = 3).
 *   |D| < 1e-12: level 1 = 0x202; wnmnm3 flag 1 gives level 2 = 0x1203, flag 2 0x2203.
 *   Otherwise level 1 = 0x102, and when ||D| - 1| < 1e-12: orthonormal (wnmnm2) gives
 *   level 2 = 0x1103 and, if D >= 0, level 3 = 0x11104 plus level 4 = 0x111105 when wnmnm1
 *   gives flag 1, or, if D < 0, level 3 = 0x21104; not orthonormal, wnmnm4 flag 1 gives
 *   level 2 = 0x3103. When ||D| - 1| is not < 1e-12 (NaN included): wnmnm1 flag 1 gives
 *   levels 2-4 = 0x1103, 0x11104, 0x111105; flag 2 gives 0x2103, 0x12104; flag 0: the
 *   matrix scaled by 1/sqrt(|D|) (n = 2) or pow(|D|, -1/3) (n = 3) orthonormal gives
 *   0x2103, else wnmnm4 flag 1 on the unscaled matrix gives 0x3103.
 *   Answer: level 4, then 3, 2, 1; the first j in 1..m with codes(j) equal to that level's
 *   word. A level not reached has the word 0, which matches an accepted code 0.
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                      outputs
 *   0      0       success                   index written (0 when nothing matches)
 *   4712   1       n is not 2 or 3           index untouched
 *   4712   1       a test of wnmnm1..4 failed (cannot happen for n = 2, 3); index 0
 * Traceback: none.
 * State: per thread, the four level words, D and the scaled matrix of the last call; no
 * call's answer depends on an earlier call. */
ORVQ7_API int32_t ynmnmr(const int32_t* n, const double* a, const int32_t* m,
                         const int32_t* codes, int32_t* index, int32_t* ierr);

/** wnmnm1 -- is the matrix a multiple of the identity?
 *   n     in   int32      order, 2 <= n <= 20
 *   a     in   real(n,n)  the matrix
 *   flag  out  int32      0 not a multiple of the identity; 1 the identity; 2 another
 *                         multiple of it
 *   ierr  out  int32      status code, below
 * Method: for j = 1..n-1 in order, |A(j,j) - A(j+1,j+1)| > 1e-12 or any of the n elements
 * stored between those two diagonal positions of magnitude > 1e-12 gives flag 0. All pass:
 * flag 1 when |A(1,1) - 1| < 1e-12 (strict), else 2.
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when                 outputs
 *   0      0       success              flag written
 *   4712   1       n < 2 or n > 20      flag untouched
 * Traceback: none.  State: none. */
ORVQ7_API int32_t wnmnm1(const int32_t* n, const double* a, int32_t* flag, int32_t* ierr);

/** wnmnm2 -- are the columns of the matrix orthonormal?
 *   n     in   int32      order, 2 <= n <= 20
 *   a     in   real(n,n)  the matrix
 *   flag  out  int32      1 orthonormal, else 0
 *   ierr  out  int32      status code as for wnmnm1
 * Method: for each pair of columns (i, j), j >= i, in column order (j = 1..n, then
 * i = 1..j): d = column i . column j (summed by increasing row), minus 1 when i = j;
 * |d| > 1e-12 gives flag 0 at once. All pass: flag 1.
 * Result and codes as for wnmnm1.  Traceback: none.  State: none. */
ORVQ7_API int32_t wnmnm2(const int32_t* n, const double* a, int32_t* flag, int32_t* ierr);

/** wnmnm3 -- is the matrix the zero map or a projector?
 *   n     in   int32      order, 2 <= n <= 20
 *   a     in   real(n,n)  the matrix
 *   flag  out  int32      1 every element at most 1e-12 in magnitude (zero map); 2 A A
 *                         equals A within 1e-12 element by element (projector); else 0
 *   ierr  out  int32      status code as for wnmnm1
 * Method: A A is formed by fmat23.
 * Result and codes as for wnmnm1.  Traceback: none.
 * State: per thread, the product A A of the last call that formed it; no later call reads
 * it. */
ORVQ7_API int32_t wnmnm3(const int32_t* n, const double* a, int32_t* flag, int32_t* ierr);

/** wnmnm4 -- is the matrix an affinity A = l I + (1 - l) P, P a projector, l not 0 or 1?
 *   n     in   int32      order, 2 <= n <= 20
 *   a     in   real(n,n)  the matrix
 *   flag  out  int32      1 an affinity, else 0
 *   ierr  out  int32      status code as for wnmnm1
 * Method: B = A - I; Q = A B by fmat23. l = 0; for each element in storage order with
 * |B(i,j)| > 1e-12: r = Q(i,j) / B(i,j); while l is exactly 0, l := r (so a ratio of
 * exactly 0 never fixes l), otherwise |r - l| > 1e-12 gives flag 0. Then |l| < 1e-12 or
 * |1 - l| < 1e-12 gives flag 0; otherwise P = (A - l I) / (1 - l) element by element, and
 * flag 1 when wnmnm3 gives P flag 2, else 0.
 * Result and codes as for wnmnm1.  Traceback: none.
 * State: per thread, B, Q and P of the last call; no later call reads them. */
ORVQ7_API int32_t wnmnm4(const int32_t* n, const double* a, int32_t* flag, int32_t* ierr);


/* ==========================================================================================
 * Local quadratic models
 * ======================================================================================== */

/** ynxxlv -- quadratic model of a vector over 0 <= s <= 1 from its value and derivative at
 * s = 0 and its value at s = 1, and the smallest and largest value of each component.
 * Arguments (all by reference; "in" arguments are never written)
 *   n     in   int32      number of components, n >= 1
 *   a     in   real(n)    value at s = 0
 *   d     in   real(n)    derivative at s = 0
 *   b     in   real(n)    value at s = 1
 *   e     out  real(n)    second-order coefficients e = (b - a) - d, so that the model is
 *                         q(s) = a + s (d + e s), evaluated in that grouping
 *   ext   out  real(n,2)  column 1 the smallest, column 2 the largest value of each
 *                         component over 0 <= s <= 1
 *   sext  out  real(n,2)  the parameters s where those values are taken
 *   ierr  out  int32      status code, below
 * Candidates of component i, in increasing s: 0 with the value a(i); the stationary point
 * s = -d(i) / (2 e(i)) when e(i) is not 0 and 0 < s < 1 (strict), with the value q(s); 1 with
 * the value b(i) itself. A later candidate replaces the extreme only when strictly beyond it,
 * so ties keep the smaller parameter; a value that is not a number never replaces one.
 * No output may overlap an input.
 * Result  0 success, 1 failure (the code is in ierr)
 *   ierr   result  when     outputs
 *   0      0       success  e, ext, sext written
 *   4712   1       n < 1    untouched
 * Traceback: none.  State: none.
 */
ORVQ7_API int32_t ynxxlv(const int32_t* n, const double* a, const double* d, const double* b,
                         double* e, double* ext, double* sext, int32_t* ierr);

ORVQ7_END_DECLS

#endif /* ORVQ7_LINALG_LINALG_API_H */
