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

/* ==========================================================================================
 * Matrix and vector products, transpose and bound widening
 * ======================================================================================== */

/* ==========================================================================================
 * Classification of linear maps
 * ======================================================================================== */

/* ==========================================================================================
 * Local quadratic models
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_LINALG_LINALG_API_H */
