// path/path_events.cpp -- tests of a new path point and special points: wnctes, wnctfe,
// wnctop, wnctob, wnccar, wncver. After a correction: has the path closed on its start point
// or left the box (then where does it end on the face)? Then: is the step acceptable, how is
// the point stored, and the march record advances to it.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr std::int32_t kMaxN = impl::kPathMaxN;
constexpr double kCrossingTiny = 1e-15;  // wnctfe: closure values closer give lambda = 1
constexpr double kClosure = 1e-6;        // wnctfe: relative agreement with x0
constexpr double kFaceSlack = 1e-12;     // wnctob: outside another face by more than this
constexpr double kRetry = 0.75;          // wnccar: step factor after a rejected step
constexpr double kHalf = 0.5;            // wnctob: step factor after no end point
constexpr double kUndoHalf = 2.0;        // wnctes: undoes wnctob's halving
constexpr double kShortStep = 1e-12;     // wnccar: shortest step for a difference quotient
constexpr double kSagittaDivisor = 8.0;  // wncver: chord-to-curve distance L |t - t'| / 8
constexpr std::int32_t kOne = 1;
constexpr std::int32_t kReqResiduals = 1;
constexpr std::int32_t kReqTangent = 2;

// Status of wnctob.
constexpr std::int32_t kFound = 0;
constexpr std::int32_t kNotFound = 1;
constexpr std::int32_t kUndecided = 2;

double dot(std::int32_t n, const double* a, const double* b) {
  double s = 0.0;
  for (std::int32_t i = 0; i < n; ++i) s += a[i] * b[i];
  return s;
}

void copy(std::int32_t n, const double* from, double* to) {
  for (std::int32_t i = 0; i < n; ++i) to[i] = from[i];
}

// Strictly outside the box (lower bounds, then upper bounds) in some unknown.
bool outside(std::int32_t n, const double* box, const double* x) {
  for (std::int32_t i = 0; i < n; ++i) {
    if (x[i] < box[i] || x[i] > box[n + i]) return true;
  }
  return false;
}

std::int32_t check_n(std::int32_t n, std::int32_t* ierr) {
  if (n < 2) return impl::fail(ierr, impl::kErrBadArg);
  if (n > kMaxN) return impl::fail(ierr, impl::kErrCapacity);
  return 0;
}

// wnctes, step 4: the quadratic model of the curve over the step (value x and derivative
// L t at 0, value xnew at 1, L = |xnew - x|). When the model leaves the box, y receives the
// model's outermost point: at the extreme of the unknown whose excursion beyond its bound is
// largest (strictly; ties keep the earlier unknown, the lower bound before the upper).
std::int32_t model_leaves(std::int32_t n, const double* x, const double* t, const double* xnew,
                          const double* box, double* y, bool* leaves, std::int32_t* ierr) {
  double d[kMaxN];
  double step[kMaxN];
  for (std::int32_t i = 0; i < n; ++i) step[i] = xnew[i] - x[i];
  const double len = std::sqrt(dot(n, step, step));
  for (std::int32_t i = 0; i < n; ++i) d[i] = len * t[i];
  double e[kMaxN];
  double ext[2 * kMaxN];
  double sext[2 * kMaxN];
  if (ynxxlv(&n, x, d, xnew, e, ext, sext, ierr) == 1) return 1;
  double most = 0.0, at = 0.0;
  *leaves = false;
  for (std::int32_t i = 0; i < n; ++i) {
    const double below = box[i] - ext[i];
    const double above = ext[n + i] - box[n + i];
    if (below > most) most = below, at = sext[i], *leaves = true;
    if (above > most) most = above, at = sext[n + i], *leaves = true;
  }
  if (*leaves) {
    for (std::int32_t i = 0; i < n; ++i) y[i] = x[i] + at * (d[i] + e[i] * at);
  }
  return 0;
}

}  // namespace

extern "C" {

std::int32_t wnctes(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* eps,
                    const double* xd, const double* xnew, const double* box, const double* pas,
                    Orvq7PathMarch* march, std::int32_t* redo, double* xkeep, std::int32_t* special,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (check_n(nn, ierr) == 1) return 1;
  *ierr = 0;
  // (1) Accept unless a test below says otherwise.
  *redo = 0;
  // (2) Closed on the start point: the point kept is x0 itself.
  std::int32_t hit = 0;
  if (wnctfe(ctx, n, fct, eps, xd, xnew, pas, march, &hit, ierr) == 1) return 1;
  if (hit == 1) {
    *special = 2;
    copy(nn, xd, xkeep);
    return 0;
  }
  // (3) Outside the box: the end point on the face, or the step is redone (undecided counts
  // as not found).
  double xend[kMaxN];
  std::int32_t status = kUndecided;
  if (outside(nn, box, xnew)) {
    if (wnctob(ctx, n, fct, eps, xnew, box, pas, march, &status, xend, ierr) == 1) return 1;
    if (status == kFound) {
      *special = 1;
      copy(nn, xend, xkeep);
    } else {
      *redo = 1;
    }
    return 0;
  }
  // (4) Inside: does the curve leave the box and come back within the step?
  double y[kMaxN];
  bool leaves = false;
  if (model_leaves(nn, march->x, march->t, xnew, box, y, &leaves, ierr) == 1) return 1;
  if (leaves) {
    if (wnctob(ctx, n, fct, eps, y, box, pas, march, &status, xend, ierr) == 1) return 1;
    if (status == kFound) {
      *special = 1;
      copy(nn, xend, xkeep);
      return 0;
    }
    // No end point there: no redo, the halving undone, the point kept as an ordinary one.
    *redo = 0;
    *special = 0;
    march->f = march->f * kUndoHalf;
  }
  // (5) An ordinary point.
  copy(nn, xnew, xkeep);
  return 0;
}

std::int32_t wnctfe(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* eps,
                    const double* xd, const double* xnew, const double* pas, Orvq7PathMarch* march,
                    std::int32_t* hit, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (check_n(nn, ierr) == 1) return 1;
  *ierr = 0;
  *hit = 0;
  const double* x0 = xd;
  const double* d0 = xd + nn;
  // (1) g = (xnew - x0) . d0, summed in increasing order.
  double g = 0.0;
  for (std::int32_t i = 0; i < nn; ++i) g += (xnew[i] - x0[i]) * d0[i];
  // (2) A crossing needs g_prev < 0 <= g.
  const double gp = march->close_prev;
  if (gp >= 0.0 || g < 0.0) {
    march->close = g;
    return 0;
  }
  // (3) Interpolate between the current point and the new one (lambda 1 when g - g_prev is
  // below 1e-15, strict).
  const double diff = g - gp;
  const double lambda = diff < kCrossingTiny ? 1.0 : -gp / diff;
  double q[kMaxN];
  for (std::int32_t i = 0; i < nn; ++i) q[i] = (1.0 - lambda) * march->x[i] + lambda * xnew[i];
  // (4) Onto the curve in the hyperplane through q orthogonal to d0; 4713 is no closure.
  double r[kMaxN];
  const std::int32_t which = 0;
  if (wncgcv(ctx, n, fct, eps, &which, d0, q, q, pas + nn, r, ierr) == 1) {
    if (*ierr != impl::kErrNotConverged) return 1;
    *ierr = 0;
    march->close = g;
    return 0;
  }
  // (5) Closed when every |x0_i - r_i| <= max(|x0_i|, 1) 1e-6 (inclusive).
  bool closed = true;
  for (std::int32_t i = 0; i < nn; ++i) {
    const double scale = std::fabs(x0[i]) > 1.0 ? std::fabs(x0[i]) : 1.0;
    if (!(std::fabs(x0[i] - r[i]) <= scale * kClosure)) closed = false;
  }
  *hit = closed ? 1 : 0;
  march->close = g;
  return 0;
}

std::int32_t wnctop(const std::int32_t* n, const double* xa, const double* xb, const double* box,
                    std::int32_t* face, double* xout, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (nn < 1) return impl::fail(ierr, impl::kErrBadArg);
  // (1) Unknowns with xb on or beyond a bound (inclusive), the lower bound tested first; the
  // largest ratio |xb_i - xa_i| / |b - xa_i| wins (strictly; ties keep the earlier unknown).
  std::int32_t k = -1, side = 0;
  double best = 0.0, bound = 0.0;
  for (std::int32_t i = 0; i < nn; ++i) {
    const bool low = xb[i] <= box[i];
    if (!low && !(xb[i] >= box[nn + i])) continue;
    const double b = low ? box[i] : box[nn + i];
    const double num = std::fabs(xb[i] - xa[i]);
    const double den = std::fabs(b - xa[i]);
    // A segment lying in the face (xa_i = xb_i = b) reaches it at its end: ratio 1.
    const double ratio = (num == 0.0 && den == 0.0) ? 1.0 : num / den;
    if (k < 0 || ratio > best) {
      k = i;
      side = low ? 1 : 2;
      best = ratio;
      bound = b;
    }
  }
  // (2) None outside.
  if (k < 0) return impl::fail(ierr, impl::kErrBadArg);
  // (3) lambda = |b - xa_k| / |xb_k - xa_k| (1 when xb_k = xa_k); the point, then exactly
  // on the face.
  const double span = std::fabs(xb[k] - xa[k]);
  const double lambda = span == 0.0 ? 1.0 : std::fabs(bound - xa[k]) / span;
  for (std::int32_t i = 0; i < nn; ++i) xout[i] = (1.0 - lambda) * xa[i] + lambda * xb[i];
  xout[k] = bound;
  face[0] = side;
  face[1] = k + 1;
  *ierr = 0;
  return 0;
}

std::int32_t wnctob(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* eps,
                    const double* xfar, const double* box, const double* pas, Orvq7PathMarch* march,
                    std::int32_t* status, double* xend, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (check_n(nn, ierr) == 1) return 1;
  *ierr = 0;
  // (1) Never at the first step: undecided, f halved.
  *status = kUndecided;
  if (march->nstored <= 1) {
    march->f = march->f * kHalf;
    return 0;
  }
  const double* x = march->x;
  double far[kMaxN];
  copy(nn, xfar, far);
  double r[kMaxN];
  bool found = false;
  for (std::int32_t attempt = 1; attempt <= nn && !found; ++attempt) {
    // (2) Where the segment from x to the far end leaves the box, on the face of unknown j.
    double q[kMaxN];
    std::int32_t face[2] = {0, 0};
    if (wnctop(n, x, far, box, face, q, ierr) == 1) {
      *ierr = 0;
      break;
    }
    const std::int32_t j = face[1] - 1;
    const double bound = face[0] == 1 ? box[j] : box[nn + j];
    // (3) Onto the curve within the face's hyperplane (direction e_j); then exactly on it.
    double ej[kMaxN] = {};
    ej[j] = 1.0;
    const std::int32_t which = 0;
    if (wncgcv(ctx, n, fct, eps, &which, ej, q, q, pas + nn, r, ierr) == 1) {
      if (*ierr != impl::kErrNotConverged) return 1;
      *ierr = 0;
      break;
    }
    r[j] = bound;
    // (4) Outside another face by more than 1e-12: the curve leaves there first; the
    // corrected point is the next far end.
    bool other = false;
    for (std::int32_t i = 0; i < nn; ++i) {
      if (i != j && (r[i] < box[i] - kFaceSlack || r[i] > box[nn + i] + kFaceSlack)) other = true;
    }
    if (other) {
      copy(nn, r, far);
      continue;
    }
    // (5) On the curve when the residuals' sum of squares is at most eps (inclusive); else
    // the corrected point is the next far end.
    double res[kMaxN];
    if (fct(ctx, &kOne, r, &kReqResiduals, res, ierr) == 1) return 1;
    double sum = 0.0;
    for (std::int32_t k = 0; k < nn - 1; ++k) sum += res[k] * res[k];
    if (sum <= *eps) {
      found = true;
    } else {
      copy(nn, r, far);
    }
  }
  if (!found) {
    *status = kNotFound;
    march->f = march->f * kHalf;
    return 0;
  }
  // (6) Ahead of the current point: (r - x) . t >= 0. The tangent at r is computed either way
  // (a point without tangent, 4710, is no error here).
  double step[kMaxN];
  for (std::int32_t i = 0; i < nn; ++i) step[i] = r[i] - x[i];
  *status = dot(nn, step, march->t) < 0.0 ? kNotFound : kFound;
  double tan[kMaxN];
  if (ynumde(ctx, n, fct, &kOne, r, &kReqTangent, tan, ierr) == 1) {
    if (*ierr != impl::kErrDegenerate) return 1;
    *ierr = 0;
  }
  if (*status == kFound) {
    copy(nn, r, xend);
  } else {
    march->f = march->f * kHalf;
  }
  return 0;
}

std::int32_t wnccar(void* ctx, const std::int32_t* n, Orvq7PathFct fct, const double* xd,
                    const double* xkeep, const double* pas, const Orvq7PathOptions* options,
                    const double* limits, const double* tol, std::int32_t* special,
                    Orvq7PathMarch* march, std::int32_t* redo, std::int32_t* accepted,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (check_n(nn, ierr) == 1) return 1;
  *ierr = 0;
  // (1) Step s = xkeep - x and its length.
  double s[kMaxN];
  for (std::int32_t i = 0; i < nn; ++i) s[i] = xkeep[i] - march->x[i];
  const double len = std::sqrt(dot(nn, s, s));
  // (2) Stored as a new point, unless an end point lies within the minimum steps (all |s_i|
  // <= pas(i,1)) of a path holding two points or more: it then replaces the last one.
  bool beyond_min = false, beyond_max = false;
  for (std::int32_t i = 0; i < nn; ++i) {
    if (std::fabs(s[i]) > pas[i]) beyond_min = true;
    if (std::fabs(s[i]) > pas[nn + i]) beyond_max = true;
  }
  *accepted = (*special == 0 || beyond_min || march->nstored < 2) ? 1 : 2;
  // (3) Longer than a maximum step (strict): redo with 0.75 of the step factor.
  if (beyond_max) {
    *redo = 1;
    march->f = kRetry * march->f;
    *special = 0;
    return 0;
  }
  // (4)-(5) Closed: advance to x0 with the tangent d0.
  *redo = 0;
  if (*special == 2) {
    copy(nn, march->t, march->tprev);
    copy(nn, xd, march->x);
    copy(nn, xd + nn, march->t);
    march->hprev = march->f * march->h;
    march->close_prev = march->close;
    return 0;
  }
  // (6) Tangent at xkeep (and the curve's second derivative at order level 1). No tangent
  // there (4710): the current tangent goes on and c is kept.
  double tan[2 * kMaxN];
  bool second = options->order == 1;
  if (ynumde(ctx, n, fct, &kOne, xkeep, &march->treq, tan, ierr) == 1) {
    if (*ierr != impl::kErrDegenerate) return 1;
    *ierr = 0;
    copy(nn, march->t, tan);
    second = false;
  }
  // (7) Step test: a rejected step is redone with 0.75 of the step factor.
  double turn = 0.0;
  if (wncver(n, s, march->t, tan, options, limits, tol, redo, &turn, ierr) == 1) return 1;
  if (*redo != 0) {
    march->f = kRetry * march->f;
    *special = 0;
    return 0;
  }
  // (8) Keep the orientation (strict: a zero product keeps the tangent as computed).
  if (turn < 0.0) {
    for (std::int32_t i = 0; i < nn; ++i) tan[i] = -tan[i];
  }
  // (9) Advance.
  copy(nn, march->t, march->tprev);
  copy(nn, tan, march->t);
  copy(nn, xkeep, march->x);
  march->hprev = march->f * march->h;
  march->close_prev = march->close;
  if (second) {
    copy(nn, tan + nn, march->c);
  } else if (options->order == 2 && len > kShortStep) {
    for (std::int32_t i = 0; i < nn; ++i) march->c[i] = (march->t[i] - march->tprev[i]) / len;
  }
  return 0;
}

std::int32_t wncver(const std::int32_t* n, const double* step, const double* t, const double* tnew,
                    const Orvq7PathOptions* options, const double* limits, const double* tol,
                    std::int32_t* redo, double* dot_out, std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (check_n(nn, ierr) == 1) return 1;
  *ierr = 0;
  *redo = 0;
  // (1) dot = t . tnew.
  const double d = dot(nn, t, tnew);
  *dot_out = d;
  // (2) Turn test against the cosine limit (strict): |dot| for flag 18 = 1, dot itself for 2,
  // none for 0.
  const double limit = limits[1];
  if ((options->flag18 == 1 && std::fabs(d) < limit) || (options->flag18 == 2 && d < limit)) {
    *redo = 1;
    return 0;
  }
  // (3) K = 4: distance between chord and curve, from the two tangents in units of the
  // tolerance: D_i = ((L / 8) (t_i / |t| - sigma tnew_i)) / tol_i, L = |step|, sigma = -1
  // when dot < 0 (the new tangent then points back), tol_i = tol(i) or tol(1). Rejected
  // (redo 2) when the sum of D_i^2 exceeds 1 (strict).
  if (options->kind == 4) {
    const double len = std::sqrt(dot(nn, step, step));
    const double tlen = std::sqrt(dot(nn, t, t));
    const double sigma = d < 0.0 ? -1.0 : 1.0;
    double q = 0.0;
    for (std::int32_t i = 0; i < nn; ++i) {
      const double ti = tlen > 0.0 ? t[i] / tlen : t[i];
      const double tol_i = options->per_unknown == 1 ? tol[i] : tol[0];
      const double di = ((len / kSagittaDivisor) * (ti - sigma * tnew[i])) / tol_i;
      q += di * di;
    }
    if (q > 1.0) *redo = 2;
  }
  return 0;
}

}  // extern "C"
