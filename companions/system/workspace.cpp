// companions/system/workspace.cpp -- temporary workspace (altes, detes): blocks addressed as an
// index relative to a base chosen by the caller, process-wide, with per-thread accounting and
// per-thread fault injection.
#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <mutex>
#include <unordered_map>

#include "companions/system/system_api.h"

namespace {

using Counter = std::shared_ptr<std::atomic<std::int64_t>>;

struct Block {
  void* memory;     // what malloc returned
  Counter counter;  // the taking thread's outstanding count (shared: it may outlive the thread)
};

// Element size in bytes of a type code; 0 for a code that is refused.
std::int64_t element_size(std::int32_t type) {
  switch (type) {
    case 1: return 1;
    case 2: return 4;
    case 3: return 8;
    case 4: return 16;
    default: return 0;
  }
}

constexpr std::int64_t kMaxBytes = std::int64_t{1} << 40;

std::mutex s_mutex;  // guards s_blocks and s_next_handle
std::unordered_map<std::int32_t, Block> s_blocks;
std::int32_t s_next_handle = 1;
std::atomic<std::int64_t> s_outstanding{0};

// Per-thread accounting. The outstanding count is atomic and shared with the thread's blocks,
// because another thread may release a block after this one has ended.
struct ThreadAccount {
  Counter outstanding = std::make_shared<std::atomic<std::int64_t>>(0);
  std::int64_t requests = 0;
  std::int32_t refuse = 0;
};
thread_local ThreadAccount s_account;

}  // namespace

extern "C" {

std::int32_t altes(void* base, const std::int32_t* type, const std::int32_t* count,
                   std::int64_t* index, std::int32_t* handle) {
  ++s_account.requests;
  if (s_account.refuse > 0) {
    --s_account.refuse;
    return 1;
  }
  const std::int64_t es = element_size(*type);
  if (es == 0 || *count < 0 || *handle != 0) return 1;
  const std::int64_t bytes = (*count == 0 ? 1 : *count) * es;
  if (bytes > kMaxBytes) return 1;
  void* memory = std::malloc(static_cast<std::size_t>(bytes + es));
  if (memory == nullptr) return 1;
  // Place the block a whole number of elements from base: start at the first address in
  // [memory, memory + es) whose distance from base is a multiple of es. Unsigned arithmetic
  // wraps, so the distance may be "negative".
  const std::uintptr_t b = reinterpret_cast<std::uintptr_t>(base);
  const std::uintptr_t m = reinterpret_cast<std::uintptr_t>(memory);
  const std::uintptr_t ues = static_cast<std::uintptr_t>(es);
  const std::uintptr_t shift = (ues - (m - b) % ues) % ues;
  const std::uintptr_t start = m + shift;
  const std::int64_t distance = static_cast<std::int64_t>(start - b);  // exact multiple of es

  s_outstanding.fetch_add(1);
  s_account.outstanding->fetch_add(1);
  std::int32_t h;
  {
    std::lock_guard<std::mutex> lock(s_mutex);
    do {
      h = s_next_handle;
      s_next_handle = (s_next_handle == INT32_MAX) ? 1 : s_next_handle + 1;
    } while (s_blocks.count(h) != 0);
    s_blocks.emplace(h, Block{memory, s_account.outstanding});
  }
  *index = distance / es + 1;
  *handle = h;
  return 0;
}

std::int32_t detes(const std::int32_t* handle) {
  if (*handle == 0) return 0;
  Block block;
  {
    std::lock_guard<std::mutex> lock(s_mutex);
    auto it = s_blocks.find(*handle);
    if (it == s_blocks.end()) return 1;
    block = it->second;
    s_blocks.erase(it);
  }
  std::free(block.memory);
  s_outstanding.fetch_sub(1);
  block.counter->fetch_sub(1);
  return 0;
}

std::int64_t orvq7sys_ws_outstanding(void) { return s_outstanding.load(); }

std::int64_t orvq7sys_ws_outstanding_thread(void) { return s_account.outstanding->load(); }

std::int64_t orvq7sys_ws_requests_thread(void) { return s_account.requests; }

void orvq7sys_ws_refuse(std::int32_t n) { s_account.refuse = n > 0 ? n : 0; }

}  // extern "C"
