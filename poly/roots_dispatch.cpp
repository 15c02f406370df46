// poly/roots_dispatch.cpp -- the newer root functions under the status convention: ynze2r,
// ynze3r and the dispatcher by degree ynzenr. Coefficients by decreasing power; roots are
// complex pairs (re, im), slot k at roots[2k]. No traceback frames; no state.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "frame/tolerances.h"
#include "linalg/linalg_api.h"
#include "poly/poly_api.h"

namespace {

constexpr double kEps = impl::kNegligible;  // 1e-15
constexpr double kRatio = 3.16e-8;          // ynze3r: one of g, h dominates the other
constexpr std::int32_t kPolishSteps = 100;  // ynze3r: Newton steps at most
constexpr std::int32_t kMaxDegree = 4;      // ynzenr
constexpr std::int32_t kGapMode = 1;        // yntrzr: cleaning by the gap rule

void set_slot(double* roots, int k, double re, double im) {
  roots[2 * k] = re;
  roots[2 * k + 1] = im;
}

}  // namespace

extern "C" {

std::int32_t ynze2r(const double* coef, double* roots, std::int32_t* err) {
  const double c0 = coef[0], c1 = coef[1], c2 = coef[2];
  // (1) Exactly zero leading coefficient.
  if (c0 == 0.0) return impl::fail(err, impl::kErrZeroLeading);
  // (2) Reduced discriminant.
  *err = 0;
  const double beta = 0.5 * c1;
  const double dd = beta * beta - c0 * c2;
  double big = beta * beta;
  if (std::fabs(c0 * c2) > big) big = std::fabs(c0 * c2);
  if (big * kEps >= std::fabs(dd)) {
    // (3) Double root (inclusive test, relative to the larger term).
    const double x = -beta / c0;
    set_slot(roots, 0, x, 0.0);
    set_slot(roots, 1, x, 0.0);
  } else if (dd > 0.0) {
    // (4) Two real roots; the sign of beta picks the non-cancelling sum.
    const double s = std::sqrt(dd);
    const double q = beta >= 0.0 ? -(beta + s) : -(beta - s);
    set_slot(roots, 0, q / c0, 0.0);
    set_slot(roots, 1, c2 / q, 0.0);
  } else {
    // (5) Conjugate pair.
    const double re = -beta / c0;
    set_slot(roots, 0, re, std::sqrt(-dd) / c0);
    set_slot(roots, 1, re, -std::sqrt(-dd) / c0);
  }
  return 0;
}

std::int32_t ynze3r(const double* coef, double* roots, std::int32_t* err) {
  const double c0 = coef[0], c1 = coef[1], c2 = coef[2], c3 = coef[3];
  // (1) Exactly zero leading coefficient.
  if (std::fabs(c0) == 0.0) return impl::fail(err, impl::kErrZeroLeading);
  // (2) Normalise; x = y - t.
  const double b = c1 / c0, c = c2 / c0, d = c3 / c0;
  const double t = b / 3.0;
  *err = 0;
  // (3) p, zero when negligible against max(|c|, b t) (inclusive).
  const double bt = b * t;
  double p = c - bt;
  double pscale = std::fabs(c);
  if (bt > pscale) pscale = bt;
  if (pscale * kEps >= std::fabs(p)) p = 0.0;
  // (4) q, zero when negligible against max(|2t^3|, |t c|, d); d with its sign, on purpose.
  const double t3 = (t * t) * t;
  double q = (d + 2.0 * t3) - t * c;
  double qscale = std::fabs(2.0 * t3);
  if (std::fabs(t * c) > qscale) qscale = std::fabs(t * c);
  if (d > qscale) qscale = d;
  if (qscale * kEps >= std::fabs(q)) q = 0.0;
  // (5) h = (q/2)^2, g = (p/3)^3, D = g + h.
  const double q2 = q / 2.0;
  const double p3 = p / 3.0;
  const double h = q2 * q2;
  const double g = (p3 * p3) * p3;
  const double dd = g + h;
  const double m = -q / 2.0;
  // (6)-(10) The root y of largest magnitude of y^3 + p y + q.
  double gh = std::fabs(g);
  if (h > gh) gh = h;
  double y;
  if (gh * kEps > std::fabs(dd) || dd == 0.0) {
    y = 2.0 * std::cbrt(m);  // D negligible: double root
  } else if (dd <= 0.0) {
    // Three real roots; q = 0 counts as positive.
    const double rho = std::fabs(p3);
    const double sigma = std::sqrt(rho);
    const double sign_q = q < 0.0 ? -1.0 : 1.0;
    y = ((-2.0 * sign_q) * sigma) * std::cos(std::acos(std::fabs(q) / ((2.0 * rho) * sigma)) / 3.0);
  } else if (kRatio * std::fabs(g) > h) {
    y = -q / p;  // g dominates
  } else if (kRatio * h > std::fabs(g)) {
    // h dominates.
    const double w = std::cbrt(std::fabs(q));
    const double y0 = p / (3.0 * w) - (g / (12.0 * h) + 1.0) * w;
    y = q >= 0.0 ? y0 : -y0;
  } else {
    const double s = std::sqrt(dd);
    y = std::cbrt(s + m) + std::cbrt(m - s);
  }
  // (11) Newton polish on the normalised cubic, stopped at a flat derivative or when |f|
  // would not decrease (x kept).
  double x = y - t;
  for (std::int32_t step = 1; step <= kPolishSteps; ++step) {
    const double f = ((x + b) * x + c) * x + d;
    const double fp = (3.0 * x + 2.0 * b) * x + c;
    if (std::fabs(fp) <= kEps) break;
    const double x1 = x - f / fp;
    const double f1 = ((x1 + b) * x1 + c) * x1 + d;
    if (std::fabs(f1) >= std::fabs(f)) break;
    x = x1;
  }
  // (12) Deflate with the unnormalised coefficients.
  set_slot(roots, 0, x, 0.0);
  const double beta = c1 + c0 * x;
  const double gamma = std::fabs(x) > kEps ? -c3 / x : c2 + x * beta;
  const double quad[3] = {c0, beta, gamma};
  return ynze2r(quad, roots + 2, err);
}

std::int32_t ynzenr(const std::int32_t* n, const double* coef, std::int32_t* nroots,
                    double* roots, std::int32_t* err) {
  // (1) Arguments; nroots is written first.
  const std::int32_t deg = *n;
  *nroots = deg;
  if (deg < 1) return impl::fail(err, impl::kErrBadArg);
  if (deg > kMaxDegree) return impl::fail(err, impl::kErrCapacity);
  *err = 0;
  // The trailing k + 1 coefficients of the caller's array.
  auto trailing = [coef, deg](std::int32_t k) { return coef + (deg - k); };
  std::int32_t level = deg;
  // (2) Quartic.
  if (level == 4) {
    std::int32_t flag = 0;
    ferari(coef, roots, &flag);
    if (flag != 3) return 0;
    *nroots = 3;
    level = 3;
  }
  // (3) Cubic.
  if (level == 3) {
    if (ynze3r(trailing(3), roots, err) == 0) return 0;
    if (*err != impl::kErrZeroLeading) return 1;
    *nroots = 2;
    *err = 0;
    level = 2;
  }
  // (4) Quadratic.
  if (level == 2) {
    if (ynze2r(trailing(2), roots, err) == 0) return 0;
    if (*err != impl::kErrZeroLeading) return 1;
    *nroots = 1;
    *err = 0;
  }
  // (5) Linear a x + b: clean (a, b) by the gap rule, then the quotient as it stands.
  const std::int32_t two = 2, mode = kGapMode;
  const double tol = kEps;
  double r[2];
  if (yntrzr(&two, trailing(1), &tol, &mode, r, err) == 1) return 1;
  if (r[0] == 0.0) {
    if (r[1] == 0.0) return impl::fail(err, impl::kErrNotUnique);
    *nroots = 0;
    return 0;
  }
  // Deliberate: r1 / r0 is b / a, without the change of sign.
  set_slot(roots, 0, r[1] / r[0], 0.0);
  return 0;
}

}  // extern "C"
