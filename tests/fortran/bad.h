/* tests/fortran/bad.h -- a declaration the generator has no mapping for: it must stop with
 * an error instead of guessing an interface. */
#include <stdint.h>
#define ORVQ7_FIX_API
/** fxbad -- single precision is not part of the calling convention. */
ORVQ7_FIX_API float fxbad(const float* x);
