/* poly/poly_api.h -- polynomial roots, evaluation and quadrature
 * (public header; compiles as C11 and as C++). Conventions: frame/frame_api.h. */
#ifndef ORVQ7_POLY_POLY_API_H
#define ORVQ7_POLY_POLY_API_H

#include <stdint.h>

#include "frame/frame_api.h"

ORVQ7_BEGIN_DECLS

/* ==========================================================================================
 * Closed-form and polished roots of polynomials
 * ======================================================================================== */

/* ==========================================================================================
 * Polynomial evaluation, derivatives and Bernstein form
 * ======================================================================================== */

/* ==========================================================================================
 * Gauss-Legendre quadrature
 * ======================================================================================== */

ORVQ7_END_DECLS

#endif /* ORVQ7_POLY_POLY_API_H */
