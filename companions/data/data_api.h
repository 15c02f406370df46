/** \file
 * \brief libQ7SysCOMD.so: the shared data areas that OrvQ7Maths reads
 * (public header; compiles as C11 and as C++).
 *
 * The areas are process-wide globals: every thread sees the same values, and a change made
 * by one thread is seen by all the others (the host serialises its changes against running
 * computations). A host may put its own libQ7SysCOMD.so in place of this one; OrvQ7Maths
 * requires only these names, the element types below and that decale[4] (decale(5) counted
 * from 1) be a valid shift into toler.
 *
 * **Tolerance sets.** toler holds tolerance sets one after another; decale(5) is the shift of
 * the current set, and tolerance k of the current set (k from 1) is toler(decale(5) + k),
 * that is toler[decale[4] + k - 1] in C. Routines read it afresh at every call, so a host
 * changes the current set at once for every routine by writing decale[4] (to select another
 * set) or by writing the values of the current set.
 *
 * Default set, at shift 0 (toler[0..19]); every slot not listed holds 1e-6:
 *
 * | k  | value | meaning                                                     |
 * |----|-------|-------------------------------------------------------------|
 * | 1  | 1e-6  | tolerance of the mean-plane fit                             |
 * | 2  | 1e-6  | linear (distance) tolerance                                 |
 * | 3  | 1e-6  | second linear tolerance                                     |
 * | 4  | 1e-10 | angular tolerance on cosines (parallel when cos > 1 - tol)  |
 * | 5  | 1e-6  | length tolerance (equal when they differ by less)           |
 * | 6  | 1e-6  | further tolerance of the set                                |
 * | 12 | 1e-8  | tolerance for intersections and element transforms          |
 *
 * The rest of toler (from toler[20]) is zero, free for a host's own sets.
 */
#ifndef ORVQ7_COMPANIONS_DATA_API_H
#define ORVQ7_COMPANIONS_DATA_API_H

#include <stdint.h>

/** Export mark of libQ7SysCOMD.so (its export list is made from the declarations that start
 * with it). */
#if defined(__GNUC__)
#define ORVQ7_DATA_API __attribute__((visibility("default")))
#else
#define ORVQ7_DATA_API
#endif

#define ORVQ7DATA_TOLER_SIZE 200  /**< reals in toler (ten sets of 20) */
#define ORVQ7DATA_DECALE_SIZE 8   /**< 8-byte integers in decale */
#define ORVQ7DATA_DATA_SIZE 1024  /**< 4-byte integers in data */
#define ORVQ7DATA_DYNAR_SIZE 16   /**< reals in dynar (a base: blocks lie elsewhere) */
#define ORVQ7DATA_UTILI1_SIZE 16  /**< reals in utili1 */
#define ORVQ7DATA_UTILI_SIZE 4096 /**< reals in utili2, utili4 and utili5 (32 KiB each) */
#define ORVQ7DATA_GMACER_SIZE 64  /**< reals in gmacer (512 bytes) */

#ifdef __cplusplus
extern "C" {
#endif

/* Every area starts on a 16-byte boundary, so it serves as a workspace base for any type. */
ORVQ7_DATA_API extern double toler[];   /**< tolerance sets */
ORVQ7_DATA_API extern int64_t decale[]; /**< shifts; decale[4] selects the current set */
ORVQ7_DATA_API extern int32_t data[];   /**< integer flags (elements 2 to 5); workspace base */
ORVQ7_DATA_API extern double dynar[];   /**< base of the temporary workspace and tables */
ORVQ7_DATA_API extern double utili1[];  /**< scratch of xplpln */
ORVQ7_DATA_API extern double utili2[];  /**< scratch and results of older geometric routines */
ORVQ7_DATA_API extern double utili4[];  /**< argument area of a service call */
ORVQ7_DATA_API extern double utili5[];  /**< scratch of dextes and related routines */
ORVQ7_DATA_API extern double gmacer[];  /**< error record read by giufin: 8 name bytes first */

#ifdef __cplusplus
}
#endif

#endif /* ORVQ7_COMPANIONS_DATA_API_H */
