/* vector_primitives.c -- dot, cross and mixed products, normalisation and a clamped arc
 * cosine, from C. Every argument goes by reference, scalars included. */
#include <stdio.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

static int failures = 0;

static void check(const char* what, double got, double want) {
  printf("%-28s %.17g\n", what, got);
  if (got != want) {
    printf("  expected %.17g\n", want);
    ++failures;
  }
}

int main(void) {
  const double a[3] = {1.0, 2.0, 3.0};
  const double b[3] = {4.0, 5.0, 6.0};
  const double c[3] = {0.0, 0.0, 1.0};
  const int32_t space = 3;
  double w[3];

  printf("OrvQ7Maths %s\n", orvq7_version_text());
  check("prosca(a, b)", prosca(a, b), 32.0);           /* 4 + 10 + 18 */
  check("promix(a, b, c)", promix(a, b, c), -3.0);     /* (a x b) . (0, 0, 1) */
  parvis(a, b, w, &space);                             /* (2*6 - 5*3, 3*4 - 1*6, 5*1 - 2*4) */
  check("parvis(a, b) x", w[0], -3.0);
  check("parvis(a, b) y", w[1], 6.0);
  check("parvis(a, b) z", w[2], -3.0);

  double v[3] = {3.0, 4.0, 0.0};
  const int32_t n = 3;
  check("devor((3, 4, 0))", devor(v, &n), 25.0);       /* the squared norm before */
  check("  normalised x", v[0], 0.6);                  /* 3 / 5 */
  check("  normalised y", v[1], 0.8);                  /* 4 / 5 */

  const double drifted = 1.0 + 1e-12, tol = 1e-9;
  int32_t flag = -1;
  check("parcos(1 + 1e-12, 1e-9)", parcos(&drifted, &tol, &flag), 0.0);
  check("  flag (clamped)", flag, 1.0);

  return failures == 0 ? 0 : 1;
}
