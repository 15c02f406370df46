// fuzz/fuzz_path.cpp -- the path-following solver's routines (options, start, tangents, step
// choice, prediction and correction, end tests, step acceptance, point storage, result tables)
// with an evaluation routine whose values and failures come from the fuzz input. After every input: codes from the documented sets, outputs
// untouched where documented, every workspace block and every table released.
#include <cmath>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <vector>

#include "fuzz_support.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace fuzz {
namespace {

// ---- The evaluation routine ---------------------------------------------------------------

// F_k(x) = c_k + sum_i A(k, i) x_i + q_k |x|^2, k = 1..n-1, with the constants chosen so that
// the start point solves it; the fuzz input picks the coefficients, a call that fails (with a
// code of its own, or 4715, or 4710), a call whose values are not numbers, and a call that
// asks for npts or req it must not get.
struct System {
  std::int32_t n = 2;
  std::vector<double> a, q, c;
  long calls = 0;
  long fail_at = 0, poison_at = 0;
  std::int32_t fail_code = 0;
  double poison = NAN;
  long max_calls = 2000;  // a bound on the solver's appetite per input
  bool soft_cap = false;  // past max_calls: fail with kOwnCode instead of stopping the run
  // The call that failed: fail_at, or the first one past the cap.
  bool failed() const { return (fail_at != 0 && calls >= fail_at) || (soft_cap && calls > max_calls); }
  // Some values handed out were not the curve's.
  bool poisoned() const { return poison_at != 0 && calls >= poison_at; }
};
constexpr std::int32_t kOwnCode = 7777;

// The n - 1 residuals at y.
void residuals(const System& s, const double* y, double* f) {
  const std::int32_t n = s.n, m = n - 1;
  double r2 = 0;
  for (std::int32_t i = 0; i < n; ++i) r2 += y[i] * y[i];
  for (std::int32_t k = 0; k < m; ++k) {
    double v = s.c[std::size_t(k)] + s.q[std::size_t(k)] * r2;
    for (std::int32_t i = 0; i < n; ++i) v += s.a[std::size_t(k + m * i)] * y[i];
    f[k] = v;
  }
}

// Their sum of squares, in equation order (as every routine of the solver forms it).
double residual_sum(const System& s, const double* y) {
  double f[21];
  residuals(s, y, f);
  double sum = 0;
  for (std::int32_t k = 0; k < s.n - 1; ++k) sum += f[k] * f[k];
  return sum;
}

std::int32_t evaluate(void* ctx, const std::int32_t* npts, const double* x, const std::int32_t* req,
                      double* out, std::int32_t* ierr) {
  System& s = *static_cast<System*>(ctx);
  const std::int32_t n = s.n, m = n - 1;
  FUZZ_CHECK("fct", *npts >= 1 && *req >= 1 && *req <= 7);
  if (s.soft_cap && s.calls >= s.max_calls) {
    ++s.calls;
    *ierr = kOwnCode;
    return 1;
  }
  FUZZ_CHECK("fct", ++s.calls <= s.max_calls);
  if (s.calls == s.fail_at) {
    *ierr = s.fail_code;
    return 1;
  }
  double* o = out;
  for (std::int32_t p = 0; p < *npts; ++p) {
    const double* y = x + std::size_t(p) * std::size_t(n);
    if (*req & 1) {
      residuals(s, y, o);
      o += m;
    }
    if (*req & 2)
      for (std::int32_t i = 0; i < n; ++i)
        for (std::int32_t k = 0; k < m; ++k)
          *o++ = s.a[std::size_t(k + m * i)] + 2 * s.q[std::size_t(k)] * y[i];
    if (*req & 4)
      for (std::int32_t j = 0; j < n; ++j)
        for (std::int32_t i = 0; i < n; ++i)
          for (std::int32_t k = 0; k < m; ++k) *o++ = i == j ? 2 * s.q[std::size_t(k)] : 0.0;
  }
  if (s.calls == s.poison_at && o != out) out[(s.calls * 7) % (o - out)] = s.poison;
  *ierr = 0;
  return 0;
}

System make_system(Input& in, std::int32_t n, const double* x0) {
  System s;
  s.n = n;
  const std::int32_t m = n - 1;
  s.a.resize(std::size_t(m) * std::size_t(n));
  s.q.resize(std::size_t(m));
  s.c.resize(std::size_t(m));
  const bool plain = in.byte() & 1;  // small multiples of 1/4, or any reals
  for (auto& v : s.a) v = plain ? static_cast<std::int8_t>(in.byte()) / 16.0 : in.real();
  for (auto& v : s.q) v = plain ? static_cast<std::int8_t>(in.byte()) / 64.0 : in.real();
  for (std::int32_t k = 0; k < m; ++k) {  // F_k(x0) = 0 up to rounding
    double f = 0, r2 = 0;
    for (std::int32_t i = 0; i < n; ++i) f += s.a[std::size_t(k + m * i)] * x0[i], r2 += x0[i] * x0[i];
    s.c[std::size_t(k)] = -(f + s.q[std::size_t(k)] * r2);
  }
  const std::uint8_t f = in.byte();
  if (f & 1) s.fail_at = in.pick(1, 12);
  const std::int32_t codes[4] = {kOwnCode, 4715, 4710, kOwnCode};
  s.fail_code = codes[(f >> 1) & 3];
  if (f & 8) s.poison_at = in.pick(1, 12), s.poison = (f & 16) ? INFINITY : NAN;
  return s;
}

// ---- Records ------------------------------------------------------------------------------

struct Records {
  Orvq7PathOptions options{};
  double limits[2] = {sentinel(), sentinel()};
  Orvq7PathLayout layout{};
  std::int32_t pairs[22] = {};
  Orvq7PathMarch march{};
  Orvq7PathTables tables{};
  std::int32_t itab = 0;
  const double* pas = nullptr;  // as given to wnccmd
  const double* tol = nullptr;
};

// The mode word: one of the kinds with the flag bits 15 and 16..19 drawn, or any integer.
std::int32_t mode_word(Input& in, const std::int32_t (&kinds)[4]) {
  const std::uint8_t f = in.byte();
  if ((f & 15) == 0) return in.int32();
  std::int32_t mode = kinds[f >> 6];
  if (f & 0x10) mode |= 1 << 15;
  if (f & 0x20) mode |= 1 << (16 + in.pick(0, 3));
  return mode;
}

// The tolerances: st of them (one per unknown, or one).
const double* tolerances(Input& in, Args& a, std::size_t st) {
  double* tol = a.raw(st);
  for (std::size_t i = 0; i < st; ++i) tol[i] = (in.byte() & 7) ? 1e-3 * (1 + in.pick(0, 99)) : in.real();
  a.seal(tol, st);
  return tol;
}

// wnccmd with arguments decoded from the input; returns its code.
std::int32_t options(Input& in, Args& a, std::int32_t n, Records& r) {
  const std::size_t sn = n > 0 && n <= 21 ? std::size_t(n) : 0;
  double* pas = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    pas[i] = (in.byte() & 15) ? 0.01 * (1 + in.pick(0, 9)) : in.real();
    pas[sn + i] = (in.byte() & 15) ? pas[i] * (2 + in.pick(0, 30)) : in.real();
  }
  a.seal(pas, 2 * sn);
  const std::int32_t mode = mode_word(in, {1, 2, 4, 8});
  const double* tol = tolerances(in, a, (mode & (1 << 16)) ? sn : 1);
  r.pas = pas;
  r.tol = tol;
  const std::uint8_t g = in.byte();
  const std::int32_t store = (g & 15) == 0 ? in.int32() : ((g & 1) ? 2 : 0) | ((g & 2) ? 0x38 : 0) |
                                                             ((g & 4) ? 1 : 0) | ((g & 8) ? 1 << 30 : 0);
  const std::int32_t variant = (in.byte() & 7) ? 1 : in.pick(0, 3);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t res = wnccmd(a.i32(n), pas, a.i32(mode), tol, a.i32(store), a.i32(variant),
                                  &r.options, r.limits, &r.layout, r.pairs, &ierr);
  check_code("wnccmd", res, ierr, {0, 4712, 4718});
  if (n < 2) FUZZ_CHECK("wnccmd", ierr == 4712);
  else if (n > 20) FUZZ_CHECK("wnccmd", ierr == 4718);
  if (n < 2 || n > 20) FUZZ_CHECK("wnccmd", all_sentinel(r.limits, 2));
  if (ierr == 0) {
    FUZZ_CHECK("wnccmd", one_of(r.options.kind, {1, 2, 4, 8}) && r.layout.nused >= 1);
    FUZZ_CHECK("wnccmd", !is_sentinel(r.limits[1]));
    if (r.options.kind >= 4) FUZZ_CHECK("wnccmd", !is_sentinel(r.limits[0]));
  }
  return ierr;
}

// Every table made for the input released, and the traceback free of frames but yncrea's.
struct TableWatch {
  std::int64_t live0 = orvq7sys_table_live();
  ~TableWatch() { orvq7sys_table_refuse(0, 0); }
  void released(const char* routine) const {
    if (orvq7sys_table_live() != live0) broken(routine, "table not released", long(orvq7sys_table_live() - live0));
  }
};

// ---- A traced path, step by step, through the exported routines ---------------------------

void fuzz_march(Input& in) {
  Case a(in, "wncini");
  TableWatch tables;
  auto r = std::make_unique<Records>();
  const std::int32_t n = (in.byte() & 7) ? in.pick(2, 5) : in.count(2, 20);
  if (options(in, a, n, *r) != 0) {
    a.check_inputs("wnccmd");
    a.call.quiet();
    return;
  }
  // The start point, its direction and the box.
  const std::size_t sn = std::size_t(n);
  double* xd = a.raw(2 * sn);
  double* box = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    xd[i] = static_cast<std::int8_t>(in.byte()) / 8.0;
    xd[sn + i] = (in.byte() & 7) ? static_cast<std::int8_t>(in.byte()) / 32.0 : in.real();
    box[i] = xd[i] - ((in.byte() & 7) ? 1 + in.pick(0, 40) / 4.0 : in.real());
    box[sn + i] = xd[i] + ((in.byte() & 7) ? 1 + in.pick(0, 40) / 4.0 : in.real());
  }
  if ((in.byte() & 15) == 0) xd[0] = box[sn];  // on a face
  for (double* v : {xd, box}) a.seal(v, 2 * sn);
  System sys = make_system(in, n, xd);
  const double* eps = a.real((in.byte() & 7) ? 1e-20 : in.real());
  const std::uint8_t faults = in.byte();
  if ((faults & 7) == 0) orvq7sys_table_refuse(in.pick(0, 3), 1);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t res = wncini(&sys, &n, evaluate, eps, xd, box, &r->options, &r->layout,
                                  r->pairs, &r->march, &r->tables, &r->itab, &ierr);
  orvq7sys_table_refuse(0, 0);
  FUZZ_CHECK("wncini", res == (ierr ? 1 : 0));
  FUZZ_CHECK("wncini", one_of(ierr, {0, 4712, 4718, 4721, 36, 4703, kOwnCode}) ||
                           (ierr == sys.fail_code && sys.fail_at != 0));
  a.done();
  if (ierr != 0) {
    FUZZ_CHECK("wncini", r->itab == 0);
    tables.released("wncini");
    return;
  }
  FUZZ_CHECK("wncini", r->itab != 0 && r->march.nstored == 1 && (r->march.sign == 1 || r->march.sign == -1));

  // A few steps: the step length, a crude predictor, the tangent there, the point stored.
  const int steps = in.pick(0, 6);
  bool intact = true;  // no storage failure: the result holds exactly the points stored
  for (int s = 0; s < steps && intact; ++s) {
    const std::int32_t variant = (in.byte() & 3) ? 1 : in.pick(0, 3);
    const double h0 = r->march.h, f0 = r->march.f;
    Call pc("wncpas");
    std::int32_t e = kSentinelInt;
    const std::int32_t pr = wncpas(&n, &variant, &r->options, r->limits, r->tol, r->pas, &r->march, &e);
    FUZZ_CHECK("wncpas", pr == (e ? 1 : 0) && one_of(e, {0, 4712, 4718}));
    if (e != 0) {
      FUZZ_CHECK("wncpas", same(r->march.h, h0) && same(r->march.f, f0));
      const auto fr = frames();
      FUZZ_CHECK("wncpas", fr.size() == 1 && fr[0].name == "WNCPAS  " && fr[0].code == e);
      break;
    }
    FUZZ_CHECK("wncpas", r->march.f == 1 && !(r->march.h > 2 * f0 * h0));
    pc.quiet();
    if (!std::isfinite(r->march.h) || r->march.h > 10) r->march.h = 0.125;
    for (std::size_t i = 0; i < sn; ++i) r->march.x[i] += r->march.h * r->march.t[i];
    double out[40];
    const std::int32_t treq = 2, one = 1;
    Call tc("ynumde");
    if (ynumde(&sys, &n, evaluate, &one, r->march.x, &treq, out, &e) == 0) {
      for (std::size_t i = 0; i < sn; ++i) r->march.t[i] = r->march.sign * out[i];
    }
    tc.quiet();
    const std::int32_t phase = 1, accepted = (in.byte() & 3) ? 1 : in.pick(0, 2);
    const std::int32_t before = r->march.nstored;
    if ((in.byte() & 15) == 0) orvq7sys_table_refuse(in.pick(0, 2), 1);
    Call fc("wncflu");
    const std::int32_t fr = wncflu(&phase, &accepted, &r->options, &r->layout, &r->march,
                                   &r->tables, &r->itab, &e);
    orvq7sys_table_refuse(0, 0);
    FUZZ_CHECK("wncflu", fr == (e ? 1 : 0) && one_of(e, {0, 36}));
    if (e == 0) FUZZ_CHECK("wncflu", r->march.nstored == before + (accepted == 1 ? 1 : 0));
    intact = e == 0;
    fc.quiet();
  }
  // The end of the path: the counts recorded, then every quantity found and read back.
  std::int32_t e = kSentinelInt;
  const std::int32_t two = 2, none = 0;
  const std::int32_t end = wncflu(&two, &none, &r->options, &r->layout, &r->march, &r->tables, &r->itab, &e);
  FUZZ_CHECK("wncflu", end == 0 || !intact);
  const std::int32_t kinds[7] = {22, 23, 43, 1, 2, 3, 99};
  for (std::int32_t kind : kinds) {
    Call yc("yncrea");
    std::int32_t handle = kSentinelInt, count = kSentinelInt;
    const std::int32_t yr = yncrea(&r->itab, &kind, &handle, &count, &e);
    const auto fr = frames();
    if (!intact) {
      yc.released();
      continue;
    }
    if (yr == 0) {
      FUZZ_CHECK("yncrea", e == 0 && fr.empty() && count >= 0 && count <= r->march.nstored);
      if (handle != 0) {
        std::int32_t esize = 0, entries = 0;
        FUZZ_CHECK("yncrea", yutinf(&handle, &esize, &entries, &e) == 0 && entries == count);
      }
    } else {
      FUZZ_CHECK("yncrea", e == 4712 && handle == kSentinelInt && count == kSentinelInt);
      FUZZ_CHECK("yncrea", fr.size() == 1 && fr[0].name == " YNCREA " && fr[0].code == 4712);
    }
    if (kind == 23 && r->layout.slot[1].used)  // the points and tangents, when asked for
      FUZZ_CHECK("yncrea", yr == 0 && count == r->march.nstored);
    yc.released();
  }
  FUZZ_CHECK("yncend", yncend(&r->itab, &e) == 0 && e == 0);
  tables.released("yncend");
  a.check_inputs("wncini");
}

// ---- ynumde on its own ----------------------------------------------------------------------

void fuzz_ynumde(Input& in) {
  Case a(in, "ynumde");
  const std::int32_t n = in.count(2, 20), npts = in.count(1, 4);
  const std::int32_t reqs[4] = {2, 4, 6, 1};
  const std::int32_t req = (in.byte() & 7) ? reqs[in.byte() & 3] : in.int32();
  const std::size_t sn = n >= 1 && n <= 21 ? std::size_t(n) : 0, sp = npts >= 1 ? std::size_t(npts) : 0;
  const double* x = a.reals(sn * sp);
  const std::size_t per = req == 6 ? 2 * sn : sn;
  double* out = a.out(per * sp);
  double x0[21] = {};
  System sys = make_system(in, sn >= 2 ? n : 2, x0);
  const bool refuse = (in.byte() & 7) == 0;
  if (refuse) a.call.refuse(1);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t res = ynumde(&sys, a.i32(n), evaluate, a.i32(npts), x, a.i32(req), out, &ierr);
  a.i32(ierr);  // shown with the arguments when a check fails
  a.call.refuse(0);
  FUZZ_CHECK("ynumde", res == (ierr ? 1 : 0) && sys.calls <= 1);
  FUZZ_CHECK("ynumde", one_of(ierr, {0, 4712, 4718, 4710, 36, kOwnCode}));
  if (ierr == 4718 && sys.calls == 1) FUZZ_CHECK("ynumde", sys.fail_at == 1 && sys.fail_code == 4715);
  // Argument errors (the order of the checks is not part of the contract).
  const bool small = n < 2 || npts < 1, large = n > 20 || !one_of(req, {2, 4, 6});
  if (small || large) FUZZ_CHECK("ynumde", (small && ierr == 4712) || (large && ierr == 4718));
  if (one_of(ierr, {4712, 4718, 36, kOwnCode})) FUZZ_CHECK("ynumde", all_sentinel(out, per * sp));
  if (ierr == 0) FUZZ_CHECK("ynumde", none_sentinel(out, per * sp));
  if (ierr == 4710) {  // the points before the degenerate one written, the others not
    std::size_t p = 0;
    while (p < sp && none_sentinel(out + p * per, per)) ++p;
    FUZZ_CHECK("ynumde", p < sp && all_sentinel(out + p * per, (sp - p) * per));
  }
  if (ierr == 0 && req != 4)  // unit tangents
    for (std::size_t p = 0; p < sp; ++p) {
      double s = 0;
      for (std::size_t i = 0; i < sn; ++i) s += out[p * per + i] * out[p * per + i];
      FUZZ_CHECK("ynumde", std::fabs(s - 1) < 1e-12);
    }
  a.done();
}

// ---- Storage on its own: wncfst, yncrea, yncend on foreign handles ----------------------------

void fuzz_storage(Input& in) {
  Case a(in, "wncfst");
  TableWatch tables;
  auto r = std::make_unique<Records>();
  const std::int32_t n = in.pick(2, 6);
  if (options(in, a, n, *r) != 0) return;
  const std::size_t nv = std::size_t(std::max(r->layout.nvalues, 0));
  const double* values = a.reals(nv ? nv : 1);
  const int points = in.pick(1, 4);
  std::int32_t e = kSentinelInt;
  for (int p = 0; p < points; ++p) {
    const std::int32_t phase = in.pick(0, 2);
    const bool refuse = (in.byte() & 7) == 0;
    if (refuse) orvq7sys_table_refuse(in.pick(0, 3), 1);
    const std::int32_t itab0 = r->itab;
    const std::int32_t res = wncfst(&phase, &r->layout, values, &r->itab, &e);
    orvq7sys_table_refuse(0, 0);
    FUZZ_CHECK("wncfst", res == (e ? 1 : 0) && one_of(e, {0, 36}));
    if (e == 36) FUZZ_CHECK("wncfst", refuse && r->itab == itab0);
    if (itab0 == 0 && e != 0) tables.released("wncfst");
  }
  a.call.quiet();
  // Foreign handles: no result, an unknown handle.
  const std::int32_t foreign[2] = {0, 0x7fff1234};
  for (std::int32_t h : foreign) {
    Call yc("yncrea");
    const std::int32_t kind = 23;
    std::int32_t handle = kSentinelInt, count = kSentinelInt, e2 = -1;
    FUZZ_CHECK("yncrea", yncrea(&h, &kind, &handle, &count, &e2) == 1 && e2 != 0);
    FUZZ_CHECK("yncrea", handle == kSentinelInt && count == kSentinelInt);
    for (const auto& f : frames()) FUZZ_CHECK("yncrea", f.name == " YNCREA ");
    Call ec("yncend");
    std::int32_t e3 = -1;
    FUZZ_CHECK("yncend", yncend(&h, &e3) == (h == 0 ? 0 : 1) && (h == 0) == (e3 == 0));
    ec.quiet();
  }
  FUZZ_CHECK("yncend", yncend(&r->itab, &e) == 0);
  tables.released("yncend");
  a.check_inputs("wncfst");
}

// ---- The variant checks on records wnccmd filled for the other variant -----------------------

void fuzz_variants(Input& in) {
  Case a(in, "wnccim");
  auto r = std::make_unique<Records>();
  const std::int32_t n = in.pick(2, 6);
  options(in, a, n, *r);
  const std::int32_t dims[3] = {n, 1, 21};
  const std::int32_t dn = dims[in.byte() % 3];
  Orvq7PathOptions o = r->options;
  Orvq7PathLayout l = r->layout;
  std::int32_t e = kSentinelInt;
  if (in.byte() & 1) {
    const std::int32_t res = wnccex(&dn, &o, &l, &e);
    FUZZ_CHECK("wnccex", res == (e ? 1 : 0) && one_of(e, {0, 4718}));
    if (e) FUZZ_CHECK("wnccex", std::memcmp(&o, &r->options, sizeof o) == 0 &&
                                    std::memcmp(&l, &r->layout, sizeof l) == 0);
  } else {
    const std::int32_t res = wnccim(&dn, &o, &l, &e);
    FUZZ_CHECK("wnccim", res == (e ? 1 : 0) && one_of(e, {0, 4718}));
    if (dn < 2 || dn > 20) FUZZ_CHECK("wnccim", e == 4718);
  }
  a.call.quiet();
}

// ---- The driver: a whole path traced by ynchem ----------------------------------------------

void fuzz_ynchem(Input& in) {
  Case a(in, "ynchem");
  TableWatch tables;
  const std::int32_t n = (in.byte() & 7) ? in.pick(2, 4) : in.count(2, 20);
  const std::size_t sn = n > 0 && n <= 21 ? std::size_t(n) : 0;
  double* xd = a.raw(2 * sn);
  double* box = a.raw(2 * sn);
  double* pas = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    xd[i] = static_cast<std::int8_t>(in.byte()) / 16.0;
    xd[sn + i] = (in.byte() & 7) ? static_cast<std::int8_t>(in.byte()) / 64.0 : in.real();
    box[i] = xd[i] - ((in.byte() & 7) ? 0.5 + in.pick(0, 20) / 4.0 : in.real());
    box[sn + i] = xd[i] + ((in.byte() & 7) ? 0.5 + in.pick(0, 20) / 4.0 : in.real());
    pas[i] = (in.byte() & 15) ? 1e-3 * (1 + in.pick(0, 20)) : in.real();
    pas[sn + i] = (in.byte() & 15) ? 0.05 * (1 + in.pick(0, 10)) : in.real();
  }
  if (sn && (in.byte() & 15) == 0) xd[0] = box[sn];  // on a face
  for (double* v : {xd, box, pas}) a.seal(v, 2 * sn);
  const std::int32_t mode = mode_word(in, {2, 4, 8, 4});
  const double* tol = tolerances(in, a, (mode & (1 << 16)) ? sn : 1);
  const std::uint8_t g = in.byte();
  const std::int32_t store = (g & 15) == 0 ? in.int32() : 2 | ((g & 1) ? 4 : 0) | ((g & 2) ? 8 : 0) |
                                                             ((g & 4) ? 16 : 0) | ((g & 8) ? 64 : 0);
  double x0[21] = {};
  for (std::size_t i = 0; i < sn; ++i) x0[i] = xd[i];
  System sys = make_system(in, sn >= 2 ? n : 2, x0);
  // n >= 5 has no point limit: a path may go on for very long, so the evaluations are capped
  // (the cap is then fct's failure).
  sys.max_calls = 40000;
  sys.soft_cap = true;
  const double* eps = a.real((in.byte() & 7) ? 1e-20 : in.real());
  const std::uint8_t faults = in.byte();
  if ((faults & 15) == 1) orvq7sys_table_refuse(in.pick(0, 40), 1);
  if ((faults & 15) == 2) orvq7sys_ws_refuse(1);
  std::int32_t itab = kSentinelInt, ierr = kSentinelInt;
  const std::int32_t res = ynchem(&sys, a.i32(n), evaluate, eps, xd, box, pas, a.i32(mode), tol,
                                  a.i32(store), &itab, &ierr);
  orvq7sys_table_refuse(0, 0);
  orvq7sys_ws_refuse(0);
  const bool fct_code = sys.failed() && (ierr == sys.fail_code || ierr == kOwnCode);
  FUZZ_CHECK("ynchem", res == 0 || res == 1);
  FUZZ_CHECK("ynchem", one_of(ierr, {0, 4712, 4718, 4713, 4720, 4721, 36}) || fct_code);
  const auto fr = frames();
  for (const auto& x : fr)
    FUZZ_CHECK("ynchem", x.name == "YNCHEM  " || x.name == "WNCGOO  " || x.name == "WNCGF2;" ||
                             x.name == "WNCPAS  " || x.name == " YNCREA ");
  a.call.released();
  if (res == 1) {
    FUZZ_CHECK("ynchem", itab == 0 && ierr != 0);
    tables.released("ynchem");
    if (ierr != 4721) FUZZ_CHECK("ynchem", !fr.empty() && fr.back().name == "YNCHEM  " && fr.back().code == ierr);
    else for (const auto& x : fr) FUZZ_CHECK("ynchem", x.name != "YNCHEM  ");
  } else {
    FUZZ_CHECK("ynchem", itab != 0 && (ierr == 0 || ierr == 4712));
    if (ierr == 4712) FUZZ_CHECK("ynchem", (store & 56) == 0);
    // Every stored point in the box (inclusive; an end point on a face may lie outside the
    // other faces by at most 1e-12), the first one x0 itself.
    const std::int32_t kind = 23;
    std::int32_t h = 0, count = 0, e = 0, first = 1;
    FUZZ_CHECK("ynchem", yncrea(&itab, &kind, &h, &count, &e) == 0 && count >= 1);
    std::vector<double> xt(2 * sn * std::size_t(count));
    FUZZ_CHECK("ynchem", yutrea(&h, &first, &count, xt.data(), &e) == 0);
    for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK("ynchem", same(xt[i], xd[i]));
    for (std::size_t j = 0; j < std::size_t(count); ++j)
      for (std::size_t i = 0; i < sn; ++i) {
        const double v = xt[j * 2 * sn + i];
        const bool inside = v >= box[i] - 1e-12 && v <= box[sn + i] + 1e-12;
        if (!inside) {  // shown with the arguments
          a.real(v);
          a.i32s({static_cast<std::int32_t>(j), static_cast<std::int32_t>(i), count});
        }
        FUZZ_CHECK("ynchem", inside);
      }
    FUZZ_CHECK("yncend", yncend(&itab, &e) == 0);
    tables.released("ynchem");
  }
  a.check_inputs("ynchem");
}


// ---- One step of a path: a start on the System's curve -----------------------------------

// The data of a step: x0 on the System's curve with the tangent there, the start direction,
// a box around x0, step bounds and a march record at (or near) x0. Arrays are sized for n in
// 1..21 (none otherwise), so that a routine reading past n is seen.
struct Scene {
  std::size_t sn = 0;
  double* xd = nullptr;   // real(n,2): x0, d0
  double* box = nullptr;  // real(n,2): lower, upper
  const double* pas = nullptr;  // real(n,2): minimum, maximum steps
  double t0[21] = {};     // unit tangent at x0 (e_1 when there is none)
  System sys;
  Orvq7PathMarch march{};
};

constexpr std::int32_t kExtraCodes[4] = {4716, 4713, 4701, 4702};

void make_scene(Input& in, Args& a, std::int32_t n, const double* pas, Scene& sc) {
  sc.sn = n >= 1 && n <= 21 ? std::size_t(n) : 0;
  const std::size_t sn = sc.sn;
  const std::int32_t ns = n >= 2 && n <= 20 ? n : 2;
  double x0[21] = {};
  for (std::size_t i = 0; i < sn; ++i) x0[i] = static_cast<std::int8_t>(in.byte()) / 8.0;
  sc.sys = make_system(in, ns, x0);
  if (in.byte() & 1) sc.sys.fail_code = kExtraCodes[in.byte() & 3];
  sc.t0[0] = 1;
  if (n == ns) {  // the tangent at x0 from a faultless copy
    System clean = sc.sys;
    clean.fail_at = clean.poison_at = 0;
    const std::int32_t one = 1, req = 2;
    std::int32_t e = 0;
    double t[20];
    if (ynumde(&clean, &n, evaluate, &one, x0, &req, t, &e) == 0)
      for (std::int32_t i = 0; i < n; ++i) sc.t0[i] = t[i];
  }
  sc.xd = a.raw(2 * sn);
  sc.box = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    sc.xd[i] = x0[i];
    sc.xd[sn + i] = (in.byte() & 7) ? sc.t0[i] : in.real();
    sc.box[i] = x0[i] - ((in.byte() & 7) ? 0.5 + in.pick(0, 40) / 8.0 : in.real());
    sc.box[sn + i] = x0[i] + ((in.byte() & 7) ? 0.5 + in.pick(0, 40) / 8.0 : in.real());
  }
  for (double* v : {sc.xd, sc.box}) a.seal(v, 2 * sn);
  if (pas == nullptr) {
    double* p = a.raw(2 * sn);
    for (std::size_t i = 0; i < sn; ++i) {
      p[i] = (in.byte() & 15) ? 1e-3 * (1 + in.pick(0, 20)) : in.real();
      p[sn + i] = (in.byte() & 15) ? 0.05 * (1 + in.pick(0, 20)) : in.real();
    }
    a.seal(p, 2 * sn);
    pas = p;
  }
  sc.pas = pas;
  // The march record: at x0 with the tangent there, or a step behind x0 (so that the next
  // point may close the path), or anywhere.
  Orvq7PathMarch& m = sc.march;
  const std::uint8_t f = in.byte();
  const double behind = (f & 3) == 1 ? in.pick(1, 16) / 16.0 : 0.0;
  const double sign = (f & 4) ? -1.0 : 1.0;
  double g = 0;
  for (std::size_t i = 0; i < sn && i < 20; ++i) {
    m.x[i] = (f & 3) == 3 ? in.real() : x0[i] - behind * sc.t0[i];
    m.t[i] = (f & 8) ? in.real() : sign * sc.t0[i];
    m.tprev[i] = (in.byte() & 3) ? m.t[i] : m.t[i] + static_cast<std::int8_t>(in.byte()) / 64.0;
    m.c[i] = (f & 16) ? in.real() : 0.0;
    g += (m.x[i] - x0[i]) * sc.xd[sn + i];
  }
  m.h = (in.byte() & 7) ? 0.0625 * in.pick(0, 40) : in.real();
  m.hprev = (in.byte() & 3) ? 1e38 : in.real();
  m.f = (in.byte() & 7) ? 1.0 : in.real();
  m.g = 1;
  m.close_prev = (f & 32) ? in.real() : g;
  m.close = in.real();
  m.sign = (f & 64) ? -1 : 1;
  m.nstored = (in.byte() & 7) ? in.pick(1, 4) : in.int32();
  m.treq = (in.byte() & 15) ? ((f & 128) ? 6 : 2) : in.pick(0, 7);
}

// A new point for the step: ahead of x along t (inside or beyond the box), x0 itself, or
// anything.
double* new_point(Input& in, Args& a, const Scene& sc) {
  double* p = a.raw(sc.sn);
  const std::uint8_t k = in.byte();
  const double h = in.pick(0, 64) / 8.0;
  for (std::size_t i = 0; i < sc.sn; ++i) {
    const double x = i < 20 ? sc.march.x[i] : 0.0, t = i < 20 ? sc.march.t[i] : 0.0;
    switch (k & 3) {
      case 0: p[i] = x + h * t; break;
      case 1: p[i] = sc.xd[i]; break;
      case 2: p[i] = in.real(); break;
      default: p[i] = x + h * t + static_cast<std::int8_t>(in.byte()) / 256.0; break;
    }
  }
  a.seal(p, sc.sn);
  return p;
}

bool same_march(const Orvq7PathMarch& a, const Orvq7PathMarch& b) { return std::memcmp(&a, &b, sizeof a) == 0; }

// The march record as before but for the fields the routine may write.
bool only_changed(Orvq7PathMarch before, const Orvq7PathMarch& after, bool f, bool close) {
  if (f) before.f = after.f;
  if (close) before.close = after.close;
  return same_march(before, after);
}

// f0 halved k >= 0 times gives f.
bool halved(double f0, double f) {
  if (std::isnan(f0)) return std::isnan(f);
  for (int k = 0; k < 2200; ++k, f0 *= 0.5)
    if (same(f0, f)) return true;
  return false;
}

// On the curve: the residuals' sum of squares at x at most eps (unless values were poisoned).
bool on_curve(const System& s, const double* x, double eps) {
  return s.poisoned() || residual_sum(s, x) <= eps;
}

// Every frame is the two-unknown corrector's, which only runs for n = 2.
void only_f2_frames(const char* routine, std::int32_t n, const std::vector<Frame>& fr) {
  for (const auto& f : fr) FUZZ_CHECK(routine, n == 2 && f.name == "WNCGF2;");
}

// ierr is one of the routine's own codes, or the code fct failed with.
bool code_ok(std::int32_t ierr, const System& s, std::initializer_list<std::int32_t> own) {
  if (one_of(ierr, own)) return true;
  if (!s.failed()) return false;
  return ierr == s.fail_code || ierr == kOwnCode || (s.fail_code == 4715 && ierr == 4718);
}

double dot_of(std::size_t n, const double* a, const double* b) {
  double s = 0;
  for (std::size_t i = 0; i < n; ++i) s += a[i] * b[i];
  return s;
}

// ---- Prediction and correction: wncgoo, wncgcv, wncgnn, wncgnr, wncgf2 ----------------------

void fuzz_newton(Input& in) {
  Case a(in, "wncgoo");
  const std::int32_t routine = in.byte() % 5;
  const std::int32_t n = routine == 4 ? 2 : (in.byte() & 7) ? in.pick(2, 5) : in.count(2, 20);
  auto sc = std::make_unique<Scene>();
  make_scene(in, a, n, nullptr, *sc);
  const std::size_t sn = sc->sn;
  System& sys = sc->sys;
  sys.soft_cap = true;
  sys.max_calls = routine == 0 ? 4000 : 400;
  const double* eps = a.real((in.byte() & 7) ? ((in.byte() & 1) ? 1e-20 : 1e-12) : in.real());
  const bool bad_n = n < 2 || n > 20;
  std::int32_t ierr = kSentinelInt;
  double* xnew = a.out(sn);
  if (routine == 0) {  // wncgoo
    const Orvq7PathMarch before = sc->march;
    const double* spare = a.real(in.real());
    std::int32_t special = kSentinelInt;
    const std::int32_t res = wncgoo(&sys, &n, evaluate, eps, spare, sc->pas, &sc->march, &special, xnew, &ierr);
    a.i32(ierr);
    FUZZ_CHECK("wncgoo", res == (ierr ? 1 : 0));
    FUZZ_CHECK("wncgoo", code_ok(ierr, sys, {0, 4712, 4718, 4713}));
    const auto fr = frames();
    if (bad_n) {
      FUZZ_CHECK("wncgoo", ierr == (n < 2 ? 4712 : 4718) && fr.empty() && sys.calls == 0);
      FUZZ_CHECK("wncgoo", special == kSentinelInt && all_sentinel(xnew, sn) && same_march(before, sc->march));
    } else {
      FUZZ_CHECK("wncgoo", only_changed(before, sc->march, true, false) && halved(before.f, sc->march.f));
      std::vector<Frame> below = fr;
      if (res == 1) {
        FUZZ_CHECK("wncgoo", !fr.empty() && fr.back().name == "WNCGOO  " && fr.back().code == ierr);
        below.pop_back();
      }
      only_f2_frames("wncgoo", n, below);
      if (res == 0) FUZZ_CHECK("wncgoo", special == 0 || special == 3);
      if (res == 0 && special == 0) {
        bool moved = false;
        for (std::size_t i = 0; i < sn; ++i) moved |= !(std::fabs(before.x[i] - xnew[i]) < sc->pas[i]);
        FUZZ_CHECK("wncgoo", none_sentinel(xnew, sn) && moved && on_curve(sys, xnew, *eps));
      }
    }
  } else if (routine == 1) {  // wncgcv
    const std::int32_t which = (in.byte() & 7) ? in.byte() & 1 : in.int32();
    double* uu = a.raw(sn);
    double* xb = a.raw(sn);
    double* p = a.raw(sn);
    double* w = a.raw(sn);
    const double h = (in.byte() & 7) ? in.pick(0, 16) / 16.0 : in.real();
    for (std::size_t i = 0; i < sn; ++i) {
      uu[i] = (in.byte() & 7) ? sc->t0[i] : in.real();
      xb[i] = (in.byte() & 7) ? sc->xd[i] : in.real();
      p[i] = sc->xd[i] + h * sc->t0[i];
      w[i] = (in.byte() & 7) ? sc->pas[sn + i] : in.real();
    }
    for (double* v : {uu, xb, p, w}) a.seal(v, sn);
    const std::int32_t res = wncgcv(&sys, &n, evaluate, eps, &which, uu, xb, p, w, xnew, &ierr);
    a.i32(ierr);
    FUZZ_CHECK("wncgcv", res == (ierr ? 1 : 0));
    const auto fr = frames();
    const bool bad_which = which != 0 && which != 1;
    if (bad_n || bad_which) {
      FUZZ_CHECK("wncgcv", (ierr == 4712 && (n < 2 || bad_which)) || (ierr == 4718 && n > 20));
      FUZZ_CHECK("wncgcv", all_sentinel(xnew, sn) && fr.empty() && sys.calls == 0);
    } else {
      FUZZ_CHECK("wncgcv", code_ok(ierr, sys, {0, 4713}));
      FUZZ_CHECK("wncgcv", sys.calls <= 306);
      only_f2_frames("wncgcv", n, fr);
      if (ierr == 0) FUZZ_CHECK("wncgcv", none_sentinel(xnew, sn) && on_curve(sys, xnew, *eps));
      if (ierr == 4713 && !sys.failed()) FUZZ_CHECK("wncgcv", none_sentinel(xnew, sn));
    }
  } else {  // the correctors
    double* v = a.raw(sn * (sn ? sn - 1 : 0));
    double* u = a.raw(sn);
    double* p = a.raw(sn);
    double* box = a.raw(2 * sn);
    const bool frozen = (in.byte() & 7) != 0 && !bad_n;
    if (frozen) {  // the gradients at x0, as wncgcv freezes them
      System clean = sys;
      clean.fail_at = clean.poison_at = 0;
      const std::int32_t one = 1, req = 2;
      std::int32_t e = 0;
      double jac[400];
      const std::size_t m = sn - 1;
      if (evaluate(&clean, &one, sc->xd, &req, jac, &e) == 0)
        for (std::size_t k = 0; k < m; ++k)
          for (std::size_t i = 0; i < sn; ++i) v[i + sn * k] = jac[k + m * i];
    } else {
      for (std::size_t k = 0; k < sn * (sn ? sn - 1 : 0); ++k) v[k] = in.real();
    }
    const double h = (in.byte() & 7) ? in.pick(0, 16) / 16.0 : in.real();
    for (std::size_t i = 0; i < sn; ++i) {
      u[i] = (in.byte() & 7) ? sc->t0[i] : in.real();
      p[i] = sc->xd[i] + h * sc->t0[i] + ((in.byte() & 7) ? 0.0 : in.real());
      const double wl = (in.byte() & 7) ? sc->pas[sn + i] : in.real();
      const double wu = (in.byte() & 7) ? wl : in.real();
      box[2 * i] = p[i] - wl;
      box[2 * i + 1] = p[i] + wu;
    }
    a.seal(v, sn * (sn ? sn - 1 : 0));
    a.seal(u, sn);
    a.seal(p, sn);
    a.seal(box, 2 * sn);
    double* rnorm = a.out(1);
    const char* name = routine == 2 ? "wncgnn" : routine == 3 ? "wncgnr" : "wncgf2";
    std::int32_t res;
    if (routine == 2) res = wncgnn(&sys, &n, evaluate, v, p, box, xnew, rnorm, &ierr);
    else if (routine == 3) res = wncgnr(&sys, &n, evaluate, u, p, box, xnew, rnorm, &ierr);
    else res = wncgf2(&sys, evaluate, u, p, box, xnew, rnorm, &ierr);
    a.i32(ierr);
    FUZZ_CHECK(name, res == (ierr ? 1 : 0));
    const auto fr = frames();
    if (bad_n) {
      FUZZ_CHECK(name, ierr == (n < 2 ? 4712 : 4718) && sys.calls == 0);
      FUZZ_CHECK(name, all_sentinel(xnew, sn) && is_sentinel(*rnorm));
    } else {
      const bool f2 = routine == 4;
      FUZZ_CHECK(name, code_ok(ierr, sys, {0, 4701, 4716, f2 ? 0 : 4702}));
      FUZZ_CHECK(name, sys.calls <= (f2 ? 305 : 100));
      // fct failed: its call was the last one.
      const bool fct_failed = sys.fail_at != 0 && sys.calls == sys.fail_at;
      if (f2) {
        if (fct_failed) {
          FUZZ_CHECK(name, ierr == sys.fail_code && all_sentinel(xnew, 2) && is_sentinel(*rnorm));
          if (ierr == 4716) FUZZ_CHECK(name, fr.empty());
          else FUZZ_CHECK(name, fr.size() == 1 && fr[0].name == "WNCGF2;" && fr[0].code == ierr);
        } else if (ierr == 4701) {
          FUZZ_CHECK(name, fr.size() == 1 && fr[0].name == "WNCGF2;" && fr[0].code == 4701 && sys.calls == 100);
        } else {
          FUZZ_CHECK(name, fr.empty());
        }
      } else {
        FUZZ_CHECK(name, fr.empty());
        if (ierr == 4701 && !fct_failed) FUZZ_CHECK(name, sys.calls == 100);
      }
      // The kept point and its norm: p with 1e38 before any decrease, else the norm at the
      // point (with the linear condition's square first for wncgnr).
      if (!fct_failed && ierr != kSentinelInt && one_of(ierr, {0, 4701, 4702, 4716})) {
        FUZZ_CHECK(name, none_sentinel(xnew, sn) && !is_sentinel(*rnorm));
        FUZZ_CHECK(name, *rnorm <= 1e38);
        if (*rnorm == 1e38) {
          if (!f2) for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK(name, same(xnew[i], p[i]));
        } else if (!sys.poisoned()) {
          double expect = residual_sum(sys, xnew);
          if (routine == 3) {
            double lin = 0;
            for (std::size_t i = 0; i < sn; ++i) lin += u[i] * (xnew[i] - p[i]);
            expect = lin * lin + expect;
          }
          FUZZ_CHECK(name, same(*rnorm, expect));
        }
        if (ierr == 0 && !f2)  // the kept point passed the box test once more
          for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK(name, box[2 * i] <= xnew[i] && xnew[i] <= box[2 * i + 1]);
      }
    }
  }
  a.done_released();
  FUZZ_CHECK("fct", orvq7sys_msg_count() == 0);
}

// ---- End tests and step acceptance: wnctes, wnctfe, wnctop, wnctob, wnccar, wncver ----------

// The closure value of a point: (x - x0) . d0, by increasing index.
double closure(const Scene& sc, const double* x) {
  double g = 0;
  for (std::size_t i = 0; i < sc.sn; ++i) g += (x[i] - sc.xd[i]) * sc.xd[sc.sn + i];
  return g;
}

// The end point on a face: one coordinate equal to a bound to the bit, none of the others
// outside the box by more than 1e-12 (a bound that is not a number has no outside).
bool on_face(std::size_t n, const double* box, const double* x) {
  bool face = false;
  for (std::size_t i = 0; i < n; ++i) {
    if (same(x[i], box[i]) || same(x[i], box[n + i])) face = true;
    else if (x[i] < box[i] - 1e-12 || x[i] > box[n + i] + 1e-12) return false;
  }
  return face;
}

void fuzz_wnctop(Input& in) {
  Case a(in, "wnctop");
  const std::int32_t n = in.count(1, 21);  // no upper bound: 22 is read as given
  const std::size_t sn = n >= 1 ? std::size_t(n) : 0;
  const double* xa = a.reals(sn);
  double* xb = a.raw(sn);
  double* box = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    xb[i] = (in.byte() & 3) ? xa[i] + static_cast<std::int8_t>(in.byte()) / 8.0 : in.real();
    box[i] = (in.byte() & 7) ? static_cast<std::int8_t>(in.byte()) / 8.0 - 8 : in.real();
    box[sn + i] = (in.byte() & 7) ? static_cast<std::int8_t>(in.byte()) / 8.0 + 8 : in.real();
    if ((in.byte() & 15) == 0) xb[i] = (in.byte() & 1) ? box[i] : box[sn + i];
  }
  a.seal(xb, sn);
  a.seal(box, 2 * sn);
  std::int32_t face[2] = {kSentinelInt, kSentinelInt}, ierr = kSentinelInt;
  double* xout = a.out(sn);
  const std::int32_t res = wnctop(a.i32(n), xa, xb, box, face, xout, &ierr);
  FUZZ_CHECK("wnctop", res == (ierr ? 1 : 0) && one_of(ierr, {0, 4712}));
  // The candidates, independently: on or beyond a bound, the lower one first.
  bool any = false, nan_ratio = false;
  double best = -1;
  std::size_t first_best = 0;
  for (std::size_t i = 0; i < sn; ++i) {
    const bool low = xb[i] <= box[i], high = xb[i] >= box[sn + i];
    if (!low && !high) continue;
    const double b = low ? box[i] : box[sn + i];
    const double num = std::fabs(xb[i] - xa[i]), den = std::fabs(b - xa[i]);
    const double r = num == 0 && den == 0 ? 1.0 : num / den;
    if (std::isnan(r)) nan_ratio = true;
    if (!any || r > best) best = r, first_best = i;
    any = true;
  }
  if (res == 1) {
    FUZZ_CHECK("wnctop", !any && face[0] == kSentinelInt && face[1] == kSentinelInt);
    FUZZ_CHECK("wnctop", all_sentinel(xout, sn));
  } else {
    FUZZ_CHECK("wnctop", any && (face[0] == 1 || face[0] == 2) && face[1] >= 1 && face[1] <= n);
    const std::size_t k = std::size_t(face[1] - 1);
    const bool low = xb[k] <= box[k];
    FUZZ_CHECK("wnctop", face[0] == (low ? 1 : 2) && (low || xb[k] >= box[sn + k]));
    FUZZ_CHECK("wnctop", same(xout[k], box[face[0] == 1 ? k : sn + k]) && none_sentinel(xout, sn));
    if (!nan_ratio) FUZZ_CHECK("wnctop", k == first_best);
  }
  a.done();
}

void fuzz_wncver(Input& in) {
  Case a(in, "wncver");
  const std::int32_t n = (in.byte() & 7) ? in.pick(2, 5) : in.count(2, 20);
  const std::size_t sn = n >= 1 && n <= 21 ? std::size_t(n) : 0;
  Orvq7PathOptions o{};
  const std::uint8_t f = in.byte();
  const std::int32_t kinds[4] = {2, 4, 8, 4};
  o.kind = (f & 0x70) ? kinds[f & 3] : in.int32();
  o.per_unknown = (f >> 2) & 1;
  o.flag18 = (f & 0x80) ? in.pick(0, 2) : 1;
  o.order = 1;
  o.first_order = 1;
  const Orvq7PathOptions o0 = o;
  double* limits = a.raw(2);
  limits[0] = in.real();
  limits[1] = (in.byte() & 7) ? 0.92388 : in.real();
  a.seal(limits, 2);
  const double* tol = tolerances(in, a, o.per_unknown ? sn : 1);
  double* step = a.raw(sn);
  double* t = a.raw(sn);
  double* tnew = a.raw(sn);
  const double len = in.pick(0, 32) / 64.0;
  for (std::size_t i = 0; i < sn; ++i) {
    t[i] = (in.byte() & 7) ? static_cast<std::int8_t>(in.byte()) / 128.0 : in.real();
    tnew[i] = (in.byte() & 7) ? t[i] + static_cast<std::int8_t>(in.byte()) / 1024.0 : in.real();
    step[i] = (in.byte() & 7) ? len * t[i] : in.real();
  }
  for (double* v : {step, t, tnew}) a.seal(v, sn);
  std::int32_t redo = kSentinelInt, ierr = kSentinelInt;
  double* dot = a.out(1);
  const std::int32_t res = wncver(&n, step, t, tnew, &o, limits, tol, &redo, dot, &ierr);
  FUZZ_CHECK("wncver", res == (ierr ? 1 : 0) && one_of(ierr, {0, 4712, 4718}));
  FUZZ_CHECK("wncver", std::memcmp(&o, &o0, sizeof o) == 0);
  if (n < 2 || n > 20) {
    FUZZ_CHECK("wncver", ierr == (n < 2 ? 4712 : 4718));
    FUZZ_CHECK("wncver", redo == kSentinelInt && is_sentinel(*dot));
  } else {
    const double d = dot_of(sn, t, tnew);
    FUZZ_CHECK("wncver", same(*dot, d) && one_of(redo, {0, 1, 2}));
    const double lim = limits[1];
    const bool turned = (o.flag18 == 1 && std::fabs(d) < lim) || (o.flag18 == 2 && d < lim);
    if (turned) FUZZ_CHECK("wncver", redo == 1);
    else if (o.kind != 4) FUZZ_CHECK("wncver", redo == 0);
    else {  // the chord's distance from the curve in units of the tolerance
      const double l = std::sqrt(dot_of(sn, step, step)), tl = std::sqrt(dot_of(sn, t, t));
      double q = 0;
      for (std::size_t i = 0; i < sn; ++i) {
        const double ti = tl > 0 ? t[i] / tl : t[i];
        const double di = ((l / 8) * (ti - (d < 0 ? -1.0 : 1.0) * tnew[i])) / tol[o.per_unknown ? i : 0];
        q += di * di;
      }
      FUZZ_CHECK("wncver", redo == (q > 1 ? 2 : 0));
    }
  }
  a.done();
}

void fuzz_events(Input& in) {
  const std::int32_t routine = in.byte() % 6;
  if (routine == 2) return fuzz_wnctop(in);
  if (routine == 5) return fuzz_wncver(in);
  const char* name = routine == 0 ? "wnctes" : routine == 1 ? "wnctfe" : routine == 3 ? "wnctob" : "wnccar";
  Case a(in, name);
  const std::int32_t n = (in.byte() & 7) ? in.pick(2, 5) : in.count(2, 20);
  const bool bad_n = n < 2 || n > 20;
  auto r = std::make_unique<Records>();
  const double* pas = nullptr;
  if (routine == 4) {  // wnccar reads the options (made for 2 unknowns when n is out of range)
    if (options(in, a, bad_n ? 2 : n, *r) != 0) {
      a.call.quiet();
      return;
    }
    if (!bad_n) pas = r->pas;
  }
  auto sc = std::make_unique<Scene>();
  make_scene(in, a, n, pas, *sc);
  const std::size_t sn = sc->sn;
  System& sys = sc->sys;
  sys.soft_cap = true;
  sys.max_calls = 8000;
  const double* eps = a.real((in.byte() & 7) ? ((in.byte() & 1) ? 1e-20 : 1e-12) : in.real());
  const double* xnew = new_point(in, a, *sc);
  Orvq7PathMarch& m = sc->march;
  const Orvq7PathMarch before = m;
  std::int32_t ierr = kSentinelInt;
  // The result matches the code; n outside 2..20: the argument code, fct not called, the march
  // record and the outputs untouched; else one of `own` or fct's code. True for a good n.
  auto settled = [&](std::int32_t res, bool untouched, std::initializer_list<std::int32_t> own) {
    a.i32(ierr);
    FUZZ_CHECK(name, res == (ierr ? 1 : 0));
    if (bad_n) FUZZ_CHECK(name, ierr == (n < 2 ? 4712 : 4718) && sys.calls == 0 && same_march(before, m) && untouched);
    else FUZZ_CHECK(name, code_ok(ierr, sys, own));
    return !bad_n;
  };
  if (routine == 0) {
    std::int32_t redo = kSentinelInt, special = kSentinelInt;
    double* xkeep = a.out(sn);
    const std::int32_t res = wnctes(&sys, &n, evaluate, eps, sc->xd, xnew, sc->box, sc->pas, &m, &redo,
                                    xkeep, &special, &ierr);
    if (settled(res, redo == kSentinelInt && special == kSentinelInt && all_sentinel(xkeep, sn), {0, 4718, 36})) {
      FUZZ_CHECK(name, only_changed(before, m, true, true));
      if (res == 0) {
        FUZZ_CHECK(name, same(m.close, closure(*sc, xnew)));
        FUZZ_CHECK(name, one_of(redo, {0, 1}) && one_of(special, {kSentinelInt, 0, 1, 2}));
        if (redo == 1) FUZZ_CHECK(name, special == kSentinelInt && all_sentinel(xkeep, sn));
        if (special == 2)
          for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK(name, same(xkeep[i], sc->xd[i]));
        if (special == 1) FUZZ_CHECK(name, redo == 0 && on_face(sn, sc->box, xkeep) && on_curve(sys, xkeep, *eps));
        if (redo == 0 && (special == 0 || special == kSentinelInt))
          for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK(name, same(xkeep[i], xnew[i]));
        if (special == 0 && std::isnormal(before.f * 0.5)) FUZZ_CHECK(name, same(m.f, before.f));
      }
    }
  } else if (routine == 1) {
    std::int32_t hit = kSentinelInt;
    const std::int32_t res = wnctfe(&sys, &n, evaluate, eps, sc->xd, xnew, sc->pas, &m, &hit, &ierr);
    if (settled(res, hit == kSentinelInt, {0})) {
      FUZZ_CHECK(name, only_changed(before, m, false, res == 0));
      const double g = closure(*sc, xnew);
      const bool crossing = before.close_prev < 0 && g >= 0;
      if (!crossing) FUZZ_CHECK(name, sys.calls == 0 && res == 0 && hit == 0);
      if (res == 0) FUZZ_CHECK(name, same(m.close, g) && (hit == 0 || (hit == 1 && crossing)));
    }
  } else if (routine == 3) {
    std::int32_t status = kSentinelInt;
    double* xend = a.out(sn);
    const std::int32_t res = wnctob(&sys, &n, evaluate, eps, xnew, sc->box, sc->pas, &m, &status, xend, &ierr);
    if (settled(res, status == kSentinelInt && all_sentinel(xend, sn), {0, 4718, 36})) {
      FUZZ_CHECK(name, only_changed(before, m, true, false));
      FUZZ_CHECK(name, sys.calls <= long(n) * 307 + 1);
      if (res == 0) {
        FUZZ_CHECK(name, one_of(status, {0, 1, 2}) && (status == 2) == (before.nstored <= 1));
        if (status == 2) FUZZ_CHECK(name, sys.calls == 0);
        if (status != 0) FUZZ_CHECK(name, same(m.f, before.f * 0.5) && all_sentinel(xend, sn));
        if (status == 0) {
          double ahead = 0;
          for (std::size_t i = 0; i < sn; ++i) ahead += (xend[i] - before.x[i]) * before.t[i];
          FUZZ_CHECK(name, same(m.f, before.f) && on_face(sn, sc->box, xend) && !(ahead < 0));
          FUZZ_CHECK(name, on_curve(sys, xend, *eps));
        }
      }
    }
  } else {  // wnccar
    const std::int32_t special0 = (in.byte() & 15) ? in.pick(0, 2) : in.int32();
    std::int32_t special = special0, redo = kSentinelInt, accepted = kSentinelInt;
    const std::int32_t res = wnccar(&sys, &n, evaluate, sc->xd, xnew, sc->pas, &r->options, r->limits,
                                    r->tol, &special, &m, &redo, &accepted, &ierr);
    settled(res, redo == kSentinelInt && accepted == kSentinelInt && special == special0, {0, 4718, 36});
    if (res == 0) {
      bool beyond_min = false, beyond_max = false;
      for (std::size_t i = 0; i < sn; ++i) {
        const double s = std::fabs(xnew[i] - before.x[i]);
        beyond_min |= s > sc->pas[i];
        beyond_max |= s > sc->pas[sn + i];
      }
      FUZZ_CHECK(name, accepted == ((special0 == 0 || beyond_min || before.nstored < 2) ? 1 : 2));
      FUZZ_CHECK(name, one_of(redo, {0, 1, 2}) && (redo != 2 || r->options.kind == 4));
      if (beyond_max) FUZZ_CHECK(name, redo == 1 && sys.calls == 0);
      if (redo != 0) {
        FUZZ_CHECK(name, special == 0 && same(m.f, 0.75 * before.f) && only_changed(before, m, true, false));
      } else {
        FUZZ_CHECK(name, special == special0 && same(m.f, before.f));
        const double* x = special0 == 2 ? sc->xd : xnew;
        for (std::size_t i = 0; i < sn; ++i)
          FUZZ_CHECK(name, same(m.x[i], x[i]) && same(m.tprev[i], before.t[i]));
        if (special0 == 2) {
          FUZZ_CHECK(name, sys.calls == 0);
          for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK(name, same(m.t[i], sc->xd[sn + i]));
        } else {
          FUZZ_CHECK(name, !(dot_of(sn, before.t, m.t) < 0));  // the orientation kept
        }
      }
    }
    a.call.quiet();
  }
  if (routine != 4) only_f2_frames(name, n, frames());
  a.done_released();
  FUZZ_CHECK(name, orvq7sys_msg_count() == 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  // The selector's low values keep their targets of old; the high half of the driver's share
  // goes to the step routines.
  const std::uint8_t sel = in.byte();
  switch (sel % 6) {
    case 4: case 5:
      if (sel < 128) fuzz_ynchem(in);
      else if (sel % 6 == 4) fuzz_newton(in);
      else fuzz_events(in);
      break;
    case 0: fuzz_march(in); break;
    case 1: fuzz_ynumde(in); break;
    case 2: fuzz_storage(in); break;
    default: fuzz_variants(in); break;
  }
  return 0;
}

}  // namespace fuzz
