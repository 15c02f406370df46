/* tests/fortran/fixture.h -- declarations in every form the Fortran generator meets in the
 * public headers; fixture.c implements them and fixture_test.f90 calls them through the
 * generated module, so a wrong mapping shows up as a wrong value or a failed build. */
#ifndef ORVQ7_TESTS_FORTRAN_FIXTURE_H
#define ORVQ7_TESTS_FORTRAN_FIXTURE_H

#include <stdint.h>

#define ORVQ7_FIX_API __attribute__((visibility("default")))
#define ORVQ7FIX_LIMIT 7

#ifdef __cplusplus
extern "C" {
#endif

enum Orvq7FixCode { ORVQ7FIX_OK = 0, ORVQ7FIX_BAD = 4712 };
typedef enum Orvq7FixMode { Orvq7FixFirst = 1, Orvq7FixSecond = 2 } Orvq7FixMode;
typedef int32_t (*Orvq7FixEval)(const double* x, double* f);

/** fxsum -- sum of v(1..n) into total; a count n < 1 fails with 4712.
 *   n      in   int32    count
 *   v      in   real(n)  the values
 *   total  out  real     their sum (untouched on failure)
 *   ierr   out  int32    0 or 4712
 * Result 0 or 1. */
ORVQ7_FIX_API int32_t fxsum(const int32_t* n, const double* v,
                            double* total,
                            int32_t* ierr);

/** fxmean -- mean of v(1..n); fails as fxsum does.
 *   n, v  as for fxsum;  mean  out  real
 *   ierr  out  int32 */
ORVQ7_FIX_API int32_t fxmean(const int32_t* n, const double* v, double* mean, int32_t* ierr);

/** fxaxpy -- y = a x + y on 3 components.
 *   a     in      real
 *   x, y  in/out  real(3)  x is read only; y is written */
ORVQ7_FIX_API void fxaxpy(const double* a, const double* x, double* y);
ORVQ7_FIX_API void fxaxpz(const double* a, const double* x, double* y);

/** fxtab -- adds k to every element of the (rows, cols) table t.
 *   t     in/out  int32(rows, cols)  the table
 *   rows  in      int32
 *   cols  in      int32
 *   k     in      int64    the table gains k mod 100; the result is rows * cols * k */
ORVQ7_FIX_API int64_t fxtab(int32_t* t, const int32_t* rows, const int32_t* cols,
                            const int64_t* k);

/* No block: every pointer argument is taken as a scalar. */
ORVQ7_FIX_API int32_t fxswap(int32_t* i, int32_t* j);

/** fxname -- records `name` (len bytes, blanks kept) and gives back its length plus mode.
 * Result len + mode; the copy is read with fxlast(). */
ORVQ7_FIX_API int32_t fxname(const char* name, int32_t mode_count, Orvq7FixMode mode, int len);

/** fxlast -- the last name recorded, zero-terminated. */
ORVQ7_FIX_API const char* fxlast(void);

/** fxfill -- writes value into count bytes at area (an address from c_loc). */
ORVQ7_FIX_API int32_t fxfill(void* area, const int32_t* count, double value);

/** fxcall -- calls f at x and gives f's result, then calls g (a typed callback) at y.
 *   x   in   real(2)
 *   fx  out  real
 *   y   in   real
 *   gy  out  real */
ORVQ7_FIX_API int32_t fxcall(int32_t (*f)(const double* x, double* fx), const double* x,
                             double* fx, Orvq7FixEval g, const double* y, double* gy);

struct Orvq7FixRecord;
/** fxhdr -- h(1) + h(2) + the record's count (an opaque record, passed by its address).
 *   h    in  int16(2)
 *   rec  in  record */
ORVQ7_FIX_API int32_t fxhdr(const int16_t* h, const struct Orvq7FixRecord* rec);

/** fxclear -- forgets the last name. */
ORVQ7_FIX_API void fxclear(void);

#ifdef __cplusplus
}
#endif

#endif /* ORVQ7_TESTS_FORTRAN_FIXTURE_H */
