/* closest_points.c -- closest points of two segments (ynoall) and the nearest of a list of
 * points or of a polyline (ynoaon), from C. A segment is an (n, 2) array: its end points as
 * columns; distances are squared. */
#include <stdio.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

static int failures = 0;

static void check(const char* what, double got, double want) {
  printf("%-30s %.17g\n", what, got);
  if (got != want) {
    printf("  expected %.17g\n", want);
    ++failures;
  }
}

static void check_int(const char* what, int32_t got, int32_t want) {
  printf("%-30s %d\n", what, (int)got);
  if (got != want) {
    printf("  expected %d\n", (int)want);
    ++failures;
  }
}

int main(void) {
  const int32_t three = 3;
  double dist2 = -1.0, t1 = -1.0, t2 = -1.0;
  int32_t ierr = -1;

  /* Skew segments: P from (0,0,0) to (2,0,0) along x, Q from (1,-1,1) to (1,1,1) along y,
   * one unit above. The common perpendicular joins (1,0,0) = P(1/2) and (1,0,1) = Q(1/2). */
  const double p[6] = {0.0, 0.0, 0.0, 2.0, 0.0, 0.0};
  const double q[6] = {1.0, -1.0, 1.0, 1.0, 1.0, 1.0};
  check_int("ynoall (skew) result", ynoall(&three, p, q, &dist2, &t1, &t2, &ierr), 0);
  check_int("  ierr", ierr, ORVQ7_OK);
  check("  t1", t1, 0.5);
  check("  t2", t2, 0.5);
  check("  dist2", dist2, 1.0);

  /* Q moved to x = 3: the lines still meet their perpendicular at x = 1.5 on P's line, past
   * P's end, so the answer lies on the edge t1 = 1: P(1) = (2,0,0) and its nearest point of Q,
   * (3,0,1) = Q(1/2), at squared distance 1 + 1 = 2. */
  const double r[6] = {3.0, -1.0, 1.0, 3.0, 1.0, 1.0};
  check_int("ynoall (clamped) result", ynoall(&three, p, r, &dist2, &t1, &t2, &ierr), 0);
  check("  t1", t1, 1.0);
  check("  t2", t2, 0.5);
  check("  dist2", dist2, 2.0);

  /* Parallel segments that overlap have no unique closest pair: code 4717, with a usable
   * pair from the middle of the overlap. P covers x in [0, 2], S (one unit away in y) covers
   * [1, 3]; the overlap [1, 2] has its middle at x = 1.5 = P(3/4) = S(1/4). */
  const double s[6] = {1.0, 1.0, 0.0, 3.0, 1.0, 0.0};
  check_int("ynoall (parallel) result", ynoall(&three, p, s, &dist2, &t1, &t2, &ierr), 1);
  check_int("  ierr", ierr, ORVQ7_ERR_NOT_UNIQUE);
  check("  t1", t1, 0.75);
  check("  t2", t2, 0.25);
  check("  dist2", dist2, 1.0);

  /* Nearest search among the points (0,0), (4,0), (4,3) from X = (5, 1.5). Squared distances
   * 27.25, 3.25, 3.25: a tie, which keeps the lower number, point 2. As a polyline: segment 1
   * is nearest at its end (4,0), 3.25; segment 2, from (4,0) to (4,3), at its middle (4,1.5),
   * 1, so segment 2 with t = 0.5. */
  const int32_t two = 2, m = 3, points = 0, polyline = 8467;
  const double pts[6] = {0.0, 0.0, 4.0, 0.0, 4.0, 3.0};
  const double x[2] = {5.0, 1.5};
  int32_t index = -1;
  double t = -1.0;
  check_int("ynoaon (points) result", ynoaon(&two, x, &m, pts, &points, &dist2, &index, &t, &ierr),
            0);
  check_int("  index", index, 2);
  check("  dist2", dist2, 3.25);
  check("  t", t, 0.0);
  check_int("ynoaon (polyline) result",
            ynoaon(&two, x, &m, pts, &polyline, &dist2, &index, &t, &ierr), 0);
  check_int("  index", index, 2);
  check("  dist2", dist2, 1.0);
  check("  t", t, 0.5);

  return failures == 0 ? 0 : 1;
}
