// path/driver.cpp -- the path-following driver: ynchem. Decodes the options, starts the path,
// then repeats step choice, prediction and correction, tests, classification and storage until
// an end. The whole path state is this thread's s_ynchem (path/path_state.h).
#include <cstdint>
#include <limits>

#include "frame/status.h"
#include "path/path_api.h"
#include "path/path_state.h"

namespace {

constexpr std::int32_t kVariant = 1;        // the implicit-path variant of wnccmd and wncpas
constexpr std::int32_t kPointLimit = 5000;  // accepted points allowed when n <= 4
constexpr std::int32_t kSmallSystem = 4;    // largest n under the point limit
constexpr std::int32_t kCollapsed = 3;      // special flag: the step collapsed
constexpr std::int32_t kNumberKind = 2;     // record kind of the point numbers

// Ends the call after a failure: the result released (itab back to 0, the failure's code
// kept), then the frame, except for 4721.
std::int32_t failed(std::int32_t* itab, std::int32_t* ierr) {
  if (*itab != 0) {
    std::int32_t code = 0;
    yncend(itab, &code);
    *itab = 0;
  }
  if (*ierr != 0 && *ierr != impl::kErrPathAtStart) impl::trace(*ierr, "YNCHEM  ");
  return 1;
}

}  // namespace

extern "C" std::int32_t ynchem(void* ctx, const std::int32_t* n, Orvq7PathFct fct,
                               const double* eps, const double* xd, const double* box,
                               const double* pas, const std::int32_t* mode, const double* tol,
                               const std::int32_t* store, std::int32_t* itab, std::int32_t* ierr) {
  impl::PathState& s = impl::s_ynchem;
  // (1) Options.
  *ierr = 0;
  *itab = 0;
  if (wnccmd(n, pas, mode, tol, store, &kVariant, &s.options, s.limits, &s.layout, s.pairs, ierr) ==
      1) {
    return failed(itab, ierr);
  }
  // (2) Start: x0 on the curve, first tangent, first point stored.
  if (wncini(ctx, n, fct, eps, xd, box, &s.options, &s.layout, s.pairs, &s.march, &s.tables, itab,
             ierr) == 1) {
    return failed(itab, ierr);
  }
  // (3) Flags; the start point is the first accepted point.
  s.special = 0;
  s.phase = 1;
  s.count = 1;
  double xnew[impl::kPathMaxN];
  double xkeep[impl::kPathMaxN];
  const double spare = 0.0;
  for (;;) {
    // (4.1) Step length.
    if (wncpas(n, &kVariant, &s.options, s.limits, tol, pas, &s.march, ierr) == 1) {
      return failed(itab, ierr);
    }
    // (4.2) Predict and correct, test, classify; again while a test asks for a redo.
    do {
      s.redo = 0;
      if (wncgoo(ctx, n, fct, eps, &spare, pas, &s.march, &s.special, xnew, ierr) == 1) {
        return failed(itab, ierr);
      }
      if (s.special == kCollapsed) {
        s.accepted = 0;
        break;
      }
      if (wnctes(ctx, n, fct, eps, xd, xnew, box, pas, &s.march, &s.redo, xkeep, &s.special,
                 ierr) == 1) {
        return failed(itab, ierr);
      }
      if (s.redo != 0) continue;
      if (wnccar(ctx, n, fct, xd, xkeep, pas, &s.options, s.limits, tol, &s.special, &s.march,
                 &s.redo, &s.accepted, ierr) == 1) {
        return failed(itab, ierr);
      }
    } while (s.redo != 0);
    // (4.3) The end has been seen.
    if (s.special != 0) s.phase = 2;
    // (4.4) Count; small systems stop past 5000 points (strict).
    if (s.accepted == 1) {
      // Larger systems have no point limit, but the count (and the stored point numbers) are
      // 32-bit: a path that reaches 2^31 - 1 points stops there with the same code.
      if (s.count == std::numeric_limits<std::int32_t>::max()) {
        *ierr = impl::kErrPointLimit;
        return failed(itab, ierr);
      }
      ++s.count;
      if (s.count > kPointLimit && *n <= kSmallSystem) {
        *ierr = impl::kErrPointLimit;
        return failed(itab, ierr);
      }
    }
    // (4.5) Store.
    if (wncflu(&s.phase, &s.accepted, &s.options, &s.layout, &s.march, &s.tables, itab, ierr) ==
        1) {
      return failed(itab, ierr);
    }
    // (4.6) End of the path. Deliberate: yncrea's result is not tested. Without record kind 2
    // it leaves 4712 in ierr (the call then returns 0 with it) and the count as the previous
    // lookup on this thread left it.
    if (s.special != 0) {
      yncrea(itab, &kNumberKind, &s.lookup_handle, &s.lookup_count, ierr);
      if (s.lookup_count == 1) {
        std::int32_t code = 0;
        yncend(itab, &code);
        *itab = 0;
        *ierr = impl::kErrPathAtStart;
        return 1;
      }
      return 0;
    }
  }
}
