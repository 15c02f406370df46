// companions/framework/framework.cpp -- load-time registration: a count per library id.
#include <cstdint>
#include <atomic>

#include "companions/framework/framework_api.h"

namespace {
constexpr int kIds = 256;
std::atomic<std::int32_t> s_loadings[kIds];
}  // namespace

extern "C" {

int OrvZelDeclareLibraryLoading(OrvZelLibraryName id) {
  const int i = static_cast<int>(id);
  if (i < 0 || i >= kIds) return 0;
  return s_loadings[i].fetch_add(1) + 1;
}

std::int32_t orvzel_loading_count(std::int32_t id) {
  if (id < 0 || id >= kIds) return 0;
  return s_loadings[id].load();
}

}  // extern "C"
