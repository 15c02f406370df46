// tests/host/host_bftier_test.cpp -- a host program that supplies its own bftier. The library
// calls the traceback service only through its exported name, so its frames reach this one
// and not the system library's.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "companions/system/system_api.h"
#include "frame/frame_api.h"

namespace {
struct HostFrame {
  std::int32_t code;
  std::string name;
};
std::vector<HostFrame> g_host_frames;
}  // namespace

extern "C" __attribute__((visibility("default"))) void bftier(const std::int32_t* code,
                                                              const char* name, int len) {
  g_host_frames.push_back(HostFrame{*code, std::string(name, static_cast<std::size_t>(len))});
}

TEST(HostServices, LibraryFramesReachTheHostsOwnTraceback) {
  g_host_frames.clear();
  orvq7sys_trace_clear();
  orvq7sys_ws_refuse(1);
  EXPECT_EQ(cbkver(), 1);
  ASSERT_EQ(g_host_frames.size(), 1u);
  EXPECT_EQ(g_host_frames[0].code, 1036);
  EXPECT_EQ(g_host_frames[0].name, "CBKVER  ");
  EXPECT_EQ(orvq7sys_trace_count(), 0);  // the system library's traceback saw nothing
}
