// fuzz/fuzz_path.cpp -- the path-following solver's routines (options, start, tangents, step
// choice, point storage, result tables) with an evaluation routine whose values and failures
// come from the fuzz input. After every input: codes from the documented sets, outputs
// untouched where documented, every workspace block and every table released.
#include <cmath>
#include <cstdint>
#include <cstring>
#include <memory>
#include <vector>

#include "fuzz_support.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

using fuzz::Args;
using fuzz::Call;
using fuzz::Input;
using fuzz::all_sentinel;
using fuzz::none_sentinel;
using fuzz::one_of;

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
};
constexpr std::int32_t kOwnCode = 7777;

std::int32_t evaluate(void* ctx, const std::int32_t* npts, const double* x, const std::int32_t* req,
                      double* out, std::int32_t* ierr) {
  System& s = *static_cast<System*>(ctx);
  const std::int32_t n = s.n, m = n - 1;
  FUZZ_CHECK("fct", *npts >= 1 && *req >= 1 && *req <= 7);
  FUZZ_CHECK("fct", ++s.calls <= s.max_calls);
  if (s.calls == s.fail_at) {
    *ierr = s.fail_code;
    return 1;
  }
  double* o = out;
  for (std::int32_t p = 0; p < *npts; ++p) {
    const double* y = x + std::size_t(p) * std::size_t(n);
    double r2 = 0;
    for (std::int32_t i = 0; i < n; ++i) r2 += y[i] * y[i];
    if (*req & 1)
      for (std::int32_t k = 0; k < m; ++k) {
        double f = s.c[std::size_t(k)] + s.q[std::size_t(k)] * r2;
        for (std::int32_t i = 0; i < n; ++i) f += s.a[std::size_t(k + m * i)] * y[i];
        *o++ = f;
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
  double limits[2] = {fuzz::sentinel(), fuzz::sentinel()};
  Orvq7PathLayout layout{};
  std::int32_t pairs[22] = {};
  Orvq7PathMarch march{};
  Orvq7PathTables tables{};
  std::int32_t itab = 0;
  const double* pas = nullptr;  // as given to wnccmd
  const double* tol = nullptr;
};

// wnccmd with arguments decoded from the input; returns its code.
std::int32_t options(Input& in, Args& a, std::int32_t n, Records& r) {
  const std::size_t sn = n > 0 && n <= 21 ? std::size_t(n) : 0;
  double* pas = a.raw(2 * sn);
  for (std::size_t i = 0; i < sn; ++i) {
    pas[i] = (in.byte() & 15) ? 0.01 * (1 + in.pick(0, 9)) : in.real();
    pas[sn + i] = (in.byte() & 15) ? pas[i] * (2 + in.pick(0, 30)) : in.real();
  }
  a.seal(pas, 2 * sn);
  const std::uint8_t f = in.byte();
  std::int32_t mode;
  if ((f & 15) == 0) {
    mode = in.int32();
  } else {
    const std::int32_t kinds[4] = {1, 2, 4, 8};
    mode = kinds[f >> 6];
    if (f & 0x10) mode |= 1 << 15;
    if (f & 0x20) mode |= 1 << (16 + in.pick(0, 3));
  }
  const bool per_unknown = mode & (1 << 16);
  const std::size_t st = per_unknown ? sn : 1;
  double* tol = a.raw(st);
  for (std::size_t i = 0; i < st; ++i) tol[i] = (in.byte() & 7) ? 1e-3 * (1 + in.pick(0, 99)) : in.real();
  a.seal(tol, st);
  r.pas = pas;
  r.tol = tol;
  const std::uint8_t g = in.byte();
  const std::int32_t store = (g & 15) == 0 ? in.int32() : ((g & 1) ? 2 : 0) | ((g & 2) ? 0x38 : 0) |
                                                             ((g & 4) ? 1 : 0) | ((g & 8) ? 1 << 30 : 0);
  const std::int32_t variant = (in.byte() & 7) ? 1 : in.pick(0, 3);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t res = wnccmd(a.i32(n), pas, a.i32(mode), tol, a.i32(store), a.i32(variant),
                                  &r.options, r.limits, &r.layout, r.pairs, &ierr);
  FUZZ_CHECK("wnccmd", one_of(ierr, {0, 4712, 4718}) && res == (ierr ? 1 : 0));
  if (n < 2) FUZZ_CHECK("wnccmd", ierr == 4712);
  else if (n > 20) FUZZ_CHECK("wnccmd", ierr == 4718);
  if (n < 2 || n > 20) FUZZ_CHECK("wnccmd", all_sentinel(r.limits, 2));
  if (ierr == 0) {
    FUZZ_CHECK("wnccmd", one_of(r.options.kind, {1, 2, 4, 8}) && r.layout.nused >= 1);
    FUZZ_CHECK("wnccmd", !fuzz::is_sentinel(r.limits[1]));
    if (r.options.kind >= 4) FUZZ_CHECK("wnccmd", !fuzz::is_sentinel(r.limits[0]));
  }
  return ierr;
}

// Every table made for the input released, and the traceback free of frames but yncrea's.
struct TableWatch {
  std::int64_t live0 = orvq7sys_table_live();
  ~TableWatch() { orvq7sys_table_refuse(0, 0); }
  void released(const char* routine) const {
    if (orvq7sys_table_live() != live0) fuzz::broken(routine, "table not released", long(orvq7sys_table_live() - live0));
  }
};

// ---- A traced path, step by step, through the exported routines ---------------------------

void fuzz_march(Input& in) {
  Args a(in);
  Call call("wncini");
  TableWatch tables;
  auto r = std::make_unique<Records>();
  const std::int32_t n = (in.byte() & 7) ? in.pick(2, 5) : in.count(2, 20);
  if (options(in, a, n, *r) != 0) {
    a.check_inputs("wnccmd");
    call.quiet();
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
  a.seal(xd, 2 * sn);
  a.seal(box, 2 * sn);
  System sys = make_system(in, n, xd);
  const double* eps = a.real((in.byte() & 7) ? 1e-20 : in.real());
  const std::uint8_t faults = in.byte();
  if ((faults & 7) == 0) orvq7sys_table_refuse(in.pick(0, 3), 1);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t res = wncini(&sys, &n, evaluate, eps, xd, box, &r->options, &r->layout,
                                  r->pairs, &r->march, &r->tables, &r->itab, &ierr);
  orvq7sys_table_refuse(0, 0);
  FUZZ_CHECK("wncini", res == (ierr ? 1 : 0));
  FUZZ_CHECK("wncini", one_of(ierr, {0, 4712, 4718, 4721, 36, 4703, kOwnCode}) ||
                           (ierr == sys.fail_code && sys.fail_at != 0));
  a.check_inputs("wncini");
  call.quiet();
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
    std::int32_t e = fuzz::kSentinelInt;
    const std::int32_t pr = wncpas(&n, &variant, &r->options, r->limits, r->tol, r->pas, &r->march, &e);
    FUZZ_CHECK("wncpas", pr == (e ? 1 : 0) && one_of(e, {0, 4712, 4718}));
    if (e != 0) {
      FUZZ_CHECK("wncpas", fuzz::same(r->march.h, h0) && fuzz::same(r->march.f, f0));
      const auto fr = fuzz::frames();
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
  std::int32_t e = fuzz::kSentinelInt;
  const std::int32_t two = 2, none = 0;
  const std::int32_t end = wncflu(&two, &none, &r->options, &r->layout, &r->march, &r->tables, &r->itab, &e);
  FUZZ_CHECK("wncflu", end == 0 || !intact);
  const std::int32_t kinds[7] = {22, 23, 43, 1, 2, 3, 99};
  for (std::int32_t kind : kinds) {
    Call yc("yncrea");
    std::int32_t handle = fuzz::kSentinelInt, count = fuzz::kSentinelInt;
    const std::int32_t yr = yncrea(&r->itab, &kind, &handle, &count, &e);
    const auto fr = fuzz::frames();
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
      FUZZ_CHECK("yncrea", e == 4712 && handle == fuzz::kSentinelInt && count == fuzz::kSentinelInt);
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
  Args a(in);
  Call call("ynumde");
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
  if (refuse) call.refuse(1);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t res = ynumde(&sys, a.i32(n), evaluate, a.i32(npts), x, a.i32(req), out, &ierr);
  a.i32(ierr);  // shown with the arguments when a check fails
  call.refuse(0);
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
  a.check_inputs("ynumde");
  call.quiet();
}

// ---- Storage on its own: wncfst, yncrea, yncend on foreign handles ----------------------------

void fuzz_storage(Input& in) {
  Args a(in);
  Call call("wncfst");
  TableWatch tables;
  auto r = std::make_unique<Records>();
  const std::int32_t n = in.pick(2, 6);
  if (options(in, a, n, *r) != 0) return;
  const std::size_t nv = std::size_t(std::max(r->layout.nvalues, 0));
  const double* values = a.reals(nv ? nv : 1);
  const int points = in.pick(1, 4);
  std::int32_t e = fuzz::kSentinelInt;
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
  call.quiet();
  // Foreign handles: no result, an unknown handle.
  const std::int32_t foreign[2] = {0, 0x7fff1234};
  for (std::int32_t h : foreign) {
    Call yc("yncrea");
    const std::int32_t kind = 23;
    std::int32_t handle = fuzz::kSentinelInt, count = fuzz::kSentinelInt, e2 = -1;
    FUZZ_CHECK("yncrea", yncrea(&h, &kind, &handle, &count, &e2) == 1 && e2 != 0);
    FUZZ_CHECK("yncrea", handle == fuzz::kSentinelInt && count == fuzz::kSentinelInt);
    for (const auto& f : fuzz::frames()) FUZZ_CHECK("yncrea", f.name == " YNCREA ");
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
  Args a(in);
  Call call("wnccim");
  auto r = std::make_unique<Records>();
  const std::int32_t n = in.pick(2, 6);
  options(in, a, n, *r);
  const std::int32_t dims[3] = {n, 1, 21};
  const std::int32_t dn = dims[in.byte() % 3];
  Orvq7PathOptions o = r->options;
  Orvq7PathLayout l = r->layout;
  std::int32_t e = fuzz::kSentinelInt;
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
  call.quiet();
}

// ---- The driver: a whole path traced by ynchem ----------------------------------------------

void fuzz_ynchem(Input& in) {
  Args a(in);
  Call call("ynchem");
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
  a.seal(xd, 2 * sn);
  a.seal(box, 2 * sn);
  a.seal(pas, 2 * sn);
  const std::uint8_t f = in.byte();
  std::int32_t mode;
  if ((f & 15) == 0) {
    mode = in.int32();
  } else {
    const std::int32_t kinds[4] = {2, 4, 8, 4};
    mode = kinds[f >> 6];
    if (f & 0x10) mode |= 1 << 15;
    if (f & 0x20) mode |= 1 << (16 + in.pick(0, 3));
  }
  const std::size_t st = (mode & (1 << 16)) ? sn : 1;
  double* tol = a.raw(st);
  for (std::size_t i = 0; i < st; ++i) tol[i] = (in.byte() & 7) ? 1e-3 * (1 + in.pick(0, 99)) : in.real();
  a.seal(tol, st);
  const std::uint8_t g = in.byte();
  const std::int32_t store = (g & 15) == 0 ? in.int32() : 2 | ((g & 1) ? 4 : 0) | ((g & 2) ? 8 : 0) |
                                                             ((g & 4) ? 16 : 0) | ((g & 8) ? 64 : 0);
  double x0[21] = {};
  for (std::size_t i = 0; i < sn; ++i) x0[i] = xd[i];
  System sys = make_system(in, sn >= 2 ? n : 2, x0);
  sys.max_calls = 1L << 40;
  const double* eps = a.real((in.byte() & 7) ? 1e-20 : in.real());
  const std::uint8_t faults = in.byte();
  if ((faults & 15) == 1) orvq7sys_table_refuse(in.pick(0, 40), 1);
  if ((faults & 15) == 2) orvq7sys_ws_refuse(1);
  std::int32_t itab = fuzz::kSentinelInt, ierr = fuzz::kSentinelInt;
  const std::int32_t res = ynchem(&sys, a.i32(n), evaluate, eps, xd, box, pas, a.i32(mode), tol,
                                  a.i32(store), &itab, &ierr);
  orvq7sys_table_refuse(0, 0);
  orvq7sys_ws_refuse(0);
  const bool fct_code = sys.fail_at != 0 && sys.calls >= sys.fail_at && ierr == sys.fail_code;
  FUZZ_CHECK("ynchem", res == 0 || res == 1);
  FUZZ_CHECK("ynchem", one_of(ierr, {0, 4712, 4718, 4713, 4720, 4721, 36}) || fct_code);
  const auto fr = fuzz::frames();
  for (const auto& x : fr)
    FUZZ_CHECK("ynchem", x.name == "YNCHEM  " || x.name == "WNCGOO  " || x.name == "WNCGF2;" ||
                             x.name == "WNCPAS  " || x.name == " YNCREA ");
  call.released();
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
    for (std::size_t i = 0; i < sn; ++i) FUZZ_CHECK("ynchem", fuzz::same(xt[i], xd[i]));
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

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  switch (in.byte() % 6) {
    case 4: case 5: fuzz_ynchem(in); break;
    case 0: fuzz_march(in); break;
    case 1: fuzz_ynumde(in); break;
    case 2: fuzz_storage(in); break;
    default: fuzz_variants(in); break;
  }
  return 0;
}
