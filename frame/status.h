// frame/status.h -- status convention shared by every routine (internal header).
#pragma once
#include <cstddef>
#include <cstdint>

#include "frame/services.h"

namespace impl {

// Function results are 0 (success) and 1 (failure); callers test for == 1.
constexpr std::int32_t kOk = 0;
constexpr std::int32_t kFailed = 1;

// Shared codes: the same meaning in every routine that sets them.
constexpr std::int32_t kErrIterLimit = 4701;    // counted loop passed its limit
constexpr std::int32_t kErrInnerSolve = 4702;   // an inner linear solve failed
constexpr std::int32_t kErrSingular = 4703;     // pivot below the routine's threshold
constexpr std::int32_t kErrZeroLeading = 4709;  // zero leading coefficient
constexpr std::int32_t kErrDegenerate = 4710;   // zero vector, no tangent
constexpr std::int32_t kErrBadArg = 4712;       // count or dimension below its minimum
constexpr std::int32_t kErrNotConverged = 4713; // correction rejected
constexpr std::int32_t kErrEvalCapacity = 4715; // evaluation routine refused the request
constexpr std::int32_t kErrLeftBox = 4716;      // an iterate left the box
constexpr std::int32_t kErrNotUnique = 4717;    // answer not unique (usable)
constexpr std::int32_t kErrCapacity = 4718;     // dimension above the fixed capacity
constexpr std::int32_t kErrPointLimit = 4720;   // path point limit
constexpr std::int32_t kErrPathAtStart = 4721;  // path ends at its start
constexpr std::int32_t kErrWorkspace = 36;      // workspace refused

inline std::int32_t fail(std::int32_t* ierr, std::int32_t code) {
  *ierr = code;
  return kFailed;
}

// One traceback frame: the name's bytes as in the literal (blanks kept), length by the
// compiler (the literal's size less its terminating zero).
template <std::size_t N>
inline void trace(std::int32_t code, const char (&name)[N]) {
  bftier(&code, name, static_cast<int>(N - 1));
}

}  // namespace impl
