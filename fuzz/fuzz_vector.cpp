// fuzz/fuzz_vector.cpp -- vector primitives, small matrices, transformations of space and of
// the plane, records and elements of the plane, driven by arbitrary bytes. None of these
// routines reports failure, takes workspace or records a frame; outputs not stated as
// written must keep their sentinel, and outputs that may be their inputs must give the same
// bits when they are.
#include <cmath>
#include <cstdint>
#include <cstring>
#include <functional>
#include <vector>

#include "fuzz_support.h"
#include "vector/vector_api.h"

namespace fuzz {
namespace {

constexpr double kTwoPi = 6.283185307179586;

// ---- Vector primitives --------------------------------------------------------------------

void fuzz_products(Input& in, int which) {
  if (which == 0) {
    Case a(in, "prosca");
    const double* x = a.reals(3);
    const double* y = a.reals(3);
    const double r = prosca(x, y);
    const double want = ((0.0 + x[0] * y[0]) + x[1] * y[1]) + x[2] * y[2];
    FUZZ_CHECK("prosca", alike(r, want));
    a.done();
  } else if (which == 1) {
    Case a(in, "promix");
    const double *x = a.reals(3), *y = a.reals(3), *z = a.reals(3);
    const double r1 = promix(x, y, z), r2 = promix(x, y, z);
    FUZZ_CHECK("promix", same(r1, r2));
    a.done();
  } else {
    const char* name = which == 2 ? "parvis" : "parbis";
    Case a(in, name);
    const double *x = a.reals(3), *y = a.reals(3);
    const std::int32_t* dim = a.i32(in.byte() & 1 ? 3 : in.int32());
    double* w = a.out(3);
    const std::int32_t r = which == 2 ? parvis(x, y, w, dim) : parbis(x, y, w, dim);
    FUZZ_CHECK(name, r == 0 && none_sentinel(w, 3));
    if (*dim != 3) {
      FUZZ_CHECK(name, w[0] == 0 && w[1] == 0);
      if (which == 3) FUZZ_CHECK(name, w[2] == 0);
    }
    a.done();
  }
}

void fuzz_norms(Input& in, int which) {
  const std::int32_t n = in.count(1, 12);
  const std::size_t len = n > 0 ? static_cast<std::size_t>(n) : 0;
  if (which == 0) {
    Case a(in, "vor");
    const double* v = len ? a.reals(len) : nullptr;  // n < 1: v is not read
    const double r = vor(v, &n);
    double want = 0.0;
    for (std::size_t k = 0; k < len; ++k) want += v[k] * v[k];
    FUZZ_CHECK("vor", alike(r, want));
    a.done();
  } else {
    Case a(in, "devor");
    double* v = a.raw(len ? len : 0);
    for (std::size_t k = 0; k < len; ++k) v[k] = in.real();
    const std::vector<double> before(v, v + len);
    const double r = devor(len ? v : nullptr, &n);
    double want = 0.0;
    for (std::size_t k = 0; k < len; ++k) want += before[k] * before[k];
    FUZZ_CHECK("devor", alike(r, want));
    if (len == 0 || r == 0.0)
      for (std::size_t k = 0; k < len; ++k) FUZZ_CHECK("devor", same(v[k], before[k]));
    a.done();
  }
}

void fuzz_angles(Input& in, int which) {
  if (which == 0) {
    Case a(in, "parcos");
    const double *c = a.reals(1), *tol = a.reals(1);
    std::int32_t* flag = a.out_i32();
    const double r = parcos(c, tol, flag);
    const double x = *c, t = *tol;
    if (x < -1 - t) FUZZ_CHECK("parcos", *flag == 2 && r == from_bits(0x400921fb54442d18));
    else if (x < -1) FUZZ_CHECK("parcos", *flag == 1 && r == from_bits(0x400921fb54442d18));
    else if (x <= 1) FUZZ_CHECK("parcos", *flag == 0 && same(r, std::acos(x)));
    else if (x <= 1 + t) FUZZ_CHECK("parcos", *flag == 1 && r == 0);
    else FUZZ_CHECK("parcos", *flag == 2 && r == 0);
    a.done();
  } else {
    const char* name = which == 1 ? "darcos" : "darsin";
    Case a(in, name);
    const double* x = a.reals(1);
    const double r = which == 1 ? darcos(x) : darsin(x);
    if (!(std::fabs(*x) <= 1)) FUZZ_CHECK(name, std::isnan(r));
    else FUZZ_CHECK(name, r == (which == 1 ? std::acos(*x) : std::asin(*x)));
    a.done();
  }
}

void fuzz_vectp2(Input& in) {
  Case a(in, "vectp2");
  const double *m = a.reals(4), *lambda = a.reals(1);
  double* v = a.out(2);
  const double r = vectp2(m, lambda, v);
  FUZZ_CHECK("vectp2", none_sentinel(v, 2));
  FUZZ_CHECK("vectp2", std::isnan(r) || r >= 0);
  if (m[1] == 0 && m[2] == 0 && m[0] == *lambda && m[3] == *lambda && std::isfinite(*lambda))
    FUZZ_CHECK("vectp2", r == 0 && v[0] == 0 && v[1] == 0);
  a.done();
}

// ---- Small matrices and transformations of space -------------------------------------------

using Apply3 = std::int32_t (*)(const double*, const double*, const double*, const double*,
                                double*, double*, double*);

void fuzz_apply3(Input& in, int which) {
  static const Apply3 fns[4] = {fmat6, fmat61, fmat8, fmat81};
  static const char* names[4] = {"fmat6", "fmat61", "fmat8", "fmat81"};
  const char* name = names[which];
  Case a(in, name);
  const double* p = a.reals(3);
  const double* t = a.reals(12);
  double* o = a.out(3);
  FUZZ_CHECK(name, fns[which](&p[0], &p[1], &p[2], t, &o[0], &o[1], &o[2]) == 0);
  FUZZ_CHECK(name, none_sentinel(o, 3));
  a.done();
  same_when_aliased(name, p, 3, o, 3, [&](double* b) {
    fns[which](&b[0], &b[1], &b[2], t, &b[0], &b[1], &b[2]);
  });
}

// Per thread, the inverse fmat1 gives back after a singular matrix.
thread_local double t_fmat1_last[9] = {};

void fuzz_matrices(Input& in, int which) {
  switch (which) {
    case 0: {  // fmat3
      Case a(in, "fmat3");
      const double* t = a.reals(12);
      double* b = a.out(12);
      FUZZ_CHECK("fmat3", fmat3(t, b) == 0 && none_sentinel(b, 12));
      a.done();
      same_when_aliased("fmat3", t, 12, b, 12, [&](double* x) { fmat3(x, x); });
      break;
    }
    case 1: {  // fmat4, fmat2
      const bool space = in.byte() & 1;
      const char* name = space ? "fmat4" : "fmat2";
      const std::size_t n = space ? 12 : 6;
      Case a(in, name);
      const double *x = a.reals(n), *y = a.reals(n);
      double* r = a.out(n);
      FUZZ_CHECK(name, (space ? fmat4(x, y, r) : fmat2(x, y, r)) == 0 && none_sentinel(r, n));
      a.done();
      same_when_aliased(name, x, n, r, n, [&](double* b) { space ? fmat4(b, y, b) : fmat2(b, y, b); });
      same_when_aliased(name, y, n, r, n, [&](double* b) { space ? fmat4(x, b, b) : fmat2(x, b, b); });
      break;
    }
    case 2: {  // fmat1: after a singular matrix, the inverse of this thread's last regular one
      Case a(in, "fmat1");
      const double* m = a.reals(9);
      double* b = a.out(9);
      std::int32_t* flag = a.out_i32();
      FUZZ_CHECK("fmat1", fmat1(m, b, flag) == 0 && (*flag == 0 || *flag == 1));
      if (*flag == 1) {
        for (int k = 0; k < 9; ++k) FUZZ_CHECK("fmat1", same(b[k], t_fmat1_last[k]));
      } else {
        FUZZ_CHECK("fmat1", none_sentinel(b, 9));
        std::memcpy(t_fmat1_last, b, sizeof t_fmat1_last);
      }
      a.done();
      break;
    }
    default: {  // inmat3, inmat2 (singular exactly when |a1 a4 - a2 a3| < 1e-6)
      const bool space = which == 3;
      const std::size_t n = space ? 12 : 6;
      const auto inv = space ? inmat3 : inmat2;
      Case a(in, space ? "inmat3" : "inmat2");
      const double* t = a.reals(n);
      double* b = a.out(n);
      std::int32_t* flag = a.out_i32();
      FUZZ_CHECK(a.name, inv(t, b, flag) == 0 && (*flag == 0 || *flag == 1));
      if (!space) FUZZ_CHECK(a.name, *flag == (std::fabs(t[0] * t[3] - t[1] * t[2]) < 1e-6 ? 1 : 0));
      FUZZ_CHECK(a.name, *flag == 1 ? all_sentinel(b, n) : none_sentinel(b, n));
      a.done();
      std::int32_t f2 = -1;
      if (*flag == 0) same_when_aliased(a.name, t, n, b, n, [&](double* x) { inv(x, x, &f2); });
      break;
    }
  }
}

void fuzz_fmat23(Input& in) {
  Case a(in, "fmat23");
  const std::int32_t n = in.count(1, 6), m = in.count(1, 6), p = in.count(1, 6);
  const bool any = n >= 1 && m >= 1 && p >= 1;
  const std::size_t sn = any ? std::size_t(n) : 0, sm = any ? std::size_t(m) : 0,
                    sp = any ? std::size_t(p) : 0;
  const double *x = a.reals(sn * sm), *y = a.reals(sm * sp);
  double* r = a.out(sn * sp);
  FUZZ_CHECK("fmat23", fmat23(a.i32(n), a.i32(m), a.i32(p), x, y, r) == 0);
  FUZZ_CHECK("fmat23", none_sentinel(r, sn * sp));
  a.done();
}

// Positions (from 0) of the first real of every point trapnt transforms; empty when nothing
// is done.
std::vector<std::int64_t> grid_points(std::int32_t dim, std::int32_t nu, std::int32_t ld,
                                      std::int32_t nv) {
  std::vector<std::int64_t> at;
  if (dim != 3 || nu < 1 || nv < 1 || (nv > 1 && ld < 1)) return at;
  for (std::int64_t j = 0; j < nv; ++j)
    for (std::int64_t i = 0; i < nu; ++i) at.push_back((i + j * ld) * 3);
  return at;
}
std::size_t grid_size(const std::vector<std::int64_t>& at) {
  std::int64_t hi = -1;
  for (std::int64_t k : at) hi = std::max(hi, k + 2);
  return static_cast<std::size_t>(hi + 1);
}
// Every point of the grid written, every other real left alone.
void check_grid(const char* name, const double* q, std::size_t size,
                const std::vector<std::int64_t>& at) {
  std::vector<char> covered(size, 0);
  for (std::int64_t k : at) covered[size_t(k)] = covered[size_t(k) + 1] = covered[size_t(k) + 2] = 1;
  for (std::size_t k = 0; k < size; ++k)
    FUZZ_CHECK(name, covered[k] ? !is_sentinel(q[k]) : is_sentinel(q[k]));
}

void fuzz_trapnt(Input& in) {
  Case a(in, "trapnt");
  const double* t = a.reals(12);
  const std::int32_t dim = (in.byte() & 7) ? 3 : in.count(2, 4);
  const std::int32_t nu = in.count(1, 5), nv = in.count(1, 4);
  const std::int32_t ld = in.byte() & 1 ? nu : in.count(-1, 7);
  const auto at = grid_points(dim, nu, ld, nv);
  const std::size_t size = grid_size(at);
  const double* p = a.reals(size);
  double* out = a.out(size);
  FUZZ_CHECK("trapnt", trapnt(t, a.i32(dim), a.i32(nu), a.i32(ld), a.i32(nv), nullptr, p, out) == 0);
  check_grid("trapnt", out, size, at);
  a.done();
  if (ld >= nu || nv == 1)  // points do not overlap: q may be p itself
    same_when_aliased("trapnt", p, size, out, size,
                      [&](double* b) { trapnt(t, &dim, &nu, &ld, &nv, nullptr, b, b); });
}

// Records: a header of 16-bit fields, then the points as reals from byte 16 (curve) or 24
// (surface).
void fuzz_records(Input& in, int which) {
  const bool curve = which == 0;
  const char* name = curve ? "rbctra" : "rbstra";
  Case a(in, name);
  const double* t = a.reals(12);
  std::int16_t hdr[12] = {};
  for (auto& f : hdr) f = static_cast<std::int16_t>(static_cast<std::int8_t>(in.byte()));
  std::int32_t dim, nu, nv;
  if (curve) {
    if (in.byte() & 3) hdr[1] = 3;
    dim = hdr[1], nu = hdr[4], nv = 1;
  } else {
    dim = 3, nu = hdr[6], nv = hdr[7];
    if (nu > 6) nu = hdr[6] = static_cast<std::int16_t>(nu % 7);
    if (nv > 6) nv = hdr[7] = static_cast<std::int16_t>(nv % 7);
  }
  const auto at = grid_points(dim, nu, nu, nv);
  const std::size_t head = curve ? 2 : 3, points = grid_size(at), size = head + points;
  double* rin = a.raw(size);
  std::memcpy(rin, hdr, head * 8);
  for (std::size_t k = head; k < size; ++k) rin[k] = in.real();
  a.seal(rin, size);
  double* rout = a.out(size);
  FUZZ_CHECK(name, (curve ? rbctra(t, rin, rout) : rbstra(t, rin, rout)) == 0);
  FUZZ_CHECK(name, all_sentinel(rout, head));  // the header is not written
  check_grid(name, rout + head, points, at);
  a.done();
  same_when_aliased(name, rin, size, rout, size,
                    [&](double* b) { curve ? rbctra(t, b, b) : rbstra(t, b, b); });
}

void fuzz_headers(Input& in, int which) {
  std::int16_t h[11];
  for (auto& f : h) f = static_cast<std::int16_t>(in.byte() | (in.byte() << 8));
  std::int32_t o[11];
  for (auto& v : o) v = kSentinelInt;
  if (which == 0) {
    Call c("rbclcp");
    FUZZ_CHECK("rbclcp", rbclcp(h, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6]) == 0);
    const int order[7] = {1, 2, 5, 7, 3, 4, 6};
    for (int k = 0; k < 7; ++k) FUZZ_CHECK("rbclcp", o[k] == h[order[k] - 1]);
    c.quiet();
  } else {
    Call c("rbslcp");
    FUZZ_CHECK("rbslcp", rbslcp(h, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6], &o[7],
                                &o[8], &o[9], &o[10]) == 0);
    const int order[11] = {1, 2, 7, 8, 11, 3, 5, 9, 4, 6, 10};
    for (int k = 0; k < 11; ++k) FUZZ_CHECK("rbslcp", o[k] == h[order[k] - 1]);
    c.quiet();
  }
}

void fuzz_planes(Input& in, int which) {
  static const char* names[4] = {"xptln", "xptpln", "eqcarp", "xptpl1"};
  Tolerances tols(in, {12});
  Case a(in, names[which]);
  switch (which) {
    case 0: {
      const double *p = a.reals(3), *l = a.reals(6);
      double* pp = a.out(3);
      FUZZ_CHECK("xptln", xptln(p, l, pp) == 0 && none_sentinel(pp, 3));
      same_when_aliased("xptln", p, 3, pp, 3, [&](double* b) { xptln(b, l, b); });
      break;
    }
    case 1: {
      const double *p = a.reals(3), *pl = a.reals(9);
      double* pp = a.out(3);
      std::int32_t* st = a.out_i32();
      FUZZ_CHECK("xptpln", xptpln(p, pl, pp, st) == 0 && *st == 0 && none_sentinel(pp, 3));
      break;
    }
    case 2: {
      const double* pl = a.reals(9);
      double* o = a.out(4);
      FUZZ_CHECK("eqcarp", eqcarp(pl, &o[0], &o[1], &o[2], &o[3]) == 0 && none_sentinel(o, 4));
      double nv[3], d = -1;
      FUZZ_CHECK("provec", provec(pl, nv, &d) == 0);
      for (int k = 0; k < 3; ++k) FUZZ_CHECK("provec", same(nv[k], o[k]));
      break;
    }
    default: {
      const double *p = a.reals(3), *pl = a.reals(9);
      double *pp = a.out(3), *uv = a.out(2);
      FUZZ_CHECK("xptpl1", xptpl1(p, pl, pp, uv) == 0 && none_sentinel(pp, 3) && none_sentinel(uv, 2));
      double pp2[3];
      std::int32_t st = -1;
      xptpln(p, pl, pp2, &st);
      for (int k = 0; k < 3; ++k) FUZZ_CHECK("xptpl1", same(pp[k], pp2[k]));
      break;
    }
  }
  a.done();
}

// ---- Elements of the plane ------------------------------------------------------------------

bool is_count(double x) { return x >= 0 && x <= 2147483647.0 && x == std::floor(x); }

const std::int32_t kTypes[] = {80, 81, 82, 83, 85, 86, 87, 88, 89, 90, 92, 95, 102, 104,
                               79, 84, 91, 105, 0, 255};

std::int32_t header_word(Input& in) {
  std::int32_t w = kTypes[in.byte() % (sizeof kTypes / sizeof kTypes[0])];
  const std::uint8_t f = in.byte();
  if (f & 1) w |= 0x100;
  if ((f & 6) == 6) w |= static_cast<std::int32_t>(in.raw64()) & ~0x1ff;
  return w;
}

void element(Input& in, std::int32_t hdr, int depth, std::vector<double>& out);

// A shape: m, then m entries (header word, L, L reals), well formed as far as its counts go;
// an entry's reals are either an element of its type or arbitrary reals.
void shape(Input& in, int depth, std::vector<double>& out) {
  const std::uint8_t f = in.byte();
  if ((f & 0x1f) == 0 || depth > 10) {  // a first real that is not a count, or 0 entries
    out.push_back((f & 0x20) ? in.real() : 0.0);
    if (is_count(out.back()) && out.back() != 0) out.back() = -1.0;
    return;
  }
  const int m = f % 4;
  out.push_back(m);
  for (int e = 0; e < m; ++e) {
    const std::int32_t w = header_word(in);
    std::vector<double> body;
    if (in.byte() & 3) element(in, w, depth + 1, body);
    else
      for (int k = in.pick(0, 9); k > 0; --k) body.push_back(in.real());
    const std::uint8_t g = in.byte();
    if ((g & 7) == 0) body.push_back(in.real());  // L longer than the element
    out.push_back(w);
    out.push_back(static_cast<double>(body.size()));
    out.insert(out.end(), body.begin(), body.end());
  }
}

// An element of the type of `hdr` in its layout; a curve's first real may be no count.
void element(Input& in, std::int32_t hdr, int depth, std::vector<double>& out) {
  std::size_t fixed = 0;
  switch (hdr & 0xff) {
    case 80: fixed = 2; break;
    case 81: case 83: fixed = 6; break;
    case 82: fixed = 5; break;
    case 85: case 90: case 95: fixed = 8; break;
    case 86: case 87: case 88: case 92: fixed = 7; break;
    case 104: fixed = (hdr & 0x100) ? 3 : 2; break;
    case 89: {
      const std::uint8_t f = in.byte();
      if ((f & 15) == 0) {
        const double bad[5] = {-1.0, 2.5, NAN, 3e9, INFINITY};
        out.push_back(bad[f % 5 == 0 ? 0 : (f >> 4) % 5]);
        return;
      }
      const int n = f % 7;
      out.push_back(n);
      for (int k = 0; k < 2 * n; ++k) out.push_back(in.real());
      return;
    }
    case 102: shape(in, depth, out); return;
    default: return;  // not handled: no reals
  }
  for (std::size_t k = 0; k < fixed; ++k) out.push_back(in.real());
  if ((hdr & 0xff) == 82 || (hdr & 0xff) == 81)  // make the angles and lengths usual
    if (in.byte() & 1) out[2] = std::fabs(out[2]);
}

// Header words and lengths of a well-formed shape are copied, up to the first real that is
// not a count.
void check_shape_words(const double* s, const double* sp, std::size_t size) {
  if (size == 0 || !is_count(s[0])) return;
  FUZZ_CHECK("tr2sha", same(sp[0], s[0]));
  std::size_t at = 1;
  for (double e = 0; e < s[0] && at + 1 < size; ++e) {
    if (!is_count(s[at + 1]) || s[at] != std::floor(s[at]) || std::fabs(s[at]) > 2147483647.0) return;
    FUZZ_CHECK("tr2sha", same(sp[at], s[at]) && same(sp[at + 1], s[at + 1]));
    at += 2 + static_cast<std::size_t>(s[at + 1]);
  }
}

void fuzz_plane2(Input& in, int which) {
  static const char* names[11] = {"tr2vec", "tr2pt",  "tr2ang", "tr2axs", "tr2cir", "tr2can",
                                  "tr2ln",  "tr2crv", "tr2sha", "traele", "traels"};
  Case a(in, names[which]);
  Tolerances tols(in, {2, 3, 4, 5, 12});
  const double* t = a.reals(6);
  switch (which) {
    case 0: case 1: case 4: case 5: {  // every output written
      using Fn = std::int32_t (*)(const double*, const double*, double*);
      const Fn fn = which == 0 ? tr2vec : which == 1 ? tr2pt : which == 4 ? tr2cir : tr2can;
      const std::size_t n = which < 2 ? 2 : which == 4 ? 5 : 7;
      const double* v = a.reals(n);
      double* o = a.out(n);
      FUZZ_CHECK(a.name, fn(v, t, o) == 0 && none_sentinel(o, n));
      if (which == 5) FUZZ_CHECK(a.name, same(o[0], v[0]));
      same_when_aliased(a.name, v, n, o, n, [&](double* b) { fn(b, t, b); });
      break;
    }
    case 2: {
      const double* ang = a.reals(1);
      const double r = tr2ang(ang, t);
      FUZZ_CHECK("tr2ang", std::isnan(r) || (r >= 0 && r <= kTwoPi));
      break;
    }
    case 3: {  // tr2axs: each direction written whole or left whole
      const double* ax = a.reals(6);
      double* o = a.out(6);
      FUZZ_CHECK("tr2axs", tr2axs(ax, t, o) == 0 && none_sentinel(o + 4, 2));
      for (int d = 0; d < 2; ++d)
        FUZZ_CHECK("tr2axs", is_sentinel(o[2 * d]) == is_sentinel(o[2 * d + 1]));
      same_when_aliased("tr2axs", ax, 6, o, 6, [&](double* b) { tr2axs(b, t, b); });
      break;
    }
    case 6: {  // tr2ln: exactly the parts of the returned bits are written
      const double* l = a.reals(6);
      double* o = a.out(6);
      const std::int32_t entry = (in.byte() & 1) ? 255 : in.int32();
      std::int32_t flag = entry;
      FUZZ_CHECK("tr2ln", tr2ln(l, t, o, &flag) == 0);
      FUZZ_CHECK("tr2ln", (flag & ~(entry & 7)) == 0 && (flag & 1) == (entry & 1));
      FUZZ_CHECK("tr2ln", ((flag & 2) != 0) == ((flag & 4) != 0) || (entry & 6) != 6);
      for (int part = 0; part < 3; ++part)
        FUZZ_CHECK("tr2ln", (flag & (1 << part)) ? none_sentinel(o + 2 * part, 2)
                                                 : all_sentinel(o + 2 * part, 2));
      std::int32_t f2 = entry;
      same_when_aliased("tr2ln", l, 6, o, 6, [&](double* b) { tr2ln(b, t, b, &f2); });
      FUZZ_CHECK("tr2ln", f2 == flag);
      break;
    }
    case 7: {  // tr2crv
      std::vector<double> e;
      element(in, 89, 0, e);
      const double* c = a.copy_of(e);
      double* o = a.out(e.size());
      FUZZ_CHECK("tr2crv", tr2crv(c, t, o) == 0);
      FUZZ_CHECK("tr2crv", is_count(c[0]) ? none_sentinel(o, e.size()) && same(o[0], c[0])
                                          : all_sentinel(o, e.size()));
      break;
    }
    case 8: {  // tr2sha
      std::vector<double> e;
      shape(in, 0, e);
      const double* s = a.copy_of(e);
      double* o = a.out(e.size());
      FUZZ_CHECK("tr2sha", tr2sha(s, t, o) == 0);
      check_shape_words(s, o, e.size());
      same_when_aliased("tr2sha", s, e.size(), o, e.size(),
                        [&](double* b) { tr2sha(b, t, b); });
      break;
    }
    case 9: {  // traele
      const std::int32_t w = header_word(in);
      std::vector<double> e;
      element(in, w, 0, e);
      const double* el = a.copy_of(e);
      double* o = a.out(e.size());
      FUZZ_CHECK("traele", traele(a.i32(w), t, el, nullptr, o) == 0);
      switch (w & 0xff) {
        case 80: case 82: case 85: case 86: case 87: case 88: case 90: case 92: case 95: case 104:
          FUZZ_CHECK("traele", none_sentinel(o, e.size()));
          break;
        case 81: case 83: case 89: case 102: break;
        default: FUZZ_CHECK("traele", all_sentinel(o, e.size()));
      }
      break;
    }
    default: {  // traels: elements at arbitrary positions in one array
      const std::int32_t n = in.count(0, 6);
      const std::size_t cnt = n > 0 ? std::size_t(n) : 0;
      std::vector<std::int32_t> hdr(cnt), pos(cnt);
      std::vector<double> e;
      for (std::size_t k = 0; k < cnt; ++k) {
        hdr[k] = header_word(in);
        const std::uint8_t f = in.byte();
        if (f & 1) {  // placed at the end of what is there, or overlapping it
          pos[k] = static_cast<std::int32_t>(e.size()) + 1 - (f & 2 ? in.pick(0, 3) : 0);
          if (pos[k] < 1) pos[k] = 1;
          std::vector<double> body;
          element(in, hdr[k], 0, body);
          e.resize(std::max(e.size(), std::size_t(pos[k] - 1) + body.size()));
          std::copy(body.begin(), body.end(), e.begin() + (pos[k] - 1));
        } else {
          pos[k] = in.pick(-2, static_cast<std::int32_t>(e.size()) + 3);
        }
      }
      for (int k = in.pick(0, 3); k > 0; --k) e.push_back(in.real());
      const std::int32_t lim = static_cast<std::int32_t>(e.size()) - ((in.byte() & 7) == 0 ? 1 : 0);
      const std::size_t sl = lim > 0 ? std::size_t(lim) : 0;
      double* el = a.raw(sl);
      std::copy(e.begin(), e.begin() + static_cast<std::ptrdiff_t>(sl), el);
      a.seal(el, sl);
      double* o = a.out(sl);
      const std::int32_t r = traels(a.i32(n), a.i32s(hdr), t, el, a.i32s(pos), a.i32(lim), o);
      FUZZ_CHECK("traels", r >= 0 && r <= std::max(n, 0));
      if (r == 0) FUZZ_CHECK("traels", all_sentinel(o, sl));
      break;
    }
  }
  a.done();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  const std::uint8_t which = in.byte() % 40;
  if (which < 4) fuzz_products(in, which);
  else if (which < 6) fuzz_norms(in, which - 4);
  else if (which < 9) fuzz_angles(in, which - 6);
  else if (which == 9) fuzz_vectp2(in);
  else if (which < 14) fuzz_apply3(in, which - 10);
  else if (which < 19) fuzz_matrices(in, which - 14);
  else if (which == 19) fuzz_fmat23(in);
  else if (which == 20) fuzz_trapnt(in);
  else if (which < 23) fuzz_records(in, which - 21);
  else if (which < 25) fuzz_headers(in, which - 23);
  else if (which < 29) fuzz_planes(in, which - 25);
  else fuzz_plane2(in, which - 29);
  return 0;
}

}  // namespace fuzz
