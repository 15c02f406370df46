// companions/system/services.cpp -- copy and fill (crccop, crcmac), sorts (sori4, sorr8) and
// the guarded error contexts (giuope, giufin, giuclo).
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <numeric>
#include <vector>

#include "companions/data/data_api.h"
#include "companions/system/system_api.h"

namespace {
thread_local std::int32_t s_open_contexts = 0;  // giuope minus giuclo on this thread
}  // namespace

extern "C" {

std::int32_t crccop(const void* src, const std::int32_t* count, void* dst) {
  if (*count > 0) std::memmove(dst, src, static_cast<std::size_t>(*count));
  return 0;
}

std::int32_t crcmac(void* dst, const std::int32_t* count, const std::int32_t* fill) {
  if (*count > 0) std::memset(dst, *fill & 0xff, static_cast<std::size_t>(*count));
  return 0;
}

std::int32_t sori4(std::int32_t* table, const std::int32_t* rowlen, const std::int32_t* nrows,
                   const std::int32_t* key, std::int32_t* /*work*/) {
  const std::int32_t m = *rowlen, n = *nrows, k = *key;
  if (m < 1 || n < 1 || k < 1 || k > m) return 0;
  std::vector<std::int32_t> order(static_cast<std::size_t>(n));
  std::iota(order.begin(), order.end(), 0);
  const std::size_t um = static_cast<std::size_t>(m);
  std::stable_sort(order.begin(), order.end(), [&](std::int32_t a, std::int32_t b) {
    return table[static_cast<std::size_t>(a) * um + (k - 1)] <
           table[static_cast<std::size_t>(b) * um + (k - 1)];
  });
  std::vector<std::int32_t> copy(table, table + um * static_cast<std::size_t>(n));
  for (std::size_t r = 0; r < order.size(); ++r) {
    std::memcpy(table + r * um, copy.data() + static_cast<std::size_t>(order[r]) * um,
                um * sizeof(std::int32_t));
  }
  return 0;
}

std::int32_t sorr8(double* values, const std::int32_t* count) {
  if (*count < 2) return 0;
  // A strict weak order with every NaN after every number.
  std::stable_sort(values, values + *count, [](double a, double b) {
    if (std::isnan(a)) return false;
    if (std::isnan(b)) return true;
    return a < b;
  });
  return 0;
}

std::int32_t giuope(void*, void*, void*, void*) {
  ++s_open_contexts;
  return 0;
}

std::int32_t giufin(const std::int32_t* status, void* /*value*/) {
  if (*status == 0) return 0;
  char name[8];
  std::memcpy(name, gmacer, sizeof name);
  bftier(status, name, 8);
  return 1;
}

void giuclo(const std::int32_t* /*flag*/) {
  if (s_open_contexts > 0) --s_open_contexts;
}

}  // extern "C"
