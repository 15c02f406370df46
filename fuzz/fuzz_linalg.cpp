// fuzz/fuzz_linalg.cpp -- dense solver, tridiagonal solver, vector cleaning and normalisation,
// classification of linear maps, driven by arbitrary bytes: codes from the documented sets,
// outputs untouched on failure, workspace released (and refused on request), the same bits
// when an output may be an input and is.
#include <cmath>
#include <cstdint>
#include <vector>

#include "fuzz_support.h"
#include "linalg/linalg_api.h"

namespace {

using fuzz::Args;
using fuzz::Call;
using fuzz::Input;
using fuzz::all_sentinel;
using fuzz::none_sentinel;
using fuzz::one_of;
using fuzz::same;

std::size_t len(std::int32_t n) { return n > 0 ? static_cast<std::size_t>(n) : 0; }

// An n-by-n matrix: arbitrary, or one of the shapes the classification looks for (multiple
// of the identity, zero, signed permutation, diagonal projector or affinity), or with two
// equal columns.
void matrix(Input& in, std::int32_t n, double* a) {
  const std::size_t nn = len(n) * len(n);
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
}

void fuzz_ynsega(Input& in) {
  Args a(in);
  Call c("ynsega");
  const std::int32_t n = in.count(1, 20);
  const std::size_t sn = len(n), sa = n <= 20 ? sn * sn : 0;
  double* m = a.raw(sa);
  matrix(in, n <= 20 ? n : 0, m);
  a.seal(m, sa);
  const double* b = a.reals(sn);
  double* x = a.out(sn);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = ynsega(a.i32(n), m, b, x, &ierr);
  FUZZ_CHECK("ynsega", one_of(ierr, {0, 4712, 4718, 4703}) && r == (ierr ? 1 : 0));
  if (n < 1) FUZZ_CHECK("ynsega", ierr == 4712);
  if (n > 20) FUZZ_CHECK("ynsega", ierr == 4718);
  FUZZ_CHECK("ynsega", ierr ? all_sentinel(x, sn) : none_sentinel(x, sn));
  a.check_inputs("ynsega");
  c.quiet();
  // x may be b itself.
  std::vector<double> xb(b, b + sn);
  std::int32_t e2 = -1;
  ynsega(&n, m, xb.data(), xb.data(), &e2);
  FUZZ_CHECK("ynsega", e2 == ierr);
  for (std::size_t k = 0; k < sn; ++k) FUZZ_CHECK("ynsega", same(xb[k], ierr ? b[k] : x[k]));
}

void fuzz_ynsetr(Input& in) {
  Args a(in);
  Call c("ynsetr");
  const std::int32_t n = (in.byte() & 3) ? in.count(1, 20) : in.pick(21, 40);
  const std::size_t sn = len(n);
  const double *d = a.reals(sn), *sub = a.reals(sn), *sup = a.reals(sn), *rhs = a.reals(sn);
  double* x = a.out(sn);
  const bool refuse = (in.byte() & 3) == 0;
  if (refuse) c.refuse(1);
  const std::int64_t req0 = c.requests_so_far();
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = ynsetr(a.i32(n), d, sub, sup, rhs, x, &ierr);
  const std::int64_t requests = c.requests_so_far() - req0;
  c.refuse(0);
  FUZZ_CHECK("ynsetr", one_of(ierr, {0, 4712, 4703, 36}) && r == (ierr ? 1 : 0));
  FUZZ_CHECK("ynsetr", requests <= (n > 20 ? 1 : 0));
  if (n <= 0) FUZZ_CHECK("ynsetr", ierr == 4712);
  if (ierr == 36) FUZZ_CHECK("ynsetr", refuse && n > 20);
  if (refuse && n > 20 && requests == 1) FUZZ_CHECK("ynsetr", ierr == 36);
  if (ierr == 0) FUZZ_CHECK("ynsetr", none_sentinel(x, sn));
  else if (ierr == 4703) {  // a written prefix x(1..i-1), the rest untouched
    std::size_t i = 0;
    while (i < sn && !fuzz::is_sentinel(x[i])) ++i;
    FUZZ_CHECK("ynsetr", i < sn && all_sentinel(x + i, sn - i));
    if (std::fabs(d[0]) < 1e-15) FUZZ_CHECK("ynsetr", i == 0);
  } else {
    FUZZ_CHECK("ynsetr", all_sentinel(x, sn));
  }
  a.check_inputs("ynsetr");
  c.quiet();
  if (ierr == 0) {  // x may be r itself
    std::vector<double> xr(rhs, rhs + sn);
    std::int32_t e2 = -1;
    ynsetr(&n, d, sub, sup, xr.data(), xr.data(), &e2);
    FUZZ_CHECK("ynsetr", e2 == 0);
    for (std::size_t k = 0; k < sn; ++k) FUZZ_CHECK("ynsetr", same(xr[k], x[k]));
  }
}

void fuzz_yntrzr(Input& in) {
  Args a(in);
  Call c("yntrzr");
  const std::int32_t n = (in.byte() & 3) ? in.count(1, 12) : in.pick(95, 130);
  const std::int32_t mode = in.count(0, 2);
  const std::size_t sn = len(n);
  const double* v = a.reals(sn);
  const double* tol = a.reals(1);
  double* w = a.out(sn);
  const bool refuse = (in.byte() & 3) == 0;
  if (refuse) c.refuse(1);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = yntrzr(a.i32(n), v, tol, a.i32(mode), w, &ierr);
  c.refuse(0);
  FUZZ_CHECK("yntrzr", one_of(ierr, {0, 4712, 4718, 36}) && r == (ierr ? 1 : 0));
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
  a.check_inputs("yntrzr");
  c.quiet();
  if (ierr == 0) {  // w may be v itself
    std::vector<double> vw(v, v + sn);
    std::int32_t e2 = -1;
    yntrzr(&n, vw.data(), tol, &mode, vw.data(), &e2);
    for (std::size_t k = 0; k < sn; ++k) FUZZ_CHECK("yntrzr", same(vw[k], w[k]));
  }
}

void fuzz_yntrnr(Input& in) {
  Args a(in);
  Call c("yntrnr");
  const std::int32_t n = in.count(1, 12), mode = in.count(0, 2);
  const std::size_t sn = len(n);
  const double* v = a.reals(sn);
  double* w = a.out(sn);
  double* norm = a.out(1);
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = yntrnr(a.i32(n), v, a.i32(mode), w, norm, &ierr);
  FUZZ_CHECK("yntrnr", one_of(ierr, {0, 4712, 4718, 4710}) && r == (ierr ? 1 : 0));
  if (n < 1) {
    FUZZ_CHECK("yntrnr", ierr == 4712 && fuzz::is_sentinel(*norm));
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
    FUZZ_CHECK("yntrnr", same(*norm, want) || (std::isnan(*norm) && std::isnan(want)));
    FUZZ_CHECK("yntrnr", ierr == (want == 0 ? 4710 : 0));
  }
  FUZZ_CHECK("yntrnr", ierr ? all_sentinel(w, sn) : none_sentinel(w, sn));
  a.check_inputs("yntrnr");
  c.quiet();
}

const std::int32_t kKinds[] = {0x102,   0x202,   0x1103,  0x2103,   0x3103, 0x1203,
                               0x2203,  0x11104, 0x21104, 0x12104, 0x111105};

void fuzz_ynmnmr(Input& in) {
  Args a(in);
  Call c("ynmnmr");
  const std::int32_t n = in.count(2, 3), m = in.count(0, 12);
  const std::size_t sa = n >= 1 && n <= 4 ? len(n) * len(n) : 0;
  double* mat = a.raw(sa);
  matrix(in, sa ? n : 0, mat);
  a.seal(mat, sa);
  std::vector<std::int32_t> codes(len(m));
  for (auto& k : codes) k = (in.byte() & 7) ? kKinds[in.byte() % 11] : ((in.byte() & 1) ? 0 : in.int32());
  std::int32_t* index = a.out_i32();
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = ynmnmr(a.i32(n), mat, a.i32(m), a.i32s(codes), index, &ierr);
  FUZZ_CHECK("ynmnmr", one_of(ierr, {0, 4712}) && r == (ierr ? 1 : 0));
  if (n != 2 && n != 3) {
    FUZZ_CHECK("ynmnmr", ierr == 4712 && *index == fuzz::kSentinelInt);
  } else {
    FUZZ_CHECK("ynmnmr", ierr == 0 && *index >= 0 && *index <= std::max(m, 0));
    if (*index > 0) {
      const std::int32_t got = codes[len(*index - 1)];
      bool known = got == 0;
      for (std::int32_t k : kKinds) known = known || got == k;
      FUZZ_CHECK("ynmnmr", known);
    }
  }
  a.check_inputs("ynmnmr");
  c.quiet();
}

void fuzz_tests(Input& in, int which) {
  static const char* names[4] = {"wnmnm1", "wnmnm2", "wnmnm3", "wnmnm4"};
  static std::int32_t (*const fns[4])(const std::int32_t*, const double*, std::int32_t*,
                                      std::int32_t*) = {wnmnm1, wnmnm2, wnmnm3, wnmnm4};
  static const std::int32_t top[4] = {2, 1, 2, 1};
  const char* name = names[which];
  Args a(in);
  Call c(name);
  const std::int32_t n = in.count(2, 20);
  const std::size_t sa = n >= 1 && n <= 21 ? len(n) * len(n) : 0;
  double* mat = a.raw(sa);
  matrix(in, sa ? n : 0, mat);
  a.seal(mat, sa);
  std::int32_t* flag = a.out_i32();
  std::int32_t ierr = fuzz::kSentinelInt;
  const std::int32_t r = fns[which](a.i32(n), mat, flag, &ierr);
  if (n < 2 || n > 20) {
    FUZZ_CHECK(name, r == 1 && ierr == 4712 && *flag == fuzz::kSentinelInt);
  } else {
    FUZZ_CHECK(name, r == 0 && ierr == 0 && *flag >= 0 && *flag <= top[which]);
  }
  a.check_inputs(name);
  c.quiet();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  switch (in.byte() % 9) {
    case 0: fuzz_ynsega(in); break;
    case 1: fuzz_ynsetr(in); break;
    case 2: fuzz_yntrzr(in); break;
    case 3: fuzz_yntrnr(in); break;
    case 4: fuzz_ynmnmr(in); break;
    default: fuzz_tests(in, 0); break;
    case 6: fuzz_tests(in, 1); break;
    case 7: fuzz_tests(in, 2); break;
    case 8: fuzz_tests(in, 3); break;
  }
  return 0;
}
