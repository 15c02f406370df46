/* linear_solve.c -- a dense linear system solved by ynsega (Gaussian elimination with
 * complete pivoting), then a singular one and its failure code, from C. Matrices are
 * column-major: element (i, j) of an order-n matrix is a[(j - 1) * n + (i - 1)]. */
#include <stdio.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

static int failures = 0;

static void check(const char* what, double got, double want) {
  printf("%-26s %.17g\n", what, got);
  if (got != want) {
    printf("  expected %.17g\n", want);
    ++failures;
  }
}

static void check_int(const char* what, int32_t got, int32_t want) {
  printf("%-26s %d\n", what, (int)got);
  if (got != want) {
    printf("  expected %d\n", (int)want);
    ++failures;
  }
}

int main(void) {
  /*     | 4 2 0 |       | 1 |       |  8 |
   * A = | 1 4 2 |   x = | 2 |   b = | 15 |
   *     | 0 2 4 |       | 3 |       | 16 |
   * By hand: the first pivot is a(1,1) = 4 (the first of the largest magnitudes); row 2 loses
   * 1/4 of row 1, leaving (3.5, 2 | 13) and (2, 4 | 16). The second pivot is a(3,3) = 4, so
   * rows 2, 3 and columns 2, 3 are exchanged; the last row loses 1/2 of the pivot row and
   * keeps 2.5 x2 = 5. Every multiplier and pivot is a short binary fraction, so the solution
   * comes out exact: x2 = 2, x3 = (16 - 2 * 2) / 4 = 3, x1 = (8 - 2 * 2) / 4 = 1. */
  const int32_t n = 3;
  const double a[9] = {4.0, 1.0, 0.0,  /* column 1 */
                       2.0, 4.0, 2.0,  /* column 2 */
                       0.0, 2.0, 4.0}; /* column 3 */
  const double b[3] = {8.0, 15.0, 16.0};
  double x[3] = {0.0, 0.0, 0.0};
  int32_t ierr = -1;

  check_int("ynsega result", ynsega(&n, a, b, x, &ierr), 0);
  check_int("  ierr", ierr, ORVQ7_OK);
  check("  x1", x[0], 1.0);
  check("  x2", x[1], 2.0);
  check("  x3", x[2], 3.0);

  /* | 1 2 |  The largest magnitude, 4, becomes the pivot; the other row loses half of it
   * | 2 4 |  and keeps 1 - 0.5 * 2 = 0 as the last pivot: the matrix is singular. The code is
   * 4703 and x keeps what it held. */
  const int32_t two = 2;
  const double s[4] = {1.0, 2.0, 2.0, 4.0};
  const double rhs[2] = {1.0, 1.0};
  double y[2] = {-7.0, -7.0};
  check_int("ynsega (singular) result", ynsega(&two, s, rhs, y, &ierr), 1);
  check_int("  ierr", ierr, ORVQ7_ERR_SINGULAR);
  printf("  meaning: %s\n", orvq7sys_code_text(ierr));
  check("  y1 untouched", y[0], -7.0);
  check("  y2 untouched", y[1], -7.0);

  return failures == 0 ? 0 : 1;
}
