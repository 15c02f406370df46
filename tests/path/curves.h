// tests/path/curves.h -- evaluation routines of known curves, path records and result reading
// for the path tests.
#pragma once
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <vector>

#include "path/path_state.h"
#include "support/recording_services.h"

// The system evaluated, its parameter, and what the solver asked of it.
struct Curve {
  enum Kind {
    kCircle,       // n = 2: x^2 + y^2 - p
    kSpherePlane,  // n = 3: x^2 + y^2 + z^2 - 1, p * z
    kCircle4,      // n = 4: x1^2 + x2^2 - 1, x3, x4
    kLinear,       // any n: F_k = x_k, k = 1..n-1
    kEllipse,      // n = 2: x^2 / p + y^2 - 1
    kViviani,      // n = 3: x^2 + y^2 + z^2 - 4, (x - 1)^2 + y^2 - 1
    kCircleN,      // any n: x1^2 + x2^2 - p, x3, ..., xn
  };
  Curve(Kind k, std::int32_t dim, double param = 1.0) : kind(k), n(dim), p(param) {}
  Kind kind;
  std::int32_t n;
  double p;
  std::int32_t fail_code = 0;     // when non-zero, calls from number fail_after on (from 0)
  std::size_t fail_after = 0;     // fail with it
  std::size_t poison_after = ~std::size_t{0};  // calls from this number on return `poison`
  double poison = 0.0;                         // in every value they write
  std::vector<std::int32_t> reqs;
  std::vector<std::int32_t> npts;
};

// Six-argument evaluation routine over a Curve context.
inline std::int32_t eval_curve(void* ctx, const std::int32_t* npts, const double* x,
                               const std::int32_t* req, double* out, std::int32_t* ierr) {
  Curve& c = *static_cast<Curve*>(ctx);
  c.reqs.push_back(*req);
  c.npts.push_back(*npts);
  const std::size_t call = c.reqs.size() - 1;
  if (c.fail_code != 0 && call >= c.fail_after) {
    *ierr = c.fail_code;
    return 1;
  }
  const std::int32_t n = c.n, m = n - 1;
  for (std::int32_t pt = 0; pt < *npts; ++pt) {
    const double* y = x + n * pt;
    std::vector<double> f(m, 0.0), jac(m * n, 0.0), hes(m * n * n, 0.0);
    auto J = [&](int k, int i) -> double& { return jac[k + m * i]; };
    auto H = [&](int k, int i, int j) -> double& { return hes[k + m * (i + n * j)]; };
    switch (c.kind) {
      case Curve::kCircle:
        f[0] = y[0] * y[0] + y[1] * y[1] - c.p;
        J(0, 0) = 2 * y[0], J(0, 1) = 2 * y[1];
        H(0, 0, 0) = 2, H(0, 1, 1) = 2;
        break;
      case Curve::kSpherePlane:
        f[0] = y[0] * y[0] + y[1] * y[1] + y[2] * y[2] - 1, f[1] = c.p * y[2];
        for (int i = 0; i < 3; ++i) J(0, i) = 2 * y[i], H(0, i, i) = 2;
        J(1, 2) = c.p;
        break;
      case Curve::kCircle4:
        f[0] = y[0] * y[0] + y[1] * y[1] - 1, f[1] = y[2], f[2] = y[3];
        J(0, 0) = 2 * y[0], J(0, 1) = 2 * y[1], J(1, 2) = 1, J(2, 3) = 1;
        H(0, 0, 0) = 2, H(0, 1, 1) = 2;
        break;
      case Curve::kLinear:
        for (int k = 0; k < m; ++k) f[k] = y[k], J(k, k) = 1;
        break;
      case Curve::kEllipse:
        f[0] = y[0] * y[0] / c.p + y[1] * y[1] - 1;
        J(0, 0) = 2 * y[0] / c.p, J(0, 1) = 2 * y[1];
        H(0, 0, 0) = 2 / c.p, H(0, 1, 1) = 2;
        break;
      case Curve::kViviani:
        f[0] = y[0] * y[0] + y[1] * y[1] + y[2] * y[2] - 4;
        f[1] = (y[0] - 1) * (y[0] - 1) + y[1] * y[1] - 1;
        for (int i = 0; i < 3; ++i) J(0, i) = 2 * y[i], H(0, i, i) = 2;
        J(1, 0) = 2 * (y[0] - 1), J(1, 1) = 2 * y[1];
        H(1, 0, 0) = 2, H(1, 1, 1) = 2;
        break;
      case Curve::kCircleN:
        f[0] = y[0] * y[0] + y[1] * y[1] - c.p;
        J(0, 0) = 2 * y[0], J(0, 1) = 2 * y[1];
        H(0, 0, 0) = 2, H(0, 1, 1) = 2;
        for (int k = 1; k < m; ++k) f[k] = y[k + 1], J(k, k + 1) = 1;
        break;
    }
    if (call >= c.poison_after) {
      for (auto* v : {&f, &jac, &hes}) std::fill(v->begin(), v->end(), c.poison);
    }
    if (*req & 1) out = std::copy(f.begin(), f.end(), out);
    if (*req & 2) out = std::copy(jac.begin(), jac.end(), out);
    if (*req & 4) out = std::copy(hes.begin(), hes.end(), out);
  }
  *ierr = 0;
  return 0;
}

// The records of one path, decoded by wnccmd for n unknowns with step bounds
// (0.001, 0.25) and tolerance 0.01.
struct PathRecords {
  PathRecords(std::int32_t n, std::int32_t mode, std::int32_t store, std::int32_t variant = 1)
      : dim(n) {
    for (std::int32_t i = 0; i < n; ++i) pas[i] = 0.001, pas[n + i] = 0.25, tol[i] = 0.01;
    result =
        wnccmd(&dim, pas, &mode, tol, &store, &variant, &options, limits, &layout, pairs, &ierr);
  }
  std::int32_t dim;
  double pas[40] = {};
  double tol[20] = {};
  Orvq7PathOptions options{};
  double limits[2] = {};
  Orvq7PathLayout layout{};
  std::int32_t pairs[22] = {};
  Orvq7PathMarch march{};
  Orvq7PathTables tables{};
  std::int32_t itab = 0;
  std::int32_t ierr = -1;
  std::int32_t result = -1;
};

// The entries of the quantity of a record kind in a result, as raw 8-byte slots (an integer
// quantity's values are read as int32 from the bytes). count receives the triple's count.
inline std::vector<unsigned char> read_kind(std::int32_t itab, std::int32_t kind,
                                            std::int32_t* count) {
  std::int32_t h = 0, ierr = 0, esize = 0, entries = 0, first = 1;
  if (yncrea(&itab, &kind, &h, count, &ierr) == 1 || h == 0) return {};
  if (yutinf(&h, &esize, &entries, &ierr) == 1) return {};
  std::vector<unsigned char> bytes(static_cast<std::size_t>(esize) * entries);
  if (yutrea(&h, &first, &entries, bytes.data(), &ierr) == 1) return {};
  return bytes;
}
template <class T>
T value_at(const std::vector<unsigned char>& bytes, std::size_t k) {
  T v;
  std::memcpy(&v, bytes.data() + k * sizeof(T), sizeof(T));
  return v;
}
