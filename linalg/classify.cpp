// linalg/classify.cpp -- classification of linear maps: ynmnmr and its four tests wnmnm1
// (multiple of the identity), wnmnm2 (orthonormal columns), wnmnm3 (zero map or projector),
// wnmnm4 (affinity).
// Matrices are n-by-n by columns, leading dimension n. Every comparison uses the fixed
// absolute tolerance kTol; failures are written as "> kTol" where the test reads "within" or
// "at most", so a NaN passes them.
#include <cmath>
#include <cstdint>

#include "frame/status.h"
#include "linalg/linalg_api.h"
#include "vector/vector_api.h"

namespace {

constexpr double kTol = 1e-12;
constexpr std::int32_t kMinOrder = 2;   // the tests accept 2 <= n <= 20
constexpr std::int32_t kMaxOrder = 20;
constexpr int kMaxElems = kMaxOrder * kMaxOrder;

// Kind codes: lowest hex digit the level plus 1, then 0, then the class at each level.
constexpr std::int32_t kRegular = 0x102;
constexpr std::int32_t kSingular = 0x202;
constexpr std::int32_t kIsometry = 0x1103;
constexpr std::int32_t kSimilarity = 0x2103;
constexpr std::int32_t kAffinity = 0x3103;
constexpr std::int32_t kZeroMap = 0x1203;
constexpr std::int32_t kProjector = 0x2203;
constexpr std::int32_t kRotation = 0x11104;
constexpr std::int32_t kImproper = 0x21104;
constexpr std::int32_t kHomothety = 0x12104;
constexpr std::int32_t kIdentity = 0x111105;

// Flags of the tests.
constexpr std::int32_t kNotMultiple = 0, kIsIdentity = 1, kOtherMultiple = 2;
constexpr std::int32_t kZeroFlag = 1, kProjectorFlag = 2;

// ---- State of ynmnmr kept between calls, one copy per thread ----
//   level   the four level words of the last call (0 where a level was not reached)
//   det     its determinant
//   scaled  its matrix scaled by |det|^(-1/n), when that step was reached
// No call reads what an earlier one left: each call clears the levels first.
struct YnmnmrState {
  std::int32_t level[4] = {};
  double det = 0.0;
  double scaled[9] = {};
};
thread_local YnmnmrState s_ynmnmr;

// ---- State of wnmnm3 kept between calls, one copy per thread ----
//   square  A A of the last call that formed it; no later call reads it
struct Wnmnm3State {
  double square[kMaxElems] = {};
};
thread_local Wnmnm3State s_wnmnm3;

// ---- State of wnmnm4 kept between calls, one copy per thread ----
//   minus_i, product, projector  B = A - I, Q = A B and P of the last call; no later call
//                                reads them
struct Wnmnm4State {
  double minus_i[kMaxElems] = {};
  double product[kMaxElems] = {};
  double projector[kMaxElems] = {};
};
thread_local Wnmnm4State s_wnmnm4;

bool order_ok(std::int32_t n) { return n >= kMinOrder && n <= kMaxOrder; }

// Determinant of order 2 or 3 in the fixed grouping; a(i, j) from 1.
double det_small(std::int32_t n, const double* a) {
  auto e = [a, n](int i, int j) { return a[(i - 1) + (j - 1) * n]; };
  if (n == 2) return e(1, 1) * e(2, 2) - e(2, 1) * e(1, 2);
  return ((e(2, 1) * e(3, 2) - e(3, 1) * e(2, 2)) * e(1, 3) +
          (e(2, 2) * e(3, 3) - e(3, 2) * e(2, 3)) * e(1, 1)) +
         (e(3, 1) * e(2, 3) - e(2, 1) * e(3, 3)) * e(1, 2);
}

}  // namespace

extern "C" {

std::int32_t ynmnmr(const std::int32_t* n, const double* a, const std::int32_t* m,
                    const std::int32_t* codes, std::int32_t* index, std::int32_t* ierr) {
  // (1) Order; then clear the status, the answer and the level words.
  const std::int32_t nn = *n;
  if (nn != 2 && nn != 3) return impl::fail(ierr, impl::kErrBadArg);
  YnmnmrState& s = s_ynmnmr;
  *ierr = 0;
  *index = 0;
  for (std::int32_t& w : s.level) w = 0;
  std::int32_t flag = 0;
  // A test that fails (it cannot for n = 2 or 3) makes this call fail with 4712.
  auto test = [&](std::int32_t (*fn)(const std::int32_t*, const double*, std::int32_t*,
                                     std::int32_t*),
                  const double* mat) { return fn(n, mat, &flag, ierr) == 1; };
  // (2) Determinant.
  const double d = det_small(nn, a);
  s.det = d;
  if (std::fabs(d) < kTol) {
    // (3) Singular: zero map or projector.
    s.level[0] = kSingular;
    if (test(wnmnm3, a)) return impl::fail(ierr, impl::kErrBadArg);
    if (flag == kZeroFlag) s.level[1] = kZeroMap;
    if (flag == kProjectorFlag) s.level[1] = kProjector;
  } else {
    s.level[0] = kRegular;
    if (std::fabs(std::fabs(d) - 1.0) < kTol) {
      // (4.1) |D| = 1: an isometry, or else an affinity.
      if (test(wnmnm2, a)) return impl::fail(ierr, impl::kErrBadArg);
      if (flag == 1) {
        s.level[1] = kIsometry;
        if (d >= 0.0) {
          s.level[2] = kRotation;
          if (test(wnmnm1, a)) return impl::fail(ierr, impl::kErrBadArg);
          if (flag == kIsIdentity) s.level[3] = kIdentity;
        } else if (d < 0.0) {
          s.level[2] = kImproper;
        }
      } else {
        if (test(wnmnm4, a)) return impl::fail(ierr, impl::kErrBadArg);
        if (flag == 1) s.level[1] = kAffinity;
      }
    } else {
      // (4.2) Otherwise: a multiple of the identity, a similarity, or an affinity.
      if (test(wnmnm1, a)) return impl::fail(ierr, impl::kErrBadArg);
      if (flag == kIsIdentity) {
        s.level[1] = kIsometry;
        s.level[2] = kRotation;
        s.level[3] = kIdentity;
      } else if (flag == kOtherMultiple) {
        s.level[1] = kSimilarity;
        s.level[2] = kHomothety;
      } else {
        const double f = nn == 2 ? 1.0 / std::sqrt(std::fabs(d))
                                 : std::pow(std::fabs(d), -1.0 / 3.0);
        for (int k = 0; k < nn * nn; ++k) s.scaled[k] = a[k] * f;
        if (test(wnmnm2, s.scaled)) return impl::fail(ierr, impl::kErrBadArg);
        if (flag == 1) {
          s.level[1] = kSimilarity;
        } else {
          if (test(wnmnm4, a)) return impl::fail(ierr, impl::kErrBadArg);
          if (flag == 1) s.level[1] = kAffinity;
        }
      }
    }
  }
  // (5) Narrowest level first; within a level the first accepted position wins.
  for (int lv = 3; lv >= 0; --lv) {
    for (std::int32_t j = 0; j < *m; ++j) {
      if (codes[j] == s.level[lv]) {
        *index = j + 1;
        return 0;
      }
    }
  }
  return 0;
}

std::int32_t wnmnm1(const std::int32_t* n, const double* a, std::int32_t* flag,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (!order_ok(nn)) return impl::fail(ierr, impl::kErrBadArg);
  // Diagonal j at position (j - 1)(n + 1); the n elements after it, up to diagonal j + 1,
  // are the rest of column j and the top of column j + 1.
  std::int32_t f = kOtherMultiple;
  for (std::int32_t j = 0; j < nn - 1 && f != kNotMultiple; ++j) {
    const std::int32_t at = j * (nn + 1);
    if (std::fabs(a[at] - a[at + nn + 1]) > kTol) f = kNotMultiple;
    for (std::int32_t k = 1; k <= nn && f != kNotMultiple; ++k) {
      if (std::fabs(a[at + k]) > kTol) f = kNotMultiple;
    }
  }
  if (f != kNotMultiple && std::fabs(a[0] - 1.0) < kTol) f = kIsIdentity;  // strict
  *flag = f;
  *ierr = 0;
  return 0;
}

std::int32_t wnmnm2(const std::int32_t* n, const double* a, std::int32_t* flag,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (!order_ok(nn)) return impl::fail(ierr, impl::kErrBadArg);
  std::int32_t f = 1;
  for (std::int32_t j = 0; j < nn && f == 1; ++j) {
    for (std::int32_t i = 0; i <= j && f == 1; ++i) {
      const double* ci = a + i * nn;
      const double* cj = a + j * nn;
      double d = 0.0;
      for (std::int32_t k = 0; k < nn; ++k) d += ci[k] * cj[k];
      if (i == j) d = d - 1.0;
      if (std::fabs(d) > kTol) f = 0;
    }
  }
  *flag = f;
  *ierr = 0;
  return 0;
}

std::int32_t wnmnm3(const std::int32_t* n, const double* a, std::int32_t* flag,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (!order_ok(nn)) return impl::fail(ierr, impl::kErrBadArg);
  const int count = nn * nn;
  // (1) Any element above the tolerance, in storage order?
  bool zero = true;
  for (int k = 0; k < count && zero; ++k) zero = !(std::fabs(a[k]) > kTol);
  if (zero) {
    *flag = kZeroFlag;
    *ierr = 0;
    return 0;
  }
  // (2) A A against A, element by element.
  double* sq = s_wnmnm3.square;
  fmat23(n, n, n, a, a, sq);
  std::int32_t f = kProjectorFlag;
  for (int k = 0; k < count && f != 0; ++k) {
    if (std::fabs(sq[k] - a[k]) > kTol) f = 0;
  }
  *flag = f;
  *ierr = 0;
  return 0;
}

std::int32_t wnmnm4(const std::int32_t* n, const double* a, std::int32_t* flag,
                    std::int32_t* ierr) {
  const std::int32_t nn = *n;
  if (!order_ok(nn)) return impl::fail(ierr, impl::kErrBadArg);
  Wnmnm4State& s = s_wnmnm4;
  const int count = nn * nn;
  auto diagonal = [nn](int k) { return k % (nn + 1) == 0; };
  *ierr = 0;
  // (1) B = A - I; Q = A B.
  for (int k = 0; k < count; ++k) s.minus_i[k] = diagonal(k) ? a[k] - 1.0 : a[k];
  fmat23(n, n, n, a, s.minus_i, s.product);
  // (2) One common ratio Q / B over the elements of B that count, in storage order. A
  //     ratio of exactly 0 never fixes lambda (deliberately kept).
  double lambda = 0.0;
  for (int k = 0; k < count; ++k) {
    if (!(std::fabs(s.minus_i[k]) > kTol)) continue;
    const double r = s.product[k] / s.minus_i[k];
    if (lambda == 0.0) {
      lambda = r;
    } else if (std::fabs(r - lambda) > kTol) {
      *flag = 0;
      return 0;
    }
  }
  // (3) Ratios 0 and 1 are not affinities (this also covers A within tolerance of I).
  if (std::fabs(lambda) < kTol || std::fabs(1.0 - lambda) < kTol) {
    *flag = 0;
    return 0;
  }
  // (4) P = (A - lambda I) / (1 - lambda) must be a projector.
  const double den = 1.0 - lambda;
  for (int k = 0; k < count; ++k) {
    s.projector[k] = (diagonal(k) ? a[k] - lambda : a[k]) / den;
  }
  std::int32_t pflag = 0;
  if (wnmnm3(n, s.projector, &pflag, ierr) == 1) return 1;
  *flag = pflag == kProjectorFlag ? 1 : 0;
  return 0;
}

}  // extern "C"
