// fuzz/fuzz_support.h -- what every fuzz target shares: decoding arbitrary bytes into
// arguments of exactly the size a routine may read, and the checks of the guarantees the
// public headers give (codes, untouched outputs, unmodified inputs, no traceback frame,
// workspace released).
#pragma once
#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <initializer_list>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "companions/data/data_api.h"
#include "companions/system/system_api.h"

namespace fuzz {

class Args;
void dump(const Args& a);
inline thread_local const Args* t_current_args = nullptr;

// A broken guarantee: say which, show the call's input arrays, and stop (libFuzzer keeps the
// input as a crash).
[[noreturn]] inline void broken(const char* routine, const char* what, long detail = 0) {
  std::fprintf(stderr, "\n*** %s: %s (%ld)\n", routine, what, detail);
  if (t_current_args != nullptr) dump(*t_current_args);
  std::fflush(stderr);
  std::abort();
}
#define FUZZ_CHECK(routine, cond) \
  do {                            \
    if (!(cond)) ::fuzz::broken(routine, "check failed: " #cond, __LINE__); \
  } while (0)

inline std::uint64_t bits(double x) {
  std::uint64_t u;
  std::memcpy(&u, &x, sizeof u);
  return u;
}
inline double from_bits(std::uint64_t u) {
  double x;
  std::memcpy(&x, &u, sizeof x);
  return x;
}
inline bool same(double a, double b) { return bits(a) == bits(b); }
// The same bits, or both NaN (of any payload).
inline bool alike(double a, double b) { return same(a, b) || (std::isnan(a) && std::isnan(b)); }

// Pattern written into every output before a call: a signalling NaN payload that no
// arithmetic produces (arithmetic quiets a signalling NaN) and the decoder never yields.
constexpr std::uint64_t kSentinelBits = 0x7ff4dead5eed0001ULL;
inline double sentinel() { return from_bits(kSentinelBits); }
inline bool is_sentinel(double x) { return bits(x) == kSentinelBits; }
constexpr std::int32_t kSentinelInt = -0x5eed0001;

// ---- Decoding ----------------------------------------------------------------------------

// Reads the fuzz input front to back; past its end every read gives zeros.
class Input {
 public:
  Input(const std::uint8_t* data, std::size_t size) : p_(data), n_(size) {}
  std::uint8_t byte() {
    if (n_ == 0) return 0;
    --n_;
    return *p_++;
  }
  std::uint64_t raw64() {
    std::uint64_t u = 0;
    for (int k = 0; k < 8; ++k) u |= static_cast<std::uint64_t>(byte()) << (8 * k);
    return u;
  }
  // An integer in [lo, hi] (mostly), or with a small chance a value just outside or far
  // outside the range, so that the argument checks are exercised.
  std::int32_t count(std::int32_t lo, std::int32_t hi) {
    const std::uint8_t b = byte();
    switch (b & 0x1f) {
      case 0: return lo - 1;
      case 1: return hi + 1;
      case 2: return (b & 0x20) ? std::numeric_limits<std::int32_t>::min() : -1;
      default: break;
    }
    const std::int64_t span = static_cast<std::int64_t>(hi) - lo + 1;
    return static_cast<std::int32_t>(lo + static_cast<std::int64_t>(byte()) % span);
  }
  // An integer in [lo, hi], always.
  std::int32_t pick(std::int32_t lo, std::int32_t hi) {
    const std::int64_t span = static_cast<std::int64_t>(hi) - lo + 1;
    const std::uint32_t u = static_cast<std::uint32_t>(byte()) | (static_cast<std::uint32_t>(byte()) << 8);
    return static_cast<std::int32_t>(lo + static_cast<std::int64_t>(u) % span);
  }
  std::int32_t int32() { return static_cast<std::int32_t>(raw64()); }
  // A real: small multiples of 1/4 most often (so the structured branches are reached), and
  // 0, -0, subnormals, the largest values, infinities, NaN, values next to 1 and next to the
  // common thresholds, and arbitrary bit patterns.
  double real() {
    const std::uint8_t tag = byte();
    const double small = static_cast<std::int8_t>(byte()) / 4.0;
    double x;
    switch (tag & 0x1f) {
      case 16: case 17: case 18: x = from_bits(raw64()); break;
      case 19: x = 0.0; break;
      case 20: x = -0.0; break;
      case 21: x = (tag & 0x20) ? -std::numeric_limits<double>::denorm_min()
                                : std::numeric_limits<double>::denorm_min(); break;
      case 22: x = (tag & 0x20) ? -DBL_MAX : DBL_MAX; break;
      case 23: x = (tag & 0x20) ? -INFINITY : INFINITY; break;
      case 24: x = std::numeric_limits<double>::quiet_NaN(); break;
      case 25: x = small * 1e300; break;
      case 26: x = small * 1e-300; break;
      case 27: x = std::nextafter(1.0, (tag & 0x20) ? 0.0 : 2.0) * ((tag & 0x40) ? -1 : 1); break;
      case 28: x = small * 1e-15; break;
      case 29: x = small * 1e-9; break;
      case 30: x = small + static_cast<std::int8_t>(byte()) / 1024.0; break;
      default: x = small; break;
    }
    if (bits(x) == kSentinelBits) x = 0.0;
    return x;
  }

 private:
  const std::uint8_t* p_;
  std::size_t n_;
};

// ---- Arguments ---------------------------------------------------------------------------

// The arrays of one call, each allocated with exactly the size the routine may read (so the
// address sanitizer sees any access past it). Inputs are remembered and compared after the
// call; outputs start as the sentinel.
class Args {
 public:
  explicit Args(Input& in) : in_(in) { t_current_args = this; }
  ~Args() { t_current_args = nullptr; }
  Args(const Args&) = delete;
  Args& operator=(const Args&) = delete;

  double* reals(std::size_t n) {
    double* p = alloc(n);
    for (std::size_t k = 0; k < n; ++k) p[k] = in_.real();
    remember(p, n);
    return p;
  }
  // An input array holding v.
  double* copy_of(const std::vector<double>& v) {
    double* p = alloc(v.size());
    std::copy(v.begin(), v.end(), p);
    remember(p, v.size());
    return p;
  }
  // An input array whose contents the caller fills; remembered by seal().
  double* raw(std::size_t n) { return alloc(n); }
  void seal(const double* p, std::size_t n) { remember(p, n); }
  double* real(double v) {
    double* p = alloc(1);
    *p = v;
    remember(p, 1);
    return p;
  }
  double* out(std::size_t n) {
    double* p = alloc(n);
    for (std::size_t k = 0; k < n; ++k) p[k] = sentinel();
    return p;
  }
  const std::int32_t* i32(std::int32_t v) {
    auto* p = alloc_i32(1);
    *p = v;
    ints_.push_back({p, {v}});
    return p;
  }
  const std::int32_t* i32s(const std::vector<std::int32_t>& v) {
    auto* p = alloc_i32(v.size());
    std::copy(v.begin(), v.end(), p);
    ints_.push_back({p, v});
    return p;
  }
  std::int32_t* out_i32(std::size_t n = 1) {
    auto* p = alloc_i32(n);
    for (std::size_t k = 0; k < n; ++k) p[k] = kSentinelInt;
    return p;
  }
  // Every input array still holds what it held before the call, bit for bit.
  void check_inputs(const char* routine) const {
    for (const auto& r : reals_)
      for (std::size_t k = 0; k < r.copy.size(); ++k)
        if (bits(r.p[k]) != bits(r.copy[k])) broken(routine, "input array modified", long(k));
    for (const auto& r : ints_)
      for (std::size_t k = 0; k < r.copy.size(); ++k)
        if (r.p[k] != r.copy[k]) broken(routine, "integer input modified", long(k));
  }

 private:
  friend void dump(const Args& a);
  struct Kept {
    const double* p;
    std::vector<double> copy;
  };
  struct KeptInt {
    const std::int32_t* p;
    std::vector<std::int32_t> copy;
  };
  double* alloc(std::size_t n) {
    blocks_.emplace_back(new double[n]);
    return blocks_.back().get();
  }
  std::int32_t* alloc_i32(std::size_t n) {
    iblocks_.emplace_back(new std::int32_t[n]);
    return iblocks_.back().get();
  }
  void remember(const double* p, std::size_t n) { reals_.push_back({p, std::vector<double>(p, p + n)}); }

  Input& in_;
  std::vector<std::unique_ptr<double[]>> blocks_;
  std::vector<std::unique_ptr<std::int32_t[]>> iblocks_;
  std::vector<Kept> reals_;
  std::vector<KeptInt> ints_;
};

inline void dump(const Args& a) {
  for (const auto& r : a.ints_) {
    std::fprintf(stderr, "  int  ");
    for (std::int32_t v : r.copy) std::fprintf(stderr, " %d", v);
    std::fprintf(stderr, "\n");
  }
  for (const auto& r : a.reals_) {
    std::fprintf(stderr, "  real ");
    for (double v : r.copy) std::fprintf(stderr, " %a", v);
    std::fprintf(stderr, "\n");
  }
}

// ---- Checks ------------------------------------------------------------------------------

inline bool all_sentinel(const double* p, std::size_t n) {
  for (std::size_t k = 0; k < n; ++k)
    if (!is_sentinel(p[k])) return false;
  return true;
}
inline bool none_sentinel(const double* p, std::size_t n) {
  for (std::size_t k = 0; k < n; ++k)
    if (is_sentinel(p[k])) return false;
  return true;
}
inline bool one_of(std::int32_t v, std::initializer_list<std::int32_t> set) {
  for (std::int32_t s : set)
    if (v == s) return true;
  return false;
}
// How many leading entries were written (hold no sentinel).
inline std::size_t written(const double* p, std::size_t n) {
  std::size_t k = 0;
  while (k < n && !is_sentinel(p[k])) ++k;
  return k;
}
// A routine's code: one of its documented set, and the result 1 exactly when it is not 0.
inline void check_code(const char* routine, std::int32_t res, std::int32_t ierr,
                       std::initializer_list<std::int32_t> set) {
  if (!one_of(ierr, set)) broken(routine, "code outside the documented set", ierr);
  if (res != (ierr ? 1 : 0)) broken(routine, "result does not match the code", res);
}
// The call `run_on(buf)` again with the output placed on a copy of one input (n_in reals):
// the same bits as `want` (n_out reals) must come out, since every input is read before any
// output is written; where `want` holds the sentinel (not written), the input's value.
inline void same_when_aliased(const char* routine, const double* in, std::size_t n_in,
                              const double* want, std::size_t n_out,
                              const std::function<void(double*)>& run_on) {
  std::vector<double> buf(in, in + n_in);
  buf.resize(n_in > n_out ? n_in : n_out);
  run_on(buf.data());
  for (std::size_t k = 0; k < n_out; ++k)
    if (!same(buf[k], is_sentinel(want[k]) && k < n_in ? in[k] : want[k]))
      broken(routine, "aliased output differs", long(k));
}

// One traceback frame as recorded on this thread.
struct Frame {
  std::int32_t code;
  std::string name;
};
inline std::vector<Frame> frames() {
  std::vector<Frame> out;
  const std::int32_t count = orvq7sys_trace_count();
  for (std::int32_t k = 1; k <= count; ++k) {
    char name[ORVQ7SYS_NAME_MAX] = {};
    std::int32_t code = 0, len = 0;
    orvq7sys_trace_frame(k, &code, name, &len);
    const int kept = len < 0 ? 0 : (len > ORVQ7SYS_NAME_MAX ? ORVQ7SYS_NAME_MAX : len);
    out.push_back({code, std::string(name, static_cast<std::size_t>(kept))});
  }
  return out;
}

// Brackets one call: clears the traceback and checks, after it, that every workspace block
// was released and that no refusal injected for the call is left pending.
class Call {
 public:
  explicit Call(const char* routine) : routine_(routine) {
    orvq7sys_trace_clear();
    orvq7sys_msg_clear();
    outstanding0_ = orvq7sys_ws_outstanding();
  }
  ~Call() { orvq7sys_ws_refuse(0); }
  // Refuses the next n workspace requests of this call.
  void refuse(std::int32_t n) { orvq7sys_ws_refuse(n); }
  std::int64_t requests_so_far() const { return orvq7sys_ws_requests_thread(); }
  // The routine released every block it took and recorded no frame and no message.
  void quiet() const {
    released();
    if (orvq7sys_trace_count() != 0) broken(routine_, "traceback frame recorded", orvq7sys_trace_count());
    if (orvq7sys_msg_count() != 0) broken(routine_, "message issued", orvq7sys_msg_count());
  }
  void released() const {
    if (orvq7sys_ws_outstanding() != outstanding0_)
      broken(routine_, "workspace block not released", long(orvq7sys_ws_outstanding() - outstanding0_));
  }

 private:
  const char* routine_;
  std::int64_t outstanding0_;
};

// The arguments of one call and its bracket: done() checks that the inputs are unmodified
// and the call quiet; done_released() only that its workspace was released.
class Case : public Args {
 public:
  Case(Input& in, const char* routine) : Args(in), call(routine), name(routine) {}
  void done() const {
    check_inputs(name);
    call.quiet();
  }
  void done_released() const {
    check_inputs(name);
    call.released();
  }
  Call call;
  const char* name;
};

// Sets tolerances of the current set from the input for the life of the object, then puts
// them back: the routines must survive any tolerance a host may hold (0, negative, NaN, huge).
class Tolerances {
 public:
  Tolerances(Input& in, std::initializer_list<int> ks) {
    const std::uint8_t mask = in.byte();
    int bit = 0;
    for (int k : ks) {
      if (mask & (1u << (bit++ & 7))) {
        double* slot = &toler[decale[4] + k - 1];
        saved_.push_back({slot, *slot});
        *slot = in.real();
      }
    }
  }
  ~Tolerances() {
    for (auto it = saved_.rbegin(); it != saved_.rend(); ++it) *it->first = it->second;
  }
  Tolerances(const Tolerances&) = delete;
  Tolerances& operator=(const Tolerances&) = delete;

 private:
  std::vector<std::pair<double*, double>> saved_;
};

}  // namespace fuzz
