/* tests/c/headers.c -- every public header compiles as C11. */
#include "closest/closest_api.h"
#include "companions/data/data_api.h"
#include "companions/framework/framework_api.h"
#include "companions/system/system_api.h"
#include "evaluators/evaluators_api.h"
#include "fitting/fitting_api.h"
#include "frame/frame_api.h"
#include "linalg/linalg_api.h"
#include "path/path_api.h"
#include "poly/poly_api.h"
#include "vector/vector_api.h"

int orvq7_c11_headers_compile(void);
int orvq7_c11_headers_compile(void) { return ORVQ7_ERR_BAD_ARG == 4712 ? 0 : 1; }
