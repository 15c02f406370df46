// traceback.cpp -- a failure and its traceback, from C++: the workspace service refuses
// cbkver's block, and the frame it recorded is read back as (code, name).
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include <OrvQ7Maths/OrvQ7Maths.h>

namespace {
struct Frame {
  std::int32_t code;
  std::string name;  // the bytes as recorded, blanks kept
};

std::vector<Frame> traceback() {
  std::vector<Frame> frames;
  for (std::int32_t k = 1; k <= orvq7sys_trace_count(); ++k) {
    std::int32_t code = 0, len = 0;
    char name[ORVQ7SYS_NAME_MAX] = {};
    if (orvq7sys_trace_frame(k, &code, name, &len) == 0)
      frames.push_back({code, std::string(name, static_cast<std::size_t>(len))});
  }
  return frames;
}
}  // namespace

int main() {
  orvq7sys_trace_clear();
  orvq7sys_ws_refuse(1);
  if (cbkver() != 1) return 1;
  const std::vector<Frame> frames = traceback();
  for (const Frame& f : frames)
    std::printf("%d \"%s\": %s\n", f.code, f.name.c_str(), orvq7sys_code_text(f.code));
  const bool as_documented =
      frames.size() == 1 && frames[0].code == ORVQ7_ERR_CBKVER && frames[0].name == "CBKVER  ";
  return as_documented && cbkver() == 0 ? 0 : 1;
}
