// path/newton.cpp -- prediction and Newton correction of a path step: wncgoo, wncgcv, wncgnn,
// wncgnr, wncgf2. A step goes from the current point along a second-order prediction to a
// predicted point p, and back onto the curve by a Newton correction inside the box of the
// maximum steps around p; a failed correction halves the step. Box arrays of the correctors
// hold a (lower, upper) pair per unknown. Residual norms are sums of squares in equation order.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "frame/tolerances.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr std::int32_t kMaxN = impl::kPathMaxN;
constexpr std::int32_t kMaxIter = 100;        // Newton iterations of each corrector
constexpr double kHalf = 0.5;                 // step halving of wncgoo, midpoint of wncgf2
constexpr double kSmallResidual = 1e-15;      // wncgf2: squared residual needing no search
constexpr double kSmallBracket = 1e-15;       // wncgf2: bracket width ending the bisection
constexpr std::int32_t kSearchHalvings = 5;   // wncgf2: halvings of the last Newton step
constexpr std::int32_t kMaxBisections = 200;  // wncgf2: bisections, whatever the bracket
constexpr std::int32_t kOne = 1;              // npts of every evaluation
constexpr std::int32_t kReqJacobian = 2;
constexpr std::int32_t kReqNewton = 3;  // residuals and first derivatives

// The product C = A B of an (r, q) and a (q, c) matrix, column-major with leading dimensions
// r and q: C(i, j) = sum over l ascending of A(i, l) B(l, j), from 0. Rows are taken two at a
// time, each element accumulated in its own order.
void product(std::int32_t r, std::int32_t q, const double* a, const double* b, std::int32_t c,
             double* out) {
  for (std::int32_t j = 0; j < c; ++j) {
    const double* bj = b + q * j;
    std::int32_t i = 0;
    for (; i + 1 < r; i += 2) {
      double s0 = 0.0, s1 = 0.0;
      for (std::int32_t l = 0; l < q; ++l) {
        s0 += a[i + r * l] * bj[l];
        s1 += a[i + 1 + r * l] * bj[l];
      }
      out[i + r * j] = s0;
      out[i + 1 + r * j] = s1;
    }
    if (i < r) {
      double s0 = 0.0;
      for (std::int32_t l = 0; l < q; ++l) s0 += a[i + r * l] * bj[l];
      out[i + r * j] = s0;
    }
  }
}

// Inclusive box test on (lower, upper) pairs; a coordinate that is not a number is outside.
bool inside(std::int32_t n, const double* box, const double* x) {
  for (std::int32_t i = 0; i < n; ++i) {
    if (!(box[2 * i] <= x[i] && x[i] <= box[2 * i + 1])) return false;
  }
  return true;
}

// Sum of squares of f(1..m), in increasing order.
double sum_squares(std::int32_t m, const double* f) {
  double s = 0.0;
  for (std::int32_t k = 0; k < m; ++k) s += f[k] * f[k];
  return s;
}

void copy(std::int32_t n, const double* from, double* to) {
  for (std::int32_t i = 0; i < n; ++i) to[i] = from[i];
}

// The iterate kept by a corrector (the last one whose residual norm decreased, p before any)
// and its norm, handed out on every return.
struct Kept {
  double x[kMaxN];
  double norm;
  void hand_out(std::int32_t n, double* xnew, double* rnorm) const {
    copy(n, x, xnew);
    *rnorm = norm;
  }
};

// wncgf2: the point at parameter s of the search line (p1 - u2 s, p2 + u1 s).
void line_point(const double* u, const double* p, double s, double* x) {
  x[0] = p[0] - u[1] * s;
  x[1] = p[1] + u[0] * s;
}

// wncgf2: residual and derivative along the line at s; req 3, so out holds F, F_x, F_y.
std::int32_t line_eval(void* ctx, Orvq7PathFct fct, const double* u, const double* p, double s,
                       double* f, double* slope, std::int32_t* ierr) {
  double x[2];
  double out[3];
  line_point(u, p, s, x);
  if (fct(ctx, &kOne, x, &kReqNewton, out, ierr) == 1) return 1;
  *f = out[0];
  *slope = out[2] * u[0] - out[1] * u[1];  // F_y u1 - F_x u2
  return 0;
}

// Residuals of opposite strict signs (a zero or a NaN has no sign here).
bool opposite(double a, double b) { return (a < 0.0 && b > 0.0) || (a > 0.0 && b < 0.0); }

// wncgf2's failure exit: the callee's code, traced unless it is 4716.
std::int32_t f2_failed(std::int32_t* ierr) {
  if (*ierr != impl::kErrLeftBox) impl::trace(*ierr, "WNCGF2;");
  return 1;
}

}  // namespace

extern "C" {

std::int32_t wncgoo(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* eps,
                    const double* /*spare*/, const double* pas, Orvq7PathMarch* march,
                    std::int32_t* special, double* xnew, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  // (1) Step h = H f and extrapolation ratio r = h / (2 H_prev).
  *ierr = 0;
  *special = 0;
  double h = march->h * march->f;
  double r = h / (2.0 * march->hprev);
  const double* x = march->x;
  const double* t = march->t;
  const double* tp = march->tprev;
  const std::int32_t which = 1;
  for (;;) {
    // (2) Predicted direction u = t + (t - t_prev) r and point p = x + h u.
    double u[kMaxN];
    double p[kMaxN];
    bool moves = false;
    bool finite = true;
    for (std::int32_t i = 0; i < nn; ++i) {
      u[i] = t[i] + (t[i] - tp[i]) * r;
      const double hu = h * u[i];
      p[i] = x[i] + hu;
      if (!(std::fabs(hu) <= pas[i])) moves = true;  // inclusive: a move of pas(i,1) collapses
      if (!std::isfinite(p[i])) finite = false;
    }
    // (3) Collapsed: no unknown moves by more than its minimum step (or the step has halved
    // down to 0). No new point; the driver ends the path.
    if (!moves || h == 0.0) {
      *special = 3;
      return 0;
    }
    // A prediction that is not finite cannot be corrected and halving does not mend it.
    if (!finite) {
      impl::trace(impl::kErrNotConverged, "WNCGOO  ");
      return impl::fail(ierr, impl::kErrNotConverged);
    }
    // (4)-(5) Correction in the box of the maximum steps around p, the Jacobian frozen at x.
    bool failed = false;
    if (wncgcv(ctx, n, fct, eps, &which, u, x, p, pas + nn, xnew, ierr) == 1) {
      if (*ierr != impl::kErrNotConverged) {
        impl::trace(*ierr, "WNCGOO  ");
        return 1;
      }
      failed = true;
    } else {
      // (6) Fallen back onto the current point: every unknown within (strictly) its minimum
      // step of x.
      std::int32_t near = 0;
      for (std::int32_t i = 0; i < nn; ++i) {
        if (std::fabs(x[i] - xnew[i]) < pas[i]) ++near;
      }
      failed = near == nn;
    }
    if (!failed) return 0;
    // (7) Failed correction: halve h, r and the step factor, predict again.
    *ierr = 0;
    h = h * kHalf;
    r = r * kHalf;
    march->f = march->f * kHalf;
  }
}

std::int32_t wncgcv(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* eps,
                    const std::int32_t* which, const double* u, const double* xbase,
                    const double* p, const double* w, double* xnew, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2 || (*which != 0 && *which != 1)) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  // (1) The search box p - w .. p + w.
  double box[2 * kMaxN];
  for (std::int32_t i = 0; i < nn; ++i) {
    box[2 * i] = p[i] - w[i];
    box[2 * i + 1] = p[i] + w[i];
  }
  // (2) The corrector: wncgf2 for two unknowns; else frozen gradients at xbase (which 1) or
  // the hyperplane through p orthogonal to u (which 0).
  double rnorm = impl::kHuge;
  std::int32_t result;
  if (nn == 2) {
    result = wncgf2(ctx, fct, u, p, box, xnew, &rnorm, ierr);
  } else if (*which == 1) {
    const std::int32_t m = nn - 1;
    double jac[kMaxN * kMaxN];
    if (fct(ctx, &kOne, xbase, &kReqJacobian, jac, ierr) == 1) return 1;
    double v[kMaxN * kMaxN];  // V(i, k) = dF_k/dx_i: column k the gradient of equation k
    for (std::int32_t k = 0; k < m; ++k) {
      for (std::int32_t i = 0; i < nn; ++i) v[i + nn * k] = jac[k + m * i];
    }
    result = wncgnn(ctx, n, fct, v, p, box, xnew, &rnorm, ierr);
  } else {
    result = wncgnr(ctx, n, fct, u, p, box, xnew, &rnorm, ierr);
  }
  // (3) Acceptance: leaving the box is a failed correction; the iteration limit, an unsolved
  // system and success are judged by the final residual norm (inclusive).
  if (result == 1) {
    if (*ierr == impl::kErrLeftBox) return impl::fail(ierr, impl::kErrNotConverged);
    if (*ierr != impl::kErrIterLimit && *ierr != impl::kErrInnerSolve) return 1;
  }
  if (rnorm <= *eps) {
    *ierr = 0;
    return 0;
  }
  return impl::fail(ierr, impl::kErrNotConverged);
}

std::int32_t wncgnn(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* v,
                    const double* p, const double* box, double* xnew, double* rnorm,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  const std::int32_t m = nn - 1;
  // (1) x = p + V z from z = 0; the kept iterate starts as p with norm 1e38.
  *ierr = 0;
  double z[kMaxN];
  for (std::int32_t l = 0; l < m; ++l) z[l] = 0.0;
  double x[kMaxN];
  copy(nn, p, x);
  Kept kept;
  copy(nn, p, kept.x);
  kept.norm = impl::kHuge;
  double out[kMaxN + kMaxN * kMaxN];  // residuals, then the (n-1) by n Jacobian
  const double* jac = out + m;
  for (std::int32_t iter = 1;; ++iter) {
    // (5) Iteration limit, checked before the 101st evaluation.
    if (iter > kMaxIter) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrIterLimit);
    }
    // (2) Box test, then residuals and Jacobian at x.
    if (!inside(nn, box, x)) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrLeftBox);
    }
    if (fct(ctx, &kOne, x, &kReqNewton, out, ierr) == 1) {
      kept.hand_out(nn, xnew, rnorm);
      return 1;
    }
    // (3) Stop when the norm does not decrease (strictly; a NaN does not): the kept iterate
    // is the result, tested once more against the box.
    const double norm = sum_squares(m, out);
    if (!(norm < kept.norm)) {
      kept.hand_out(nn, xnew, rnorm);
      if (!inside(nn, box, kept.x)) return impl::fail(ierr, impl::kErrLeftBox);
      *ierr = 0;
      return 0;
    }
    kept.norm = norm;
    copy(nn, x, kept.x);
    // (4) (J V) dz = F: (J V)(k, l) = sum over i ascending of J(k, i) V(i, l), from 0.
    double jv[kMaxN * kMaxN];
    product(m, nn, jac, v, m, jv);
    double dz[kMaxN];
    std::int32_t code = 0;
    if (ynsega(&m, jv, out, dz, &code) == 1) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrInnerSolve);
    }
    // z := z - dz; x := p + V z, (V z)_i summed over l ascending from 0.
    for (std::int32_t l = 0; l < m; ++l) z[l] = z[l] - dz[l];
    double vz[kMaxN];
    product(nn, m, v, z, 1, vz);
    for (std::int32_t i = 0; i < nn; ++i) x[i] = p[i] + vz[i];
  }
}

std::int32_t wncgnr(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* u,
                    const double* p, const double* box, double* xnew, double* rnorm,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  const std::int32_t m = nn - 1;
  // (1) x from p; the system F(x) = 0, u . (x - p) = 0.
  *ierr = 0;
  double x[kMaxN];
  copy(nn, p, x);
  Kept kept;
  copy(nn, p, kept.x);
  kept.norm = impl::kHuge;
  double out[kMaxN + kMaxN * kMaxN];
  const double* jac = out + m;
  for (std::int32_t iter = 1;; ++iter) {
    // (4) Iteration limit.
    if (iter > kMaxIter) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrIterLimit);
    }
    // (2) Box test, evaluation; norm = (u . (x - p))^2 + (sum of squares of F).
    if (!inside(nn, box, x)) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrLeftBox);
    }
    if (fct(ctx, &kOne, x, &kReqNewton, out, ierr) == 1) {
      kept.hand_out(nn, xnew, rnorm);
      return 1;
    }
    double lin = 0.0;
    for (std::int32_t i = 0; i < nn; ++i) lin += u[i] * (x[i] - p[i]);
    const double norm = lin * lin + sum_squares(m, out);
    if (!(norm < kept.norm)) {
      kept.hand_out(nn, xnew, rnorm);
      if (!inside(nn, box, kept.x)) return impl::fail(ierr, impl::kErrLeftBox);
      *ierr = 0;
      return 0;
    }
    kept.norm = norm;
    copy(nn, x, kept.x);
    // (3) Rows 1..n-1 the Jacobian, row n u; right-hand side (F, u . (x - p)); x := x - dx.
    double a[kMaxN * kMaxN];
    double rhs[kMaxN];
    for (std::int32_t i = 0; i < nn; ++i) {
      for (std::int32_t k = 0; k < m; ++k) a[k + nn * i] = jac[k + m * i];
      a[m + nn * i] = u[i];
    }
    copy(m, out, rhs);
    rhs[m] = lin;
    double dx[kMaxN];
    std::int32_t code = 0;
    if (ynsega(n, a, rhs, dx, &code) == 1) {
      kept.hand_out(nn, xnew, rnorm);
      return impl::fail(ierr, impl::kErrInnerSolve);
    }
    for (std::int32_t i = 0; i < nn; ++i) x[i] = x[i] - dx[i];
  }
}

std::int32_t wncgf2(void* ctx, Orvq7PathFct fct, const double* u, const double* p,
                    const double* box, double* xnew, double* rnorm, std::int32_t* ierr) {
  *ierr = 0;
  // (1) Newton in s from 0. best: the last s whose squared residual decreased (strictly).
  double s = 0.0;
  double best_s = 0.0, best_f = 0.0, best_norm = impl::kHuge;
  bool rejected = false;  // a Newton step was taken and did not decrease the residual
  double step = 0.0;      // that step, from best_s
  double f_step = 0.0;    // the residual at best_s + step
  auto hand_out = [&] {
    line_point(u, p, best_s, xnew);
    *rnorm = best_norm;
  };
  for (std::int32_t iter = 1;; ++iter) {
    if (iter > kMaxIter) {
      hand_out();
      impl::trace(impl::kErrIterLimit, "WNCGF2;");
      return impl::fail(ierr, impl::kErrIterLimit);
    }
    double x[2];
    line_point(u, p, s, x);
    if (!inside(2, box, x)) {
      hand_out();
      return impl::fail(ierr, impl::kErrLeftBox);
    }
    double f = 0.0, slope = 0.0;
    if (line_eval(ctx, fct, u, p, s, &f, &slope, ierr) == 1) return f2_failed(ierr);
    const double norm = f * f;
    if (!(norm < best_norm)) {
      rejected = iter > 1;
      f_step = f;
      break;
    }
    best_s = s;
    best_f = f;
    best_norm = norm;
    if (slope == 0.0) break;  // a zero derivative ends the Newton phase
    step = -(f / slope);
    s = best_s + step;
  }
  // (2) Safeguarded search, only after a rejected Newton step. The step is halved (up to five
  // times) until the residual at best_s + step has the opposite sign of the residual at
  // best_s; that bracket is then bisected while it is wider than 1e-15 and the best squared
  // residual exceeds 1e-15 (both strict). Every point evaluated competes for the best
  // (strictly smaller squared residual wins). A residual that is not finite ends the search.
  if (rejected && best_norm > kSmallResidual) {
    const double s0 = best_s, f0 = best_f;
    auto consider = [&](double sv, double fv) {
      if (fv * fv < best_norm) {
        best_s = sv;
        best_norm = fv * fv;
      }
    };
    bool bracket = opposite(f0, f_step);
    for (std::int32_t k = 0; k < kSearchHalvings && !bracket; ++k) {
      step = step * kHalf;
      double f = 0.0, slope = 0.0;
      if (line_eval(ctx, fct, u, p, s0 + step, &f, &slope, ierr) == 1) return f2_failed(ierr);
      if (!std::isfinite(f)) break;
      consider(s0 + step, f);
      f_step = f;
      bracket = opposite(f0, f);
    }
    // The bracket [a, b] with f(a) of the sign of f0; a midpoint that is not strictly inside
    // (no double between the ends) ends the bisection.
    double a = s0, b = s0 + step;
    for (std::int32_t k = 0; bracket && k < kMaxBisections; ++k) {
      if (!(std::fabs(b - a) > kSmallBracket && best_norm > kSmallResidual)) break;
      const double mid = a + kHalf * (b - a);
      if (mid == a || mid == b) break;
      double f = 0.0, slope = 0.0;
      if (line_eval(ctx, fct, u, p, mid, &f, &slope, ierr) == 1) return f2_failed(ierr);
      if (!std::isfinite(f)) break;
      consider(mid, f);
      if (opposite(f0, f)) {
        b = mid;
      } else {
        a = mid;
      }
    }
  }
  // (3) The best point and its squared residual.
  hand_out();
  *ierr = 0;
  return 0;
}

}  // extern "C"
