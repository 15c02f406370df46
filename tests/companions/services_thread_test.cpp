// tests/companions/services_thread_test.cpp -- the platform services used from two threads at
// once: traceback, workspace accounting, fault injection and table counts are per thread, and
// blocks or tables made on one thread may be released on another.
#include <gtest/gtest.h>

#include <algorithm>
#include <thread>

#include "companions/data/data_api.h"
#include "support/recording_services.h"
#include "support/thread_compare.h"

// Rounds on two threads at once, each equal to the same round alone: blocks written whole
// (the sanitizers see any overlap with the other thread's), frames, a table grown one entry
// at a time and read back, an injected refusal.
TEST(ServicesThreads, PerThreadStateMatchesSingleThreadedAnswers) {
  const Sequence round = [](int v) {
    Answer out;
    orvq7sys_trace_clear();
    std::int32_t h = 0, ierr, zero = 0, one = 1, es = 8, type = 3, count, handle, code, len,
                 n = 200;
    std::int64_t index;
    std::vector<double> got(n);
    char name[ORVQ7SYS_NAME_MAX];
    out.ints({yutini(&es, &zero, &h, &ierr)});
    for (std::int32_t r = 1; r <= n; ++r) {
      const double x = 1000.0 * v + r;
      count = r + v, handle = 0, code = 1000 * v + r;
      out.ints({altes(dynar, &type, &count, &index, &handle), orvq7sys_ws_outstanding_thread()});
      const std::uintptr_t block = reinterpret_cast<std::uintptr_t>(dynar) + (index - 1) * 8;
      std::fill_n(reinterpret_cast<double*>(block), count, x);
      bftier(&code, "THREAD  ", 8);
      out.ints({detes(&handle), yutmnc(&h, &r, &ierr), yutwri(&h, &r, &one, &x, &ierr),
                orvq7sys_table_live_thread()});
    }
    orvq7sys_ws_refuse(1);  // the next request is refused, zero stays 0
    out.ints({yutrea(&h, &one, &n, got.data(), &ierr), orvq7sys_trace_frame(64, &code, name, &len),
              code, altes(dynar, &type, &count, &index, &zero), yutend(&h, &ierr),
              orvq7sys_table_live_thread()});
    return out.reals(got.data(), n);
  };
  EXPECT_EQ(rounds_differing_across_threads(round, 100), 0);
}

// The release is counted against the thread that made the block or table.
TEST(ServicesThreads, BlocksAndTablesMadeOnOneThreadMayBeReleasedOnAnother) {
  std::int32_t h = 0, t = 0, type = 3, n = 8, ierr;
  std::int64_t index = 0, mine = orvq7sys_ws_outstanding_thread();
  std::thread([&] { altes(dynar, &type, &n, &index, &h), yutini(&n, &type, &t, &ierr); }).join();
  const std::int64_t blocks = orvq7sys_ws_outstanding(), tables = orvq7sys_table_live();
  EXPECT_EQ(detes(&h) + yutend(&t, &ierr), 0);
  EXPECT_EQ(std::tuple(orvq7sys_ws_outstanding(), orvq7sys_table_live(),
                       orvq7sys_ws_outstanding_thread()),
            std::tuple(blocks - 1, tables - 1, mine));
}
