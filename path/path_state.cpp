// path/path_state.cpp -- the driver's path state, one copy per thread (see path/path_state.h).
#include "path/path_state.h"

namespace impl {
thread_local PathState s_ynchem{};
}  // namespace impl
