// path/step.cpp -- step control of the path solver: wncpas. A bound T from the path kind, the
// tolerance, the derived bound B and the local shape of the curve; the step may at most double
// from one step to the next: H := min(2 f H, T), f := 1.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr double kSafety = 0.9;           // factor on every bound but that of K = 1
constexpr double kTinyComponent = 1e-15;  // a tangent component counted as moving

// ---- State of wncpas kept between calls, one copy per thread ----
//   last_bound  the bound T of the last successful call (0 before the first); read only by the
//               fallback of variants other than 1 and 2; it outlives the path
struct WncpasState {
  double last_bound = 0.0;
};
thread_local WncpasState s_wncpas;

// Euclidean norm of v(1..n), squares summed in increasing index order.
double norm(std::int32_t n, const double* v) {
  double s = 0.0;
  for (std::int32_t i = 0; i < n; ++i) s += v[i] * v[i];
  return std::sqrt(s);
}

// Norm of the exterior product t ^ v (ynvevv): its n(n-1)/2 values summed in ynvevv's order.
std::int32_t wedge_norm(const std::int32_t* n, const double* t, const double* v, double* out,
                        std::int32_t* ierr) {
  double w[impl::kPathMaxN * (impl::kPathMaxN - 1) / 2];
  if (ynvevv(n, t, v, w, ierr) == 1) return 1;
  *out = norm(*n * (*n - 1) / 2, w);
  return 0;
}

// K = 4, variant 1, per-unknown tolerance: the straight-curve or curvature bound T0, then each
// unknown's move along the tangent held within its maximum step; times 0.9.
double bound_k4_per_unknown(std::int32_t n, const double* tol, const double* pas,
                            const Orvq7PathMarch* march) {
  const double* t = march->t;
  const double* c = march->c;
  double q = 0.0;
  for (std::int32_t i = 0; i < n; ++i) {
    const double v = c[i] / tol[i];
    q += v * v;
  }
  double t0;
  if (q == 0.0) {
    // Straight here: the first unknown (in increasing order) whose tangent component is at
    // least 1e-15 (inclusive). A tangent without one (not a unit vector) takes the smallest
    // maximum step instead.
    std::int32_t k = -1;
    for (std::int32_t i = 0; i < n && k < 0; ++i) {
      if (std::fabs(t[i]) >= kTinyComponent) k = i;
    }
    if (k >= 0) {
      t0 = pas[n + k] / std::fabs(t[k]);
    } else {
      t0 = pas[n];
      for (std::int32_t i = 1; i < n; ++i) {
        if (pas[n + i] < t0) t0 = pas[n + i];
      }
    }
  } else {
    t0 = std::sqrt(1.0 / (0.5 * std::sqrt(q)));
  }
  for (std::int32_t i = 0; i < n; ++i) {
    const double r = (std::fabs(t[i]) * t0) / pas[n + i];
    if (r > 1.0) t0 = t0 / r;  // strict: a move of exactly the maximum step stays
  }
  return kSafety * t0;
}

}  // namespace

extern "C" std::int32_t wncpas(const std::int32_t* n, const std::int32_t* variant,
                               const Orvq7PathOptions* options, const double* limits,
                               const double* tol, const double* pas, Orvq7PathMarch* march,
                               std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (nn > impl::kPathMaxN) {
    impl::trace(impl::kErrCapacity, "WNCPAS  ");
    return impl::fail(ierr, impl::kErrCapacity);
  }
  // (1) The bound T of the path kind.
  *ierr = 0;
  const std::int32_t kind = options->kind, var = *variant;
  const bool per_unknown = options->per_unknown == 1;
  const double b = limits[0];
  const double g = march->g;
  const double* t = march->t;
  const double* c = march->c;
  double bound = 0.0;
  double e = 0.0;  // norm of an exterior product
  if (kind == 1) {
    bound = std::fabs(tol[0]);  // no factor 0.9 for K = 1
  } else if (kind == 2) {
    if (per_unknown) {
      double s = 0.0;
      for (std::int32_t i = 0; i < nn; ++i) {
        const double v = tol[i] * t[i];
        s += v * v;
      }
      bound = kSafety * std::sqrt(s);
    } else {
      bound = kSafety * std::fabs(tol[0]);
    }
  } else if ((kind == 4 || kind == 8) && var != 1 && var != 2) {
    bound = kSafety * s_wncpas.last_bound;
  } else if (kind == 4 && var == 1) {
    bound = per_unknown ? bound_k4_per_unknown(nn, tol, pas, march)
                        : kSafety * std::sqrt(1.0 / ((0.5 * norm(nn, c)) / tol[0] + b));
  } else if (kind == 4) {
    if (per_unknown) {
      // Deliberate: every w_i is formed from the first component c_1.
      double w[impl::kPathMaxN];
      for (std::int32_t i = 0; i < nn; ++i) w[i] = c[0] / tol[i];
      if (wedge_norm(n, t, w, &e, ierr) == 1) {
        impl::trace(*ierr, "WNCPAS  ");
        return 1;
      }
      bound = kSafety * std::sqrt(1.0 / (b * (g * g) + e / 2.0));
    } else {
      if (wedge_norm(n, t, c, &e, ierr) == 1) {
        impl::trace(*ierr, "WNCPAS  ");
        return 1;
      }
      bound = kSafety * std::sqrt(1.0 / (b * (g * g) + e / (2.0 * tol[0])));
    }
  } else if (kind == 8 && var == 1) {
    bound = kSafety / (norm(nn, c) / tol[0] + b);
  } else if (kind == 8) {
    if (wedge_norm(n, t, c, &e, ierr) == 1) {
      impl::trace(*ierr, "WNCPAS  ");
      return 1;
    }
    // Deliberate: only the last components t_n c_n, not the dot product of t and c.
    bound = kSafety / ((g * (e - (t[nn - 1] * c[nn - 1]) * tol[0])) / (tol[0] + b));
  } else {
    impl::trace(impl::kErrCapacity, "WNCPAS  ");
    return impl::fail(ierr, impl::kErrCapacity);
  }
  s_wncpas.last_bound = bound;
  // (2) Growth: at most twice the step that last succeeded (f halved per failed correction),
  // never above T; a bound that is not a number gives a step that is not one.
  const double grown = (2.0 * march->f) * march->h;
  march->h = grown <= bound ? grown : bound;
  march->f = 1.0;
  return 0;
}
