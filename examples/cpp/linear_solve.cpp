// linear_solve.cpp -- Gaussian elimination with complete pivoting (ynsega) from C++, behind a
// small wrapper that returns the solution or the status code; then a singular matrix.
#include <array>
#include <cstdint>
#include <cstdio>
#include <optional>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
int failures = 0;

void expect(bool ok, const char* what) {
  std::printf("%-44s %s\n", what, ok ? "ok" : "MISMATCH");
  if (!ok) ++failures;
}

// A column-major square matrix of order N and its right-hand side.
template <std::size_t N>
struct System {
  std::array<double, N * N> a;  // element (i, j) at a[j * N + i], from 0
  std::array<double, N> b;
};

// The solution of a x = b, or nothing with the code in `code`.
template <std::size_t N>
std::optional<std::array<double, N>> solve(const System<N>& s, std::int32_t& code) {
  const std::int32_t n = N;
  std::array<double, N> x{};
  if (ynsega(&n, s.a.data(), s.b.data(), x.data(), &code) != 0) return std::nullopt;
  return x;
}
}  // namespace

int main() {
  // | 4 2 0 | x = |  8 |  By hand: pivots 4 (row 1, column 1) and 4 (row 3, column 3, so
  // | 1 4 2 |     | 15 |  rows and columns 2 and 3 are exchanged), multipliers 1/4 and 1/2;
  // | 0 2 4 |     | 16 |  the last row keeps 2.5 x2 = 5. All exact: x = (1, 2, 3).
  const System<3> good{{4.0, 1.0, 0.0, 2.0, 4.0, 2.0, 0.0, 2.0, 4.0}, {8.0, 15.0, 16.0}};
  std::int32_t code = -1;
  const auto x = solve(good, code);
  if (x) std::printf("x = (%.17g, %.17g, %.17g)\n", (*x)[0], (*x)[1], (*x)[2]);
  expect(x.has_value() && code == ORVQ7_OK, "ynsega solves the 3-by-3 system");
  expect(x && *x == std::array<double, 3>{1.0, 2.0, 3.0}, "  x = (1, 2, 3) exactly");

  // | 1 2 |  Pivot 4, multiplier 1/2, last pivot 1 - 0.5 * 2 = 0: singular, code 4703.
  // | 2 4 |
  const System<2> singular{{1.0, 2.0, 2.0, 4.0}, {1.0, 1.0}};
  const auto y = solve(singular, code);
  std::printf("singular: code %d, %s\n", code, orvq7sys_code_text(code));
  expect(!y && code == ORVQ7_ERR_SINGULAR, "ynsega refuses the singular matrix with 4703");

  return failures == 0 ? 0 : 1;
}
