// frame/load.cpp -- load-time registration and the exported data item and marker.
#include <cstdint>
#include "frame/frame_api.h"
#include "frame/services.h"

namespace {

// Result of the registration at load; nothing else of the library reads it.
int s_registration = 0;

// Runs once when the library is loaded, before any routine can be called.
__attribute__((constructor)) void register_library() {
  s_registration = OrvZelDeclareLibraryLoading(static_cast<OrvZelLibraryName>(ORVQ7_LIBRARY_ID));
}

}  // namespace

extern "C" {

int32_t OrvZelLibrary = 1;

int32_t OrvZelInternalOrvQ7Maths(void) { return 1; }

}  // extern "C"
