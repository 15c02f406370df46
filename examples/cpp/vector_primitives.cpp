// vector_primitives.cpp -- dot and cross products and the eigen-direction of a symmetric
// 2-by-2 matrix, from C++: the headers declare C linkage, so the routines are called as is.
#include <array>
#include <cmath>
#include <cstdint>
#include <cstdio>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
int failures = 0;

void check(const char* what, double got, double want) {
  std::printf("%-30s %.17g\n", what, got);
  if (got != want) {
    std::printf("  expected %.17g\n", want);
    ++failures;
  }
}
}  // namespace

int main() {
  const std::array<double, 3> x{1.0, 0.0, 0.0}, y{0.0, 1.0, 0.0};
  std::array<double, 3> z{};
  const std::int32_t space = 3;
  check("prosca(x, y)", prosca(x.data(), y.data()), 0.0);
  parbis(x.data(), y.data(), z.data(), &space);  // unit cross product: x x y = z
  check("parbis(x, y) z", z[2], 1.0);

  // [[2, 1], [1, 2]] has the eigenvalue 3 with direction (1, 1) / sqrt(2).
  const std::array<double, 4> m{2.0, 1.0, 1.0, 2.0};  // by columns
  const double lambda = 3.0;
  std::array<double, 2> v{};
  const double squared = vectp2(m.data(), &lambda, v.data());
  check("vectp2 squared length", squared, 2.0);  // p = (M12, lambda - M11) = (1, 1)
  check("vectp2 direction x", v[0], 1.0 / std::sqrt(2.0));
  check("vectp2 direction y", v[1], 1.0 / std::sqrt(2.0));

  std::int32_t major = 0, minor = 0, patch = 0;
  const std::int32_t number = orvq7_version(&major, &minor, &patch);
  std::printf("OrvQ7Maths %d.%d.%d (%d), headers %d.%d.%d\n", major, minor, patch, number,
              ORVQ7_VERSION_MAJOR, ORVQ7_VERSION_MINOR, ORVQ7_VERSION_PATCH);
  if (major != ORVQ7_VERSION_MAJOR || minor < ORVQ7_VERSION_MINOR) ++failures;
  return failures == 0 ? 0 : 1;
}
