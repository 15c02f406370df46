// tests/path/curves.h -- curves given as separable quadratics, the records of a path, a path
// traced by ynchem, and the reading of a path's result, for the path tests.
#pragma once
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <vector>

#include "path/path_state.h"
#include "support/recording_services.h"

using Ints = std::vector<std::int32_t>;
using Reals = std::vector<double>;

// n - 1 equations F_k(x) = sum over i of (a_ki x_i + b_ki) x_i - c_k, and what the solver
// asked of them. Calls from number fail_after on fail with fail_code (when non-zero); calls
// from number poison_after on write `poison` into every value.
struct Curve {
  // kCircle: x1^2 + x2^2 = p, x3 = ... = xn = 0; kEllipse: x^2 / p + y^2 = 1 (p a power of 2);
  // kSpherePlane: x^2 + y^2 + z^2 = 1, p z = 0; kViviani: x^2 + y^2 + z^2 = 4,
  // (x - 1)^2 + y^2 = 1; kLinear: x_k = 0 for k = 1..n-1.
  enum Kind { kCircle, kEllipse, kSpherePlane, kViviani, kLinear };
  Curve(Kind kind, std::int32_t dim, double p = 1.0) : n(dim) {
    for (int k = 0; k < n - 1; ++k) b[k][kind == kLinear ? k : k + 1] = 1.0;
    if (kind == kCircle) a[0][0] = a[0][1] = 1.0, b[0][1] = 0.0, c[0] = p;
    if (kind == kEllipse) a[0][0] = 1.0 / p, a[0][1] = 1.0, b[0][1] = 0.0, c[0] = 1.0;
    if (kind == kSpherePlane || kind == kViviani) {
      a[0][0] = a[0][1] = a[0][2] = 1.0, b[0][1] = 0.0, c[0] = kind == kViviani ? 4.0 : 1.0;
      if (kind == kSpherePlane) b[1][2] = p;
      if (kind == kViviani) a[1][0] = a[1][1] = 1.0, b[1][0] = -2.0, b[1][2] = 0.0;
    }
  }
  // The sum of squared residuals at y, in long double (apart from the routines' rounding).
  long double residual2(const double* y) const {
    long double s = 0, f = 0;
    for (int k = 0; k < n - 1; s += f * f, ++k) {
      f = -c[k];
      for (int i = 0; i < n; ++i) f += (a[k][i] * static_cast<long double>(y[i]) + b[k][i]) * y[i];
    }
    return s;
  }
  std::int32_t n;
  double a[20][21] = {}, b[20][21] = {}, c[20] = {};  // room for a refused n = 21
  std::int32_t fail_code = 0;
  std::size_t fail_after = 0, poison_after = ~std::size_t{0};
  double poison = 0.0;
  Ints reqs{}, npts{};
};

// Six-argument evaluation routine over a Curve context.
inline std::int32_t eval_curve(void* ctx, const std::int32_t* npts, const double* x,
                               const std::int32_t* req, double* out, std::int32_t* ierr) {
  Curve& c = *static_cast<Curve*>(ctx);
  c.reqs.push_back(*req), c.npts.push_back(*npts);
  const std::size_t call = c.reqs.size() - 1;
  if (c.fail_code != 0 && call >= c.fail_after) return *ierr = c.fail_code, 1;
  const std::int32_t n = c.n, m = n - 1;
  for (std::int32_t pt = 0; pt < *npts; ++pt) {
    const double* y = x + n * pt;
    double* f = out;
    double* jac = f + (*req & 1 ? m : 0);
    double* hes = jac + (*req & 2 ? m * n : 0);
    out = hes + (*req & 4 ? m * n * n : 0);
    std::fill(f, out, 0.0);
    for (std::int32_t k = 0; k < m; ++k) {
      if (*req & 1) f[k] = -c.c[k];
      for (std::int32_t i = 0; i < n; ++i) {
        if (*req & 1) f[k] += (c.a[k][i] * y[i] + c.b[k][i]) * y[i];
        if (*req & 2) jac[k + m * i] = 2.0 * c.a[k][i] * y[i] + c.b[k][i];
        if (*req & 4) hes[k + m * (i + n * i)] = 2.0 * c.a[k][i];
      }
    }
    if (call >= c.poison_after) std::fill(f, out, c.poison);
  }
  return *ierr = 0;
}

inline std::vector<std::uint64_t> bitsv(const double* v, std::size_t n) {
  std::vector<std::uint64_t> u(n);
  std::transform(v, v + n, u.begin(), bits);
  return u;
}
inline std::vector<std::uint64_t> bitsv(Reals v) { return bitsv(v.data(), v.size()); }

// The records of one path, decoded by wnccmd for n unknowns with step bounds (0.001, 0.25)
// and tolerance 0.01.
struct PathRecords {
  PathRecords(int n, int mode, int store, int var = 1) : dim(n) {
    for (std::int32_t i = 0; i < n; ++i) pas[i] = 0.001, pas[n + i] = 0.25, tol[i] = 0.01;
    result = wnccmd(&dim, pas, &mode, tol, &store, &var, &options, limits, &layout, pairs, &ierr);
  }
  std::int32_t flush(std::int32_t phase, std::int32_t accepted) {
    return wncflu(&phase, &accepted, &options, &layout, &march, &tables, &itab, &ierr);
  }
  std::int32_t dim, pairs[22] = {}, itab = 0, ierr = -1, result = -1;
  double pas[40] = {}, tol[20] = {}, limits[2] = {};
  Orvq7PathOptions options{};
  Orvq7PathLayout layout{};
  Orvq7PathMarch march{};
  Orvq7PathTables tables{};
};

// The values of the quantity of a record kind in a result (an integer quantity read as
// int32); count receives the triple's count. Empty when the kind has no values.
template <class T>
std::vector<T> read_kind(std::int32_t itab, std::int32_t kind, std::int32_t* count = nullptr) {
  std::int32_t h = 0, ierr = 0, esize = 0, entries = 0, first = 1, cnt = 0;
  if (yncrea(&itab, &kind, &h, count ? count : &cnt, &ierr) == 1 || h == 0) return {};
  if (yutinf(&h, &esize, &entries, &ierr) == 1) return {};
  std::vector<T> v(static_cast<std::size_t>(esize) * entries / sizeof(T));
  if (v.empty() || yutrea(&h, &first, &entries, v.data(), &ierr) == 1) return {};
  return v;
}

// A path traced by ynchem from x0 along d0 in the box |x_i| <= half_i (the last half given
// stands for the remaining unknowns), steps (lo, 0.25), tol(1) = tol, and what it left: the
// result, code, frames, and the points with their tangents (kind 23), phases and numbers
// (kinds 1, 2, when stored), read back before the result is released.
struct Path {
  Curve c;
  Reals x0, d0, half = {3.0};
  double lo = 1e-4, tol = 0.01;
  std::int32_t mode = 4, store = 2 + 8, result = -1, ierr = -1, itab = -1, count = 0;
  Reals xt{};
  Ints phase{}, number{};
  std::vector<Frame> frames{};  // recorded by ynchem
  const double* x(std::int32_t j) const { return xt.data() + 2 * c.n * j; }

  void run() {
    const std::int32_t n = c.n;
    Reals xd = x0, box(2 * n), pas(2 * n), tols(n, 0.01);
    xd.insert(xd.end(), d0.begin(), d0.end());
    for (std::int32_t i = 0; i < n; ++i) {
      const double h = half[std::min<std::size_t>(i, half.size() - 1)];
      box[i] = -h, box[n + i] = h, pas[i] = lo, pas[n + i] = 0.25;
    }
    tols[0] = tol;
    const double eps = 1e-20;
    RecordedFrames rec;
    result = ynchem(&c, &c.n, eval_curve, &eps, xd.data(), box.data(), pas.data(), &mode,
                    tols.data(), &store, &itab, &ierr);
    frames = rec.frames();
    if (itab == 0) return;
    xt = read_kind<double>(itab, 23, &count);
    phase = read_kind<std::int32_t>(itab, 1);
    number = read_kind<std::int32_t>(itab, 2);
    std::int32_t code = -1;
    yncend(&itab, &code);
  }
};
