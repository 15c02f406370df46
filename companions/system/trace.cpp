// companions/system/trace.cpp -- traceback (bftier), message log (errmsg), code texts and the
// version record. Both logs are per thread and bounded: the most recent entries are kept.
#include <cstdint>
#include <algorithm>
#include <cstring>

#include "companions/system/system_api.h"

namespace {

struct Frame {
  std::int32_t code;
  std::int32_t len;
  char name[ORVQ7SYS_NAME_MAX];
};

struct Message {
  std::int32_t code;
  std::int32_t severity;
};

// A ring of the most recent entries; `total` counts every entry since the last clear.
template <class T>
struct Ring {
  T items[ORVQ7SYS_TRACE_MAX];
  std::int64_t total = 0;
  void push(const T& item) { items[total++ % ORVQ7SYS_TRACE_MAX] = item; }
  std::int32_t held() const {
    return static_cast<std::int32_t>(std::min<std::int64_t>(total, ORVQ7SYS_TRACE_MAX));
  }
  // k from 1 (oldest held) to held().
  const T& at(std::int32_t k) const {
    const std::int64_t first = total - held();
    return items[(first + k - 1) % ORVQ7SYS_TRACE_MAX];
  }
};

thread_local Ring<Frame> s_frames;
thread_local Ring<Message> s_messages;

constexpr const char* kVersionText = "OrvQ7System 1.0.0";

}  // namespace

extern "C" {

void bftier(const std::int32_t* code, const char* name, int len) {
  Frame f{};
  f.code = *code;
  f.len = len < 0 ? 0 : len;
  const int kept = std::min(f.len, ORVQ7SYS_NAME_MAX);
  if (kept > 0) std::memcpy(f.name, name, static_cast<std::size_t>(kept));
  s_frames.push(f);
}

void errmsg(const std::int32_t* code, const std::int32_t* severity) {
  s_messages.push(Message{*code, *severity});
}

void altver(void) {
  const std::int32_t zero = 0;
  errmsg(&zero, &zero);
}

std::int32_t orvq7sys_trace_count(void) { return s_frames.held(); }

std::int32_t orvq7sys_trace_frame(std::int32_t k, std::int32_t* code, char* name,
                                  std::int32_t* len) {
  if (k < 1 || k > s_frames.held()) return 1;
  const Frame& f = s_frames.at(k);
  *code = f.code;
  std::memcpy(name, f.name, ORVQ7SYS_NAME_MAX);
  *len = f.len;
  return 0;
}

std::int64_t orvq7sys_trace_dropped(void) { return s_frames.total - s_frames.held(); }

void orvq7sys_trace_clear(void) { s_frames.total = 0; }

std::int32_t orvq7sys_msg_count(void) { return s_messages.held(); }

std::int32_t orvq7sys_msg_get(std::int32_t k, std::int32_t* code, std::int32_t* severity) {
  if (k < 1 || k > s_messages.held()) return 1;
  *code = s_messages.at(k).code;
  *severity = s_messages.at(k).severity;
  return 0;
}

void orvq7sys_msg_clear(void) { s_messages.total = 0; }

const char* orvq7sys_version_text(void) { return kVersionText; }

const char* orvq7sys_code_text(std::int32_t code) {
  switch (code) {
    case 0: return "success";
    case 1: return "drmoyn: the mean-plane solve failed";
    case 2: return "drmoyn: the eigen-direction step failed";
    case 36: return "the temporary workspace could not be obtained";
    case 116: return "matppe failed";
    case 250: return "xyzvol failed";
    case 722: return "an index lies outside the structure it addresses";
    case 1036: return "cbkver: the workspace service refused a block";
    case 4701: return "iteration limit exceeded";
    case 4702: return "an inner linear system could not be solved";
    case 4703: return "singular system: a pivot or determinant below the routine's threshold";
    case 4704: return "routine-specific failure (4704)";
    case 4707: return "routine-specific failure (4707)";
    case 4709: return "zero leading coefficient or zero constant term";
    case 4710: return "degenerate input: zero vector or no tangent at the point";
    case 4712: return "invalid argument: a count or dimension below its minimum, or out of order";
    case 4713: return "the correction was rejected: no convergence";
    case 4715: return "the evaluation routine refused the request";
    case 4716: return "an iterate left the search box";
    case 4717: return "the answer is not unique (usable, with a warning)";
    case 4718: return "capacity exceeded: a dimension above the routine's fixed capacity";
    case 4720: return "the traced path reached its point limit";
    case 4721: return "the traced path ends at its start";
    case 4722: return "routine-specific failure (4722)";
    default: return "unknown code";
  }
}

}  // extern "C"
