// fitting/mean_plane.cpp -- mean planes and mean lines of point sets by principal axes:
// solmpr, clvcpr, drmoyn, plmoyn, ecrdrt. Points are the columns of a (ld, n) array; the
// scatter matrix is (Sxx, Syy, Szz, Sxy, Sxz, Syz), unscaled sums about the centroid.
#include <cmath>
#include <cstddef>
#include <cstdint>

#include "fitting/fitting_api.h"
#include "frame/status.h"
#include "frame/tolerances.h"
#include "poly/poly_api.h"
#include "vector/vector_api.h"

namespace {

// ---- Status codes kept between the reset on entry and the traceback, one per thread ----
//   code  set to 0 on entry, to the failure's code before the frame is recorded
struct SolmprState {
  std::int32_t code = 0;
};
struct ClvcprState {
  std::int32_t code = 0;
};
struct DrmoynState {
  std::int32_t code = 0;
};
thread_local SolmprState s_solmpr;
thread_local ClvcprState s_clvcpr;
thread_local DrmoynState s_drmoyn;

constexpr std::int32_t kCoincident = 1;  // solmpr: all points within tol / 2 of G
constexpr std::int32_t kMultiple = 1;    // clvcpr: largest minor <= 1e-13
constexpr std::int32_t kNoMinor = 2;     // clvcpr: no minor equals the largest (NaN)
constexpr std::int32_t kPlaneFailed = 1; // drmoyn: solmpr failed
constexpr std::int32_t kLineFailed = 2;  // drmoyn: clvcpr failed
constexpr double kMinorZero = 100.0 * impl::kNegligible;  // 1e-13, inclusive
constexpr std::int32_t kMinLd = 3;

// Point j (from 1) of the (ld, n) array.
const double* point(const double* p, std::int32_t ld, std::int32_t j) {
  return p + static_cast<std::ptrdiff_t>(j - 1) * ld;
}

bool bad_cloud(std::int32_t ld, std::int32_t n) { return n < 1 || ld < kMinLd; }

// S and the three eigenvalues divided by the largest one (which becomes 1).
void scale_by_largest(double* s, double* l) {
  const double big = l[2];
  for (int i = 0; i < 6; ++i) s[i] = s[i] / big;
  for (int i = 0; i < 3; ++i) l[i] = l[i] / big;
}

}  // namespace

extern "C" {

std::int32_t solmpr(const double* p, const std::int32_t* ld, const std::int32_t* n,
                    const double* tol, double* g, double* s, double* l) {
  // (1) Reset; the centroid, sums in point order.
  s_solmpr.code = 0;
  const std::int32_t np = *n, lda = *ld;
  if (bad_cloud(lda, np)) {
    s_solmpr.code = kCoincident;
    impl::trace(s_solmpr.code, " SOLMPR;");
    return 1;
  }
  double sx = 0.0, sy = 0.0, sz = 0.0;
  for (std::int32_t j = 1; j <= np; ++j) {
    const double* pj = point(p, lda, j);
    sx += pj[0];
    sy += pj[1];
    sz += pj[2];
  }
  const double gx = sx / np, gy = sy / np, gz = sz / np;
  // (2) Scatter sums; note any point strictly farther than tol / 2.
  const double half = *tol / 2.0;
  const double r2 = half * half;
  double sxx = 0.0, syy = 0.0, szz = 0.0, sxy = 0.0, sxz = 0.0, syz = 0.0;
  bool spread = false;
  for (std::int32_t j = 1; j <= np; ++j) {
    const double* pj = point(p, lda, j);
    const double dx = pj[0] - gx, dy = pj[1] - gy, dz = pj[2] - gz;
    sxx += dx * dx;
    syy += dy * dy;
    szz += dz * dz;
    sxy += dx * dy;
    sxz += dx * dz;
    syz += dy * dz;
    if ((dx * dx + dy * dy) + dz * dz > r2) spread = true;
  }
  g[0] = gx;
  g[1] = gy;
  g[2] = gz;
  s[0] = sxx;
  s[1] = syy;
  s[2] = szz;
  s[3] = sxy;
  s[4] = sxz;
  s[5] = syz;
  // (3) All points coincide within tolerance.
  if (!spread) {
    s_solmpr.code = kCoincident;
    impl::trace(s_solmpr.code, " SOLMPR;");
    return 1;
  }
  // (4) Characteristic cubic x^3 + c2 x^2 + c1 x + c0 of S / tr.
  const double tr = (sxx + syy) + szz;
  const double a = sxx / tr, b = syy / tr, c = szz / tr;
  const double pp = sxy / tr, qq = sxz / tr, rr = syz / tr;
  const double c2 = -((a + b) + c);
  const double c1 = (b + c) * a + (((b * c - pp * pp) - qq * qq) - rr * rr);
  const double c0 = (rr * rr - b * c) * a + ((b * (qq * qq) + c * (pp * pp)) - ((2.0 * pp) * qq) * rr);
  // (5) Roots by tresor (its code not examined), real parts times tr, increasing order.
  const double cubic[4] = {1.0, c2, c1, c0};
  double roots[6];
  std::int32_t code = 0;
  tresor(cubic, roots, &code);
  for (int i = 0; i < 3; ++i) l[i] = roots[2 * i] * tr;
  const std::int32_t three = 3;
  sorr8(l, &three);
  // (6)
  return 0;
}

std::int32_t clvcpr(const double* s, const double* lambda, double* v) {
  s_clvcpr.code = 0;
  // (1) B = S - lambda I.
  const double a = s[0] - *lambda, b = s[1] - *lambda, c = s[2] - *lambda;
  const double p = s[3], q = s[4], r = s[5];
  // (2)-(3) The 2-by-2 minors and the largest magnitude (scanned m1, m2, m3; a later one
  // replaces only when strictly larger).
  const double m1 = b * c - r * r;
  const double m2 = c * a - q * q;
  const double m3 = b * a - p * p;
  double mx = std::fabs(m1);
  if (std::fabs(m2) > mx) mx = std::fabs(m2);
  if (std::fabs(m3) > mx) mx = std::fabs(m3);
  // (4) Multiple eigenvalue (inclusive).
  if (mx <= kMinorZero) {
    s_clvcpr.code = kMultiple;
    impl::trace(s_clvcpr.code, " CLVCPR;");
    return 1;
  }
  // (5) Cross product of the two rows whose minor is largest, tested m1, m2, m3.
  double w[3];
  if (mx == std::fabs(m1)) {
    w[0] = m1;
    w[1] = r * q - c * p;
    w[2] = r * p - b * q;
  } else if (mx == std::fabs(m2)) {
    w[0] = r * q - c * p;
    w[1] = m2;
    w[2] = q * p - r * a;
  } else if (mx == std::fabs(m3)) {
    w[0] = r * p - b * q;
    w[1] = q * p - r * a;
    w[2] = m3;
  } else {
    s_clvcpr.code = kNoMinor;
    impl::trace(s_clvcpr.code, " CLVCPR;");
    return 1;
  }
  // (6) Unit length.
  const double len = std::sqrt(prosca(w, w));
  v[0] = w[0] / len;
  v[1] = w[1] / len;
  v[2] = w[2] / len;
  return 0;
}

std::int32_t drmoyn(const double* p, const std::int32_t* ld, const std::int32_t* n,
                    const double* tol, double* line) {
  // (1) Reset; fit.
  s_drmoyn.code = 0;
  double g[3], s[6], l[3], dir[3];
  if (solmpr(p, ld, n, tol, g, s, l) == 1) {
    s_drmoyn.code = kPlaneFailed;
  } else {
    // (2) Scale so that the largest eigenvalue is 1; (3) its direction.
    scale_by_largest(s, l);
    if (clvcpr(s, &l[2], dir) == 1) {
      s_drmoyn.code = kLineFailed;
    } else {
      // (4) Direction, then the centroid.
      line[0] = dir[0];
      line[1] = dir[1];
      line[2] = dir[2];
      line[3] = g[0];
      line[4] = g[1];
      line[5] = g[2];
      return 0;
    }
  }
  // (5) Failure.
  impl::trace(s_drmoyn.code, " DRMOYN;");
  return 1;
}

std::int32_t plmoyn(const double* p, const std::int32_t* ld, const std::int32_t* n,
                    const double* tol, double* a, double* b, double* c, double* d, double* e) {
  // (1) Fit.
  const double r2 = (*tol * *tol) / 4.0;
  double g[3], s[6], l[3];
  if (solmpr(p, ld, n, tol, g, s, l) == 1) return 1;
  // (2) Points on a line within tolerance (inclusive).
  const double small_sum = l[0] + l[1];
  if (r2 >= small_sum) return 1;
  // (3) Scale by the largest eigenvalue.
  scale_by_largest(s, l);
  // (4) Possibly collinear: spread about the mean line, written into e. A multiple
  // largest eigenvalue (clvcpr fails) means the points are not near a line.
  if (static_cast<double>(*n) * r2 >= small_sum) {
    double line[6];
    if (clvcpr(s, &l[2], line) == 0) {
      line[3] = g[0];
      line[4] = g[1];
      line[5] = g[2];
      std::int32_t k = 0;
      ecrdrt(p, ld, n, line, e, &k);
      if (r2 >= *e) return 1;
    }
  }
  // (5) Normal: the direction of the smallest eigenvalue.
  double nrm[3];
  if (clvcpr(s, &l[0], nrm) == 1) return 1;
  // (6) Signed heights over the points; hmin and hmax start at 0.
  const double d0 = -prosca(nrm, g);
  double hmin = 0.0, hmax = 0.0;
  const std::int32_t np = *n;
  for (std::int32_t j = 1; j <= np; ++j) {
    const double h = prosca(nrm, point(p, *ld, j)) + d0;
    if (h < hmin) hmin = h;
    if (h > hmax) hmax = h;
  }
  // (7) Centre the plane in the slab.
  *a = nrm[0];
  *b = nrm[1];
  *c = nrm[2];
  *d = d0 - (hmin + hmax) / 2.0;
  *e = (hmax - hmin) / 2.0;
  return 0;
}

void ecrdrt(const double* p, const std::int32_t* ld, const std::int32_t* n, const double* line,
            double* e, std::int32_t* k) {
  // (1)-(2) Largest |w x D|^2, w = Q - P(j); strict '>': the first point wins a tie.
  double best = 0.0;
  std::int32_t kbest = 1;
  const std::int32_t np = *n, lda = *ld;
  if (!bad_cloud(lda, np)) {
    const std::int32_t space = 3;
    for (std::int32_t j = 1; j <= np; ++j) {
      const double* pj = point(p, lda, j);
      const double w[3] = {line[3] - pj[0], line[4] - pj[1], line[5] - pj[2]};
      double cr[3];
      parvis(w, line, cr, &space);
      const double sj = prosca(cr, cr);
      if (sj > best) {
        best = sj;
        kbest = j;
      }
    }
  }
  // (3)
  *e = best;
  *k = kbest;
}

}  // extern "C"
