/* evaluators/evaluators_api.h -- geometric tests and evaluators of dimension n
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_EVALUATORS_EVALUATORS_API_H
#define ORVQ7_EVALUATORS_EVALUATORS_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Points near a subspace
 * ======================================================================================== */

/* ==========================================================================================
 * Affine map inverse
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_EVALUATORS_EVALUATORS_API_H */
