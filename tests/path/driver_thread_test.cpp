// tests/path/driver_thread_test.cpp -- paths traced by ynchem on several threads at once.
#include <thread>

#include "curves.h"

// Viviani's curve (K = 4) and a circle of radius^2 2 keeping phases and numbers (K = 8), each
// traced again and again on its own thread.
TEST(YnchemThreads, PathsAtOnceMatchTheirSequentialRuns) {
  const std::vector<Path> paths = {
      {Curve(Curve::kViviani, 3), {0, 0, 2}, {0, 1, 0}},
      {Curve(Curve::kCircle, 2, 2.0), {1, 1}, {-1, 1}, {3.0}, 1e-4, 0.01, 8, 2 + 16}};
  std::vector<Path> want = paths;
  for (Path& p : want) p.run();
  const std::int64_t live0 = orvq7sys_table_live();
  std::vector<int> same(want.size(), 0);
  std::vector<std::thread> pool;
  for (std::size_t k = 0; k < want.size(); ++k) {
    pool.emplace_back([&, k] {
      for (int round = 0; round < 8; ++round) {
        Path p = paths[k];
        p.run();
        same[k] += p.ierr == 0 && bitsv(p.xt) == bitsv(want[k].xt) && p.number == want[k].number;
      }
    });
  }
  for (auto& t : pool) t.join();
  EXPECT_EQ(same, std::vector<int>(want.size(), 8));
  EXPECT_GT(std::min(want[0].count, want[1].count), 20);
  EXPECT_EQ(orvq7sys_table_live(), live0);
}
