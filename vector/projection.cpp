// vector/projection.cpp -- projections onto lines and planes of space and the implicit
// equation of a plane: xptln, xptpln, eqcarp, provec, xptpl1.
// Plane: a 3-by-3 array by columns whose rows are the origin O = (a1, a4, a7), the first
// direction U = (a2, a5, a8) and the second direction V = (a3, a6, a9). Line: a unit
// direction D, then a point Q.
#include <cmath>
#include <cstdint>

#include "frame/tolerances.h"
#include "vector/vector_api.h"

namespace {

// Bands of the normalising factor: above kSqrtBand the square root; above kSeriesBand the
// second-order series; at or below it the first-order one.
constexpr double kSqrtBand = 3e-8;
constexpr double kSeriesBand = 1e-10;

// ---- State of xptpln kept between calls, one copy per thread ----
//   normal, constant  the plane of the last call (N . X = d); no later call reads them
struct XptplnState {
  double normal[3] = {};
  double constant = 0.0;
};
thread_local XptplnState s_xptpln;

// ---- State of xptpl1 kept between calls, one copy per thread ----
//   normal, constant  as for xptpln
struct Xptpl1State {
  double normal[3] = {};
  double constant = 0.0;
};
thread_local Xptpl1State s_xptpl1;

// The body shared by eqcarp and provec: the unit normal n and q = n . O. Returns false for
// a degenerate plane (s < e^2, strict), leaving n and q unset.
bool unit_normal(const double* pl, double n[3], double* q) {
  const double o[3] = {pl[0], pl[3], pl[6]};
  const double u[3] = {pl[1], pl[4], pl[7]};
  const double v[3] = {pl[2], pl[5], pl[8]};
  // (1) N = U x V.
  double n1 = u[1] * v[2] - u[2] * v[1];
  double n2 = u[2] * v[0] - u[0] * v[2];
  double n3 = u[0] * v[1] - u[1] * v[0];
  // (2) Degenerate when s < e^2, e = tolerance 12, read now.
  const double s = n1 * n1 + n2 * n2 + n3 * n3;
  const double e = impl::tol(12);
  if (s < e * e) return false;
  // (3) Three bands, both tests strict (|s - 1| = 3e-8 takes the series).
  const double ds = s - 1.0;
  double f;
  if (std::fabs(ds) > kSqrtBand) {
    f = 1.0 / std::sqrt(s);
  } else if (std::fabs(ds) > kSeriesBand) {
    f = 1.0 + ds * (-0.5 + 0.375 * ds);
  } else {
    f = 1.0 - 0.5 * ds;
  }
  // (4) Scale, then q = (N1 O1 + N2 O2) + N3 O3.
  n1 = f * n1;
  n2 = f * n2;
  n3 = f * n3;
  n[0] = n1;
  n[1] = n2;
  n[2] = n3;
  *q = n1 * o[0] + n2 * o[1] + n3 * o[2];
  return true;
}

// P' = P + t N with t = (d - N . P) / (N . N); N and d from provec.
void project_on_plane(const double* p, const double* pl, double n[3], double* d, double pp[3]) {
  provec(pl, n, d);
  const double t = (*d - prosca(n, p)) / prosca(n, n);
  for (int i = 0; i < 3; ++i) pp[i] = p[i] + t * n[i];
}

}  // namespace

extern "C" {

std::int32_t xptln(const double* p, const double* l, double* pp) {
  // t = (P - Q) . D; P' = Q + t D. D is taken as unit, unchecked.
  const double* dir = l;
  const double* q = l + 3;
  const double pq[3] = {p[0] - q[0], p[1] - q[1], p[2] - q[2]};
  const double t = prosca(pq, dir);
  const double out[3] = {q[0] + t * dir[0], q[1] + t * dir[1], q[2] + t * dir[2]};
  pp[0] = out[0];
  pp[1] = out[1];
  pp[2] = out[2];
  return 0;
}

std::int32_t xptpln(const double* p, const double* pl, double* pp, std::int32_t* status) {
  double out[3];
  project_on_plane(p, pl, s_xptpln.normal, &s_xptpln.constant, out);
  pp[0] = out[0];
  pp[1] = out[1];
  pp[2] = out[2];
  *status = 0;
  return 0;
}

std::int32_t eqcarp(const double* pl, double* a, double* b, double* c, double* d) {
  double n[3], q;
  if (!unit_normal(pl, n, &q)) {
    *a = 0.0;
    *b = 0.0;
    *c = 0.0;
    *d = 0.0;
    return 0;
  }
  *a = n[0];
  *b = n[1];
  *c = n[2];
  *d = 0.0 - q;  // not -q: a plane through the global origin gives d = +0
  return 0;
}

std::int32_t provec(const double* pl, double* nv, double* p) {
  double n[3], q;
  if (!unit_normal(pl, n, &q)) {
    n[0] = 0.0;
    n[1] = 0.0;
    n[2] = 0.0;
    q = 0.0;
  }
  nv[0] = n[0];
  nv[1] = n[1];
  nv[2] = n[2];
  *p = q;
  return 0;
}

std::int32_t xptpl1(const double* p, const double* pl, double* pp, double* uv) {
  // (1)-(2) The projection, as xptpln.
  double out[3];
  project_on_plane(p, pl, s_xptpl1.normal, &s_xptpl1.constant, out);
  // (3) Coordinates in the plane's frame: (P' - O) . U and (P' - O) . V.
  const double rel[3] = {out[0] - pl[0], out[1] - pl[3], out[2] - pl[6]};
  const double u[3] = {pl[1], pl[4], pl[7]};
  const double v[3] = {pl[2], pl[5], pl[8]};
  const double cu = prosca(rel, u), cv = prosca(rel, v);
  pp[0] = out[0];
  pp[1] = out[1];
  pp[2] = out[2];
  uv[0] = cu;
  uv[1] = cv;
  return 0;
}

}  // extern "C"
