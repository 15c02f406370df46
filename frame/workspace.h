// frame/workspace.h -- the guard through which routines take temporary workspace (internal).
#pragma once
#include <cstdint>

#include "frame/services.h"

namespace impl {

// Element type codes of the workspace service.
constexpr std::int32_t kWsInt32 = 2;
constexpr std::int32_t kWsReal = 3;

// Address of element `index` (from 1) of `base` counted in units of T. The block may lie
// anywhere relative to base, so the address is formed in integer arithmetic.
template <class T>
inline T* ws_at(void* base, std::int64_t index) {
  const std::uintptr_t b = reinterpret_cast<std::uintptr_t>(base);
  return reinterpret_cast<T*>(b + static_cast<std::uintptr_t>(index - 1) * sizeof(T));
}

// One workspace block held for the lifetime of the guard: released on every path out.
// The handle is a local (no later call reads it), so callers stay reentrant.
class WorkspaceBlock {
 public:
  WorkspaceBlock() = default;
  WorkspaceBlock(const WorkspaceBlock&) = delete;
  WorkspaceBlock& operator=(const WorkspaceBlock&) = delete;
  ~WorkspaceBlock() { release(); }

  // Asks for `count` elements of `type` relative to `base` (dynar unless given). Returns
  // true when the block was granted.
  bool take(std::int32_t type, std::int32_t count, void* base = dynar) {
    base_ = base;
    return altes(base_, &type, &count, &index_, &handle_) == 0;
  }
  template <class T>
  T* get() const {
    return ws_at<T>(base_, index_);
  }
  // Releases the block now (also done by the destructor); returns detes's result.
  std::int32_t release() {
    if (handle_ == 0) return 0;
    const std::int32_t r = detes(&handle_);
    handle_ = 0;
    return r;
  }
  std::int32_t handle() const { return handle_; }

 private:
  void* base_ = nullptr;
  std::int64_t index_ = 0;
  std::int32_t handle_ = 0;
};

}  // namespace impl
