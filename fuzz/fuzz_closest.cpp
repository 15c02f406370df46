// fuzz/fuzz_closest.cpp -- closest points, frame coordinates and nearest searches in
// dimension n, driven by arbitrary bytes: codes, untouched outputs, parameters within their
// ranges, and the documented sums (from the first term, by increasing index) recomputed.
#include <cmath>
#include <cstdint>
#include <vector>

#include "closest/closest_api.h"
#include "fuzz_support.h"

namespace fuzz {
namespace {

std::size_t len(std::int32_t n) { return n > 0 ? static_cast<std::size_t>(n) : 0; }
bool in_unit(double t) { return t >= 0 && t <= 1; }

// Points as columns: arbitrary, or with some columns repeated (degenerate segments) or on
// one line (parallel segments).
double* columns(Input& in, Args& a, std::size_t n, std::size_t m) {
  double* p = a.raw(n * m);
  const std::uint8_t kind = in.byte() % 4;
  for (std::size_t k = 0; k < n * m; ++k) p[k] = in.real();
  for (std::size_t j = 1; j < m && kind; ++j)
    for (std::size_t i = 0; i < n; ++i) {
      if (kind == 1 && (in.byte() & 1)) p[i + j * n] = p[i + (j - 1) * n];
      if (kind == 2) p[i + j * n] = p[i] + static_cast<double>(j) * 0.5 * p[i + n];
    }
  a.seal(p, n * m);
  return p;
}

void fuzz_ynoall(Input& in) {
  Case a(in, "ynoall");
  const std::int32_t n = in.count(2, 6);
  const std::size_t sn = len(n);
  const double* segs = columns(in, a, sn, 4);  // P1, P2, Q1, Q2
  double* o = a.out(3);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynoall(a.i32(n), segs, segs + 2 * sn, &o[0], &o[1], &o[2], &ierr);
  check_code("ynoall", r, ierr, {0, 4712, 4717});
  if (n < 2) {
    FUZZ_CHECK("ynoall", ierr == 4712 && all_sentinel(o, 3));
  } else {
    FUZZ_CHECK("ynoall", none_sentinel(o, 3) && !(o[0] < 0));
    // A unique pair lies on the segments. The middle of a parallel overlap (4717) comes from
    // projections: with segments parallel only within the 1e-12 test, or by rounding, they
    // may fall a little outside; squared lengths that overflow make them NaN.
    bool tame = true;
    for (std::size_t k = 0; k < 4 * sn; ++k) tame = tame && std::fabs(segs[k]) < 1e150;
    if (tame && ierr == 0) FUZZ_CHECK("ynoall", in_unit(o[1]) && in_unit(o[2]));
    if (tame) FUZZ_CHECK("ynoall", std::isfinite(o[1]) && std::isfinite(o[2]));
  }
  a.done();
}

// ynoaot, ynraoo, ynjont: the frame sums recomputed in their stated order.
void fuzz_frames(Input& in, int which) {
  const std::int32_t n = in.count(1, 5), k = in.count(0, n > 0 && n < 6 ? n : 5);
  const std::size_t sn = len(n), sk = len(k);
  const bool ok = n >= 1 && k >= 0 && k <= n;
  if (which == 0) {
    Case a(in, "ynoaot");
    const double *x = a.reals(sn), *y = a.reals(sn), *u = a.reals(ok ? sn * sk : 0);
    double *d2 = a.out(1), *cc = a.out(ok ? sk : 0);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynoaot(a.i32(n), a.i32(k), x, y, u, d2, cc, &ierr);
    FUZZ_CHECK("ynoaot", ierr == (ok ? 0 : 4712) && r == (ok ? 0 : 1));
    if (ok) {
      for (std::size_t j = 0; j < sk; ++j) {
        double s = (x[0] - y[0]) * u[j * sn];
        for (std::size_t i = 1; i < sn; ++i) s += (x[i] - y[i]) * u[i + j * sn];
        FUZZ_CHECK("ynoaot", alike(cc[j], s));
      }
      double want = 0;
      for (std::size_t i = 0; i < sn; ++i) {
        double ri = x[i] - y[i];
        for (std::size_t j = 0; j < sk; ++j) ri = ri - cc[j] * u[i + j * sn];
        want = i == 0 ? ri * ri : want + ri * ri;
      }
      FUZZ_CHECK("ynoaot", alike(*d2, want));
    } else {
      FUZZ_CHECK("ynoaot", is_sentinel(*d2));
    }
    a.done();
  } else if (which == 1) {
    Case a(in, "ynraoo");
    const double *cc = a.reals(ok ? sk : 0), *y = a.reals(sn), *u = a.reals(ok ? sn * sk : 0);
    double* x = a.out(sn);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynraoo(a.i32(n), a.i32(k), cc, y, u, x, &ierr);
    FUZZ_CHECK("ynraoo", ierr == (ok ? 0 : 4712) && r == (ok ? 0 : 1));
    for (std::size_t i = 0; i < sn; ++i) {
      double want = y[i];
      for (std::size_t j = 0; j < sk && ok; ++j) want = want + cc[j] * u[i + j * sn];
      FUZZ_CHECK("ynraoo", ok ? alike(x[i], want) : is_sentinel(x[i]));
    }
    a.done();
    std::int32_t e2 = -1;  // x may be y itself
    if (ok) same_when_aliased("ynraoo", y, sn, x, sn, [&](double* v) { ynraoo(&n, &k, cc, v, u, v, &e2); });
  } else {
    Case a(in, "ynjont");
    const std::int32_t m = in.count(1, 5), kk = in.count(0, 4);
    const bool good = n >= 1 && m >= 1;
    const std::size_t sm = good ? len(m) : 0, skk = good ? len(kk) : 0;
    const double *p = a.reals(sn * sm), *y = a.reals(sn), *u = a.reals(sn * skk);
    double* co = a.out(skk * sm);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynjont(a.i32(n), a.i32(m), p, a.i32(kk), y, u, co, &ierr);
    FUZZ_CHECK("ynjont", ierr == (good ? 0 : 4712) && r == (good ? 0 : 1));
    for (std::size_t j = 0; j < sm; ++j)
      for (std::size_t i = 0; i < skk; ++i) {
        double s = (p[j * sn] - y[0]) * u[i * sn];
        for (std::size_t l = 1; l < sn; ++l) s += (p[l + j * sn] - y[l]) * u[l + i * sn];
        FUZZ_CHECK("ynjont", alike(co[i + j * skk], s));
      }
    a.done();
  }
}

double dot_from_first(std::size_t n, const double* x, const double* y) {
  double s = x[0] * y[0];
  for (std::size_t i = 1; i < n; ++i) s += x[i] * y[i];
  return s;
}

void fuzz_ynoapl(Input& in) {
  Case a(in, "ynoapl");
  const std::int32_t n = in.count(1, 6);
  const std::size_t sn = len(n);
  const double* x = a.reals(sn);
  const double* seg = columns(in, a, sn, 2);
  double* o = a.out(2);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynoapl(a.i32(n), x, seg, &o[0], &o[1], &ierr);
  if (n < 1) {
    FUZZ_CHECK("ynoapl", r == 1 && ierr == 4712 && all_sentinel(o, 2));
  } else {
    std::vector<double> xs(sn), d(sn);
    for (std::size_t i = 0; i < sn; ++i) xs[i] = x[i] - seg[i], d[i] = seg[sn + i] - seg[i];
    const double p = dot_from_first(sn, xs.data(), d.data());
    const double l = dot_from_first(sn, d.data(), d.data());
    double t;
    std::int32_t code = 0;
    if (p < 0) t = 0;
    else if (l <= 1e-15) t = 0.5, code = 4717;
    else if (p > l) t = 1;
    else t = p / l;
    FUZZ_CHECK("ynoapl", ierr == code && r == (code ? 1 : 0) && alike(o[1], t));
    FUZZ_CHECK("ynoapl", !is_sentinel(o[0]) && !(o[0] < 0));
  }
  a.done();
}

void fuzz_ynoal2(Input& in) {
  Case a(in, "ynoal2");
  const std::int32_t n = in.count(2, 6);
  const std::size_t sn = len(n);
  const double* seg = columns(in, a, sn, 2);
  double* line = a.raw(2 * sn);
  for (std::size_t k = 0; k < 2 * sn; ++k) line[k] = in.real();
  if (sn && (in.byte() & 1)) {  // a unit direction
    for (std::size_t k = 0; k < sn; ++k) line[k] = 0;
    line[in.byte() % sn] = (in.byte() & 1) ? 1.0 : -1.0;
  }
  a.seal(line, 2 * sn);
  double* o = a.out(3);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynoal2(a.i32(n), seg, line, &o[0], &o[1], &o[2], &ierr);
  check_code("ynoal2", r, ierr, {0, 4712, 4717});
  if (n < 2) FUZZ_CHECK("ynoal2", ierr == 4712 && all_sentinel(o, 3));
  else FUZZ_CHECK("ynoal2", none_sentinel(o, 3) && in_unit(o[1]) && (ierr == 0 || o[1] == 0.5));
  a.done();
}

// ynoaon, ynoaod; point mode recomputed: squared distances from the first term, the first
// strictly nearer candidate wins, the box filter of ynoaod applied first.
void fuzz_nearest(Input& in, int which) {
  const char* name = which == 0 ? "ynoaon" : "ynoaod";
  Case a(in, name);
  const std::int32_t n = in.count(1, 5), m = in.count(2, 7);
  const std::int32_t modes[4] = {8466, 8467, 0, 100000};
  const std::int32_t mode = (in.byte() & 7) ? modes[in.byte() & 3] : in.int32();
  const bool ok = n >= 1 && m >= 2;
  const std::size_t sn = len(n), sm = ok ? len(m) : 0;
  const double* x = a.reals(sn);
  const double* p = columns(in, a, sn, sm);
  const double* r2 = which ? a.reals(1) : nullptr;
  const double* tol = which ? a.reals(1) : nullptr;
  double* o = a.out(2);  // dist2, t
  std::int32_t* index = a.out_i32();
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r =
      which == 0 ? ynoaon(a.i32(n), x, a.i32(m), p, a.i32(mode), &o[0], index, &o[1], &ierr)
                 : ynoaod(a.i32(n), x, a.i32(m), p, a.i32(mode), r2, tol, &o[0], index, &o[1], &ierr);
  if (!ok) {
    FUZZ_CHECK(name, r == 1 && ierr == 4712 && all_sentinel(o, 2) && *index == kSentinelInt);
  } else {
    FUZZ_CHECK(name, r == 0 && ierr == 0 && none_sentinel(o, 2));
    const bool polyline = mode >= 8467;
    if (!polyline) {
      const double start = which ? *r2 : 1e60;
      const double h = n == 3 && which ? std::sqrt(*r2) + *tol : which ? *r2 : 0;
      double best = start;
      std::int32_t at = 0;
      for (std::size_t j = 0; j < sm; ++j) {
        const double* q = p + j * sn;
        bool skip = false;
        for (std::size_t i = 0; i < sn && which; ++i) skip = skip || q[i] > x[i] + h || q[i] < x[i] - h;
        if (skip) continue;
        double d = (q[0] - x[0]) * (q[0] - x[0]);
        for (std::size_t i = 1; i < sn; ++i) d += (q[i] - x[i]) * (q[i] - x[i]);
        if (d < best) best = d, at = static_cast<std::int32_t>(j) + 1;
      }
      FUZZ_CHECK(name, alike(o[0], best) && same(o[1], 0.0));
      FUZZ_CHECK(name, *index == (at ? at : kSentinelInt));
    } else {
      FUZZ_CHECK(name, in_unit(o[1]));
      FUZZ_CHECK(name, (*index >= 1 && *index < m) || (which ? *index == 0 : *index == kSentinelInt));
    }
  }
  a.done();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  const int sel = in.byte() % 8;
  switch (sel) {
    case 0: fuzz_ynoall(in); break;
    case 1: case 2: case 3: fuzz_frames(in, sel - 1); break;
    case 4: fuzz_ynoapl(in); break;
    case 5: fuzz_ynoal2(in); break;
    default: fuzz_nearest(in, sel - 6); break;
  }
  return 0;
}

}  // namespace fuzz
