// poly/evaluate.cpp -- polynomials in power form by increasing power, and the Bernstein
// basis: cor, deriv, dersec, derter, bernst. No state; nothing reports an error.
#include <array>
#include <cstdint>

#include "poly/poly_api.h"

namespace {

constexpr std::int32_t kDerivMax = 20;  // deriv: m above gives 0
constexpr std::int32_t kBernMax = 19;   // highest tabulated degree

// Position (from 1) of the last entry of degree n, n = 0..19, in the Bernstein table.
constexpr std::array<std::int32_t, kBernMax + 1> kBernLast = {
    0, 3, 9, 19, 34, 55, 83, 119, 164, 219, 285, 363, 454, 559, 679, 815, 968, 1139, 1329, 1539};
constexpr std::int32_t kBernSize = 1539;

// The Bernstein table: for n = 1..19 and i = 0..n, the coefficients by increasing power of
// binom(n, i) (1 - t)^(n-i), that is binom(n, i) binom(n-i, k) (-1)^k for k = 0..n-i.
// Every value is an integer below 2^25, so the table is exact.
constexpr std::array<double, kBernSize> make_bernstein_table() {
  std::array<double, kBernSize> tab{};
  std::int64_t binom[kBernMax + 1][kBernMax + 1] = {};
  for (int n = 0; n <= kBernMax; ++n) {
    binom[n][0] = 1;
    for (int k = 1; k <= n; ++k) binom[n][k] = binom[n - 1][k - 1] + (k < n ? binom[n - 1][k] : 0);
  }
  int pos = 0;
  for (int n = 1; n <= kBernMax; ++n) {
    for (int i = 0; i <= n; ++i) {
      for (int k = 0; k <= n - i; ++k) {
        const std::int64_t v = binom[n][i] * binom[n - i][k];
        tab[pos++] = static_cast<double>(k % 2 == 0 ? v : -v);
      }
    }
  }
  return tab;
}
constexpr std::array<double, kBernSize> kBern = make_bernstein_table();

constexpr bool last_positions_match() {
  std::int32_t pos = 0;
  for (std::int32_t n = 0; n <= kBernMax; ++n) {
    if (n > 0) pos += (n + 1) * (n + 2) / 2;
    if (kBernLast[n] != pos) return false;
  }
  return pos == kBernSize;
}
static_assert(last_positions_match(), "degree n occupies (n + 1)(n + 2) / 2 entries");

// t^i for i >= 1 by binary powering, squarings from the low bit up: y = t when i is odd,
// else 1; then while i >>= 1: t = t t, and y = y t for each set bit.
double power_int(double t, std::int32_t i) {
  std::uint32_t k = static_cast<std::uint32_t>(i);
  double y = (k % 2 != 0) ? t : 1.0;
  while ((k >>= 1) != 0) {
    t = t * t;
    if (k % 2 != 0) y = y * t;
  }
  return y;
}

}  // namespace

extern "C" {

double cor(const double* c, const std::int32_t* m, const double* t) {
  // Horner from the highest coefficient; m < 1 gives 0 (tested first: m - 1 would overflow
  // for the most negative m).
  double s = 0.0;
  if (*m < 1) return s;
  for (std::int32_t k = *m - 1; k >= 0; --k) s = s * *t + c[k];
  return s;
}

double deriv(const double* c, const std::int32_t* m, const double* t) {
  const std::int32_t mm = *m;
  if (mm < 2 || mm > kDerivMax) return 0.0;  // c not read
  double s = static_cast<double>(mm - 1) * c[mm - 1];
  for (std::int32_t k = mm - 2; k >= 1; --k) s = s * *t + static_cast<double>(k) * c[k];
  return s;
}

double dersec(const double* c, const std::int32_t* m, const double* t) {
  const std::int32_t mm = *m;
  if (mm < 1) return 0.0;  // nothing to read
  // Deliberate: no upper limit, and m = 1, 2 read c(m-1) and give 0 times it.
  const std::int64_t m1 = mm - 1;
  double s = static_cast<double>(m1 * (m1 - 1)) * c[mm - 1];
  for (std::int32_t k = mm - 2; k >= 2; --k) {
    const std::int64_t kk = k;
    s = s * *t + static_cast<double>(kk * (kk - 1)) * c[k];
  }
  return s;
}

double derter(const double* c, const std::int32_t* m, const double* t) {
  const std::int32_t mm = *m;
  if (mm < 4) return 0.0;
  double s = 0.0;
  for (std::int32_t k = mm - 1; k >= 3; --k) {
    // k (k-1) (k-2) is exact for k below 2^17; beyond, rounded once per factor.
    const double kf = static_cast<double>(k);
    s = s * *t + ((kf * (kf - 1.0)) * (kf - 2.0)) * c[k];
  }
  return s;
}

double bernst(const std::int32_t* i, const std::int32_t* n, const double* t) {
  const std::int32_t ii = *i, nn = *n;
  if (ii <= 0 && nn <= 0) return 1.0;
  if (ii < 0 || ii > nn || nn > kBernMax) return 0.0;  // outside the table: not read
  // (1) The sub-row of binom(n, i) (1 - t)^(n-i), r = n - i + 1 coefficients, is followed
  // in degree n by the sub-rows of r - 1, ..., 1: it starts at position (from 1)
  // last(n) - r (r + 1) / 2 + 1.
  const std::int32_t r = nn - ii + 1;
  const double* row = kBern.data() + (kBernLast[nn] - r * (r + 1) / 2);
  const double poly = cor(row, &r, t);
  // (2) i = 0: the sub-row alone; (3) i > 0: t^i times it.
  if (ii == 0) return poly;
  return power_int(*t, ii) * poly;
}

}  // extern "C"
