/* consumer.c -- a C11 program built against an installed OrvQ7Maths: it includes the
 * umbrella header, calls routines of the library and of each platform library, and checks
 * that the library loaded is the version it was built for (EXPECTED_VERSION, from the CMake
 * package or pkg-config). Exit status 0 when all holds. */
#include <stdio.h>
#include <string.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

#ifndef EXPECTED_VERSION
#error "build with -DEXPECTED_VERSION=\"major.minor.patch\""
#endif

static int failures = 0;

static void expect(int ok, const char* what) {
  printf("%-52s %s\n", what, ok ? "ok" : "FAILED");
  if (!ok) ++failures;
}

int main(void) {
  /* The loaded library, the headers and the package agree on the version. */
  int32_t major = -1, minor = -1, patch = -1;
  const int32_t number = orvq7_version(&major, &minor, &patch);
  char text[32];
  snprintf(text, sizeof text, "%d.%d.%d", (int)major, (int)minor, (int)patch);
  printf("library %s, headers %d.%d.%d, package %s\n", orvq7_version_text(),
         ORVQ7_VERSION_MAJOR, ORVQ7_VERSION_MINOR, ORVQ7_VERSION_PATCH, EXPECTED_VERSION);
  expect(strcmp(orvq7_version_text(), EXPECTED_VERSION) == 0, "version text as packaged");
  expect(strcmp(text, EXPECTED_VERSION) == 0, "version numbers as packaged");
  expect(number == major * 10000 + minor * 100 + patch, "version as one integer");
  expect(major == ORVQ7_VERSION_MAJOR && minor == ORVQ7_VERSION_MINOR &&
             patch == ORVQ7_VERSION_PATCH,
         "version of the headers");

  /* The library: a product and its load-time registration with the framework library. */
  const double a[3] = {1.0, -2.0, 0.5}, b[3] = {4.0, 1.0, 2.0};
  expect(prosca(a, b) == 3.0, "prosca from libOrvQ7Maths"); /* 4 - 2 + 1 */
  expect(orvzel_loading_count(ORVQ7_LIBRARY_ID) == 1, "registered once at load");
  expect(OrvZelLibrary == 1 && OrvZelInternalOrvQ7Maths() == 1, "exported data and marker");

  /* The platform libraries: the tolerance set and the traceback. */
  expect(toler[decale[4] + 4 - 1] == 1e-10, "angular tolerance from libQ7SysCOMD");
  orvq7sys_trace_clear();
  orvq7sys_ws_refuse(1);
  expect(cbkver() == 1 && orvq7sys_trace_count() == 1, "refused workspace gives a frame");
  int32_t code = 0, len = 0;
  char name[ORVQ7SYS_NAME_MAX] = {0};
  expect(orvq7sys_trace_frame(1, &code, name, &len) == 0 && code == 1036 && len == 8 &&
             memcmp(name, "CBKVER  ", 8) == 0,
         "frame 1036 \"CBKVER  \" from libOrvQ7System");
  expect(cbkver() == 0 && orvq7sys_ws_outstanding() == 0, "next call succeeds, no leak");
  return failures == 0 ? 0 : 1;
}
