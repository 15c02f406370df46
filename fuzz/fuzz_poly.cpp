// fuzz/fuzz_poly.cpp -- polynomial roots, evaluation, Bernstein basis and Gauss-Legendre
// quadrature, driven by arbitrary bytes: case flags and codes from their documented sets,
// roots untouched where documented, integrands called exactly as often as the rule says.
#include <cmath>
#include <cstdint>
#include <vector>

#include "fuzz_support.h"
#include "poly/poly_api.h"

namespace fuzz {
namespace {

void fuzz_duos(Input& in) {
  Case a(in, "duos");
  const double* k = a.reals(3);
  double* r = a.out(4);
  std::int32_t flag = kSentinelInt;
  duos(k, r, &flag);
  FUZZ_CHECK("duos", flag >= 0 && flag <= 4);
  if (k[0] == 0 && k[1] == 0) {
    FUZZ_CHECK("duos", flag == (k[2] == 0 ? 2 : 1) && all_sentinel(r, 4));
  } else if (k[0] == 0 && !std::isnan(k[1])) {
    const double x = -k[2] / k[1];
    FUZZ_CHECK("duos", flag == 3 && same(r[0], x) && same(r[2], x) && same(r[1], 0.0) &&
                           same(r[3], 0.0));
  } else if (!std::isnan(k[0]) && !std::isnan(k[1])) {
    FUZZ_CHECK("duos", (flag == 0 || flag == 4) && none_sentinel(r, 4));
  }
  a.done();
}

void fuzz_cubics(Input& in, int which) {
  static const char* names[3] = {"cardan", "tresor", "itdeg3"};
  Case a(in, names[which]);
  const double* k = a.reals(4);
  double* r = a.out(6);
  std::int32_t code = kSentinelInt;
  if (which == 0) {
    const std::int32_t* mode = a.i32(in.byte() & 1 ? in.pick(1, 2) : in.int32());
    cardan(k, mode, r, &code);
    FUZZ_CHECK("cardan", one_of(code, {1, 2, 3}) && none_sentinel(r, 6));
    if (std::fabs(k[0]) < 1e-15) FUZZ_CHECK("cardan", code == 2);
  } else if (which == 1) {
    tresor(k, r, &code);
    FUZZ_CHECK("tresor", one_of(code, {0, 11, 12, 13, 33}) && none_sentinel(r, 6));
  } else {
    const double* start = a.reals(1);
    itdeg3(k, start, r, &code);
    FUZZ_CHECK("itdeg3", one_of(code, {0, 11, 12, 13}) && none_sentinel(r, 6));
    if (code == 12) FUZZ_CHECK("itdeg3", r[0] == 0 && r[1] == 0);
  }
  a.done();
}

void fuzz_quartics(Input& in, int which) {
  Case a(in, which == 0 ? "ferari" : "quadr");
  const double* k = a.reals(5);
  double* r = a.out(8);
  std::int32_t flag = kSentinelInt;
  if (which == 0) {
    ferari(k, r, &flag);
    FUZZ_CHECK("ferari", flag == (std::fabs(k[0]) < 1e-15 ? 3 : 0));
    FUZZ_CHECK("ferari", flag == 3 ? all_sentinel(r, 8) : none_sentinel(r, 8));
  } else {
    quadr(k, r, &flag);
    FUZZ_CHECK("quadr", one_of(flag, {0, 1, 2, 3, 4, 11, 12, 13, 33}));
    FUZZ_CHECK("quadr", (flag == 3) == (k[0] == 0));
    if (flag == 3) FUZZ_CHECK("quadr", all_sentinel(r, 8));
  }
  a.done();
}

void fuzz_ynze(Input& in, int which) {
  const char* name = which == 0 ? "ynze2r" : "ynze3r";
  Case a(in, name);
  const std::size_t nc = which == 0 ? 3 : 4, nr = which == 0 ? 4 : 6;
  const double* k = a.reals(nc);
  double* r = a.out(nr);
  std::int32_t err = kSentinelInt;
  const std::int32_t res = which == 0 ? ynze2r(k, r, &err) : ynze3r(k, r, &err);
  if (k[0] == 0) {
    FUZZ_CHECK(name, res == 1 && err == 4709 && all_sentinel(r, nr));
  } else {
    FUZZ_CHECK(name, res == 0 && err == 0 && none_sentinel(r, nr));
  }
  a.done();
}

void fuzz_ynzenr(Input& in) {
  Case a(in, "ynzenr");
  const std::int32_t n = in.count(1, 4);
  const std::size_t nc = n >= 0 ? std::size_t(n) + 1 : 0;
  const std::size_t nr = n >= 1 && n <= 4 ? 2 * std::size_t(n) : 0;
  double* k = a.raw(nc);
  for (std::size_t j = 0; j < nc; ++j) k[j] = (in.byte() & 3) ? in.real() : 0.0;
  a.seal(k, nc);
  double* r = a.out(nr);
  std::int32_t nroots = kSentinelInt, err = kSentinelInt;
  const std::int32_t res = ynzenr(a.i32(n), k, &nroots, r, &err);
  FUZZ_CHECK("ynzenr", res == (err == 0 ? 0 : 1));
  FUZZ_CHECK("ynzenr", one_of(err, {0, 4712, 4718, 4717, 4709}));
  if (n < 1) FUZZ_CHECK("ynzenr", err == 4712 && nroots == n && all_sentinel(r, nr));
  else if (n > 4) FUZZ_CHECK("ynzenr", err == 4718 && nroots == n && all_sentinel(r, nr));
  else if (err == 0) FUZZ_CHECK("ynzenr", nroots >= 0 && nroots <= n && none_sentinel(r, 2 * std::size_t(nroots)));
  else if (err == 4717) FUZZ_CHECK("ynzenr", nroots == 1);
  a.done();
}

// cor, deriv, dersec, derter: the value for m coefficients; c is not read where documented.
void fuzz_evaluate(Input& in, int which) {
  static const char* names[4] = {"cor", "deriv", "dersec", "derter"};
  const char* name = names[which];
  Case a(in, name);
  const std::int32_t m = in.count(1, 24);
  const double* t = a.reals(1);
  const bool read = which == 0 ? m >= 1 : which == 1 ? m >= 2 && m <= 20 : which == 2 ? m >= 1 : m >= 1;
  const double* k = read ? a.reals(std::size_t(m)) : nullptr;
  double r = 0;
  switch (which) {
    case 0: r = cor(k, &m, t); break;
    case 1: r = deriv(k, &m, t); break;
    case 2: r = dersec(k, &m, t); break;
    default: r = derter(k, &m, t); break;
  }
  if (!read || (which == 3 && m < 4)) FUZZ_CHECK(name, same(r, 0.0));
  if (which == 0 && read) {  // Horner from the highest coefficient, s starting at 0
    double s = 0.0;
    for (std::int32_t j = m - 1; j >= 0; --j) s = s * *t + k[j];
    FUZZ_CHECK("cor", alike(r, s));
  }
  a.done();
}

void fuzz_bernst(Input& in) {
  Case a(in, "bernst");
  const std::int32_t i = in.count(0, 19), n = in.count(0, 19);
  const double* t = a.reals(1);
  const double r = bernst(&i, &n, t);
  if (i <= 0 && n <= 0) FUZZ_CHECK("bernst", same(r, 1.0));
  else if (!(0 <= i && i <= n && n <= 19)) FUZZ_CHECK("bernst", same(r, 0.0));
  else if (*t == 0) FUZZ_CHECK("bernst", r == (i == 0 ? 1.0 : 0.0));
  a.done();
}

// ---- Quadrature -------------------------------------------------------------------------

// Points of the rule used for a requested count.
int rule_points(std::int32_t n) {
  const std::int32_t k = n < 1 ? 1 : n > 20 ? 20 : n;
  if (k <= 10) return (k + 1) / 2 * 2;
  if (k <= 12) return 12;
  return k <= 16 ? 16 : 20;
}

// The integrands return values taken in turn from the fuzz input, count their calls and,
// when asked, integrate again inside (the routines keep no state, so that is allowed).
struct Integrand {
  std::vector<double> values;
  long calls = 0;
  long inner_calls = 0;
  bool nest = false;
  std::int32_t inner_n = 0;
};
thread_local Integrand* t_integrand = nullptr;

double inner_f(const double*) {
  ++t_integrand->inner_calls;
  return 0.5;
}
double next_value(Integrand& g) {
  const double v = g.values[static_cast<std::size_t>(g.calls) % g.values.size()];
  ++g.calls;
  if (g.nest && (g.calls & 3) == 1) {
    const double lo = 0, hi = v;
    const double r = gauleg(inner_f, &lo, &hi, &g.inner_n);
    return std::isnan(r) ? v : r;
  }
  return v;
}
double f1(const double*) { return next_value(*t_integrand); }
double f2(const double*, const double*) { return next_value(*t_integrand); }

void fuzz_quadrature(Input& in, int which) {
  const char* name = which == 0 ? "gauleg" : "dauleg";
  Case a(in, name);
  Integrand g;
  for (int k = in.pick(1, 6); k > 0; --k) g.values.push_back(in.real());
  g.nest = (in.byte() & 3) == 0;
  g.inner_n = in.count(1, 20);
  t_integrand = &g;
  const double *lo = a.reals(1), *hi = a.reals(1);
  long want;
  if (which == 0) {
    const std::int32_t n = in.count(1, 20);
    gauleg(f1, lo, hi, a.i32(n));
    want = rule_points(n);
  } else {
    const double *c2 = a.reals(1), *d2 = a.reals(1);
    const std::int32_t nx = in.count(1, 20), ny = in.count(1, 20);
    dauleg(f2, lo, hi, c2, d2, a.i32(nx), a.i32(ny));
    want = static_cast<long>(rule_points(nx)) * rule_points(ny);
  }
  FUZZ_CHECK(name, g.calls == want);
  if (g.nest) FUZZ_CHECK(name, g.inner_calls == ((want + 3) / 4) * rule_points(g.inner_n));
  t_integrand = nullptr;
  a.done();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  const std::uint8_t which = in.byte() % 15;
  if (which == 0) fuzz_duos(in);
  else if (which < 4) fuzz_cubics(in, which - 1);
  else if (which < 6) fuzz_quartics(in, which - 4);
  else if (which < 8) fuzz_ynze(in, which - 6);
  else if (which == 8) fuzz_ynzenr(in);
  else if (which < 13) fuzz_evaluate(in, which - 9);
  else if (which == 13) fuzz_bernst(in);
  else fuzz_quadrature(in, in.byte() & 1);
  return 0;
}

}  // namespace fuzz
