// tests/support/recording_services.h -- what the tests read of the platform services: the
// calling thread's traceback frames, the workspace accounting, and bit patterns of reals.
#pragma once
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "companions/system/system_api.h"

// The 64-bit pattern of a real (so -0.0 differs from 0.0 and NaNs compare).
inline std::uint64_t bits(double x) {
  std::uint64_t u;
  std::memcpy(&u, &x, sizeof u);
  return u;
}

struct Frame {
  std::int32_t code;
  std::string name;  // the bytes as passed, blanks and punctuation kept
  std::int32_t len;  // the length as passed
  bool operator==(const Frame&) const = default;
};

// Clears this thread's traceback on construction; frames() reads what was recorded since.
class RecordedFrames {
 public:
  RecordedFrames() { orvq7sys_trace_clear(); }
  std::vector<Frame> frames() const;
  bool empty() const { return orvq7sys_trace_count() == 0; }
};

// Workspace accounting of this thread: blocks outstanding and requests made since
// construction; cancels any pending fault injection on destruction.
class WorkspaceWatch {
 public:
  WorkspaceWatch()
      : outstanding0_(orvq7sys_ws_outstanding_thread()), requests0_(orvq7sys_ws_requests_thread()) {}
  ~WorkspaceWatch() { orvq7sys_ws_refuse(0); }
  std::int64_t outstanding() const { return orvq7sys_ws_outstanding_thread() - outstanding0_; }
  std::int64_t requests() const { return orvq7sys_ws_requests_thread() - requests0_; }
  void refuse_next(std::int32_t n) const { orvq7sys_ws_refuse(n); }

 private:
  std::int64_t outstanding0_;
  std::int64_t requests0_;
};
