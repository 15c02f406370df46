// polynomial_roots.cpp -- polynomial roots from C++: ynzenr (degrees 1 to 4) and Cardano's
// closed form (cardan), the (real, imaginary) pairs read as std::complex<double>.
#include <algorithm>
#include <cmath>
#include <complex>
#include <cstdint>
#include <cstdio>
#include <vector>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
int failures = 0;

void expect(bool ok, const char* what) {
  std::printf("%-48s %s\n", what, ok ? "ok" : "MISMATCH");
  if (!ok) ++failures;
}

using Roots = std::vector<std::complex<double>>;

Roots as_complex(const double* pairs, std::int32_t count) {
  Roots r;
  for (std::int32_t k = 0; k < count; ++k) r.emplace_back(pairs[2 * k], pairs[2 * k + 1]);
  for (const auto& z : r) std::printf("  (%.17g, %.17g)\n", z.real(), z.imag());
  return r;
}

// Every expected root matched by a distinct computed one, within tol.
bool same_roots(Roots got, const Roots& want, double tol = 1e-12) {
  if (got.size() != want.size()) return false;
  for (const auto& w : want) {
    const auto hit =
        std::find_if(got.begin(), got.end(), [&](const auto& z) { return std::abs(z - w) <= tol; });
    if (hit == got.end()) return false;
    got.erase(hit);
  }
  return true;
}

// The roots of the polynomial with coefficients `coef` (by decreasing power), by ynzenr.
Roots roots_of(const std::vector<double>& coef, std::int32_t& code) {
  const std::int32_t n = static_cast<std::int32_t>(coef.size()) - 1;
  std::vector<double> pairs(2 * static_cast<std::size_t>(std::max(n, 1)));
  std::int32_t nroots = 0;
  if (ynzenr(&n, coef.data(), &nroots, pairs.data(), &code) != 0) return {};
  return as_complex(pairs.data(), nroots);
}
}  // namespace

int main() {
  std::int32_t code = -1;
  // x^3 - 1: the cube roots of unity, 1 and -1/2 +- i sqrt(3)/2.
  const double h = std::sqrt(3.0) / 2.0;
  expect(same_roots(roots_of({1.0, 0.0, 0.0, -1.0}, code), {{1.0, 0.0}, {-0.5, h}, {-0.5, -h}}),
         "ynzenr: x^3 - 1 has the three cube roots of 1");
  // x^4 - 5x^2 + 4 = (x^2 - 1)(x^2 - 4).
  expect(same_roots(roots_of({1.0, 0.0, -5.0, 0.0, 4.0}, code),
                    {{1.0, 0.0}, {-1.0, 0.0}, {2.0, 0.0}, {-2.0, 0.0}}),
         "ynzenr: x^4 - 5x^2 + 4 has the roots +-1, +-2");
  // A leading coefficient 0 drops the degree: 0 x^3 + x^2 - 4 is the quadratic x^2 - 4.
  expect(same_roots(roots_of({0.0, 1.0, 0.0, -4.0}, code), {{2.0, 0.0}, {-2.0, 0.0}}),
         "ynzenr: 0 x^3 + x^2 - 4 is solved as a quadratic");
  // Degree 0 is refused.
  expect(roots_of({1.0}, code).empty() && code == ORVQ7_ERR_BAD_ARG,
         "ynzenr: degree 0 is refused with 4712");

  // 2x^3 - 4x^2 - 22x + 24 = 2 (x - 4)(x - 1)(x + 3): three real roots, flag 3, sorted by
  // decreasing value.
  const double cubic[4] = {2.0, -4.0, -22.0, 24.0};
  const std::int32_t all = 1;
  double pairs[6];
  std::int32_t flag = -1;
  cardan(cubic, &all, pairs, &flag);
  const Roots c = as_complex(pairs, 3);
  expect(flag == 3, "cardan: three real roots (flag 3)");
  expect(std::abs(c[0] - 4.0) <= 1e-12 && std::abs(c[1] - 1.0) <= 1e-12 &&
             std::abs(c[2] + 3.0) <= 1e-12,
         "cardan: 4, 1, -3 in decreasing order");

  return failures == 0 ? 0 : 1;
}
