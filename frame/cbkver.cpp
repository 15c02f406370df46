// frame/cbkver.cpp -- cbkver: a check that the workspace service works.
#include <cstdint>
#include "frame/frame_api.h"
#include "frame/status.h"
#include "frame/workspace.h"

namespace {
constexpr std::int32_t kCbkverCode = 1036;  // the service refused the block
constexpr std::int32_t kCbkverCount = 100;  // reals asked for
}  // namespace

extern "C" int32_t cbkver(void) {
  // (1) The version record of the system library.
  altver();
  // (2) 100 reals relative to the shared area `data`.
  impl::WorkspaceBlock block;
  if (!block.take(impl::kWsReal, kCbkverCount, data)) {
    impl::trace(kCbkverCode, "CBKVER  ");
    return 1;
  }
  // (3) Use the block, then release it (only a granted block has a non-zero handle).
  *block.get<double>() = 1.0;
  block.release();
  return 0;
}
