/* closest/closest_api.h -- closest points and squared distances in dimension n
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_CLOSEST_CLOSEST_API_H
#define ORVQ7_CLOSEST_CLOSEST_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Closest points and distances
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_CLOSEST_CLOSEST_API_H */
