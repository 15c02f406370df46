// path/tangent.cpp -- tangent routine of the path solver: ynumde. Unit tangent of the curve
// F(x) = 0 (n - 1 equations in n unknowns) and its second derivative with respect to arc
// length, from the caller's first and second derivatives. One evaluation serves all points.
#include <cfloat>
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "frame/workspace.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr double kFlatGradient2 = 1e-24;  // n = 2: squared gradient length below it
constexpr double kFlatGradient3 = 1e-10;  // n = 3: squared length of either gradient below it
constexpr double kFlatProduct = 1e-24;    // n >= 3: squared length of the product below it
constexpr std::int32_t kStackWork = 210;  // reals of the work area kept on the stack
constexpr std::int32_t kMaxN = impl::kPathMaxN;

// A squared length that gives a direction: at least `limit` and finite (a NaN fails).
bool usable(double q, double limit) { return q >= limit && q <= DBL_MAX; }

// Unit tangent of one point into t; jac is the (n-1) by n Jacobian, row k the gradient of
// equation k. Returns 0, or 1 with the code in ierr.
std::int32_t unit_tangent(std::int32_t n, const double* jac, double* t, std::int32_t* ierr) {
  const std::int32_t m = n - 1;  // leading dimension of jac
  if (n == 2) {
    // (a, b) the gradient; tangent (-b, a) / sqrt(a^2 + b^2).
    const double a = jac[0], b = jac[1];
    const double q = a * a + b * b;
    if (!usable(q, kFlatGradient2)) return impl::fail(ierr, impl::kErrDegenerate);
    const double r = std::sqrt(q);
    t[0] = -b / r;
    t[1] = a / r;
    return 0;
  }
  double w[kMaxN];
  if (n == 3) {
    // Cross product g1 x g2 of the two gradients (rows of jac).
    const double g1x = jac[0], g1y = jac[m], g1z = jac[2 * m];
    const double g2x = jac[1], g2y = jac[1 + m], g2z = jac[1 + 2 * m];
    const double q1 = (g1x * g1x + g1y * g1y) + g1z * g1z;
    const double q2 = (g2x * g2x + g2y * g2y) + g2z * g2z;
    if (!usable(q1, kFlatGradient3) || !usable(q2, kFlatGradient3)) {
      return impl::fail(ierr, impl::kErrDegenerate);
    }
    w[0] = g1y * g2z - g1z * g2y;
    w[1] = g1z * g2x - g1x * g2z;
    w[2] = g1x * g2y - g1y * g2x;
  } else {
    // Generalised vector product of the gradients, as the columns of an n by (n-1) array.
    double a[kMaxN * (kMaxN - 1)];
    for (std::int32_t k = 0; k < m; ++k) {
      for (std::int32_t i = 0; i < n; ++i) a[i + n * k] = jac[k + m * i];
    }
    if (ynvvvv(&n, a, w, ierr) == 1) return 1;
  }
  double p = 0.0;
  for (std::int32_t i = 0; i < n; ++i) p += w[i] * w[i];
  if (!usable(p, kFlatProduct)) return impl::fail(ierr, impl::kErrDegenerate);
  const double r = std::sqrt(p);
  for (std::int32_t i = 0; i < n; ++i) t[i] = w[i] / r;
  return 0;
}

// Second derivative of the curve at one point into c, given its unit tangent t, Jacobian jac
// and second derivatives hes ((n-1) by n by n, equation index fastest).
std::int32_t curve_second(std::int32_t n, const double* jac, const double* hes, const double* t,
                          double* c, std::int32_t* ierr) {
  const std::int32_t m = n - 1;
  if (n == 2) {
    // The gradient times (2ab F_xy - b^2 F_xx - a^2 F_yy) / (a^2 + b^2)^2.
    const double a = jac[0], b = jac[1];
    const double fxx = hes[0], fxy = hes[2], fyy = hes[3];
    const double q = a * a + b * b;
    if (!usable(q, kFlatGradient2)) return impl::fail(ierr, impl::kErrDegenerate);
    const double lambda = (((2.0 * a) * b) * fxy - (b * b) * fxx - (a * a) * fyy) / (q * q);
    c[0] = a * lambda;
    c[1] = b * lambda;
    return 0;
  }
  // J c = -(t' H_k t) for each equation k, and t . c = 0: rows of J, then t.
  double sys[kMaxN * kMaxN];
  double rhs[kMaxN];
  for (std::int32_t i = 0; i < n; ++i) {
    for (std::int32_t k = 0; k < m; ++k) sys[k + n * i] = jac[k + m * i];
    sys[m + n * i] = t[i];
  }
  for (std::int32_t k = 0; k < m; ++k) {
    double s = 0.0;
    for (std::int32_t j = 0; j < n; ++j) {
      for (std::int32_t i = 0; i < n; ++i) s += (t[i] * hes[k + m * (i + n * j)]) * t[j];
    }
    rhs[k] = -s;
  }
  rhs[m] = 0.0;
  std::int32_t code = 0;
  if (ynsega(&n, sys, rhs, c, &code) == 1) return impl::fail(ierr, impl::kErrDegenerate);
  return 0;
}

}  // namespace

extern "C" std::int32_t ynumde(void* ctx, const std::int32_t* n, Orvq7PathFct fct,
                               const std::int32_t* npts, const double* x, const std::int32_t* req,
                               double* out, std::int32_t* ierr) {
  // (1) Arguments.
  const std::int32_t nn = *n, np = *npts, rq = *req;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  if (rq != 2 && rq != 4 && rq != 6) return impl::fail(ierr, impl::kErrCapacity);
  if (np < 1) return impl::fail(ierr, impl::kErrBadArg);
  // (2) Work area for all points: first derivatives, and second ones for req 4 and 6.
  const std::int32_t m = nn - 1;
  const std::int64_t jac_size = std::int64_t{m} * nn;
  const std::int64_t per_point = rq == 2 ? jac_size : (nn + 1) * jac_size;
  const std::int64_t total = per_point * np;
  double stack_work[kStackWork];
  double* work = stack_work;
  impl::WorkspaceBlock block;
  if (total > kStackWork) {
    if (total > INT32_MAX || !block.take(impl::kWsReal, static_cast<std::int32_t>(total))) {
      return impl::fail(ierr, impl::kErrWorkspace);
    }
    work = block.get<double>();
  }
  // (3) One evaluation for all points: req 2, or 6 for the second derivatives.
  const std::int32_t eval_req = rq == 2 ? 2 : 6;
  if (fct(ctx, npts, x, &eval_req, work, ierr) == 1) {
    if (*ierr == impl::kErrEvalCapacity) *ierr = impl::kErrCapacity;
    return 1;
  }
  // (4) Point by point: tangent, then the second derivative; out holds n or 2n values each.
  const std::int32_t out_size = rq == 6 ? 2 * nn : nn;
  for (std::int32_t p = 0; p < np; ++p) {
    const double* jac = work + per_point * p;
    double t[kMaxN];
    double c[kMaxN];
    if (unit_tangent(nn, jac, t, ierr) == 1) return 1;
    if (rq != 2 && curve_second(nn, jac, jac + jac_size, t, c, ierr) == 1) return 1;
    double* o = out + std::int64_t{out_size} * p;
    if (rq != 4) {
      for (std::int32_t i = 0; i < nn; ++i) o[i] = t[i];
    }
    if (rq != 2) {
      double* oc = rq == 6 ? o + nn : o;
      for (std::int32_t i = 0; i < nn; ++i) oc[i] = c[i];
    }
  }
  *ierr = 0;
  return 0;
}
