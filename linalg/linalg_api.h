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

/* ==========================================================================================
 * Matrix inversion and determinant
 * ======================================================================================== */

/* ==========================================================================================
 * Matrix and vector products, transpose and bound widening
 * ======================================================================================== */

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

ORVQ7_END_DECLS

#endif /* ORVQ7_LINALG_LINALG_API_H */
