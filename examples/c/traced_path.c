/* traced_path.c -- the unit circle x^2 + y^2 = 1 traced by ynchem, with the evaluation
 * routine written in C, from (1, 0) counter-clockwise until the path closes on its start. The
 * points are read back from the result tables with yncrea and yutrea, and the result is
 * released with yncend. */
#include <math.h>
#include <stdio.h>
#include <stdlib.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

/* What the evaluation routine is handed back at each call (ctx). */
struct Circle {
  double radius;
  int calls;
};

/* F(x, y) = x^2 + y^2 - r^2, one equation in two unknowns. Per point the blocks asked for
 * follow one another: the residual (1 value), the gradient (1 by 2), the second derivatives
 * (1 by 2 by 2, element (1, i, j) at i - 1 + 2 (j - 1)). */
static int32_t circle(void* ctx, const int32_t* npts, const double* x, const int32_t* req,
                      double* out, int32_t* ierr) {
  struct Circle* c = (struct Circle*)ctx;
  ++c->calls;
  for (int32_t p = 0; p < *npts; ++p) {
    const double u = x[2 * p], v = x[2 * p + 1];
    if (*req & 1) *out++ = u * u + v * v - c->radius * c->radius;
    if (*req & 2) {
      *out++ = 2.0 * u;
      *out++ = 2.0 * v;
    }
    if (*req & 4) {
      *out++ = 2.0;
      *out++ = 0.0;
      *out++ = 0.0;
      *out++ = 2.0;
    }
  }
  *ierr = 0;
  return 0;
}

static int failures = 0;

static void expect(int ok, const char* what) {
  printf("%-56s %s\n", what, ok ? "ok" : "MISMATCH");
  if (!ok) ++failures;
}

/* The entries of the quantity of record kind `kind` (entry_bytes each) in a new array;
 * count receives their number. */
static void* read_kind(int32_t itab, int32_t kind, size_t entry_bytes, int32_t* count) {
  int32_t handle = 0, err = 0, first = 1;
  *count = 0;
  if (yncrea(&itab, &kind, &handle, count, &err) != 0 || handle == 0 || *count < 1) return NULL;
  void* values = malloc(entry_bytes * (size_t)*count);
  if (values != NULL && yutrea(&handle, &first, count, values, &err) != 0) {
    free(values);
    return NULL;
  }
  return values;
}

int main(void) {
  const int32_t n = 2;
  struct Circle circ = {1.0, 0};
  const double eps = 1e-20;        /* on the curve: residual^2 <= eps */
  const double xd[4] = {1.0, 0.0,  /* start point x0 = (1, 0) */
                        0.0, 1.0}; /* start direction d0 = (0, 1) */
  const double box[4] = {-2.0, -2.0, 2.0, 2.0};
  const double pas[4] = {1e-6, 1e-6, 0.5, 0.5};
  const int32_t mode = 4;      /* steps from the curvature */
  const double tol = 1e-2;     /* steps of at most 0.9 / sqrt(0.5 / tol + 1 / 0.5^2) = 0.1225 */
  const int32_t store = 2 + 8; /* kind 23 (x, t), and kinds 1, 2, 3 (phase, number, x) */
  int32_t itab = 0, ierr = -1;

  const int64_t live_before = orvq7sys_table_live();
  const int32_t result =
      ynchem(&circ, &n, circle, &eps, xd, box, pas, &mode, &tol, &store, &itab, &ierr);
  printf("ynchem: result %d, ierr %d, %d evaluations\n", (int)result, (int)ierr, circ.calls);
  expect(result == 0 && ierr == ORVQ7_OK && itab != 0, "ynchem traced the circle");

  int32_t count = 0, count_phase = 0, count_number = 0;
  double* xt = read_kind(itab, 23, 4 * sizeof(double), &count);
  int32_t* phase = read_kind(itab, 1, sizeof(int32_t), &count_phase);
  int32_t* number = read_kind(itab, 2, sizeof(int32_t), &count_number);
  expect(xt != NULL && phase != NULL && number != NULL && count_phase == count &&
             count_number == count,
         "kinds 23, 1 and 2 read back with one entry per point");
  printf("%d points\n", (int)count);

  if (xt != NULL && phase != NULL && number != NULL) {
    /* Steps of about 0.12 (the bound above, where the curvature is 1) make some 2 pi / 0.12
     * = 52 points for a whole turn; steps twice as long or half as long would be wrong. */
    expect(count >= 40 && count <= 120, "some fifty points (between 40 and 120)");
    const double* last = xt + 4 * (count - 1);
    expect(xt[0] == 1.0 && xt[1] == 0.0 && xt[2] == 0.0 && xt[3] == 1.0,
           "point 1 is x0 with the tangent d0");
    expect(last[0] == 1.0 && last[1] == 0.0 && last[2] == 0.0 && last[3] == 1.0,
           "the last point is x0 again, to the bit, with d0");
    expect(phase[0] == 0 && phase[count - 1] == 2, "phases: 0 at the start, 2 at the end");

    int on_circle = 1, unit_tangent = 1, counter_clockwise = 1, numbered = 1, along = 1;
    double turned = 0.0;
    for (int32_t j = 0; j < count; ++j) {
      const double* p = xt + 4 * j;
      const double r2 = p[0] * p[0] + p[1] * p[1];
      if (fabs(r2 - 1.0) > 1e-9) on_circle = 0; /* (r2 - 1)^2 <= eps = 1e-20 */
      /* The unit tangent of travel at (cos a, sin a) is (-sin a, cos a). */
      if (fabs(p[2] + p[1]) > 1e-8 || fabs(p[3] - p[0]) > 1e-8) unit_tangent = 0;
      if (p[0] * p[3] - p[1] * p[2] <= 0.0) counter_clockwise = 0;
      if (number[j] != j + 1) numbered = 0;
      if (j > 0 && j < count - 1 && phase[j] != 1) along = 0;
      if (j > 0) {
        const double* q = p - 4; /* the angle from the previous point, in (-pi, pi] */
        const double step = atan2(q[0] * p[1] - q[1] * p[0], q[0] * p[0] + q[1] * p[1]);
        if (step <= 0.0) counter_clockwise = 0;
        turned += step;
      }
    }
    expect(on_circle, "every point on the circle: |x^2 + y^2 - 1| <= 1e-9");
    expect(unit_tangent, "every tangent (-y, x), the direction of travel");
    expect(counter_clockwise, "each step turns counter-clockwise");
    expect(fabs(turned - 2.0 * acos(-1.0)) <= 1e-9, "the angles add up to one whole turn");
    expect(numbered && along, "points numbered 1, 2, ...; phase 1 between the ends");
  }
  free(xt);
  free(phase);
  free(number);

  expect(circ.calls > 0, "the evaluation routine was called with its context");
  expect(yncend(&itab, &ierr) == 0 && ierr == 0, "yncend released the result");
  printf("tables live: %lld before, %lld after\n", (long long)live_before,
         (long long)orvq7sys_table_live());
  expect(orvq7sys_table_live() == live_before, "no table left live");
  return failures == 0 ? 0 : 1;
}
