/* fitting/fitting_api.h -- mean planes and mean lines of point sets
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_FITTING_FITTING_API_H
#define ORVQ7_FITTING_FITTING_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Mean plane and mean line fitting
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_FITTING_FITTING_API_H */
