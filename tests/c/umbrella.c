/* tests/c/umbrella.c -- the umbrella header compiles as C11 and declares every directory's
 * routines (a call to one routine of each header with declarations shows that). */
#include <OrvQ7Maths/OrvQ7Maths.h>

int orvq7_c11_umbrella_compile(void);
int orvq7_c11_umbrella_compile(void) {
  const double a[3] = {1.0, 0.0, 0.0};
  return prosca(a, a) == 1.0 && cbkver() == 0 && orvq7sys_trace_count() >= 0 ? 0 : 1;
}
