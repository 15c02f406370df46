// tests/support/real_checks.h -- checks on arrays of reals, and a scoped setting of one
// tolerance of the current set.
#pragma once
#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>

#include "companions/data/data_api.h"
#include "support/recording_services.h"

// got[0..] against want, bit for bit (-0 differs from +0, NaN patterns compare).
inline void expect_bits(const double* got, std::initializer_list<double> want) {
  int k = 0;
  for (double w : want) {
    EXPECT_EQ(bits(got[k]), bits(w)) << "element " << k + 1 << ": " << got[k] << " vs " << w;
    ++k;
  }
}

// Sets tolerance k (from 1) of the current set for one scope, restoring it after.
class ToleranceGuard {
 public:
  ToleranceGuard(std::int32_t k, double value) : slot_(&toler[decale[4] + k - 1]), saved_(*slot_) {
    *slot_ = value;
  }
  ~ToleranceGuard() { *slot_ = saved_; }
  ToleranceGuard(const ToleranceGuard&) = delete;
  ToleranceGuard& operator=(const ToleranceGuard&) = delete;

 private:
  double* slot_;
  double saved_;
};
