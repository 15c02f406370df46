/* traceback.c -- a failure and its traceback, from C. The workspace service is told to
 * refuse the next request, so cbkver fails; its frame is then read back from the system
 * library, and the meaning of the code looked up. */
#include <stdio.h>
#include <string.h>

#include <OrvQ7Maths/OrvQ7Maths.h>

int main(void) {
  orvq7sys_trace_clear();
  orvq7sys_ws_refuse(1); /* fault injection: the next workspace request is refused */

  const int32_t result = cbkver();
  printf("cbkver() = %d\n", (int)result);
  if (result != 1) return 1;

  const int32_t frames = orvq7sys_trace_count();
  printf("%d frame(s):\n", (int)frames);
  for (int32_t k = 1; k <= frames; ++k) {
    int32_t code = 0, len = 0;
    char name[ORVQ7SYS_NAME_MAX + 1] = {0};
    orvq7sys_trace_frame(k, &code, name, &len);
    printf("  %d  \"%.*s\"  %s\n", (int)code, (int)len, name, orvq7sys_code_text(code));
  }
  int32_t code = 0, len = 0;
  char name[ORVQ7SYS_NAME_MAX + 1] = {0};
  if (frames != 1 || orvq7sys_trace_frame(1, &code, name, &len) != 0 ||
      code != ORVQ7_ERR_CBKVER || len != 8 || memcmp(name, "CBKVER  ", 8) != 0)
    return 1;

  /* The refusal was used up: the next call succeeds and leaves no block behind. */
  const int32_t again = cbkver();
  printf("cbkver() again = %d, blocks outstanding %lld\n", (int)again,
         (long long)orvq7sys_ws_outstanding());
  return again == 0 && orvq7sys_ws_outstanding() == 0 ? 0 : 1;
}
