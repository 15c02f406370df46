// frame/tolerances.h -- the current tolerance set (internal header).
#pragma once
#include <cstdint>

#include "frame/services.h"

namespace impl {

// Tolerance k (from 1) of the current set: toler(decale(5) + k). Read afresh at every call,
// never cached, so a host's change of the current set takes effect at once.
inline double tol(std::int32_t k) { return toler[decale[4] + k - 1]; }

// Library constants, shared by design between routines.
constexpr double kNegligible = 1e-15;  // relative zero
constexpr double kHuge = 1e38;         // bound standing for infinity
constexpr double kTiny = 1e-38;        // tiny value, pivot threshold
constexpr double kLarge = 1e35;        // large value
constexpr double kCubicRatio = 3e-8;   // threshold of the cubic and quartic solvers
constexpr double kPi = 3.141592653589793;

}  // namespace impl
