// tests/companions/system_thread_test.cpp -- the services used from several threads at once.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "companions/data/data_api.h"
#include "support/recording_services.h"

TEST(ServicesThreads, TracebacksStayPerThreadAndBlocksAreAllReleased) {
  constexpr int kThreads = 4, kRounds = 500;
  std::vector<int> failures(kThreads, 0);
  std::vector<std::thread> pool;
  const std::int64_t before = orvq7sys_ws_outstanding();
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, &failures] {
      orvq7sys_trace_clear();
      for (int r = 0; r < kRounds; ++r) {
        std::int32_t type = 2 + (r & 1), count = 1 + r % 50, handle = 0;
        std::int64_t index = 0;
        if (altes(dynar, &type, &count, &index, &handle) != 0) ++failures[t];
        // Write the whole block: the sanitizers see any overlap with another thread's block.
        const std::uintptr_t size = type == 2 ? 4 : 8;
        auto* first = reinterpret_cast<unsigned char*>(
            reinterpret_cast<std::uintptr_t>(dynar) + static_cast<std::uintptr_t>(index - 1) * size);
        for (std::uintptr_t b = 0; b < static_cast<std::uintptr_t>(count) * size; ++b) {
          first[b] = static_cast<unsigned char>(t);
        }
        const std::int32_t code = 1000 * t + r;
        bftier(&code, "THREAD  ", 8);
        if (detes(&handle) != 0) ++failures[t];
      }
      // This thread saw only its own frames, the most recent kept.
      std::int32_t code = 0, len = 0;
      char name[ORVQ7SYS_NAME_MAX];
      orvq7sys_trace_frame(ORVQ7SYS_TRACE_MAX, &code, name, &len);
      if (code != 1000 * t + kRounds - 1) ++failures[t];
      if (orvq7sys_ws_outstanding_thread() != 0) ++failures[t];
      orvq7sys_ws_refuse(1);  // fault injection on this thread only
      std::int32_t type = 3, count = 1, handle = 0;
      std::int64_t index = 0;
      if (altes(dynar, &type, &count, &index, &handle) != 1) ++failures[t];
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
  EXPECT_EQ(orvq7sys_ws_outstanding(), before);
  // The main thread's own injection state was not touched by the others.
  std::int32_t type = 3, count = 1, handle = 0;
  std::int64_t index = 0;
  ASSERT_EQ(altes(dynar, &type, &count, &index, &handle), 0);
  EXPECT_EQ(detes(&handle), 0);
}

TEST(ServicesThreads, BlockTakenOnOneThreadMayBeReleasedOnAnother) {
  std::int32_t handle = 0;
  std::thread taker([&handle] {
    std::int32_t type = 3, count = 8;
    std::int64_t index = 0;
    ASSERT_EQ(altes(dynar, &type, &count, &index, &handle), 0);
  });
  taker.join();
  const std::int64_t before = orvq7sys_ws_outstanding();
  EXPECT_EQ(detes(&handle), 0);
  EXPECT_EQ(orvq7sys_ws_outstanding(), before - 1);
}
