// frame/version.cpp -- the version of the library, as numbers and as text.
#include <cstdint>

#include "frame/frame_api.h"

#define ORVQ7_STR2(x) #x
#define ORVQ7_STR(x) ORVQ7_STR2(x)

namespace {
constexpr const char kVersionText[] = ORVQ7_STR(ORVQ7_VERSION_MAJOR) "." ORVQ7_STR(
    ORVQ7_VERSION_MINOR) "." ORVQ7_STR(ORVQ7_VERSION_PATCH);
}  // namespace

extern "C" int32_t orvq7_version(int32_t* major, int32_t* minor, int32_t* patch) {
  *major = ORVQ7_VERSION_MAJOR;
  *minor = ORVQ7_VERSION_MINOR;
  *patch = ORVQ7_VERSION_PATCH;
  return ORVQ7_VERSION_MAJOR * 10000 + ORVQ7_VERSION_MINOR * 100 + ORVQ7_VERSION_PATCH;
}

extern "C" const char* orvq7_version_text(void) { return kVersionText; }
