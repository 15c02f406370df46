// fuzz/fuzz_linalg.cpp -- dense solver, tridiagonal solver, vector cleaning and normalisation,
// classification of linear maps, driven by arbitrary bytes: codes from the documented sets,
// outputs untouched on failure, workspace released (and refused on request), the same bits
// when an output may be an input and is.
#include <cmath>
#include <cstdint>
#include <vector>

#include "fuzz_support.h"
#include "linalg/linalg_api.h"

namespace fuzz {
namespace {

std::size_t len(std::int32_t n) { return n > 0 ? static_cast<std::size_t>(n) : 0; }

// An n-by-n matrix: arbitrary, or one of the shapes the classification looks for (multiple
// of the identity, zero, signed permutation, diagonal projector or affinity), or with two
// equal columns.
const double* matrix(Input& in, Args& args, std::int32_t n) {
  const std::size_t nn = len(n) * len(n);
  double* a = args.raw(nn);
  for (std::size_t k = 0; k < nn; ++k) a[k] = 0.0;
  const std::uint8_t kind = in.byte() % 8;
  const double l = in.real();
  for (std::int32_t j = 0; j < n; ++j) {
    double* col = a + len(j) * len(n);
    switch (kind) {
      case 1: col[j] = l; break;
      case 2: break;
      case 3: col[(j + (in.byte() & 1)) % n] = (in.byte() & 1) ? 1.0 : -1.0; break;
      case 4: col[j] = in.byte() & 1; break;
      case 5: col[j] = (in.byte() & 1) ? 1.0 : l; break;
      default:
        for (std::int32_t i = 0; i < n; ++i) col[i] = in.real();
        if (kind == 6 && j > 0)
          for (std::int32_t i = 0; i < n; ++i) col[i] = a[i];
    }
  }
  if (in.byte() % 4 == 0 && nn > 0) a[in.byte() % nn] += in.real() * 1e-12;
  args.seal(a, nn);
  return a;
}

void fuzz_ynsega(Input& in) {
  Case a(in, "ynsega");
  const std::int32_t n = in.count(1, 20);
  const std::size_t sn = len(n);
  const double* m = matrix(in, a, n <= 20 ? n : 0);
  const double* b = a.reals(sn);
  double* x = a.out(sn);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynsega(a.i32(n), m, b, x, &ierr);
  check_code("ynsega", r, ierr, {0, 4712, 4718, 4703});
  if (n < 1) FUZZ_CHECK("ynsega", ierr == 4712);
  if (n > 20) FUZZ_CHECK("ynsega", ierr == 4718);
  FUZZ_CHECK("ynsega", ierr ? all_sentinel(x, sn) : none_sentinel(x, sn));
  a.done();
  std::int32_t e2 = -1;  // x may be b itself
  same_when_aliased("ynsega", b, sn, ierr ? b : x, sn, [&](double* v) { ynsega(&n, m, v, v, &e2); });
  FUZZ_CHECK("ynsega", e2 == ierr);
}

void fuzz_ynsetr(Input& in) {
  Case a(in, "ynsetr");
  const std::int32_t n = (in.byte() & 3) ? in.count(1, 20) : in.pick(21, 40);
  const std::size_t sn = len(n);
  const double *d = a.reals(sn), *sub = a.reals(sn), *sup = a.reals(sn), *rhs = a.reals(sn);
  double* x = a.out(sn);
  const bool refuse = (in.byte() & 3) == 0;
  if (refuse) a.call.refuse(1);
  const std::int64_t req0 = a.call.requests_so_far();
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynsetr(a.i32(n), d, sub, sup, rhs, x, &ierr);
  const std::int64_t requests = a.call.requests_so_far() - req0;
  a.call.refuse(0);
  check_code("ynsetr", r, ierr, {0, 4712, 4703, 36});
  FUZZ_CHECK("ynsetr", requests <= (n > 20 ? 1 : 0));
  if (n <= 0) FUZZ_CHECK("ynsetr", ierr == 4712);
  if (ierr == 36) FUZZ_CHECK("ynsetr", refuse && n > 20);
  if (refuse && n > 20 && requests == 1) FUZZ_CHECK("ynsetr", ierr == 36);
  if (ierr == 0) FUZZ_CHECK("ynsetr", none_sentinel(x, sn));
  else if (ierr == 4703) {  // a written prefix x(1..i-1), the rest untouched
    const std::size_t i = written(x, sn);
    FUZZ_CHECK("ynsetr", i < sn && all_sentinel(x + i, sn - i));
    if (std::fabs(d[0]) < 1e-15) FUZZ_CHECK("ynsetr", i == 0);
  } else {
    FUZZ_CHECK("ynsetr", all_sentinel(x, sn));
  }
  a.done();
  std::int32_t e2 = 0;  // x may be r itself
  if (ierr == 0) same_when_aliased("ynsetr", rhs, sn, x, sn, [&](double* v) { ynsetr(&n, d, sub, sup, v, v, &e2); });
  FUZZ_CHECK("ynsetr", e2 == 0);
}

void fuzz_yntrzr(Input& in) {
  Case a(in, "yntrzr");
  const std::int32_t n = (in.byte() & 3) ? in.count(1, 12) : in.pick(95, 130);
  const std::int32_t mode = in.count(0, 2);
  const std::size_t sn = len(n);
  const double* v = a.reals(sn);
  const double* tol = a.reals(1);
  double* w = a.out(sn);
  const bool refuse = (in.byte() & 3) == 0;
  if (refuse) a.call.refuse(1);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = yntrzr(a.i32(n), v, tol, a.i32(mode), w, &ierr);
  a.call.refuse(0);
  check_code("yntrzr", r, ierr, {0, 4712, 4718, 36});
  if (n < 1) FUZZ_CHECK("yntrzr", ierr == 4712);
  else if (mode < 0 || mode > 2) FUZZ_CHECK("yntrzr", ierr == 4718);
  else if (ierr == 36) FUZZ_CHECK("yntrzr", refuse && mode == 1 && n > 100);
  else if (!(refuse && mode == 1 && n > 100)) FUZZ_CHECK("yntrzr", ierr == 0);
  if (ierr != 0) {
    FUZZ_CHECK("yntrzr", all_sentinel(w, sn));
  } else {
    double big = 0.0;  // a NaN is never the maximum
    for (std::size_t k = 0; k < sn; ++k)
      if (std::fabs(v[k]) > big) big = std::fabs(v[k]);
    for (std::size_t k = 0; k < sn; ++k) {
      FUZZ_CHECK("yntrzr", same(w[k], v[k]) || same(w[k], 0.0));
      if (mode == 0) FUZZ_CHECK("yntrzr", same(w[k], std::fabs(v[k]) <= *tol ? 0.0 : v[k]));
      if (mode == 2) FUZZ_CHECK("yntrzr", same(w[k], std::fabs(v[k]) <= *tol * big ? 0.0 : v[k]));
    }
  }
  a.done();
  std::int32_t e2 = -1;  // w may be v itself
  if (ierr == 0) same_when_aliased("yntrzr", v, sn, w, sn, [&](double* b) { yntrzr(&n, b, tol, &mode, b, &e2); });
}

void fuzz_yntrnr(Input& in) {
  Case a(in, "yntrnr");
  const std::int32_t n = in.count(1, 12), mode = in.count(0, 2);
  const std::size_t sn = len(n);
  const double* v = a.reals(sn);
  double* w = a.out(sn);
  double* norm = a.out(1);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = yntrnr(a.i32(n), v, a.i32(mode), w, norm, &ierr);
  check_code("yntrnr", r, ierr, {0, 4712, 4718, 4710});
  if (n < 1) {
    FUZZ_CHECK("yntrnr", ierr == 4712 && is_sentinel(*norm));
  } else if (mode < 0 || mode > 2) {
    FUZZ_CHECK("yntrnr", ierr == 4718 && same(*norm, 0.0));
  } else {
    double want = 0.0;  // by increasing index; a NaN is never the maximum
    for (std::size_t k = 0; k < sn; ++k) {
      if (mode == 0 && std::fabs(v[k]) > want) want = std::fabs(v[k]);
      if (mode == 1) want += std::fabs(v[k]);
      if (mode == 2) want += v[k] * v[k];
    }
    if (mode == 2) want = std::sqrt(want);
    FUZZ_CHECK("yntrnr", alike(*norm, want));
    FUZZ_CHECK("yntrnr", ierr == (want == 0 ? 4710 : 0));
  }
  FUZZ_CHECK("yntrnr", ierr ? all_sentinel(w, sn) : none_sentinel(w, sn));
  a.done();
}

const std::int32_t kKinds[] = {0x102,   0x202,   0x1103,  0x2103,   0x3103, 0x1203,
                               0x2203,  0x11104, 0x21104, 0x12104, 0x111105};

void fuzz_ynmnmr(Input& in) {
  Case a(in, "ynmnmr");
  const std::int32_t n = in.count(2, 3), m = in.count(0, 12);
  const double* mat = matrix(in, a, n >= 1 && n <= 4 ? n : 0);
  std::vector<std::int32_t> codes(len(m));
  for (auto& k : codes) k = (in.byte() & 7) ? kKinds[in.byte() % 11] : ((in.byte() & 1) ? 0 : in.int32());
  std::int32_t* index = a.out_i32();
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynmnmr(a.i32(n), mat, a.i32(m), a.i32s(codes), index, &ierr);
  check_code("ynmnmr", r, ierr, {0, 4712});
  if (n != 2 && n != 3) {
    FUZZ_CHECK("ynmnmr", ierr == 4712 && *index == kSentinelInt);
  } else {
    FUZZ_CHECK("ynmnmr", ierr == 0 && *index >= 0 && *index <= std::max(m, 0));
    if (*index > 0) {
      const std::int32_t got = codes[len(*index - 1)];
      bool known = got == 0;
      for (std::int32_t k : kKinds) known = known || got == k;
      FUZZ_CHECK("ynmnmr", known);
    }
  }
  a.done();
}

void fuzz_tests(Input& in, int which) {
  static const char* names[4] = {"wnmnm1", "wnmnm2", "wnmnm3", "wnmnm4"};
  static std::int32_t (*const fns[4])(const std::int32_t*, const double*, std::int32_t*,
                                      std::int32_t*) = {wnmnm1, wnmnm2, wnmnm3, wnmnm4};
  static const std::int32_t top[4] = {2, 1, 2, 1};
  const char* name = names[which];
  Case a(in, name);
  const std::int32_t n = in.count(2, 20);
  const double* mat = matrix(in, a, n >= 1 && n <= 21 ? n : 0);
  std::int32_t* flag = a.out_i32();
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = fns[which](a.i32(n), mat, flag, &ierr);
  if (n < 2 || n > 20) {
    FUZZ_CHECK(name, r == 1 && ierr == 4712 && *flag == kSentinelInt);
  } else {
    FUZZ_CHECK(name, r == 0 && ierr == 0 && *flag >= 0 && *flag <= top[which]);
  }
  a.done();
}

void fuzz_ynmimr(Input& in) {
  Case a(in, "ynmimr");
  const std::int32_t n = in.count(1, 20);
  const std::size_t sn = n <= 21 ? len(n) : 0, sa = sn * sn;
  const double* m = matrix(in, a, static_cast<std::int32_t>(sn));
  double* b = a.out(sa);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynmimr(a.i32(n), m, b, &ierr);
  check_code("ynmimr", r, ierr, {0, 4712, 4703, 4718});
  if (n < 1) FUZZ_CHECK("ynmimr", ierr == 4712);
  if (n > 20) FUZZ_CHECK("ynmimr", ierr == 4718);
  if (n == 1) FUZZ_CHECK("ynmimr", (ierr == 4703) == (std::fabs(m[0]) < 1e-15));
  if (n == 2) FUZZ_CHECK("ynmimr", (ierr == 4703) == (std::fabs(m[0] * m[3] - m[1] * m[2]) < 1e-30));
  if (ierr == 0) FUZZ_CHECK("ynmimr", none_sentinel(b, sa));
  else if (ierr != 4703 || n <= 2) FUZZ_CHECK("ynmimr", all_sentinel(b, sa));
  a.done();
  std::int32_t e2 = 0;  // b may be a itself
  if (ierr == 0) same_when_aliased("ynmimr", m, sa, b, sa, [&](double* v) { ynmimr(&n, v, v, &e2); });
  FUZZ_CHECK("ynmimr", e2 == 0);
}

void fuzz_ynmxmr(Input& in) {
  Case a(in, "ynmxmr");
  const std::int32_t n = in.count(1, 20);
  const std::size_t sn = n <= 20 ? len(n) : 0;
  const double* m = matrix(in, a, static_cast<std::int32_t>(sn));
  double* det = a.out(1);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynmxmr(a.i32(n), m, det, &ierr);
  FUZZ_CHECK("ynmxmr", ierr == (n < 1 ? 4712 : n > 20 ? 4718 : 0) && r == (ierr ? 1 : 0));
  FUZZ_CHECK("ynmxmr", is_sentinel(*det) == (ierr != 0));
  if (n == 1) FUZZ_CHECK("ynmxmr", same(*det, m[0]));
  if (n == 2) {
    const double want = m[0] * m[3] - m[1] * m[2];
    FUZZ_CHECK("ynmxmr", alike(*det, want));
  }
  a.done();
}

// ynmpmm, ynmpmv, ynmrmm: sizes below 1 refused with the output untouched.
void fuzz_products(Input& in, int which) {
  static const char* names[3] = {"ynmpmm", "ynmpmv", "ynmrmm"};
  const char* name = names[which];
  Case a(in, name);
  const std::int32_t m = in.count(1, 5), k = in.count(1, 5), n = in.count(1, 5);
  const bool ok = m >= 1 && k >= 1 && (which != 0 || n >= 1);
  const std::size_t sm = ok ? len(m) : 0, sk = ok ? len(k) : 0, sn = ok ? len(n) : 0;
  std::int32_t ierr = kSentinelInt, r = -1;
  std::size_t so = 0;
  double* out = nullptr;
  if (which == 0) {
    const double *x = a.reals(sm * sk), *y = a.reals(sk * sn);
    so = sm * sn;
    out = a.out(so);
    r = ynmpmm(a.i32(m), a.i32(k), a.i32(n), x, y, out, &ierr);
  } else if (which == 1) {
    const double *x = a.reals(sm * sk), *v = a.reals(sk);
    so = sm;
    out = a.out(so);
    r = ynmpmv(a.i32(m), a.i32(k), x, v, out, &ierr);
  } else {
    const double* x = a.reals(sm * sk);
    so = sm * sk;
    out = a.out(so);
    r = ynmrmm(a.i32(m), a.i32(k), x, out, &ierr);
    if (ok)  // B(j,i) = A(i,j)
      for (std::size_t i = 0; i < sm; ++i)
        for (std::size_t j = 0; j < sk; ++j) FUZZ_CHECK(name, same(out[j + i * sk], x[i + j * sm]));
  }
  FUZZ_CHECK(name, ierr == (ok ? 0 : 4712) && r == (ok ? 0 : 1));
  FUZZ_CHECK(name, ok ? none_sentinel(out, so) : all_sentinel(out, so));
  a.done();
}

void fuzz_ynmtvv(Input& in) {
  Case a(in, "ynmtvv");
  const std::int32_t n = in.count(1, 8);
  const std::size_t sn = len(n);
  const double *x = a.reals(2 * sn), *d = a.reals(sn);
  double* y = a.out(2 * sn);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynmtvv(a.i32(n), x, d, y, &ierr);
  // The first crossing pair (strict; a NaN never crosses) stops the widening after it.
  std::size_t stop = sn;
  for (std::size_t i = 0; i < sn && stop == sn; ++i)
    if (x[i] - d[i] > x[sn + i] + d[i]) stop = i;
  const bool fails = n < 1 || stop < sn;
  FUZZ_CHECK("ynmtvv", ierr == (fails ? 4712 : 0) && r == (fails ? 1 : 0));
  for (std::size_t i = 0; i < sn; ++i) {
    if (n >= 1 && i <= stop) {
      FUZZ_CHECK("ynmtvv", same(y[i], x[i] - d[i]) && same(y[sn + i], x[sn + i] + d[i]));
    } else {
      FUZZ_CHECK("ynmtvv", is_sentinel(y[i]) && is_sentinel(y[sn + i]));
    }
  }
  a.done();
  std::int32_t e2 = -1;  // y may be x
  same_when_aliased("ynmtvv", x, 2 * sn, y, 2 * sn, [&](double* v) { ynmtvv(&n, v, d, v, &e2); });
  FUZZ_CHECK("ynmtvv", e2 == ierr);
}

void fuzz_vectors(Input& in, int which) {
  if (which == 0) {
    Case a(in, "ynvpvv");
    const std::int32_t n = in.count(1, 8);
    const std::size_t sn = len(n);
    const double *u = a.reals(sn), *v = a.reals(sn);
    double* s = a.out(1);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynvpvv(a.i32(n), u, v, s, &ierr);
    FUZZ_CHECK("ynvpvv", ierr == (n < 1 ? 4712 : 0) && r == (n < 1 ? 1 : 0));
    if (n >= 1) {  // from the first term, left to right
      double want = u[0] * v[0];
      for (std::size_t k = 1; k < sn; ++k) want += u[k] * v[k];
      FUZZ_CHECK("ynvpvv", alike(*s, want));
    } else {
      FUZZ_CHECK("ynvpvv", is_sentinel(*s));
    }
    a.done();
  } else if (which == 1) {
    Case a(in, "ynvevv");
    const std::int32_t n = in.count(2, 8);
    const std::size_t sn = len(n), sw = n >= 2 ? sn * (sn - 1) / 2 : 0;
    const double *u = a.reals(sn), *v = a.reals(sn);
    double* w = a.out(sw);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynvevv(a.i32(n), u, v, w, &ierr);
    FUZZ_CHECK("ynvevv", ierr == (n < 2 ? 4712 : 0) && r == (n < 2 ? 1 : 0));
    std::size_t at = 0;
    for (std::size_t i = 0; i + 1 < sn && n >= 2; ++i)
      for (std::size_t j = i + 1; j < sn; ++j, ++at) {
        const double want = u[i] * v[j] - u[j] * v[i];
        FUZZ_CHECK("ynvevv", alike(w[at], want));
      }
    a.done();
  } else {
    Case a(in, "ynvvvv");
    const std::int32_t n = (in.byte() & 3) ? in.count(2, 6) : in.count(10, 21);
    const std::size_t sn = n <= 22 ? len(n) : 0, sa = sn ? sn * (sn - 1) : 0;
    double* m = a.raw(sa);
    for (std::size_t k = 0; k < sa; ++k) m[k] = in.real();
    if (sa && (in.byte() & 3) == 0) m[sa - 1] = m[sn - 1], m[sa - 2] = m[sn - 2];
    a.seal(m, sa);
    double* w = a.out(sn);
    const bool refuse = (in.byte() & 3) == 0;
    if (refuse) a.call.refuse(1);
    std::int32_t ierr = kSentinelInt;
    const std::int32_t r = ynvvvv(a.i32(n), m, w, &ierr);
    a.call.refuse(0);
    check_code("ynvvvv", r, ierr, {0, 4712, 4718, 36});
    if (n < 2) FUZZ_CHECK("ynvvvv", ierr == 4712);
    else if (n > 21) FUZZ_CHECK("ynvvvv", ierr == 4718);
    else if (n >= 11 && refuse) FUZZ_CHECK("ynvvvv", ierr == 36);
    else FUZZ_CHECK("ynvvvv", ierr == 0);
    FUZZ_CHECK("ynvvvv", ierr ? all_sentinel(w, sn) : none_sentinel(w, sn));
    if (n == 2) FUZZ_CHECK("ynvvvv", same(w[0], -m[1]) && same(w[1], m[0]));
    a.done();
  }
}

// ynxxlv: the model's coefficients and the extremes of each component recomputed from the
// candidates 0, the stationary point strictly inside, 1; ties keep the smaller parameter.
void fuzz_ynxxlv(Input& in) {
  Case a(in, "ynxxlv");
  const std::int32_t n = in.count(1, 6);
  const std::size_t sn = len(n);
  const double *x0 = a.reals(sn), *d = a.reals(sn), *x1 = a.reals(sn);
  double *e = a.out(sn), *ext = a.out(2 * sn), *sext = a.out(2 * sn);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynxxlv(a.i32(n), x0, d, x1, e, ext, sext, &ierr);
  FUZZ_CHECK("ynxxlv", ierr == (n < 1 ? 4712 : 0) && r == (n < 1 ? 1 : 0));
  for (std::size_t i = 0; i < sn; ++i) {
    const double ei = (x1[i] - x0[i]) - d[i];
    double lo = x0[i], hi = x0[i], slo = 0.0, shi = 0.0;
    auto consider = [&](double s, double v) {
      if (v < lo) lo = v, slo = s;
      if (v > hi) hi = v, shi = s;
    };
    if (ei != 0) {
      const double s = -d[i] / (2 * ei);
      if (0 < s && s < 1) consider(s, x0[i] + s * (d[i] + ei * s));
    }
    consider(1.0, x1[i]);
    const double want[5] = {ei, lo, hi, slo, shi};
    const double got[5] = {e[i], ext[i], ext[sn + i], sext[i], sext[sn + i]};
    for (int k = 0; k < 5; ++k)
      FUZZ_CHECK("ynxxlv", alike(got[k], want[k]));
  }
  a.done();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  const int sel = in.byte() % 19;
  switch (sel) {
    case 0: fuzz_ynsega(in); break;
    case 1: fuzz_ynsetr(in); break;
    case 2: fuzz_yntrzr(in); break;
    case 3: fuzz_yntrnr(in); break;
    case 4: fuzz_ynmnmr(in); break;
    case 5: case 6: case 7: case 8: fuzz_tests(in, sel - 5); break;
    case 9: fuzz_ynmimr(in); break;
    case 10: fuzz_ynmxmr(in); break;
    case 11: case 12: case 13: fuzz_products(in, in.byte() % 3); break;
    case 14: fuzz_ynmtvv(in); break;
    case 18: fuzz_ynxxlv(in); break;
    default: fuzz_vectors(in, in.byte() % 3); break;
  }
  return 0;
}

}  // namespace fuzz
