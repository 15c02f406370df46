/* tests/fortran/bad.h -- a declaration the generator has no mapping for: it must stop with
 * an error instead of guessing an interface. */
#include <stdint.h>
#define ORVQ7_FIX_API
struct Orvq7FixPair { double a, b; };
/** fxbad -- a record by value is not part of the calling convention. */
ORVQ7_FIX_API int32_t fxbad(const int32_t* n, struct Orvq7FixPair pair);
