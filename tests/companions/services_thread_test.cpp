// tests/companions/services_thread_test.cpp -- the platform services used from two threads at
// once: traceback, workspace accounting, fault injection and table counts are per thread, and
// blocks or tables made on one thread may be released on another.
#include <gtest/gtest.h>

#include <cstring>
#include <thread>

#include "companions/data/data_api.h"
#include "support/recording_services.h"
#include "support/thread_compare.h"

namespace {
// One round: blocks written whole (the sanitizers see any overlap with the other thread's),
// frames, a table grown one entry at a time and read back, an injected refusal.
Answer round(int v) {
  Answer out;
  orvq7sys_trace_clear();
  std::int32_t h = 0, ierr, es = 8, zero = 0, one = 1, type = 3, count, handle, code, len,
               all = 200;
  std::int64_t index;
  std::vector<double> got(200);
  char name[ORVQ7SYS_NAME_MAX];
  out.ints({yutini(&es, &zero, &h, &ierr)});
  for (std::int32_t r = 1; r <= 200; ++r) {
    const double x = 1000.0 * v + r;
    count = r + v, handle = 0, code = 1000 * v + r;
    out.ints({altes(dynar, &type, &count, &index, &handle), orvq7sys_ws_outstanding_thread()});
    std::memset(reinterpret_cast<void*>(reinterpret_cast<std::uintptr_t>(dynar) + (index - 1) * 8),
                v, count * 8);
    bftier(&code, "THREAD  ", 8);
    out.ints({detes(&handle), yutmnc(&h, &r, &ierr), yutwri(&h, &r, &one, &x, &ierr),
              orvq7sys_table_live_thread()});
  }
  orvq7sys_ws_refuse(1);
  handle = 0;
  out.ints({yutrea(&h, &one, &all, got.data(), &ierr), orvq7sys_trace_frame(64, &code, name, &len),
            code, altes(dynar, &type, &count, &index, &handle), yutend(&h, &ierr),
            orvq7sys_table_live_thread()});
  return out.reals(got.data(), 200);
}
}  // namespace

TEST(ServicesThreads, PerThreadStateMatchesSingleThreadedAnswers) {
  EXPECT_EQ(rounds_differing_across_threads(round, 100), 0);
}

// The release is counted against the thread that made the block or table.
TEST(ServicesThreads, BlocksAndTablesMadeOnOneThreadMayBeReleasedOnAnother) {
  std::int32_t handle = 0, table = 0, type = 3, count = 8, ierr;
  std::int64_t index = 0, mine = orvq7sys_ws_outstanding_thread();
  std::thread([&] {
    EXPECT_EQ(altes(dynar, &type, &count, &index, &handle) + yutini(&count, &type, &table, &ierr),
              0);
  }).join();
  const std::int64_t blocks = orvq7sys_ws_outstanding(), tables = orvq7sys_table_live();
  EXPECT_EQ(detes(&handle) + yutend(&table, &ierr), 0);
  EXPECT_EQ(std::tuple(orvq7sys_ws_outstanding(), orvq7sys_table_live(),
                       orvq7sys_ws_outstanding_thread()),
            std::tuple(blocks - 1, tables - 1, mine));
}
