// tests/support/recording_services.cpp -- reading the calling thread's traceback.
#include "support/recording_services.h"

std::vector<Frame> RecordedFrames::frames() const {
  std::vector<Frame> out;
  const std::int32_t n = orvq7sys_trace_count();
  for (std::int32_t k = 1; k <= n; ++k) {
    std::int32_t code = 0, len = 0;
    char name[ORVQ7SYS_NAME_MAX];
    orvq7sys_trace_frame(k, &code, name, &len);
    const std::int32_t kept = len < ORVQ7SYS_NAME_MAX ? len : ORVQ7SYS_NAME_MAX;
    out.push_back(Frame{code, std::string(name, static_cast<std::size_t>(kept)), len});
  }
  return out;
}
