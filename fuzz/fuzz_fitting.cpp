// fuzz/fuzz_fitting.cpp -- mean planes and mean lines of point sets, driven by arbitrary
// bytes: point sets arbitrary, coincident, on a line or on a plane; results, untouched
// outputs and the traceback frames each routine documents.
#include <cmath>
#include <cstdint>
#include <string>
#include <vector>

#include "fitting/fitting_api.h"
#include "fuzz_support.h"

namespace fuzz {
namespace {

const std::string kSolmpr = " SOLMPR;", kClvcpr = " CLVCPR;", kDrmoyn = " DRMOYN;";

// n points of space with leading dimension ld, in an array of exactly (n - 1) ld + 3 reals
// (none when n < 1 or ld < 3): arbitrary, or near one point, a line or a plane.
struct Points {
  std::int32_t ld, n;
  std::size_t size;
  const double* p;
};
Points points(Input& in, Args& a) {
  Points pts;
  pts.ld = in.count(3, 5);
  pts.n = in.count(1, 9);
  pts.size = pts.n >= 1 && pts.ld >= 3 ? std::size_t(pts.n - 1) * std::size_t(pts.ld) + 3 : 0;
  double* p = a.raw(pts.size);
  const std::uint8_t kind = in.byte() % 4;
  double o[3], u[3], v[3];
  for (int k = 0; k < 3; ++k) o[k] = in.real(), u[k] = in.real(), v[k] = in.real();
  for (std::size_t k = 0; k < pts.size; ++k) p[k] = in.real();
  for (std::int32_t j = 0; j < pts.n && pts.size; ++j) {
    double* q = p + std::size_t(j) * std::size_t(pts.ld);
    const double s = in.real(), t = in.real();
    for (int k = 0; k < 3 && kind; ++k) {
      const double noise = (in.byte() & 1) ? q[k] * 1e-9 : 0.0;
      q[k] = o[k] + (kind >= 2 ? s * u[k] : 0.0) + (kind == 3 ? t * v[k] : 0.0) + noise;
    }
  }
  a.seal(p, pts.size);
  pts.p = p;
  return pts;
}

void fuzz_solmpr(Input& in) {
  Case a(in, "solmpr");
  const Points pts = points(in, a);
  const double* tol = a.reals(1);
  double *g = a.out(3), *s = a.out(6), *l = a.out(3);
  const std::int32_t r = solmpr(pts.p, a.i32(pts.ld), a.i32(pts.n), tol, g, s, l);
  const auto fr = frames();
  FUZZ_CHECK("solmpr", r == 0 || r == 1);
  if (r == 0) {
    FUZZ_CHECK("solmpr", fr.empty() && none_sentinel(g, 3) && none_sentinel(s, 6) && none_sentinel(l, 3));
    FUZZ_CHECK("solmpr", !(l[0] > l[1]) && !(l[1] > l[2]));  // increasing (sorr8: NaNs last)
  } else {
    FUZZ_CHECK("solmpr", fr.size() == 1 && fr[0].code == 1 && fr[0].name == kSolmpr);
    FUZZ_CHECK("solmpr", all_sentinel(l, 3));
    if (pts.size == 0) FUZZ_CHECK("solmpr", all_sentinel(g, 3) && all_sentinel(s, 6));
    else FUZZ_CHECK("solmpr", none_sentinel(g, 3) && none_sentinel(s, 6));
  }
  a.done_released();
}

void fuzz_clvcpr(Input& in) {
  Case a(in, "clvcpr");
  double* s = a.raw(6);
  for (int k = 0; k < 6; ++k) s[k] = in.real();
  if (in.byte() & 1) s[3] = s[4] = s[5] = 0.0;  // diagonal: multiple eigenvalues are near
  a.seal(s, 6);
  const double* lambda = (in.byte() & 1) ? a.real(s[in.byte() % 3]) : a.reals(1);
  double* v = a.out(3);
  const std::int32_t r = clvcpr(s, lambda, v);
  const auto fr = frames();
  if (r == 0) {
    FUZZ_CHECK("clvcpr", fr.empty() && none_sentinel(v, 3));
  } else {
    FUZZ_CHECK("clvcpr", r == 1 && all_sentinel(v, 3) && fr.size() == 1);
    FUZZ_CHECK("clvcpr", (fr[0].code == 1 || fr[0].code == 2) && fr[0].name == kClvcpr);
  }
  a.done_released();
}

void fuzz_drmoyn(Input& in) {
  Case a(in, "drmoyn");
  const Points pts = points(in, a);
  const double* tol = a.reals(1);
  double* line = a.out(6);
  const std::int32_t r = drmoyn(pts.p, a.i32(pts.ld), a.i32(pts.n), tol, line);
  const auto fr = frames();
  if (r == 0) {
    FUZZ_CHECK("drmoyn", fr.empty() && none_sentinel(line, 6));
  } else {
    FUZZ_CHECK("drmoyn", r == 1 && all_sentinel(line, 6) && fr.size() == 2);
    FUZZ_CHECK("drmoyn", fr[1].name == kDrmoyn && (fr[1].code == 1 || fr[1].code == 2));
    FUZZ_CHECK("drmoyn", fr[0].name == (fr[1].code == 1 ? kSolmpr : kClvcpr));
  }
  a.done_released();
}

void fuzz_plmoyn(Input& in) {
  Case a(in, "plmoyn");
  const Points pts = points(in, a);
  const double* tol = a.reals(1);
  double* o = a.out(5);  // a, b, c, d, e
  const std::int32_t r = plmoyn(pts.p, a.i32(pts.ld), a.i32(pts.n), tol, &o[0], &o[1], &o[2],
                                &o[3], &o[4]);
  FUZZ_CHECK("plmoyn", r == 0 || r == 1);
  FUZZ_CHECK("plmoyn", r == 0 ? none_sentinel(o, 5) : all_sentinel(o, 4));
  for (const auto& f : frames()) FUZZ_CHECK("plmoyn", f.name == kSolmpr || f.name == kClvcpr);
  a.done_released();
}

void fuzz_ecrdrt(Input& in) {
  Case a(in, "ecrdrt");
  const Points pts = points(in, a);
  const double* line = a.reals(6);
  double* e = a.out(1);
  std::int32_t* k = a.out_i32();
  ecrdrt(pts.p, a.i32(pts.ld), a.i32(pts.n), line, e, k);
  if (pts.size == 0) FUZZ_CHECK("ecrdrt", *e == 0 && *k == 1);
  FUZZ_CHECK("ecrdrt", *k >= 1 && *k <= std::max(pts.n, 1));
  FUZZ_CHECK("ecrdrt", std::isnan(*e) || *e >= 0);
  a.done();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  switch (in.byte() % 5) {
    case 0: fuzz_solmpr(in); break;
    case 1: fuzz_clvcpr(in); break;
    case 2: fuzz_drmoyn(in); break;
    case 3: fuzz_plmoyn(in); break;
    default: fuzz_ecrdrt(in); break;
  }
  return 0;
}

}  // namespace fuzz
