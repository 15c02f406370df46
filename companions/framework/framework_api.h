/** \file
 * \brief libOrvMathematics.so: load-time registration of the libraries of the modelling
 * system (public header; compiles as C11 and as C++).
 *
 * A host may put its own libOrvMathematics.so in place of this one; OrvQ7Maths requires only
 * OrvZelDeclareLibraryLoading. */
#ifndef ORVQ7_COMPANIONS_FRAMEWORK_API_H
#define ORVQ7_COMPANIONS_FRAMEWORK_API_H

#include <stdint.h>

/** Export mark of libOrvMathematics.so (its export list is made from the declarations that
 * start with it). */
#if defined(__GNUC__)
#define ORVQ7_FW_API __attribute__((visibility("default")))
#else
#define ORVQ7_FW_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/** Identifiers of the libraries that register themselves. */
typedef enum OrvZelLibraryName { OrvZelLibrary_OrvQ7Maths = 19 } OrvZelLibraryName;

/** OrvZelDeclareLibraryLoading -- records that library `id` was loaded (thread-safe).
 * Returns the number of registrations of that identifier so far, this one included. */
ORVQ7_FW_API int OrvZelDeclareLibraryLoading(OrvZelLibraryName id);

/** Number of registrations of identifier `id` since the process started (0..; ids outside
 * 0..255 give 0). */
ORVQ7_FW_API int32_t orvzel_loading_count(int32_t id);

#ifdef __cplusplus
}
#endif

#endif /* ORVQ7_COMPANIONS_FRAMEWORK_API_H */
