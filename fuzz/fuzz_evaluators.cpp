// fuzz/fuzz_evaluators.cpp -- the points-near-subspace test and the affine map inverse,
// driven by arbitrary bytes: codes, the answer on failure, untouched outputs, the orthogonal
// inverse as a transpose and the translation sums in their stated order.
#include <cmath>
#include <cstdint>
#include <vector>

#include "evaluators/evaluators_api.h"
#include "fuzz_support.h"

namespace fuzz {
namespace {

std::size_t len(std::int32_t n) { return n > 0 ? static_cast<std::size_t>(n) : 0; }

void fuzz_yngcoa(Input& in) {
  Case a(in, "yngcoa");
  const bool wide = (in.byte() & 15) == 0;  // around the capacity of 20 directions
  const std::int32_t n = wide ? in.pick(20, 23) : in.count(1, 5), m = in.count(1, 6);
  const std::int32_t k = wide ? in.pick(19, 22) : in.count(0, n > 0 && n <= 6 ? n : 5);
  const std::int32_t orders[5] = {17, 274, 300, 0, 18};
  const std::int32_t order = (in.byte() & 7) ? orders[in.byte() % 5] : in.int32();
  const std::size_t sn = len(n), sm = len(m), sk = k >= 0 && k <= n ? len(k) : 0;
  const double *p = a.reals(sn * sm), *o = a.reals(sn), *u = a.reals(sn * sk);
  const double* tol = a.reals(1);
  std::int32_t* inside = a.out_i32();
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = yngcoa(a.i32(n), a.i32(m), p, a.i32(order), a.i32(k), o, u, tol, inside, &ierr);
  check_code("yngcoa", r, ierr, {0, 4712, 4718});
  const bool bad = n <= 0 || k < 0 || k > n || m <= 0;
  if (bad || k >= 21) {
    FUZZ_CHECK("yngcoa", ierr != 0 && *inside == 1);
    if (!bad) FUZZ_CHECK("yngcoa", ierr == 4718);
    if (k < 21) FUZZ_CHECK("yngcoa", ierr == 4712);
  } else {
    FUZZ_CHECK("yngcoa", ierr == 0 && (*inside == 0 || *inside == 1));
    if (k == n) FUZZ_CHECK("yngcoa", *inside == 1);
    if (k == 0) {  // every point within tol of the origin (a point at exactly tol is inside)
      bool all = true;
      for (std::size_t j = 0; j < sm; ++j) {
        double r2 = 0;
        for (std::size_t i = 0; i < sn; ++i) r2 += (p[i + j * sn] - o[i]) * (p[i + j * sn] - o[i]);
        all = all && !(r2 > *tol * *tol);
      }
      FUZZ_CHECK("yngcoa", *inside == (all ? 1 : 0));
    }
  }
  a.done();
}

void fuzz_ynaitt(Input& in) {
  Case a(in, "ynaitt");
  const std::int32_t n = (in.byte() & 15) ? in.count(1, 5) : in.pick(19, 22);
  const std::int32_t kinds[4] = {0, 1, -1, 2};
  const std::int32_t kind = (in.byte() & 7) ? kinds[in.byte() & 3] : in.int32();
  const std::size_t sn = len(n), sa = sn * sn;
  double* mat = a.raw(sa);
  const std::uint8_t shape = in.byte() % 3;
  for (std::size_t k = 0; k < sa; ++k) mat[k] = in.real();
  if (shape == 1)  // a signed permutation: orthogonal
    for (std::size_t j = 0; j < sn; ++j)
      for (std::size_t i = 0; i < sn; ++i) mat[i + j * sn] = i == (j + 1) % sn ? ((in.byte() & 1) ? 1.0 : -1.0) : 0.0;
  if (shape == 2 && sn > 1)  // two equal columns: singular
    for (std::size_t i = 0; i < sn; ++i) mat[i + sn] = mat[i];
  a.seal(mat, sa);
  const double* b = a.reals(sn);
  double *m = a.out(sa), *cc = a.out(sn);
  std::int32_t ierr = kSentinelInt;
  const std::int32_t r = ynaitt(a.i32(n), mat, b, a.i32(kind), m, cc, &ierr);
  check_code("ynaitt", r, ierr, {0, 4712, 4718, 4703});
  if (n < 1) FUZZ_CHECK("ynaitt", ierr == 4712);
  else if (kind >= 2) FUZZ_CHECK("ynaitt", ierr == 4718 && all_sentinel(m, sa));
  else if (kind == 0) FUZZ_CHECK("ynaitt", ierr == 0);
  else if (n > 20) FUZZ_CHECK("ynaitt", ierr == 4718);
  if (ierr != 0) {
    FUZZ_CHECK("ynaitt", all_sentinel(cc, sn));
  } else {
    FUZZ_CHECK("ynaitt", none_sentinel(m, sa));
    if (kind == 0)
      for (std::size_t i = 0; i < sn; ++i)
        for (std::size_t j = 0; j < sn; ++j) FUZZ_CHECK("ynaitt", same(m[i + j * sn], mat[j + i * sn]));
    for (std::size_t i = 0; i < sn; ++i) {  // c = -b(1) M(:,1), then c - b(j) M(:,j)
      double want = -b[0] * m[i];
      for (std::size_t j = 1; j < sn; ++j) want = want - b[j] * m[i + j * sn];
      FUZZ_CHECK("ynaitt", alike(cc[i], want));
    }
  }
  a.done();
  std::vector<double> c2(sn);  // m may be a itself
  std::int32_t e2 = 0;
  if (ierr == 0 && kind != 0)
    same_when_aliased("ynaitt", mat, sa, m, sa, [&](double* v) { ynaitt(&n, v, b, &kind, v, c2.data(), &e2); });
  FUZZ_CHECK("ynaitt", e2 == 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Input in(data, size);
  if (in.byte() & 1) fuzz_yngcoa(in);
  else fuzz_ynaitt(in);
  return 0;
}

}  // namespace fuzz
