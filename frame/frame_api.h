/** \file
 * \brief Calling convention, status codes, version and load-time items of OrvQ7Maths
 * (public header; compiles as C11 and as C++).
 *
 * **Calling convention of every exported routine**
 *   - Every argument is passed by reference, scalars included: int32_t* for integers,
 *     double* for reals, arrays as a pointer to their first element. "in" arguments are
 *     declared const and are never written.
 *   - Arrays are contiguous and column-major; element (i, j) of an array with leading
 *     dimension ld is at position (i - 1) + (j - 1) * ld (indices in the documentation
 *     count from 1).
 *   - A routine passed as an argument is a plain C function pointer; an opaque caller
 *     context is a void* handed back unchanged. A character argument is followed, after all
 *     the other arguments, by its length as an int passed by value.
 *   - Routines that report failure return 1 and put a code in their last argument (ierr);
 *     on success they return 0 and set ierr to 0 unless their block says otherwise.
 *     Callers test the result for the value 1.
 *   - Preconditions common to all routines: every array holds at least the documented
 *     number of elements, and no pointer is null unless the routine's block says the
 *     argument is never read.
 *
 * **State**: routines that keep values between calls keep them per thread (one copy per
 * thread), so a thread sees exactly the persistence its blocks document and two threads
 * never see each other's values. Scratch that no later call reads lives on the stack.
 *
 * **Platform services**: the library calls the traceback (bftier), message (errmsg) and
 * workspace services (altes/detes, ...) of libOrvQ7System.so, reads the shared data areas
 * (toler, decale, dynar, ...) of libQ7SysCOMD.so and registers itself with
 * libOrvMathematics.so, only through their exported names, so a host can supply its own.
 */
#ifndef ORVQ7_FRAME_FRAME_API_H
#define ORVQ7_FRAME_FRAME_API_H

#include <stdint.h>

/** Version of the library these headers belong to (major, minor, patch). A new major
 * version may change an exported routine's arguments or behaviour; minor versions add
 * routines; patch versions only mend. orvq7_version() gives the version of the library
 * actually loaded. */
#define ORVQ7_VERSION_MAJOR 1
#define ORVQ7_VERSION_MINOR 0   /**< see ORVQ7_VERSION_MAJOR */
#define ORVQ7_VERSION_PATCH 0   /**< see ORVQ7_VERSION_MAJOR */

/** Export mark: starts the declaration of every exported routine and data item (the export
 * list of the shared library is made from the declarations that start with it). */
#if defined(__GNUC__)
#define ORVQ7_API __attribute__((visibility("default")))
#else
#define ORVQ7_API
#endif

/** \def ORVQ7_BEGIN_DECLS
 * Opens the declarations of a public header: `extern "C" {` when compiled as C++. */
/** \def ORVQ7_END_DECLS
 * Closes what ORVQ7_BEGIN_DECLS opened. */
#ifdef __cplusplus
#define ORVQ7_BEGIN_DECLS extern "C" {
#define ORVQ7_END_DECLS }
#else
#define ORVQ7_BEGIN_DECLS
#define ORVQ7_END_DECLS
#endif

ORVQ7_BEGIN_DECLS

/** Status codes. A code means the same thing in every routine that sets it; callers outside
 * the library compare against these numbers, which never change. The text of each code is
 * available at run time from orvq7sys_code_text() of libOrvQ7System.so. */
enum Orvq7Code {
  ORVQ7_OK = 0,                   /**< success */
  /* Shared numbering of the numerical families. */
  ORVQ7_ERR_ITER_LIMIT = 4701,    /**< a counted loop passed its limit (100 in the Newton steps) */
  ORVQ7_ERR_INNER_SOLVE = 4702,   /**< an inner linear system could not be solved */
  ORVQ7_ERR_SINGULAR = 4703,      /**< a pivot or determinant below the routine's threshold */
  ORVQ7_ERR_4704 = 4704,          /**< reserved: routine-specific, see the routine's block */
  ORVQ7_ERR_4707 = 4707,          /**< reserved: routine-specific, see the routine's block */
  ORVQ7_ERR_ZERO_LEADING = 4709,  /**< zero leading coefficient (or zero constant) of a polynomial */
  ORVQ7_ERR_DEGENERATE = 4710,    /**< degenerate input: zero vector, no tangent at a point */
  ORVQ7_ERR_BAD_ARG = 4712,       /**< invalid argument: a count or dimension below its minimum,
                                       or another invalid argument named by the routine */
  ORVQ7_ERR_NOT_CONVERGED = 4713, /**< a correction was rejected (no convergence) */
  ORVQ7_ERR_EVAL_CAPACITY = 4715, /**< an evaluation routine refused the request */
  ORVQ7_ERR_LEFT_BOX = 4716,      /**< an iterate left the search box */
  ORVQ7_ERR_NOT_UNIQUE = 4717,    /**< the answer is not unique (a usable answer with a warning) */
  ORVQ7_ERR_CAPACITY = 4718,      /**< a dimension above the fixed capacity of the routine */
  ORVQ7_ERR_POINT_LIMIT = 4720,   /**< a traced path reached its point limit */
  ORVQ7_ERR_PATH_AT_START = 4721, /**< a traced path ends at its start (leaves the box at once) */
  ORVQ7_ERR_4722 = 4722,          /**< reserved: routine-specific, see the routine's block */
  /* Codes of single routines, outside the shared numbering. */
  ORVQ7_ERR_WORKSPACE = 36,       /**< the temporary workspace could not be obtained */
  ORVQ7_ERR_MATPPE = 116,         /**< matppe failure */
  ORVQ7_ERR_XYZVOL = 250,         /**< xyzvol failure */
  ORVQ7_MSG_BAD_INDEX = 722,      /**< message: an index outside the structure it addresses */
  ORVQ7_ERR_CBKVER = 1036,        /**< cbkver: the workspace service refused a block */
  ORVQ7_ERR_DRMOYN_PLANE = 1,     /**< drmoyn: the mean-plane solve failed */
  ORVQ7_ERR_DRMOYN_DIRECTION = 2  /**< drmoyn: the eigen-direction step failed */
};

/** Value of the enumeration OrvZelLibraryName that identifies this library when it
 * registers itself at load time with OrvZelDeclareLibraryLoading (libOrvMathematics.so). */
#define ORVQ7_LIBRARY_ID 19

/** OrvZelLibrary -- exported data item through which a host identifies the library; an
 * integer slot initialised to 1. The library never reads or writes it after load. */
ORVQ7_API extern int32_t OrvZelLibrary;

/** OrvZelInternalOrvQ7Maths -- marker function of the library's internal interface: the
 * maker's mark for internal interfaces ("OrvZelInternal") followed by the module name.
 * Takes no argument, returns 1, carries no behaviour. */
ORVQ7_API int32_t OrvZelInternalOrvQ7Maths(void);

/** cbkver -- checks that the workspace service works.
 * Issues the system library's version record (altver), then asks the workspace service for a
 * block of 100 reals addressed relative to the shared area `data`, writes 1.0 into its first
 * element and releases it.
 * Arguments: none.
 * Result  0 the block was obtained and released; 1 the service refused it.
 * Traceback: on refusal one frame, code 1036, name "CBKVER  " (length 8).
 * State: none (the handle is a local; the block never outlives the call).
 */
ORVQ7_API int32_t cbkver(void);

/** orvq7_version -- version of the library actually loaded, as numbers.
 *   major  out  int32  major version
 *   minor  out  int32  minor version
 *   patch  out  int32  patch level
 * Result major * 10000 + minor * 100 + patch (10000 for 1.0.0), so that versions compare as
 * integers. A program built against these headers runs with any loaded library of the same
 * major version and an equal or higher minor version.
 * Traceback: none.  State: none; safe to call concurrently. */
ORVQ7_API int32_t orvq7_version(int32_t* major, int32_t* minor, int32_t* patch);

/** orvq7_version_text -- version of the library actually loaded, as text.
 * Result a static, zero-terminated string "major.minor.patch" ("1.0.0"), never null.
 * Traceback: none.  State: none; safe to call concurrently. */
ORVQ7_API const char* orvq7_version_text(void);

ORVQ7_END_DECLS

#endif /* ORVQ7_FRAME_FRAME_API_H */
