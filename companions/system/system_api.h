/** \file
 * \brief libOrvQ7System.so: the system services that OrvQ7Maths imports (traceback,
 * messages, workspace, copy, fill, sort, guarded error contexts, growable tables), plus a
 * query interface through which a host or a test reads what the services recorded.
 * (Public header; compiles as C11 and as C++.)
 *
 * A host system may put its own libOrvQ7System.so in place of this one: OrvQ7Maths calls
 * only the services declared in the first section below, by these names and with these
 * arguments. The query interface (orvq7sys_*) belongs to this implementation.
 *
 * Thread safety: every service may be called from several threads at once. The traceback
 * and the message log are kept per thread; workspace blocks are process-wide (a block may
 * be released by another thread than the one that took it), with per-thread accounting and
 * per-thread fault injection.
 */
#ifndef ORVQ7_COMPANIONS_SYSTEM_API_H
#define ORVQ7_COMPANIONS_SYSTEM_API_H

#include <stdint.h>

/** Export mark of libOrvQ7System.so (its export list is made from the declarations that
 * start with it). */
#if defined(__GNUC__)
#define ORVQ7_SYS_API __attribute__((visibility("default")))
#else
#define ORVQ7_SYS_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* ------------------------------------------------------------------------------------------
 * Services imported by OrvQ7Maths
 * ---------------------------------------------------------------------------------------- */

/** bftier -- records one frame of an error traceback: routine `name` failed with `code`.
 *   code   in  int32      the code
 *   name   in  char(len)  the routine's name, kept byte for byte (blanks, punctuation)
 *   len    in  int, by value  the name's length; any length is accepted (a negative one
 *                             counts as 0); at most ORVQ7SYS_NAME_MAX bytes are kept
 * Returns normally, never stops the program. Frames go to the calling thread's traceback,
 * which holds the ORVQ7SYS_TRACE_MAX most recent frames (older ones are dropped and
 * counted). */
ORVQ7_SYS_API void bftier(const int32_t* code, const char* name, int len);

/** errmsg -- issues the message of a code: appends (code, severity) to the calling thread's
 * message log (the ORVQ7SYS_TRACE_MAX most recent entries are kept). Returns normally. */
ORVQ7_SYS_API void errmsg(const int32_t* code, const int32_t* severity);

/** altes -- reserves a temporary block of `count` elements of type `type`.
 *   base    in   array   base the caller addresses the block from (any address)
 *   type    in   int32   element type: 1 byte (1), 4-byte integer (2), 8-byte real (3),
 *                        16-byte pair of reals (4); other codes are refused
 *   count   in   int32   number of elements, >= 0 (0 gives a valid empty block)
 *   index   out  int64   the k-th element of the block is element index + k - 1 of base,
 *                        counted from 1 in units of the type; may be large or negative
 *   handle  in/out int32 must be 0 on entry; on success a non-zero handle naming the block
 * Result 0 success; 1 refusal (bad type, negative count, non-zero handle on entry, no
 * memory, or fault injection), with handle and index unchanged.
 * The block starts a whole number of elements from base and is aligned for its type when
 * base is. It lives until detes. */
ORVQ7_SYS_API int32_t altes(void* base, const int32_t* type, const int32_t* count, int64_t* index,
                            int32_t* handle);

/** detes -- releases the block of `handle`. A handle of 0 is accepted and does nothing.
 * Result 0 success; 1 the handle names no live block (nothing is freed). */
ORVQ7_SYS_API int32_t detes(const int32_t* handle);

/** crccop -- copies `count` bytes from `src` to `dst`.
 *   src    in   array  overlapping areas allowed
 *   count  in   int32  a count below 1 copies nothing
 *   dst    out  array
 * Result always 0. */
ORVQ7_SYS_API int32_t crccop(const void* src, const int32_t* count, void* dst);

/** crcmac -- sets `count` bytes of `dst` to the low byte of `fill`.
 *   dst    out  array
 *   count  in   int32  a count below 1 sets nothing
 *   fill   in   int32  the byte is its low byte
 * Result always 0. */
ORVQ7_SYS_API int32_t crcmac(void* dst, const int32_t* count, const int32_t* fill);

/** sori4 -- sorts the rows of an integer table in place, in increasing order of the integer
 * at position `key` (from 1) of each row; rows with equal keys keep their order (stable).
 *   table  in/out int32(rowlen, nrows)  rows stored one after another
 *   work   scratch int32                 accepted for compatibility; not written
 * Nothing happens when rowlen < 1, nrows < 1 or key is outside 1..rowlen. Result 0. */
ORVQ7_SYS_API int32_t sori4(int32_t* table, const int32_t* rowlen, const int32_t* nrows,
                            const int32_t* key, int32_t* work);

/** sorr8 -- sorts `count` reals in place into increasing order.
 *   values  in/out  real(count)  equal values keep their order (so -0 and +0 keep theirs),
 *                                NaNs go last
 *   count   in      int32        a count below 2 does nothing
 * Result 0. */
ORVQ7_SYS_API int32_t sorr8(double* values, const int32_t* count);

/** giuope -- opens a guarded error context for the calling routine; the four arguments are
 * that routine's own, passed on unchanged and not read. Contexts nest per thread. Result 0. */
ORVQ7_SYS_API int32_t giuope(void* a1, void* a2, void* a3, void* a4);

/** giufin -- closes the error context. When status is non-zero, records the error held in
 * the shared area gmacer as one traceback frame (code = status, name = gmacer's first 8
 * bytes) and returns 1 (bit 0: the caller must report failure); otherwise returns 0.
 * `value` is not read. */
ORVQ7_SYS_API int32_t giufin(const int32_t* status, void* value);

/** giuclo -- releases the guarded context opened by giuope (flag: 1 after giufin was called,
 * 0 otherwise; not otherwise used). A close without an open context does nothing. */
ORVQ7_SYS_API void giuclo(const int32_t* flag);

/** altver -- issues the version record of the system library: appends message code 0 with
 * severity 0 to the calling thread's message log. The record's text is
 * orvq7sys_version_text(). */
ORVQ7_SYS_API void altver(void);

/* ------------------------------------------------------------------------------------------
 * Growable tables (result tables of traced paths)
 * ---------------------------------------------------------------------------------------- */

/* A table is a sequence of entries of one fixed size in bytes, named by a handle (a positive
 * integer, 0 is never a handle). Entries are counted from 1. Tables are process-wide: a handle
 * made on one thread may be used and released on another. Every service locks one mutex for its
 * whole work, so calls on different tables, or reads of one table, may run concurrently; the
 * caller serialises writes to a table against other uses of that table. The storage grows
 * geometrically (its capacity at least doubles when it must grow), so appending entries one at
 * a time costs amortised constant time per entry; shrinking keeps the capacity. Entries that a
 * table gains without being written (yutini, yutmnc) are zero-filled.
 * Codes (in ierr, result 1; nothing is changed): 4712 an unknown handle, a size or count out of
 * range, an entry range outside the table, a selector other than 1..4; 36 the storage was
 * refused (no memory, more than 2^40 bytes, already 2^20 tables live, or fault injection,
 * below). On success ierr = 0. A released handle stays unknown to every service (it is not
 * given out again until its slot has served 2048 more tables). */

/** yutini -- creates a table of `entries` zero-filled entries of `esize` bytes.
 *   esize    in   int32  entry size in bytes, >= 1
 *   entries  in   int32  number of entries, >= 0
 *   handle   out  int32  the new table's handle (written only on success) */
ORVQ7_SYS_API int32_t yutini(const int32_t* esize, const int32_t* entries, int32_t* handle,
                             int32_t* ierr);

/** yutwri -- writes `count` entries from `values`, starting at entry `first`. The range must
 * start within the table or right after its last entry (1 <= first <= entries + 1, count >= 0);
 * the table grows to hold first + count - 1 entries when needed.
 *   values   in   bytes(count * esize)  the entries, one after another */
ORVQ7_SYS_API int32_t yutwri(const int32_t* handle, const int32_t* first, const int32_t* count,
                             const void* values, int32_t* ierr);

/** yutrea -- reads `count` entries starting at entry `first` into `values`
 * (1 <= first, count >= 0, first + count - 1 <= entries).
 *   values   out  bytes(count * esize) */
ORVQ7_SYS_API int32_t yutrea(const int32_t* handle, const int32_t* first, const int32_t* count,
                             void* values, int32_t* ierr);

/** yutinf -- describes a table: `esize` receives its entry size in bytes and `entries` its
 * current number of entries. */
ORVQ7_SYS_API int32_t yutinf(const int32_t* handle, int32_t* esize, int32_t* entries,
                             int32_t* ierr);

/** yutmnc -- sets the number of entries to `entries` (>= 0): entries added are zero-filled,
 * entries removed are forgotten (the capacity is kept). */
ORVQ7_SYS_API int32_t yutmnc(const int32_t* handle, const int32_t* entries, int32_t* ierr);

/** yuttab -- direct access to a table's storage.
 *   selector  in   int32  unit of the index, the workspace's type codes: 1 byte, 2 4-byte
 *                         integer, 3 8-byte real, 4 16-byte pair of reals
 *   index     out  int64  byte (or integer, real, pair) k of the storage, k from 1, is element
 *                         index + k - 1 of dynar counted from 1 in units of the selector
 *   entries   out  int32  the current number of entries (the storage holds entries * esize
 *                         bytes in use, entry j starting at byte (j - 1) * esize + 1)
 * The storage is 16-byte aligned. It stays where it is until the table grows past its capacity
 * (yutwri, yutmnc) or is released; the index must not be used after that. */
ORVQ7_SYS_API int32_t yuttab(const int32_t* handle, const int32_t* selector, int64_t* index,
                             int32_t* entries, int32_t* ierr);

/** yutcop -- creates a new table with the entry size and the entries of table `handle`;
 * `copy` receives the new handle (written only on success). */
ORVQ7_SYS_API int32_t yutcop(const int32_t* handle, int32_t* copy, int32_t* ierr);

/** yutend -- releases a table; its handle is then unknown. */
ORVQ7_SYS_API int32_t yutend(const int32_t* handle, int32_t* ierr);

/* ------------------------------------------------------------------------------------------
 * Query interface of this implementation (hosts and tests)
 * ---------------------------------------------------------------------------------------- */

#define ORVQ7SYS_TRACE_MAX 64 /**< frames (and messages) kept per thread */
#define ORVQ7SYS_NAME_MAX 32  /**< bytes of a frame's name kept */

/** Number of traceback frames held for the calling thread (0..ORVQ7SYS_TRACE_MAX). */
ORVQ7_SYS_API int32_t orvq7sys_trace_count(void);
/** Frame k of the calling thread, k from 1 (the oldest held) to orvq7sys_trace_count().
 * Writes the code, the name bytes (name must hold ORVQ7SYS_NAME_MAX bytes; no terminating
 * zero is added beyond the kept length, the rest is zero-filled) and the length as passed to
 * bftier. Result 0, or 1 when k is out of range (nothing written). */
ORVQ7_SYS_API int32_t orvq7sys_trace_frame(int32_t k, int32_t* code, char* name, int32_t* len);
/** Frames dropped on the calling thread since its last clear because the traceback was full. */
ORVQ7_SYS_API int64_t orvq7sys_trace_dropped(void);
/** Clears the calling thread's traceback. */
ORVQ7_SYS_API void orvq7sys_trace_clear(void);

/** Number of messages held for the calling thread. */
ORVQ7_SYS_API int32_t orvq7sys_msg_count(void);
/** Message k (from 1) of the calling thread. Result 0, or 1 when k is out of range. */
ORVQ7_SYS_API int32_t orvq7sys_msg_get(int32_t k, int32_t* code, int32_t* severity);
/** Clears the calling thread's message log. */
ORVQ7_SYS_API void orvq7sys_msg_clear(void);

/** Meaning of any code of OrvQ7Maths (0, the shared numbering 4701..4722 and the codes of
 * single routines), as a static English text; "unknown code" for any other value. */
ORVQ7_SYS_API const char* orvq7sys_code_text(int32_t code);

/** Text of the version record that altver issues. */
ORVQ7_SYS_API const char* orvq7sys_version_text(void);

/** Workspace blocks taken and not yet released, in the whole process. */
ORVQ7_SYS_API int64_t orvq7sys_ws_outstanding(void);
/** Workspace blocks taken by the calling thread and not yet released (by any thread). */
ORVQ7_SYS_API int64_t orvq7sys_ws_outstanding_thread(void);
/** Requests (granted or refused) made by the calling thread since it started. */
ORVQ7_SYS_API int64_t orvq7sys_ws_requests_thread(void);
/** Fault injection: the calling thread's next n requests are refused (n <= 0 cancels). */
ORVQ7_SYS_API void orvq7sys_ws_refuse(int32_t n);

/** Growable tables not yet released, in the whole process. */
ORVQ7_SYS_API int64_t orvq7sys_table_live(void);
/** Tables created by the calling thread and not yet released (by any thread). */
ORVQ7_SYS_API int64_t orvq7sys_table_live_thread(void);
/** Capacity in entries of a table's storage (>= its number of entries); -1 for an unknown
 * handle. */
ORVQ7_SYS_API int64_t orvq7sys_table_capacity(int32_t handle);
/** Fault injection: of the calling thread's next calls of yutini, yutwri, yutmnc or yutcop,
 * the first `skip` go through and the n after them are refused with 36, changing nothing
 * (n <= 0 cancels). */
ORVQ7_SYS_API void orvq7sys_table_refuse(int32_t skip, int32_t n);

#ifdef __cplusplus
}
#endif

#endif /* ORVQ7_COMPANIONS_SYSTEM_API_H */
