/* path/path_api.h -- the path-following (marching) solver and its result tables
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_PATH_PATH_API_H
#define ORVQ7_PATH_PATH_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Path-following solver
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_PATH_PATH_API_H */
