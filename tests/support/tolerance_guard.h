// tests/support/tolerance_guard.h -- sets tolerance k of the current set for one scope and
// restores it after, so a test can put a tolerance on a value of its choosing.
#pragma once
#include <cstdint>

#include "companions/data/data_api.h"

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
