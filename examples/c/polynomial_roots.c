/* polynomial_roots.c -- roots of real polynomials, from C: ynzenr for any degree from 1 to
 * 4, and the closed-form quadratic duos. Coefficients go by decreasing power; roots come back
 * as complex pairs (real part, imaginary part), slot k in roots[2k], roots[2k + 1]. */
#include <math.h>
#include <stdio.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

static int failures = 0;

static void check(const char* what, double got, double want) {
  printf("%-24s %.17g\n", what, got);
  if (got != want) {
    printf("  expected %.17g\n", want);
    ++failures;
  }
}

static void check_int(const char* what, int32_t got, int32_t want) {
  printf("%-24s %d\n", what, (int)got);
  if (got != want) {
    printf("  expected %d\n", (int)want);
    ++failures;
  }
}

/* The roots of ynzenr are polished in floating point, so they are compared with a tolerance,
 * and as a set: every expected root must be matched by a distinct computed one. */
static void check_roots(const char* what, const double* roots, const double* want, int count) {
  const double tol = 1e-12;
  int used[4] = {0, 0, 0, 0};
  printf("%s:\n", what);
  for (int k = 0; k < count; ++k) printf("  (%.17g, %.17g)\n", roots[2 * k], roots[2 * k + 1]);
  for (int e = 0; e < count; ++e) {
    int found = 0;
    for (int k = 0; k < count && !found; ++k) {
      if (!used[k] && fabs(roots[2 * k] - want[2 * e]) <= tol &&
          fabs(roots[2 * k + 1] - want[2 * e + 1]) <= tol) {
        used[k] = found = 1;
      }
    }
    if (!found) {
      printf("  missing (%.17g, %.17g)\n", want[2 * e], want[2 * e + 1]);
      ++failures;
    }
  }
}

int main(void) {
  double roots[8];
  int32_t nroots = -1, err = -1;

  /* x^3 - 6x^2 + 11x - 6 = (x - 1)(x - 2)(x - 3) */
  const int32_t three = 3;
  const double cubic[4] = {1.0, -6.0, 11.0, -6.0};
  const double cubic_roots[6] = {1.0, 0.0, 2.0, 0.0, 3.0, 0.0};
  check_int("ynzenr (cubic) result", ynzenr(&three, cubic, &nroots, roots, &err), 0);
  check_int("  err", err, ORVQ7_OK);
  check_int("  nroots", nroots, 3);
  check_roots("  roots", roots, cubic_roots, 3);

  /* x^4 - 1 = (x - 1)(x + 1)(x - i)(x + i) */
  const int32_t four = 4;
  const double quartic[5] = {1.0, 0.0, 0.0, 0.0, -1.0};
  const double quartic_roots[8] = {1.0, 0.0, -1.0, 0.0, 0.0, 1.0, 0.0, -1.0};
  check_int("ynzenr (quartic) result", ynzenr(&four, quartic, &nroots, roots, &err), 0);
  check_int("  nroots", nroots, 4);
  check_roots("  roots", roots, quartic_roots, 4);

  /* A degree above 4 is refused with 4718; nroots still tells the degree asked for. */
  const int32_t five = 5;
  const double quintic[6] = {1.0, 0.0, 0.0, 0.0, 0.0, -1.0};
  check_int("ynzenr (degree 5) result", ynzenr(&five, quintic, &nroots, roots, &err), 1);
  check_int("  err", err, ORVQ7_ERR_CAPACITY);
  check_int("  nroots", nroots, 5);

  /* duos, closed form; every step is exact for these coefficients.
   * x^2 - 3x + 2: h = 0.5 / 1, s = sqrt(9 - 8) = 1; c1 < 0, so q = -h (c1 - s) = 2 in slot 1
   * and c2 / (c0 q) = 1 in slot 0. */
  int32_t flag = -1;
  const double real_pair[3] = {1.0, -3.0, 2.0};
  duos(real_pair, roots, &flag);
  check_int("duos (real) flag", flag, 0);
  check("  slot 0", roots[0], 1.0);
  check("  slot 1", roots[2], 2.0);
  check("  imaginary parts", roots[1] + roots[3], 0.0);

  /* x^2 + 2x + 5: d = 4 c0 c2 = 20 > c1^2 = 4, a conjugate pair
   * (-c1 h, +-sqrt(20 - 4) h) = (-1, +-2), the positive imaginary part first as c0 > 0. */
  const double complex_pair[3] = {1.0, 2.0, 5.0};
  duos(complex_pair, roots, &flag);
  check_int("duos (complex) flag", flag, 4);
  check("  slot 0 real", roots[0], -1.0);
  check("  slot 0 imaginary", roots[1], 2.0);
  check("  slot 1 real", roots[2], -1.0);
  check("  slot 1 imaginary", roots[3], -2.0);

  return failures == 0 ? 0 : 1;
}
