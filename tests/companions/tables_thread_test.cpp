// tests/companions/tables_thread_test.cpp -- growable tables used from several threads at once.
#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "support/recording_services.h"

TEST(TablesThreads, ConcurrentTablesKeepTheirOwnEntriesAndAreAllReleased) {
  constexpr int kThreads = 4, kTables = 20, kEntries = 300;
  const std::int64_t live0 = orvq7sys_table_live();
  // One shared table, written by the main thread before and read by every thread.
  std::int32_t shared = 0, ierr = 0, esize = 8, n = kEntries;
  ASSERT_EQ(yutini(&esize, &n, &shared, &ierr), 0);
  std::vector<int> failures(kThreads, 0);
  std::vector<std::int32_t> handed(kThreads, 0);  // made on thread t, released by main
  std::vector<std::thread> pool;
  for (int t = 0; t < kThreads; ++t) {
    pool.emplace_back([t, shared, &failures, &handed] {
      std::int32_t err = 0, one = 1, es = 8, zero = 0;
      std::vector<std::int32_t> mine;
      for (int k = 0; k < kTables; ++k) {
        std::int32_t h = 0;
        if (yutini(&es, &zero, &h, &err) != 0) ++failures[t];
        mine.push_back(h);
      }
      // Interleave appends over this thread's tables, growing each one by one entry a time.
      for (std::int32_t e = 1; e <= kEntries; ++e) {
        for (int k = 0; k < kTables; ++k) {
          const double v = 1000.0 * t + k + e * 1e-3;
          if (yutmnc(&mine[k], &e, &err) != 0 || yutwri(&mine[k], &e, &one, &v, &err) != 0) {
            ++failures[t];
          }
        }
        double s = -1.0;
        if (yutrea(&shared, &e, &one, &s, &err) != 0 || s != 0.0) ++failures[t];
      }
      for (int k = 0; k < kTables; ++k) {
        std::int32_t first = 1, count = kEntries;
        std::vector<double> got(kEntries);
        if (yutrea(&mine[k], &first, &count, got.data(), &err) != 0) ++failures[t];
        for (int e = 1; e <= kEntries; ++e) {
          if (got[e - 1] != 1000.0 * t + k + e * 1e-3) ++failures[t];
        }
        if (k == 0) {
          handed[t] = mine[k];
        } else if (yutend(&mine[k], &err) != 0) {
          ++failures[t];
        }
      }
      if (orvq7sys_table_live_thread() != 1) ++failures[t];
    });
  }
  for (auto& th : pool) th.join();
  for (int t = 0; t < kThreads; ++t) EXPECT_EQ(failures[t], 0) << "thread " << t;
  // Tables made on other threads are released here.
  for (std::int32_t h : handed) EXPECT_EQ(yutend(&h, &ierr), 0);
  EXPECT_EQ(yutend(&shared, &ierr), 0);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}
