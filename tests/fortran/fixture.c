/* tests/fortran/fixture.c -- C side of the Fortran interface test (see fixture.h). */
#include "fixture.h"

#include <string.h>

static char s_last[64];

int32_t fxsum(const int32_t* n, const double* v, double* total, int32_t* ierr) {
  if (*n < 1) {
    *ierr = ORVQ7FIX_BAD;
    return 1;
  }
  double s = 0.0;
  for (int32_t i = 0; i < *n; ++i) s += v[i];
  *total = s;
  *ierr = 0;
  return 0;
}

int32_t fxmean(const int32_t* n, const double* v, double* mean, int32_t* ierr) {
  double total = 0.0;
  if (fxsum(n, v, &total, ierr) == 1) return 1;
  *mean = total / *n;
  return 0;
}

void fxaxpy(const double* a, const double* x, double* y) {
  for (int i = 0; i < 3; ++i) y[i] = *a * x[i] + y[i];
}

void fxaxpz(const double* a, const double* x, double* y) {
  for (int i = 0; i < 3; ++i) y[i] = *a * x[i] - y[i];
}

int64_t fxtab(int32_t* t, const int32_t* rows, const int32_t* cols, const int64_t* k) {
  for (int32_t j = 0; j < *cols; ++j)
    for (int32_t i = 0; i < *rows; ++i) t[i + j * *rows] += (int32_t)(*k % 100);
  return (int64_t)*rows * *cols * *k;
}

int32_t fxswap(int32_t* i, int32_t* j) {
  const int32_t t = *i;
  *i = *j;
  *j = t;
  return *i - *j;
}

int32_t fxname(const char* name, int32_t mode_count, Orvq7FixMode mode, int len) {
  const int n = len < 0 ? 0 : (len > 63 ? 63 : len);
  memcpy(s_last, name, (size_t)n);
  s_last[n] = '\0';
  return len + (int32_t)mode * mode_count;
}

const char* fxlast(void) { return s_last; }

int32_t fxfill(void* area, const int32_t* count, double value) {
  double* d = (double*)area;
  for (int32_t i = 0; i < *count; ++i) d[i] = value;
  return *count;
}

int32_t fxcall(int32_t (*f)(const double* x, double* fx), const double* x, double* fx,
               Orvq7FixEval g, const double* y, double* gy) {
  const int32_t r = f(x, fx);
  return r + 10 * g(y, gy);
}

struct Orvq7FixRecord {
  int32_t count;
};

int32_t fxhdr(const int16_t* h, const struct Orvq7FixRecord* rec) {
  return h[0] + h[1] + rec->count;
}

void fxclear(void) { s_last[0] = '\0'; }
