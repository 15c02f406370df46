// vector/matrix3.cpp -- affine transformations of space and of the plane: apply, compose,
// invert (fmat6, fmat61, fmat8, fmat81, fmat3, fmat4, fmat2, fmat1, inmat3, inmat2) and the
// general small product fmat23.
// Transformation of space: 12 reals, linear part M by columns (M(i, j) at i + 3(j - 1), from
// 1), then the translation T. Of the plane: 6 reals (m11, m21, m12, m22, t1, t2). Every input
// is read into locals before an output is written, so outputs may share storage with inputs.
#include <cmath>
#include <cstdint>

#include "frame/services.h"
#include "vector/vector_api.h"

namespace {

constexpr double kSingular3 = 1e-9;  // inmat3: |det| below it (strict) is singular
constexpr double kSingular2 = 1e-6;  // inmat2: a thousand times that of inmat3, on purpose
constexpr std::int32_t kPlaneBytes = 48;  // the six reals of a plane transformation

// ---- State of fmat3 kept between calls, one copy per thread ----
//   inverse  the last inverse, built here and copied out; no later call reads it
struct Fmat3State {
  double inverse[12] = {};
};
thread_local Fmat3State s_fmat3;

// ---- State of fmat1 kept between calls, one copy per thread ----
//   work     the transformation handed to inmat3: the 3-by-3 matrix, zero translation
//   inverse  inmat3's output; a singular call leaves it as the last regular call wrote it,
//            and fmat1 then copies that out (zeros before any regular call on this thread)
struct Fmat1State {
  double work[12] = {};
  double inverse[12] = {};
};
thread_local Fmat1State s_fmat1;

// ---- State of inmat3 kept between calls, one copy per thread ----
//   inverse  the last inverse, built here and copied out; no later call reads it
struct Inmat3State {
  double inverse[12] = {};
};
thread_local Inmat3State s_inmat3;

// ---- State of inmat2 kept between calls, one copy per thread ----
//   inverse  the last inverse, built here and copied out with crccop; no later call reads it
struct Inmat2State {
  double inverse[6] = {};
};
thread_local Inmat2State s_inmat2;

// Element (i, j) of the linear part, from 1.
inline double linear_at(const double* a, int i, int j) { return a[(i - 1) + 3 * (j - 1)]; }

// M v, row by row: ((m(i,1) v1 + m(i,2) v2) + m(i,3) v3).
inline void apply_linear(const double* a, const double v[3], double out[3]) {
  for (int i = 1; i <= 3; ++i) {
    out[i - 1] = linear_at(a, i, 1) * v[0] + linear_at(a, i, 2) * v[1] + linear_at(a, i, 3) * v[2];
  }
}

// M^T v: column i of M dotted with v, ((m(1,i) v1 + m(2,i) v2) + m(3,i) v3).
inline void apply_transposed(const double* a, const double v[3], double out[3]) {
  for (int i = 1; i <= 3; ++i) {
    out[i - 1] = linear_at(a, 1, i) * v[0] + linear_at(a, 2, i) * v[1] + linear_at(a, 3, i) * v[2];
  }
}

inline void write_xyz(const double v[3], double* x, double* y, double* z) {
  *x = v[0];
  *y = v[1];
  *z = v[2];
}

}  // namespace

extern "C" {

std::int32_t fmat6(const double* x, const double* y, const double* z, const double* a,
                   double* xp, double* yp, double* zp) {
  const double v[3] = {*x, *y, *z};
  double w[3];
  apply_linear(a, v, w);
  // The translation is added last: ((m(i,1) x + m(i,2) y) + m(i,3) z) + t(i).
  for (int i = 0; i < 3; ++i) w[i] = w[i] + a[9 + i];
  write_xyz(w, xp, yp, zp);
  return 0;
}

std::int32_t fmat61(const double* x, const double* y, const double* z, const double* a,
                    double* xp, double* yp, double* zp) {
  const double v[3] = {*x, *y, *z};
  double w[3];
  apply_linear(a, v, w);
  write_xyz(w, xp, yp, zp);
  return 0;
}

std::int32_t fmat8(const double* x, const double* y, const double* z, const double* a,
                   double* xp, double* yp, double* zp) {
  // (1) d = p - T, then (2) M^T d.
  const double d[3] = {*x - a[9], *y - a[10], *z - a[11]};
  double w[3];
  apply_transposed(a, d, w);
  write_xyz(w, xp, yp, zp);
  return 0;
}

std::int32_t fmat81(const double* x, const double* y, const double* z, const double* a,
                    double* xp, double* yp, double* zp) {
  const double v[3] = {*x, *y, *z};
  double w[3];
  apply_transposed(a, v, w);
  write_xyz(w, xp, yp, zp);
  return 0;
}

std::int32_t fmat3(const double* a, double* b) {
  double* r = s_fmat3.inverse;
  // (1) Linear part M^T.
  for (int i = 1; i <= 3; ++i) {
    for (int j = 1; j <= 3; ++j) r[(i - 1) + 3 * (j - 1)] = linear_at(a, j, i);
  }
  // (2) Translation -(M^T T): the product first, then its negation.
  const double t[3] = {a[9], a[10], a[11]};
  double mt[3];
  apply_transposed(a, t, mt);
  for (int i = 0; i < 3; ++i) r[9 + i] = -mt[i];
  // (3) Copied out of this thread's storage.
  for (int k = 0; k < 12; ++k) b[k] = r[k];
  return 0;
}

std::int32_t fmat4(const double* a, const double* b, double* r) {
  double out[12];
  // (1) Linear part M_B M_A, element by element, k = 1..3 in order.
  for (int j = 1; j <= 3; ++j) {
    for (int i = 1; i <= 3; ++i) {
      out[(i - 1) + 3 * (j - 1)] =
          linear_at(b, i, 1) * linear_at(a, 1, j) + linear_at(b, i, 2) * linear_at(a, 2, j) + linear_at(b, i, 3) * linear_at(a, 3, j);
    }
  }
  // (2) Translation M_B T_A + T_B, as fmat6 maps the point T_A.
  const double ta[3] = {a[9], a[10], a[11]};
  double w[3];
  apply_linear(b, ta, w);
  for (int i = 0; i < 3; ++i) out[9 + i] = w[i] + b[9 + i];
  for (int k = 0; k < 12; ++k) r[k] = out[k];
  return 0;
}

std::int32_t fmat2(const double* a, const double* b, double* r) {
  const double r1 = b[0] * a[0] + b[2] * a[1];
  const double r2 = b[1] * a[0] + b[3] * a[1];
  const double r3 = b[0] * a[2] + b[2] * a[3];
  const double r4 = b[1] * a[2] + b[3] * a[3];
  const double r5 = (b[0] * a[4] + b[2] * a[5]) + b[4];
  const double r6 = (b[1] * a[4] + b[3] * a[5]) + b[5];
  r[0] = r1;
  r[1] = r2;
  r[2] = r3;
  r[3] = r4;
  r[4] = r5;
  r[5] = r6;
  return 0;
}

std::int32_t fmat1(const double* a, double* b, std::int32_t* flag) {
  // (1) The matrix with a zero translation, in this thread's storage.
  Fmat1State& s = s_fmat1;
  for (int k = 0; k < 9; ++k) s.work[k] = a[k];
  s.work[9] = 0.0;
  s.work[10] = 0.0;
  s.work[11] = 0.0;
  // (2) inmat3 leaves s.inverse untouched when singular: the last regular inverse stays.
  std::int32_t f = 0;
  inmat3(s.work, s.inverse, &f);
  // (3) The linear part goes out on both flags.
  for (int k = 0; k < 9; ++k) b[k] = s.inverse[k];
  *flag = f;
  return 0;
}

std::int32_t inmat3(const double* a, double* b, std::int32_t* flag) {
  // (1) Cofactors, indices taken cyclically: C(i, j) = m(i+1, j+1) m(i+2, j+2)
  //     - m(i+2, j+1) m(i+1, j+2); C(1, 1) = m22 m33 - m32 m23.
  auto m = [a](int i, int j) { return linear_at(a, (i - 1) % 3 + 1, (j - 1) % 3 + 1); };
  double c[3][3];
  for (int i = 1; i <= 3; ++i) {
    for (int j = 1; j <= 3; ++j) {
      c[i - 1][j - 1] = m(i + 1, j + 1) * m(i + 2, j + 2) - m(i + 2, j + 1) * m(i + 1, j + 2);
    }
  }
  // (2) Expansion along the first row, in order.
  const double det = linear_at(a, 1, 1) * c[0][0] + linear_at(a, 1, 2) * c[0][1] + linear_at(a, 1, 3) * c[0][2];
  // (3) Strict: |det| = 1e-9 inverts. A NaN det fails the comparison and goes on.
  if (std::fabs(det) < kSingular3) {
    *flag = 1;
    return 0;
  }
  // (4) The adjugate times 1/det, the reciprocal formed once.
  double* r = s_inmat3.inverse;
  const double rdet = 1.0 / det;
  for (int i = 1; i <= 3; ++i) {
    for (int j = 1; j <= 3; ++j) r[(i - 1) + 3 * (j - 1)] = c[j - 1][i - 1] * rdet;
  }
  // (5) Translation: the inverse's linear part applied to -T.
  const double mt[3] = {-a[9], -a[10], -a[11]};
  double w[3];
  apply_linear(r, mt, w);
  r[9] = w[0];
  r[10] = w[1];
  r[11] = w[2];
  // (6) Copied out of this thread's storage.
  for (int k = 0; k < 12; ++k) b[k] = r[k];
  *flag = 0;
  return 0;
}

std::int32_t inmat2(const double* a, double* b, std::int32_t* flag) {
  // (1) Determinant.
  const double det = a[0] * a[3] - a[1] * a[2];
  // (2) Strict; a NaN det fails the comparison and goes on.
  if (std::fabs(det) < kSingular2) {
    *flag = 1;
    return 0;
  }
  // (3) With r = 1/det.
  const double r = 1.0 / det;
  double* v = s_inmat2.inverse;
  const double b5 = (a[2] * a[5] - a[3] * a[4]) * r;
  const double b6 = (a[1] * a[4] - a[0] * a[5]) * r;
  v[0] = a[3] * r;
  v[1] = -a[1] * r;
  v[2] = -a[2] * r;
  v[3] = a[0] * r;
  v[4] = b5;
  v[5] = b6;
  // (4) Copied out with the copy service.
  crccop(v, &kPlaneBytes, b);
  *flag = 0;
  return 0;
}

std::int32_t fmat23(const std::int32_t* n, const std::int32_t* m, const std::int32_t* p,
                    const double* a, const double* b, double* r) {
  const std::int64_t nn = *n, mm = *m, pp = *p;
  if (nn < 1 || mm < 1 || pp < 1) return 0;
  // Column by column of r, four rows at a time held in registers: each r(i, j) starts from
  // a(i, 1) b(1, j) and adds a(i, k) b(k, j) for k = 2..m in increasing k; only independent
  // rows go side by side.
  for (std::int64_t j = 0; j < pp; ++j) {
    double* rj = r + j * nn;
    const double* bj = b + j * mm;
    std::int64_t i = 0;
    for (; i + 4 <= nn; i += 4) {
      const double b1 = bj[0];
      double s0 = a[i] * b1, s1 = a[i + 1] * b1, s2 = a[i + 2] * b1, s3 = a[i + 3] * b1;
      for (std::int64_t k = 1; k < mm; ++k) {
        const double* ak = a + k * nn + i;
        const double bk = bj[k];
        s0 = s0 + ak[0] * bk;
        s1 = s1 + ak[1] * bk;
        s2 = s2 + ak[2] * bk;
        s3 = s3 + ak[3] * bk;
      }
      rj[i] = s0;
      rj[i + 1] = s1;
      rj[i + 2] = s2;
      rj[i + 3] = s3;
    }
    for (; i < nn; ++i) {
      double s = a[i] * bj[0];
      for (std::int64_t k = 1; k < mm; ++k) s = s + a[k * nn + i] * bj[k];
      rj[i] = s;
    }
  }
  return 0;
}

}  // extern "C"
